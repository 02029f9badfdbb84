//===- frameworks/kiln/design/KilnSprigs.cpp - Kiln's structure tree nodes ===//
//
// The drag, drop and palette rules of controls in the structure tree, the
// re-parenting move with its clamping into the new parent, the images of the
// framework's sprigs, and the frame's own components.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/KilnSprigs.h"

#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "tree/SprigRegistry.h"

namespace formkit {

FK_IMPLEMENT(TControlSprig, "KilnSprigs") {}
FK_IMPLEMENT(TWinControlSprig, "KilnSprigs") {}
FK_IMPLEMENT(TFrameSprig, "KilnSprigs") {}
FK_IMPLEMENT(TWinControlRootSprig, "KilnSprigs") {}
FK_IMPLEMENT(TCustomFormRootSprig, "KilnSprigs") {}
FK_IMPLEMENT(TDataModuleRootSprig, "KilnSprigs") {}

namespace {

/// Whether the sprig's item is a control that takes child controls.
bool AcceptsControls(const TSprig* Target) {
  // The class record answers: each new windowed control's sprig asks, and a tree of a
  // large module makes many.
  const TPersistent* Item = Target ? Target->Item() : nullptr;
  if (!Item || !Item->InheritsFrom(TControl::StaticClass())) return false;
  return static_cast<const TControl*>(Item)->ControlStyle().Contains(csAcceptsControls);
}

/// The image of a windowed control's sprig, by whether it takes child controls.
int WinControlImage(const TSprig* Sprig) { return CUIControlImageIndex[AcceptsControls(Sprig) ? 1 : 0]; }

/// Whether a control's sprig may go under `AParent`: a control's sprig or a windowed
/// root whose control takes child controls.
bool ControlParentTest(TSprig* AParent) {
  return (dynamic_cast<TControlSprig*>(AParent) || dynamic_cast<TWinControlRootSprig*>(AParent)) &&
         AcceptsControls(AParent);
}

/// Whether the dragged `AItem` may be dropped on `Target`.
bool ControlDragTest(TSprig* Target, TSprig* AItem) {
  return dynamic_cast<TControlSprig*>(AItem) && AcceptsControls(Target) && AItem->DragOverTo(Target);
}

/// Whether a new component of `AClass`, shown by sprigs of `ASprigClass`, may go on
/// `Target` as a control.
bool ControlPaletteTest(TSprig* Target, TSprigClass ASprigClass, TClass AClass) {
  if (!ASprigClass) return false;
  if (!ASprigClass->InheritsFrom(TControlSprig::StaticClass()) &&
      !ASprigClass->InheritsFrom(TWinControlRootSprig::StaticClass()))
    return false;
  // The base operation asks the class's `PaletteOverTo` through a prototype.
  return AcceptsControls(Target) && Target->TSprig::PaletteOver(ASprigClass, AClass);
}

/// Keeps a control of `Width` at `Left` inside a parent's client extent `Client`: no
/// lower bound, so a control larger than its parent ends at a negative position.
int ClampInto(int Left, int Width, int Client) { return Client < Width + Left ? Client - Width : Left; }

/// Makes `Target`'s control the parent of `AItem`'s and keeps it inside. False when the
/// target is the parent already; true otherwise, even when `AItem` refuses the drop.
bool ControlMove(TSprig* Target, TSprig* AItem) {
  if (Target == AItem->Parent()) return false;
  if (!AItem->DragDropTo(Target)) return true;
  auto* Control = dynamic_cast<TControl*>(AItem->Item());
  auto* NewParent = dynamic_cast<TWinControl*>(Target->Item());
  if (!Control || !NewParent) return true; // a sprig whose item is gone moves nothing
  Control->SetParent(NewParent);
  IPtr<IDesigner> Designer;
  auto Module = AItem->GetDesigner(Designer) ? QueryAs<IInternalRoot>(Designer) : nullptr;
  if (auto* Kiln = Module ? dynamic_cast<TKilnRoot*>(Module->Implementor()) : nullptr) Kiln->KeepOwnerWithParent(Control);
  const int Left = ClampInto(Control->Left(), Control->Width(), NewParent->ClientWidth());
  const int Top = ClampInto(Control->Top(), Control->Height(), NewParent->ClientHeight());
  Control->SetBounds(Left, Top, Control->Width(), Control->Height());
  return true;
}

} // namespace

//===----------------------------------------------------------------------===//
// TControlSprig
//===----------------------------------------------------------------------===//

void TControlSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageControl);
}

