//===- platform/Lists.h - Pointer, string and interface lists ------------===//
//
// `TList` (untyped pointers), `TStrings` and `TStringList` (lines with an object
// each, name=value pairs, comma text, sorting), and `TInterfaceList`, whose
// every operation runs under the list's own lock.
//
// Example:
//   TStringList List;
//   List.SetCommaText("a,\"b c\",d");     // three lines
//   List.SetValues("Key", "Value");        // appends "Key=Value"
//   List.IndexOfName("KEY");               // 3: names compare without regard to case
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"

#include <mutex>

namespace formkit {

//===----------------------------------------------------------------------===//
// TList
//===----------------------------------------------------------------------===//

/// A list of untyped pointers; owns nothing. Index errors raise `EListError`
/// "List index out of bounds (%d)".
class FK_API TList : public TObject {
  FK_CLASS(TList, TObject)

  int Count() const noexcept { return static_cast<int>(FItems.size()); }
  void* Get(int Index) const;
  void Put(int Index, void* Item);
  int Add(void* Item);
  void Insert(int Index, void* Item);
  void Delete(int Index);
  /// Removes the first occurrence; returns its former index or -1. Complexity: O(n).
  int Remove(void* Item);
  int IndexOf(const void* Item) const noexcept;
  void Exchange(int Index1, int Index2);
  void Move(int CurIndex, int NewIndex);
  void Clear() noexcept { FItems.clear(); }
  void* First() const { return Get(0); }
  void* Last() const { return Get(Count() - 1); }

private:
  void Check(int Index, int Limit) const;
  std::vector<void*> FItems;
};

//===----------------------------------------------------------------------===//
// TStrings
//===----------------------------------------------------------------------===//

enum TDuplicates : std::uint8_t { dupIgnore, dupAccept, dupError };

/// Lines of text, each with an optional object. Abstract: storage is the descendant's.
class FK_API TStrings : public TPersistent {
  FK_CLASS(TStrings, TPersistent)

  // Storage, supplied by descendants ------------------------------------------
  virtual int Count() const = 0;
  virtual String Get(int Index) const = 0;
  virtual void Put(int Index, const String& S);
  virtual TObject* GetObject(int Index) const;
  virtual void PutObject(int Index, TObject* Obj);
  virtual void Insert(int Index, const String& S) = 0;
  virtual void InsertObject(int Index, const String& S, TObject* Obj);
  virtual void Delete(int Index) = 0;
  virtual void Clear() = 0;

  // Lines ----------------------------------------------------------------------
  String operator[](int Index) const { return Get(Index); }
  virtual int Add(const String& S);
  virtual int AddObject(const String& S, TObject* Obj);
  void AddStrings(TStrings* Strings);
  void Append(const String& S) { Add(S); }
  /// The index of `S`, compared as `CompareStrings` does; -1 when absent.
  virtual int IndexOf(const String& S) const;
  int IndexOfObject(const TObject* Obj) const;
  void Exchange(int Index1, int Index2);
  void Move(int CurIndex, int NewIndex);
  bool Equals(const TStrings* Other) const;
  void Assign(TPersistent* Source) override;

  // Name=value pairs -------------------------------------------------------------
  /// The part before the first separator, or empty when the line has none.
  String Names(int Index) const;
  String ValueFromIndex(int Index) const;
  void SetValueFromIndex(int Index, const String& Value);
  /// The index of the line whose name is `Name`, without regard to case; -1 when absent.
  int IndexOfName(const String& Name) const;
  /// The value of `Name`, or empty.
  String Values(const String& Name) const;
  /// Sets the value of `Name`: replaces, appends, or with an empty value deletes the line.
  void SetValues(const String& Name, const String& Value);
  char NameValueSeparator = '=';

  // Whole text -------------------------------------------------------------------
  /// Each line followed by `LineBreak`.
  String Text() const;
  /// Replaces the lines; breaks at CR LF, LF or CR.
  void SetText(std::string_view Value);
  /// Lines joined by commas; a line holding spaces, commas, quotes or nothing is quoted.
  String CommaText() const;
  void SetCommaText(std::string_view Value);
  String DelimitedText() const;
  void SetDelimitedText(std::string_view Value);
  char Delimiter = ',';
  char QuoteChar = '"';
  /// When true, only `Delimiter` separates; otherwise spaces separate too.
  bool StrictDelimiter = false;
  String LineBreak = "\r\n";

  // Updates -----------------------------------------------------------------------
  void BeginUpdate();
  void EndUpdate();
  int UpdateCount() const noexcept { return FUpdateCount; }

