//===- tests/platform/ListsTest.cpp - String and pointer lists -----------===//
#include "platform/Lists.h"

#include <gtest/gtest.h>

using namespace formkit;

TEST(StringList, CommaTextQuotesWhatNeedsItAndParsesBack) {
  TStringList List;
  List.Add("plain");
  List.Add("with space");
  List.Add("say \"hi\"");
  List.Add("");
  List.Add("a,b");
  EXPECT_EQ(List.CommaText(), "plain,\"with space\",\"say \"\"hi\"\"\",\"\",\"a,b\"");
  TStringList Back;
  Back.SetCommaText(List.CommaText());
  EXPECT_TRUE(Back.Equals(&List));

  // Unquoted blanks separate; a trailing comma adds an empty line.
  Back.SetCommaText("  one two,three ,");
  EXPECT_EQ(Back.Count(), 4);
  EXPECT_EQ(Back[1], "two");
  EXPECT_EQ(Back[3], "");
  Back.Clear();
  Back.Add("");
  EXPECT_EQ(Back.CommaText(), "\"\"");
  Back.StrictDelimiter = true;
  Back.Delimiter = ';';
  Back.SetDelimitedText("a b;c");
  EXPECT_EQ(Back.Count(), 2);
  EXPECT_EQ(Back[0], "a b");
}

TEST(StringList, NamesAndValuesWithoutRegardToCase) {
  TStringList List;
  List.SetText("Left=10\r\nTop=20\nnovalue\rWidth=");
  EXPECT_EQ(List.Count(), 4);
  EXPECT_EQ(List.IndexOfName("TOP"), 1);
  EXPECT_EQ(List.IndexOfName("novalue"), -1);
  EXPECT_EQ(List.Values("left"), "10");
  EXPECT_EQ(List.Names(3), "Width");
  List.SetValues("Top", "25");
  EXPECT_EQ(List[1], "Top=25");
  List.SetValues("Height", "5");
  EXPECT_EQ(List[4], "Height=5");
  List.SetValues("left", "");
  EXPECT_EQ(List.IndexOfName("Left"), -1);
  EXPECT_EQ(List.Text(), "Top=25\r\nnovalue\r\nWidth=\r\nHeight=5\r\n");
  EXPECT_EQ(List.IndexOf("NOVALUE"), 1);
  List.Assign(&List); // assigning a list to itself keeps its lines
  EXPECT_EQ(List.Count(), 4);
}

TEST(StringList, SortedListsKeepOrderAndHandleDuplicates) {
  TStringList List;
  List.SetSorted(true);
  for (const char* S : {"pear", "Apple", "fig", "apple"}) List.Add(S);
  EXPECT_EQ(List.Count(), 3); // dupIgnore, compared without regard to case
  EXPECT_EQ(List.CommaText(), "Apple,fig,pear");
  int Index = -1;
  EXPECT_FALSE(List.Find("grape", Index));
  EXPECT_EQ(Index, 2);
  EXPECT_EQ(List.IndexOf("PEAR"), 2);
  try {
    List.Insert(0, "x");
    FAIL();
  } catch (const EStringListError& E) {
    EXPECT_EQ(E.Message(), "Operation not allowed on sorted list");
  }
  List.Duplicates = dupError;
  try {
    List.Add("FIG");
    FAIL();
  } catch (const EStringListError& E) {
    EXPECT_EQ(E.Message(), "String list does not allow duplicates");
  }
  List.SetCaseSensitive(true);
  List.Add("FIG");
  EXPECT_EQ(List.CommaText(), "Apple,FIG,fig,pear"); // by bytes, upper case first
  try {
    List.Get(9);
    FAIL();
  } catch (const EStringListError& E) {
    EXPECT_EQ(E.Message(), "List index out of bounds (9)");
  }
}

namespace {
struct ChangeCounter : TObject {
  int Changes = 0;
  void Changed(TObject*) { ++Changes; }
};
} // namespace

TEST(StringList, ChangeEventsAreBatchedByUpdatesAndOwnedObjectsFreed) {
  TStringList List;
  ChangeCounter Counter;
  List.OnChange = TNotifyEvent(TMethod{reinterpret_cast<void*>(+[](void* Self, TObject* Sender) {
                                         static_cast<ChangeCounter*>(static_cast<TObject*>(Self))->Changed(Sender);
                                       }),
                                       static_cast<TObject*>(&Counter)});
  List.Add("a");
  EXPECT_EQ(Counter.Changes, 1);
  List.BeginUpdate();
  List.Add("b");
  List.Add("c");
  List.EndUpdate();
  EXPECT_EQ(Counter.Changes, 2);
  List.OnChange.Clear();

  auto* Owning = new TStringList(true);
  Owning->AddObject("x", new TStringList);
  Owning->AddObject("y", new TStringList);
  Owning->Delete(0);
  Owning->Destroy(); // frees the remaining object; the sanitizer checks for leaks
}

TEST(PointerList, IndexErrorsAndMoves) {
  TList List;
  int A = 1, B = 2, C = 3;
  List.Add(&A);
  List.Add(&B);
  List.Insert(0, &C);
  EXPECT_EQ(List.IndexOf(&A), 1);
  List.Move(0, 2);
  EXPECT_EQ(List.Last(), &C);
  EXPECT_EQ(List.Remove(&A), 0);
  EXPECT_EQ(List.Remove(&A), -1);
  try {
    List.Get(2);
    FAIL();
  } catch (const EListError& E) {
    EXPECT_EQ(E.Message(), "List index out of bounds (2)");
  }
}

TEST(StringList, ExchangeAndMoveCarryEachLinesObject) {
  TStringList List;
  TStringList A, B, C; // stand-ins for the objects of the lines
  List.AddObject("a", &A);
  List.AddObject("b", &B);
  List.AddObject("c", &C);
  List.Exchange(0, 2);
  EXPECT_EQ(List.CommaText(), "c,b,a");
  EXPECT_EQ(List.GetObject(0), &C);
  EXPECT_EQ(List.GetObject(2), &A);
  List.Move(0, 1);
  EXPECT_EQ(List.CommaText(), "b,c,a");
  EXPECT_EQ(List.GetObject(1), &C);
  EXPECT_EQ(List.IndexOfObject(&A), 2);
  // A sorted list keeps its order: a line cannot be put in place.
  List.SetSorted(true);
  EXPECT_EQ(List.CommaText(), "a,b,c");
  EXPECT_EQ(List.GetObject(0), &A);
  EXPECT_THROW(List.Exchange(0, 1), EStringListError);
  EXPECT_EQ(List.CommaText(), "a,b,c");
}
