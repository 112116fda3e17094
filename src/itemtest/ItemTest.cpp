#include "itemtest/ItemTest.h"

#include "channel/Channel.h"
#include "document/TunFile.h"
#include "opc/CvOpcAutoClient.h"
#include "platform/Platform.h"

namespace cv {

namespace {

constexpr int16_t kHourglass = 11;
constexpr const char* kWaitText = "Initializing communications.  Please wait...";
constexpr const char* kWaitKey = "Software\\Corvalent\\Faceplate";
constexpr const char* kWaitValue = "TimeOut";
constexpr const char* kLostText = "The item is no longer being read from the server.";

bool IsOpc(int32_t lComType) {
    return lComType == ComTypeCode::Opc || lComType == ComTypeCode::OpcHda;
}

}  // namespace

ItemTest::ItemTest(Platform& platform, TunFile& cTunFile, Channel& cChannel, Listener& listener)
    : mPlatform(platform),
      mcTunFile(cTunFile),
      mcChannel(cChannel),
      mListener(listener),
      mProgress(platform) {}

ItemTest::~ItemTest() {
    mPlatform.events.StopTimer(mlTimer);
}

void ItemTest::Start() {
    mDisplay.caption = "Trying to connect...";
    // A value from an earlier test of the channel is none of this one's.
    mlSampleShown = mcChannel.LastOpcSample().number;
    miState = 0;
    mbInTimer = false;
    StartTimer(kConnectTickMs);
    Notify();
}

void ItemTest::StartTimer(uint32_t lIntervalMs) {
    mPlatform.events.StopTimer(mlTimer);
    mlIntervalMs = lIntervalMs;
    mlTimer = mPlatform.events.StartTimer(lIntervalMs, true, [this] { Tick(); });
}

void ItemTest::Tick() {
    if (mbInTimer || mbUnloaded) {
        return;
    }
    mbInTimer = true;
    for (;;) {
        const int16_t iBefore = miState;
        RunStep();
        // Closed by a failure, or by the user while a step waited.
        if (mbUnloaded) {
            return;
        }
        if (miState == iBefore) {
            break;
        }
    }
    mbInTimer = false;
}

void ItemTest::RunStep() {
    switch (miState) {
        case 0:
            miState = 1;
            break;
        case 1:
            Prepare();
            break;
        case 2:
            Create();
            break;
        case 3:
            RetryCreate();
            break;
        case 4:
            GoOnline();
            break;
        case 5:
            FirstValue();
            break;
        default:
            Refresh();
            break;
    }
}

void ItemTest::Prepare() {
    SetBusy(kHourglass);
    mDisplay.instValue = "?";
    mDisplay.caption = "Testing Item: " + mcChannel.Description();
    const int32_t lComType = mcChannel.ComType();
    if (IsOpc(lComType)) {
        mDisplay.frameCaption = std::string("OPC ") +
                                (lComType == ComTypeCode::OpcHda ? "HDA " : "") +
                                "Item name: " + mcChannel.ItemName();
        miState = 2;
        Notify();
        return;
    }
    if (lComType == ComTypeCode::Dde) {
        mDisplay.frameCaption = "DDE Item name: " + mcChannel.ItemName();
        mcDdeLabel = mPlatform.dde.CreateDdeLink();
        mcChannel.SetDdeLabel(mcDdeLabel);
    }
    Notify();
    int32_t lButtons = MsgBoxStyle::Exclamation;
    std::string sText;
    if (!mcChannel.GoOnline(mcTunFile, lButtons, sText, false)) {
        Close();
        return;
    }
    miState = 5;
}

void ItemTest::Create() {
    mProgress.Initialise(kWaitText, true, kWaitKey, kWaitValue);
    if (mlWaitOverride) {
        mProgress.OverrideWaitTime(*mlWaitOverride);
    }
    int32_t lButtons = MsgBoxStyle::Exclamation;
    std::string sText;
    const bool bCreated = mcChannel.CreateCommsObjects(mcTunFile, lButtons, sText, true);
    if (mbUnloaded) {
        return;  // closed while the client connected
    }
    NoteBackend();
    if (bCreated) {
        miState = 4;
        return;
    }
    AnswerOrEnd();
    if (mbUnloaded) {
        return;
    }
    mProgress.ReInitialize();
    (void)mProgress.TimeUp();  // draws the bar
    mProgress.SetVisible(true);
    miState = 3;
}

void ItemTest::RetryCreate() {
    const bool bTimeUp = mProgress.TimeUp();
    int32_t lButtons = MsgBoxStyle::Exclamation;
    std::string sText;
    // Silent until the wait is up: the last attempt shows its diagnosis.
    const bool bCreated = mcChannel.CreateCommsObjects(mcTunFile, lButtons, sText, !bTimeUp);
    NoteBackend();
    if (bCreated) {
        mProgress.SetVisible(false);
        ShowServerAnswer("");
        miState = 4;
    } else if (bTimeUp && !mbUnloaded) {
        Close();
    } else if (!mbUnloaded) {
        AnswerOrEnd();
    }
}

void ItemTest::GoOnline() {
    int32_t lButtons = MsgBoxStyle::Exclamation;
    std::string sText;
    if (!mcChannel.GoOnline(mcTunFile, lButtons, sText, false)) {
        Close();
        return;
    }
    if (mcChannel.ComType() == ComTypeCode::Opc) {
        mcTunFile.OpcAutoGoOnline(mcTunFile.General().SIinMSec());
    }
    mProgress.ReInitialize();
    SetBusy(0);
    miState = 5;
}

void ItemTest::FirstValue() {
    switch (mcChannel.Online(mProgress.TimeUp())) {
        case OnlineState::GoingOnline:
            mProgress.SetVisible(true);
            if (NoteRefusedValue()) {
                ShowServerAnswer(mDisplay.quality);
            }
            break;
        case OnlineState::Online:
            SetBusy(0);
            mProgress.SetVisible(false);
            ShowServerAnswer("");
            miState = 6;
            LayOutValueDisplay();
            break;
        default:
            SetBusy(0);
            (void)NoteRefusedValue();
            if (!mbUnloaded) {
                ShowReadError("Error trying to read ", MsgBoxStyle::Exclamation);
                Close();
            }
            break;
    }
}

void ItemTest::Refresh() {
    if (!mcTunFile.General().UseHotLinks()) {
        // A failed read is told by the channel's state and error text below.
        (void)mcChannel.SingleShotRead(mcTunFile, true);
    }
    if (mbUnloaded) {
        return;
    }
    if (mcChannel.Online(false) != OnlineState::Online) {
        (void)NoteRefusedValue();
        if (!mbUnloaded) {
            ShowReadError("Error reading ", MsgBoxStyle::Critical);
            Close();
        }
        return;
    }
    if (mcChannel.IsOnline()) {
        ShowValues();
    }
}

void ItemTest::ShowReadError(const std::string& sPrefix, int32_t lIcon) {
    // The server's shutdown was told by the OPC client already.
    if (mcChannel.ServerShutDown()) {
        return;
    }
    int32_t lButtons = 0;
    std::string sQuestion;
    std::string sError = mcChannel.ErrorStr();
    // Without a stored reason (the server shut down, the item went away)
    // there is no error to describe: say what the user sees.
    if (sError.empty()) {
        sError = kLostText;
    }
    const std::string sText = mcChannel.GetErrorString(sError, lButtons, sQuestion, ErrorInfo{});
    (void)mPlatform.dialogs.MsgBox(sText, lButtons + lIcon, sPrefix + mcChannel.Description());
}

// The client of the channel's server exists once connected, even when the
// server refused the item.
void ItemTest::NoteBackend() {
    if (!mDisplay.backend.empty()) {
        return;
    }
    if (const CvOpcAutoClient* cClient = ServingClient()) {
        mDisplay.backend = cClient->BackendName();
        Notify();
    }
}

// Also after the channel let go of it (a bad value took it offline).
CvOpcAutoClient* ItemTest::ServingClient() const {
    for (const std::shared_ptr<CvOpcAutoClient>& cClient : mcTunFile.OpcClients()) {
        if (cClient->ServerID() == mcChannel.OpcServerID() &&
            cClient->ServerNode() == mcChannel.OpcComputer()) {
            return cClient.get();
        }
    }
    return nullptr;
}

void ItemTest::SetBusy(int16_t iPointer) {
    mDisplay.mousePointer = iPointer;
    Notify();
}

void ItemTest::Close() {
    mbClosed = true;
    Unload();
    mListener.CloseRequested();
}

void ItemTest::Unload() {
    if (mbUnloaded) {
        return;
    }
    mbUnloaded = true;
    mPlatform.events.StopTimer(mlTimer);
    mlTimer = 0;
    SetBusy(0);
    mcChannel.GoOffline();
    mcChannel.ClearCommunicationsObject();
    mcTunFile.OpcAutoGoOffline();
}

}  // namespace cv
