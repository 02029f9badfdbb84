//===- desktop/IDEDockPanel.cpp - Dock panels along the editor's edges ---===//
#include "desktop/IDEDockPanel.h"

#include "desktop/PercentageDockTree.h"
#include "frameworks/kiln/KilnForms.h"

#include <algorithm>

namespace formkit {

namespace {
constexpr const char* KeyPercentageSizes = "PercentageSizes";
constexpr const char* EditWindowClass = "TEditWindow";

bool HasSection(TCustomIniFile* Ini, const String& Section) {
  TObjectGuard<TStringList> Sections(new TStringList);
  Ini->ReadSections(Sections.Get());
  for (int I = 0; I < Sections->Count(); ++I)
    if (CompareText(Sections->Get(I), Section) == 0) return true;
  return false;
}

/// Freezes drawing through the desktop service unless it is frozen already; undone
/// when the scope ends.
class TDrawingLock {
public:
  TDrawingLock() : FLocked(!TIDEDesktopService::IsDrawingLocked()) {
    if (FLocked) TIDEDesktopService::LockDrawing();
  }
  ~TDrawingLock() {
    if (FLocked) RunIgnoringExceptions([] { TIDEDesktopService::UnLockDrawing(); });
  }
  TDrawingLock(const TDrawingLock&) = delete;
  TDrawingLock& operator=(const TDrawingLock&) = delete;

private:
  bool FLocked;
};
} // namespace

FK_IMPLEMENT(TEditorDockPanel, "IDEDockPanel") {}

void TEditorDockPanel::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetDockSite(this, true);
  CreateDockManager();
}

void TEditorDockPanel::CreateDockManager() {
  if (DockManager(this) || !IsDockSite(this)) return;
  SetDockManager(this, New<TPercentageDockTree>(this, FDockCaptionOrientation));
}

void TEditorDockPanel::SetDockCaptionOrientation(TDockCaptionOrientation AValue) {
  FDockCaptionOrientation = AValue;
  if (!DockManager(this)) return;
  auto Tree = New<TCaptionedTabDockTree>(this, AValue);
  for (TControl* C : DockClients(this)) Tree->InsertControl(C, alNone, nullptr);
  SetDockManager(this, Tree);
}

//===----------------------------------------------------------------------===//
// Splitter and next control
//===----------------------------------------------------------------------===//

void TEditorDockPanel::CheckPlacement(TControl* AControl, bool Outer) const {
  if (Align() != alTop && Align() != alBottom && Align() != alLeft && Align() != alRight)
    throw Exception(SAlignNotSetCorrectly);
  if (!AControl) return;
  // Along each edge, from the edge outward: next control, panel, splitter.
  bool Wrong = AControl->Align() != Align();
  switch (Align()) {
  case alLeft: Wrong |= Outer ? AControl->Left() > Left() : AControl->Left() < Left(); break;
  case alRight: Wrong |= Outer ? AControl->Left() < Left() : AControl->Left() > Left(); break;
  case alTop: Wrong |= Outer ? AControl->Top() > Top() : AControl->Top() < Top(); break;
  default: Wrong |= Outer ? AControl->Top() < Top() : AControl->Top() > Top(); break;
  }
  if (Wrong) throw Exception(Outer ? SNextControlNotConfigured : SSplitterNotConfigured);
}

void TEditorDockPanel::SetSplitter(TSplitter* ASplitter) {
  CheckPlacement(ASplitter, false);
  if (ASplitter) FreeNotification(ASplitter);
  FSplitter = ASplitter;
}

void TEditorDockPanel::SetNextControl(TControl* AControl) {
  CheckPlacement(AControl, true);
  if (AControl) FreeNotification(AControl);
  FNextControl = AControl;
}

void TEditorDockPanel::Notification(TComponent* AComponent, TOperation Operation) {
  inherited::Notification(AComponent, Operation);
  if (Operation != opRemove) return;
  if (AComponent == FSplitter) FSplitter = nullptr;
  if (AComponent == FNextControl) FNextControl = nullptr;
}

