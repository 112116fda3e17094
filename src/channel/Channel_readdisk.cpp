#include "channel/Channel.h"

#include "channel/SpecificChannelKeys.h"
#include "channel/TunerKindCode.h"
#include "document/TunFile.h"
#include "stores/IniFile.h"

namespace cv {

namespace {

constexpr const char* kPlcAppTopic = "PLCDDE|Topic";

std::string DefaultDdeAppTopic(int32_t lTuner) {
    return lTuner == TunerKindCode::DdeTuner ? "Simulate|Loop" : "VIEW|TAGNAME";
}

// The item the PV, CO and SP channels read when the file names none.
std::string DefaultRoleItem(int32_t lNumber) {
    switch (lNumber) {
        case 1:
            return "PVData";
        case 2:
            return "COData";
        default:
            return "";
    }
}

}  // namespace

void Channel::ReadFromDisk(IniFile& cSharedIni, TunFile& cTunFile) {
    if (miSpecificChannelType == 0) {
        ReadArchiveFromDisk(cSharedIni, cTunFile.IniFileObject(), cTunFile.TunerTypeObj());
    } else {
        ReadSpecificFromDisk(cTunFile.IniFileObject(), cTunFile.TunerType());
    }
}

// A write channel reads its read channel's item unless the file asks for
// unique write locations; even then that item is the default.
void Channel::ReadSpecificFromDisk(IniFile& cIni, int32_t lTuner) {
    const SpecificChannelKeys* keys = FindSpecificChannelKeys(miSpecificChannelType);
    if (keys == nullptr) {
        return;
    }
    msDescription = keys->sDescription;
    const std::string sPrefix = lTuner == TunerKindCode::OpcTuner ? "OPC" : "DDE";
    std::string sKey = sPrefix + keys->sReadKey;
    std::string sDefault;
    if (keys->sSendKey != nullptr && cIni.ReadBoolean("DDE", "DDE_UniqueWriteLocs", false)) {
        sDefault = keys->bFilter ? "" : cIni.ReadString(sPrefix, sKey, "");
        sKey = keys->sSendKey;
    }
    switch (lTuner) {
        case TunerKindCode::DdeTuner:
        case TunerKindCode::Fenwarden:
        case TunerKindCode::Wonderware:
            miComType = ComTypeCode::Dde;
            SetDdeAppTopic(cIni.ReadString(
                "DDE", keys->bFilter ? "DDE_FilterAppTopic" : "DDE_applicationtopic",
                DefaultDdeAppTopic(lTuner)));
            msItemName = cIni.ReadString("DDE", sKey, sDefault);
            break;
        case TunerKindCode::Plc32Tuner:
            miComType = ComTypeCode::Dde;
            SetDdeAppTopic(kPlcAppTopic);
            msItemName = keys->sShortName;
            break;
        case TunerKindCode::OpcTuner:
            miComType = ComTypeCode::Opc;
            SetOpcNodeAndServer(
                cIni.ReadString("OPC", keys->bFilter ? "OPC_FilterServerID" : "OPC_ServerID", ""));
            msTopicName = cIni.ReadString(
                "OPC", keys->bFilter ? "OPC_FilterAccessPath" : "OPC_AccessPath", "");
            msItemName = cIni.ReadString("OPC", sKey, sDefault);
            break;
        default:
            break;
    }
}

// The SP of a faceplate tuner takes its ranges and units from the PV's
// section; the CO of one is in percent unless the file says otherwise.
void Channel::ReadArchiveFromDisk(IniFile& cSharedIni, IniFile& cIni, cv::TunerType& cTuner) {
    const bool bFaceplate = (miNumber == 2 || miNumber == 3) && cTuner.HasFaceplate();
    const std::string sRanges = bFaceplate && miNumber == 3 ? "Channel1" : ChannelSection();
    SetRange(RangeType::Engineering, cIni.ReadDouble(sRanges, "EngMin", 0),
             cIni.ReadDouble(sRanges, "EngMax", 100));
    SetRange(RangeType::Instrument, cIni.ReadDouble(sRanges, "InstMin", 0),
             cIni.ReadDouble(sRanges, "InstMax", 100));
    SetRange(RangeType::Display, cIni.ReadDouble(sRanges, "DisplayMin", 0),
             cIni.ReadDouble(sRanges, "DisplayMax", 100));
    msEngUnits =
        cIni.ReadString(sRanges, "EngineeringUnits", bFaceplate && miNumber == 2 ? "%" : "");
    if (sRanges == "Channel1" && msEngUnits.empty()) {
        msEngUnits = cIni.ReadString("PIDTuningSelections", "Engineering_Units", "");
    }
    ReadArchiveDisplay(cSharedIni, cIni, cTuner);
    ReadArchiveAddress(cIni, cTuner.Tuner());
}

// Without the shared file, and for extra channels, colour and width live in
// the channel's own section, and the description defaults to "Trend" + index.
void Channel::ReadArchiveDisplay(IniFile& cSharedIni, IniFile& cIni, cv::TunerType& cTuner) {
    const std::string sSection = ChannelSection();
    std::string sRoleName;
    int32_t lColour = mlLineColor;
    ReadCorvalentIni(cSharedIni, sRoleName, lColour);
    std::string sDefaultDescription = sRoleName;
    const bool bUsesCvIni = cTuner.UsesCvIni();
    if (miNumber >= 4 || !bUsesCvIni) {
        sDefaultDescription = "Trend" + std::to_string(bUsesCvIni ? miNumber - 3 : miNumber);
        mlLineColor = cIni.ReadLong(sSection, "LineColor", mlLineColor, 0, 0);
        SetLineWidth(cIni.ReadLong(sSection, "LineWidth", miLineWidth, 0, 0));
    }
    msDescription = cIni.ReadString(sSection, "Description", "");
    if (msDescription.empty()) {
        msDescription = sDefaultDescription;
    }
    miDecimalPlaces = cIni.ReadLong(sSection, "DecimalPlaces", 1, 0, 0);
    SetLineStyle(cIni.ReadString(sSection, "LineStyle", "Solid"));
    mbDisplayOnGraph = cIni.ReadBoolean(sSection, "DisplayOnGraph", true);
}

void Channel::ReadArchiveAddress(IniFile& cIni, int32_t lTuner) {
    switch (lTuner) {
        case TunerKindCode::DdeTuner:
        case TunerKindCode::Fenwarden:
        case TunerKindCode::Wonderware:
            miComType = ComTypeCode::Dde;
            ReadArchiveDdeAddress(cIni, lTuner);
            break;
        case TunerKindCode::Brindlemoor:
            miComType = ComTypeCode::Dde;
            if (miNumber >= 4) {
                msItemName = cIni.ReadString(ChannelSection(), "Item", "PID_1_PV");
            }
            break;
        case TunerKindCode::Plc32Tuner:
            miComType = ComTypeCode::Dde;
            SetDdeAppTopic(kPlcAppTopic);
            if (miNumber >= 1 && miNumber <= 3) {
                constexpr const char* kPlcItems[] = {"PV", "Output", "SP"};
                msItemName = kPlcItems[miNumber - 1];
            }
            break;
        case TunerKindCode::OpcTuner:
            miComType = ComTypeCode::Opc;
            ReadArchiveOpcAddress(cIni);
            break;
        default:
            break;
    }
}

// PV, CO and SP share one application and topic; extra channels have their
// own, stored apart so that a bar inside either survives.
void Channel::ReadArchiveDdeAddress(IniFile& cIni, int32_t lTuner) {
    if (miNumber >= 4) {
        const std::string sSection = ChannelSection();
        msDdeApplication = cIni.ReadString(sSection, "Application", "Simulate");
        msTopicName = cIni.ReadString(sSection, "Topic", "Loop");
        msItemName = cIni.ReadString(sSection, "Item", "");
        return;
    }
    SetDdeAppTopic(cIni.ReadString("DDE", "DDE_applicationtopic", DefaultDdeAppTopic(lTuner)));
    if (miNumber >= 1) {
        msItemName = cIni.ReadString("DDE", "DDE_item_" + RoleName(), DefaultRoleItem(miNumber));
    }
}

// PV, CO and SP share one server and access path in section "OPC".
void Channel::ReadArchiveOpcAddress(IniFile& cIni) {
    if (miNumber >= 4) {
        const std::string sSection = ChannelSection();
        SetOpcNodeAndServer(cIni.ReadString(sSection, "ServerID", ""));
        msTopicName = cIni.ReadString(sSection, "AccessPath", "");
        msItemName = cIni.ReadString(sSection, "Item", "");
        return;
    }
    SetOpcNodeAndServer(cIni.ReadString("OPC", "OPC_ServerID", ""));
    msTopicName = cIni.ReadString("OPC", "OPC_AccessPath", "");
    if (miNumber >= 1) {
        msItemName = cIni.ReadString("OPC", "OPC_item_" + RoleName(), DefaultRoleItem(miNumber));
    }
}

}  // namespace cv
