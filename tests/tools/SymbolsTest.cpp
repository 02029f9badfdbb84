//===- tests/tools/SymbolsTest.cpp - Symbol tables and reserved words -----===//
#include "tools/CppSym.h"
#include "tools/PasSym.h"

#include "platform/TypInfoBuilder.h"

#include <gtest/gtest.h>

#include <clocale>
#include <set>

using namespace formkit;
using detail::ShortString;

namespace {

/// A symbol that counts its own destruction.
class TCountedSymbol : public TBaseSymbol {
  FK_CLASS(TCountedSymbol, TBaseSymbol)
  TCountedSymbol() = default;
  TCountedSymbol(const String& Name, int* Destroyed) : TBaseSymbol(Name), FDestroyed(Destroyed) {}
  void BeforeDestruction() override {
    if (FDestroyed) ++*FDestroyed;
    inherited::BeforeDestruction();
  }

private:
  int* FDestroyed = nullptr;
};

} // namespace

FK_IMPLEMENT(TCountedSymbol, "SymbolsTest") {}

namespace {

//===----------------------------------------------------------------------===//
// The hash
//===----------------------------------------------------------------------===//

TEST(SymbolIndexTest, SumsEachByteXorTenLessOneAndKeepsFiveBits) {
  EXPECT_EQ(SymbolIndex(""), 0);
  EXPECT_EQ(SymbolIndex("A"), 10);  // (0x41 xor 10) - 1 = 0x4A
  EXPECT_EQ(SymbolIndex("AB"), 17); // 0x4A + 0x47 = 0x91
  EXPECT_EQ(SymbolIndex(ShortString("AB")), 17);
}

TEST(SymbolIndexTest, LetterCaseNeverChangesTheBucket) {
  for (const char* Pair : {"begin|BEGIN", "Zz_09|zZ_09", "\xC3\x84NDERN|\xC3\xA4ndern", // ÄNDERN
                           "\xCE\xA3\xCE\x91\xCE\xA3|\xCF\x83\xCE\xB1\xCF\x82",         // ΣΑΣ, σας
                           "\xD0\x9F\xD0\xA0\xD0\x98|\xD0\xBF\xD1\x80\xD0\xB8",         // ПРИ, при
                           "\xE2\x84\xAA" "elvin|kelvin"}) {                              // Kelvin sign
    std::string_view P(Pair);
    std::string_view A = P.substr(0, P.find('|')), B = P.substr(P.find('|') + 1);
    EXPECT_EQ(SymbolIndex(A), SymbolIndex(B)) << A << " / " << B;
  }
}

TEST(SymbolIndexTest, TextFormCutsAt255BytesLikeTheShortForm) {
  String Long(300, 'q');
  EXPECT_EQ(SymbolIndex(Long), SymbolIndex(String(255, 'q')));
  EXPECT_EQ(ShortString(Long).size(), 255u);
}

TEST(CaseFoldTest, FoldsWithoutRegardToTheMachinesLocale) {
  const char* Previous = std::setlocale(LC_ALL, nullptr);
  String Saved = Previous ? Previous : "C";
  for (const char* Locale : {"C", "tr_TR.UTF-8", "de_DE.UTF-8"}) {
    std::setlocale(LC_ALL, Locale); // may be missing on the machine: then C stays
    EXPECT_EQ(detail::CaseFold("TITLE"), "title");
    EXPECT_EQ(detail::CaseFold("\xC3\x80\xC3\x89\xC3\x8E\xC3\x97"), "\xC3\xA0\xC3\xA9\xC3\xAE\xC3\x97"); // ÀÉÎ×
    EXPECT_EQ(detail::CaseFold("\xCF\x82"), "\xCF\x83");                                     // ς to σ
  }
  std::setlocale(LC_ALL, Saved.c_str());
  EXPECT_EQ(detail::CaseFold("a\xFF" "b"), "a\xEF\xBF\xBD" "b"); // malformed byte
}

//===----------------------------------------------------------------------===//
// Tables
//===----------------------------------------------------------------------===//

TEST(SymbolTableTest, InsensitiveTableFindsAnyCaseSensitiveOnlyTheSame) {
  TObjectGuard<TSymbolTable> Loose(new TSymbolTable(stInsensitive));
  TObjectGuard<TSymbolTable> Strict(new TSymbolTable(stCaseSensitive));
  for (TSymbolTable* T : {Loose.Get(), Strict.Get()}) {
    T->Insert(new TBaseSymbol(String("Begin")));
    T->Insert(new TBaseSymbol(String("\xC3\x84ndern"))); // Ändern
  }
  EXPECT_NE(Loose->Find("BEGIN"), nullptr);
  EXPECT_NE(Loose->Find(ShortString("begin")), nullptr);
  EXPECT_NE(Loose->Find("\xC3\xA4NDERN"), nullptr);
  EXPECT_EQ(Strict->Find("BEGIN"), nullptr);
  EXPECT_EQ(Strict->Find("\xC3\xA4NDERN"), nullptr);
  EXPECT_NE(Strict->Find("Begin"), nullptr);
  EXPECT_EQ(Strict->Find("Begin")->GetIdent(), "Begin");
  EXPECT_EQ(Loose->Count(), 2);
}

TEST(SymbolTableTest, DuplicatesAreFoundNewestFirst) {
  TObjectGuard<TSymbolTable> Table(new TSymbolTable(stInsensitive));
  auto* Older = new TBaseSymbol(String("name"));
  auto* Newer = new TBaseSymbol(String("NAME"));
  Table->Insert(Older);
  Table->Insert(new TBaseSymbol(String("other")));
  Table->Insert(Newer);
  EXPECT_EQ(Table->Find("Name"), Newer);
  EXPECT_EQ(Table->FindNext(Newer), Older);
  EXPECT_EQ(Table->FindNext(Older), nullptr);
  EXPECT_EQ(Table->FindIndex(SymbolIndex("name"), "name"), Newer);
  EXPECT_EQ(Table->FindIndex(32, "name"), nullptr);
  EXPECT_EQ(Table->FindSymbol(SymbolIndex("name"),
                              [](const ShortString& S) { return S.View() == "name"; }),
            Older);
}

TEST(SymbolTableTest, DeleteUnlinksWithoutFreeingAndClearFreesAll) {
  int Destroyed = 0;
  TSymbolTable* Table = new TSymbolTable(stCaseSensitive);
  auto* Kept = new TCountedSymbol("kept", &Destroyed);
  Table->Insert(Kept);
  for (int I = 0; I < 40; ++I) Table->Insert(new TCountedSymbol("s" + std::to_string(I), &Destroyed));
  Table->Insert(nullptr);
  EXPECT_EQ(Table->Count(), 41);

  EXPECT_TRUE(Table->Contains(Kept));
  Table->Delete(Kept);
  Table->Delete(Kept); // not there any more: no change
  EXPECT_FALSE(Table->Contains(Kept));
  EXPECT_FALSE(Table->Contains(nullptr));
  EXPECT_EQ(Table->Count(), 40);
  EXPECT_EQ(Table->Find("kept"), nullptr);
  EXPECT_EQ(Destroyed, 0);

  Table->Clear();
  EXPECT_EQ(Destroyed, 40);
  EXPECT_TRUE(Table->Empty());
  EXPECT_EQ(Table->Find("s1"), nullptr);
  Table->Insert(new TCountedSymbol("late", &Destroyed));
  Table->Destroy(); // frees what is left
  EXPECT_EQ(Destroyed, 41);
  EXPECT_EQ(Kept->GetIdent(), "kept");
  Kept->Destroy();
}

TEST(SymbolTableTest, LongFormComesFromTheKeyWhenNotGiven) {
  TObjectGuard<TBaseSymbol> Sym(new TBaseSymbol(ShortString("short")));
  EXPECT_EQ(Sym->GetIdent(), "short");
  Sym->SetIdent("changed");
  EXPECT_EQ(Sym->ShortIdent().View(), "changed");
  Sym->SetShortIdent(ShortString("key only"));
  EXPECT_EQ(Sym->GetIdent(), "changed");
}

//===----------------------------------------------------------------------===//
// Positional access
//===----------------------------------------------------------------------===//

TEST(TableIteratorTest, VisitsBucketByBucketNewestFirstAndRestartsBackwards) {
  TObjectGuard<TSymbolTable> Table(new TSymbolTable(stCaseSensitive));
  // "A" and "a" share bucket 10; "AB" is in bucket 17; "" in bucket 0.
  auto* Empty = new TBaseSymbol(String(""));
  auto* Upper = new TBaseSymbol(String("A"));
  auto* Lower = new TBaseSymbol(String("a"));
  auto* Pair = new TBaseSymbol(String("AB"));
  for (TBaseSymbol* S : {Pair, Upper, Empty, Lower}) Table->Insert(S);

  TObjectGuard<TTableIterator> It(new TTableIterator(Table.Get()));
  EXPECT_EQ(It->Count(), 4);
  EXPECT_EQ(It->GetSymbol(0), Empty);
  EXPECT_EQ(It->GetSymbol(1), Lower);
  EXPECT_EQ(It->GetSymbol(3), Pair);
  EXPECT_EQ(It->GetSymbol(2), Upper); // backwards: starts again from bucket 0
  EXPECT_EQ(It->GetSymbol(4), nullptr);
  EXPECT_EQ(It->GetSymbol(-1), nullptr);
  TObjectGuard<TTableIterator> None(new TTableIterator(nullptr));
  EXPECT_EQ(None->GetSymbol(0), nullptr);
}

TEST(TableIteratorTest, WalksTheReservedWordsOnceInBucketOrder) {
  InitializePasSym();
  TObjectGuard<TTableIterator> It(new TTableIterator(PascalSymbols));
  ASSERT_EQ(It->Count(), 71);
  std::set<String> Seen;
  int PreviousBucket = 0;
  TBaseSymbol* First = It->GetSymbol(0);
  for (int I = 0; I < It->Count(); ++I) {
    TBaseSymbol* S = It->GetSymbol(I);
    ASSERT_NE(S, nullptr);
    int Bucket = SymbolIndex(S->ShortIdent());
    EXPECT_GE(Bucket, PreviousBucket);
    PreviousBucket = Bucket;
    Seen.insert(S->GetIdent());
  }
  EXPECT_EQ(Seen.size(), 71u);
  // The first symbol is the head of the lowest bucket: the word inserted last of
  // those that hash to it. Index 0 after index 5 finds it again.
  EXPECT_EQ(First, PascalSymbols->Bucket(SymbolIndex(First->ShortIdent())));
  It->GetSymbol(5);
  EXPECT_EQ(It->GetSymbol(0), First);
}

TEST(SymbolListTest, GrowsByDoublingAndDoesNotOwn) {
  TObjectGuard<TSymbolList> List(new TSymbolList);
  TBaseSymbol* Syms[5];
  for (auto*& S : Syms) {
    S = new TBaseSymbol(String("x"));
    List->Add(S);
  }
  EXPECT_EQ(List->Count(), 5);
  EXPECT_EQ(List->GetSymbol(4), Syms[4]);
  EXPECT_EQ(List->GetSymbol(7), nullptr); // storage of 8, slots above the count are empty
  EXPECT_EQ(List->GetSymbol(8), nullptr);
  List->Clear();
  EXPECT_EQ(List->Count(), 0);
  EXPECT_EQ(List->GetSymbol(0), nullptr);
  for (auto* S : Syms) S->Destroy();
}

//===----------------------------------------------------------------------===//
// Reserved words
//===----------------------------------------------------------------------===//

/// The units of the reserved words started, as a program starts them before its first
/// lookup: in a shuffled run the test that stops them may come just before.
struct ReservedWords : ::testing::Test {
  void SetUp() override {
    InitializePasSym();
    InitializeCppSym();
  }
};
using PasSymTest = ReservedWords;
using CppSymTest = ReservedWords;

TEST_F(PasSymTest, WordsAreFoundInAnyCase) {
  for (const char* W : {"begin", "BEGIN", "Begin", "resourcestring", "Xor", "DispInterface"})
    EXPECT_TRUE(PasSym::IsReservedWord(W)) << W;
  for (const char* W : {"", "beginn", "integer", "self", "begi"}) EXPECT_FALSE(PasSym::IsReservedWord(W)) << W;
  EXPECT_TRUE(PasSym::IsReservedWord(ShortString("UNTIL")));
  EXPECT_EQ(PascalSymbols->Count(), 71);
  EXPECT_EQ(PasSym::MaxWordLength(), 14u);
}

TEST_F(PasSymTest, Tokens) {
  auto TokenOf = [](const char* W) {
    auto* S = static_cast<TPascalSymbol*>(PascalSymbols->Find(W));
    return S ? S->Token : 0;
  };
  EXPECT_EQ(TokenOf("array"), 5);
  EXPECT_EQ(TokenOf("Begin"), 20);
  EXPECT_EQ(TokenOf("set"), 34);
  EXPECT_EQ(TokenOf("interface"), 128);
  EXPECT_EQ(TokenOf("ASM"), 135);
  EXPECT_EQ(TokenOf("until"), 143);
  EXPECT_EQ(TokenOf("and"), SymReservedWord);
  EXPECT_EQ(TokenOf("program"), SymReservedWord);
}

TEST_F(PasSymTest, TooLongWordIsRefusedBeforeAnyLookup) {
  // A longer word placed in the table is still not reserved through the text form.
  auto* Long = new TPascalSymbol(ShortString("NOTRESERVEDATALL"), SymReservedWord);
  PascalSymbols->Insert(Long);
  EXPECT_TRUE(PasSym::IsReservedWord(ShortString("notreservedatall")));
  EXPECT_FALSE(PasSym::IsReservedWord("notreservedatall"));
  PascalSymbols->Delete(Long);
  Long->Destroy();
}

TEST_F(PasSymTest, NonAsciiTextUsesTheLowByteOfEachCharacterBelowTheEuroSign) {
  // U+0142 has the low byte of "B"; below U+20AC the low byte is what is looked up.
  EXPECT_TRUE(PasSym::IsReservedWord("\xC5\x82" "egin"));
  // U+00AC and U+20AC share the low byte 0xAC: only the first is looked up at all.
  auto* Odd = new TPascalSymbol(ShortString("\xAC"), SymReservedWord);
  PascalSymbols->Insert(Odd);
  EXPECT_TRUE(PasSym::IsReservedWord("\xC2\xAC"));       // U+00AC
  EXPECT_FALSE(PasSym::IsReservedWord("\xE2\x82\xAC"));  // U+20AC
  EXPECT_FALSE(PasSym::IsReservedWord("\xF0\x9F\x98\x80")); // beyond 16 bits
  PascalSymbols->Delete(Odd);
  Odd->Destroy();
  EXPECT_FALSE(PasSym::IsReservedWord("b\xC3\xA9gin")); // é
}

TEST_F(CppSymTest, WordsAreFoundOnlyInTheirOwnCase) {
  for (const char* W : {"class", "_Bool", "__published", "char16_t", "static_assert",
                        "__has_nothrow_default_constructor", "while"})
    EXPECT_TRUE(CppSym::IsReservedWord(W)) << W;
  for (const char* W : {"Class", "CLASS", "_bool", "begin", "__has_nothrow_default_constructorX", ""})
    EXPECT_FALSE(CppSym::IsReservedWord(W)) << W;
  EXPECT_FALSE(PasSym::IsReservedWord("static_assert"));
  EXPECT_EQ(CppSymbols->Count(), 199);
  EXPECT_EQ(CppSym::MaxWordLength(), 33u);
}

TEST_F(CppSymTest, Tokens) {
  auto TokenOf = [](const char* W) {
    auto* S = static_cast<TCppSymbol*>(CppSymbols->Find(W));
    return S ? S->Token : 0;
  };
  EXPECT_EQ(TokenOf("private"), 7);
  EXPECT_EQ(TokenOf("protected"), 8);
  EXPECT_EQ(TokenOf("public"), 9);
  EXPECT_EQ(TokenOf("__published"), 10);
  EXPECT_EQ(TokenOf("__automated"), 11);
  EXPECT_EQ(TokenOf("virtual"), SymReservedWord);
}

TEST(ReservedWordTablesTest, LiveFromTheUnitsStartToItsStopAndALookupNeverBuildsThem) {
  // Stopped, as before the program's start or after its end.
  FinalizeCppSym();
  FinalizePasSym();
  EXPECT_EQ(PascalSymbols, nullptr);
  EXPECT_EQ(CppSymbols, nullptr);
  EXPECT_EQ(PasSym::MaxWordLength(), 0u);
  EXPECT_EQ(CppSym::MaxWordLength(), 0u);

  // A lookup while stopped is refused and brings no table into being.
  try {
    (void)PasSym::IsReservedWord("begin");
    ADD_FAILURE() << "a lookup built the Pascal table";
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "The Pascal reserved words are not loaded");
  }
  try {
    (void)CppSym::IsReservedWord(ShortString("class"));
    ADD_FAILURE() << "a lookup built the C++ table";
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "The C++ reserved words are not loaded");
  }
  EXPECT_EQ(PascalSymbols, nullptr);
  EXPECT_EQ(CppSymbols, nullptr);

  // The start builds each whole table before any lookup.
  InitializePasSym();
  InitializeCppSym();
  ASSERT_NE(PascalSymbols, nullptr);
  ASSERT_NE(CppSymbols, nullptr);
  EXPECT_EQ(PascalSymbols->Count(), 71);
  EXPECT_EQ(CppSymbols->Count(), 199);
  EXPECT_EQ(PasSym::MaxWordLength(), 14u);
  EXPECT_EQ(CppSym::MaxWordLength(), 33u);

  // A second start and the lookups leave the very same tables.
  TSymbolTable* Pascal = PascalSymbols;
  TSymbolTable* Cpp = CppSymbols;
  InitializePasSym();
  InitializeCppSym();
  EXPECT_TRUE(PasSym::IsReservedWord("Begin"));
  EXPECT_TRUE(CppSym::IsReservedWord("nullptr"));
  EXPECT_EQ(PascalSymbols, Pascal);
  EXPECT_EQ(CppSymbols, Cpp);
  EXPECT_EQ(PascalSymbols->Count(), 71);
}

} // namespace

TEST(ReservedWordTablesTest, ExistFromTheProgramsStartWithoutAnyCall) {
  // Nothing in this test starts the units: linking them is enough.
  ASSERT_NE(PascalSymbols, nullptr);
  ASSERT_NE(CppSymbols, nullptr);
  EXPECT_EQ(71, PascalSymbols->Count());
  EXPECT_TRUE(CppSym::IsReservedWord("namespace"));
}
