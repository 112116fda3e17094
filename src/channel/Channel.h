#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <utility>

#include "channel/OpcSample.h"
#include "platform/ErrorInfo.h"
#include "platform/Variant.h"
#include "platform/opc/ValueDetail.h"

namespace cv {

class CvOpcAutoClient;
class IniFile;
class TunFile;
class TunerType;
struct Platform;

namespace platform {
class DdeLink;
class OPCItem;
}  // namespace platform

// The three ranges a channel keeps; their names appear in messages.
enum class RangeType : int32_t { Engineering = 0, Instrument = 1, Display = 2 };

// Communication-type codes; 3, 5 and 7 have only generic handling.
namespace ComTypeCode {
inline constexpr int32_t Dde = 0;
inline constexpr int32_t Opc = 4;
inline constexpr int32_t OpcHda = 8;
}  // namespace ComTypeCode

// Communications state of a channel.
namespace OnlineState {
inline constexpr int32_t Offline = 0;
inline constexpr int32_t GoingOnline = 1;
inline constexpr int32_t Online = 2;
}  // namespace OnlineState

// One data point reached over OPC or DDE: its ranges and the conversion from
// the raw (instrument) value to the engineering value, its display
// attributes, its address, the last value received with its quality, and the
// plain-words diagnosis of a failure.
class Channel {
  public:
    explicit Channel(Platform& platform);
    ~Channel();
    Channel(const Channel&) = delete;
    Channel& operator=(const Channel&) = delete;

    // A reference that reads null once this channel is destroyed, for a list
    // that keeps the channel without owning it (the OPC client's).
    std::shared_ptr<Channel* const> Presence() const { return mpPresence; }

    // Ranges. Equal (or non-finite) limits are stored as 0 and 100.
    double EngMin() const { return mdEngMin; }
    double EngMax() const { return mdEngMax; }
    double InstMin() const { return mdInstMin; }
    double InstMax() const { return mdInstMax; }
    double DisplayMin() const { return mdDisplayMin; }
    double DisplayMax() const { return mdDisplayMax; }
    void SetRange(RangeType eRange, double dMin, double dMax);
    bool ValidateRange(RangeType eRange, double dMin, double dMax, std::string& sMessage) const;
    // lWhich: 0 minimum, 1 maximum.
    double GetRangeValue(RangeType eRange, int32_t lWhich) const;
    ErrorInfo SpanValue(RangeType eRange, double& dSpan) const;
    void CopyRangeValuesFrom(const Channel& cSource);
    void CopyEngRangeToInstRange();
    ErrorInfo SetDefaultDisplaySpan(bool bUseCurrent, float sngLow, float sngHigh);

    // Scaling between the instrument and the engineering range.
    double ScaleFactor() const { return mdScaleFactor; }
    double ScaleOffset() const { return mdScaleOffset; }
    bool NeedsScaling(TunFile& cTunFile);
    double ScalePriorToOutput(double dValue) const;
    ErrorInfo ConvertToPercent(double dValue, double& dPercent) const;
    ErrorInfo ConvertFromPercent(double dPercent, double& dValue) const;
    // May ask the uncertain-value or the conversion question.
    double CurrentValue();
    std::string FormatCurrentValue();

    // Display attributes.
    int32_t DecimalPlaces() const { return miDecimalPlaces; }
    void SetDecimalPlaces(int32_t lPlaces);
    bool ValidateDecimalPlaces(int32_t lPlaces, std::string& sMessage) const;
    void DefaultDecPt();
    std::string FormatDecPt(double dValue) const;
    const std::string& Description() const { return msDescription; }
    void SetDescription(const std::string& sText) { msDescription = sText; }
    const std::string& EngUnits() const { return msEngUnits; }
    void SetEngUnits(const std::string& sText) { msEngUnits = sText; }
    std::string EngUnitsBrackets() const;
    std::string LineStyle() const;
    void SetLineStyle(const std::string& sStyle);
    int32_t LineWidth() const { return miLineWidth; }
    void SetLineWidth(int32_t lWidth);
    bool ValidateLineWidth(int32_t lWidth, std::string& sMessage) const;
    int32_t LineColor() const { return mlLineColor; }
    void SetLineColor(int32_t lColor) { mlLineColor = lColor; }
    bool DisplayOnGraph() const { return mbDisplayOnGraph; }
    void SetDisplayOnGraph(bool bShow) { mbDisplayOnGraph = bShow; }
    int32_t Number() const { return miNumber; }
    void SetNumber(int32_t lNumber) { miNumber = lNumber; }

