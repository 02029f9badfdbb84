//===- platform/Writer.cpp - Writing component data -----------------------===//
//
// The writer walks a tree with `GetChildren` and writes each component's prefix,
// names and the properties whose value differs from the ancestor's (or, without
// an ancestor, from the default). The same comparison answers
// `IsDefaultPropertyValue`, so an inspector and the file agree on what is default.
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <unordered_map>

namespace formkit {

namespace {
FK_RESOURCESTRING(SNameTooLong, "Name too long to write: %s");
FK_RESOURCESTRING(SValueTooLong, "Value too long to write");
FK_RESOURCESTRING(SInvalidFloatToWrite, "Invalid floating point value to write");
} // namespace

namespace detail {

struct TChildList {
  /// The ancestor's children by upper-cased name; empty without an ancestor.
  std::unordered_map<String, TComponent*> ByName;
  /// What a reader's parent holds while the children are read: the ancestor's children
  /// (as identity of the ancestor component) followed by the new ones.
  std::vector<const void*> Order;
  /// The child being written as `Order` holds it when the ancestor has it: its ancestor
  /// component, from the ancestor's tree.
  const void* Inherited = nullptr;
};

} // namespace detail

namespace {

/// What a value is compared with.
struct TCompareContext {
  TPersistent* Ancestor = nullptr;
  TComponent* LookupRoot = nullptr;
  TComponent* RootAncestor = nullptr;
  const TFindComponentValueEvent* FindComponentValue = nullptr;
};

/// A component value is written as a reference unless it is a sub-component of the
/// object that holds it.
bool IsReference(TObject* Holder, TObject* Value) {
  auto* C = dynamic_cast<TComponent*>(Value);
  if (!C) return false;
  return !C->ComponentStyle().Contains(csSubComponent) || (C->Owner() != Holder && C->Owner() != nullptr);
}

/// The name a reference is written with: "Button1" under `LookupRoot`,
/// "Frame1.Button1" through a nested root, "Form2.Button1" in another root.
String ReferencePath(TComponent* C, TComponent* LookupRoot) {
  if (!C) return "";
  if (C == LookupRoot) return C->Name();
  std::vector<const String*> Names;
  TComponent* T = C;
  for (; T && T != LookupRoot; T = T->Owner()) Names.push_back(&T->Name());
  String Path;
  for (std::size_t I = Names.size(); I-- > 0;) {
    Path += *Names[I];
    if (I) Path += '.';
  }
  return Path;
}

/// The reference as compared between a module and its ancestor: a reference to the
/// root itself matches a reference to the ancestor's root, whatever their names.
String ComparePath(TComponent* C, TComponent* LookupRoot, const TCompareContext& Ctx) {
  if (!C) return "";
  if (C == LookupRoot) return String("\x01");
  if (Ctx.FindComponentValue && *Ctx.FindComponentValue) {
    String S = (*Ctx.FindComponentValue)(C);
    if (!S.empty()) return S;
  }
  return ReferencePath(C, LookupRoot);
}

/// Components are held through interfaces only by their reference wrappers.
TComponent* ComponentOfInterface(const IPtr<IInterface>& I) { return ReferencedComponent(I); }

String MethodNameOf(const TMethod& M) {
  if (!M.Code || !M.Data) return "";
  return static_cast<TObject*>(M.Data)->MethodName(M.Code);
}

bool IsBooleanType(PTypeInfo Type) {
  PTypeInfo Base = Type->Data.BaseType ? Type->Data.BaseType() : Type;
  return Base == TypeInfo<bool>();
}

/// The ancestor object if it has `Prop`.
TPersistent* AncestorFor(TPersistent* Ancestor, PPropInfo Prop) {
  return Ancestor && Ancestor->InheritsFrom(Prop->Declaring) ? Ancestor : nullptr;
}

/// True when the value of `Prop` would not be written: equal to the ancestor's, or to
/// the default without an ancestor. Sub-objects are never default here: their own
/// properties decide.
bool IsDefaultValue(TObject* Instance, PPropInfo Prop, const TCompareContext& Ctx) {
  TPersistent* Anc = AncestorFor(Ctx.Ancestor, Prop);
  switch (Prop->Kind()) {
  case tkInteger:
  case tkChar:
  case tkWChar:
  case tkEnumeration:
  case tkSet: {
    std::int64_t V = GetOrdProp(Instance, Prop);
    if (Anc) return V == GetOrdProp(Anc, Prop);
    return Prop->HasDefault && V == Prop->Default;
  }
  case tkInt64: {
    std::int64_t V = GetInt64Prop(Instance, Prop);
    if (Anc) return V == GetInt64Prop(Anc, Prop);
    return V == (Prop->HasDefault ? Prop->Default : 0);
  }
  case tkFloat: {
    double V = GetFloatProp(Instance, Prop);
    if (Anc) {
      double A = GetFloatProp(Anc, Prop);
      return std::memcmp(&V, &A, sizeof V) == 0;
    }
    return V == 0 && !std::signbit(V);
  }
  case tkString:
  case tkLString:
  case tkWString:
  case tkUString: {
    String V = GetStrProp(Instance, Prop);
    return Anc ? V == GetStrProp(Anc, Prop) : V.empty();
  }
  case tkVariant: {
    TVariant V = GetVariantProp(Instance, Prop);
    return Anc ? V == GetVariantProp(Anc, Prop) : V.IsEmpty();
  }
  case tkMethod: {
    String V = MethodNameOf(GetMethodProp(Instance, Prop));
    return Anc ? SameText(V, MethodNameOf(GetMethodProp(Anc, Prop))) : !GetMethodProp(Instance, Prop).IsAssigned();
  }
  case tkInterface: {
    TComponent* V = ComponentOfInterface(GetInterfaceProp(Instance, Prop));
    if (!Anc) return !V && !GetInterfaceProp(Instance, Prop);
    TComponent* A = ComponentOfInterface(GetInterfaceProp(Anc, Prop));
    return ComparePath(V, Ctx.LookupRoot, Ctx) == ComparePath(A, Ctx.RootAncestor, Ctx);
  }
  case tkClass: {
    TObject* V = GetObjectProp(Instance, Prop);
    TObject* A = Anc ? GetObjectProp(Anc, Prop) : nullptr;
    if (!V) return !A;
    if (IsReference(Instance, V)) {
      if (!Anc || !IsReference(Anc, A)) return false;
      return ComparePath(static_cast<TComponent*>(V), Ctx.LookupRoot, Ctx) ==
             ComparePath(static_cast<TComponent*>(A), Ctx.RootAncestor, Ctx);
    }
    if (auto* Coll = dynamic_cast<TCollection*>(V)) {
      if (!Anc) return Coll->Count() == 0;
      return CollectionsEqual(Coll, dynamic_cast<TCollection*>(A), Ctx.LookupRoot, Ctx.RootAncestor);
    }
    return false;
  }
  default: return true;
  }
}

/// True when the writer leaves the value of `Prop` out: equal to its ancestor's, or to
/// the default without an ancestor.
bool IsUnchanged(const TWriter& W, TObject* Instance, PPropInfo Prop) {
  return IsDefaultValue(Instance, Prop, TCompareContext{W.Ancestor(), W.LookupRoot(), W.RootAncestor(), nullptr});
}

} // namespace

//===----------------------------------------------------------------------===//
// TWriter: primitives
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TWriter, "Classes") {}

