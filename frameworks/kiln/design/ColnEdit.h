//===- frameworks/kiln/design/ColnEdit.h - The collection editor window ----===//
//
// A collection property opens a window that lists the collection's items; in
// it the user adds, deletes and reorders items, and selecting rows selects the
// items in the designer, so that the inspector shows them. The window stays
// open beside the inspector and stays true to the collection when the designer
// changes things behind its back: a deleted item refreshes the list (deferred
// through the message queue), the deleted owner or the closed module closes
// the window, and a selection made elsewhere is mirrored back by the items' IDs.
// One window exists per designer, component, collection and property name.
// Its bounds, tool bar and column widths are kept under
// "Collection Editor\<collection class>" through the dialog state service.
//
// Example:
//   TCollectionEditor* Editor = ShowCollectionEditor(Designer, StatusBar1, StatusBar1->Panels(), "Panels");
//   Editor->AddCmd()->Execute();            // a new panel, selected in the designer
//   Editor->ListView1()->ClickRow(0);       // the first panel, after the queue runs
//
//===----------------------------------------------------------------------===//
#pragma once

#include "desktop/ToolWnds.h"
#include "editors/ReferenceEditors.h"
#include "frameworks/kiln/KilnListView.h"
#include "frameworks/kiln/KilnToolBars.h"

#include <vector>

namespace formkit {

FK_RESOURCESTRING(SColEditCaption, "Editing %s%s%s");

/// The window's own message: a deferred refresh (first parameter 1) or selection (0).
inline constexpr std::uint32_t AM_DeferUpdate = WM_USER + 100;

/// The window that edits one collection.
class FK_API TCollectionEditor : public TToolbarDesignWindow {
  FK_CLASS(TCollectionEditor, TToolbarDesignWindow)
  /// The window as its stored form makes it, then joins `CollectionEditorsList`.
  void Create(TComponent* AOwner) override;
  /// Leaves `CollectionEditorsList`.
  void BeforeDestruction() override;

  // The edited collection ---------------------------------------------------------
  /// The collection; null after `CloseEditor`. Not owned.
  TCollection* Collection = nullptr;
  /// The component that holds the property; null after `CloseEditor`. Not owned.
  TComponent* Component = nullptr;
  const String& CollectionPropertyName() const noexcept { return FCollectionPropertyName; }
  /// Names the property; a new name captions the window "Editing Component.Property".
  void SetCollectionPropertyName(const String& Value);
  const String& CollectionClassName() const noexcept { return FCollectionClassName; }
  void SetCollectionClassName(const String& Value) { FCollectionClassName = Value; }
  TColOptions ColOptions() const noexcept { return FColOptions; }
  /// Enables `AddCmd` by the options, once.
  void SetColOptions(TColOptions Value);

  // State -------------------------------------------------------------------------
  bool Closing() const noexcept { return FClosing; }
  bool SelectionError() const noexcept { return FSelectionError; }
  int StateLockCount() const noexcept { return FStateLock; }
  /// The `ID` of each item this window selected last.
  const std::vector<int>& ItemIDList() const noexcept { return FItemIDList; }

  // Controls and commands ---------------------------------------------------------
  TListView* ListView1() const noexcept { return FListView1; }
  TAction* AddCmd() const noexcept { return FAddCmd; }
  TAction* DeleteCmd() const noexcept { return FDeleteCmd; }
  TAction* MoveUpCmd() const noexcept { return FMoveUpCmd; }
  TAction* MoveDownCmd() const noexcept { return FMoveDownCmd; }
  TAction* SelectAllCmd() const noexcept { return FSelectAllCmd; }
  /// The name of the image of one of the five commands ("Collections\Add"); empty for
  /// any other action.
  [[nodiscard]] String CommandImageName(const TAction* Command) const;

  // Operations --------------------------------------------------------------------
  /// Whether the item at `Index` is listed; the base lists every item.
  virtual bool CanAdd(int Index);
  /// The designer becomes active, and the window's selection the designer's.
  void Activated() override;
  void SelectAll(bool DoUpdate = true);
  void SelectNone(bool DoUpdate = true);
  /// The text of item `ItemIndex` in column `Index`: "%d - %s" of its index and display
  /// name without attributes, else the collection's `GetItemAttr`.
  [[nodiscard]] String GetItemName(int Index, int ItemIndex);
  /// Brings the rows in step with the collection; rows that are equal stay, with their
  /// selection and scroll position.
  void UpdateListbox();
  /// From the designer to the list: restores the rows this window selected last.
  void GetSelection();
  /// From the list to the designer: the selected items, or the collection itself.
  void SetSelection();
  using TDesignWindow::SetSelection;
  void LockState() noexcept { ++FStateLock; }
  void UnlockState() noexcept { --FStateLock; }
  /// Lets go of the collection and the component and closes the window.
  void CloseEditor();

