//===- tests/platform/ReaderWriterTest.cpp - Reader, writer, hooks --------===//
#include "tests/platform/StreamingFixtures.h"

#include <gtest/gtest.h>

#include <cstring>

using namespace formkit;
using namespace formkit::streamtest;

namespace {

template <class T> struct TFree {
  T* P;
  ~TFree() {
    if (P) P->Destroy();
  }
  T* operator->() const { return P; }
};

TTestControl* Ctl(TComponent* Root, const char* Name) { return static_cast<TTestControl*>(Root->FindComponent(Name)); }

/// The names that stand in the text form behind a keyword ("inherited Panel1: ...").
std::vector<String> HeadsWith(const String& Text, const String& Keyword) {
  std::vector<String> Out;
  std::size_t Pos = 0;
  String Key = Keyword + " ";
  while ((Pos = Text.find(Key, Pos)) != String::npos) {
    if (Pos == 0 || Text[Pos - 1] == ' ') {
      std::size_t Start = Pos + Key.size();
      Out.push_back(Text.substr(Start, Text.find(':', Start) - Start));
    }
    Pos += Key.size();
  }
  return Out;
}

} // namespace

//===----------------------------------------------------------------------===//
// Round trips
//===----------------------------------------------------------------------===//

TEST(ReaderWriter, RichTreeRoundTripsThroughBinary) {
  TFree<TTestForm> Form{BuildRichForm()};
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  ASSERT_GE(Bytes.size(), 4u);
  EXPECT_EQ(0, std::memcmp(Bytes.data(), "KDS1", 4));
  TFree<TComponent> Copy{ReadBytes(Bytes)};
  EXPECT_EQ("Form1", Copy->Name());
  auto* F = static_cast<TTestForm*>(Copy.P);
  EXPECT_EQ(Form->Caption, F->Caption);
  EXPECT_EQ(640, F->Width);
  EXPECT_EQ(5000000000LL, F->Big);
  EXPECT_EQ(1.25, F->Ratio);
  EXPECT_EQ(0.5f, F->Scale);
  EXPECT_EQ((TTones{toLow, toHigh}), F->Tones);
  EXPECT_EQ(12, F->Look->Size);
  EXPECT_EQ("Sans", F->Look->Face);
  EXPECT_EQ((std::vector<std::uint8_t>{0x00, 0x01, 0xFE, 0xFF}), F->Blob);
  EXPECT_EQ(TVariant(std::int64_t(7)), F->Value);
  EXPECT_EQ(F, F->Buddy);
  TTestControl* Panel = Ctl(F, "Panel1");
  ASSERT_NE(nullptr, Panel);
  EXPECT_EQ(F, Panel->FParent);
  EXPECT_EQ(8, Panel->Left);
  EXPECT_EQ(-4, Panel->Top);
  EXPECT_EQ(toHigh, Panel->Tone);
  EXPECT_FALSE(Panel->Enabled);
  EXPECT_EQ(u"h\u00e9", Panel->Hint);
  TTestControl* B1 = Ctl(F, "Button1");
  TTestControl* B2 = Ctl(F, "Button2");
  ASSERT_TRUE(B1 && B2);
  EXPECT_EQ(Panel, B1->FParent);
  EXPECT_EQ((std::vector<TTestControl*>{B1, B2}), Panel->FControls);
  EXPECT_EQ(String(300, 'x'), B1->Caption);
  EXPECT_EQ(-7, B1->Small);
  EXPECT_EQ('z', B1->Letter);
  EXPECT_EQ(u'\u20ac', B1->Key);
  EXPECT_TRUE(B1->Value.IsNull());
  EXPECT_EQ(B2, B1->Buddy) << "a forward reference is fixed up";
  EXPECT_EQ(TVariant("text"), B2->Value);
  EXPECT_EQ(Panel, ReferencedComponent(B2->Peer));
  ASSERT_TRUE(B1->OnPoke.IsAssigned());
  EXPECT_EQ(static_cast<TObject*>(F), static_cast<TObject*>(B1->OnPoke.Method().Data));
  B1->OnPoke(B1);
  EXPECT_EQ(1, F->Pokes);
  auto* Ticker = static_cast<TTicker*>(F->FindComponent("Ticker1"));
  ASSERT_NE(nullptr, Ticker);
  EXPECT_EQ(250, Ticker->Interval);
  EXPECT_EQ((16 << 16) | 40, Ticker->DesignInfo());
  EXPECT_EQ(1, Ticker->LoadedCalls);
  EXPECT_FALSE(Ticker->ComponentState().Contains(csLoading));
  ASSERT_EQ(2, F->Rows->Count());
  auto* R1 = static_cast<TRow*>(F->Rows->Items(0));
  EXPECT_EQ("first", R1->Caption);
  EXPECT_EQ(30, R1->Width);
  EXPECT_EQ(Ticker, R1->Link);
  EXPECT_EQ("second", static_cast<TRow*>(F->Rows->Items(1))->Caption);
  // Writing the copy gives the same bytes: nothing was lost or added.
  EXPECT_EQ(Bytes, WriteBytes(Copy.P));
}

