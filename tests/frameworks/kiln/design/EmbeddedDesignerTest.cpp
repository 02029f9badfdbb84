//===- tests/frameworks/kiln/design/EmbeddedDesignerTest.cpp - A module designed in an editor tab ===//
//
// The registry of editor sub-views and its host procedures; the sub-view
// "Design" showing a Kiln module in its frame through a wrapper written here for
// the Kiln designer; the context cache following the module and the frame; the
// keys and focus the frame hands to the designed form.
//
//===----------------------------------------------------------------------===//
#include "core/EditorGroups.h"
#include "core/Events.h"
#include "core/root/RootFormEditor.h"
#include "frameworks/kiln/design/EditorFormDesigner.h"
#include "frameworks/kiln/design/FormEditorView.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

TCallLog* ProcLog = nullptr;
void RecordRegistered(const IPtr<INTACustomEditorSubView>& SubView) {
  ProcLog->Add("Registered(" + CastAs<IEditorSubViewOperations>(SubView)->GetCaption() + ")");
}
void RefuseRegistration(const IPtr<INTACustomEditorSubView>&) {
  throw EInvalidOperation("The host has no room for the sub-view");
}
void RecordUnregistered(const IPtr<INTACustomEditorSubView>& SubView) {
  ProcLog->Add("Unregistered(" + CastAs<IEditorSubViewOperations>(SubView)->GetCaption() + ")");
}

/// A sub-view of a package: a caption and a frame class.
class TPackageView : public TCustomEditorView {
  FK_CLASS(TPackageView, TCustomEditorView)
  TPackageView() = default;
  explicit TPackageView(String Caption) : Caption(std::move(Caption)) {}
  String GetCaption() override { return Caption; }
  TClass GetFrameClass() override {
    ++FrameClassAsked;
    return TFrame::StaticClass();
  }
  String Caption;
  int FrameClassAsked = 0;
};

/// The host's record of an open module, with its form editor second (the source first).
class TEditorModule : public TInterfacedObject, public IOTAModule, public IOTAModuleData {
  FK_CLASS(TEditorModule, TInterfacedObject)
  FK_INTERFACES(IOTAModule, IOTAModuleData)
  TEditorModule() = default;
  TEditorModule(String FileName, IPtr<IOTAFormEditor> Form) : FileName(std::move(FileName)), Form(std::move(Form)) {}

  String GetFileName() override { return FileName; }
  int GetModuleFileCount() override { return 2; }
  String GetModuleFileName(int Index) override { return Index == 0 ? "Unit1.pas" : FileName; }
  int AddNotifier(const IPtr<IOTAModuleNotifier>& Notifier) override {
    Notifiers.push_back(Notifier);
    return static_cast<int>(Notifiers.size()) - 1;
  }
  void RemoveNotifier(int Index) override { Notifiers.at(static_cast<std::size_t>(Index)) = nullptr; }
  IPtr<IOTAEditor> GetModuleFileEditor(int Index) override { return Index == 1 ? QueryAs<IOTAEditor>(Form) : nullptr; }
  bool Save(bool, bool) override { return true; }
  /// Tells the notifiers that the module goes, last first, and forgets them.
  bool CloseModule(bool) override {
    for (auto N = Notifiers.rbegin(); N != Notifiers.rend(); ++N)
      if (*N) (*N)->Destroyed();
    Notifiers.clear();
    return true;
  }
  void SetFileName(const String&) override {}
  void SetFileSystem(const String&) override {}
  bool HasObjects() override { return Objects; }

  int LiveNotifiers() const {
    return static_cast<int>(std::count_if(Notifiers.begin(), Notifiers.end(), [](auto& N) { return N != nullptr; }));
  }
  String FileName;
  IPtr<IOTAFormEditor> Form;
  std::vector<IPtr<IOTAModuleNotifier>> Notifiers;
  bool Objects = true;
};

