//===- frameworks/kiln/KilnDockTree.h - Zones of a dock site --------------===//
//
// The dock manager that lays a site's clients out in a tree of zones: a leaf
// holds one control; an inner zone splits its space between its children side
// by side (vertical orientation) or one above the other (horizontal). Each
// child keeps its share of the parent, so zones keep their proportions when
// the site changes size. A zone left with one child gives way to it; a zone
// removed gives its space to its neighbour. A splitter of `BorderWidth` pixels
// follows each zone but the last, and a mouse drag on it moves the border.
// The tree saves itself as bytes that name each client by its `Name`.
//
// `TCaptionedTabDockTree` adds a caption strip (the grabber) to each client
// and a drawer that places the caption's close and pin buttons.
//
// Example:
//   auto Tree = New<TDockTree>(Site);
//   SetDockManager(Site, Tree);
//   ManualDock(A, Site);
//   ManualDock(B, Site, A, alRight);   // A | B, half each
//   Site->SetWidth(900);               // still half each
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDocking.h"
#include "frameworks/kiln/KilnGraphics.h"

#include <memory>
#include <vector>

namespace formkit {

/// How an inner zone splits its space: not yet, one above the other, side by side.
FK_ENUM(TDockOrientation, std::uint8_t, doNoOrient, doHorizontal, doVertical)
/// Where a client's caption strip lies: along its top, or down its left side.
FK_ENUM(TDockCaptionOrientation, std::uint8_t, dcoHorizontal, dcoVertical)

FK_RESOURCESTRING(SInvalidDockTreeData, "Invalid dock tree data");

/// A caption's parts, as a hit test answers them.
enum : int { HTNOWHERE = 0, HTCAPTION = 2, HTCLOSE = 20, HTPIN = 21 };

//===----------------------------------------------------------------------===//
// TDockZone
//===----------------------------------------------------------------------===//

/// One zone: a leaf with a control, or an inner zone with children. Owned by its parent
/// zone or, for the top zone, by the tree; the control is not owned.
class FK_API TDockZone {
public:
  TDockZone* ParentZone() const noexcept { return FParent; }
  TControl* ChildControl() const noexcept { return FControl; }
  TDockOrientation Orientation() const noexcept { return FOrientation; }
  int ChildCount() const noexcept { return static_cast<int>(FChildren.size()); }
  /// Raises `std::out_of_range` when out of range.
  TDockZone* Children(int Index) const { return FChildren.at(static_cast<std::size_t>(Index)).get(); }
  /// The part of the parent's extent this zone takes among its visible siblings.
  double Share() const noexcept { return FShare; }
  /// Where the last layout put the zone, in the site's client coordinates.
  const TRect& Bounds() const noexcept { return FBounds; }
  /// A leaf with a visible control, or an inner zone with such a leaf.
  bool Visible() const noexcept;

private:
  friend class TDockTree;
  TDockZone* FParent = nullptr;
  TControl* FControl = nullptr;
  TDockOrientation FOrientation = doNoOrient;
  double FShare = 1.0;
  TRect FBounds;
  std::vector<std::unique_ptr<TDockZone>> FChildren;
};

//===----------------------------------------------------------------------===//
// TDockTree
//===----------------------------------------------------------------------===//

/// The zones of one site. Made for a site and given to it with `SetDockManager`; the
/// site is not owned, and the tree must not outlive it.
class FK_API TDockTree : public TInterfacedObject, public IDockManager, public IDockZones {
  FK_CLASS(TDockTree, TInterfacedObject)
  FK_INTERFACES(IDockManager, IDockZones)
public:
  explicit TDockTree(TWinControl* ADockSite);

  TWinControl* DockSite() const noexcept { return FDockSite; }
  TDockZone* TopZone() const noexcept { return FTopZone.get(); }
  /// The leaf of `Control`, or null.
  TDockZone* FindControlZone(const TControl* Control) const noexcept;
  /// The thickness of the splitter after each zone but the last.
  int BorderWidth() const noexcept { return FBorderWidth; }
  void SetBorderWidth(int Value);

  // Zones --------------------------------------------------------------------------
  /// Side by side for `alLeft` and `alRight`, one above the other for `alTop` and
  /// `alBottom`, before or after `DropControl`'s zone, which gives up half its share;
  /// beside all zones when `DropControl` has none. `alNone` and `alClient` put the
  /// control last in the top zone's orientation (one above the other when it has none).
  void InsertControl(TControl* Control, TAlign InsertAt, TControl* DropControl) override;
  /// The zone's share goes to the zone before it (the one after, for a first zone); an
  /// inner zone left with one child gives way to it.
  void RemoveControl(TControl* Control) override;
  void ReplaceControl(TControl* Control, TControl* NewControl) override;
  void ResetBounds(bool Force) override;
  /// Gives the children of `Zone` equal shares.
  void ResetChildren(TDockZone* Zone);
  /// Holds layouts back until the matching `EndUpdate`, which lays out once.
  void BeginUpdate() noexcept { ++FUpdateCount; }
  void EndUpdate();

