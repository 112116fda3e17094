#include <algorithm>
#include <memory>
#include <string>
#include <vector>

#include "document/TunFile.h"
#include "opc/ClientErrors.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/Platform.h"
#include "util/ProgramRoutines.h"

namespace cv {

int32_t TunFile::Online(bool bTimedOut) {
    const int32_t lArchives = mcArchives->Online(bTimedOut);
    if (lArchives == OnlineState::Offline) {
        return OnlineState::Offline;
    }
    const int32_t lSpecifics = mcSpecifics->Online(bTimedOut);
    if (lArchives == OnlineState::GoingOnline || lSpecifics == OnlineState::GoingOnline) {
        return OnlineState::GoingOnline;
    }
    return OnlineState::Online;
}

bool TunFile::GoOnline(bool bSilent) {
    const bool bOk = mcArchives->CreateCommsObjects(*this, bSilent) &&
                     mcSpecifics->CreateCommsObjects(*this, bSilent) &&
                     mcArchives->GoOnline(*this, bSilent) && mcSpecifics->GoOnline(*this, bSilent);
    if (!bOk) {
        GoOffline();
        return false;
    }
    OpcAutoGoOnline(mcGeneral->SIinMSec());
    return true;
}

void TunFile::GoOffline() {
    OpcAutoGoOffline();
    mcArchives->GoOffline();
    mcSpecifics->GoOffline();
}

bool TunFile::SingleShotRead() {
    const char* sFault = nullptr;
    if (mcGeneral->UseHotLinks()) {
        sFault = " error: TunFile.SingleShotRead 1";
    } else if (!mcArchives->IsOnline()) {
        sFault = " error: TunFile.SingleShotRead 2";
    }
    if (sFault != nullptr) {
        mPlatform.dialogs.MsgBox(mcTunerType.Name() + sFault, MsgBoxStyle::OKOnly, "");
    } else if (mcArchives->SingleShotRead(*this) && mcSpecifics->SingleShotRead(*this)) {
        return true;
    }
    GoOffline();
    return false;
}

ErrorInfo TunFile::CreateOpcAutoObject(Channel& cChannel) {
    std::shared_ptr<CvOpcAutoClient> cClient = FindOpcClient(cChannel);
    if (!cClient) {
        if (ErrorInfo error = NewOpcClient(cChannel, cClient)) {
            return error;
        }
    }
    return cClient->AddChannel(cChannel);
}

std::shared_ptr<CvOpcAutoClient> TunFile::FindOpcClient(const Channel& cChannel) const {
    for (const std::shared_ptr<CvOpcAutoClient>& cEach : mcOpcClients) {
        if (cEach->ServerID() == cChannel.OpcServerID() &&
            cEach->ServerNode() == cChannel.OpcComputer()) {
            return cEach;
        }
    }
    return nullptr;
}

// The new client is listed while it connects, so that going offline meanwhile
// ends it too; it stays only when it connected and is still listed.
ErrorInfo TunFile::NewOpcClient(const Channel& cChannel,
                                std::shared_ptr<CvOpcAutoClient>& cClient) {
    auto cNew = std::make_shared<CvOpcAutoClient>(mPlatform);
    mcOpcClients.push_back(cNew);
    const ErrorInfo error =
        cNew->CreateServerAndGroup(cChannel.OpcServerID(), cChannel.OpcComputer());
    const auto found = std::find(mcOpcClients.begin(), mcOpcClients.end(), cNew);
    if (!error && found != mcOpcClients.end()) {
        cClient = std::move(cNew);
        return {};
    }
    if (found != mcOpcClients.end()) {
        mcOpcClients.erase(found);
    }
    return error ? error : ClientErrors::Disconnected();
}

// A failing client is reported and the others still go online.
void TunFile::OpcAutoGoOnline(int32_t lRate) {
    const std::string sFault = ProgramTitle() + " Error: OpcAutoGoOnline";
    for (size_t i = 0; i < mcOpcClients.size(); ++i) {
        if (mcOpcClients[i]->UpdateRate(1, lRate)) {
            mPlatform.dialogs.MsgBox(sFault, MsgBoxStyle::OKOnly, "");
        }
        if (i < mcOpcClients.size()) {
            mcOpcClients[i]->Advise(1, true);
        }
    }
}

// Each client leaves the list before it ends, so events that run while it
// waits on its server never meet a half-ended client there.
void TunFile::OpcAutoGoOffline() {
    while (!mcOpcClients.empty()) {
        const std::shared_ptr<CvOpcAutoClient> cClient = std::move(mcOpcClients.front());
        mcOpcClients.erase(mcOpcClients.begin());
        (void)cClient->GoOffline();
    }
}

// Reads through the clients listed at the start, since events during a read
// may change the list. A client that ended (its server shut down, or the
// document went offline) has nothing to read; one that ends while it reads
// was ended by a shutdown that was told or by a close that was asked for,
// so its failure is not shown again.
ErrorInfo TunFile::OpcAutoSingleShotRead(int32_t lGroup) {
    const std::vector<std::shared_ptr<CvOpcAutoClient>> cClients = mcOpcClients;
    for (const std::shared_ptr<CvOpcAutoClient>& cClient : cClients) {
        if (!cClient->IsConnected()) {
            continue;
        }
        if (ErrorInfo error = cClient->SingleShotReadGroup(lGroup)) {
            if (cClient->IsConnected()) {
                mPlatform.dialogs.MsgBox(ProgramTitle() + " Error: OpcAutoSingleShotRead",
                                         MsgBoxStyle::OKOnly, "");
            }
            return error;
        }
    }
    return {};
}

}  // namespace cv
