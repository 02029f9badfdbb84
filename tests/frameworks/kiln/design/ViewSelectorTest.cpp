//===- tests/frameworks/kiln/design/ViewSelectorTest.cpp - Picking the view of an embedded module ===//
//
// The view selector of an embedded designer over a Kiln module whose host keeps
// views: the device list with its headers in the device service's order, views
// added, selected and removed (with the user's confirmation), the active
// designer going to its master, a removed package's devices taking their views
// along, and the preview styles the host's platforms offer.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/KilnGraphics.h"
#include "frameworks/kiln/design/EditorFormDesigner.h"
#include "platform/DeviceInfo.h"
#include "tests/frameworks/kiln/design/ModuleFilesFixture.h"

#include <map>

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// The host's services: devices in an order of their own, personalities and platforms.
class TDeviceHost : public TInterfacedObject,
                    public IHalvernIDEServices,
                    public IOTADesignerDeviceServices,
                    public IDesignerDeviceOperations,
                    public IOTAPersonalityServices,
                    public IPersonalityOperations,
                    public IOTAPlatformServices,
                    public IPlatformOperations {
  FK_CLASS(TDeviceHost, TInterfacedObject)
  FK_INTERFACES(IHalvernIDEServices, IOTADesignerDeviceServices, IDesignerDeviceOperations, IOTAPersonalityServices,
                IPersonalityOperations, IOTAPlatformServices, IPlatformOperations)

  bool FindDevice(const String& ID, TDesignerDeviceEntry& Entry) override {
    for (auto& [Name, Known] : Devices)
      if (CompareText(Name, ID) == 0) {
        Entry = Known;
        return true;
      }
    return false;
  }
  String GetCurrentPersonality() override { return "Native"; }
  std::vector<String> GetPersonalityPlatforms(const String& Personality) override {
    return Personality == "Native" ? PersonalityPlatforms : std::vector<String>{};
  }
  std::vector<String> GetAllPlatforms() override {
    std::vector<String> All;
    for (auto& Entry : Platforms) All.push_back(Entry.first);
    return All;
  }
  TOTAOSFamily GetPlatformOSFamily(const String& Platform) override {
    auto Found = Platforms.find(Platform);
    return Found == Platforms.end() ? osfUndefined : Found->second;
  }

  std::map<String, TDesignerDeviceEntry> Devices;
  std::vector<String> PersonalityPlatforms;
  std::map<String, TOTAOSFamily> Platforms;
};

/// The framework's host control around a previewed form.
class TPreviewHost : public TWinControl, public IViewDesignSupport {
  FK_CLASS(TPreviewHost, TWinControl)
  FK_INTERFACES(IViewDesignSupport)
  void RotateView() override { Calls.push_back("RotateView"); }
  void ToggleBackground() override { Calls.push_back("ToggleBackground"); }
  void SelectStyle(TOTAOSFamily Family) override { Calls.push_back("SelectStyle(" + OSFamilyName(Family) + ")"); }
  bool GetLandscape() override { return false; }
  bool GetBackgroundVisible() override { return true; }
  TOTAOSFamily GetStyle() override { return osfWindows; }
  String GetDevice() override { return ""; }
  void SetDevice(const String&) override {}
  int GetZoom() override { return 100; }
  void SetZoom(int) override {}
  void RefreshView() override {}
  std::vector<String> Calls;
};

/// Hears what a bare selector reports.
class TSelectorListener : public TObject {
  FK_CLASS(TSelectorListener, TObject)
  void Added(TObject*, const String& Name) {
    Calls.push_back("Add(" + Name + ")");
    if (Refuse) throw EInvalidOperation("The view cannot be made");
  }
  void Selected(TObject*, const String& Name) { Calls.push_back("Select(" + Name + ")"); }
  void Removed(TObject*, const String& Name) { Calls.push_back("Remove(" + Name + ")"); }
  void Style(TObject*, TOTAOSFamily Family) { Calls.push_back("Style(" + OSFamilyName(Family) + ")"); }
  std::vector<String> Calls;
  bool Refuse = false;
};

} // namespace

FK_IMPLEMENT(TDeviceHost, "ViewSelectorTest") {}
FK_IMPLEMENT(TSelectorListener, "ViewSelectorTest") {}
FK_IMPLEMENT(TPreviewHost, "ViewSelectorTest") {}

