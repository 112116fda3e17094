#include "platform/sim/SimServer.h"

#include "platform/opc/OpcResult.h"
#include "platform/sim/ErrorTexts.h"
#include "platform/sim/PlantRuntime.h"
#include "platform/sim/ServerInstance.h"
#include "platform/sim/SimBrowser.h"

namespace cv::sim {

// Calls that may wait hold the shared state themselves: an event handler
// may release this object while they wait.

SimServer::SimServer(const std::shared_ptr<PlantRuntime>& runtime)
    : connection_(std::make_shared<Connection>(runtime)), groups_(connection_) {}

SimServer::~SimServer() {
    connection_->Release();
}

ErrorInfo SimServer::ServerName(std::string& sName) const {
    sName = connection_->ProgId();
    return {};
}

ErrorInfo SimServer::ServerNode(std::string& sNode) const {
    sNode = connection_->Node();
    return {};
}

ErrorInfo SimServer::Connect(const std::string& sProgID, const std::string& sNode) {
    const auto connection = connection_;
    return connection->Connect(sProgID, sNode);
}

ErrorInfo SimServer::SetClientName(const std::string& sName) {
    if (const ErrorInfo error = connection_->Check()) {
        return error;
    }
    connection_->SetClientName(sName);
    return {};
}

ErrorInfo SimServer::GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) {
    const auto runtime = connection_->SharedRuntime();
    return runtime->ListServers(sNode, vServers);
}

ErrorInfo SimServer::CreateBrowser(std::shared_ptr<platform::OPCBrowser>& cBrowser) {
    const auto connection = connection_;
    if (const ErrorInfo error = connection->Call()) {
        return error;
    }
    const ServerSpec& server = connection->Server().Described();
    if (!server.browsable) {
        return ServerError(SimResult::E_NOINTERFACE);
    }
    cBrowser = std::make_shared<SimBrowser>(connection, server);
    return {};
}

ErrorInfo SimServer::GetErrorString(int32_t lError, std::string& sText) {
    const auto connection = connection_;
    if (const ErrorInfo error = connection->Call()) {
        return error;
    }
    const auto text = ErrorText(lError);
    if (!text) {
        return ServerError(platform::OpcResult::E_INVALIDARG);
    }
    sText = *text;
    return {};
}

ErrorInfo SimServer::Disconnect() {
    connection_->Disconnect();
    return {};
}

void SimServer::SetShutDownHandler(ShutDownHandler handler) {
    connection_->SetShutDownHandler(std::move(handler));
}

}  // namespace cv::sim
