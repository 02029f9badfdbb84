//===- frameworks/kiln/KilnFonts.cpp - Font names, character sets, input methods ===//
#include "frameworks/kiln/KilnFonts.h"

namespace formkit {

namespace {

struct TCharsetName {
  int Value;
  const char* Name;
};

constexpr TCharsetName CharsetNames[] = {
    {ANSI_CHARSET, "ANSI_CHARSET"},       {DEFAULT_CHARSET, "DEFAULT_CHARSET"},
    {SYMBOL_CHARSET, "SYMBOL_CHARSET"},   {MAC_CHARSET, "MAC_CHARSET"},
    {SHIFTJIS_CHARSET, "SHIFTJIS_CHARSET"}, {HANGEUL_CHARSET, "HANGEUL_CHARSET"},
    {JOHAB_CHARSET, "JOHAB_CHARSET"},     {GB2312_CHARSET, "GB2312_CHARSET"},
    {CHINESEBIG5_CHARSET, "CHINESEBIG5_CHARSET"}, {GREEK_CHARSET, "GREEK_CHARSET"},
    {TURKISH_CHARSET, "TURKISH_CHARSET"}, {VIETNAMESE_CHARSET, "VIETNAMESE_CHARSET"},
    {HEBREW_CHARSET, "HEBREW_CHARSET"},   {ARABIC_CHARSET, "ARABIC_CHARSET"},
    {BALTIC_CHARSET, "BALTIC_CHARSET"},   {RUSSIAN_CHARSET, "RUSSIAN_CHARSET"},
    {THAI_CHARSET, "THAI_CHARSET"},       {EASTEUROPE_CHARSET, "EASTEUROPE_CHARSET"},
    {OEM_CHARSET, "OEM_CHARSET"}};

} // namespace

bool CharsetToIdent(int Charset, String& Ident) {
  for (const TCharsetName& C : CharsetNames)
    if (C.Value == Charset) {
      Ident = C.Name;
      return true;
    }
  return false;
}

bool IdentToCharset(std::string_view Ident, int& Charset) {
  for (const TCharsetName& C : CharsetNames)
    if (SameText(C.Name, Ident)) {
      Charset = C.Value;
      return true;
    }
  return false;
}

void GetCharsetValues(const std::function<void(const String& Name)>& Proc) {
  for (const TCharsetName& C : CharsetNames) Proc(C.Name);
}

std::vector<String>& ScreenFonts() {
  static std::vector<String> Fonts = {DefaultFontName, "Serif", "Monospace"};
  return Fonts;
}

std::vector<String>& ScreenImes() {
  static std::vector<String> Imes;
  return Imes;
}

} // namespace formkit
