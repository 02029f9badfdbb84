//===- platform/Reader.cpp - Reading component data -----------------------===//
//
// The reader builds a component tree from component data. Every failure is
// offered to `OnError` where it happens: a handled one skips the property (by
// seeking back to the value and skipping it) or the component (everything it
// created is destroyed first), so the tree never holds half-read objects.
//
//===----------------------------------------------------------------------===//
#include "platform/Filer.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <unordered_set>

namespace formkit {

namespace {
FK_RESOURCESTRING(SReadError, "Stream read error");
FK_RESOURCESTRING(SInvalidImage, "Invalid stream format");
FK_RESOURCESTRING(SUnknownValueTag, "Unknown value tag %d");
FK_RESOURCESTRING(SInvalidLength, "Length %d runs past the end of the stream");
FK_RESOURCESTRING(SNestingTooDeep, "Stream nesting too deep");
FK_RESOURCESTRING(SUnknownProperty, "Property %s does not exist");
FK_RESOURCESTRING(SReadOnlyProperty, "Property %s is read-only");
FK_RESOURCESTRING(SPropertyError, "Error reading %s.%s: %s");
FK_RESOURCESTRING(SClassNotFound, "Class %s not found");
FK_RESOURCESTRING(SNotComponentClass, "Class %s is not a component class");
FK_RESOURCESTRING(SAncestorNotFound, "Ancestor for '%s' not found");
FK_RESOURCESTRING(SMethodNotFound, "Method %s not found");
FK_RESOURCESTRING(SInvalidComponentName, "Invalid component name '%s'");
} // namespace

namespace detail {

struct TLoadedEntry {
  TComponent* Component;
  /// Made by this read (dropped when it fails), or found (an inherited component).
  bool Created;
  /// Whether the read moved a found component, and the parent it had before: restored
  /// when the read fails.
  bool Moved = false;
  TComponent* OldParent = nullptr;
};

} // namespace detail

namespace {
/// A reference read into a property, resolved when the read's references are fixed up.
struct TFixup {
  TPersistent* Instance;
  TComponent* Holder;
  PPropInfo Prop;
  String Name;
  TComponent* LookupRoot;
};
} // namespace

namespace detail {
/// What a reader collects between `BeginReferences` and `EndReferences`.
struct TReaderState {
  std::vector<TLoadedEntry> Loaded;
  std::vector<TFixup> Fixups;
};
} // namespace detail

namespace {

/// Inside a catch block: passes `EReadError` and `EAbort` on, turns any other exception
/// of the library into `EReadError` with its message.
[[noreturn]] void RaiseAsReadError() {
  try {
    throw;
  } catch (const EReadError&) {
    throw;
  } catch (const EAbort&) {
    throw;
  } catch (const Exception& E) {
    throw EReadError(E.Message());
  }
}

bool IsIntTag(TValueType T) { return T == vaInt8 || T == vaInt16 || T == vaInt32 || T == vaInt64; }

[[noreturn]] void BadValue(TValueType T) {
  if (T > vaMaxTag || T == vaNull) throw EReadError(SUnknownValueTag, static_cast<int>(T));
  throw EReadError(SInvalidPropertyValue);
}

class TNestingGuard {
public:
  explicit TNestingGuard(int& Level) : FLevel(Level) {
    if (++FLevel > MaxStreamNesting) {
      --FLevel;
      throw EReadError(SNestingTooDeep);
    }
  }
  ~TNestingGuard() { --FLevel; }
  TNestingGuard(const TNestingGuard&) = delete;
  TNestingGuard& operator=(const TNestingGuard&) = delete;

private:
  int& FLevel;
};

} // namespace

//===----------------------------------------------------------------------===//
// TFiler
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TFiler, "Classes") {}

TFiler::TFiler(TStream* Stream, int BufSize) : FStream(Stream) {
  // Multi-byte values are read through the buffer, so it holds at least one of them.
  FBuffer.resize(static_cast<std::size_t>(std::max(BufSize, 16)));
}

void TFiler::SetRoot(TComponent* Value) {
  FRoot = Value;
  FLookupRoot = Value;
}

//===----------------------------------------------------------------------===//
// TReader: primitives
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TReader, "Classes") {}

TReader::TReader(TStream* Stream, int BufSize) : TFiler(Stream, BufSize) {}

TReader::~TReader() = default;

