//===- platform/Lists.cpp - Pointer, string and interface lists ----------===//
#include "platform/Lists.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SDuplicateString, "String list does not allow duplicates");
FK_RESOURCESTRING(SSortedListError, "Operation not allowed on sorted list");

//===----------------------------------------------------------------------===//
// TList
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TList, "Classes") {}

void TList::Check(int Index, int Limit) const {
  if (Index < 0 || Index >= Limit) throw EListError(SListIndexError, Index);
}

void* TList::Get(int Index) const {
  Check(Index, Count());
  return FItems[static_cast<size_t>(Index)];
}

void TList::Put(int Index, void* Item) {
  Check(Index, Count());
  FItems[static_cast<size_t>(Index)] = Item;
}

int TList::Add(void* Item) {
  FItems.push_back(Item);
  return Count() - 1;
}

void TList::Insert(int Index, void* Item) {
  Check(Index, Count() + 1);
  FItems.insert(FItems.begin() + Index, Item);
}

void TList::Delete(int Index) {
  Check(Index, Count());
  FItems.erase(FItems.begin() + Index);
}

int TList::Remove(void* Item) {
  int Index = IndexOf(Item);
  if (Index >= 0) Delete(Index);
  return Index;
}

int TList::IndexOf(const void* Item) const noexcept {
  auto It = std::find(FItems.begin(), FItems.end(), Item);
  return It == FItems.end() ? -1 : static_cast<int>(It - FItems.begin());
}

void TList::Exchange(int Index1, int Index2) {
  Check(Index1, Count());
  Check(Index2, Count());
  std::swap(FItems[static_cast<size_t>(Index1)], FItems[static_cast<size_t>(Index2)]);
}

void TList::Move(int CurIndex, int NewIndex) {
  if (CurIndex == NewIndex) return;
  Check(CurIndex, Count());
  Check(NewIndex, Count());
  void* Item = FItems[static_cast<size_t>(CurIndex)];
  FItems.erase(FItems.begin() + CurIndex);
  FItems.insert(FItems.begin() + NewIndex, Item);
}

//===----------------------------------------------------------------------===//
// TStrings
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStrings, "Classes") {}

namespace {
/// Runs `Change` inside one update of `Strings`, so that listeners hear of it once. The
/// update ends however `Change` ends; a listener that fails at the end of a failed change
/// cannot hide that failure, while after success its failure passes on.
template <class F> void InOneUpdate(TStrings& Strings, F&& Change) {
  Strings.BeginUpdate();
  auto End = OnFailure([&Strings]() noexcept { RunIgnoringExceptions([&Strings] { Strings.EndUpdate(); }); });
  Change();
  End.Dismiss();
  Strings.EndUpdate();
}

/// Gives `Strings` the delimiter, quote and blanks of comma text until the guard goes.
[[nodiscard]] auto CommaSyntax(TStrings& Strings) {
  auto Restore = Finally([&Strings, D = Strings.Delimiter, Q = Strings.QuoteChar,
                          Strict = Strings.StrictDelimiter]() noexcept {
    Strings.Delimiter = D;
    Strings.QuoteChar = Q;
    Strings.StrictDelimiter = Strict;
  });
  Strings.Delimiter = ',';
  Strings.QuoteChar = '"';
  Strings.StrictDelimiter = false;
  return Restore;
}
} // namespace

void TStrings::IndexError(int Index) const { throw EStringListError(SListIndexError, Index); }

void TStrings::Put(int Index, const String& S) {
  TObject* Obj = GetObject(Index);
  Delete(Index);
  InsertObject(Index, S, Obj);
}

TObject* TStrings::GetObject(int) const { return nullptr; }
void TStrings::PutObject(int, TObject*) {}

void TStrings::InsertObject(int Index, const String& S, TObject* Obj) {
  Insert(Index, S);
  PutObject(Index, Obj);
}

int TStrings::Add(const String& S) {
  int Index = Count();
  Insert(Index, S);
  return Index;
}

int TStrings::AddObject(const String& S, TObject* Obj) {
  int Index = Add(S);
  PutObject(Index, Obj);
  return Index;
}

void TStrings::AddStrings(TStrings* Strings) {
  InOneUpdate(*this, [&] {
    for (int I = 0; I < Strings->Count(); ++I) AddObject(Strings->Get(I), Strings->GetObject(I));
  });
}

int TStrings::CompareStrings(const String& S1, const String& S2) const { return CompareText(S1, S2); }

int TStrings::IndexOf(const String& S) const {
  for (int I = 0; I < Count(); ++I)
    if (CompareStrings(Get(I), S) == 0) return I;
  return -1;
}

int TStrings::IndexOfObject(const TObject* Obj) const {
  for (int I = 0; I < Count(); ++I)
    if (GetObject(I) == Obj) return I;
  return -1;
}