/// The designer hook of the window the Kiln designer stands in: arrow keys with Ctrl
/// (LParam 1) nudge the selection on the module's surface.
class TKilnKeyHook : public TInterfacedObject, public IDesignerNotify, public IDesignerHook {
  FK_CLASS(TKilnKeyHook, TInterfacedObject)
  FK_INTERFACES(IDesignerNotify, IDesignerHook)
  TKilnKeyHook() = default;
  TKilnKeyHook(TKilnSurface* Surface, TCallLog* Log) : Surface(Surface), Log(Log) {}
  void Modified() override {}
  void Notification(TPersistent*, TOperation) override {}
  void ValidateRename(TComponent*, const String&, const String&) override {}
  bool IsDesignMsg(TControl* Sender, TMessage& Message) override {
    Log->Add("IsDesignMsg(" + Sender->Name() + "," + std::to_string(Message.Msg) + ")");
    if (Message.Msg != WM_KEYDOWN || Message.WParam != 0x27) return false;
    Surface->KeyDown(dkRight, Message.LParam == 1 ? TShiftState{ssCtrl} : TShiftState{});
    return true;
  }
  TKilnSurface* Surface = nullptr;
  TCallLog* Log = nullptr;
};

/// The Kiln designer's wrapper, as a host would write it: the module's designer goes into
/// the frame, and the window that holds it takes the keys.
class TKilnEditorWrapper : public TEditorFormDesignerWrapper {
  FK_CLASS(TKilnEditorWrapper, TEditorFormDesignerWrapper)
  TKilnEditorWrapper() = default;
  TKilnEditorWrapper(IPtr<IRoot> Root, IPtr<IOTAModule> Module, TForm* Host, TCallLog* Log)
      : Root(std::move(Root)), Module(std::move(Module)), Host(Host), Log(Log) {}
  void BeforeDestruction() override {
    Root = nullptr;
    Module = nullptr;
    inherited::BeforeDestruction();
  }
  String GetRootClassName() override { return "TForm"; }
  void DisplayDesigner(TObject* ViewObject) override {
    Log->Add("DisplayDesigner");
    Shown = dynamic_cast<TEditorFormDesigner*>(ViewObject);
    Shown->SetActiveDesigner(Root->GetDesigner());
    Shown->SetFocusedControl(Host);
  }
  TEditorFormDesignerWrapper* GetActiveDesignerWrapper() override { return this; }
  void HideDesigner() override {
    Log->Add("HideDesigner");
    if (Shown) Shown->SetFocusedControl(nullptr);
    Shown = nullptr;
  }
  bool IsModule(const IPtr<IOTAModule>& Other) override { return Other.Get() == Module.Get(); }
  bool IsChildView(TObject* ViewObject) override { return Shown && ViewObject == Shown; }
  TEditState GetEditState() override { return {esCanCopy}; }
  bool EditAction(TEditAction Action) override {
    Log->Add("EditAction");
    return Action == eaCopy;
  }
  IPtr<IInterface> GetStructureViewContext() override { return QueryAs<IInterface>(Root); }

  IPtr<IRoot> Root;
  IPtr<IOTAModule> Module;
  TForm* Host = nullptr;
  TCallLog* Log = nullptr;
  TEditorFormDesigner* Shown = nullptr;
};

/// A view object that names its wrapper.
class TWrapperSource : public TInterfacedObject, public IGetEditorFormDesignerWrapper {
  FK_CLASS(TWrapperSource, TInterfacedObject)
  FK_INTERFACES(IGetEditorFormDesignerWrapper)
  TWrapperSource() = default;
  explicit TWrapperSource(TEditorFormDesignerWrapper* Wrapper) : Wrapper(Wrapper) {}
  TEditorFormDesignerWrapper* GetWrapper() override { return Wrapper; }
  TEditorFormDesignerWrapper* Wrapper = nullptr;
};

/// Hears `EvDesignerHidden` and the application's messages.
class TListener : public TObject, public TMessageTarget {
  FK_CLASS(TListener, TObject)
  void Hidden(TObject* Sender) { HiddenFrames.push_back(Sender); }
  void WndProc(TMessage& Message) override {
    AppMessages.push_back(Message.Msg);
    Message.Result = AppAnswer;
  }
  std::vector<TObject*> HiddenFrames;
  std::vector<std::uint32_t> AppMessages;
  std::intptr_t AppAnswer = 0;
};

} // namespace

FK_IMPLEMENT(TPackageView, "EmbeddedDesignerTest") {}
FK_IMPLEMENT(TEditorModule, "EmbeddedDesignerTest") {}
FK_IMPLEMENT(TKilnKeyHook, "EmbeddedDesignerTest") {}
FK_IMPLEMENT(TKilnEditorWrapper, "EmbeddedDesignerTest") {}
FK_IMPLEMENT(TListener, "EmbeddedDesignerTest") {}
FK_IMPLEMENT(TWrapperSource, "EmbeddedDesignerTest") {}

