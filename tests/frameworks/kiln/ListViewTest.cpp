//===- tests/frameworks/kiln/ListViewTest.cpp - Rows of items with columns ===//
//
// The list view's selection by clicks (alone, extended, toggled), the state changes it
// tells, scrolling a row into view, rows by point, and updates drawn once.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnListView.h"
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

/// A form that records its list's state changes.
class TRowsForm : public TForm {
  FK_CLASS(TRowsForm, TForm)
  std::vector<String> Events;
  void Changed(TObject*, TListItem* Item, TItemChange Change) {
    Events.push_back(Item->Caption() + (Change == ctState ? " state" : " text"));
  }
};
FK_IMPLEMENT(TRowsForm, "ListViewTest") {}

using ListViewTest = KilnTest;

std::vector<String> SelectedOf(TListView* List) {
  std::vector<String> Rows;
  for (int I = 0; I < List->Items()->Count(); ++I)
    if (List->Items()->Item(I)->Selected()) Rows.push_back(List->Items()->Item(I)->Caption());
  return Rows;
}

TEST_F(ListViewTest, ListViewSelectsByClicksAndTellsEachChange) {
  TRootGuard<TRowsForm> Form(CreateComponentOf<TRowsForm>(Application()));
  auto* List = Make<TListView>(Form.P, Form.P, "List1");
  List->SetViewStyle(vsReport);
  List->SetShowColumnHeaders(false);
  List->SetBounds(0, 0, 100, 3 * TListView::RowHeight);
  for (const char* Caption : {"a", "b", "c", "d", "e"}) List->Items()->Add()->SetCaption(Caption);
  List->OnChange = TLVChangeEvent::Bind<&TRowsForm::Changed>(Form.P);

  List->ClickRow(1);
  EXPECT_EQ(SelectedOf(List), (std::vector<String>{"b"}));
  EXPECT_EQ(Form->Events, (std::vector<String>{"b state", "b state"})) << "selected, then focused";
  List->ClickRow(3);
  EXPECT_EQ(SelectedOf(List), (std::vector<String>{"d"})) << "a list of single selection";
  List->SetMultiSelect(true);
  List->ClickRow(1, TShiftState{ssShift});
  EXPECT_EQ(SelectedOf(List), (std::vector<String>{"b", "c", "d"})) << "extended from the focused row";
  List->ClickRow(2, TShiftState{ssCtrl});
  EXPECT_EQ(SelectedOf(List), (std::vector<String>{"b", "d"}));
  EXPECT_EQ(List->SelCount(), 2);
  EXPECT_EQ(List->Selected()->Caption(), "b");
  List->SelectAll();
  EXPECT_EQ(List->SelCount(), 5);
  List->ClearSelection();
  EXPECT_EQ(List->Selected(), nullptr);

  // Three rows show: the last one scrolls in, and a point finds the row under it.
  List->Items()->Item(4)->MakeVisible(false);
  EXPECT_EQ(List->TopIndex(), 2);
  EXPECT_EQ(List->GetItemAt(5, TListView::RowHeight + 1)->Caption(), "d");
  EXPECT_EQ(List->GetItemAt(5, 10 * TListView::RowHeight), nullptr);
  List->Items()->Item(0)->MakeVisible(false);
  EXPECT_EQ(List->TopIndex(), 0);

  // Rows changed inside an update are laid out once; a deleted selected row is told.
  const int Before = List->RedrawCount();
  List->Items()->BeginUpdate();
  List->Items()->Add()->SetCaption("f");
  List->Items()->Delete(0);
  List->Items()->EndUpdate();
  EXPECT_EQ(List->RedrawCount(), Before + 1);
  EXPECT_THROW(List->Items()->Item(9), EListError);
  Form->Events.clear();
  List->Items()->Item(0)->SetSelected(true);
  List->Items()->Clear();
  EXPECT_EQ(Form->Events, (std::vector<String>{"b state", "b state"}));
  EXPECT_EQ(List->Items()->Count(), 0);
}

} // namespace