void TReader::BeforeDestruction() {
  // Give back what was buffered but not consumed, so the stream stands right after
  // the data that was read. A stream that refuses cannot be reported from a teardown.
  if (FStream && FBufEnd > FBufPos) RunIgnoringExceptions([this] { FlushBuffer(); });
  FState.reset();
  inherited::BeforeDestruction();
}

void TReader::FlushBuffer() {
  if (FStream && FBufEnd > FBufPos) FStream->Seek(FBufPos - FBufEnd, soCurrent);
  FBufPos = FBufEnd = 0;
}

void TReader::ReadBufferFill(std::int64_t Min) {
  // Keep the unread tail and top the buffer up behind it.
  std::int64_t Tail = FBufEnd - FBufPos;
  if (Tail > 0 && FBufPos > 0) std::memmove(FBuffer.data(), FBuffer.data() + FBufPos, static_cast<std::size_t>(Tail));
  FBufPos = 0;
  FBufEnd = Tail;
  while (FBufEnd < Min) {
    std::int64_t N = FStream ? FStream->Read(FBuffer.data() + FBufEnd, static_cast<std::int64_t>(FBuffer.size()) - FBufEnd) : 0;
    if (N <= 0) throw EReadError(SReadError);
    FBufEnd += N;
  }
}

std::uint8_t TReader::ReadByte() {
  if (FBufPos == FBufEnd) ReadBufferFill(1);
  return FBuffer[static_cast<std::size_t>(FBufPos++)];
}

void TReader::Read(void* Buffer, std::int64_t Count) {
  auto* Out = static_cast<std::uint8_t*>(Buffer);
  while (Count > 0) {
    std::int64_t Avail = FBufEnd - FBufPos;
    if (Avail == 0) {
      if (Count >= static_cast<std::int64_t>(FBuffer.size())) {
        if (!FStream) throw EReadError(SReadError);
        FStream->ReadBuffer(Out, Count);
        return;
      }
      ReadBufferFill(1);
      continue;
    }
    std::int64_t N = std::min(Avail, Count);
    std::memcpy(Out, FBuffer.data() + FBufPos, static_cast<std::size_t>(N));
    FBufPos += N;
    Out += N;
    Count -= N;
  }
}

std::int64_t TReader::Position() const {
  return (FStream ? FStream->Position() : 0) - (FBufEnd - FBufPos);
}

void TReader::SetPosition(std::int64_t Value) {
  if (FStream) FStream->SetPosition(Value);
  FBufPos = FBufEnd = 0;
}

std::int64_t TReader::Remaining() const {
  if (!FStream) return FBufEnd - FBufPos;
  return FStream->Size() - Position();
}

void TReader::CheckLength(std::int64_t Length) {
  if (Length < 0 || Length > Remaining()) throw EReadError(SInvalidLength, static_cast<long long>(Length));
}

namespace {
template <class T> T ReadLE(TReader* R) {
  std::uint8_t B[sizeof(T)];
  R->Read(B, sizeof B);
  std::uint64_t V = 0;
  for (std::size_t I = 0; I < sizeof(T); ++I) V |= std::uint64_t(B[I]) << (8 * I);
  return static_cast<T>(V);
}
} // namespace

TValueType TReader::ReadValue() { return static_cast<TValueType>(ReadByte()); }

TValueType TReader::NextValue() {
  if (FBufPos == FBufEnd) ReadBufferFill(1);
  return static_cast<TValueType>(FBuffer[static_cast<std::size_t>(FBufPos)]);
}

bool TReader::EndOfList() { return NextValue() == vaNull; }

void TReader::ReadListBegin() {
  if (ReadValue() != vaList) throw EReadError(SInvalidImage);
}

void TReader::ReadListEnd() {
  if (ReadValue() != vaNull) throw EReadError(SInvalidImage);
}

void TReader::ReadSignature() {
  char Sig[4];
  Read(Sig, 4);
  if (std::memcmp(Sig, FilerSignature, 4) != 0) throw EReadError(SInvalidImage);
}

void TReader::ReadFilerFlags(TFilerFlags& Flags, int& Position) {
  std::uint8_t B = ReadByte();
  if ((B & 0xF8) != 0xF0) throw EReadError(SInvalidImage);
  Flags = TFilerFlags::FromMask(B & 0x07);
  Position = -1;
  if (Flags.Contains(ffChildPos)) {
    std::int64_t P = ReadInt64();
    if (P < 0 || P > INT32_MAX) throw EReadError(SInvalidImage);
    Position = static_cast<int>(P);
  }
}