TWriter::TWriter(TStream* Stream, int BufSize) : TFiler(Stream, BufSize) {}

void TWriter::BeforeDestruction() {
  // A failure here cannot be reported; callers that must know call FlushBuffer first.
  RunIgnoringExceptions([this] { FlushBuffer(); });
  inherited::BeforeDestruction();
}

void TWriter::FlushBuffer() {
  if (FBufPos > 0 && FStream) FStream->WriteBuffer(FBuffer.data(), FBufPos);
  FBufPos = 0;
}

void TWriter::Write(const void* Buffer, std::int64_t Count) {
  if (Count <= 0) return;
  std::int64_t Room = static_cast<std::int64_t>(FBuffer.size()) - FBufPos;
  if (Count > Room) {
    FlushBuffer();
    if (Count >= static_cast<std::int64_t>(FBuffer.size())) {
      if (FStream) FStream->WriteBuffer(Buffer, Count);
      return;
    }
  }
  std::memcpy(FBuffer.data() + FBufPos, Buffer, static_cast<std::size_t>(Count));
  FBufPos += Count;
}

std::int64_t TWriter::Position() const { return (FStream ? FStream->Position() : 0) + FBufPos; }

void TWriter::SetPosition(std::int64_t Value) {
  FlushBuffer();
  if (FStream) FStream->SetPosition(Value);
}

