//===- tools/Symbols.cpp - Hash tables of named symbols --------------------===//
#include "tools/Symbols.h"

#include "platform/TypInfoBuilder.h"

#include <atomic>
#include <cstring>

namespace formkit {

namespace {
FK_RESOURCESTRING(SReservedWordsNotLoaded, "The %s reserved words are not loaded");
} // namespace

//===----------------------------------------------------------------------===//
// Short strings and case folding
//===----------------------------------------------------------------------===//

namespace detail {

ShortString::ShortString(std::string_view Text) noexcept {
  std::size_t N = Text.size() < MaxLength ? Text.size() : MaxLength;
  std::memcpy(FData, Text.data(), N);
  FLength = static_cast<std::uint8_t>(N);
}

void ShortString::PushBack(char C) noexcept {
  if (FLength < MaxLength) FData[FLength++] = C;
}

namespace {

/// The simple case folding of one code point; the identity outside the table.
/// Upper case and title case map to lower case; a few symbols fold onto letters.
char32_t FoldCodePoint(char32_t C) noexcept {
  auto EvenToOdd = [C](char32_t First, char32_t Last) { return C >= First && C <= Last && (C % 2 == 0); };
  auto OddToEven = [C](char32_t First, char32_t Last) { return C >= First && C <= Last && (C % 2 == 1); };
  if (C < 0x80) return (C >= 'A' && C <= 'Z') ? C + 32 : C;
  if (C < 0x100) {
    if (C == 0xB5) return 0x3BC; // micro sign to Greek mu
    return (C >= 0xC0 && C <= 0xDE && C != 0xD7) ? C + 32 : C;
  }
  // Latin Extended-A.
  if (EvenToOdd(0x100, 0x12F) || EvenToOdd(0x132, 0x137) || OddToEven(0x139, 0x148) ||
      EvenToOdd(0x14A, 0x177) || OddToEven(0x179, 0x17E))
    return C + 1;
  if (C == 0x178) return 0xFF;
  if (C == 0x17F) return 's';
  // Latin Extended-B: the regular pairs and the digraphs.
  if (C == 0x1C4 || C == 0x1C5) return 0x1C6;
  if (C == 0x1C7 || C == 0x1C8) return 0x1C9;
  if (C == 0x1CA || C == 0x1CB) return 0x1CC;
  if (C == 0x1F1 || C == 0x1F2) return 0x1F3;
  if (OddToEven(0x1CD, 0x1DC) || EvenToOdd(0x1DE, 0x1EF) || C == 0x1F4 ||
      EvenToOdd(0x1F8, 0x21F) || EvenToOdd(0x222, 0x233) || EvenToOdd(0x246, 0x24F))
    return C + 1;
  // Greek.
  if (C == 0x386) return 0x3AC;
  if (C >= 0x388 && C <= 0x38A) return C + 37;
  if (C == 0x38C) return 0x3CC;
  if (C == 0x38E || C == 0x38F) return C + 63;
  if ((C >= 0x391 && C <= 0x3A1) || (C >= 0x3A3 && C <= 0x3AB)) return C + 32;
  if (C == 0x3C2) return 0x3C3; // final sigma
  if (EvenToOdd(0x3D8, 0x3EF)) return C + 1;
  // Cyrillic.
  if (C >= 0x400 && C <= 0x40F) return C + 80;
  if (C >= 0x410 && C <= 0x42F) return C + 32;
  if (EvenToOdd(0x460, 0x481) || EvenToOdd(0x48A, 0x4BF) || OddToEven(0x4C1, 0x4CE) ||
      EvenToOdd(0x4D0, 0x52F))
    return C + 1;
  if (C == 0x4C0) return 0x4CF;
  // Armenian, Georgian.
  if (C >= 0x531 && C <= 0x556) return C + 48;
  if ((C >= 0x10A0 && C <= 0x10C5) || C == 0x10C7 || C == 0x10CD) return C + 0x1C60;
  // Latin Extended Additional.
  if (EvenToOdd(0x1E00, 0x1E95) || EvenToOdd(0x1EA0, 0x1EFF)) return C + 1;
  if (C == 0x1E9E) return 0xDF;
  // Letter-like symbols, number forms, enclosed letters.
  if (C == 0x2126) return 0x3C9;
  if (C == 0x212A) return 'k';
  if (C == 0x212B) return 0xE5;
  if (C >= 0x2160 && C <= 0x216F) return C + 16;
  if (C >= 0x24B6 && C <= 0x24CF) return C + 26;
  // Glagolitic, Coptic, Cyrillic and Latin extensions.
  if (C >= 0x2C00 && C <= 0x2C2F) return C + 48;
  if (EvenToOdd(0x2C80, 0x2CE3) || EvenToOdd(0xA640, 0xA66D) || EvenToOdd(0xA680, 0xA69B) ||
      EvenToOdd(0xA722, 0xA72F) || EvenToOdd(0xA732, 0xA76F) || OddToEven(0xA779, 0xA77C) ||
      EvenToOdd(0xA77E, 0xA787))
    return C + 1;
  // Fullwidth Latin, Deseret.
  if (C >= 0xFF21 && C <= 0xFF3A) return C + 32;
  if (C >= 0x10400 && C <= 0x10427) return C + 40;
  return C;
}

bool IsAscii(std::string_view S) noexcept {
  for (char C : S)
    if (static_cast<unsigned char>(C) >= 0x80) return false;
  return true;
}

/// The hash step of one byte, kept to 8 bits.
inline std::uint8_t HashStep(std::uint8_t Sum, unsigned char C) noexcept {
  return static_cast<std::uint8_t>(Sum + static_cast<std::uint8_t>((C ^ 10) - 1));
}

} // namespace

String CaseFold(std::string_view Text) {
  String Out;
  Out.reserve(Text.size());
  for (std::size_t I = 0; I < Text.size();) AppendUtf8(FoldCodePoint(DecodeUtf8(Text, I)), Out);
  return Out;
}

bool SameShortText(const ShortString& A, const ShortString& B) {
  if (A.View() == B.View()) return true;
  if (IsAscii(A.View()) && IsAscii(B.View())) return SameText(A.View(), B.View());
  return CaseFold(A.View()) == CaseFold(B.View());
}

bool ReservedWordKey(std::string_view AWord, std::size_t AMaxLength, ShortString& AKey) {
  AKey = ShortString();
  if (IsAscii(AWord)) { // one unit per byte: no conversion needed
    if (AWord.size() > AMaxLength) return false;
    AKey = ShortString(AWord);
    return true;
  }
  WideString Units = Utf8ToUtf16(AWord);
  if (Units.size() > AMaxLength) return false;
  for (char16_t U : Units) {
    if (U >= 0x20AC) return false;
    AKey.PushBack(static_cast<char>(U & 0xFF));
  }
  return true;
}

void RaiseReservedWordsNotLoaded(const char* Language) {
  throw EInvalidOperation(SReservedWordsNotLoaded, Language);
}

} // namespace detail

//===----------------------------------------------------------------------===//
// The hash
//===----------------------------------------------------------------------===//

int SymbolIndex(const detail::ShortString& AName) {
  std::uint8_t Sum = 0;
  for (std::size_t I = 0; I < AName.size(); ++I) {
    unsigned char C = AName[I];
    if (C >= 0x80) {
      // The folded form stands in for a sort key with case ignored: any letter and
      // its other case give the same bytes, whatever the machine's locale.
      String Key = detail::CaseFold(AName.View());
      Sum = 0;
      for (char K : Key) Sum = detail::HashStep(Sum, static_cast<unsigned char>(K));
      return Sum & (SymbolBucketCount - 1);
    }
    Sum = detail::HashStep(Sum, C);
  }
  return Sum & (SymbolBucketCount - 1);
}

int SymbolIndex(std::string_view AName) { return SymbolIndex(detail::ShortString(AName)); }

//===----------------------------------------------------------------------===//
// TBaseSymbol
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TBaseSymbol, "Symbols") {}

