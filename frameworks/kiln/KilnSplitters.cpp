//===- frameworks/kiln/KilnSplitters.cpp - Splitters ---------------------===//
#include "frameworks/kiln/KilnSplitters.h"

#include <algorithm>

namespace formkit {

FK_IMPLEMENT(TSplitter, "KilnSplitters") {
  detail::PublishAlign(B);
  B.Property("MinSize", &TSplitter::MinSize, &TSplitter::SetMinSize).Default(30);
  B.Property("ResizeStyle", &TSplitter::ResizeStyle, &TSplitter::SetResizeStyle).Default(rsPattern);
  detail::PublishVisible(B);
  B.Event("OnCanResize", &TSplitter::OnCanResize);
  B.Event("OnMoved", &TSplitter::OnMoved);
}

void TSplitter::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 3, 100);
  SetAlign(alLeft);
  SetCursor(crSizeWE);
}

namespace {
/// Whether `C`'s far edge touches the splitter `S` for their common alignment.
bool Touches(const TControl* C, const TControl* S) {
  switch (S->Align()) {
  case alTop: return C->Top() + C->Height() == S->Top();
  case alBottom: return C->Top() == S->Top() + S->Height();
  case alLeft: return C->Left() + C->Width() == S->Left();
  case alRight: return C->Left() == S->Left() + S->Width();
  default: return false;
  }
}
} // namespace

TControl* TSplitter::ResizeControl() const {
  TWinControl* P = Parent();
  if (!P) return nullptr;
  for (int I = 0; I < P->ControlCount(); ++I) {
    TControl* C = P->Controls(I);
    if (C != this && C->Visible() && C->Align() == Align() && Touches(C, this)) return C;
  }
  return nullptr;
}

bool TSplitter::MoveTo(int Position) {
  TControl* C = ResizeControl();
  if (!C) return false;
  int NewSize = 0;
  switch (Align()) {
  case alTop: NewSize = Position - C->Top(); break;
  case alBottom: NewSize = C->Top() + C->Height() - Position; break;
  case alLeft: NewSize = Position - C->Left(); break;
  case alRight: NewSize = C->Left() + C->Width() - Position; break;
  default: return false;
  }
  NewSize = std::max(NewSize, FMinSize);
  bool Accept = true;
  if (OnCanResize) OnCanResize(this, NewSize, Accept);
  if (!Accept) return false;
  if (Align() == alTop || Align() == alBottom) C->SetHeight(NewSize);
  else C->SetWidth(NewSize);
  if (OnMoved) OnMoved(this);
  return true;
}

} // namespace formkit
