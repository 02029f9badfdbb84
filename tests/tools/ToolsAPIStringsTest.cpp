//===- tests/tools/ToolsAPIStringsTest.cpp - String list adapter ---------===//
//
// `TOTAStringsAdapter` forwards to its list, assigns from another adapter
// wholesale and from any other string list line by line, and frees its list
// only when it owns it.
//
//===----------------------------------------------------------------------===//
#include "tools/ToolsAPI.h"

#include "platform/Lists.h"

#include <gtest/gtest.h>

#include <utility>
#include <vector>

using namespace formkit;

namespace {

/// A string list that says when it goes.
class TWatchedList : public TStringList {
  FK_CLASS(TWatchedList, TStringList)
public:
  explicit TWatchedList(bool* Gone = nullptr) : FGone(Gone) {}
  void BeforeDestruction() override {
    if (FGone) *FGone = true;
    inherited::BeforeDestruction();
  }

private:
  bool* FGone;
};
FK_IMPLEMENT(TWatchedList, "ToolsAPIStringsTest") {}

/// A string list of the host's own that has no framework list behind it.
class THostStrings : public TInterfacedObject, public IOTAStrings {
  FK_CLASS(THostStrings, TInterfacedObject)
  FK_INTERFACES(IOTAStrings)

  std::vector<std::pair<String, TObject*>> Lines;

  int GetCount() override { return static_cast<int>(Lines.size()); }
  String GetItem(int Index) override { return Lines.at(Index).first; }
  void SetItem(int Index, const String& Value) override { Lines.at(Index).first = Value; }
  TObject* GetData(int Index) override { return Lines.at(Index).second; }
  void SetData(int Index, TObject* Value) override { Lines.at(Index).second = Value; }
  String GetName(int) override { return String(); }
  String GetValue(const String&) override { return String(); }
  void SetValue(const String&, const String&) override {}
  String GetValueFromIndex(int) override { return String(); }
  void SetValueFromIndex(int, const String&) override {}
  void Assign(const IPtr<IOTAStrings>&) override {}
};
FK_IMPLEMENT(THostStrings, "ToolsAPIStringsTest") {}

class TMarker : public TObject {};

/// An adapter that owns a new, empty list.
IPtr<TOTAStringsAdapter> NewOwningAdapter(TStrings** List = nullptr) {
  TStrings* Strings = new TStringList();
  if (List) *List = Strings;
  return New<TOTAStringsAdapter>(Strings, true);
}

TEST(ToolsAPIStrings, OperationsForwardToTheList) {
  TStringList* List = new TStringList();
  IPtr<IOTAStrings> Adapter = NewAs<IOTAStrings, TOTAStringsAdapter>(List, true);
  TMarker Mark;
  List->Add("Color=clRed");
  List->AddObject("Caption=Save", &Mark);
  List->Add("plain");

  EXPECT_EQ(Adapter->GetCount(), 3);
  EXPECT_EQ(Adapter->GetItem(1), "Caption=Save");
  EXPECT_EQ(Adapter->GetData(1), &Mark);
  EXPECT_EQ(Adapter->GetData(0), nullptr);
  EXPECT_EQ(Adapter->GetName(0), "Color");
  EXPECT_EQ(Adapter->GetName(2), "");
  EXPECT_EQ(Adapter->GetValue("caption"), "Save");
  EXPECT_EQ(Adapter->GetValueFromIndex(0), "clRed");

  Adapter->SetItem(2, "Width=75");
  Adapter->SetData(0, &Mark);
  Adapter->SetValue("Color", "clBlue");
  Adapter->SetValue("Height", "25");
  Adapter->SetValueFromIndex(1, "Open");
  EXPECT_EQ(List->Text(), "Color=clBlue\r\nCaption=Open\r\nWidth=75\r\nHeight=25\r\n");
  EXPECT_EQ(List->GetObject(0), &Mark);

  IPtr<INTAStrings> Native = QueryAs<INTAStrings>(Adapter);
  ASSERT_TRUE(Native);
  EXPECT_EQ(Native->GetStrings(), List);
  EXPECT_THROW(Adapter->GetItem(4), EStringListError);
}

TEST(ToolsAPIStrings, AssignFromAnAdapterTakesTheWholeList) {
  TMarker Mark;
  TStringList* Source = new TStringList();
  Source->NameValueSeparator = ':';
  Source->LineBreak = "\n";
  Source->AddObject("Left:8", &Mark);
  Source->Add("Top:16");
  IPtr<IOTAStrings> From = NewAs<IOTAStrings, TOTAStringsAdapter>(Source, true);

  TStrings* Target = nullptr;
  IPtr<TOTAStringsAdapter> To = NewOwningAdapter(&Target);
  Target->Add("old line");
  To->Assign(From);

  EXPECT_EQ(Target->Text(), "Left:8\nTop:16\n");
  EXPECT_EQ(Target->GetObject(0), &Mark);
  EXPECT_EQ(To->GetValue("Top"), "16"); // the separator came along

  // Assigning a list to itself, through another adapter on it, keeps it.
  To->Assign(NewAs<IOTAStrings, TOTAStringsAdapter>(Target, false));
  EXPECT_EQ(Target->Text(), "Left:8\nTop:16\n");
}

TEST(ToolsAPIStrings, AssignFromAPlainStringListCopiesLineByLineWithData) {
  TMarker First, Second;
  IPtr<THostStrings> Host = New<THostStrings>();
  Host->Lines = {{"Name=Button1", &First}, {"Caption=OK", nullptr}, {"Tag=3", &Second}};

  TStrings* Target = nullptr;
  IPtr<TOTAStringsAdapter> To = NewOwningAdapter(&Target);
  Target->NameValueSeparator = ':';
  Target->Add("old line");
  To->Assign(IPtr<IOTAStrings>(Host));

  ASSERT_EQ(Target->Count(), 3);
  EXPECT_EQ(Target->Get(0), "Name=Button1");
  EXPECT_EQ(Target->GetObject(0), &First);
  EXPECT_EQ(Target->GetObject(1), nullptr);
  EXPECT_EQ(Target->GetObject(2), &Second);
  EXPECT_EQ(Target->NameValueSeparator, ':'); // only the lines were copied
  EXPECT_EQ(Target->UpdateCount(), 0);

  To->Assign(nullptr);
  EXPECT_EQ(Target->Count(), 0);
}

TEST(ToolsAPIStrings, TheAdapterFreesItsListOnlyWhenItOwnsIt) {
  bool Gone = false;
  TWatchedList* List = new TWatchedList(&Gone);
  {
    IPtr<TOTAStringsAdapter> Adapter = New<TOTAStringsAdapter>(List, false);
    EXPECT_FALSE(Adapter->Owned());
    Adapter->SetValue("Kept", "yes");
  }
  EXPECT_FALSE(Gone);
  EXPECT_EQ(List->Values("Kept"), "yes");
  {
    IPtr<IOTAStrings> Adapter = NewAs<IOTAStrings, TOTAStringsAdapter>(List, true);
    EXPECT_FALSE(Gone);
  }
  EXPECT_TRUE(Gone);
}

} // namespace
