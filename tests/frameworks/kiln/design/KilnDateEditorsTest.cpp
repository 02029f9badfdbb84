//===- tests/frameworks/kiln/design/KilnDateEditorsTest.cpp - Dates with a calendar drop-down ===//
#include "tests/frameworks/kiln/design/KilnEditorsFixture.h"

#include "platform/FormatSettings.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// The inspector's side of a drop-down: records what it is asked to do.
class TDropDownHost : public TInterfacedObject, public IPropertyHost {
  FK_CLASS(TDropDownHost, TInterfacedObject)
  FK_INTERFACES(IPropertyHost)
  void DropDownControl(TComponent* Control) override { Dropped.push_back(Control); }
  void CloseDropDown() override { ++Closed; }
  std::vector<TComponent*> Dropped;
  int Closed = 0;
};
FK_IMPLEMENT(TDropDownHost, "KilnEditorsTest") {}

struct KilnDateEditorsTest : KilnEditorsFixture {};

TEST_F(KilnDateEditorsTest, ADateDropsDownACalendarWhoseDayADoubleClickOrEnterWrites) {
  TValueGadget* G = MakeGadget();
  G->FDay = EncodeDate(2024, 2, 29);
  IPtr<IProperty> P = PropertyOf({G}, "Day");
  auto* Editor = EditorOf<KilnEditors::TDateProperty>(P);
  ASSERT_TRUE(Editor);
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paRevertable, paCustomDropDown}));
  EXPECT_EQ(P->GetValue(), DateToStr(EncodeDate(2024, 2, 29), FormatSettings())) << "the text of the date editor";
  P->SetValue(DateToStr(EncodeDate(2024, 3, 1), FormatSettings()));
  EXPECT_EQ(G->FDay, EncodeDate(2024, 3, 1));

  IPtr<TDropDownHost> Host = New<TDropDownHost>();
  IPtr<IProperty80> Drop = QueryAs<IProperty80>(P);
  ASSERT_TRUE(Drop);
  Drop->Edit(QueryAs<IPropertyHost>(Host.Get()), false);
  KilnEditors::TMonthCalendar* Calendar = Editor->Calendar();
  ASSERT_TRUE(Calendar);
  EXPECT_EQ(Host->Dropped, (std::vector<TComponent*>{Calendar}));
  EXPECT_EQ(Calendar->Date(), EncodeDate(2024, 3, 1));
  EXPECT_TRUE(Calendar->Visible());
  // Its smallest size at a 12-pixel line: 7 columns of 4 characters of 6 pixels and
  // one character more; 8 rows of 14 pixels and 2.
  EXPECT_EQ(Calendar->Width(), 180);
  EXPECT_EQ(Calendar->Height(), 114);
  Calendar->ScaleForPPI(192);
  EXPECT_EQ(Calendar->Width(), 180) << "the drop-down's calendar keeps the size set for it";
  TObjectGuard<TMonthCalendar> Plain(CreateComponentOf<TMonthCalendar>(nullptr));
  const int PlainWidth = Plain->Width();
  Plain->ScaleForPPI(192);
  EXPECT_EQ(Plain->Width(), 2 * PlainWidth) << "where a plain calendar scales";

  Calendar->SetDate(EncodeDate(2025, 1, 2));
  Calendar->DblClick();
  EXPECT_EQ(G->FDay, EncodeDate(2025, 1, 2));
  Calendar->SetDate(EncodeDate(2025, 3, 4));
  char Key = 13;
  Calendar->KeyPress(Key);
  EXPECT_EQ(G->FDay, EncodeDate(2025, 3, 4));
  EXPECT_EQ(Host->Closed, 0) << "choosing a day does not close the drop-down";
  Calendar->SetDate(EncodeDate(2030, 1, 1));
  Key = 'x';
  Calendar->KeyPress(Key);
  Key = 27;
  Calendar->KeyPress(Key);
  EXPECT_EQ(Host->Closed, 1);
  EXPECT_EQ(G->FDay, EncodeDate(2025, 3, 4)) << "Escape and other keys write nothing";

  // A new drop-down makes a new calendar; an empty date starts at today.
  P->SetValue("");
  const double Before = Now();
  Drop->Edit(QueryAs<IPropertyHost>(Host.Get()), true);
  ASSERT_EQ(Host->Dropped.size(), 2u);
  EXPECT_EQ(Host->Dropped[1], Editor->Calendar());
  EXPECT_GE(Editor->Calendar()->Date(), Before);
  EXPECT_LE(Editor->Calendar()->Date(), Now());
}

} // namespace
