//===- tests/frameworks/kiln/design/KilnValueEditorsTest.cpp - Cursors, shortcuts, results, files ===//
//
// Cursors by name with their pictures in the list, shortcuts by their text,
// modal results by name, file names through the open dialog, and the editors
// the Kiln package registers for Kiln's properties.
//
//===----------------------------------------------------------------------===//
#include "tests/frameworks/kiln/design/KilnEditorsFixture.h"

#include "core/DesignCore.h"
#include "editors/EditorRegistry.h"
#include "frameworks/kiln/KilnCursors.h"
#include "platform/IniFiles.h"
#include "platform/ScopeGuard.h"

#include <cstdio>
#include <unistd.h>


using namespace formkit;
using namespace formkit::fakes;

namespace {

using Texts = std::vector<String>;

struct KilnValueEditorsTest : KilnEditorsFixture {
  void TearDown() override {
    ScreenCursors().Clear();
    KilnEditorsFixture::TearDown();
  }
  /// An editor of class `Class` for property `Name` of `G`, made as the registry makes one.
  IPtr<IProperty> EditorFor(TClass Class, TValueGadget* G, const String& Name) {
    TNewPropertyEditor E = NewPropertyEditor(Class, FormDesigner, 1);
    E.Editor->SetPropEntry(0, G, GetPropInfo(TValueGadget::StaticClass()->TypeInfo(), Name));
    E.Editor->Initialize();
    return E.Prop;
  }
};

TEST_F(KilnValueEditorsTest, CursorsShowTheirNamesAndAreListedWithTheirPictures) {
  auto* Button = Make<TButton>();
  IPtr<IProperty> P = PropertyOf({Button}, "Cursor");
  ASSERT_TRUE(EditorOf<TCursorProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paSortList, paValueList, paRevertable}));
  EXPECT_EQ(P->GetValue(), "crDefault");
  P->SetValue("CRHANDPOINT");
  EXPECT_EQ(Button->Cursor(), crHandPoint);
  EXPECT_EQ(P->GetValue(), "crHandPoint");
  P->SetValue("5");
  EXPECT_EQ(P->GetValue(), "5");
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("crPointyHat"); }),
            "'crPointyHat' is not a valid integer value");
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("40000"); }), "Value must be between -32768 and 32767");
  EXPECT_EQ(Button->Cursor(), 5);
  Texts Values = ValuesOf(P);
  ASSERT_EQ(Values.size(), 22u);
  EXPECT_EQ((Texts{Values[0], Values[1], Values[2]}), (Texts{"crDefault", "crNone", "crArrow"}));

  auto List = QueryAs<ICustomPropertyListDrawing>(P);
  List->ListDrawValue("crHandPoint", Canvas.Get(), Rect(0, 0, 200, 40), false);
  EXPECT_EQ(Drawn(), (Texts{"FillRect(0,0,200,40)", "Draw(10,2,crHandPoint 32x32)", "FillRect(36,0,200,40)",
                            "TextRect(45,0,200,40,45,14,\"crHandPoint\")"}));
  // A number the screen has no cursor for is listed without a picture; one the program
  // added is drawn with its own.
  List->ListDrawValue("5", Canvas.Get(), Rect(0, 0, 200, 40), false);
  EXPECT_EQ(Drawn(), (Texts{"FillRect(0,0,200,40)", "FillRect(36,0,200,40)", "TextRect(45,0,200,40,45,14,\"5\")"}));
  ScreenCursors().Add(5, "Pencil");
  PropertyDrawingOffset = 0;
  List->ListDrawValue("5", Canvas.Get(), Rect(0, 0, 200, 40), false);
  EXPECT_EQ(Drawn()[1], "Draw(2,2,Pencil 32x32)");
  EXPECT_EQ(ErrorOf<EInvalidOperation>([] { ScreenCursors().Add(-3, "Cross"); }), "Cursor -3 is built in");

  int Width = 10, Height = 16;
  List->ListMeasureWidth("crArrow", Canvas.Get(), Width);
  List->ListMeasureHeight("crArrow", Canvas.Get(), Height);
  EXPECT_EQ(Width, 46);
  EXPECT_EQ(Height, 36) << "the picture is taller than a line";
}

