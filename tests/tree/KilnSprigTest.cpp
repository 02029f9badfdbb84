//===- tests/tree/KilnSprigTest.cpp - Kiln's rules in the structure tree -===//
//
// With the Kiln package's sprigs: controls, windowed controls, frames and the
// three kinds of root get their classes and images; a control dragged in the
// tree takes a new parent only where controls are accepted, within its owner,
// and is kept inside the new parent; a data module takes no controls; a frame
// shows the components it owns, once.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnComCtrls.h"
#include "frameworks/kiln/design/KilnSprigs.h"
#include "tests/tree/TreeFixture.h"

namespace formkit::fakes {
namespace {

struct KilnSprigTest : TreeFixture {
  KilnSprigTest() { FrameworkSprigs = true; }

  /// The sprig of `Component` in `Root`'s refreshed tree; fails the test when none.
  static TSprig* SprigOf(const IPtr<IRoot>& Root, TComponent* Component) {
    TSprig* Sprig = RootOf(Root)->Find(Component);
    EXPECT_NE(Sprig, nullptr) << Component->Name();
    return Sprig;
  }
  /// Tells the tree that the module changed and gives it back refreshed.
  static TRootSprig* Changed(const IPtr<IRoot>& Root) {
    DesignerOf(Root)->Modified();
    return RootOf(Root);
  }
};

TEST_F(KilnSprigTest, EachKindOfObjectGetsItsSprigClassAndImage) {
  EXPECT_EQ(FindBestSprigClass(TLabel::StaticClass()), TControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TPanel::StaticClass()), TWinControlSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TFrame::StaticClass()), TFrameSprig::StaticClass());
  EXPECT_EQ(FindBestSprigClass(TTimer::StaticClass()), TComponentSprig::StaticClass());
  EXPECT_EQ(FindBestRootSprigClass(TForm::StaticClass()), TCustomFormRootSprig::StaticClass());
  EXPECT_EQ(FindBestRootSprigClass(TFrame::StaticClass()), TWinControlRootSprig::StaticClass());
  EXPECT_EQ(FindBestRootSprigClass(TDataModule::StaticClass()), TDataModuleRootSprig::StaticClass());

  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1, Panel);
  auto* Label = Add<TLabel>(Form1);
  auto* Timer = Add<TTimer>(Form1);
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n    Button1\n  Label1\n  Timer1\n");
  TRootSprig* Root = RootOf(Form1);
  EXPECT_TRUE(dynamic_cast<TCustomFormRootSprig*>(Root));
  EXPECT_EQ(Root->GetImageIndex(), 9);
  EXPECT_EQ(SprigOf(Form1, Panel)->GetImageIndex(), 8) << "accepts controls";
  EXPECT_EQ(SprigOf(Form1, Button)->GetImageIndex(), 7) << "accepts none";
  EXPECT_EQ(SprigOf(Form1, Label)->GetImageIndex(), 6);
  EXPECT_EQ(SprigOf(Form1, Timer)->GetImageIndex(), SprigImageComponent);

  // The image of a windowed control follows its style when the sprig is made; a frame's
  // does not.
  Panel->SetControlStyle({});
  EXPECT_EQ(NewSprig(TWinControlSprig::StaticClass(), Panel)->GetImageIndex(), 7);
  EXPECT_EQ(NewSprig(TFrameSprig::StaticClass(), Panel)->GetImageIndex(), 8);

  IPtr<IRoot> Frame1 = OpenModule("Frame1", "Frame");
  EXPECT_TRUE(dynamic_cast<TWinControlRootSprig*>(RootOf(Frame1)));
  EXPECT_FALSE(dynamic_cast<TCustomFormRootSprig*>(RootOf(Frame1)));
  EXPECT_EQ(RootOf(Frame1)->GetImageIndex(), 8);
  IPtr<IRoot> Data1 = OpenModule("Data1", "DataModule");
  EXPECT_TRUE(dynamic_cast<TDataModuleRootSprig*>(RootOf(Data1)));
  EXPECT_EQ(RootOf(Data1)->GetImageIndex(), 5);
}

