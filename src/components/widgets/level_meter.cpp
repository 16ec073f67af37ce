#include "components/widgets/level_meter.h"

#include "components/widgets/control_painting.h"

#include <QPainter>

#include <algorithm>
#include <cmath>

namespace {

constexpr float kSilenceDb = -200;  // below anything the meter shows

float ToDb(float linear) {
    return linear > 0 ? 20 * std::log10(linear) : kSilenceDb;
}

QColor ZoneColour(float floorDb) {
    if (floorDb >= LevelMeter::kRedDb) return QColor(0xff, 0x3b, 0x30);
    if (floorDb >= LevelMeter::kYellowDb) return QColor(0xff, 0xd6, 0x0a);
    return QColor(0x30, 0xd1, 0x58);
}

}  // namespace

LevelMeter::LevelMeter(QWidget* parent) : QWidget(parent), peakDb_(kSilenceDb) {
    setAccessibleName(QStringLiteral("Level meter"));
}

void LevelMeter::setLevel(float linear) {
    setLevel(linear, Clock::now());
}

void LevelMeter::setLevel(float linear, Clock::time_point now) {
    level_ = std::isnan(linear) ? 0.0f : std::clamp(linear, 0.0f, 1.0f);
    if (updated_ && now > lastUpdate_) {
        const double seconds = std::chrono::duration<double>(now - lastUpdate_).count();
        const double fallPerSecond = -kFloorDb / kPeakFallSeconds;
        peakDb_ =
            static_cast<float>(std::max<double>(kSilenceDb, peakDb_ - seconds * fallPerSecond));
    }
    peakDb_ = std::max(peakDb_, ToDb(level_));
    lastUpdate_ = now;
    updated_ = true;
    update();
}

float LevelMeter::peakHold() const {
    return peakDb_ < kFloorDb ? 0.0f : std::pow(10.0f, peakDb_ / 20);
}

int LevelMeter::SegmentCount() {
    return static_cast<int>(-kFloorDb / kSegmentDb);
}

float LevelMeter::SegmentFloorDb(int segment) {
    return kFloorDb + segment * kSegmentDb;
}

QRectF LevelMeter::segmentRect(int segment) const {
    const double gap = std::max(1.0, FontUnit(*this) / 16);
    const int count = SegmentCount();
    const double pitch = (height() + gap) / count;
    const double top = height() - (segment + 1) * pitch + gap;
    return {0, top, static_cast<double>(width()), pitch - gap};
}

QSize LevelMeter::sizeHint() const {
    const double unit = FontUnit(*this);
    return {std::max(6, qRound(0.5 * unit)), qRound(8 * unit)};
}

QSize LevelMeter::minimumSizeHint() const {
    return {4, SegmentCount() * 2};
}

void LevelMeter::paintEvent(QPaintEvent*) {
    QPainter painter(this);
    painter.fillRect(rect(), palette().color(QPalette::Window).darker(250));
    const float levelDb = ToDb(level_);
    // The peak at full scale sits in the top segment, not above it.
    const int peakSegment =
        peakDb_ < kFloorDb
            ? -1
            : std::min(SegmentCount() - 1, static_cast<int>((peakDb_ - kFloorDb) / kSegmentDb));
    for (int segment = 0; segment < SegmentCount(); ++segment) {
        const float floorDb = SegmentFloorDb(segment);
        const bool lit = levelDb >= floorDb || segment == peakSegment;
        const QColor colour = ZoneColour(floorDb);
        painter.fillRect(segmentRect(segment), lit ? colour : colour.darker(420));
    }
}
