//===- frameworks/kiln/KilnValEdit.cpp - A grid of names and values -------===//
#include "frameworks/kiln/KilnValEdit.h"

namespace formkit {

FK_IMPLEMENT(TValueListEditor, "KilnValEdit") {
  detail::PublishAlign(B);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  B.Property("KeyOptions", &TValueListEditor::KeyOptions, &TValueListEditor::SetKeyOptions);
  B.Property("Strings", &TValueListEditor::Strings, &TValueListEditor::SetStrings);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  B.Event("OnKeyDown", &TValueListEditor::OnKeyDown);
  B.Event("OnStringsChange", &TValueListEditor::OnStringsChange);
}

void TValueListEditor::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csClickEvents, csDoubleClicks, csOpaque});
  SetTabStop(true);
  SetBounds(0, 0, 306, 300);
  FStrings.Reset(new TStoredStrings);
  FStrings->OnChange = TNotifyEvent::Bind<&TValueListEditor::StringsChanged>(this);
}

void TValueListEditor::BeforeDestruction() {
  FStrings.Reset();
  inherited::BeforeDestruction();
}

int& TValueListEditor::Column(int Index) {
  if (Index < 0 || Index > 1) throw EListError(SListIndexError, Index);
  return FColWidths[Index];
}

int TValueListEditor::ColWidth(int Index) const { return const_cast<TValueListEditor*>(this)->Column(Index); }

void TValueListEditor::SetColWidth(int Index, int Value) { Column(Index) = Value; }

void TValueListEditor::StringsChanged(TObject*) {
  if (OnStringsChange && !IsDesigning() && !IsLoading()) OnStringsChange(this);
}

void TValueListEditor::KeyDown(std::uint16_t& Key, TShiftState Shift) {
  if (OnKeyDown) OnKeyDown(this, Key, Shift);
}

} // namespace formkit
