//===- frameworks/kiln/KilnDragDock.cpp - Dragging controls to dock them -===//
#include "frameworks/kiln/KilnDragDock.h"

#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnWindowTable.h"
#include "frameworks/kiln/KilnWindows.h"

namespace formkit {

//===----------------------------------------------------------------------===//
// Geometry
//===----------------------------------------------------------------------===//

int DragThreshold = 5;

TRect ScreenBoundsOf(const TControl* Control) {
  if (!Control->Parent()) return Control->BoundsRect();
  TPoint P = Control->Parent()->ClientToScreen(Point(Control->Left(), Control->Top()));
  return Bounds(P.X, P.Y, Control->Width(), Control->Height());
}

TAlign NearestEdge(const TRect& R, TPoint P) noexcept {
  if (!R.Contains(P)) return alNone;
  std::int64_t W = R.Width(), H = R.Height(), X = P.X - R.Left, Y = P.Y - R.Top;
  // Distances as fractions of the side they run across, compared without division.
  std::pair<std::int64_t, TAlign> Edges[] = {{X * H, alLeft}, {Y * W, alTop}, {(W - X) * H, alRight}, {(H - Y) * W, alBottom}};
  auto Best = Edges[0];
  for (auto& E : Edges)
    if (E.first < Best.first) Best = E;
  return Best.second;
}

TRect EdgeHalf(const TRect& R, TAlign Edge) noexcept {
  TRect Out = R;
  switch (Edge) {
  case alTop: Out.Bottom -= R.Height() / 2; break;
  case alBottom: Out.Top += R.Height() / 2; break;
  case alLeft: Out.Right -= R.Width() / 2; break;
  case alRight: Out.Left += R.Width() / 2; break;
  default: break;
  }
  return Out;
}

//===----------------------------------------------------------------------===//
// TDragDockObject
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDragDockObject, "KilnDragDock") {}

TDragDockObject::TDragDockObject(TControl* AControl) : FControl(AControl), FDockRect(ScreenBoundsOf(AControl)) {}

TAlign TDragDockObject::GetDockEdge(TPoint MousePos) const {
  return FDragTarget ? NearestEdge(ScreenBoundsOf(FDragTarget), MousePos) : alNone;
}

void TDragDockObject::DrawDragDockImage() {
  FImageRect = FDockRect;
  FImageVisible = true;
}

void TDragDockObject::EraseDragDockImage() { FImageVisible = false; }

//===----------------------------------------------------------------------===//
// TDockHandler
//===----------------------------------------------------------------------===//

int LRDockWidth(const TControl* Control) noexcept {
  const detail::TWindowExtras* E = detail::FindWindowExtras(Control);
  return E && E->LRDockWidth > 0 ? E->LRDockWidth : Control->Width();
}

int TBDockHeight(const TControl* Control) noexcept {
  const detail::TWindowExtras* E = detail::FindWindowExtras(Control);
  return E && E->TBDockHeight > 0 ? E->TBDockHeight : Control->Height();
}

void SetLRDockWidth(TControl* Control, int Value) { detail::WindowExtrasOf(Control).LRDockWidth = Value; }

void SetTBDockHeight(TControl* Control, int Value) { detail::WindowExtrasOf(Control).TBDockHeight = Value; }

TDockHandler* DockHandlerOf(TControl* Control) noexcept { return dynamic_cast<TDockHandler*>(Control); }

TControl* TDockHandler::HandlerControl() { return dynamic_cast<TControl*>(this); }

void TDockHandler::GetSiteInfo(TControl*, TRect&, TPoint, bool&) {}