TEST(ReaderWriter, WritingTwiceGivesTheSameBytes) {
  TFree<TTestForm> Form{BuildRichForm()};
  EXPECT_EQ(WriteBytes(Form.P), WriteBytes(Form.P));
}

TEST(ReaderWriter, DefaultValuesAreNotWritten) {
  RegisterStreamingClasses();
  TFree<TComponent> Form{CreateComponent(TTestForm::StaticClass(), nullptr)};
  Form->SetName("Form1");
  EXPECT_EQ("object Form1: TTestForm\nend\n", BinaryToText(WriteBytes(Form.P)));
}

TEST(ReaderWriter, ResourceHeaderPrecedesTheSignature) {
  TFree<TTestForm> Form{BuildRichForm()};
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  std::int64_t Fixup = 0;
  S->WriteResourceHeader(Form->ClassName(), Fixup);
  std::int64_t DataStart = S->Position();
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 4096));
    W->WriteDescendent(Form.P, nullptr);
  }
  S->FixupResourceHeader(Fixup);
  S->SetPosition(0);
  EXPECT_EQ("TTestForm", S->ReadResHeader());
  EXPECT_EQ(DataStart, S->Position());
  char Sig[4];
  S->ReadBuffer(Sig, 4);
  EXPECT_EQ(0, std::memcmp(Sig, "KDS1", 4));
}

//===----------------------------------------------------------------------===//
// Ancestors
//===----------------------------------------------------------------------===//

namespace {
/// A descendant as the core makes one: the ancestor's full image read into a new root.
TTestForm* MakeDescendant(TTestForm* Ancestor) {
  auto* D = static_cast<TTestForm*>(CreateComponent(TTestForm::StaticClass(), nullptr));
  D->SetName("Form2");
  ReadBytes(WriteBytes(Ancestor), D);
  return D;
}
} // namespace

