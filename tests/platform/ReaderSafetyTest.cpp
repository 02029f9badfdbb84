//===- tests/platform/ReaderSafetyTest.cpp - What a read may free --------===//
//
// Reads whose pending references would write into objects that are gone by
// the time they resolve, failed reads that must free exactly what they made,
// and interface references to components that outlive them.
//
//===----------------------------------------------------------------------===//
#include "tests/platform/StreamingFixtures.h"

#include <gtest/gtest.h>

#include <cstring>
#include <limits>
#include <map>

using namespace formkit;
using namespace formkit::streamtest;

namespace {

TTestControl* Ctl(TComponent* Root, const char* Name) { return static_cast<TTestControl*>(Root->FindComponent(Name)); }

/// Finds open roots by name for the global fix-ups.
class TRootFinder {
public:
  TRootFinder() {
    FToken = RegisterFindGlobalComponentProc([this](const String& Name) -> TComponent* {
      auto It = Roots.find(UpperCase(Name));
      return It == Roots.end() ? nullptr : It->second;
    });
  }
  ~TRootFinder() { UnregisterFindGlobalComponentProc(FToken); }
  TRootFinder(const TRootFinder&) = delete;
  TRootFinder& operator=(const TRootFinder&) = delete;
  std::map<String, TComponent*> Roots;

private:
  int FToken;
};

} // namespace

TEST(ReaderSafety, AReferenceIntoACollectionReadTwiceIsDroppedWithItsItem) {
  // The first Rows holds an item with a pending reference; the second Rows clears the
  // collection and frees that item before references resolve.
  TObjectGuard<TComponent> Root(ReadBytes(TextToBinary("object Form1: TTestForm\n"
                                                       "  object Button1: TTestControl\n"
                                                       "    Rows = <\n"
                                                       "      item\n"
                                                       "        Link = Button2\n"
                                                       "      end\n"
                                                       "    >\n"
                                                       "    Rows = <\n"
                                                       "      item\n"
                                                       "        Caption = \"second\"\n"
                                                       "      end\n"
                                                       "    >\n"
                                                       "  end\n"
                                                       "  object Button2: TTestControl\n"
                                                       "  end\n"
                                                       "end\n")));
  TOwnedCollection* Rows = Ctl(Root.Get(), "Button1")->Rows;
  ASSERT_EQ(1, Rows->Count());
  auto* Row = static_cast<TRow*>(Rows->Items(0));
  EXPECT_EQ("second", Row->Caption);
  EXPECT_EQ(nullptr, Row->Link);
}

TEST(ReaderSafety, AGlobalReferenceDiesWithTheItemThatHeldIt) {
  TRootFinder Finder;
  TObjectGuard<TComponent> Main(ReadBytes(TextToBinary("object Main: TTestForm\n"
                                                       "  object Button1: TTestControl\n"
                                                       "    Rows = <\n"
                                                       "      item\n"
                                                       "        Link = Data.Source1\n"
                                                       "      end\n"
                                                       "      item\n"
                                                       "        Link = Data.Source1\n"
                                                       "      end\n"
                                                       "    >\n"
                                                       "  end\n"
                                                       "end\n")));
  std::vector<String> Names;
  GetFixupReferenceNames(Main.Get(), Names);
  EXPECT_EQ(std::vector<String>{"Data"}, Names);
  // The first item goes while Data is not open; opening Data later resolves only the other.
  TOwnedCollection* Rows = Ctl(Main.Get(), "Button1")->Rows;
  Rows->Delete(0);
  TObjectGuard<TComponent> Data(ReadBytes(TextToBinary("object Data: TOtherForm\n"
                                                       "  object Source1: TTicker\n"
                                                       "  end\n"
                                                       "end\n")));
  Finder.Roots["DATA"] = Data.Get();
  GlobalFixupReferences();
  ASSERT_EQ(1, Rows->Count());
  EXPECT_EQ(Data->FindComponent("Source1"), static_cast<TRow*>(Rows->Items(0))->Link);
  Names.clear();
  GetFixupReferenceNames(Main.Get(), Names);
  EXPECT_TRUE(Names.empty());
}

TEST(ReaderSafety, ManyPendingGlobalReferencesFreeWithTheirHolders) {
  // Holders freed one by one, then the module: every fix-up is forgotten exactly once.
  TRootFinder Finder;
  String Text = "object Main: TTestForm\n";
  for (int I = 0; I < 300; ++I)
    Text += "  object B" + std::to_string(I) + ": TTestControl\n    Buddy = Far.Thing" + std::to_string(I) + "\n  end\n";
  Text += "end\n";
  TComponent* Main = ReadBytes(TextToBinary(Text));
  for (int I = 0; I < 300; I += 2) Main->FindComponent("B" + std::to_string(I))->Destroy();
  std::vector<String> Instances;
  GetFixupInstanceNames(Main, "Far", Instances);
  EXPECT_EQ(150u, Instances.size());
  EXPECT_EQ("Thing1", Instances.front());
  Main->Destroy();
  TObjectGuard<TComponent> Far(ReadBytes(TextToBinary("object Far: TOtherForm\n  object Thing1: TTicker\n  end\nend\n")));
  Finder.Roots["FAR"] = Far.Get();
  GlobalFixupReferences(); // nothing left that could write into the freed module
  std::vector<String> Names;
  GetFixupReferenceNames(Main, Names);
  EXPECT_TRUE(Names.empty());
}

