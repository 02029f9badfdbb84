//===- tests/frameworks/kiln/design/NamesTest.cpp - Names of components across modules ===//
#include "tests/frameworks/kiln/design/NamesFixture.h"

using namespace formkit;
using namespace formkit::fakes;

FK_IMPLEMENT(TRenameListener, "Tests") {}

namespace {

std::vector<String> NamesOf(TComponentRoot* Root, TClass Class) {
  TTypeData Wanted;
  Wanted.ClassRef = Class;
  std::vector<String> Names;
  Root->GetComponentNames(Class ? &Wanted : nullptr, [&](const String& N) { Names.push_back(N); });
  return Names;
}

} // namespace

//===----------------------------------------------------------------------===//
// Free names
//===----------------------------------------------------------------------===//

TEST_F(NamesFixture, AFreeNameCountsUpFromOnePerStem) {
  IPtr<IRoot> Form = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Form);
  EXPECT_EQ(Kiln->UniqueName("TButton"), "Button1");
  TButton* First = Add<TButton>(Form);
  EXPECT_EQ(First->Name(), "Button1");
  EXPECT_EQ(Kiln->UniqueName("TButton"), "Button2");
  EXPECT_EQ(Add<TButton>(Form, nullptr, 40)->Name(), "Button2");
  // Only a leading T goes, and only when more follows.
  EXPECT_EQ(Kiln->UniqueName("X"), "X1");
  EXPECT_EQ(Kiln->UniqueName("Table"), "able1");
  EXPECT_EQ(Kiln->UniqueName("T"), "T1");
  EXPECT_EQ(Kiln->UniqueName("tButton"), "tButton1");
  // The stem is at most 255 characters long.
  EXPECT_EQ(Kiln->UniqueName("T" + String(300, 'a')), String(255, 'a') + "1");
  // A gap in a stem's numbers is filled; another stem's names do not count.
  First->SetName("Label1");
  EXPECT_EQ(Kiln->UniqueName("TButton"), "Button1");
  EXPECT_EQ(Kiln->UniqueName("TLabel"), "Label2");
  // Names compare without regard to case.
  First->SetName("BUTTON1");
  EXPECT_EQ(Kiln->UniqueName("TButton"), "Button3");
}

TEST_F(NamesFixture, AFreeNameIsFreeInTheWholeFamily) {
  WithInheritance();
  IPtr<IRoot> Form1 = NewForm("Form1");
  Add<TButton>(Form1);
  IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
  ASSERT_EQ(Form2->GetRoot()->ClassType()->Parent, Form1->GetRoot()->ClassType());
  ASSERT_NE(Form2->GetRoot()->FindComponent("Button1"), nullptr); // inherited
  // The descendant's own component takes its name from the ancestor's family too.
  EXPECT_EQ(Add<TButton>(Form2, nullptr, 40)->Name(), "Button2");
  // The ancestor does not give away a name that only the descendant uses.
  EXPECT_EQ(KilnRoot(Form1)->UniqueName("TButton"), "Button3");
  EXPECT_EQ(KilnRoot(Form2)->UniqueName("TButton"), "Button3");
  EXPECT_EQ(Add<TButton>(Form1, nullptr, 80)->Name(), "Button3");
  // With the descendant gone, only the module itself counts.
  Form2->Close();
  EXPECT_EQ(KilnRoot(Form1)->UniqueName("TButton"), "Button2");
}

//===----------------------------------------------------------------------===//
// Refused renames
//===----------------------------------------------------------------------===//

