#include <cstdio>
#include <initializer_list>

#include "channel/Channel.h"
#include "platform/Platform.h"
#include "util/ProgramRoutines.h"

namespace cv {

namespace {

constexpr int32_t kErrDdeInitiate = 282;
constexpr int32_t kErrDdeItem = 285;
constexpr int32_t kErrDdeTimeout = 286;
constexpr int32_t kErrDdeTopic = 297;
constexpr int32_t kErrObjectCreation = 429;

constexpr uint32_t kOpcBadRights = 0xC0040006;
constexpr uint32_t kOpcUnknownItemId = 0xC0040007;
constexpr uint32_t kOpcInvalidItemId = 0xC0040008;
constexpr uint32_t kOpcUnknownPath = 0xC004000A;
constexpr uint32_t kClientNoServerObject = 0xC00400FF;
constexpr uint32_t kClientNoSubscription = 0xC00400FE;
constexpr uint32_t kFail = 0x80004005;
constexpr uint32_t kHdaUnknownItem = 0x800403FD;

constexpr const char* kBadNonSpecific = "BAD:NONSPECIFIC";
constexpr char Q = '"';

std::string Quoted(const std::string& sText) {
    return Q + sText + Q;
}

std::string JoinLines(std::initializer_list<std::string> lines) {
    std::string sText;
    bool bFirst = true;
    for (const std::string& sLine : lines) {
        if (!bFirst) {
            sText += "\r\n";
        }
        sText += sLine;
        bFirst = false;
    }
    return sText;
}

std::string HexNumber(int32_t lNumber) {
    char buffer[16];
    std::snprintf(buffer, sizeof buffer, "%X",
                  static_cast<unsigned>(static_cast<uint32_t>(lNumber)));
    return buffer;
}

}  // namespace

std::string Channel::GetErrorString(const std::string& sOverride, int32_t& lButtons,
                                    std::string& sQuestion, const ErrorInfo& currentError) {
    if (sOverride.empty()) {
        return DiagnoseError(currentError, lButtons, sQuestion);
    }
    if (sOverride == kBadNonSpecific) {
        return CommsFailureText();
    }
    return sOverride;
}

// The DDE label's link topic is the channel's own application and topic.
std::string Channel::DiagnoseError(const ErrorInfo& currentError, int32_t& lButtons,
                                   std::string& sQuestion) {
    switch (currentError.Number) {
        case kErrObjectCreation:
            return ObjectCreationText();
        case kErrDdeInitiate:
            return JoinLines({"DDE Initiate Failed.", "",
                              "1. Check your application and topic names.  Currently you have " +
                                  Quoted(DdeAppTopic()) + ".",
                              "2. Make sure that " + Quoted(msDdeApplication) + " is running."});
        case kErrDdeItem:
            return JoinLines({"DDE Link Error.", "",
                              "Your DDE Server has not recognised the " + msDescription +
                                  " item name " + Quoted(msItemName) + "."});
        case kErrDdeTimeout:
            lButtons = MsgBoxStyle::YesNo;
            sQuestion = "Do you want to increase the timeout time by 5 seconds?";
            return "Time out while waiting for DDE response.";
        case kErrDdeTopic:
            return JoinLines({"DDE Link Error.", "",
                              "Your DDE Server has not recognised the topic name.  Currently you "
                              "have " +
                                  Quoted(msTopicName) + "."});
        case kErrTypeMismatch:
            return Quoted(VariantText(RawValue())) +
                   " has been sent from the Server.  This is not a number.";
        default:
            return DiagnoseOpcError(currentError);
    }
}

std::string Channel::DiagnoseOpcError(const ErrorInfo& currentError) const {
    const std::string sInComputer =
        msOpcComputer.empty() ? "this computer." : "computer " + Quoted(msOpcComputer) + ".";
    switch (static_cast<uint32_t>(currentError.Number)) {
        case kOpcBadRights:
            return "The OPC Server has not accepted the new value.";
        case kOpcUnknownItemId:
            return "Either the Access Path or the Item Name are unknown to the OPC Server.  "
                   "Currently you have " +
                   Quoted(msTopicName) + " and " + Quoted(msItemName) + ".";
        case kOpcInvalidItemId:
            return "The Item name doesn't conform to the OPC Server's syntax.  Currently you "
                   "have " +
                   Quoted(msItemName) + ".";
        case kOpcUnknownPath:
            return "The Item's access path is not known to the OPC Server.  Currently you have an "
                   "access path of " +
                   Quoted(msTopicName) + ", and an Item name of " + Quoted(msItemName) + ".";
        case kClientNoServerObject:
            return JoinLines(
                {"The OPC Automation interface has not been installed on this computer.",
                 ProgramTitle() + " uses the OPC Automation Interface, not the OPC Custom "
                                  "interface.  Contact your OPC Server supplier."});
        case kClientNoSubscription:
            return JoinLines({"Problem with your OPC Server: " + Quoted(msOpcServerID) + ".",
                              ProgramTitle() +
                                  " cannot subscribe to data change notifications from the OPC "
                                  "Server."});
        case kFail:
            return "Server ID " + Quoted(msOpcServerID) +
                   " is not registered as an OPC Server in " + sInComputer;
        case kHdaUnknownItem:
            return "The Item Name is unknown to the OPC HDA Server.  Currently you have " +
                   Quoted(msItemName) + ".";
        default:
            return currentError.Description + " (" + HexNumber(currentError.Number) + ")";
    }
}

std::string Channel::ObjectCreationText() const {
    const std::string sHead = std::string("OPC") +
                              (miComType == ComTypeCode::OpcHda ? " HDA" : "") +
                              " connection failed.";
    const std::string sServer = Quoted(msOpcServerID);
    const std::string sBrowse =
        "2. Click the Browse button to see if " + sServer + " is registered.";
    if (msOpcComputer.empty()) {
        return JoinLines({sHead, "", "1. Check your Server and Node.",
                          "    Currently you have " + sServer + " in this computer.", sBrowse});
    }
    return JoinLines({sHead, "", "1. Check your Server and Node.",
                      "    Currently you have " + sServer + " in computer " +
                          Quoted("\\\\" + msOpcComputer) + ".",
                      "    Network Servers may be locked out by your DCOM settings.", sBrowse});
}

std::string Channel::CommsFailureText() const {
    return JoinLines(
        {"OPC communications failure.", "",
         "1.  Check Item name.  Currently you have " + Quoted(msItemName) + ".",
         "2.  Check Topic (or Access Path) name.  Currently you have " + Quoted(msTopicName) + ".",
         "3.  Check communications cables."});
}

}  // namespace cv
