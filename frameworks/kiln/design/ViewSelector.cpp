//===- frameworks/kiln/design/ViewSelector.cpp - The bar that picks a module's view ===//
//
// The device list with its headers, the user's choices and the preview styles.
//
//===----------------------------------------------------------------------===//
#include "frameworks/kiln/design/ViewSelector.h"

#include "frameworks/kiln/KilnDialogs.h"
#include "frameworks/kiln/KilnGraphics.h"
#include "platform/DeviceInfo.h"
#include "platform/ScopeGuard.h"

#include <algorithm>
#include <array>

namespace formkit {

FK_IMPLEMENT(TDeviceComboBox, "ViewSelector") {}
FK_IMPLEMENT(TViewSelectorFrame, "ViewSelector") {}

namespace {

/// The attribute of a device that names it for people.
constexpr const char* DisplayNameAttribute = "DisplayName";
/// The attribute of a device that gives its class as a number.
constexpr const char* DeviceClassAttribute = "DeviceClass";
/// The device classes whose preview can turn: phones, tablets and the like.
constexpr std::array<int, 5> RotatableDeviceClasses{2, 3, 4, 8, 11};

/// Selects item `Index` of `List` without calling its `OnChange`: a choice made by the
/// program, not by the user.
void SelectQuietly(TCustomListControl* List, int Index) {
  TNotifyEvent Saved = std::exchange(List->OnChange, TNotifyEvent());
  auto Restore = Finally([&]() noexcept { List->OnChange = Saved; });
  List->SetItemIndex(Index);
}

void ClearList(TCustomListControl* List) {
  SelectQuietly(List, -1);
  List->Items()->Clear();
}

IPtr<IDesignerDeviceOperations> DeviceService() {
  return QueryAs<IDesignerDeviceOperations>(IDEService<IOTADesignerDeviceServices>());
}

bool IsRotatable(const TDeviceInfo* Device) {
  if (!Device || !Device->HasAttribute(DeviceClassAttribute)) return false;
  int Class = 0;
  try {
    Class = std::stoi(Device->GetAttribute(DeviceClassAttribute));
  } catch (const std::exception&) {
    return false; // a class that is no number is none of the rotatable ones
  }
  return std::find(RotatableDeviceClasses.begin(), RotatableDeviceClasses.end(), Class) !=
         RotatableDeviceClasses.end();
}

} // namespace

//===----------------------------------------------------------------------===//
// The device list
//===----------------------------------------------------------------------===//

void TDeviceComboBox::WndProc(TMessage& Message) {
  if (Message.Msg == WM_LBUTTONDOWN) FClicking = true;
  else if (Message.Msg == WM_LBUTTONUP) FClicking = false;
  inherited::WndProc(Message);
}

bool TDeviceComboBox::IsHeader(int Index) const {
  String Item = Items()->Get(Index);
  return Item == CreatedViewsHeader || Item == AvailableViewsHeader || Item == ViewDivider;
}

String TDeviceComboBox::ItemLabel(int Index) const {
  String Item = Items()->Get(Index);
  if (TDeviceInfo* Device = Item.empty() ? nullptr : TDeviceInfo::GetDeviceByID(Item))
    if (Device->HasAttribute(DisplayNameAttribute)) return Device->GetAttribute(DisplayNameAttribute);
  return Item;
}

void TDeviceComboBox::DrawItem(TCanvas* Canvas, int Index, const TRect& Rect) const {
  String Item = Items()->Get(Index);
  int Indent = Canvas->TextWidth("AA");
  if (Item == ViewDivider) {
    int Middle = (Rect.Top + Rect.Bottom) / 2;
    Canvas->MoveTo(Rect.Left, Middle);
    Canvas->LineTo(Rect.Right, Middle);
  } else if (Item == CreatedViewsHeader || Item == AvailableViewsHeader) {
    Canvas->FillRect(Rect);
    Canvas->TextOut(Rect.Left + 2, Rect.Top, Item == CreatedViewsHeader ? "Views" : "Available");
  } else {
    Canvas->FillRect(Rect);
    Canvas->TextOut(Rect.Left + Indent, Rect.Top, Item.empty() ? String("Master") : ItemLabel(Index));
  }
}

//===----------------------------------------------------------------------===//
// Construction
//===----------------------------------------------------------------------===//

void TViewSelectorFrame::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetBounds(0, 0, 700, 34);
  FCreatedViews.Reset(new TStringList);
  FAvailableViews.Reset(new TStringList);

