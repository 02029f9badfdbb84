//===- core/root/RootFormEditor.cpp - A module as the tool interfaces show it ===//
#include "core/root/RootFormEditor.h"

#include "core/IStreams.h"
#include "platform/ScopeGuard.h"
#include "platform/Variants.h"

#include <algorithm>
#include <cstring>
#include <ctime>

namespace formkit {

FK_IMPLEMENT(TOTAFormEditor, "ComponentDesigner") {}
FK_IMPLEMENT(TOTAComponent, "ComponentDesigner") {}
FK_IMPLEMENT(TAncestorNotifier, "ComponentDesigner") {}
FK_IMPLEMENT(TEnvironmentTools, "ComponentDesigner") {}

namespace {

/// A new wrapper of `Object` in the module of `Root`, or null for null.
IPtr<IOTAComponent> WrapObject(TPersistent* Object, TComponentRoot* Root) {
  if (!Object) return nullptr;
  return NewAs<IOTAComponent, TOTAComponent>(Object, Root);
}

/// The UTC time of a packed local file date (date in the high word, time in the low
/// word, seconds halved), or nothing when the date is no valid one.
std::optional<TDateTime> PackedLocalDateToUtc(int Packed) {
  const auto Bits = static_cast<std::uint32_t>(Packed);
  std::tm Local{};
  Local.tm_year = static_cast<int>(Bits >> 25) + 80;
  Local.tm_mon = static_cast<int>((Bits >> 21) & 0xF) - 1;
  Local.tm_mday = static_cast<int>((Bits >> 16) & 0x1F);
  Local.tm_hour = static_cast<int>((Bits >> 11) & 0x1F);
  Local.tm_min = static_cast<int>((Bits >> 5) & 0x3F);
  Local.tm_sec = static_cast<int>(Bits & 0x1F) * 2;
  Local.tm_isdst = -1;
  const std::tm Given = Local;
  std::time_t Time = std::mktime(&Local);
  // mktime normalises what is out of range (the 30th of February, hour 25): no such date.
  if (Time == static_cast<std::time_t>(-1) || Local.tm_mon != Given.tm_mon || Local.tm_mday != Given.tm_mday ||
      Local.tm_hour != Given.tm_hour || Local.tm_min != Given.tm_min || Local.tm_sec != Given.tm_sec)
    return std::nullopt;
  std::tm Utc{};
  if (!gmtime_r(&Time, &Utc)) return std::nullopt;
  return EncodeDate(Utc.tm_year + 1900, Utc.tm_mon + 1, Utc.tm_mday) +
         EncodeTime(Utc.tm_hour, Utc.tm_min, Utc.tm_sec, 0);
}

} // namespace

//===----------------------------------------------------------------------===//
// The root's facade
//===----------------------------------------------------------------------===//

IPtr<IOTAFormEditor> TComponentRoot::GetFormEditor() {
  if (!FOTAFormEditor) {
    IPtr<TOTAFormEditor> Editor = New<TOTAFormEditor>(this);
    FOTAFormEditorRef = IPtr<IOTAFormEditor>(Editor.Get());
    FOTAFormEditor = Editor.Get();
    // A test fixture may have put its own hook in; a missing one is ours.
    if (!TRootHooks::NotifyFormEditorRenamed) InitializeRootFormEditor();
  }
  return FOTAFormEditorRef;
}

void InitializeRootFormEditor() {
  TRootHooks::NotifyFormEditorRenamed = [](TComponentRoot& Root, TComponent* Component, const String& CurName,
                                           const String& NewName) {
    if (TOTAFormEditor* Editor = TOTAFormEditor::Of(Root)) Editor->NotifyRenamed(Component, CurName, NewName);
  };
}

//===----------------------------------------------------------------------===//
// TOTAFormEditor: the editor
//===----------------------------------------------------------------------===//

TOTAFormEditor::TOTAFormEditor(TComponentRoot* Root) : FComponentRoot(Root) {
  // Lives by its counted references, not until it is freed.
  DropOwnReference();
}

IPtr<IOTAComponent> TOTAFormEditor::Wrap(TPersistent* Object) { return WrapObject(Object, FComponentRoot); }

int TOTAFormEditor::AddNotifier(const IPtr<IOTANotifier>& Notifier) {
  return AddToList(FNotifyList, QueryAs<IInterface>(Notifier));
}

String TOTAFormEditor::GetFileName() { return FComponentRoot->GetFileName(); }

bool TOTAFormEditor::GetModified() { return FComponentRoot->GetTimeAtLoad() != FComponentRoot->GetModifyTime(); }

IPtr<IOTAModule> TOTAFormEditor::GetModule() { return QueryAs<IOTAModule>(FComponentRoot->GetModule()); }

bool TOTAFormEditor::MarkModified() {
  FComponentRoot->Modified();
  return true;
}

void TOTAFormEditor::RemoveNotifier(int Index) { FNotifyList->Put(Index, nullptr); }

void TOTAFormEditor::Show() { FComponentRoot->AsRoot()->Show(); }

IPtr<IOTAComponent> TOTAFormEditor::GetRootComponent() { return Wrap(FComponentRoot->GetRoot()); }

IPtr<IOTAComponent> TOTAFormEditor::FindComponent(const String& Name) {
  TComponent* Root = FComponentRoot->GetRoot();
  return Root ? Wrap(Root->FindComponent(Name)) : nullptr;
}

IPtr<IOTAComponent> TOTAFormEditor::GetComponentFromHandle(TOTAHandle ComponentHandle) {
  // The handle is an address an add-in was given; it is taken on trust.
  return Wrap(static_cast<TPersistent*>(ComponentHandle));
}

int TOTAFormEditor::GetSelCount() {
  return FComponentRoot->FSelections ? FComponentRoot->FSelections->GetCount() : 0;
}

IPtr<IOTAComponent> TOTAFormEditor::GetSelComponent(int Index) {
  if (Index >= 0 && Index < GetSelCount()) return Wrap(FComponentRoot->FSelections->GetPersistents(Index));
  if (Index == 0) return Wrap(FComponentRoot->GetRoot());
  return nullptr;
}

IPtr<IOTAComponent> TOTAFormEditor::GetCreateParent() { return Wrap(FComponentRoot->FindCurrentParent()); }

IPtr<IOTAComponent> TOTAFormEditor::CreateComponent(const IPtr<IOTAComponent>& Container, const String& TypeName,
                                                    int X, int Y, int W, int H) {
  TClass Class = GetClass(TypeName);
  if (!Class || !Class->InheritsFrom(TComponent::StaticClass())) return nullptr;
  TComponent* Parent = nullptr;
  if (auto Native = QueryAs<INTAComponent>(Container); Native && dynamic_cast<TComponent*>(Native->GetPersistent()))
    Parent = Native->GetComponent();
  if (!Parent) Parent = FComponentRoot->GetRoot();
  return Wrap(FComponentRoot->CreateComponent(Class, Parent, X, Y, W, H));
}

void TOTAFormEditor::GetFormResource(const IPtr<IStream>& Stream) {
  TVirtualStream Target(Stream);
  GetFormResource(static_cast<TStream*>(&Target));
}

IPtr<IDesigner> TOTAFormEditor::GetFormDesigner() { return FComponentRoot->AsDesigner(); }

void TOTAFormEditor::GetFormResource(TStream* Stream) {
  Stream->CopyFrom(FComponentRoot->GetRootStream(), 0, DefaultCopyBufferSize);
  Stream->SetPosition(0);
}

//===----------------------------------------------------------------------===//
// TOTAFormEditor: the content
//===----------------------------------------------------------------------===//

IPtr<IStream> TOTAFormEditor::GetContent() {
  TStream* Stream = FComponentRoot->GetRootStream();
  if (auto* Memory = dynamic_cast<TMemoryStream*>(Stream)) return NewAs<IStream, TIMemoryStream>(Memory);
  return NewAs<IStream, TStreamAdapter>(Stream);
}

void TOTAFormEditor::SetContent(const IPtr<IStream>& Content) {
  TComponentRoot& Root = *FComponentRoot;
  const bool WasDormant = Root.IsDormant();
  if (!WasDormant) {
    // While closing, no listener can bring the module back during its shut-down.
    Root.FClosing = true;
    auto Open = Finally([&Root]() noexcept { Root.FClosing = false; });
    Root.GoDormant();
  }
  TMemoryStream* Old = Root.FDormantStream;
  auto* Fresh = new TMemoryStream;
  Root.FDormantStream = Fresh;
  auto Undo = OnFailure([&Root, Old, Fresh]() noexcept {
    // A failed read leaves the module dormant on its old content. Once the module has
    // come back to life it has taken the new content, and only the old one goes.
    if (Root.FDormantStream == Fresh) {
      Fresh->Destroy();
      Root.FDormantStream = Old;
    } else if (Old) {
      Old->Destroy();
    }
  });
  {
    TOleStream Source(Content);
    Fresh->CopyFrom(&Source, 0, DefaultCopyBufferSize);
    Fresh->SetPosition(0);
  }
  if (!WasDormant) {
    Root.Resurrect();
    const int ModifyTime = Root.FModifyTime;
    auto Keep = Finally([&Root, ModifyTime]() noexcept { Root.FModifyTime = ModifyTime; });
    Root.Modified();
  }
  if (Old) Old->Destroy();
}

TDateTime TOTAFormEditor::GetContentAge() {
  const int Packed = FComponentRoot->GetModifyTime();
  if (Packed != -1)
    if (std::optional<TDateTime> Age = PackedLocalDateToUtc(Packed)) return *Age;
  return Now();
}

void TOTAFormEditor::ResetDiskAge() { FComponentRoot->FDiskAge = FComponentRoot->GetModifyTime(); }

//===----------------------------------------------------------------------===//
// TOTAFormEditor: notifications
//===----------------------------------------------------------------------===//

void TOTAFormEditor::FormModified() {
  ForEach(FNotifyList, [](const IPtr<IInterface>& Item, const IPtr<IInterface>&) {
    if (auto Notifier = QueryAs<IOTANotifier>(Item)) Notifier->Modified();
  });
}

void TOTAFormEditor::FormSaving() {
  ForEach(FNotifyList, [](const IPtr<IInterface>& Item, const IPtr<IInterface>&) {
    if (auto Notifier = QueryAs<IOTAFormNotifier>(Item)) Notifier->FormSaving();
  });
}

void TOTAFormEditor::NotifyActivate() {
  ForEach(FNotifyList, [](const IPtr<IInterface>& Item, const IPtr<IInterface>&) {
    if (auto Notifier = QueryAs<IOTAFormNotifier>(Item)) Notifier->FormActivated();
  });
}

void TOTAFormEditor::NotifyRenamed(TComponent* Component, const String& OldName, const String& NewName) {
  for (int I = 0; I < FNotifyList->GetCount(); ++I)
    if (auto Notifier = QueryAs<IOTAFormNotifier>(FNotifyList->Get(I)))
      Notifier->ComponentRenamed(static_cast<TPersistent*>(Component), OldName, NewName);
}

void TOTAFormEditor::NotifyDestruct() {
  ForEach(FNotifyList, &TOTAClass::NotifyDestroyed);
  FComponentRoot = nullptr;
}

//===----------------------------------------------------------------------===//
// TOTAComponent: the object
//===----------------------------------------------------------------------===//

TOTAComponent::TOTAComponent(TPersistent* Object, TComponentRoot* Root) : FObject(Object), FComponentRoot(Root) {}

TComponent* TOTAComponent::GetComponent() { return dynamic_cast<TComponent*>(FObject); }

TComponent* TOTAComponent::ChildComponent() {
  TComponent* Component = GetComponent();
  return Component && Component != FComponentRoot->GetRoot() ? Component : nullptr;
}

String TOTAComponent::GetComponentType() { return FObject->ClassName(); }

TOTAHandle TOTAComponent::GetComponentHandle() { return FObject; }

IPtr<IOTAComponent> TOTAComponent::GetParent() {
  TComponent* Component = ChildComponent();
  return Component ? WrapObject(FComponentRoot->GetParent(Component), FComponentRoot) : nullptr;
}

bool TOTAComponent::IsTControl() {
  TComponent* Component = GetComponent();
  return Component && FComponentRoot->IsControl(Component);
}

int TOTAComponent::GetControlCount() {
  TComponent* Component = GetComponent();
  return Component ? FComponentRoot->GetControlCount(Component) : 0;
}

IPtr<IOTAComponent> TOTAComponent::GetControl(int Index) {
  TComponent* Component = GetComponent();
  return Component ? WrapObject(FComponentRoot->GetControl(Component, Index), FComponentRoot) : nullptr;
}

int TOTAComponent::GetComponentCount() {
  TComponent* Component = GetComponent();
  return Component ? Component->ComponentCount() : -1;
}

IPtr<IOTAComponent> TOTAComponent::GetComponent(int Index) {
  TComponent* Component = GetComponent();
  return Component ? WrapObject(Component->Components(Index), FComponentRoot) : nullptr;
}

bool TOTAComponent::GetChildren(void* Param, TOTAGetChildCallback Proc) {
  TComponent* Component = GetComponent();
  if (!Component) return false;
  FProc = Proc;
  FParam = Param;
  auto Clear = Finally([this]() noexcept {
    FProc = nullptr;
    FParam = nullptr;
  });
  Component->GetChildren([this](TComponent* Child) { GetChildProc(Child); }, FComponentRoot->GetRoot());
  return true;
}

void TOTAComponent::GetChildProc(TComponent* Child) {
  if (!FProc) Abort();
  bool Result = true;
  FProc(FParam, WrapObject(Child, FComponentRoot), Result);
  if (!Result) Abort();
}

bool TOTAComponent::Select(bool AddToSelection) {
  TComponent* Component = GetComponent();
  if (!Component) return false;
  if (Component == FComponentRoot->GetRoot()) FComponentRoot->ClearSelection();
  else FComponentRoot->Select(Component, AddToSelection);
  return true;
}

bool TOTAComponent::Focus(bool AddToSelection) {
  TComponent* Component = GetComponent();
  if (!Component) return false;
  if (Component != FComponentRoot->GetRoot()) {
    Select(AddToSelection);
    IPtr<ISelections> Items = FComponentRoot->SelectionItems();
    if (Items && Items->GetCount() == 1) {
      Items->GetItems(0)->Edit();
      return true;
    }
  }
  FComponentRoot->AsRoot()->Show();
  return true;
}

bool TOTAComponent::Delete() {
  TComponent* Component = GetComponent();
  if (!Component || !Component->Owner() || Component->Owner() != FComponentRoot->GetRoot()) return false;
  Component->Destroy();
  return true;
}

//===----------------------------------------------------------------------===//
// TOTAComponent: properties
//===----------------------------------------------------------------------===//

const std::vector<PPropInfo>& TOTAComponent::PropList() {
  if (!FPropList) FPropList = FObject->ClassType()->Properties();
  return *FPropList;
}

PPropInfo TOTAComponent::PropAt(int Index) {
  const std::vector<PPropInfo>& List = PropList();
  return Index >= 0 && Index < static_cast<int>(List.size()) ? List[static_cast<std::size_t>(Index)] : nullptr;
}

PPropInfo TOTAComponent::PropNamed(const String& Name) {
  for (PPropInfo Prop : PropList())
    if (SameText(Prop->Name, Name)) return Prop;
  return nullptr;
}

int TOTAComponent::GetPropCount() { return static_cast<int>(PropList().size()); }

String TOTAComponent::GetPropName(int Index) {
  PPropInfo Prop = PropAt(Index);
  return Prop ? Prop->Name : String();
}

TTypeKind TOTAComponent::GetPropType(int Index) {
  PPropInfo Prop = PropAt(Index);
  return Prop ? Prop->Kind() : tkUnknown;
}

TTypeKind TOTAComponent::GetPropTypeByName(const String& Name) {
  PPropInfo Prop = PropNamed(Name);
  return Prop ? Prop->Kind() : tkUnknown;
}

bool TOTAComponent::GetPropValue(int Index, void* Value) {
  PPropInfo Prop = PropAt(Index);
  return Prop && GetValue(Prop, Value);
}

bool TOTAComponent::GetPropValueByName(const String& Name, void* Value) {
  PPropInfo Prop = PropNamed(Name);
  return Prop && GetValue(Prop, Value);
}

bool TOTAComponent::SetProp(int Index, const void* Value) {
  PPropInfo Prop = PropAt(Index);
  return Prop && SetValue(Prop, Value);
}

bool TOTAComponent::SetPropByName(const String& Name, const void* Value) {
  PPropInfo Prop = PropNamed(Name);
  return Prop && SetValue(Prop, Value);
}

bool TOTAComponent::GetValue(PPropInfo Prop, void* Value) {
  switch (Prop->Kind()) {
  case tkInteger:
  case tkChar:
  case tkEnumeration:
  case tkSet:
  case tkWChar:
    *static_cast<std::int32_t*>(Value) = static_cast<std::int32_t>(GetOrdProp(FObject, Prop));
    return true;
  case tkFloat:
    *static_cast<long double*>(Value) = GetFloatProp(FObject, Prop);
    return true;
  case tkString: {
    String Text = GetAnsiStrProp(FObject, Prop);
    auto& Short = *static_cast<TOTAShortString*>(Value);
    Short.Length = static_cast<std::uint8_t>(std::min<std::size_t>(Text.size(), sizeof Short.Chars));
    std::memcpy(Short.Chars, Text.data(), Short.Length);
    return true;
  }
  case tkClass: {
    // Components are reached through the form editor; only owned objects are wrapped here.
    TObject* Object = GetObjectProp(FObject, Prop);
    auto* Persistent = dynamic_cast<TPersistent*>(Object);
    *static_cast<IPtr<IOTAComponent>*>(Value) =
        Persistent && !dynamic_cast<TComponent*>(Object) ? WrapObject(Persistent, FComponentRoot) : nullptr;
    return true;
  }
  case tkMethod:
    *static_cast<TMethod*>(Value) = GetMethodProp(FObject, Prop);
    return true;
  case tkLString:
    *static_cast<String*>(Value) = GetAnsiStrProp(FObject, Prop);
    return true;
  case tkWString:
    *static_cast<WideString*>(Value) = GetWideStrProp(FObject, Prop);
    return true;
  case tkVariant:
    *static_cast<TVariant*>(Value) = GetVariantProp(FObject, Prop);
    return true;
  case tkUString:
    *static_cast<String*>(Value) = GetStrProp(FObject, Prop);
    return true;
  default:
    return false;
  }
}

namespace {

/// The ordinal at `Value`, read with the width of the property's ordinal type.
std::int64_t ReadOrdinal(PPropInfo Prop, const void* Value) {
  switch (GetTypeData(Prop->PropType())->OrdType) {
  case otSByte: return *static_cast<const std::int8_t*>(Value);
  case otUByte: return *static_cast<const std::uint8_t*>(Value);
  case otSWord: return *static_cast<const std::int16_t*>(Value);
  case otUWord: return *static_cast<const std::uint16_t*>(Value);
  case otSLong: return *static_cast<const std::int32_t*>(Value);
  case otULong: return *static_cast<const std::uint32_t*>(Value);
  }
  return 0;
}

} // namespace

bool TOTAComponent::SetValue(PPropInfo Prop, const void* Value) {
  switch (Prop->Kind()) {
  case tkInteger:
  case tkChar:
  case tkEnumeration:
  case tkSet:
  case tkWChar:
    SetOrdProp(FObject, Prop, ReadOrdinal(Prop, Value));
    break;
  case tkFloat:
    SetFloatProp(FObject, Prop, static_cast<double>(*static_cast<const long double*>(Value)));
    break;
  case tkString: {
    const auto& Short = *static_cast<const TOTAShortString*>(Value);
    SetAnsiStrProp(FObject, Prop, String(Short.Chars, Short.Length));
    break;
  }
  case tkMethod:
    SetMethodProp(FObject, Prop, *static_cast<const TMethod*>(Value));
    break;
  case tkLString:
    SetAnsiStrProp(FObject, Prop, *static_cast<const String*>(Value));
    break;
  case tkWString:
    SetWideStrProp(FObject, Prop, *static_cast<const WideString*>(Value));
    break;
  case tkVariant:
    SetVariantProp(FObject, Prop, *static_cast<const TVariant*>(Value));
    break;
  case tkUString:
    SetStrProp(FObject, Prop, *static_cast<const String*>(Value));
    break;
  default: // tkClass among them: an object is set through its own wrapper
    return false;
  }
  FComponentRoot->Modified();
  return true;
}

//===----------------------------------------------------------------------===//
// Adapters
//===----------------------------------------------------------------------===//

TAncestorNotifier::TAncestorNotifier(TComponentRoot* Root) : FComponentRoot(Root) {
  if (!Root || !Root->FAncestorRoot) return;
  FModule = QueryAs<IOTAModule>(Root->FAncestorRoot->GetModule());
  if (FModule) FNotifierIndex = FModule->AddNotifier(IPtr<IOTAModuleNotifier>(this));
}

void TAncestorNotifier::Destroyed() {
  if (FNotifierIndex <= -1) return;
  // The module's list may hold the last reference.
  IPtr<IOTAModuleNotifier> Self(this);
  FModule->RemoveNotifier(FNotifierIndex);
  FModule = nullptr;
  FComponentRoot->FAncestorRoot = nullptr;
  FComponentRoot = nullptr;
  FNotifierIndex = -1;
}

bool TEnvironmentTools::ToolSelected() {
  if (!FEnvironment) return false;
  IPtr<IOTABasePaletteItem> Item;
  FEnvironment->GetToolSelected(Item);
  return Item != nullptr;
}

} // namespace formkit
