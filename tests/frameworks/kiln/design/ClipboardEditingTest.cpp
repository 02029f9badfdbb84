//===- tests/frameworks/kiln/design/ClipboardEditingTest.cpp - Copy, paste, delete, undelete ===//
//
// Selections of a Kiln module leave it as a selection stream and come back into
// the same module or another: the stream's exact bytes, renames of what collides
// with the references that follow them, pasted handlers renamed or shared, the
// clipboard's two forms, deletion with its checks and undeletion in place.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "frameworks/kiln/KilnClipbrd.h"
#include "platform/Filer.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

struct ClipboardEditingTest : KilnDesignFixture {
  IPtr<IRoot> Form1;
  IPtr<TRecordingModule> Module1;
  TKilnRoot* Kiln = nullptr;

  /// Form1 with Button1 (a click handler), Label1 focusing Edit1, Edit1.
  void SetUp() override {
    KilnDesignFixture::SetUp();
    Form1 = NewForm("Form1", &Module1);
    Kiln = KilnRoot(Form1);
    TComponent* Root = Form1->GetRoot();
    auto* Button = static_cast<TButton*>(Kiln->CreateComponent(TButton::StaticClass(), Root, 8, 8, 75, 25));
    Button->OnClick = TNotifyEvent(Kiln->CreateMethod("Button1Click", IPtr<IEventInfo>()));
    auto* Label = static_cast<TLabel*>(Kiln->CreateComponent(TLabel::StaticClass(), Root, 8, 48, 65, 17));
    auto* Edit = static_cast<TEdit*>(Kiln->CreateComponent(TEdit::StaticClass(), Root, 80, 48, 121, 23));
    Label->SetFocusControl(Edit);
  }
  void TearDown() override {
    Kiln = nullptr;
    Form1 = nullptr;
    Module1 = nullptr;
    KilnDesignFixture::TearDown();
  }
  void SelectOnly(TKilnRoot* Root, std::initializer_list<const char*> Names) {
    bool Add = false;
    for (const char* Name : Names) {
      Root->SelectComponent(Root->Root()->FindComponent(Name), Add);
      Add = true;
    }
  }
  static std::vector<std::uint8_t> BytesOf(TMemoryStream* S) {
    return std::vector<std::uint8_t>(S->Memory(), S->Memory() + S->Size());
  }
  template <class T> static T* Find(TKilnRoot* Root, const char* Name) {
    return dynamic_cast<T*>(Root->Root()->FindComponent(Name));
  }
};

TEST_F(ClipboardEditingTest, ASelectionStreamHasItsRectangleComponentsAndHandlerSource) {
  SelectOnly(Kiln, {"Label1", "Edit1", "Button1"});
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  Kiln->CopySelectionToStream(S.Get());
  std::vector<std::uint8_t> Bytes = BytesOf(S.Get());
  // The bounding rectangle (8, 8, 201, 71) in the smallest integer forms, then the first signature.
  std::vector<std::uint8_t> Head{2, 8, 2, 8, 3, 201, 0, 2, 71, 'K', 'D', 'S', '1'};
  ASSERT_GT(Bytes.size(), Head.size());
  EXPECT_EQ(std::vector<std::uint8_t>(Bytes.begin(), Bytes.begin() + static_cast<std::ptrdiff_t>(Head.size())), Head);
  // The end: the components' zero, the handler's source, the final zero.
  String Tail = "procedure Button1Click;\n";
  std::vector<std::uint8_t> End{0};
  End.insert(End.end(), Tail.begin(), Tail.end());
  End.push_back(0);
  EXPECT_EQ(std::vector<std::uint8_t>(Bytes.end() - static_cast<std::ptrdiff_t>(End.size()), Bytes.end()), End);

  // Without a rectangle and without methods (the undelete form).
  TObjectGuard<TMemoryStream> Plain(new TMemoryStream);
  Kiln->StreamSelection(Plain.Get(), false, nullptr, false);
  EXPECT_EQ(std::vector<std::uint8_t>(Plain->Memory(), Plain->Memory() + 4), (std::vector<std::uint8_t>{'K', 'D', 'S', '1'}));
  EXPECT_EQ(Plain->Memory()[Plain->Size() - 2], 0);
  EXPECT_EQ(Plain->Memory()[Plain->Size() - 1], 0);

  // An empty selection leaves the stream as it was.
  Kiln->ClearSelection();
  TObjectGuard<TMemoryStream> Empty(new TMemoryStream);
  Kiln->CopySelectionToStream(Empty.Get());
  EXPECT_EQ(Empty->Size(), 0);
}

