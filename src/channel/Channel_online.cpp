#include <string>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "platform/DdeLink.h"
#include "platform/Platform.h"

namespace cv {

namespace {

constexpr int32_t kComTypeOnlineAtOnce = 7;
constexpr int32_t kFirstExtraChannel = 4;
constexpr int32_t kErrObjectNotSet = 91;

bool Succeeds(int32_t lComType) {
    return lComType == ComTypeCode::Dde || lComType == 3 || lComType == 5;
}

}  // namespace

bool Channel::OKtoGoOnline(const TunFile& cTunFile) const {
    return !(cTunFile.IsSimulation() && miSpecificChannelType == 0 &&
             miNumber >= kFirstExtraChannel);
}

bool Channel::CreateCommsObjects(TunFile& cTunFile, int32_t& lButtons, std::string& sText,
                                 bool bSilent) {
    msErrorStr.clear();
    mbServerShutDown = false;
    if (!OKtoGoOnline(cTunFile)) {
        return false;
    }
    if (Succeeds(miComType)) {
        return true;
    }
    if (miComType != ComTypeCode::Opc) {
        mPlatform.dialogs.MsgBox("Error: Channel.CreateCommsObjects", MsgBoxStyle::OKOnly, "");
        return false;
    }
    if (ErrorInfo error = cTunFile.CreateOpcAutoObject(*this)) {
        ReportCommsError(error, lButtons, sText, bSilent);
        return false;
    }
    return true;
}

bool Channel::GoOnline(TunFile& cTunFile, int32_t& lButtons, std::string& sText, bool bSilent) {
    if (!OKtoGoOnline(cTunFile)) {
        miState = OnlineState::Offline;
        return false;
    }
    MarkGoingOnline();
    ErrorInfo error;
    switch (miComType) {
        case ComTypeCode::Dde: {
            // Events run during the request: the channel may be gone after it.
            const std::shared_ptr<Channel* const> presence = Presence();
            const bool bDone = GoOnlineDde(cTunFile, error);
            if (*presence == nullptr) {
                return false;
            }
            if (!bDone) {
                const int32_t lAnswer = ReportCommsError(error, lButtons, sText, bSilent);
                if (lAnswer != MsgBoxResult::OK) {
                    OfferLongerDdeTimeout(lAnswer, error, cTunFile);
                }
                return false;
            }
            if (miState != OnlineState::Online) {
                return false;
            }
            break;
        }
        case ComTypeCode::Opc:
            if (!mcOpcItem) {
                miState = OnlineState::Offline;
            }
            break;
        case kComTypeOnlineAtOnce:
            miState = OnlineState::Online;
            break;
        default:
            mPlatform.dialogs.MsgBox("Error: Channel.GoOnline", MsgBoxStyle::OKOnly, "");
            miState = OnlineState::Offline;
            return false;
    }
    UpdateScalingFlags(cTunFile);
    msErrorStr.clear();
    return true;
}

// Opens the link and fetches the first value. Only a channel still going
// online after the events that ran meanwhile comes online; one taken offline
// meanwhile stays so, with the error text it was given.
bool Channel::GoOnlineDde(TunFile& cTunFile, ErrorInfo& error) {
    const std::shared_ptr<platform::DdeLink> cLabel = mcDdeLabel;
    if (!cLabel) {
        error = {kErrObjectNotSet, "The channel has no DDE link."};
        return false;
    }
    cLabel->SetLinkTimeout(cTunFile.General().DDETimeout());
    const int32_t lMode = cTunFile.General().UseHotLinks() ? platform::DdeLinkMode::Automatic
                                                           : platform::DdeLinkMode::Manual;
    if ((error = cLabel->SetLinkMode(lMode)) || (error = cLabel->LinkRequest())) {
        return false;
    }
    const std::shared_ptr<Channel* const> presence = Presence();
    mPlatform.events.DoEvents();
    if (*presence == nullptr || miState != OnlineState::GoingOnline) {
        return true;
    }
    miState = OnlineState::Online;
    if (mbExpectANumber) {
        Variant vNumber;
        error = ChangeType(vNumber, RawValue(), VT_R8, mPlatform.locale);
    }
    return !error;
}

bool Channel::SingleShotRead(TunFile& cTunFile, bool bSilent) {
    int32_t lButtons = MsgBoxStyle::Critical;
    std::string sText;
    switch (miComType) {
        case ComTypeCode::Dde:
            if (!mcDdeLabel) {
                return false;
            }
            if (ErrorInfo error = mcDdeLabel->SetLinkItem(msItemName)) {
                ReportCommsError(error, lButtons, sText, bSilent);
                return false;
            }
            return GoOnline(cTunFile, lButtons, sText, bSilent);
        case ComTypeCode::Opc:
            if (ErrorInfo error = cTunFile.OpcAutoSingleShotRead(OpcGroupNumber())) {
                ReportCommsError(error, lButtons, sText, bSilent);
                return false;
            }
            return true;
        case kComTypeOnlineAtOnce:
            return true;
        default:
            mPlatform.dialogs.MsgBox("Channel.SingleShotRead error", MsgBoxStyle::OKOnly, "");
            return false;
    }
}

// Takes the channel offline and shows the diagnosis, or leaves it in the
// error text when silent. Answers the button pressed (OK when silent).
int32_t Channel::ReportCommsError(const ErrorInfo& error, int32_t lButtons, std::string& sText,
                                  bool bSilent) {
    mCommsError = error;
    int32_t lExtraButtons = 0;
    std::string sQuestion;
    std::string sMessage = GetErrorString("", lExtraButtons, sQuestion, error);
    GoOffline();
    if (bSilent) {
        msErrorStr = sMessage;
        return MsgBoxResult::OK;
    }
    if (!sQuestion.empty()) {
        if (!sText.empty()) {
            sText += "\r\n\r\n";
        }
        sText += sQuestion;
        lButtons |= lExtraButtons;
    }
    if (!sText.empty()) {
        sMessage += "\r\n\r\n" + sText;
    }
    return mPlatform.dialogs.MsgBox(sMessage, lButtons, "Error trying to read " + msDescription);
}

// Yes to the time-out question gives every DDE link 5 seconds more, stored
// in the tuning file at once.
void Channel::OfferLongerDdeTimeout(int32_t lAnswer, const ErrorInfo& error, TunFile& cTunFile) {
    if (lAnswer != MsgBoxResult::Yes || error.Number != platform::DdeError::TimedOut) {
        return;
    }
    TunFileGeneral& cGeneral = cTunFile.General();
    cGeneral.SetDDETimeout(cGeneral.DDETimeout() + 50);
    cGeneral.WriteTimeoutToDisk(cTunFile.IniFileObject());
}

}  // namespace cv
