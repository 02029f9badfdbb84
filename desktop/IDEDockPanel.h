//===- desktop/IDEDockPanel.h - Dock panels along the editor's edges -----===//
//
// `TEditorDockPanel` is a dock site along one edge of the source editor's
// window, with a splitter between it and the editor area. It collapses to
// nothing (and hides the splitter) when its last visible client leaves and
// comes back at the size its client remembers; it keeps its size in the
// desktop relative to the primary monitor; and a drag shows at most half of
// its parent as the drop preview. `ResetDockSite` floats every client of a
// site and collapses it.
//
// Example:
//   Panel->SetAlign(alLeft);
//   Panel->SetSplitter(LeftSplitter);     // order from the edge: next, panel, splitter
//   Panel->SaveState(Desktop, false, "LeftPanelSize", "LeftPanelClients",
//                    "LeftPanelData", EditWindow);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/DeskForm.h"
#include "frameworks/kiln/KilnDockTree.h"
#include "frameworks/kiln/KilnDragDock.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnSplitters.h"

namespace formkit {

FK_RESOURCESTRING(SAlignNotSetCorrectly, "Align property is not set correctly");
FK_RESOURCESTRING(SSplitterNotConfigured, "Splitter control is not configured correctly");
FK_RESOURCESTRING(SNextControlNotConfigured, "NextControl is not configured correctly");

/// A dock panel along an edge of the editor's window.
class FK_API TEditorDockPanel : public TPanel, public TDockHandler {
  FK_CLASS(TEditorDockPanel, TPanel)
public:
  /// A dock site with a `TPercentageDockTree`.
  void Create(TComponent* AOwner) override;

  // Properties ---------------------------------------------------------------------
  /// The splitter between the panel and the editor area; not owned.
  TSplitter* Splitter() const noexcept { return FSplitter; }
  /// Raises `Exception` "Align property is not set correctly" unless the panel stands
  /// along an edge, or "Splitter control is not configured correctly" for a splitter of
  /// another alignment or on the edge's side of the panel; then nothing changed.
  void SetSplitter(TSplitter* ASplitter);
  /// The next control outward along the same edge; not owned. Raises like `SetSplitter`,
  /// with "NextControl is not configured correctly", for one on the inner side.
  TControl* NextControl() const noexcept { return FNextControl; }
  void SetNextControl(TControl* AControl);
  bool ResizeSuspended() const noexcept { return FResizeSuspended; }
  /// Holds back collapsing; switched off, the zones are laid out again.
  void SetResizeSuspended(bool AValue);
  bool HideDockTreeCaption() const noexcept { return FHideDockTreeCaption; }
  void SetHideDockTreeCaption(bool AValue) noexcept { FHideDockTreeCaption = AValue; }
  TDockCaptionOrientation DockCaptionOrientation() const noexcept { return FDockCaptionOrientation; }
  /// Replaces an existing manager by a plain captioned tree of that orientation.
  void SetDockCaptionOrientation(TDockCaptionOrientation AValue);
  /// Fired with a null sender after a client left.
  TNotifyEvent OnDockClientRemoved;
  /// Fired by `DoSplitterMouseUp`, also when a splitter move was refused.
  TNotifyEvent OnSplitterMouseUp;

  // Operations ---------------------------------------------------------------------
  /// Makes the dock manager when there is none.
  void CreateDockManager();
  /// Stacks the panel after its next control and the splitter after the panel.
  void AdjustPosition();
  int VisibleClientCount() const;
  void DoSplitterMouseUp(TObject* ASender);
  /// Width (left, right) or height (top, bottom) 0, and the splitter hidden.
  void Collapse();
  /// The panel's size relative to the primary monitor under `SizeSection`, its clients
  /// under `ClientSection`, their arrangement under `DataSection`, all in the section
  /// of `DesktopForm`.
  void SaveState(TCustomIniFile* Desktop, bool IsProject, const String& SizeSection, const String& ClientSection,
                 const String& DataSection, TDesktopForm* DesktopForm);
  /// Reads what `SaveState` wrote; a desktop without the section leaves the panel.
  void LoadState(TCustomIniFile* Desktop, const String& SizeSection, const String& ClientSection,
                 const String& DataSection, TDesktopForm* DesktopForm);

  // Docking ------------------------------------------------------------------------
  /// The preview covers at most half of the parent.
  void DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) override;
  /// A collapsed panel opens at the dock rectangle's size, or the client's undocked size.
  void DockDrop(TDragDockObject* Source, int X, int Y) override;
  bool DoUnDock(TWinControl* NewTarget, TControl* Client) override;
  void CMUnDockClient(TControl* Client, TWinControl* NewTarget) override;
  void CMDockNotification(TControl* Client, TDockNotifyKind Kind) override;
  /// The child of that name.
  TControl* ReloadDockedControl(const String& Name) override;

protected:
  void Notification(TComponent* AComponent, TOperation Operation) override;

private:
  bool Horizontal() const noexcept { return Align() == alLeft || Align() == alRight; }
  /// Checks `AControl` against the panel's edge, as the next control (`Outer`) or the
  /// splitter; raises the text of the one it is when it is wrong.
  void CheckPlacement(TControl* AControl, bool Outer) const;
  void SetSize(int Size);

  TSplitter* FSplitter = nullptr;
  TControl* FNextControl = nullptr;
  bool FResizeSuspended = false;
  bool FHideDockTreeCaption = false;
  TDockCaptionOrientation FDockCaptionOrientation = dcoHorizontal;
};

/// Floats every client of `ASite`, the last first, then collapses the site along its
/// edge.
FK_API void ResetDockSite(TWinControl* ASite);

} // namespace formkit