void TStrings::Exchange(int Index1, int Index2) {
  String S1 = Get(Index1), S2 = Get(Index2);
  TObject* O1 = GetObject(Index1);
  TObject* O2 = GetObject(Index2);
  Put(Index1, S2);
  PutObject(Index1, O2);
  Put(Index2, S1);
  PutObject(Index2, O1);
}

void TStrings::Move(int CurIndex, int NewIndex) {
  if (CurIndex == NewIndex) return;
  String S = Get(CurIndex);
  TObject* Obj = GetObject(CurIndex);
  Delete(CurIndex);
  InsertObject(NewIndex, S, Obj);
}

bool TStrings::Equals(const TStrings* Other) const {
  if (!Other || Other->Count() != Count()) return false;
  for (int I = 0; I < Count(); ++I)
    if (Get(I) != Other->Get(I)) return false;
  return true;
}

void TStrings::Assign(TPersistent* Source) {
  if (Source == this) return; // clearing first would lose the lines
  auto* Other = dynamic_cast<TStrings*>(Source);
  if (!Other) {
    inherited::Assign(Source);
    return;
  }
  InOneUpdate(*this, [&] {
    Clear();
    NameValueSeparator = Other->NameValueSeparator;
    Delimiter = Other->Delimiter;
    QuoteChar = Other->QuoteChar;
    StrictDelimiter = Other->StrictDelimiter;
    LineBreak = Other->LineBreak;
    AddStrings(Other);
  });
}

String TStrings::Names(int Index) const {
  String S = Get(Index);
  size_t Sep = S.find(NameValueSeparator);
  return Sep == String::npos ? String() : S.substr(0, Sep);
}

String TStrings::ValueFromIndex(int Index) const {
  if (Index < 0) return "";
  String S = Get(Index);
  size_t Sep = S.find(NameValueSeparator);
  return Sep == String::npos ? String() : S.substr(Sep + 1);
}

void TStrings::SetValueFromIndex(int Index, const String& Value) {
  if (Index < 0) {
    Add(String(1, NameValueSeparator) + Value);
    return;
  }
  Put(Index, Names(Index) + NameValueSeparator + Value);
}

int TStrings::IndexOfName(const String& Name) const {
  for (int I = 0; I < Count(); ++I) {
    String S = Get(I);
    size_t Sep = S.find(NameValueSeparator);
    if (Sep != String::npos && CompareText(std::string_view(S).substr(0, Sep), Name) == 0) return I;
  }
  return -1;
}

String TStrings::Values(const String& Name) const { return ValueFromIndex(IndexOfName(Name)); }

void TStrings::SetValues(const String& Name, const String& Value) {
  int Index = IndexOfName(Name);
  if (!Value.empty()) {
    if (Index < 0) Add(Name + NameValueSeparator + Value);
    else Put(Index, Name + NameValueSeparator + Value);
  } else if (Index >= 0) {
    Delete(Index);
  }
}

String TStrings::Text() const {
  String Out;
  for (int I = 0; I < Count(); ++I) Out += Get(I) + LineBreak;
  return Out;
}

void TStrings::SetText(std::string_view Value) {
  InOneUpdate(*this, [&] {
    Clear();
    size_t Start = 0;
    while (Start < Value.size()) {
      size_t End = Value.find_first_of("\r\n", Start);
      if (End == std::string_view::npos) {
        Add(String(Value.substr(Start)));
        break;
      }
      Add(String(Value.substr(Start, End - Start)));
      Start = End + 1;
      if (Value[End] == '\r' && Start < Value.size() && Value[Start] == '\n') ++Start;
    }
  });
}

namespace {
bool NeedsQuotes(const String& S, char Delimiter, char Quote, bool Strict) {
  if (S.empty()) return true;
  for (char C : S)
    if (C == Delimiter || C == Quote || (!Strict && static_cast<unsigned char>(C) <= ' ') || C == '\0') return true;
  return false;
}
String Quoted(const String& S, char Quote) {
  String Out(1, Quote);
  for (char C : S) {
    Out.push_back(C);
    if (C == Quote) Out.push_back(Quote);
  }
  Out.push_back(Quote);
  return Out;
}
bool IsBlank(char C) { return C != '\0' && static_cast<unsigned char>(C) <= ' '; }
/// The item of delimited text that starts at `P`, quoted or plain; `P` moves past it.
String NextDelimitedItem(std::string_view Value, size_t& P, char Delimiter, char Quote, bool Strict) {
  const size_t N = Value.size();
  String S;
  if (Value[P] != Quote) {
    size_t Begin = P;
    while (P < N && Value[P] != Delimiter && (Strict || !IsBlank(Value[P]))) ++P;
    S.assign(Value.substr(Begin, P - Begin));
    return S;
  }
  ++P;
  while (P < N) {
    if (Value[P] == Quote) {
      if (P + 1 < N && Value[P + 1] == Quote) {
        S.push_back(Quote);
        P += 2;
        continue;
      }
      ++P;
      break;
    }
    S.push_back(Value[P++]);
  }
  return S;
}
} // namespace