String TReader::ReadStr() {
  std::uint8_t Len = ReadByte();
  String S(Len, '\0');
  Read(S.data(), Len);
  return S;
}

std::int32_t TReader::ReadInteger() {
  TValueType T = ReadValue();
  switch (T) {
  case vaInt8: return ReadLE<std::int8_t>(this);
  case vaInt16: return ReadLE<std::int16_t>(this);
  case vaInt32: return ReadLE<std::int32_t>(this);
  default: BadValue(T);
  }
}

std::int64_t TReader::ReadInt64() {
  if (NextValue() == vaInt64) {
    ReadValue();
    return ReadLE<std::int64_t>(this);
  }
  return ReadInteger();
}

namespace {
double BitsToDouble(std::uint64_t Bits) {
  double D;
  std::memcpy(&D, &Bits, sizeof D);
  return D;
}
} // namespace

double TReader::ReadFloat() {
  TValueType T = NextValue();
  if (T == vaDouble || T == vaDate) {
    ReadValue();
    return BitsToDouble(ReadLE<std::uint64_t>(this));
  }
  if (IsIntTag(T)) return static_cast<double>(ReadInt64());
  ReadValue();
  BadValue(T);
}

double TReader::ReadDate() { return ReadFloat(); }

void TReader::ReadFloatProp(TPersistent* Instance, PPropInfo Prop) {
  double Value = ReadFiniteFloat();
  double Old = GetFloatProp(Instance, Prop);
  SetFloatProp(Instance, Prop, Value);
  // A number too large for a narrower property turns infinite there: refuse it and keep
  // what was there.
  if (!std::isfinite(GetFloatProp(Instance, Prop))) {
    SetFloatProp(Instance, Prop, Old);
    throw EReadError(SInvalidPropertyValue);
  }
}

double TReader::ReadFiniteFloat() {
  // A value that no form file can hold (not a number, infinite) is not given to an object.
  double D = ReadFloat();
  if (!std::isfinite(D)) throw EReadError(SInvalidPropertyValue);
  return D;
}

bool TReader::ReadBoolean() {
  TValueType T = ReadValue();
  if (T == vaTrue) return true;
  if (T == vaFalse) return false;
  BadValue(T);
}

String TReader::ReadString() {
  TValueType T = ReadValue();
  if (T == vaString) return ReadStr();
  if (T != vaLString) BadValue(T);
  std::int64_t Len = ReadLE<std::uint32_t>(this);
  CheckLength(Len);
  String S(static_cast<std::size_t>(Len), '\0');
  Read(S.data(), Len);
  return S;
}

String TReader::ReadIdent() {
  TValueType T = ReadValue();
  switch (T) {
  case vaIdent: return ReadStr();
  case vaFalse: return "False";
  case vaTrue: return "True";
  case vaNil: return "nil";
  case vaVarNull: return "null";
  default: BadValue(T);
  }
}

TVariant TReader::ReadVariant() {
  TValueType T = NextValue();
  switch (T) {
  case vaInt8:
  case vaInt16:
  case vaInt32: return TVariant(ReadInteger());
  case vaInt64: return TVariant(ReadInt64());
  case vaDouble: return TVariant(ReadFiniteFloat());
  case vaDate: return TVariant::Date(ReadFiniteFloat());
  case vaString:
  case vaLString: return TVariant(ReadString());
  case vaFalse:
  case vaTrue: return TVariant(ReadBoolean());
  case vaNil: ReadValue(); return TVariant();
  case vaVarNull: ReadValue(); return TVariant::Null();
  default: ReadValue(); BadValue(T);
  }
}

void TReader::SkipValue() {
  auto SkipBytes = [this](std::int64_t N) {
    if (N <= FBufEnd - FBufPos) {
      FBufPos += N;
      return;
    }
    CheckLength(N);
    SetPosition(Position() + N);
  };
  TValueType T = ReadValue();
  switch (T) {
  case vaList: {
    TNestingGuard G(FNesting);
    while (!EndOfList()) SkipValue();
    ReadListEnd();
    break;
  }
  case vaInt8: SkipBytes(1); break;
  case vaInt16: SkipBytes(2); break;
  case vaInt32: SkipBytes(4); break;
  case vaDouble:
  case vaDate:
  case vaInt64: SkipBytes(8); break;
  case vaString:
  case vaIdent: SkipBytes(ReadByte()); break;
  case vaFalse:
  case vaTrue:
  case vaNil:
  case vaVarNull: break;
  case vaBinary:
  case vaLString: SkipBytes(ReadLE<std::uint32_t>(this)); break;
  case vaSet:
    for (std::uint8_t N = ReadByte(); N != 0; N = ReadByte()) SkipBytes(N);
    break;
  case vaCollection: {
    TNestingGuard G(FNesting);
    while (!EndOfList()) {
      if (IsIntTag(NextValue())) ReadInt64();
      ReadListBegin();
      while (!EndOfList()) SkipProperty();
      ReadListEnd();
    }
    ReadListEnd();
    break;
  }
  default: BadValue(T);
  }
}

