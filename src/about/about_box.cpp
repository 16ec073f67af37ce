#include "about/about_box.h"

#include "about/program_icon.h"

#include <QEventLoop>
#include <QFrame>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QTimer>
#include <QVBoxLayout>

#include <algorithm>

namespace {

// A platform that never draws the splash must not hold start-up up for longer than this.
constexpr int kLongestWaitForFirstPaint = 1000;

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
    timerAbout_->setSingleShot(true);
    timerAbout_->setTimerType(Qt::PreciseTimer);  // a coarse one may add 5 % to the wait
    connect(timerAbout_, &QTimer::timeout, this, &QDialog::accept);
}

void AboutBox::ShowSplash() {
    show();
    if (!painted_) {  // some platforms draw a window as it is shown
        QEventLoop untilPainted;
        connect(this, &AboutBox::painted, &untilPainted, &QEventLoop::quit);
        connect(this, &QDialog::finished, &untilPainted, &QEventLoop::quit);
        QTimer::singleShot(kLongestWaitForFirstPaint, &untilPainted, &QEventLoop::quit);
        untilPainted.exec();
    }
    // Its time to be read counts from when it is seen, not from when it was built.
    shownFor_.start();
}

void AboutBox::CloseSplashWhenReady(int minimumMilliseconds) {
    if (!isVisible()) return;  // a key or a click while it was being drawn
    QEventLoop untilClosed;
    connect(this, &QDialog::finished, &untilClosed, &QEventLoop::quit);
    // Keys and clicks that came while the program was busy are handled in this loop first.
    timerAbout_->start(
        static_cast<int>(std::max<qint64>(0, minimumMilliseconds - shownFor_.elapsed())));
    untilClosed.exec();
}

QIcon AboutBox::ProgramIcon() {
    return QIcon(new ProgramIconEngine);
}

void AboutBox::paintEvent(QPaintEvent* event) {
    QDialog::paintEvent(event);
    painted_ = true;
    emit painted();
}

void AboutBox::keyPressEvent(QKeyEvent* event) {
    if (mode_ == Mode::Splash) {
        accept();
        return;
    }
    QDialog::keyPressEvent(event);
}

void AboutBox::mousePressEvent(QMouseEvent* event) {
    if (mode_ == Mode::Splash) {
        accept();
        return;
    }
    QDialog::mousePressEvent(event);
}