namespace {
template <class T> void WriteLE(TWriter* W, T Value) {
  std::uint8_t B[sizeof(T)];
  auto V = static_cast<std::uint64_t>(Value);
  for (std::size_t I = 0; I < sizeof(T); ++I) B[I] = static_cast<std::uint8_t>(V >> (8 * I));
  W->Write(B, sizeof B);
}
} // namespace

void TWriter::WriteValue(TValueType Value) {
  std::uint8_t B = Value;
  Write(&B, 1);
}

void TWriter::WriteSignature() { Write(FilerSignature, 4); }

void TWriter::WriteFilerFlags(TFilerFlags Flags, int Position) {
  std::uint8_t B = static_cast<std::uint8_t>(0xF0 | (Flags.Mask() & 0x07));
  Write(&B, 1);
  if (Flags.Contains(ffChildPos)) WriteInteger(Position);
}

void TWriter::WriteStr(std::string_view Value) {
  if (Value.size() > 255) throw EWriteError(SNameTooLong, Value);
  std::uint8_t Len = static_cast<std::uint8_t>(Value.size());
  Write(&Len, 1);
  Write(Value.data(), Len);
}

void TWriter::WriteInteger(std::int64_t Value) {
  if (Value >= INT8_MIN && Value <= INT8_MAX) {
    WriteValue(vaInt8);
    WriteLE<std::int8_t>(this, static_cast<std::int8_t>(Value));
  } else if (Value >= INT16_MIN && Value <= INT16_MAX) {
    WriteValue(vaInt16);
    WriteLE<std::int16_t>(this, static_cast<std::int16_t>(Value));
  } else if (Value >= INT32_MIN && Value <= INT32_MAX) {
    WriteValue(vaInt32);
    WriteLE<std::int32_t>(this, static_cast<std::int32_t>(Value));
  } else {
    WriteInt64(Value);
  }
}

void TWriter::WriteInt64(std::int64_t Value) {
  WriteValue(vaInt64);
  WriteLE<std::int64_t>(this, Value);
}

void TWriter::WriteFloat(double Value) { WriteFloatTagged(vaDouble, Value); }

void TWriter::WriteDate(double Value) { WriteFloatTagged(vaDate, Value); }

void TWriter::WriteFloatTagged(TValueType Tag, double Value) {
  // A form file carries finite numbers only: what could not be read back is not written.
  if (!std::isfinite(Value)) throw EWriteError(SInvalidFloatToWrite);
  WriteValue(Tag);
  std::uint64_t Bits;
  std::memcpy(&Bits, &Value, sizeof Bits);
  WriteLE<std::uint64_t>(this, Bits);
}

void TWriter::WriteBoolean(bool Value) { WriteValue(Value ? vaTrue : vaFalse); }

