#include "components/widgets/value_control.h"

#include <QKeyEvent>
#include <QMouseEvent>
#include <QWheelEvent>

#include <algorithm>
#include <cmath>

ValueControl::ValueControl(QWidget* parent) : HandDrawnControl(parent) {
    setToolTip(valueText());
}

void ValueControl::setRange(int minimum, int maximum) {
    minimum_ = minimum;
    maximum_ = std::max(minimum, maximum);
    const int old = value_;
    value_ = std::clamp(value_, minimum_, maximum_);
    update();  // the same value sits elsewhere in a new range
    if (value_ == old) return;
    ShowValue();
    emit valueChanged(value_);
}

void ValueControl::setMinimum(int minimum) {
    setRange(minimum, std::max(minimum, maximum_));
}

void ValueControl::setMaximum(int maximum) {
    setRange(std::min(minimum_, maximum), maximum);
}

void ValueControl::setValue(int value) {
    value = std::clamp(value, minimum_, maximum_);
    if (value == value_) return;
    value_ = value;
    ShowValue();
    emit valueChanged(value_);
}

int ValueControl::singleStep() const {
    if (singleStep_ > 0) return singleStep_;
    return std::max(1, static_cast<int>((static_cast<qint64>(maximum_) - minimum_) / 100));
}

int ValueControl::pageStep() const {
    if (pageStep_ > 0) return pageStep_;
    return std::max(1, static_cast<int>((static_cast<qint64>(maximum_) - minimum_) / 10));
}

void ValueControl::setValueText(std::function<QString(int)> text) {
    text_ = std::move(text);
    ShowValue();
}

QString ValueControl::valueText() const {
    return text_ ? text_(value_) : QString::number(value_);
}

double ValueControl::fraction() const {
    return fractionOf(value_);
}

double ValueControl::fractionOf(int value) const {
    if (maximum_ == minimum_) return 0;
    return (static_cast<double>(value) - minimum_) / (static_cast<double>(maximum_) - minimum_);
}

int ValueControl::valueAtFraction(double fraction) const {
    const double span = static_cast<double>(maximum_) - minimum_;
    const double value = minimum_ + std::clamp(fraction, 0.0, 1.0) * span;
    return static_cast<int>(std::lround(value));
}

void ValueControl::stepBy(qint64 amount) {
    // In 64 bits, so a step past the end of a wide range cannot overflow.
    setValue(static_cast<int>(std::clamp<qint64>(value_ + amount, minimum_, maximum_)));
}

void ValueControl::keyPressEvent(QKeyEvent* event) {
    switch (event->key()) {
        case Qt::Key_Up:
        case Qt::Key_Right:
            stepBy(singleStep());
            break;
        case Qt::Key_Down:
        case Qt::Key_Left:
            stepBy(-singleStep());
            break;
        case Qt::Key_PageUp:
            stepBy(pageStep());
            break;
        case Qt::Key_PageDown:
            stepBy(-pageStep());
            break;
        case Qt::Key_Home:
            setValue(minimum_);
            break;
        case Qt::Key_End:
            setValue(maximum_);
            break;
        default:
            event->ignore();
    }
}

void ValueControl::wheelEvent(QWheelEvent* event) {
    stepBy(static_cast<qint64>(wheel_.take(*event)) * singleStep());
}

void ValueControl::mouseDoubleClickEvent(QMouseEvent* event) {
    if (event->button() != Qt::LeftButton) return;
    setValue(defaultValue_);
}

void ValueControl::ShowValue() {
    setToolTip(valueText());
    NotifyAccessibleValue(this, value_);
    update();
}