//===----------------------------------------------------------------------===//
// Interface references to components
//===----------------------------------------------------------------------===//

TEST(ComponentReferences, AWrapperOutlivesItsComponentSafely) {
  TObjectGuard<TComponent> Owner(CreateComponent(TComponent::StaticClass(), nullptr));
  auto* Holder = static_cast<TTestControl*>(CreateComponent(TTestControl::StaticClass(), Owner.Get()));
  TComponent* Target = CreateComponent(TTicker::StaticClass(), Owner.Get());
  Holder->Peer = ComponentReference(Target);
  EXPECT_EQ(Target, ReferencedComponent(Holder->Peer));
  // One wrapper a component: asking twice gives the same one.
  EXPECT_EQ(ComponentReference(Target).Get(), QueryAs<IComponentReferenceSource>(Holder->Peer).Get());
  EXPECT_EQ(0, Target->InterfaceTally());
  Target->Destroy();
  EXPECT_EQ(nullptr, ReferencedComponent(Holder->Peer));
  EXPECT_EQ(nullptr, ComponentReference(nullptr));
  // A counted object that is not a wrapper names no component.
  EXPECT_EQ(nullptr, ReferencedComponent(IPtr<IInterface>(New<TInterfacedObject>())));
}

TEST(ComponentReferences, APlainReferenceThatOutlivesItsComponentIsReportedAndSafe) {
  std::vector<std::pair<String, int>> Reports;
  auto Saved = DanglingComponentReferenceHook;
  DanglingComponentReferenceHook = [&](const String& Name, int Count) { Reports.emplace_back(Name, Count); };
  auto* C = CreateComponent(TTicker::StaticClass(), nullptr);
  IPtr<IInterface> Held(static_cast<IInterface*>(C));
  IPtr<IInterface> Second = Held;
  C->Destroy();
  DanglingComponentReferenceHook = Saved;
  ASSERT_EQ(1u, Reports.size());
  EXPECT_EQ((std::pair<String, int>{"TTicker", 2}), Reports[0]);
  // The memory stays until the last plain reference goes: the releases are safe.
  Held = nullptr;
  Second = nullptr;
}

//===----------------------------------------------------------------------===//
// Descendants
//===----------------------------------------------------------------------===//

TEST(ReaderSafety, AnInheritedComponentMovedToAnotherParentStaysInheritedAndReopens) {
  TObjectGuard<TTestForm> Ancestor(BuildRichForm());
  std::vector<std::uint8_t> AncestorBytes = WriteBytes(Ancestor.Get());
  TObjectGuard<TComponent> Form(ReadBytes(AncestorBytes));
  // Button2 leaves Panel1 for the form itself.
  auto* Button2 = Ctl(Form.Get(), "Button2");
  Button2->SetParentComponent(Form.Get());
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.Get(), Ancestor.Get());
  String Text = BinaryToText(Bytes);
  EXPECT_NE(String::npos, Text.find("  inherited Button2: TTestControl"));
  EXPECT_EQ(String::npos, Text.find("object Button2"));
  // Read over a fresh copy of the ancestor, as a descendant opens: the same tree again.
  TObjectGuard<TComponent> Again(ReadBytes(Bytes, ReadBytes(AncestorBytes)));
  EXPECT_EQ(Again.Get(), Ctl(Again.Get(), "Button2")->FParent);
  EXPECT_EQ(Bytes, WriteBytes(Again.Get(), Ancestor.Get()));
}

TEST(ReaderSafety, ANewNestedRootInADescendantInheritsNothingFromTheOuterAncestor) {
  TObjectGuard<TTestForm> Ancestor(BuildRichForm()); // has Button1 under Panel1
  std::vector<std::uint8_t> AncestorBytes = WriteBytes(Ancestor.Get());
  TObjectGuard<TComponent> Form(ReadBytes(TextToBinary("inherited Form1: TTestForm\n"
                                                       "  inline Frame2: TOtherForm\n"
                                                       "    object Button1: TTestControl\n"
                                                       "    end\n"
                                                       "  end\n"
                                                       "end\n"),
                                          ReadBytes(AncestorBytes)));
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.Get(), Ancestor.Get());
  EXPECT_NE(String::npos, BinaryToText(Bytes).find("    object Button1: TTestControl"));
  TObjectGuard<TComponent> Again(ReadBytes(Bytes, ReadBytes(AncestorBytes)));
  EXPECT_EQ(Bytes, WriteBytes(Again.Get(), Ancestor.Get()));
}

