#include "channel/Channel.h"

#include "document/TunerType.h"
#include "stores/IniFile.h"

namespace cv {

namespace {

constexpr int32_t kWhite = 0xFFFFFF;
constexpr int32_t kGreen = 0x00FF00;
constexpr int32_t kYellow = 0x00FFFF;
constexpr int32_t kDefaultLineWidth = 2;

}  // namespace

// "PV", "CO" or "SP" by Number; empty for other channels.
std::string Channel::RoleName() const {
    switch (miNumber) {
        case 1:
            return "PV";
        case 2:
            return "CO";
        case 3:
            return "SP";
        default:
            return "";
    }
}

std::string Channel::ChannelSection() const {
    return "Channel" + std::to_string(miNumber);
}

// The SP of a faceplate tuner shares the PV's ranges and units. The number
// is checked first so that an unknown kind reports only for the SP.
bool Channel::IsSpOfFaceplate(cv::TunerType& cTuner) const {
    return miNumber == 3 && cTuner.HasFaceplate();
}

// Colour and width by role from the shared file; extra channels get green.
void Channel::ReadCorvalentIni(IniFile& cSharedIni, std::string& sRoleName, int32_t& lColour) {
    if (miNumber > 3) {
        mlLineColor = kGreen;
        miLineWidth = kDefaultLineWidth;
        return;
    }
    if (miNumber >= 1) {
        constexpr int32_t kRoleColours[] = {kWhite, kGreen, kYellow};
        sRoleName = RoleName();
        lColour = kRoleColours[miNumber - 1];
    }
    mlLineColor = cSharedIni.ReadLong("FacePlate", "Color" + sRoleName, lColour, 0, 0);
    SetLineWidth(
        cSharedIni.ReadLong("FacePlate", "LineWidth" + sRoleName, kDefaultLineWidth, 0, 0));
}

void Channel::CopyFrom(const Channel& cSource) {
    SetRange(RangeType::Engineering, cSource.mdEngMin, cSource.mdEngMax);
    SetRange(RangeType::Instrument, cSource.mdInstMin, cSource.mdInstMax);
    SetRange(RangeType::Display, cSource.mdDisplayMin, cSource.mdDisplayMax);
    miDecimalPlaces = cSource.miDecimalPlaces;
    msDescription = cSource.msDescription;
    msEngUnits = cSource.msEngUnits;
    miLineStyle = cSource.miLineStyle;
    miLineWidth = cSource.miLineWidth;
    mlLineColor = cSource.mlLineColor;
    mbDisplayOnGraph = cSource.mbDisplayOnGraph;
    miComType = cSource.miComType;
    miSpecificChannelType = cSource.miSpecificChannelType;
    mbExpectANumber = cSource.mbExpectANumber;
    msItemName = cSource.msItemName;
    msTopicName = cSource.msTopicName;
    msDdeApplication = cSource.msDdeApplication;
    msOpcComputer = cSource.msOpcComputer;
    msOpcServerID = cSource.msOpcServerID;
}

}  // namespace cv
