//===- frameworks/kiln/KilnControls.cpp - Controls and windowed controls -===//
#include "frameworks/kiln/KilnControls.h"

#include "frameworks/kiln/KilnDragDock.h"

#include "platform/Filer.h"

#include <algorithm>
#include <iterator>

namespace formkit {

FK_RESOURCESTRING(SControlParentSelf, "Control '%s' cannot be its own parent");
FK_RESOURCESTRING(SControlParentChild, "Control '%s' cannot be parented to '%s', which lies inside it");
FK_RESOURCESTRING(SControlNotWindowed, "Control '%s' cannot hold '%s': only a windowed control holds children");
FK_RESOURCESTRING(SComponentHoldsNoControls, "Component '%s' cannot hold the control '%s'");
FK_RESOURCESTRING(SControlNotChild, "Control '%s' is not a child of '%s'");
FK_RESOURCESTRING(SControlNotParent, "'%s' is not a parent of control '%s'");
FK_RESOURCESTRING(SControlIndexError, "Control index out of bounds (%d)");
FK_RESOURCESTRING(SInvalidPPI, "%d is not a valid number of pixels per inch");
FK_RESOURCESTRING(SInvalidMarginWidth, "Margin width %d is not valid: it must be 0 or more");
FK_RESOURCESTRING(SInvalidPaddingWidth, "Padding width %d is not valid: it must be 0 or more");

std::function<int(const TControl*)> ControlPPIHook;

namespace {
/// A name for messages: the control's name, or its class name when it has none.
String DisplayName(const TComponent* C) {
  if (!C) return "(none)";
  return C->Name().empty() ? C->ClassName() : C->Name();
}

/// Raises `EInvalidOperation` with `Message` for the first negative width of `Widths`.
void CheckWidths(const TRect& Widths, const TResString& Message) {
  for (int Width : {Widths.Left, Widths.Top, Widths.Right, Widths.Bottom})
    if (Width < 0) throw EInvalidOperation(Message, Width);
}
} // namespace

//===----------------------------------------------------------------------===//
// TControl
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TControl, "KilnControls") {
  auto SizeStored = +[](TObject* O) { return static_cast<TControl*>(O)->IsSizeStored(); };
  B.Property("Left", &TControl::Left, &TControl::SetLeft);
  B.Property("Top", &TControl::Top, &TControl::SetTop);
  B.Property("Width", &TControl::Width, &TControl::SetWidth).Stored(SizeStored);
  B.Property("Height", &TControl::Height, &TControl::SetHeight).Stored(SizeStored);
  B.Property("Cursor", &TControl::Cursor, &TControl::SetCursor).Type(&TypeInfo_TCursor).Default(crDefault);
  B.Property("Hint", &TControl::Hint, &TControl::SetHint);
}

void TControl::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FFont.Reset(new TFont);
  FFont->OnChange = TNotifyEvent::Bind<&TControl::FontChangedHandler>(this);
}

void TControl::BeforeDestruction() {
  // Leave the parent while this control and the parent are whole. A parent that goes
  // too need not hear of it, nor this control of its new parent: both are going.
  if (FParent && FParent->ComponentState().Contains(csDestroying)) FParent->Detach(this);
  else if (FParent) SetParent(nullptr);
  FFont.Reset();
  // Last: nothing queued for this control may be delivered once it is gone.
  RemoveMessages(this);
  inherited::BeforeDestruction();
}

void TControl::SetBounds(int ALeft, int ATop, int AWidth, int AHeight) {
  AWidth = std::max(AWidth, 0);
  AHeight = std::max(AHeight, 0);
  if (ALeft == FLeft && ATop == FTop && AWidth == FWidth && AHeight == FHeight) return;
  UpdateBounds(ALeft, ATop, AWidth, AHeight);
  RequestAlign();
}

