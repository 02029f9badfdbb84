//===- frameworks/kiln/design/PicEdit.cpp - The picture editor ------------===//
#include "frameworks/kiln/design/PicEdit.h"

#include "core/DesignIntfClasses.h"
#include "frameworks/kiln/KilnWindows.h"
#include "platform/TypInfo.h"

namespace formkit {

namespace {

/// The options both file dialogs get from the editor.
constexpr TOpenOptions EditorDialogOptions{ofHideReadOnly, ofShowHelp, ofFileMustExist};

/// A control of class `T` named `Name` in `Parent`, owned by `Form`, at `Rect`.
template <class T> T* Place(TCustomForm* Form, TWinControl* Parent, const char* Name, const TRect& Rect) {
  T* Control = CreateComponentOf<T>(Form);
  Control->SetName(Name);
  Control->SetParent(Parent);
  Control->SetBoundsRect(Rect);
  return Control;
}

TButton* PlaceButton(TCustomForm* Form, TWinControl* Parent, const char* Name, const char* Caption, const TRect& Rect) {
  auto* Button = Place<TButton>(Form, Parent, Name, Rect);
  Button->SetCaption(Caption);
  return Button;
}

bool HasPicture(const TPicture* P) { return P->Graphic() && !P->Graphic()->Empty(); }

/// The text of a graphic in the inspector: its class in parentheses, or "(None)".
String GraphicText(const TGraphic* G) {
  return G && !G->Empty() ? "(" + G->ClassName() + ")" : LoadResString(SPictureNone);
}

} // namespace

//===----------------------------------------------------------------------===//
// TPictureEditorDlg
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPictureEditorDlg, "PicEdit") {}

void TPictureEditorDlg::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("PictureEditorDlg");
  SetCaption("Picture Editor");
  SetBorderStyle(bsDialog);
  SetPosition(poScreenCenter);
  SetClientWidth(344);
  SetClientHeight(294);
  TRect Work = Screen()->WorkAreaRect();
  SetBounds(Work.Left + (Work.Width() - Width()) / 2, Work.Top + (Work.Height() - Height()) / 2, Width(), Height());

  OpenDialog = CreateComponentOf<TOpenPictureDialog>(this);
  OpenDialog->SetName("OpenDialog");
  SaveDialog = CreateComponentOf<TSavePictureDialog>(this);
  SaveDialog->SetName("SaveDialog");
  for (TPictureFileDialog* D : std::initializer_list<TPictureFileDialog*>{OpenDialog, SaveDialog})
    D->SetFilter(LoadResString(SPictureDesignFilter));

  pnBottom = Place<TPanel>(this, this, "pnBottom", Bounds(0, 286, 264, 8));
  pnRight = Place<TPanel>(this, this, "pnRight", Bounds(264, 0, 80, 294));
  for (TPanel* P : {pnBottom, pnRight}) {
    P->SetCaption(String());
    P->SetBevelOuter(bvNone);
  }
  OKButton = PlaceButton(this, pnRight, "OKButton", "OK", Bounds(0, 8, 75, 25));
  OKButton->SetModalResult(mrOk);
  OKButton->SetDefault(true);
  CancelButton = PlaceButton(this, pnRight, "CancelButton", "Cancel", Bounds(0, 39, 75, 25));
  CancelButton->SetModalResult(mrCancel);
  CancelButton->SetCancel(true);
  HelpButton = PlaceButton(this, pnRight, "HelpButton", "&Help", Bounds(0, 70, 75, 25));
  HelpButton->OnClick = TNotifyEvent::Bind<&TPictureEditorDlg::HelpButtonClick>(this);

  GroupBox1 = Place<TPanel>(this, this, "GroupBox1", Bounds(8, 8, 249, 278));
  GroupBox1->SetCaption(String());
  ImagePanel = Place<TPanel>(this, GroupBox1, "ImagePanel", Bounds(8, 16, 233, 225));
  ImagePanel->SetCaption(String());
  ImagePanel->SetBevelOuter(bvNone);
  ImagePanel->SetColor(clWindow);
  Shape1 = Place<TShape>(this, ImagePanel, "Shape1", Bounds(0, 0, 233, 225));
  Shape1->Brush()->SetStyle(bsClear);
  Shape1->Pen()->SetStyle(psDot);
  ImagePaintBox = Place<TPaintBox>(this, ImagePanel, "ImagePaintBox", Bounds(5, 5, 223, 215));
  ImagePaintBox->OnPaint = TNotifyEvent::Bind<&TPictureEditorDlg::ImagePaintBoxPaint>(this);
  Load = PlaceButton(this, GroupBox1, "Load", "&Load...", Bounds(8, 247, 75, 25));
  Load->OnClick = TNotifyEvent::Bind<&TPictureEditorDlg::LoadClick>(this);
  Save = PlaceButton(this, GroupBox1, "Save", "&Save...", Bounds(87, 247, 75, 25));
  Save->OnClick = TNotifyEvent::Bind<&TPictureEditorDlg::SaveClick>(this);
  Clear = PlaceButton(this, GroupBox1, "Clear", "&Clear", Bounds(166, 247, 75, 25));
  Clear->OnClick = TNotifyEvent::Bind<&TPictureEditorDlg::ClearClick>(this);
  OnShow = TNotifyEvent::Bind<&TPictureEditorDlg::FormShow>(this);

  // What the form's creation does once the parts stand.
  SetHelpContext(26030);
  Pic.Reset(new TPicture);
  Save->SetEnabled(false);
}

