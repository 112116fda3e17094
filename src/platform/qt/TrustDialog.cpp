#include "platform/qt/TrustDialog.h"

#include <QApplication>
#include <QFormLayout>
#include <QLabel>
#include <QPushButton>
#include <QVBoxLayout>

namespace cv::qtui {

namespace {

QString Text(const std::string& text) {
    return QString::fromStdString(text);
}

QLabel* Fact(const char* name, const QString& text) {
    auto* label = new QLabel(text);
    label->setObjectName(name);
    // Certificate fields come from the server: never rich text.
    label->setTextFormat(Qt::PlainText);
    label->setTextInteractionFlags(Qt::TextSelectableByMouse);
    return label;
}

QString HostText(const platform::CertificateFacts& facts) {
    return facts.hostMatches ? "Yes: it names " + Text(facts.host)
                             : "No: it does not name " + Text(facts.host);
}

}  // namespace

TrustDialog::TrustDialog(const platform::TrustQuestion& question, QWidget* parent)
    : QDialog(parent) {
    setObjectName("dlgTrust");
    setWindowTitle("Server Certificate");
    setModal(true);
    const platform::CertificateFacts& facts = question.facts;
    auto* form = new QFormLayout;
    form->addRow("Server:", Fact("lblEndpoint", Text(question.endpointUrl)));
    form->addRow("Subject:", Fact("lblSubject", Text(facts.subject)));
    form->addRow("Application URI:", Fact("lblApplicationUri", Text(facts.applicationUri)));
    form->addRow("Thumbprint:", Fact("lblThumbprint", Text(facts.thumbprint)));
    form->addRow("Valid:", Fact("lblValidity", Text(facts.validFrom + " to " + facts.validTo)));
    form->addRow("Host name matches:", Fact("lblHost", HostText(facts)));
    auto* diagnosis = Fact("lblDiagnosis", Text(question.diagnosis));
    diagnosis->setWordWrap(true);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(form);
    layout->addWidget(diagnosis);
    auto* buttons = new QHBoxLayout;
    buttons->addStretch();
    buttons->addWidget(AddButton("cmdRefuse", "Refuse", platform::TrustAnswer::Refuse));
    buttons->addWidget(AddButton("cmdTrustSession", "Trust for this session",
                                 platform::TrustAnswer::TrustForSession));
    buttons->addWidget(
        AddButton("cmdTrustAlways", "Trust always", platform::TrustAnswer::TrustAlways));
    layout->addLayout(buttons);
    findChild<QPushButton*>("cmdRefuse")->setDefault(true);
}

QPushButton* TrustDialog::AddButton(const char* name, const QString& text,
                                    platform::TrustAnswer answer) {
    auto* button = new QPushButton(text);
    button->setObjectName(name);
    button->setAutoDefault(false);
    connect(button, &QPushButton::clicked, this, [this, answer] {
        answer_ = answer;
        accept();
    });
    return button;
}

platform::TrustAnswer QtCertificateTrust::Ask(const platform::TrustQuestion& question) {
    TrustDialog dialog(question, QApplication::activeWindow());
    dialog.exec();
    return dialog.Answer();
}

}  // namespace cv::qtui