TEST_F(KilnSprigTest, AControlDroppedOnAControlThatAcceptsControlsTakesItAsParent) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1);
  auto* Label = Add<TLabel>(Form1);
  auto* Timer = Add<TTimer>(Form1);
  TRootSprig* Root = RootOf(Form1);
  TSprig* PanelSprig = Root->Find(Panel);
  TSprig* ButtonSprig = Root->Find(Button);
  TSprig* LabelSprig = Root->Find(Label);
  TSprig* TimerSprig = Root->Find(Timer);

  // Over: only onto a control that accepts controls, only a control.
  EXPECT_TRUE(PanelSprig->DragOver(ButtonSprig));
  EXPECT_TRUE(PanelSprig->DragOver(LabelSprig));
  EXPECT_FALSE(LabelSprig->DragOver(ButtonSprig)) << "a label takes no controls";
  EXPECT_FALSE(ButtonSprig->DragOver(LabelSprig)) << "nor does a button";
  EXPECT_FALSE(PanelSprig->DragOver(TimerSprig)) << "a non-visual component stays under the root";
  EXPECT_FALSE(PanelSprig->DragOver(nullptr));
  EXPECT_TRUE(Root->DragOver(ButtonSprig));
  EXPECT_FALSE(Root->DragOver(TimerSprig));
  EXPECT_TRUE(ButtonSprig->DragOverTo(Root));
  EXPECT_FALSE(ButtonSprig->DragOverTo(TimerSprig));
  EXPECT_FALSE(ButtonSprig->DragOverTo(nullptr));

  // A drop onto a control that takes none is a drop that moves nothing.
  EXPECT_FALSE(LabelSprig->DragDrop(ButtonSprig));
  EXPECT_TRUE(ButtonSprig->DragDrop(LabelSprig)) << "the target is not its parent: True";
  EXPECT_EQ(Label->Parent(), Form1->GetRoot());
  EXPECT_FALSE(PanelSprig->DragDrop(TimerSprig));
  EXPECT_FALSE(PanelSprig->DragDrop(nullptr));

  // Onto the panel: the button takes it as parent, and the tree follows.
  EXPECT_TRUE(PanelSprig->DragDrop(ButtonSprig));
  EXPECT_EQ(Button->Parent(), Panel);
  Root = Changed(Form1);
  EXPECT_EQ(Root->Find(Button)->Parent(), PanelSprig);
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n    Button1\n  Label1\n  Timer1\n");
  // Onto its own parent: nothing changes, and the result is False.
  const TRect Bounds = Button->BoundsRect();
  EXPECT_FALSE(PanelSprig->DragDrop(ButtonSprig));
  EXPECT_EQ(Button->Parent(), Panel);
  EXPECT_EQ(Button->BoundsRect(), Bounds);
  // Back onto the root's control.
  EXPECT_TRUE(Root->DragDrop(ButtonSprig));
  EXPECT_EQ(Button->Parent(), Form1->GetRoot());
  EXPECT_FALSE(Root->DragDrop(TimerSprig)) << "a component without a parent property has nowhere to go";
  EXPECT_FALSE(Root->DragDrop(nullptr));
  Changed(Form1);
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n  Label1\n  Timer1\n  Button1\n");
}

TEST_F(KilnSprigTest, AMovedControlIsKeptInsideItsNewParentWithNoLowerBound) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1);
  auto* Wide = Add<TButton>(Form1);
  auto* Small = Add<TButton>(Form1);
  Panel->SetBounds(0, 0, 120, 100);
  Button->SetBounds(100, 90, 50, 30);
  Wide->SetBounds(10, 5, 200, 20);
  Small->SetBounds(20, 30, 40, 20);
  TRootSprig* Root = RootOf(Form1);
  TSprig* PanelSprig = Root->Find(Panel);

  ASSERT_TRUE(PanelSprig->DragDrop(Root->Find(Button)));
  EXPECT_EQ(Button->BoundsRect(), Bounds(70, 70, 50, 30)) << "120 - 50 and 100 - 30";
  ASSERT_TRUE(PanelSprig->DragDrop(Root->Find(Wide)));
  EXPECT_EQ(Wide->BoundsRect(), Bounds(-80, 5, 200, 20)) << "wider than the panel";
  ASSERT_TRUE(PanelSprig->DragDrop(Root->Find(Small)));
  EXPECT_EQ(Small->BoundsRect(), Bounds(20, 30, 40, 20)) << "fits: stays where it was";
  EXPECT_EQ(Panel->ControlCount(), 3);
}

TEST_F(KilnSprigTest, AControlDroppedIntoItsOwnChildIsRefusedWithNothingChanged) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Outer = Add<TPanel>(Form1);
  auto* Inner = Add<TPanel>(Form1, Outer);
  Outer->SetBounds(300, 200, 100, 80);
  TRootSprig* Root = RootOf(Form1);
  TSprig* InnerSprig = Root->Find(Inner);
  EXPECT_TRUE(InnerSprig->DragOver(Root->Find(Outer))) << "the tests look at kinds, not at nesting";
  try {
    InnerSprig->DragDrop(Root->Find(Outer));
    ADD_FAILURE() << "no exception";
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "Control 'Panel1' cannot be parented to 'Panel2', which lies inside it");
  }
  EXPECT_EQ(Outer->Parent(), Form1->GetRoot());
  EXPECT_EQ(Outer->BoundsRect(), Bounds(300, 200, 100, 80));
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n    Panel2\n");
}