TEST_F(KilnValueEditorsTest, ShortcutsShowTheirTextAndRefuseTextsThatAreNoShortcut) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "ShortCut");
  ASSERT_TRUE(EditorOf<TShortCutProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paValueList, paRevertable}));
  EXPECT_EQ(P->GetValue(), "(None)");
  P->SetValue("ctrl+s");
  EXPECT_EQ(G->FShortCut, scCtrl | 'S');
  EXPECT_EQ(P->GetValue(), "Ctrl+S");
  P->SetValue("Alt+Shift+Del");
  EXPECT_EQ(P->GetValue(), "Shift+Alt+Del");
  P->SetValue("");
  EXPECT_EQ(G->FShortCut, 0);
  P->SetValue("F5");
  P->SetValue("(none)");
  EXPECT_EQ(G->FShortCut, 0);

  P->SetValue("Shift+F12");
  for (const char* Bad : {"Ctrl+Nothing", "Ctrl+", "Hyper+A", "F13"})
    EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue(Bad); }), "Invalid property value") << Bad;
  EXPECT_EQ(P->GetValue(), "Shift+F12") << "a refused text changes nothing";

  Texts Values = ValuesOf(P);
  ASSERT_EQ(Values.size(), 109u);
  EXPECT_EQ((Texts{Values[0], Values[1], Values[26], Values[27], Values[53], Values[65], Values[77], Values[89]}),
            (Texts{"(None)", "Ctrl+A", "Ctrl+Z", "Shift+Ctrl+A", "F1", "Ctrl+F1", "Shift+F1", "Shift+Ctrl+F1"}));
  EXPECT_EQ((Texts(Values.end() - 8, Values.end())),
            (Texts{"Ins", "Shift+Ins", "Ctrl+Ins", "Del", "Shift+Del", "Ctrl+Del", "Alt+BkSp", "Shift+Alt+BkSp"}));
  // Every offered text reads back as the shortcut it shows.
  for (size_t I = 1; I < Values.size(); ++I) EXPECT_EQ(ShortCutToText(TextToShortCut(Values[I])), Values[I]);
}

TEST_F(KilnValueEditorsTest, ModalResultsShowTheirNamesAndNumbersBeyondThem) {
  TValueGadget* G = MakeGadget();
  IPtr<IProperty> P = PropertyOf({G}, "Result");
  ASSERT_TRUE(EditorOf<TModalResultProperty>(P));
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paMultiSelect, paValueList, paRevertable}));
  EXPECT_EQ(ValuesOf(P), (Texts{"mrNone", "mrOk", "mrCancel", "mrAbort", "mrRetry", "mrIgnore", "mrYes", "mrNo",
                                "mrClose", "mrHelp", "mrTryAgain", "mrContinue", "mrAll", "mrNoToAll", "mrYesToAll"}));
  P->SetValue("MROK");
  EXPECT_EQ(G->FResult, 1);
  EXPECT_EQ(P->GetValue(), "mrOk");
  P->SetValue("mryestoall");
  EXPECT_EQ(P->GetValue(), "mrYesToAll");
  P->SetValue("15");
  EXPECT_EQ(P->GetValue(), "15");
  P->SetValue("42");
  EXPECT_EQ(G->FResult, 42);
  P->SetValue("-1");
  EXPECT_EQ(P->GetValue(), "-1");
  P->SetValue("");
  EXPECT_EQ(G->FResult, 0);
  EXPECT_EQ(ErrorOf<EDesignPropertyError>([&] { P->SetValue("mrMaybe"); }), "'mrMaybe' is not a valid integer value");
  EXPECT_EQ(G->FResult, 0);

  // The button's modal result is served by it too.
  auto* Button = Make<TButton>();
  IPtr<IProperty> B = PropertyOf({Button}, "ModalResult");
  ASSERT_TRUE(EditorOf<TModalResultProperty>(B));
  B->SetValue("mrCancel");
  EXPECT_EQ(Button->ModalResult(), 2);
}

