//===- core/TopLevels.cpp - Components that live in top-level windows ----===//
#include "core/TopLevels.h"

namespace formkit {

namespace {
IPtr<IInterfaceList> Handlers;
std::vector<TWindowList::Window> PlatformWindows;
HWND Active = 0;

/// The handlers in registration order, as a snapshot.
std::vector<IPtr<ITopLevelsHandler>> Snapshot() {
  std::vector<IPtr<ITopLevelsHandler>> Out;
  if (!Handlers) return Out;
  for (int I = 0, N = Handlers->GetCount(); I < N; ++I)
    if (auto H = QueryAs<ITopLevelsHandler>(Handlers->Get(I))) Out.push_back(H);
  return Out;
}
} // namespace

std::function<TComponent*(TComponent*)> GetTopLevelComponentFunc;

void InitializeTopLevels() {
  if (!Handlers) Handlers = NewAs<IInterfaceList, TInterfaceList>();
  GetTopLevelComponentFunc = &TopLevelComponent;
}

void FinalizeTopLevels() noexcept {
  GetTopLevelComponentFunc = nullptr;
  Handlers = nullptr;
}

void RegisterHandler(const IPtr<ITopLevelsHandler>& Handler) {
  if (Handlers && Handler) Handlers->Add(QueryAs<IInterface>(Handler));
}

void UnregisterHandler(const IPtr<ITopLevelsHandler>& Handler) {
  if (Handlers && Handler) Handlers->Remove(QueryAs<IInterface>(Handler));
}

bool ActivateTopLevelComponent(TComponent* Component) {
  for (auto& H : Snapshot())
    if (H->ActivateTopLevelComponent(Component)) return true;
  return false;
}

String CaptionFromComponent(TComponent* Component) {
  for (auto& H : Snapshot()) {
    String Caption;
    if (H->CaptionFromComponent(Component, Caption) && !Caption.empty()) return Caption;
  }
  return "";
}

bool IsComponentDesigner(TComponent* Component) {
  for (auto& H : Snapshot())
    if (H->IsComponentDesigner(Component)) return true;
  return false;
}

TComponent* ComponentFromWindow(HWND Wnd) {
  if (!Wnd) return nullptr;
  for (auto& H : Snapshot())
    if (TComponent* C = H->ComponentFromWindow(Wnd)) return C;
  return nullptr;
}

TComponent* TopLevelComponent(TComponent* Exclude) {
  if (TComponent* C = ComponentFromWindow(Active); C && C != Exclude) return C;
  for (const TWindowList::Window& W : PlatformWindows) {
    if (W.Topmost || !W.Visible) continue;
    TComponent* C = ComponentFromWindow(W.Handle);
    if (C && C != Exclude) return C;
  }
  return nullptr;
}

std::vector<TComponent*> TopLevelComponents() { return {}; }

void TWindowList::SetWindows(std::vector<Window> Windows) { PlatformWindows = std::move(Windows); }
const std::vector<TWindowList::Window>& TWindowList::Windows() { return PlatformWindows; }
void TWindowList::SetActiveWindow(HWND Wnd) { Active = Wnd; }
HWND TWindowList::ActiveWindow() { return Active; }

} // namespace formkit
