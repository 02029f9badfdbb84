//===- frameworks/kiln/KilnListView.h - Rows of items with columns ---------===//
//
// A list view shows items as rows: each a caption and sub-items under columns
// with captions and widths (-1 fits the contents, -2 the header). Rows may be
// selected, several at once, one of them focused; each change of a row's state
// is told through `OnChange`, as the system control does. Rows may be dragged
// within the list (`OnDragOver`, `OnDragDrop`) and keys typed on it are heard
// (`OnKeyPress`, `OnKeyDown`). The window handle exists once something asks for
// it (`HandleNeeded`).
//
// Example:
//   auto* List = CreateComponentOf<TListView>(Form);
//   List->SetViewStyle(vsReport);
//   List->Columns()->Add()->SetWidth(-1);
//   TListItem* Row = List->Items()->Add();
//   Row->SetCaption("0 - Panel0");
//   Row->SetSelected(true);                 // OnChange(List, Row, ctState)
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnDragDock.h"
#include "frameworks/kiln/KilnMemo.h"
#include "platform/Lists.h"

#include <memory>
#include <vector>

namespace formkit {

class TListItems;
class TListView;

FK_ENUM(TViewStyle, std::uint8_t, vsIcon, vsSmallIcon, vsList, vsReport)
/// What changed of a row.
FK_ENUM(TItemChange, std::uint8_t, ctText, ctImage, ctState)

/// One row of a list view. Owned by the view's `TListItems`.
class FK_API TListItem {
public:
  explicit TListItem(TListItems* AOwner) : FOwner(AOwner) {}
  TListItem(const TListItem&) = delete;
  TListItem& operator=(const TListItem&) = delete;

  TListItems* Owner() const noexcept { return FOwner; }
  TListView* ListView() const noexcept;
  /// The row's place, from 0.
  int Index() const;
  const String& Caption() const noexcept { return FCaption; }
  void SetCaption(const String& Value);
  /// The texts of the columns after the first. Owned by the row.
  TStrings* SubItems() const noexcept { return FSubItems.Get(); }
  bool Selected() const noexcept { return FSelected; }
  /// Selects or deselects; in a list of single selection selecting deselects the
  /// others. Each row whose state changes is told through the view's `OnChange`.
  void SetSelected(bool Value);
  bool Focused() const noexcept { return FFocused; }
  /// Focuses the row (the one focused before loses the focus).
  void SetFocused(bool Value);
  /// Scrolls the view so that the row shows.
  void MakeVisible(bool PartialOK);
  /// What the user of the view keeps with the row; not owned.
  TObject* Data = nullptr;

private:
  friend class TListItems;
  TListItems* FOwner = nullptr; // back reference: the list owns this row
  String FCaption;
  TObjectGuard<TStringList> FSubItems{new TStringList};
  bool FSelected = false;
  bool FFocused = false;
};

/// The rows of a list view, owned by it.
class FK_API TListItems {
public:
  explicit TListItems(TListView* AOwner) : FOwner(AOwner) {}
  TListItems(const TListItems&) = delete;
  TListItems& operator=(const TListItems&) = delete;

  TListView* Owner() const noexcept { return FOwner; }
  int Count() const noexcept { return static_cast<int>(FItems.size()); }
  /// The row at `Index`; raises `EListError` "List index out of bounds (%d)".
  TListItem* Item(int Index) const;
  /// A new row at the end.
  TListItem* Add();
  void Delete(int Index);
  void Clear();
  /// Changes inside an update are drawn once, at its end.
  void BeginUpdate() noexcept { ++FUpdateCount; }
  void EndUpdate();
  int UpdateCount() const noexcept { return FUpdateCount; }

private:
  friend class TListView;
  friend class TListItem;
  TListView* FOwner = nullptr; // back reference: the view owns this list
  std::vector<std::unique_ptr<TListItem>> FItems;
  int FUpdateCount = 0;
};

/// A column of a list view in report style.
class FK_API TListColumn : public TCollectionItem {
  FK_CLASS(TListColumn, TCollectionItem)
  const String& Caption() const noexcept { return FCaption; }
  void SetCaption(const String& Value) { FCaption = Value; }
  /// The width in pixels, or -1 (fit the contents) or -2 (fit the header).
  int Width() const noexcept { return FWidth; }
  void SetWidth(int Value) { FWidth = Value; }
  String GetDisplayName() override { return FCaption.empty() ? inherited::GetDisplayName() : FCaption; }

private:
  String FCaption;
  int FWidth = 50;
};

/// The columns of a list view.
class FK_API TListColumns : public TOwnedCollection {
  FK_CLASS(TListColumns, TOwnedCollection)
  TListColumns() = default;
  explicit TListColumns(TListView* AOwner);
  TListColumn* Add() { return static_cast<TListColumn*>(TCollection::Add()); }
  TListColumn* Column(int Index) const { return static_cast<TListColumn*>(Items(Index)); }
};

FK_EVENT(TLVChangeEvent, void(TObject* Sender, TListItem* Item, TItemChange Change));
FK_EVENT(TListDragOverEvent, void(TObject* Sender, TObject* Source, int X, int Y, bool& Accept));
FK_EVENT(TListDragDropEvent, void(TObject* Sender, TObject* Source, int X, int Y));
FK_EVENT(TListKeyPressEvent, void(TObject* Sender, char& Key));

/// A list of rows in one of four styles; in report style with columns.
class FK_API TListView : public TWinControl {
  FK_CLASS(TListView, TWinControl)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  /// The height of a row and of the header, in pixels.
  static constexpr int RowHeight = 17;
  static constexpr int HeaderHeight = 20;