TEST(ReaderWriter, DescendantWritesOnlyDifferencesWithInheritedFlags) {
  TFree<TTestForm> Anc{BuildRichForm()};
  TFree<TTestForm> Desc{MakeDescendant(Anc.P)};
  // Unchanged: only the root's head, every component inherited, no property.
  String Same = BinaryToText(WriteBytes(Desc.P, Anc.P));
  EXPECT_EQ("inherited Form2: TTestForm\n"
            "  inherited Panel1: TTestControl\n"
            "    inherited Button1: TTestControl\n"
            "    end\n"
            "    inherited Button2: TTestControl\n"
            "    end\n"
            "  end\n"
            "  inherited Ticker1: TTicker\n"
            "  end\n"
            "end\n",
            Same);
  // Edit: a changed property, a moved ticker, a new button first in the panel.
  Ctl(Desc.P, "Button2")->Caption = "changed";
  Desc->FindComponent("Ticker1")->SetDesignInfo((16 << 16) | 41);
  TTestControl* New = AddControl(Desc.P, Ctl(Desc.P, "Panel1"), "Button3");
  Ctl(Desc.P, "Panel1")->SetChildOrder(New, 0);
  std::vector<std::uint8_t> Diff = WriteBytes(Desc.P, Anc.P);
  String Text = BinaryToText(Diff);
  EXPECT_EQ((std::vector<String>{"Form2", "Panel1", "Button1", "Button2", "Ticker1"}), HeadsWith(Text, "inherited"));
  EXPECT_EQ((std::vector<String>{"Button3"}), HeadsWith(Text, "object"));
  EXPECT_NE(String::npos, Text.find("      Caption = \"changed\"\n"));
  EXPECT_NE(String::npos, Text.find("    Left = 41\n"));
  EXPECT_EQ(String::npos, Text.find("Top = 16")) << "the unchanged half of the position is not written";
  EXPECT_EQ(String::npos, Text.find("Width = 640")) << "a value equal to the ancestor's is not written";

  // Rebuild: the ancestor's image, then the difference.
  TFree<TTestForm> Rebuilt{MakeDescendant(Anc.P)};
  ReadBytes(Diff, Rebuilt.P);
  EXPECT_EQ(WriteBytes(Desc.P), WriteBytes(Rebuilt.P));
  EXPECT_EQ("Button3", Ctl(Rebuilt.P, "Panel1")->FControls.at(0)->Name());
  EXPECT_EQ(Diff, WriteBytes(Rebuilt.P, Anc.P));
}

TEST(ReaderWriter, ReorderedInheritedChildrenCarryTheirPosition) {
  TFree<TTestForm> Anc{BuildRichForm()};
  AddControl(Anc.P, Ctl(Anc.P, "Panel1"), "Button3");
  AddControl(Anc.P, Ctl(Anc.P, "Panel1"), "Button4");
  TFree<TTestForm> Desc{MakeDescendant(Anc.P)};
  TTestControl* Panel = Ctl(Desc.P, "Panel1");
  Panel->SetChildOrder(Ctl(Desc.P, "Button4"), 0); // 4 1 2 3
  Panel->SetChildOrder(Ctl(Desc.P, "Button2"), 1); // 4 2 1 3
  std::vector<std::uint8_t> Diff = WriteBytes(Desc.P, Anc.P);
  TFree<TTestForm> Rebuilt{MakeDescendant(Anc.P)};
  ReadBytes(Diff, Rebuilt.P);
  std::vector<String> Order;
  for (TTestControl* C : Ctl(Rebuilt.P, "Panel1")->FControls) Order.push_back(C->Name());
  EXPECT_EQ((std::vector<String>{"Button4", "Button2", "Button1", "Button3"}), Order);
}

TEST(ReaderWriter, CollectionsEqualComparesStreamedContent) {
  TFree<TTestForm> A{BuildRichForm()};
  TFree<TTestForm> B{MakeDescendant(A.P)};
  EXPECT_TRUE(CollectionsEqual(A->Rows, B->Rows, A.P, B.P)) << "references resolve against each owner";
  static_cast<TRow*>(B->Rows->Items(1))->Width = 5;
  EXPECT_FALSE(CollectionsEqual(A->Rows, B->Rows, A.P, B.P));
  EXPECT_FALSE(CollectionsEqual(A->Rows, nullptr, A.P, B.P));
  EXPECT_TRUE(CollectionsEqual(A->Rows, A->Rows, A.P, A.P));
}