void TWriter::WriteString(std::string_view Value) {
  if (Value.size() <= 255) {
    WriteValue(vaString);
    WriteStr(Value);
    return;
  }
  if (Value.size() > UINT32_MAX) throw EWriteError(SValueTooLong);
  WriteValue(vaLString);
  WriteLE<std::uint32_t>(this, static_cast<std::uint32_t>(Value.size()));
  Write(Value.data(), static_cast<std::int64_t>(Value.size()));
}

void TWriter::WriteIdent(std::string_view Value) {
  WriteValue(vaIdent);
  WriteStr(Value);
}

void TWriter::WriteVariant(const TVariant& Value) {
  switch (Value.VarType()) {
  case varEmpty: WriteValue(vaNil); break;
  case varNull: WriteValue(vaVarNull); break;
  case varInteger: WriteInteger(Value.AsInteger()); break;
  case varInt64: WriteInt64(Value.AsInt64()); break;
  case varDouble: WriteFloat(Value.AsDouble()); break;
  case varDate: WriteDate(Value.AsDouble()); break;
  case varBoolean: WriteBoolean(Value.AsBoolean()); break;
  case varUString: WriteString(Value.AsString()); break;
  default: WriteValue(vaNil); break;
  }
}

void TWriter::WritePropName(std::string_view Name) {
  if (FPropPath.empty()) {
    WriteStr(Name);
    return;
  }
  String Full = FPropPath;
  Full += Name;
  WriteStr(Full);
}

//===----------------------------------------------------------------------===//
// TWriter: properties
//===----------------------------------------------------------------------===//

void TWriter::WriteProperties(TPersistent* Instance) {
  for (PPropInfo Prop : Instance->ClassType()->Properties()) WriteProperty(Instance, Prop);
  Instance->DefineProperties(this);
}

void TWriter::WriteProperty(TPersistent* Instance, PPropInfo Prop) {
  if (!Prop->IsReadable()) return;
  TTypeKind Kind = Prop->Kind();
  if (Kind != tkClass && !Prop->IsWritable()) return;
  if (!IsStoredProp(Instance, Prop)) return;
  switch (Kind) {
  case tkClass: WriteObjectProperty(Instance, Prop); break;
  case tkInterface: WriteInterfaceProperty(Instance, Prop); break;
  case tkMethod: WriteMethodProperty(Instance, Prop); break;
  default: WriteValueProperty(Instance, Prop); break;
  }
}

void TWriter::WriteObjectProperty(TPersistent* Instance, PPropInfo Prop) {
  TObject* V = GetObjectProp(Instance, Prop);
  if (V && !IsReference(Instance, V)) {
    if (auto* Coll = dynamic_cast<TCollection*>(V)) {
      if (IsUnchanged(*this, Instance, Prop)) return;
      WritePropName(Prop->Name);
      WriteCollection(Coll);
    } else if (auto* Sub = dynamic_cast<TPersistent*>(V)) {
      WriteSubProperties(Sub, Prop);
    }
    return;
  }
  if (!Prop->IsWritable() || IsUnchanged(*this, Instance, Prop)) return;
  WritePropName(Prop->Name);
  if (V) WriteIdent(ReferencePath(static_cast<TComponent*>(V), FLookupRoot));
  else WriteValue(vaNil);
}

void TWriter::WriteSubProperties(TPersistent* Sub, PPropInfo Prop) {
  // A sub-object's properties are written with its path, against the ancestor's
  // sub-object.
  TPersistent* Anc = AncestorFor(FAncestor, Prop);
  auto Restore = Finally([this, OldPath = FPropPath, OldAncestor = FAncestor]() mutable noexcept {
    FPropPath = std::move(OldPath);
    FAncestor = OldAncestor;
  });
  FPropPath += Prop->Name;
  FPropPath += '.';
  FAncestor = Anc ? dynamic_cast<TPersistent*>(GetObjectProp(Anc, Prop)) : nullptr;
  WriteProperties(Sub);
}