namespace {

struct ViewSelectorTest : ModuleFilesTest {
  IPtr<TDeviceHost> Host;
  IPtr<TViewRecordingModule> Module;
  IPtr<IRoot> Master;
  TEditorFormDesigner* Frame = nullptr;
  TViewSelectorFrame* Bare = nullptr;
  TSelectorListener Listener;

  void SetUp() override {
    ModuleFilesTest::SetUp();
    TDeviceInfo::AddDevice("Phone", {{"Size", "360x640"}, {"DisplayName", "Phone (portrait)"}, {"DeviceClass", "3"}});
    TDeviceInfo::AddDevice("Tablet", {{"Size", "768x1024"}, {"DeviceClass", "1"}});
    TDeviceInfo::AddDevice("Watch", {{"Size", "200x200"}});
    TDeviceInfo::AddDevice("Desktop", {{"Size", "1920x1080"}});
    Host = New<TDeviceHost>();
    // Desktop is not offered for the personality; Tablet comes first in the host's order.
    Host->Devices = {{"Phone", {"Phone", 2}}, {"Tablet", {"Tablet", 1}}, {"Watch", {"Apple Watch", 2}}};
    Host->Platforms = {{"Win64", osfWindows}, {"OSX64", osfOSX},     {"iOSDevice64", osfiOS},
                       {"Android", osfAndroid}, {"Linux64", osfLinux}, {"Wasm", osfUndefined}};
    HalvernIDEServices = IPtr<IHalvernIDEServices>(Host.Get());
  }
  void TearDown() override {
    if (Frame) Frame->Destroy();
    if (Bare) Bare->Destroy();
    HalvernIDEServices = nullptr;
    Host = nullptr;
    Master = nullptr;
    Module = nullptr;
    TDeviceInfo::ClearDevices();
    ModuleFilesTest::TearDown();
  }

  /// Master "Form1" with the views `Views`, shown in a new frame.
  void OpenMaster(const std::vector<String>& Views) {
    Module = New<TViewRecordingModule>(PathOf("Form1.kfm"), &Log);
    Master = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf("Form1.kfm"), false, "Form1",
                                  "", "", nullptr, "");
    Open.push_back(Master);
    for (const String& View : Views) Master->AddView(View);
    Frame = CreateComponentOf<TEditorFormDesigner>(nullptr);
    Frame->SetActiveDesigner(Master->GetDesigner());
  }
  TViewSelectorFrame* Selector() const { return Frame->ViewSelector; }
  static std::vector<String> Items(TViewSelectorFrame* S) {
    std::vector<String> All;
    for (int I = 0; I < S->Count(); ++I) All.push_back(S->cbDeviceSelector->Items()->Get(I));
    return All;
  }
  static std::vector<String> Styles(TViewSelectorFrame* S) {
    std::vector<String> All;
    for (int I = 0; I < S->cbStyleSelector->Items()->Count(); ++I) All.push_back(S->cbStyleSelector->Items()->Get(I));
    return All;
  }
  String ActiveViewName() const {
    IPtr<IRoot> Active = Master->GetActiveView();
    for (int I = 0; I < Master->GetViewCount(); ++I)
      if (Master->GetView(I).Get() == Active.Get()) return Master->GetViewName(I);
    return "";
  }
  TViewSelectorFrame* NewBareSelector() {
    Bare = CreateComponentOf<TViewSelectorFrame>(nullptr);
    Bare->OnAddView = TViewNameEvent::Bind<&TSelectorListener::Added>(&Listener);
    Bare->OnSelectView = TViewNameEvent::Bind<&TSelectorListener::Selected>(&Listener);
    Bare->OnRemoveView = TViewNameEvent::Bind<&TSelectorListener::Removed>(&Listener);
    Bare->OnSelectStyle = TViewStyleEvent::Bind<&TSelectorListener::Style>(&Listener);
    return Bare;
  }
};

} // namespace

