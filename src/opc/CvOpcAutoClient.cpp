#include "opc/CvOpcAutoClient.h"

#include <utility>

#include "opc/ClientErrors.h"
#include "opc/PriorToConnect.h"
#include "platform/Platform.h"
#include "platform/opc/OpcResult.h"
#include "util/ProgramRoutines.h"

namespace cv {

using namespace platform::OpcResult;

namespace {

const char* BoolText(bool bValue) {
    return bValue ? "True" : "False";
}

}  // namespace

CvOpcAutoClient::CvOpcAutoClient(Platform& platform) : mPlatform(platform), mcTunerType(platform) {
    mcTunerType.SetTuner(ProgramTunerKind());
}

CvOpcAutoClient::~CvOpcAutoClient() {
    mpLife->alive = false;
    // Nobody is left to hear a failure; everything ends all the same.
    (void)GoOffline();
}

void CvOpcAutoClient::Trace(Platform& platform, std::string sLabel) {
    platform.trace.Add(platform.events.TimeGetTime(), std::move(sLabel));
}

std::string CvOpcAutoClient::GroupName(int32_t lGroup) const {
    return mcTunerType.RegistryName() + (lGroup == 2 ? "2" : "");
}

// The computer, then the program as its path would read on the system the
// servers know: folder, "\", name, ".exe".
std::string CvOpcAutoClient::ClientName() const {
    std::string sFile = mPlatform.program.FileName();
    if (const size_t lDot = sFile.rfind('.'); lDot != std::string::npos) {
        sFile.erase(lDot);
    }
    return ComputerName(mPlatform) + ";" + mPlatform.program.Folder() + "\\" + sFile + ".exe";
}

std::string CvOpcAutoClient::ServerID() const {
    const auto server = mcOpcServer;
    if (!server) {
        return {};
    }
    Trace("Read server name");
    std::string sName;
    // A server that cannot name itself matches no channel's server.
    return server->ServerName(sName) ? std::string() : sName;
}

std::string CvOpcAutoClient::ServerNode() const {
    const auto server = mcOpcServer;
    if (!server) {
        return {};
    }
    Trace("Read server node");
    std::string sNode;
    return server->ServerNode(sNode) ? std::string() : sNode;
}

void CvOpcAutoClient::PriorToConnect(const std::string& sServerID, const std::string& sComputer) {
    cv::PriorToConnect(mPlatform.serverCalls, sServerID, sComputer);
}

ErrorInfo CvOpcAutoClient::CreateServerAndGroup(const std::string& sServerID,
                                                const std::string& sComputer) {
    if (mcOpcServer) {
        (void)GoOffline();  // the new connection replaces the old, whatever its end
    }
    const Watch watch = Watching();
    std::unique_ptr<platform::OPCServer> cCreated;
    if (const ErrorInfo error = mPlatform.opc.CreateServer(cCreated); error || !cCreated) {
        return {CannotCreateServer, error.Description};
    }
    mcOpcServer = std::move(cCreated);
    mcOpcServer->SetShutDownHandler(
        [this](const std::string& sReason) { mcOpcServer_ServerShutDown(sReason); });
    const auto server = mcOpcServer;
    Trace("Read server name");
    std::string sName;
    const ErrorInfo named = server->ServerName(sName);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (named) {
        return {CannotCreateServer, named.Description};
    }
    if (sServerID.empty()) {
        return {E_FAIL, "Unspecified error"};
    }
    PriorToConnect(sServerID, sComputer);
    if (ErrorInfo error = Connect(sServerID, sComputer)) {
        return error;
    }
    if (ErrorInfo error = AddGroup(1)) {
        return error;
    }
    const GroupPtr group = mcOpcGroup1;
    Trace("OPCGroup.IsActive = False");
    const ErrorInfo deactivated = group->SetIsActive(false);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (deactivated) {
        return deactivated;
    }
    Trace("OPCGroup.IsSubscribed = True");
    const ErrorInfo subscribed = group->SetIsSubscribed(true);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (subscribed) {
        Trace("CannotSubcribeError: " + subscribed.Description);
        return {CannotSubscribe, subscribed.Description};
    }
    return {};
}

// Connects and names the client; a name the server refuses does not matter.
ErrorInfo CvOpcAutoClient::Connect(const std::string& sServerID, const std::string& sComputer) {
    const Watch watch = Watching();
    const auto server = mcOpcServer;
    Trace("Server.Connect " + sServerID + ", " + sComputer);
    const ErrorInfo connected = server->Connect(sServerID, sComputer);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (connected) {
        return connected;
    }
    const std::string sClientName = ClientName();
    Trace("Server.ClientName = " + sClientName);
    const ErrorInfo named = server->SetClientName(sClientName);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (named) {
        Trace("ClientName error");
    }
    return {};
}

// Adds group 1 or 2 under its name and takes its notifications.
ErrorInfo CvOpcAutoClient::AddGroup(int32_t lGroup) {
    const Watch watch = Watching();
    const auto server = mcOpcServer;
    if (!server) {
        return ClientErrors::NoObject();
    }
    Trace("Call Server.OPCGroups");
    const std::string sName = GroupName(lGroup);
    Trace("OPCGroups.Add " + sName);
    GroupPtr group;
    const ErrorInfo added = server->OPCGroups().Add(sName, group);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (added) {
        return added;
    }
    if (!group) {
        return ClientErrors::NoObject();
    }
    group->SetDataChangeHandler(
        [this, lGroup](const platform::DataChangeArgs& args) { ChannelDataChange(lGroup, args); });
    (lGroup == 2 ? mcOpcGroup2 : mcOpcGroup1) = group;
    return {};
}

ErrorInfo CvOpcAutoClient::AddExtraGroup() {
    if (mcOpcGroup2) {
        return {};
    }
    const Watch watch = Watching();
    if (ErrorInfo error = AddGroup(2)) {
        return error;
    }
    const GroupPtr group = mcOpcGroup2;
    Trace("OPCGroup2.IsActive = False");
    const ErrorInfo deactivated = group->SetIsActive(false);
    if (watch.Ended()) {
        return ClientErrors::Disconnected();
    }
    if (deactivated) {
        return deactivated;
    }
    Trace("OPCGroup2.IsSubscribed = True");
    const ErrorInfo subscribed = group->SetIsSubscribed(true);
    return watch.Ended() ? ClientErrors::Disconnected() : subscribed;
}

ErrorInfo CvOpcAutoClient::UpdateRate(int32_t lGroup, int32_t lRate) {
    const GroupPtr group = Group(lGroup);
    if (!group) {
        return ClientErrors::NoObject();
    }
    if (lGroup != 2) {
        Trace("OPCGroup.UpdateRate = " + std::to_string(lRate));
    }
    return group->SetUpdateRate(lRate);
}

void CvOpcAutoClient::Advise(int32_t lGroup, bool bValue) {
    AdviseGroup(mPlatform, Group(lGroup), lGroup, bValue);
}

void CvOpcAutoClient::AdviseGroup(Platform& platform, GroupPtr group, int32_t lGroup, bool bValue) {
    if (!group) {
        return;
    }
    // A failure ends the advice without a report.
    if (lGroup != 2) {
        Trace(platform, std::string("OPCGroup.IsActive = ") + BoolText(bValue));
        (void)group->SetIsActive(bValue);
        return;
    }
    if (group->SetIsSubscribed(bValue) || bValue) {
        return;
    }
    (void)group->SetIsActive(false);
}

}  // namespace cv
