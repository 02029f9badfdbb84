//===- platform/Objects.cpp - Class records, TObject and counted objects -===//
#include "platform/TypInfo.h"
#include "platform/Rtti.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(SAbstractClass, "Cannot create an instance of abstract class %s");
FK_RESOURCESTRING(SInvalidReclass, "Class %s does not descend from %s");

//===----------------------------------------------------------------------===//
// TClassRec
//===----------------------------------------------------------------------===//

TClassRec::TClassRec(TClass AParent, String AClassName, String AUnitName)
    : Parent(AParent), ClassName(std::move(AClassName)), UnitName(std::move(AUnitName)),
      FTypeInfo(std::make_unique<TTypeInfo>()) {
  FTypeInfo->Kind = tkClass;
  FTypeInfo->Name = ClassName;
  FTypeInfo->Data.ClassRef = this;
  FTypeInfo->Data.IntfUnit = UnitName;
}

TClassRec::~TClassRec() = default;

TPropInfo* TClassRec::AddOwnProperty(std::unique_ptr<TPropInfo> Prop) {
  FOwnProps.push_back(std::move(Prop));
  return FOwnProps.back().get();
}

void TClassRec::FinishProperties() {
  FProps = Parent ? Parent->FProps : std::vector<PPropInfo>{};
  for (const std::unique_ptr<TPropInfo>& Own : FOwnProps) {
    auto Same = std::find_if(FProps.begin(), FProps.end(),
                             [&](PPropInfo P) { return SameText(P->Name, Own->Name); });
    if (Same != FProps.end()) *Same = Own.get(); // a redeclaration hides the parent's property
    else FProps.push_back(Own.get());
  }
  for (const std::unique_ptr<TPropInfo>& Own : FOwnProps) {
    auto Pos = std::find(FProps.begin(), FProps.end(), Own.get());
    Own->NameIndex = static_cast<int>(Pos - FProps.begin());
  }
  FSorted = FProps;
  std::stable_sort(FSorted.begin(), FSorted.end(),
                   [](PPropInfo A, PPropInfo B) { return CompareText(A->Name, B->Name) < 0; });
  IndexPropertiesByName();
}


void TClassRec::IndexPropertiesByName() {
  std::size_t Size = 8;
  while (Size < FProps.size() * 2) Size *= 2;
  FByName.assign(Size, {0, nullptr});
  for (PPropInfo P : FProps) {
    std::uint64_t H = FoldedNameHash(P->Name);
    std::size_t I = H & (Size - 1);
    while (FByName[I].second) I = (I + 1) & (Size - 1);
    FByName[I] = {H, P};
  }
}

bool TClassRec::InheritsFrom(const TClassRec* Other) const noexcept {
  for (const TClassRec* C = this; C; C = C->Parent)
    if (C == Other) return true;
  return false;
}

String TClassRec::QualifiedClassName() const {
  return UnitName.empty() ? ClassName : UnitName + "." + ClassName;
}

const TMethodEntry* TClassRec::FindMethod(std::string_view Name) const noexcept {
  for (const TClassRec* C = this; C; C = C->Parent)
    for (const TMethodEntry& M : C->Methods)
      if (SameText(M.Name, Name)) return &M;
  return nullptr;
}

void* TClassRec::MethodAddress(std::string_view Name) const noexcept {
  const TMethodEntry* M = FindMethod(Name);
  return M ? M->Code : nullptr;
}

String TClassRec::MethodName(const void* Code) const {
  if (!Code) return "";
  for (const TClassRec* C = this; C; C = C->Parent)
    for (const TMethodEntry& M : C->Methods)
      if (M.Code == Code) return M.Name;
  return "";
}

PPropInfo TClassRec::FindProperty(std::string_view Name) const noexcept {
  if (FByName.empty()) return nullptr;
  std::uint64_t H = FoldedNameHash(Name);
  std::size_t Mask = FByName.size() - 1;
  for (std::size_t I = H & Mask; FByName[I].second; I = (I + 1) & Mask)
    if (FByName[I].first == H && SameText(FByName[I].second->Name, Name)) return FByName[I].second;
  return nullptr;
}

TObject* TClassRec::NewInstance() {
  if (!Factory) throw EInvalidOperation(SAbstractClass, ClassName);
  TObject* Obj = Factory();
  if (!Obj) throw EInvalidOperation(SAbstractClass, ClassName);
  Obj->FClassType = Generated ? this : nullptr;
  return Obj;
}

TGeneratedClass TClassRec::NewGeneratedClass(TClass AParent, String AClassName, String AUnitName) {
  TGeneratedClass Rec(new TClassRec(AParent, std::move(AClassName), std::move(AUnitName)));
  Rec->Generated = true;
  Rec->Compiled = AParent->Compiled;
  Rec->Factory = AParent->Factory;
  Rec->FProps = AParent->FProps;
  Rec->FSorted = AParent->FSorted;
  Rec->FByName = AParent->FByName;
  return Rec;
}

void TClassRec::DisposeGeneratedClass(TClass Class) noexcept {
  if (Class && Class->Generated) delete Class;
}

namespace detail {
TClass NewCompiledRecord(TClass Parent, const char* Name, const char* Unit, TObject* (*Factory)()) {
  auto* Rec = new TClassRec(Parent, Name, Unit); // immortal
  Rec->Compiled = Rec;
  Rec->Factory = Factory;
  RememberType(Rec->TypeInfo(), Rec->QualifiedClassName());
  return Rec;
}
} // namespace detail

//===----------------------------------------------------------------------===//
// TObject
//===----------------------------------------------------------------------===//

TClass TObject::StaticClass() {
  static TClass Rec = detail::NewCompiledRecord(nullptr, "TObject", "System", &detail::Allocate<TObject>);
  static bool Finished = (Rec->FinishProperties(), true);
  (void)Finished;
  return Rec;
}

TObject::~TObject() = default;

void TObject::SetClassType(TClass Class) {
  TClass Compiled = CompiledClass();
  if (!Class->InheritsFrom(Compiled) || Class->Compiled != Compiled)
    throw EInvalidCast(SInvalidReclass, Class->ClassName, Compiled->ClassName);
  FClassType = (Class == Compiled) ? nullptr : Class;
}

void TObject::Destroy() {
  TClass Class = ClassType();
  if (Class->Generated) {
    for (TClass C = Class; C && C->Generated; C = C->Parent)
      if (C->OnDestroy) {
        C->OnDestroy(this);
        break;
      }
  }
  Destroying();
  BeforeDestruction();
  FreeInstance();
}

void* TObject::GetInterfaceEntry(const TGUID&) { return nullptr; }

bool TObject::GetInterface(const TGUID& IID, void** Obj) {
  void* P = GetInterfaceEntry(IID);
  *Obj = P;
  if (!P) return false;
  ObjAddRef();
  return true;
}

//===----------------------------------------------------------------------===//
// TInterfacedObject
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TInterfacedObject, "System") {}

int TInterfacedObject::ObjAddRef() { return ++FRefCount; }

int TInterfacedObject::ObjRelease() {
  int Count = --FRefCount;
  if (Count == 0) {
    FRefCount = DestroyingBias;
    Destroy();
  }
  return Count;
}

} // namespace formkit
