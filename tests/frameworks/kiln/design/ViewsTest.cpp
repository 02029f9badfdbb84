//===- tests/frameworks/kiln/design/ViewsTest.cpp - Alternate views of a module ===//
//
// A Kiln module whose host keeps views: views added, saved beside the master as
// their differences, closed with it and made again from the view list when the
// master reopens, removed; the view shown; the master's edits reaching its
// views; the messages a user meets.
//
//===----------------------------------------------------------------------===//
#include "core/DesignNotifications.h"
#include "core/IDECreators.h"
#include "frameworks/kiln/KilnGraphics.h"
#include "platform/DeviceInfo.h"
#include "tests/frameworks/kiln/design/ModuleFilesFixture.h"

#include <cstring>

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// Hears the views added to and removed from a module.
class TViewWatcher : public TInterfacedObject, public IDesignNotificationViews {
  FK_CLASS(TViewWatcher, TInterfacedObject)
  FK_INTERFACES(IDesignNotificationViews)
  explicit TViewWatcher(TCallLog* Log = nullptr) : Log(Log) {}
  void ItemDeleted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemInserted(const IPtr<IDesigner>&, TPersistent*) override {}
  void ItemsModified(const IPtr<IDesigner>&) override {}
  void SelectionChanged(const IPtr<IDesigner>&, const IPtr<IDesignerSelections>&) override {}
  void DesignerOpened(const IPtr<IDesigner>&, bool) override {}
  void DesignerClosed(const IPtr<IDesigner>&, bool) override {}
  void ViewAdded(const IPtr<IDesigner>& D, const String& Name) override {
    Log->Add("ViewAdded(" + D->GetRoot()->Name() + "," + Name + ")");
  }
  void ViewRemoved(const IPtr<IDesigner>& D, const String& Name) override {
    Log->Add("ViewRemoved(" + D->GetRoot()->Name() + "," + Name + ")");
  }
  TCallLog* Log;
};

/// A view's file as a wizard hands it over: bytes and an age.
class TViewFile : public TInterfacedObject, public IDECreators::IFileAge {
  FK_CLASS(TViewFile, TInterfacedObject)
  FK_INTERFACES(IDECreators::IFileAge)
  TViewFile() = default;
  TViewFile(std::vector<std::uint8_t> Bytes, int Age) : Bytes(std::move(Bytes)), Age(Age) {}
  void Close() override {}
  std::int64_t GetSize() override { return static_cast<std::int64_t>(Bytes.size()); }
  std::int64_t Read(void* Buffer, std::int64_t Count) override {
    auto N = std::min<std::int64_t>(Count, GetSize() - Position);
    std::memcpy(Buffer, Bytes.data() + Position, static_cast<std::size_t>(N));
    Position += N;
    return N;
  }
  void Open() override { Position = 0; }
  String GetFileName() override { return ""; }
  bool GetIsReadOnly() override { return false; }
  int GetAge() override { return Age; }
  void SetAge(int Value) override { Age = Value; }
  std::vector<std::uint8_t> Bytes;
  int Age = 0;
  std::int64_t Position = 0;
};

/// The record of a module a wizard makes: it brings the files of some views.
class TWizardModule : public TViewRecordingModule, public IDECreators::IDesignerViewsCreator {
  FK_CLASS(TWizardModule, TViewRecordingModule)
  FK_INTERFACES(IDECreators::IDesignerViewsCreator)
  using TViewRecordingModule::TViewRecordingModule;
  bool GetAddListedViews() override { return AddListed; }
  int GetViewCount() override { return static_cast<int>(Views.size()); }
  void GetViewName(int Index, String& Name) override { Name = Views[static_cast<std::size_t>(Index)].first; }
  void GetViewFile(int Index, IPtr<IInterface>& File) override {
    File = InterfaceOf<IDECreators::IFileAge>(New<TViewFile>(Views[static_cast<std::size_t>(Index)].second, 1234).Get());
  }
  bool AddListed = false;
  std::vector<std::pair<String, std::vector<std::uint8_t>>> Views;
};

} // namespace

FK_IMPLEMENT(TViewWatcher, "ViewsTest") {}
FK_IMPLEMENT(TViewFile, "ViewsTest") {}
FK_IMPLEMENT(TWizardModule, "ViewsTest") {}