    // Address.
    const std::string& ItemName() const { return msItemName; }
    void SetItemName(const std::string& sName) { msItemName = sName; }
    const std::string& TopicName() const { return msTopicName; }
    void SetTopicName(const std::string& sName) { msTopicName = sName; }
    const std::string& OpcAccessPath() const { return msTopicName; }
    void SetOpcAccessPath(const std::string& sPath) { msTopicName = sPath; }
    const std::string& DdeApplication() const { return msDdeApplication; }
    std::string DdeAppTopic() const;
    void SetDdeAppTopic(const std::string& sAppTopic);
    const std::string& OpcComputer() const { return msOpcComputer; }
    void SetOpcComputer(const std::string& sComputer) { msOpcComputer = sComputer; }
    const std::string& OpcServerID() const { return msOpcServerID; }
    void SetOpcServerID(const std::string& sServerID) { msOpcServerID = sServerID; }
    // "\\Node\Server", or the server ID alone for this computer.
    std::string OpcNodeAndServer() const;
    void SetOpcNodeAndServer(const std::string& sNodeAndServer);

    // Persistence in the tuning file (cIni) and the shared "Corvalen.ini"
    // (cSharedIni). A loop-specific channel (SpecificChannelType 1 to 12)
    // keeps its item under one section per protocol; an archive channel
    // (SpecificChannelType 0) has the section "Channel" + Number.
    void ReadCorvalentIni(IniFile& cSharedIni, std::string& sRoleName, int32_t& lColour);
    void ReadFromDisk(IniFile& cSharedIni, TunFile& cTunFile);
    void WriteToDisk(IniFile& cSharedIni, IniFile& cIni, cv::TunerType& cTuner);
    void WriteSpansToDisk(const std::string& sSection, IniFile& cIni, cv::TunerType& cTuner);
    void WriteDisplayDataToDisk(const std::string& sSection, IniFile& cSharedIni, IniFile& cIni,
                                cv::TunerType& cTuner);
    void WriteEngUnitsToDisk(IniFile& cIni, const std::string& sSection);
    // Ranges, display attributes and address; not the number, nor anything
    // of the communications.
    void CopyFrom(const Channel& cSource);

    // Communications.
    int32_t ComType() const { return miComType; }
    void SetComType(int32_t lComType) { miComType = lComType; }
    void CheckComType(int32_t) const {}
    int32_t SpecificChannelType() const { return miSpecificChannelType; }
    void SetSpecificChannelType(int32_t lType) { miSpecificChannelType = lType; }
    bool ExpectANumber() const { return mbExpectANumber; }
    void SetExpectANumber(bool bExpect) { mbExpectANumber = bExpect; }
    void SetDisplayVarType(int16_t iVarType) { miDisplayVarType = iVarType; }
    bool IsOnline() const { return miState == OnlineState::Online; }
    // The first step of going online: the channel waits for its first value
    // (state GoingOnline); only then does a good value bring it online.
    void MarkGoingOnline() { miState = OnlineState::GoingOnline; }
    int32_t Online(bool bTimedOut);
    // False only for an extra charted channel of a simulation document.
    bool OKtoGoOnline(const TunFile& cTunFile) const;
    // The communications life cycle. lButtons and sText are the owner's
    // message style and consequence text for a failure, shown (or, when
    // bSilent, left in ErrorStr) together with the diagnosis; the failing
    // channel is offline.
    bool CreateCommsObjects(TunFile& cTunFile, int32_t& lButtons, std::string& sText, bool bSilent);
    bool GoOnline(TunFile& cTunFile, int32_t& lButtons, std::string& sText, bool bSilent);
    void GoOffline();
    bool SingleShotRead(TunFile& cTunFile, bool bSilent);
    // Goes offline and, for DDE, lets go of the DDE label.
    void ClearCommunicationsObject();
    // Writes sValue unchanged (DDE poke or OPC write); SendResult tells how
    // it went and ErrorStr why it failed.
    bool SendValue(const std::string& sValue);
    // The DDE link of a DDE channel. Attaching one points it at DdeAppTopic
    // and ItemName; a step that fails ends it silently.
    const std::shared_ptr<platform::DdeLink>& DdeLabel() const { return mcDdeLabel; }
    void SetDdeLabel(std::shared_ptr<platform::DdeLink> cLabel);
    // Returns the stored error text and clears it.
    std::string ErrorStr();
    // The failure last reported by the communications life cycle (shown, or
    // left in the error text when silent).
    const ErrorInfo& CommsError() const { return mCommsError; }
    int32_t SendResult() const { return miSendResult; }
    void SetSendResult(int32_t lResult) { miSendResult = lResult; }
    // The value as received: 0 while not online; may ask the uncertain-value
    // question once per channel.
    Variant RawValue();

