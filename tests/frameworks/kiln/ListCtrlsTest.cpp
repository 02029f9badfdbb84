//===- tests/frameworks/kiln/ListCtrlsTest.cpp - Radio buttons, lists, clicks in a dialog ===//
#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnListCtrls.h"
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

using KilnListCtrls = KilnTest;

template <class T> T* Child(TWinControl* Parent, const char* Name) {
  T* C = CreateComponentOf<T>(Parent);
  C->SetName(Name);
  C->SetParent(Parent);
  return C;
}

String Message(const std::function<void()>& Action) {
  try {
    Action();
  } catch (const Exception& E) {
    return String(E.ClassName()) + ": " + E.Message();
  }
  return "no exception";
}

TEST_F(KilnListCtrls, ARadioButtonExcludesOnlyItsSiblings) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* A = Child<TRadioButton>(Form.P, "A");
  auto* B = Child<TRadioButton>(Form.P, "B");
  auto* Group = Child<TPanel>(Form.P, "Group");
  auto* C = Child<TRadioButton>(Group, "C");
  A->SetChecked(true);
  C->SetChecked(true);
  B->SetChecked(true);
  EXPECT_FALSE(A->Checked());
  EXPECT_TRUE(B->Checked());
  EXPECT_TRUE(C->Checked()) << "another parent is another group";
  EXPECT_EQ(Format("%dx%d", A->Width(), A->Height()), "113x17");
}

TEST_F(KilnListCtrls, ListsChooseAnItemOrNoneAndKeepOrderWhenSorted) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* Combo = Child<TComboBox>(Form.P, "Combo");
  Combo->Items()->SetCommaText("Beta,Alpha");
  Combo->SetStyle(csDropDownList);
  EXPECT_EQ(Combo->Text(), "");
  Combo->SetItemIndex(1);
  EXPECT_EQ(Combo->Text(), "Alpha");
  EXPECT_EQ(Message([&] { Combo->SetItemIndex(2); }), "EListError: List index out of bounds (2)");
  EXPECT_EQ(Combo->ItemIndex(), 1);
  Combo->SetItemIndex(-1);
  EXPECT_EQ(Combo->Text(), "");

  auto* List = Child<TListBox>(Form.P, "List");
  List->SetSorted(true);
  List->Items()->Add("Form3");
  List->Items()->Add("form1");
  List->Items()->Add("Form2");
  EXPECT_EQ(List->Items()->CommaText(), "form1,Form2,Form3");
  EXPECT_EQ(List->ItemIndex(), -1);
}

TEST_F(KilnListCtrls, AClickOnAButtonGivesTheResultItsFormCloseWith) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  Form.P->SetName("Dialog");
  auto* Ok = Child<TButton>(Form.P, "Ok");
  Ok->SetModalResult(mrOk);
  EXPECT_EQ(ClickButton(*Form.P, "Ok"), mrOk);
  Ok->SetEnabled(false);
  EXPECT_EQ(Message([&] { (void)ClickButton(*Form.P, "Ok"); }),
            "EInvalidOperation: Form Dialog has no button Ok");
  EXPECT_EQ(Message([&] { (void)ClickButton(*Form.P, "Nobody"); }),
            "EInvalidOperation: Form Dialog has no button Nobody");
}

} // namespace
