//===- tests/frameworks/kiln/design/PictureEditorTest.cpp - The picture editor ===//
//
// The picture dialog scripted as a user works it (load, save, clear, OK or
// Cancel), its preview, the two property editors and the component editor that
// open it, and a picture that goes into a module file and comes back.
//
//===----------------------------------------------------------------------===//
#include "editors/EditorRegistry.h"
#include "frameworks/kiln/KilnWindows.h"
#include "frameworks/kiln/design/PicEdit.h"
#include "tests/frameworks/kiln/PictureSamples.h"
#include "tests/frameworks/kiln/design/ModuleFilesFixture.h"

using namespace formkit;
using namespace formkit::fakes;
using namespace formkit::kilntest;

namespace {

/// A control with a graphic property of one narrow class, a picture named "image" and an
/// event.
class TLogo : public TGraphicControl {
  FK_CLASS(TLogo, TGraphicControl)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    FGlyph.Reset(new TPngImage);
    FImage.Reset(new TPicture);
  }
  void BeforeDestruction() override {
    FGlyph.Reset();
    FImage.Reset();
    inherited::BeforeDestruction();
  }
  /// The glyph; null when it holds no pixels.
  TPngImage* Glyph() const { return FGlyph->Empty() ? nullptr : FGlyph.Get(); }
  void SetGlyph(TPngImage* Value) { FGlyph->Assign(Value); }
  TPicture* Image() const { return FImage.Get(); }
  void SetImage(TPicture* Value) { FImage->Assign(Value); }
  TNotifyEvent OnClick;

private:
  TObjectGuard<TPngImage> FGlyph;
  TObjectGuard<TPicture> FImage;
};
FK_IMPLEMENT(TLogo, "PictureEditorTest") {
  B.Property("Glyph", &TLogo::Glyph, &TLogo::SetGlyph);
  B.Property("image", &TLogo::Image, &TLogo::SetImage);
  B.Event("OnClick", &TLogo::OnClick);
}

struct PictureEditorTest : ModuleFilesTest {
  TTempFile Png{".png"}, Bmp{".bmp"}, Bad{".png"}, Saved{".png"};

  void SetUp() override {
    ModuleFilesTest::SetUp();
    WritePatternPng(Png.Name, 6, 4);
    WriteBytes(Bad.Name, {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n', 0, 0, 0});
  }
  /// An editor of `EditorClass` for property `Name` of `Instance`, on the module's designer.
  static IPtr<IProperty> EditorFor(TClass EditorClass, TPersistent* Instance, const char* Name,
                                   const IPtr<IDesigner>& Designer) {
    TNewPropertyEditor E = NewPropertyEditor(EditorClass, Designer, 1);
    E.Editor->SetPropEntry(0, Instance, GetPropInfo(Instance, Name));
    E.Editor->Initialize();
    return E.Prop;
  }
  /// The user's work on the dialog: `Work`, then a click on `Close`.
  static void Answer(std::function<void(TCustomForm&)> Work, const char* Close = "OKButton") {
    DialogScript().AnswerBy([Work, Close](TCustomForm& F) {
      Work(F);
      return ClickButton(F, Close);
    });
  }
  static TPictureEditorDlg& Dlg(TCustomForm& F) { return dynamic_cast<TPictureEditorDlg&>(F); }
  /// The user loads `File` through the open dialog.
  static void LoadFile(TCustomForm& F, const String& File) {
    DialogScript().Answer(mrOk, {File});
    (void)ClickButton(F, "Load");
  }
};

//===----------------------------------------------------------------------===//
// A module's picture
//===----------------------------------------------------------------------===//

TEST_F(PictureEditorTest, APictureLoadedFromAPngIsSavedInTheModuleAndReopensWithItsPixels) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  auto* Image =
      static_cast<TImage*>(KilnRoot(Form)->CreateComponent(TImage::StaticClass(), Form->GetRoot(), 8, 8, 105, 105));
  Log.Clear();
  // A double click on the image opens the dialog on its picture.
  Answer([&](TCustomForm& F) { LoadFile(F, Png.Name); });
  GetComponentEditor(Image, QueryAs<IDesigner>(Form))->Edit();
  ExpectPattern(Image->Picture()->Graphic(), 6, 4);
  EXPECT_NE(Log.Text().find("Modified"), String::npos) << Log.Text();
  EXPECT_EQ(Log.Text().find("CreateMethod"), String::npos) << "no event handler is created";
  Form->Save();
  Form->Close();

  IPtr<IRoot> Again = OpenAt("Form1.kfm");
  auto* Read = dynamic_cast<TImage*>(Again->GetRoot()->FindComponent("Image1"));
  ASSERT_TRUE(Read);
  EXPECT_EQ(Read->Picture()->Graphic()->ClassName(), "TPngImage");
  ExpectPattern(Read->Picture()->Graphic(), 6, 4);
}

TEST_F(PictureEditorTest, ACorruptFileIsRefusedAndThePropertyKeepsItsPicture) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  auto* Image =
      static_cast<TImage*>(KilnRoot(Form)->CreateComponent(TImage::StaticClass(), Form->GetRoot(), 8, 8, 105, 105));
  Image->Picture()->LoadFromFile(Png.Name);
  String Refusal;
  Answer([&](TCustomForm& F) {
    try {
      LoadFile(F, Bad.Name);
    } catch (const EInvalidGraphic& E) {
      Refusal = E.Message();
    }
    // The working copy keeps what it had.
    ExpectPattern(Dlg(F).Picture()->Graphic(), 6, 4);
    EXPECT_TRUE(Dlg(F).Save->Enabled());
  });
  IPtr<IProperty> Prop = EditorFor(TPictureProperty::StaticClass(), Image, "Picture", QueryAs<IDesigner>(Form));
  Prop->Edit();
  EXPECT_EQ(Refusal.rfind("The PNG image is not valid: ", 0), 0u) << Refusal;
  ExpectPattern(Image->Picture()->Graphic(), 6, 4);
}