  // Design notifications ----------------------------------------------------------
  void ItemDeleted(const IPtr<IDesigner>& ADesigner, TPersistent* AItem) override;
  void DesignerClosed(const IPtr<IDesigner>& ADesigner, bool AGoingDormant) override;
  void ItemsModified(const IPtr<IDesigner>& ADesigner) override;
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}

  // Commands and events -----------------------------------------------------------
  void AddClick(TObject* Sender);
  void DeleteClick(TObject* Sender);
  void MoveUpClick(TObject* Sender);
  void MoveDownClick(TObject* Sender);
  void SelectAllCommandExecute(TObject* Sender);
  /// A key the form sees first: Enter and key code 229 hand typing to the inspector.
  void FormKeyPress(char& Key);

protected:
  void WndProc(TMessage& Message) override;
  /// Keeps the first column's width across a change of the monitor's density.
  void ScaleForPPI(int NewPPI) override;

private:
  void MakeListView();
  void MakeCommands();
  TAction* MakeCommand(const String& Name, const String& Caption, const String& Hint, int ShortCut,
                       TNotifyEvent Execute);
  void CommandUpdate(TObject* Sender);
  void FormClose(TObject* Sender, TCloseAction& Action);
  void AMDeferUpdate(std::intptr_t WParam, std::intptr_t LParam);
  void UpdateColumns();
  void ReadWindowState();
  void WriteWindowState();
  void ListView1Change(TObject* Sender, TListItem* Item, TItemChange Change);
  void ListView1DragOver(TObject* Sender, TObject* Source, int X, int Y, bool& Accept);
  void ListView1DragDrop(TObject* Sender, TObject* Source, int X, int Y);
  void ListView1KeyPress(TObject* Sender, char& Key);
  void ListView1KeyDown(TObject* Sender, std::uint16_t& Key, TShiftState Shift);
  /// Sets the index of each selected item in turn from `Target`, as a move or a drop does.
  void MoveSelected(bool Down);
  [[nodiscard]] bool OwnedByCollection(TPersistent* AItem) const;
  [[nodiscard]] bool CollectionOwnedBy(TPersistent* AItem) const;
  void ModalEditKey(char Key);

  int FListViewWidth = 0;
  bool FClosing = false;
  String FCollectionPropertyName;
  int FStateLock = 0;
  std::vector<int> FItemIDList;
  String FCollectionClassName;
  bool FSelectionError = false;
  TColOptions FColOptions;
  TListView* FListView1 = nullptr;
  TAction* FAddCmd = nullptr;
  TAction* FDeleteCmd = nullptr;
  TAction* FMoveUpCmd = nullptr;
  TAction* FMoveDownCmd = nullptr;
  TAction* FSelectAllCmd = nullptr;
};

/// The class reference of a collection editor window.
using TCollectionEditorClass = TClass;

/// Every open collection editor; null until the first `ShowCollectionEditorClass`.
[[nodiscard]] FK_API const std::vector<TCollectionEditor*>* CollectionEditorsList() noexcept;

/// Shows the editor of `ACollection`, the property `PropertyName` of `AComponent` in
/// `ADesigner`'s module: the open one (brought to the front), or a new window of
/// `CollectionEditorClass` with the application as owner. A step that raises frees
/// the new window and raises again. Raises `EInvalidOperation` "There is no collection
/// to edit" for a null collection.
FK_API TCollectionEditor* ShowCollectionEditorClass(const IPtr<IDesigner>& ADesigner,
                                                    TCollectionEditorClass CollectionEditorClass,
                                                    TComponent* AComponent, TCollection* ACollection,
                                                    const String& PropertyName, TColOptions ColOptions);
/// The same with `TCollectionEditor` and all three options.
FK_API TCollectionEditor* ShowCollectionEditor(const IPtr<IDesigner>& ADesigner, TComponent* AComponent,
                                               TCollection* ACollection, const String& PropertyName);

/// Makes collection properties open this window; the package's registration calls it.
FK_API void RegisterCollectionEditor();
/// Closes the open editors and forgets the window: the package's unloading.
FK_API void UnregisterCollectionEditor() noexcept;

} // namespace formkit
