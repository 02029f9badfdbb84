//===- core/root/RootPositioning.cpp - Lining up, spacing and sizing the selection ===//
//
// The commands that line up, space, centre, size and reorder the selection
// without dragging. Each reduces the selection to one parent and works on the
// items through `TBounder`, which reads back what an item really took after each
// change, so an item that refuses a size leaves the next computation with its
// real bounds. The item at index 0 is the anchor. Each command ends with one
// `Modified`.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"

#include "core/DesignNotifications.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <climits>
#include <memory>

namespace formkit {

namespace {

/// One selected item's rectangle, as the item really has it.
class TBounder {
public:
  explicit TBounder(IPtr<IItem> Item) : FItem(std::move(Item)), FBounds(FItem->GetBoundsRect()) {}

  int Left() const { return FBounds.Left; }
  int Top() const { return FBounds.Top; }
  int Width() const { return FBounds.Width(); }
  int Height() const { return FBounds.Height(); }
  int ClientWidth() {
    ReadClient();
    return FClientWidth;
  }
  int ClientHeight() {
    ReadClient();
    return FClientHeight;
  }
  void SetLeft(int V) { SetBoundsRect(Rect(V, FBounds.Top, V + Width(), FBounds.Bottom)); }
  void SetTop(int V) { SetBoundsRect(Rect(FBounds.Left, V, FBounds.Right, V + Height())); }
  void SetWidth(int V) { SetBoundsRect(Rect(FBounds.Left, FBounds.Top, FBounds.Left + V, FBounds.Bottom)); }
  void SetHeight(int V) { SetBoundsRect(Rect(FBounds.Left, FBounds.Top, FBounds.Right, FBounds.Top + V)); }
  const TRect& BoundsRect() const { return FBounds; }
  void SetBoundsRect(const TRect& R) {
    FItem->SetBoundsRect(R);
    FBounds = FItem->GetBoundsRect();
  }
  /// A bounder on the item's parent; null without one.
  std::unique_ptr<TBounder> Parent() const {
    IPtr<IItem> P = FItem->GetParent();
    return P ? std::make_unique<TBounder>(P) : nullptr;
  }

  // Along one axis: left and width, or top and height.
  int Position(bool Horizontal) const { return Horizontal ? Left() : Top(); }
  int Extent(bool Horizontal) const { return Horizontal ? Width() : Height(); }
  void SetPosition(bool Horizontal, int V) { Horizontal ? SetLeft(V) : SetTop(V); }

private:
  void ReadClient() {
    if (FClientWidth != -1) return;
    TRect C = FItem->GetClientRect();
    FClientWidth = C.Right;
    FClientHeight = C.Bottom;
  }