TEST_F(KilnSprigTest, NewComponentsGoWhereTheirKindMay) {
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Button = Add<TButton>(Form1);
  TRootSprig* Root = RootOf(Form1);
  TSprig* PanelSprig = Root->Find(Panel);
  TSprig* ButtonSprig = Root->Find(Button);
  TClass ControlSprig = TControlSprig::StaticClass();
  TClass WinSprig = TWinControlSprig::StaticClass();
  TClass Plain = TComponentSprig::StaticClass();

  EXPECT_TRUE(PanelSprig->PaletteOver(ControlSprig, TLabel::StaticClass()));
  EXPECT_TRUE(PanelSprig->PaletteOver(WinSprig, TButton::StaticClass()));
  EXPECT_FALSE(PanelSprig->PaletteOver(Plain, TTimer::StaticClass()));
  EXPECT_FALSE(PanelSprig->PaletteOver(nullptr, TLabel::StaticClass()));
  EXPECT_FALSE(ButtonSprig->PaletteOver(ControlSprig, TLabel::StaticClass()));
  EXPECT_TRUE(Root->PaletteOver(ControlSprig, TLabel::StaticClass()));
  EXPECT_TRUE(Root->PaletteOver(Plain, TTimer::StaticClass())) << "non-visual components go on the root";
  EXPECT_FALSE(Root->PaletteOver(TCollectionSprig::StaticClass(), TStatusPanels::StaticClass()));
  EXPECT_FALSE(Root->PaletteOver(nullptr, nullptr));
  // The class operation of a control's sprig.
  TObjectGuard<TSprig> Prototype = NewSprig(ControlSprig, nullptr);
  EXPECT_TRUE(Prototype->PaletteOverTo(PanelSprig, TLabel::StaticClass()));
  EXPECT_FALSE(Prototype->PaletteOverTo(ButtonSprig, TLabel::StaticClass()));
  EXPECT_FALSE(Prototype->PaletteOverTo(nullptr, TLabel::StaticClass()));
  // A root class passes the kind test but no root goes under a root; a control's sprig
  // class is a component's too, so the root takes it even when it takes no controls.
  EXPECT_FALSE(Root->PaletteOver(TWinControlRootSprig::StaticClass(), TFrame::StaticClass()));
  static_cast<TControl*>(Form1->GetRoot())->SetControlStyle({});
  EXPECT_TRUE(Root->PaletteOver(ControlSprig, TLabel::StaticClass()));
  EXPECT_TRUE(Root->PaletteOver(Plain, TTimer::StaticClass()));
}

TEST_F(KilnSprigTest, ADataModuleTakesNoControls) {
  IPtr<IRoot> Data1 = OpenModule("Data1", "DataModule");
  auto* Timer = Add<TTimer>(Data1);
  TRootSprig* Root = RootOf(Data1);
  EXPECT_EQ(Tree(Data1), "Data1\n  Timer1\n");
  EXPECT_FALSE(Root->AcceptsClass(TButton::StaticClass()));
  EXPECT_FALSE(Root->AcceptsClass(TControl::StaticClass()));
  EXPECT_TRUE(Root->AcceptsClass(TTimer::StaticClass()));
  EXPECT_FALSE(Root->AcceptsClass(TStatusPanel::StaticClass())) << "what the root takes at all";
  EXPECT_FALSE(Root->AcceptsClass(nullptr));

  EXPECT_TRUE(Root->DragOver(Root->Find(Timer)));
  EXPECT_FALSE(Root->DragOver(nullptr));
  // A control's sprig of this module, made by hand: refused.
  TObjectGuard<TButton> Button(CreateComponentOf<TButton>(nullptr));
  TObjectGuard<TSprig> ButtonSprig = NewSprig(TWinControlSprig::StaticClass(), Button.Get());
  static_cast<TComponentSprig*>(ButtonSprig.Get())->SetOwner(Root);
  EXPECT_FALSE(Root->DragOver(ButtonSprig.Get()));
  // A component of another module: refused.
  IPtr<IRoot> Data2 = OpenModule("Data2", "DataModule");
  auto* Other = Add<TTimer>(Data2);
  EXPECT_FALSE(Root->DragOver(RootOf(Data2)->Find(Other)));

  EXPECT_TRUE(Root->PaletteOver(TComponentSprig::StaticClass(), TTimer::StaticClass()));
  EXPECT_FALSE(Root->PaletteOver(TControlSprig::StaticClass(), TLabel::StaticClass()));
  EXPECT_FALSE(Root->PaletteOver(TWinControlSprig::StaticClass(), TButton::StaticClass()));
  EXPECT_FALSE(Root->PaletteOver(TPersistentSprig::StaticClass(), TTimer::StaticClass()));
  EXPECT_FALSE(Root->PaletteOver(nullptr, TTimer::StaticClass()));
}