void TPictureEditorDlg::BeforeDestruction() {
  Pic.Reset();
  inherited::BeforeDestruction();
}

void TPictureEditorDlg::UpdateButtons() {
  bool Any = HasPicture(Pic.Get());
  Save->SetEnabled(Any);
  Clear->SetEnabled(Any);
}

void TPictureEditorDlg::LoadClick(TObject*) {
  OpenDialog->SetTitle(LoadResString(SLoadPictureTitle));
  if (!OpenDialog->Execute()) return;
  Pic->LoadFromFile(OpenDialog->FileName());
  ImagePaintBox->Repaint();
  UpdateButtons();
}

void TPictureEditorDlg::SaveClick(TObject*) {
  TGraphic* Graphic = Pic->Graphic();
  if (!Graphic) return;
  SaveDialog->SetTitle(LoadResString(SSavePictureTitle));
  SaveDialog->SetDefaultExt(GraphicExtension(Graphic->ClassType()));
  SaveDialog->SetFilter(GraphicFilter(Graphic->ClassType()));
  if (SaveDialog->Execute()) Pic->SaveToFile(SaveDialog->FileName());
}

void TPictureEditorDlg::ClearClick(TObject*) {
  Pic->SetGraphic(nullptr);
  ImagePaintBox->Repaint();
  UpdateButtons();
}

void TPictureEditorDlg::HelpButtonClick(TObject*) { Application()->HelpContext(HelpContext()); }

void TPictureEditorDlg::FormShow(TObject*) {
  Shape1->Pen()->SetWidth(1);
  ImagePaintBox->Repaint();
}

void TPictureEditorDlg::ImagePaintBoxPaint(TObject*) {
  TCanvas* Canvas = ImagePaintBox->Canvas();
  TRect R = ImagePaintBox->ClientRect();
  Canvas->Brush()->SetColor(clBtnFace);
  Canvas->Font()->SetColor(clBtnText);
  const int W = Pic->Width(), H = Pic->Height();
  if (W <= 0) {
    String None = LoadResString(SPictureNone);
    Canvas->TextOut(R.Left + (R.Width() - Canvas->TextWidth(None)) / 2,
                    R.Top + (R.Height() - Canvas->TextHeight(None)) / 2, None);
    return;
  }
  if (W <= R.Width() && H <= R.Height()) {
    int Left = R.Left + (R.Width() - W) / 2, Top = R.Top + (R.Height() - H) / 2;
    Pic->Graphic()->Draw(Canvas, Rect(Left, Top, Left + W, Top + H));
    return;
  }
  if (W > H)
    R.Bottom = R.Top + MulDiv(H, R.Width(), W);
  else
    R.Right = R.Left + MulDiv(W, R.Height(), H);
  Pic->Graphic()->Draw(Canvas, R);
}

//===----------------------------------------------------------------------===//
// TPictureEditor
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPictureEditor, "PicEdit") {}

void TPictureEditor::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  FGraphicClass = TGraphic::StaticClass();
  FPicture.Reset(new TPicture);
  FPicDlg = CreateComponentOf<TPictureEditorDlg>(this);
}

void TPictureEditor::BeforeDestruction() {
  FPicture.Reset();
  inherited::BeforeDestruction();
}