TEST_F(NamesFixture, ARefusedRenameSaysWhyAndKeepsTheName) {
  WithInheritance();
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module1);
  TComponent* Form = Form1->GetRoot();
  TButton* Button = Add<TButton>(Form1);
  IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
  Add<TButton>(Form2, nullptr, 40); // Button2, only in the descendant
  TComponent* Inherited = Form2->GetRoot()->FindComponent("Button1");
  Log.Clear();

  // A name a descendant uses.
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Button->SetName("Button2"); }),
            "A component named Button2 already exists in a descendant module");
  // The reserved name, in any letter case.
  for (const char* Reserved : {"Owner", "OWNER", "owner"})
    EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Button->SetName(Reserved); }),
              "A component named " + String(Reserved) + " already exists in a descendant module");
  // What an ancestor introduced.
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Inherited->SetName("Other"); }),
            "Cannot rename component Button1, component was introduced in an ancestor form");
  // A root without a name, or named as one of its class's ancestors.
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->SetName(""); }), "Root component must have a name");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->SetName("Form"); }),
            "Cannot rename a module to the same name as one of its ancestors (TForm)");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->SetName("customform"); }),
            "Cannot rename a module to the same name as one of its ancestors (Tcustomform)");
  // The host refuses: its exception passes on.
  Module1->Refuse = {"RenameComponent", "ValidateComponentName"};
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Button->SetName("OkButton"); }),
            "The host refused RenameComponent");
  EXPECT_EQ(MessageOf<EComponentDesignerException>([&] { Form->SetName("MainForm"); }),
            "The host refused ValidateComponentName");

  // Nothing changed: names, the class, the descendant; nobody heard of a rename.
  EXPECT_EQ(Button->Name(), "Button1");
  EXPECT_EQ(Inherited->Name(), "Button1");
  EXPECT_EQ(Form->Name(), "Form1");
  EXPECT_EQ(Form->ClassName(), "TForm1");
  EXPECT_EQ(Log.Calls, (std::vector<String>{"RenameComponent(Button1,OkButton)", "ValidateComponentName(MainForm)"}));
}

TEST_F(NamesFixture, WhatDoesNotCountAsAClash) {
  WithInheritance();
  IPtr<IRoot> Form1 = NewForm("Form1");
  TButton* Button = Add<TButton>(Form1);
  NewDescendant("Form2", "Form1");
  Log.Clear();
  // Another letter case of its own name: the descendants' copies do not count.
  Button->SetName("BUTTON1");
  EXPECT_EQ(Button->Name(), "BUTTON1");
  // No name at all is allowed for a component, and reaches the host as such (then the
  // descendant's copy loses its name too).
  Log.Clear();
  Button->SetName("");
  EXPECT_EQ(Button->Name(), "");
  EXPECT_EQ(CallsOf({"RenameComponent", "ComponentRenamed"}),
            (std::vector<String>{"RenameComponent(BUTTON1,)", "ComponentRenamed(BUTTON1,)", "ComponentRenamed(BUTTON1,)"}));
}

//===----------------------------------------------------------------------===//
// Where a rename goes
//===----------------------------------------------------------------------===//

TEST_F(NamesFixture, ARenameGoesToTheHostTheDescendantsAndTheListenersInOrder) {
  WithInheritance();
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module1);
  TButton* Button = Add<TButton>(Form1);
  IPtr<IRoot> Form2 = NewDescendant("Form2", "Form1");
  IPtr<IRoot> Form3 = NewDescendant("Form3", "Form2");
  Log.Clear();

  EXPECT_TRUE(KilnRoot(Form1)->RenameComponent("Button1", "OkButton"));
  EXPECT_EQ(Button->Name(), "OkButton");
  EXPECT_EQ(Form2->GetRoot()->FindComponent("OkButton")->ComponentState().Contains(csAncestor), true);
  EXPECT_EQ(Form3->GetRoot()->FindComponent("OkButton")->ComponentState().Contains(csAncestor), true);
  // The host renames the field; the family follows before the module's form editor and
  // the listeners hear of it. A descendant does not ask its host: the field is the
  // ancestor's.
  EXPECT_EQ(CallsOf({"RenameComponent", "RenameDescendents", "FormEditor", "Ev.", "ComponentRenamed"}),
            (std::vector<String>{
                "RenameComponent(Button1,OkButton)",
                "RenameDescendents(Form1,Button1,OkButton)",
                "RenameDescendents(Form2,Button1,OkButton)",
                "RenameDescendents(Form3,Button1,OkButton)",
                "FormEditor.Renamed(Form3,Button1,OkButton)",
                "Ev.Renamed(Form3,Button1,OkButton)",
                "ComponentRenamed(Button1,OkButton)",
                "RenameDescendents(Form3,Button1,OkButton)",
                "FormEditor.Renamed(Form2,Button1,OkButton)",
                "Ev.Renamed(Form2,Button1,OkButton)",
                "ComponentRenamed(Button1,OkButton)",
                "RenameDescendents(Form2,Button1,OkButton)",
                "RenameDescendents(Form3,Button1,OkButton)",
                "FormEditor.Renamed(Form1,Button1,OkButton)",
                "Ev.Renamed(Form1,Button1,OkButton)",
                "ComponentRenamed(Button1,OkButton)",
            }));
  // What the host was told of the component.
  EXPECT_EQ(Module1->LastCompInfo, "KilnStdCtrls.TButton Button1 []");
  // By a name the module does not have, nothing is renamed.
  EXPECT_FALSE(KilnRoot(Form1)->RenameComponent("Nothing", "Other"));
}

