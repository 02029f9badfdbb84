//===- tests/frameworks/kiln/design/PlainModuleFormsTest.cpp - Data module and control windows ===//
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

#include "editors/SelectionEditors.h"
#include "platform/Rtti.h"

namespace formkit::fakes {
namespace {

std::int32_t Packed(int Left, int Top) {
  return static_cast<std::int32_t>((static_cast<std::uint32_t>(static_cast<std::uint16_t>(Top)) << 16) |
                                   static_cast<std::uint16_t>(Left));
}

struct PlainModuleFormsTest : KilnDesignFixture {
  IPtr<IRoot> OpenKind(const String& Name, const String& Kind) {
    IPtr<TRecordingModule> Module = New<TRecordingModule>(Name + ".kfm", &Log);
    IPtr<IRoot> Root = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), Name + ".kfm", false, Name,
                                            Kind, "", nullptr, "");
    Open.push_back(Root);
    return Root;
  }
  static TDataModuleForm* DataWindow(const IPtr<IRoot>& Root) {
    return dynamic_cast<TDataModuleForm*>(KilnRoot(Root)->DesignWindow());
  }
  /// The "ClassGroup" property the selection editors offer for the module's root alone.
  IPtr<IProperty> ClassGroupProperty(const IPtr<IRoot>& Root) {
    TKilnRoot* Kiln = KilnRoot(Root);
    IPtr<IDesignerSelections> Selection = NewAs<IDesignerSelections, TDesignerSelections>();
    Selection->Add(Root->GetRoot());
    IPtr<ISelectionEditorList> Editors = GetSelectionEditors(Kiln->AsDesigner(), Selection);
    IPtr<IInterfaceList> Properties = NewAs<IInterfaceList, TInterfaceList>();
    for (int I = 0; Editors && I < Editors->GetCount(); ++I)
      if (auto Filter = QueryAs<ISelectionPropertyFilter>(Editors->Get(I))) Filter->FilterProperties(Selection, Properties);
    for (int I = 0; I < Properties->GetCount(); ++I)
      if (auto Property = QueryAs<IProperty>(Properties->Get(I)); Property && Property->GetName() == "ClassGroup")
        return Property;
    return nullptr;
  }
  static String SetValueError(const IPtr<IProperty>& Property, const String& Value) {
    try {
      Property->SetValue(Value);
    } catch (const EInvalidType& E) {
      return E.Message();
    }
    return "no error";
  }
};

//===----------------------------------------------------------------------===//
// The data module's window
//===----------------------------------------------------------------------===//

TEST_F(PlainModuleFormsTest, ADataModuleLiesInItsOwnWindowAsIconsThatGesturesMove) {
  IPtr<IRoot> Data = OpenKind("Data1", "DataModule");
  TKilnRoot* Kiln = KilnRoot(Data);
  TDataModuleForm* Window = DataWindow(Data);
  ASSERT_NE(Window, nullptr);
  auto* Module = static_cast<TDataModule*>(Data->GetRoot());
  // The window is the stored one, placed by the module, and the module stands in it.
  EXPECT_EQ(Window->Caption(), "Data1");
  EXPECT_EQ(Window->ClientWidth(), 389);
  EXPECT_EQ(Window->ClientHeight(), 201);
  EXPECT_EQ(Module->Owner(), Window);
  EXPECT_EQ(Module->DesignPPI(), Screen()->PixelsPerInch()); // 0 took the screen's value
  TComponentContainer* Area = Window->ComponentContainer();
  EXPECT_EQ(Kiln->KilnSurface()->Container(), Area);
  EXPECT_EQ(Area->Align(), alClient);
  EXPECT_EQ(Area->Color(), clWindow);
  EXPECT_TRUE(Area->ControlStyle().Contains(csOpaque));
  EXPECT_EQ(Area->HorzScrollBar()->Margin(), 8);
  EXPECT_TRUE(Area->VertScrollBar()->Tracking());
  EXPECT_EQ(Area->GetBrush()->Color(), clWindow);

  // A timer dropped on the area is an icon; the mouse drags it by its icon.
  Kiln->CreateComponentPos(InterfaceOf<IInternalPaletteItem>(New<TToolItem>(TTimer::StaticClass()).Get()), 40, 40);
  TComponent* Timer = Module->FindComponent("Timer1");
  ASSERT_NE(Timer, nullptr);
  EXPECT_EQ(Timer->DesignInfo(), Packed(40, 40));
  Drag(Kiln->KilnSurface(), {45, 45}, {85, 69});
  EXPECT_EQ(Timer->DesignInfo(), Packed(80, 64));
  EXPECT_EQ(Kiln->SelectedComponent(), Timer);

  // Moving and sizing the window writes the module's design information back, both
  // halves of the position signed.
  Window->SetBounds(-5, 300, 500, 400);
  EXPECT_EQ(Module->DesignInfo(), Packed(-5, 300));
  EXPECT_EQ(Module->DesignSize(), (TPoint{500, 400}));
  Module->SetDesignInfo(Packed(-7, -9));
  Module->SetDesignSize({300, 250});
  Window->ItemsModified(Kiln->AsDesigner());
  EXPECT_EQ(Window->Left(), -7);
  EXPECT_EQ(Window->Top(), -9);
  EXPECT_EQ(Window->Width(), 300);
}