//===----------------------------------------------------------------------===//
// The dialog
//===----------------------------------------------------------------------===//

TEST_F(PictureEditorTest, TheDialogLoadsSavesAndClearsAWorkingCopy) {
  TObjectGuard<TPictureEditor> Editor(CreateComponentOf<TPictureEditor>(nullptr));
  TPictureEditorDlg* D = Editor->Dialog();
  EXPECT_EQ(D->Caption(), "Picture Editor");
  EXPECT_EQ(D->ClientWidth(), 344);
  EXPECT_EQ(D->ClientHeight(), 294);
  EXPECT_EQ(D->HelpContext(), 26030);
  EXPECT_EQ(D->Load->Caption(), "&Load...");
  EXPECT_EQ(D->Save->Caption(), "&Save...");
  EXPECT_EQ(D->Clear->Caption(), "&Clear");
  EXPECT_EQ(D->HelpButton->Caption(), "&Help");
  EXPECT_EQ(D->OpenDialog->Filter(),
            "All (*.bmp;*.ico;*.emf;*.wmf)|*.bmp;*.ico;*.emf;*.wmf|Bitmaps (*.bmp)|*.bmp|Icons (*.ico)|*.ico|"
            "Enhanced Metafiles (*.emf)|*.emf|Metafiles (*.wmf)|*.wmf");
  EXPECT_FALSE(D->Save->Enabled());

  // An empty picture: Save and Clear disabled, "(None)" in the preview; Cancel keeps it.
  Answer(
      [&](TCustomForm& F) {
        EXPECT_FALSE(Dlg(F).Save->Enabled());
        EXPECT_FALSE(Dlg(F).Clear->Enabled());
        EXPECT_EQ(Dlg(F).ImagePaintBox->Canvas()->Lines().back(), "TextOut(93,101,\"(None)\")");
        LoadFile(F, Png.Name);
        EXPECT_TRUE(Dlg(F).Save->Enabled());
        EXPECT_TRUE(Dlg(F).Clear->Enabled());
        EXPECT_EQ(Dlg(F).ImagePaintBox->Canvas()->Lines().back(), "Draw(108,105,TPngImage)");
      },
      "CancelButton");
  EXPECT_FALSE(Editor->Execute());
  EXPECT_FALSE(Editor->Picture()->Graphic());
  const TShownDialog& Shown = DialogScript().Shown().front();
  EXPECT_EQ(Shown.Kind, "ShowModal");
  EXPECT_EQ(Shown.Caption, "Picture Editor");
  EXPECT_EQ(Shown.DefaultButton, "OKButton");
  const TShownDialog& Open = DialogScript().Shown().back();
  EXPECT_EQ(Open.Kind, "OpenPictureDialog");
  EXPECT_EQ(Open.Caption, "Load Picture");
  EXPECT_EQ(Open.Message, GraphicFilter(TGraphic::StaticClass()));
  EXPECT_EQ(D->OpenDialog->Options(), (TOpenOptions{ofHideReadOnly, ofShowHelp, ofFileMustExist}));
  EXPECT_EQ(D->SaveDialog->Options(), (TOpenOptions{ofHideReadOnly, ofShowHelp, ofFileMustExist}));
  EXPECT_EQ(D->OpenDialog->DefaultExt(), "bmp");
  EXPECT_EQ(D->OpenDialog->HelpContext(), 27000);
  EXPECT_EQ(D->SaveDialog->HelpContext(), 27010);

  // Load, save under a name without extension, help, OK.
  DialogScript().Clear();
  Answer([&](TCustomForm& F) {
    LoadFile(F, Png.Name);
    DialogScript().Answer(mrOk, {Saved.Name.substr(0, Saved.Name.size() - 4)});
    (void)ClickButton(F, "Save");
    (void)ClickButton(F, "HelpButton");
  });
  EXPECT_TRUE(Editor->Execute());
  ExpectPattern(Editor->Picture()->Graphic(), 6, 4);
  EXPECT_EQ(DialogScript().Shown().back().Kind, "SavePictureDialog");
  EXPECT_EQ(DialogScript().Shown().back().Caption, "Save Picture As");
  EXPECT_EQ(D->SaveDialog->Filter(), GraphicFilter(TPngImage::StaticClass()));
  EXPECT_EQ(D->SaveDialog->DefaultExt(), "png");
  TObjectGuard<TPngImage> Written(new TPngImage);
  Written->LoadFromFile(Saved.Name);
  EXPECT_TRUE(Written->Equals(Editor->Picture()->Graphic()));
  EXPECT_EQ(Application()->HelpRequests().back(), "context 26030");

  // Clear, then OK: the picture is empty.
  Answer([&](TCustomForm& F) {
    EXPECT_TRUE(Dlg(F).Clear->Enabled());
    (void)ClickButton(F, "Clear");
    EXPECT_FALSE(Dlg(F).Save->Enabled());
    EXPECT_FALSE(Dlg(F).Clear->Enabled());
    EXPECT_EQ(Dlg(F).ImagePaintBox->Canvas()->Lines().back(), "TextOut(93,101,\"(None)\")");
  });
  EXPECT_TRUE(Editor->Execute());
  EXPECT_FALSE(Editor->Picture()->Graphic());
}