  lblViewTitle = CreateComponentOf<TLabel>(this);
  lblViewTitle->SetParent(this);
  lblViewTitle->SetBounds(8, 9, 40, 17);
  lblViewTitle->SetCaption("View:");

  cbDeviceSelector = CreateComponentOf<TDeviceComboBox>(this);
  cbDeviceSelector->SetParent(this);
  cbDeviceSelector->SetStyle(csDropDownList);
  cbDeviceSelector->SetBounds(52, 5, 200, 23);
  cbDeviceSelector->OnChange = TNotifyEvent::Bind<&TViewSelectorFrame::cbDeviceSelectorChange>(this);

  DeviceToolbar = CreateComponentOf<TToolBar>(this);
  DeviceToolbar->SetParent(this);
  DeviceToolbar->SetAlign(alNone);
  DeviceToolbar->SetBounds(260, 4, 80, 26);
  DeviceToolbar->SetShowHint(true);
  auto MakeButton = [&](const char* Hint, int Left, TNotifyEvent OnClick) {
    auto* Button = CreateComponentOf<TButton>(this);
    Button->SetParent(DeviceToolbar);
    Button->SetBounds(Left, 0, DeviceToolbar->ButtonWidth(), DeviceToolbar->ButtonHeight());
    Button->SetHint(Hint);
    Button->OnClick = OnClick;
    return Button;
  };
  btnRemoveView = MakeButton("Remove View|Remove the selected view from the list", 0,
                             TNotifyEvent::Bind<&TViewSelectorFrame::acRemoveViewExecute>(this));
  btnRotateView =
      MakeButton("Rotate the current view", 23, TNotifyEvent::Bind<&TViewSelectorFrame::acRotateExecute>(this));
  btnRotateView->SetEnabled(false);
  btnShowBackground = MakeButton("Hide or show the form frame", 46,
                                 TNotifyEvent::Bind<&TViewSelectorFrame::acBackgroundExecute>(this));

  btnSeparator = CreateComponentOf<TBevel>(this);
  btnSeparator->SetParent(this);
  btnSeparator->SetShape(bsLeftLine);
  btnSeparator->SetBounds(348, 4, 2, 26);

  lblStyleTitle = CreateComponentOf<TLabel>(this);
  lblStyleTitle->SetParent(this);
  lblStyleTitle->SetBounds(358, 9, 40, 17);
  lblStyleTitle->SetCaption("Style:");

  cbStyleSelector = CreateComponentOf<TComboBox>(this);
  cbStyleSelector->SetParent(this);
  cbStyleSelector->SetStyle(csDropDownList);
  cbStyleSelector->SetBounds(402, 5, 145, 23);
  cbStyleSelector->OnChange = TNotifyEvent::Bind<&TViewSelectorFrame::cbStyleSelectorChange>(this);

  FillAvailableViews();
  RefreshViewSelector();
  PopulateStyleSelector();
  RelocateUI();
}

