#include "channel/Channel.h"

#include "channel/SpecificChannelKeys.h"
#include "channel/TunerKindCode.h"
#include "document/TunerType.h"
#include "stores/IniFile.h"

namespace cv {

void Channel::WriteToDisk(IniFile& cSharedIni, IniFile& cIni, cv::TunerType& cTuner) {
    if (miSpecificChannelType != 0) {
        WriteSpecificToDisk(cIni, cTuner.Tuner());
        return;
    }
    const std::string sSection = ChannelSection();
    WriteSpansToDisk(sSection, cIni, cTuner);
    WriteDisplayDataToDisk(sSection, cSharedIni, cIni, cTuner);
    WriteArchiveAddress(cIni, cTuner.Tuner());
}

// Only the DDE and OPC tuners keep loop-specific items. A write channel
// always goes under its own key, whatever the unique-write setting.
void Channel::WriteSpecificToDisk(IniFile& cIni, int32_t lTuner) {
    const SpecificChannelKeys* keys = FindSpecificChannelKeys(miSpecificChannelType);
    if (keys == nullptr ||
        (lTuner != TunerKindCode::DdeTuner && lTuner != TunerKindCode::OpcTuner)) {
        return;
    }
    const std::string sPrefix = lTuner == TunerKindCode::OpcTuner ? "OPC" : "DDE";
    const std::string sKey = keys->sSendKey != nullptr ? keys->sSendKey : sPrefix + keys->sReadKey;
    cIni.WriteText(sPrefix, sKey, msItemName);
    if (!keys->bFilter || keys->sSendKey != nullptr) {
        return;
    }
    if (lTuner == TunerKindCode::OpcTuner) {
        cIni.WriteText("OPC", "OPC_FilterServerID", OpcNodeAndServer());
        cIni.WriteText("OPC", "OPC_FilterAccessPath", msTopicName);
    } else {
        cIni.WriteText("DDE", "DDE_FilterAppTopic", DdeAppTopic());
    }
}

void Channel::WriteSpansToDisk(const std::string& sSection, IniFile& cIni, cv::TunerType& cTuner) {
    if (IsSpOfFaceplate(cTuner)) {
        return;
    }
    cIni.WriteDouble(sSection, "EngMin", mdEngMin);
    cIni.WriteDouble(sSection, "EngMax", mdEngMax);
    cIni.WriteDouble(sSection, "InstMin", mdInstMin);
    cIni.WriteDouble(sSection, "InstMax", mdInstMax);
}

// Colour and width of PV, CO and SP belong to the shared file when the kind
// uses it; everything else goes to the channel's section.
void Channel::WriteDisplayDataToDisk(const std::string& sSection, IniFile& cSharedIni,
                                     IniFile& cIni, cv::TunerType& cTuner) {
    if (!IsSpOfFaceplate(cTuner)) {
        cIni.WriteDouble(sSection, "DisplayMin", mdDisplayMin);
        cIni.WriteDouble(sSection, "DisplayMax", mdDisplayMax);
        WriteEngUnitsToDisk(cIni, sSection);
    }
    if (miNumber >= 4 || !cTuner.UsesCvIni()) {
        cIni.WriteLong(sSection, "LineColor", mlLineColor);
        cIni.WriteLong(sSection, "LineWidth", miLineWidth);
    } else {
        cSharedIni.WriteLong("FacePlate", "Color" + RoleName(), mlLineColor);
        cSharedIni.WriteLong("FacePlate", "LineWidth" + RoleName(), miLineWidth);
    }
    cIni.WriteLong(sSection, "DecimalPlaces", miDecimalPlaces);
    cIni.WriteText(sSection, "Description", msDescription);
    cIni.WriteString(sSection, "LineStyle", LineStyle());
    cIni.WriteBoolean(sSection, "DisplayOnGraph", mbDisplayOnGraph);
}

void Channel::WriteEngUnitsToDisk(IniFile& cIni, const std::string& sSection) {
    cIni.WriteText(sSection, "EngineeringUnits", msEngUnits);
}

void Channel::WriteArchiveAddress(IniFile& cIni, int32_t lTuner) {
    switch (lTuner) {
        case TunerKindCode::DdeTuner:
            WriteArchiveDdeAddress(cIni);
            break;
        case TunerKindCode::Fenwarden:
            if (miNumber >= 4) {
                cIni.WriteText(ChannelSection(), "LinxItem", msItemName);
            }
            break;
        case TunerKindCode::Brindlemoor:
            if (miNumber >= 4) {
                cIni.WriteText(ChannelSection(), "Item", msItemName);
            }
            break;
        case TunerKindCode::OpcTuner:
            WriteArchiveOpcAddress(cIni);
            break;
        default:
            break;
    }
}

// PV, CO and SP share the application and topic in section "DDE", so the
// last of them written sets those for all three.
void Channel::WriteArchiveDdeAddress(IniFile& cIni) {
    if (miNumber >= 4) {
        const std::string sSection = ChannelSection();
        cIni.WriteText(sSection, "Application", msDdeApplication);
        cIni.WriteText(sSection, "Topic", msTopicName);
        cIni.WriteText(sSection, "Item", msItemName);
    } else if (miNumber >= 1) {
        cIni.WriteText("DDE", "DDE_applicationtopic", DdeAppTopic());
        cIni.WriteText("DDE", "DDE_item_" + RoleName(), msItemName);
    }
}

// Likewise PV, CO and SP share the server and access path in section "OPC".
// A historical-data item names no server.
void Channel::WriteArchiveOpcAddress(IniFile& cIni) {
    const std::string sServer =
        miComType == ComTypeCode::OpcHda ? "OPC HDA item - No OPC Server" : OpcNodeAndServer();
    if (miNumber >= 4) {
        const std::string sSection = ChannelSection();
        cIni.WriteText(sSection, "ServerID", sServer);
        cIni.WriteText(sSection, "AccessPath", msTopicName);
        cIni.WriteText(sSection, "Item", msItemName);
    } else if (miNumber >= 1) {
        cIni.WriteText("OPC", "OPC_ServerID", sServer);
        cIni.WriteText("OPC", "OPC_AccessPath", msTopicName);
        cIni.WriteText("OPC", "OPC_item_" + RoleName(), msItemName);
    }
}

}  // namespace cv
