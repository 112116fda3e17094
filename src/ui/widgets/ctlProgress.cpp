#include "ui/widgets/ctlProgress.h"

#include <QGridLayout>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>

#include "itemtest/WaitProgress.h"

namespace cv {

ctlProgress::ctlProgress(WaitProgress& progress, QWidget* parent)
    : QFrame(parent), mProgress(progress) {
    setFrameShape(QFrame::StyledPanel);
    setObjectName(QStringLiteral("ctlProgress"));
    lblText = new QLabel(this);
    lblText->setObjectName(QStringLiteral("lblText"));
    lblText->setWordWrap(true);
    ProgressBar1 = new QProgressBar(this);
    ProgressBar1->setObjectName(QStringLiteral("ProgressBar1"));
    ProgressBar1->setRange(0, 100);
    ProgressBar1->setTextVisible(false);
    lblCompletion = new QLabel(this);
    lblCompletion->setObjectName(QStringLiteral("lblCompletion"));
    lblCompletion->setMinimumWidth(lblCompletion->fontMetrics().horizontalAdvance("100 %") + 4);
    lblCompletion->setAlignment(Qt::AlignRight | Qt::AlignVCenter);
    auto* grid = new QGridLayout(this);
    grid->addWidget(lblText, 0, 0, 1, 4);
    grid->addWidget(ProgressBar1, 1, 0, 1, 3);
    grid->addWidget(lblCompletion, 1, 3);
    for (int i = 0; i < 2; ++i) {
        auto* button = new QPushButton(this);
        button->setObjectName(QStringLiteral("cmdButton%1").arg(i + 1));
        button->setAutoDefault(false);
        // The wait buttons stay usable while the window around is busy.
        button->setProperty("Tag", QStringLiteral("Cancel"));
        connect(button, &QPushButton::clicked, this, [this, i] { mProgress.ButtonPressed(i + 1); });
        cmdButton[static_cast<size_t>(i)] = button;
        grid->addWidget(button, 2, i == 0 ? 0 : 2, 1, 2);
    }
    mProgress.SetOnChange([this] { Show(); });
    Show();
}

ctlProgress::~ctlProgress() {
    mProgress.SetOnChange({});
}

void ctlProgress::Show() {
    lblText->setText(QString::fromStdString(mProgress.Text()));
    ProgressBar1->setValue(mProgress.BarValue());
    lblCompletion->setText(QString::fromStdString(mProgress.CompletionText()));
    for (int i = 0; i < 2; ++i) {
        QPushButton* button = cmdButton[static_cast<size_t>(i)];
        button->setText(QString::fromStdString(mProgress.ButtonCaption(i + 1)));
        button->setVisible(mProgress.ButtonVisible(i + 1));
    }
    setVisible(mProgress.Visible());
}

}  // namespace cv