TEST(ReaderWriter, IsDefaultPropertyValueFollowsTheWriter) {
  TFree<TTestForm> A{BuildRichForm()};
  TFree<TTestForm> B{MakeDescendant(A.P)};
  PPropInfo Width = GetPropInfo(B.P, "Width");
  PPropInfo Tone = GetPropInfo(B.P, "Tone");
  EXPECT_FALSE(IsDefaultPropertyValue(B.P, Width)) << "640 is not the default 100";
  EXPECT_TRUE(IsDefaultPropertyValue(B.P, Tone));
  auto Lookup = [&](TPersistent*& Ancestor, TComponent*& Root, TComponent*& LookupRoot, TComponent*& RootAncestor) {
    Ancestor = A.P;
    Root = B.P;
    LookupRoot = B.P;
    RootAncestor = A.P;
  };
  EXPECT_TRUE(IsDefaultPropertyValue(B.P, Width, Lookup)) << "equal to the ancestor's";
  EXPECT_TRUE(IsDefaultPropertyValue(B.P, GetPropInfo(B.P, "Buddy"), Lookup)) << "the root itself on both sides";
  B->Width = 1;
  EXPECT_FALSE(IsDefaultPropertyValue(B.P, Width, Lookup));
}

//===----------------------------------------------------------------------===//
// Hooks
//===----------------------------------------------------------------------===//

namespace {

class THooks : public TObject {
  FK_CLASS(THooks, TObject)
  std::vector<String> Log;
  bool HandleErrors = true;
  TComponent* Substitute = nullptr;

  void FindMethod(TReader*, const String& Name, void*& Address, bool& Error) {
    Log.push_back("method " + Name);
    if (!Address) {
      Address = TTestControl::StaticClass()->MethodAddress("Poke");
      Error = false;
    }
  }
  void SetName(TReader*, TComponent*, String& Name) {
    Log.push_back("name " + Name);
    if (Name == "Button1") Name = "Renamed1";
  }
  void ReferenceName(TReader*, String& Name) {
    Log.push_back("reference " + Name);
    if (Name == "Button1") Name = "Renamed1";
  }
  void AncestorNotFound(TReader*, const String& Name, TClass Class, TComponent*& Component) {
    Log.push_back("ancestor " + Name + " " + Class->ClassName);
    Component = Substitute;
  }
  void Error(TReader*, const String& Message, bool& Handled) {
    Log.push_back("error " + Message);
    Handled = HandleErrors;
  }
  void FindClass(TReader*, const String& Name, TClass& Class) {
    Log.push_back("class " + Name);
    if (Name == "THidden") Class = THidden::StaticClass();
  }
  void Create(TReader* R, TClass Class, TComponent*& Component) {
    Log.push_back("create " + Class->ClassName);
    Component = CreateComponent(Class, R->Owner());
  }
};

FK_IMPLEMENT(THooks, "StreamTest") {}

void Hook(TReader* R, THooks* H) {
  R->OnFindMethod = TFindMethodEvent::Bind<&THooks::FindMethod>(H);
  R->OnSetName = TSetNameEvent::Bind<&THooks::SetName>(H);
  R->OnReferenceName = TReferenceNameEvent::Bind<&THooks::ReferenceName>(H);
  R->OnAncestorNotFound = TAncestorNotFoundEvent::Bind<&THooks::AncestorNotFound>(H);
  R->OnError = TReaderError::Bind<&THooks::Error>(H);
  R->OnFindComponentClass = TFindComponentClassEvent::Bind<&THooks::FindClass>(H);
  R->OnCreateComponent = TCreateComponentEvent::Bind<&THooks::Create>(H);
}

bool Logged(const THooks& H, const String& Entry) {
  return std::find(H.Log.begin(), H.Log.end(), Entry) != H.Log.end();
}

TComponent* ReadHooked(const String& Text, THooks* H, TComponent* Root = nullptr) {
  RegisterStreamingClasses();
  std::vector<std::uint8_t> Bytes = TextToBinary(Text);
  TObjectGuard<TBytesStream> S(new TBytesStream(Bytes));
  TObjectGuard<TReader> R(new TReader(S.Get(), 4096));
  Hook(R.Get(), H);
  bool Own = !Root;
  if (Own) Root = CreateComponent(TTestForm::StaticClass(), nullptr);
  try {
    R->ReadRootComponent(Root);
  } catch (...) {
    if (Own) Root->Destroy();
    throw;
  }
  return Root;
}

} // namespace

