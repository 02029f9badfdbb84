//===- frameworks/kiln/KilnListView.cpp - Rows of items with columns -------===//
#include "frameworks/kiln/KilnListView.h"

#include <algorithm>

namespace formkit {

//===----------------------------------------------------------------------===//
// TListItem
//===----------------------------------------------------------------------===//

TListView* TListItem::ListView() const noexcept { return FOwner ? FOwner->Owner() : nullptr; }

int TListItem::Index() const {
  if (!FOwner) return -1;
  const auto& Items = FOwner->FItems;
  auto It = std::find_if(Items.begin(), Items.end(), [this](const auto& Item) { return Item.get() == this; });
  return It == Items.end() ? -1 : static_cast<int>(It - Items.begin());
}

void TListItem::SetCaption(const String& Value) {
  if (FCaption == Value) return;
  FCaption = Value;
  if (TListView* View = ListView()) View->ItemChanged(this, ctText);
}

void TListItem::SetSelected(bool Value) {
  if (FSelected == Value) return;
  TListView* View = ListView();
  if (Value && View && !View->MultiSelect()) View->ClearSelection();
  FSelected = Value;
  if (View) View->ItemChanged(this, ctState);
}

void TListItem::SetFocused(bool Value) {
  if (FFocused == Value) return;
  TListView* View = ListView();
  if (Value && View)
    if (TListItem* Before = View->ItemFocused()) Before->SetFocused(false);
  FFocused = Value;
  if (View) View->ItemChanged(this, ctState);
}

void TListItem::MakeVisible(bool PartialOK) {
  TListView* View = ListView();
  if (!View) return;
  const int Row = Index();
  const int Rows = View->VisibleRowCount();
  if (Row < View->TopIndex()) View->SetTopIndex(Row);
  else if (Row >= View->TopIndex() + Rows && !(PartialOK && Row == View->TopIndex() + Rows))
    View->SetTopIndex(Row - Rows + 1);
}

//===----------------------------------------------------------------------===//
// TListItems
//===----------------------------------------------------------------------===//

TListItem* TListItems::Item(int Index) const {
  if (Index < 0 || Index >= Count()) throw EListError(SListIndexError, Index);
  return FItems[static_cast<std::size_t>(Index)].get();
}

TListItem* TListItems::Add() {
  FItems.push_back(std::make_unique<TListItem>(this));
  if (FOwner) FOwner->RowsChanged();
  return FItems.back().get();
}

void TListItems::Delete(int Index) {
  TListItem* Gone = Item(Index);
  if (Gone->Selected()) Gone->SetSelected(false);
  FItems.erase(FItems.begin() + Index);
  if (FOwner) FOwner->RowsChanged();
}

void TListItems::Clear() {
  if (FItems.empty()) return;
  BeginUpdate();
  while (!FItems.empty()) Delete(Count() - 1);
  EndUpdate();
}

void TListItems::EndUpdate() {
  if (FUpdateCount > 0 && --FUpdateCount == 0 && FOwner) FOwner->RowsChanged();
}

//===----------------------------------------------------------------------===//
// TListColumns
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TListColumn, "KilnListView") {
  B.Property("Caption", &TListColumn::Caption, &TListColumn::SetCaption);
  B.Property("Width", &TListColumn::Width, &TListColumn::SetWidth).Default(50);
}

FK_IMPLEMENT(TListColumns, "KilnListView") {}

TListColumns::TListColumns(TListView* AOwner) : TOwnedCollection(AOwner, TListColumn::StaticClass()) {}

//===----------------------------------------------------------------------===//
// TListView
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TListView, "KilnListView") {
  B.Property("Align", &TControl::Align, &TControl::SetAlign).Default(alNone);
  B.Property("ViewStyle", &TListView::ViewStyle, &TListView::SetViewStyle).Default(vsIcon);
  B.Property("ReadOnly", &TListView::ReadOnly, &TListView::SetReadOnly).Default(false);
  B.Property("MultiSelect", &TListView::MultiSelect, &TListView::SetMultiSelect).Default(false);
  B.Property("RowSelect", &TListView::RowSelect, &TListView::SetRowSelect).Default(false);
}

