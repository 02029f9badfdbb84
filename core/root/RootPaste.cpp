//===- core/root/RootPaste.cpp - Names and handlers of pasted components ===//
//
// While a pasted text is read, a component whose name is taken gets a free one
// and references inside the text follow it; each handler the text names gets a
// temporary method under a name no source can hold ("@1", "@2", ...), one per
// distinct name. After the read the handlers get their final names (following
// the renamed components), the host inserts the pasted method text, and the
// handlers the host did not insert fall back on the class's method of their
// pasted name, if any.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

namespace formkit {

namespace {

/// Numbers the temporary methods of pastes; lives as long as the process.
int PastedMethodCounter = 0;

bool IsDecimalDigit(char C) { return C >= '0' && C <= '9'; }

/// `Name` starts with `Prefix`, something follows, and it is not a digit: the handler
/// Button1Click belongs to Button1, Button11Click does not.
bool HasComponentPrefix(const String& Name, const String& Prefix) {
  return Prefix.size() < Name.size() && Name.compare(0, Prefix.size(), Prefix) == 0 &&
         !IsDecimalDigit(Name[Prefix.size()]);
}

/// The walk of `IterateMethods` through one object; true when `Proc` stopped it.
bool WalkMethods(TPersistent* Instance, TComponent* Root, const TComponentRoot::TMethodPropProc& Proc) {
  for (PPropInfo Prop : Instance->ClassType()->Properties()) {
    if (!Prop->IsReadable()) continue;
    if (Prop->Kind() == tkMethod) {
      if (Proc(Instance, Prop)) return true;
    } else if (Prop->Kind() == tkClass) {
      TClass Class = GetObjectPropClass(Prop);
      if (!Class || !Class->InheritsFrom(TPersistent::StaticClass())) continue;
      auto* Sub = dynamic_cast<TPersistent*>(GetObjectProp(Instance, Prop));
      if (Sub && !dynamic_cast<TComponent*>(Sub) && WalkMethods(Sub, Root, Proc)) return true;
    }
  }
  if (auto* Component = dynamic_cast<TComponent*>(Instance)) {
    std::vector<TComponent*> Children;
    Component->GetChildren([&](TComponent* Child) { Children.push_back(Child); }, Root);
    for (TComponent* Child : Children) WalkMethods(Child, Root, Proc); // their answers do not stop this one
  }
  return false;
}

} // namespace

//===----------------------------------------------------------------------===//
// The reader's hooks
//===----------------------------------------------------------------------===//

void TComponentRoot::BeginPasteRead(TReader* Reader) {
  EndPasteRead();
  Reader->OnSetName = TSetNameEvent::Bind<&TComponentRoot::ReaderSetName>(this);
  Reader->OnReferenceName = TReferenceNameEvent::Bind<&TComponentRoot::ReaderReferenceName>(this);
  Reader->OnFindMethod = TFindMethodEvent::Bind<&TComponentRoot::ReaderFindMethod>(this);
}

void TComponentRoot::EndPasteRead() noexcept {
  FRenames.Clear();
  FEvents.Clear();
}

void TComponentRoot::ReaderSetName(TReader* Reader, TComponent* Component, String& Name) {
  if (Reader->Root() != FRoot || !FRoot->FindComponent(Name)) return;
  String OldName = Name;
  Name = UniqueName(Component->ClassName());
  FRenames.Add(OldName, Name);
}

void TComponentRoot::ReaderReferenceName(TReader* Reader, String& Name) {
  if (Reader->Root() == FRoot) FRenames.Rename(Name);
}

void TComponentRoot::ReaderFindMethod(TReader* Reader, const String& MethodName, void*& Address, bool& Error) {
  if (Reader->Root() != FRoot) return;
  if (TEventItem* Item = FEvents.Find(MethodName)) {
    Address = Item->Value;
  } else {
    RequireClassMethods(AddingMethod);
    Address = TRootHooks::CreateSubClassMethod(FRoot, Format("@%d", ++PastedMethodCounter));
    FEvents.Add(Address, MethodName);
  }
  Error = false;
}

//===----------------------------------------------------------------------===//
// After the read
//===----------------------------------------------------------------------===//

void TComponentRoot::RenameEvents() {
  RequireClassMethods(AddingMethod);
  for (int I = 0; I < FEvents.GetCount(); ++I) {
    TEventItem& Event = FEvents.GetItems(I);
    // The renames grow below: later handlers follow earlier handlers' renames too.
    for (int R = 0; R < FRenames.GetCount(); ++R) {
      const TRenameItem& Rename = FRenames.GetItems(R);
      if (!HasComponentPrefix(Event.Name, Rename.Source)) continue;
      Event.Name = Rename.Target + Event.Name.substr(Rename.Source.size());
      break;
    }
    String Free = Event.Name;
    for (int N = 2; FRoot->MethodAddress(Free); ++N) Free = Event.Name + std::to_string(N);
    Event.Name = Free;
    if (Event.Name != Event.OriginalName) FRenames.Add(Event.OriginalName, Event.Name);
    TRootHooks::RenameSubClassMethod(FRoot, Event.Value, Event.Name);
  }
}

String TComponentRoot::ReadMethodText(TReader* Reader) {
  std::int64_t Count = Reader->Remaining();
  if (Count <= 0) return "";
  String Text(static_cast<std::size_t>(Count), '\0');
  Reader->Read(Text.data(), Count);
  Text.resize(Text.find('\0') == String::npos ? Text.size() : Text.find('\0'));
  return Text;
}

void TComponentRoot::VerifyEvents(TStrings* Inserted) {
  RequireClassMethods(AddingMethod);
  for (int I = 0; I < FEvents.GetCount(); ++I) {
    TEventItem& Event = FEvents.GetItems(I);
    if (Inserted->IndexOf(Event.Name) >= 0) continue;
    // Gone first, so that the fallback is another method of the pasted name or nothing.
    TRootHooks::DestroySubClassMethod(FRoot, Event.Value);
    Event.NewValue = FRoot->MethodAddress(Event.OriginalName);
  }
}

void TComponentRoot::UpdateEvents() {
  bool Moved = false;
  for (int I = 0; I < FEvents.GetCount(); ++I) Moved = Moved || FEvents.GetItems(I).Value != FEvents.GetItems(I).NewValue;
  if (!Moved) return;
  IterateMethods([this](TPersistent* Instance, PPropInfo Prop) {
    TMethod Method = GetMethodProp(Instance, Prop);
    if (!Method.Code) return false;
    for (int I = 0; I < FEvents.GetCount(); ++I) {
      const TEventItem& Event = FEvents.GetItems(I);
      if (Method.Code != Event.Value) continue;
      SetMethodProp(Instance, Prop, Event.NewValue ? TMethod{Event.NewValue, Method.Data} : TMethod{});
      break;
    }
    return false;
  });
}

void TComponentRoot::IterateMethods(const TMethodPropProc& Proc) {
  for (int I = 0; FSelections && I < FSelections->GetCount(); ++I)
    if (TPersistent* Instance = FSelections->GetPersistents(I)) WalkMethods(Instance, FRoot, Proc);
}

void TComponentRoot::FinishPasteRead(TReader* Reader) {
  RenameEvents();
  TObjectGuard<TStringList> Renames(new TStringList);
  for (int I = 0; I < FRenames.GetCount(); ++I) Renames->SetValues(FRenames.GetItems(I).Source, FRenames.GetItems(I).Target);
  TObjectGuard<TStringList> Inserted(new TStringList);
  String Text = ReadMethodText(Reader);
  if (!Text.empty() && FModule) {
    // A host that refuses the text has inserted nothing: the handlers fall back.
    auto Fallback = OnFailure([&]() noexcept {
      RunIgnoringExceptions([&] {
        Inserted->Clear();
        VerifyEvents(Inserted.Get());
        UpdateEvents();
      });
    });
    FModule->InsertMethodSource(Text, Renames.Get(), Inserted.Get());
  }
  VerifyEvents(Inserted.Get());
  UpdateEvents();
}

} // namespace formkit
