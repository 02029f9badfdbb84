//===- frameworks/kiln/KilnDockTree.cpp - Zones of a dock site ------------===//
#include "frameworks/kiln/KilnDockTree.h"

#include "frameworks/kiln/KilnDragDock.h"

#include <algorithm>
#include <cmath>

namespace formkit {

namespace {
constexpr std::int32_t TreeStreamVersion = 1;
constexpr std::int32_t ShareUnits = 10000;
/// Bounds of what a stream may hold; beyond them the bytes are not a tree.
constexpr int MaxDepth = 64;
constexpr std::int32_t MaxChildren = 4096;
constexpr std::int32_t MaxNameLength = 4096;

bool SideBySide(TDockOrientation O) noexcept { return O == doVertical; }

TDockOrientation OrientationOf(TAlign A) noexcept {
  return A == alLeft || A == alRight ? doVertical : doHorizontal;
}

int IndexIn(const TDockZone* Parent, const TDockZone* Child) {
  for (int I = 0; I < Parent->ChildCount(); ++I)
    if (Parent->Children(I) == Child) return I;
  return -1;
}

template <class T> void WriteValue(TStream* S, T V) { S->WriteBuffer(&V, sizeof V); }
template <class T> T ReadValue(TStream* S) {
  T V{};
  S->ReadBuffer(&V, sizeof V);
  return V;
}
} // namespace

//===----------------------------------------------------------------------===//
// TDockZone
//===----------------------------------------------------------------------===//

bool TDockZone::Visible() const noexcept {
  if (FControl) return FControl->Visible();
  return std::any_of(FChildren.begin(), FChildren.end(), [](const auto& C) { return C->Visible(); });
}

//===----------------------------------------------------------------------===//
// TDockTree
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDockTree, "KilnDockTree") {}

TDockTree::TDockTree(TWinControl* ADockSite) : FDockSite(ADockSite), FTopZone(std::make_unique<TDockZone>()) {}

void TDockTree::SetBorderWidth(int Value) {
  if (Value == FBorderWidth) return;
  FBorderWidth = std::max(0, Value);
  ResetBounds(true);
}

namespace {
TDockZone* FindIn(TDockZone* Zone, const TControl* Control) noexcept {
  if (Zone->ChildControl() == Control) return Zone;
  for (int I = 0; I < Zone->ChildCount(); ++I)
    if (TDockZone* Found = FindIn(Zone->Children(I), Control)) return Found;
  return nullptr;
}
} // namespace

TDockZone* TDockTree::FindControlZone(const TControl* Control) const noexcept {
  return Control ? FindIn(FTopZone.get(), Control) : nullptr;
}

TDockZone* TDockTree::NewLeafBeside(TDockZone* Target, TDockOrientation Orient, bool Before, TControl* Control) {
  auto Leaf = std::make_unique<TDockZone>();
  Leaf->FControl = Control;
  TDockZone* Result = Leaf.get();
  TDockZone* Parent = Target == FTopZone.get() ? Target : Target->FParent;
  if (Parent->ChildCount() <= 1) Parent->FOrientation = Orient;
  if (Parent->FOrientation != Orient && Target == FTopZone.get()) {
    // Everything there so far becomes one zone beside the new one.
    auto Inner = std::make_unique<TDockZone>();
    Inner->FOrientation = Parent->FOrientation;
    Inner->FParent = Parent;
    Inner->FChildren = std::move(Parent->FChildren);
    for (auto& C : Inner->FChildren) C->FParent = Inner.get();
    Parent->FChildren.clear();
    Parent->FChildren.push_back(std::move(Inner));
    Parent->FOrientation = Orient;
  }
  if (Target == FTopZone.get()) {
    double Sum = 0;
    for (auto& C : Parent->FChildren) Sum += C->FShare;
    Leaf->FShare = Parent->FChildren.empty() ? 1.0 : Sum / static_cast<double>(Parent->ChildCount());
    Leaf->FParent = Parent;
    Parent->FChildren.insert(Before ? Parent->FChildren.begin() : Parent->FChildren.end(), std::move(Leaf));
    return Result;
  }
  auto At = Parent->FChildren.begin() + IndexIn(Parent, Target);
  if (Parent->FOrientation == Orient) {
    Target->FShare /= 2;
    Leaf->FShare = Target->FShare;
    Leaf->FParent = Parent;
    Parent->FChildren.insert(Before ? At : At + 1, std::move(Leaf));
    return Result;
  }
  // The drop zone splits the other way: it and the new leaf share a zone of their own.
  auto Inner = std::make_unique<TDockZone>();
  Inner->FOrientation = Orient;
  Inner->FParent = Parent;
  Inner->FShare = Target->FShare;
  std::unique_ptr<TDockZone> Old = std::move(*At);
  Old->FShare = 0.5;
  Leaf->FShare = 0.5;
  Old->FParent = Leaf->FParent = Inner.get();
  if (Before) {
    Inner->FChildren.push_back(std::move(Leaf));
    Inner->FChildren.push_back(std::move(Old));
  } else {
    Inner->FChildren.push_back(std::move(Old));
    Inner->FChildren.push_back(std::move(Leaf));
  }
  *At = std::move(Inner);
  return Result;
}

