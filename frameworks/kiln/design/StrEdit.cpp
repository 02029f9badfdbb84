//===- frameworks/kiln/design/StrEdit.cpp - String lists and long strings in a dialog ===//
#include "frameworks/kiln/design/StrEdit.h"

#include "core/DesignIntfClasses.h"
#include "frameworks/kiln/KilnWindows.h"
#include "frameworks/kiln/design/MultiLineStringEdit.h"
#include "frameworks/kiln/design/StringsEdit.h"
#include "frameworks/kiln/design/ValueEdit.h"
#include "platform/ScopeGuard.h"
#include "tools/StringsFileSystem.h"

namespace formkit {

namespace {

constexpr int DefaultDialogPPI = 96;

/// A control of class `T` named `Name` on `Parent`, owned by `Form`, at `Rect`.
template <class T> T* PlaceControl(TCustomForm* Form, TWinControl* Parent, const char* Name, const TRect& Rect) {
  T* Control = CreateComponentOf<T>(Form);
  Control->SetName(Name);
  Control->SetParent(Parent);
  Control->SetBoundsRect(Rect);
  return Control;
}

TMenuItem* AddMenuItem(TCustomForm* Form, TPopupMenu* Menu, const char* Name, const char* Caption) {
  auto* Item = CreateComponentOf<TMenuItem>(Form);
  Item->SetName(Name);
  Item->SetCaption(Caption);
  Menu->Items()->Add(Item);
  return Item;
}

/// The lines of `Lines` joined by its line break, without one at the end.
String JoinLines(TStrings* Lines) {
  String Text;
  for (int I = 0; I < Lines->Count(); ++I) Text += (I ? Lines->LineBreak : String()) + Lines->Get(I);
  return Text;
}

/// Shows the string list dialog over `Text` with the code editor commands off; true with
/// the new text in `Text` when closed with OK.
bool EditLongText(String& Text) {
  TObjectGuard<TStringsEditDlg> Dialog(CreateComponentOf<TStringsEditDlg>(Application()));
  TObjectGuard<TStringList> List(new TStringList);
  List->SetText(Text);
  Dialog->SetLines(List.Get());
  Dialog->SetActiveControl(Dialog->GetLinesControl());
  Dialog->CodeEditorItem->SetEnabled(false);
  Dialog->CodeWndBtn->SetEnabled(false);
  if (ShowModal(Dialog.Get()) != mrOk) return false;
  Text = JoinLines(Dialog->GetLines());
  return true;
}

/// The virtual file name of `AComponent`'s class property `APropertyName`, or empty when
/// the code editor cannot hold it.
String StringsIdent(TComponent* AComponent, const String& APropertyName, const IPtr<IDesigner>& ADesigner) {
  if (!AComponent || !ADesigner) return String();
  TComponent* Root = ADesigner->GetRoot();
  if (!Root || AComponent->Owner() != Root || Root->Name().empty()) return String();
  if (!GetPropInfo(AComponent, APropertyName, TTypeKinds{tkClass})) return String();
  String Designer = StringsDesignerName(ADesigner);
  if (Designer.empty()) return String();
  return MakeStringsFileName(Designer, Root->Name(), AComponent->Name(), APropertyName);
}

/// Opens `Lines` in the code editor as the text module `Ident`; a module the host does
/// not create leaves everything as it was.
void OpenInCodeEditor(const IPtr<IOTAModuleServices>& Modules, const String& Ident, TComponent* AComponent,
                      const String& APropertyName, TStrings* Lines, bool Modified) {
  TDateTime Age = Now();
  RegisterStringsFileSystem();
  IPtr<IOTAModule> Module =
      Modules->CreateModule(NewAs<IOTACreator, TStringsModuleCreator>(Ident, Age, Lines->Text()));
  if (!Module) return;
  if (TStringsFileSystem* FileSystem = StringsFileSystem())
    FileSystem->GetTStringsProperty(Ident, AComponent, APropertyName)->SetDiskAge(DateTimeToFileDate(Age));
  IPtr<IOTAEditor> Editor = Module->GetModuleFileCount() > 0 ? Module->GetModuleFileEditor(0) : nullptr;
  if (!Editor) return;
  // Just opened, yet changed in the dialog: the module must count as changed.
  if (Modified) Editor->MarkModified();
  Editor->Show();
}

} // namespace

//===----------------------------------------------------------------------===//
// Size and place
//===----------------------------------------------------------------------===//

TDialogPlacement& StrEditDlgPlacement() noexcept {
  static TDialogPlacement Placement;
  return Placement;
}

void detail::RestorePlacement(TCustomForm* Form, const TDialogPlacement& Stored, int MinWidth, int MinHeight) {
  const int PPI = Form->CurrentPPI();
  auto Scale = [PPI](int Value) { return MulDiv(Value, PPI, DefaultDialogPPI); };
  int Width = Stored.Width ? Scale(std::max(Stored.Width, MinWidth)) : std::max(Form->Width(), Scale(MinWidth));
  int Height = Stored.Height ? Scale(std::max(Stored.Height, MinHeight)) : std::max(Form->Height(), Scale(MinHeight));
  TCustomForm* Main = Application()->MainForm();
  TRect Area = Main && Main->Monitor() ? Main->Monitor()->WorkareaRect() : Screen()->WorkAreaRect();
  int Left = Stored.Left != TDialogPlacement::NotStored ? Scale(Stored.Left) : Area.Left + (Area.Width() - Width) / 2;
  int Top = Stored.Top != TDialogPlacement::NotStored ? Scale(Stored.Top) : Area.Top + (Area.Height() - Height) / 2;
  Form->SetBounds(Left, Top, Width, Height);
}

void detail::StorePlacement(const TCustomForm* Form, TDialogPlacement& Stored) noexcept {
  const int PPI = Form->CurrentPPI();
  auto Unscale = [PPI](int Value) { return MulDiv(Value, DefaultDialogPPI, PPI); };
  Stored = {Unscale(Form->Width()), Unscale(Form->Height()), Unscale(Form->Left()), Unscale(Form->Top())};
}

//===----------------------------------------------------------------------===//
// The file dialogs of a string list
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStringListFileDialog, "StrEdit") {}

