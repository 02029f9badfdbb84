//===- frameworks/kiln/design/ViewSelector.h - The bar that picks a module's view ===//
//
// `TViewSelectorFrame` stands on top of an embedded designer: a drop-down list of
// the module's views (the master first, as an empty item, then the views made,
// under a header "*", then the devices with no view yet, under a header "+"),
// buttons to remove, rotate and frame the view, and the preview styles the
// host's platforms offer for the master. It holds no module: it reports the
// user's choices through its events and is told the views by its owner.
//
// Example:
//   Selector->OnSelectView = TViewNameEvent::Bind<&TMyFrame::DoSelectView>(this);
//   TStringList Views;  Views.Add("Phone");
//   Selector->PopulateViewSelector(&Views);   // "", "*", "Phone", "+", "Tablet"
//   Selector->SelectView("Tablet");           // OnAddView, then OnSelectView
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/design/EditorViewIntf.h"

#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnListCtrls.h"
#include "frameworks/kiln/KilnStdCtrls.h"
#include "frameworks/kiln/KilnToolBars.h"
#include "platform/Lists.h"

namespace formkit {

class TCanvas;
class TDeviceInfo;

FK_RESOURCESTRING(sConfirmDeleteView,
                  "The action you are about to perform cannot be undone.\r\nAre you sure that you want to delete "
                  "this view?");

FK_EVENT(TViewNameEvent, void(TObject* Sender, const String& Name));
FK_EVENT(TViewCheckEvent, void(TObject* Sender, const String& Name, bool& Allowed));
FK_EVENT(TViewStyleEvent, void(TObject* Sender, TOTAOSFamily Family));

/// The header item above the views a module has.
inline constexpr const char* CreatedViewsHeader = "*";
/// The header item above the devices a view can be added for.
inline constexpr const char* AvailableViewsHeader = "+";
/// A divider item.
inline constexpr const char* ViewDivider = "-";

/// Mouse messages of a control: the left button went down or up over it.
enum : std::uint32_t { WM_LBUTTONDOWN = 0x0201, WM_LBUTTONUP = 0x0202 };

//===----------------------------------------------------------------------===//
// The device list
//===----------------------------------------------------------------------===//

/// The owner-drawn list of views: headers, dividers and devices by their display name.
class FK_API TDeviceComboBox : public TComboBox {
  FK_CLASS(TDeviceComboBox, TComboBox)

  /// Whether the left button is down over the list (its control state's clicked bit).
  bool Clicking() const noexcept { return FClicking; }
  /// How many items the drop-down shows at once: all of them.
  int DropDownCount() const noexcept { return FDropDownCount; }
  void SetDropDownCount(int Value) noexcept { FDropDownCount = Value; }
  /// The index selected before the last change, to go back to when a change fails.
  int Tag() const noexcept { return FTag; }
  void SetTag(int Value) noexcept { FTag = Value; }
  /// The text drawn for item `Index`: a device's "DisplayName" attribute, else the item.
  String ItemLabel(int Index) const;
  /// Whether item `Index` is a header or a divider, which cannot stand selected.
  bool IsHeader(int Index) const;
  /// Draws item `Index` into `Rect` of `Canvas`: the headers as "Views" and "Available",
  /// a divider as a line, the master as "Master" and a device by its label, both indented
  /// by the width of "AA".
  void DrawItem(TCanvas* Canvas, int Index, const TRect& Rect) const;

protected:
  void WndProc(TMessage& Message) override;

private:
  bool FClicking = false;
  int FTag = 0;
  int FDropDownCount = 8;
};

//===----------------------------------------------------------------------===//
// The bar
//===----------------------------------------------------------------------===//

/// The bar of views and styles over an embedded designer: 700 by 34.
class FK_API TViewSelectorFrame : public TFrame {
  FK_CLASS(TViewSelectorFrame, TFrame)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The views the module has now (`Views` is copied); the other devices become
  /// available, and the list is built again.
  void PopulateViewSelector(TStrings* Views);
  /// Builds the list again from the views made and available, sorted.
  void RefreshViewSelector();
  /// Fills the styles from the host's platforms for the current personality.
  void PopulateStyleSelector();
  /// Selects the item of `Name` (empty: the master) without telling anyone.
  void HighlightView(const String& Name);
  void HighlightView(int Index);
  /// Selects and acts as the user's choice would (`cbDeviceSelectorChange`).
  void SelectView(const String& Name);
  void SelectView(int Index);
  /// Selects the style of `Family` on the master, else the first, and reports it.
  void SelectStyle(TOTAOSFamily Family);
  /// Whether the master is selected.
  bool IsMasterView() const;
  /// Empties the list.
  void Clear();
  int Count() const;
  /// Enables the buttons and shows the styles as the selection asks.
  void RefreshUI();
  /// Places the style list behind the view title.
  void RelocateUI();
  /// True when a wheel turned at `Pos` (frame coordinates) is the list's.
  bool FrameMouseWheel(TPoint Pos) const;

  // What the user does --------------------------------------------------------------------
  void cbDeviceSelectorChange(TObject* Sender);
  void cbStyleSelectorChange(TObject* Sender);
  /// Asks with `sConfirmDeleteView`, then reports the view removed and goes to the master.
  void acRemoveViewExecute(TObject* Sender);
  void acRotateExecute(TObject* Sender);
  void acBackgroundExecute(TObject* Sender);

  const TStringList* CreatedViews() const noexcept { return FCreatedViews.Get(); }
  const TStringList* AvailableViews() const noexcept { return FAvailableViews.Get(); }
  const std::vector<TOTAOSFamily>& PlatformIndexes() const noexcept { return FPlatformIndexes; }

  TToolBar* DeviceToolbar = nullptr;
  TButton* btnRemoveView = nullptr;
  TButton* btnRotateView = nullptr;
  TButton* btnShowBackground = nullptr;
  TDeviceComboBox* cbDeviceSelector = nullptr;
  TBevel* btnSeparator = nullptr;
  TLabel* lblViewTitle = nullptr;
  TLabel* lblStyleTitle = nullptr;
  TComboBox* cbStyleSelector = nullptr;

  TViewNameEvent OnRemoveView;
  TViewNameEvent OnAddView;
  TViewNameEvent OnSelectView;
  TNotifyEvent OnRotateView;
  TNotifyEvent OnBackgroundView;
  TViewCheckEvent OnCheckView;
  TViewStyleEvent OnSelectStyle;

private:
  void FillAvailableViews();
  void SortViews();
  /// Adds the views of `Views` that the device service accepts under `Header`.
  void AddViewGroup(const IPtr<IDesignerDeviceOperations>& Devices, TStringList* Views, const char* Header);
  TObjectGuard<TStringList> FCreatedViews;
  TObjectGuard<TStringList> FAvailableViews;
  std::vector<TOTAOSFamily> FPlatformIndexes;
};

} // namespace formkit