void TDockTree::InsertControl(TControl* Control, TAlign InsertAt, TControl* DropControl) {
  if (!Control) return;
  if (FindControlZone(Control)) RemoveControl(Control);
  TDockZone* Target = DropControl ? FindControlZone(DropControl) : nullptr;
  bool Before = InsertAt == alLeft || InsertAt == alTop;
  TDockOrientation Orient = OrientationOf(InsertAt);
  if (InsertAt == alNone || InsertAt == alClient) {
    Target = nullptr;
    Orient = FTopZone->FOrientation == doNoOrient ? doHorizontal : FTopZone->FOrientation;
  }
  NewLeafBeside(Target ? Target : FTopZone.get(), Orient, Before, Control);
  ResetBounds(true);
}

void TDockTree::Collapse(TDockZone* Zone) {
  TDockZone* Top = FTopZone.get();
  if (Zone != Top && Zone->ChildCount() == 1) {
    TDockZone* Parent = Zone->FParent;
    std::unique_ptr<TDockZone> Only = std::move(Zone->FChildren.front());
    Only->FShare = Zone->FShare;
    Only->FParent = Parent;
    Parent->FChildren[static_cast<std::size_t>(IndexIn(Parent, Zone))] = std::move(Only);
  }
  if (Top->ChildCount() == 1 && !Top->FChildren.front()->FControl) {
    std::unique_ptr<TDockZone> Only = std::move(Top->FChildren.front());
    Top->FOrientation = Only->FOrientation;
    Top->FChildren = std::move(Only->FChildren);
    for (auto& C : Top->FChildren) C->FParent = Top;
  }
  if (Top->ChildCount() <= 1) Top->FOrientation = doNoOrient;
}

void TDockTree::Unlink(TDockZone* Zone, bool GiveShare) {
  FSizingZone = nullptr;
  TDockZone* Parent = Zone->FParent;
  int I = IndexIn(Parent, Zone);
  int Neighbour = I > 0 ? I - 1 : I + 1;
  if (GiveShare && Neighbour < Parent->ChildCount()) Parent->Children(Neighbour)->FShare += Zone->FShare;
  Parent->FChildren.erase(Parent->FChildren.begin() + I);
  Collapse(Parent);
}

void TDockTree::RemoveControl(TControl* Control) {
  TDockZone* Zone = FindControlZone(Control);
  if (!Zone) return;
  Unlink(Zone, true);
  ResetBounds(true);
}

void TDockTree::ReplaceControl(TControl* Control, TControl* NewControl) {
  if (!NewControl || !FindControlZone(Control)) return;
  // The new control's own zone goes without a trace: its share was never anyone's.
  if (TDockZone* Own = FindControlZone(NewControl)) Unlink(Own, false);
  FindControlZone(Control)->FControl = NewControl;
  ResetBounds(true);
}

void TDockTree::ResetChildren(TDockZone* Zone) {
  if (!Zone) return;
  for (auto& C : Zone->FChildren) C->FShare = 1.0;
  ResetBounds(true);
}

void TDockTree::EndUpdate() {
  if (FUpdateCount > 0 && --FUpdateCount == 0) ResetBounds(true);
}

void TDockTree::ResetBounds(bool Force) {
  if (FUpdateCount > 0 || !FDockSite) return;
  TRect R = FDockSite->ClientRect();
  if (!Force && R == FOldRect) return;
  FOldRect = R;
  Layout(FTopZone.get(), R);
}