TEST_F(NamesFixture, ARootRenameRenamesTheClassAndTellsTheHostFirst) {
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module1);
  TComponent* Form = Form1->GetRoot();
  EXPECT_EQ(Form->QualifiedClassName(), "Unit1.TForm1");
  Log.Clear();
  KilnRoot(Form1)->SetRootName("MainForm");
  EXPECT_EQ(Form1->GetRootName(), "MainForm");
  EXPECT_EQ(Form->ClassName(), "TMainForm");
  EXPECT_EQ(CallsOf({"ValidateComponentName", "FormEditor", "Ev.", "ComponentRenamed"}),
            (std::vector<String>{"ValidateComponentName(MainForm)", "FormEditor.Renamed(Form1,Form1,MainForm)",
                                 "Ev.Renamed(Form1,Form1,MainForm)", "ComponentRenamed(Form1,MainForm)"}));
  EXPECT_EQ(Module1->LastCompInfo, "Unit1.TForm1 Form1 []");
}

TEST_F(NamesFixture, RenamingTheFileKeepsItsExtensionAndMovesTheClassToTheUnit) {
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module1);
  Module1->UnitName = "Main";
  Form1->Rename("/src/Main.pas");
  EXPECT_EQ(Form1->GetFileName(), "/src/Main.kfm");
  EXPECT_EQ(Form1->GetRoot()->QualifiedClassName(), "Main.TForm1");
}

//===----------------------------------------------------------------------===//
// Looking names up across modules
//===----------------------------------------------------------------------===//

TEST_F(NamesFixture, NamesAreFoundInTheModuleAndInOtherModules) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  IPtr<IRoot> Form2 = NewForm("Form2");
  TKilnRoot* Kiln = KilnRoot(Form1);
  TButton* Own = Add<TButton>(Form1);
  TButton* Other = Add<TButton>(Form2);
  TPanel* Panel = Add<TPanel>(Form2, nullptr, 40);

  EXPECT_EQ(Kiln->GetComponent("Button1"), Own);
  EXPECT_EQ(Kiln->GetComponent("BUTTON1"), Own);
  EXPECT_EQ(Kiln->GetComponent("Form1"), Form1->GetRoot());
  // A bare name of another module's root; a qualified name of one of its components.
  EXPECT_EQ(Kiln->GetComponent("Form2"), Form2->GetRoot());
  EXPECT_EQ(Kiln->GetComponent("form2"), Form2->GetRoot());
  EXPECT_EQ(Kiln->GetComponent("Form2.Button1"), Other);
  EXPECT_EQ(Kiln->GetComponent("Form2.Panel1"), Panel);
  EXPECT_EQ(Kiln->GetComponent("Form2.Form2"), Form2->GetRoot());
  EXPECT_EQ(Kiln->GetComponent("Form2.Nothing"), nullptr);
  EXPECT_EQ(Kiln->GetComponent("Form9.Button1"), nullptr);
  EXPECT_EQ(Kiln->GetComponent("Nothing"), nullptr);
  EXPECT_EQ(Kiln->GetObject("Form2.Button1"), Other);
  // The host's finder of roots is not asked.
  EXPECT_EQ(Log.Count("FindGlobalComponent"), 0);

  // The names this module uses for them.
  EXPECT_EQ(Kiln->GetComponentName(Own), "Button1");
  EXPECT_EQ(Kiln->GetComponentName(Form1->GetRoot()), "Form1");
  EXPECT_EQ(Kiln->GetComponentName(Other), "Form2.Button1");
  EXPECT_EQ(Kiln->GetComponentName(Form2->GetRoot()), "Form2");
  EXPECT_EQ(Kiln->GetComponentName(nullptr), "");
  EXPECT_EQ(Kiln->GetObjectName(Other), "Form2.Button1");
  EXPECT_EQ(Kiln->GetObjectName(nullptr), "");
}