TEST(ReaderHooks, NamesMethodsReferencesClassesAndCreation) {
  THooks H;
  TFree<TComponent> Root{ReadHooked("object Form1: TTestForm\n"
                                    "  object Button1: TTestControl\n"
                                    "    OnPoke = Unknown\n"
                                    "  end\n"
                                    "  object Secret1: THidden\n"
                                    "    Buddy = Button1\n"
                                    "  end\n"
                                    "end\n",
                                    &H)};
  EXPECT_TRUE(Logged(H, "method Unknown"));
  EXPECT_TRUE(Logged(H, "name Button1"));
  EXPECT_TRUE(Logged(H, "class THidden"));
  EXPECT_TRUE(Logged(H, "create THidden"));
  EXPECT_TRUE(Logged(H, "reference Button1"));
  TComponent* Renamed = Root->FindComponent("Renamed1");
  ASSERT_NE(nullptr, Renamed) << "OnSetName changed the name";
  auto* Secret = dynamic_cast<THidden*>(Root->FindComponent("Secret1"));
  ASSERT_NE(nullptr, Secret) << "OnFindComponentClass supplied the class";
  EXPECT_EQ(Renamed, Secret->Buddy) << "OnReferenceName followed the rename";
  EXPECT_TRUE(static_cast<TTestControl*>(Renamed)->OnPoke.IsAssigned());
}

TEST(ReaderHooks, AncestorNotFoundSuppliesOrRefuses) {
  RegisterStreamingClasses();
  const String Text = "inherited Form1: TTestForm\n"
                      "  inherited Gone: TTestControl\n"
                      "    Width = 7\n"
                      "  end\n"
                      "end\n";
  THooks H;
  TFree<TComponent> Root{CreateComponent(TTestForm::StaticClass(), nullptr)};
  H.Substitute = AddControl(Root.P, static_cast<TTestControl*>(Root.P), "Stand");
  ReadHooked(Text, &H, Root.P);
  EXPECT_TRUE(Logged(H, "ancestor Gone TTestControl"));
  EXPECT_EQ(7, static_cast<TTestControl*>(H.Substitute)->Width);

  THooks Refuse;
  Refuse.HandleErrors = false;
  TFree<TComponent> Root2{CreateComponent(TTestForm::StaticClass(), nullptr)};
  try {
    ReadHooked(Text, &Refuse, Root2.P);
    FAIL() << "a refused ancestor is a read error";
  } catch (const EReadError& E) {
    EXPECT_STREQ("Ancestor for 'Gone' not found", E.what());
  }
  EXPECT_TRUE(Logged(Refuse, "error Ancestor for 'Gone' not found"));
}

TEST(ReaderHooks, HandledErrorsSkipThePropertyOrComponentAndGoOn) {
  THooks H;
  TFree<TComponent> Root{ReadHooked("object Form1: TTestForm\n"
                                    "  Nonsense = 12\n"
                                    "  Width = 300\n"
                                    "  Tone = toNowhere\n"
                                    "  object Lost1: TNoSuchClass\n"
                                    "    Width = 1\n"
                                    "    object Inner: TTestControl\n"
                                    "    end\n"
                                    "  end\n"
                                    "  object Kept1: TTestControl\n"
                                    "    Width = 5\n"
                                    "  end\n"
                                    "end\n",
                                    &H)};
  EXPECT_EQ((std::vector<String>{"error Error reading Form1.Nonsense: Property Nonsense does not exist",
                                 "error Error reading Form1.Tone: Invalid property value",
                                 "class TNoSuchClass", "error Class TNoSuchClass not found"}),
            std::vector<String>(H.Log.begin(), H.Log.begin() + 4));
  EXPECT_EQ(300, static_cast<TTestControl*>(Root.P)->Width);
  EXPECT_EQ(toMid, static_cast<TTestControl*>(Root.P)->Tone);
  EXPECT_EQ(nullptr, Root->FindComponent("Lost1"));
  EXPECT_EQ(nullptr, Root->FindComponent("Inner"));
  ASSERT_NE(nullptr, Root->FindComponent("Kept1"));
  EXPECT_EQ(5, Ctl(Root.P, "Kept1")->Width);
}

