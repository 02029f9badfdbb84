//===- fuzz/support/KilnSamples.h - Kiln modules for fuzzing --------------===//
//
// Real Kiln modules, built in code the way a designer leaves them: a main form
// with nested panels, buttons with event handlers, labels, edits, check boxes
// and a timer; a panel that refers to other components directly, through an
// interface and through the items of a collection; a second module whose
// references name components of the first; a descendant written against its
// ancestor, with an inherited control moved into a new panel; a frame, inline in
// a form; a data module. The fuzz targets read their input over these, and the
// seed generator writes them out as the corpora the targets start from.
//
// Example:
//   StartKilnSamples();                          // once per process
//   TObjectGuard<TSampleForm> A(BuildModuleA());
//   TBytes Data = WriteRoot(A.Get());
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/Kiln.h"
#include "fuzz/support/StreamChecks.h"

namespace formkit::fuzzing {

/// A program's form: its event handlers are published methods.
class FK_API TSampleForm : public TForm {
  FK_CLASS(TSampleForm, TForm)
  /// Handlers that streams name; they do nothing.
  void ButtonClick(TObject*) {}
  void EditChange(TObject*) {}
  void Tick(TObject*) {}
  void FormShow(TObject*) {}
};

/// A frame class of a program, to stand as a root or inline in a form.
class FK_API TSampleFrame : public TFrame {
  FK_CLASS(TSampleFrame, TFrame)
  /// A handler that streams name; it does nothing.
  void ButtonClick(TObject*) {}
};

/// A data module class of a program.
class FK_API TSampleDataModule : public TDataModule {
  FK_CLASS(TSampleDataModule, TDataModule)
  /// A handler that streams name; it does nothing.
  void Tick(TObject*) {}
};

/// One reference of a `TLinkPanel`'s collection: a caption and a component.
class FK_API TLinkItem : public TCollectionItem {
  FK_CLASS(TLinkItem, TCollectionItem)
  /// Free text, streamed.
  String Caption;
  /// The component referred to; null once it went. Not owned.
  TComponent* Target() const noexcept { return FTarget; }
  /// Asks the panel that holds the collection to watch the new target.
  void SetTarget(TComponent* Value);

private:
  friend class TLinkPanel;
  TComponent* FTarget = nullptr;
};

/// A panel that refers to other components, of its own module or another: `Buddy`
/// directly, `Peer` through an interface, and `Links` through the items of a collection.
/// It asks to be told when a component it refers to directly goes, and forgets it then;
/// `Peer` holds whatever interface it is given and relies on it.
class FK_API TLinkPanel : public TPanel {
  FK_CLASS(TLinkPanel, TPanel)
  /// Makes `Links`.
  void Create(TComponent* AOwner) override;
  /// Frees `Links` and lets go of `Peer`.
  void BeforeDestruction() override;
  /// Forgets a component referred to directly when it goes.
  void Notification(TComponent* AComponent, TOperation Operation) override;

  /// A component referred to directly; null once it went. Not owned.
  TComponent* Buddy() const noexcept { return FBuddy; }
  /// Refers to `Value` and watches it.
  void SetBuddy(TComponent* Value);
  /// Whatever the reader or a program gives it; counted.
  IPtr<IInterface> Peer;
  /// Items of `TLinkItem`; owned.
  TOwnedCollection* Links() const noexcept { return FLinks; }

  /// Adds an item referring to `Target`.
  TLinkItem* AddLink(const String& Caption, TComponent* Target);
  /// Watches `Target` for its going (after an item took it).
  void Watch(TComponent* Target);

private:
  TComponent* FBuddy = nullptr;
  TOwnedCollection* FLinks = nullptr;
};

/// Starts the Kiln framework for the rest of the process and registers the sample
/// classes in its class group. Safe to call more than once.
FK_API void StartKilnSamples();

/// A new, empty root of each sample class, as a fuzz target reads into it.
[[nodiscard]] FK_API TComponent* NewSampleForm();
[[nodiscard]] FK_API TComponent* NewSampleFrame();
[[nodiscard]] FK_API TComponent* NewSampleDataModule();

/// "ModuleA": a panel with two buttons and an edit, a label, a check box, a timer and a
/// link panel whose references stay inside the module.
[[nodiscard]] FK_API TSampleForm* BuildModuleA();
/// "ModuleB": nested panels, and a link panel whose references name components of
/// `ModuleA`, which must be open.
[[nodiscard]] FK_API TSampleForm* BuildModuleB(TComponent* ModuleA);

/// "Form1": the ancestor of the descendants below; a plain main form.
[[nodiscard]] FK_API TSampleForm* BuildAncestor();
/// A descendant of `Ancestor` read from `AncestorData` and edited: a moved button, a new
/// button, a child put back in order, a new panel put first that took an inherited edit
/// and has a check box of its own, new links. Write it against `Ancestor` to get what a designer saves.
[[nodiscard]] FK_API TSampleForm* BuildDescendant(const TBytes& AncestorData);
/// A new root with the components of `AncestorData`, ready to read a descendant into.
[[nodiscard]] FK_API TSampleForm* NewDescendantRoot(const TBytes& AncestorData);

/// "Frame1": a frame with a button, an edit and a timer.
[[nodiscard]] FK_API TSampleFrame* BuildFrame();
/// "Form2": a form with a frame inline in a panel.
[[nodiscard]] FK_API TSampleForm* BuildFormWithFrame();
/// "DataModule1": timers and its design window's size.
[[nodiscard]] FK_API TSampleDataModule* BuildDataModule();

} // namespace formkit::fuzzing
