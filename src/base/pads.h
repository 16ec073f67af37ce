#pragma once

// The sixteen pads are the notes 57..72; every loop over them runs upwards.
inline constexpr int kFirstPad = 57;
inline constexpr int kLastPad = 72;
inline constexpr int kPadCount = kLastPad - kFirstPad + 1;
inline constexpr int kSlotCount = 128;
inline constexpr bool IsPad(int note) {
    return note >= kFirstPad && note <= kLastPad;
}
inline constexpr bool IsSlot(int note) {
    return note >= 0 && note < kSlotCount;
}