void TReader::SkipProperty() {
  ReadStr();
  SkipValue();
}

void TReader::SkipComponent(bool SkipHeader) {
  TNestingGuard G(FNesting);
  if (SkipHeader) {
    TFilerFlags Flags;
    int Pos;
    ReadFilerFlags(Flags, Pos);
    ReadStr();
    ReadStr();
  }
  while (!EndOfList()) SkipProperty();
  ReadListEnd();
  while (!EndOfList()) SkipComponent(true);
  ReadListEnd();
}

//===----------------------------------------------------------------------===//
// TReader: hooks
//===----------------------------------------------------------------------===//

bool TReader::Error(const String& Message) {
  bool Handled = false;
  if (OnError) OnError(this, Message, Handled);
  return Handled;
}

void* TReader::FindMethod(TComponent* ARoot, const String& MethodName) {
  void* Address = ARoot ? ARoot->MethodAddress(MethodName) : nullptr;
  bool Err = Address == nullptr;
  if (OnFindMethod) OnFindMethod(this, MethodName, Address, Err);
  if (Err || !Address) throw EReadError(SMethodNotFound, MethodName);
  return Address;
}

TClass TReader::FindComponentClass(const String& ClassName) {
  TClass C = GetClass(ClassName);
  if (C && !C->InheritsFrom(TComponent::StaticClass())) C = nullptr;
  if (!C && OnFindComponentClass) OnFindComponentClass(this, ClassName, C);
  if (!C) throw EReadError(SClassNotFound, ClassName);
  if (!C->InheritsFrom(TComponent::StaticClass())) throw EReadError(SNotComponentClass, ClassName);
  return C;
}

//===----------------------------------------------------------------------===//
// TReader: properties
//===----------------------------------------------------------------------===//

void TReader::ReadProperty(TPersistent* Instance) {
  String Name = ReadStr();
  std::int64_t ValueStart = Position();
  try {
    // A dotted name walks into sub-objects: "Font.Size".
    TPersistent* Obj = Instance;
    std::string_view Rest = Name;
    for (std::size_t Dot = Rest.find('.'); Dot != std::string_view::npos; Dot = Rest.find('.')) {
      PPropInfo P = Obj->ClassType()->FindProperty(Rest.substr(0, Dot));
      auto* Sub = P && P->Kind() == tkClass && P->IsReadable() ? dynamic_cast<TPersistent*>(GetObjectProp(Obj, P)) : nullptr;
      if (!Sub) throw EReadError(SUnknownProperty, Name);
      Obj = Sub;
      Rest = Rest.substr(Dot + 1);
    }
    PPropInfo P = Obj->ClassType()->FindProperty(Rest);
    if (P && P->IsReadable()) {
      ReadPropValue(Obj, P);
    } else {
      FPropName = String(Rest);
      Obj->DefineProperties(this);
      if (!FPropName.empty()) {
        FPropName.clear();
        throw EReadError(SUnknownProperty, Name);
      }
    }
  } catch (const EAbort&) {
    throw;
  } catch (const Exception& E) {
    FPropName.clear();
    if (FErrorRefused) throw;
    String Msg = Format(LoadResString(SPropertyError), Instance->GetNamePath(), Name, E.Message());
    if (!Error(Msg)) {
      FErrorRefused = true;
      throw EReadError(Msg);
    }
    SetPosition(ValueStart);
    SkipValue();
  }
}

