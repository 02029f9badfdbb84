//===- tests/frameworks/kiln/MemoTest.cpp - Multi-line text and value grids ===//
//
// The memo and the value list grid: their lines told as changes, the caret's
// line and column, keys, and their lines through a form file.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnValEdit.h"
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

/// A form that records what its controls tell it.
class TNotesForm : public TForm {
  FK_CLASS(TNotesForm, TForm)
  std::vector<String> Events;
  void Changed(TObject* Sender) { Events.push_back("change " + static_cast<TComponent*>(Sender)->Name()); }
  void Key(TObject*, std::uint16_t& Key, TShiftState) {
    Events.push_back("key " + IntToStr(Key));
    Key = 0;
  }
};
FK_IMPLEMENT(TNotesForm, "MemoTest") {}

class KilnMemo : public KilnTest {
protected:
  void SetUp() override {
    KilnTest::SetUp();
    RegisterClass(TNotesForm::StaticClass());
  }
  void TearDown() override {
    UnRegisterClass(TNotesForm::StaticClass());
    KilnTest::TearDown();
  }
};

TEST_F(KilnMemo, TheLinesTellTheirChangesAndTheCaretFindsItsLine) {
  TRootGuard<TNotesForm> Form(CreateComponentOf<TNotesForm>(nullptr));
  auto* Memo = Make<TMemo>(Form.P, Form.P, "Memo1");
  EXPECT_EQ(Memo->BoundsRect(), Bounds(0, 0, 185, 89));
  EXPECT_TRUE(Memo->WordWrap());
  TNotesForm& Seen = *Form.P;
  Memo->OnChange = TNotifyEvent::Bind<&TNotesForm::Changed>(Form.P);
  Memo->OnKeyDown = TKeyEvent::Bind<&TNotesForm::Key>(Form.P);
  Memo->Lines()->SetText("first\r\nsecond\r\nthird");
  Memo->Lines()->Add("fourth");
  EXPECT_EQ(Seen.Events, (std::vector<String>{"change Memo1", "change Memo1"}));

  // "first\r\n" is 7 bytes: offset 9 is the third character of the second line.
  Memo->OnSelectionChange = TNotifyEvent::Bind<&TNotesForm::Changed>(Form.P);
  Memo->SetSelStart(9);
  Memo->SetSelStart(9); // no move
  EXPECT_EQ(Seen.Events.size(), 3u);
  Memo->OnSelectionChange = {};
  EXPECT_EQ(Memo->CaretLine(), 1);
  EXPECT_EQ(Memo->CaretColumn(), 2);
  Memo->SetSelStart(7);
  EXPECT_EQ(Memo->CaretLine(), 1);
  EXPECT_EQ(Memo->CaretColumn(), 0);
  Memo->SetSelStart(-5); // kept inside the text
  EXPECT_EQ(Memo->SelStart(), 0);
  Memo->SetSelStart(1000);
  EXPECT_EQ(Memo->SelStart(), static_cast<int>(Memo->Lines()->Text().size()));
  EXPECT_EQ(Memo->CaretLine(), 3);
  Memo->Lines()->Clear(); // the caret follows the text
  EXPECT_EQ(Memo->SelStart(), 0);
  EXPECT_EQ(Memo->CaretLine(), 0);

  std::uint16_t Key = vkEscape;
  Memo->KeyDown(Key, {});
  EXPECT_EQ(Key, 0);
  EXPECT_EQ(Seen.Events.back(), "key 27");

  // Nothing is told on design.
  Memo->SetDesigning(true, false);
  Memo->Lines()->Add("quiet");
  EXPECT_EQ(Seen.Events.size(), 5u);
}

TEST_F(KilnMemo, TheValueGridKeepsNamesAndValues) {
  TRootGuard<TNotesForm> Form(CreateComponentOf<TNotesForm>(nullptr));
  auto* Grid = Make<TValueListEditor>(Form.P, Form.P, "Grid1");
  TNotesForm& Seen = *Form.P;
  Grid->OnStringsChange = TNotifyEvent::Bind<&TNotesForm::Changed>(Form.P);
  Grid->Strings()->SetValues("Width", "80");
  Grid->Strings()->SetValues("Height", "20");
  EXPECT_EQ(Grid->Strings()->Values("Width"), "80");
  EXPECT_EQ(Seen.Events.size(), 2u);
  EXPECT_EQ(Grid->ColWidth(0), 150);
  Grid->SetColWidth(1, 249);
  EXPECT_EQ(Grid->ColWidth(1), 249);
  EXPECT_THROW(Grid->SetColWidth(2, 10), EListError);
  EXPECT_THROW((void)Grid->ColWidth(-1), EListError);
}

TEST_F(KilnMemo, LinesGoThroughAFormFile) {
  TRootGuard<TNotesForm> Form(CreateComponentOf<TNotesForm>(nullptr));
  Form->SetName("NotesForm");
  auto* Memo = Make<TMemo>(Form.P, Form.P, "Memo1");
  Memo->Lines()->SetText("one\r\nGrüße");
  Memo->SetScrollBars(ssBoth);
  Make<TMemo>(Form.P, Form.P, "Memo2");
  auto* Grid = Make<TValueListEditor>(Form.P, Form.P, "Grid1");
  Grid->Strings()->SetValues("Key", "Value");
  Grid->SetKeyOptions({keyEdit, keyAdd});

  TObjectGuard<TMemoryStream> Stream(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(Stream.Get(), 4096));
    W->WriteDescendent(Form.P, nullptr);
    W->FlushBuffer();
  }
  Stream->SetPosition(0);
  TObjectGuard<TMemoryStream> Text(new TMemoryStream);
  ObjectBinaryToText(Stream.Get(), Text.Get());
  String FormText(reinterpret_cast<const char*>(Text->Memory()), static_cast<size_t>(Text->Size()));
  EXPECT_NE(FormText.find("    Lines.Strings = (\n      \"one\"\n      \"Grüße\"\n    )\n"), String::npos)
      << FormText;
  EXPECT_NE(FormText.find("    Strings.Strings = (\n      \"Key=Value\"\n    )\n"), String::npos) << FormText;
  // Empty lines are not written.
  EXPECT_EQ(FormText.find("Lines.Strings"), FormText.rfind("Lines.Strings"));
  Stream->SetPosition(0);
  TRootGuard<TNotesForm> Copy(CreateComponentOf<TNotesForm>(nullptr));
  {
    TObjectGuard<TReader> R(new TReader(Stream.Get(), 4096));
    R->ReadRootComponent(Copy.P);
  }
  auto* MemoCopy = dynamic_cast<TMemo*>(Copy->FindComponent("Memo1"));
  ASSERT_TRUE(MemoCopy);
  EXPECT_EQ(MemoCopy->Lines()->Text(), "one\r\nGrüße\r\n");
  EXPECT_EQ(MemoCopy->ScrollBars(), ssBoth);
  auto* GridCopy = dynamic_cast<TValueListEditor*>(Copy->FindComponent("Grid1"));
  ASSERT_TRUE(GridCopy);
  EXPECT_EQ(GridCopy->Strings()->Values("Key"), "Value");
  EXPECT_EQ(GridCopy->KeyOptions(), (TKeyOptions{keyEdit, keyAdd}));
}

} // namespace