void TDockTree::Layout(TDockZone* Zone, const TRect& R) {
  Zone->FBounds = R;
  if (Zone->FControl) {
    SetControlBounds(Zone);
    return;
  }
  std::vector<TDockZone*> Shown;
  double Sum = 0;
  for (auto& C : Zone->FChildren)
    if (C->Visible()) {
      Shown.push_back(C.get());
      Sum += C->FShare;
    }
  if (Shown.empty()) return;
  bool Across = SideBySide(Zone->FOrientation);
  int Start = Across ? R.Left : R.Top;
  int Total = Across ? R.Width() : R.Height();
  int Splitters = FBorderWidth * static_cast<int>(Shown.size() - 1);
  int Room = std::max(0, Total - Splitters);
  double Cum = 0;
  for (std::size_t I = 0; I < Shown.size(); ++I) {
    // Edges come from the running sum, so rounding never piles up along a row.
    int From = Start + static_cast<int>(std::lround(Sum > 0 ? Room * Cum / Sum : 0)) + static_cast<int>(I) * FBorderWidth;
    Cum += Shown[I]->FShare;
    int To = Start + static_cast<int>(std::lround(Sum > 0 ? Room * Cum / Sum : 0)) + static_cast<int>(I) * FBorderWidth;
    if (I + 1 == Shown.size()) To = Start + Total;
    TRect Slice = Across ? Rect(From, R.Top, std::max(From, To), R.Bottom) : Rect(R.Left, From, R.Right, std::max(From, To));
    Layout(Shown[I], Slice);
  }
}

void TDockTree::SetControlBounds(TDockZone* Leaf) {
  TRect R = Leaf->FBounds;
  AdjustDockRect(Leaf->FControl, R);
  TControl* C = Leaf->FControl;
  C->SetBounds(R.Left, R.Top, std::max(0, R.Width()), std::max(0, R.Height()));
  // What a client has along an edge is what it comes back with there.
  TAlign Edge = FDockSite->Align();
  if ((Edge == alLeft || Edge == alRight) && C->Width() > 0) SetLRDockWidth(C, C->Width());
  if ((Edge == alTop || Edge == alBottom) && C->Height() > 0) SetTBDockHeight(C, C->Height());
}

void TDockTree::AdjustDockRect(TControl*, TRect&) const {}

void TDockTree::PaintDockFrame(TCanvas*, TControl*, const TRect&) {}

void TDockTree::PaintSite(TCanvas* ACanvas) {
  std::vector<TDockZone*> Todo{FTopZone.get()};
  while (!Todo.empty()) {
    TDockZone* Z = Todo.back();
    Todo.pop_back();
    if (!Z->Visible()) continue;
    if (Z->FControl) PaintDockFrame(ACanvas, Z->FControl, Z->FBounds);
    for (auto It = Z->FChildren.rbegin(); It != Z->FChildren.rend(); ++It) Todo.push_back(It->get());
  }
}

//===----------------------------------------------------------------------===//
// Splitters
//===----------------------------------------------------------------------===//

TDockZone* TDockTree::SplitterZoneAt(TPoint P) const {
  std::vector<TDockZone*> Todo{FTopZone.get()};
  while (!Todo.empty()) {
    TDockZone* Z = Todo.back();
    Todo.pop_back();
    TDockZone* Previous = nullptr;
    for (auto& C : Z->FChildren) {
      if (!C->Visible()) continue;
      if (Previous) {
        const TRect& B = Previous->FBounds;
        TRect Band = SideBySide(Z->FOrientation) ? Rect(B.Right, Z->FBounds.Top, C->FBounds.Left, Z->FBounds.Bottom)
                                                 : Rect(Z->FBounds.Left, B.Bottom, Z->FBounds.Right, C->FBounds.Top);
        if (Band.Contains(P)) return Previous;
      }
      Previous = C.get();
      Todo.push_back(C.get());
    }
  }
  return nullptr;
}

bool TDockTree::MouseDown(TMouseButton Button, int X, int Y) {
  if (Button != mbLeft) return false;
  FSizingZone = SplitterZoneAt(Point(X, Y));
  return FSizingZone != nullptr;
}

