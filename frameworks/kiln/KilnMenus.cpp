//===- frameworks/kiln/KilnMenus.cpp - Shortcuts and their texts -----------===//
#include "frameworks/kiln/KilnMenus.h"

namespace formkit {

namespace {

struct TKeyName {
  std::uint16_t Key;
  const char* Name;
};

constexpr TKeyName KeyNames[] = {{vkBack, "BkSp"},  {vkTab, "Tab"},     {vkReturn, "Enter"}, {vkEscape, "Esc"},
                                 {vkSpace, "Space"}, {vkPrior, "PgUp"}, {vkNext, "PgDn"},    {vkEnd, "End"},
                                 {vkHome, "Home"},   {vkLeft, "Left"},  {vkUp, "Up"},        {vkRight, "Right"},
                                 {vkDown, "Down"},   {vkInsert, "Ins"}, {vkDelete, "Del"}};

struct TModifier {
  TShortCut Bit;
  const char* Prefix;
};

// The order of the text.
constexpr TModifier Modifiers[] = {{scShift, "Shift+"}, {scCtrl, "Ctrl+"}, {scAlt, "Alt+"}};

String KeyName(std::uint16_t Key) {
  if ((Key >= 'A' && Key <= 'Z') || (Key >= '0' && Key <= '9')) return String(1, static_cast<char>(Key));
  if (Key >= vkF1 && Key <= vkF12) return "F" + IntToStr(Key - vkF1 + 1);
  for (const TKeyName& K : KeyNames)
    if (K.Key == Key) return K.Name;
  return String();
}

/// The key a name stands for; 0 when none.
std::uint16_t KeyOfName(std::string_view Name) {
  if (Name.size() == 1) {
    char C = UpperCase(Name)[0];
    if ((C >= 'A' && C <= 'Z') || (C >= '0' && C <= '9')) return static_cast<std::uint16_t>(C);
  }
  for (std::uint16_t Key = vkF1; Key <= vkF12; ++Key)
    if (SameText(KeyName(Key), Name)) return Key;
  for (const TKeyName& K : KeyNames)
    if (SameText(K.Name, Name)) return K.Key;
  return 0;
}

} // namespace

TShortCut ShortCut(std::uint16_t Key, TShiftState Shift) noexcept {
  if (Key > 0xFF) return scNone;
  TShortCut Result = Key;
  if (Shift.Contains(ssShift)) Result |= scShift;
  if (Shift.Contains(ssCtrl)) Result |= scCtrl;
  if (Shift.Contains(ssAlt)) Result |= scAlt;
  return Result;
}

void ShortCutToKey(TShortCut ShortCut, std::uint16_t& Key, TShiftState& Shift) noexcept {
  Key = ShortCut & 0xFF;
  Shift = {};
  if (ShortCut & scShift) Shift.Include(ssShift);
  if (ShortCut & scCtrl) Shift.Include(ssCtrl);
  if (ShortCut & scAlt) Shift.Include(ssAlt);
}

String ShortCutToText(TShortCut ShortCut) {
  String Name = KeyName(ShortCut & 0xFF);
  if (Name.empty()) return Name;
  String Text;
  for (const TModifier& M : Modifiers)
    if (ShortCut & M.Bit) Text += M.Prefix;
  return Text + Name;
}

TShortCut TextToShortCut(std::string_view Text) {
  TShortCut Result = 0;
  // Modifiers may come in any order; each is taken once from the front.
  bool Found = true;
  while (Found) {
    Found = false;
    for (const TModifier& M : Modifiers) {
      std::string_view Prefix = M.Prefix;
      if (Text.size() > Prefix.size() && AnsiStartsText(Prefix, Text) && !(Result & M.Bit)) {
        Result |= M.Bit;
        Text.remove_prefix(Prefix.size());
        Found = true;
      }
    }
  }
  std::uint16_t Key = KeyOfName(Text);
  return Key ? static_cast<TShortCut>(Result | Key) : scNone;
}

} // namespace formkit