void TControl::UpdateBounds(int ALeft, int ATop, int AWidth, int AHeight) {
  AWidth = std::max(AWidth, 0);
  AHeight = std::max(AHeight, 0);
  bool Sized = AWidth != FWidth || AHeight != FHeight;
  FLeft = ALeft;
  FTop = ATop;
  FWidth = AWidth;
  FHeight = AHeight;
  if (Sized) Resized();
}

void TControl::RequestAlign() {
  if (FParent && FAlign != alNone) FParent->Realign();
}

void TControl::SetClientWidth(int Value) { SetWidth(Value + (FWidth - ClientWidth())); }

void TControl::SetClientHeight(int Value) { SetHeight(Value + (FHeight - ClientHeight())); }

TPoint TControl::ClientOrigin() const {
  TPoint P{0, 0};
  for (const TControl* C = this; C; C = C->FParent) {
    TPoint Off = C->ClientOffset();
    P.X += C->FLeft + Off.X;
    P.Y += C->FTop + Off.Y;
  }
  return P;
}

TPoint TControl::ClientToScreen(TPoint P) const {
  TPoint O = ClientOrigin();
  return {P.X + O.X, P.Y + O.Y};
}

TPoint TControl::ScreenToClient(TPoint P) const {
  TPoint O = ClientOrigin();
  return {P.X - O.X, P.Y - O.Y};
}

TPoint TControl::ClientToParent(TPoint P, const TWinControl* AParent) const {
  const TControl* C = this;
  for (; C && C != AParent; C = C->FParent) {
    TPoint Off = C->ClientOffset();
    P.X += C->FLeft + Off.X;
    P.Y += C->FTop + Off.Y;
  }
  if (!C) throw EInvalidOperation(SControlNotParent, DisplayName(AParent), DisplayName(this));
  return P;
}

TPoint TControl::ParentToClient(TPoint P, const TWinControl* AParent) const {
  TPoint Zero = ClientToParent({0, 0}, AParent);
  return {P.X - Zero.X, P.Y - Zero.Y};
}

bool TControl::HasAncestor(const TControl* Other) const noexcept {
  for (const TControl* C = this; C; C = C->FParent)
    if (C == Other) return true;
  return false;
}

void TControl::SetParent(TWinControl* Value) {
  if (Value == FParent) return;
  if (Value == this) throw EInvalidOperation(SControlParentSelf, DisplayName(this));
  if (Value && Value->HasAncestor(this))
    throw EInvalidOperation(SControlParentChild, DisplayName(this), DisplayName(Value));
  TWinControl* Old = FParent;
  if (Old) Old->Detach(this);
  if (Value) Value->Attach(this);
  if (FParentFont && FParent) TakeParentFont();
  if (Old) Old->Perform(CM_CONTROLCHANGE, reinterpret_cast<std::intptr_t>(this), 0);
  if (Value) Value->Perform(CM_CONTROLCHANGE, reinterpret_cast<std::intptr_t>(this), 1);
  Perform(CM_PARENTCHANGED, reinterpret_cast<std::intptr_t>(Old), reinterpret_cast<std::intptr_t>(Value));
}

bool TControl::Showing() const noexcept {
  for (const TControl* C = this; C; C = C->FParent)
    if (!C->FVisible) return false;
  return true;
}

void TControl::SetVisible(bool Value) {
  if (FVisible == Value) return;
  FVisible = Value;
  RequestAlign();
  Perform(CM_VISIBLECHANGED, Value ? 1 : 0);
}

void TControl::SetEnabled(bool Value) {
  if (FEnabled == Value) return;
  FEnabled = Value;
  Perform(CM_ENABLEDCHANGED);
}

void TControl::SetAlign(TAlign Value) {
  if (FAlign == Value) return;
  FAlign = Value;
  if (FParent) FParent->Realign();
}

void TControl::SetText(const String& Value) {
  if (FText == Value) return;
  FText = Value;
  Perform(CM_TEXTCHANGED);
}