void TDockTree::MouseMove(int, int) {}

void TDockTree::MouseUp(TMouseButton Button, int X, int Y, bool& Handled) {
  TDockZone* Zone = FSizingZone;
  FSizingZone = nullptr;
  if (Button != mbLeft || !Zone) return;
  Handled = true;
  TDockZone* Parent = Zone->FParent;
  TDockZone* Next = nullptr;
  for (int I = IndexIn(Parent, Zone) + 1; I < Parent->ChildCount() && !Next; ++I)
    if (Parent->Children(I)->Visible()) Next = Parent->Children(I);
  if (!Next) return;
  bool Across = SideBySide(Parent->FOrientation);
  int From = Across ? Zone->FBounds.Left : Zone->FBounds.Top;
  int To = Across ? Next->FBounds.Right : Next->FBounds.Bottom;
  int Border = std::clamp(Across ? X : Y, From, std::max(From, To - FBorderWidth));
  int First = Border - From;
  int Second = To - Border - FBorderWidth;
  if (First + Second <= 0) return;
  double Both = Zone->FShare + Next->FShare;
  Zone->FShare = Both * First / (First + Second);
  Next->FShare = Both - Zone->FShare;
  ResetBounds(true);
}

//===----------------------------------------------------------------------===//
// Streams
//===----------------------------------------------------------------------===//

void TDockTree::WriteZone(TStream* Stream, const TDockZone* Zone) {
  WriteValue<std::uint8_t>(Stream, Zone->FControl ? 0 : 1);
  WriteValue<std::uint8_t>(Stream, static_cast<std::uint8_t>(Zone->FOrientation));
  double Sum = 0;
  if (Zone->FParent)
    for (auto& C : Zone->FParent->FChildren) Sum += C->FShare;
  WriteValue<std::int32_t>(Stream, Sum > 0 ? static_cast<std::int32_t>(std::lround(Zone->FShare / Sum * ShareUnits)) : ShareUnits);
  if (Zone->FControl) {
    const String& Name = Zone->FControl->Name();
    WriteValue<std::int32_t>(Stream, static_cast<std::int32_t>(Name.size()));
    Stream->WriteBuffer(Name.data(), static_cast<std::int64_t>(Name.size()));
    return;
  }
  WriteValue<std::int32_t>(Stream, Zone->ChildCount());
  for (auto& C : Zone->FChildren) WriteZone(Stream, C.get());
}

void TDockTree::SaveToStream(TStream* Stream) {
  WriteValue<std::int32_t>(Stream, TreeStreamVersion);
  WriteZone(Stream, FTopZone.get());
}

std::unique_ptr<TDockZone> TDockTree::ReadZone(TStream* Stream, int Depth, std::vector<TControl*>& Used) {
  if (Depth > MaxDepth) throw EReadError(SInvalidDockTreeData);
  auto Zone = std::make_unique<TDockZone>();
  auto Kind = ReadValue<std::uint8_t>(Stream);
  auto Orient = ReadValue<std::uint8_t>(Stream);
  auto Share = ReadValue<std::int32_t>(Stream);
  if (Kind > 1 || Orient > doVertical || Share < 0 || Share > ShareUnits) throw EReadError(SInvalidDockTreeData);
  Zone->FOrientation = static_cast<TDockOrientation>(Orient);
  Zone->FShare = Share;
  auto Count = ReadValue<std::int32_t>(Stream);
  if (Kind == 0) {
    if (Count < 0 || Count > MaxNameLength) throw EReadError(SInvalidDockTreeData);
    String Name(static_cast<std::size_t>(Count), '\0');
    Stream->ReadBuffer(Name.data(), Count);
    // A client that is gone, or named twice, leaves its zone empty; it is dropped below.
    TControl* C = FindClient(Name);
    if (C && std::find(Used.begin(), Used.end(), C) == Used.end()) {
      Used.push_back(C);
      Zone->FControl = C;
    }
    return Zone;
  }
  if (Count < 0 || Count > MaxChildren) throw EReadError(SInvalidDockTreeData);
  for (std::int32_t I = 0; I < Count; ++I) {
    std::unique_ptr<TDockZone> Child = ReadZone(Stream, Depth + 1, Used);
    if (!Child->FControl && Child->FChildren.empty()) continue;
    if (!Child->FControl && Child->ChildCount() == 1) {
      std::unique_ptr<TDockZone> Only = std::move(Child->FChildren.front());
      Only->FShare = Child->FShare;
      Child = std::move(Only);
    }
    Child->FParent = Zone.get();
    Zone->FChildren.push_back(std::move(Child));
  }
  return Zone;
}

