#include "components/widgets/dark_theme.h"
#include "components/widgets/fader.h"
#include "components/widgets/level_meter.h"
#include "components/widgets/lever_switch.h"
#include "components/widgets/piano_key.h"
#include "components/widgets/rotary_knob.h"
#include "widget_events.h"

#include <QStyle>

#include <gtest/gtest.h>

#include <memory>
#include <vector>

namespace {

// One of each control, set to a value that draws every part of it.
std::vector<std::unique_ptr<QWidget>> EveryControl() {
    std::vector<std::unique_ptr<QWidget>> controls;
    auto lever = std::make_unique<LeverSwitch>(4);
    lever->setPosition(2);
    controls.push_back(std::move(lever));
    auto knob = std::make_unique<RotaryKnob>();
    knob->setRange(-10000, 10000);
    knob->setValue(-4000);
    controls.push_back(std::move(knob));
    auto fader = std::make_unique<Fader>();
    fader->setValue(70);
    controls.push_back(std::move(fader));
    auto meter = std::make_unique<LevelMeter>();
    meter->setLevel(0.5f);
    controls.push_back(std::move(meter));
    auto key = std::make_unique<PianoKey>(61);
    key->setLabel("C#4");
    key->setMarked(true);
    controls.push_back(std::move(key));
    return controls;
}

// How far apart two images of the same size are: the mean difference of a channel, 0..255.
double MeanDifference(const QImage& a, const QImage& b) {
    double sum = 0;
    for (int y = 0; y < a.height(); ++y) {
        for (int x = 0; x < a.width(); ++x) {
            const QColor p = a.pixelColor(x, y);
            const QColor q = b.pixelColor(x, y);
            sum += std::abs(p.red() - q.red()) + std::abs(p.green() - q.green()) +
                   std::abs(p.blue() - q.blue());
        }
    }
    return sum / (3.0 * a.width() * a.height());
}

double Luminance(const QColor& colour) {
    const auto linear = [](double c) {
        return c <= 0.03928 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4);
    };
    return 0.2126 * linear(colour.redF()) + 0.7152 * linear(colour.greenF()) +
           0.0722 * linear(colour.blueF());
}

double Contrast(const QColor& a, const QColor& b) {
    const double la = Luminance(a);
    const double lb = Luminance(b);
    return (std::max(la, lb) + 0.05) / (std::min(la, lb) + 0.05);
}

}  // namespace

TEST(WidgetPaintingTest, EveryControlDrawsTheSamePictureAtOneAndTwoTimesScale) {
    for (const auto& control : EveryControl()) {
        const char* name = control->metaObject()->className();
        control->resize(control->sizeHint());
        const QImage single = Render(*control, 1);
        const QImage doubled = Render(*control, 2);
        ASSERT_EQ(doubled.size(), single.size() * 2) << name;

        // Something is drawn, not just the background.
        QImage empty(single.size(), single.format());
        empty.fill(control->palette().color(QPalette::Window));
        EXPECT_GT(MeanDifference(single, empty), 5) << name;
        // The sharper picture, scaled back, is the same picture: the drawing is in logical units.
        const QImage reduced =
            doubled.scaled(single.size(), Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
        EXPECT_LT(MeanDifference(single, reduced), 10) << name;
    }
}

TEST(WidgetPaintingTest, SizesGrowWithTheFontAndKeepTheirMinimums) {
    for (const auto& control : EveryControl()) {
        const char* name = control->metaObject()->className();
        const QSize normal = control->sizeHint();
        QFont large = control->font();
        large.setPointSizeF(large.pointSizeF() * 3);
        control->setFont(large);
        const QSize grown = control->sizeHint();
        EXPECT_GT(grown.height(), normal.height()) << name;
        EXPECT_GE(grown.width(), normal.width()) << name;

        QFont tiny = control->font();
        tiny.setPixelSize(4);
        control->setFont(tiny);
        const bool key = qobject_cast<PianoKey*>(control.get()) != nullptr;
        const bool meter = qobject_cast<LevelMeter*>(control.get()) != nullptr;
        const int minimumWidth = key ? 40 : meter ? 4 : 24;
        EXPECT_GE(control->sizeHint().width(), minimumWidth) << name;
        EXPECT_GE(control->minimumSizeHint().width(), minimumWidth) << name;
    }
}

TEST(DarkThemeTest, FusionWithReadableTextAndTwoDistinctAccents) {
    ApplyDarkTheme(*qApp);
    EXPECT_EQ(QApplication::style()->name().toLower(), "fusion");
    const QPalette palette = QApplication::palette();
    EXPECT_LT(Luminance(palette.color(QPalette::Window)), 0.05) << "dark";
    const std::pair<QPalette::ColorRole, QPalette::ColorRole> pairs[] = {
        {QPalette::WindowText, QPalette::Window},
        {QPalette::Text, QPalette::Base},
        {QPalette::ButtonText, QPalette::Button},
        {QPalette::ToolTipText, QPalette::ToolTipBase},
        {QPalette::HighlightedText, QPalette::Highlight}};
    for (const auto& [text, background] : pairs) {
        // WCAG's ratios: 7 for body text, 4.5 for the selection.
        const double needed = text == QPalette::HighlightedText ? 4.5 : 7;
        EXPECT_GE(Contrast(palette.color(text), palette.color(background)), needed) << text;
    }
    const QColor disabled = palette.color(QPalette::Disabled, QPalette::WindowText);
    const QColor window = palette.color(QPalette::Window);
    EXPECT_GE(Contrast(disabled, window), 2.5) << "still legible";
    EXPECT_LT(Contrast(disabled, window), Contrast(palette.color(QPalette::WindowText), window));

    EXPECT_GE(Contrast(MidiAccent(), window), 3);
    EXPECT_GE(Contrast(WaveAccent(), window), 3);
    const int hueApart = std::abs(MidiAccent().hue() - WaveAccent().hue());
    EXPECT_GE(std::min(hueApart, 360 - hueApart), 90);
}