void TListView::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FItems = std::make_unique<TListItems>(this);
  FColumns.Reset(new TListColumns(this));
  SetBounds(0, 0, 250, 150);
}

void TListView::BeforeDestruction() {
  OnChange = {}; // the rows go without telling anyone
  FItems.reset();
  FColumns.Reset();
  inherited::BeforeDestruction();
}

void TListView::ItemChanged(TListItem* Item, TItemChange Change) {
  if (OnChange) OnChange(this, Item, Change);
}

void TListView::RowsChanged() {
  if (FItems->UpdateCount() > 0) return;
  ++FRedrawCount;
  SetTopIndex(FTopIndex); // kept inside the rows there are
}

int TListView::SelCount() const {
  int N = 0;
  for (const auto& Item : FItems->FItems) N += Item->Selected() ? 1 : 0;
  return N;
}

TListItem* TListView::Selected() const {
  for (const auto& Item : FItems->FItems)
    if (Item->Selected()) return Item.get();
  return nullptr;
}

TListItem* TListView::ItemFocused() const {
  for (const auto& Item : FItems->FItems)
    if (Item->Focused()) return Item.get();
  return nullptr;
}

void TListView::ClearSelection() {
  for (const auto& Item : FItems->FItems)
    if (Item->Selected()) Item->SetSelected(false);
}

void TListView::SelectAll() {
  if (!FMultiSelect) return;
  for (int I = 0; I < FItems->Count(); ++I) FItems->Item(I)->SetSelected(true);
}

void TListView::SetTopIndex(int Value) {
  FTopIndex = std::clamp(Value, 0, std::max(0, FItems->Count() - VisibleRowCount()));
}

int TListView::VisibleRowCount() const {
  int Header = FViewStyle == vsReport && FShowColumnHeaders ? HeaderHeight : 0;
  return std::max(1, (ClientHeight() - Header) / RowHeight);
}

TListItem* TListView::GetItemAt(int X, int Y) const {
  int Header = FViewStyle == vsReport && FShowColumnHeaders ? HeaderHeight : 0;
  if (X < 0 || X >= ClientWidth() || Y < Header) return nullptr;
  int Row = FTopIndex + (Y - Header) / RowHeight;
  return Row < FItems->Count() ? FItems->Item(Row) : nullptr;
}

void TListView::ClickRow(int Index, TShiftState Shift) {
  TListItem* Row = FItems->Item(Index);
  if (FMultiSelect && Shift.Contains(ssCtrl)) {
    Row->SetSelected(!Row->Selected());
  } else if (FMultiSelect && Shift.Contains(ssShift) && ItemFocused()) {
    int From = ItemFocused()->Index();
    for (int I = 0; I < FItems->Count(); ++I) {
      bool Within = (I >= std::min(From, Index) && I <= std::max(From, Index));
      FItems->Item(I)->SetSelected(Within);
    }
    return; // the anchor keeps the focus
  } else {
    for (int I = 0; I < FItems->Count(); ++I)
      if (I != Index) FItems->Item(I)->SetSelected(false);
    Row->SetSelected(true);
  }
  Row->SetFocused(true);
}

bool TListView::DragOver(TObject* Source, int X, int Y) {
  bool Accept = false;
  if (OnDragOver) OnDragOver(this, Source, X, Y, Accept);
  return Accept;
}

void TListView::DragDrop(TObject* Source, int X, int Y) {
  if (OnDragDrop) OnDragDrop(this, Source, X, Y);
}

void TListView::KeyPress(char& Key) {
  if (OnKeyPress) OnKeyPress(this, Key);
}

void TListView::KeyDown(std::uint16_t& Key, TShiftState Shift) {
  if (OnKeyDown) OnKeyDown(this, Key, Shift);
}

} // namespace formkit