TEST_F(ClipboardEditingTest, PastedIntoTheSameModuleWhatCollidesIsRenamedAndReferencesFollow) {
  SelectOnly(Kiln, {"Label1", "Edit1"});
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  Kiln->CopySelectionToStream(S.Get());
  S->SetPosition(0);
  Kiln->Activate();
  Kiln->PasteSelectionFromStream(S.Get(), nullptr, Rect(100, 200, 300, 300));
  auto* Label2 = Find<TLabel>(Kiln, "Label2");
  auto* Edit2 = Find<TEdit>(Kiln, "Edit2");
  ASSERT_TRUE(Label2 && Edit2);
  EXPECT_EQ(Label2->FocusControl(), Edit2) << "the reference follows the rename";
  EXPECT_EQ(Find<TLabel>(Kiln, "Label1")->FocusControl(), Find<TEdit>(Kiln, "Edit1"));
  // Moved by what takes the selection's corner (8, 48) to (100, 200).
  EXPECT_EQ(Label2->BoundsRect(), Rect(100, 200, 165, 217));
  EXPECT_EQ(Edit2->BoundsRect(), Rect(172, 200, 293, 223));
  // The pasted components are the selection.
  IPtr<IDesignerSelections> Selected = Kiln->GetSelection();
  ASSERT_EQ(Selected->GetCount(), 2);
  EXPECT_EQ(Selected->Get(0), Label2);
  EXPECT_EQ(Selected->Get(1), Edit2);
}

TEST_F(ClipboardEditingTest, PastedHandlersFollowTheirComponentOrAreSharedInAnotherModule) {
  SelectOnly(Kiln, {"Button1"});
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  Kiln->CopySelectionToStream(S.Get());
  // Into the same module: Button2, whose handler follows it.
  S->SetPosition(0);
  Log.Clear();
  Kiln->Activate();
  Kiln->PasteSelectionFromStream(S.Get(), nullptr, Rect(8, 100, 100, 200));
  auto* Button2 = Find<TButton>(Kiln, "Button2");
  ASSERT_NE(Button2, nullptr);
  EXPECT_EQ(Kiln->GetMethodName(Button2->OnClick.Method()), "Button2Click");
  EXPECT_EQ(Log.Count("InsertMethodSource(Button1=Button2,Button1Click=Button2Click)"), 1) << Log.Text();
  EXPECT_EQ(Module1->SourceMethods, (std::vector<String>{"Button1Click", "Button2Click"}));

  // Into another module: the name stands and the handler keeps its name.
  IPtr<TRecordingModule> Module2;
  IPtr<IRoot> Form2 = NewForm("Form2", &Module2);
  TKilnRoot* Kiln2 = KilnRoot(Form2);
  S->SetPosition(0);
  Kiln2->Activate();
  Kiln2->PasteSelectionFromStream(S.Get(), nullptr, Rect(8, 8, 100, 100));
  auto* Copy = Find<TButton>(Kiln2, "Button1");
  ASSERT_NE(Copy, nullptr);
  EXPECT_EQ(Kiln2->GetMethodName(Copy->OnClick.Method()), "Button1Click");
  EXPECT_EQ(Module2->SourceMethods, (std::vector<String>{"Button1Click"}));
  // Two pasted buttons naming one handler share one method.
  Find<TButton>(Kiln, "Button2")->OnClick = Find<TButton>(Kiln, "Button1")->OnClick;
  SelectOnly(Kiln, {"Button1", "Button2"});
  TObjectGuard<TMemoryStream> Both(new TMemoryStream);
  Kiln->CopySelectionToStream(Both.Get());
  Both->SetPosition(0);
  IPtr<IRoot> Form3 = NewForm("Form3");
  TKilnRoot* Kiln3 = KilnRoot(Form3);
  Kiln3->Activate();
  Kiln3->PasteSelectionFromStream(Both.Get(), nullptr, Rect(8, 8, 100, 100));
  EXPECT_EQ(Find<TButton>(Kiln3, "Button1")->OnClick.Method(), Find<TButton>(Kiln3, "Button2")->OnClick.Method());
}