void TControl::SetColor(TColor Value) {
  if (FColor == Value) return;
  FColor = Value;
  Perform(CM_COLORCHANGED);
}

void TControl::SetMargins(TRect Value) {
  CheckWidths(Value, SInvalidMarginWidth);
  FMargins = Value;
}

void TControl::SetParentFont(bool Value) {
  FParentFont = Value;
  if (Value && FParent) TakeParentFont();
}

void TControl::TakeParentFont() {
  // A copy of the parent's font is not the control's own: its change notification must
  // leave ParentFont on.
  FTakingParentFont = true;
  auto Done = Finally([this]() noexcept { FTakingParentFont = false; });
  FFont->Assign(FParent->Font());
}

void TControl::FontChangedHandler(TObject*) {
  // A font set on the control itself is its own from now on; one copied from the
  // parent is not.
  if (!FTakingParentFont) FParentFont = false;
  Perform(CM_FONTCHANGED);
}

int TControl::CurrentPPI() const {
  if (ControlPPIHook) {
    int V = ControlPPIHook(this);
    if (V > 0) return V;
  }
  return FPPI;
}

void TControl::ScaleForPPI(int NewPPI) {
  if (NewPPI <= 0) throw EInvalidOperation(SInvalidPPI, NewPPI);
  if (NewPPI == FPPI) return;
  ChangeScale(NewPPI, FPPI, NewPPI);
}

void TControl::ChangeScale(int M, int D, int NewPPI) {
  FPPI = NewPPI;
  SetBounds(MulDiv(FLeft, M, D), MulDiv(FTop, M, D), MulDiv(FWidth, M, D), MulDiv(FHeight, M, D));
}

void TControl::SetOwnPPI(int Value) {
  if (Value <= 0) throw EInvalidOperation(SInvalidPPI, Value);
  FPPI = Value;
}

void TControl::Click() {
  if (OnClick && !IsDesigning()) OnClick(this);
}

void TControl::WndProc(TMessage& Message) {
  switch (Message.Msg) {
  case CM_FONTCHANGED: FontChanged(); break;
  case CM_TEXTCHANGED:
    TextChanged();
    detail::SendDockNotification(this, TDockNotifyKind::CaptionChanged);
    break;
  case CM_VISIBLECHANGED: detail::SendDockNotification(this, TDockNotifyKind::VisibleChanged); break;
  default: break;
  }
}

TComponent* TControl::GetParentComponent() { return FParent; }

void TControl::SetParentComponent(TComponent* AParent) {
  if (auto* W = dynamic_cast<TWinControl*>(AParent)) {
    SetParent(W);
    return;
  }
  // A control read under a non-visual root stays without a parent; under another kind
  // of control, or under a non-visual component of a module, it cannot stand: it would
  // be written back somewhere else.
  if (dynamic_cast<TControl*>(AParent))
    throw EInvalidOperation(SControlNotWindowed, DisplayName(AParent), DisplayName(this));
  if (AParent && AParent->Owner())
    throw EInvalidOperation(SComponentHoldsNoControls, DisplayName(AParent), DisplayName(this));
  SetParent(nullptr);
}

void TControl::SetName(const String& NewName) {
  String OldName = Name();
  TComponent* Own = Owner();
  bool Follow = FControlStyle.Contains(csSetCaption) && FText == OldName && !IsLoading() &&
                !(Own && Own->ComponentState().Contains(csLoading));
  inherited::SetName(NewName);
  if (Follow) SetText(NewName);
}

//===----------------------------------------------------------------------===//
// TWinControl
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TWinControl, "KilnControls") {}

void TWinControl::BeforeDestruction() {
  // What this control owns goes first, in one pass from the last to the first: usually
  // that is all of its children, each found at the back of its parent's list. Then it
  // takes the remaining children with it, whoever owns them; each leaves its owner in
  // its own teardown.
  DestroyComponents();
  while (!FControls.empty()) FControls.back()->Destroy();
  inherited::BeforeDestruction();
}