TEST_F(PlainModuleFormsTest, TheAreaScrollsToTheModulesOffsetOnceTheIconsGiveItRange) {
  IPtr<IRoot> Data = OpenKind("Data1", "DataModule");
  TKilnRoot* Kiln = KilnRoot(Data);
  TDataModuleForm* Window = DataWindow(Data);
  auto* Module = static_cast<TDataModule*>(Data->GetRoot());
  auto* Timer = CreateComponentOf<TTimer>(Module);
  Timer->SetName("Timer1");
  Timer->SetDesignInfo(Packed(40, 600));
  Module->SetDesignOffset({0, 50});
  TControlScrollBar* Vert = Window->ComponentContainer()->VertScrollBar();
  // The position is set before the range: with no range yet it is read back as 0.
  Vert->SetRange(0);
  Window->UpdateDesigner();
  EXPECT_EQ(Vert->Position(), 0);
  EXPECT_EQ(Vert->Range(), 628); // the icon's bottom
  EXPECT_EQ(Module->DesignOffset(), (TPoint{0, 50})); // following the module writes nothing back
  Window->UpdateDesigner();
  EXPECT_EQ(Vert->Position(), 50);
  // Input on the scrolled area reaches the icon where it lies in the module.
  Kiln->KilnSurface()->MouseDown(45, 555, {});
  Kiln->KilnSurface()->MouseUp(45, 555);
  EXPECT_EQ(Kiln->SelectedComponent(), Timer);
  // The window's next move keeps the scroll offset in the module.
  Window->SetBounds(10, 10, 400, 300);
  EXPECT_EQ(Module->DesignOffset(), (TPoint{0, 50}));
}

TEST_F(PlainModuleFormsTest, ScalingForTheWindowsPixelsPerInchTouchesOnlyANamedModule) {
  IPtr<IRoot> Data = OpenKind("Data1", "DataModule");
  TDataModuleForm* Window = DataWindow(Data);
  auto* Module = static_cast<TDataModule*>(Data->GetRoot());
  auto* Timer = CreateComponentOf<TTimer>(Module);
  Timer->SetName("Timer1");
  Timer->SetDesignInfo(Packed(30, -60));
  Module->SetDesignSize({600, 300});
  Module->SetDesignPPI(144);
  String Name = Module->Name();
  Module->SetName("");
  Window->ScaleForPPI(200); // the argument is not what counts: the window's own value is
  EXPECT_EQ(Module->DesignSize(), (TPoint{600, 300}));
  EXPECT_EQ(Module->DesignPPI(), 144);
  Module->SetName(Name);
  Window->ScaleForPPI(200);
  EXPECT_EQ(Module->DesignPPI(), 96);
  EXPECT_EQ(Module->DesignSize(), (TPoint{400, 200}));
  EXPECT_EQ(Timer->DesignInfo(), Packed(20, -40));
  EXPECT_EQ(Window->Width(), 400);
}