namespace {

struct EmbeddedDesignerTest : KilnDesignFixture {
  IPtr<IRoot> Form;
  IPtr<TEditorModule> Module;
  IPtr<TKilnKeyHook> Hook;
  TForm* Host = nullptr;       // the window of the editor page
  TEditorFormDesigner* Frame = nullptr;
  TKilnEditorWrapper* Wrapper = nullptr;
  TListener Listener;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    InternalRegister();
    EvDesignerHidden->Add(TNotifyEvent::Bind<&TListener::Hidden>(&Listener));
  }
  void TearDown() override {
    ApplicationMessageTarget = nullptr;
    RegisterCustomEditorViewProc = UnregisterCustomEditorViewProc = nullptr;
    ProcLog = nullptr;
    if (Frame) Frame->Destroy();
    if (Host) Host->Destroy();
    if (Wrapper) Wrapper->Destroy();
    InternalUnRegister();
    FreeRegisteredEditorSubViews();
    Module = nullptr;
    Hook = nullptr;
    Form = nullptr;
    KilnDesignFixture::TearDown();
  }

  /// Form1 with Button1 at (8, 8), its host record, the page window with the key hook,
  /// the wrapper and the frame the host makes from the sub-view's frame class.
  void OpenInEditor() {
    Form = NewForm("Form1");
    KilnRoot(Form)->CreateComponent(TButton::StaticClass(), Form->GetRoot(), 8, 8, 75, 25);
    auto* Root = dynamic_cast<TComponentRoot*>(QueryAs<IInternalRoot>(Form)->Implementor());
    Module = New<TEditorModule>("Form1.kfm", Root->GetFormEditor());
    Hook = New<TKilnKeyHook>(KilnSurfaceOf(Form), &Log);
    Host = CreateComponentOf<TForm>(nullptr);
    Host->SetName("EditorPage");
    Host->SetDesigner(Hook.Get());
    Wrapper = new TKilnEditorWrapper(Form, QueryAs<IOTAModule>(Module), Host, &Log);
    TClass FrameClass = FormEditorView()->GetFrameClass();
    Frame = static_cast<TEditorFormDesigner*>(FrameClass->NewInstance());
    RunConstructor(Frame, static_cast<TComponent*>(nullptr));
  }
  IPtr<IInterface> Context() const { return QueryAs<IInterface>(Module); }
  TControl* Button() const { return static_cast<TControl*>(Form->GetRoot()->FindComponent("Button1")); }
};

} // namespace