TControl* TWinControl::Controls(int Index) const {
  if (Index < 0 || Index >= ControlCount()) throw EListError(SControlIndexError, Index);
  return FControls[static_cast<std::size_t>(Index)];
}

int TWinControl::IndexOfControl(const TControl* Control) const noexcept {
  auto It = std::find(FControls.begin(), FControls.end(), Control);
  return It == FControls.end() ? -1 : static_cast<int>(It - FControls.begin());
}

void TWinControl::InsertControl(TControl* AControl) {
  if (!AControl) throw EInvalidOperation(SControlNotChild, "(none)", DisplayName(this));
  AControl->SetParent(this);
}

void TWinControl::RemoveControl(TControl* AControl) {
  if (!AControl || AControl->FParent != this)
    throw EInvalidOperation(SControlNotChild, DisplayName(AControl), DisplayName(this));
  AControl->SetParent(nullptr);
}

void TWinControl::ReserveForChild(bool Windowed) {
  // Geometric growth: reserving one more slot at a time would copy the list per child.
  auto Grow = [](auto& List) {
    if (List.size() == List.capacity()) List.reserve(std::max<std::size_t>(8, List.capacity() * 2));
  };
  Grow(FControls);
  if (Windowed) Grow(FTabList);
}

void TWinControl::Attach(TControl* Child) {
  auto* W = dynamic_cast<TWinControl*>(Child);
  ReserveForChild(W != nullptr);
  // Nothing below allocates: the lists stay consistent.
  FControls.push_back(Child);
  Child->FParent = this;
  if (!W) return;
  FTabList.push_back(W);
  W->FTabIndex = static_cast<int>(FTabList.size()) - 1;
  if (W->FPendingTabOrder >= 0) {
    int Pending = std::exchange(W->FPendingTabOrder, -1);
    W->SetTabOrder(Pending);
  }
}

namespace {
/// Erases `Item` from `List`, searching from the back, where teardown finds it; returns
/// whether it was the last element.
template <class T> bool EraseFromBack(std::vector<T*>& List, const void* Item) noexcept {
  for (std::size_t I = List.size(); I-- > 0;)
    if (List[I] == Item) {
      bool Last = I + 1 == List.size();
      List.erase(List.begin() + static_cast<std::ptrdiff_t>(I));
      return Last;
    }
  return true;
}
} // namespace

void TWinControl::Detach(TControl* Child) noexcept {
  EraseFromBack(FControls, Child);
  if (auto* W = dynamic_cast<TWinControl*>(Child)) {
    if (!EraseFromBack(FTabList, W)) FTabListStale = true;
    W->FTabIndex = -1;
  }
  Child->FParent = nullptr;
}

TControl* TWinControl::ControlAtPos(TPoint Pos, bool AllowDisabled, bool AllowWinControls, bool AllLevels) const {
  for (std::size_t I = FControls.size(); I-- > 0;) {
    TControl* C = FControls[I];
    auto* W = dynamic_cast<TWinControl*>(C);
    if (W && !AllowWinControls) continue;
    bool Visible = C->Visible() || (C->IsDesigning() && !C->ControlStyle().Contains(csNoDesignVisible));
    if (!Visible || (!C->Enabled() && !AllowDisabled)) continue;
    if (!C->BoundsRect().Contains(Pos)) continue;
    if (AllLevels && W) {
      TPoint Off = W->ClientOffset();
      if (TControl* Inner = W->ControlAtPos({Pos.X - W->Left() - Off.X, Pos.Y - W->Top() - Off.Y}, AllowDisabled,
                                            AllowWinControls, true))
        return Inner;
    }
    return C;
  }
  return nullptr;
}