TShownDialog TStringListFileDialog::Describe() {
  TShownDialog Shown = TOpenDialog::Describe();
  Shown.Kind = FKind;
  Shown.Caption = FTitle;
  return Shown;
}

void TStringListFileDialog::Accept(const std::vector<String>& Values) {
  String Name = Values.front();
  if (!FDefaultExt.empty() && ExtractFileExt(Name).empty()) Name += "." + FDefaultExt;
  TOpenDialog::Accept({Name});
}

//===----------------------------------------------------------------------===//
// TStrEditDlg
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStrEditDlg, "StrEdit") {}

void TStrEditDlg::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetName("StrEditDlg");
  SetCaption(LoadResString(SStrEditDlgCaption));
  SetBounds(0, 0, MinWidth, MinHeight);
  OnShow = TNotifyEvent::Bind<&TStrEditDlg::FormShow>(this);

  PanelBottom = PlaceControl<TPanel>(this, this, "PanelBottom", Bounds(0, ClientHeight() - 41, ClientWidth(), 41));
  PanelBottom->SetCaption(String());
  PanelBottom->SetAlign(alBottom);
  CodeWndBtn = PlaceControl<TButton>(this, PanelBottom, "CodeWndBtn", Bounds(8, 8, 100, 25));
  CodeWndBtn->SetCaption("&Code Editor...");
  CodeWndBtn->SetModalResult(mrCodeEditor);
  OKButton = PlaceControl<TButton>(this, PanelBottom, "OKButton", Bounds(ClientWidth() - 249, 8, 75, 25));
  OKButton->SetCaption("&OK");
  OKButton->SetModalResult(mrOk);
  OKButton->SetDefault(true);
  CancelButton = PlaceControl<TButton>(this, PanelBottom, "CancelButton", Bounds(ClientWidth() - 166, 8, 75, 25));
  CancelButton->SetCaption("Cancel");
  CancelButton->SetModalResult(mrCancel);
  CancelButton->SetCancel(true);
  HelpButton = PlaceControl<TButton>(this, PanelBottom, "HelpButton", Bounds(ClientWidth() - 83, 8, 75, 25));
  HelpButton->SetCaption("Help");
  HelpButton->OnClick = TNotifyEvent::Bind<&TStrEditDlg::HelpButtonClick>(this);

  StringEditorMenu = CreateComponentOf<TPopupMenu>(this);
  StringEditorMenu->SetName("StringEditorMenu");
  LoadItem = AddMenuItem(this, StringEditorMenu, "LoadItem", "&Load...");
  LoadItem->OnClick = TNotifyEvent::Bind<&TStrEditDlg::FileOpen>(this);
  SaveItem = AddMenuItem(this, StringEditorMenu, "SaveItem", "&Save...");
  SaveItem->OnClick = TNotifyEvent::Bind<&TStrEditDlg::FileSave>(this);
  CodeEditorItem = AddMenuItem(this, StringEditorMenu, "CodeEditorItem", "&Code Editor...");
  CodeEditorItem->OnClick = TNotifyEvent::Bind<&TStrEditDlg::CodeEditorItemClick>(this);

  OpenDialog = CreateComponentOf<TStringListFileDialog>(this);
  OpenDialog->SetName("OpenDialog");
  OpenDialog->SetTitle(LoadResString(SLoadStringListTitle));
  OpenDialog->SetHelpContext(27040);
  SaveDialog = CreateComponentOf<TStringListFileDialog>(this);
  SaveDialog->SetName("SaveDialog");
  SaveDialog->SetKind("SaveDialog");
  SaveDialog->SetTitle(LoadResString(SSaveStringListTitle));
  SaveDialog->SetHelpContext(27050);
  for (TStringListFileDialog* Files : {OpenDialog, SaveDialog}) {
    Files->SetDefaultExt("TXT");
    Files->SetFilter(LoadResString(SStringListFilter));
  }
}