namespace {

struct ViewsTest : ModuleFilesTest {
  IPtr<TViewRecordingModule> Module;
  IPtr<IRoot> Master;

  void SetUp() override {
    ModuleFilesTest::SetUp();
    TDeviceInfo::AddDevice("Phone", {{"Size", "360x640"}});
  }
  void TearDown() override {
    Master = nullptr;
    Module = nullptr;
    TDeviceInfo::ClearDevices();
    ModuleFilesTest::TearDown();
  }
  /// A new master "Form1" with a button "Go" at (8, 8).
  void NewMaster() {
    Module = New<TViewRecordingModule>(PathOf("Form1.kfm"), &Log);
    Master = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf("Form1.kfm"), false, "Form1", "",
                                  "", nullptr, "");
    Open.push_back(Master);
    auto* Button = static_cast<TButton*>(
        KilnRoot(Master)->CreateComponent(TButton::StaticClass(), Master->GetRoot(), 8, 8, 75, 25));
    Button->SetCaption("Go");
  }
  /// Opens Form1.kfm again with the view list `Views` kept by its new module record.
  IPtr<IRoot> Reopen(std::vector<String> Views) {
    Module = New<TViewRecordingModule>(PathOf("Form1.kfm"), &Log);
    Module->ViewList = std::move(Views);
    Master = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), PathOf("Form1.kfm"), true, "", "", "",
                                  nullptr, "");
    Open.push_back(Master);
    return Master;
  }
  static TControl* Control(const IPtr<IRoot>& Root, const String& Name) {
    return static_cast<TControl*>(Root->GetRoot()->FindComponent(Name));
  }
  static String Message(const std::function<void()>& Action) {
    try {
      Action();
    } catch (const Exception& E) {
      return String(E.ClassName()) + ": " + E.Message();
    }
    return "no exception";
  }
};

} // namespace

TEST_F(ViewsTest, AViewIsSavedBesideItsMasterAsItsDifferencesAndComesBackWithIt) {
  auto Watcher = New<TViewWatcher>(&Log);
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(Watcher.Get()));
  NewMaster();
  EXPECT_EQ(Master->AddView("Tall"), 0);
  EXPECT_EQ(Master->AddView("Phone"), 1);
  EXPECT_EQ(Module->ViewList, (std::vector<String>{"Tall= ", "Phone=360x640"}));
  EXPECT_EQ(Log.Count("ViewAdded(Form1,Tall)"), 1);
  IPtr<IRoot> Tall = Master->GetView(0);
  EXPECT_EQ(Tall->GetFileName(), PathOf("Form1.Tall.kfm"));
  EXPECT_EQ(Tall->GetRoot()->Name(), "Form1_Tall");
  EXPECT_EQ(Tall->GetMasterView().Get(), Master.Get());
  EXPECT_TRUE(KilnRoot(Tall)->IsView());
  EXPECT_EQ(Master->GetMasterView(), nullptr);
  EXPECT_EQ(Master->GetViewName(1), "Phone");

  // The view inherits the button and moves it in its own layout.
  Control(Tall, "Button1")->SetLeft(100);
  KilnRoot(Tall)->Modified();
  Master->Save();
  String TallText = TextOf(ToTextForm(FileBytes(PathOf("Form1.Tall.kfm"))));
  EXPECT_NE(TallText.find("inherited Form1_Tall: TForm1_Tall"), String::npos) << TallText;
  EXPECT_NE(TallText.find("Left = 100"), String::npos) << TallText;
  EXPECT_EQ(TallText.find("Caption = 'Go'"), String::npos) << "a view keeps only its differences:\n" << TallText;
  EXPECT_TRUE(Exists(PathOf("Form1.Phone.kfm")));

  // Closing the master closes its views, the last first; they stay its views.
  Master->Close();
  EXPECT_EQ(Tall->GetRoot(), nullptr);
  EXPECT_EQ(Master->GetViewCount(), 2);
  Open.clear();

  IPtr<IRoot> Again = Reopen(Module->ViewList);
  ASSERT_EQ(Again->GetViewCount(), 2);
  IPtr<IRoot> TallAgain = Again->GetView(Again->GetViewIndex("TALL"));
  EXPECT_EQ(Control(TallAgain, "Button1")->Left(), 100);
  EXPECT_EQ(static_cast<TButton*>(Control(TallAgain, "Button1"))->Caption(), "Go");
  EXPECT_EQ(Control(Again, "Button1")->Left(), 8);
  UnregisterDesignNotification(InterfaceOf<IDesignNotification>(Watcher.Get()));
}

