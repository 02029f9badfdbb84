//===- frameworks/kiln/design/EditorViewSupport.cpp - Registry of editor sub-views ===//
//
// The registry of sub-views, the procedure variables the host fills, and the
// context functions.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/EditorViewSupport.h"

#include "core/EditorGroups.h"
#include "platform/Lists.h"
#include "platform/ScopeGuard.h"

namespace formkit {

FK_IMPLEMENT(TCustomEditorViewInfo, "EditorViewSupport") {}
FK_IMPLEMENT(TCustomEditorViewList, "EditorViewSupport") {}
FK_IMPLEMENT(TCustomEditorView, "EditorViewSupport") {}

TCustomEditorViewProc RegisterCustomEditorViewProc = nullptr;
TCustomEditorViewProc UnregisterCustomEditorViewProc = nullptr;

String OSFamilyName(TOTAOSFamily Family) {
  static const char* const Names[] = {"Windows", "macOS", "iOS", "Android", "Linux", "Unknown"};
  auto Index = static_cast<std::size_t>(Family);
  return Index < std::size(Names) ? Names[Index] : "Unknown";
}

//===----------------------------------------------------------------------===//
// Entries
//===----------------------------------------------------------------------===//

TCustomEditorViewInfo::TCustomEditorViewInfo(TClass ViewClass, IPtr<INTACustomEditorSubView> SubView)
    : FViewClass(ViewClass), FCustomEditorSubView(std::move(SubView)), FGroup(CurrentGroup) {}

TClass TCustomEditorViewInfo::GetViewClass() {
  if (!FViewClass)
    if (auto Operations = QueryAs<IEditorSubViewOperations>(FCustomEditorSubView))
      FViewClass = Operations->GetFrameClass();
  return FViewClass;
}

//===----------------------------------------------------------------------===//
// The list
//===----------------------------------------------------------------------===//

void TCustomEditorViewList::BeforeDestruction() {
  while (!FList.empty()) Delete(FList.size() - 1);
  inherited::BeforeDestruction();
}

void TCustomEditorViewList::Delete(std::size_t Index) noexcept {
  TCustomEditorViewInfo* Info = FList[Index];
  FList.erase(FList.begin() + static_cast<std::ptrdiff_t>(Index));
  Info->Destroy();
}

void* TCustomEditorViewList::Add(TClass ViewClass) {
  FList.reserve(FList.size() + 1);
  auto* Info = new TCustomEditorViewInfo(ViewClass, nullptr);
  FList.push_back(Info);
  return Info;
}

void* TCustomEditorViewList::Add(const IPtr<INTACustomEditorSubView>& SubView) {
  if (!SubView) throw EArgumentException("A sub-view to register is required");
  FList.reserve(FList.size() + 1);
  auto* Info = new TCustomEditorViewInfo(nullptr, SubView);
  FList.push_back(Info);
  auto Undo = OnFailure([&]() noexcept { Delete(FList.size() - 1); });
  if (RegisterCustomEditorViewProc) RegisterCustomEditorViewProc(SubView);
  return Info;
}

void TCustomEditorViewList::Remove(TClass ViewClass) {
  for (std::size_t I = FList.size(); I-- > 0;)
    if (FList[I]->GetViewClass() == ViewClass) Delete(I);
}

void TCustomEditorViewList::Remove(void* Handle) {
  for (std::size_t I = FList.size(); I-- > 0;) {
    if (FList[I] != Handle) continue;
    if (UnregisterCustomEditorViewProc && FList[I]->CustomEditorSubView())
      UnregisterCustomEditorViewProc(FList[I]->CustomEditorSubView());
    Delete(I);
    return;
  }
}

TCustomEditorViewInfo* TCustomEditorViewList::Entry(int Index) const {
  if (Index < 0 || Index >= Count()) throw EListError(SListIndexError, Index);
  return FList[static_cast<std::size_t>(Index)];
}

IPtr<INTACustomEditorSubView> TCustomEditorViewList::GetCustomEditorView(int Index) const {
  return Entry(Index)->CustomEditorSubView();
}

IPtr<INTAFileCustomEditorSubView> TCustomEditorViewList::GetFileCustomEditorView(int Index) const {
  return QueryAs<INTAFileCustomEditorSubView>(Entry(Index)->CustomEditorSubView());
}

TClass TCustomEditorViewList::GetViewClass(int Index) const { return Entry(Index)->GetViewClass(); }

void TCustomEditorViewList::FreeEditorGroup(int Group) {
  for (std::size_t I = FList.size(); I-- > 0;)
    if (FList[I]->Group() == Group) Delete(I);
}

namespace {
TCustomEditorViewList* SubViews = nullptr;

void FreeSubViewGroup(int Group) {
  if (SubViews) SubViews->FreeEditorGroup(Group);
}
} // namespace

TCustomEditorViewList* RegisteredEditorSubViews() {
  if (!SubViews) {
    SubViews = new TCustomEditorViewList;
    NotifyGroupChange(&FreeSubViewGroup);
  }
  return SubViews;
}

void* RegisterEditorSubView(const IPtr<INTACustomEditorSubView>& SubView) {
  return RegisteredEditorSubViews()->Add(SubView);
}

void UnregisterEditorSubView(void* Handle) {
  if (SubViews) SubViews->Remove(Handle);
}

void FreeRegisteredEditorSubViews() noexcept {
  if (!SubViews) return;
  UnnotifyGroupChange(&FreeSubViewGroup);
  std::exchange(SubViews, nullptr)->Destroy();
}

//===----------------------------------------------------------------------===//
// Context functions
//===----------------------------------------------------------------------===//

bool ContextToModule(const IPtr<IInterface>& Context, IPtr<IOTAModule>& Module) {
  Module = QueryAs<IOTAModule>(Context);
  return static_cast<bool>(Module);
}

bool ContextToFormEditor(const IPtr<IInterface>& Context, IPtr<IOTAFormEditor>& FormEditor) {
  FormEditor = nullptr;
  IPtr<IOTAModule> Module;
  if (!ContextToModule(Context, Module)) return false;
  for (int I = 0, N = Module->GetModuleFileCount(); I < N && !FormEditor; ++I)
    FormEditor = QueryAs<IOTAFormEditor>(Module->GetModuleFileEditor(I));
  return static_cast<bool>(FormEditor);
}

bool ContextToDesigner(const IPtr<IInterface>& Context, IPtr<IDesigner>& Designer) {
  Designer = nullptr;
  IPtr<IOTAFormEditor> FormEditor;
  if (!ContextToFormEditor(Context, FormEditor)) return false;
  if (auto Native = QueryAs<INTAFormEditor>(FormEditor)) Designer = Native->GetFormDesigner();
  return static_cast<bool>(Designer);
}

bool ContextToRootComponent(const IPtr<IInterface>& Context, TComponent*& Root) {
  Root = nullptr;
  IPtr<IDesigner> Designer;
  if (ContextToDesigner(Context, Designer)) Root = Designer->GetRoot();
  return Root != nullptr;
}

bool ContextToFormFilename(const IPtr<IInterface>& Context, String& Name) {
  Name.clear();
  IPtr<IOTAFormEditor> FormEditor;
  if (ContextToFormEditor(Context, FormEditor)) Name = FormEditor->GetFileName();
  return static_cast<bool>(FormEditor);
}

bool ContextToFilename(const IPtr<IInterface>& Context, String& Name) {
  Name.clear();
  IPtr<IOTAModule> Module;
  if (ContextToModule(Context, Module)) Name = Module->GetFileName();
  return static_cast<bool>(Module);
}

bool ContextResurrect(const IPtr<IInterface>& Context) {
  IPtr<IDesigner> Designer;
  if (!ContextToDesigner(Context, Designer) || !Designer->GetIsDormant()) return false;
  Designer->Resurrect();
  return true;
}

} // namespace formkit