TEST_F(PlainModuleFormsTest, TheDataModulesCustomModuleMakesItsWindowOrAsksTheHost) {
  IPtr<IRoot> Data = OpenKind("Data1", "DataModule");
  TKilnRoot* Kiln = KilnRoot(Data);
  auto Module = QueryAs<ICustomDesignForm80>(Kiln->GetCustomModule());
  ASSERT_TRUE(Module);
  IPtr<IHostForm> HostForm;
  TWinControl* Container = Kiln->KilnSurface()->Container();
  Module->CreateDesignerForm(Kiln->AsDesigner(), Data->GetRoot(), HostForm, Container);
  EXPECT_EQ(Container, nullptr); // no host procedure: both cleared
  TComponent* Seen = nullptr;
  auto* Marker = CreateComponentOf<TPanel>(nullptr);
  DMForm::CreateDesignerFormProc = [&](const IPtr<IDesigner>&, TComponent* Root, IPtr<IHostForm>&, TWinControl*& Out) {
    Seen = Root;
    Out = Marker;
  };
  Module->CreateDesignerForm(Kiln->AsDesigner(), Data->GetRoot(), HostForm, Container);
  DMForm::CreateDesignerFormProc = nullptr;
  EXPECT_EQ(Seen, Data->GetRoot());
  EXPECT_EQ(Container, Marker);
  // The control window's procedure is another one: unset, it leaves the outputs null.
  TWinControlCustomModule Other;
  Container = Marker;
  Other.CreateDesignerForm(nullptr, nullptr, HostForm, Container);
  EXPECT_EQ(Container, nullptr);
  Marker->Destroy();
  // A data module takes no other designer's plain module.
  EXPECT_FALSE(Kiln->GetCustomModule()->ValidateComponentClass(TDataModule::StaticClass()));
}

//===----------------------------------------------------------------------===//
// The class group
//===----------------------------------------------------------------------===//

TEST_F(PlainModuleFormsTest, TheClassGroupIsChosenFromItsListAndCheckedBeforeAnythingChanges) {
  IPtr<IRoot> Data = OpenKind("Data1", "DataModule");
  TKilnRoot* Kiln = KilnRoot(Data);
  IPtr<IProperty> Group = ClassGroupProperty(Data);
  ASSERT_TRUE(Group);
  EXPECT_EQ(Group->GetAttributes().Mask(), 2049u);
  EXPECT_EQ(CastAs<IPropertyKind>(Group)->GetKind(), tkClassRef);
  EXPECT_EQ(Group->GetEditLimit(), -1);
  EXPECT_FALSE(Group->HasInstance(Data->GetRoot()));
  std::vector<String> Values;
  Group->GetValues([&](const String& S) { Values.push_back(S); });
  EXPECT_EQ(Values, (std::vector<String>{"Classes.TPersistent", "KilnForms.TDataModule"}));
  EXPECT_EQ(Group->GetValue(), "");

  auto* Timer = CreateComponentOf<TTimer>(Data->GetRoot());
  Timer->SetName("Timer1");
  auto* Plain = CreateComponentOf<TComponent>(Data->GetRoot()); // of no group but the persistents'
  Plain->SetName("Plain1");
  int Stamp = Kiln->ModifyTime();
  EXPECT_EQ(SetValueError(Group, "Nowhere.TNothing"), "Unable to find type 'Nowhere.TNothing'");
  EXPECT_EQ(SetValueError(Group, "Boolean"), "Type 'Boolean' must be a class type");
  EXPECT_EQ(SetValueError(Group, "System.TObject"), "Type 'System.TObject' must descend from System.Classes.TPersistent");
  EXPECT_EQ(SetValueError(Group, "Classes.TPersistent"),
            "The following component(s) are not available in the specified class group.\r\n"
            "This is likely to cause compile or runtime errors.\r\n\r\nKilnExtCtrls.TTimer");
  EXPECT_EQ(Group->GetValue(), "");
  EXPECT_EQ(Kiln->ModifyTime(), Stamp);

  Group->SetValue("KilnControls.TControl");
  EXPECT_EQ(Group->GetValue(), "KilnControls.TControl");
  String Edit;
  EXPECT_TRUE(Group->GetEditValue(Edit));
  EXPECT_EQ(Edit, "KilnControls.TControl");
  EXPECT_TRUE(Kiln->ClassGroupKnown());
  EXPECT_EQ(Kiln->GetClassGroupClass(), TControl::StaticClass());
  EXPECT_NE(Kiln->ModifyTime(), Stamp);

  // Only one data module alone gets the property.
  IPtr<IDesignerSelections> Two = NewAs<IDesignerSelections, TDesignerSelections>();
  Two->Add(Data->GetRoot());
  Two->Add(Timer);
  IPtr<IInterfaceList> Properties = NewAs<IInterfaceList, TInterfaceList>();
  IPtr<TDataModuleSelectionEditor> Editor = New<TDataModuleSelectionEditor>();
  Editor->Create(Kiln->AsDesigner());
  Editor->FilterProperties(Two, Properties);
  EXPECT_EQ(Properties->GetCount(), 0);
}

