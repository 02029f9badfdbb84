//===- platform/Objects.h - Class records, TObject and counted objects ---===//
//
// Every class has one immortal class record `TClassRec` that exists at run
// time: parent, names, published properties and methods, a factory, and the
// hooks of generated classes. `TObject` starts each instance with a reference
// to its record; `TInterfacedObject` is the counted base of most classes.
//
// Example:
//   class FK_API TFoo : public TInterfacedObject, public IFoo {
//     FK_CLASS(TFoo, TInterfacedObject)
//     FK_INTERFACES(IFoo)
//   };
//   IPtr<IFoo> Foo = New<TFoo>();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Interfaces.h"

#include <functional>
#include <memory>
#include <vector>

namespace formkit {

class TObject;
class TComponent;
class TClassRec;
struct TPropInfo;
struct TGeneratedClassDeleter;
/// The owner of a class record made at run time (`TClassRec::NewGeneratedClass`): frees
/// the record when it goes.
using TGeneratedClass = std::unique_ptr<TClassRec, TGeneratedClassDeleter>;
using PPropInfo = const TPropInfo*;
/// A class reference: the record of a class. Compiled records are immortal.
using TClass = TClassRec*;
template <class T> class TClassBuilder;

/// Operations announced through `TComponent::Notification`.
enum TOperation : std::uint8_t { opInsert, opRemove };

/// A method pointer: code and the object it runs on. Code is a thunk bound to a real
/// method, or a token below 0x10000 of a generated class, which raises when called.
struct TMethod {
  void* Code = nullptr;
  void* Data = nullptr;
  bool IsAssigned() const noexcept { return Code != nullptr; }
  friend bool operator==(const TMethod&, const TMethod&) = default;
};

/// Codes below this are tokens of generated classes, not callable addresses.
inline constexpr std::uintptr_t MaxMethodToken = 0x10000;

/// One entry of a class's table of published methods.
struct TMethodEntry {
  String Name;
  void* Code = nullptr;
  /// The method type the method fits (an event type), or null when unknown.
  PTypeInfo Signature = nullptr;
  /// Identity of the C++ signature of a compiled method; null for a generated token.
  const void* SignatureId = nullptr;
};

//===----------------------------------------------------------------------===//
// Class records
//===----------------------------------------------------------------------===//

/// The run-time description of a class. Compiled records are built on first use,
/// parents first, and never freed; generated records are made at run time on a
/// compiled parent and freed by the `TGeneratedClass` that their maker holds.
class FK_API TClassRec {
public:
  /// The parent class, or null for `TObject`.
  TClass Parent = nullptr;
  String ClassName;
  String UnitName;
  /// The nearest compiled record: this record for a compiled class.
  TClass Compiled = nullptr;
  bool Generated = false;
  /// Allocates an instance of the compiled C++ type; null for an abstract class.
  TObject* (*Factory)() = nullptr;

  /// The type information of the class (kind `tkClass`).
  PTypeInfo TypeInfo() const noexcept { return FTypeInfo.get(); }
  /// Published properties, ancestors' first, in declaration order.
  const std::vector<PPropInfo>& Properties() const noexcept { return FProps; }
  /// Published properties sorted by name without regard to case. Computed once.
  const std::vector<PPropInfo>& SortedProperties() const noexcept { return FSorted; }
  /// The class's own published methods (not its parents').
  std::vector<TMethodEntry> Methods;

  /// Called by `TObject::Destroy` before the teardown of an instance of this record.
  std::function<void(TObject*)> OnDestroy;
  /// Called by `TComponent::SendNotification` before the instance's own `Notification`.
  std::function<void(TComponent* Self, TComponent* Component, TOperation Operation)> OnNotification;
  /// Free for the maker of a generated class.
  void* UserData = nullptr;

