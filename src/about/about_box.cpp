#include "about/about_box.h"

#include "about/program_icon.h"

#include <QFrame>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QTimer>
#include <QVBoxLayout>

namespace {

constexpr int kSplashMilliseconds = 3000;

const char* const kDescription[] = {
    "Virtual recording studio, sound mixer and simple editor.",
    "Designed for simplicity and ease of use.",
    "Up to 16 sounds (*.wav or *.mp3) can be loaded and played with various loop options.",
    "Basic MIDI functionality (In/Out) supports sounds and percussion of most soundcards",
    "Live recoding supports most common sample resolutions, stereo and mono mode.",
};

QFrame* Separator(QWidget* parent) {
    auto* line = new QFrame(parent);
    line->setObjectName(QStringLiteral("Line1"));
    line->setFrameShape(QFrame::HLine);
    line->setFrameShadow(QFrame::Sunken);
    return line;
}

QLabel* Label(const QString& text, const QString& name, QWidget* parent) {
    auto* label = new QLabel(text, parent);
    label->setObjectName(name);
    label->setTextFormat(Qt::PlainText);
    return label;
}

}  // namespace

AboutBox::AboutBox(Mode mode, QWidget* parent) : QDialog(parent), mode_(mode) {
    setObjectName(QStringLiteral("frmAbout"));
    setWindowTitle(QStringLiteral("About Orvelle Quindara..."));
    setWindowIcon(ProgramIcon());
    setModal(true);

    auto* picture = Label(QString(), QStringLiteral("picIcon"), this);
    const int side = 4 * fontMetrics().height();
    picture->setPixmap(ProgramIcon().pixmap(QSize(side, side), devicePixelRatioF()));
    picture->setAlignment(Qt::AlignTop | Qt::AlignHCenter);

    auto* title = Label(QStringLiteral("Orvelle Quindara"), QStringLiteral("lblTitle"), this);
    QFont titleFont = title->font();
    titleFont.setBold(true);
    titleFont.setPointSizeF(titleFont.pointSizeF() * 1.6);
    title->setFont(titleFont);

    auto* text = new QVBoxLayout;
    text->addWidget(title);
    text->addWidget(
        Label(QStringLiteral("Version 2.01. Rev.3."), QStringLiteral("lblVersion"), this));
    text->addWidget(Separator(this));
    int index = 0;
    for (const char* line : kDescription) {
        text->addWidget(Label(QString::fromLatin1(line),
                              QStringLiteral("lblDescription%1").arg(index++), this));
    }
    text->addWidget(Separator(this));
    const QString credits[] = {
        QStringLiteral("Made by the Orvelle Quindara developers."),
        QStringLiteral("Built with Qt %1.").arg(QString::fromLatin1(qVersion())),
        QStringLiteral("Questions and reports: the project's issue tracker."),
    };
    index = 0;
    for (const QString& line : credits) {
        text->addWidget(Label(line, QStringLiteral("lblCredit%1").arg(index++), this));
    }
    text->addWidget(Separator(this));

    auto* ok = new QPushButton(QStringLiteral("OK"), this);
    ok->setObjectName(QStringLiteral("cmdOK"));
    ok->setDefault(true);
    connect(ok, &QPushButton::clicked, this, &QDialog::accept);
    text->addWidget(ok, 0, Qt::AlignRight);

    auto* layout = new QHBoxLayout(this);
    layout->addWidget(picture, 0, Qt::AlignTop);
    layout->addLayout(text);
    layout->setSizeConstraint(QLayout::SetFixedSize);

    timerAbout_ = new QTimer(this);
    timerAbout_->setObjectName(QStringLiteral("timerAbout"));
    timerAbout_->setInterval(kSplashMilliseconds);
    timerAbout_->setSingleShot(true);
    connect(timerAbout_, &QTimer::timeout, this, &QDialog::accept);
    if (mode_ == Mode::Splash) timerAbout_->start();
}

void AboutBox::setSplashInterval(int milliseconds) {
    timerAbout_->setInterval(milliseconds);
}

int AboutBox::splashInterval() const {
    return timerAbout_->interval();
}

QIcon AboutBox::ProgramIcon() {
    return QIcon(new ProgramIconEngine);
}

void AboutBox::showEvent(QShowEvent* event) {
    QDialog::showEvent(event);
    // The splash counts its three seconds from when it is seen, not from when it was built.
    if (mode_ == Mode::Splash) timerAbout_->start();
}