TEST_F(ViewsTest, TheMastersEditsReachItsViewsWhereTheyHaveNotChangedTheirOwn) {
  NewMaster();
  IPtr<IRoot> Tall = Master->GetView(Master->AddView("Tall"));
  Control(Tall, "Button1")->SetLeft(100);
  KilnRoot(Tall)->Modified();

  TControl* Button = Control(Master, "Button1");
  Button->SetBounds(20, 30, 75, 25);
  static_cast<TButton*>(Button)->SetCaption("Start");
  KilnRoot(Master)->CreateComponent(TEdit::StaticClass(), Master->GetRoot(), 8, 48, 121, 23);
  KilnRoot(Master)->Modified();

  EXPECT_EQ(Control(Tall, "Button1")->Left(), 100) << "the view's own value stays";
  EXPECT_EQ(Control(Tall, "Button1")->Top(), 30);
  EXPECT_EQ(static_cast<TButton*>(Control(Tall, "Button1"))->Caption(), "Start");
  ASSERT_NE(Control(Tall, "Edit1"), nullptr);

  // A component made on a view is made on the master; the view gets it from there.
  KilnRoot(Tall)->CreateComponent(TLabel::StaticClass(), Tall->GetRoot(), 8, 100, 65, 17);
  EXPECT_NE(Control(Master, "Label1"), nullptr);
  ASSERT_NE(Control(Tall, "Label1"), nullptr);
  EXPECT_EQ(KilnRoot(Tall)->GetSelection()->Get(0), Control(Tall, "Label1"));

  // A component inserted into a view by any other route is refused.
  EXPECT_EQ(Message([&] { KilnRoot(Tall)->CanInsertComponent(nullptr); }),
            "EComponentDesignerException: This component can only be created on the Master View");

  // Renaming the master's root renames the views' roots after it.
  Master->GetRoot()->SetName("MainForm");
  EXPECT_EQ(Tall->GetRoot()->Name(), "MainForm_Tall");
}

TEST_F(ViewsTest, NamesAndIndexesOutsideTheListAreRefusedAndChangeNothing) {
  NewMaster();
  IPtr<IRoot> Tall = Master->GetView(Master->AddView("Tall"));
  std::vector<String> List = Module->ViewList;

  EXPECT_EQ(Message([&] { Master->AddView("tall"); }),
            "EComponentDesignerException: View \"tall\" already exists in module");
  EXPECT_EQ(Message([&] { Tall->AddView("TALL"); }),
            "EComponentDesignerException: View \"TALL\" already exists in module");
  EXPECT_EQ(Message([&] { Master->AddView("Two words"); }),
            "EComponentDesignerException: \"Two words\" is not a valid view name");
  EXPECT_EQ(Message([&] { Master->RemoveView("Wide"); }),
            "EComponentDesignerException: View \"Wide\" does not exist in module");
  EXPECT_EQ(Message([&] { Master->RemoveView(3); }), "EListError: List index out of bounds (3)");
  EXPECT_EQ(Message([&] { Master->GetView(-1); }), "EListError: List index out of bounds (-1)");
  EXPECT_EQ(Message([&] { Master->GetViewName(1); }), "EListError: List index out of bounds (1)");
  EXPECT_EQ(Module->ViewList, List);
  EXPECT_EQ(Master->GetViewCount(), 1);

  // A view has no views of its own, yet answers for its master's list.
  EXPECT_EQ(Tall->GetViewCount(), 0);
  EXPECT_EQ(Tall->GetViewIndex("TALL"), 0);
}

