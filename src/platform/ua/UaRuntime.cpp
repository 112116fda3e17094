#include "platform/ua/UaRuntime.h"

#include "platform/ua/UaAwait.h"
#include "ua/transport/EndpointUrl.h"
#include "ua/types/PlainText.h"

namespace cv::uaopc {

namespace {

std::string UrlOf(const std::string& host, uint16_t port, const std::string& path) {
    const bool ipv6 = host.find(':') != std::string::npos;
    return "opc.tcp://" + (ipv6 ? "[" + host + "]" : host) + ":" + std::to_string(port) + path;
}

// The endpoint URL of a server found on host, from its first opc.tcp
// discovery URL; empty when it has none.
std::string AddressOf(const ua::ApplicationDescription& server, const std::string& host) {
    for (const std::string& url : server.discoveryUrls) {
        const auto parsed = ua::EndpointUrl::Parse(url);
        if (parsed) {
            return UrlOf(host, parsed.Value().port, parsed.Value().path);
        }
    }
    return {};
}

}  // namespace

std::string HostOfNode(const std::string& node) {
    const size_t start = node.find_first_not_of('\\');
    const std::string name = start == std::string::npos ? std::string() : node.substr(start);
    return name.empty() || name == "." ? "localhost" : name;
}

std::unique_ptr<ua::Client> UaRuntime::NewClient(const ua::ClientOptions& options) {
    platform::EventLoop& events = wait_.Events();
    return std::make_unique<ua::Client>(
        [&events](std::function<void()> work) { events.Post(std::move(work)); }, options);
}

void UaRuntime::CloseInBackground(std::unique_ptr<ua::Client> client) {
    ua::Client* raw = client.get();
    closing_.emplace(raw, std::move(client));
    raw->Close([weak = weak_from_this(), raw] {
        if (const auto self = weak.lock()) {
            self->closing_.erase(raw);
        }
    });
}

std::vector<FoundServer> UaRuntime::FindServers(const std::string& node) {
    if (options_.discoveryPort == 0) {
        return {};
    }
    if (!discovery_) {
        ua::ClientOptions options;
        options.requestTimeoutMs = options_.discoveryTimeoutMs;
        options.channel.connectTimeoutMs = options_.discoveryTimeoutMs;
        discovery_ = NewClient(options);
    }
    const std::string host = HostOfNode(node);
    const std::string url = UrlOf(host, options_.discoveryPort, "");
    platform::EventLoop& events = wait_.Events();
    const auto late = std::make_shared<bool>(false);
    const auto timer =
        events.StartTimer(options_.discoveryTimeoutMs, false, [late] { *late = true; });
    std::optional<ua::Result<std::vector<ua::ApplicationDescription>>> answer;
    ua::Client& client = *discovery_;
    const ErrorInfo error = Await<std::vector<ua::ApplicationDescription>>(
        wait_, [late] { return *late; },
        [&](auto done) { client.FindServers(url, std::move(done)); }, answer);
    events.StopTimer(timer);
    std::vector<FoundServer> found;
    if (error || !answer || !*answer) {
        return found;
    }
    for (const ua::ApplicationDescription& server : answer->Value()) {
        const std::string address = AddressOf(server, host);
        if (server.applicationType != ua::ApplicationType::DiscoveryServer && !address.empty()) {
            found.push_back({ua::PlainText(server.applicationName.text), address});
        }
    }
    return found;
}

}  // namespace cv::uaopc