String TStrings::DelimitedText() const {
  int N = Count();
  if (N == 1 && Get(0).empty()) return String(2, QuoteChar);
  String Out;
  for (int I = 0; I < N; ++I) {
    if (I) Out.push_back(Delimiter);
    String S = Get(I);
    Out += NeedsQuotes(S, Delimiter, QuoteChar, StrictDelimiter) ? Quoted(S, QuoteChar) : S;
  }
  return Out;
}

void TStrings::SetDelimitedText(std::string_view Value) {
  InOneUpdate(*this, [&] {
    Clear();
    size_t P = 0, N = Value.size();
    auto SkipBlanks = [&] {
      if (!StrictDelimiter)
        while (P < N && IsBlank(Value[P])) ++P;
    };
    SkipBlanks();
    while (P < N) {
      Add(NextDelimitedItem(Value, P, Delimiter, QuoteChar, StrictDelimiter));
      SkipBlanks();
      if (P < N && Value[P] == Delimiter) {
        if (P + 1 == N) Add("");
        ++P;
        SkipBlanks();
      }
    }
  });
}

String TStrings::CommaText() const {
  // The syntax is switched for the call and back: the list's own settings are untouched.
  auto Syntax = CommaSyntax(*const_cast<TStrings*>(this));
  return DelimitedText();
}

void TStrings::SetCommaText(std::string_view Value) {
  auto Syntax = CommaSyntax(*this);
  SetDelimitedText(Value);
}

void TStrings::BeginUpdate() {
  if (FUpdateCount++ == 0) SetUpdateState(true);
}

void TStrings::EndUpdate() {
  if (FUpdateCount > 0 && --FUpdateCount == 0) SetUpdateState(false);
}

void TStrings::SetUpdateState(bool) {}

//===----------------------------------------------------------------------===//
// TStringList
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStringList, "Classes") {}

String TStringList::Get(int Index) const {
  if (Index < 0 || Index >= Count()) IndexError(Index);
  return FItems[static_cast<size_t>(Index)].S;
}

void TStringList::Put(int Index, const String& S) {
  if (FSorted) throw EStringListError(SSortedListError);
  if (Index < 0 || Index >= Count()) IndexError(Index);
  Changing();
  FItems[static_cast<size_t>(Index)].S = S;
  Changed();
}

TObject* TStringList::GetObject(int Index) const {
  if (Index < 0 || Index >= Count()) IndexError(Index);
  return FItems[static_cast<size_t>(Index)].Obj;
}

void TStringList::PutObject(int Index, TObject* Obj) {
  if (Index < 0 || Index >= Count()) IndexError(Index);
  Changing();
  FItems[static_cast<size_t>(Index)].Obj = Obj;
  Changed();
}

void TStringList::Insert(int Index, const String& S) { InsertObject(Index, S, nullptr); }

void TStringList::InsertObject(int Index, const String& S, TObject* Obj) {
  if (FSorted) throw EStringListError(SSortedListError);
  if (Index < 0 || Index > Count()) IndexError(Index);
  InsertItem(Index, S, Obj);
}

void TStringList::InsertItem(int Index, const String& S, TObject* Obj) {
  Changing();
  FItems.insert(FItems.begin() + Index, Item{S, Obj});
  Changed();
}

int TStringList::AddObject(const String& S, TObject* Obj) {
  int Index = Count();
  if (FSorted) {
    if (Find(S, Index)) {
      if (Duplicates == dupIgnore) return Index;
      if (Duplicates == dupError) throw EStringListError(SDuplicateString);
    }
  }
  InsertItem(Index, S, Obj);
  return Index;
}

void TStringList::Delete(int Index) {
  if (Index < 0 || Index >= Count()) IndexError(Index);
  Changing();
  TObject* Obj = FItems[static_cast<size_t>(Index)].Obj;
  FItems.erase(FItems.begin() + Index);
  FreeObject(Obj);
  Changed();
}

void TStringList::Clear() {
  if (FItems.empty()) return;
  Changing();
  std::vector<Item> Old;
  Old.swap(FItems);
  for (Item& It : Old) FreeObject(It.Obj);
  Changed();
}

void TStringList::FreeObject(TObject* Obj) noexcept {
  if (FOwnsObjects && Obj) Obj->Destroy();
}

