#include "platform/fake/ScriptedOpcServer.h"

#include <algorithm>

#include "platform/fake/ScriptedOpc.h"
#include "platform/fake/ScriptedOpcGroup.h"
#include "platform/opc/OpcResult.h"

namespace cv::fake {

ErrorInfo ScriptedOpcServer::ServerName(std::string& sName) const {
    sName = progId_;
    return script_.Call("ServerName");
}

ErrorInfo ScriptedOpcServer::ServerNode(std::string& sNode) const {
    sNode = node_;
    return script_.Call("ServerNode");
}

ErrorInfo ScriptedOpcServer::Connect(const std::string& sProgID, const std::string& sNode) {
    if (ErrorInfo error = script_.Call("Connect")) {
        return error;
    }
    progId_ = sProgID;
    node_ = sNode;
    return {};
}

ErrorInfo ScriptedOpcServer::SetClientName(const std::string&) {
    return script_.Call("SetClientName");
}

ErrorInfo ScriptedOpcServer::GetOPCServers(const std::optional<std::string>&, Variant& vServers) {
    vServers = Variant::Array(VT_BSTR, {}, 1);
    return script_.Call("GetOPCServers");
}

ErrorInfo ScriptedOpcServer::CreateBrowser(std::shared_ptr<platform::OPCBrowser>&) {
    const ErrorInfo error = script_.Call("CreateBrowser");
    return error ? error : ErrorInfo{platform::OpcResult::E_NOTIMPL, "Not implemented"};
}

ErrorInfo ScriptedOpcServer::GetErrorString(int32_t lError, std::string& sText) {
    sText = "Scripted text of " + std::to_string(lError);
    return script_.Call("GetErrorString");
}

ErrorInfo ScriptedOpcServer::Disconnect() {
    return script_.Call("Disconnect");
}

ErrorInfo ScriptedOpcServer::Add(const std::string& sName,
                                 std::shared_ptr<platform::OPCGroup>& cGroup) {
    if (ErrorInfo error = script_.Call("Add")) {
        return error;
    }
    cGroup = std::make_shared<ScriptedOpcGroup>(script_, sName);
    groups_.push_back(sName);
    return {};
}

ErrorInfo ScriptedOpcServer::Remove(const std::string& sName) {
    if (ErrorInfo error = script_.Call("Remove")) {
        return error;
    }
    std::erase(groups_, sName);
    return {};
}

ErrorInfo ScriptedOpcServer::RemoveAll() {
    if (ErrorInfo error = script_.Call("RemoveAll")) {
        return error;
    }
    groups_.clear();
    return {};
}

}  // namespace cv::fake
