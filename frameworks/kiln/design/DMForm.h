//===- frameworks/kiln/design/DMForm.h - The design window of a data module ===//
//
// A data module has no window of its own: on design its non-visual components
// lie as icons in `TDataModuleForm`, on a scrolling `TComponentContainer` that
// fills the window. The window follows the module's design position, size and
// scroll offset, and writes them back when the user moves or sizes it.
// `TDataModuleCustomModule` hands the window to the framework's designer, and
// the selection editor of a data module offers the pseudo property "ClassGroup"
// by which the module's class group is chosen.
//
// Example:
//   RegisterCustomModule(TDataModule::StaticClass(), TDataModuleCustomModule::StaticClass());
//   // the designer asks the module's custom module for a window:
//   TCustomForm* Window = nullptr; TWinControl* Container = nullptr;
//   CastAs<ICustomDesignForm>(Module)->CreateDesignerForm(Designer, Root, Window, Container);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/root/ComponentRoot.h"
#include "editors/CustomModule.h"
#include "editors/SelectionEditors.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnGraphics.h"

#include <functional>

namespace formkit {

/// For the framework's designers; nothing in this library raises it.
FK_RESOURCESTRING(sControlInDataModule, "Controls cannot be added to a data module");

// The class group check --------------------------------------------------------------------
FK_EXCEPTION(EInvalidType, Exception);
FK_RESOURCESTRING(sUnableToFindType, "Unable to find type '%s'");
FK_RESOURCESTRING(sTypeMustBeClass, "Type '%s' must be a class type");
FK_RESOURCESTRING(sTypeMustDescendFromPersistent, "Type '%s' must descend from System.Classes.TPersistent");
FK_RESOURCESTRING(sComponentsNotInClassGroup,
                  "The following component(s) are not available in the specified class group.\r\n"
                  "This is likely to cause compile or runtime errors.\r\n\r\n%s");

/// The signature of the procedure a host sets to make design windows of its own.
using TCreateDesignerFormProc = std::function<void(const IPtr<IDesigner>& Designer, TComponent* Root,
                                                   IPtr<IHostForm>& DesignForm, TWinControl*& ComponentContainer)>;

namespace DMForm {
/// Set by the host: makes the design window of a data module when the designer asks
/// through `ICustomDesignForm80`; unset, the outputs stay null.
FK_API extern TCreateDesignerFormProc CreateDesignerFormProc;
} // namespace DMForm

//===----------------------------------------------------------------------===//
// Containers of component icons
//===----------------------------------------------------------------------===//

/// Where the framework's designer draws the icons of non-visual components.
struct FK_API IInternalComponentContainer : IInterface {
  FK_INTERFACE(IInternalComponentContainer, IInterface, "{6D499D46-3074-4404-904D-28E7034B5499}")
  /// The canvas the icons are drawn on; owned by the container.
  virtual TCanvas* GetCanvas() = 0;
  /// The colour behind the icons.
  virtual TColor GetBackgroundColor() = 0;
  /// The canvas's brush, with the background colour set on it.
  virtual TBrush* GetBrush() = 0;
};

/// A window that holds such a container and can give it the focus.
struct FK_API IInternalComponentContainerParent : IInterface {
  FK_INTERFACE(IInternalComponentContainerParent, IInterface, "{58315D64-EC35-4F06-9D0C-F2FB74D26AB6}")
  virtual void FocusContainer() = 0;
};

/// The scrolling area of a data module's window. Its canvas follows its colour and font.
class FK_API TComponentContainer : public TScrollBox, public IInternalComponentContainer {
  FK_CLASS(TComponentContainer, TScrollBox)
  FK_INTERFACES(IInternalComponentContainer)
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  TCanvas* GetCanvas() override { return FCanvas.Get(); }
  /// `Color`: no theme is active on this system.
  TColor GetBackgroundColor() override { return Color(); }
  TBrush* GetBrush() override;
  /// Paints the grid through the window's designer hook when the window is a form that
  /// has one; otherwise fills the area with the background colour.
  void PaintWindow(TCanvas* Canvas);

protected:
  void WndProc(TMessage& Message) override;

private:
  TObjectGuard<TCanvas> FCanvas;
};

//===----------------------------------------------------------------------===//
// The window
//===----------------------------------------------------------------------===//

/// The design window of a data module: position 8, 8 and client size 389 by 201 until
/// the module's design information places it. It hears the design notifications of
/// every designer and follows its own.
class FK_API TDataModuleForm : public TForm, public IInternalComponentContainerParent, public IDesignNotification {
  FK_CLASS(TDataModuleForm, TForm)
  FK_INTERFACES(IInternalComponentContainerParent, IDesignNotification)

  /// Makes the window for `Root` (not owned; the root is inserted into the window's
  /// components) on `Designer`. The caller frees the window.
  [[nodiscard]] static TDataModuleForm* CreateFor(TComponent* Root, const IPtr<IDesigner>& Designer);
  void BeforeDestruction() override;
  /// The outer size of the window before a module places it.
  static TPoint StoredSize();

