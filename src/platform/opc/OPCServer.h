#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

#include "platform/ErrorInfo.h"
#include "platform/Variant.h"
#include "platform/opc/OPCBrowser.h"
#include "platform/opc/OPCGroups.h"

namespace cv::platform {

// One server object of the automation interface: created unconnected, it
// lists the servers of a computer; connected, it holds groups and browsers.
//
// Calls that reach a server may take time: they let the window thread's
// events run while they wait (notifications, repaints, input), show the busy
// notice after its time-out, and fail with RPC_E_TIMEOUT after the call
// limit. An event handler may release any object, this one included, while a
// call of it waits: the call then ends with an error and touches nothing that
// was released. Groups, items and browsers handed out fail their calls once
// their server is disconnected or released.
class OPCServer {
  public:
    using ShutDownHandler = std::function<void(const std::string& sReason)>;

    virtual ~OPCServer() = default;
    virtual ErrorInfo ServerName(std::string& sName) const = 0;
    virtual ErrorInfo ServerNode(std::string& sNode) const = 0;
    // sNode is empty for this computer.
    virtual ErrorInfo Connect(const std::string& sProgID, const std::string& sNode) = 0;
    virtual ErrorInfo SetClientName(const std::string& sName) = 0;
    virtual platform::OPCGroups& OPCGroups() = 0;
    // The server IDs registered on a computer (this one when no node is
    // given), as an array of texts.
    virtual ErrorInfo GetOPCServers(const std::optional<std::string>& sNode, Variant& vServers) = 0;
    virtual ErrorInfo CreateBrowser(std::shared_ptr<OPCBrowser>& cBrowser) = 0;
    virtual ErrorInfo GetErrorString(int32_t lError, std::string& sText) = 0;
    virtual ErrorInfo Disconnect() = 0;
    // Fires from the event loop when the server announces that it goes down
    // or is lost for good.
    virtual void SetShutDownHandler(ShutDownHandler handler) = 0;
    // Which kind of server this object talks to, in words for the user
    // ("simulated plant", "OPC UA"); empty while that is not known yet.
    virtual std::string BackendName() const = 0;
};

}  // namespace cv::platform