TEST_F(PictureEditorTest, ThePreviewScalesWhatDoesNotFitToTheBox) {
  TObjectGuard<TPictureEditor> Editor(CreateComponentOf<TPictureEditor>(nullptr));
  TPaintBox* Box = Editor->Dialog()->ImagePaintBox;
  ASSERT_EQ(Box->ClientRect().Width(), 223);
  ASSERT_EQ(Box->ClientRect().Height(), 215);
  auto PreviewOf = [&](int W, int H) {
    TObjectGuard<TPngImage> G(new TPngImage);
    G->SetSize(W, H);
    Editor->Dialog()->Picture()->SetGraphic(G.Get());
    Box->Repaint();
    return Box->Canvas()->Lines().back();
  };
  EXPECT_EQ(PreviewOf(223, 215), "Draw(0,0,TPngImage)");                // exactly the box
  EXPECT_EQ(PreviewOf(21, 15), "Draw(101,100,TPngImage)");              // centred
  EXPECT_EQ(PreviewOf(446, 100), "StretchDraw(0,0,223,50,TPngImage)");  // wide: the width, at the top
  EXPECT_EQ(PreviewOf(100, 430), "StretchDraw(0,0,50,215,TPngImage)");  // tall: the height, at the left
  EXPECT_EQ(PreviewOf(430, 430), "StretchDraw(0,0,215,215,TPngImage)"); // square: the height
}

//===----------------------------------------------------------------------===//
// The property editors
//===----------------------------------------------------------------------===//