TEST_F(ViewSelectorTest, TheListShowsTheMasterTheViewsAndTheDevicesInTheServicesOrder) {
  OpenMaster({"Watch", "Phone"});
  EXPECT_EQ(Items(Selector()), (std::vector<String>{"", "*", "Watch", "Phone", "+", "Tablet"}))
      << "by order, then by the device's name (\"Apple Watch\"); Desktop is not offered";
  EXPECT_EQ(Selector()->cbDeviceSelector->DropDownCount(), 6);
  EXPECT_TRUE(Selector()->IsMasterView());
  EXPECT_FALSE(Selector()->btnRemoveView->Enabled()) << "the master cannot be removed";
  EXPECT_FALSE(Selector()->btnShowBackground->Enabled());
  EXPECT_TRUE(Selector()->cbStyleSelector->Visible());
  EXPECT_FALSE(Frame->Multiview()) << "the selector shows only when the wrapper asks";

  // The owner-drawn list: a device by its display name, headers and the master.
  auto* Canvas = new TCanvas;
  TObjectGuard<TCanvas> Guard(Canvas);
  Selector()->cbDeviceSelector->DrawItem(Canvas, 3, Rect(0, 0, 200, 20));
  EXPECT_EQ(Selector()->cbDeviceSelector->ItemLabel(3), "Phone (portrait)");
  EXPECT_EQ(Selector()->cbDeviceSelector->ItemLabel(2), "Watch");
  EXPECT_NE(Canvas->Text().find("Phone (portrait)"), String::npos) << Canvas->Text();
  EXPECT_TRUE(Selector()->cbDeviceSelector->IsHeader(1));
  EXPECT_FALSE(Selector()->cbDeviceSelector->IsHeader(2));

  // Every device has a view: no "+" header.
  Master->AddView("Tablet");
  EXPECT_EQ(Items(Selector()), (std::vector<String>{"", "*", "Tablet", "Watch", "Phone"}));

  // Without the device service only the master stays.
  HalvernIDEServices = nullptr;
  Frame->UpdateViewSelector();
  EXPECT_EQ(Items(Selector()), std::vector<String>{""});
}

TEST_F(ViewSelectorTest, ViewsAreAddedSelectedAndRemovedThroughTheSelector) {
  OpenMaster({"Phone"});

  // Choosing an available device adds its view and stands on it.
  Selector()->SelectView("Tablet");
  ASSERT_EQ(Master->GetViewIndex("Tablet"), 1);
  EXPECT_EQ(Items(Selector()), (std::vector<String>{"", "*", "Tablet", "Phone", "+", "Watch"}));
  EXPECT_EQ(Selector()->cbDeviceSelector->Text(), "Tablet");
  EXPECT_EQ(ActiveViewName(), "Tablet");
  EXPECT_TRUE(Selector()->btnRemoveView->Enabled());
  EXPECT_TRUE(Selector()->btnShowBackground->Enabled());
  EXPECT_FALSE(Selector()->btnRotateView->Enabled()) << "a device of class 1 does not turn";
  EXPECT_FALSE(Selector()->cbStyleSelector->Visible()) << "styles are the master's";

  // An existing view is shown; a phone can turn.
  Selector()->SelectView("Phone");
  EXPECT_EQ(ActiveViewName(), "Phone");
  EXPECT_TRUE(Selector()->btnRotateView->Enabled());
  bool Allowed = false;
  Frame->DoCheckView(nullptr, "Phone", Allowed);
  EXPECT_TRUE(Allowed);
  Frame->DoCheckView(nullptr, "Watch", Allowed);
  EXPECT_FALSE(Allowed);
  Frame->DoCheckView(nullptr, "", Allowed);
  EXPECT_TRUE(Allowed);

  // Deleting asks first; "No" keeps the view.
  DialogScript().Answer(mrNo);
  Selector()->btnRemoveView->Click();
  ASSERT_EQ(DialogScript().Shown().size(), 1u);
  EXPECT_EQ(DialogScript().Shown().back().Message,
            "The action you are about to perform cannot be undone.\r\nAre you sure that you want to delete this "
            "view?");
  EXPECT_EQ(DialogScript().Shown().back().DlgType, mtConfirmation);
  EXPECT_EQ(Master->GetViewCount(), 2);
  EXPECT_EQ(Selector()->cbDeviceSelector->Text(), "Phone");

  // "Yes" removes it; the master is shown and selected again.
  DialogScript().Answer(mrYes);
  Selector()->btnRemoveView->Click();
  EXPECT_EQ(Master->GetViewIndex("Phone"), -1);
  EXPECT_EQ(Items(Selector()), (std::vector<String>{"", "*", "Tablet", "+", "Watch", "Phone"}));
  EXPECT_TRUE(Selector()->IsMasterView());
  EXPECT_EQ(Master->GetActiveView().Get(), Master.Get());
  EXPECT_FALSE(Selector()->btnRemoveView->Enabled());

  // On the master the button asks nothing.
  Selector()->acRemoveViewExecute(nullptr);
  EXPECT_EQ(DialogScript().Shown().size(), 2u);
}

