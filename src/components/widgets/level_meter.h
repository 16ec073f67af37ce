#pragma once

#include <QWidget>

#include <chrono>

// An LED-style vertical level meter: a column of segments of 3 dB each from -48 dB at the bottom
// to 0 dB at the top, green below -12 dB, yellow from -12 dB and red from -3 dB; unlit segments
// show their colour dimmed. The segment of the recent peak stays lit above the level and falls
// the whole scale in 1.5 seconds. The meter has no timer: the window feeds it at display rate,
// and the fall is measured on a steady clock between those calls.
class LevelMeter : public QWidget {
    Q_OBJECT
  public:
    using Clock = std::chrono::steady_clock;

    static constexpr float kFloorDb = -48;
    static constexpr float kSegmentDb = 3;
    static constexpr float kYellowDb = -12;
    static constexpr float kRedDb = -3;
    static constexpr double kPeakFallSeconds = 1.5;  // from 0 dB to the floor

    explicit LevelMeter(QWidget* parent = nullptr);

    // The peak since the last call, linear (1 = full scale); beyond 0..1 is clamped.
    void setLevel(float linear);
    void setLevel(float linear, Clock::time_point now);
    float level() const { return level_; }
    // The falling peak marker, linear; 0 once it has fallen below the floor.
    float peakHold() const;

    static int SegmentCount();
    // The lower edge of a segment in dB; segment 0 is the bottom one.
    static float SegmentFloorDb(int segment);
    QRectF segmentRect(int segment) const;

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

  protected:
    void paintEvent(QPaintEvent* event) override;

  private:
    float level_ = 0;
    float peakDb_;
    Clock::time_point lastUpdate_{};
    bool updated_ = false;
};