void TDockHandler::PositionDockRect(TDragDockObject* Source) {
  auto* Site = dynamic_cast<TWinControl*>(HandlerControl());
  if (!Site) return;
  TPoint P = Site->ScreenToClient(Source->DragPos());
  Source->SetDropOnControl(nullptr);
  Source->SetDropAlign(alNone);
  TRect Zone = Site->ClientRect();
  for (TControl* C : DockClients(Site))
    if (C->Visible() && C != Source->Control() && C->BoundsRect().Contains(P)) {
      Zone = C->BoundsRect();
      Source->SetDropOnControl(C);
      Source->SetDropAlign(NearestEdge(Zone, P));
      Zone = EdgeHalf(Zone, Source->DropAlign());
      break;
    }
  TPoint Origin = Site->ClientToScreen(Zone.TopLeft());
  Source->SetDockRect(Bounds(Origin.X, Origin.Y, Zone.Width(), Zone.Height()));
}

void TDockHandler::DoDockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) {
  if (OnDockOver) OnDockOver(HandlerControl(), Source, X, Y, State, Accept);
}

void TDockHandler::DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) {
  PositionDockRect(Source);
  DoDockOver(Source, X, Y, State, Accept);
}

void TDockHandler::CMDockClient(TDragDockObject* Source, TPoint MousePos, std::intptr_t& Result) {
  if (Result != 0) return;
  auto* Site = dynamic_cast<TWinControl*>(HandlerControl());
  TPoint P = Site->ScreenToClient(MousePos);
  DockDrop(Source, P.X, P.Y);
  Result = 1;
}

void TDockHandler::DockDrop(TDragDockObject* Source, int, int) {
  ManualDock(Source->Control(), dynamic_cast<TWinControl*>(HandlerControl()), Source->DropOnControl(),
             Source->DropAlign());
}

bool TDockHandler::DoUnDock(TWinControl*, TControl*) { return true; }

void TDockHandler::CMUnDockClient(TControl* Client, TWinControl*) {
  auto* Site = dynamic_cast<TWinControl*>(HandlerControl());
  if (IPtr<IDockZones> Zones; Site && Supports(DockManager(Site), Zones)) Zones->RemoveControl(Client);
}

void TDockHandler::CMDockNotification(TControl*, TDockNotifyKind) {
  auto* Site = dynamic_cast<TWinControl*>(HandlerControl());
  if (IPtr<IDockZones> Zones; Site && Supports(DockManager(Site), Zones)) Zones->ResetBounds(true);
}

TControl* TDockHandler::ReloadDockedControl(const String& Name) {
  auto* Site = dynamic_cast<TWinControl*>(HandlerControl());
  for (TControl* C : DockClients(Site))
    if (CompareText(C->Name(), Name) == 0) return C;
  return nullptr;
}

void TDockHandler::DoStartDock(TDragDockObject*&) {}

void TDockHandler::DoEndDock(TObject*, int, int) {}

namespace detail {
void SendUndockClient(TControl* Control, TWinControl* NewTarget) {
  TWinControl* Old = HostDockSite(Control);
  if (!Old) return;
  // The size along the edge it leaves is what it comes back with.
  if (Old->Align() == alLeft || Old->Align() == alRight) SetLRDockWidth(Control, Control->Width());
  if (Old->Align() == alTop || Old->Align() == alBottom) SetTBDockHeight(Control, Control->Height());
  if (TDockHandler* H = DockHandlerOf(Old)) H->CMUnDockClient(Control, NewTarget);
  UndockFromTable(Control);
}

void SendDockNotification(TControl* Control, TDockNotifyKind Kind) {
  TWinControl* Site = HostDockSite(Control);
  if (!Site) return;
  if (TDockHandler* H = DockHandlerOf(Site))
    H->CMDockNotification(Control, Kind);
  else if (IPtr<IDockZones> Zones; Supports(DockManager(Site), Zones))
    Zones->ResetBounds(true);
}
} // namespace detail

//===----------------------------------------------------------------------===//
// TDockDrag
//===----------------------------------------------------------------------===//

TDockDrag::TDockDrag(TControl* AControl) : FControl(AControl) {
  TDragDockObject* Given = nullptr;
  if (TDockHandler* H = DockHandlerOf(AControl)) H->DoStartDock(Given);
  FOwned.Reset(Given ? Given : new TDragDockObject(AControl));
  FObject = FOwned.Get();
}

