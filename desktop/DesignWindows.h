//===- desktop/DesignWindows.h - Editor windows beside a designer --------===//
//
// `TDesignWindow` is the base of the windows in which editors work on the
// components of one module: it serves one designer, hears every design
// notification (and must tell its own designer's from the others'), hides and
// shows with its module, and hands selections to the framework's designer.
// Such windows keep their position in the host's settings between sessions:
// one owned by another form relative to that form's client area, so that it
// moves with its owner; any other relative to its monitor, with the monitor's
// number. Sizes are stored at the default resolution. Components travel between
// such windows and modules over the clipboard of the module's framework, in the
// design core's component format with their text beside it.
//
// Example:
//   auto* Editor = CreateComponentOf<TCollectionEditorWindow>(Application());
//   Editor->SetDesigner(Designer);    // placed below the main window
//   LoadFormPos(Settings, "Collection Editor\\TListColumns", Editor);
//   Editor->CopyComponents(Root, Selection);
//   if (Editor->ClipboardComponents()) Editor->PasteComponents(Other, Other, Pasted);
//   SaveFormPos(Settings, "Collection Editor\\TListColumns", Editor);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"
#include "desktop/DeskUtil.h"

namespace formkit {

class TComponentRoot;
class TDesignWindowLink;

FK_RESOURCESTRING(sDesignWindowNoModule, "The window serves no module on design, so it has no clipboard");

//===----------------------------------------------------------------------===//
// TDesignWindow
//===----------------------------------------------------------------------===//

/// A window that works beside one designer. It hears the design notifications of every
/// designer through a counted link it owns, which goes quiet when the window goes.
class FK_API TDesignWindow : public TForm, public IEditHandler {
  FK_CLASS(TDesignWindow, TForm)
  FK_INTERFACES(IEditHandler)

  /// Registers the window's link for design notifications.
  void Create(TComponent* AOwner) override;
  void BeforeDestruction() override;

  const IPtr<IDesigner>& Designer() const noexcept { return FDesigner; }
  /// Serves `ADesigner`: finds the framework's designer of its extension and places the
  /// window at 200 from the left, 2 pixels below the host's main window.
  void SetDesigner(const IPtr<IDesigner>& ADesigner);
  const IPtr<IComponentDesigner>& ComponentDesigner() const noexcept { return FComponentDesigner; }
  /// The window is the active one.
  bool Active() const noexcept { return FActive; }

  // Operations, in this order ----------------------------------------------------
  /// Nothing to edit by default.
  TEditState GetEditState() override { return {}; }
  bool EditAction(TEditAction) override { return false; }
  /// The design notifications: nothing by default. Each is told of every designer.
  virtual void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) {}
  virtual void ItemInserted(const IPtr<IDesigner>&, TPersistent*) {}
  virtual void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) {}
  virtual void DesignerOpened(const IPtr<IDesigner>&, bool) {}
  virtual void DesignerClosed(const IPtr<IDesigner>&, bool) {}
  virtual void ItemsModified(const IPtr<IDesigner>&) {}
  /// Takes the window off the screen while its module is not shown; `Visible` stays.
  virtual void WindowHide();
  /// Puts it back in its window state.
  virtual void WindowShow();

  /// Told when the window becomes active; nothing by default.
  virtual void Activated() {}
  /// Has the host's inspector take the key `AChar`; the focus comes back here after.
  void ActivateInspector(char AChar);
  /// Makes `ASelection` the selection, with this window as its source.
  void SetSelection(const IPtr<IDesignerSelections>& ASelection);
  /// A name for a new component that its module does not use yet.
  virtual String UniqueName(TComponent* AComponent);

  // The clipboard ----------------------------------------------------------------
  /// Whether the clipboard holds components: in their own format, or as text that may
  /// be a component stream. Any failure on the way, a window without a module among
  /// them, answers false.
  [[nodiscard]] bool ClipboardComponents() noexcept;
  /// Puts the components of `ASelection` (other persistents are left out), written
  /// against `ARoot`, on the clipboard as component data and as text. Raises
  /// `EInvalidOperation` `sDesignWindowNoModule` when the window serves no module, and
  /// then the clipboard stays as it was.
  void CopyComponents(TComponent* ARoot, const IPtr<IDesignerSelections>& ASelection);
  /// Reads the clipboard's components into `AOwner` under `AParent`; one whose name
  /// `AOwner` uses already gets `UniqueName`. Each component read is added to
  /// `ASelection`. Text that is no component stream reads nothing. Raises as
  /// `CopyComponents` does, and the reader's errors; what was read before an error stays.
  void PasteComponents(TComponent* AOwner, TComponent* AParent, const IPtr<IDesignerSelections>& ASelection);

protected:
  void WndProc(TMessage& Message) override;

private:
  /// The module on design the window serves, whose framework supplies the clipboard.
  TComponentRoot* DesignRoot() const;
  void ReaderSetName(TReader* AReader, TComponent* AComponent, String& AName);
  void ComponentRead(TComponent* AComponent);

  /// The list and the owner of the paste that runs; set only during `PasteComponents`.
  IPtr<IDesignerSelections> FSelection;
  TComponent* FOwner = nullptr;
  IPtr<IDesigner> FDesigner;
  IPtr<IComponentDesigner> FComponentDesigner;
  bool FActive = false;
  /// What the design core holds of this window (a `TDesignWindowLink`).
  IPtr<IDesignWindow> FLink;
  TDesignWindowLink* Link() const noexcept;
};

//===----------------------------------------------------------------------===//
// Positions
//===----------------------------------------------------------------------===//

/// Writes "Left", "Top", "Width", "Height" at the default resolution, and "MonitorIndex"
/// for a window not owned by a form (deleted for one that is).
FK_API void SaveFormPos(TCustomIniFile* AIniFile, const String& ASection, TCustomForm* AForm);
/// Puts the window back inside its monitor (or the screen) where `SaveFormPos` left it.
/// A window owned by a form with no stored size is centred on its owner; any other
/// window without a stored size of at least 2 by 2 stays where it is.
FK_API void LoadFormPos(TCustomIniFile* AIniFile, const String& ASection, TCustomForm* AForm);

} // namespace formkit