  // Splitters ----------------------------------------------------------------------
  /// The zone whose trailing splitter holds `P` (site client coordinates), or null.
  TDockZone* SplitterZoneAt(TPoint P) const;
  /// The zone whose splitter the mouse is dragging, or null.
  TDockZone* SizingZone() const noexcept { return FSizingZone; }
  void SetSizingZone(TDockZone* Value) noexcept { FSizingZone = Value; }
  /// A press on a splitter starts sizing its zone; true when it did.
  virtual bool MouseDown(TMouseButton Button, int X, int Y);
  virtual void MouseMove(int X, int Y);
  /// Ends a sizing: the border moves to the mouse, within the two zones it divides.
  virtual void MouseUp(TMouseButton Button, int X, int Y, bool& Handled);
  virtual void MouseLeave() {}

  // Captions -----------------------------------------------------------------------
  /// The thickness of a client's caption strip; 0 in a plain tree.
  virtual int GetGrabberSize() const { return 0; }
  /// Shrinks a leaf's rectangle to what its control fills.
  virtual void AdjustDockRect(TControl* Control, TRect& ARect) const;
  /// Paints the caption of `Control`, whose zone is `ARect`; nothing in a plain tree.
  virtual void PaintDockFrame(TCanvas* ACanvas, TControl* Control, const TRect& ARect);
  /// Paints the caption of each visible client.
  void PaintSite(TCanvas* ACanvas);

  // Streams ------------------------------------------------------------------------
  /// Writes the zones with each zone's part of its parent in 1/10,000 and each client's
  /// `Name`.
  void SaveToStream(TStream* Stream) override;
  /// Rebuilds the zones from `SaveToStream`'s bytes; a client that the site's
  /// `ReloadDockedControl` does not find is left out, and clients of the site that the
  /// bytes do not name go last. Raises `EReadError` "Invalid dock tree data" for bytes
  /// it cannot read, and then the zones stay as they were.
  void LoadFromStream(TStream* Stream) override;

protected:
  /// The control `Name` stands for when a stream is loaded.
  virtual TControl* FindClient(const String& Name);

private:
  TDockZone* NewLeafBeside(TDockZone* Target, TDockOrientation Orient, bool Before, TControl* Control);
  void Collapse(TDockZone* Zone);
  /// Takes a leaf out; with `GiveShare` its neighbour takes its share.
  void Unlink(TDockZone* Zone, bool GiveShare);
  void Layout(TDockZone* Zone, const TRect& R);
  void SetControlBounds(TDockZone* Leaf);
  /// Reads a zone; `Used` collects the clients placed so far, so none is placed twice.
  std::unique_ptr<TDockZone> ReadZone(TStream* Stream, int Depth, std::vector<TControl*>& Used);
  void WriteZone(TStream* Stream, const TDockZone* Zone);

  TWinControl* FDockSite;
  std::unique_ptr<TDockZone> FTopZone;
  int FBorderWidth = 4;
  int FUpdateCount = 0;
  TRect FOldRect;
  TDockZone* FSizingZone = nullptr;
};

//===----------------------------------------------------------------------===//
// Captions
//===----------------------------------------------------------------------===//

/// Places the buttons of a caption strip and answers which part a point is on.
class FK_API TDockCaptionDrawer : public TObject {
  FK_CLASS(TDockCaptionDrawer, TObject)
public:
  explicit TDockCaptionDrawer(TDockCaptionOrientation AOrientation) : FOrientation(AOrientation) {}
  TDockCaptionOrientation Orientation() const noexcept { return FOrientation; }
  /// The close and pin buttons of a caption; the base puts squares of the strip's
  /// thickness less 4 at its far end, close outermost.
  virtual TRect GetCloseRect(const TRect& ACaption, TWinControl* ASite) const;
  virtual TRect GetPinRect(const TRect& ACaption, TWinControl* ASite) const;
  /// `HTCLOSE`, `HTPIN`, `HTCAPTION` or `HTNOWHERE` for `P` in caption `ACaption`.
  int DockCaptionHitTest(const TRect& ACaption, TPoint P, TWinControl* ASite) const;

private:
  TDockCaptionOrientation FOrientation;
};

/// A tree whose clients carry a caption strip of `GetGrabberSize` along their top (or
/// left side, for vertical captions).
class FK_API TCaptionedTabDockTree : public TDockTree {
  FK_CLASS(TCaptionedTabDockTree, TDockTree)
public:
  TCaptionedTabDockTree(TWinControl* ADockSite, TDockCaptionOrientation AOrientation);
  TDockCaptionOrientation CaptionOrientation() const noexcept { return FCaptionOrientation; }
  /// The drawer of the captions; owned.
  TDockCaptionDrawer* DockCaptionDrawer() const noexcept { return FDrawer.get(); }
  int GetGrabberSize() const override { return 20; }
  void AdjustDockRect(TControl* Control, TRect& ARect) const override;
  /// The caption strip of a client whose zone is `ARect`.
  virtual TRect AdjustCaptionRect(const TRect& ARect) const;

protected:
  /// Makes the drawer of this class of tree.
  virtual std::unique_ptr<TDockCaptionDrawer> GetDockCaptionDrawer() const;
  /// Puts the drawer of `GetDockCaptionDrawer` in place. A constructor calls it: one of
  /// a descendant with a drawer of its own calls it again, since a base constructor only
  /// reaches the base's drawer.
  void InitDrawer() { FDrawer = GetDockCaptionDrawer(); }

private:
  TDockCaptionOrientation FCaptionOrientation;
  std::unique_ptr<TDockCaptionDrawer> FDrawer;
};

} // namespace formkit
