#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/opc/OPCServer.h"

namespace cv::sim {

class GroupState;
class PlantRuntime;
class ServerInstance;

// The state behind one OPCServer object: which server it is connected to,
// its groups and its shutdown handler. Shared with the groups, items and
// browsers it hands out, so that a call that waits while an event handler
// releases the server object still finds its state, and fails.
class Connection : public std::enable_shared_from_this<Connection> {
  public:
    explicit Connection(std::shared_ptr<PlantRuntime> runtime) : runtime_(std::move(runtime)) {}
    Connection(const Connection&) = delete;
    Connection& operator=(const Connection&) = delete;

    const std::shared_ptr<PlantRuntime>& SharedRuntime() const { return runtime_; }

    ErrorInfo Connect(const std::string& progId, const std::string& node);
    // Ends the connection: groups removed, handed-out objects fail. Never fails.
    void Disconnect();
    // The server object is gone: as Disconnect, and no more events.
    void Release();

    const std::string& ClientName() const { return clientName_; }
    void SetClientName(std::string name) { clientName_ = std::move(name); }
    const std::string& ProgId() const { return progId_; }
    const std::string& Node() const { return node_; }
    // Grows with each Connect, so that a browser can tell its session ended.
    uint64_t Session() const { return session_; }

    // Fails when the connection cannot carry calls (never connected,
    // disconnected, released, or its server went away).
    ErrorInfo Check() const;
    // A call into the server: Check, the server's call time with events
    // running, Check again.
    ErrorInfo Call();
    // The connected server; only after a successful Check.
    ServerInstance& Server() { return *server_; }

    int32_t GroupCount() const { return static_cast<int32_t>(groups_.size()); }
    ErrorInfo AddGroup(const std::string& name, std::shared_ptr<GroupState>& group);
    ErrorInfo RemoveGroup(const std::string& name);
    ErrorInfo RemoveAllGroups();
    int32_t NewServerHandle() { return nextHandle_++; }

    void SetShutDownHandler(platform::OPCServer::ShutDownHandler handler) {
        handler_ = std::move(handler);
    }
    // From the server instance as it ends: with a reason, the shutdown
    // handler hears it from the event loop.
    void ServerEnded(int32_t code, const std::string* reason);

  private:
    void EndGroups();

    std::shared_ptr<PlantRuntime> runtime_;
    std::shared_ptr<ServerInstance> server_;
    std::vector<std::shared_ptr<GroupState>> groups_;
    std::string progId_;
    std::string node_;
    std::string clientName_;
    bool connected_ = false;
    bool released_ = false;
    int32_t endedCode_ = 0;
    uint64_t session_ = 0;
    int32_t nextHandle_ = 1;
    int32_t nextGroupNumber_ = 1;
    platform::OPCServer::ShutDownHandler handler_;
};

}  // namespace cv::sim