  IPtr<IItem> FItem;
  TRect FBounds;
  int FClientWidth = -1;
  int FClientHeight = -1;
};

using TBounders = std::vector<std::unique_ptr<TBounder>>;

/// The two-index quicksort with the middle element as pivot, by position along one axis.
/// Not stable: equal positions end in the order it leaves them.
void SortByPosition(TBounders& Items, int L, int R, bool Horizontal) {
  auto Key = [&](int I) { return Items[static_cast<std::size_t>(I)]->Position(Horizontal); };
  int I;
  do {
    I = L;
    int J = R;
    int P = (L + R) >> 1;
    do {
      while (Key(I) < Key(P)) ++I;
      while (Key(J) > Key(P)) --J;
      if (I <= J) {
        if (I != J) std::swap(Items[static_cast<std::size_t>(I)], Items[static_cast<std::size_t>(J)]);
        if (P == I) P = J;
        else if (P == J) P = I;
        ++I;
        --J;
      }
    } while (I <= J);
    if (L < J) SortByPosition(Items, L, J, Horizontal);
    L = I;
  } while (I < R);
}

/// Sorts and gives the anchor's index in the sorted array (0 when not among 1 to High).
int SortAroundAnchor(TBounders& Items, bool Horizontal) {
  const TBounder* Anchor = Items.front().get();
  SortByPosition(Items, 0, static_cast<int>(Items.size()) - 1, Horizontal);
  for (std::size_t I = 1; I < Items.size(); ++I)
    if (Items[I].get() == Anchor) return static_cast<int>(I);
  return 0;
}

void SpaceEvenly(TBounders& Items, bool Horizontal) {
  int High = static_cast<int>(Items.size()) - 1;
  if (High < 1) return;
  SortByPosition(Items, 0, High, Horizontal);
  std::int64_t L0 = Items.front()->Position(Horizontal);
  std::int64_t Span = Items.back()->Position(Horizontal) - L0;
  for (int I = 1; I < High; ++I)
    Items[static_cast<std::size_t>(I)]->SetPosition(Horizontal, static_cast<int>(Span * I / High + L0));
}

void CentreInParent(TBounders& Items, bool Horizontal) {
  std::unique_ptr<TBounder> Parent = Items.front()->Parent();
  if (!Parent) return;
  TRect Union = Items.front()->BoundsRect();
  for (const auto& B : Items) {
    const TRect& R = B->BoundsRect();
    Union = Rect(std::min(Union.Left, R.Left), std::min(Union.Top, R.Top), std::max(Union.Right, R.Right),
                 std::max(Union.Bottom, R.Bottom));
  }
  int Delta = Horizontal ? (Parent->ClientWidth() - Union.Left - Union.Right) / 2
                         : (Parent->ClientHeight() - Union.Top - Union.Bottom) / 2;
  for (const auto& B : Items) B->SetPosition(Horizontal, B->Position(Horizontal) + Delta);
}

void StepSpacing(TBounders& Items, bool Horizontal, int Step) {
  int High = static_cast<int>(Items.size()) - 1;
  if (High < 1) return;
  TBounder* Anchor = Items.front().get();
  int I = SortAroundAnchor(Items, Horizontal);
  int AnchorAt = Anchor->Position(Horizontal);
  auto Moves = [&](TBounder& B) { return Step > 0 || B.Position(Horizontal) != AnchorAt; };
  int Sum = 0;
  for (int K = I - 1; K >= 0; --K) {
    TBounder& B = *Items[static_cast<std::size_t>(K)];
    if (!Moves(B)) continue;
    Sum += Step;
    B.SetPosition(Horizontal, B.Position(Horizontal) - Sum);
  }
  Sum = 0;
  for (int K = I + 1; K <= High; ++K) {
    TBounder& B = *Items[static_cast<std::size_t>(K)];
    if (!Moves(B)) continue;
    Sum += Step;
    B.SetPosition(Horizontal, B.Position(Horizontal) + Sum);
  }
}

void RemoveSpacing(TBounders& Items, bool Horizontal) {
  int High = static_cast<int>(Items.size()) - 1;
  if (High < 1) return;
  int I = SortAroundAnchor(Items, Horizontal);
  auto At = [&](int K) -> TBounder& { return *Items[static_cast<std::size_t>(K)]; };
  auto GapAfter = [&](int K) {
    return std::max(0, At(K + 1).Position(Horizontal) - (At(K).Position(Horizontal) + At(K).Extent(Horizontal)));
  };
  std::vector<int> Gaps(static_cast<std::size_t>(High) + 1, 0);
  for (int B = I - 1; B >= 0; --B)
    Gaps[static_cast<std::size_t>(B)] = GapAfter(B) + (B == I - 1 ? 0 : Gaps[static_cast<std::size_t>(B) + 1]);
  for (int K = 0; K < I; ++K) At(K).SetPosition(Horizontal, At(K).Position(Horizontal) + Gaps[static_cast<std::size_t>(K)]);
  for (int K = I + 1; K <= High; ++K)
    Gaps[static_cast<std::size_t>(K)] = GapAfter(K - 1) + (K == I + 1 ? 0 : Gaps[static_cast<std::size_t>(K) - 1]);
  for (int K = I + 1; K <= High; ++K)
    At(K).SetPosition(Horizontal, At(K).Position(Horizontal) - Gaps[static_cast<std::size_t>(K)]);
}

bool IsHorizontal(TOTAAffect A) { return A == afHSpace || A == afHSpaceInc || A == afHSpaceDec || A == afHSpaceDel; }

} // namespace

std::vector<IPtr<IItem>> TComponentRoot::SelectedItems() {
  std::vector<IPtr<IItem>> Items;
  if (IPtr<ISelections> S = SelectionItems())
    for (int I = 0; I < S->GetCount(); ++I) Items.push_back(S->GetItems(I));
  return Items;
}

//===----------------------------------------------------------------------===//
// Align and Size
//===----------------------------------------------------------------------===//

void TComponentRoot::Align(TOTAAffect Affect) {
  if (IsRootSelected() || FDesigner->GetControlsLocked()) return;
  if (!FSelections || FSelections->GetCount() == 0) {
    Modified();
    return;
  }
  ForceCommonParent();
  TBounders Items;
  for (const IPtr<IItem>& Item : SelectedItems()) Items.push_back(std::make_unique<TBounder>(Item));
  if (Items.empty()) {
    Modified();
    return;
  }
  const TBounder& First = *Items.front();
  switch (Affect) {
  case afTop: {
    int V = First.Top();
    for (auto& B : Items) B->SetTop(V);
    break;
  }
  case afLeft: {
    int V = First.Left();
    for (auto& B : Items) B->SetLeft(V);
    break;
  }
  case afBottom: {
    int V = First.Top() + First.Height();
    for (auto& B : Items) B->SetTop(V - B->Height());
    break;
  }
  case afRight: {
    int V = First.Left() + First.Width();
    for (auto& B : Items) B->SetLeft(V - B->Width());
    break;
  }
  case afHCenter: {
    int V = First.Left() + First.Width() / 2;
    for (auto& B : Items) B->SetLeft(V - B->Width() / 2);
    break;
  }
  case afVCenter: {
    int V = First.Top() + First.Height() / 2;
    for (auto& B : Items) B->SetTop(V - B->Height() / 2);
    break;
  }
  case afHSpace:
  case afVSpace: SpaceEvenly(Items, Affect == afHSpace); break;
  case afHWinCenter:
  case afVWinCenter: CentreInParent(Items, Affect == afHWinCenter); break;
  case afHSpaceInc:
  case afVSpaceInc: StepSpacing(Items, IsHorizontal(Affect), 1); break;
  case afHSpaceDec:
  case afVSpaceDec: StepSpacing(Items, IsHorizontal(Affect), -1); break;
  case afHSpaceDel:
  case afVSpaceDel: RemoveSpacing(Items, IsHorizontal(Affect)); break;
  case afAlignToGrid: AlignToGrid(); break;
  case afSnapToGrid:
    if (FSurfaceDesigner) FSurfaceDesigner->SetGridAligned(!FSurfaceDesigner->GetGridAligned());
    break;
  case afSendToBack: SendToBack(); break;
  case afBringToFront: BringToFront(); break;
  default: break;
  }
  Modified();
}

void TComponentRoot::Size(TOTASizeAffect Affect, int Value) {
  if (!FSelections || FSelections->GetCount() == 0 || FDesigner->GetControlsLocked()) return;
  ForceCommonParent();
  TBounders Items;
  for (const IPtr<IItem>& Item : SelectedItems()) Items.push_back(std::make_unique<TBounder>(Item));
  if (Items.empty()) return;
  int AnchorWidth = Items.front()->Width(), AnchorHeight = Items.front()->Height();
  int MinW = INT_MAX, MinH = INT_MAX, MaxW = 0, MaxH = 0;
  for (const auto& B : Items) {
    MinW = std::min(MinW, B->Width());
    MaxW = std::max(MaxW, B->Width());
    MinH = std::min(MinH, B->Height());
    MaxH = std::max(MaxH, B->Height());
  }
  for (auto& B : Items) {
    switch (Affect) {
    case asHGrow: B->SetWidth(MaxW); break;
    case asHShrink: B->SetWidth(MinW); break;
    case asHAbsolute: B->SetWidth(Value); break;
    case asVGrow: B->SetHeight(MaxH); break;
    case asVShrink: B->SetHeight(MinH); break;
    case asVAbsolute: B->SetHeight(Value); break;
    case asWidths: B->SetWidth(AnchorWidth); break;
    case asHeights: B->SetHeight(AnchorHeight); break;
    case asWidthHeight:
      B->SetWidth(AnchorWidth);
      B->SetHeight(AnchorHeight);
      break;
    default: break;
    }
  }
  Modified();
}

//===----------------------------------------------------------------------===//
// Grid, order, selection
//===----------------------------------------------------------------------===//

void TComponentRoot::AlignToGrid() {
  if (!FSelections || FSelections->GetCount() == 0 || FDesigner->GetControlsLocked()) return;
  ForceCommonParent();
  for (const IPtr<IItem>& Item : SelectedItems()) {
    TRect R = Item->GetBoundsRect();
    TPoint Corner = FSurfaceDesigner ? FSurfaceDesigner->PointToGrid({R.Left, R.Top}, true) : TPoint{R.Left, R.Top};
    Item->SetBoundsRect(Rect(Corner.X, Corner.Y, Corner.X + R.Width(), Corner.Y + R.Height()));
  }
  Modified();
}

void TComponentRoot::ZOrder(bool Front) {
  Modified();
  for (const IPtr<IItem>& Item : SelectedItems())
    if (auto Internal = QueryAs<IInternalItem>(Item)) Internal->ZOrder(Front);
  if (FSurface) FSurface->UpdateSurface();
  Modified();
}

void TComponentRoot::SelectAll() {
  IPtr<ISelections> Items = SelectionItems();
  if (Items) Items->BeginSelections();
  auto End = Finally([&]() noexcept {
    if (Items) RunIgnoringExceptions([&] { Items->EndSelections(); });
  });
  ClearSelection();
  for (int I = 0; I < FRoot->ComponentCount(); ++I)
    if (TComponent* C = FRoot->Components(I); !IsNoIconComponent(C)) Select(C, true);
}

void TComponentRoot::Dialog(TDesignDialog Kind) {
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->Dialog(Kind);
}

void TComponentRoot::Command(TDesignCommand Kind) {
  switch (Kind) {
  case dmAlignToGrid: AlignToGrid(); break;
  case dmFlipAllChildren: FlipRootChildren(true); break;
  case dmFlipSelectedChildren: FlipRootChildren(false); break;
  case dmTextLYT:
    FLYTToText = !FLYTToText;
    FOrigLYTFormat = 0;
    Modified();
    break;
  case dmViewAsText:
    if (FModule) FModule->ViewAsText();
    break;
  case dmRevert: RevertComponents(); break;
  case dmShowNonVisualComponents:
    if (TRootHooks::SendDesignerCommand) TRootHooks::SendDesignerCommand("ToggleNonVisualComponentVisibility");
    break;
  default: break;
  }
}

//===----------------------------------------------------------------------===//
// Reverting components to the ancestor
//===----------------------------------------------------------------------===//

bool TComponentRoot::CanRevert() {
  if (IsRootSelected() || !FSelections) return false;
  if (FRootUpdateManager && FRootUpdateManager->GetHasDescendents()) return false;
  for (int I = 0; I < FSelections->GetCount(); ++I)
    if (auto* C = dynamic_cast<TComponent*>(FSelections->GetPersistents(I)); C && C->ComponentState().Contains(csAncestor))
      return true;
  return false;
}

void TComponentRoot::RevertComponents() {
  if (!FRootUpdateManager || !FSelections) return;
  std::vector<TComponent*> List;
  for (int I = 0; I < FSelections->GetCount(); ++I) {
    auto* C = dynamic_cast<TComponent*>(FSelections->GetPersistents(I));
    if (!C || !C->ComponentState().Contains(csAncestor)) continue;
    List.push_back(C);
    TStringList Own;
    C->GetChildren(
        [&](TComponent* Child) {
          if (Child->Owner() == C->Owner() && !Child->ComponentState().Contains(csAncestor)) Own.Add(Child->Name());
        },
        C->Owner());
    if (Own.Count() == 0) continue;
    String Names;
    for (int K = 0; K < Own.Count(); ++K) Names += (K ? ", " : "") + Own.Get(K);
    switch (AskDeleteWarning(C->Name(), Names)) {
    case dwYes: break;
    case dwNo: List.pop_back(); break;
    default: return;
    }
  }
  if (List.empty()) return;
  FRevertingComponent = true;
  {
    auto Reset = Finally([this]() noexcept { FRevertingComponent = false; });
    IPtr<ISelections> Items = SelectionItems();
    if (Items) Items->BeginSelections();
    {
      auto End = Finally([&]() noexcept {
        if (Items) RunIgnoringExceptions([&] { Items->EndSelections(); });
      });
      if (IPtr<IGrabHandles> Handles = FSurface ? FSurface->GetGrabHandles() : nullptr) Handles->AttachHandles(nullptr);
      for (TComponent* C : List) C->Destroy();
    }
    auto Each = [this](const std::function<void(const IPtr<IUpdateManager>&)>& Hook) {
      if (!Hook) return;
      Hook(FRootUpdateManager);
      for (int I = 0; FUpdateManagers && I < FUpdateManagers->GetCount(); ++I)
        Hook(QueryAs<IUpdateManager>(FUpdateManagers->Get(I)));
    };
    Each(TRootHooks::UpdateManagerUpdate);
    Each(TRootHooks::UpdateManagerModified);
  }
  Modified();
}

} // namespace formkit
