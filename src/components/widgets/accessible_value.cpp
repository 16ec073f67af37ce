#include "components/widgets/accessible_value.h"

#include <QAccessibleWidget>
#include <QWidget>

namespace {

class ValueAccessible : public QAccessibleWidget, public QAccessibleValueInterface {
  public:
    ValueAccessible(QWidget* widget, QAccessible::Role role, AccessibleValueSource* source)
        : QAccessibleWidget(widget, role), source_(source) {}

    void* interface_cast(QAccessible::InterfaceType type) override {
        if (type == QAccessible::ValueInterface)
            return static_cast<QAccessibleValueInterface*>(this);
        return QAccessibleWidget::interface_cast(type);
    }
    QString text(QAccessible::Text kind) const override {
        if (kind == QAccessible::Value) return source_->accessibleValueText();
        return QAccessibleWidget::text(kind);
    }
    QVariant currentValue() const override { return source_->accessibleValue(); }
    void setCurrentValue(const QVariant& value) override {
        source_->setAccessibleValue(value.toInt());
    }
    QVariant maximumValue() const override { return source_->accessibleMaximum(); }
    QVariant minimumValue() const override { return source_->accessibleMinimum(); }
    QVariant minimumStepSize() const override { return source_->accessibleStep(); }

  private:
    AccessibleValueSource* source_;
};

QAccessibleInterface* CreateValueAccessible(const QString&, QObject* object) {
    auto* widget = qobject_cast<QWidget*>(object);
    auto* source = dynamic_cast<AccessibleValueSource*>(object);
    if (widget == nullptr || source == nullptr) return nullptr;
    const bool dial = object->inherits("RotaryKnob");
    return new ValueAccessible(widget, dial ? QAccessible::Dial : QAccessible::Slider, source);
}

}  // namespace

void InstallValueAccessibility() {
    static const bool installed = [] {
        QAccessible::installFactory(CreateValueAccessible);
        return true;
    }();
    Q_UNUSED(installed);
}

void NotifyAccessibleValue(QWidget* control, int value) {
    if (!QAccessible::isActive()) return;
    QAccessibleValueChangeEvent event(control, value);
    QAccessible::updateAccessibility(&event);
}
