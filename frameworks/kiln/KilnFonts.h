//===- frameworks/kiln/KilnFonts.h - Font names, character sets, input methods ===//
//
// What a font property can hold beside its face: the character set, by name
// ("RUSSIAN_CHARSET") or number, and the lists a screen offers, the installed
// font faces and the input methods. The lists start with the faces every
// headless screen has and no input method; a host sets them to the machine's.
//
// Example:
//   String Name;
//   CharsetToIdent(204, Name);                  // true, "RUSSIAN_CHARSET"
//   ScreenFonts() = {"DejaVu Sans", "Noto Serif"};
//   ScreenImes().push_back("Pinyin");
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnGraphics.h"

#include <functional>
#include <vector>

namespace formkit {

/// A character set number.
using TFontCharset = std::uint8_t;
FK_SUBRANGE(TFontCharset, std::uint8_t, 0, 255)
/// A font face's name: its type record lets editors offer the installed faces.
FK_ALIAS(TFontName, tkUString)
/// An input method's name.
FK_ALIAS(TImeName, tkUString)

inline constexpr int ANSI_CHARSET = 0;
inline constexpr int DEFAULT_CHARSET = 1;
inline constexpr int SYMBOL_CHARSET = 2;
inline constexpr int MAC_CHARSET = 77;
inline constexpr int SHIFTJIS_CHARSET = 128;
inline constexpr int HANGEUL_CHARSET = 129;
inline constexpr int JOHAB_CHARSET = 130;
inline constexpr int GB2312_CHARSET = 134;
inline constexpr int CHINESEBIG5_CHARSET = 136;
inline constexpr int GREEK_CHARSET = 161;
inline constexpr int TURKISH_CHARSET = 162;
inline constexpr int VIETNAMESE_CHARSET = 163;
inline constexpr int HEBREW_CHARSET = 177;
inline constexpr int ARABIC_CHARSET = 178;
inline constexpr int BALTIC_CHARSET = 186;
inline constexpr int RUSSIAN_CHARSET = 204;
inline constexpr int THAI_CHARSET = 222;
inline constexpr int EASTEUROPE_CHARSET = 238;
inline constexpr int OEM_CHARSET = 255;

/// The name of a known character set; false for any other number.
FK_API bool CharsetToIdent(int Charset, String& Ident);
/// The number of a character set name, without regard to case; false when unknown.
FK_API bool IdentToCharset(std::string_view Ident, int& Charset);
/// Calls `Proc` with every character set name, in ascending order of number.
FK_API void GetCharsetValues(const std::function<void(const String& Name)>& Proc);

/// The font faces installed on the screen, in the order a host gave them.
FK_API std::vector<String>& ScreenFonts();
/// The input methods installed on the screen.
FK_API std::vector<String>& ScreenImes();

} // namespace formkit