TBaseSymbol::TBaseSymbol(const detail::ShortString& AName) : FShortIdent(AName) {}

TBaseSymbol::TBaseSymbol(const String& AName) : FShortIdent(AName), FIdent(AName) {}

void TBaseSymbol::SetIdent(const String& AValue) {
  FIdent = AValue;
  FShortIdent = detail::ShortString(AValue);
}

const String& TBaseSymbol::GetIdent() {
  if (FIdent.empty() && !FShortIdent.empty()) FIdent = FShortIdent.ToString();
  return FIdent;
}

//===----------------------------------------------------------------------===//
// TSymbolTable
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TSymbolTable, "Symbols") {}

namespace {
bool SameExact(const detail::ShortString& A, const detail::ShortString& B) { return A == B; }
} // namespace

TSymbolTable::TSymbolTable(TSymbolTableKind AKind)
    : FCompare(AKind == stCaseSensitive ? &SameExact : &detail::SameShortText) {}

void TSymbolTable::BeforeDestruction() {
  Clear();
  inherited::BeforeDestruction();
}

bool TSymbolTable::Contains(TBaseSymbol* ASymbol) const noexcept {
  if (!ASymbol) return false;
  for (TBaseSymbol* S = FSymbolList[SymbolIndex(ASymbol->ShortIdent())]; S; S = S->Next)
    if (S == ASymbol) return true;
  return false;
}

