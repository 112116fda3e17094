#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/ErrorInfo.h"
#include "platform/opc/OPCServer.h"
#include "platform/ua/UaAwait.h"
#include "platform/ua/UaRuntime.h"
#include "ua/client/Client.h"

namespace cv::uaopc {

class UaGroupState;

// The state behind one OPCServer object of the OPC UA backend: its client
// and session, its groups, its shutdown handler, and the UA statuses its
// errors came from. Shared with the groups, items and browsers it hands
// out, so that a call that waits while an event handler releases the
// server object still finds its state, and fails.
class UaConnection : public std::enable_shared_from_this<UaConnection> {
  public:
    explicit UaConnection(std::shared_ptr<UaRuntime> runtime) : runtime_(std::move(runtime)) {}
    UaConnection(const UaConnection&) = delete;
    UaConnection& operator=(const UaConnection&) = delete;

    const std::shared_ptr<UaRuntime>& Runtime() const { return runtime_; }

    // Opens a session at the endpoint URL; any failure to reach the server
    // or to open the session is E_FAIL with the reason.
    ErrorInfo Connect(const std::string& address, const std::string& node);
    // Ends the connection: groups removed, session closed without waiting,
    // handed-out objects fail. Never fails.
    void Disconnect();
    // The server object is gone: as Disconnect, and no more events.
    void Release();

    const std::string& Address() const { return address_; }
    const std::string& Node() const { return node_; }
    // Grows with each Connect, so that a browser can tell its session ended.
    uint64_t Session() const { return session_; }
    const std::vector<std::string>& NamespaceUris() const { return namespaces_; }
    void SetShutDownHandler(platform::OPCServer::ShutDownHandler handler) {
        handler_ = std::move(handler);
    }

    // Fails when the connection cannot carry calls (never connected,
    // disconnected, released, or the server went away).
    ErrorInfo Check() const;

    // A service call: starts it on the client with the completion it gets
    // and waits for the answer with events running. A call that failed
    // because the connection broke under it is made once more when retry
    // is set (the client holds it until the session is resumed), so use
    // retry only for calls that change nothing on the server.
    template <class T, class Start>
    ErrorInfo Call(Start start, std::optional<ua::Result<T>>& result, bool retry = false);

    // The Data Access error of an operation's status, remembered so that
    // GetErrorString can name the UA status behind it.
    int32_t ResultOf(ua::StatusCode status);
    // A whole call that failed, as its error.
    ErrorInfo CallError(const ua::Error& failure);
    // The UA status name and text behind an error code.
    ErrorInfo ErrorText(int32_t code, std::string& text) const;

    int32_t GroupCount() const { return static_cast<int32_t>(groups_.size()); }
    ErrorInfo AddGroup(const std::string& name, std::shared_ptr<UaGroupState>& group);
    ErrorInfo RemoveGroup(const std::string& name);
    ErrorInfo RemoveAllGroups();
    int32_t NewServerHandle() { return nextHandle_++; }

  private:
    bool Gone(uint64_t session) const { return released_ || session_ != session || ended_; }
    template <class T, class Start>
    ErrorInfo CallOnce(const Start& start, std::optional<ua::Result<T>>& result);
    void ReadNamespaces();
    void OnClientEvent(ua::ConnectionEvent event, const ua::Error& reason);
    // The server went away for good: calls fail, groups end, and the
    // shutdown handler hears the reason once.
    void End(const std::string& reason);
    void EndGroups();
    void CloseClient();

    std::shared_ptr<UaRuntime> runtime_;
    std::unique_ptr<ua::Client> client_;
    std::vector<std::shared_ptr<UaGroupState>> groups_;
    std::vector<std::string> namespaces_;
    std::map<int32_t, ua::StatusCode> statuses_;
    std::string address_;
    std::string node_;
    std::string endReason_;
    bool connected_ = false;
    bool released_ = false;
    bool ended_ = false;
    bool told_ = false;
    uint64_t session_ = 0;
    int32_t nextHandle_ = 1;
    int32_t nextGroupNumber_ = 1;
    platform::OPCServer::ShutDownHandler handler_;
};

template <class T, class Start>
ErrorInfo UaConnection::CallOnce(const Start& start, std::optional<ua::Result<T>>& result) {
    if (const ErrorInfo error = Check()) {
        return error;
    }
    const auto self = shared_from_this();
    const uint64_t session = session_;
    ua::Client& client = *client_;
    if (const ErrorInfo error = Await<T>(
            runtime_->CallWait(), [self, session] { return self->Gone(session); },
            [&](auto done) { start(client, std::move(done)); }, result)) {
        const ErrorInfo ended = Check();
        return ended ? ended : error;
    }
    return {};
}

template <class T, class Start>
ErrorInfo UaConnection::Call(Start start, std::optional<ua::Result<T>>& result, bool retry) {
    if (const ErrorInfo error = CallOnce<T>(start, result)) {
        return error;
    }
    const auto broken = [&result] {
        const ua::StatusCode status = result->Ok() ? ua::StatusCode{} : result->Failure().status;
        return status == ua::status::BadConnectionClosed ||
               status == ua::status::BadSecureChannelClosed;
    };
    if (retry && broken()) {
        result.reset();
        return CallOnce<T>(start, result);
    }
    return {};
}

}  // namespace cv::uaopc
