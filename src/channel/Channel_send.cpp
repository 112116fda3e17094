#include <string>
#include <utility>

#include "channel/Channel.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/DdeLink.h"
#include "platform/Platform.h"

namespace cv {

namespace {

constexpr int32_t kSendIdle = 0;
constexpr int32_t kSending = 1;
constexpr int32_t kSendFailed = 2;

}  // namespace

void Channel::SetDdeLabel(std::shared_ptr<platform::DdeLink> cLabel) {
    mcDdeLabel = std::move(cLabel);
    if (mcDdeLabel && !mcDdeLabel->SetLinkTopic(DdeAppTopic())) {
        (void)mcDdeLabel->SetLinkItem(msItemName);
    }
}

void Channel::ClearCommunicationsObject() {
    GoOffline();
    if (miComType == ComTypeCode::Dde) {
        SetDdeLabel(nullptr);
    }
}

bool Channel::SendValue(const std::string& sValue) {
    miSendResult = kSending;
    switch (miComType) {
        case ComTypeCode::Dde:
            if (!mcDdeLabel) {
                // Nothing was written: say so and report the failure.
                mPlatform.dialogs.MsgBox("Channel.SendValue error Dde", MsgBoxStyle::OKOnly, "");
                miSendResult = kSendFailed;
                return false;
            }
            if (ErrorInfo error = SendDde(sValue)) {
                msErrorStr = error.Description;
                miSendResult = kSendFailed;
                return false;
            }
            miSendResult = kSendIdle;
            return true;
        case ComTypeCode::Opc:
            return SendOpc(sValue);
        default:
            return true;
    }
}

ErrorInfo Channel::SendDde(const std::string& sValue) {
    mcDdeLabel->SetText(sValue);
    if (ErrorInfo error = mcDdeLabel->SetLinkMode(platform::DdeLinkMode::Manual)) {
        return error;
    }
    ErrorInfo error = mcDdeLabel->LinkPoke();
    const ErrorInfo closed = mcDdeLabel->SetLinkMode(platform::DdeLinkMode::None);
    return error ? error : closed;
}

// A client released after an error refuses writes until the channel is set
// up again.
bool Channel::SendOpc(const std::string& sValue) {
    if (mcOpcClient == nullptr) {
        msErrorStr = "Writing disabled due to a previously reported error from the OPC Server.";
        miSendResult = kSendFailed;
        return false;
    }
    ErrorInfo error;
    const std::string sMessage = mcOpcClient->SendValue(*this, sValue, error);
    if (sMessage.empty() && !error) {
        miSendResult = kSendIdle;
        return true;
    }
    if (error) {
        int32_t lButtons = 0;
        std::string sQuestion;
        msErrorStr = GetErrorString("", lButtons, sQuestion, error);
    } else {
        msErrorStr = sMessage;
    }
    miSendResult = kSendFailed;
    return false;
}

}  // namespace cv
