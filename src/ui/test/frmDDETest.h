#pragma once

#include <cstdint>

#include <QDialog>

#include "itemtest/ItemTest.h"

class QComboBox;
class QGroupBox;
class QLabel;
class QLineEdit;
class QPushButton;
class QToolButton;

namespace cv {

class Channel;
class TunFile;
class ctlProgress;
struct Platform;

// The item test window: shows an ItemTest (connecting, the wait, the value
// refreshed at the sample interval) and passes the user's actions to it.
// The test's timer runs on the platform's event loop.
class frmDDETest : public QDialog, private ItemTest::Listener {
    Q_OBJECT

  public:
    frmDDETest(Platform& platform, TunFile& cTunFile, Channel& cChannel, QWidget* parent = nullptr);
    ~frmDDETest() override;

    // Shows the window modally at (lLeft, lTop) in screen pixels, or centred
    // when both are 1. Answers whether the user changed the channel's
    // decimal places or colour or applied a mode string. bOption is not
    // used.
    static bool DoIt(Platform& platform, TunFile& cTunFile, Channel& cChannel, int32_t lTop,
                     int32_t lLeft, bool bOption, QWidget* parent = nullptr);

    ItemTest& Test() { return mTest; }

  protected:
    void closeEvent(QCloseEvent* event) override;
    bool eventFilter(QObject* watched, QEvent* event) override;

  private:
    void CreateControls();
    QGroupBox* CreateEngValueFrame();
    QGroupBox* CreateModeFrame();
    QWidget* CreateStatusRow();
    QWidget* CreateButtonRow();
    void ShowQuality();
    void DisplayChanged() override;
    void CloseRequested() override;
    void ShowModes();
    void lblEngValue_Click();
    bool txtDecimalPlaces_Validate();
    void cmdClose_Click();

    Platform& mPlatform;
    ItemTest mTest;
    int16_t miPointerShown = 0;
    std::string msPlacesShown;
    bool mbModesShown = false;
    // The decimal places box was left and its check has not run yet.
    bool mbCheckPending = false;

    QGroupBox* fraTestItem = nullptr;
    QLabel* lblDdeLabel = nullptr;
    QLabel* lblInstLabel = nullptr;
    QLabel* lblInstValue = nullptr;
    QLabel* lblTimeStampLabel = nullptr;
    QLabel* lblTimeStamp = nullptr;
    // The value's source time stamp, where the server sends one.
    QLabel* lblSourceTimeStampLabel = nullptr;
    QLabel* lblSourceTimeStamp = nullptr;
    QGroupBox* fraEngValue = nullptr;
    QLabel* lblEngLabel = nullptr;
    QLabel* lblEngValue = nullptr;
    QLabel* Label11 = nullptr;
    QLineEdit* txtDecimalPlaces = nullptr;
    QWidget* updDecimalPlaces = nullptr;
    QToolButton* updDecimalPlacesUp = nullptr;
    QToolButton* updDecimalPlacesDown = nullptr;
    QGroupBox* fraModeSelect = nullptr;
    QLabel* Label1 = nullptr;
    QComboBox* cmbAutoManual = nullptr;
    QLabel* Label2 = nullptr;
    QPushButton* cmdApply = nullptr;
    QLabel* lblTestResult = nullptr;
    // Beside the test result: the value's quality, and a mark while the
    // engineering value is outside the engineering range.
    QLabel* lblQuality = nullptr;
    QLabel* lblOutOfRange = nullptr;
    // Under the wait progress: what the server answered last.
    QLabel* lblServerAnswer = nullptr;
    // Which kind of server answered, once known.
    QLabel* lblBackend = nullptr;
    ctlProgress* mcProgress = nullptr;
    QPushButton* cmdClose = nullptr;
    QPushButton* cmdHelp = nullptr;
};

}  // namespace cv
