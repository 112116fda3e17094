#include "ui/widgets/msgForm2.h"

#include <algorithm>
#include <cmath>

#include <QCheckBox>
#include <QGuiApplication>
#include <QLabel>
#include <QPushButton>
#include <QScreen>
#include <QScrollArea>

#include "platform/qt/QtDialogs.h"
#include "ui/widgets/FormUtility.h"
#include "ui/widgets/HelpTopics.h"

namespace cv {

namespace {

// The designed geometry, in twips.
struct Box {
    int left, top, width, height;
};
constexpr int kClientWidth = 4425;
constexpr int kClientHeight = 2730;
constexpr Box kLabel{228, 168, 3948, 192};
constexpr Box kButton1{240, 1920, 1092, 372};
constexpr Box kButton2{1560, 1920, 1212, 372};
constexpr Box kButton3{2988, 1920, 1212, 372};
constexpr Box kMoreHelp{4416, 1920, 1212, 372};
constexpr Box kCheck{240, 2400, 3972, 252};
constexpr int kGap = 200;

QString Text(const std::string& text) {
    return qtui::QtDialogs::DisplayText(text);
}

}  // namespace

msgForm2::msgForm2(Platform& platform, QWidget* parent) : QDialog(parent), mPlatform(platform) {
    setObjectName(QStringLiteral("msgForm2"));
    setWindowTitle(QStringLiteral("Message"));
    CreateControls();
}

int msgForm2::Px(int twips) const {
    return static_cast<int>(std::lround(twips * logicalDpiX() / 1440.0));
}

void msgForm2::CreateControls() {
    Label1 = new QLabel();
    Label1->setObjectName(QStringLiteral("Label1"));
    Label1->setWordWrap(true);
    Label1->setTextFormat(Qt::PlainText);
    Label1->setAlignment(Qt::AlignLeft | Qt::AlignTop);
    // A message taller than the screen scrolls instead of running under
    // the buttons.
    msgArea = new QScrollArea(this);
    msgArea->setFrameShape(QFrame::NoFrame);
    msgArea->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    msgArea->setWidget(Label1);
    const auto button = [this](const char* name, const char* caption, const Box& box) {
        auto* control = new QPushButton(QString::fromUtf8(caption), this);
        control->setObjectName(QLatin1String(name));
        control->setAutoDefault(false);
        control->setGeometry(Px(box.left), Px(box.top), Px(box.width), Px(box.height));
        return control;
    };
    cmdButton1 = button("cmdButton1", "Command1", kButton1);
    cmdButton2 = button("cmdButton2", "Command2", kButton2);
    cmdButton3 = button("cmdButton3", "Command3", kButton3);
    cmdMoreHelp = button("cmdMoreHelp", "More &Help", kMoreHelp);
    cmdButton1->setDefault(true);
    Check1 = new QCheckBox(QStringLiteral("Check1"), this);
    Check1->setObjectName(QStringLiteral("Check1"));
    Check1->setGeometry(Px(kCheck.left), Px(kCheck.top), Px(kCheck.width), Px(kCheck.height));
    Check1->hide();
    int32_t number = 1;
    for (QPushButton* control : {cmdButton1, cmdButton2, cmdButton3}) {
        connect(control, &QPushButton::clicked, this, [this, number] {
            mlAnswer += number;
            close();
        });
        ++number;
    }
    connect(Check1, &QCheckBox::clicked, this,
            [this](bool ticked) { mlAnswer += ticked ? 10 : -10; });
    connect(cmdMoreHelp, &QPushButton::clicked, this,
            [this] { ShowHelpTopic(mPlatform, mlHelpContext); });
    resize(Px(kClientWidth), Px(kClientHeight));
    PlaceLabel(kLabel.width);
}

void msgForm2::PlaceLabel(int widthTwips) {
    const int width = Px(widthTwips);
    Label1->setFixedWidth(width);
    const int height = std::max(Label1->heightForWidth(width), Px(kLabel.height));
    Label1->setFixedHeight(height);
    msgArea->setGeometry(Px(kLabel.left), Px(kLabel.top), width, height);
}

void msgForm2::CentreButton(QPushButton* button) {
    button->move(width() / 2 - button->width() / 2, button->y());
}

// Keeps the window on the screen: a window taller than the screen becomes
// as high as the screen with its button row (and the message's visible
// part) raised by the excess; a window reaching past the bottom moves up.
void msgForm2::FitScreen(int& height, int& buttonTop) {
    const QScreen* screen = this->screen() ? this->screen() : QGuiApplication::primaryScreen();
    const int screenHeight = screen != nullptr ? screen->availableGeometry().height() : height;
    (void)winId();  // the platform window knows the frame's size
    const int frame = frameGeometry().height() - geometry().height();
    if (screenHeight < height + frame) {
        const int excess = height + frame - screenHeight;
        buttonTop -= excess;
        height -= excess;
        msgArea->setFixedHeight(std::max(0, msgArea->height() - excess));
    }
    CenterForm(*this, 0);
    if (y() + height + frame >= screenHeight) {
        move(x(), std::max(0, screenHeight - height - frame));
    }
}

int32_t msgForm2::response(const std::string& FormTitle, const std::string& msg,
                           const std::string& Button1Caption,
                           std::optional<double> MoreHelpButtonContextID,
                           std::optional<std::string> Button2Caption,
                           std::optional<std::string> CheckBoxCaption,
                           const std::string& Button3Caption) {
    setWindowTitle(Text(FormTitle));
    Label1->setText(Text(msg));
    cmdButton1->setText(QString::fromStdString(Button1Caption));
    int count = 1;
    cmdMoreHelp->setVisible(MoreHelpButtonContextID.has_value());
    if (MoreHelpButtonContextID) {
        ++count;
        mlHelpContext = static_cast<int32_t>(std::floor(*MoreHelpButtonContextID));
    }
    cmdButton2->setVisible(Button2Caption.has_value());
    if (Button2Caption) {
        ++count;
        cmdButton2->setText(QString::fromStdString(*Button2Caption));
    } else {
        cmdMoreHelp->move(cmdButton2->x(), cmdMoreHelp->y());
    }
    cmdButton3->setVisible(!Button3Caption.empty());
    if (!Button3Caption.empty()) {
        ++count;
        cmdButton3->setText(QString::fromStdString(Button3Caption));
    } else {
        cmdMoreHelp->move(cmdButton3->x(), cmdMoreHelp->y());
    }
    int labelWidth = kLabel.width;
    if (count == 4) {
        resize(cmdMoreHelp->x() + cmdMoreHelp->width() + Px(kGap), height());
        labelWidth = kMoreHelp.width + kMoreHelp.left - kButton1.left + kGap;
    }
    PlaceLabel(labelWidth);
    if (count == 1) {
        CentreButton(cmdButton1);
    }
    int buttonTop = Label1->height() + Px(kLabel.top + kGap);
    int height = cmdButton1->height() + buttonTop + Px(100);
    if (CheckBoxCaption) {
        Check1->setText(QString::fromStdString(*CheckBoxCaption));
        Check1->show();
        height += Check1->height() + Px(kGap);
    }
    FitScreen(height, buttonTop);
    resize(width(), height);
    for (QPushButton* control : {cmdButton1, cmdButton2, cmdButton3, cmdMoreHelp}) {
        control->move(control->x(), buttonTop);
    }
    Check1->move(Check1->x(), buttonTop + cmdButton1->height() + Px(kGap));
    mlAnswer = 0;
    exec();
    return mlAnswer;
}

bool msgForm2::LaunchModeless(const std::string& sFormTitle, const std::string& sMsg,
                              const std::string& sButton1Caption) {
    setWindowTitle(Text(sFormTitle));
    Label1->setText(Text(sMsg));
    cmdButton1->setText(QString::fromStdString(sButton1Caption));
    for (QWidget* control :
         std::initializer_list<QWidget*>{cmdButton2, cmdButton3, cmdMoreHelp, Check1}) {
        control->hide();
    }
    PlaceLabel(kLabel.width);
    CentreButton(cmdButton1);
    const int buttonTop = Label1->height() + Px(kLabel.top + kGap);
    cmdButton1->move(cmdButton1->x(), buttonTop);
    resize(width(), cmdButton1->height() + buttonTop + Px(125));
    CenterForm(*this, 0);
    setModal(false);
    show();
    return isVisible();
}

}  // namespace cv
