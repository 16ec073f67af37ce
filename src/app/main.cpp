#include "about/about_box.h"
#include "app/application.h"
#include "components/audio/devices/alsa_silence.h"
#include "components/widgets/dark_theme.h"

#include <QApplication>

int main(int argc, char** argv) {
    // Probing for a JACK server must never start one.
    qputenv("JACK_NO_START_SERVER", "1");
    SilenceAlsaLibErrors();
    QApplication app(argc, argv);
    QApplication::setApplicationName(QStringLiteral("Orvelle Quindara"));
    QApplication::setWindowIcon(AboutBox::ProgramIcon());
    ApplyDarkTheme(app);
    // The splash is up first; the program is built and made ready while it shows.
    std::unique_ptr<AboutBox> splash = Application::ShowSplash();
    Application program(Backends::Real());
    program.Start(std::move(splash));
    return QApplication::exec();
}
