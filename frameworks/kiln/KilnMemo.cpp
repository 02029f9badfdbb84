//===- frameworks/kiln/KilnMemo.cpp - A multi-line edit control -----------===//
#include "frameworks/kiln/KilnMemo.h"

#include "platform/Filer.h"
#include "platform/ScopeGuard.h"

#include <algorithm>

namespace formkit {

//===----------------------------------------------------------------------===//
// TStoredStrings
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStoredStrings, "KilnMemo") {}

void TStoredStrings::DefineProperties(TFiler* Filer) {
  inherited::DefineProperties(Filer);
  auto* Ancestor = dynamic_cast<TStrings*>(Filer->Ancestor());
  Filer->DefineProperty(
      "Strings", [this](TReader* R) { ReadLines(R); }, [this](TWriter* W) { WriteLines(W); },
      Ancestor ? !Equals(Ancestor) : Count() > 0);
}

void TStoredStrings::ReadLines(TReader* Reader) {
  BeginUpdate();
  auto Done = Finally([this]() noexcept { EndUpdate(); });
  Clear();
  Reader->ReadListBegin();
  while (!Reader->EndOfList()) Add(Reader->ReadString());
  Reader->ReadListEnd();
}

void TStoredStrings::WriteLines(TWriter* Writer) {
  Writer->WriteListBegin();
  for (int I = 0; I < Count(); ++I) Writer->WriteString(Get(I));
  Writer->WriteListEnd();
}

//===----------------------------------------------------------------------===//
// TMemo
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMemo, "KilnMemo") {
  detail::PublishAlign(B);
  detail::PublishColor(B, clWindow);
  detail::PublishEnabled(B);
  detail::PublishFont(B);
  B.Property("Lines", &TMemo::Lines, &TMemo::SetLines);
  B.Property("ReadOnly", &TMemo::ReadOnly, &TMemo::SetReadOnly).Default(false);
  B.Property("ScrollBars", &TMemo::ScrollBars, &TMemo::SetScrollBars).Default(ssNone);
  detail::PublishTabOrder(B);
  detail::PublishVisible(B);
  B.Property("WordWrap", &TMemo::WordWrap, &TMemo::SetWordWrap).Default(true);
  B.Event("OnChange", &TMemo::OnChange);
  detail::PublishOnClick(B);
  B.Event("OnKeyDown", &TMemo::OnKeyDown);
  B.Event("OnSelectionChange", &TMemo::OnSelectionChange);
}

void TMemo::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetControlStyle({csClickEvents, csDoubleClicks, csOpaque});
  SetColor(clWindow);
  SetTabStop(true);
  SetBounds(0, 0, 185, 89);
  FLines.Reset(new TStoredStrings);
  FLines->OnChange = TNotifyEvent::Bind<&TMemo::LinesChanged>(this);
}

void TMemo::BeforeDestruction() {
  FLines.Reset();
  inherited::BeforeDestruction();
}

void TMemo::Tell(const TNotifyEvent& Event) {
  if (Event && !IsDesigning() && !IsLoading()) Event(this);
}

void TMemo::LinesChanged(TObject*) {
  FSelStart = std::min(FSelStart, static_cast<int>(FLines->Text().size()));
  Tell(OnChange);
}

void TMemo::SetSelStart(int Value) {
  int Clamped = std::clamp(Value, 0, static_cast<int>(FLines->Text().size()));
  if (Clamped == FSelStart) return;
  FSelStart = Clamped;
  Tell(OnSelectionChange);
}

int TMemo::LineStart(int Line) const {
  int Start = 0;
  for (int I = 0; I < Line; ++I) Start += static_cast<int>(FLines->Get(I).size() + FLines->LineBreak.size());
  return Start;
}

int TMemo::CaretLine() const {
  int Line = 0;
  while (Line + 1 < FLines->Count() && LineStart(Line + 1) <= FSelStart) ++Line;
  return Line;
}

int TMemo::CaretColumn() const { return FSelStart - LineStart(CaretLine()); }

void TMemo::KeyDown(std::uint16_t& Key, TShiftState Shift) {
  if (OnKeyDown) OnKeyDown(this, Key, Shift);
}

} // namespace formkit
