#include <cfloat>
#include <cmath>

#include "app/frmOpcTestClient.h"
#include "platform/Platform.h"
#include "stores/RegClass.h"

namespace cv {

namespace {

// Where the window's values are remembered for the user.
const std::string kSettingsKey = "Software\\Corvalent\\TestClient";

constexpr double kDefaultMin = 0;
constexpr double kDefaultMax = 100;
constexpr int32_t kDefaultDecPt = 2;
constexpr int32_t kDefaultColour = 65280;
constexpr double kDefaultSI = 1.0;
// Colours are 0x00BBGGRR values.
constexpr int32_t kMaxColour = 0x00FFFFFF;

RegClass UserSettings(Platform& platform) {
    RegClass cReg(platform.registry);
    cReg.SetMainKey(platform::kHkeyCurrentUser);
    return cReg;
}

// The boxes show and check the limits in single precision, so a range is
// used only when both limits fit it and stay apart in it. That also keeps
// the scale factor finite.
bool FitsTheBoxes(double dMin, double dMax) {
    return std::fabs(dMin) <= FLT_MAX && std::fabs(dMax) <= FLT_MAX &&
           static_cast<float>(dMin) != static_cast<float>(dMax);
}

}  // namespace

// The remembered values in the order they are stored. Each goes through the
// rules of the object that holds it: a value it refuses, or one the window
// could not show sensibly, is ignored and the object keeps what it holds.
void frmOpcTestClient::ReadRememberedValues() {
    RegClass cReg = UserSettings(mPlatform);
    Channel& channel = TestChannel();
    channel.SetOpcNodeAndServer(cReg.ReadString(kSettingsKey, "ServerID", ""));
    channel.SetOpcAccessPath(cReg.ReadString(kSettingsKey, "AccessPath", ""));
    channel.SetItemName(cReg.ReadString(kSettingsKey, "ItemName", ""));
    const double dEngMin = cReg.ReadDouble(kSettingsKey, "EngMin", kDefaultMin);
    const double dEngMax = cReg.ReadDouble(kSettingsKey, "EngMax", kDefaultMax);
    ApplyRememberedRange(RangeType::Engineering, dEngMin, dEngMax);
    const double dInstMin = cReg.ReadDouble(kSettingsKey, "InstMin", kDefaultMin);
    const double dInstMax = cReg.ReadDouble(kSettingsKey, "InstMax", kDefaultMax);
    ApplyRememberedRange(RangeType::Instrument, dInstMin, dInstMax);
    channel.SetDecimalPlaces(cReg.ReadLong(kSettingsKey, "DecPt", kDefaultDecPt, 0, 0));
    const int32_t lColour = cReg.ReadLong(kSettingsKey, "Colour", kDefaultColour, 0, 0);
    if (lColour >= 0 && lColour <= kMaxColour) {
        channel.SetLineColor(lColour);
    }
    General().SetScalePVandCO(cReg.ReadBoolean(kSettingsKey, "Scaling", true));
    General().SetSIinSec(cReg.ReadDouble(kSettingsKey, "SI", kDefaultSI));
}

void frmOpcTestClient::ApplyRememberedRange(RangeType eRange, double dMin, double dMax) {
    if (FitsTheBoxes(dMin, dMax)) {
        TestChannel().SetRange(eRange, dMin, dMax);
    }
}

// Saves what the objects hold; text typed into a box that has not been
// checked yet never reached them and is not saved. Store failures are silent.
void frmOpcTestClient::WriteRememberedValues() {
    RegClass cReg = UserSettings(mPlatform);
    const Channel& channel = TestChannel();
    cReg.WriteString(kSettingsKey, "ServerID", channel.OpcNodeAndServer());
    cReg.WriteString(kSettingsKey, "AccessPath", channel.OpcAccessPath());
    cReg.WriteString(kSettingsKey, "ItemName", channel.ItemName());
    cReg.WriteDouble(kSettingsKey, "EngMin", channel.EngMin());
    cReg.WriteDouble(kSettingsKey, "EngMax", channel.EngMax());
    cReg.WriteDouble(kSettingsKey, "InstMin", channel.InstMin());
    cReg.WriteDouble(kSettingsKey, "InstMax", channel.InstMax());
    cReg.WriteLong(kSettingsKey, "DecPt", channel.DecimalPlaces());
    cReg.WriteLong(kSettingsKey, "Colour", channel.LineColor());
    cReg.WriteBoolean(kSettingsKey, "Scaling", General().ScalePVandCO());
    cReg.WriteDouble(kSettingsKey, "SI", General().SIinSec());
}

}  // namespace cv