TDockDrag::~TDockDrag() {
  if (FEnded) return;
  EndImage();
  if (TDockHandler* H = DockHandlerOf(FControl))
    RunIgnoringExceptions([&] { H->DoEndDock(nullptr, FObject->DragPos().X, FObject->DragPos().Y); });
}

void TDockDrag::EndImage() noexcept {
  FEnded = true;
  RunIgnoringExceptions([&] { FObject->EraseDragDockImage(); });
}

TWinControl* TDockDrag::SiteAt(TPoint P) const {
  for (int I = Screen()->FormCount() - 1; I >= 0; --I) {
    TCustomForm* F = Screen()->Forms(I);
    if (F->Parent() || !IsWindowVisible(F) || F->HasAncestor(FControl) || !F->BoundsRect().Contains(P)) continue;
    TWinControl* Found = nullptr;
    for (TWinControl* C = F; C;) {
      if (IsDockSite(C) && !C->HasAncestor(FControl)) {
        TRect Influence = ScreenBoundsOf(C);
        bool CanDock = true;
        if (TDockHandler* H = DockHandlerOf(C)) H->GetSiteInfo(FControl, Influence, P, CanDock);
        if (CanDock && Influence.Contains(P)) Found = C;
      }
      C = dynamic_cast<TWinControl*>(C->ControlAtPos(C->ScreenToClient(P), false, true, false));
    }
    if (Found) return Found;
  }
  return nullptr;
}

void TDockDrag::MoveTo(TPoint P) {
  if (FEnded) return;
  FObject->SetDragPos(P);
  TWinControl* Site = SiteAt(P);
  TWinControl* Old = FObject->DragTarget();
  if (Old && Old != Site)
    if (TDockHandler* H = DockHandlerOf(Old)) {
      bool Ignored = false;
      TPoint Q = Old->ScreenToClient(P);
      H->DockOver(FObject, Q.X, Q.Y, dsDragLeave, Ignored);
    }
  FObject->SetDragTarget(Site);
  FObject->SetDropOnControl(nullptr);
  FObject->SetDropAlign(alNone);
  // Floating, the control would stand with its corner at the mouse.
  FObject->SetDockRect(Bounds(P.X, P.Y, FControl->Width(), FControl->Height()));
  FAccepted = Site != nullptr;
  if (Site) {
    TPoint Q = Site->ScreenToClient(P);
    TDragState State = Site == Old ? dsDragMove : dsDragEnter;
    if (TDockHandler* H = DockHandlerOf(Site)) {
      H->DockOver(FObject, Q.X, Q.Y, State, FAccepted);
    } else {
      FObject->SetDockRect(ScreenBoundsOf(Site));
    }
  }
  if (FObject->GetEraseWhenMoving()) FObject->EraseDragDockImage();
  FObject->DrawDragDockImage();
}

bool TDockDrag::Drop() {
  if (FEnded) return false;
  TWinControl* Target = FObject->DragTarget();
  TPoint P = FObject->DragPos();
  EndImage();
  TDockHandler* Self = DockHandlerOf(FControl);
  auto Tell = [&](TObject* Where) {
    if (Self) Self->DoEndDock(Where, P.X, P.Y);
  };
  TWinControl* Old = HostDockSite(FControl);
  bool Refused = Target && !FAccepted;
  if (!Refused && Old && Old != Target)
    if (TDockHandler* H = DockHandlerOf(Old)) Refused = !H->DoUnDock(Target, FControl);
  if (Refused) {
    Tell(nullptr);
    return false;
  }
  if (!Target) {
    ManualFloat(FControl, FObject->DockRect());
  } else if (TDockHandler* H = DockHandlerOf(Target)) {
    std::intptr_t Result = 0;
    H->CMDockClient(FObject, P, Result);
  } else {
    ManualDock(FControl, Target);
  }
  Tell(Target);
  return true;
}

void TDockDrag::Cancel() {
  if (FEnded) return;
  EndImage();
  if (TDockHandler* H = DockHandlerOf(FControl)) H->DoEndDock(nullptr, FObject->DragPos().X, FObject->DragPos().Y);
}

} // namespace formkit
