//===- editors/CustomModule.h - The base of custom modules ---------------===//
//
// A custom module adapts a kind of root (a data module, a control form) to the
// designer: it offers verbs for the module as a whole and decides which
// component classes may stand on it, by name within the class group of the
// root's owner (or of the root), so that a class of the same name from another
// framework is refused. Descendants register through `RegisterCustomModule`.
//
// Example:
//   class TMyModule : public TCustomModule {
//     FK_CLASS(TMyModule, TCustomModule)
//     int GetVerbCount() override { return 1; }
//     String GetVerb(int) override { return "Arrange"; }
//   };
//   Module->ValidateComponent(Button);   // raises "Class TButton is not applicable..."
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignIntfClasses.h"
#include "platform/Classes.h"

namespace formkit {

class TCustomForm;
class TWinControl;

/// What a custom module implements to give its root a design window of its own: the
/// framework's designer asks it before it makes a window itself.
struct FK_API ICustomDesignForm : IInterface {
  FK_INTERFACE(ICustomDesignForm, IInterface, "{787195AF-C234-49DC-881B-221B69C0137A}")
  /// Makes the window for `Root`: `DesignForm` shows the module, `ComponentContainer` is
  /// where its components stand. The caller frees the window; both may come back null.
  virtual void CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root, TCustomForm*& DesignForm,
                                  TWinControl*& ComponentContainer) = 0;
};

/// The later version, for a host that gives its own form (`IHostForm`).
struct FK_API ICustomDesignForm80 : IInterface {
  FK_INTERFACE(ICustomDesignForm80, IInterface, "{525A1DF8-5EF3-4B98-8EE3-4567910A7EA1}")
  virtual void CreateDesignerForm(const IPtr<IDesigner>& Designer, TComponent* Root, IPtr<IHostForm>& DesignForm,
                                  TWinControl*& ComponentContainer) = 0;
};

FK_RESOURCESTRING(sClassNotApplicable, "Class %s is not applicable to this module");

/// The base of custom modules: no verbs, no attributes, not nestable, and every class
/// of the root's class group applicable.
class FK_API TCustomModule : public TBaseCustomModule, public ICustomModule {
  FK_CLASS(TCustomModule, TBaseCustomModule)
  FK_INTERFACES(ICustomModule)
  /// Keeps the root and the designer; neither is owned.
  void Create(TComponent* ARoot, const IPtr<IDesigner>& ADesigner) override;
  void BeforeDestruction() override;

  /// The class whose group decides which classes apply: the class of the root's owner
  /// when it has one, else the root's.
  virtual TClass GetFinderClass();
  void ExecuteVerb(int) override {}
  TCustomModuleAttributes GetAttributes() override { return {}; }
  String GetVerb(int) override { return String(); }
  int GetVerbCount() override { return 0; }
  void Saving() override {}
  void PrepareItem(int, const IPtr<IMenuItem>&) override {}
  /// Raises `ENonAIRException` `sClassNotApplicable` for a component whose class does not
  /// apply.
  void ValidateComponent(TComponent* Component) override;
  /// Whether the first class of `ComponentClass`'s line that is not generated is the very
  /// class the root's class group knows by its name. Never raises.
  bool ValidateComponentClass(TClass ComponentClass) override;
  bool Nestable() override { return false; }

  TComponent* Root() const noexcept { return FRoot; }
  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }

protected:
  TComponent* FRoot = nullptr; // not owned: the root being designed
  IPtr<IDesigner> FDesigner;

private:
  /// Made on first need and again when the finder class changes.
  TObjectGuard<TClassFinder> FFinder;
};

/// Whether `ClassType` or one of its ancestors is named `ClassName` (any case); false
/// for a null class.
[[nodiscard]] FK_API bool ClassInheritsFrom(TClass ClassType, const String& ClassName);

/// False only when `ClassType` does not descend from `AncestorClass` but has an ancestor
/// of the same name: another class that stands in its place.
[[nodiscard]] FK_API bool AncestorNameMatches(TClass ClassType, TClass AncestorClass);

} // namespace formkit