TEST_F(PictureEditorTest, PicturePropertiesShowTheirGraphicsClassAndClearOnlyOnEmptyText) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  auto* Image =
      static_cast<TImage*>(KilnRoot(Form)->CreateComponent(TImage::StaticClass(), Form->GetRoot(), 8, 8, 105, 105));
  EXPECT_EQ(GetEditorClass(GetPropInfo(Image, "Picture"), Image), TPictureProperty::StaticClass());
  IPtr<IProperty> Prop = EditorFor(TPictureProperty::StaticClass(), Image, "Picture", QueryAs<IDesigner>(Form));
  EXPECT_EQ(Prop->GetAttributes(), TPropertyAttributes{paDialog});
  EXPECT_EQ(Prop->GetValue(), "(None)");
  Image->Picture()->LoadFromFile(Png.Name);
  EXPECT_EQ(Prop->GetValue(), "(TPngImage)");
  Prop->SetValue("(None)");
  EXPECT_TRUE(Image->Picture()->Graphic());
  Prop->SetValue("");
  EXPECT_FALSE(Image->Picture()->Graphic());
  EXPECT_EQ(Prop->GetValue(), "(None)");
}

TEST_F(PictureEditorTest, GraphicPropertiesTakeOnlyTheirOwnClass) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  TObjectGuard<TLogo> Logo(CreateComponentOf<TLogo>(nullptr));
  IPtr<IDesigner> Designer = QueryAs<IDesigner>(Form);
  EXPECT_EQ(GetEditorClass(GetPropInfo(Logo.Get(), "Glyph"), Logo.Get()), TGraphicProperty::StaticClass());
  IPtr<IProperty> Prop = EditorFor(TGraphicProperty::StaticClass(), Logo.Get(), "Glyph", Designer);
  EXPECT_EQ(Prop->GetAttributes(), TPropertyAttributes{paDialog});
  EXPECT_EQ(Prop->GetValue(), "(None)");

  // A PNG goes in; the dialog offered PNG files only.
  Answer([&](TCustomForm& F) {
    EXPECT_EQ(Dlg(F).OpenDialog->DefaultExt(), "png");
    LoadFile(F, Png.Name);
  });
  Prop->Edit();
  ExpectPattern(Logo->Glyph(), 6, 4);
  EXPECT_EQ(Prop->GetValue(), "(TPngImage)");

  // A bitmap is another class: refused on OK, and nothing is stored.
  TObjectGuard<TBmpImage> AsBitmap(new TBmpImage);
  AsBitmap->SetSize(2, 2);
  AsBitmap->SaveToFile(Bmp.Name);
  Answer([&](TCustomForm& F) { LoadFile(F, Bmp.Name); });
  try {
    Prop->Edit();
    ADD_FAILURE() << "a bitmap was stored in a PNG property";
  } catch (const Exception& E) {
    EXPECT_EQ(E.Message(), "Invalid graphic format");
  }
  ExpectPattern(Logo->Glyph(), 6, 4);

  // Other text is ignored; Clear then OK stores nil.
  Prop->SetValue("(TBmpImage)");
  ExpectPattern(Logo->Glyph(), 6, 4);
  Answer([&](TCustomForm& F) { (void)ClickButton(F, "Clear"); });
  Prop->Edit();
  EXPECT_FALSE(Logo->Glyph());
  EXPECT_EQ(Prop->GetValue(), "(None)");
}

//===----------------------------------------------------------------------===//
// The component editor
//===----------------------------------------------------------------------===//

TEST_F(PictureEditorTest, ADoubleClickEditsThePictureNamedImageInAnyCaseAndCreatesNoEvent) {
  IPtr<IRoot> Form = NewFormAt("Form1");
  RegisterComponentEditor(TLogo::StaticClass(), TGraphicEditor::StaticClass());
  auto* Logo =
      static_cast<TLogo*>(KilnRoot(Form)->CreateComponent(TLogo::StaticClass(), Form->GetRoot(), 8, 8, 50, 50));
  Log.Clear();
  Answer([&](TCustomForm& F) { LoadFile(F, Png.Name); });
  GetComponentEditor(Logo, QueryAs<IDesigner>(Form))->Edit();
  ExpectPattern(Logo->Image()->Graphic(), 6, 4);
  EXPECT_EQ(Log.Text().find("CreateMethod"), String::npos) << Log.Text();
  EXPECT_FALSE(Logo->OnClick);
  // Without the editor the same double click creates the click handler.
  TObjectGuard<TButton> Plain(CreateComponentOf<TButton>(nullptr));
  EXPECT_EQ(
      dynamic_cast<TObject*>(static_cast<IInterface*>(GetComponentEditor(Plain.Get(), nullptr).Get()))->ClassType(),
      TDefaultEditor::StaticClass());
}

} // namespace