  /// Compares two lines; without regard to case unless the descendant says otherwise.
  virtual int CompareStrings(const String& S1, const String& S2) const;

protected:
  /// Told when the first `BeginUpdate` starts and the last `EndUpdate` ends.
  virtual void SetUpdateState(bool Updating);
  [[noreturn]] void IndexError(int Index) const;

private:
  int FUpdateCount = 0;
};

/// The string list: a `TStrings` with its own storage, optional sorting and change events.
class FK_API TStringList : public TStrings {
  FK_CLASS(TStringList, TStrings)

  TStringList() = default;
  /// A list that frees the objects of its lines when they go.
  explicit TStringList(bool OwnsObjects) : FOwnsObjects(OwnsObjects) {}

  int Count() const override { return static_cast<int>(FItems.size()); }
  String Get(int Index) const override;
  void Put(int Index, const String& S) override;
  TObject* GetObject(int Index) const override;
  void PutObject(int Index, TObject* Obj) override;
  void Insert(int Index, const String& S) override;
  void InsertObject(int Index, const String& S, TObject* Obj) override;
  int Add(const String& S) override { return AddObject(S, nullptr); }
  int AddObject(const String& S, TObject* Obj) override;
  void Delete(int Index) override;
  void Clear() override;
  int IndexOf(const String& S) const override;
  int CompareStrings(const String& S1, const String& S2) const override;

  /// Binary search in a sorted list: true when found; `Index` is where `S` is or would go.
  /// Complexity: O(log n).
  bool Find(const String& S, int& Index) const;
  void Sort();
  void CustomSort(const std::function<int(TStringList* List, int Index1, int Index2)>& Compare);

  bool Sorted() const noexcept { return FSorted; }
  /// Sorting on keeps the list sorted from now on; `Insert` and `Put` are then refused.
  void SetSorted(bool Value);
  TDuplicates Duplicates = dupIgnore;
  bool CaseSensitive() const noexcept { return FCaseSensitive; }
  void SetCaseSensitive(bool Value);
  bool OwnsObjects() const noexcept { return FOwnsObjects; }

  TNotifyEvent OnChange;
  TNotifyEvent OnChanging;

  void BeforeDestruction() override;

protected:
  void SetUpdateState(bool Updating) override;
  virtual void Changed();
  virtual void Changing();

private:
  struct Item {
    String S;
    TObject* Obj = nullptr;
  };
  void InsertItem(int Index, const String& S, TObject* Obj);
  void FreeObject(TObject* Obj) noexcept;
  std::vector<Item> FItems;
  bool FSorted = false;
  bool FCaseSensitive = false;
  bool FOwnsObjects = false;
};

//===----------------------------------------------------------------------===//
// Interface lists
//===----------------------------------------------------------------------===//

/// A list of interface references shared between threads.
struct FK_API IInterfaceList : IInterface {
  FK_INTERFACE(IInterfaceList, IInterface, "{6C1D4A8E-2F3B-4E57-9B0C-7A5D8E1F2C34}")
  virtual IPtr<IInterface> Get(int Index) = 0;
  virtual int GetCount() = 0;
  virtual void Put(int Index, const IPtr<IInterface>& Item) = 0;
  virtual int Add(const IPtr<IInterface>& Item) = 0;
  virtual void Insert(int Index, const IPtr<IInterface>& Item) = 0;
  virtual void Delete(int Index) = 0;
  virtual int IndexOf(const IPtr<IInterface>& Item) = 0;
  virtual int Remove(const IPtr<IInterface>& Item) = 0;
  virtual void Clear() = 0;
  /// Holds the list's lock across several calls; pairs with `Unlock`.
  virtual void Lock() = 0;
  virtual void Unlock() = 0;
};

/// The interface list: counted references, every operation under a recursive lock.
/// Items compare by identity (their `IInterface`).
class FK_API TInterfaceList : public TInterfacedObject, public IInterfaceList {
  FK_CLASS(TInterfaceList, TInterfacedObject)
  FK_INTERFACES(IInterfaceList)

  IPtr<IInterface> Get(int Index) override;
  int GetCount() override;
  void Put(int Index, const IPtr<IInterface>& Item) override;
  int Add(const IPtr<IInterface>& Item) override;
  void Insert(int Index, const IPtr<IInterface>& Item) override;
  void Delete(int Index) override;
  int IndexOf(const IPtr<IInterface>& Item) override;
  int Remove(const IPtr<IInterface>& Item) override;
  void Clear() override;
  void Lock() override { FLock.lock(); }
  void Unlock() override { FLock.unlock(); }

private:
  void Check(int Index, int Limit) const;
  std::recursive_mutex FLock;
  std::vector<IPtr<IInterface>> FItems;
};

} // namespace formkit
