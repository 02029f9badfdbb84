//===- core/root/RootFormEditor.h - A module as the tool interfaces show it ===//
//
// Add-ins of the host never see a `TComponentRoot`: they reach a module through
// `IOTAFormEditor` (the form), `IOTAComponent` (one object of it) and
// `IOTAEditorContent` (the whole form stream). `TOTAFormEditor` is the one
// facade of a root, made by `GetFormEditor` on first use and kept by the root
// until it is destroyed; `TOTAComponent` is a short-lived wrapper of one object,
// made anew for every request. `TAncestorNotifier` lets a descendant forget its
// ancestor when the ancestor's module goes, and `TEnvironmentTools` asks the
// host's palette whether a tool is armed.
//
// Example:
//   IPtr<IOTAFormEditor> Editor = Root->GetFormEditor();
//   if (IPtr<IOTAComponent> Button = Editor->FindComponent("Button1")) {
//     String Caption = "OK";
//     Button->SetPropByName("Caption", &Caption);   // a UnicodeString property
//   }
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ToolUtils.h"
#include "core/root/ComponentRoot.h"

#include <optional>

namespace formkit {

//===----------------------------------------------------------------------===//
// The form editor
//===----------------------------------------------------------------------===//

/// The tool facade of one root. It lives by its counted references, one of which the
/// root holds; it does not keep the root alive.
class FK_API TOTAFormEditor : public TOTAClass,
                              public IOTAFormEditor,
                              public INTAFormEditor,
                              public IOTAEditorContent {
  FK_CLASS(TOTAFormEditor, TOTAClass)
  FK_INTERFACES(IOTAFormEditor, INTAFormEditor, IOTAEditorContent)

  explicit TOTAFormEditor(TComponentRoot* Root = nullptr);

  // IOTAEditor
  int AddNotifier(const IPtr<IOTANotifier>& Notifier) override;
  String GetFileName() override;
  /// True when the module changed after it was read or saved.
  bool GetModified() override;
  /// The module record as `IOTAModule`, or null when it is none.
  IPtr<IOTAModule> GetModule() override;
  bool MarkModified() override;
  void RemoveNotifier(int Index) override;
  void Show() override;
  // IOTAFormEditor
  IPtr<IOTAComponent> GetRootComponent() override;
  IPtr<IOTAComponent> FindComponent(const String& Name) override;
  IPtr<IOTAComponent> GetComponentFromHandle(TOTAHandle ComponentHandle) override;
  int GetSelCount() override;
  IPtr<IOTAComponent> GetSelComponent(int Index) override;
  IPtr<IOTAComponent> GetCreateParent() override;
  IPtr<IOTAComponent> CreateComponent(const IPtr<IOTAComponent>& Container, const String& TypeName, int X, int Y,
                                      int W, int H) override;
  void GetFormResource(const IPtr<IStream>& Stream) override;
  // INTAFormEditor
  IPtr<IDesigner> GetFormDesigner() override;
  /// Copies the whole module stream to `Stream` (not owned) and rewinds it.
  void GetFormResource(TStream* Stream) override;
  // IOTAEditorContent
  /// The module stream, not copied: valid until the module changes.
  IPtr<IStream> GetContent() override;
  /// Replaces the module's stream by `Content`, through dormancy when the module is
  /// live. On failure the old content stays and the module stays dormant.
  void SetContent(const IPtr<IStream>& Content) override;
  /// The time of the last change in UTC; the present time when none is known.
  TDateTime GetContentAge() override;
  void ResetDiskAge() override;

  // What the root tells its notifiers -------------------------------------------------
  void FormModified();
  void FormSaving();
  /// Called by the host when the form becomes the active one.
  void NotifyActivate();
  void NotifyRenamed(TComponent* Component, const String& OldName, const String& NewName);
  void NotifyDestruct();

  /// The root; null once the root has gone (a facade that outlives it is not to be used).
  TComponentRoot* ComponentRoot() const noexcept { return FComponentRoot; }
  /// The facade `Root` has made, or null; does not make one.
  static TOTAFormEditor* Of(TComponentRoot& Root) noexcept { return Root.FOTAFormEditor; }

private:
  /// A new wrapper of `Object`, or null for null.
  IPtr<IOTAComponent> Wrap(TPersistent* Object);

  TComponentRoot* FComponentRoot; // holds this facade
};

/// Joins the root core: a rename in a module reaches its facade's notifiers.
FK_API void InitializeRootFormEditor();

//===----------------------------------------------------------------------===//
// Components
//===----------------------------------------------------------------------===//

/// One object of a module, for one request: not kept alive by the wrapper, and two
/// wrappers of one object are different objects.
class FK_API TOTAComponent : public TInterfacedObject, public IOTAComponent, public INTAComponent {
  FK_CLASS(TOTAComponent, TInterfacedObject)
  FK_INTERFACES(IOTAComponent, INTAComponent)

