#include <string>

#include "document/SpecificChannels.h"
#include "document/TunFile.h"
#include "platform/Platform.h"

namespace cv {

namespace {

constexpr int32_t kVarTypeText = 8;

bool IsWriteType(int32_t lType) {
    return (lType >= SpecificType::SendCO && lType <= SpecificType::SendMode) ||
           lType == SpecificType::SendFilter;
}

bool HasItem(const Channel* cChannel) {
    return cChannel != nullptr && !cChannel->ItemName().empty();
}

}  // namespace

bool SpecificChannels::CreateOne(Channel* cChannel, TunFile& cTunFile, const std::string& sMessage,
                                 bool bSilent) {
    int32_t lStyle = MsgBoxStyle::Information;
    std::string sText = sMessage;
    return cChannel->CreateCommsObjects(cTunFile, lStyle, sText, bSilent);
}

// Types in increasing order, so each read channel decides for its write
// channel, and a failing P stops I and D.
bool SpecificChannels::CreateCommsObjects(TunFile& cTunFile, bool bSilent) {
    bool bP = true, bI = true, bD = true, bMode = true, bFilter = true;
    for (int32_t t = 1; t <= FinalChannel(); ++t) {
        Channel* c = Item(t);
        if (c == nullptr) {
            continue;
        }
        const std::string w = (t >= SpecificType::SendCO && t != SpecificType::Filter)
                                  ? "Writing of " + c->Description() + " disabled."
                                  : "";
        switch (t) {
            case SpecificType::P:
            case SpecificType::SendP:
                bP = bP && HasItem(c) &&
                     CreateOne(c, cTunFile, "Scanning of I and D disabled also.  " + w, bSilent);
                bI = bD = bP;
                break;
            case SpecificType::I:
            case SpecificType::SendI:
                if (!HasItem(c)) {
                    bI = bD = false;
                } else if (bI) {
                    bD = CreateOne(c, cTunFile, "Scanning of D disabled also.  " + w, bSilent);
                }
                break;
            case SpecificType::D:
            case SpecificType::SendD:
                bD = bD && HasItem(c) && CreateOne(c, cTunFile, w, bSilent);
                break;
            case SpecificType::Mode:
            case SpecificType::SendMode:
                bMode = bMode && HasItem(c) && CreateOne(c, cTunFile, w, bSilent);
                break;
            case SpecificType::Filter:
            case SpecificType::SendFilter:
                bFilter = bFilter && HasItem(c) && CreateOne(c, cTunFile, w, bSilent);
                break;
            default:
                if (HasItem(c)) {
                    CreateOne(c, cTunFile, w, bSilent);
                }
                break;
        }
    }
    return true;
}

bool SpecificChannels::GoOnlineOne(Channel* cChannel, TunFile& cTunFile,
                                   const std::string& sMessage, bool bSilent) {
    int32_t lStyle = MsgBoxStyle::Information;
    std::string sText = sMessage;
    return cChannel->GoOnline(cTunFile, lStyle, sText, bSilent);
}

// Write channels are not scanned.
bool SpecificChannels::GoOnline(TunFile& cTunFile, bool bSilent) {
    bool bI = false, bD = false;
    for (int32_t t = 1; t <= FinalChannel(); ++t) {
        Channel* c = Item(t);
        if (c == nullptr) {
            continue;
        }
        c->SetExpectANumber(false);
        switch (t) {
            case SpecificType::P:
                bI = bD = HasItem(c) &&
                          GoOnlineOne(c, cTunFile, "Scanning of I and D disabled also.", bSilent);
                break;
            case SpecificType::I:
                if (!HasItem(c)) {
                    bI = bD = false;
                } else if (bI) {
                    bD = GoOnlineOne(c, cTunFile, "Scanning of D disabled also.", bSilent);
                }
                break;
            case SpecificType::D:
                bD = bD && HasItem(c);
                if (bD) {
                    GoOnlineOne(c, cTunFile, "", bSilent);
                }
                break;
            case SpecificType::Mode:
            case SpecificType::Filter:
                if (HasItem(c)) {
                    if (t == SpecificType::Mode) {
                        c->SetDisplayVarType(kVarTypeText);
                    }
                    GoOnlineOne(c, cTunFile, "", bSilent);
                }
                break;
            default:
                break;
        }
    }
    return true;
}

int32_t SpecificChannels::Online(bool bTimedOut) {
    int32_t lState = OnlineState::Offline;
    for (int32_t t = 1; t <= FinalChannel(); ++t) {
        Channel* c = Item(t);
        if (c == nullptr) {
            continue;
        }
        const int32_t s = c->Online(bTimedOut);
        if (s == OnlineState::Offline) {
            ReportDropOut(*c);
        } else {
            (void)c->ErrorStr();
        }
        if (!IsWriteType(t) && lState != OnlineState::GoingOnline && s != OnlineState::Offline) {
            lState = s;
        }
    }
    return lState;
}

void SpecificChannels::ReportDropOut(Channel& cChannel) {
    const std::string sError = cChannel.ErrorStr();
    if (sError.empty()) {
        return;
    }
    int32_t lStyle = MsgBoxStyle::Exclamation;
    std::string sQuestion;
    std::string sText = cChannel.GetErrorString(sError, lStyle, sQuestion, {});
    if (IsWriteType(cChannel.SpecificChannelType())) {
        sText += "\r\n\r\nWriting of " + cChannel.Description() + " disabled.";
    }
    mPlatform.dialogs.MsgBox(sText, MsgBoxStyle::Exclamation,
                             "Error reading " + cChannel.Description());
}

void SpecificChannels::GoOffline() {
    for (const std::unique_ptr<Channel>& cChannel : maChannels) {
        cChannel->GoOffline();
    }
}

bool SpecificChannels::SingleShotRead(TunFile& cTunFile) {
    for (size_t i = 0; i < maChannels.size(); ++i) {
        Channel& cChannel = *maChannels[i];
        if (cChannel.IsOnline() && !cChannel.SingleShotRead(cTunFile, false)) {
            GoOffline();
            return false;
        }
    }
    return true;
}

}  // namespace cv
