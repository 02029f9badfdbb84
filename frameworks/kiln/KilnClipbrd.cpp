//===- frameworks/kiln/KilnClipbrd.cpp - The clipboard -------------------===//
#include "frameworks/kiln/KilnClipbrd.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SEmptyClipFormatName, "A clipboard format needs a name");
FK_RESOURCESTRING(SUnknownClipFormat, "Clipboard format %d is not registered");
FK_RESOURCESTRING(SClipFormatIndexError, "Clipboard format index out of bounds (%d)");

namespace {
std::vector<String>& ClipFormatNames() {
  static auto* Names = new std::vector<String>; // immortal: read during teardown
  return *Names;
}

bool IsKnownClipFormat(TClipFormat Format) {
  if (Format == CF_TEXT) return true;
  return Format >= FirstRegisteredClipFormat && Format - FirstRegisteredClipFormat < ClipFormatNames().size();
}
} // namespace

TClipFormat RegisterClipboardFormat(const String& Name) {
  if (Name.empty()) throw EInvalidOperation(SEmptyClipFormatName);
  auto& Names = ClipFormatNames();
  for (std::size_t I = 0; I < Names.size(); ++I)
    if (SameText(Names[I], Name)) return FirstRegisteredClipFormat + static_cast<TClipFormat>(I);
  Names.push_back(Name);
  return FirstRegisteredClipFormat + static_cast<TClipFormat>(Names.size() - 1);
}

String ClipboardFormatName(TClipFormat Format) {
  if (Format == CF_TEXT) return "CF_TEXT";
  if (!IsKnownClipFormat(Format)) return "";
  return ClipFormatNames()[Format - FirstRegisteredClipFormat];
}

FK_IMPLEMENT(TClipboard, "KilnClipbrd") {}

void TClipboard::Open() {
  if (FOpenCount++ == 0) FEmptied = false;
}

void TClipboard::Close() {
  if (FOpenCount > 0) --FOpenCount;
}

void TClipboard::Clear() {
  FData.clear();
  ++FChangeCount;
}

void TClipboard::Adding() {
  // The first format put in a session replaces the old content; later ones join it.
  if (FOpenCount > 0 && !FEmptied) {
    Clear();
    FEmptied = true;
  }
}

void TClipboard::SetAsHandle(TClipFormat Format, std::vector<std::uint8_t> Data) {
  if (!IsKnownClipFormat(Format)) throw EInvalidOperation(SUnknownClipFormat, static_cast<unsigned>(Format));
  Open();
  Adding();
  auto It = std::find_if(FData.begin(), FData.end(), [Format](const TEntry& E) { return E.Format == Format; });
  if (It != FData.end()) It->Data = std::move(Data);
  else FData.push_back({Format, std::move(Data)});
  ++FChangeCount;
  Close();
}

std::vector<std::uint8_t> TClipboard::GetAsHandle(TClipFormat Format) const {
  for (const TEntry& E : FData)
    if (E.Format == Format) return E.Data;
  return {};
}

bool TClipboard::HasFormat(TClipFormat Format) const noexcept {
  return std::any_of(FData.begin(), FData.end(), [Format](const TEntry& E) { return E.Format == Format; });
}

TClipFormat TClipboard::Formats(int Index) const {
  if (Index < 0 || Index >= FormatCount()) throw EListError(SClipFormatIndexError, Index);
  return FData[static_cast<std::size_t>(Index)].Format;
}

String TClipboard::AsText() const {
  std::vector<std::uint8_t> B = GetAsHandle(CF_TEXT);
  return String(B.begin(), B.end());
}

void TClipboard::SetAsText(const String& Value) { SetAsHandle(CF_TEXT, std::vector<std::uint8_t>(Value.begin(), Value.end())); }

namespace {
TClipboard*& ClipboardInstance() {
  static TClipboard* C = nullptr;
  return C;
}
} // namespace

namespace detail {
void FreeClipboard() noexcept {
  FreeAndNil(ClipboardInstance());
}
} // namespace detail

TClipboard* Clipboard() {
  TClipboard*& C = ClipboardInstance();
  if (!C) C = new TClipboard;
  return C;
}

} // namespace formkit