void TViewSelectorFrame::BeforeDestruction() {
  FCreatedViews.Reset();
  FAvailableViews.Reset();
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// The list of views
//===----------------------------------------------------------------------===//

void TViewSelectorFrame::FillAvailableViews() {
  for (TDeviceInfo* Device : TDeviceInfo::Devices())
    if (FCreatedViews->IndexOf(Device->ID()) < 0) FAvailableViews->Add(Device->ID());
}

void TViewSelectorFrame::PopulateViewSelector(TStrings* Views) {
  FCreatedViews->Assign(Views);
  FAvailableViews->Clear();
  FillAvailableViews();
  RefreshViewSelector();
}

void TViewSelectorFrame::SortViews() {
  IPtr<IDesignerDeviceOperations> Devices = DeviceService();
  auto Compare = [&](const String& A, const String& B) {
    if (!Devices) return A.compare(B);
    TDesignerDeviceEntry First, Second;
    if (!Devices->FindDevice(A, First) || !Devices->FindDevice(B, Second)) return 0;
    if (First.Order != Second.Order) return First.Order < Second.Order ? -1 : 1;
    return First.Name.compare(Second.Name);
  };
  for (TStringList* List : {FCreatedViews.Get(), FAvailableViews.Get()})
    List->CustomSort([&](TStringList* L, int I, int J) { return Compare(L->Get(I), L->Get(J)); });
}

void TViewSelectorFrame::AddViewGroup(const IPtr<IDesignerDeviceOperations>& Devices, TStringList* Views,
                                      const char* Header) {
  if (Views->Count() == 0) return;
  TStrings* Items = cbDeviceSelector->Items();
  int Mark = Items->Count();
  for (int I = 0; I < Views->Count(); ++I) {
    TDesignerDeviceEntry Entry;
    if (Devices->FindDevice(Views->Get(I), Entry)) Items->Add(Views->Get(I));
  }
  if (Items->Count() > Mark) Items->Insert(Mark, Header);
}

void TViewSelectorFrame::RefreshViewSelector() {
  SortViews();
  ClearList(cbDeviceSelector);
  cbDeviceSelector->Items()->Add(""); // the master
  if (IPtr<IDesignerDeviceOperations> Devices = DeviceService()) {
    AddViewGroup(Devices, FCreatedViews.Get(), CreatedViewsHeader);
    AddViewGroup(Devices, FAvailableViews.Get(), AvailableViewsHeader);
  }
  cbDeviceSelector->SetDropDownCount(cbDeviceSelector->Items()->Count());
}

bool TViewSelectorFrame::IsMasterView() const { return cbDeviceSelector->ItemIndex() == 0; }

void TViewSelectorFrame::HighlightView(const String& Name) {
  int Index = Name.empty() ? 0 : cbDeviceSelector->Items()->IndexOf(Name);
  if (Index >= 0) {
    SelectQuietly(cbDeviceSelector, Index);
    cbDeviceSelector->SetTag(Index);
  }
  RefreshUI();
}

void TViewSelectorFrame::HighlightView(int Index) {
  SelectQuietly(cbDeviceSelector, Index);
  cbDeviceSelector->SetTag(Index);
  RefreshUI();
}

// As the user's choice: the index kept in `Tag` stays the one to go back to.
void TViewSelectorFrame::SelectView(const String& Name) {
  int Index = Name.empty() ? 0 : cbDeviceSelector->Items()->IndexOf(Name);
  if (Index >= 0) SelectQuietly(cbDeviceSelector, Index);
  RefreshUI();
  cbDeviceSelectorChange(cbDeviceSelector);
}

void TViewSelectorFrame::SelectView(int Index) {
  SelectQuietly(cbDeviceSelector, Index);
  RefreshUI();
  cbDeviceSelectorChange(cbDeviceSelector);
}

void TViewSelectorFrame::Clear() { ClearList(cbDeviceSelector); }

int TViewSelectorFrame::Count() const { return cbDeviceSelector->Items()->Count(); }

void TViewSelectorFrame::cbDeviceSelectorChange(TObject*) {
  int Index = cbDeviceSelector->ItemIndex();
  String Name = Index <= 0 ? String() : cbDeviceSelector->Text();
  if (OnSelectView) {
    auto GoBack = [this]() {
      SelectQuietly(cbDeviceSelector, cbDeviceSelector->Tag());
      RefreshUI();
    };
    {
      auto Undo = OnFailure([&]() noexcept { RunIgnoringExceptions(GoBack); });
      if (FAvailableViews->IndexOf(Name) >= 0 && OnAddView) OnAddView(this, Name);
    }
    if (FCreatedViews->IndexOf(Name) < 0 && !Name.empty()) {
      GoBack();
      return;
    }
    int Selected = Name.empty() ? 0 : cbDeviceSelector->Items()->IndexOf(Name);
    SelectQuietly(cbDeviceSelector, Selected);
    cbDeviceSelector->SetTag(Selected);
    btnRemoveView->SetEnabled(!cbDeviceSelector->Text().empty());
    OnSelectView(this, Name);
  }
  RefreshUI();
}

void TViewSelectorFrame::acRemoveViewExecute(TObject*) {
  String Name = cbDeviceSelector->Text();
  if (FCreatedViews->IndexOf(Name) < 0) return;
  if (MessageDlgPos(LoadResString(sConfirmDeleteView), mtConfirmation, {mbYes, mbNo}, 0, -1, -1) != mrYes) return;
  if (OnRemoveView) OnRemoveView(this, Name);
  SelectView(0);
}

void TViewSelectorFrame::acRotateExecute(TObject*) {
  if (OnRotateView) OnRotateView(this);
}

void TViewSelectorFrame::acBackgroundExecute(TObject*) {
  if (OnBackgroundView) OnBackgroundView(this);
}

void TViewSelectorFrame::RefreshUI() {
  int Index = cbDeviceSelector->ItemIndex();
  String Name = Index > 0 ? cbDeviceSelector->Items()->Get(Index) : String();
  TDeviceInfo* Device = Name.empty() ? nullptr : TDeviceInfo::GetDeviceByID(Name);
  btnRemoveView->SetEnabled(!IsMasterView());
  btnRotateView->SetEnabled(IsRotatable(Device));
  btnShowBackground->SetEnabled(Device != nullptr);
  bool Styles = IsMasterView() && static_cast<bool>(OnSelectView);
  lblStyleTitle->SetVisible(Styles);
  cbStyleSelector->SetVisible(Styles);
}

//===----------------------------------------------------------------------===//
// Styles
//===----------------------------------------------------------------------===//

void TViewSelectorFrame::PopulateStyleSelector() {
  ClearList(cbStyleSelector);
  FPlatformIndexes.clear();
  auto Allowed = [](TOTAOSFamily Family) { return Family != osfLinux; };
  std::array<bool, 6> Available{};
  if (auto Platforms = QueryAs<IPlatformOperations>(IDEService<IOTAPlatformServices>())) {
    std::vector<String> Names;
    if (auto Personalities = QueryAs<IPersonalityOperations>(PersonalityServices()))
      Names = Personalities->GetPersonalityPlatforms(Personalities->GetCurrentPersonality());
    if (Names.empty()) Names = Platforms->GetAllPlatforms();
    for (const String& Platform : Names) {
      TOTAOSFamily Family = Platforms->GetPlatformOSFamily(Platform);
      if (static_cast<std::size_t>(Family) < Available.size() && Allowed(Family))
        Available[static_cast<std::size_t>(Family)] = true;
    }
  }
  for (std::size_t F = 0; F < Available.size(); ++F) {
    if (!Available[F]) continue;
    auto Family = static_cast<TOTAOSFamily>(F);
    cbStyleSelector->Items()->Add(OSFamilyName(Family));
    FPlatformIndexes.push_back(Family);
  }
}

void TViewSelectorFrame::cbStyleSelectorChange(TObject*) {
  int Index = cbStyleSelector->ItemIndex();
  if (OnSelectStyle && Index >= 0) OnSelectStyle(this, FPlatformIndexes[static_cast<std::size_t>(Index)]);
}

void TViewSelectorFrame::SelectStyle(TOTAOSFamily Family) {
  if (!IsMasterView()) return;
  SelectQuietly(cbStyleSelector, -1);
  auto Found = std::find(FPlatformIndexes.begin(), FPlatformIndexes.end(), Family);
  if (Found != FPlatformIndexes.end())
    SelectQuietly(cbStyleSelector, static_cast<int>(Found - FPlatformIndexes.begin()));
  else if (cbStyleSelector->Items()->Count() > 0) SelectQuietly(cbStyleSelector, 0);
  else return;
  cbStyleSelectorChange(cbStyleSelector);
}

//===----------------------------------------------------------------------===//
// Layout
//===----------------------------------------------------------------------===//

void TViewSelectorFrame::RelocateUI() {
  TObjectGuard<TCanvas> Canvas(new TCanvas);
  Canvas->Font()->Assign(Font());
  int Left = lblStyleTitle->Left() + Canvas->TextWidth("AA" + lblViewTitle->Caption());
  cbStyleSelector->SetLeft(Left);
  lblStyleTitle->SetWidth(Left - lblStyleTitle->Left() - 8);
}

bool TViewSelectorFrame::FrameMouseWheel(TPoint Pos) const {
  TRect R = cbDeviceSelector->BoundsRect();
  R = Rect(R.Left - 1, R.Top - 1, R.Right + 1, R.Bottom + 1);
  return R.Contains(Pos);
}

} // namespace formkit