TEST(ReaderHooks, AComponentThatFailsHalfwayLeavesNothingBehind) {
  THooks H;
  TFree<TComponent> Root{ReadHooked("object Form1: TTestForm\n"
                                    "  object Panel1: TTestControl\n"
                                    "    object Child1: TTestControl\n"
                                    "      Buddy = Panel1\n"
                                    "    end\n"
                                    "    object Child1: TTestControl\n"
                                    "    end\n"
                                    "  end\n"
                                    "end\n",
                                    &H)};
  // The duplicate name fails inside Panel1; OnError skips only the duplicate.
  EXPECT_TRUE(Logged(H, "error A component named Child1 already exists"));
  ASSERT_NE(nullptr, Root->FindComponent("Child1"));
  EXPECT_EQ(Root->FindComponent("Panel1"), Ctl(Root.P, "Child1")->Buddy);
  EXPECT_EQ(2, Root->ComponentCount());
}

TEST(ReaderHooks, AnUnhandledErrorRaisesAndFreesWhatWasCreated) {
  THooks H;
  H.HandleErrors = false;
  RegisterStreamingClasses();
  TFree<TComponent> Root{CreateComponent(TTestForm::StaticClass(), nullptr)};
  try {
    ReadHooked("object Form1: TTestForm\n"
               "  object Panel1: TTestControl\n"
               "    object Child1: TTestControl\n"
               "      Width = \"wide\"\n"
               "    end\n"
               "  end\n"
               "end\n",
               &H, Root.P);
    FAIL();
  } catch (const EReadError& E) {
    EXPECT_STREQ("Error reading Child1.Width: Invalid property value", E.what());
  }
  EXPECT_EQ(1u, H.Log.size() - std::count_if(H.Log.begin(), H.Log.end(),
                                             [](const String& S) { return S.rfind("error", 0) != 0; }))
      << "the error is offered once";
  EXPECT_EQ(0, Root->ComponentCount());
  EXPECT_FALSE(Root->ComponentState().Contains(csLoading));
}

//===----------------------------------------------------------------------===//
// Selection streams
//===----------------------------------------------------------------------===//

TEST(ReaderWriter, ComponentsWithARectangleReadIntoALiveRoot) {
  TFree<TTestForm> Source{BuildRichForm()};
  TObjectGuard<TMemoryStream> S(new TMemoryStream);
  {
    TObjectGuard<TWriter> W(new TWriter(S.Get(), 1024));
    W->SetRoot(Source.P);
    for (int V : {1, 2, 300, 70000}) W->WriteInteger(V);
    for (const char* Name : {"Button1", "Button2"}) {
      W->WriteSignature();
      W->WriteComponent(Source->FindComponent(Name));
    }
    W->WriteListEnd();
    const char Tail[] = "method text";
    W->Write(Tail, sizeof Tail);
  }
  S->SetPosition(0);
  RegisterStreamingClasses();
  TFree<TComponent> Target{CreateComponent(TTestForm::StaticClass(), nullptr)};
  Target->SetName("Target");
  TObjectGuard<TReader> R(new TReader(S.Get(), 1024));
  EXPECT_EQ(vaInt8, R->NextValue());
  EXPECT_EQ(0, R->Position());
  int Rect[4];
  for (int& V : Rect) V = R->ReadInteger();
  EXPECT_EQ(70000, Rect[3]);
  EXPECT_EQ(2 + 2 + 3 + 5, R->Position());
  EXPECT_EQ(0, std::memcmp(S->Memory() + R->Position(), "KDS1", 4));
  std::vector<String> Read;
  R->ReadComponents(Target.P, nullptr, [&](TComponent* C) { Read.push_back(C->Name()); });
  EXPECT_EQ((std::vector<String>{"Button1", "Button2"}), Read);
  EXPECT_EQ(Target->FindComponent("Button2"), Ctl(Target.P, "Button1")->Buddy);
  std::int64_t Rest = S->Size() - R->Position();
  EXPECT_EQ(12, Rest);
  R.Release()->Destroy();
  EXPECT_EQ(S->Size() - 12, S->Position()) << "the stream stands after what the reader consumed";
}

