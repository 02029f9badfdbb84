//===- core/root/RootReading.cpp - A module from its stream --------------===//
//
// A module read fills a new root from a form file: the stream is brought to
// binary form, its class and ancestor are peeked at, the ancestor is opened, the
// root instance is made with its design flags set before its constructor runs,
// moves to a generated class, gets a copy of its ancestor's image and then reads
// its own stream over it. The reader's hooks let the user decide about read
// errors and about inherited components the ancestor no longer has.
//
// A selection read adds the components of a selection stream (a paste, an
// undelete) to a live module, renaming what collides.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "core/DesignNotifications.h"
#include "core/Designers.h"
#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

namespace formkit {

FK_RESOURCESTRING(sPasteError, "Cannot paste %s in the designer");

namespace {
/// The buffer of the copy of a form file into memory.
constexpr std::int64_t FileReadBufferSize = 1048576;

/// The name a class stands for in a form file: "TForm1" gives "Form1".
String WithoutFirstCharacter(const String& Name) { return Name.empty() ? Name : Name.substr(1); }

/// The host's operation that a read error or a recovery made the module differ from its file.
void TellLoadingFormModified(const IPtr<IDesignerModule>& Module) {
  if (auto Listener = QueryAs<IDesignerLoadingFormModified>(Module)) Listener->LoadingFormModified();
}
} // namespace

//===----------------------------------------------------------------------===//
// A module read
//===----------------------------------------------------------------------===//

void TComponentRoot::ReadExistingModule(const TCreateArgs& Args) {
  if (Args.Stream) {
    TObjectGuard<TOleStream> Stream(new TOleStream(IPtr<IStream>(Args.Stream)));
    FDiskAge = Args.Stream->GetModifyTime();
    CreateFromStream(Stream.Get(), Args.AncestorRoot);
    FReadStreamSize = Stream->Size();
    return;
  }
  // The file is read whole first: the reader's many small reads then cost no calls to
  // the file system, and the file is closed while the module is made.
  TObjectGuard<TMemoryStream> Image(new TMemoryStream);
  {
    TObjectGuard<TStream> File(FDesigner->OpenFile(FFileSystem, FFileName, fmOpenRead | fmShareDenyNone));
    Image->CopyFrom(File.Get(), 0, FileReadBufferSize);
  }
  Image->SetPosition(0);
  FDiskAge = FDesigner->GetFileAge(FFileSystem, FFileName);
  CreateFromStream(Image.Get(), Args.AncestorRoot);
  FReadStreamSize = Image->Size();
}

void TComponentRoot::CreateFromStream(TStream* Stream, const IPtr<IRoot>& AncestorRoot) {
  BeginGlobalLoading();
  auto EndLoading = Finally([]() noexcept { EndGlobalLoading(); });
  TObjectGuard<TStream> Converted;
  TStream* S = PrepareInputStream(Stream, true);
  if (S != Stream) Converted.Reset(S);
  auto Undo = OnFailure([this]() noexcept {
    if (TComponent* Half = std::exchange(FRoot, nullptr)) {
      RunIgnoringExceptions([&] { TearDownRoot(); });
      RunIgnoringExceptions([&] { DestroyRootInstance(Half); });
    }
    RunIgnoringExceptions([&] { RootCreationFailed(); });
  });
  String ClassName, AncestorClassName;
  GetCreateInfoFrom(S, ClassName, AncestorClassName, AncestorRoot);
  CreateRootAs(ClassName, AncestorClassName, AncestorRoot);
  ReadObjectFromStream(FRoot, S);
  ModifiedUpdateNotification();
  NotifyGlobalLoading();
}

TStream* TComponentRoot::PrepareInputStream(TStream* Stream, bool AtLoad) {
  FOrigLYTFormat = TestStreamFormat(Stream);
  if (FOrigLYTFormat < 2) {
    if (AtLoad) FLYTToText = false;
    return Stream;
  }
  TObjectGuard<TMemoryStream> Binary(new TMemoryStream);
  ObjectTextToResource(Stream, Binary.Get(), "");
  Binary->SetPosition(0);
  if (AtLoad) FLYTToText = true;
  return Binary.Release();
}

void TComponentRoot::GetCreateInfoFrom(TStream* Stream, String& ClassName, String& AncestorClassName,
                                       const IPtr<IRoot>& AncestorRoot) {
  Stream->ReadResHeader();
  std::int64_t Position = Stream->Position();
  auto Restore = Finally([&]() noexcept { Stream->SetPosition(Position); });
  TObjectGuard<TReader> Reader(new TReader(Stream, 256));
  Reader->ReadSignature();
  TFilerFlags Flags;
  int ChildPosition = 0;
  Reader->ReadFilerFlags(Flags, ChildPosition);
  ClassName = Reader->ReadStr();
  Reader.Reset(); // the reader gives back what it buffered before the position is restored
  if (AncestorRoot && AncestorRoot->GetRoot()) AncestorClassName = AncestorRoot->GetRoot()->ClassName();
  else if (!FViewName.empty() && FAncestorRoot && FAncestorRoot->GetRoot())
    AncestorClassName = FAncestorRoot->GetRoot()->ClassName();
  else AncestorClassName = FModule ? FModule->GetAncestorClassName(ClassName) : String();
  // A stream that is not inherited can only have a base class as its ancestor.
  if (!Flags.Contains(ffInherited) && !FDesigner->IsRootBaseClass(AncestorClassName)) AncestorClassName = "TFORM";
}

void TComponentRoot::ReadObjectFromStream(TComponent* Instance, TStream* Stream) {
  TObjectGuard<TReader> Reader(new TReader(Stream, 4096));
  FIgnoringErrors = false;
  FIgnoreNext = false;
  Reader->OnFindMethod = TFindMethodEvent::Bind<&TComponentRoot::FindObjectMethod>(this);
  Reader->OnError = TReaderError::Bind<&TComponentRoot::ReaderObjectError>(this);
  Reader->OnAncestorNotFound = TAncestorNotFoundEvent::Bind<&TComponentRoot::ReaderAncestorNotFound>(this);
  Reader->OnFindComponentClass = TFindComponentClassEvent::Bind<&TComponentRoot::ReaderFindComponentClass>(this);
  Reader->OnCreateComponent = TCreateComponentEvent::Bind<&TComponentRoot::ReaderCreateComponent>(this);
  BeforeReadRoot(Instance);
  TClass Previous = ActivateClassGroup(GetClassGroup());
  auto Restore = Finally([Previous]() noexcept {
    if (Previous) ActivateClassGroup(Previous);
  });
  Reader->ReadRootComponent(Instance);
}

//===----------------------------------------------------------------------===//
// The reader's hooks
//===----------------------------------------------------------------------===//

void TComponentRoot::ReaderObjectError(TReader*, const String& Message, bool& Handled) {
  FReadError = true;
  if (FIgnoringErrors || FIgnoreNext) {
    Handled = true;
    FIgnoreNext = false;
    return;
  }
  TRootReadErrorResult Answer = AskReadError(Message);
  Handled = Answer != rerCancel;
  if (Handled) {
    Modified();
    TellLoadingFormModified(FModule);
  }
  FIgnoringErrors = Answer == rerIgnoreAll;
  FIgnoreNext = false;
}

void TComponentRoot::ReaderAncestorNotFound(TReader* Reader, const String& ComponentName, TClass ComponentClass,
                                            TComponent*& Component) {
  TComponent* Lookup = Reader->LookupRoot();
  bool Nested = Lookup != Reader->Root();
  TStringList Candidates;
  for (int I = 0; I < Lookup->ComponentCount(); ++I) {
    TComponent* C = Lookup->Components(I);
    if (C->ComponentState().Contains(csAncestor) && C->ClassType()->InheritsFrom(ComponentClass))
      Candidates.Add(C->Name());
  }
  String NewName = ComponentName;
  String AncestorName = (FAncestorRoot && !Nested && FAncestorRoot->GetRoot()) ? FAncestorRoot->GetRoot()->Name()
                                                                                 : WithoutFirstCharacter(Lookup->ClassName());
  switch (AskAncestorRecovery(Lookup->Name(), AncestorName, NewName, Candidates.CommaText(), Nested)) {
  case rrDelete:
    FIgnoreNext = true;
    Component = nullptr;
    break;
  case rrRename: Component = Lookup->FindComponent(NewName); break;
  case rrCreate: {
    TComponent* Made = formkit::CreateComponent(ComponentClass, Lookup);
    auto Free = OnFailure([Made]() noexcept { Made->Destroy(); });
    if (Reader->Parent()) Made->SetParentComponent(Reader->Parent());
    Made->SetName(NewName);
    Component = Made;
    break;
  }
  default: return;
  }
  TellLoadingFormModified(FModule);
}

void TComponentRoot::ReaderFindComponentClass(TReader*, const String& ClassName, TClass& ComponentClass) {
  if (ComponentClass) return;
  if (auto Nested = QueryAs<IInternalRoot>(FDesigner->OpenRootClass(ClassName)))
    if (TComponent* NestedRoot = Nested->GetRoot()) {
      TClass Class = NestedRoot->ClassType();
      if (TRootHooks::IsProxyClass && TRootHooks::IsProxyClass(Class) && CanNestClass(Class)) ComponentClass = Class;
    }
  if (!ComponentClass)
    if (IPtr<IDesignEnvironment> Env = GetEnvironment()) ComponentClass = Env->FindComponentClass(ClassName);
}

void TComponentRoot::ReaderCreateComponent(TReader* Reader, TClass ComponentClass, TComponent*& Component) {
  Component = FrameCreateComponent(ComponentClass, Reader->Owner());
}

void TComponentRoot::LoadDependentModules(TComponent* Root) {
  std::vector<String> Names;
  GetFixupReferenceNames(Root, Names);
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  if (!Env) return;
  for (const String& Name : Names) Env->OpenModuleByName(Name, nullptr);
}

//===----------------------------------------------------------------------===//
// A selection read
//===----------------------------------------------------------------------===//

void TComponentRoot::ComponentRead(TComponent* Component) {
  if (!FInUndo && IsNoIconComponent(Component)) throw EComponentDesignerException(sPasteError, Component->ClassName());
  if (FRootUpdateManager && FRootUpdateManager->GetHasDescendents() &&
      !Component->ComponentStyle().Contains(csInheritable))
    throw EComponentDesignerException(sCannotInherit, Component->ClassName());
  ValidateComponent(Component);
  SelectComponent(Component, true);
}

void TComponentRoot::ComponentReadAdjust(TComponent* Component) {
  AdjustReadComponent(Component, FAdjustmentRect, FAdjustmentBounds);
  ComponentRead(Component);
}

void TComponentRoot::ReadStream(TStream* Stream, TComponent* Parent, bool Adjust, const TRect& Rect) {
  EndPasteRead();
  TClass Previous = ActivateClassGroup(GetClassGroup());
  TObjectGuard<TStream> Converted;
  auto Cleanup = Finally([this, Previous]() noexcept {
    EndPasteRead();
    if (Previous) ActivateClassGroup(Previous);
  });
  TStream* S = PrepareInputStream(Stream, false);
  if (S != Stream) Converted.Reset(S);
  TObjectGuard<TReader> Reader(new TReader(S, 1024));
  BeginPasteRead(Reader.Get());
  Reader->OnFindComponentClass = TFindComponentClassEvent::Bind<&TComponentRoot::ReaderFindComponentClass>(this);
  Reader->OnCreateComponent = TCreateComponentEvent::Bind<&TComponentRoot::ReaderCreateComponent>(this);
  FAdjustmentRect = Rect;
  FAdjustmentBounds = ReadSelectionBounds(Reader.Get());
  BeforeReadSelection();
  {
    auto After = OnFailure([this]() noexcept { RunIgnoringExceptions([this] { AfterReadSelection(); }); });
    Reader->ReadComponents(FRoot, Parent, [this, Adjust](TComponent* C) {
      if (Adjust) ComponentReadAdjust(C);
      else ComponentRead(C);
    });
  }
  AfterReadSelection();
  FinishPasteRead(Reader.Get());
}

void TComponentRoot::SelectReadStream(TStream* Stream, TComponent* Parent, bool Adjust, const TRect& Rect) {
  // The read lands in the master of the active module.
  auto Active = QueryAs<IInternalRoot>(FDesigner->GetActiveRoot());
  if (!Active) Active = QueryAs<IInternalRoot>(AsRoot());
  if (auto Master = QueryAs<IInternalRoot>(Active->GetMasterView())) Active = Master;
  auto* Target = dynamic_cast<TComponentRoot*>(Active->Implementor());
  // A parent of a view stands for the master's component of the same name.
  if (Parent && FSurface) Parent = ExtractComponent(GetMasterViewComponent(FSurface->ItemFromComponent(Parent)));
  Target->ClearSelection();
  IPtr<ISelections> Items = Target->SelectionItems();
  if (Items) Items->BeginSelections();
  {
    auto End = Finally([&]() noexcept {
      if (Items) RunIgnoringExceptions([&] { Items->EndSelections(); });
    });
    Target->ReadStream(Stream, Parent, Adjust, Rect);
    Target->Modified();
  }
  if (FSurface) {
    FSurface->RefreshItems();
    FSurface->UpdateSurface();
  }
}

} // namespace formkit
