#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <utility>

#include "platform/ErrorInfo.h"
#include "platform/EventLoop.h"
#include "platform/ServerCallWait.h"
#include "platform/Variant.h"
#include "platform/sim/PlantClock.h"
#include "platform/sim/PlantDescription.h"

namespace cv::sim {

class ServerInstance;

struct PlantOptions {
    // This computer's name on the network; empty: the plant file's name for it.
    std::string localComputerName;
    // The OLE date (local time) at which the plant's clock starts; default:
    // the system clock's now.
    std::optional<double> startDate;
};

// What every object of a running plant shares: the description, the clock,
// the event loop with its call wait, and the server instances that have run.
// Held by shared pointers, so that it outlives each object handed out.
class PlantRuntime {
  public:
    PlantRuntime(std::shared_ptr<const PlantDescription> plant, platform::ServerCallWait& wait,
                 const PlantOptions& options);
    PlantRuntime(const PlantRuntime&) = delete;
    PlantRuntime& operator=(const PlantRuntime&) = delete;

    const PlantDescription& Plant() const { return *plant_; }
    platform::EventLoop& Events() { return wait_.Events(); }
    PlantClock& Clock() { return clock_; }
    const std::string& LocalName() const { return localName_; }

    // The computer a node names: empty, ".", "localhost" or this computer's
    // name (with or without leading backslashes) is this computer; nullptr
    // when the network has no such computer.
    const ComputerSpec* ResolveComputer(const std::string& node) const;
    // Fails as a call to that computer fails before any server is asked:
    // unknown, access denied, or no answer after its waiting time.
    ErrorInfo Reach(const ComputerSpec* computer);
    // The server IDs registered on a computer, as a 1-based array of texts.
    ErrorInfo ListServers(const std::optional<std::string>& node, Variant& servers);
    // A call that takes ms: the window thread's events run meanwhile, the
    // busy notice shows after its time-out, and the call limit applies.
    ErrorInfo Delay(uint32_t ms);

    // The instance of a server on a computer; it keeps its item values and
    // settings across starts and stops.
    std::shared_ptr<ServerInstance> Instance(const ComputerSpec& computer,
                                             const ServerSpec& server);

    bool CreateFails() const { return createFails_; }
    void SetCreateFails(bool fails) { createFails_ = fails; }

  private:
    std::shared_ptr<const PlantDescription> plant_;
    platform::ServerCallWait& wait_;
    PlantClock clock_;
    std::string localName_;
    std::map<std::pair<const ComputerSpec*, const ServerSpec*>, std::shared_ptr<ServerInstance>>
        instances_;
    bool createFails_ = false;
};

}  // namespace cv::sim