void TStrEditDlg::BeforeDestruction() {
  detail::StorePlacement(this, StrEditDlgPlacement());
  inherited::BeforeDestruction();
}

void TStrEditDlg::SetLines(TStrings* Value) {
  if (TStrings* Lines = GetLines()) Lines->Assign(Value);
}

void TStrEditDlg::FileOpen(TObject*) {
  TStrings* Lines = GetLines();
  if (!Lines || !OpenDialog->Execute()) return;
  TObjectGuard<TMemoryStream> File(new TMemoryStream);
  File->LoadFromFile(OpenDialog->FileName());
  Lines->SetText(std::string_view(reinterpret_cast<const char*>(File->Memory()), static_cast<size_t>(File->Size())));
}

void TStrEditDlg::FileSave(TObject*) {
  TStrings* Lines = GetLines();
  SaveDialog->SetFileName(OpenDialog->FileName());
  if (!Lines || !SaveDialog->Execute()) return;
  String Text = Lines->Text();
  TObjectGuard<TMemoryStream> File(new TMemoryStream);
  File->WriteBuffer(Text.data(), static_cast<std::int64_t>(Text.size()));
  File->SaveToFile(SaveDialog->FileName());
}

void TStrEditDlg::HelpButtonClick(TObject*) { Application()->HelpContext(HelpContext()); }

void TStrEditDlg::FormShow(TObject*) {
  FUpdatingPos = true;
  auto Done = Finally([this]() noexcept { FUpdatingPos = false; });
  detail::RestorePlacement(this, StrEditDlgPlacement(), MinWidth, MinHeight);
}

void TStrEditDlg::CodeEditorItemClick(TObject*) { SetModalResult(mrCodeEditor); }

void TStrEditDlg::CancelOnEscape(std::uint16_t& Key) {
  if (Key != vkEscape) return;
  CancelButton->Click();
  SetModalResult(CancelButton->ModalResult());
}

//===----------------------------------------------------------------------===//
// Into the code editor
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStringsModuleCreator, "StrEdit") {}

String TStringsModuleCreator::GetFileSystem() { return StringsFileSystemID; }

IPtr<IOTAFile> TStringsModuleCreator::NewImplSource(const String&, const String&, const String&) {
  return NewAs<IOTAFile, TOTAFile>(FText, FAge);
}

