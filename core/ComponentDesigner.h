//===- core/ComponentDesigner.h - The base of a framework's designer -----===//
//
// `TComponentDesigner` keeps the list of one framework's open roots, the active
// root, the current selection and the window that set it. A framework's
// designer package derives a concrete designer that makes roots, gives the
// plain module class, file operations and `SupportsRootClass`, and registers
// it with `Designers` from its initializer.
//
// Example:
//   class TKilnDesigner : public TComponentDesigner { ... };
//   void InitializeKilnDesigner(const IPtr<IDesignEnvironment>& Env) {
//     Designers()->RegisterDesigner(NewAs<IComponentDesigner, TKilnDesigner>(Env));
//   }
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"

namespace formkit {

/// The constant rectangles and points of the core.
inline constexpr TRect EmptyRect{0, 0, 0, 0};
inline constexpr TPoint EmptyPoint{0, 0};
inline constexpr TRect OffScreenRect{-100, -100, -100, -100};
inline constexpr TPoint OffScreenPoint{-100, -100};

/// The abstract base of a framework's designer. It answers to the designer interfaces
/// itself; a concrete designer fills the operations left abstract (making roots, the
/// plain module class, the file operations, `SupportsRootClass`).
class FK_API TComponentDesigner : public TInterfacedObject,
                                  public IInternalComponentDesigner,
                                  public IRootListUpdate,
                                  public IDesignerRegistrationInterface {
  FK_CLASS(TComponentDesigner, TInterfacedObject)
  FK_INTERFACES(IInternalComponentDesigner, IRootListUpdate, IDesignerRegistrationInterface)

  explicit TComponentDesigner(const IPtr<IDesignEnvironment>& Environment = nullptr);

  // IComponentDesigner ----------------------------------------------------------
  /// True while the designer has an active root.
  bool GetActive() override { return static_cast<bool>(FActiveRoot); }
  void DesignerOptionsChanged() override;
  bool FindFile(const String& Name, IPtr<IRoot>& Root) override;
  IPtr<IRoot> FindRoot(TComponent* Component) override;
  IPtr<IRoot> FindRoot(const String& Name) override;
  IPtr<IRoot> GetActiveRoot() override { return IPtr<IRoot>(FActiveRoot); }
  String GetFirstSelectionType() override;
  String GetFirstSelectionUnit() override;
  void GetProperties(const TGetPropProc& Proc) override;
  void HideWindows() override;
  void ShowWindows() override;
  IPtr<IRoot> OpenRootClass(const String& ClassName) override;
  void GetSelection(const IPtr<IDesignerSelections>& List) override;
  void SetSelection(const IPtr<IDesigner>& Designer, const IPtr<IInterface>& Window,
                    const IPtr<IDesignerSelections>& Selections) override;
  bool GetControlsLocked() override { return FControlsLocked; }
  void SetControlsLocked(bool Value) override;
  IPtr<IRoot> GetRoots(int Index) override;
  int GetRootsCount() override { return FRootList->GetCount(); }
  IPtr<IDesignEnvironment> GetEnvironment() override { return FEnvironment; }
  void CancelModes() override;
  void CopySelectionToStream(TStream* Stream) override;
  void PasteSelectionFromStream(TStream* Stream, TComponent* Parent, const TRect& Rect) override;
  bool EditAction(TEditAction Action) override;
  TEditState GetEditState() override;
  void GetClassUnits(const String& ClassName, const TGetStrProc& Proc) override;
  TClass GetFirstSelectionClass() override;
  void GetRootNames(const TGetStrProc& Proc) override;
  String GetSelectionName() override;
  String GetSelectionType() override;
  bool IsNestable(const String& ClassName) override;
  void ModalEditDone(const IPtr<IActivatable>& ReturnWindow) override;
  void RootActivated(const IPtr<IRoot>& Root) override;

  // IInternalComponentDesigner and IRootListUpdate --------------------------------
  void RemoveDependenciesOn(TComponent* Component) override;
  void RootListAdd(const IPtr<IRoot>& Root) override;
  void RootListRemove(const IPtr<IRoot>& Root) override;
  void RootGoingDormant(const IPtr<IRoot>& Root) override;
  void RootModified(const IPtr<IRoot>& Root) override;
  void UpdateRootDependents() override;
  void UpdateSelections() override;
  String FindBaseClass(const String& ClassName) override;
  TClass FindCustomModuleClass(const String& ClassName) override;
  bool IsRootBaseClass(const String& ClassName) override;

  /// The current global selection; null before the first `SetSelection`.
  const IPtr<IDesignerSelections>& Selections() const noexcept { return FSelections; }
  /// The roots, in list order.
  const IPtr<IInterfaceList>& RootList() const noexcept { return FRootList; }

  void BeforeDestruction() override;

protected:
  IPtr<IInterfaceList> FRootList;
  IPtr<IInternalRoot> FActiveRoot;
  IPtr<IEditHandler> FActiveEditHandler;
  IPtr<IDesignEnvironment> FEnvironment;
  IPtr<IDesignerSelections> FSelections;
  bool FControlsLocked = false;
  bool FInUpdateSelections = false;

private:
  std::vector<IPtr<IInternalRoot>> Roots();
  IPtr<IComponentDesigner> Self() { return IPtr<IComponentDesigner>(this); }
};

} // namespace formkit
