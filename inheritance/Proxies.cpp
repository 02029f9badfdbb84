//===- inheritance/Proxies.cpp - Classes of designed roots made at run time ---===//
#include "inheritance/Proxies.h"

#include "core/root/RootHooks.h"
#include "platform/Classes.h"
#include "platform/ScopeGuard.h"
#include "platform/TypInfo.h"

#include <algorithm>
#include <cstdint>
#include <memory>
#include <vector>

namespace formkit {

namespace {

/// What a proxy adds to its class record.
struct TProxy {
  TGeneratedClass Class;
  /// The class the first instance had before; it gets it back when it leaves.
  TClass Earlier = nullptr;
  /// Instances and derived proxies that use the record.
  int RefCount = 1;
  /// The instances counted in `RefCount`. An instance moved in by other means than this
  /// unit leaves without releasing a count it never took.
  std::vector<TObject*> Users;
  /// Every token this proxy handed out, whether or not its table still names it: event
  /// properties may hold a removed method's token until the class goes.
  std::vector<std::uintptr_t> Tokens;
};

using TProxyList = std::vector<std::unique_ptr<TProxy>>;

/// All live proxies; exists from the first proxy until the last goes.
std::unique_ptr<TProxyList>& ProxyList() {
  static std::unique_ptr<TProxyList> List;
  return List;
}

/// The tokens in use: bit N set means token N + 1 is taken.
struct TTokenBits {
  std::vector<bool> Bits;
  /// No bit below this one is clear, so a search for the lowest free token starts here.
  std::size_t FirstFree = 0;
};

TTokenBits& UsedTokens() {
  static TTokenBits Tokens;
  return Tokens;
}

constexpr std::size_t MaxShortString = 255;

/// `Text` cut to a short string, never inside a UTF-8 sequence.
String ShortName(const String& Text) {
  if (Text.size() <= MaxShortString) return Text;
  std::size_t Length = MaxShortString;
  while (Length > 0 && (static_cast<unsigned char>(Text[Length]) & 0xC0) == 0x80) --Length;
  return Text.substr(0, Length);
}

TProxy* ProxyOf(const TClassRec* Class) noexcept {
  const std::unique_ptr<TProxyList>& List = ProxyList();
  // Compiled classes are rejected before the search: streaming asks of every class.
  if (!List || !Class || !Class->Generated) return nullptr;
  for (const std::unique_ptr<TProxy>& P : *List)
    if (P->Class.get() == Class) return P.get();
  return nullptr;
}

/// The proxy `Class` is, or the nearest one among its generated parents.
TProxy* NearestProxy(TClass Class) noexcept {
  for (TClass C = Class; C && C->Generated; C = C->Parent)
    if (TProxy* P = ProxyOf(C)) return P;
  return nullptr;
}

/// Takes the lowest free token; nothing is marked when it raises.
std::uintptr_t TakeToken(TClass Class) {
  TTokenBits& Tokens = UsedTokens();
  std::vector<bool>& Bits = Tokens.Bits;
  auto Free = std::find(Bits.begin() + static_cast<std::ptrdiff_t>(Tokens.FirstFree), Bits.end(), false);
  auto Index = static_cast<std::size_t>(Free - Bits.begin());
  if (Index + 1 >= MaxMethodToken) throw EOutOfResources(STooManyMethods, Class->ClassName);
  if (Free == Bits.end()) Bits.push_back(true);
  else *Free = true;
  Tokens.FirstFree = Index + 1;
  return Index + 1;
}

void FreeTokens(const TProxy& Proxy) noexcept {
  TTokenBits& Tokens = UsedTokens();
  for (std::uintptr_t Token : Proxy.Tokens) {
    Tokens.Bits[Token - 1] = false;
    Tokens.FirstFree = std::min<std::size_t>(Tokens.FirstFree, Token - 1);
  }
}

void Release(TProxy* Proxy) noexcept {
  if (--Proxy->RefCount >= 1) return;
  FreeTokens(*Proxy);
  std::unique_ptr<TProxyList>& List = ProxyList();
  if (!List) return;
  auto It = std::find_if(List->begin(), List->end(), [&](const auto& P) { return P.get() == Proxy; });
  if (It == List->end()) return;
  std::unique_ptr<TProxy> Owned = std::move(*It);
  List->erase(It);
  if (List->empty()) List.reset();
  if (List)
    for (const std::unique_ptr<TProxy>& P : *List)
      if (P->Class->Parent == Owned->Class.get()) P->Class->Parent = Owned->Earlier;
  if (TProxy* Parent = ProxyOf(Owned->Class->Parent)) Release(Parent);
}

/// Puts `Instance` back into `Class`, which it had a moment ago.
void RestoreClass(TObject* Instance, TClass Class) noexcept {
  RunIgnoringExceptions([&] { Instance->SetClassType(Class); });
}

/// The type information of a proxy, set anew from its record.
void ResetTypeInfo(TClass Class) {
  // The record owns a mutable type record; its maker keeps it in step with the names.
  auto* Info = const_cast<TTypeInfo*>(Class->TypeInfo());
  Info->Kind = tkClass;
  Info->Name = Class->ClassName;
  Info->Data.ClassRef = Class;
  Info->Data.IntfUnit = Class->UnitName;
}

bool HasInOwnerChain(TComponent* Component, TComponent* Instance) noexcept {
  for (TComponent* C = Component; C; C = C->Owner())
    if (C == Instance) return true;
  return false;
}

/// An owned root passes notifications to its owner; a nested (inline) one only those of
/// its own components, so that its owner hears of what happens inside it.
bool ForwardsToOwner(TComponent* Self, TComponent* Component) noexcept {
  if (!Self->Owner()) return false;
  return !Self->ComponentState().Contains(csInline) || HasInOwnerChain(Component, Self);
}

/// The notification hook `Class` would run, for an instance that is in `Class` now.
void RunNotificationHook(TClass Class, TComponent* Self, TComponent* Component, TOperation Operation) {
  for (TClass C = Class; C && C->Generated; C = C->Parent)
    if (C->OnNotification) {
      C->OnNotification(Self, Component, Operation);
      return;
    }
}

// The instance's own `Notification` follows this hook. For the length of the call the
// instance is in its earlier class, so that an owner passing the notification back to
// its components does not come back here.
void ProxyNotification(TComponent* Self, TComponent* Component, TOperation Operation) {
  TClass Present = Self->ClassType();
  TProxy* Proxy = NearestProxy(Present);
  if (!Proxy) return;
  Self->SetClassType(Proxy->Earlier);
  auto Restore = Finally([&]() noexcept { RestoreClass(Self, Present); });
  if (ForwardsToOwner(Self, Component)) Self->Owner()->SendNotification(Component, Operation);
  else RunNotificationHook(Proxy->Earlier, Self, Component, Operation);
}

// Destroying an instance leaves every proxy it is in, so that the teardown runs in
// its earlier class and the proxies go once nothing uses them.
void ProxyDestroy(TObject* Self) {
  while (IsProxyClass(Self->ClassType())) DestroySubClass(Self);
}

/// The own method entry of code `Token`, or the end.
std::vector<TMethodEntry>::iterator FindEntry(std::vector<TMethodEntry>& Table, void* Token) {
  return std::find_if(Table.begin(), Table.end(), [&](const TMethodEntry& M) { return M.Code == Token; });
}

} // namespace

//===----------------------------------------------------------------------===//
// Proxy classes
//===----------------------------------------------------------------------===//

void CreateSubClass(TObject* Instance, const String& ClassName, const String& UnitName, TClass Metaclass) {
  auto Proxy = std::make_unique<TProxy>();
  Proxy->Class = TClassRec::NewGeneratedClass(Metaclass, ShortName(ClassName), ShortName(UnitName));
  Proxy->Earlier = Instance->ClassType();
  Proxy->Users.push_back(Instance);
  Proxy->Class->OnDestroy = &ProxyDestroy;
  Proxy->Class->OnNotification = &ProxyNotification;
  std::unique_ptr<TProxyList>& List = ProxyList();
  bool NewList = !List;
  if (NewList) List = std::make_unique<TProxyList>();
  auto DropList = OnFailure([&]() noexcept {
    if (NewList) List.reset();
  });
  List->reserve(List->size() + 1);
  Instance->SetClassType(Proxy->Class.get()); // checks that the instance fits
  // Nothing below raises.
  if (TProxy* Parent = ProxyOf(Metaclass)) ++Parent->RefCount;
  List->push_back(std::move(Proxy));
}

void CreateSubClass(TObject* Instance, const String& ClassName, TClass Metaclass) {
  CreateSubClass(Instance, ClassName, String(), Metaclass);
}

void ChangeToProxyClass(TObject* Instance, TClass Metaclass) {
  TProxy* Proxy = ProxyOf(Metaclass);
  if (!Proxy || !Metaclass->InheritsFrom(Instance->ClassType())) return;
  Proxy->Users.reserve(Proxy->Users.size() + 1);
  Instance->SetClassType(Metaclass);
  Proxy->Users.push_back(Instance);
  ++Proxy->RefCount;
}

void DestroySubClass(TObject* Instance) {
  TProxy* Proxy = ProxyOf(Instance->ClassType());
  if (!Proxy) return;
  Instance->SetClassType(Proxy->Earlier);
  auto User = std::find(Proxy->Users.begin(), Proxy->Users.end(), Instance);
  if (User == Proxy->Users.end()) return;
  Proxy->Users.erase(User);
  Release(Proxy);
}

void RenameSubClass(TObject* Instance, const String& ClassName, const String& UnitName) {
  TClass Class = Instance->ClassType();
  if (!ProxyOf(Class)) return;
  String Name = ShortName(ClassName);
  String Unit = UnitName.empty() ? Class->UnitName : ShortName(UnitName);
  Class->ClassName = std::move(Name);
  Class->UnitName = std::move(Unit);
  ResetTypeInfo(Class);
}

bool IsProxyClass(TClass ClassType) { return ProxyOf(ClassType) != nullptr; }

int ProxyReferenceCount(TClass ClassType) {
  TProxy* Proxy = ProxyOf(ClassType);
  return Proxy ? Proxy->RefCount : 0;
}

int ProxyClassCount() {
  const std::unique_ptr<TProxyList>& List = ProxyList();
  return List ? static_cast<int>(List->size()) : 0;
}

TClass ProxyEarlierClass(TClass ClassType) {
  TProxy* Proxy = ProxyOf(ClassType);
  return Proxy ? Proxy->Earlier : nullptr;
}

//===----------------------------------------------------------------------===//
// Methods
//===----------------------------------------------------------------------===//

void* CreateSubClassMethod(TObject* Instance, const String& MethodName) {
  TClass Class = Instance->ClassType();
  if (void* Code = Class->MethodAddress(MethodName)) return Code;
  TProxy* Proxy = ProxyOf(Class);
  if (!Proxy) return nullptr;
  TMethodEntry Entry{ShortName(MethodName), nullptr, nullptr, nullptr};
  Proxy->Tokens.reserve(Proxy->Tokens.size() + 1);
  Class->Methods.reserve(Class->Methods.size() + 1);
  std::uintptr_t Token = TakeToken(Class);
  // Nothing below raises.
  Proxy->Tokens.push_back(Token);
  Entry.Code = reinterpret_cast<void*>(Token);
  Class->Methods.push_back(std::move(Entry));
  return reinterpret_cast<void*>(Token);
}

void RenameSubClassMethod(TObject* Instance, void* Token, const String& NewName) {
  TClass Class = Instance->ClassType();
  if (!ProxyOf(Class)) return;
  String Name = ShortName(NewName);
  std::vector<TMethodEntry>& Table = Class->Methods;
  auto Entry = FindEntry(Table, Token);
  if (Entry == Table.end()) {
    Table.push_back({std::move(Name), Token, nullptr, nullptr});
    return;
  }
  // Moved to the end, as a removal and a new entry would be, without a new allocation.
  std::rotate(Entry, Entry + 1, Table.end());
  Table.back() = TMethodEntry{std::move(Name), Token, nullptr, nullptr};
}

void DestroySubClassMethod(TObject* Instance, void* Token) {
  TClass Class = Instance->ClassType();
  if (!ProxyOf(Class)) return;
  std::vector<TMethodEntry>& Table = Class->Methods;
  auto Entry = FindEntry(Table, Token);
  if (Entry == Table.end()) return;
  Table.erase(Entry);
  if (Table.empty()) std::vector<TMethodEntry>().swap(Table);
}

bool ExistProxyMethod(TClass ClassType, std::string_view Name) {
  if (!ClassType) return false;
  return std::any_of(ClassType->Methods.begin(), ClassType->Methods.end(),
                     [&](const TMethodEntry& M) { return SameText(M.Name, Name); });
}

//===----------------------------------------------------------------------===//
// The root core's hooks
//===----------------------------------------------------------------------===//

void InstallClassProxyHooks() {
  TRootHooks::CreateSubClass = [](TComponent* Instance, const String& ClassName, const String& UnitName,
                                  TClass Metaclass) { CreateSubClass(Instance, ClassName, UnitName, Metaclass); };
  TRootHooks::RenameSubClass = [](TComponent* Instance, const String& ClassName, const String& UnitName) {
    RenameSubClass(Instance, ClassName, UnitName);
  };
  TRootHooks::CreateSubClassMethod = [](TComponent* Instance, const String& MethodName) {
    return CreateSubClassMethod(Instance, MethodName);
  };
  TRootHooks::RenameSubClassMethod = [](TComponent* Instance, void* Token, const String& NewName) {
    RenameSubClassMethod(Instance, Token, NewName);
  };
  TRootHooks::DestroySubClassMethod = [](TComponent* Instance, void* Token) {
    DestroySubClassMethod(Instance, Token);
  };
  TRootHooks::IsProxyClass = [](TClass Class) { return IsProxyClass(Class); };
  TRootHooks::ChangeToProxyClass = [](TComponent* Instance, TClass Class) { ChangeToProxyClass(Instance, Class); };
}

void RemoveClassProxyHooks() {
  TRootHooks::CreateSubClass = nullptr;
  TRootHooks::RenameSubClass = nullptr;
  TRootHooks::CreateSubClassMethod = nullptr;
  TRootHooks::RenameSubClassMethod = nullptr;
  TRootHooks::DestroySubClassMethod = nullptr;
  TRootHooks::IsProxyClass = nullptr;
  TRootHooks::ChangeToProxyClass = nullptr;
}

} // namespace formkit
