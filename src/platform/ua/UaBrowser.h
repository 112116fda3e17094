#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/opc/OPCBrowser.h"
#include "platform/ua/UaConnection.h"
#include "ua/services/ViewServices.h"

namespace cv::uaopc {

// A cursor over an OPC UA server's address space below the Objects folder.
// Branches are the objects (folders among them) that have children other
// than properties; leaves are the variables; properties such as EURange
// are neither. Names are display names; a leaf's item ID is its NodeId
// text. Large folders are read through BrowseNext. Position and lists live
// in shared state, so a call that waits while this object is released
// touches nothing that went.
class UaBrowser : public platform::OPCBrowser {
  public:
    explicit UaBrowser(std::shared_ptr<UaConnection> connection);

    ErrorInfo ShowBranches() override;
    ErrorInfo ShowLeafs() override;
    int32_t Count() const override { return static_cast<int32_t>(state_->names.size()); }
    ErrorInfo Item(int32_t lIndex, std::string& sName) const override;
    ErrorInfo MoveToRoot() override;
    ErrorInfo MoveDown(const std::string& sBranch) override;
    ErrorInfo GetItemID(const std::string& sLeaf, std::string& sItemID) override;
    // OPC UA has no access paths: always empty.
    ErrorInfo GetAccessPaths(const std::string& sItemID, Variant& vPaths) override;

  private:
    struct Child {
        std::string name;
        ua::NodeId node;
        bool branch = false;
    };
    struct State {
        std::shared_ptr<UaConnection> connection;
        uint64_t session = 0;
        std::vector<ua::NodeId> position;            // from Objects down
        std::optional<std::vector<Child>> children;  // of the position, once browsed
        std::vector<std::string> names;
    };
    using References = std::vector<std::vector<ua::ReferenceDescription>>;

    // Fails once the browser's session has ended.
    static ErrorInfo Check(const State& state);
    // The children of the position, browsed on first use.
    static ErrorInfo Children(State& state);
    static ErrorInfo List(State& state, bool branches);
    static const Child* Find(const std::vector<Child>& children, const std::string& name,
                             bool branch);
    // Every forward hierarchical reference of the nodes to objects and
    // variables; with complete false, the first batch only.
    static ErrorInfo Browse(State& state, const std::vector<ua::NodeId>& nodes, bool complete,
                            References& references);
    static ErrorInfo BrowseNext(State& state, std::vector<ua::ByteString> points, bool release,
                                std::vector<ua::BrowseResult>& results);

    std::shared_ptr<State> state_;
};

}  // namespace cv::uaopc