TEST_F(ViewsTest, AModuleWhoseHostKeepsNoViewsHasNone) {
  IPtr<IRoot> Form = NewForm("Form1");
  EXPECT_EQ(Form->AddView("Tall"), -1);
  EXPECT_EQ(Form->GetViewCount(), 0);
  EXPECT_NO_THROW(Form->RemoveView(0));
  EXPECT_EQ(Form->GetActiveView().Get(), Form.Get());

  // A descendant of another module is a master, not a view.
  IPtr<IRoot> Child = NewDescendant("Form2", "Form1");
  EXPECT_EQ(Child->GetMasterView(), nullptr);
  EXPECT_FALSE(KilnRoot(Child)->IsView());
}

TEST_F(ViewsTest, TheActiveViewIsTheMastersOrOneOfItsViews) {
  NewMaster();
  IPtr<IRoot> Tall = Master->GetView(Master->AddView("Tall"));
  IPtr<IRoot> Wide = Master->GetView(Master->AddView("Wide"));
  EXPECT_EQ(Master->GetActiveView().Get(), Master.Get());

  KilnRoot(Master)->SetActiveView(Wide);
  EXPECT_EQ(Master->GetActiveView().Get(), Wide.Get());
  EXPECT_EQ(Tall->GetActiveView().Get(), Wide.Get()) << "a view answers for its master";
  KilnRoot(Master)->SetActiveView(nullptr);
  EXPECT_EQ(Master->GetActiveView().Get(), Wide.Get());

  // Showing a view makes it the active one.
  Tall->Show();
  EXPECT_EQ(Master->GetActiveView().Get(), Tall.Get());
  KilnRoot(Master)->SetActiveView(Master);
  EXPECT_EQ(Master->GetActiveView().Get(), Master.Get());

  IPtr<IRoot> Other = NewForm("Other");
  EXPECT_EQ(Message([&] { KilnRoot(Master)->SetActiveView(Other); }), "EArgumentException: Invalid argument");
  EXPECT_EQ(Master->GetActiveView().Get(), Master.Get());

  // Removing the active view leaves the index as it was: the caller shows another first.
  KilnRoot(Master)->SetActiveView(Wide);
  Master->Show();
  Master->RemoveView("Wide");
  EXPECT_EQ(Message([&] { Master->GetActiveView(); }), "EListError: List index out of bounds (1)");
  KilnRoot(Master)->SetActiveView(Master);
}

TEST_F(ViewsTest, ARemovedViewLeavesTheListAndIsClosed) {
  auto Watcher = New<TViewWatcher>(&Log);
  RegisterDesignNotification(InterfaceOf<IDesignNotification>(Watcher.Get()));
  NewMaster();
  IPtr<IRoot> Tall = Master->GetView(Master->AddView("Tall"));
  Master->AddView("Phone");
  int Roots = Designer->GetRootsCount();
  Tall->RemoveView(0);
  EXPECT_EQ(Module->ViewList, (std::vector<String>{"Phone=360x640"}));
  EXPECT_EQ(Tall->GetRoot(), nullptr);
  EXPECT_EQ(Designer->GetRootsCount(), Roots - 1);
  EXPECT_EQ(Master->GetViewName(0), "Phone");
  EXPECT_EQ(Log.Count("ViewRemoved(Form1,Tall)"), 1);
  UnregisterDesignNotification(InterfaceOf<IDesignNotification>(Watcher.Get()));
}