TEST_F(ClipboardEditingTest, TheClipboardHoldsTheStreamAndItsTextAndTextPastesToo) {
  SelectOnly(Kiln, {"Edit1"});
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  Kiln->CopySelectionToStream(S.Get());
  Kiln->CopyStreamToClipboard(S.Get());
  EXPECT_EQ(Clipboard()->GetAsHandle(RegisterClipboardFormat("Tessel Components")), BytesOf(S.Get()));
  EXPECT_EQ(Clipboard()->AsText(), "object Edit1: TEdit\n"
                                   "  Left = 80\n"
                                   "  Top = 48\n"
                                   "  Width = 121\n"
                                   "  Height = 23\n"
                                   "  TabOrder = 1\n"
                                   "  Text = \"Edit1\"\n"
                                   "end\n");
  TObjectGuard<TMemoryStream> Back(Kiln->GetClipboardStream());
  EXPECT_EQ(BytesOf(Back.Get()), BytesOf(S.Get()));

  // Text someone typed pastes as components.
  Clipboard()->Clear();
  Clipboard()->SetAsText("  object Panel7: TPanel\n  Left = 16\n  Top = 16\nend\n");
  TObjectGuard<TMemoryStream> FromText(Kiln->GetClipboardStream());
  Kiln->Activate();
  Kiln->PasteSelectionFromStream(FromText.Get(), nullptr, TRect{});
  ASSERT_NE(Find<TPanel>(Kiln, "Panel7"), nullptr);
  // Text that is no object stream gives a stream of one zero byte.
  Clipboard()->SetAsText("hello");
  TObjectGuard<TMemoryStream> Nothing(Kiln->GetClipboardStream());
  EXPECT_EQ(BytesOf(Nothing.Get()), std::vector<std::uint8_t>{0});
  EXPECT_TRUE(TComponentRoot::PossibleStream("\t\r\n inline Frame1: TFrame1"));
  EXPECT_FALSE(TComponentRoot::PossibleStream("x object"));
}

TEST_F(ClipboardEditingTest, DeleteKeepsAnUndoStreamAndUndeletePutsTheComponentsBackInPlace) {
  SelectOnly(Kiln, {"Label1", "Edit1"});
  Kiln->DeleteSelection(false);
  EXPECT_EQ(Find<TLabel>(Kiln, "Label1"), nullptr);
  EXPECT_EQ(Find<TEdit>(Kiln, "Edit1"), nullptr);
  EXPECT_TRUE(Kiln->CanUndelete());
  // The host hears of each twice: from the deletion, then as the component goes.
  EXPECT_EQ(Log.Count("ItemDeleted(Label1)"), 2) << Log.Text();
  EXPECT_EQ(Log.Count("ItemDeleted(Edit1)"), 2) << Log.Text();
  Kiln->Activate();
  Kiln->DoUndelete();
  EXPECT_FALSE(Kiln->CanUndelete());
  auto* Label = Find<TLabel>(Kiln, "Label1");
  auto* Edit = Find<TEdit>(Kiln, "Edit1");
  ASSERT_TRUE(Label && Edit);
  EXPECT_EQ(Label->BoundsRect(), Rect(8, 48, 73, 65)) << "back where it stood";
  EXPECT_EQ(Label->FocusControl(), Edit);
  // Another insertion ends the chance to undelete.
  SelectOnly(Kiln, {"Edit1"});
  Kiln->DeleteSelection(false);
  EXPECT_TRUE(Kiln->CanUndelete());
  Kiln->CreateComponent(TButton::StaticClass(), Form1->GetRoot(), 8, 200, 75, 25);
  EXPECT_FALSE(Kiln->CanUndelete());
  // Nothing happens with the root selected.
  Kiln->SelectComponent(Form1->GetRoot());
  Kiln->DeleteSelection(false);
  EXPECT_NE(Form1->GetRoot()->ComponentCount(), 0);
}

TEST_F(ClipboardEditingTest, ACutMovesTheSelectionThroughTheClipboardIntoAnotherModule) {
  SelectOnly(Kiln, {"Label1", "Edit1"});
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  Kiln->CopySelectionToStream(S.Get());
  Kiln->CopyStreamToClipboard(S.Get());
  Kiln->DeleteSelection(false);
  EXPECT_EQ(Find<TLabel>(Kiln, "Label1"), nullptr);
  IPtr<IRoot> Form2 = NewForm("Form2");
  TKilnRoot* Kiln2 = KilnRoot(Form2);
  Kiln2->Activate();
  TObjectGuard<TMemoryStream> Board(Kiln2->GetClipboardStream());
  Kiln2->PasteSelectionFromStream(Board.Get(), nullptr, Rect(8, 48, 100, 100));
  auto* Label = Find<TLabel>(Kiln2, "Label1");
  ASSERT_NE(Label, nullptr);
  EXPECT_EQ(Label->FocusControl(), Find<TEdit>(Kiln2, "Edit1"));
  EXPECT_EQ(Label->BoundsRect(), Rect(8, 48, 73, 65));
}

TEST_F(ClipboardEditingTest, AnInheritedComponentCannotBeDeletedAndNothingChanges) {
  IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
  TKilnRoot* Kiln2 = KilnRoot(Form2);
  SelectOnly(Kiln2, {"Edit1"});
  try {
    Kiln2->DeleteSelection(false);
    FAIL();
  } catch (const EComponentDesignerException& E) {
    EXPECT_EQ(E.Message(), "Selection contains a component, Edit1, introduced in an ancestor and cannot be deleted");
  }
  EXPECT_NE(Find<TEdit>(Kiln2, "Edit1"), nullptr);
  EXPECT_FALSE(Kiln2->CanUndelete());
}

} // namespace
