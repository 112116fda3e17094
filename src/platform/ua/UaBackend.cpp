#include "platform/ua/UaBackend.h"

#include "platform/AsciiCase.h"
#include "platform/ua/UaRuntime.h"
#include "platform/ua/UaServer.h"
#include "ua/transport/EndpointUrl.h"

namespace cv::uaopc {

UaBackend::UaBackend(platform::ServerCallWait& wait, UaOptions options)
    : runtime_(std::make_shared<UaRuntime>(wait, std::move(options))) {}

bool UaBackend::IsEndpointUrl(const std::string& text) {
    return static_cast<bool>(ua::EndpointUrl::Parse(text));
}

ErrorInfo UaBackend::CreateServer(std::unique_ptr<platform::OPCServer>& cServer) {
    cServer = std::make_unique<UaServer>(runtime_);
    return {};
}

std::vector<std::string> UaBackend::FindServers(const std::string& sNode) {
    const auto runtime = runtime_;
    std::vector<std::string> ids;
    for (const FoundServer& server : runtime->FindServers(sNode)) {
        ids.push_back(server.address);
    }
    return ids;
}

std::optional<std::string> UaBackend::FindServerNamed(const std::string& sName,
                                                      const std::string& sNode) {
    const auto runtime = runtime_;
    for (const FoundServer& server : runtime->FindServers(sNode)) {
        if (!sName.empty() && EqualsIgnoringCase(server.name, sName)) {
            return server.address;
        }
    }
    return std::nullopt;
}

}  // namespace cv::uaopc
