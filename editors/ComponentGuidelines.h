//===- editors/ComponentGuidelines.h - Guides of components and their registry ---===//
//
// A design package tells which guides the components of a class offer on a
// surface by registering a guidelines class for it. `GuidelinesFor` finds the
// class registered for a component's class or its nearest ancestor that has one
// (`TComponentGuidelines`, which offers none, when nothing is registered), makes
// an instance for the designer and binds it to the component. Registrations are
// stamped with the group of the package that made them and go when it unloads.
//
// `TComponentGuidelines` is the base of such classes: a subclass lists its guides
// with offsets from the component's own origin, and `CalcHorzPos` and
// `CalcVertPos` bring them into the container's coordinates.
//
// Example:
//   StartComponentGuidelines();                       // the editor registries start
//   RegisterComponentGuidelines(TMyControl::StaticClass(), TMyControlGuidelines::StaticClass());
//   IPtr<IComponentGuidelines> G = GuidelinesFor(Designer, MyControl1, Form1);
//   for (int I = 0; I < G->GetCount(); ++I)
//     Use(G->GetDesignerGuideType(I), G->GetDesignerGuideOffset(I));
//   FreeComponentGuidelinesGroup(Group);              // the package goes away
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntf.h"

#include <climits>

namespace formkit {

/// The offset of a guide that has no position.
inline constexpr int NoGuideOffset = INT_MAX;

FK_RESOURCESTRING(sGuidelinesWithoutComponent, "Guidelines need a component");

/// The guides of a component that offers none; the base of the guidelines classes. Holds
/// the component and its container without owning them; it must not outlive them.
class FK_API TComponentGuidelines : public TBaseComponentGuidelines, public IComponentGuidelines {
  FK_CLASS(TComponentGuidelines, TBaseComponentGuidelines)
  FK_INTERFACES(IComponentGuidelines)

  /// Keeps the component and the container; overrides read what they need of them here.
  void Initialize(TComponent* AComponent, TComponent* AContainer) override;
  /// Bring an offset on the X or the Y axis from the component's own origin into the
  /// container's coordinates; the base returns `APos` as it is.
  virtual int CalcHorzPos(int APos) { return APos; }
  virtual int CalcVertPos(int APos) { return APos; }
  /// The number of guides; none in the base.
  int GetCount() override { return 0; }
  /// The kind of guide `Index`; `gtAlignLeft` in the base.
  TDesignerGuideType GetDesignerGuideType(int) override { return gtAlignLeft; }
  /// The offset of guide `Index` from the component's own origin; `NoGuideOffset` in the
  /// base. Subclasses override this one, not the interface's `GetDesignerGuideOffset`.
  virtual int GetGuideOffset(int) { return NoGuideOffset; }
  /// What the interface answers: the offset of guide `Index` in the container's
  /// coordinates (see `InternalGetDesignerGuideOffset`).
  int GetDesignerGuideOffset(int Index) final { return InternalGetDesignerGuideOffset(Index); }

  TComponent* Component() const noexcept { return FComponent; }
  TComponent* Container() const noexcept { return FContainer; }

protected:
  /// `GetGuideOffset(Index)` passed through `CalcHorzPos` for a guide on the X axis and
  /// through `CalcVertPos` for one on the Y axis (a baseline included); `NoGuideOffset`
  /// for a kind outside `TDesignerGuideType`.
  int InternalGetDesignerGuideOffset(int Index);

  TComponent* FComponent = nullptr;
  TComponent* FContainer = nullptr;
};

/// The guides of `AComponent` in the coordinates of `AContainer`: an instance of the class
/// registered for its class or for its nearest ancestor below `TPersistent`, else of
/// `TComponentGuidelines`, made with `Designer` and initialised. What `Initialize` raises
/// passes on, the instance freed. Raises `EArgumentException` `sGuidelinesWithoutComponent`
/// for a null component, `EInvalidCast` "Class %s is not a component guidelines class" when the class found does
/// not descend from `TBaseComponentGuidelines`, `EInvalidOperation` when it is abstract,
/// and `EIntfCastError` when it does not offer `IComponentGuidelines`. Cost: one look-up
/// for each class up the ancestry.
[[nodiscard]] FK_API IPtr<IComponentGuidelines> GuidelinesFor(const IPtr<IDesigner>& Designer, TComponent* AComponent,
                                                              TComponent* AContainer);
/// Points `RegisterComponentGuidelinesProc` at this registry: registrations are kept from
/// now on. Called when the editor registries start.
FK_API void StartComponentGuidelines();
/// Clears the hook, so that registrations do nothing, and frees every record.
FK_API void StopComponentGuidelines() noexcept;
/// Drops the records that group `Group` registered, when its package unloads: a class
/// whose newest registration goes falls back to the one before. Cost: a walk over all
/// records.
FK_API void FreeComponentGuidelinesGroup(int Group);

} // namespace formkit