void TEditorDockPanel::AdjustPosition() {
  if (!FSplitter) return;
  TControl* N = FNextControl;
  switch (Align()) {
  case alLeft:
    if (N && N->Width() > 0) SetLeft(N->Left() + N->Width() + 1);
    FSplitter->SetLeft(Left() + Width() + 1);
    break;
  case alRight:
    if (N && N->Width() > 0) SetLeft(N->Left() - Width() - 1);
    FSplitter->SetLeft(Left() - FSplitter->Width() - 1);
    break;
  case alBottom:
    if (N && N->Height() > 0) SetTop(N->Top() - Height() - 1);
    FSplitter->SetTop(Top() - FSplitter->Height() - 1);
    break;
  case alTop:
    if (N && N->Height() > 0) SetTop(N->Top() + N->Height() + 1);
    FSplitter->SetTop(Top() + Height() + 1);
    break;
  default: break;
  }
  FSplitter->Show();
}

//===----------------------------------------------------------------------===//
// Size
//===----------------------------------------------------------------------===//

int TEditorDockPanel::VisibleClientCount() const {
  int N = 0;
  for (TControl* C : DockClients(this))
    if (C->Visible()) ++N;
  return N;
}

void TEditorDockPanel::SetSize(int Size) {
  if (Horizontal())
    SetWidth(Size);
  else
    SetHeight(Size);
}

void TEditorDockPanel::Collapse() {
  SetSize(0);
  if (FSplitter) FSplitter->Hide();
}

void TEditorDockPanel::SetResizeSuspended(bool AValue) {
  if (AValue == FResizeSuspended) return;
  FResizeSuspended = AValue;
  if (IPtr<IDockZones> Zones; !AValue && Supports(DockManager(this), Zones)) Zones->ResetBounds(true);
}

void TEditorDockPanel::DoSplitterMouseUp(TObject* ASender) {
  if (OnSplitterMouseUp) OnSplitterMouseUp(ASender);
}

//===----------------------------------------------------------------------===//
// Docking
//===----------------------------------------------------------------------===//

void TEditorDockPanel::DockOver(TDragDockObject* Source, int X, int Y, TDragState State, bool& Accept) {
  TDockHandler::DockOver(Source, X, Y, State, Accept);
  if (!Accept || !Parent()) return;
  TRect R = Source->DockRect();
  int HalfW = Parent()->Width() / 2, HalfH = Parent()->Height() / 2;
  switch (Align()) {
  case alTop: R.Bottom = std::min(R.Bottom, R.Top + HalfH); break;
  case alBottom: R.Top = std::max(R.Top, R.Bottom - HalfH); break;
  case alLeft: R.Right = std::min(R.Right, R.Left + HalfW); break;
  case alRight: R.Left = std::max(R.Left, R.Right - HalfW); break;
  default: break;
  }
  Source->SetDockRect(R);
}

void TEditorDockPanel::DockDrop(TDragDockObject* Source, int X, int Y) {
  TDrawingLock Lock;
  if (auto* Tree = dynamic_cast<TPercentageDockTree*>(DockManager(this).Get())) Tree->SetBorderWidth(ScaleValue(8));
  TControl* C = Source->Control();
  if ((Width() == 0 || Height() == 0) && C->Visible()) {
    if (Horizontal()) {
      int W = Source->DockRect().Width();
      SetWidth(W != 0 ? W : LRDockWidth(C));
    } else if (Align() == alTop || Align() == alBottom) {
      int H = Source->DockRect().Height();
      SetHeight(H != 0 ? H : TBDockHeight(C));
    }
  }
  TDockHandler::DockDrop(Source, X, Y);
  if (C->Visible()) AdjustPosition();
}

bool TEditorDockPanel::DoUnDock(TWinControl* NewTarget, TControl* Client) {
  TDrawingLock Lock;
  if (NewTarget == this && FResizeSuspended) return true;
  bool Result = TDockHandler::DoUnDock(NewTarget, Client);
  if (VisibleClientCount() == 0 && !FResizeSuspended) Collapse();
  return Result;
}

void TEditorDockPanel::CMUnDockClient(TControl* Client, TWinControl* NewTarget) {
  int ClientWidth = Client->Width(), ClientHeight = Client->Height();
  TWinControl* OldHost = HostDockSite(Client);
  bool WasVisible = Client->Visible();
  TDockHandler::CMUnDockClient(Client, NewTarget);
  auto* Tree = OldHost ? dynamic_cast<TPercentageDockTree*>(DockManager(OldHost).Get()) : nullptr;
  if (Tree) {
    if ((OldHost->Align() == alLeft || OldHost->Align() == alRight) &&
        CompareText(Client->ClassName(), EditWindowClass) == 0) {
      int Editors = 0, Tallest = 0;
      for (TControl* C : DockClients(OldHost))
        if (CompareText(C->ClassName(), EditWindowClass) == 0) {
          ++Editors;
          Tallest = std::max(Tallest, C->Height());
        }
      if (Editors == 1 && ClientHeight >= Tallest && OldHost->Width() > ClientWidth)
        OldHost->SetWidth(OldHost->Width() - ClientWidth);
    }
    Tree->BeginUpdate();
    auto Done = Finally([Tree]() noexcept { RunIgnoringExceptions([Tree] { Tree->EndUpdate(); }); });
    Tree->ResetChildren(Tree->TopZone());
  }
  int Visible = VisibleClientCount();
  if (!FResizeSuspended && !TIDEDesktopService::IsLocked() &&
      ((Visible == 1 && WasVisible) || (!FHideDockTreeCaption && Visible == 0)))
    Collapse();
  if (OnDockClientRemoved) OnDockClientRemoved(nullptr);
}