int TStringList::CompareStrings(const String& S1, const String& S2) const {
  if (FCaseSensitive) return S1.compare(S2);
  return CompareText(S1, S2);
}

int TStringList::IndexOf(const String& S) const {
  if (!FSorted) return TStrings::IndexOf(S);
  int Index;
  return Find(S, Index) ? Index : -1;
}

bool TStringList::Find(const String& S, int& Index) const {
  int L = 0, H = Count() - 1;
  bool Found = false;
  while (L <= H) {
    int M = (L + H) / 2;
    int C = CompareStrings(FItems[static_cast<size_t>(M)].S, S);
    if (C < 0) {
      L = M + 1;
    } else {
      H = M - 1;
      if (C == 0) {
        Found = true;
        if (Duplicates != dupAccept) L = M;
      }
    }
  }
  Index = L;
  return Found;
}

void TStringList::Sort() {
  CustomSort([](TStringList* List, int A, int B) { return List->CompareStrings(List->Get(A), List->Get(B)); });
}

void TStringList::CustomSort(const std::function<int(TStringList*, int, int)>& Compare) {
  if (FItems.size() < 2) return;
  Changing();
  // Sort a permutation through the caller's index-based comparison, then apply it.
  std::vector<int> Order(FItems.size());
  for (size_t I = 0; I < Order.size(); ++I) Order[I] = static_cast<int>(I);
  std::stable_sort(Order.begin(), Order.end(), [&](int A, int B) { return Compare(this, A, B) < 0; });
  std::vector<Item> Sorted;
  Sorted.reserve(FItems.size());
  for (int I : Order) Sorted.push_back(std::move(FItems[static_cast<size_t>(I)]));
  FItems.swap(Sorted);
  Changed();
}

void TStringList::SetSorted(bool Value) {
  if (Value && !FSorted) Sort();
  FSorted = Value;
}

void TStringList::SetCaseSensitive(bool Value) {
  if (Value == FCaseSensitive) return;
  FCaseSensitive = Value;
  if (FSorted) Sort();
}

void TStringList::SetUpdateState(bool Updating) {
  if (Updating) Changing();
  else Changed();
}

void TStringList::Changed() {
  if (UpdateCount() == 0 && OnChange) OnChange(this);
}

void TStringList::Changing() {
  if (UpdateCount() == 0 && OnChanging) OnChanging(this);
}

void TStringList::BeforeDestruction() {
  OnChange.Clear();
  OnChanging.Clear();
  Clear();
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// TInterfaceList
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TInterfaceList, "Classes") {}

void TInterfaceList::Check(int Index, int Limit) const {
  if (Index < 0 || Index >= Limit) throw EListError(SListIndexError, Index);
}

IPtr<IInterface> TInterfaceList::Get(int Index) {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  Check(Index, static_cast<int>(FItems.size()));
  return FItems[static_cast<size_t>(Index)];
}

int TInterfaceList::GetCount() {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  return static_cast<int>(FItems.size());
}

void TInterfaceList::Put(int Index, const IPtr<IInterface>& Item) {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  Check(Index, static_cast<int>(FItems.size()));
  FItems[static_cast<size_t>(Index)] = Item;
}

int TInterfaceList::Add(const IPtr<IInterface>& Item) {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  FItems.push_back(Item);
  return static_cast<int>(FItems.size()) - 1;
}

void TInterfaceList::Insert(int Index, const IPtr<IInterface>& Item) {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  Check(Index, static_cast<int>(FItems.size()) + 1);
  FItems.insert(FItems.begin() + Index, Item);
}

void TInterfaceList::Delete(int Index) {
  IPtr<IInterface> Dropped; // released after the lock, so a dying item may use the list
  {
    std::lock_guard<std::recursive_mutex> Guard(FLock);
    Check(Index, static_cast<int>(FItems.size()));
    Dropped = std::move(FItems[static_cast<size_t>(Index)]);
    FItems.erase(FItems.begin() + Index);
  }
}

int TInterfaceList::IndexOf(const IPtr<IInterface>& Item) {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  IInterface* Identity = QueryAs<IInterface>(Item).Get();
  for (size_t I = 0; I < FItems.size(); ++I)
    if (QueryAs<IInterface>(FItems[I]).Get() == Identity) return static_cast<int>(I);
  return -1;
}

int TInterfaceList::Remove(const IPtr<IInterface>& Item) {
  std::lock_guard<std::recursive_mutex> Guard(FLock);
  int Index = IndexOf(Item);
  if (Index >= 0) Delete(Index);
  return Index;
}

void TInterfaceList::Clear() {
  std::vector<IPtr<IInterface>> Dropped;
  {
    std::lock_guard<std::recursive_mutex> Guard(FLock);
    Dropped.swap(FItems);
  }
}

} // namespace formkit
