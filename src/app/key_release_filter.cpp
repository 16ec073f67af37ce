#include "app/key_release_filter.h"

#include "app/qt_key_codes.h"
#include "engine/computer_keys.h"

#include <QGuiApplication>
#include <QKeyEvent>

// xcb's XKB header names a member `explicit`, which C++ reserves.
#define explicit xkb_explicit
#include <xcb/xkb.h>
#undef explicit

#include <cstdlib>
#include <utility>

KeyReleaseFilter::KeyReleaseFilter(ComputerKeyboard& keyboard, bool holdReleases, QObject* parent)
    : QObject(parent), keyboard_(keyboard), holdReleases_(holdReleases) {
    releaseTimer_.setSingleShot(true);
    releaseTimer_.setTimerType(Qt::PreciseTimer);
    releaseTimer_.setInterval(kRepeatWindowMs);
    connect(&releaseTimer_, &QTimer::timeout, this, &KeyReleaseFilter::Flush);
}

bool KeyReleaseFilter::Feed(const QKeyEvent& event) {
    const int code = VirtualKeyCode(event);
    if (event.type() == QEvent::KeyPress) {
        if (heldReleaseCode_ != 0 && code == heldReleaseCode_ &&
            event.timestamp() == heldReleaseTime_) {
            // The other half of an auto-repeat pair: the key never went up.
            releaseTimer_.stop();
            heldReleaseCode_ = 0;
            return true;
        }
        Flush();
        keyboard_.KeyDown(code);
        return true;
    }
    if (event.type() != QEvent::KeyRelease) return false;
    if (event.isAutoRepeat()) return true;
    Flush();
    if (holdReleases_ && ComputerKeyboard::PadNoteForKey(code) >= 0) {
        heldReleaseCode_ = code;
        heldReleaseTime_ = event.timestamp();
        releaseTimer_.start();
        return true;
    }
    keyboard_.KeyUp(code);
    return true;
}

void KeyReleaseFilter::Flush() {
    releaseTimer_.stop();
    if (heldReleaseCode_ == 0) return;
    const int code = std::exchange(heldReleaseCode_, 0);
    keyboard_.KeyUp(code);
}

bool EnableDetectableAutoRepeat() {
    auto* x11 = qGuiApp ? qGuiApp->nativeInterface<QNativeInterface::QX11Application>() : nullptr;
    if (!x11 || !x11->connection()) return false;
    xcb_connection_t* connection = x11->connection();
    const auto flag = XCB_XKB_PER_CLIENT_FLAG_DETECTABLE_AUTO_REPEAT;
    auto* reply = xcb_xkb_per_client_flags_reply(
        connection,
        xcb_xkb_per_client_flags(connection, XCB_XKB_ID_USE_CORE_KBD, flag, flag, 0, 0, 0),
        nullptr);
    const bool enabled = reply && (reply->value & flag);
    std::free(reply);
    return enabled;
}