bool TPictureEditor::Execute() {
  FPicDlg->Picture()->Assign(FPicture.Get());
  FPicDlg->OpenDialog->SetOptions(EditorDialogOptions);
  FPicDlg->SaveDialog->SetOptions(EditorDialogOptions);
  for (TPictureFileDialog* D : std::initializer_list<TPictureFileDialog*>{FPicDlg->OpenDialog, FPicDlg->SaveDialog}) {
    D->SetDefaultExt(GraphicExtension(FGraphicClass));
    D->SetFilter(GraphicFilter(FGraphicClass));
  }
  FPicDlg->OpenDialog->SetHelpContext(27000);
  FPicDlg->SaveDialog->SetHelpContext(27010);
  bool Any = HasPicture(FPicture.Get());
  FPicDlg->Save->SetEnabled(Any);
  FPicDlg->Clear->SetEnabled(Any);
  if (ShowModal(FPicDlg) != mrOk) return false;
  FPicture->Assign(FPicDlg->Picture());
  return true;
}

//===----------------------------------------------------------------------===//
// TPictureProperty
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TPictureProperty, "PicEdit") {}

String TPictureProperty::GetValue() {
  auto* Picture = dynamic_cast<TPicture*>(GetObjectProp(GetComponent(0), GetPropInfo()));
  return Picture && Picture->Graphic() ? "(" + Picture->Graphic()->ClassName() + ")" : LoadResString(SPictureNone);
}

void TPictureProperty::SetValue(const String& Value) {
  if (!Value.empty()) return;
  WriteAllPairs([](TPersistent* Instance, PPropInfo Prop) { SetObjectProp(Instance, Prop, nullptr); });
}

void TPictureProperty::Edit() {
  TObjectGuard<TPictureEditor> Editor(CreateComponentOf<TPictureEditor>(nullptr));
  Editor->SetPicture(dynamic_cast<TPicture*>(GetObjectProp(GetComponent(0), GetPropInfo())));
  if (!Editor->Execute()) return;
  TPicture* Result = Editor->Picture();
  WriteAllPairs([Result](TPersistent* Instance, PPropInfo Prop) { SetObjectProp(Instance, Prop, Result); });
}

//===----------------------------------------------------------------------===//
// TGraphicProperty
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TGraphicProperty, "PicEdit") {}

String TGraphicProperty::GetValue() {
  return GraphicText(dynamic_cast<TGraphic*>(GetObjectProp(GetComponent(0), GetPropInfo())));
}

void TGraphicProperty::SetValue(const String& Value) {
  if (!Value.empty()) return;
  WriteAllPairs([](TPersistent* Instance, PPropInfo Prop) { SetObjectProp(Instance, Prop, nullptr); });
}

void TGraphicProperty::Edit() {
  TObjectGuard<TPictureEditor> Editor(CreateComponentOf<TPictureEditor>(nullptr));
  TGraphicClass PropClass = GetObjectPropClass(GetPropInfo());
  Editor->SetGraphicClass(PropClass);
  Editor->Picture()->SetGraphic(dynamic_cast<TGraphic*>(GetObjectProp(GetComponent(0), GetPropInfo())));
  if (!Editor->Execute()) return;
  TGraphic* Result = Editor->Picture()->Graphic();
  if (Result && !Result->InheritsFrom(PropClass)) throw Exception(SInvalidFormat);
  WriteAllPairs([Result](TPersistent* Instance, PPropInfo Prop) { SetObjectProp(Instance, Prop, Result); });
}

//===----------------------------------------------------------------------===//
// TGraphicEditor
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TGraphicEditor, "PicEdit") {}

void TGraphicEditor::EditProperty(const IPtr<IProperty>& Prop, bool& Continue) {
  String Name = Prop->GetName();
  if (CompareText(Name, "PICTURE") != 0 && CompareText(Name, "IMAGE") != 0) return;
  Prop->Edit();
  Continue = false;
}

void RegisterPictureEditors() {
  RegisterPropertyEditor(TPicture::StaticClass()->TypeInfo(), nullptr, "", TPictureProperty::StaticClass());
  RegisterPropertyEditor(TGraphic::StaticClass()->TypeInfo(), nullptr, "", TGraphicProperty::StaticClass());
  RegisterComponentEditor(TImage::StaticClass(), TGraphicEditor::StaticClass());
}

} // namespace formkit