  TComponentContainer* ComponentContainer() const noexcept { return FComponentContainer; }
  TComponent* DataModule() const noexcept { return FDataModule; }
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }

  /// Brings the window into line with the module: caption, position, size, scrolling.
  void UpdateDesigner();
  /// Writes the window's position, size and scroll offset back into the module.
  void FormResize(TObject* Sender);
  void SetBounds(int ALeft, int ATop, int AWidth, int AHeight) override;
  /// Scales a data module's design size and its components' positions to the window's
  /// pixels per inch; `NewPPI` is not used, as the window knows its own.
  void ScaleForPPI(int NewPPI) override;

  void FocusContainer() override;

  // IDesignNotification -----------------------------------------------------------------
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemsModified(const IPtr<IDesigner>& ADesigner) override;
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}
  void DesignerOpened(const IPtr<IDesigner>& ADesigner, bool AResurrecting) override;
  void DesignerClosed(const IPtr<IDesigner>& ADesigner, bool AGoingDormant) override;

private:
  TComponentContainer* FComponentContainer = nullptr; // owned by the window as a component
  TComponent* FDataModule = nullptr;                  // not owned
  IPtr<IDesigner> FDesigner;
  bool FUpdating = false; // the window follows the module: nothing to write back
};

//===----------------------------------------------------------------------===//
// Custom module, selection editor, class group
//===----------------------------------------------------------------------===//

/// The custom module of data modules: a window of its own, no visual controls, and the
/// class group the module chose.
class FK_API TDataModuleCustomModule : public TCustomModule, public ICustomDesignForm, public ICustomDesignForm80 {
  FK_CLASS(TDataModuleCustomModule, TCustomModule)
  FK_INTERFACES(ICustomDesignForm, ICustomDesignForm80)

  TClass DesignClass() const override;
  /// False for what the inherited check refuses and for a class that descends from a
  /// designer's plain module class.
  bool ValidateComponentClass(TClass AClass) override;
  /// The chosen class group's class when one was chosen (the inherited finder when it is
  /// unknown), `TControl` while none was chosen; the inherited finder off design.
  TClass GetFinderClass() override;

  /// A `TDataModuleForm` for `Root`; the container is its component container.
  void CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root, TCustomForm*& DesignForm,
                          TWinControl*& ComponentContainer) override;
  /// Clears both, then asks `DMForm::CreateDesignerFormProc` when the host set it.
  void CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root, IPtr<IHostForm>& DesignForm,
                          TWinControl*& ComponentContainer) override;

  /// Whether `AClass` descends from a class of `InvalidDataModuleClasses`.
  [[nodiscard]] static bool IsInvalidDataModuleClass(TClass AClass);
};

/// Adds the "ClassGroup" pseudo property when one data module alone is selected.
class FK_API TDataModuleSelectionEditor : public TSelectionEditor, public ISelectionPropertyFilter {
  FK_CLASS(TDataModuleSelectionEditor, TSelectionEditor)
  FK_INTERFACES(ISelectionPropertyFilter)
  void FilterProperties(const IPtr<IDesignerSelections>& ASelection, const IPtr<IInterfaceList>& AProperties) override;
};

/// "ClassGroup": the class group of the module on `Designer`, chosen from a list.
class FK_API TDataModuleClassGroupProperty : public TBasePropertyEditor, public IProperty, public IPropertyKind {
  FK_CLASS(TDataModuleClassGroupProperty, TBasePropertyEditor)
  FK_INTERFACES(IProperty, IPropertyKind)
  void Create(const IPtr<IDesigner>& ADesigner, int APropCount) override;
  void Initialize() override {}
  void SetPropEntry(int, TPersistent*, PPropInfo) override {}

  void Activate() override {}
  bool AllEqual() override { return true; }
  bool AutoFill() override { return true; }
  void Edit() override {}
  bool HasInstance(TPersistent*) override { return false; }
  /// `paValueList` and `paNotNestable`.
  TPropertyAttributes GetAttributes() override { return {paValueList, paNotNestable}; }
  int GetEditLimit() override { return -1; }
  bool GetEditValue(String& Value) override;
  String GetName() override { return "ClassGroup"; }
  void GetProperties(const TGetPropProc&) override {}
  PPropInfo GetPropInfo() override { return nullptr; }
  PTypeInfo GetPropType() override { return nullptr; }
  /// The group's name; empty off design.
  String GetValue() override;
  /// "Classes.TPersistent", then each designer's plain module class, qualified.
  void GetValues(const TGetStrProc& Proc) override;
  void Revert() override {}
  /// Raises `EInvalidType` for a name that is no persistent class, or whose group would
  /// leave components of the module out, and then nothing has changed.
  void SetValue(const String& Value) override;
  bool ValueAvailable() override { return true; }
  TTypeKind GetKind() override { return tkClassRef; }

private:
  IPtr<IDesigner> FDesigner;
};

/// Checks that `QualifiedName` names a class that may be the class group of `Root`'s
/// module: raises `EInvalidType` with the reason otherwise.
FK_API void CheckClassGroup(TComponent* Root, const String& QualifiedName);

} // namespace formkit
