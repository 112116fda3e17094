#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/NetEnumApi.h"
#include "platform/ServerCallWait.h"
#include "platform/Variant.h"
#include "platform/opc/OpcServerFactory.h"
#include "platform/sim/PlantDescription.h"
#include "platform/sim/PlantRuntime.h"

namespace cv::sim {

class ServerInstance;
class SimDdeServers;
class SimNetEnum;

// The simulated plant: a network of computers with OPC servers, described by
// a plant file (PlantLoader.h), with DDE applications, running on the
// window thread's event loop.
// It creates the server objects of the automation interface, lists its
// network through the network enumeration, and lets tests change the plant
// while it runs.
//
// Calls into its servers wait through the given ServerCallWait (events run,
// busy notice, call limit); notifications and shutdowns come from the event
// loop. The event loop and the call wait must outlive every object the
// plant hands out; the plant itself may go first.
class SimulatedPlant : public platform::OpcServerFactory {
  public:
    SimulatedPlant(std::shared_ptr<const PlantDescription> plant, platform::ServerCallWait& wait,
                   const PlantOptions& options = {});
    ~SimulatedPlant() override;
    SimulatedPlant(const SimulatedPlant&) = delete;
    SimulatedPlant& operator=(const SimulatedPlant&) = delete;

    ErrorInfo CreateServer(std::unique_ptr<platform::OPCServer>& cServer) override;
    // The plant's network: providers, domains, computers and their shares.
    platform::NetEnumApi& NetEnum();
    // The plant's DDE applications, which make the DDE links.
    SimDdeServers& DdeServers();

    const PlantDescription& Description() const { return runtime_->Plant(); }
    // This computer's name on the simulated network.
    const std::string& LocalComputerName() const { return runtime_->LocalName(); }
    // The plant's time now, as the time stamps of its values give it.
    double Now() const;

    // Changes for tests. Each names a server on a computer (node as for
    // Connect: empty for this computer) and fails with E_INVALIDARG when the
    // plant has no such server there.
    //
    // Creating a server object fails ("the object cannot be created").
    void SetCreateFails(bool fails) { runtime_->SetCreateFails(fails); }
    // Gives an item a value of any type, past its rights and conversions;
    // the generator no longer moves it.
    ErrorInfo SetItemValue(const std::string& node, const std::string& serverId,
                           const std::string& itemId, const Variant& value);
    ErrorInfo SetItemQuality(const std::string& node, const std::string& serverId,
                             const std::string& itemId, uint16_t quality);
    // The server announces that it goes down (its clients hear it from the
    // event loop) and ends; a later Connect starts it again.
    ErrorInfo ShutDownServer(const std::string& node, const std::string& serverId,
                             const std::string& reason);
    // The server disappears between calls: every call of its clients fails
    // with RPC_S_SERVER_UNAVAILABLE; a later Connect starts it again.
    ErrorInfo DropServer(const std::string& node, const std::string& serverId);
    ErrorInfo SetCallDelay(const std::string& node, const std::string& serverId, uint32_t ms);
    // The client names of the server's connected clients.
    ErrorInfo ClientNames(const std::string& node, const std::string& serverId,
                          std::vector<std::string>& names);

  private:
    ErrorInfo Find(const std::string& node, const std::string& serverId,
                   std::shared_ptr<ServerInstance>& instance);
    ErrorInfo FindItem(const std::string& node, const std::string& serverId,
                       const std::string& itemId, std::shared_ptr<ServerInstance>& instance,
                       size_t& item);

    std::shared_ptr<PlantRuntime> runtime_;
    std::unique_ptr<SimNetEnum> netEnum_;
    std::unique_ptr<SimDdeServers> ddeServers_;
};

}  // namespace cv::sim