  TOTAComponent(TPersistent* Object = nullptr, TComponentRoot* Root = nullptr);

  // IOTAComponent
  String GetComponentType() override;
  TOTAHandle GetComponentHandle() override;
  IPtr<IOTAComponent> GetParent() override;
  bool IsTControl() override;
  int GetPropCount() override;
  String GetPropName(int Index) override;
  TTypeKind GetPropType(int Index) override;
  TTypeKind GetPropTypeByName(const String& Name) override;
  bool GetPropValue(int Index, void* Value) override;
  bool GetPropValueByName(const String& Name, void* Value) override;
  /// Ends with the root's `Modified` when the property took the value.
  bool SetProp(int Index, const void* Value) override;
  bool SetPropByName(const String& Name, const void* Value) override;
  /// A callback that clears its `Result` stops the walk with `EAbort`, which passes out.
  /// Not re-entrant on one wrapper.
  bool GetChildren(void* Param, TOTAGetChildCallback Proc) override;
  int GetControlCount() override;
  IPtr<IOTAComponent> GetControl(int Index) override;
  int GetComponentCount() override;
  IPtr<IOTAComponent> GetComponent(int Index) override;
  bool Select(bool AddToSelection) override;
  bool Focus(bool AddToSelection) override;
  /// Frees a component that the root component owns; false for anything else.
  bool Delete() override;
  // INTAComponent
  TPersistent* GetPersistent() override { return FObject; }
  TComponent* GetComponent() override;

private:
  /// The published properties in declaration order, found once.
  const std::vector<PPropInfo>& PropList();
  PPropInfo PropAt(int Index);
  PPropInfo PropNamed(const String& Name);
  bool GetValue(PPropInfo Prop, void* Value);
  bool SetValue(PPropInfo Prop, const void* Value);
  /// A component of the module other than the root component, or null.
  TComponent* ChildComponent();
  void GetChildProc(TComponent* Child);

  TPersistent* FObject;
  TComponentRoot* FComponentRoot;
  std::optional<std::vector<PPropInfo>> FPropList;
  TOTAGetChildCallback FProc = nullptr;
  void* FParam = nullptr;
};

//===----------------------------------------------------------------------===//
// Adapters
//===----------------------------------------------------------------------===//

/// Watches the module of a root's ancestor; when that module goes, the root forgets its
/// ancestor root. Registered with the ancestor's module only when it is an `IOTAModule`.
class FK_API TAncestorNotifier : public TInterfacedObject, public IOTAModuleNotifier {
  FK_CLASS(TAncestorNotifier, TInterfacedObject)
  FK_INTERFACES(IOTAModuleNotifier)

  explicit TAncestorNotifier(TComponentRoot* Root = nullptr);

  void AfterSave() override {}
  void BeforeSave() override {}
  /// Leaves the ancestor's module and clears the root's ancestor root; once only.
  void Destroyed() override;
  void Modified() override {}
  bool CheckOverwrite() override { return true; }
  void ModuleRenamed(const String&) override {}

  /// The handle given by the ancestor's module; -1 while not registered.
  int NotifierIndex() const noexcept { return FNotifierIndex; }

private:
  IPtr<IOTAModule> FModule;
  TComponentRoot* FComponentRoot;
  int FNotifierIndex = -1;
};

/// The palette as the surface engine asks it, through the host's environment.
class FK_API TEnvironmentTools : public TInterfacedObject, public ITools {
  FK_CLASS(TEnvironmentTools, TInterfacedObject)
  FK_INTERFACES(ITools)

  explicit TEnvironmentTools(IPtr<IDesignEnvironment> Environment = nullptr)
      : FEnvironment(std::move(Environment)) {}
  /// True when the host's palette has an item selected.
  bool ToolSelected() override;

private:
  IPtr<IDesignEnvironment> FEnvironment;
};

} // namespace formkit
