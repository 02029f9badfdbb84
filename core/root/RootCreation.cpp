//===- core/root/RootCreation.cpp - Creating components on a module -----===//
//
// Every way of creating a component meets in `DoCreateComponent`: the parent
// under the cursor, the class's own size or the dragged rectangle, placement
// without hiding another component, and the scale of the surface.
//
//===----------------------------------------------------------------------===//
#include "core/root/ComponentRoot.h"
#include "platform/Filer.h"

#include <algorithm>
#include <cmath>

namespace formkit {

namespace {

/// Sizes of this unit, in pixels at 96 per inch.
constexpr int IconSize = 28;
constexpr int CascadeStep = 10;
constexpr int ClickSize = 9;
constexpr int FallbackWidth = 100;
constexpr int FallbackHeight = 40;

/// The scale of a creation: pixels per inch against 96, as a percentage.
struct TScale {
  int PPI = 96;
  int Percent = 100;
  explicit TScale(int APPI) : PPI(APPI), Percent(static_cast<int>(std::lround(static_cast<float>(APPI) / 96.0f * 100))) {}
  int Scaled(int V) const { return MulDiv(V, Percent, 100); }
  int Unscaled(int V) const { return MulDiv(V, 100, Percent); }
};

/// Frees a new component unless the creation gets through.
struct TNewComponentGuard {
  TComponent* Component;
  ~TNewComponentGuard() {
    if (Component) Component->Destroy();
  }
};

} // namespace

IPtr<IItem> TComponentRoot::FindItemParent(const IPtr<IItem>& Item) {
  if (Item && !Item->IsContainer())
    if (auto Internal = QueryAs<IInternalItem>(Item))
      for (int I = 0, N = Internal->GetChildCount(); I < N; ++I)
        if (IPtr<IItem> Child = Internal->GetChildren(I); Child && Child->IsContainer()) return Child;
  IPtr<IItem> Current = Item;
  while (Current && !Current->IsContainer()) Current = Current->GetParent();
  if (!Current && FSurface) Current = FSurface->GetRoot();
  return Current;
}

IPtr<IItem> TComponentRoot::FindCurrentParentItem() {
  IPtr<ISelections> Items = SelectionItems();
  if (Items && Items->GetCount() == 1) return FindItemParent(Items->GetItems(0));
  return FSurface ? FSurface->GetRoot() : nullptr;
}

TComponent* TComponentRoot::FindCurrentParent() { return ExtractComponent(FindCurrentParentItem()); }

void TComponentRoot::ForceCommonParent() {
  IPtr<ISelections> Items = SelectionItems();
  if (!Items || Items->GetCount() == 0) return;
  Items->BeginSelections();
  IPtr<IItem> Parent = Items->GetItems(0)->GetParent();
  for (int I = Items->GetCount() - 1; I >= 0; --I)
    if (!SameItem(Items->GetItems(I)->GetParent(), Parent)) Items->Remove(I);
  Items->EndSelections();
}

void TComponentRoot::ValidateComponent(TComponent* Component) {
  if (FCustomModule) FCustomModule->ValidateComponent(Component);
}

TComponent* TComponentRoot::DoCreateComponent(const IPtr<IInternalPaletteItem>& PaletteItem, IPtr<IItem> Parent,
                                              TRect Rect, bool SetBounds, bool Scaled) {
  if (FModule) FModule->CheckWritable();
  if (!PaletteItem) return nullptr;
  if (auto Usable = QueryAs<IOTABasePaletteItem>(PaletteItem); Usable && !Usable->GetEnabled()) return nullptr;

  TComponent* Component = nullptr;
  FCreateContainers = false;
  try {
    if (Rect.IsEmpty()) Parent = FindCurrentParentItem();
    TScale Scale(PPIForItem(Parent));
    if (TComponentRoot* Master = MasterOfView()) {
      // Only the master takes new components; the update from master to view brings it.
      TComponent* Made = Master->DoCreateComponent(PaletteItem, GetMasterViewComponent(Parent), Rect, SetBounds, true);
      FCreateContainers = true;
      TComponent* Here = Made ? FRoot->FindComponent(Made->Name()) : nullptr;
      return Here ? SelectCreated(Here) : nullptr;
    }
    Component = PaletteItem->CreateComponent(FRoot, ExtractComponent(Parent), FModule, Rect);
    if (!Component) {
      FCreateContainers = true;
      return nullptr;
    }
    TNewComponentGuard Guard{Component};
    ValidateComponent(Component);
    if (!Component->ComponentStyle().Contains(csInheritable) && FRootUpdateManager &&
        FRootUpdateManager->GetHasDescendents())
      throw EComponentDesignerException(sCannotInherit, Component->ClassName());

    IPtr<IItem> Item = FSurface->ItemFromComponent(Component);
    IPtr<IItem> NewParent = Item ? Item->GetParent() : nullptr;
    if (NewParent) {
      if (!NewParent->GetParent()) {
        // The framework put the component at the top: the rectangle moves into the top's
        // coordinates.
        for (IPtr<IItem> P = Parent; P && P->GetParent(); P = P->GetParent()) {
          TRect B = P->GetBoundsRect();
          Rect.Offset(B.Left, B.Top);
        }
      }
      Parent = NewParent;
    }

    Component->SetName(UniqueName(Component->ClassName()));

    if (Rect.IsEmpty() && Item) {
      TRect Own = Item->GetBoundsRect();
      int W = Own.Width(), H = Own.Height();
      bool Icon = W == Scale.Scaled(IconSize) && H == Scale.Scaled(IconSize);
      TRect ParentBounds = Parent ? Parent->GetBoundsRect() : TRect{};
      int PW = ParentBounds.Width(), PH = ParentBounds.Height();
      TPoint TopLeft = Icon ? TPoint{PW / 2 - W / 2, PH / 2 - H / 2}
                            : TPoint{PW / 2 - Scale.Scaled(W) / 2, PH / 2 - Scale.Scaled(H) / 2};
      TopLeft = FSurfaceDesigner->PointToGrid(TopLeft, false);
      Rect = Bounds(TopLeft.X, TopLeft.Y, W, H);
      // Cascade: never land exactly on another component's top-left corner.
      TPoint Grid = FSurfaceDesigner->GetGridSize();
      int StepX = std::max(Grid.X / 2 + 1, Scale.Scaled(CascadeStep));
      int StepY = std::max(Grid.Y / 2 + 1, Scale.Scaled(CascadeStep));
      for (bool Moved = true; Moved;) {
        Moved = false;
        for (int I = 0, N = FSurface->GetItemsCount(); I < N; ++I) {
          IPtr<IItem> Other = FSurface->GetItems(I);
          if (!Other || SameItem(Other, Item)) continue;
          if (Other->GetBoundsRect().TopLeft() == Rect.TopLeft()) {
            TPoint Next = FSurfaceDesigner->PointToGrid({Rect.Left + StepX, Rect.Top + StepY}, false);
            Rect = Bounds(Next.X, Next.Y, W, H);
            Moved = true;
            break;
          }
        }
      }
    }

    if (SetBounds && Item) {
      if (Rect.Width() <= Scale.Scaled(ClickSize) && Rect.Height() <= Scale.Scaled(ClickSize)) {
        TRect Own = Item->GetBoundsRect();
        if (Own.Width() <= Scale.Scaled(ClickSize) && Own.Height() <= Scale.Scaled(ClickSize)) {
          // Unscaled, and the bottom grows from the old bottom.
          Rect.Right = Rect.Left + FallbackWidth;
          Rect.Bottom = Rect.Bottom + FallbackHeight;
        } else {
          Rect.Right = Rect.Left + Own.Width();
          Rect.Bottom = Rect.Top + Own.Height();
        }
      }
      if (Scale.PPI != 96) {
        int W = Scaled ? Rect.Width() : Scale.Unscaled(Rect.Width());
        int H = Scaled ? Rect.Height() : Scale.Unscaled(Rect.Height());
        if (!(W == Scale.Scaled(IconSize) && H == Scale.Scaled(IconSize))) {
          Rect.Left = Scale.Unscaled(Rect.Left);
          Rect.Top = Scale.Unscaled(Rect.Top);
        }
        Rect.Right = Rect.Left + W;
        Rect.Bottom = Rect.Top + H;
      }
      Item->SetBoundsRect(Rect);
    }
    if (auto Internal = QueryAs<IInternalItem>(Item)) {
      Internal->SetParent(Parent);
      Internal->Show();
    }
    Guard.Component = nullptr;
  } catch (...) {
    FCreateContainers = true;
    throw;
  }
  FCreateContainers = true;
  return SelectCreated(Component);
}

TComponent* TComponentRoot::SelectCreated(TComponent* Component) {
  Select(Component, false);
  if (FSurface) FSurface->UpdateSurface();
  Modified();
  return Component;
}

void TComponentRoot::CreateComponent(const IPtr<IInternalPaletteItem>& PaletteItem) {
  DoCreateComponent(PaletteItem, nullptr, TRect{}, true, true);
}

TComponent* TComponentRoot::CreateComponent(TClass ComponentClass, TComponent* Parent, int Left, int Top, int Width,
                                            int Height) {
  IPtr<IItem> Target;
  TRect Rect;
  if (Parent) {
    IPtr<IItem> Item = FSurface->ItemFromComponent(Parent);
    Target = FindItemParent(Item);
    TPoint P{Left, Top};
    if (Item && Target && Target.Get() != Item.Get()) P = Target->GlobalToLocal(Item->LocalToGlobal(P));
    P = FSurfaceDesigner->PointToGrid(P, false);
    Rect = Bounds(P.X, P.Y, Width, Height);
  }
  return DoCreateComponent(NewAs<IInternalPaletteItem, TClassPaletteItem>(ComponentClass), Target, Rect, true, true);
}

TComponent* TComponentRoot::CreateChild(TClass ComponentClass, TComponent* Parent) {
  IPtr<IItem> Item = Parent ? FSurface->ItemFromComponent(Parent) : nullptr;
  return DoCreateComponent(NewAs<IInternalPaletteItem, TClassPaletteItem>(ComponentClass), Item, Rect(0, 0, 1, 1),
                           false, true);
}

TComponent* TComponentRoot::CreateCurrentComponent(TComponent* Parent, const TRect& Rect) {
  return CreateCurrentComponentScaled(Parent, Rect, true);
}

TComponent* TComponentRoot::CreateCurrentComponentScaled(TComponent* Parent, const TRect& Rect, bool Scaled) {
  IPtr<IDesignEnvironment> Env = GetEnvironment();
  IPtr<IOTABasePaletteItem> Tool;
  if (Env) Env->GetToolSelected(Tool);
  TComponent* Result = nullptr;
  try {
    Result = DoCreateComponent(QueryAs<IInternalPaletteItem>(Tool), Parent ? FSurface->ItemFromComponent(Parent) : nullptr,
                               Rect, true, Scaled);
  } catch (...) {
    if (Env) Env->ToolUsed(); // a failed creation disarms the tool as well
    throw;
  }
  if (Env) Env->ToolUsed();
  return Result;
}

void TComponentRoot::CreateComponentPos(const IPtr<IInternalPaletteItem>& PaletteItem, int X, int Y) {
  IPtr<IItem> Parent = FSurface->ItemAtPoint(X, Y);
  while (Parent && !Parent->IsContainer()) Parent = Parent->GetParent();
  if (!Parent) Parent = FSurface->GetRoot();
  IPtr<IItem> Root = FSurface->GetRoot();
  for (IPtr<IItem> P = Parent; P && P->GetParent() && !P->Equals(Root); P = P->GetParent()) {
    TRect B = P->GetBoundsRect();
    X -= B.Left;
    Y -= B.Top;
  }
  TDesignerOptions Options;
  if (IPtr<IDesignEnvironment> Env = GetEnvironment()) Env->GetDesignerOptions(Options);
  int PPI = (Options.ScaleGridSize && GetPPIForKilnDesignerForIItemFunc) ? GetPPIForKilnDesignerForIItemFunc(Parent) : 96;
  if (Options.SnapToGrid) {
    int GX = MulDiv(Options.GridSizeX, PPI, 96), GY = MulDiv(Options.GridSizeY, PPI, 96);
    // Toward zero, unlike the engine's snapping to the nearest grid line.
    if (GX > 0) X = (X / GX) * GX;
    if (GY > 0) Y = (Y / GY) * GY;
  }
  DoCreateComponent(PaletteItem, Parent, Rect(X, Y, X + 1, Y + 1), true, true);
}

} // namespace formkit

