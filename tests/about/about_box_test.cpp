#include "about/about_box.h"

#include <QLabel>
#include <QPushButton>
#include <QSignalSpy>
#include <QTest>
#include <QTimer>

#include <gtest/gtest.h>

namespace {

QString Text(const AboutBox& box, const QString& name) {
    const auto* label = box.findChild<QLabel*>(name);
    return label != nullptr ? label->text() : QStringLiteral("<no %1>").arg(name);
}

QTimer* SplashTimer(const AboutBox& box) {
    return box.findChild<QTimer*>("timerAbout");
}

}  // namespace

TEST(AboutBoxTest, ShowsNameVersionAndDescription) {
    AboutBox box(AboutBox::Mode::About);
    EXPECT_EQ(box.objectName(), "frmAbout");
    EXPECT_EQ(box.windowTitle(), "About Orvelle Quindara...");
    EXPECT_EQ(Text(box, "lblTitle"), "Orvelle Quindara");
    EXPECT_TRUE(box.findChild<QLabel*>("lblTitle")->font().bold());
    EXPECT_EQ(Text(box, "lblVersion"), "Version 2.01. Rev.3.");
    const QStringList description = {
        "Virtual recording studio, sound mixer and simple editor.",
        "Designed for simplicity and ease of use.",
        "Up to 16 sounds (*.wav or *.mp3) can be loaded and played with various loop options.",
        "Basic MIDI functionality (In/Out) supports sounds and percussion of most soundcards",
        "Live recoding supports most common sample resolutions, stereo and mono mode."};
    for (int i = 0; i < description.size(); ++i) {
        EXPECT_EQ(Text(box, QStringLiteral("lblDescription%1").arg(i)), description[i]);
    }
    const auto* picture = box.findChild<QLabel*>("picIcon");
    ASSERT_NE(picture, nullptr);
    EXPECT_FALSE(picture->pixmap().isNull());
    const auto* ok = box.findChild<QPushButton*>("cmdOK");
    ASSERT_NE(ok, nullptr);
    EXPECT_EQ(ok->text(), "OK");
    EXPECT_TRUE(ok->isDefault());
}

TEST(AboutBoxTest, OkEnterAndEscapeCloseIt) {
    AboutBox clicked(AboutBox::Mode::About);
    clicked.show();
    QTest::mouseClick(clicked.findChild<QPushButton*>("cmdOK"), Qt::LeftButton);
    EXPECT_FALSE(clicked.isVisible());
    EXPECT_EQ(clicked.result(), QDialog::Accepted);

    for (int key : {Qt::Key_Return, Qt::Key_Escape}) {
        AboutBox box(AboutBox::Mode::About);
        box.show();
        QTest::keyClick(&box, static_cast<Qt::Key>(key));
        EXPECT_FALSE(box.isVisible()) << key;
    }

    // OK ends the splash at once, as at start-up when the user does not wait.
    AboutBox splash(AboutBox::Mode::Splash);
    QTimer::singleShot(0, &splash, [&splash] {
        QTest::mouseClick(splash.findChild<QPushButton*>("cmdOK"), Qt::LeftButton);
    });
    EXPECT_EQ(splash.exec(), QDialog::Accepted);
}

TEST(AboutBoxTest, SplashClosesItselfAndTheHelpMenusBoxWaits) {
    AboutBox splash(AboutBox::Mode::Splash);
    QTimer* timer = SplashTimer(splash);
    ASSERT_NE(timer, nullptr);
    EXPECT_EQ(timer->interval(), 3000);
    EXPECT_EQ(splash.splashInterval(), 3000);
    EXPECT_TRUE(timer->isSingleShot());
    EXPECT_TRUE(timer->isActive());
    splash.setSplashInterval(50);
    // Start-up waits in exec(); the box must end that wait by itself.
    QTimer failsafe;
    failsafe.setSingleShot(true);
    QObject::connect(&failsafe, &QTimer::timeout, &splash, &QDialog::reject);
    failsafe.start(5000);
    EXPECT_EQ(splash.exec(), QDialog::Accepted) << "closed by the failsafe, not by itself";
    EXPECT_FALSE(splash.isVisible());

    AboutBox about(AboutBox::Mode::About);
    about.setSplashInterval(50);  // were the timer running, the box would close in the wait
    about.show();
    EXPECT_FALSE(SplashTimer(about)->isActive());
    QTest::qWait(200);
    EXPECT_TRUE(about.isVisible());
}

TEST(AboutBoxTest, ProgramIconIsDrawnAtAnySize) {
    const QIcon icon = AboutBox::ProgramIcon();
    for (int side : {16, 48, 256}) {
        const QImage image = icon.pixmap(QSize(side, side)).toImage();
        ASSERT_EQ(image.size(), QSize(side, side));
        EXPECT_LT(qAlpha(image.pixel(0, 0)), 32) << "rounded corners at " << side;
        EXPECT_EQ(qAlpha(image.pixel(side / 2, side / 2)), 255) << side;
    }
    const QPixmap sharp = icon.pixmap(QSize(32, 32), 2.0);
    EXPECT_EQ(sharp.size(), QSize(64, 64));
    EXPECT_EQ(sharp.deviceIndependentSize(), QSizeF(32, 32));
}