void TWinControl::SetChildZOrder(TControl* Child, int Position) {
  int Index = IndexOfControl(Child);
  if (Index < 0) throw EInvalidOperation(SControlNotChild, DisplayName(Child), DisplayName(this));
  Position = std::clamp(Position, 0, ControlCount() - 1);
  if (Position == Index) return;
  FControls.erase(FControls.begin() + Index);
  FControls.insert(FControls.begin() + Position, Child);
  // Among aligned children of one kind, ties are broken by this order.
  if (Child->Align() != alNone) Realign();
}

void TWinControl::SetPadding(TRect Value) {
  CheckWidths(Value, SInvalidPaddingWidth);
  FPadding = Value;
}

int TWinControl::TabOrder() const noexcept {
  if (!FParent) return -1;
  if (FParent->FTabListStale) FParent->RenumberTabList();
  return FTabIndex;
}

void TWinControl::RenumberTabList() const noexcept {
  for (std::size_t I = 0; I < FTabList.size(); ++I) FTabList[I]->FTabIndex = static_cast<int>(I);
  FTabListStale = false;
}

void TWinControl::SetTabOrder(int Value) {
  if (!FParent) {
    FPendingTabOrder = Value;
    return;
  }
  if (ComponentState().Contains(csReading) && FParent->ComponentState().Contains(csReading)) {
    FReadTabOrder = Value;
    return;
  }
  int Current = TabOrder();
  if (Current < 0) return;
  auto& L = FParent->FTabList;
  Value = std::clamp(Value, 0, static_cast<int>(L.size()) - 1);
  if (Value == Current) return;
  L.erase(L.begin() + Current);
  L.insert(L.begin() + Value, this);
  FParent->FTabListStale = true;
}

void TWinControl::Realign() {
  if (FAlignLevel > 0 || FAligning || IsLoading() || ComponentState().Contains(csDestroying)) return;
  FAligning = true;
  auto Done = Finally([this]() noexcept { FAligning = false; });
  AlignControls();
}

void TWinControl::EnableAlign() {
  if (FAlignLevel > 0 && --FAlignLevel == 0) Realign();
}

void TWinControl::AlignControls() {
  // One pass over the children: most are not aligned, and a parent may have very many.
  std::vector<TControl*> Aligned;
  for (TControl* C : FControls) {
    if (C->Align() == alNone) continue;
    if (!C->Visible() && !(C->IsDesigning() && !C->ControlStyle().Contains(csNoDesignVisible))) continue;
    Aligned.push_back(C);
  }
  if (Aligned.empty()) return;
  TRect R = AlignRect();
  std::vector<TControl*> Group;
  for (TAlign A : {alTop, alBottom, alLeft, alRight, alClient}) {
    Group.clear();
    std::copy_if(Aligned.begin(), Aligned.end(), std::back_inserter(Group), [A](TControl* C) { return C->Align() == A; });
    // Controls of one edge keep the order in which they stand along it.
    std::stable_sort(Group.begin(), Group.end(), [A](TControl* X, TControl* Y) {
      switch (A) {
      case alTop: return X->Top() < Y->Top();
      case alBottom: return X->Top() + X->Height() > Y->Top() + Y->Height();
      case alLeft: return X->Left() < Y->Left();
      case alRight: return X->Left() + X->Width() > Y->Left() + Y->Width();
      default: return false;
      }
    });
    for (TControl* C : Group) {
      int W = C->Width();
      int H = C->Height();
      switch (A) {
      case alTop:
        C->UpdateBounds(R.Left, R.Top, std::max(R.Width(), 0), H);
        R.Top += H;
        break;
      case alBottom:
        C->UpdateBounds(R.Left, R.Bottom - H, std::max(R.Width(), 0), H);
        R.Bottom -= H;
        break;
      case alLeft:
        C->UpdateBounds(R.Left, R.Top, W, std::max(R.Height(), 0));
        R.Left += W;
        break;
      case alRight:
        C->UpdateBounds(R.Right - W, R.Top, W, std::max(R.Height(), 0));
        R.Right -= W;
        break;
      default: C->UpdateBounds(R.Left, R.Top, std::max(R.Width(), 0), std::max(R.Height(), 0)); break;
      }
    }
  }
}