TEST_F(EmbeddedDesignerTest, SubViewsAreRegisteredWithTheHostAndGoWithTheirPackage) {
  TCallLog Procs;
  ProcLog = &Procs;
  RegisterCustomEditorViewProc = &RecordRegistered;
  UnregisterCustomEditorViewProc = &RecordUnregistered;
  TCustomEditorViewList* List = RegisteredEditorSubViews();
  ASSERT_EQ(List->Count(), 1) << "the sub-view \"Design\" is registered";
  EXPECT_EQ(List->GetViewClass(0), TEditorFormDesigner::StaticClass());
  EXPECT_EQ(List->GetFileCustomEditorView(0), nullptr);

  // A package loads under group 7: its sub-view joins the group; the host hears of it.
  int SavedGroup = CurrentGroup;
  CurrentGroup = 7;
  IPtr<TPackageView> Charts = New<TPackageView>("Charts");
  void* Handle = RegisterEditorSubView(IPtr<INTACustomEditorSubView>(Charts.Get()));
  void* Classic = List->Add(TFrame::StaticClass());
  CurrentGroup = SavedGroup;
  EXPECT_EQ(Procs.Calls, std::vector<String>{"Registered(Charts)"});
  ASSERT_EQ(List->Count(), 3);
  EXPECT_EQ(List->GetCustomEditorView(1).Get(), static_cast<INTACustomEditorSubView*>(Charts.Get()));
  EXPECT_EQ(List->GetCustomEditorView(2), nullptr);
  EXPECT_EQ(List->GetViewClass(1), TFrame::StaticClass());
  EXPECT_EQ(List->GetViewClass(1), TFrame::StaticClass());
  EXPECT_EQ(Charts->FrameClassAsked, 1) << "the frame class is asked once and kept";

  // Bad input leaves the list as it was.
  EXPECT_THROW((void)RegisterEditorSubView(nullptr), EArgumentException);
  try {
    (void)List->GetViewClass(3);
    ADD_FAILURE() << "no exception";
  } catch (const EListError& E) {
    EXPECT_STREQ(E.what(), "List index out of bounds (3)");
  }
  EXPECT_EQ(List->Count(), 3);
  RegisterCustomEditorViewProc = &RefuseRegistration;
  EXPECT_THROW((void)RegisterEditorSubView(IPtr<INTACustomEditorSubView>(Charts.Get())), EInvalidOperation);
  RegisterCustomEditorViewProc = &RecordRegistered;
  EXPECT_EQ(List->Count(), 3) << "a sub-view the host refused is not kept";
  UnregisterEditorSubView(reinterpret_cast<void*>(&Procs)); // no entry of the list
  EXPECT_EQ(List->Count(), 3);

  // Removing by class takes every entry of the class; a handle goes with its host call.
  List->Remove(TFrame::StaticClass());
  EXPECT_EQ(List->Count(), 1);
  (void)Handle;
  (void)Classic;

  // The package goes away: its group's entries leave the list, from the end.
  CurrentGroup = 7;
  Handle = RegisterEditorSubView(IPtr<INTACustomEditorSubView>(Charts.Get()));
  CurrentGroup = SavedGroup;
  ASSERT_EQ(List->Count(), 2);
  NotifyGroupChangeSubscribers(7);
  EXPECT_EQ(List->Count(), 1);
  EXPECT_EQ(List->GetViewClass(0), TEditorFormDesigner::StaticClass());

  // Unregistering tells the host before the entry goes.
  Procs.Clear();
  Handle = RegisterEditorSubView(IPtr<INTACustomEditorSubView>(Charts.Get()));
  UnregisterEditorSubView(Handle);
  EXPECT_EQ(Procs.Calls, (std::vector<String>{"Registered(Charts)", "Unregistered(Charts)"}));
  EXPECT_EQ(List->Count(), 1);
}

TEST_F(EmbeddedDesignerTest, TheDesignSubViewAnswersTheHost) {
  TFormEditorView* View = FormEditorView();
  ASSERT_NE(View, nullptr);
  EXPECT_EQ(View->GetCaption(), "Design");
  EXPECT_EQ(View->GetViewIdentifier(), "Halvern.FormDesignerView");
  EXPECT_TRUE(View->GetCanCloneView());
  EXPECT_EQ(View->GetPriority(), -255);
  EXPECT_EQ(View->GetStructureType(), "Designer.StructureType");
  EXPECT_TRUE(Supports<IOTACustomEditorSubViewStructure>(View));
  EXPECT_TRUE(Supports<IInternalNotifyClosing>(View));
  EXPECT_TRUE(Supports<INTACustomEditorSubView190>(View));

  // It handles a module with objects to design, and nothing else.
  auto Data = New<TEditorModule>("Unit1.kfm", nullptr);
  EXPECT_TRUE(View->Handles(QueryAs<IInterface>(Data)));
  Data->Objects = false;
  EXPECT_FALSE(View->Handles(QueryAs<IInterface>(Data)));
  EXPECT_FALSE(View->Handles(nullptr));

  // The plain base: no caption, no frame, last.
  auto Plain = New<TPackageView>("");
  EXPECT_EQ(Plain->TCustomEditorView::GetPriority(), 2147483647);
  EXPECT_EQ(Plain->TCustomEditorView::GetFrameClass(), nullptr);
  EXPECT_FALSE(Plain->Handles(QueryAs<IInterface>(Data)));
}