//===----------------------------------------------------------------------===//
// Bad input
//===----------------------------------------------------------------------===//

namespace {
String ReadError(const std::vector<std::uint8_t>& Bytes) {
  try {
    TFree<TComponent> Root{ReadBytes(Bytes)};
  } catch (const EReadError& E) {
    return E.Message();
  }
  return "<no error>";
}
} // namespace

TEST(ReaderBadInput, EveryTruncationRaisesAReadError) {
  TFree<TTestForm> Form{BuildRichForm()};
  std::vector<std::uint8_t> Bytes = WriteBytes(Form.P);
  for (std::size_t N = 0; N < Bytes.size(); ++N) {
    std::vector<std::uint8_t> Cut(Bytes.begin(), Bytes.begin() + static_cast<std::ptrdiff_t>(N));
    EXPECT_NE("<no error>", ReadError(Cut)) << N;
  }
  EXPECT_EQ("Stream read error", ReadError({'K', 'D', 'S', '1', 0xF0, 9, 'T'}));
}

TEST(ReaderBadInput, ClearMessagesForMalformedData) {
  auto Data = [](std::initializer_list<std::uint8_t> Tail) {
    std::vector<std::uint8_t> B{'K', 'D', 'S', '1', 0xF0, 9, 'T', 'T', 'e', 's', 't', 'F', 'o', 'r', 'm', 1, 'F'};
    B.insert(B.end(), Tail);
    return B;
  };
  EXPECT_EQ("Invalid stream format", ReadError({'K', 'D', 'S', '2', 0xF0}));
  EXPECT_EQ("Invalid stream format", ReadError({'K', 'D', 'S', '1', 0x07}));
  EXPECT_EQ("Error reading F.Width: Unknown value tag 200", ReadError(Data({5, 'W', 'i', 'd', 't', 'h', 200, 0, 0})));
  EXPECT_EQ("Error reading F.Caption: Length 4294967295 runs past the end of the stream",
            ReadError(Data({7, 'C', 'a', 'p', 't', 'i', 'o', 'n', vaLString, 0xFF, 0xFF, 0xFF, 0xFF, 0, 0})));
  EXPECT_EQ("Error reading F.Nope: Property Nope does not exist", ReadError(Data({4, 'N', 'o', 'p', 'e', vaInt8, 1, 0, 0})));
  EXPECT_EQ("Class TGhost not found", ReadError(Data({0, 0xF0, 6, 'T', 'G', 'h', 'o', 's', 't', 0, 0, 0, 0})));
  EXPECT_EQ("Error reading F.Width: Invalid property value", ReadError(Data({5, 'W', 'i', 'd', 't', 'h', vaString, 1, 'x', 0, 0})));
  // Nesting beyond the limit is refused, not recursed into.
  std::vector<std::uint8_t> Deep = Data({0});
  for (int I = 0; I < 300; ++I) Deep.insert(Deep.end(), {0xF0, 12, 'T', 'T', 'e', 's', 't', 'C', 'o', 'n', 't', 'r', 'o', 'l', 0, 0});
  EXPECT_EQ("Stream nesting too deep", ReadError(Deep));
}
