#include "itemtest/CommandLineTestRead.h"

#include <cmath>
#include <cstdio>
#include <ostream>

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "itemtest/QualityWords.h"
#include "platform/OleDate.h"
#include "platform/Platform.h"
#include "platform/ValueText.h"
#include "util/ProgramRoutines.h"

namespace cv {

namespace {

// How long one wait of the event loop lasts before the loop looks again.
constexpr uint32_t kWaitSliceMs = 60000;

std::string IsoTime(double dStamp) {
    const std::optional<OleDateParts> parts = OleDateToParts(dStamp);
    if (!parts) {
        return "-";
    }
    char text[40];
    std::snprintf(text, sizeof text, "%04d-%02d-%02dT%02d:%02d:%02d.%03d", parts->year,
                  parts->month, parts->day, parts->hour, parts->minute, parts->second,
                  parts->millisecond);
    return text;
}

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
    if (mbBackendTold || mcTest == nullptr || mcTest->Display().backend.empty()) {
        return;
    }
    mbBackendTold = true;
    mErr << "Backend: " << mcTest->Display().backend << '\n';
    mErr.flush();
}

void CommandLineTestRead::ValuesShown() {
    if (mlShown >= mOptions.count) {
        return;
    }
    ++mlShown;
    std::string sRaw;
    (void)ValueToText(mcChannel->RawValue(), mPlatform.locale, sRaw);
    mOut << IsoTime(mcChannel->OpcTimeStamp()) << '\t' << sRaw << '\t' << mcTest->Display().engValue
         << '\t' << QualityWords(mcChannel->OpcQuality()) << '\n';
    mOut.flush();
}

}  // namespace cv
