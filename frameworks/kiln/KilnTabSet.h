//===- frameworks/kiln/KilnTabSet.h - A strip of tabs with objects -------===//
//
// `TTabSet` is a strip of tabs, each with a text and an object that the
// strip does not own. One tab at a time is selected; choosing one calls
// `OnClick`. Tabs can be moved, which is how a host reorders its clients.
//
// Example:
//   auto* Strip = CreateComponentOf<TTabSet>(Form);
//   Strip->AddTab("Messages", Info);   // tab 0
//   Strip->SetTabIndex(0);             // OnClick
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnControls.h"

namespace formkit {

/// The side of its owner a strip of tabs stands at.
FK_ENUM(TTabPosition, std::uint8_t, tpTop, tpBottom, tpLeft, tpRight)

/// A strip of tabs with a text and an object each.
class FK_API TTabSet : public TCustomControl {
  FK_CLASS(TTabSet, TCustomControl)
public:
  int TabCount() const noexcept { return static_cast<int>(FTabs.size()); }
  /// Appends a tab; its index.
  int AddTab(const String& Text, TObject* Object);
  /// Removes a tab; the selection follows its tab or becomes -1. Raises `EListError`
  /// "Tab index out of bounds (%d)" for a bad index.
  void DeleteTab(int Index);
  /// Moves the tab at `From` to `To`, the others closing up; the selection follows its tab.
  void MoveTab(int From, int To);
  const String& TabText(int Index) const;
  void SetTabText(int Index, const String& Text);
  /// The object of a tab; not owned.
  TObject* TabObject(int Index) const;
  void SetTabObject(int Index, TObject* Object);
  /// The selected tab, -1 for none.
  int TabIndex() const noexcept { return FTabIndex; }
  /// Selects a tab (-1 for none) and calls `OnClick` when it changes. Raises `EListError`.
  void SetTabIndex(int Index);
  /// The tab at a point of the strip, -1 for none: tabs of equal length along the strip.
  int TabAt(TPoint P) const noexcept;
  /// The rectangle of a tab in the strip; empty for a bad index.
  TRect TabRect(int Index) const noexcept;
  TTabPosition TabPosition() const noexcept { return FTabPosition; }
  void SetTabPosition(TTabPosition Value) noexcept { FTabPosition = Value; }
  int TabHeight() const noexcept { return FTabHeight; }
  void SetTabHeight(int Value) noexcept { FTabHeight = Value; }

  TNotifyEvent OnClick;

private:
  struct TTab {
    String Text;
    TObject* Object = nullptr;
  };
  void Check(int Index) const;
  std::vector<TTab> FTabs;
  int FTabIndex = -1;
  TTabPosition FTabPosition = tpBottom;
  int FTabHeight = 24;
};

} // namespace formkit