void TWinControl::ChangeScale(int M, int D, int NewPPI) {
  // The children are laid out once, at the end, from their scaled bounds; after a
  // failure they are left where it stopped.
  DisableAlign();
  auto Undo = OnFailure([this]() noexcept { --FAlignLevel; });
  inherited::ChangeScale(M, D, NewPPI);
  for (TControl* C : std::vector<TControl*>(FControls)) C->ChangeScale(M, D, NewPPI);
  Undo.Dismiss();
  EnableAlign();
}

void TWinControl::ControlChange(TControl* Child, bool) {
  if (Child->Align() != alNone) Realign();
}

void TWinControl::WndProc(TMessage& Message) {
  if (Message.Msg == CM_CONTROLCHANGE) {
    ControlChange(reinterpret_cast<TControl*>(Message.WParam), Message.LParam != 0);
    return;
  }
  if (Message.Msg == CM_DIALOGCHAR) {
    Broadcast(Message);
    return;
  }
  inherited::WndProc(Message);
}

void TWinControl::Broadcast(TMessage& Message) {
  // A copy: a child that acts may change the list.
  for (TControl* C : std::vector<TControl*>(FControls))
    if ((Message.Result = SendMessage(C, Message.Msg, Message.WParam, Message.LParam)) != 0) return;
}

void TWinControl::Resized() {
  inherited::Resized();
  Realign();
  if (IPtr<IDockZones> Zones; Supports(DockManager(this), Zones)) Zones->ResetBounds(false);
}

void TWinControl::FontChanged() {
  inherited::FontChanged();
  for (TControl* C : std::vector<TControl*>(FControls))
    if (C->ParentFont()) C->SetParentFont(true);
}

void TWinControl::GetChildren(const TGetChildProc& Proc, TComponent* Root) {
  for (TControl* C : std::vector<TControl*>(FControls))
    if (C->Owner() == Root) Proc(C);
}

void TWinControl::SetChildOrder(TComponent* Child, int Order) {
  auto* C = dynamic_cast<TControl*>(Child);
  if (C && C->FParent == this) SetChildZOrder(C, Order);
}

void TWinControl::ReadState(TReader* Reader) {
  inherited::ReadState(Reader);
  FixupTabList();
}

void TWinControl::FixupTabList() {
  std::size_t Count = FTabList.size();
  std::vector<TWinControl*> Placed(Count, nullptr);
  std::vector<bool> IsPlaced(Count, false);
  bool Any = false;
  for (std::size_t I = 0; I < Count; ++I) {
    int At = std::exchange(FTabList[I]->FReadTabOrder, -1);
    if (At < 0 || static_cast<std::size_t>(At) >= Count || Placed[static_cast<std::size_t>(At)]) continue;
    Placed[static_cast<std::size_t>(At)] = FTabList[I];
    IsPlaced[I] = Any = true;
  }
  if (!Any) return;
  std::size_t Gap = 0;
  for (std::size_t I = 0; I < Count; ++I) {
    if (IsPlaced[I]) continue;
    while (Placed[Gap]) ++Gap;
    Placed[Gap] = FTabList[I];
  }
  FTabList = std::move(Placed);
  FTabListStale = true;
}

void TWinControl::Loaded() {
  inherited::Loaded();
  Realign();
}

//===----------------------------------------------------------------------===//
// Painted controls
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TGraphicControl, "KilnControls") {}

void TGraphicControl::Paint(TCanvas*) {}

FK_IMPLEMENT(TCustomControl, "KilnControls") {}

void TCustomControl::Paint(TCanvas* Canvas) {
  Canvas->Brush()->SetColor(Color());
  Canvas->FillRect(ClientRect());
}

} // namespace formkit