TModalResult EditStringsWithCodeEditor(TComponent* AComponent, const String& APropertyName, TStrings* AStrings,
                                       const IPtr<IDesigner>& ADesigner, const TEditStringsFunc& AEditFunc,
                                       const TOkStringsProc& AOkProc) {
  IPtr<IOTAModuleServices> Modules = IDEService<IOTAModuleServices>();
  String Ident = Modules ? StringsIdent(AComponent, APropertyName, ADesigner) : String();
  if (!Ident.empty())
    if (IPtr<IOTAModule> Module = Modules->FindModule(Ident); Module && Module->GetModuleFileCount() > 0) {
      // The code editor holds the list already.
      if (IPtr<IOTAEditor> Editor = Module->GetModuleFileEditor(0)) Editor->Show();
      return mrCancel;
    }
  TStrEditDlg* Dialog = nullptr;
  auto FreeDialog = Finally([&Dialog]() noexcept {
    if (Dialog) Dialog->Destroy();
  });
  bool Modified = false;
  TStrings* Lines = nullptr;
  TModalResult Result = AEditFunc(AStrings, !Ident.empty(), Dialog, Modified, Lines);
  if (Result == mrOk) AOkProc(Lines);
  else if (Result == mrCodeEditor && !Ident.empty())
    OpenInCodeEditor(Modules, Ident, AComponent, APropertyName, Lines, Modified);
  return Result;
}

//===----------------------------------------------------------------------===//
// Property editors
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStringListProperty, "StrEdit") {}

TPropertyAttributes TStringListProperty::GetAttributes() {
  return (TClassProperty::GetAttributes() - TPropertyAttributes{paSubProperties}) + TPropertyAttributes{paDialog};
}

TStrEditDlg* TStringListProperty::EditDialog() { return CreateComponentOf<TStringsEditDlg>(Application()); }

TStrings* TStringListProperty::GetStrings() {
  return dynamic_cast<TStrings*>(GetObjectProp(GetComponent(0), GetPropInfo()));
}

void TStringListProperty::SetStrings(TStrings* Value) {
  WriteAllPairs([Value](TPersistent* Instance, PPropInfo Prop) { SetObjectProp(Instance, Prop, Value); });
}

void TStringListProperty::Edit() {
  auto EditFunc = [this](TStrings* Strings, bool CodeEditor, TStrEditDlg*& Dialog, bool& Modified,
                         TStrings*& Lines) {
    Dialog = EditDialog();
    Dialog->SetLines(Strings);
    Dialog->SetModified(false);
    Dialog->SetActiveControl(Dialog->GetLinesControl());
    Dialog->CodeEditorItem->SetEnabled(CodeEditor);
    Dialog->CodeWndBtn->SetEnabled(CodeEditor);
    TModalResult Result = ShowModal(Dialog);
    Lines = Dialog->GetLines();
    Modified = Dialog->Modified();
    return Result;
  };
  auto OkProc = [this](TStrings* Lines) { SetStrings(Lines); };
  EditStringsWithCodeEditor(dynamic_cast<TComponent*>(GetComponent(0)), GetName(), GetStrings(), FDesigner, EditFunc,
                            OkProc);
}

FK_IMPLEMENT(TLongStringProperty, "StrEdit") {}

TPropertyAttributes TLongStringProperty::GetAttributes() {
  return TPropertyEditor::GetAttributes() + TPropertyAttributes{paDialog};
}

void TLongStringProperty::Edit() {
  if (String Text = GetValue(); EditLongText(Text)) SetValue(Text);
}

FK_IMPLEMENT(TLongWideStringProperty, "StrEdit") {}

TPropertyAttributes TLongWideStringProperty::GetAttributes() {
  return TPropertyEditor::GetAttributes() + TPropertyAttributes{paDialog};
}

void TLongWideStringProperty::Edit() {
  if (String Text = Utf16ToUtf8(GetValueW()); EditLongText(Text)) SetValueW(Utf8ToUtf16(Text));
}

//===----------------------------------------------------------------------===//
// Registration
//===----------------------------------------------------------------------===//

void RegisterStringEditors() {
  RegisterPropertyEditor(TStrings::StaticClass()->TypeInfo(), nullptr, "", TStringListProperty::StaticClass());
  RegisterPropertyEditor(TStrings::StaticClass()->TypeInfo(), TValueListEditor::StaticClass(), "Strings",
                         TValueListProperty::StaticClass());
  RegisterPropertyEditor(TypeInfo_TCaption(), TLabel::StaticClass(), "Caption",
                         TMultiLineStringProperty::StaticClass());
}

} // namespace formkit