TEST_F(KilnSprigTest, AFrameShowsTheComponentsItOwnsOnceAndKeepsThemToItself) {
  IPtr<IRoot> Frame1 = OpenModule("Frame1", "Frame");
  Add<TButton>(Frame1);
  Add<TTimer>(Frame1);
  IPtr<IRoot> Form1 = NewForm("Form1");
  auto* Panel = Add<TPanel>(Form1);
  auto* Label = Add<TLabel>(Form1);
  TComponent* Frame = KilnRoot(Form1)->FrameCreateComponent(Frame1->GetRoot()->ClassType(), Form1->GetRoot());
  ASSERT_NE(Frame, nullptr);
  static_cast<TControl*>(Frame)->SetParent(Panel);
  TRootSprig* Root = Changed(Form1);
  const String Name = Frame->Name();
  const String Expected = "Form1\n  Panel1\n    " + Name + "\n      Button1\n      Timer1\n  Label1\n";
  EXPECT_EQ(Tree(Form1), Expected);
  EXPECT_EQ(Tree(Frame1), "Frame1\n  Button1\n  Timer1\n") << "the frame's own module is unchanged";

  TSprig* FrameSprig = Root->Find(Frame);
  ASSERT_TRUE(dynamic_cast<TFrameSprig*>(FrameSprig));
  TSprig* InnerButton = Root->Find(Frame->Components(0));
  ASSERT_NE(InnerButton, nullptr);
  EXPECT_TRUE(dynamic_cast<TWinControlSprig*>(InnerButton));
  EXPECT_EQ(InnerButton->Owner(), FrameSprig);
  EXPECT_EQ(InnerButton->Path(), "Form1\\Panel1\\" + Name + "\\Button1");

  // Asked again and again, the frame adds nothing it has.
  FrameSprig->FigureChildren();
  Root = Changed(Form1);
  EXPECT_EQ(Tree(Form1), Expected);
  EXPECT_EQ(FrameSprig->Count(), 2);

  // Owners differ: a frame's control may not leave the frame. The frame itself belongs to
  // the form, so its own controls are not its owner's either, while the form's are.
  TSprig* PanelSprig = Root->Find(Panel);
  TSprig* LabelSprig = Root->Find(Label);
  EXPECT_FALSE(PanelSprig->DragOver(InnerButton));
  EXPECT_FALSE(PanelSprig->DragDrop(InnerButton));
  EXPECT_FALSE(Root->DragOver(InnerButton));
  // Not the root's control: the default drop answers, and a control's sprig moves nothing.
  EXPECT_TRUE(Root->DragDrop(InnerButton));
  EXPECT_FALSE(FrameSprig->DragOver(InnerButton));
  EXPECT_EQ(static_cast<TControl*>(Frame->Components(0))->Parent(), Frame);
  EXPECT_TRUE(FrameSprig->DragOver(LabelSprig));
  // The frame itself is a control of the form.
  EXPECT_TRUE(Root->DragDrop(FrameSprig));
  EXPECT_EQ(static_cast<TControl*>(Frame)->Parent(), Form1->GetRoot());
  Root = Changed(Form1);
  EXPECT_EQ(Tree(Form1), "Form1\n  Panel1\n  Label1\n  " + Name + "\n    Button1\n    Timer1\n");

  // The form's label dropped on the frame stands in it and belongs to it, as it does when
  // the module is read again; the module writes it there.
  ASSERT_TRUE(Root->Find(Frame)->DragDrop(Root->Find(Label)));
  EXPECT_EQ(Label->Parent(), Frame);
  EXPECT_EQ(Label->Owner(), Frame);
  EXPECT_EQ(Form1->GetRoot()->FindComponent("Label1"), nullptr);
  EXPECT_NE(FormImage(Form1->GetRoot()).find("Label1"), String::npos);
}

} // namespace
} // namespace formkit::fakes
