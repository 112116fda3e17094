#include "browse/Network.h"

namespace cv {

using namespace platform;

Network::Network(NetEnumApi& cNetEnum) {
    AddNode(std::make_unique<NetResource>(cNetEnum), 0);
    mlRootKey = mcNodes.back()->Key();
    mcCurrent = mcNodes.back().get();
}

Network::~Network() {
    for (auto& cNode : mcNodes) {
        cNode.reset();
    }
}

int32_t Network::Count() const {
    return mcCurrent->Children();
}

int32_t Network::Key() const {
    return mcCurrent->Key();
}

NetResource* Network::Item(int32_t lIndex) const {
    const auto found = mcChildRanges.find(mcCurrent->Key());
    if (found == mcChildRanges.end() || lIndex < 1 ||
        static_cast<size_t>(lIndex) > found->second.count) {
        return nullptr;
    }
    return mcNodes[found->second.first + static_cast<size_t>(lIndex) - 1].get();
}

void Network::GoToKey(int32_t lKey) {
    // A node's key is its position in the list.
    if (lKey >= 1 && static_cast<size_t>(lKey) <= mcNodes.size()) {
        mcCurrent = mcNodes[static_cast<size_t>(lKey) - 1].get();
    }
}

void Network::GoToRoot() {
    GoToKey(mlRootKey);
}

void Network::GetResources() {
    NetResource* cNode = mcCurrent;
    if (cNode->Enumerated()) {
        return;
    }
    // Marked first, so that a failed enumeration is not repeated.
    cNode->SetEnumerated(true);
    auto cBorn = cNode->GiveBirth(kResourceGlobalNet, kResourceTypeAny, kResourceUsageAll);
    mcChildRanges[cNode->Key()] = {mcNodes.size(), cBorn.size()};
    for (auto& cChild : cBorn) {
        AddNode(std::move(cChild), cNode->Key());
    }
}

void Network::AddNode(std::unique_ptr<NetResource> cNode, int32_t lParent) {
    cNode->SetParent(lParent);
    mcNodes.push_back(std::move(cNode));
    mcNodes.back()->SetKey(static_cast<int32_t>(mcNodes.size()));
}

}  // namespace cv