//===----------------------------------------------------------------------===//
// Values and names that would not read back
//===----------------------------------------------------------------------===//

TEST(ReaderSafety, ACharacterAbove127ReadsWritesAndReadsBack) {
  TObjectGuard<TComponent> Form(ReadBytes(TextToBinary("object Form1: TTestForm\n  Letter = 212\nend\n")));
  auto* Root = static_cast<TTestForm*>(Form.Get());
  EXPECT_EQ(212, static_cast<unsigned char>(Root->Letter));
  EXPECT_EQ(212, GetOrdProp(Root, Root->ClassType()->FindProperty("Letter")));
  TObjectGuard<TComponent> Again(ReadBytes(WriteBytes(Root)));
  EXPECT_EQ(Root->Letter, static_cast<TTestForm*>(Again.Get())->Letter);
}

TEST(ReaderSafety, ANumberNoFormFileCanHoldIsRefusedBothWays) {
  // Ratio read as not-a-number: an invalid value, whatever the bits.
  std::vector<std::uint8_t> Bytes = {'K', 'D', 'S', '1', 0xF0, 9, 'T', 'T', 'e', 's', 't', 'F', 'o', 'r', 'm', 5,
                                     'F', 'o', 'r', 'm', '1', 5, 'R', 'a', 't', 'i', 'o', vaDouble,
                                     0, 0, 0, 0, 0, 0, 0xF8, 0x7F, 0, 0};
  try {
    TObjectGuard<TComponent> Form(ReadBytes(Bytes));
    FAIL() << "a NaN was read";
  } catch (const EReadError& E) {
    EXPECT_STREQ("Error reading Form1.Ratio: Invalid property value", E.what());
  }
  // A number too large for a narrower property is refused too, and the value stays.
  std::vector<std::uint8_t> Large = {'K', 'D', 'S', '1', 0xF0, 9, 'T', 'T', 'e', 's', 't', 'F', 'o', 'r', 'm', 5,
                                     'F', 'o', 'r', 'm', '1', 5, 'S', 'c', 'a', 'l', 'e', vaDouble};
  // The double's eight bytes, then the ends of the property list and of the children.
  std::size_t At = Large.size();
  Large.resize(At + 8 + 2, 0);
  double Huge = 1e300;
  std::memcpy(Large.data() + At, &Huge, sizeof Huge);
  TObjectGuard<TComponent> Target(CreateComponent(TTestForm::StaticClass(), nullptr));
  static_cast<TTestForm*>(Target.Get())->Scale = 0.5f;
  EXPECT_THROW(ReadBytes(Large, Target.Get()), EReadError);
  EXPECT_EQ(0.5f, static_cast<TTestForm*>(Target.Get())->Scale);
  // Set by a program, it is not written: the save fails instead of writing what would not reopen.
  TObjectGuard<TTestForm> Form(static_cast<TTestForm*>(CreateComponent(TTestForm::StaticClass(), nullptr)));
  Form->Ratio = std::numeric_limits<double>::infinity();
  try {
    WriteBytes(Form.Get());
    FAIL() << "an infinity was written";
  } catch (const EWriteError& E) {
    EXPECT_STREQ("Invalid floating point value to write", E.what());
  }
}

TEST(ReaderSafety, AComponentMayNotBearItsOwnersNameNorTheOwnerOneOfItsComponents) {
  TObjectGuard<TTestForm> Form(static_cast<TTestForm*>(CreateComponent(TTestForm::StaticClass(), nullptr)));
  Form->SetName("Form1");
  TTestControl* Button = AddControl(Form.Get(), Form.Get(), "Button1");
  try {
    Button->SetName("FORM1");
    FAIL();
  } catch (const EComponentError& E) {
    EXPECT_STREQ("A component named FORM1 already exists", E.what());
  }
  try {
    Form->SetName("button1");
    FAIL();
  } catch (const EComponentError& E) {
    EXPECT_STREQ("A component named button1 already exists", E.what());
  }
  EXPECT_EQ("Button1", Button->Name());
  EXPECT_EQ("Form1", Form->Name());
  // Pasted under that name, the component is refused, so a reference to the form stays one.
  std::vector<std::uint8_t> Pasted = TextToBinary("object ForM1: TTestControl\nend\n");
  Pasted.push_back(vaNull); // the end of the list of components
  TObjectGuard<TBytesStream> In(new TBytesStream(Pasted));
  TObjectGuard<TReader> R(new TReader(In.Get(), 1024));
  try {
    R->ReadComponents(Form.Get(), Form.Get(), nullptr);
    FAIL() << "a component took its owner's name";
  } catch (const EReadError& E) {
    EXPECT_STREQ("A component named ForM1 already exists", E.what());
  }
  EXPECT_EQ(1, Form->ComponentCount());
}