namespace {
/// An integer or character property: the value must lie in the type's range.
void ReadIntegerValue(TReader& R, TPersistent* Instance, PPropInfo Prop, PTypeInfo Type) {
  std::int64_t V = R.ReadInt64();
  if (V < Type->Data.MinValue || V > Type->Data.MaxValue) throw EReadError(SInvalidPropertyValue);
  SetOrdProp(Instance, Prop, V);
}

/// An enumeration property: a name of the type, or True or False for a Boolean.
void ReadEnumValue(TReader& R, TPersistent* Instance, PPropInfo Prop, PTypeInfo Type) {
  TValueType T = R.NextValue();
  int V;
  if (T == vaFalse || T == vaTrue) V = R.ReadBoolean() ? 1 : 0;
  else V = GetEnumValue(Type, R.ReadIdent());
  PTypeInfo Base = Type->Data.BaseType ? Type->Data.BaseType() : Type;
  if (V < 0 || V >= static_cast<int>(Base->Data.EnumNames.size())) throw EReadError(SInvalidPropertyValue);
  SetOrdProp(Instance, Prop, V);
}

/// A set property: the names of its elements, up to an empty one.
void ReadSetValue(TReader& R, TPersistent* Instance, PPropInfo Prop, PTypeInfo Type) {
  TValueType T = R.ReadValue();
  if (T != vaSet) BadValue(T);
  PTypeInfo Comp = Type->Data.CompType ? Type->Data.CompType() : nullptr;
  std::uint64_t Mask = 0;
  for (String Element = R.ReadStr(); !Element.empty(); Element = R.ReadStr()) {
    int V = Comp ? GetEnumValue(Comp, Element) : -1;
    if (V < 0 || V > 63) throw EReadError(SInvalidPropertyValue);
    Mask |= std::uint64_t(1) << V;
  }
  SetOrdProp(Instance, Prop, static_cast<std::int64_t>(Mask));
}

/// A method property: nil, or the name of a method of the root being read.
void ReadMethodValue(TReader& R, TPersistent* Instance, PPropInfo Prop) {
  TValueType T = R.NextValue();
  if (T == vaNil) {
    R.ReadValue();
    SetMethodProp(Instance, Prop, TMethod{});
    return;
  }
  if (T != vaIdent) {
    R.ReadValue();
    BadValue(T);
  }
  String Name = R.ReadIdent();
  void* Code = R.FindMethod(R.Root(), Name);
  SetMethodProp(Instance, Prop, TMethod{Code, static_cast<TObject*>(R.Root())});
}
} // namespace

void TReader::ReadObjectValue(TPersistent* Instance, PPropInfo Prop, TTypeKind Kind) {
  TValueType T = ReadValue();
  if (T == vaNil) {
    if (!Prop->IsWritable()) throw EReadError(SReadOnlyProperty, Prop->Name);
    if (Kind == tkClass) SetOrdProp(Instance, Prop, 0);
    else SetInterfaceProp(Instance, Prop, nullptr);
  } else if (T == vaIdent) {
    String Name = ReadStr();
    TClass PropClass = Kind == tkClass ? GetObjectPropClass(Prop) : nullptr;
    bool IsComponentClass = Kind == tkInterface || (PropClass && PropClass->InheritsFrom(TComponent::StaticClass()));
    if (!Prop->IsWritable() || !IsComponentClass || Name.empty()) throw EReadError(SInvalidPropertyValue);
    if (!FState) throw EReadError(SInvalidPropertyValue);
    FState->Fixups.push_back({Instance, FCurrent, Prop, Name, FLookupRoot});
  } else if (T == vaCollection && Kind == tkClass) {
    auto* Coll = dynamic_cast<TCollection*>(GetObjectProp(Instance, Prop));
    if (!Coll) throw EReadError(SInvalidPropertyValue);
    ReadCollection(Coll);
  } else {
    BadValue(T);
  }
}

void TReader::ReadPropValue(TPersistent* Instance, PPropInfo Prop) {
  PTypeInfo Type = Prop->PropType();
  TTypeKind Kind = Type->Kind;
  if (Kind != tkClass && !Prop->IsWritable()) throw EReadError(SReadOnlyProperty, Prop->Name);
  switch (Kind) {
  case tkInteger:
  case tkChar:
  case tkWChar: ReadIntegerValue(*this, Instance, Prop, Type); break;
  case tkEnumeration: ReadEnumValue(*this, Instance, Prop, Type); break;
  case tkSet: ReadSetValue(*this, Instance, Prop, Type); break;
  case tkInt64: SetInt64Prop(Instance, Prop, ReadInt64()); break;
  case tkFloat: ReadFloatProp(Instance, Prop); break;
  case tkString:
  case tkLString:
  case tkWString:
  case tkUString: SetStrProp(Instance, Prop, ReadString()); break;
  case tkVariant: SetVariantProp(Instance, Prop, ReadVariant()); break;
  case tkMethod: ReadMethodValue(*this, Instance, Prop); break;
  case tkClass:
  case tkInterface: ReadObjectValue(Instance, Prop, Kind); break;
  default: throw EReadError(SInvalidPropertyValue);
  }
}