TEST_F(EmbeddedDesignerTest, AModuleIsDesignedInItsEditorTabThroughTheKilnWrapper) {
  OpenInEditor();
  TFormEditorView* View = FormEditorView();

  // The context functions walk from the tab's module to the designer.
  IPtr<IDesigner> Designer;
  ASSERT_TRUE(ContextToDesigner(Context(), Designer));
  EXPECT_EQ(Designer->GetRoot(), Form->GetRoot());
  TComponent* Root = nullptr;
  EXPECT_TRUE(ContextToRootComponent(Context(), Root));
  EXPECT_EQ(Root, Form->GetRoot());
  String Name;
  EXPECT_TRUE(ContextToFilename(Context(), Name));
  EXPECT_EQ(Name, "Form1.kfm");
  EXPECT_TRUE(ContextToFormFilename(Context(), Name));
  EXPECT_EQ(Name, Form->GetFileName());
  EXPECT_FALSE(ContextResurrect(Context())) << "a live module is not brought back";
  EXPECT_FALSE(ContextToDesigner(nullptr, Designer));
  EXPECT_EQ(Designer, nullptr);
  EXPECT_FALSE(ContextToFormFilename(nullptr, Name));
  EXPECT_EQ(Name, "");

  // A dormant module comes back as its tab shows it; the wrapper puts it in the frame.
  Form->GoDormant();
  ASSERT_EQ(Form->GetRoot(), nullptr);
  Wrapper->SetMultiview(true);
  View->Display(Context(), Frame);
  ASSERT_NE(Form->GetRoot(), nullptr);
  EXPECT_EQ(Log.Count("DisplayDesigner"), 1);
  EXPECT_EQ(Frame->ActiveDesigner()->GetRoot(), Form->GetRoot());
  EXPECT_EQ(Frame->FocusedControl(), Host);
  EXPECT_EQ(Frame->Color(), clWindow) << "no theme: the window colour behind the form";
  EXPECT_TRUE(Frame->Multiview()) << "the wrapper's multiview shows the selector";
  EXPECT_EQ(Frame->ViewSelector->BoundsRect(), Rect(0, 0, 700, 34));
  EXPECT_EQ(View->GetCachedContext(Frame).Get(), static_cast<IOTAModule*>(Module.Get()));
  EXPECT_EQ(Module->LiveNotifiers(), 1);

  // Edit commands and the structure view go to the active wrapper.
  EXPECT_TRUE(View->EditAction(Context(), eaCopy, Frame));
  EXPECT_EQ(View->GetEditState(Context(), Frame), TEditState{esCanCopy});
  EXPECT_NE(View->GetStructureContext(Context(), Frame), nullptr);
  EXPECT_FALSE(View->EditAction(Context(), eaCopy, &Listener)) << "not a design frame";
  EXPECT_EQ(View->GetEditState(Context(), &Listener), TEditState{});

  // A key typed into the frame reaches the designer through the window's hook.
  KilnRoot(Form)->SelectComponent(Button());
  Hook->Surface = KilnSurfaceOf(Form);
  SendMessage(Frame, WM_KEYDOWN, 0x27, 1);
  EXPECT_EQ(Button()->Left(), 9) << "Ctrl+Right nudged the button";
  EXPECT_EQ(Log.Count("IsDesignMsg(EditorPage,256)"), 1);
  SendMessage(Frame, WM_CHAR, 'a', 0);
  EXPECT_EQ(Log.Count("IsDesignMsg(EditorPage,258)"), 1);
  SendMessage(Frame, WM_SIZE, 0, 0);
  EXPECT_EQ(Log.Count("IsDesignMsg"), 2) << "only key messages go to the hook";
  EXPECT_EQ(SendMessage(Frame, WM_GETDLGCODE, 0, 0), DLGC_WANTALL);

  // The focus message gives the window the focus, unless the view list is being clicked.
  SendMessage(Frame->ViewSelector->cbDeviceSelector, WM_LBUTTONDOWN, 0, 0);
  SendMessage(Frame, CM_EDITORFOCUS, 0, 0);
  EXPECT_NE(GetFocus(), Host);
  SendMessage(Frame->ViewSelector->cbDeviceSelector, WM_LBUTTONUP, 0, 0);
  SendMessage(Frame, CM_EDITORFOCUS, 0, 0);
  EXPECT_EQ(GetFocus(), Host);
  SetFocus(nullptr);

  // A system key asks the application first; its answer ends the message.
  Listener.AppAnswer = 5;
  ApplicationMessageTarget = &Listener;
  EXPECT_EQ(SendMessage(Frame, CN_SYSKEYDOWN, 'F', 0), 5);
  EXPECT_EQ(Listener.AppMessages, std::vector<std::uint32_t>{CM_APPSYSKEYDOWN});

  // The button of a designer open elsewhere asks the page window to bring it back.
  Frame->SetParent(Host);
  Frame->BtnOpenDesigner->Click();
  TMessageTarget* Target = nullptr;
  TMessage Posted;
  ASSERT_TRUE(PeekMessage(Target, Posted, UM_OPENDESIGNER, UM_OPENDESIGNER, true));
  EXPECT_EQ(Target, static_cast<TMessageTarget*>(Host));
  EXPECT_EQ(Frame->LbOpenDesigner->Caption(),
            "This form or frame is being designed in another window.\r\nDo you want to use the designer in this "
            "window instead?");
  EXPECT_EQ(Frame->BtnOpenDesigner->Caption(), "Move Designer");
  // The three centre controls stand in one column, centred in the area below the bar.
  EXPECT_EQ(Frame->VirtualImage1->Left(), (700 - 64) / 2);
  EXPECT_EQ(Frame->BtnOpenDesigner->Left(), (700 - 130) / 2);
  EXPECT_LT(Frame->VirtualImage1->Top(), Frame->LbOpenDesigner->Top());
  EXPECT_LT(Frame->LbOpenDesigner->Top(), Frame->BtnOpenDesigner->Top());

  // The page window goes (a parent frees the controls it holds, so the frame leaves it
  // first): the frame forgets it.
  Frame->SetParent(nullptr);
  Host->Destroy();
  Host = nullptr;
  EXPECT_EQ(Frame->FocusedControl(), nullptr);
  SendMessage(Frame, WM_KEYDOWN, 0x27, 1);
  EXPECT_EQ(Button()->Left(), 9);
}

