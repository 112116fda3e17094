#include <algorithm>
#include <cmath>

#include "channel/Channel.h"
#include "document/ModeMapClass.h"
#include "document/TunFile.h"
#include "itemtest/ItemTest.h"
#include "itemtest/QualityWords.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/AsciiCase.h"
#include "platform/DateText.h"
#include "platform/DdeLink.h"
#include "platform/Platform.h"
#include "platform/ValueText.h"
#include "util/ProgramRoutines.h"
#include "util/TextToNumber.h"

namespace cv {

namespace {

constexpr int32_t kModeChannel = 4;
constexpr int32_t kTunerWithViaText = 2;

std::string ProtocolName(int32_t lComType) {
    switch (lComType) {
        case ComTypeCode::Dde:
            return "DDE";
        case ComTypeCode::Opc:
            return "OPC";
        default:
            return "OPC HDA";
    }
}

int32_t QualityColor(int32_t lQuality) {
    switch (LevelOf(lQuality)) {
        case QualityLevel::Good:
            return ItemTestDisplay::kGoodColor;
        case QualityLevel::Uncertain:
            return ItemTestDisplay::kUncertainColor;
        default:
            return ItemTestDisplay::kBadColor;
    }
}

}  // namespace

void ItemTest::LayOutValueDisplay() {
    const int32_t lComType = mcChannel.ComType();
    if (mcTunFile.TunerType() == kTunerWithViaText) {
        mDisplay.testResult = "Test successful (via " + ProtocolName(lComType) + ")";
    }
    mDisplay.showTestResult = true;
    StartTimer(static_cast<uint32_t>(std::max(1, mcTunFile.General().SIinMSec())));
    const int32_t lSpecific = mcChannel.SpecificChannelType();
    if (lSpecific != 0) {
        mDisplay.instLabel = "Current value :";
        if (lSpecific == kModeChannel) {
            SelectMode();
        }
    } else {
        mDisplay.instLabel = "Raw Instrument value :";
        mDisplay.engColor = mcChannel.LineColor();
        mDisplay.showEngValue = true;
        mDisplay.decimalPlaces = std::to_string(mcChannel.DecimalPlaces());
    }
    mDisplay.showTimeStamp = lComType == ComTypeCode::Opc || lComType == ComTypeCode::OpcHda;
    Notify();
}

// The mode whose key is the value read, ignoring case (the last when
// several are), else the first.
void ItemTest::SelectMode() {
    const TunFileGeneral& cGeneral = mcTunFile.General();
    std::string sRaw;
    (void)ValueToText(mcChannel.RawValue(), mPlatform.locale, sRaw);
    mDisplay.modes.clear();
    mDisplay.modeIndex = 0;
    for (int32_t i = 1; i <= cGeneral.ModeCount(); ++i) {
        mDisplay.modes.push_back(cGeneral.ModeValue(i));
        if (EqualsIgnoringCase(cGeneral.ModeKey(i), sRaw)) {
            mDisplay.modeIndex = i - 1;
        }
    }
    mDisplay.showModeSelect = true;
}

void ItemTest::ShowValues() {
    const int32_t lComType = mcChannel.ComType();
    if (lComType == ComTypeCode::Opc || lComType == ComTypeCode::OpcHda) {
        mlSampleShown = mcChannel.LastOpcSample().number;
        ShowSample(mcChannel.LastOpcSample());
        if (mbUnloaded) {
            return;
        }
    }
    if (mcChannel.SpecificChannelType() == 0) {
        const double dValue = mcChannel.CurrentValue();
        mDisplay.engValue = mcChannel.FormatDecPt(dValue);
        ShowRange(dValue);
    }
    std::string sRaw;
    (void)ValueToText(mcChannel.RawValue(), mPlatform.locale, sRaw);
    mDisplay.instValue = ModeMapClass::StripDDETerminators(sRaw);
    if (mcDdeLabel) {
        mDisplay.ddeLabel = mcDdeLabel->Text();
    }
    Notify();
    mListener.ValuesShown();
}

// The time stamps to the millisecond and the quality in words. Asking the
// server to name a status lets events run.
void ItemTest::ShowSample(const OpcSample& sample) {
    const auto stampText = [this](double dStamp) {
        std::string sTime;
        std::string sDate;
        if (WriteOleDateToTheMillisecond(dStamp, mPlatform.locale.LongTimeFormat(), sTime) ||
            WriteOleDateAs(dStamp, mPlatform.locale.ShortDateFormat(), sDate)) {
            return std::string();
        }
        return sTime + "  " + sDate;
    };
    mDisplay.timeStamp = stampText(sample.timeStamp);
    mDisplay.sourceTimeStamp =
        sample.detail.sourceTimeStamp != 0 ? stampText(sample.detail.sourceTimeStamp) : "";
    std::string sWords = QualityWords(sample.quality);
    if (sample.detail.status != 0) {
        const std::string sName = StatusName(sample.detail.status);
        if (!sName.empty()) {
            sWords += " (" + sName + ")";
        }
    }
    mDisplay.quality = sWords;
    mDisplay.qualityColor = QualityColor(sample.quality);
}

// Only where the user asked for scaling does the engineering range mean
// anything; a value that is not a number is in no range.
void ItemTest::ShowRange(double dValue) {
    const double dLow = std::min(mcChannel.EngMin(), mcChannel.EngMax());
    const double dHigh = std::max(mcChannel.EngMin(), mcChannel.EngMax());
    // Rounding in the scaling is no departure from the range.
    const double dSlack = (dHigh - dLow) * 1e-9;
    const bool bScaled = mcChannel.NeedsScaling(mcTunFile) || mcTunFile.General().ScalePVandCO();
    mDisplay.outOfRange = bScaled && (dValue < dLow - dSlack || dValue > dHigh + dSlack);
    mDisplay.rangeMark =
        "out of range " + mcChannel.FormatDecPt(dLow) + " to " + mcChannel.FormatDecPt(dHigh);
}

// The server's name for a status, asked once; empty when it has none.
std::string ItemTest::StatusName(uint32_t lStatus) {
    const auto known = mStatusNames.find(lStatus);
    if (known != mStatusNames.end()) {
        return known->second;
    }
    std::string sText;
    CvOpcAutoClient* cClient = ServingClient();
    const bool bNamed =
        cClient != nullptr && !cClient->ServerErrorString(static_cast<int32_t>(lStatus), sText);
    return mStatusNames[lStatus] = bNamed ? StatusNameOf(sText) : "";
}

bool ItemTest::SetDecimalPlaces(int32_t lPlaces, bool bQuiet) {
    std::string sMessage;
    if (!mcChannel.ValidateDecimalPlaces(lPlaces, sMessage)) {
        if (!bQuiet) {
            (void)mPlatform.dialogs.MsgBox(sMessage, MsgBoxStyle::Information, "");
        }
        return true;
    }
    mcChannel.SetDecimalPlaces(lPlaces);
    if (mcChannel.IsOnline()) {
        mDisplay.engValue = mcChannel.FormatCurrentValue();
    }
    mDisplay.decimalPlaces = std::to_string(lPlaces);
    mbChanged = true;
    Notify();
    return false;
}

void ItemTest::DecimalPlacesUp() {
    (void)SetDecimalPlaces(mcChannel.DecimalPlaces() + 1, true);
}

void ItemTest::DecimalPlacesDown() {
    (void)SetDecimalPlaces(mcChannel.DecimalPlaces() - 1, true);
}

int32_t ItemTest::PlacesFromText(const std::string& sText) {
    const double dValue = std::round(TextToSingle(mPlatform, sText));
    return static_cast<int32_t>(std::clamp(dValue, -1e9, 1e9));
}

void ItemTest::DecimalPlacesEntered(const std::string& sText) {
    (void)SetDecimalPlaces(PlacesFromText(sText), false);
}

bool ItemTest::ValidateDecimalPlaces(const std::string& sText) {
    const int32_t lPlaces = PlacesFromText(sText);
    if (lPlaces == mcChannel.DecimalPlaces()) {
        return true;
    }
    return !SetDecimalPlaces(lPlaces, false);
}

void ItemTest::ColourChosen(int32_t lColor) {
    if (lColor == mDisplay.engColor) {
        return;
    }
    mDisplay.engColor = lColor;
    mcChannel.SetLineColor(lColor);
    mbChanged = true;
    Notify();
}

void ItemTest::ApplyMode(int32_t iIndex) {
    if (iIndex < 0 || iIndex >= static_cast<int32_t>(mDisplay.modes.size())) {
        return;
    }
    const std::string& sMode = mDisplay.modes[static_cast<size_t>(iIndex)];
    const std::string sRaw = mDisplay.instValue;
    const std::string sQuestion = "Please confirm that you wish " + ProgramTitle() +
                                  " to recognise the string \"" + sRaw + "\" as loop mode " +
                                  sMode + ".";
    if (mPlatform.dialogs.MsgBox(sQuestion, MsgBoxStyle::YesNo + MsgBoxStyle::Question, "") !=
        MsgBoxResult::Yes) {
        return;
    }
    const int32_t n = iIndex + 1;
    TunFileGeneral& cGeneral = mcTunFile.General();
    if (sRaw != cGeneral.ModeKey(n)) {
        cGeneral.SetMode(n, sRaw, sMode);
        mbChanged = true;
    }
}

bool ItemTest::CanClose(const std::string& sDecimalPlaces) {
    // The box is there only once values are shown.
    return !mDisplay.showEngValue || ValidateDecimalPlaces(sDecimalPlaces);
}

void ItemTest::Notify() {
    mListener.DisplayChanged();
}

}  // namespace cv
