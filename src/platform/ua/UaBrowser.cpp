#include "platform/ua/UaBrowser.h"

#include <algorithm>

#include "platform/AsciiCase.h"
#include "platform/opc/OpcResult.h"
#include "platform/ua/UaStatusMap.h"
#include "ua/types/NodeIdText.h"
#include "ua/types/PlainText.h"

namespace cv::uaopc {

namespace {

using platform::OpcResult::E_INVALIDARG;

constexpr uint32_t kObjectsAndVariables = 1 | 2;
// Whether an object has children is seen from its first references, asked
// of this many objects at a time.
constexpr uint32_t kCheckReferences = 100;
constexpr size_t kCheckNodes = 100;

const ua::NodeId kHasProperty{0, ua::ids::HasProperty};

ErrorInfo NotThere(const std::string& name) {
    return {E_INVALIDARG, "There is no \"" + name + "\" here."};
}

}  // namespace

UaBrowser::UaBrowser(std::shared_ptr<UaConnection> connection) : state_(std::make_shared<State>()) {
    state_->session = connection->Session();
    state_->connection = std::move(connection);
    state_->position = {ua::NodeId(0, ua::ids::ObjectsFolder)};
}

ErrorInfo UaBrowser::Check(const State& state) {
    const ErrorInfo error = state.connection->Check();
    if (error || state.connection->Session() != state.session) {
        return error ? error : Disconnected();
    }
    return {};
}

ErrorInfo UaBrowser::BrowseNext(State& state, std::vector<ua::ByteString> points, bool release,
                                std::vector<ua::BrowseResult>& results) {
    std::optional<ua::Result<std::vector<ua::BrowseResult>>> next;
    if (const ErrorInfo error = state.connection->Call<std::vector<ua::BrowseResult>>(
            [&](ua::Client& client, auto done) {
                client.BrowseNext(points, release, std::move(done));
            },
            next, true)) {
        return error;
    }
    if (!*next) {
        return state.connection->CallError(next->Failure());
    }
    results = std::move(next->Value());
    return {};
}

ErrorInfo UaBrowser::Browse(State& state, const std::vector<ua::NodeId>& nodes, bool complete,
                            References& references) {
    references.assign(nodes.size(), {});
    std::vector<ua::BrowseDescription> descriptions(nodes.size());
    std::vector<size_t> owners(nodes.size());
    for (size_t k = 0; k < nodes.size(); ++k) {
        descriptions[k].nodeId = nodes[k];
        descriptions[k].nodeClassMask = kObjectsAndVariables;
        owners[k] = k;
    }
    const uint32_t batch =
        complete ? state.connection->Runtime()->Options().browseBatch : kCheckReferences;
    std::optional<ua::Result<std::vector<ua::BrowseResult>>> browsed;
    if (const ErrorInfo error = state.connection->Call<std::vector<ua::BrowseResult>>(
            [&](ua::Client& client, auto done) {
                client.Browse(descriptions, batch, std::move(done));
            },
            browsed, true)) {
        return error;
    }
    if (!*browsed) {
        return state.connection->CallError(browsed->Failure());
    }
    std::vector<ua::BrowseResult> results = std::move(browsed->Value());
    for (;;) {
        std::vector<ua::ByteString> points;
        std::vector<size_t> waiting;
        for (size_t k = 0; k < results.size(); ++k) {
            auto& found = references[owners[k]];
            if (!results[k].statusCode.IsBad()) {
                found.insert(found.end(), results[k].references.begin(),
                             results[k].references.end());
            }
            if (!results[k].continuationPoint.bytes.empty()) {
                points.push_back(std::move(results[k].continuationPoint));
                waiting.push_back(owners[k]);
            }
        }
        if (points.empty()) {
            return {};
        }
        if (const ErrorInfo error = BrowseNext(state, std::move(points), !complete, results)) {
            return error;
        }
        if (!complete) {
            return {};
        }
        owners = std::move(waiting);
    }
}

ErrorInfo UaBrowser::Children(State& state) {
    if (state.children) {
        return {};
    }
    References references;
    if (const ErrorInfo error = Browse(state, {state.position.back()}, true, references)) {
        return error;
    }
    const std::vector<std::string>& namespaces = state.connection->NamespaceUris();
    std::vector<Child> children;
    for (const ua::ReferenceDescription& reference : references[0]) {
        ua::NodeId node = reference.nodeId.nodeId;
        const auto& uri = reference.nodeId.namespaceUri;
        const auto index = std::find(namespaces.begin(), namespaces.end(), uri);
        if (reference.referenceTypeId == kHasProperty || reference.nodeId.serverIndex != 0 ||
            (!uri.empty() && index == namespaces.end())) {
            continue;
        }
        if (!uri.empty()) {
            node.namespaceIndex = static_cast<uint16_t>(index - namespaces.begin());
        }
        const std::string& display = reference.displayName.text;
        children.push_back({ua::PlainText(display.empty() ? reference.browseName.name : display),
                            node, reference.nodeClass == ua::NodeClass::Object});
    }
    // Objects are branches when they have children other than properties.
    std::vector<bool> keep(children.size(), true);
    for (size_t start = 0; start < children.size(); start += kCheckNodes) {
        std::vector<ua::NodeId> objects;
        std::vector<size_t> at;
        for (size_t k = start; k < std::min(children.size(), start + kCheckNodes); ++k) {
            if (children[k].branch) {
                objects.push_back(children[k].node);
                at.push_back(k);
            }
        }
        References inner;
        if (const ErrorInfo error =
                objects.empty() ? ErrorInfo{} : Browse(state, objects, false, inner)) {
            return error;
        }
        for (size_t k = 0; k < objects.size(); ++k) {
            keep[at[k]] = std::any_of(inner[k].begin(), inner[k].end(), [](const auto& r) {
                return r.referenceTypeId != kHasProperty;
            });
        }
    }
    std::vector<Child> kept;
    for (size_t k = 0; k < children.size(); ++k) {
        if (keep[k]) {
            kept.push_back(std::move(children[k]));
        }
    }
    state.children = std::move(kept);
    return {};
}

ErrorInfo UaBrowser::List(State& state, bool branches) {
    if (const ErrorInfo error = Check(state)) {
        return error;
    }
    if (const ErrorInfo error = Children(state)) {
        return error;
    }
    state.names.clear();
    for (const Child& child : *state.children) {
        if (child.branch == branches) {
            state.names.push_back(child.name);
        }
    }
    return Check(state);
}

ErrorInfo UaBrowser::ShowBranches() {
    const auto state = state_;
    return List(*state, true);
}

ErrorInfo UaBrowser::ShowLeafs() {
    const auto state = state_;
    return List(*state, false);
}

ErrorInfo UaBrowser::Item(int32_t lIndex, std::string& sName) const {
    if (lIndex < 1 || lIndex > Count()) {
        return {E_INVALIDARG, *OwnErrorText(E_INVALIDARG)};
    }
    sName = state_->names[static_cast<size_t>(lIndex) - 1];
    return {};
}

ErrorInfo UaBrowser::MoveToRoot() {
    const auto state = state_;
    if (const ErrorInfo error = Check(*state)) {
        return error;
    }
    state->position.resize(1);
    state->children.reset();
    return {};
}

const UaBrowser::Child* UaBrowser::Find(const std::vector<Child>& children, const std::string& name,
                                        bool branch) {
    const auto exact = std::find_if(children.begin(), children.end(), [&](const Child& c) {
        return c.branch == branch && c.name == name;
    });
    if (exact != children.end()) {
        return &*exact;
    }
    const auto loose = std::find_if(children.begin(), children.end(), [&](const Child& c) {
        return c.branch == branch && EqualsIgnoringCase(c.name, name);
    });
    return loose != children.end() ? &*loose : nullptr;
}

ErrorInfo UaBrowser::MoveDown(const std::string& sBranch) {
    const auto state = state_;
    if (const ErrorInfo error = Check(*state)) {
        return error;
    }
    if (const ErrorInfo error = Children(*state)) {
        return error;
    }
    const Child* branch = Find(*state->children, sBranch, true);
    if (branch == nullptr) {
        return NotThere(sBranch);
    }
    state->position.push_back(branch->node);
    state->children.reset();
    return Check(*state);
}

ErrorInfo UaBrowser::GetItemID(const std::string& sLeaf, std::string& sItemID) {
    const auto state = state_;
    if (const ErrorInfo error = Check(*state)) {
        return error;
    }
    if (const ErrorInfo error = Children(*state)) {
        return error;
    }
    const Child* found = Find(*state->children, sLeaf, false);
    found = found != nullptr ? found : Find(*state->children, sLeaf, true);
    if (found == nullptr) {
        return NotThere(sLeaf);
    }
    sItemID = ua::FormatNodeId(found->node);
    return Check(*state);
}

ErrorInfo UaBrowser::GetAccessPaths(const std::string&, Variant& vPaths) {
    if (const ErrorInfo error = Check(*state_)) {
        return error;
    }
    vPaths = Variant();
    return {};
}

}  // namespace cv::uaopc
