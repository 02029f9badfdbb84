//===- tests/platform/FixupsTest.cpp - Cross-root references, loading -----===//
#include "tests/platform/StreamingFixtures.h"

#include "platform/Lists.h"

#include <gtest/gtest.h>

#include <map>

using namespace formkit;
using namespace formkit::streamtest;

namespace {

/// The open roots of a test, found by name through a registered finder.
class TOpenRoots {
public:
  TOpenRoots() {
    FToken = RegisterFindGlobalComponentProc([this](const String& Name) -> TComponent* {
      auto It = FRoots.find(UpperCase(Name));
      return It == FRoots.end() ? nullptr : It->second;
    });
  }
  ~TOpenRoots() {
    UnregisterFindGlobalComponentProc(FToken);
    for (auto& [Name, Root] : FRoots) Root->Destroy();
  }
  /// Reads a root as the core does: inside a loading bracket, so that the references
  /// into the root being read resolve at the end of its read.
  TComponent* Open(const String& Text) {
    BeginGlobalLoading();
    TComponent* Root = nullptr;
    try {
      Root = ReadBytes(TextToBinary(Text));
      NotifyGlobalLoading();
    } catch (...) {
      EndGlobalLoading();
      throw;
    }
    EndGlobalLoading();
    FRoots[UpperCase(Root->Name())] = Root;
    return Root;
  }
  void Close(const String& Name) {
    FRoots.at(UpperCase(Name))->Destroy();
    FRoots.erase(UpperCase(Name));
  }

private:
  std::map<String, TComponent*> FRoots;
  int FToken;
};

std::vector<String> ReferenceNames(TComponent* Root) {
  std::vector<String> Names;
  GetFixupReferenceNames(Root, Names);
  return Names;
}

const char* const MainText = "object Main: TTestForm\n"
                             "  object Button1: TTestControl\n"
                             "    Buddy = Data.Source1\n"
                             "    Peer = Data\n"
                             "  end\n"
                             "  object Button2: TTestControl\n"
                             "    Buddy = Extra.Thing\n"
                             "  end\n"
                             "end\n";

} // namespace

TEST(Fixups, ACrossRootReferenceWaitsForItsRoot) {
  TOpenRoots Roots;
  TComponent* Main = Roots.Open(MainText);
  auto* B1 = static_cast<TTestControl*>(Main->FindComponent("Button1"));
  EXPECT_EQ(nullptr, B1->Buddy);
  EXPECT_EQ((std::vector<String>{"Data", "Extra"}), ReferenceNames(Main));
  TObjectGuard<TStringList> List(new TStringList);
  GetFixupReferenceNames(Main, List.Get());
  EXPECT_EQ(2, List->Count());
  EXPECT_EQ("Extra", List->Get(1));
  std::vector<String> Wanted;
  GetFixupInstanceNames(Main, "data", Wanted);
  EXPECT_EQ((std::vector<String>{"Source1"}), Wanted);

  // Loading the root resolves what points into it; the list shrinks.
  TComponent* Data = Roots.Open("object Data: TOtherForm\n  object Source1: TTicker\n  end\nend\n");
  EXPECT_EQ(Data->FindComponent("Source1"), B1->Buddy);
  EXPECT_EQ(Data, ReferencedComponent(B1->Peer));
  EXPECT_EQ((std::vector<String>{"Extra"}), ReferenceNames(Main));

  // A redirect to a root that exists resolves; the list ends empty.
  Roots.Open("object Other: TOtherForm\n  object Thing: TTicker\n  end\nend\n");
  RedirectFixupReferences(Main, "Extra", "Other");
  EXPECT_TRUE(ReferenceNames(Main).empty());
  EXPECT_EQ("Thing", static_cast<TTestControl*>(Main->FindComponent("Button2"))->Buddy->Name());
  B1->Peer = nullptr;
}

TEST(Fixups, RemovingAndDestroyingDropFixups) {
  TOpenRoots Roots;
  TComponent* Main = Roots.Open(MainText);
  RemoveFixupReferences(Main, "extra");
  EXPECT_EQ((std::vector<String>{"Data"}), ReferenceNames(Main));
  // A holder that goes takes its fixups along; so does its root.
  Main->FindComponent("Button1")->Destroy();
  EXPECT_TRUE(ReferenceNames(Main).empty());
  TComponent* Again = Roots.Open(String(MainText).replace(7, 4, "Mai2"));
  EXPECT_EQ(2u, ReferenceNames(Again).size());
  Roots.Close("Mai2");
  TComponent* Data = Roots.Open("object Data: TOtherForm\n  object Source1: TTicker\n  end\nend\n");
  GlobalFixupReferences(); // nothing left that could touch the freed root
  EXPECT_NE(nullptr, Data);
}

TEST(Fixups, NoFixupsGiveAnEmptyList) {
  TOpenRoots Roots;
  TComponent* Plain = Roots.Open("object Plain: TTestForm\nend\n");
  EXPECT_TRUE(ReferenceNames(Plain).empty());
  EXPECT_TRUE(ReferenceNames(nullptr).empty());
}

TEST(GlobalLoading, LoadedWaitsForTheNotificationAndBracketsNest) {
  RegisterStreamingClasses();
  const String Text = "object Loader: TTestForm\n  object Tick: TTicker\n  end\nend\n";
  EXPECT_FALSE(IsGlobalLoading());
  BeginGlobalLoading();
  TComponent* Outer = ReadBytes(TextToBinary(Text));
  auto* OuterTick = static_cast<TTicker*>(Outer->FindComponent("Tick"));
  EXPECT_EQ(0, OuterTick->LoadedCalls);
  EXPECT_TRUE(OuterTick->ComponentState().Contains(csLoading));
  EXPECT_EQ(Outer, FindGlobalComponent("loader")) << "roots of an open bracket are found by name";

  BeginGlobalLoading(); // a root loaded while another loads
  TComponent* Inner = ReadBytes(TextToBinary(Text));
  auto* InnerTick = static_cast<TTicker*>(Inner->FindComponent("Tick"));
  NotifyGlobalLoading();
  EndGlobalLoading();
  EXPECT_EQ(1, InnerTick->LoadedCalls);
  EXPECT_EQ(0, OuterTick->LoadedCalls);

  // A root freed inside the bracket is forgotten by it.
  TComponent* Doomed = ReadBytes(TextToBinary(Text));
  Doomed->Destroy();
  NotifyGlobalLoading();
  NotifyGlobalLoading(); // a second notification calls nobody twice
  EndGlobalLoading();
  EXPECT_EQ(1, OuterTick->LoadedCalls);
  EXPECT_EQ(1, static_cast<TTestControl*>(Outer)->LoadedCalls);
  EXPECT_FALSE(OuterTick->ComponentState().Contains(csLoading));
  EXPECT_FALSE(IsGlobalLoading());
  Outer->Destroy();
  Inner->Destroy();
}

TEST(GlobalLoading, WithoutABracketLoadedRunsAtOnce) {
  RegisterStreamingClasses();
  TComponent* Root = ReadBytes(TextToBinary("object Solo: TTestForm\n  object Tick: TTicker\n  end\nend\n"));
  EXPECT_EQ(1, static_cast<TTicker*>(Root->FindComponent("Tick"))->LoadedCalls);
  Root->Destroy();
}
