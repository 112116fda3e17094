#include "itemtest/CommandLineTestRead.h"

#include <cmath>
#include <ostream>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "itemtest/IsoTimeText.h"
#include "platform/Platform.h"
#include "platform/ValueText.h"
#include "util/ProgramRoutines.h"

namespace cv {

namespace {

// How long one wait of the event loop lasts before the loop looks again.
constexpr uint32_t kWaitSliceMs = 60000;

}  // namespace

CommandLineTestRead::CommandLineTestRead(Platform& platform, const TestReadOptions& options,
                                         std::ostream& out, std::ostream& err)
    : mPlatform(platform), mOptions(options), mOut(out), mErr(err) {}

void CommandLineTestRead::Configure(TunFile& cTunFile, Channel& cChannel) const {
    cChannel.SetOpcNodeAndServer(mOptions.nodeAndServer);
    cChannel.SetOpcAccessPath(mOptions.accessPath);
    cChannel.SetItemName(mOptions.itemId);
    cChannel.SetDescription(mOptions.itemId);
    TunFileGeneral& cGeneral = cTunFile.General();
    cGeneral.SetSIinSec(mOptions.intervalSec);
    cGeneral.SetScalePVandCO(mOptions.scale.has_value());
    cGeneral.SetScaleSP(mOptions.scale.has_value());
    if (mOptions.scale) {
        cChannel.SetRange(RangeType::Instrument, mOptions.scale->instMin, mOptions.scale->instMax);
        cChannel.SetRange(RangeType::Engineering, mOptions.scale->engMin, mOptions.scale->engMax);
    }
}

int CommandLineTestRead::Run() {
    // The quality is on every line; nobody is there to answer the question.
    (void)UncertainWarningOff(mPlatform, true);
    TunFile cTunFile(mPlatform);
    cTunFile.SetDefaults(ProgramTunerKind());
    mcChannel = cTunFile.Archives().SPChannel();
    Configure(cTunFile, *mcChannel);
    ItemTest test(mPlatform, cTunFile, *mcChannel, *this);
    mcTest = &test;
    if (mOptions.timeoutSec) {
        test.SetWaitOverride(static_cast<int32_t>(std::lround(*mOptions.timeoutSec * 1000)));
    }
    test.Start();
    const auto done = [this] { return mbFailed || mlShown >= mOptions.count; };
    while (!done()) {
        (void)mPlatform.events.WaitUntil(done, kWaitSliceMs);  // done() is asked again
    }
    test.Unload();
    mcTest = nullptr;
    return mbFailed ? TestReadExit::kTestFailed : TestReadExit::kValuesRead;
}

void CommandLineTestRead::DisplayChanged() {
    if (mcTest == nullptr) {
        return;
    }
    const ItemTestDisplay& shown = mcTest->Display();
    if (!mbBackendTold && !shown.backend.empty()) {
        mbBackendTold = true;
        mErr << "Backend: " << shown.backend << '\n';
        mErr.flush();
    }
    if (mOptions.verbose && shown.serverAnswer != msAnswerTold) {
        msAnswerTold = shown.serverAnswer;
        if (!msAnswerTold.empty()) {
            mErr << msAnswerTold << '\n';
            mErr.flush();
        }
    }
}

void CommandLineTestRead::ValuesShown() {
    if (mlShown >= mOptions.count) {
        return;
    }
    ++mlShown;
    PrintValue(true);
}

void CommandLineTestRead::ValueRefused() {
    PrintValue(false);
}

// The value as the server sent it; a refused one has no scaled value.
void CommandLineTestRead::PrintValue(bool bTaken) {
    const OpcSample& sample = mcChannel->LastOpcSample();
    std::string sRaw;
    (void)ValueToText(sample.value, mPlatform.locale, sRaw);
    const ItemTestDisplay& shown = mcTest->Display();
    const double dSource = sample.detail.sourceTimeStamp;
    mOut << IsoTimeText(sample.timeStamp) << '\t' << sRaw << '\t'
         << (bTaken ? shown.engValue : std::string()) << '\t' << shown.quality << '\t'
         << (dSource != 0 ? IsoTimeText(dSource) : std::string()) << '\n';
    mOut.flush();
}

}  // namespace cv
