#include "platform/sim/SimulatedPlant.h"

#include <algorithm>

#include "platform/AsciiCase.h"
#include "platform/opc/OpcResult.h"
#include "platform/sim/ServerInstance.h"
#include "platform/sim/SimDdeServers.h"
#include "platform/sim/SimNetEnum.h"
#include "platform/sim/SimServer.h"

namespace cv::sim {

using platform::OpcResult::E_INVALIDARG;

SimulatedPlant::SimulatedPlant(std::shared_ptr<const PlantDescription> plant,
                               platform::ServerCallWait& wait, const PlantOptions& options)
    : runtime_(std::make_shared<PlantRuntime>(plant, wait, options)),
      netEnum_(std::make_unique<SimNetEnum>(runtime_)),
      ddeServers_(std::make_unique<SimDdeServers>(std::move(plant), wait.Events())) {}

SimulatedPlant::~SimulatedPlant() = default;

SimDdeServers& SimulatedPlant::DdeServers() {
    return *ddeServers_;
}

platform::NetEnumApi& SimulatedPlant::NetEnum() {
    return *netEnum_;
}

ErrorInfo SimulatedPlant::CreateServer(std::unique_ptr<platform::OPCServer>& cServer) {
    if (runtime_->CreateFails()) {
        return {429, "ActiveX component can't create object"};
    }
    cServer = std::make_unique<SimServer>(runtime_);
    return {};
}

double SimulatedPlant::Now() const {
    PlantClock& clock = runtime_->Clock();
    return clock.OleDate(clock.NowMs());
}

ErrorInfo SimulatedPlant::Find(const std::string& node, const std::string& serverId,
                               std::shared_ptr<ServerInstance>& instance) {
    const ComputerSpec* computer = runtime_->ResolveComputer(node);
    if (computer == nullptr) {
        return {E_INVALIDARG, "The plant has no computer \"" + node + "\"."};
    }
    const bool registered =
        std::any_of(computer->servers.begin(), computer->servers.end(),
                    [&](const std::string& id) { return EqualsIgnoringCase(id, serverId); });
    if (!registered) {
        return {E_INVALIDARG,
                "The server \"" + serverId + "\" is not registered on \"" + computer->name + "\"."};
    }
    instance = runtime_->Instance(*computer, *runtime_->Plant().FindServer(serverId));
    return {};
}

ErrorInfo SimulatedPlant::FindItem(const std::string& node, const std::string& serverId,
                                   const std::string& itemId,
                                   std::shared_ptr<ServerInstance>& instance, size_t& item) {
    if (const ErrorInfo error = Find(node, serverId, instance)) {
        return error;
    }
    const ItemSpec* described = instance->Described().FindItem(itemId);
    if (described == nullptr) {
        return {E_INVALIDARG, "The server \"" + serverId + "\" has no item \"" + itemId + "\"."};
    }
    item = instance->Described().IndexOf(*described);
    return {};
}

ErrorInfo SimulatedPlant::SetItemValue(const std::string& node, const std::string& serverId,
                                       const std::string& itemId, const Variant& value) {
    std::shared_ptr<ServerInstance> instance;
    size_t item = 0;
    const ErrorInfo error = FindItem(node, serverId, itemId, instance, item);
    if (!error) {
        instance->Force(item, value);
    }
    return error;
}

ErrorInfo SimulatedPlant::SetItemQuality(const std::string& node, const std::string& serverId,
                                         const std::string& itemId, uint16_t quality) {
    std::shared_ptr<ServerInstance> instance;
    size_t item = 0;
    const ErrorInfo error = FindItem(node, serverId, itemId, instance, item);
    if (!error) {
        instance->ForceQuality(item, quality);
    }
    return error;
}

ErrorInfo SimulatedPlant::ShutDownServer(const std::string& node, const std::string& serverId,
                                         const std::string& reason) {
    std::shared_ptr<ServerInstance> instance;
    const ErrorInfo error = Find(node, serverId, instance);
    if (!error) {
        instance->ShutDown(reason);
    }
    return error;
}

ErrorInfo SimulatedPlant::DropServer(const std::string& node, const std::string& serverId) {
    std::shared_ptr<ServerInstance> instance;
    const ErrorInfo error = Find(node, serverId, instance);
    if (!error) {
        instance->Drop();
    }
    return error;
}

ErrorInfo SimulatedPlant::SetCallDelay(const std::string& node, const std::string& serverId,
                                       uint32_t ms) {
    std::shared_ptr<ServerInstance> instance;
    const ErrorInfo error = Find(node, serverId, instance);
    if (!error) {
        instance->SetCallDelay(ms);
    }
    return error;
}

ErrorInfo SimulatedPlant::ClientNames(const std::string& node, const std::string& serverId,
                                      std::vector<std::string>& names) {
    std::shared_ptr<ServerInstance> instance;
    const ErrorInfo error = Find(node, serverId, instance);
    if (!error) {
        names = instance->ClientNames();
    }
    return error;
}

}  // namespace cv::sim