void TReader::ReadCollection(TCollection* Collection) {
  TNestingGuard G(FNesting);
  Collection->BeginUpdate();
  // Ending the update tells the collection's owner, which may fail: after a failure here
  // that one passes on, after success its own does.
  auto End = OnFailure([Collection]() noexcept { RunIgnoringExceptions([Collection] { Collection->EndUpdate(); }); });
  // The items go: references read into them earlier (the property came twice) must not
  // be written into freed items.
  if (Collection->Count() > 0) ForgetFixupsInto(Collection);
  Collection->Clear();
  while (!EndOfList()) {
    if (IsIntTag(NextValue())) ReadInt64();
    ReadListBegin();
    TCollectionItem* Item = Collection->Add();
    while (!EndOfList()) ReadProperty(Item);
    ReadListEnd();
  }
  ReadListEnd();
  End.Dismiss();
  Collection->EndUpdate();
}

namespace {
bool IsWithin(TPersistent* Obj, const TPersistent* Container) {
  for (TPersistent* P = Obj; P; P = P->GetOwner())
    if (P == Container) return true;
  return false;
}
} // namespace

void TReader::ForgetFixupsInto(TCollection* Collection) {
  if (!FState) return;
  // The current component's references were read last: they are the tail of the list.
  auto& Fixups = FState->Fixups;
  std::size_t First = Fixups.size();
  while (First > 0 && Fixups[First - 1].Holder == FCurrent) --First;
  auto Gone = std::remove_if(Fixups.begin() + static_cast<std::ptrdiff_t>(First), Fixups.end(),
                             [&](const TFixup& F) { return IsWithin(F.Instance, Collection); });
  Fixups.erase(Gone, Fixups.end());
}

void TReader::DefineProperty(const String& Name, const TReaderProc& ReadData, const TWriterProc&, bool) {
  if (FPropName.empty() || !ReadData || !SameText(Name, FPropName)) return;
  FPropName.clear();
  ReadData(this);
}

void TReader::DefineBinaryProperty(const String& Name, const TStreamProc& ReadData, const TStreamProc&, bool) {
  if (FPropName.empty() || !SameText(Name, FPropName)) return;
  FPropName.clear();
  TValueType T = ReadValue();
  if (T != vaBinary) BadValue(T);
  std::int64_t Len = ReadLE<std::uint32_t>(this);
  CheckLength(Len);
  TObjectGuard<TMemoryStream> Data(new TMemoryStream);
  Data->SetSize(Len);
  Read(Data->Memory(), Len);
  Data->SetPosition(0);
  if (ReadData) ReadData(Data.Get());
}

//===----------------------------------------------------------------------===//
// TReader: components
//===----------------------------------------------------------------------===//

void TReader::BeginReferences() {
  if (!FState) FState = std::make_unique<detail::TReaderState>();
}

void TReader::EndReferences() noexcept { FState.reset(); }

void TReader::ClearLoadingFlags() noexcept {
  if (!FState) return;
  for (const detail::TLoadedEntry& E : FState->Loaded) {
    E.Component->SetReading(false);
    E.Component->SetLoading(false);
  }
}

void TReader::DoFixupReferences() {
  if (!FState) return;
  std::vector<TFixup> Fixups = std::move(FState->Fixups);
  FState->Fixups.clear();
  for (const TFixup& F : Fixups) {
    String Name = F.Name;
    if (OnReferenceName) OnReferenceName(this, Name);
    TComponent* Target = detail::FindReference(F.LookupRoot, Name);
    if (!Target && F.LookupRoot == FRoot && !FStreamRootName.empty()) {
      std::size_t Dot = Name.find('.');
      if (SameText(std::string_view(Name).substr(0, Dot), FStreamRootName))
        Target = Dot == String::npos ? FRoot : FindNestedComponent(FRoot, std::string_view(Name).substr(Dot + 1));
    }
    if (!Target) {
      detail::AddGlobalFixup(FRoot, F.Instance, F.Holder, F.Prop, Name);
      continue;
    }
    try {
      detail::SetReferenceProp(F.Instance, F.Prop, Target);
    } catch (const EAbort&) {
      throw;
    } catch (const Exception& E) {
      String Msg = Format(LoadResString(SPropertyError), F.Instance->GetNamePath(), F.Prop->Name, E.Message());
      if (!Error(Msg)) throw EReadError(Msg);
    }
  }
}