TEST_F(PlainModuleFormsTest, TheFinderClassFollowsTheChosenGroup) {
  IPtr<IRoot> Data = OpenKind("Data1", "DataModule");
  TKilnRoot* Kiln = KilnRoot(Data);
  TDataModuleCustomModule Module;
  Module.Create(Data->GetRoot(), Kiln->AsDesigner());
  EXPECT_EQ(Module.GetFinderClass(), TControl::StaticClass()); // no group chosen yet
  Kiln->SetClassGroupName("Classes.TPersistent");
  EXPECT_EQ(Module.GetFinderClass(), TPersistent::StaticClass());
  Kiln->SetClassGroupName("Nowhere.TGone"); // known, but no such class: the inherited finder
  EXPECT_EQ(Module.GetFinderClass(), Data->GetRoot()->Owner()->ClassType());
  TDataModuleCustomModule Loose;
  Loose.Create(Data->GetRoot(), nullptr);
  EXPECT_EQ(Loose.GetFinderClass(), Data->GetRoot()->Owner()->ClassType());
  EXPECT_EQ(Module.DesignClass(), TForm::StaticClass());
  EXPECT_EQ(TRttiContext().FindType("classes.tpersistent"), TPersistent::StaticClass()->TypeInfo());
}

//===----------------------------------------------------------------------===//
// The control module's window
//===----------------------------------------------------------------------===//

TEST_F(PlainModuleFormsTest, WithoutSizingTheWindowHugsTheFrameAndTheFrameFollowsTheWindow) {
  IPtr<IRoot> Frame = OpenKind("Frame1", "Frame");
  auto* Window = dynamic_cast<TWinControlForm*>(KilnRoot(Frame)->DesignWindow());
  ASSERT_NE(Window, nullptr);
  auto* Control = static_cast<TWinControl*>(Frame->GetRoot());
  EXPECT_EQ(Window->Control(), Control);
  EXPECT_EQ(Control->Parent(), Window);
  EXPECT_EQ(Control->Owner(), Window);
  EXPECT_EQ(Window->Caption(), "Frame1");
  EXPECT_EQ(Window->Tag(), 93);
  EXPECT_FALSE(Window->Sizing());
  EXPECT_FALSE(Window->HorzScrollBar()->Visible());
  EXPECT_FALSE(Window->VertScrollBar()->Visible());
  for (int Tag = 1; Tag <= 3; ++Tag) {
    ASSERT_NE(Window->Sizer(Tag), nullptr);
    EXPECT_FALSE(Window->Sizer(Tag)->Visible());
  }
  EXPECT_EQ(Control->Left(), 0);
  EXPECT_EQ(Control->Top(), 0);
  EXPECT_EQ(Window->ClientWidth(), Control->Width());
  EXPECT_EQ(Window->ClientHeight(), Control->Height());
  Window->SetBounds(Window->Left(), Window->Top(), 500, 420);
  EXPECT_EQ(Control->Width(), Window->ClientWidth());
  EXPECT_EQ(Control->Height(), Window->ClientHeight());
}

