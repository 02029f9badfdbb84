//===- frameworks/kiln/design/FormEditorView.cpp - The "Design" sub-view -===//
//
// The framework wrappers' list, the context cache with its module notifiers,
// the sub-view's display of a module, and the unit's registration.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/FormEditorView.h"

#include "core/ComponentDesignerIntf.h"
#include "core/Designers.h"
#include "core/Events.h"
#include "frameworks/kiln/design/EditorFormDesigner.h"
#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TEditorFormDesignerWrapper, "FormEditorView") {}
FK_IMPLEMENT(TContextCacheItem, "FormEditorView") {}
FK_IMPLEMENT(TModuleNotifier, "FormEditorView") {}
FK_IMPLEMENT(TFormEditorView, "FormEditorView") {}

TEvent* EvDesignerHidden = nullptr;

//===----------------------------------------------------------------------===//
// Framework wrappers
//===----------------------------------------------------------------------===//

namespace {
std::vector<TEditorFormDesignerWrapper*>* Wrappers = nullptr; // made at first use; not owning
} // namespace

TEditorFormDesignerWrapper::TEditorFormDesignerWrapper() {
  if (!Wrappers) Wrappers = new std::vector<TEditorFormDesignerWrapper*>;
  Wrappers->push_back(this);
}

void TEditorFormDesignerWrapper::BeforeDestruction() {
  if (Wrappers) std::erase(*Wrappers, this);
  FContext = nullptr;
  inherited::BeforeDestruction();
}

TEditorFormDesignerWrapper* TEditorFormDesignerWrapper::FindWrapper(
    const std::function<bool(TEditorFormDesignerWrapper*)>& Predicate) {
  if (!Wrappers) return nullptr;
  auto Found = std::find_if(Wrappers->begin(), Wrappers->end(), Predicate);
  return Found == Wrappers->end() ? nullptr : *Found;
}

bool TEditorFormDesignerWrapper::WrapperListExists() noexcept { return Wrappers != nullptr; }

void TEditorFormDesignerWrapper::FreeWrapperList() noexcept {
  delete Wrappers;
  Wrappers = nullptr;
}

void SetViewContext(const IPtr<IInterface>& Context, TObject* ViewObject) {
  IPtr<IGetEditorFormDesignerWrapper> Source;
  if (Supports(ViewObject, Source))
    if (TEditorFormDesignerWrapper* Wrapper = Source->GetWrapper()) Wrapper->SetContext(Context);
}

//===----------------------------------------------------------------------===//
// The context cache
//===----------------------------------------------------------------------===//

void TModuleNotifier::Destroyed() {
  if (!FItem) return;
  TContextCacheItem* Item = std::exchange(FItem, nullptr);
  Item->FNotifierIndex = -1;
  IPtr<TModuleNotifier> Self = std::move(Item->FNotifier); // this notifier lives to the end of the call
  Item->FContext = nullptr;
}

void TContextCacheItem::DetachNotifier() noexcept {
  if (FNotifierIndex > -1 && FContext)
    RunIgnoringExceptions([this] { FContext->RemoveNotifier(FNotifierIndex); });
  FNotifierIndex = -1;
  if (FNotifier) FNotifier->FItem = nullptr;
  FNotifier = nullptr;
}

void TContextCacheItem::SetContext(const IPtr<IOTAModule>& Value) {
  if (FContext) DetachNotifier();
  FContext = Value;
  if (!Value) return;
  FNotifier = New<TModuleNotifier>(this);
  auto Undo = OnFailure([this]() noexcept {
    FNotifier->FItem = nullptr;
    FNotifier = nullptr;
    FContext = nullptr;
  });
  FNotifierIndex = Value->AddNotifier(IPtr<IOTAModuleNotifier>(FNotifier.Get()));
}

void TContextCacheItem::SetViewObject(TObject* Value) {
  if (auto* Old = dynamic_cast<TComponent*>(FViewObject)) Old->RemoveFreeNotification(this);
  FViewObject = Value;
  if (auto* New = dynamic_cast<TComponent*>(Value)) New->FreeNotification(this);
}

void TContextCacheItem::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove || AComponent != FViewObject || !AComponent) return;
  DetachNotifier();
  FViewObject = nullptr;
  Destroy(); // the last thing it does: the view object that goes takes its entry along
}

void TContextCacheItem::BeforeDestruction() {
  DetachNotifier();
  FContext = nullptr;
  if (auto* View = dynamic_cast<TComponent*>(std::exchange(FViewObject, nullptr))) View->RemoveFreeNotification(this);
  if (FCache) std::erase(FCache->FCachedContexts, this);
  FCache = nullptr;
  inherited::BeforeDestruction();
}

TContextCacheItem* TFormEditorView::GetContextCacheItem(TObject* ViewObject) const {
  auto Found = std::find_if(FCachedContexts.begin(), FCachedContexts.end(),
                            [&](TContextCacheItem* Item) { return Item->ViewObject() == ViewObject; });
  return Found == FCachedContexts.end() ? nullptr : *Found;
}

IPtr<IOTAModule> TFormEditorView::GetCachedContext(TObject* ViewObject) const {
  TContextCacheItem* Item = GetContextCacheItem(ViewObject);
  return Item ? Item->Context() : nullptr;
}