void TWriter::WriteInterfaceProperty(TPersistent* Instance, PPropInfo Prop) {
  IPtr<IInterface> I = GetInterfaceProp(Instance, Prop);
  TComponent* C = ComponentOfInterface(I);
  if (I && !C) return; // only components can be named in a stream
  if (IsUnchanged(*this, Instance, Prop)) return;
  WritePropName(Prop->Name);
  if (C) WriteIdent(ReferencePath(C, FLookupRoot));
  else WriteValue(vaNil);
}

void TWriter::WriteMethodProperty(TPersistent* Instance, PPropInfo Prop) {
  TMethod M = GetMethodProp(Instance, Prop);
  String Name = MethodNameOf(M);
  if (M.IsAssigned() && Name.empty()) return; // a method without a published name
  if (IsUnchanged(*this, Instance, Prop)) return;
  WritePropName(Prop->Name);
  if (Name.empty()) WriteValue(vaNil);
  else WriteIdent(Name);
}

void TWriter::WriteValueProperty(TPersistent* Instance, PPropInfo Prop) {
  TTypeKind Kind = Prop->Kind();
  if (Kind == tkVariant && GetVariantProp(Instance, Prop).VarType() == varUnknown) return;
  if (IsUnchanged(*this, Instance, Prop)) return;
  PTypeInfo Type = Prop->PropType();
  switch (Kind) {
  case tkInteger:
  case tkChar:
  case tkWChar:
    WritePropName(Prop->Name);
    WriteInteger(GetOrdProp(Instance, Prop));
    break;
  case tkEnumeration: {
    std::int64_t V = GetOrdProp(Instance, Prop);
    if (IsBooleanType(Type)) {
      WritePropName(Prop->Name);
      WriteBoolean(V != 0);
      break;
    }
    String Name = GetEnumName(Type, V);
    if (Name.empty()) return;
    WritePropName(Prop->Name);
    WriteIdent(Name);
    break;
  }
  case tkSet: {
    std::uint64_t Mask = static_cast<std::uint64_t>(GetOrdProp(Instance, Prop));
    WritePropName(Prop->Name);
    WriteValue(vaSet);
    for (int Bit = 0; Bit < 64; ++Bit) {
      if (!((Mask >> Bit) & 1u)) continue;
      String Element = GetSetElementName(Type, Bit);
      if (!Element.empty()) WriteStr(Element);
    }
    WriteStr("");
    break;
  }
  case tkInt64:
    WritePropName(Prop->Name);
    WriteInteger(GetInt64Prop(Instance, Prop));
    break;
  case tkFloat:
    WritePropName(Prop->Name);
    WriteFloat(GetFloatProp(Instance, Prop));
    break;
  case tkString:
  case tkLString:
  case tkWString:
  case tkUString:
    WritePropName(Prop->Name);
    WriteString(GetStrProp(Instance, Prop));
    break;
  case tkVariant:
    WritePropName(Prop->Name);
    WriteVariant(GetVariantProp(Instance, Prop));
    break;
  default: break;
  }
}

void TWriter::WriteCollection(TCollection* Value) {
  WriteValue(vaCollection);
  // Items are written in full, with names of their own.
  auto Restore = Finally([this, OldPath = std::exchange(FPropPath, String()),
                          OldAncestor = std::exchange(FAncestor, nullptr)]() mutable noexcept {
    FPropPath = std::move(OldPath);
    FAncestor = OldAncestor;
  });
  if (Value)
    for (int I = 0; I < Value->Count(); ++I) {
      WriteListBegin();
      WriteProperties(Value->Items(I));
      WriteListEnd();
    }
  WriteListEnd();
}

void TWriter::DefineProperty(const String& Name, const TReaderProc&, const TWriterProc& WriteData, bool HasData) {
  if (!HasData || !WriteData) return;
  WritePropName(Name);
  WriteData(this);
}