void TEditorDockPanel::CMDockNotification(TControl* Client, TDockNotifyKind Kind) {
  TDockHandler::CMDockNotification(Client, Kind);
  if (Kind != TDockNotifyKind::VisibleChanged) return;
  if (!Client->Visible()) {
    if (VisibleClientCount() == 0 && !FResizeSuspended) Collapse();
    return;
  }
  if (Width() != 0 && Height() != 0) return;
  if (Horizontal())
    SetWidth(LRDockWidth(Client));
  else
    SetHeight(TBDockHeight(Client) + (FDockCaptionOrientation == dcoHorizontal ? 24 : 0));
  AdjustPosition();
}

TControl* TEditorDockPanel::ReloadDockedControl(const String& Name) {
  for (int I = 0; I < ControlCount(); ++I)
    if (CompareText(Controls(I)->Name(), Name) == 0) return Controls(I);
  return nullptr;
}

//===----------------------------------------------------------------------===//
// Desktop
//===----------------------------------------------------------------------===//

void TEditorDockPanel::SaveState(TCustomIniFile* Desktop, bool IsProject, const String& SizeSection,
                                 const String& ClientSection, const String& DataSection,
                                 TDesktopForm* DesktopForm) {
  TMonitor* Primary = Screen()->PrimaryMonitor();
  int Size = Horizontal() ? Width() : Height();
  int Range = Horizontal() ? Primary->Width() : Primary->Height();
  Desktop->WriteInteger(DesktopForm->DeskSection(), SizeSection, TIDEDesktopService::ActualToRelative(Size, Range));
  DesktopForm->SaveDockClients(Desktop, IsProject, ClientSection, this);
  DesktopForm->SaveDockStream(Desktop, DataSection, this);
}

void TEditorDockPanel::LoadState(TCustomIniFile* Desktop, const String& SizeSection, const String& ClientSection,
                                 const String& DataSection, TDesktopForm* DesktopForm) {
  const String& Section = DesktopForm->DeskSection();
  if (!HasSection(Desktop, Section)) return;
  bool Percent = Desktop->ReadBool(Section, KeyPercentageSizes, false);
  int Size = Desktop->ReadInteger(Section, SizeSection, 0);
  if (Percent && Size != 0) {
    TMonitor* Primary = Screen()->PrimaryMonitor();
    Size = TIDEDesktopService::RelativeToActual(Size, Horizontal() ? Primary->Width() : Primary->Height());
  }
  if (Horizontal())
    SetWidth(Size);
  else if (Align() != alClient)
    SetHeight(Size);
  if (FSplitter && Size != 0) FSplitter->Show();
  int KeptWidth = Width();
  SetResizeSuspended(true);
  {
    auto Resume = Finally([&]() noexcept {
      RunIgnoringExceptions([&] { SetResizeSuspended(false); });
      RunIgnoringExceptions([&] { SetWidth(KeptWidth); });
    });
    DesktopForm->LoadDockClients(Desktop, ClientSection, this);
    DesktopForm->LoadDockStream(Desktop, DataSection, this);
  }
  if (Size == 0) return;
  if (VisibleClientCount() == 0)
    ResetDockSite(this);
  else
    AdjustPosition();
}

void ResetDockSite(TWinControl* ASite) {
  std::vector<TControl*> Clients = DockClients(ASite);
  for (auto It = Clients.rbegin(); It != Clients.rend(); ++It) ManualFloat(*It, ScreenBoundsOf(*It));
  switch (ASite->Align()) {
  case alTop:
  case alBottom: ASite->SetHeight(0); break;
  case alLeft:
  case alRight: ASite->SetWidth(0); break;
  default: break;
  }
}

} // namespace formkit