  /// True when this class is `Other` or descends from it. Complexity: O(depth).
  bool InheritsFrom(const TClassRec* Other) const noexcept;
  bool ClassNameIs(std::string_view Name) const noexcept { return SameText(ClassName, Name); }
  /// "Unit.ClassName", or the class name alone when the unit is empty.
  String QualifiedClassName() const;
  /// The published method of that name here or in a parent; null when absent.
  const TMethodEntry* FindMethod(std::string_view Name) const noexcept;
  /// The code of a published method, or null. Names compare without regard to case.
  void* MethodAddress(std::string_view Name) const noexcept;
  /// The name of the published method with that code, or empty.
  String MethodName(const void* Code) const;
  /// The property of that name (without regard to case), or null. Complexity: O(1): a
  /// hash of the folded name, then one comparison with the candidate.
  PPropInfo FindProperty(std::string_view Name) const noexcept;
  /// Allocates an instance without running any constructor logic; the instance's
  /// record is this one. The caller runs the constructor (`RunConstructor`) or destroys
  /// the instance. Raises `EInvalidOperation` for an abstract class.
  [[nodiscard]] TObject* NewInstance();

  /// Makes a record at run time on a compiled or generated parent, sharing its
  /// properties and factory, with its own names and an empty method table. The record
  /// lives as long as the owner returned; instances must be gone or re-classed by then.
  [[nodiscard]] static TGeneratedClass NewGeneratedClass(TClass Parent, String ClassName, String UnitName);
  /// Frees a record made by `NewGeneratedClass`; instances must be gone or re-classed.
  /// Does nothing for a compiled record. The owner of a generated record calls it.
  static void DisposeGeneratedClass(TClass Class) noexcept;

