#include "platform/sim/PlantRuntime.h"

#include "platform/AsciiCase.h"
#include "platform/sim/ErrorTexts.h"
#include "platform/sim/ServerInstance.h"

namespace cv::sim {

using namespace platform::OpcResult;

PlantRuntime::PlantRuntime(std::shared_ptr<const PlantDescription> plant,
                           platform::ServerCallWait& wait, const PlantOptions& options)
    : plant_(std::move(plant)),
      wait_(wait),
      clock_(wait.Events(), options.startDate.value_or(PlantClock::LocalNow())),
      localName_(options.localComputerName) {
    if (localName_.empty() && plant_->LocalComputer() != nullptr) {
        localName_ = plant_->LocalComputer()->name;
    }
}

const ComputerSpec* PlantRuntime::ResolveComputer(const std::string& node) const {
    const size_t start = node.find_first_not_of('\\');
    const std::string name = start == std::string::npos ? std::string() : node.substr(start);
    if (name.empty() || name == "." || EqualsIgnoringCase(name, "localhost") ||
        EqualsIgnoringCase(name, localName_)) {
        return plant_->LocalComputer();
    }
    return plant_->FindComputer(name);
}

ErrorInfo PlantRuntime::Reach(const ComputerSpec* computer) {
    if (computer == nullptr) {
        return ServerError(RPC_S_SERVER_UNAVAILABLE);
    }
    if (computer->access == ComputerAccess::Denied) {
        return ServerError(E_ACCESSDENIED);
    }
    if (computer->access == ComputerAccess::Silent) {
        const ErrorInfo waited = Delay(computer->answerAfterMs);
        return waited ? waited : ServerError(RPC_S_SERVER_UNAVAILABLE);
    }
    return {};
}

ErrorInfo PlantRuntime::ListServers(const std::optional<std::string>& node, Variant& servers) {
    const ComputerSpec* computer = ResolveComputer(node.value_or(std::string()));
    if (const ErrorInfo error = Reach(computer)) {
        return error;
    }
    std::vector<Variant> ids;
    for (const std::string& id : computer->servers) {
        ids.push_back(Variant::Str(id));
    }
    servers = Variant::Array(VT_BSTR, std::move(ids), 1);
    return {};
}

ErrorInfo PlantRuntime::Delay(uint32_t ms) {
    if (ms == 0) {
        return {};
    }
    auto answered = std::make_shared<bool>(false);
    const auto timer = Events().StartTimer(ms, false, [answered] { *answered = true; });
    ErrorInfo error = wait_.Wait([answered] { return *answered; });
    Events().StopTimer(timer);
    return error;
}

std::shared_ptr<ServerInstance> PlantRuntime::Instance(const ComputerSpec& computer,
                                                       const ServerSpec& server) {
    auto& instance = instances_[{&computer, &server}];
    if (!instance) {
        instance = std::make_shared<ServerInstance>(*this, server);
    }
    return instance;
}

}  // namespace cv::sim
