//===- tests/frameworks/kiln/GraphicsTest.cpp - Colours, fonts, canvas ----===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

TEST(KilnColors, NamesAndNumbers) {
  EXPECT_EQ(ColorToString(clBtnFace), "clBtnFace");
  EXPECT_EQ(ColorToString(clRed), "clRed");
  EXPECT_EQ(ColorToString(0x123456), "$00123456");
  EXPECT_EQ(StringToColor("CLWINDOW"), clWindow);
  EXPECT_EQ(StringToColor("$00123456"), 0x123456);
  EXPECT_EQ(StringToColor("$FF000005"), clWindow);
  EXPECT_EQ(StringToColor("255"), clRed);
  EXPECT_THROW(StringToColor("clPink"), EConvertError);
  EXPECT_EQ(ColorToRGB(clWindow), clWhite);
  EXPECT_EQ(ColorToRGB(clNavy), clNavy);
  int Count = 0;
  String First;
  GetColorValues([&](const String& Name) {
    if (Count++ == 0) First = Name;
  });
  EXPECT_EQ(First, "clBlack");
  EXPECT_EQ(Count, 37);
  EXPECT_EQ(TypeInfo_TColor()->Name, "TColor");
}

TEST(KilnFont, ChangesAreAnnouncedAndAssignCopiesAll) {
  struct TCounter : TObject {
    int Changes = 0;
    void Changed(TObject*) { ++Changes; }
  };
  TObjectGuard<TFont> A(new TFont);
  TObjectGuard<TFont> B(new TFont);
  TCounter Counter;
  B->OnChange = TNotifyEvent::Bind<&TCounter::Changed>(&Counter);
  EXPECT_EQ(A->Name(), "Sans Serif");
  EXPECT_EQ(A->Size(), 9);
  EXPECT_EQ(A->Color(), clWindowText);
  EXPECT_EQ(A->PixelHeight(), 12);
  EXPECT_EQ(A->PixelHeight(144), 18);
  A->SetName("Mono");
  A->SetSize(12);
  A->SetStyle({fsBold, fsItalic});
  B->Assign(A.Get());
  EXPECT_EQ(Counter.Changes, 1);
  EXPECT_TRUE(B->Equals(A.Get()));
  B->Assign(A.Get());
  EXPECT_EQ(Counter.Changes, 1) << "an equal font is no change";
  EXPECT_THROW(B->SetSize(0), EInvalidOperation);
  EXPECT_EQ(B->Size(), 12);
  TObjectGuard<TPen> Pen(new TPen);
  EXPECT_THROW(B->Assign(Pen.Get()), EConvertError);
}

TEST(KilnCanvas, RecordsDrawingCalls) {
  TObjectGuard<TCanvas> C(new TCanvas);
  C->MoveTo(1, 2);
  C->LineTo(30, 2);
  C->Rectangle(0, 0, 10, 10);
  C->FillRect(Rect(1, 1, 9, 9));
  C->FrameRect(Rect(2, 2, 8, 8));
  C->Ellipse(0, 0, 4, 4);
  C->TextOut(5, 6, "Hi");
  C->TextRect(Rect(0, 0, 50, 20), 2, 3, "Box");
  C->Draw(7, 8, "Icon");
  EXPECT_EQ(C->Text(),
            "MoveTo(1,2)\n"
            "LineTo(30,2)\n"
            "Rectangle(0,0,10,10)\n"
            "FillRect(1,1,9,9)\n"
            "FrameRect(2,2,8,8)\n"
            "Ellipse(0,0,4,4)\n"
            "TextOut(5,6,\"Hi\")\n"
            "TextRect(0,0,50,20,2,3,\"Box\")\n"
            "Draw(7,8,Icon)\n");
  EXPECT_EQ(C->PenPos(), Point(17, 6)) << "text moves the pen past it";
  EXPECT_EQ(C->TextWidth("\xC3\xA9t\xC3\xA9"), 18) << "three characters of six pixels";
  EXPECT_EQ(C->TextHeight("x"), 12);
  C->SetPixelsPerInch(192);
  EXPECT_EQ(C->TextExtent("ab"), Point(24, 24));
  C->ClearLines();
  EXPECT_TRUE(C->Lines().empty());
}

} // namespace
