#include <string>

#include "document/ArchiveChannels.h"
#include "document/TunFile.h"
#include "platform/Platform.h"

namespace cv {

namespace {

bool IsFatal(const Channel& cChannel) {
    return cChannel.Number() == 1 || cChannel.Number() == 2;
}

}  // namespace

ArchiveChannels::~ArchiveChannels() {
    GoOffline();
}

int32_t ArchiveChannels::Online(bool bTimedOut) {
    int32_t lState = OnlineState::Offline;
    for (size_t i = 0; i < maChannels.size(); ++i) {
        Channel& cChannel = *maChannels[i];
        const int32_t lChannel = cChannel.Online(bTimedOut);
        if (lChannel == OnlineState::GoingOnline) {
            lState = OnlineState::GoingOnline;
            break;
        }
        if (lChannel == OnlineState::Online) {
            lState = OnlineState::Online;
        } else if (ReportDropOut(cChannel)) {
            lState = OnlineState::Offline;
            break;
        }
    }
    if (maMessageWindows.size() == 1 && lState == OnlineState::Online) {
        maMessageWindows.assign(maChannels.size() + 1, 0);
    }
    return lState;
}

// Shows an offline channel's error text once; true when the channel is PV
// or CO, whose failure ends the poll.
bool ArchiveChannels::ReportDropOut(Channel& cChannel) {
    const bool bFatal = IsFatal(cChannel);
    const std::string sError = cChannel.ErrorStr();
    if (sError.empty()) {
        return bFatal;
    }
    const std::string sTitle = "Error reading " + cChannel.Description();
    const auto lNumber = static_cast<size_t>(cChannel.Number());
    if (bFatal || lNumber >= maMessageWindows.size()) {
        int32_t lStyle = bFatal ? MsgBoxStyle::Critical : MsgBoxStyle::Exclamation;
        std::string sQuestion;
        const std::string sText = cChannel.GetErrorString(sError, lStyle, sQuestion, {});
        mPlatform.dialogs.MsgBox(sText, lStyle, sTitle);
    } else if (maMessageWindows[lNumber] == 0) {
        maMessageWindows[lNumber] = mPlatform.modeless.Launch(sTitle, sError, "OK");
    }
    return bFatal;
}

bool ArchiveChannels::CreateCommsObjects(TunFile& cTunFile, bool bSilent) {
    return EveryChannel(&Channel::CreateCommsObjects, cTunFile, bSilent);
}

bool ArchiveChannels::GoOnline(TunFile& cTunFile, bool bSilent) {
    return EveryChannel(&Channel::GoOnline, cTunFile, bSilent);
}

// PV and CO are always handled, the others only with an item name; a PV or
// CO that fails takes the whole collection offline.
bool ArchiveChannels::EveryChannel(Step step, TunFile& cTunFile, bool bSilent) {
    for (size_t i = 0; i < maChannels.size(); ++i) {
        Channel& cChannel = *maChannels[i];
        const bool bFatal = IsFatal(cChannel);
        if (!bFatal && cChannel.ItemName().empty()) {
            continue;
        }
        int32_t lStyle = bFatal ? MsgBoxStyle::Critical : MsgBoxStyle::Information;
        std::string sText;
        if (!(cChannel.*step)(cTunFile, lStyle, sText, bSilent) && bFatal) {
            GoOffline();
            return false;
        }
    }
    return true;
}

void ArchiveChannels::GoOffline() {
    for (const std::unique_ptr<Channel>& cChannel : maChannels) {
        cChannel->GoOffline();
    }
    CloseMessageWindows();
}

void ArchiveChannels::CloseMessageWindows() {
    for (const platform::ModelessMessages::WindowId id : maMessageWindows) {
        if (id != 0) {
            mPlatform.modeless.Close(id);
        }
    }
    maMessageWindows.assign(1, 0);
}

bool ArchiveChannels::SingleShotRead(TunFile& cTunFile) {
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
