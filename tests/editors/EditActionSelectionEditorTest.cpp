//===- tests/editors/EditActionSelectionEditorTest.cpp - The edit commands of every selection ===//
#include "frameworks/kiln/KilnActions.h"
#include "tests/editors/EditorSamples.h"

#include "core/TopLevels.h"
#include "platform/ScopeGuard.h"

namespace formkit::samples {
namespace {

/// A menu item of the host's menu layer that writes down what goes into it.
class TRecordingMenuItem : public TInterfacedObject, public IMenuItem {
  FK_CLASS(TRecordingMenuItem, TInterfacedObject)
  FK_INTERFACES(IMenuItem)
  IPtr<IMenuItem> AddItem(TComponent* Action, const String&) override { return Add(Action->Name()); }
  IPtr<IMenuItem> AddLine(const String&) override { return Add("-"); }
  IPtr<IMenuItem> InsertLine(int, const String&) override { return Add("-"); }
  int GetCount() override { return static_cast<int>(Items.size()); }
  IPtr<IMenuItem> GetItem(int) override { return nullptr; }
  String GetCaption() override { return String(); }
  String GetName() override { return String(); }
  bool GetChecked() override { return false; }
  bool GetEnabled() override { return true; }
  bool GetVisible() override { return true; }
  bool GetIsLine() override { return false; }
  TComponent* GetAction() override { return nullptr; }
  IPtr<IMenuItem> InsertItem(int, const String& Caption, const String&, const TNotifyEvent&, int) override {
    return Add(Caption);
  }
  int GetGroupIndex() override { return 0; }
  bool GetRadioItem() override { return false; }
  int GetShortCut() override { return 0; }
  std::vector<String> Items;

private:
  IPtr<IMenuItem> Add(const String& What) {
    Items.push_back(What);
    return nullptr;
  }
};

/// A top-level window that takes edit commands.
class TEditingWindow : public TComponent, public IEditHandler {
  FK_CLASS(TEditingWindow, TComponent)
  FK_INTERFACES(IEditHandler)
  bool EditAction(TEditAction Action) override {
    Done.push_back(Action);
    return true;
  }
  TEditState GetEditState() override { return {esCanCopy}; }
  std::vector<TEditAction> Done;
};

} // namespace

FK_IMPLEMENT(TRecordingMenuItem, "EditActionTest") {}
FK_IMPLEMENT(TEditingWindow, "EditActionTest") {}

namespace {

using EditActionSelectionEditorTest = EditorFixture;

IPtr<TEditActionSelectionEditor> NewEditor() {
  return IPtr<TEditActionSelectionEditor>(
      dynamic_cast<TEditActionSelectionEditor*>(
          NewFromClass<TBaseSelectionEditor>(TEditActionSelectionEditor::StaticClass(), IPtr<IDesigner>()).Get()));
}

TEST_F(EditActionSelectionEditorTest, TheMenusTakeTheHostsCommandsInOrderWithTheirSeparators) {
  // The host's commands: all but "EditDeleteCommand".
  TObjectGuard<TComponent> Commands(CreateComponentOf<TComponent>(nullptr));
  auto* List = CreateComponentOf<TActionList>(Commands.Get());
  for (const char* Name : {"EditUndoCommand", "EditCutCommand", "EditCopyCommand", "EditPasteCommand",
                           "EditSelectAllCommand", "AlignBringToFrontCommand", "AlignSendToBackCommand"}) {
    auto* Action = CreateComponentOf<TAction>(Commands.Get());
    Action->SetName(Name);
    Action->SetActionList(List);
  }
  GetIDEActionListFunc = [List] { return List; };
  auto Forget = Finally([]() noexcept { GetIDEActionListFunc = nullptr; });
  IPtr<TEditActionSelectionEditor> Editor = NewEditor();
  ASSERT_TRUE(Editor);
  IPtr<TRecordingMenuItem> Edit = New<TRecordingMenuItem>(), Control = New<TRecordingMenuItem>();
  Editor->PrepareItem(0, InterfaceOf<IMenuItem>(Edit.Get()));
  Editor->PrepareItem(1, InterfaceOf<IMenuItem>(Control.Get()));
  EXPECT_EQ(Edit->Items, (std::vector<String>{"EditUndoCommand", "-", "EditCutCommand", "EditCopyCommand",
                                              "EditPasteCommand", "-", "EditSelectAllCommand"}));
  EXPECT_EQ(Control->Items, (std::vector<String>{"AlignBringToFrontCommand", "AlignSendToBackCommand"}));

  // A component of a command's name that is no action is refused.
  CreateComponentOf<TComponent>(Commands.Get())->SetName("EditDeleteCommand");
  IPtr<TRecordingMenuItem> Again = New<TRecordingMenuItem>();
  try {
    Editor->PrepareItem(0, InterfaceOf<IMenuItem>(Again.Get()));
    ADD_FAILURE() << "no exception";
  } catch (const EInvalidCast& E) {
    EXPECT_EQ(E.Message(), "Invalid class typecast");
  }
}

TEST_F(EditActionSelectionEditorTest, EditCommandsGoToTheTopLevelWindowAndStatesComeFromIt) {
  IPtr<TEditActionSelectionEditor> Editor = NewEditor();
  // Neither the designer nor a window takes edit commands: all six states, nothing done.
  auto Saved = std::exchange(GetTopLevelComponentFunc, nullptr);
  auto Restore = Finally([&]() noexcept { GetTopLevelComponentFunc = std::move(Saved); });
  EXPECT_EQ(Editor->GetEditState(), (TEditState{esCanUndo, esCanRedo, esCanCut, esCanCopy, esCanPaste, esCanDelete}));
  Editor->HandleCut(nullptr);

  TObjectGuard<TEditingWindow> Window(CreateComponentOf<TEditingWindow>(nullptr));
  TEditingWindow* Top = Window.Get();
  GetTopLevelComponentFunc = [Top](TComponent*) { return Top; };
  Editor->HandleCopy(nullptr);
  Editor->HandleSelectAll(nullptr);
  EXPECT_EQ(Top->Done, (std::vector<TEditAction>{eaCopy, eaSelectAll}));
  EXPECT_EQ(Editor->GetEditState(), TEditState{esCanCopy});
}

} // namespace
} // namespace formkit::samples
