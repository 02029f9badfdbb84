//===- frameworks/kiln/KilnMenus.h - Shortcuts and their texts -------------===//
//
// A shortcut is a key code with modifier bits in one 16-bit number, and has a
// text a user reads and types: modifiers first ("Shift+", "Ctrl+", "Alt+", in
// that order), then the key's name ("A", "F5", "Del", "BkSp"). Both ways are
// exact inverses for every key that has a name; the text is read without
// regard to case.
//
// Example:
//   ShortCut(vkDelete, {ssCtrl});         // scCtrl | vkDelete
//   ShortCutToText(scShift | scCtrl | vkF1);   // "Shift+Ctrl+F1"
//   TextToShortCut("ctrl+s");            // scCtrl | 'S'; 0 for a text that is no shortcut
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

namespace formkit {

/// A key code in the low byte and the modifiers `scShift`, `scCtrl`, `scAlt`; 0 is none.
using TShortCut = std::uint16_t;
FK_SUBRANGE(TShortCut, std::uint16_t, 0, 65535)

inline constexpr TShortCut scShift = 0x2000;
inline constexpr TShortCut scCtrl = 0x4000;
inline constexpr TShortCut scAlt = 0x8000;
inline constexpr TShortCut scNone = 0;

/// Key codes of the keys that have names; letters and digits are their upper-case
/// characters ('A', '0').
inline constexpr std::uint16_t vkBack = 8, vkTab = 9, vkReturn = 13, vkEscape = 27, vkSpace = 32,
                               vkPrior = 33, vkNext = 34, vkEnd = 35, vkHome = 36, vkLeft = 37,
                               vkUp = 38, vkRight = 39, vkDown = 40, vkInsert = 45, vkDelete = 46,
                               vkF1 = 112, vkF12 = 123;

/// The shortcut of `Key` with the modifiers of `Shift` (shift, control and alt).
FK_API TShortCut ShortCut(std::uint16_t Key, TShiftState Shift) noexcept;
/// The key and the modifiers of a shortcut.
FK_API void ShortCutToKey(TShortCut ShortCut, std::uint16_t& Key, TShiftState& Shift) noexcept;
/// The text of a shortcut; empty for 0 and for a key without a name.
FK_API String ShortCutToText(TShortCut ShortCut);
/// The shortcut of a text; 0 when the text is empty or names no key.
FK_API TShortCut TextToShortCut(std::string_view Text);

} // namespace formkit