void TReader::FixupReferences() {
  if (!FState) return;
  DoFixupReferences();
  std::vector<detail::TLoadedEntry> Loaded = std::move(FState->Loaded);
  FState->Loaded.clear();
  for (const detail::TLoadedEntry& E : Loaded) {
    E.Component->SetReading(false);
    E.Component->Loaded();
  }
}

void TReader::DropCreatedAfter(std::size_t LoadedIndex) noexcept {
  if (!FState || LoadedIndex >= FState->Loaded.size()) return;
  auto& Loaded = FState->Loaded;
  // What the read found and moved goes back where it was first, latest move first, so
  // that dropping a new container never takes a component it did not create with it.
  std::vector<TComponent*> Gone;
  for (std::size_t I = Loaded.size(); I-- > LoadedIndex;) {
    const detail::TLoadedEntry& E = Loaded[I];
    if (E.Created) {
      Gone.push_back(E.Component);
      continue;
    }
    E.Component->SetReading(false);
    E.Component->SetLoading(false);
    RestoreParent(E);
  }
  Loaded.resize(LoadedIndex);
  std::unordered_set<TComponent*> GoneSet(Gone.begin(), Gone.end());
  std::erase_if(FState->Fixups, [&](const TFixup& F) { return GoneSet.count(F.Holder) != 0; });
  // Last created first: children before their parents and owners.
  FreeComponentsTogether(Gone);
}

void TReader::RestoreParent(const detail::TLoadedEntry& E) noexcept {
  TComponent* C = E.Component;
  if (!E.Moved || C->GetParentComponent() == E.OldParent) return;
  try {
    C->SetParentComponent(E.OldParent);
  } catch (...) {
    // The component had that parent before the read: taking it back cannot be refused.
    // Should a framework refuse anyway, leave it without one rather than with a parent
    // that is about to go.
    RunIgnoringExceptions([C] { C->SetParentComponent(nullptr); });
  }
}

void TReader::ReadData(TComponent* Instance) {
  if (FState) {
    ReadDataInner(Instance);
    return;
  }
  BeginReferences();
  auto End = Finally([this]() noexcept { EndReferences(); });
  ReadDataInner(Instance);
  DoFixupReferences();
}

void TReader::ReadDataInner(TComponent* Instance) {
  TNestingGuard G(FNesting);
  auto Restore = Finally([this, OldCurrent = FCurrent, OldParent = FParent, OldOwner = FOwner,
                          OldLookupRoot = FLookupRoot]() noexcept {
    FCurrent = OldCurrent;
    FParent = OldParent;
    FOwner = OldOwner;
    FLookupRoot = OldLookupRoot;
  });
  FCurrent = Instance;
  while (!EndOfList()) ReadProperty(Instance);
  ReadListEnd();
  FParent = Instance;
  // The components of a nested root belong to it and are found under it by name.
  if (Instance != FRoot && Instance->ComponentState().Contains(csInline)) {
    FOwner = Instance;
    FLookupRoot = Instance;
  }
  while (!EndOfList()) ReadComponent(nullptr);
  ReadListEnd();
}

