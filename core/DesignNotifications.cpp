//===- core/DesignNotifications.cpp - Listeners of every design surface --===//
#include "core/DesignNotifications.h"

#include <algorithm>

namespace formkit {

namespace {
IPtr<IInterfaceList> Listeners;
std::vector<TClass>* NoIconClasses = nullptr;

IPtr<IDesignNotification> ListenerAt(int Index) {
  return QueryAs<IDesignNotification>(Listeners->Get(Index));
}

void RegisterListener(const IPtr<IDesignNotification>& Listener) {
  if (!Listeners) Listeners = NewAs<IInterfaceList, TInterfaceList>();
  Listeners->Add(QueryAs<IInterface>(Listener)); // no duplicate check
}

void UnregisterListener(const IPtr<IDesignNotification>& Listener) {
  if (!Listeners) return;
  IInterface* Identity = QueryAs<IInterface>(Listener).Get();
  for (int I = Listeners->GetCount() - 1; I >= 0; --I)
    if (Listeners->Get(I).Get() == Identity) Listeners->Delete(I);
}

/// Calls `Call` on each listener from the last to the first, skipping nil entries. The
/// count is read again after each call because a listener may leave meanwhile.
template <class F> void ForEachListener(F&& Call) {
  if (!Listeners) return;
  for (int I = Listeners->GetCount() - 1; I >= 0; --I) {
    if (I >= Listeners->GetCount()) continue;
    if (IPtr<IDesignNotification> L = ListenerAt(I)) Call(L);
  }
}

void AddNoIconClasses(const std::vector<TClass>& Classes) {
  if (!NoIconClasses) return;
  NoIconClasses->insert(NoIconClasses->end(), Classes.begin(), Classes.end());
}
} // namespace

void DesignNotificationItemDeleted(const IPtr<IDesigner>& D, TPersistent* Item) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) { L->ItemDeleted(D, Item); });
}

void DesignNotificationItemInserted(const IPtr<IDesigner>& D, TPersistent* Item) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) { L->ItemInserted(D, Item); });
}

void DesignNotificationItemsModified(const IPtr<IDesigner>& D) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) { L->ItemsModified(D); });
}

void DesignNotificationSelectionChanged(const IPtr<IDesigner>& D, const IPtr<IDesignerSelections>& S) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) { L->SelectionChanged(D, S); });
}

void DesignNotificationDesignerOpened(const IPtr<IDesigner>& D, bool Resurrecting) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) { L->DesignerOpened(D, Resurrecting); });
}

void DesignNotificationDesignerClosed(const IPtr<IDesigner>& D, bool GoingDormant) {
  if (!Listeners) return;
  // A copy in order; a listener is called only while it is still registered, so one
  // that another unregisters meanwhile is not called.
  std::vector<IPtr<IInterface>> Copy;
  for (int I = 0, N = Listeners->GetCount(); I < N; ++I) Copy.push_back(Listeners->Get(I));
  for (IPtr<IInterface>& Entry : Copy) {
    if (Entry && Listeners && Listeners->IndexOf(Entry) >= 0)
      if (auto L = QueryAs<IDesignNotification>(Entry)) L->DesignerClosed(D, GoingDormant);
    Entry = nullptr;
  }
}

void DesignNotificationDescendantUpdated(const IPtr<IDesigner>& D) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) {
    if (auto Ex = QueryAs<IDesignNotificationEx>(L)) Ex->DescendantUpdated(D);
  });
}

void DesignNotificationViewAdded(const IPtr<IDesigner>& D, const String& ViewName) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) {
    if (auto V = QueryAs<IDesignNotificationViews>(L)) V->ViewAdded(D, ViewName);
  });
}

void DesignNotificationViewRemoved(const IPtr<IDesigner>& D, const String& ViewName) {
  ForEachListener([&](const IPtr<IDesignNotification>& L) {
    if (auto V = QueryAs<IDesignNotificationViews>(L)) V->ViewRemoved(D, ViewName);
  });
}

std::vector<IPtr<IDesignNotification>> DesignNotificationListeners() {
  std::vector<IPtr<IDesignNotification>> Out;
  ForEachListener([&](const IPtr<IDesignNotification>& L) { Out.push_back(L); });
  return Out;
}

bool IsNoIconComponent(TComponent* Component) {
  if (!Component) return true;
  if (!NoIconClasses) return false;
  return std::any_of(NoIconClasses->begin(), NoIconClasses->end(),
                     [&](TClass C) { return Component->InheritsFrom(C); });
}

void InitializeDesignNotifications() {
  if (!Listeners) Listeners = NewAs<IInterfaceList, TInterfaceList>();
}

void InitializeNoIconClasses() {
  if (!NoIconClasses) NoIconClasses = new std::vector<TClass>;
  RegisterNoIconProc = &AddNoIconClasses;
}

void InstallDesignNotificationHooks() {
  RegisterDesignNotificationProc = &RegisterListener;
  UnregisterDesignNotificationProc = &UnregisterListener;
}

void FinalizeDesignNotifications() noexcept {
  RegisterDesignNotificationProc = nullptr;
  UnregisterDesignNotificationProc = nullptr;
  RegisterNoIconProc = nullptr;
  delete NoIconClasses;
  NoIconClasses = nullptr;
  Listeners = nullptr;
}

} // namespace formkit
