#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "platform/ServerCallWait.h"
#include "platform/ua/UaOptions.h"
#include "ua/client/Client.h"

namespace cv::uaopc {

// A server found by discovery: its application name and the endpoint URL
// to connect to.
struct FoundServer {
    std::string name;
    std::string address;
};

// What every object of the OPC UA backend shares: the window thread's call
// wait and event loop, the options, the discovery client, and the clients
// that are closing their sessions. Held by shared pointers, so that it
// outlives each object handed out; the event loop and the call wait must
// outlive it.
class UaRuntime : public std::enable_shared_from_this<UaRuntime> {
  public:
    UaRuntime(platform::ServerCallWait& wait, UaOptions options)
        : wait_(wait), options_(std::move(options)) {}
    UaRuntime(const UaRuntime&) = delete;
    UaRuntime& operator=(const UaRuntime&) = delete;

    platform::ServerCallWait& CallWait() { return wait_; }
    const UaOptions& Options() const { return options_; }

    // A client whose completions run on the window thread's event loop.
    std::unique_ptr<ua::Client> NewClient(const ua::ClientOptions& options);
    // Closes the client's session without waiting; the client goes once
    // that is done (or with this runtime).
    void CloseInBackground(std::unique_ptr<ua::Client> client);

    // The servers FindServers reports at the computer's discovery port,
    // without discovery servers, each with the endpoint URL its first
    // opc.tcp discovery URL gives, on the host that was asked (advertised
    // host names are often unknown to the caller). Empty when the computer
    // does not answer within the discovery time-out, or discovery is off.
    std::vector<FoundServer> FindServers(const std::string& node);

  private:
    platform::ServerCallWait& wait_;
    UaOptions options_;
    std::unique_ptr<ua::Client> discovery_;
    std::map<ua::Client*, std::unique_ptr<ua::Client>> closing_;
};

// The host a computer name stands for: without leading backslashes;
// "localhost" for this computer (an empty name or ".").
std::string HostOfNode(const std::string& node);

}  // namespace cv::uaopc