void TSymbolTable::Delete(TBaseSymbol* ASymbol) noexcept {
  if (!ASymbol) return;
  TBaseSymbol** Link = &FSymbolList[SymbolIndex(ASymbol->ShortIdent())];
  for (; *Link; Link = &(*Link)->Next) {
    if (*Link == ASymbol) {
      *Link = ASymbol->Next;
      ASymbol->Next = nullptr;
      --FCount;
      return;
    }
  }
}

void TSymbolTable::Insert(TBaseSymbol* ASymbol) noexcept {
  if (!ASymbol) return;
  TBaseSymbol*& Head = FSymbolList[SymbolIndex(ASymbol->ShortIdent())];
  ASymbol->Next = Head;
  Head = ASymbol;
  ++FCount;
}

TBaseSymbol* TSymbolTable::Find(const detail::ShortString& AName) const {
  return FindIndex(SymbolIndex(AName), AName);
}

TBaseSymbol* TSymbolTable::Find(std::string_view AName) const {
  detail::ShortString Name(AName);
  return FindIndex(SymbolIndex(Name), Name);
}

TBaseSymbol* TSymbolTable::FindNext(TBaseSymbol* ASymbol) const {
  if (!ASymbol) return nullptr;
  for (TBaseSymbol* S = ASymbol->Next; S; S = S->Next)
    if (FCompare(S->ShortIdent(), ASymbol->ShortIdent())) return S;
  return nullptr;
}

TBaseSymbol* TSymbolTable::FindIndex(int AIndex, const detail::ShortString& AName) const {
  if (AIndex < 0 || AIndex >= SymbolBucketCount) return nullptr;
  for (TBaseSymbol* S = FSymbolList[AIndex]; S; S = S->Next)
    if (FCompare(S->ShortIdent(), AName)) return S;
  return nullptr;
}

TBaseSymbol* TSymbolTable::FindIndex(int AIndex, std::string_view AName) const {
  return FindIndex(AIndex, detail::ShortString(AName));
}

TBaseSymbol* TSymbolTable::FindSymbol(
    int AIndex, const std::function<bool(const detail::ShortString&)>& ATest) const {
  if (AIndex < 0 || AIndex >= SymbolBucketCount || !ATest) return nullptr;
  for (TBaseSymbol* S = FSymbolList[AIndex]; S; S = S->Next)
    if (ATest(S->ShortIdent())) return S;
  return nullptr;
}

void TSymbolTable::Clear() noexcept {
  for (TBaseSymbol*& Head : FSymbolList) {
    TBaseSymbol* Chain = std::atomic_ref<TBaseSymbol*>(Head).exchange(nullptr);
    while (Chain) {
      TBaseSymbol* Next = Chain->Next;
      Chain->Destroy();
      Chain = Next;
    }
  }
  FCount = 0;
}

//===----------------------------------------------------------------------===//
// TTableIterator
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TTableIterator, "Symbols") {}

TTableIterator::TTableIterator(TSymbolTable* ATable) noexcept
    : FCount(ATable ? ATable->Count() : 0), FTable(ATable) {}

TBaseSymbol* TTableIterator::GetSymbol(int AIndex) noexcept {
  if (AIndex < 0 || AIndex >= FCount || !FTable) return nullptr;
  if (AIndex < FIndex) {
    FLocation = -1;
    FIndex = -1;
    FSymbol = nullptr;
  }
  while (AIndex > FIndex) {
    if (FSymbol) FSymbol = FSymbol->Next;
    while (!FSymbol) {
      if (++FLocation >= SymbolBucketCount) {
        // The table shrank since the count was taken: start over next time.
        FLocation = -1;
        FIndex = -1;
        return nullptr;
      }
      FSymbol = FTable->Bucket(FLocation);
    }
    ++FIndex;
  }
  return FSymbol;
}

//===----------------------------------------------------------------------===//
// TSymbolList
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TSymbolList, "Symbols") {}

TSymbolList::TSymbolList() : FList(1, nullptr) {}

void TSymbolList::Add(TBaseSymbol* ASymbol) {
  if (FList.size() <= static_cast<std::size_t>(FCount)) FList.resize(FList.size() * 2, nullptr);
  FList[FCount++] = ASymbol;
}

void TSymbolList::Clear() {
  FCount = 0;
  FList.assign(1, nullptr);
}

TBaseSymbol* TSymbolList::GetSymbol(int AIndex) const noexcept {
  if (AIndex < 0 || static_cast<std::size_t>(AIndex) >= FList.size()) return nullptr;
  return FList[AIndex];
}

} // namespace formkit