bool TControlSprig::DragOverTo(TSprig* AParent) { return ControlParentTest(AParent); }
bool TControlSprig::DragDropTo(TSprig* AParent) { return ControlParentTest(AParent); }
bool TControlSprig::PaletteOverTo(TSprig* AParent, TClass) { return ControlParentTest(AParent); }

//===----------------------------------------------------------------------===//
// TWinControlSprig and TFrameSprig
//===----------------------------------------------------------------------===//

void TWinControlSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(WinControlImage(this));
}

bool TWinControlSprig::DragOver(TSprig* AItem) {
  return AItem && AItem->Owner() == Owner() && ControlDragTest(this, AItem);
}

bool TWinControlSprig::DragDrop(TSprig* AItem) {
  return AItem && AItem->Owner() == Owner() && dynamic_cast<TControlSprig*>(AItem) && ControlMove(this, AItem);
}

bool TWinControlSprig::PaletteOver(TSprigClass ASprigClass, TClass AClass) {
  return ControlPaletteTest(this, ASprigClass, AClass);
}

void TFrameSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(CUIControlImageIndex[1]);
}

void TFrameSprig::FigureChildren() {
  inherited::FigureChildren();
  auto* Frame = dynamic_cast<TComponent*>(Item());
  if (!Frame || !Root()) return;
  for (int I = 0; I < Frame->ComponentCount(); ++I) {
    TComponent* Component = Frame->Components(I);
    if (Root()->Find(Component, true)) continue;
    TSprigClass SprigClass = FindBestSprigClass(Component->ClassType(), TComponentSprig::StaticClass());
    if (!SprigClass) continue;
    TObjectGuard<TSprig> Sprig = NewSprig(SprigClass, Component);
    static_cast<TComponentSprig*>(Sprig.Get())->SetOwner(this);
    Add(Sprig.Release());
  }
}

//===----------------------------------------------------------------------===//
// Root sprigs
//===----------------------------------------------------------------------===//

void TWinControlRootSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(WinControlImage(this));
}

bool TWinControlRootSprig::DragOver(TSprig* AItem) {
  return AItem && AItem->Owner() == this && ControlDragTest(this, AItem);
}

bool TWinControlRootSprig::DragDrop(TSprig* AItem) {
  if (AItem && AItem->Owner() == this && dynamic_cast<TControlSprig*>(AItem) && ControlMove(this, AItem)) return true;
  return dynamic_cast<TComponentSprig*>(AItem) && inherited::DragDrop(AItem);
}

bool TWinControlRootSprig::PaletteOver(TSprigClass ASprigClass, TClass AClass) {
  return ControlPaletteTest(this, ASprigClass, AClass) ||
         (ASprigClass && ASprigClass->InheritsFrom(TComponentSprig::StaticClass()));
}

void TCustomFormRootSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageForm);
}

void TDataModuleRootSprig::Create(TPersistent* AItem) {
  inherited::Create(AItem);
  SetImageIndex(SprigImageDataModule);
}

bool TDataModuleRootSprig::AcceptsClass(TClass AClass) {
  return !(AClass && AClass->InheritsFrom(TControl::StaticClass())) && inherited::AcceptsClass(AClass);
}

bool TDataModuleRootSprig::DragOver(TSprig* AItem) {
  return AItem && AItem->Owner() == this && !dynamic_cast<TControlSprig*>(AItem) &&
         dynamic_cast<TComponentSprig*>(AItem);
}

bool TDataModuleRootSprig::PaletteOver(TSprigClass ASprigClass, TClass) {
  return ASprigClass && !ASprigClass->InheritsFrom(TControlSprig::StaticClass()) &&
         ASprigClass->InheritsFrom(TComponentSprig::StaticClass());
}

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

void RegisterKilnSprigs() {
  RegisterSprigType(TControl::StaticClass(), TControlSprig::StaticClass());
  RegisterSprigType(TWinControl::StaticClass(), TWinControlSprig::StaticClass());
  RegisterSprigType(TCustomFrame::StaticClass(), TFrameSprig::StaticClass());
  RegisterRootSprigType(TWinControl::StaticClass(), TWinControlRootSprig::StaticClass());
  RegisterRootSprigType(TCustomForm::StaticClass(), TCustomFormRootSprig::StaticClass());
  RegisterRootSprigType(TDataModule::StaticClass(), TDataModuleRootSprig::StaticClass());
}

} // namespace formkit
