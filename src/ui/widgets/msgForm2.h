#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include <QDialog>

class QCheckBox;
class QLabel;
class QPushButton;
class QScrollArea;

namespace cv {

struct Platform;

// A message window with up to three buttons of free captions, an optional
// "More Help" button that opens a help topic, and an optional check box
// whose state is folded into the answer. It sizes itself to the message.
// Geometry is designed in twips and shown in pixels at the screen's
// resolution.
class msgForm2 : public QDialog {
    Q_OBJECT

  public:
    explicit msgForm2(Platform& platform, QWidget* parent = nullptr);

    // Shows the window modally. Answers the button pressed (1, 2, 3), plus
    // 10 when the box is ticked; 0 or 10 when closed without a button. A
    // Button3Caption that is empty means no third button.
    int32_t response(const std::string& FormTitle, const std::string& msg,
                     const std::string& Button1Caption,
                     std::optional<double> MoreHelpButtonContextID = std::nullopt,
                     std::optional<std::string> Button2Caption = std::nullopt,
                     std::optional<std::string> CheckBoxCaption = std::nullopt,
                     const std::string& Button3Caption = "");
    // Shows the window with one button, without waiting; true when shown.
    bool LaunchModeless(const std::string& sFormTitle, const std::string& sMsg,
                        const std::string& sButton1Caption);

    int32_t Answer() const { return mlAnswer; }

  private:
    void CreateControls();
    int Px(int twips) const;
    void PlaceLabel(int widthTwips);
    void CentreButton(QPushButton* button);
    void FitScreen(int& height, int& buttonTop);

    Platform& mPlatform;
    int32_t mlHelpContext = 0;
    int32_t mlAnswer = 0;

    QScrollArea* msgArea = nullptr;
    QLabel* Label1 = nullptr;
    QPushButton* cmdButton1 = nullptr;
    QPushButton* cmdButton2 = nullptr;
    QPushButton* cmdButton3 = nullptr;
    QPushButton* cmdMoreHelp = nullptr;
    QCheckBox* Check1 = nullptr;
};

}  // namespace cv