TEST_F(NamesFixture, AComponentOfANestedFrameIsNamedThroughTheFrame) {
  IPtr<IRoot> Frame1 = NewFrame("Frame1");
  TButton* InFrame = Add<TButton>(Frame1);
  IPtr<IRoot> Form1 = NewForm("Form1");
  TKilnRoot* Kiln = KilnRoot(Form1);
  TComponent* Frame = NestFrame(Frame1, Form1);
  ASSERT_NE(Frame, nullptr);
  TComponent* Nested = Frame->FindComponent("Button1");
  ASSERT_NE(Nested, nullptr);
  ASSERT_NE(Nested, InFrame);

  // The frame's path comes first.
  EXPECT_EQ(Kiln->GetComponentName(Nested), "Frame1.Button1");
  EXPECT_EQ(Kiln->GetComponentName(Frame), "Frame1");
  EXPECT_EQ(Kiln->GetComponent("Frame1.Button1"), Nested);
  EXPECT_EQ(Kiln->GetObjectName(Nested), "Frame1.Button1");
  // The frame's components are offered one level deep, after the frame itself; a Kiln
  // form does not offer itself.
  EXPECT_EQ(NamesOf(Kiln, nullptr), (std::vector<String>{"Frame1", "Frame1.Button1"}));
  EXPECT_EQ(NamesOf(Kiln, TButton::StaticClass()), std::vector<String>{"Frame1.Button1"});
}

TEST_F(NamesFixture, LinkedModulesOfferTheirComponentsUnderTheirNames) {
  WithInheritance();
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module1);
  TKilnRoot* Kiln = KilnRoot(Form1);
  Add<TButton>(Form1);
  Add<TLabel>(Form1, nullptr, 40)->SetName(""); // unnamed: never offered
  IPtr<IRoot> Form2 = NewForm("Form2");
  Add<TButton>(Form2);
  Add<TEdit>(Form2, nullptr, 40);
  IPtr<IRoot> Frame1 = NewFrame("Frame1"); // a nestable module is not linked to
  Add<TButton>(Frame1);
  IPtr<TRecordingModule> Module3;
  IPtr<IRoot> Form3 = NewDescendant("Form3", "Form1", &Module3);

  // Without links, the module's own names.
  EXPECT_EQ(NamesOf(Kiln, TButton::StaticClass()), std::vector<String>{"Button1"});
  // The host lists units and modules; only open modules count.
  Module1->LinkedModules = {"SysUtils", "Form2", "Frame1", "Form1"};
  // A module the host lists for itself offers its components again, but not its root.
  EXPECT_EQ(NamesOf(Kiln, TButton::StaticClass()), (std::vector<String>{"Button1", "Form2.Button1", "Form1.Button1"}));
  EXPECT_EQ(NamesOf(Kiln, TWinControl::StaticClass()),
            (std::vector<String>{"Button1", "Form2", "Form2.Button1", "Form2.Edit1", "Form1.Button1"}));
  // A descendant does not offer its ancestor's names again.
  Module3->LinkedModules = {"Form1", "Form2"};
  EXPECT_EQ(NamesOf(KilnRoot(Form3), TButton::StaticClass()), (std::vector<String>{"Button1", "Form2.Button1"}));
}

TEST_F(NamesFixture, AComponentIsLinkableWhenItsModuleIsLinked) {
  IPtr<TRecordingModule> Module1;
  IPtr<IRoot> Form1 = NewForm("Form1", &Module1);
  TKilnRoot* Kiln = KilnRoot(Form1);
  TButton* Own = Add<TButton>(Form1);
  IPtr<IRoot> Form2 = NewForm("Form2");
  TButton* Other = Add<TButton>(Form2);

  EXPECT_TRUE(Kiln->IsComponentLinkable(Own));
  EXPECT_TRUE(Kiln->IsComponentLinkable(Form1->GetRoot()));
  EXPECT_FALSE(Kiln->IsComponentLinkable(Other));
  EXPECT_FALSE(Kiln->IsComponentLinkable(nullptr));
  Module1->LinkedModules = {"SysUtils", "Form2"};
  EXPECT_TRUE(Kiln->IsComponentLinkable(Other));
  EXPECT_TRUE(Kiln->IsComponentLinkable(Form2->GetRoot()));

  // Linking asks the host to add the module of the component's root.
  Log.Clear();
  Kiln->MakeComponentLinkable(Other);
  Kiln->MakeComponentLinkable(nullptr);
  EXPECT_EQ(Log.Calls, std::vector<String>{"MakeComponentLinkable(Form2)"});
}

TEST_F(NamesFixture, TheHostsKeysAndButtonsReachTheModulesEditors) {
  IPtr<IDesigner> Designer1 = QueryAs<IDesigner>(NewForm("Form1"));
  EXPECT_EQ(Designer1->GetShiftState(), TShiftState{});
  Env->ShiftState = TShiftState{ssCtrl, ssLeft};
  EXPECT_EQ(Designer1->GetShiftState(), (TShiftState{ssCtrl, ssLeft}));
}
