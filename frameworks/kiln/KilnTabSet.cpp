//===- frameworks/kiln/KilnTabSet.cpp - A strip of tabs with objects -----===//
#include "frameworks/kiln/KilnTabSet.h"

namespace formkit {

FK_RESOURCESTRING(STabSetIndexError, "Tab index out of bounds (%d)");

FK_IMPLEMENT(TTabSet, "KilnTabSet") {}

void TTabSet::Check(int Index) const {
  if (Index < 0 || Index >= TabCount()) throw EListError(STabSetIndexError, Index);
}

int TTabSet::AddTab(const String& Text, TObject* Object) {
  FTabs.push_back({Text, Object});
  return TabCount() - 1;
}

void TTabSet::DeleteTab(int Index) {
  Check(Index);
  FTabs.erase(FTabs.begin() + Index);
  if (FTabIndex == Index)
    FTabIndex = -1;
  else if (FTabIndex > Index)
    --FTabIndex;
}

void TTabSet::MoveTab(int From, int To) {
  Check(From);
  Check(To);
  TTab Moved = FTabs[static_cast<std::size_t>(From)];
  FTabs.erase(FTabs.begin() + From);
  FTabs.insert(FTabs.begin() + To, Moved);
  if (FTabIndex == From)
    FTabIndex = To;
  else if (FTabIndex > From && FTabIndex <= To)
    --FTabIndex;
  else if (FTabIndex >= To && FTabIndex < From)
    ++FTabIndex;
}

const String& TTabSet::TabText(int Index) const {
  Check(Index);
  return FTabs[static_cast<std::size_t>(Index)].Text;
}

void TTabSet::SetTabText(int Index, const String& Text) {
  Check(Index);
  FTabs[static_cast<std::size_t>(Index)].Text = Text;
}

TObject* TTabSet::TabObject(int Index) const {
  Check(Index);
  return FTabs[static_cast<std::size_t>(Index)].Object;
}

void TTabSet::SetTabObject(int Index, TObject* Object) {
  Check(Index);
  FTabs[static_cast<std::size_t>(Index)].Object = Object;
}

void TTabSet::SetTabIndex(int Index) {
  if (Index != -1) Check(Index);
  if (Index == FTabIndex) return;
  FTabIndex = Index;
  if (OnClick) OnClick(this);
}

int TTabSet::TabAt(TPoint P) const noexcept {
  if (FTabs.empty()) return -1;
  bool Vertical = FTabPosition == tpLeft || FTabPosition == tpRight;
  int Length = Vertical ? Height() : Width(), Along = Vertical ? P.Y : P.X;
  int Across = Vertical ? P.X : P.Y, Thickness = Vertical ? Width() : Height();
  if (Length <= 0 || Along < 0 || Along >= Length || Across < 0 || Across >= Thickness) return -1;
  int Index = static_cast<int>(static_cast<long long>(Along) * TabCount() / Length);
  return Index;
}

TRect TTabSet::TabRect(int Index) const noexcept {
  if (Index < 0 || Index >= TabCount()) return TRect();
  bool Vertical = FTabPosition == tpLeft || FTabPosition == tpRight;
  int Length = Vertical ? Height() : Width();
  auto Edge = [&](int I) { return static_cast<int>(static_cast<long long>(Length) * I / TabCount()); };
  if (Vertical) return Rect(0, Edge(Index), Width(), Edge(Index + 1));
  return Rect(Edge(Index), 0, Edge(Index + 1), Height());
}

} // namespace formkit
