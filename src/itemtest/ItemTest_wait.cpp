#include <algorithm>
#include <string>

#include "channel/Channel.h"
#include "itemtest/ItemTest.h"
#include "platform/Platform.h"
#include "platform/opc/OpcResult.h"

namespace cv {

namespace {

// Failures no retry can change: an item ID the server's syntax refuses,
// and a server ID that is not registered. A server named by an endpoint
// URL may still be starting, so its failures are tried again.
bool RetryCannotHelp(const ErrorInfo& error, const std::string& sServerID) {
    using namespace platform::OpcResult;
    return error.Number == OPC_E_INVALIDITEMID ||
           (error.Number == E_FAIL && sServerID.find("://") == std::string::npos);
}

// The first sentence of a diagnosis, without its full stop.
std::string Headline(const std::string& sDiagnosis) {
    std::string sLine = sDiagnosis.substr(0, sDiagnosis.find_first_of("\r\n"));
    sLine.resize(std::min(sLine.size(), sLine.find(".  ")));
    if (!sLine.empty() && sLine.back() == '.') {
        sLine.pop_back();
    }
    return sLine;
}

}  // namespace

// After a silent failure to connect: one no retry can change ends the test
// with its diagnosis, any other is shown while the test tries again.
void ItemTest::AnswerOrEnd() {
    const std::string sDiagnosis = mcChannel.ErrorStr();
    if (RetryCannotHelp(mcChannel.CommsError(), mcChannel.OpcServerID())) {
        SetBusy(0);
        (void)mPlatform.dialogs.MsgBox(sDiagnosis, MsgBoxStyle::Exclamation,
                                       "Error trying to read " + mcChannel.Description());
        Close();
        return;
    }
    ShowServerAnswer(Headline(sDiagnosis));
}

void ItemTest::ShowServerAnswer(const std::string& sAnswer) {
    const std::string sShown =
        sAnswer.empty() ? ""
                        : "The server answered: " + sAnswer + "; trying again until the wait ends";
    if (sShown != mDisplay.serverAnswer) {
        mDisplay.serverAnswer = sShown;
        Notify();
    }
}

// A value that arrived since the last one shown and that the channel did
// not take: shown as it came and told. False when there is none (or the
// test ended while the server named its status).
bool ItemTest::NoteRefusedValue() {
    const OpcSample& sample = mcChannel.LastOpcSample();
    if (sample.number == mlSampleShown || mcChannel.IsOnline()) {
        return false;
    }
    mlSampleShown = sample.number;
    ShowSample(sample);
    if (mbUnloaded) {
        return false;
    }
    Notify();
    mListener.ValueRefused();
    return true;
}

}  // namespace cv
