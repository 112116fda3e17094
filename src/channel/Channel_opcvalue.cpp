#include "channel/Channel.h"
#include "platform/DdeLink.h"
#include "platform/Platform.h"
#include "util/ProgramRoutines.h"

namespace cv {

namespace {

constexpr int32_t kQualityMask = 0xC0;
constexpr int32_t kQualityGood = 0xC0;
constexpr int32_t kQualityUncertain = 0x40;
constexpr int32_t kStatusMask = 0xFC;
constexpr int32_t kLastKnown = 0x14;
constexpr int32_t kSubStatusMask = 0x3C;
// The channel's own mark that its uncertain-value warning was shown.
constexpr int32_t kWarnedMark = 0x800;
constexpr const char* kCrLf = "\r\n";

}  // namespace

std::string Channel::VariantText(const Variant& vValue) const {
    Variant vText;
    if (ChangeType(vText, vValue, VT_BSTR, mPlatform.locale)) {
        return {};
    }
    return vText.AsStr();
}

void Channel::OpcSetRawValue(const Variant& vValue, int32_t lQuality, double dTimeStamp,
                             bool bSingleShot, const platform::ValueDetail& detail) {
    mvRawValue = vValue;
    mdTimeStamp = dTimeStamp;
    if (vValue.IsArray()) {
        std::string sLines;
        for (size_t i = 0; i < vValue.ElementCount(); ++i) {
            sLines += VariantText(vValue.Element(i)) + kCrLf;
        }
        mvRawValue = Variant::Str(sLines);
    }
    if (mvRawValue.VarType() == VT_BSTR) {
        const std::string& sText = mvRawValue.AsStr();
        mvRawValue = Variant::Str(sText.substr(0, sText.find('\0')));
    }
    mOpcSample = {mvRawValue, lQuality, dTimeStamp, detail, mOpcSample.number + 1};
    if ((lQuality & kStatusMask) == kLastKnown) {
        lQuality = (lQuality & ~kSubStatusMask) | kQualityGood;
    }
    mlQuality = (lQuality & ~kWarnedMark) | (mlQuality & kWarnedMark);

    // Only a channel waiting for its first value comes online: a late value
    // reaching a channel that went offline (timed out, its client released)
    // is kept but brings nothing back.
    const int32_t lKind = lQuality & kQualityMask;
    if (miComType == ComTypeCode::Opc && (lKind == kQualityGood || lKind == kQualityUncertain)) {
        if (miState == OnlineState::GoingOnline) {
            miState = OnlineState::Online;
            ProveNumber();
        }
        return;
    }
    if (bSingleShot || miState != OnlineState::Offline) {
        msErrorStr = QualityText(lQuality);
    }
    if (bSingleShot || miState == OnlineState::Online) {
        GoOffline();
    }
}

// A first value that is no number takes the channel offline again, with the
// diagnosis left for the owner.
void Channel::ProveNumber() {
    if (!mbExpectANumber) {
        return;
    }
    Variant vNumber;
    if (ErrorInfo error = ChangeType(vNumber, RawValue(), VT_R8, mPlatform.locale)) {
        int32_t lButtons = 0;
        std::string sQuestion;
        msErrorStr = GetErrorString("", lButtons, sQuestion, error);
        GoOffline();
    }
}

Variant Channel::RawValue() {
    if (miState != OnlineState::Online) {
        return Variant::I2(0);
    }
    if (miComType == ComTypeCode::Dde) {
        return mcDdeLabel ? Variant::Str(mcDdeLabel->Text()) : Variant::I2(0);
    }
    if (miComType != ComTypeCode::Opc && miComType != ComTypeCode::OpcHda) {
        return Variant::I2(0);
    }
    if ((mlQuality & kQualityMask) == kQualityUncertain && !UncertainWarningOff(mPlatform, false) &&
        (mlQuality & kWarnedMark) == 0) {
        AskUncertainWarning();
    }
    if (miDisplayVarType == 0) {
        return mvRawValue;
    }
    Variant vConverted;
    if (ChangeType(vConverted, mvRawValue, static_cast<uint16_t>(miDisplayVarType),
                   mPlatform.locale)) {
        return Variant();
    }
    return vConverted;
}

// Asked once per channel; No silences it for every channel for the run.
void Channel::AskUncertainWarning() {
    mlQuality |= kWarnedMark;
    const std::string sText = std::string("Uncertain value reported by OPC ") +
                              (miComType == ComTypeCode::OpcHda ? "HDA " : "") + "Server.  " +
                              "The reported reason is :\"" + QualityText(mlQuality) + "\"" + kCrLf +
                              kCrLf + "Continue showing this warning in this session?";
    const int32_t lAnswer =
        mPlatform.dialogs.MsgBox(sText, MsgBoxStyle::YesNo + MsgBoxStyle::Exclamation,
                                 msDescription + ": Uncertain OPC Value");
    if (lAnswer == MsgBoxResult::No) {
        UncertainWarningOff(mPlatform, true);
    }
}

std::string Channel::QualityText(int32_t lQuality) const {
    switch (lQuality & kStatusMask) {
        case 0x04:
            return "OPC Server configuration error";
        case 0x08:
            return "OPC Server error: \"Not connected\"";
        case 0x0C:
            return "OPC Server error: \"Device failure\"";
        case 0x10:
            return "OPC Server error: \"Sensor failure\"";
        case 0x14:
            return "OPC Server error: \"Last known\"";
        case 0x18:
            return "OPC Server error: \"Communications failure\"";
        case 0x1C:
            return "OPC Server error: \"Out of service\"";
        case 0x44:
            return "Uncertain value - Last usable";
        case 0x50:
            return "Uncertain value - Sensor Cal";
        case 0x54:
            return "Uncertain value - EGU exceeded";
        case 0x58:
            return "Uncertain value - Sub normal";
        default:
            break;
    }
    if ((lQuality & kQualityMask) != 0) {
        return "Uncertain value - Undefined reason";
    }
    return "Bad value of unknown status reported by OPC Server.";
}

}  // namespace cv