void TFormEditorView::SetCachedContext(const IPtr<IInterface>& Context, TObject* ViewObject) {
  TContextCacheItem* Item = GetContextCacheItem(ViewObject);
  if (!Item) {
    FCachedContexts.reserve(FCachedContexts.size() + 1);
    Item = CreateComponentOf<TContextCacheItem>(nullptr);
    Item->FCache = this;
    FCachedContexts.push_back(Item);
    auto Undo = OnFailure([Item]() noexcept { Item->Destroy(); });
    Item->SetViewObject(ViewObject);
  }
  Item->SetContext(QueryAs<IOTAModule>(Context));
}

//===----------------------------------------------------------------------===//
// The sub-view
//===----------------------------------------------------------------------===//

void TFormEditorView::BeforeDestruction() {
  while (!FCachedContexts.empty()) FCachedContexts.back()->Destroy();
  inherited::BeforeDestruction();
}

String TFormEditorView::GetCaption() { return LoadResString(sFormEditorViewCaption); }

TClass TFormEditorView::GetFrameClass() { return TEditorFormDesigner::StaticClass(); }

bool TFormEditorView::Handles(const IPtr<IInterface>& Context) {
  IPtr<IOTAModuleData> Data = QueryAs<IOTAModuleData>(Context);
  return Data && Data->HasObjects();
}

TEditorFormDesignerWrapper* TFormEditorView::GetContainerForm(const IPtr<IInterface>& Context, TObject* ViewObject) {
  if (!dynamic_cast<TEditorFormDesigner*>(ViewObject) || !TEditorFormDesignerWrapper::WrapperListExists())
    return nullptr;
  IPtr<IOTAModule> Module;
  ContextToModule(Context, Module);
  TEditorFormDesignerWrapper* Found = TEditorFormDesignerWrapper::FindWrapper([&](TEditorFormDesignerWrapper* W) {
    return Module ? W->IsModule(Module) : W->IsChildView(ViewObject);
  });
  return Found ? Found->GetActiveDesignerWrapper() : nullptr;
}

void TFormEditorView::Display(const IPtr<IInterface>& Context, TObject* ViewObject) {
  IPtr<IOTAModule> Module;
  if (ContextToModule(Context, Module))
    for (int I = 0, N = Module->GetModuleFileCount(); I < N; ++I)
      if (IPtr<INTAFormEditor> FormEditor = QueryAs<INTAFormEditor>(Module->GetModuleFileEditor(I))) {
        if (IPtr<IInternalRoot> Root = QueryAs<IInternalRoot>(FormEditor->GetFormDesigner())) Root->Resurrect();
        break;
      }

  TEditorFormDesignerWrapper* Wrapper =
      Module ? GetContainerForm(Context, ViewObject) : GetContainerForm(GetCachedContext(ViewObject), ViewObject);
  SetCachedContext(Module ? Context : nullptr, ViewObject);
  if (!Wrapper) return;
  if (Module) {
    Wrapper->DisplayDesigner(ViewObject);
    static_cast<TEditorFormDesigner*>(ViewObject)->SetMultiview(Wrapper->Multiview());
    return;
  }
  Wrapper->HideDesigner();
  Designers()->DesignerDeactivated();
  if (!FClosingNotifier && EvDesignerHidden) EvDesignerHidden->Send(ViewObject);
}

bool TFormEditorView::EditAction(const IPtr<IInterface>& Context, TEditAction Action, TObject* ViewObject) {
  TEditorFormDesignerWrapper* Wrapper = GetContainerForm(Context, ViewObject);
  return Wrapper && Wrapper->EditAction(Action);
}

TEditState TFormEditorView::GetEditState(const IPtr<IInterface>& Context, TObject* ViewObject) {
  TEditorFormDesignerWrapper* Wrapper = GetContainerForm(Context, ViewObject);
  return Wrapper ? Wrapper->GetEditState() : TEditState{};
}

IPtr<IInterface> TFormEditorView::GetStructureContext(const IPtr<IInterface>& Context, TObject* ViewObject) {
  TEditorFormDesignerWrapper* Wrapper = GetContainerForm(Context, ViewObject);
  return Wrapper ? Wrapper->GetStructureViewContext() : nullptr;
}

//===----------------------------------------------------------------------===//
// The unit's state
//===----------------------------------------------------------------------===//

namespace {
IPtr<TFormEditorView> View;
void* ViewHandle = nullptr;
} // namespace

void InternalRegister() {
  if (View) return;
  EvDesignerHidden = new TEvent;
  auto Undo = OnFailure([]() noexcept {
    View = nullptr;
    std::exchange(EvDesignerHidden, nullptr)->Destroy();
  });
  View = New<TFormEditorView>();
  ViewHandle = RegisterEditorSubView(IPtr<INTACustomEditorSubView>(View.Get()));
}

void InternalUnRegister() noexcept {
  if (ViewHandle) RunIgnoringExceptions([] { UnregisterEditorSubView(ViewHandle); });
  ViewHandle = nullptr;
  View = nullptr;
  TEditorFormDesignerWrapper::FreeWrapperList();
  if (EvDesignerHidden) std::exchange(EvDesignerHidden, nullptr)->Destroy();
}

TFormEditorView* FormEditorView() noexcept { return View.Get(); }

} // namespace formkit