    // OPC members used by the OPC client. detail is what the server told
    // besides the time stamp and the quality.
    void OpcSetRawValue(const Variant& vValue, int32_t lQuality, double dTimeStamp,
                        bool bSingleShot, const platform::ValueDetail& detail = {});
    void OpcDataChange(const std::string& sText);
    // The client marks the channels it served when their server shut down
    // (and says so itself); the mark lasts until CreateCommsObjects.
    void OpcServerShutDown() { mbServerShutDown = true; }
    bool ServerShutDown() const { return mbServerShutDown; }
    // The OPC client serving this channel and the channel's OPC item, set by
    // the client when it adds the channel and released when the channel goes
    // offline; the client is not owned here.
    CvOpcAutoClient* OpcClient() const { return mcOpcClient; }
    void SetOpcClient(CvOpcAutoClient* cClient) { mcOpcClient = cClient; }
    void SetOpcItem(std::shared_ptr<platform::OPCItem> cItem) { mcOpcItem = std::move(cItem); }
    int32_t OpcServerHandle() const { return mlOpcServerHandle; }
    void SetOpcServerHandle(int32_t lHandle) { mlOpcServerHandle = lHandle; }
    int32_t OpcGroupNumber() const;
    bool OpcIsActive() const;
    int16_t OpcRawValueVarType() const;
    double OpcTimeStamp() const;
    // The OPC quality word of the last value, without the channel's own marks.
    int32_t OpcQuality() const { return mlQuality & 0xF7FF; }
    const OpcSample& LastOpcSample() const { return mOpcSample; }

    // The plain-words diagnosis of sOverride, or of currentError when
    // sOverride is empty. A DDE time-out sets lButtons to Yes/No and asks
    // sQuestion.
    std::string GetErrorString(const std::string& sOverride, int32_t& lButtons,
                               std::string& sQuestion, const ErrorInfo& currentError);

  private:
    bool GoOnlineDde(TunFile& cTunFile, ErrorInfo& error);
    ErrorInfo SendDde(const std::string& sValue);
    bool SendOpc(const std::string& sValue);
    int32_t ReportCommsError(const ErrorInfo& error, int32_t lButtons, std::string& sText,
                             bool bSilent);
    void OfferLongerDdeTimeout(int32_t lAnswer, const ErrorInfo& error, TunFile& cTunFile);
    std::string RoleName() const;
    std::string ChannelSection() const;
    bool IsSpOfFaceplate(cv::TunerType& cTuner) const;
    void ReadSpecificFromDisk(IniFile& cIni, int32_t lTuner);
    void ReadArchiveFromDisk(IniFile& cSharedIni, IniFile& cIni, cv::TunerType& cTuner);
    void ReadArchiveDisplay(IniFile& cSharedIni, IniFile& cIni, cv::TunerType& cTuner);
    void ReadArchiveAddress(IniFile& cIni, int32_t lTuner);
    void ReadArchiveDdeAddress(IniFile& cIni, int32_t lTuner);
    void ReadArchiveOpcAddress(IniFile& cIni);
    void WriteSpecificToDisk(IniFile& cIni, int32_t lTuner);
    void WriteArchiveAddress(IniFile& cIni, int32_t lTuner);
    void WriteArchiveDdeAddress(IniFile& cIni);
    void WriteArchiveOpcAddress(IniFile& cIni);
    void CalcScaleFactors();
    void UpdateScalingFlags(TunFile& cTunFile);
    void ProveNumber();
    void AskUncertainWarning();
    std::string QualityText(int32_t lQuality) const;
    std::string VariantText(const Variant& vValue) const;
    std::string DiagnoseError(const ErrorInfo& currentError, int32_t& lButtons,
                              std::string& sQuestion);
    std::string DiagnoseOpcError(const ErrorInfo& currentError) const;
    std::string ObjectCreationText() const;
    std::string CommsFailureText() const;

    Platform& mPlatform;
    std::shared_ptr<Channel*> mpPresence = std::make_shared<Channel*>(this);

    int32_t miNumber = 0;
    double mdEngMin = 0;
    double mdEngMax = 100;
    double mdInstMin = 0;
    double mdInstMax = 100;
    std::string msDescription;
    std::string msEngUnits;
    int32_t miDecimalPlaces = 2;
    double mdDisplayMin = 0;
    double mdDisplayMax = 100;
    int32_t miLineStyle = 0;
    int32_t miLineWidth = 2;
    int32_t mlLineColor = 0x00FF00;
    bool mbDisplayOnGraph = true;
    int32_t miComType = ComTypeCode::Dde;
    int32_t miSpecificChannelType = 0;
    bool mbExpectANumber = true;
    double mdScaleFactor = 1;
    double mdScaleOffset = 0;
    bool mbNeedsScaling = false;
    bool mbScalePriorToOutput = false;
    std::string msErrorStr;
    bool mbServerShutDown = false;
    int32_t miState = OnlineState::Offline;
    int32_t miSendResult = 0;
    std::string msItemName;
    std::string msTopicName;
    int16_t miDisplayVarType = 0;
    std::string msDdeApplication;
    std::string msOpcComputer;
    std::string msOpcServerID;
    CvOpcAutoClient* mcOpcClient = nullptr;
    int32_t mlOpcServerHandle = 0;
    std::shared_ptr<platform::OPCItem> mcOpcItem;
    std::shared_ptr<platform::DdeLink> mcDdeLabel;
    Variant mvRawValue = Variant::Null();
    double mdTimeStamp = 0;
    int32_t mlQuality = 0;
    OpcSample mOpcSample;
    ErrorInfo mCommsError;
};

}  // namespace cv