void TWriter::DefineBinaryProperty(const String& Name, const TStreamProc&, const TStreamProc& WriteData,
                                   bool HasData) {
  if (!HasData || !WriteData) return;
  TObjectGuard<TMemoryStream> Data(new TMemoryStream);
  WriteData(Data.Get());
  if (Data->Size() > UINT32_MAX) throw EWriteError(SValueTooLong);
  WritePropName(Name);
  WriteValue(vaBinary);
  WriteLE<std::uint32_t>(this, static_cast<std::uint32_t>(Data->Size()));
  Write(Data->Memory(), Data->Size());
}

//===----------------------------------------------------------------------===//
// TWriter: components
//===----------------------------------------------------------------------===//

void TWriter::WriteDescendent(TComponent* ARoot, TComponent* AAncestor) {
  FRootAncestor = AAncestor;
  FAncestor = AAncestor;
  SetRoot(ARoot);
  FChildren = nullptr;
  FChildPos = 0;
  WriteSignature();
  WriteComponent(ARoot);
}

void TWriter::WriteComponent(TComponent* Component) {
  auto Restore = Finally([this, Component, OldAncestor = FAncestor, OldRootAncestor = FRootAncestor,
                          OldMoved = FAncestorMoved, OldInherited = FAncestorInherited]() noexcept {
    FAncestor = OldAncestor;
    FRootAncestor = OldRootAncestor;
    FAncestorMoved = OldMoved;
    FAncestorInherited = OldInherited;
    Component->SetWriting(false);
  });
  Component->SetWriting(true);
  FAncestorMoved = false;
  if (FChildren) {
    auto It = FChildren->ByName.find(UpperCase(Component->Name()));
    FAncestor = It != FChildren->ByName.end() && !Component->Name().empty() ? It->second : nullptr;
    // Every component the ancestor has is inherited, also one moved to another parent.
    if (!FAncestor && FRootAncestor && !Component->Name().empty())
      if ((FAncestor = FRootAncestor->FindComponent(Component->Name()))) FAncestorMoved = true;
  } else if (Component != FRoot) {
    FAncestor = nullptr;
  }
  FAncestorInherited = FAncestor != nullptr;
  // A nested frame new to this parent gets its module as ancestor below, but the reader
  // still adds it as a new child.
  if (FChildren) FChildren->Inherited = FAncestor;
  if (OnFindAncestor) {
    auto* A = dynamic_cast<TComponent*>(FAncestor);
    if (!FAncestor || A) {
      OnFindAncestor(this, Component, Component->Name(), A, FRootAncestor);
      FAncestor = A;
    }
  }
  Component->WriteState(this);
}

void TWriter::WriteChild(TComponent* Child) {
  WriteComponent(Child);
  ++FChildPos;
}

void TWriter::WriteData(TComponent* Instance) {
  TFilerFlags Flags;
  int Pos = -1;
  if (FAncestorInherited) Flags.Include(ffInherited);
  if (Instance->ComponentState().Contains(csInline)) Flags.Include(ffInline);
  if (FChildren && TakesChildPosition(Instance)) {
    Flags.Include(ffChildPos);
    Pos = static_cast<int>(FChildPos);
  }
  WriteFilerFlags(Flags, Pos);
  WriteStr(Instance->ClassName());
  WriteStr(Instance->Name());
  WriteProperties(Instance);
  WriteListEnd();
  if (!FIgnoreChildren) WriteChildren(Instance);
  WriteListEnd();
}

bool TWriter::TakesChildPosition(TComponent* Instance) {
  // Mirror what the reader will do: a new child lands at the end, and a child that
  // does not stand where the reader will have it is moved there.
  auto& Order = FChildren->Order;
  const void* Key = FAncestorInherited ? FChildren->Inherited : static_cast<const void*>(Instance);
  if (!FAncestorInherited || FAncestorMoved) Order.push_back(Key);
  if (FChildPos < Order.size() && Order[FChildPos] == Key) return false;
  auto It = std::find(Order.begin(), Order.end(), Key);
  if (It == Order.end()) return false;
  Order.erase(It);
  Order.insert(Order.begin() + static_cast<std::ptrdiff_t>(std::min(FChildPos, Order.size())), Key);
  return true;
}