namespace formkit {

namespace {
/// Whether `Class` is the class of `C` or of anything it owns, at any depth.
bool HoldsClass(TComponent* C, TClass Class) {
  if (C->ClassType() == Class) return true;
  for (int I = 0; I < C->ComponentCount(); ++I)
    if (HoldsClass(C->Components(I), Class)) return true;
  return false;
}
} // namespace

TComponent* TComponentRoot::GetInliningComponent(TComponent* Component) const {
  auto It = FInliningComponents.find(Component);
  return It == FInliningComponents.end() ? nullptr : It->second;
}

TComponent* TComponentRoot::FrameCreateComponent(TClass ComponentClass, TComponent* Owner) {
  if (!TRootHooks::IsProxyClass || !TRootHooks::IsProxyClass(ComponentClass)) return nullptr;
  IPtr<IInternalRoot> Module = QueryAs<IInternalRoot>(FDesigner->OpenRootClass(ComponentClass->ClassName));
  if (!Module) return nullptr;
  if (IPtr<ICustomModule> Custom = Module->GetCustomModule(); !Custom || !Custom->Nestable())
    throw EComponentDesignerException(sCannotPasteForm);
  TComponent* Ancestor = Module->GetRoot();
  if (Owner && HoldsClass(Ancestor, Owner->ClassType())) throw EComponentDesignerException(sNestedInsertedInSelf);
  if (TRootHooks::ValidateInheritence) TRootHooks::ValidateInheritence(*this, Ancestor);

  // The flags stand before the constructor runs, as for a root.
  auto* Instance = static_cast<TComponent*>(Ancestor->ClassType()->Compiled->NewInstance());
  Instance->SetDesigning(true, true);
  Instance->SetInline(true);
  Instance->SetDesignInstance(true);
  RunConstructor(Instance, Owner); // a failing constructor frees the instance
  bool SavedFrameManagers = FCreateFrameManagers;
  try {
    FModifiableFrames.push_back(Instance);
    FInliningComponents[Instance] = Ancestor;
    if (TRootHooks::ChangeToProxyClass) TRootHooks::ChangeToProxyClass(Instance, ComponentClass);
    FCreateFrameManagers = false;
    TObjectGuard<TMemoryStream> Image(new TMemoryStream);
    {
      TObjectGuard<TWriter> Writer(new TWriter(Image.Get(), 4096));
      Writer->WriteDescendent(Ancestor, nullptr);
    } // the writer flushes as it goes
    Image->SetPosition(0);
    ReadObjectFromStream(Instance, Image.Get());
    FCreateFrameManagers = SavedFrameManagers;
    FrameComponentAdded(Instance);
    for (int I = 0; I < Instance->ComponentCount(); ++I) {
      Instance->Components(I)->SetAncestor(true);
      FrameComponentAdded(Instance->Components(I));
    }
    if (SavedFrameManagers && TRootHooks::CreateUpdateManager)
      if (IPtr<IUpdateManager> Manager =
              TRootHooks::CreateUpdateManager(*this, Instance, Ancestor, Module->GetUpdateManager()))
        FUpdateManagers->Add(QueryAs<IInterface>(Manager));
  } catch (...) {
    FCreateFrameManagers = SavedFrameManagers;
    FModifiableFrames.erase(std::remove(FModifiableFrames.begin(), FModifiableFrames.end(), Instance),
                            FModifiableFrames.end());
    FInliningComponents.erase(Instance);
    Instance->Destroy();
    throw;
  }
  return Instance;
}

} // namespace formkit
