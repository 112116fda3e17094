#include "platform/ua/UaServer.h"

#include "platform/ua/UaBrowser.h"

namespace cv::uaopc {

// Calls that may wait hold the shared state themselves: an event handler
// may release this object while they wait.

ErrorInfo UaServer::ServerName(std::string& sName) const {
    sName = connection_->Address();
    return {};
}

ErrorInfo UaServer::ServerNode(std::string& sNode) const {
    sNode = connection_->Node();
    return {};
}

ErrorInfo UaServer::Connect(const std::string& sProgID, const std::string& sNode) {
    const auto connection = connection_;
    return connection->Connect(sProgID, sNode);
}

// The session's name was given when it opened; the text is not kept.
ErrorInfo UaServer::SetClientName(const std::string&) {
    return connection_->Check();
}

ErrorInfo UaServer::GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) {
    const auto runtime = connection_->Runtime();
    std::vector<Variant> ids;
    for (const FoundServer& server : runtime->FindServers(sNode.value_or(std::string()))) {
        ids.push_back(Variant::Str(server.address));
    }
    vServers = Variant::Array(VT_BSTR, std::move(ids), 1);
    return {};
}

ErrorInfo UaServer::CreateBrowser(std::shared_ptr<platform::OPCBrowser>& cBrowser) {
    if (const ErrorInfo error = connection_->Check()) {
        return error;
    }
    cBrowser = std::make_shared<UaBrowser>(connection_);
    return {};
}

ErrorInfo UaServer::GetErrorString(int32_t lError, std::string& sText) {
    return connection_->ErrorText(lError, sText);
}

ErrorInfo UaServer::Disconnect() {
    connection_->Disconnect();
    return {};
}

void UaServer::SetShutDownHandler(ShutDownHandler handler) {
    connection_->SetShutDownHandler(std::move(handler));
}

}  // namespace cv::uaopc
