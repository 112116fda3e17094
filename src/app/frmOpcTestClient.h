#pragma once

#include <deque>
#include <string>

#include <QList>
#include <QPointer>
#include <QWidget>

#include "channel/Channel.h"
#include "document/TunFile.h"

class QCheckBox;
class QCloseEvent;
class QGroupBox;
class QLabel;
class QLineEdit;
class QPushButton;

namespace cv {

struct Platform;

// The main window: names one OPC item (server, access path, item ID), its
// scaling ranges and the sample interval, and starts the test read. Each
// field is checked and written through to the channel or the document's
// general settings when the focus leaves it for another control.
namespace security {
class ServerSettings;
}

class frmOpcTestClient : public QWidget {
    Q_OBJECT

  public:
    explicit frmOpcTestClient(Platform& platform, QWidget* parent = nullptr);

    TunFile& Document() { return mcTunFile; }
    // The channel under test: the document's SP channel.
    Channel& TestChannel() { return *mcChannel; }
    // Adds a small "Security..." button beside the server box that opens the
    // OPC UA security choices of the endpoint URL in it. Without this call the
    // window has no such button.
    void OfferServerSecurity(security::ServerSettings& settings);

  protected:
    bool eventFilter(QObject* watched, QEvent* event) override;
    void changeEvent(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;

  private:
    // Building and loading (frmOpcTestClient.cpp).
    void CreateControls();
    QGroupBox* CreateAddressFrame();
    QGroupBox* CreateScalingFrame();
    QWidget* CreateSampleIntervalRow();
    QWidget* CreateButtonRow();
    void SetTabOrder();
    void WatchFields();
    void Load();
    void FillFields();
    void chkUseScaling_Click();
    void cmdBrowseServers_Click();
    void cmdBrowseItems_Click();
    void cmdTest_Click();
    void cmdHelp_Click();
    void cmdClose_Click();
    void cmdServerSecurity_Click();
    // Says which backend a test read of the server in the box will use.
    void ShowBackend();

    // Field checks (frmOpcTestClient_validate.cpp).
    void QueueValidation(QWidget* field);
    bool RunPendingValidations();
    // Before the channel or the settings are used: every field typed in and
    // not yet passed is checked too, the refused one first.
    bool ChecksPassed();
    void KeepFocusInRefusedField();
    bool Validate(QWidget* field);
    bool ValidateRangeBox(QLineEdit& box, const std::string& sSpanName, RangeType eRange,
                          bool bIsMax, double dOtherLimit);
    bool CheckMinMax(double dMin, double dMax, const std::string& sSpanName);
    bool ValidateSI();
    bool FitsRemembered(const std::string& sText);
    std::string RangeText(double dValue) const;

    // The remembered values (frmOpcTestClient_settings.cpp).
    void ReadRememberedValues();
    void ApplyRememberedRange(RangeType eRange, double dMin, double dMax);
    void WriteRememberedValues();

    // The document's general settings: the scaling switch and the sample interval.
    TunFileGeneral& General() { return mcTunFile.General(); }

    Platform& mPlatform;
    // The document lives as long as the window; closing the main window ends
    // the program, and with it the document.
    TunFile mcTunFile;
    Channel* mcChannel = nullptr;
    // Fields whose checks wait to run, oldest first; while a check shows a
    // message, no other check starts.
    std::deque<QPointer<QWidget>> mPendingValidations;
    bool mbValidating = false;
    // Fields typed in (or rewritten by a refusal) whose text has not passed
    // its check since, and the field refused last: it keeps the focus until
    // it passes.
    QList<QWidget*> mEditedFields;
    QPointer<QWidget> mRefusedField;

    QGroupBox* Frame1 = nullptr;
    QLabel* Label1 = nullptr;
    QLineEdit* txtServerID = nullptr;
    QPushButton* cmdBrowseServers = nullptr;
    QPushButton* cmdServerSecurity = nullptr;
    QLabel* lblBackend = nullptr;
    security::ServerSettings* mServerSettings = nullptr;
    QLabel* Label2 = nullptr;
    QLineEdit* txtAccessPath = nullptr;
    QLabel* Label3 = nullptr;
    QLineEdit* txtItemID = nullptr;
    QPushButton* cmdBrowseItems = nullptr;
    QPushButton* cmdTest = nullptr;
    QGroupBox* fraScaling = nullptr;
    QLabel* Label8 = nullptr;
    QCheckBox* chkUseScaling = nullptr;
    QGroupBox* fraScalingValues = nullptr;
    QLabel* Label5 = nullptr;
    QLabel* Label4 = nullptr;
    QLabel* Label6 = nullptr;
    QLineEdit* txtEngMin = nullptr;
    QLineEdit* txtEngMax = nullptr;
    QLabel* Label7 = nullptr;
    QLineEdit* txtInstMin = nullptr;
    QLineEdit* txtInstMax = nullptr;
    QLabel* Label9 = nullptr;
    QLineEdit* txtSI = nullptr;
    QLabel* Label10 = nullptr;
    QPushButton* cmdHelp = nullptr;
    QPushButton* cmdClose = nullptr;
    QLabel* lblVersion = nullptr;
    QLabel* lblCopyright = nullptr;
};

}  // namespace cv