TComponent* TReader::ReadComponent(TComponent* Component) {
  std::int64_t Start = Position();
  TFilerFlags Flags;
  int ChildPos;
  ReadFilerFlags(Flags, ChildPos);
  String ClassName = ReadStr();
  String Name = ReadStr();
  BeginReferences();
  std::size_t LoadedIndex = FState->Loaded.size();
  TComponent* Result = Component;
  try {
    // Whatever went wrong, what this component brought goes before the failure is
    // offered to the handler.
    auto Drop = OnFailure([this, LoadedIndex]() noexcept { DropCreatedAfter(LoadedIndex); });
    if (Result) {
      FState->Loaded.push_back({Result, false});
    } else if (Flags.Contains(ffInherited)) {
      Result = FLookupRoot ? FLookupRoot->FindComponent(Name) : nullptr;
      if (!Result) {
        TClass Class = FindComponentClass(ClassName);
        if (OnAncestorNotFound) OnAncestorNotFound(this, Name, Class, Result);
        if (!Result) throw EReadError(SAncestorNotFound, Name);
      }
      FState->Loaded.push_back({Result, false});
    } else {
      TClass Class = FindComponentClass(ClassName);
      if (OnCreateComponent) OnCreateComponent(this, Class, Result);
      if (!Result) Result = CreateComponent(Class, FOwner);
      FState->Loaded.push_back({Result, true});
      if (Flags.Contains(ffInline)) Result->SetInline(true);
      // Loading before the name: what follows the name (a caption) must not react to it.
      Result->SetLoading(true);
      String NewName = Name;
      if (OnSetName) OnSetName(this, Result, NewName);
      if (!NewName.empty() && !IsValidIdent(NewName)) throw EReadError(SInvalidComponentName, NewName);
      Result->SetName(NewName);
    }
    Result->SetLoading(true);
    Result->SetReading(true);
    if (FParent && Result != FParent && Result->HasParent() && Result->GetParentComponent() != FParent) {
      detail::TLoadedEntry& Entry = FState->Loaded[LoadedIndex];
      Entry.Moved = !Entry.Created;
      Entry.OldParent = Result->GetParentComponent();
      Result->SetParentComponent(FParent);
    }
    Result->ReadState(this);
    Result->SetReading(false);
    if (Flags.Contains(ffChildPos) && FParent) FParent->SetChildOrder(Result, ChildPos);
  } catch (const EAbort&) {
    throw;
  } catch (const Exception& E) {
    if (FErrorRefused) throw;
    if (!Error(E.Message())) {
      FErrorRefused = true;
      RaiseAsReadError();
    }
    SetPosition(Start);
    SkipComponent(true);
    return nullptr;
  }
  return Result;
}

TComponent* TReader::ReadRootComponent(TComponent* ARoot) {
  FErrorRefused = false;
  ReadSignature();
  TFilerFlags Flags;
  int Pos;
  ReadFilerFlags(Flags, Pos);
  String ClassName = ReadStr();
  String Name = ReadStr();
  FStreamRootName = Name;
  bool CreatedRoot = false;
  if (!ARoot) {
    try {
      ARoot = CreateComponent(FindComponentClass(ClassName), nullptr);
    } catch (...) {
      RaiseAsReadError();
    }
    CreatedRoot = true;
  }
  bool OwnReferences = !FState;
  try {
    auto Undo = OnFailure([this, ARoot, OwnReferences, CreatedRoot]() noexcept {
      RemoveFixupReferences(ARoot, "");
      ClearLoadingFlags();
      if (OwnReferences) EndReferences();
      if (CreatedRoot) {
        SetRoot(nullptr);
        ARoot->Destroy();
      }
    });
    if (ARoot->Name().empty() && !Name.empty()) {
      if (!IsValidIdent(Name)) throw EReadError(SInvalidComponentName, Name);
      ARoot->ChangeName(Name);
    }
    SetRoot(ARoot);
    FOwner = ARoot;
    FParent = nullptr;
    BeginReferences();
    FState->Loaded.push_back({ARoot, false});
    ARoot->SetLoading(true);
    ARoot->SetReading(true);
    ARoot->ReadState(this);
    ARoot->SetReading(false);
    DoFixupReferences();
    if (OwnReferences) {
      std::vector<TComponent*> Loaded;
      Loaded.reserve(FState->Loaded.size());
      for (const detail::TLoadedEntry& E : FState->Loaded) Loaded.push_back(E.Component);
      EndReferences();
      if (!detail::AddGlobalLoaded(Loaded))
        for (TComponent* C : Loaded) C->Loaded();
    }
    GlobalFixupReferences();
  } catch (...) {
    RaiseAsReadError();
  }
  return ARoot;
}

void TReader::ReadComponents(TComponent* AOwner, TComponent* AParent, const TReadComponentsProc& Proc) {
  FErrorRefused = false;
  SetRoot(AOwner);
  FOwner = AOwner;
  FParent = AParent;
  bool OwnReferences = !FState;
  BeginReferences();
  try {
    auto End = Finally([this, OwnReferences]() noexcept {
      if (OwnReferences) EndReferences();
    });
    // What was read stays, without the references that were still open.
    auto Unflag = OnFailure([this]() noexcept { ClearLoadingFlags(); });
    while (!EndOfList()) {
      ReadSignature();
      TComponent* C = ReadComponent(nullptr);
      if (C && Proc) Proc(C);
    }
    ReadListEnd();
    FixupReferences();
  } catch (...) {
    RaiseAsReadError();
  }
}

} // namespace formkit