TEST_F(ViewsTest, AWizardsViewsAndTheListedOnesShareOneOrder) {
  NewMaster();
  IPtr<IRoot> Tall = Master->GetView(Master->AddView("Tall"));
  Control(Tall, "Button1")->SetLeft(100);
  KilnRoot(Tall)->Modified();
  Master->AddView("Wide");
  Master->AddView("Square");
  Master->Save();
  std::vector<std::uint8_t> TallBytes = FileBytes(PathOf("Form1.Tall.kfm"));
  std::vector<std::uint8_t> SquareBytes = FileBytes(PathOf("Form1.Square.kfm"));
  Master->Close();
  Open.clear();

  // The list names Wide and Tall; the wizard brings Tall's file and a new Square. The
  // wizard's views are made first, and then take the list's order.
  auto Wizard = New<TWizardModule>(PathOf("Form1.kfm"), &Log);
  Wizard->ViewList = {"Wide= ", "Tall= "};
  Wizard->AddListed = true;
  Wizard->Views = {{"Tall", TallBytes}, {"Square", SquareBytes}};
  std::filesystem::remove(PathOf("Form1.Tall.kfm"));
  Master = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Wizard.Get()), PathOf("Form1.kfm"), true, "", "", "",
                                nullptr, "");
  Open.push_back(Master);
  ASSERT_EQ(Master->GetViewCount(), 3);
  EXPECT_EQ(Wizard->ViewList, (std::vector<String>{"Wide= ", "Tall= ", "Square= "}));
  EXPECT_EQ(Master->GetViewName(0), "Wide");
  EXPECT_EQ(Master->GetViewName(1), "Tall");
  EXPECT_EQ(Master->GetViewName(2), "Square");
  EXPECT_EQ(Control(Master->GetView(1), "Button1")->Left(), 100);
  EXPECT_EQ(Master->GetView(1)->GetTimeAtLoad(), 1234);

  // So an index names the same view in both.
  Master->RemoveView(1);
  EXPECT_EQ(Wizard->ViewList, (std::vector<String>{"Wide= ", "Square= "}));
  EXPECT_EQ(Master->GetViewName(1), "Square");
  Master->Close();
  Open.clear();

  // Without the listed views, the list keeps only the views the wizard brought.
  Wizard = New<TWizardModule>(PathOf("Form1.kfm"), &Log);
  Wizard->ViewList = {"Wide= ", "Tall= "};
  Wizard->Views = {{"Tall", TallBytes}};
  Master = Designer->CreateRoot(InterfaceOf<IDesignerModule>(Wizard.Get()), PathOf("Form1.kfm"), true, "", "", "",
                                nullptr, "");
  Open.push_back(Master);
  EXPECT_EQ(Master->GetViewCount(), 1);
  EXPECT_EQ(Wizard->ViewList, (std::vector<String>{"Tall= "}));
}

TEST_F(ViewsTest, AViewThatCannotBeReadLeavesNoModuleOpen) {
  NewMaster();
  Master->Save();
  Master->Close();
  Open.clear();
  int Roots = Designer->GetRootsCount();
  String Error = Message([&] { Reopen({"Tall= "}); });
  Open.clear();
  EXPECT_NE(Error.find("Form1.Tall.kfm"), String::npos) << Error;
  EXPECT_EQ(Designer->GetRootsCount(), Roots);
}

TEST_F(ViewsTest, AMasterSleepsWithItsViewsAndEachWakesWhenAsked) {
  NewMaster();
  IPtr<IRoot> Tall = Master->GetView(Master->AddView("Tall"));
  Control(Tall, "Button1")->SetLeft(100);
  KilnRoot(Tall)->Modified();
  Master->GoDormant();
  EXPECT_TRUE(QueryAs<IInternalRoot>(Tall)->IsDormant());
  Log.Clear();
  QueryAs<IInternalRoot>(Master)->Resurrect();
  EXPECT_TRUE(QueryAs<IInternalRoot>(Tall)->IsDormant()) << "a view comes back when it is asked for";
  QueryAs<IInternalRoot>(Tall)->Resurrect();
  EXPECT_EQ(Control(Tall, "Button1")->Left(), 100);
  EXPECT_EQ(Tall->GetMasterView().Get(), Master.Get());
  EXPECT_EQ(Log.Count("ModuleResurrected"), 1) << "only the master tells the module it came back";
}

TEST_F(ViewsTest, PreviewsDrawAViewOrTheFrameOfADevice) {
  NewMaster();
  Master->AddView("Tall");
  TObjectGuard<TBitmap> Picture(new TBitmap);
  Master->GetViewPreview("", Picture.Get());
  EXPECT_TRUE(Picture->Canvas()->Lines().empty());
  Master->GetViewPreview("tall", Picture.Get());
  EXPECT_GT(Picture->Width(), 0);
  EXPECT_NE(Picture->Canvas()->Text().find("TextOut(10,10,\"Button1\")"), String::npos) << Picture->Canvas()->Text();
  EXPECT_FALSE(KilnRoot(Master->GetView(0))->PreviewOutOfDate());

  Picture->Canvas()->ClearLines();
  Picture->SetSize(360, 640);
  Master->GetViewPreview("Phone", Picture.Get());
  EXPECT_EQ(Picture->Canvas()->Text(), "FrameRect(0,0,360,640)\nTextOut(4,4,\"Phone\")\n");
}