void TWriter::WriteChildren(TComponent* Instance) {
  detail::TChildList Children;
  auto Restore = Finally([this, OldChildren = FChildren, OldChildPos = FChildPos, OldRoot = FRoot,
                          OldLookupRoot = FLookupRoot, OldRootAncestor = FRootAncestor]() noexcept {
    FChildren = OldChildren;
    FChildPos = OldChildPos;
    FRoot = OldRoot;
    FLookupRoot = OldLookupRoot;
    FRootAncestor = OldRootAncestor;
  });
  if (auto* AncComp = dynamic_cast<TComponent*>(FAncestor)) {
    if (AncComp->ComponentState().Contains(csInline)) FRootAncestor = AncComp;
    AncComp->GetChildren(
        [&](TComponent* C) {
          Children.Order.push_back(C);
          if (!C->Name().empty()) Children.ByName.emplace(UpperCase(C->Name()), C);
        },
        FRootAncestor);
  }
  FChildren = &Children;
  FChildPos = 0;
  // The components of a nested root are written under it and named from it.
  if (Instance != FRoot && Instance->ComponentState().Contains(csInline)) {
    FRoot = Instance;
    FLookupRoot = Instance;
    // A new nested root has no ancestor: nothing under it is inherited from the outer one.
    if (!FAncestor) FRootAncestor = nullptr;
  }
  Instance->GetChildren([this](TComponent* C) { WriteChild(C); }, FRoot);
}

//===----------------------------------------------------------------------===//
// Comparison
//===----------------------------------------------------------------------===//

namespace {
void StreamCollection(TCollection* C, TComponent* Owner, TMemoryStream* Out) {
  TObjectGuard<TWriter> Writer(new TWriter(Out, 1024));
  Writer->SetRoot(Owner);
  Writer->WriteCollection(C);
  Writer->FlushBuffer();
}
} // namespace

bool CollectionsEqual(TCollection* C1, TCollection* C2, TComponent* Owner1, TComponent* Owner2) {
  if (C1 == C2) return true;
  if (!C1 || !C2 || C1->ClassType() != C2->ClassType() || C1->Count() != C2->Count()) return false;
  TObjectGuard<TMemoryStream> S1(new TMemoryStream);
  TObjectGuard<TMemoryStream> S2(new TMemoryStream);
  StreamCollection(C1, Owner1, S1.Get());
  StreamCollection(C2, Owner2, S2.Get());
  return S1->Size() == S2->Size() && std::memcmp(S1->Memory(), S2->Memory(), static_cast<std::size_t>(S1->Size())) == 0;
}

bool AncestorIsValid(TPersistent* Ancestor, TComponent* Root, TComponent* RootAncestor) {
  return Ancestor && RootAncestor && Root && Root->InheritsFrom(RootAncestor->ClassType());
}

bool IsDefaultPropertyValue(TObject* Instance, PPropInfo Prop, const TGetLookupInfoEvent& OnGetLookupInfo,
                            TWriter* Writer, const TFindComponentValueEvent& OnFindComponentValue) {
  if (!Instance || !Prop || !Prop->IsReadable()) return true;
  TPersistent* Ancestor = nullptr;
  TComponent* Root = nullptr;
  TComponent* LookupRoot = nullptr;
  TComponent* RootAncestor = nullptr;
  if (OnGetLookupInfo) OnGetLookupInfo(Ancestor, Root, LookupRoot, RootAncestor);
  else if (Writer) {
    Ancestor = Writer->Ancestor();
    LookupRoot = Writer->LookupRoot();
    RootAncestor = Writer->RootAncestor();
  }
  if (!LookupRoot) LookupRoot = Root;
  TCompareContext Ctx{Ancestor, LookupRoot, RootAncestor, &OnFindComponentValue};
  return IsDefaultValue(Instance, Prop, Ctx);
}

} // namespace formkit
