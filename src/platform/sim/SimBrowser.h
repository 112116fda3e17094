#pragma once

#include <memory>
#include <string>
#include <vector>

#include "platform/opc/OPCBrowser.h"
#include "platform/sim/Connection.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

// A cursor over a simulated server's namespace. Its position and list live
// in shared state, so a call that waits while this object is released
// touches nothing that went.
class SimBrowser : public platform::OPCBrowser {
  public:
    SimBrowser(std::shared_ptr<Connection> connection, const ServerSpec& server);

    ErrorInfo ShowBranches() override;
    ErrorInfo ShowLeafs() override;
    int32_t Count() const override { return static_cast<int32_t>(state_->names.size()); }
    ErrorInfo Item(int32_t lIndex, std::string& sName) const override;
    ErrorInfo MoveToRoot() override;
    ErrorInfo MoveDown(const std::string& sBranch) override;
    ErrorInfo GetItemID(const std::string& sLeaf, std::string& sItemID) override;
    ErrorInfo GetAccessPaths(const std::string& sItemID, Variant& vPaths) override;

  private:
    struct State {
        std::shared_ptr<Connection> connection;
        uint64_t session = 0;
        const ServerSpec* server = nullptr;
        std::vector<const BranchSpec*> position;  // from the root down
        std::vector<std::string> names;
    };

    // Checks that the browser's server is still connected, then takes the
    // server's call time.
    static ErrorInfo Call(State& state);
    static std::string Prefix(const State& state);

    std::shared_ptr<State> state_;
};

}  // namespace cv::sim