TEST_F(ViewSelectorTest, TheActiveDesignerIsTheMastersAndItsActiveViewIsHighlighted) {
  OpenMaster({"Phone", "Tablet"});
  IPtr<IRoot> Phone = Master->GetView(Master->GetViewIndex("Phone"));
  Phone->Show();
  Frame->SetActiveDesigner(Phone->GetDesigner());
  EXPECT_EQ(QueryAs<IRoot>(Frame->ActiveDesigner()).Get(), Master.Get()) << "a view goes to its master";
  EXPECT_EQ(Selector()->cbDeviceSelector->Text(), "Phone");

  // A designer that is no module changes nothing.
  Frame->SetActiveDesigner(nullptr);
  EXPECT_EQ(QueryAs<IRoot>(Frame->ActiveDesigner()).Get(), Master.Get());

  // The master itself selected: its own layout shows.
  Selector()->SelectView(0);
  EXPECT_EQ(Master->GetActiveView().Get(), Master.Get());
  Frame->SetActiveDesigner(Master->GetDesigner());
  EXPECT_TRUE(Selector()->IsMasterView());
}

TEST_F(ViewSelectorTest, ARemovedPackageTakesItsDevicesViewsAlong) {
  OpenMaster({"Phone", "Tablet"});
  Selector()->SelectView("Phone");
  Frame->PackageNotification("PhoneDevices", poUninstalling);
  EXPECT_EQ(Master->GetViewCount(), 2);

  TDeviceInfo::RemoveDevice("Phone");
  Frame->PackageNotification("PhoneDevices", poUninstalled);
  EXPECT_EQ(Master->GetViewIndex("Phone"), -1);
  EXPECT_EQ(Master->GetViewCount(), 1);
  EXPECT_EQ(Master->GetActiveView().Get(), Master.Get());
  EXPECT_TRUE(Selector()->IsMasterView());
  EXPECT_EQ(Items(Selector()), (std::vector<String>{"", "*", "Tablet", "+", "Watch"}));

  // Installed again: the device is offered, the views stay.
  TDeviceInfo::AddDevice("Phone", {{"Size", "360x640"}});
  Frame->PackageNotification("PhoneDevices", poInstalled);
  EXPECT_EQ(Items(Selector()), (std::vector<String>{"", "*", "Tablet", "+", "Watch", "Phone"}));
}

TEST_F(ViewSelectorTest, ABareSelectorGoesBackWhenAViewIsNotMade) {
  TViewSelectorFrame* S = NewBareSelector();
  EXPECT_EQ(S->Width(), 700);
  EXPECT_EQ(S->Height(), 34);
  EXPECT_EQ(S->btnRemoveView->Hint(), "Remove View|Remove the selected view from the list");
  EXPECT_EQ(S->btnRotateView->Hint(), "Rotate the current view");
  EXPECT_EQ(S->btnShowBackground->Hint(), "Hide or show the form frame");
  EXPECT_EQ(Items(S), (std::vector<String>{"", "+", "Tablet", "Watch", "Phone"}));
  S->HighlightView(0);

  // The listener does not make the view: the selection goes back to the master.
  S->SelectView("Watch");
  EXPECT_EQ(Listener.Calls, std::vector<String>{"Add(Watch)"});
  EXPECT_TRUE(S->IsMasterView());

  // Making it fails: the selection goes back and the failure passes on.
  Listener.Calls.clear();
  Listener.Refuse = true;
  EXPECT_THROW(S->SelectView("Tablet"), EInvalidOperation);
  EXPECT_TRUE(S->IsMasterView());
  Listener.Refuse = false;

  // A header cannot be chosen.
  Listener.Calls.clear();
  S->SelectView(1);
  EXPECT_TRUE(Listener.Calls.empty());
  EXPECT_TRUE(S->IsMasterView());

  // The wheel over the list is the list's.
  TRect R = S->cbDeviceSelector->BoundsRect();
  EXPECT_TRUE(S->FrameMouseWheel({R.Left - 1, R.Top}));
  EXPECT_FALSE(S->FrameMouseWheel({R.Left - 2, R.Top}));

  // The views made come from the owner; rotating and framing report when set.
  TStringList Views;
  Views.Add("Watch");
  S->PopulateViewSelector(&Views);
  EXPECT_EQ(Items(S), (std::vector<String>{"", "*", "Watch", "+", "Tablet", "Phone"}));
  S->SelectView("Watch");
  EXPECT_EQ(Listener.Calls, std::vector<String>{"Select(Watch)"});
  S->Clear();
  EXPECT_EQ(S->Count(), 0);
}

