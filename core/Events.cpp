//===- core/Events.cpp - Multicast events --------------------------------===//
#include "core/Events.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TEvent, "Events") {}
FK_IMPLEMENT(TEvRootActivatedEvent, "Events") {}
FK_IMPLEMENT(TEvComponentRenamedEvent, "Events") {}

void TEvent::Add(const TMethod& Handler) {
  if (IndexOf(Handler) < 0) ForceAdd(Handler);
}

void TEvent::ForceAdd(const TMethod& Handler) { FList.push_back(new TMethod(Handler)); }

int TEvent::IndexOf(const TMethod& Handler) {
  for (size_t I = FList.size(); I-- > 0;)
    if (*FList[I] == Handler) return static_cast<int>(I);
  return -1;
}

void TEvent::Remove(const TMethod& Handler) {
  int Index = IndexOf(Handler);
  if (Index < 0) return;
  delete FList[static_cast<size_t>(Index)];
  FList.erase(FList.begin() + Index);
}

void TEvent::ForEachFromLast(const std::function<void(const TMethod&)>& Call) {
  for (int I = static_cast<int>(FList.size()) - 1; I >= 0; --I) {
    // Copy the record: the handler may remove (and free) it.
    TMethod M = *FList[static_cast<size_t>(I)];
    Call(M);
    if (I > static_cast<int>(FList.size())) I = static_cast<int>(FList.size());
  }
}

void TEvent::Send(TObject* Sender) {
  ForEachFromLast([&](const TMethod& M) { TNotifyEvent{M}(Sender); });
  FExecuted = true;
}

void TEvent::Clear() {
  for (TMethod* M : FList) delete M;
  FList.clear();
}

void TEvent::BeforeDestruction() {
  Clear();
  inherited::BeforeDestruction();
}

void TEvRootActivatedEvent::Send(TObject* Sender, const IPtr<ICustomModule>& CustomModule) {
  IPtr<IOTAPaletteServices> Palette = IDEService<IOTAPaletteServices>();
  if (Palette) {
    Palette->BeginUpdate();
    if (CustomModule) Palette->AddContextName(NativeDesignerActiveContext);
    else Palette->RemoveContextName(NativeDesignerActiveContext);
    Palette->RemoveContextName(CodeEditorActiveContext);
  }
  try {
    SendWithoutPalette(Sender, CustomModule);
  } catch (...) {
    if (Palette) Palette->EndUpdate();
    throw;
  }
  if (Palette) Palette->EndUpdate();
}

void TEvRootActivatedEvent::SendWithoutPalette(TObject* Sender, const IPtr<ICustomModule>& CustomModule) {
  ForEachFromLast([&](const TMethod& M) { TRootActivatedEvent{M}(Sender, CustomModule); });
  MarkExecuted();
}

void TEvComponentRenamedEvent::Send(TObject* Sender, const String& CurName, const String& NewName) {
  ForEachFromLast([&](const TMethod& M) { TComponentRenamedEvent{M}(Sender, CurName, NewName); });
  MarkExecuted();
}

void TEventT::Remove(const TMethod& Handler) {
  auto It = std::find(FList.begin(), FList.end(), Handler);
  if (It != FList.end()) FList.erase(It);
}

TEvRootActivatedEvent* EvRootActivatedEvent = nullptr;
TEvent* EvActiveRootModifiedEvent = nullptr;
TEvComponentRenamedEvent* EvComponentRenamedEvent = nullptr;
TEvent* EvDesignerDeactivated = nullptr;

void CreateGlobalEvents() {
  if (!EvRootActivatedEvent) EvRootActivatedEvent = new TEvRootActivatedEvent;
  if (!EvActiveRootModifiedEvent) EvActiveRootModifiedEvent = new TEvent;
  if (!EvComponentRenamedEvent) EvComponentRenamedEvent = new TEvComponentRenamedEvent;
  if (!EvDesignerDeactivated) EvDesignerDeactivated = new TEvent;
}

void FreeGlobalEvents() noexcept {
  FreeAndNil(EvRootActivatedEvent);
  FreeAndNil(EvActiveRootModifiedEvent);
  FreeAndNil(EvComponentRenamedEvent);
  FreeAndNil(EvDesignerDeactivated);
}

} // namespace formkit
