#include "platform/sim/SimBrowser.h"

#include <algorithm>

#include "platform/AsciiCase.h"
#include "platform/opc/OpcResult.h"
#include "platform/sim/ErrorTexts.h"
#include "platform/sim/ItemIdSyntax.h"

namespace cv::sim {

using namespace platform::OpcResult;

SimBrowser::SimBrowser(std::shared_ptr<Connection> connection, const ServerSpec& server)
    : state_(std::make_shared<State>()) {
    state_->session = connection->Session();
    state_->connection = std::move(connection);
    state_->server = &server;
    state_->position = {&server.root};
}

ErrorInfo SimBrowser::Call(State& state) {
    const ErrorInfo error = state.connection->Check();
    if (error || state.connection->Session() != state.session) {
        return error ? error : ServerError(RPC_E_DISCONNECTED);
    }
    return state.connection->Call();
}

std::string SimBrowser::Prefix(const State& state) {
    std::string prefix;
    for (size_t i = 1; i < state.position.size(); ++i) {
        prefix += state.position[i]->name + ".";
    }
    return prefix;
}

ErrorInfo SimBrowser::ShowBranches() {
    const auto state = state_;
    if (const ErrorInfo error = Call(*state)) {
        return error;
    }
    state->names.clear();
    for (const BranchSpec& branch : state->position.back()->branches) {
        state->names.push_back(branch.name);
    }
    return {};
}

ErrorInfo SimBrowser::ShowLeafs() {
    const auto state = state_;
    if (const ErrorInfo error = Call(*state)) {
        return error;
    }
    state->names.clear();
    for (const size_t item : state->position.back()->items) {
        state->names.push_back(state->server->items[item].name);
    }
    return {};
}

ErrorInfo SimBrowser::Item(int32_t lIndex, std::string& sName) const {
    if (lIndex < 1 || lIndex > Count()) {
        return ServerError(E_INVALIDARG);
    }
    sName = state_->names[static_cast<size_t>(lIndex) - 1];
    return {};
}

ErrorInfo SimBrowser::MoveToRoot() {
    const auto state = state_;
    if (const ErrorInfo error = Call(*state)) {
        return error;
    }
    state->position.resize(1);
    return {};
}

ErrorInfo SimBrowser::MoveDown(const std::string& sBranch) {
    const auto state = state_;
    if (const ErrorInfo error = Call(*state)) {
        return error;
    }
    const auto& branches = state->position.back()->branches;
    const auto found = std::find_if(branches.begin(), branches.end(), [&](const BranchSpec& b) {
        return EqualsIgnoringCase(b.name, sBranch);
    });
    if (found == branches.end()) {
        return ServerError(E_INVALIDARG);
    }
    state->position.push_back(&*found);
    return {};
}

ErrorInfo SimBrowser::GetItemID(const std::string& sLeaf, std::string& sItemID) {
    const auto state = state_;
    if (const ErrorInfo error = Call(*state)) {
        return error;
    }
    const BranchSpec& here = *state->position.back();
    const bool leaf = std::any_of(here.items.begin(), here.items.end(), [&](size_t item) {
        return EqualsIgnoringCase(state->server->items[item].name, sLeaf);
    });
    const bool branch =
        std::any_of(here.branches.begin(), here.branches.end(),
                    [&](const BranchSpec& b) { return EqualsIgnoringCase(b.name, sLeaf); });
    if (!leaf && !branch) {
        return ServerError(E_INVALIDARG);
    }
    const ItemSpec* item = leaf ? state->server->FindItem(Prefix(*state) + sLeaf) : nullptr;
    sItemID = item != nullptr ? item->itemId : Prefix(*state) + sLeaf;
    return {};
}

ErrorInfo SimBrowser::GetAccessPaths(const std::string& sItemID, Variant& vPaths) {
    const auto state = state_;
    if (const ErrorInfo error = Call(*state)) {
        return error;
    }
    if (!IsWellFormedItemId(sItemID)) {
        return ServerError(OPC_E_INVALIDITEMID);
    }
    const ItemSpec* item = state->server->FindItem(sItemID);
    if (item == nullptr) {
        return ServerError(OPC_E_UNKNOWNITEMID);
    }
    if (item->accessPaths.empty()) {
        vPaths = Variant();
        return {};
    }
    std::vector<Variant> paths;
    for (const std::string& path : item->accessPaths) {
        paths.push_back(Variant::Str(path));
    }
    vPaths = Variant::Array(VT_BSTR, std::move(paths), 1);
    return {};
}

}  // namespace cv::sim
