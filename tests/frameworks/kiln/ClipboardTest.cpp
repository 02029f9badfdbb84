//===- tests/frameworks/kiln/ClipboardTest.cpp - Formats on the clipboard -===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

#include <cstring>

using namespace formkit;
using namespace formkit::kilntest;

namespace {

using KilnClipboard = KilnTest;

std::vector<std::uint8_t> Bytes(const char* S) { return std::vector<std::uint8_t>(S, S + std::strlen(S)); }

TEST_F(KilnClipboard, NamedFormatsHaveTheirOwnNumbers) {
  TClipFormat A = RegisterClipboardFormat("Widget Components");
  TClipFormat B = RegisterClipboardFormat("Widget Component");
  EXPECT_GE(A, FirstRegisteredClipFormat);
  EXPECT_NE(A, B);
  EXPECT_EQ(RegisterClipboardFormat("WIDGET COMPONENTS"), A) << "names compare without case";
  EXPECT_EQ(ClipboardFormatName(A), "Widget Components");
  EXPECT_EQ(ClipboardFormatName(CF_TEXT), "CF_TEXT");
  EXPECT_EQ(ClipboardFormatName(0xBEEF), "");
  EXPECT_THROW(RegisterClipboardFormat(""), EInvalidOperation);
}

TEST_F(KilnClipboard, FormatsAreKeptApart) {
  TClipFormat A = RegisterClipboardFormat("Widget Components");
  TClipFormat B = RegisterClipboardFormat("Widget Component");
  TClipboard* C = Clipboard();
  C->Open();
  C->SetAsHandle(A, Bytes("binary"));
  C->SetAsHandle(B, Bytes("one"));
  C->SetAsText("Button1");
  C->Close();
  EXPECT_EQ(C->FormatCount(), 3);
  EXPECT_EQ(C->Formats(0), A);
  EXPECT_EQ(C->Formats(2), CF_TEXT);
  EXPECT_EQ(C->GetAsHandle(A), Bytes("binary"));
  EXPECT_EQ(C->GetAsHandle(B), Bytes("one"));
  EXPECT_EQ(C->AsText(), "Button1");
  EXPECT_THROW(C->Formats(3), EListError);
  // Outside a session, putting data replaces everything.
  C->SetAsHandle(B, Bytes("two"));
  EXPECT_EQ(C->FormatCount(), 1);
  EXPECT_FALSE(C->HasFormat(A));
  EXPECT_EQ(C->GetAsHandle(A), std::vector<std::uint8_t>{});
  EXPECT_EQ(C->GetAsHandle(B), Bytes("two"));
  int Changes = C->ChangeCount();
  C->Clear();
  EXPECT_EQ(C->FormatCount(), 0);
  EXPECT_GT(C->ChangeCount(), Changes);
}

TEST_F(KilnClipboard, SessionsNestAndBadFormatsAreRefused) {
  TClipboard* C = Clipboard();
  C->SetAsText("old");
  C->Open();
  C->Open();
  EXPECT_TRUE(C->IsOpen());
  C->SetAsHandle(RegisterClipboardFormat("Inner"), Bytes("x"));
  C->Close();
  C->SetAsText("new");
  C->Close();
  EXPECT_FALSE(C->IsOpen());
  C->Close(); // without a session: nothing
  EXPECT_EQ(C->FormatCount(), 2);
  EXPECT_EQ(C->AsText(), "new");
  try {
    C->SetAsHandle(0x1234, Bytes("y"));
    FAIL();
  } catch (const EInvalidOperation& E) {
    EXPECT_STREQ(E.what(), "Clipboard format 4660 is not registered");
  }
  EXPECT_EQ(C->FormatCount(), 2);
  EXPECT_EQ(Clipboard(), C) << "one clipboard for the process";
}

} // namespace