  TListItems* Items() const noexcept { return FItems.get(); }
  TListColumns* Columns() const noexcept { return FColumns.Get(); }

  // Style ------------------------------------------------------------------------
  TViewStyle ViewStyle() const noexcept { return FViewStyle; }
  void SetViewStyle(TViewStyle Value) noexcept { FViewStyle = Value; }
  bool ReadOnly() const noexcept { return FReadOnly; }
  void SetReadOnly(bool Value) noexcept { FReadOnly = Value; }
  bool MultiSelect() const noexcept { return FMultiSelect; }
  void SetMultiSelect(bool Value) noexcept { FMultiSelect = Value; }
  bool RowSelect() const noexcept { return FRowSelect; }
  void SetRowSelect(bool Value) noexcept { FRowSelect = Value; }
  bool ShowColumnHeaders() const noexcept { return FShowColumnHeaders; }
  void SetShowColumnHeaders(bool Value) noexcept { FShowColumnHeaders = Value; }
  bool ColumnClick() const noexcept { return FColumnClick; }
  void SetColumnClick(bool Value) noexcept { FColumnClick = Value; }
  TDragMode DragMode() const noexcept { return FDragMode; }
  void SetDragMode(TDragMode Value) noexcept { FDragMode = Value; }

  // The window ---------------------------------------------------------------------
  bool HandleAllocated() const noexcept { return FHandleAllocated; }
  /// Makes the window if it does not exist yet.
  void HandleNeeded() noexcept { FHandleAllocated = true; }
  /// How often the rows were laid out anew: after each change of rows outside an
  /// update, and once at the end of an update that changed them.
  int RedrawCount() const noexcept { return FRedrawCount; }

  // Selection and scrolling --------------------------------------------------------
  int SelCount() const;
  /// The first selected row, or null.
  TListItem* Selected() const;
  TListItem* ItemFocused() const;
  void ClearSelection();
  /// Selects every row (in a list of multiple selection).
  void SelectAll();
  /// The first row shown.
  int TopIndex() const noexcept { return FTopIndex; }
  void SetTopIndex(int Value);
  /// The rows the view has room for, at least 1.
  int VisibleRowCount() const;
  /// The row at client point (`X`, `Y`), or null.
  TListItem* GetItemAt(int X, int Y) const;

  // Input -------------------------------------------------------------------------
  /// A click on the row at `Index`: with ctrl it toggles, with shift it extends from
  /// the focused row, else the row alone is selected; the row gets the focus.
  void ClickRow(int Index, TShiftState Shift = {});
  /// Whether a drag of `Source` may drop at (`X`, `Y`): `OnDragOver` decides; false
  /// without it.
  bool DragOver(TObject* Source, int X, int Y);
  /// `Source` is dropped at (`X`, `Y`): `OnDragDrop` hears it.
  void DragDrop(TObject* Source, int X, int Y);
  /// A character typed on the view: `OnKeyPress` hears it and may swallow it (0).
  void KeyPress(char& Key);
  /// A key went down on the view: `OnKeyDown` hears it.
  void KeyDown(std::uint16_t& Key, TShiftState Shift);

  TLVChangeEvent OnChange;
  TListDragOverEvent OnDragOver;
  TListDragDropEvent OnDragDrop;
  TListKeyPressEvent OnKeyPress;
  TKeyEvent OnKeyDown;

private:
  friend class TListItems;
  friend class TListItem;
  void ItemChanged(TListItem* Item, TItemChange Change);
  void RowsChanged();
  std::unique_ptr<TListItems> FItems;
  TObjectGuard<TListColumns> FColumns;
  TViewStyle FViewStyle = vsIcon;
  bool FReadOnly = false;
  bool FMultiSelect = false;
  bool FRowSelect = false;
  bool FShowColumnHeaders = true;
  bool FColumnClick = true;
  TDragMode FDragMode = dmManual;
  bool FHandleAllocated = false;
  int FRedrawCount = 0;
  int FTopIndex = 0;
};

} // namespace formkit