void TDockTree::LoadFromStream(TStream* Stream) {
  std::unique_ptr<TDockZone> Top;
  std::vector<TControl*> Used;
  try {
    if (ReadValue<std::int32_t>(Stream) != TreeStreamVersion) throw EReadError(SInvalidDockTreeData);
    Top = ReadZone(Stream, 0, Used);
  } catch (const EReadError&) {
    throw EReadError(SInvalidDockTreeData);
  }
  if (Top->FControl) throw EReadError(SInvalidDockTreeData);
  FTopZone = std::move(Top);
  FTopZone->FShare = 1.0;
  FSizingZone = nullptr;
  Collapse(FTopZone.get());
  BeginUpdate();
  auto Done = Finally([this]() noexcept { --FUpdateCount; });
  for (TControl* C : DockClients(FDockSite))
    if (!FindControlZone(C)) InsertControl(C, alNone, nullptr);
  Done.Dismiss();
  EndUpdate();
}

TControl* TDockTree::FindClient(const String& Name) {
  if (Name.empty()) return nullptr;
  TControl* C = nullptr;
  if (TDockHandler* H = DockHandlerOf(FDockSite))
    C = H->ReloadDockedControl(Name);
  else
    for (TControl* Client : DockClients(FDockSite))
      if (CompareText(Client->Name(), Name) == 0) C = Client;
  return C && HostDockSite(C) == FDockSite ? C : nullptr;
}

//===----------------------------------------------------------------------===//
// Captions
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TDockCaptionDrawer, "KilnDockTree") {}

TRect TDockCaptionDrawer::GetCloseRect(const TRect& ACaption, TWinControl*) const {
  if (FOrientation == dcoVertical) {
    int S = std::max(0, ACaption.Width() - 4);
    return Bounds(ACaption.Left + 2, ACaption.Top + 2, S, S);
  }
  int S = std::max(0, ACaption.Height() - 4);
  return Bounds(ACaption.Right - 2 - S, ACaption.Top + 2, S, S);
}

TRect TDockCaptionDrawer::GetPinRect(const TRect& ACaption, TWinControl* ASite) const {
  TRect R = GetCloseRect(ACaption, ASite);
  if (FOrientation == dcoVertical)
    R.Offset(0, R.Height());
  else
    R.Offset(-R.Width(), 0);
  return R;
}

int TDockCaptionDrawer::DockCaptionHitTest(const TRect& ACaption, TPoint P, TWinControl* ASite) const {
  if (GetCloseRect(ACaption, ASite).Contains(P)) return HTCLOSE;
  if (GetPinRect(ACaption, ASite).Contains(P)) return HTPIN;
  return ACaption.Contains(P) ? HTCAPTION : HTNOWHERE;
}

FK_IMPLEMENT(TCaptionedTabDockTree, "KilnDockTree") {}

TCaptionedTabDockTree::TCaptionedTabDockTree(TWinControl* ADockSite, TDockCaptionOrientation AOrientation)
    : TDockTree(ADockSite), FCaptionOrientation(AOrientation) {
  InitDrawer();
}

std::unique_ptr<TDockCaptionDrawer> TCaptionedTabDockTree::GetDockCaptionDrawer() const {
  return std::make_unique<TDockCaptionDrawer>(FCaptionOrientation);
}

void TCaptionedTabDockTree::AdjustDockRect(TControl*, TRect& ARect) const {
  int G = GetGrabberSize();
  if (FCaptionOrientation == dcoVertical)
    ARect.Left += G;
  else
    ARect.Top += G;
}

TRect TCaptionedTabDockTree::AdjustCaptionRect(const TRect& ARect) const {
  int G = GetGrabberSize();
  if (FCaptionOrientation == dcoVertical) return Rect(ARect.Left, ARect.Top, ARect.Left + G, ARect.Bottom);
  return Rect(ARect.Left, ARect.Top, ARect.Right, ARect.Top + G);
}

} // namespace formkit
