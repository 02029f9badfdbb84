//===- frameworks/kiln/KilnDockTabs.cpp - A strip of tabs for docked clients ===//
#include "frameworks/kiln/KilnDockTabs.h"

#include <algorithm>

namespace formkit {

FK_RESOURCESTRING(STabIndexError, "Tab index out of bounds (%d)");

/// The manager of a tab set: clients that dock and leave become tabs and go.
class TDockTabManager : public TInterfacedObject, public IDockManager, public IDockZones {
  FK_CLASS(TDockTabManager, TInterfacedObject)
  FK_INTERFACES(IDockManager, IDockZones)
public:
  explicit TDockTabManager(TDockTabSet* ASet) : FSet(ASet) {}
  void InsertControl(TControl* Control, TAlign, TControl*) override { FSet->ClientDocked(Control); }
  void RemoveControl(TControl* Control) override { FSet->ClientLeft(Control); }
  void ReplaceControl(TControl* Control, TControl* NewControl) override {
    FSet->ClientLeft(NewControl);
    if (TTabDockClientInfo* Info = FSet->GetClientInfo(Control)) {
      Info->Control = NewControl;
      if (Info->TabIndex >= 0) FSet->FSlots[static_cast<std::size_t>(Info->TabIndex)] = NewControl;
    }
  }
  void ResetBounds(bool) override {}
  /// The order of the tabs is the order of the clients: nothing more to keep.
  void SaveToStream(TStream*) override {}
  void LoadFromStream(TStream*) override {}

private:
  TDockTabSet* FSet;
};
FK_IMPLEMENT(TDockTabManager, "KilnDockTabs") {}

FK_IMPLEMENT(TDockTabSet, "KilnDockTabs") {}

void TDockTabSet::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetDockSite(this, true);
  SetDockManager(this, New<TDockTabManager>(this));
}

TControl* TDockTabSet::TabClient(int Index) const {
  if (Index < 0 || Index >= TabCount()) throw EListError(STabIndexError, Index);
  return FSlots[static_cast<std::size_t>(Index)];
}

String TDockTabSet::Tabs(int Index) {
  TControl* C = TabClient(Index);
  return C ? GetTabName(C) : String();
}

TTabDockClientInfo* TDockTabSet::GetClientInfo(const TControl* AClient) const noexcept {
  for (auto& I : FInfos)
    if (I->Control == AClient) return I.get();
  return nullptr;
}

void TDockTabSet::DeleteTab(int Index) {
  TControl* C = TabClient(Index);
  if (TTabDockClientInfo* Info = GetClientInfo(C); Info && C) Info->TabIndex = -1;
  FSlots.erase(FSlots.begin() + Index);
  for (auto& I : FInfos)
    if (I->TabIndex > Index) --I->TabIndex;
}

void TDockTabSet::SetTabIndex(TTabDockClientInfo* AInfo, int Index) {
  if (Index < 0) throw EListError(STabIndexError, Index);
  if (Index >= TabCount()) FSlots.resize(static_cast<std::size_t>(Index) + 1, nullptr);
  TControl* There = FSlots[static_cast<std::size_t>(Index)];
  int Old = AInfo->TabIndex;
  if (Old >= 0) FSlots[static_cast<std::size_t>(Old)] = There;
  if (TTabDockClientInfo* Other = There ? GetClientInfo(There) : nullptr; Other && Other != AInfo) Other->TabIndex = Old;
  FSlots[static_cast<std::size_t>(Index)] = AInfo->Control;
  AInfo->TabIndex = Index;
}

void TDockTabSet::SelectTab(int Index) {
  if (TTabDockClientInfo* Info = GetClientInfo(TabClient(Index)); Info && Info->Control) ShowDockClientInfo(Info);
}

String TDockTabSet::GetTabName(TControl* AClient) {
  return AClient->Caption().empty() ? AClient->Name() : AClient->Caption();
}

bool TDockTabSet::ShouldAutoHide(TControl*) { return true; }

void TDockTabSet::ShowDockClientInfo(TTabDockClientInfo* AInfo) {
  AInfo->Control->Show();
  FShownClient = AInfo->Control;
}

void TDockTabSet::Paint(TCanvas* Canvas) {
  int X = 0;
  for (int I = 0; I < TabCount(); ++I) {
    String Text = Tabs(I);
    Canvas->TextOut(X + 4, 2, Text);
    X += Canvas->TextWidth(Text) + 8;
  }
}

void TDockTabSet::ClientDocked(TControl* AClient) {
  if (GetClientInfo(AClient)) return;
  FSlots.reserve(FSlots.size() + 1);
  auto Info = std::make_unique<TTabDockClientInfo>(TTabDockClientInfo{AClient, TabCount()});
  FInfos.push_back(std::move(Info));
  FSlots.push_back(AClient);
  if (ShouldAutoHide(AClient)) AClient->Hide();
}

void TDockTabSet::ClientLeft(TControl* AClient) noexcept {
  auto It = std::find_if(FInfos.begin(), FInfos.end(), [AClient](const auto& I) { return I->Control == AClient; });
  if (It == FInfos.end()) return;
  int Index = (*It)->TabIndex;
  FInfos.erase(It);
  if (FShownClient == AClient) FShownClient = nullptr;
  if (Index < 0) return;
  FSlots.erase(FSlots.begin() + Index);
  for (auto& I : FInfos)
    if (I->TabIndex > Index) --I->TabIndex;
}

} // namespace formkit
