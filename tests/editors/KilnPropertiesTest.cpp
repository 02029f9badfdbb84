//===- tests/editors/KilnPropertiesTest.cpp - The inspector on real Kiln controls ===//
//
// Every Kiln class the palette offers, seen through the inspector's engine: the
// full property list in name order with the text of each value, and a write of
// every writable property through its editor, read back through the same editor.
//
//===----------------------------------------------------------------------===//
#include "tests/editors/EditorSamples.h"

#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/KilnExtCtrls.h"
#include "frameworks/kiln/KilnForms.h"
#include "frameworks/kiln/KilnStdCtrls.h"

#include <map>

namespace formkit::samples {
namespace {

struct KilnPropertiesTest : EditorFixture {
  void SetUp() override {
    InitializeKiln();
    EditorFixture::SetUp();
  }
  void TearDown() override {
    for (TComponent* F : Forms) F->Destroy();
    EditorFixture::TearDown();
    FinalizeKiln();
  }

  /// A new instance of `Class`, named after it ("Button1"), on a form of its own; a form
  /// is its own root. Frames stand alone, as they do in their own module, unless
  /// `AmongOthers`: then every control stands on the form, before a panel.
  TComponent* Place(TClass Class, bool AmongOthers = false) {
    TForm* Form = CreateComponentOf<TForm>(nullptr);
    Forms.push_back(Form);
    if (Class == TForm::StaticClass()) {
      Form->SetName("Form1");
      return Form;
    }
    Form->SetName("Host");
    auto* Obj = static_cast<TComponent*>(Class->NewInstance());
    RunConstructor(Obj, Form);
    Obj->SetName(Class->ClassName.substr(1) + "1");
    auto* Control = dynamic_cast<TControl*>(Obj);
    if (Control && (AmongOthers || Class != TFrame::StaticClass())) Control->SetParent(Form);
    if (AmongOthers) CreateComponentOf<TPanel>(Form)->SetParent(Form);
    return Obj;
  }

  /// "Name=Value" of every property and, one level down, of every nested one.
  std::vector<String> Texts(TComponent* Obj) {
    std::vector<String> Result;
    for (const IPtr<IProperty>& P : PropertiesOf({Obj})) {
      Result.push_back(P->GetName() + "=" + P->GetValue());
      if (!dynamic_cast<TClassProperty*>(P.Get())) continue;
      P->GetProperties([&](const IPtr<IProperty>& Sub) {
        Result.push_back(P->GetName() + "." + Sub->GetName() + "=" + Sub->GetValue());
      });
    }
    return Result;
  }