TEST_F(PlainModuleFormsTest, WithSizingOnlyTheHandlesResizeTheControl) {
  TWinControlForm* Window = TWinControlForm::CreateFor(nullptr, true);
  auto Free = Finally([&]() noexcept { Window->Destroy(); });
  // The stored window and its handles, before a control arrives.
  EXPECT_EQ(Window->ClientWidth(), 435);
  EXPECT_EQ(Window->ClientHeight(), 266);
  EXPECT_EQ(Window->Left(), 8);
  EXPECT_EQ(Window->Top(), 8);
  EXPECT_EQ(Window->WidthHandle()->Name(), "WidthHandle");
  EXPECT_EQ(Window->WidthHandle()->BoundsRect(), Rect(36, 8, 45, 17));
  EXPECT_EQ(Window->SizeHandle()->BoundsRect(), Rect(36, 24, 45, 33));
  EXPECT_EQ(Window->HeightHandle()->BoundsRect(), Rect(36, 40, 45, 49));
  EXPECT_EQ(Window->WidthHandle()->Tag(), 1);
  EXPECT_EQ(Window->SizeHandle()->Tag(), 3);
  EXPECT_EQ(Window->HeightHandle()->Tag(), 2);
  EXPECT_EQ(Window->WidthHandle()->Cursor(), crSizeWE);
  EXPECT_EQ(Window->SizeHandle()->Cursor(), crSizeNWSE);
  EXPECT_EQ(Window->HeightHandle()->Cursor(), crSizeNS);
  EXPECT_EQ(Window->SizeHandle()->Brush()->Color(), clBlack);

  auto* Panel = CreateComponentOf<TPanel>(nullptr);
  Panel->SetName("Panel1");
  Panel->SetBounds(10, 20, 100, 60);
  Window->Initialize(Panel, true);
  EXPECT_TRUE(Window->HorzScrollBar()->Visible());
  EXPECT_EQ(Window->Caption(), "Panel1");
  EXPECT_EQ(Panel->Owner(), Window);
  // Each handle is 5 by 5 at its edge of the control.
  EXPECT_EQ(Window->WidthHandle()->BoundsRect(), Rect(110, 20, 115, 25));
  EXPECT_EQ(Window->SizeHandle()->BoundsRect(), Rect(110, 80, 115, 85));
  EXPECT_EQ(Window->HeightHandle()->BoundsRect(), Rect(10, 80, 15, 85));
  EXPECT_TRUE(Window->SizeHandle()->Visible());
  EXPECT_FALSE(Window->SizeHandle()->IsDesigning());

  // The window does not pull the control along.
  Window->SetBounds(0, 0, 700, 500);
  EXPECT_EQ(Panel->BoundsRect(), Rect(10, 20, 110, 80));
  // The corner handle, in its own coordinates, grows the control both ways.
  TShape* Corner = Window->SizeHandle();
  Corner->MouseDown(mbLeft, {}, 2, 2);
  EXPECT_EQ(Window->DragTag(), 3);
  EXPECT_FALSE(Window->AutoRangeEnabled());
  Corner->MouseMove({}, 42, 12);
  EXPECT_EQ(Panel->BoundsRect(), Rect(10, 20, 150, 90));
  EXPECT_EQ(Corner->BoundsRect(), Rect(150, 90, 155, 95));
  Corner->MouseUp(mbLeft, {}, 42, 12);
  EXPECT_EQ(Window->DragTag(), 0);
  EXPECT_TRUE(Window->AutoRangeEnabled());
  // The width handle moves the right edge only; a move without a drag does nothing.
  Window->DragStart(1, 150, 20);
  Window->DragMove(130, 300);
  Window->DragEnd();
  EXPECT_EQ(Panel->BoundsRect(), Rect(10, 20, 130, 90));
  Window->DragMove(400, 400);
  EXPECT_EQ(Panel->BoundsRect(), Rect(10, 20, 130, 90));
  Window->RemoveComponent(Panel);
  Panel->Destroy();
}

} // namespace
} // namespace formkit::fakes
