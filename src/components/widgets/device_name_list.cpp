#include "components/widgets/device_name_list.h"

#include <QComboBox>
#include <QScreen>

namespace {

// A quarter of the screen is left for the captions, buttons and frames beside the list.
int WidestName(const QComboBox& list) {
    const QScreen* screen = list.screen();
    return screen != nullptr ? screen->availableGeometry().width() * 3 / 4 : 1000;
}

}  // namespace

void AddDeviceName(QComboBox* list, const QString& name) {
    const QString shown = list->fontMetrics().elidedText(name, Qt::ElideMiddle, WidestName(*list));
    list->addItem(shown, name);
    if (shown != name) list->setItemData(list->count() - 1, name, Qt::ToolTipRole);
}