  // Used while a compiled record is built; see `TClassBuilder`.
  TClassRec(TClass Parent, String ClassName, String UnitName);
  TClassRec(const TClassRec&) = delete;
  TClassRec& operator=(const TClassRec&) = delete;
  /// Adopts a property this class declares; returns it for refinement.
  TPropInfo* AddOwnProperty(std::unique_ptr<TPropInfo> Prop);
  void FinishProperties();
  ~TClassRec();

private:
  std::unique_ptr<TTypeInfo> FTypeInfo;
  std::vector<std::unique_ptr<TPropInfo>> FOwnProps;
  std::vector<PPropInfo> FProps;
  std::vector<PPropInfo> FSorted;
  /// `FProps` by folded-name hash: open addressing, a power of two in size, empty slots null.
  std::vector<std::pair<std::uint64_t, PPropInfo>> FByName;
  void IndexPropertiesByName();
};

/// How `TGeneratedClass` frees its record: `TClassRec::DisposeGeneratedClass`.
struct TGeneratedClassDeleter {
  void operator()(TClass Class) const noexcept { TClassRec::DisposeGeneratedClass(Class); }
};

//===----------------------------------------------------------------------===//
// Declaring classes
//===----------------------------------------------------------------------===//

/// Declares a class's record: `inherited`, `StaticClass()`, `CompiledClass()`.
#define FK_CLASS(Name, Parent)                                                                     \
public:                                                                                            \
  using inherited = Parent;                                                                        \
  using ThisClass = Name;                                                                          \
  static ::formkit::TClass StaticClass();                                                          \
  ::formkit::TClass CompiledClass() const override { return StaticClass(); }                       \
  static void DescribeClass(::formkit::TClassBuilder<Name>& B);                                    \
                                                                                                   \
public:

/// Defines a class's record; the body that follows describes published members with `B`.
#define FK_IMPLEMENT(Name, Unit)                                                                   \
  ::formkit::TClass Name::StaticClass() {                                                          \
    static ::formkit::TClass Rec = ::formkit::detail::BuildClass<Name>(#Name, Unit);               \
    return Rec;                                                                                    \
  }                                                                                                \
  void Name::DescribeClass([[maybe_unused]] ::formkit::TClassBuilder<Name>& B)

/// Lists the interfaces a class answers to; each answers for every older member of its chain.
#define FK_INTERFACES(...)                                                                         \
public:                                                                                            \
  bool QueryInterface(const ::formkit::TGUID& IID, void** Obj) override {                         \
    return this->GetInterface(IID, Obj);                                                           \
  }                                                                                                \
  int AddRef() override { return this->ObjAddRef(); }                                              \
  int Release() override { return this->ObjRelease(); }                                            \
  void* GetInterfaceEntry(const ::formkit::TGUID& IID) override {                                  \
    if (void* P = ::formkit::detail::FindInterface<ThisClass, __VA_ARGS__>(this, IID)) return P;   \
    return inherited::GetInterfaceEntry(IID);                                                      \
  }                                                                                                \
                                                                                                   \
public:

namespace detail {
template <class Self, class... Is> void* FindInterface(Self* S, const TGUID& IID) {
  void* Found = nullptr;
  ((Found = Found ? Found : (ChainHas<Is>(IID) ? ChainCast<Is>(static_cast<Is*>(S), IID) : nullptr)), ...);
  return Found;
}
template <class T> TObject* Allocate() {
  if constexpr (std::is_abstract_v<T> || !std::is_default_constructible_v<T>) return nullptr;
  else return new T();
}
template <class T> TClass BuildClass(const char* Name, const char* Unit);
} // namespace detail

//===----------------------------------------------------------------------===//
// TObject
//===----------------------------------------------------------------------===//

/// The root of every class.
class FK_API TObject {
public:
  using ThisClass = TObject;
  TObject() = default;
  TObject(const TObject&) = delete;
  TObject& operator=(const TObject&) = delete;

  static TClass StaticClass();
  /// The record of the C++ type: the nearest compiled class.
  virtual TClass CompiledClass() const { return StaticClass(); }

  /// The instance's record: a replaced (generated) one, or the compiled one.
  TClass ClassType() const noexcept { return FClassType ? FClassType : CompiledClass(); }
  /// Replaces the instance's record; it must descend from the compiled record.
  void SetClassType(TClass Class);
  String ClassName() const { return ClassType()->ClassName; }
  String UnitName() const { return ClassType()->UnitName; }
  String QualifiedClassName() const { return ClassType()->QualifiedClassName(); }
  bool ClassNameIs(std::string_view Name) const { return ClassType()->ClassNameIs(Name); }
  bool InheritsFrom(const TClassRec* Class) const { return ClassType()->InheritsFrom(Class); }
  String MethodName(const void* Code) const { return ClassType()->MethodName(Code); }
  void* MethodAddress(std::string_view Name) const { return ClassType()->MethodAddress(Name); }

  /// Destroys the instance: the record's destruction hook, `Destroying`,
  /// `BeforeDestruction` (the teardown), then `FreeInstance`. Null-safe via `FreeAndNil`.
  void Destroy();
  /// Teardown. Overrides undo their own work and call `inherited::BeforeDestruction` last.
  virtual void BeforeDestruction() {}
  /// Called once construction is complete (after `Create` for components).
  virtual void AfterConstruction() {}

  /// The raw interface pointer for `IID`, not counted; null when not supported.
  virtual void* GetInterfaceEntry(const TGUID& IID);
  /// Like `GetInterfaceEntry`, but counted: stores the pointer and adds a reference.
  bool GetInterface(const TGUID& IID, void** Obj);
  /// Counting of interface references; -1 for uncounted classes.
  virtual int ObjAddRef() { return -1; }
  virtual int ObjRelease() { return -1; }

protected:
  /// Only `Destroy` deletes; the C++ destructor must not reach outside the object.
  virtual ~TObject();
  /// Announces destruction before any teardown runs (components set `Destroying`).
  virtual void Destroying() {}
  /// Gives the memory back once the teardown is done. A class whose instances may still
  /// be referenced from outside after their teardown overrides it to free later.
  virtual void FreeInstance() { delete this; }

private:
  friend class TClassRec;
  TClass FClassType = nullptr;
};

/// Destroys `Obj` when it is not null and clears the reference.
template <class T> void FreeAndNil(T*& Obj) {
  if (T* P = Obj) {
    Obj = nullptr;
    P->Destroy();
  }
}

/// The owner of one plain object: calls `Destroy` on what it holds when it goes or takes
/// another. Movable, so a function can hand a new object to its caller, and a list of
/// guards is a list that owns its objects. Not for counted or owned components: their
/// references or their owner free them.
///
/// Example:
///   TObjectGuard<TMemoryStream> Data(new TMemoryStream);
///   Fill(Data.Get());
///   std::vector<TObjectGuard<TMonitor>> Monitors;   // each monitor goes with the list
template <class T> class [[nodiscard]] TObjectGuard {
public:
  TObjectGuard() noexcept = default;
  explicit TObjectGuard(T* Obj) noexcept : FObj(Obj) {}
  TObjectGuard(TObjectGuard&& Other) noexcept : FObj(Other.Release()) {}
  /// Takes over a guard of a descendant class.
  template <class U>
    requires std::is_convertible_v<U*, T*>
  TObjectGuard(TObjectGuard<U>&& Other) noexcept : FObj(Other.Release()) {}
  /// Frees what this guard held, then takes what `Other` held.
  TObjectGuard& operator=(TObjectGuard&& Other) noexcept {
    Reset(Other.Release());
    return *this;
  }
  TObjectGuard(const TObjectGuard&) = delete;
  TObjectGuard& operator=(const TObjectGuard&) = delete;
  ~TObjectGuard() { Reset(); }

  T* Get() const noexcept { return FObj; }
  T* operator->() const noexcept { return FObj; }
  explicit operator bool() const noexcept { return FObj != nullptr; }
  /// Hands the object over to the caller, who frees it from now on.
  [[nodiscard]] T* Release() noexcept { return std::exchange(FObj, nullptr); }
  /// Frees the object held (cleared first, so the teardown sees an empty guard) and
  /// holds `Obj` instead.
  void Reset(T* Obj = nullptr) noexcept {
    if (T* Old = std::exchange(FObj, Obj)) Old->Destroy();
  }

private:
  T* FObj = nullptr;
};

//===----------------------------------------------------------------------===//
// Counted objects
//===----------------------------------------------------------------------===//

/// The counted base: dies with its last reference. While a constructor runs the count
/// is 1; `New<T>` hands that reference to its caller. When the count reaches 0 it is
/// replaced by a large bias, so a destructor may leave listener lists safely.
class FK_API TInterfacedObject : public TObject, public IInterface {
  FK_CLASS(TInterfacedObject, TObject)
  FK_INTERFACES(IInterface)

  int ObjAddRef() override;
  int ObjRelease() override;
  int RefCount() const noexcept { return FRefCount; }
  /// Lowers the count without freeing: for an object that registered itself in a
  /// list so that the registration does not keep it alive.
  void DropOwnReference() noexcept { --FRefCount; }

protected:
  static constexpr int DestroyingBias = 1 << 30;

private:
  int FRefCount = 1;
};

/// Creates a counted object and returns the one reference to it.
template <class T, class... A> IPtr<T> New(A&&... Args) {
  // Held from the start, so that an `AfterConstruction` that raises frees the object.
  IPtr<T> Obj = IPtr<T>::Adopt(new T(std::forward<A>(Args)...));
  Obj->AfterConstruction();
  return Obj;
}


/// True when the object answers to `I`; does not touch the count.
template <class I> bool Supports(const TObject* Obj) {
  return Obj && const_cast<TObject*>(Obj)->GetInterfaceEntry(I::IID) != nullptr;
}
/// True with a counted reference in `Out`, or false with `Out` cleared. On an object
/// nobody holds, the reference in `Out` becomes the only one: take a reference first.
template <class I> bool Supports(TObject* Obj, IPtr<I>& Out) {
  void* P = nullptr;
  if (Obj && Obj->GetInterface(I::IID, &P)) {
    Out = IPtr<I>::Adopt(static_cast<I*>(P));
    return true;
  }
  Out = nullptr;
  return false;
}
/// The interface `I` of an object, counted, or null.
template <class I> IPtr<I> InterfaceOf(TObject* Obj) {
  IPtr<I> R;
  Supports(Obj, R);
  return R;
}

/// Creates a counted object and returns it as interface `I`. Where `T` has `I` more than
/// once (several interfaces of one family), the object is asked for it instead.
template <class I, class T, class... A> IPtr<I> NewAs(A&&... Args) {
  IPtr<T> Obj = New<T>(std::forward<A>(Args)...);
  if constexpr (std::is_convertible_v<T*, I*>) return IPtr<I>(std::move(Obj));
  else return InterfaceOf<I>(Obj.Get());
}


} // namespace formkit