TEST_F(EmbeddedDesignerTest, TheContextCacheFollowsItsModuleAndItsFrame) {
  OpenInEditor();
  TFormEditorView* View = FormEditorView();
  View->Display(Context(), Frame);
  ASSERT_EQ(View->CachedContextCount(), 1);

  // The tab loses its module while the module lives: the cached one finds the wrapper.
  View->Display(nullptr, Frame);
  EXPECT_EQ(Log.Count("HideDesigner"), 1);
  EXPECT_EQ(Listener.HiddenFrames, std::vector<TObject*>{Frame});
  EXPECT_EQ(View->GetCachedContext(Frame), nullptr);
  EXPECT_EQ(Module->LiveNotifiers(), 0) << "the notifier left the module with the context";

  // Shown again, then the module closes: its notifier clears the cache entry's context.
  View->Display(Context(), Frame);
  TContextCacheItem* Item = View->GetContextCacheItem(Frame);
  ASSERT_NE(Item, nullptr);
  EXPECT_EQ(Item->NotifierIndex(), 1);
  Module->CloseModule(true);
  EXPECT_EQ(Item->NotifierIndex(), -1);
  EXPECT_EQ(View->GetCachedContext(Frame), nullptr);

  // Without a cached module the wrapper standing in the frame hides; while the tab
  // closes, nobody hears of it.
  View->SetClosing(true);
  View->Display(nullptr, Frame);
  EXPECT_EQ(Log.Count("HideDesigner"), 2);
  EXPECT_EQ(Listener.HiddenFrames.size(), 1u);
  View->SetClosing(false);

  // The frame goes: its entry goes with it.
  View->Display(Context(), Frame);
  EXPECT_EQ(Module->LiveNotifiers(), 1);
  Frame->Destroy();
  Frame = nullptr;
  EXPECT_EQ(View->CachedContextCount(), 0);
  EXPECT_EQ(Module->LiveNotifiers(), 0);

  // A view object that is no design frame has no wrapper.
  EXPECT_EQ(View->GetContainerForm(Context(), &Listener), nullptr);
}

TEST_F(EmbeddedDesignerTest, WrappersAreFoundInOrderAndLeaveTheListAsTheyGo) {
  OpenInEditor();
  auto* Second = new TKilnEditorWrapper(Form, QueryAs<IOTAModule>(Module), nullptr, &Log);
  EXPECT_EQ(TEditorFormDesignerWrapper::FindWrapper([](auto*) { return true; }), Wrapper);
  Wrapper->Destroy();
  Wrapper = nullptr;
  EXPECT_EQ(TEditorFormDesignerWrapper::FindWrapper([](auto*) { return true; }), Second);

  // A view object that names its wrapper hands it the tab's context.
  SetViewContext(Context(), Frame); // the frame names none: nothing happens
  EXPECT_EQ(Second->Context(), nullptr);
  auto Source = New<TWrapperSource>(Second);
  SetViewContext(Context(), Source.Get());
  EXPECT_EQ(Second->Context().Get(), Context().Get());
  Second->Destroy();
  EXPECT_EQ(TEditorFormDesignerWrapper::FindWrapper([](auto*) { return true; }), nullptr);
}