  std::vector<TComponent*> Forms;
};

const std::vector<TClass>& PaletteClasses() {
  static const std::vector<TClass> Classes = {
      TForm::StaticClass(),   TFrame::StaticClass(), TDataModule::StaticClass(), TPanel::StaticClass(),
      TButton::StaticClass(), TLabel::StaticClass(), TEdit::StaticClass(),       TCheckBox::StaticClass(),
      TTimer::StaticClass()};
  return Classes;
}

const std::map<String, std::vector<String>> ExpectedTexts = {
    {"TForm",
     {"BorderStyle=bsSizeable", "Caption=Form1", "ClientHeight=201", "ClientWidth=304",
      "Color=-16777201", "Cursor=0", "Enabled=True", "Font=(TFont)", "Font.Color=-16777208",
      "Font.Name=Sans Serif", "Font.Size=9", "Font.Style=[]", "Height=240", "Hint=", "Left=0",
      "Name=Form1", "OnClick=", "OnClose=", "OnHide=", "OnShow=",
      "PixelsPerInch=96", "Scaled=True", "Tag=0", "Top=0", "Visible=False", "Width=320"}},
    {"TFrame",
     {"Align=alNone", "Color=-16777201", "Cursor=0", "Enabled=True", "Font=(TFont)",
      "Font.Color=-16777208", "Font.Name=Sans Serif", "Font.Size=9", "Font.Style=[]", "Height=240",
      "Hint=", "Left=0", "Name=Frame1", "OnClick=", "ParentFont=True", "TabOrder=-1",
      "Tag=0", "Top=0", "Visible=True", "Width=320"}},
    {"TDataModule",
     {"Name=DataModule1", "Tag=0"}},
    {"TPanel",
     {"Align=alNone", "BevelInner=bvNone", "BevelOuter=bvRaised", "BevelWidth=1", "BorderWidth=0",
      "Caption=Panel1", "Color=-16777201", "Cursor=0", "Enabled=True", "Font=(TFont)",
      "Font.Color=-16777208", "Font.Name=Sans Serif", "Font.Size=9", "Font.Style=[]", "Height=41",
      "Hint=", "Left=0", "Name=Panel1", "OnClick=", "ParentFont=True", "TabOrder=0",
      "Tag=0", "Top=0", "Visible=True", "Width=185"}},
    {"TButton",
     {"Align=alNone", "Cancel=False", "Caption=Button1", "Cursor=0", "Default=False", "Enabled=True",
      "Font=(TFont)", "Font.Color=-16777208", "Font.Name=Sans Serif", "Font.Size=9", "Font.Style=[]",
      "Height=25", "Hint=", "Left=0", "ModalResult=0", "Name=Button1", "OnClick=",
      "ParentFont=True", "TabOrder=0", "Tag=0", "Top=0", "Visible=True", "Width=75"}},
    {"TLabel",
     {"Align=alNone", "Caption=Label1", "Color=-16777201", "Cursor=0", "Enabled=True",
      "FocusControl=", "Font=(TFont)", "Font.Color=-16777208", "Font.Name=Sans Serif",
      "Font.Size=9", "Font.Style=[]", "Height=17", "Hint=", "Left=0", "Name=Label1",
      "OnClick=", "ParentFont=True", "Tag=0", "Top=0", "Transparent=False", "Visible=True",
      "Width=65", "WordWrap=False"}},
    {"TEdit",
     {"Align=alNone", "Color=-16777211", "Cursor=0", "Enabled=True", "Font=(TFont)",
      "Font.Color=-16777208", "Font.Name=Sans Serif", "Font.Size=9", "Font.Style=[]", "Height=23",
      "Hint=", "Left=0", "MaxLength=0", "Name=Edit1", "OnChange=", "OnClick=",
      "ParentFont=True", "ReadOnly=False", "TabOrder=0", "Tag=0", "Text=Edit1", "Top=0",
      "Visible=True", "Width=121"}},
    {"TCheckBox",
     {"Align=alNone", "AllowGrayed=False", "Caption=CheckBox1", "Checked=False", "Cursor=0",
      "Enabled=True", "Font=(TFont)", "Font.Color=-16777208", "Font.Name=Sans Serif", "Font.Size=9",
      "Font.Style=[]", "Height=19", "Hint=", "Left=0", "Name=CheckBox1", "OnClick=",
      "ParentFont=True", "State=cbUnchecked", "TabOrder=0", "Tag=0", "Top=0", "Visible=True",
      "Width=97"}},
    {"TTimer",
     {"Enabled=True", "Interval=1000", "Name=Timer1", "OnTimer=", "Tag=0"}},
};

TEST_F(KilnPropertiesTest, EveryClassListsEveryPublishedPropertyInNameOrderWithItsText) {
  for (TClass Class : PaletteClasses()) {
    SCOPED_TRACE(Class->ClassName);
    TComponent* Obj = Place(Class);
    EXPECT_EQ(Texts(Obj), ExpectedTexts.at(Class->ClassName));
    // Nothing published is missing for want of an editor.
    std::vector<String> Names = NamesOf(PropertiesOf({Obj}));
    EXPECT_EQ(Names.size(), Class->Properties().size());
    for (PPropInfo Prop : Class->Properties())
      EXPECT_NE(std::find_if(Names.begin(), Names.end(), [&](const String& N) { return SameText(N, Prop->Name); }),
                Names.end())
          << Prop->Name;
  }
}

/// A text the editor should accept that differs from the current value.
String AnotherValue(const IPtr<IProperty>& P) {
  String Current = P->GetValue();
  if (dynamic_cast<TEnumProperty*>(P.Get()) || dynamic_cast<TSetElementProperty*>(P.Get())) {
    String Other;
    P->GetValues([&](const String& V) {
      if (Other.empty() && V != Current) Other = V;
    });
    return Other;
  }
  // Small numbers suit every integer: a tab order among two controls, a size, a colour.
  if (dynamic_cast<TIntegerProperty*>(P.Get())) return Current == "1" ? "2" : "1";
  if (dynamic_cast<TComponentNameProperty*>(P.Get())) return Current + "X";
  return Current + "Zed";
}

/// The paths ("Font", "Size") of every writable property of `Obj` and of its nested
/// properties. References and events are left out: their names are a module's, and the
/// tests of a module at work write them.
std::vector<std::vector<String>> WritablePaths(const std::vector<IPtr<IProperty>>& Props,
                                               const std::vector<String>& Prefix = {}) {
  std::vector<std::vector<String>> Paths;
  for (const IPtr<IProperty>& P : Props) {
    std::vector<String> Path = Prefix;
    Path.push_back(P->GetName());
    if (P->GetAttributes().Contains(paSubProperties)) {
      std::vector<IPtr<IProperty>> Nested;
      P->GetProperties([&](const IPtr<IProperty>& Sub) { Nested.push_back(Sub); });
      for (auto& Sub : WritablePaths(Nested, Path)) Paths.push_back(Sub);
    } else if (!dynamic_cast<TMethodProperty*>(P.Get()) && !dynamic_cast<TComponentProperty*>(P.Get()) &&
               P->GetPropInfo()->IsWritable()) {
      Paths.push_back(Path);
    }
  }
  return Paths;
}

/// The editor at `Path` beneath `Props`.
IPtr<IProperty> EditorAt(const std::vector<IPtr<IProperty>>& Props, const std::vector<String>& Path) {
  IPtr<IProperty> P = EditorFixture::Find(Props, Path[0]);
  for (size_t I = 1; P && I < Path.size(); ++I) {
    std::vector<IPtr<IProperty>> Nested;
    P->GetProperties([&](const IPtr<IProperty>& Sub) { Nested.push_back(Sub); });
    P = EditorFixture::Find(Nested, Path[I]);
  }
  return P;
}

TEST_F(KilnPropertiesTest, EveryWritablePropertyTakesATextAndShowsItBack) {
  std::map<String, int> Written;
  for (TClass Class : PaletteClasses()) {
    // Each property on a fresh control, so that no write disturbs the next (an alignment
    // fixes the position, for one).
    for (const std::vector<String>& Path : WritablePaths(PropertiesOf({Place(Class, true)}))) {
      String Where = Class->ClassName;
      for (const String& Step : Path) Where += "." + Step;
      SCOPED_TRACE(Where);
      IPtr<IProperty> P = EditorAt(PropertiesOf({Place(Class, true)}, Designer()), Path);
      ASSERT_TRUE(P);
      String Text = AnotherValue(P);
      Log.Clear();
      P->SetValue(Text);
      EXPECT_EQ(P->GetValue(), Text);
      EXPECT_EQ(Log.Count("Form1.Modified"), 1);
      ++Written[Class->ClassName];
    }
  }
  // The scalar properties of each class and of its font, with each font style element.
  EXPECT_EQ(Written["TButton"], 24);
  EXPECT_EQ(Written["TTimer"], 4);
  EXPECT_EQ(Written["TDataModule"], 2);
}

TEST_F(KilnPropertiesTest, ASelectionOfAButtonAndALabelSharesTheirCommonProperties) {
  auto* Button = static_cast<TButton*>(Place(TButton::StaticClass()));
  auto* Label = static_cast<TLabel*>(Place(TLabel::StaticClass()));
  std::vector<IPtr<IProperty>> Props = PropertiesOf({Button, Label}, Designer());
  EXPECT_EQ(NamesOf(Props), (std::vector<String>{"Align", "Caption", "Cursor", "Enabled", "Font", "Height", "Hint",
                                                 "Left", "OnClick", "ParentFont", "Tag", "Top", "Visible", "Width"}));
  Log.Clear();
  Find(Props, "Left")->SetValue("33");
  EXPECT_EQ(Button->Left(), 33);
  EXPECT_EQ(Label->Left(), 33);
  EXPECT_EQ(Log.Count("Form1.Modified"), 1);
  std::vector<IPtr<IProperty>> Font;
  Find(Props, "Font")->GetProperties([&](const IPtr<IProperty>& P) { Font.push_back(P); });
  Find(Font, "Size")->SetValue("14");
  EXPECT_EQ(Button->Font()->Size(), 14);
  EXPECT_EQ(Label->Font()->Size(), 14);
  ExpectRejected([&] { Find(Props, "Align")->SetValue("alMiddle"); }, "Invalid property value");
  EXPECT_EQ(Button->Align(), alNone);
  EXPECT_EQ(Label->Align(), alNone);
}

} // namespace
} // namespace formkit::samples
