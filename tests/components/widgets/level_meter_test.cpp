#include "components/widgets/level_meter.h"
#include "widget_events.h"

#include <gtest/gtest.h>

#include <cmath>

namespace {

using namespace std::chrono_literals;
using Clock = LevelMeter::Clock;

float FromDb(float db) {
    return std::pow(10.0f, db / 20);
}

float ToDb(float linear) {
    return 20 * std::log10(linear);
}

// The colour in the middle of a segment as drawn.
QColor SegmentColour(LevelMeter& meter, int segment) {
    return Render(meter).pixelColor(meter.segmentRect(segment).center().toPoint());
}

bool Lit(const QColor& colour) {
    return colour.value() > 200;
}

}  // namespace

TEST(LevelMeterTest, SegmentsLightUpToTheLevelInGreenYellowAndRed) {
    LevelMeter meter;
    meter.resize(10, 200);
    meter.setLevel(1.0f);
    ASSERT_EQ(LevelMeter::SegmentCount(), 16);
    for (int segment = 0; segment < LevelMeter::SegmentCount(); ++segment) {
        const QColor colour = SegmentColour(meter, segment);
        const float floorDb = LevelMeter::SegmentFloorDb(segment);
        EXPECT_TRUE(Lit(colour)) << segment;
        EXPECT_LT(colour.blue(), 120) << segment;
        if (floorDb < -12) {
            EXPECT_GT(colour.green(), colour.red() + 80) << "green at " << floorDb << " dB";
        } else if (floorDb < -3) {
            EXPECT_GT(colour.red(), 200) << "yellow at " << floorDb << " dB";
            EXPECT_GT(colour.green(), 180) << "yellow at " << floorDb << " dB";
        } else {
            EXPECT_GT(colour.red(), colour.green() + 120) << "red at " << floorDb << " dB";
        }
    }

    // Half a segment above -12 dB: the first yellow segment lights, the ones above it stay dark.
    LevelMeter quieter;
    quieter.resize(10, 200);
    quieter.setLevel(FromDb(-10.5f));
    for (int segment = 0; segment < LevelMeter::SegmentCount(); ++segment) {
        EXPECT_EQ(Lit(SegmentColour(quieter, segment)), LevelMeter::SegmentFloorDb(segment) <= -12)
            << segment;
    }

    quieter.setLevel(1.5f);
    EXPECT_EQ(quieter.level(), 1.0f) << "clipping shows as full scale";
    quieter.setLevel(-0.5f);
    EXPECT_EQ(quieter.level(), 0.0f);
    quieter.setLevel(std::nanf(""));
    EXPECT_EQ(quieter.level(), 0.0f);
}

TEST(LevelMeterTest, PeakMarkerFallsTheWholeScaleInOneAndAHalfSeconds) {
    LevelMeter meter;
    meter.resize(10, 200);
    const Clock::time_point start{};
    meter.setLevel(1.0f, start);
    EXPECT_FLOAT_EQ(meter.peakHold(), 1.0f);

    // Half the time, half the 48 dB scale: the peak stands at -24 dB and its segment is lit.
    meter.setLevel(0.0f, start + 750ms);
    EXPECT_NEAR(ToDb(meter.peakHold()), -24, 0.1);
    EXPECT_TRUE(Lit(SegmentColour(meter, 8)));
    EXPECT_FALSE(Lit(SegmentColour(meter, 9)));
    EXPECT_FALSE(Lit(SegmentColour(meter, 7)));

    meter.setLevel(0.5f, start + 800ms);
    EXPECT_FLOAT_EQ(meter.peakHold(), 0.5f) << "a louder level lifts the marker at once";
    meter.setLevel(0.0f, start + 800ms + 1125ms);
    EXPECT_NEAR(ToDb(meter.peakHold()), -6 - 36, 0.1);
    meter.setLevel(0.0f, start + 800ms + 1500ms);
    EXPECT_EQ(meter.peakHold(), 0.0f) << "fallen below the floor";

    // The fall depends on the time that passed, not on how often the window calls.
    LevelMeter often;
    LevelMeter seldom;
    often.setLevel(1.0f, start);
    seldom.setLevel(1.0f, start);
    for (auto t = 16ms; t <= 608ms; t += 16ms) often.setLevel(0.01f, start + t);
    seldom.setLevel(0.01f, start + 608ms);
    EXPECT_NEAR(ToDb(often.peakHold()), ToDb(seldom.peakHold()), 0.01);
    EXPECT_NEAR(ToDb(seldom.peakHold()), -48 * 0.608 / 1.5, 0.1);
}