TEST_F(ViewSelectorTest, StylesComeFromThePersonalitysPlatformsAndLinuxIsNeverOffered) {
  TViewSelectorFrame* S = NewBareSelector();
  // The personality names no platform: all of them, but Linux, in the families' order.
  EXPECT_EQ(Styles(S), (std::vector<String>{"Windows", "macOS", "iOS", "Android", "Unknown"}));

  Host->PersonalityPlatforms = {"Linux64", "Android", "Win64"};
  S->PopulateStyleSelector();
  EXPECT_EQ(Styles(S), (std::vector<String>{"Windows", "Android"}));
  EXPECT_EQ(S->PlatformIndexes(), (std::vector<TOTAOSFamily>{osfWindows, osfAndroid}));

  // Selecting a style on the master reports it; a style not offered takes the first.
  S->HighlightView(0);
  S->SelectStyle(osfAndroid);
  S->SelectStyle(osfLinux);
  EXPECT_EQ(Listener.Calls, (std::vector<String>{"Style(Android)", "Style(Windows)"}));
  EXPECT_EQ(S->cbStyleSelector->ItemIndex(), 0);

  // Not on a view.
  S->HighlightView(2);
  S->SelectStyle(osfAndroid);
  EXPECT_EQ(Listener.Calls.size(), 2u);

  // Without platform services there is no style.
  HalvernIDEServices = nullptr;
  S->PopulateStyleSelector();
  EXPECT_TRUE(Styles(S).empty());
  S->HighlightView(0);
  S->SelectStyle(osfWindows);
  EXPECT_EQ(Listener.Calls.size(), 2u);
}

TEST_F(ViewSelectorTest, TheFrameSelectsAPreviewStyleAndKeepsTheSelectionShown) {
  OpenMaster({});
  Host->PersonalityPlatforms = {"iOSDevice64"};
  auto* Button = KilnRoot(Master)->CreateComponent(TButton::StaticClass(), Master->GetRoot(), 8, 8, 75, 25);
  KilnRoot(Master)->SelectComponent(Button);
  Frame->SelectPreviewStyle(osfWindows);
  EXPECT_EQ(Styles(Selector()), std::vector<String>{"iOS"});
  EXPECT_EQ(Selector()->cbStyleSelector->ItemIndex(), 0);
  EXPECT_EQ(KilnRoot(Master)->GetSelection()->Get(0), Button) << "the one object stays selected";
}

TEST_F(ViewSelectorTest, RotateFrameAndStyleGoToTheHostControlAroundTheActiveView) {
  OpenMaster({"Phone"});
  Selector()->SelectView("Phone");
  auto* Preview = CreateComponentOf<TPreviewHost>(nullptr);
  auto Free = Finally([&]() noexcept { Preview->Destroy(); });
  IPtr<IRoot> Phone = Master->GetView(0);
  auto* PhoneForm = static_cast<TControl*>(Phone->GetRoot());

  // No host control around the view: nothing to call.
  Selector()->btnRotateView->Click();
  EXPECT_TRUE(Preview->Calls.empty());

  PhoneForm->SetParent(Preview);
  auto Unparent = Finally([&]() noexcept { PhoneForm->SetParent(nullptr); });
  Selector()->btnRotateView->Click();
  Selector()->btnShowBackground->Click();
  Selector()->SelectView(0);
  Frame->DoSelectStyle(nullptr, osfAndroid); // the master is active now: no host control around it
  EXPECT_EQ(Preview->Calls, (std::vector<String>{"RotateView", "ToggleBackground"}));
  Phone->Show();
  Frame->DoSelectStyle(nullptr, osfAndroid);
  EXPECT_EQ(Preview->Calls.back(), "SelectStyle(Android)");
}
