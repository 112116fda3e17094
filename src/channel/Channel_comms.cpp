#include <algorithm>
#include <chrono>
#include <ctime>
#include <utility>

#include "channel/Channel.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/DdeLink.h"
#include "platform/OleDate.h"
#include "platform/Platform.h"
#include "platform/opc/OPCItem.h"

namespace cv {

namespace {

constexpr int32_t kExtraGroupChannel = 13;
constexpr int32_t kSendFailed = 2;

// The local date and time now, as an OLE date.
double OleDateNow() {
    const auto now = std::chrono::system_clock::now();
    const std::time_t seconds = std::chrono::system_clock::to_time_t(now);
    const auto ms = std::chrono::duration_cast<std::chrono::milliseconds>(
                        now - std::chrono::system_clock::from_time_t(seconds))
                        .count();
    const std::tm local = *std::localtime(&seconds);
    const OleDateParts parts{local.tm_year + 1900,    local.tm_mon + 1, local.tm_mday,
                             local.tm_hour,           local.tm_min,     std::min(local.tm_sec, 59),
                             static_cast<int32_t>(ms)};
    return OleDateFromParts(parts).value_or(0);
}

}  // namespace

Channel::~Channel() {
    *mpPresence = nullptr;
}

int32_t Channel::Online(bool bTimedOut) {
    if (bTimedOut && miState == OnlineState::GoingOnline) {
        GoOffline();
        if (msErrorStr.empty()) {
            msErrorStr = "Timed out waiting for a response";
        }
    }
    return miState;
}

void Channel::GoOffline() {
    miState = OnlineState::Offline;
    switch (miComType) {
        case ComTypeCode::Dde:
            if (mcDdeLabel) {
                (void)mcDdeLabel->SetLinkMode(platform::DdeLinkMode::None);
            }
            break;
        case ComTypeCode::Opc: {
            // The channel is offline before the client removes the extra
            // group, which lets events run while it waits for the server.
            mvRawValue = Variant::Null();
            mcOpcItem.reset();
            CvOpcAutoClient* cClient = std::exchange(mcOpcClient, nullptr);
            if (cClient != nullptr && miSpecificChannelType == kExtraGroupChannel) {
                cClient->RemoveExtraGroup();
            }
            break;
        }
        default:
            mPlatform.dialogs.MsgBox("Error: Channel.GoOffline", MsgBoxStyle::OKOnly, "");
            break;
    }
}

std::string Channel::ErrorStr() {
    std::string sText;
    sText.swap(msErrorStr);
    return sText;
}

void Channel::OpcDataChange(const std::string& sText) {
    if (sText.empty()) {
        miSendResult = 0;
    } else {
        msErrorStr = sText;
        miSendResult = kSendFailed;
    }
}

int32_t Channel::OpcGroupNumber() const {
    return miSpecificChannelType == kExtraGroupChannel ? 2 : 1;
}

// Write channels (5 to 10 and 12) sit in their group inactive.
bool Channel::OpcIsActive() const {
    switch (miSpecificChannelType) {
        case 0:
        case 1:
        case 2:
        case 3:
        case 4:
        case 11:
        case 13:
        case 14:
            return true;
        case 5:
        case 6:
        case 7:
        case 8:
        case 9:
        case 10:
        case 12:
            return false;
        default:
            mPlatform.dialogs.MsgBox("Channel.OpcIsActive fault", MsgBoxStyle::OKOnly, "");
            return false;
    }
}

int16_t Channel::OpcRawValueVarType() const {
    return mvRawValue.IsNull() ? 0 : static_cast<int16_t>(mvRawValue.VarType());
}

double Channel::OpcTimeStamp() const {
    return mvRawValue.IsNull() ? OleDateNow() : mdTimeStamp;
}

}  // namespace cv