TEST_F(KilnValueEditorsTest, FileNamesAreChosenWithTheOpenDialog) {
  TValueGadget* G = MakeGadget();
  const String Existing = Format("/tmp/formkit-editors-%d.wav", static_cast<int>(::getpid()));
  WriteFileText(Existing, "RIFF");
  auto Remove = Finally([&]() noexcept { std::remove(Existing.c_str()); });
  G->FFile = "old.txt";

  IPtr<IProperty> P = EditorFor(TFileNameProperty::StaticClass(), G, "File");
  EXPECT_EQ(P->GetAttributes(), (TPropertyAttributes{paDialog, paRevertable, paMultiSelect}));
  DialogScript().Answer(mrOk, {Existing});
  P->Edit();
  EXPECT_EQ(G->FFile, Existing);
  const TShownDialog& Shown = DialogScript().Shown().at(0);
  EXPECT_EQ(Shown.Kind, "OpenDialog");
  EXPECT_EQ(Shown.Prompts, (Texts{"HelpContext=0", "Filter=All Files (*.*)|*.*", "Options=[ofFileMustExist]"}));
  EXPECT_EQ(Shown.Values, (Texts{""})) << "the dialog does not start from the present value";
  DialogScript().Answer(mrOk, {"/tmp/formkit-no-such-file"});
  EXPECT_EQ(ErrorOf<EInvalidOperation>([&] { P->Edit(); }), "File /tmp/formkit-no-such-file does not exist");
  EXPECT_EQ(G->FFile, Existing);

  IPtr<IProperty> Media = EditorFor(TMPFilenameProperty::StaticClass(), G, "File");
  EXPECT_EQ(Media->GetAttributes(), (TPropertyAttributes{paDialog, paRevertable}));
  DialogScript().Answer(mrOk, {"/formkit-no-such-folder/song.wav"});
  EXPECT_EQ(ErrorOf<EInvalidOperation>([&] { Media->Edit(); }), "Path /formkit-no-such-folder does not exist");
  const TShownDialog& MediaShown = DialogScript().Shown().at(2);
  EXPECT_EQ(MediaShown.Prompts,
            (Texts{"HelpContext=25020",
                   "Filter=Media files (*.wav;*.mid;*.avi)|*.wav;*.mid;*.avi|All files (*.*)|*.*",
                   "Options=[ofShowHelp,ofPathMustExist,ofFileMustExist]"}));
  EXPECT_EQ(MediaShown.Values, (Texts{Existing})) << "the media dialog starts from the present value";
  DialogScript().Answer(mrCancel);
  Media->Edit();
  EXPECT_EQ(G->FFile, Existing);
}

TEST_F(KilnValueEditorsTest, ThePackageRegistersTheEditorsForKilnProperties) {
  auto* Button = Make<TButton>();
  EXPECT_TRUE(EditorOf<TCaptionProperty>(PropertyOf({Button}, "Caption")));
  EXPECT_EQ(PropertyOf({Button}, "Caption")->GetAttributes(),
            (TPropertyAttributes{paMultiSelect, paAutoUpdate, paRevertable}));
  EXPECT_TRUE(EditorOf<TTabOrderProperty>(PropertyOf({Button}, "TabOrder")));
  auto* Second = Make<TButton>();
  EXPECT_EQ(PropertyOf({Button, Second}, "TabOrder"), nullptr) << "a tab order is not shown for two buttons";
  EXPECT_EQ(PropertyOf({Button}, "TabOrder")->GetAttributes(), TPropertyAttributes{});
  EXPECT_TRUE(EditorOf<TBooleanProperty>(PropertyOf({Button}, "Enabled")));
  IPtr<IProperty> Style;
  PropertyOf({Button}, "Font")->GetProperties([&](const IPtr<IProperty>& P) {
    if (P->GetName() == "Style") Style = P;
  });
  EXPECT_TRUE(EditorOf<KilnEditors::TSetProperty>(Style));

  // The unit's finalisation runs with the core's stop and forgets the registry key.
  Texts Steps = DesignCoreStepNames();
  EXPECT_NE(std::find(Steps.begin(), Steps.end(), "KilnEditors"), Steps.end());
  BaseRegistryKey = "Software\\Somewhere";
  UnregisterKilnEditors();
  EXPECT_EQ(BaseRegistryKey, "");
}

} // namespace
