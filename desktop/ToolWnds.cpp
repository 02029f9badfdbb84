//===- desktop/ToolWnds.cpp - Design windows with a tool bar -------------===//
#include "desktop/ToolWnds.h"

#include "platform/FormatSettings.h"

namespace formkit {

FK_RESOURCESTRING(SDesignToolbarSmallHeight, "32");
FK_RESOURCESTRING(SDesignButtonSmallHeight, "24");
FK_RESOURCESTRING(SDesignButtonSmallWidth, "24");
FK_RESOURCESTRING(SDesignToolbarLargeHeight, "44");
FK_RESOURCESTRING(SDesignButtonLargeHeight, "36");
FK_RESOURCESTRING(SDesignButtonLargeWidth, "56");

TDesignToolbarMetrics DesignToolbarMetrics() {
  auto Read = [](const TResString& Res, int Fallback) {
    int Value = Fallback;
    if (!TryStrToInt(LoadResString(Res), Value)) Value = Fallback;
    return Value;
  };
  return {Read(SDesignToolbarSmallHeight, 32), Read(SDesignButtonSmallHeight, 24),
          Read(SDesignButtonSmallWidth, 24),   Read(SDesignToolbarLargeHeight, 44),
          Read(SDesignButtonLargeHeight, 36),  Read(SDesignButtonLargeWidth, 56)};
}

FK_IMPLEMENT(TToolbarDesignWindow, "ToolWnds") {}

TAction* TToolbarDesignWindow::MakeCommand(const String& Name, const String& Caption) {
  auto* A = CreateComponentOf<TAction>(this);
  A->SetName(Name);
  A->SetCaption(Caption);
  A->SetActionList(FActionList1);
  return A;
}

TPopupMenu* TToolbarDesignWindow::MakePopup(const String& Name, const String& ItemName, TAction* Action) {
  auto* Menu = CreateComponentOf<TPopupMenu>(this);
  Menu->SetName(Name);
  auto* Item = CreateComponentOf<TMenuItem>(this);
  Item->SetName(ItemName);
  Item->SetAction(Action);
  Menu->Items()->Add(Item);
  return Menu;
}

void TToolbarDesignWindow::Create(TComponent* AOwner) {
  inherited::Create(AOwner);
  SetCaption("ToolbarForm");
  FToolBar1 = CreateComponentOf<TToolBar>(this);
  FToolBar1->SetName("ToolBar1");
  FToolBar1->SetParent(this);
  FToolBar1->SetHeight(30);
  FSplitter1 = CreateComponentOf<TSplitter>(this);
  FSplitter1->SetName("Splitter1");
  FSplitter1->SetAlign(alTop);
  FSplitter1->SetTop(FToolBar1->Top() + FToolBar1->Height());
  FSplitter1->SetHeight(8);
  FSplitter1->SetCursor(crSizeNS);
  FSplitter1->SetResizeStyle(rsUpdate);
  FSplitter1->SetParent(this);
  FSplitter1->OnCanResize = TCanResizeEvent::Bind<&TToolbarDesignWindow::Splitter1CanResize>(this);
  FSplitter1->OnMoved = TNotifyEvent::Bind<&TToolbarDesignWindow::Splitter1Moved>(this);
  FActionList1 = CreateComponentOf<TActionList>(this);
  FActionList1->SetName("ActionList1");
  FToolbarCmd = MakeCommand("ToolbarCmd", "&Toolbar");
  FToolbarCmd->SetChecked(true);
  FToolbarCmd->OnExecute = TNotifyEvent::Bind<&TToolbarDesignWindow::ToolbarCmdExecute>(this);
  FToolbarCmd->OnUpdate = TNotifyEvent::Bind<&TToolbarDesignWindow::ToolbarCmdUpdate>(this);
  FTextLabelsCmd = MakeCommand("TextLabelsCmd", "Text &Labels");
  FTextLabelsCmd->OnExecute = TNotifyEvent::Bind<&TToolbarDesignWindow::TextLabelsCmdExecute>(this);
  FTextLabelsCmd->OnUpdate = TNotifyEvent::Bind<&TToolbarDesignWindow::TextLabelsCmdUpdate>(this);
  FHelpCmd = MakeCommand("HelpCmd", "Help");
  FHelpCmd->SetHint("Show help");
  FHelpCmd->OnExecute = TNotifyEvent::Bind<&TToolbarDesignWindow::HelpCmdExecute>(this);
  FHelpCmd->OnUpdate = TNotifyEvent::Bind<&TToolbarDesignWindow::HelpCmdUpdate>(this);
  FPopupMenu1 = MakePopup("PopupMenu1", "Toolbar2", FToolbarCmd);
  FPopupMenu2 = MakePopup("PopupMenu2", "TextLabels1", FTextLabelsCmd);
  // Measure the bar in both sizes, then show it in the chosen one.
  ResizeButtons(false);
  FSmallHeight = MulDiv(FToolBar1->Height(), DefaultPPI, CurrentPPI());
  ResizeButtons(true);
  FLargeHeight = MulDiv(FToolBar1->Height(), DefaultPPI, CurrentPPI());
  ResizeButtons(FLargeButtons);
  UpdateToolbarVisible(true);
}

void TToolbarDesignWindow::ResizeButtons(bool ALarge) {
  SetRedraw(FToolBar1, false);
  auto Redraw = Finally([this]() noexcept { RunIgnoringExceptions([this] { SetRedraw(FToolBar1, true); }); });
  TDesignToolbarMetrics M = DesignToolbarMetrics();
  FToolBar1->SetShowCaptions(ALarge);
  FToolBar1->SetButtonWidth(ScaleValue(ALarge ? M.LargeButtonWidth : M.SmallButtonWidth));
  FToolBar1->SetButtonHeight(ScaleValue(ALarge ? M.LargeButtonHeight : M.SmallButtonHeight));
  FToolBar1->SetHeight(ALarge ? ScaleValue(8) + FToolBar1->ButtonHeight() : ScaleValue(M.SmallToolbarHeight));
  FToolBar1->SetShowHint(!ALarge);
}

void TToolbarDesignWindow::SetLargeButtons(bool AValue) {
  if (AValue == FLargeButtons) return;
  ResizeButtons(AValue);
  FLargeButtons = AValue;
}

bool TToolbarDesignWindow::ToolbarVisible() const { return FToolBar1->Visible(); }

void TToolbarDesignWindow::SetToolbarVisible(bool AValue) {
  if (AValue != ToolbarVisible()) UpdateToolbarVisible(AValue);
}

void TToolbarDesignWindow::UpdateToolbarVisible(bool AValue) {
  DisableAlign();
  // Laying out may fail: after a failure here that one passes on, after success its own.
  auto End = OnFailure([this]() noexcept { RunIgnoringExceptions([this] { EnableAlign(); }); });
  FToolBar1->SetVisible(AValue);
  FSplitter1->SetTop(FToolBar1->Top() + FToolBar1->Height());
  FSplitter1->SetVisible(AValue);
  End.Dismiss();
  EnableAlign();
}

void TToolbarDesignWindow::ToolbarCmdExecute(TObject*) { SetToolbarVisible(!ToolbarVisible()); }
void TToolbarDesignWindow::ToolbarCmdUpdate(TObject*) { FToolbarCmd->SetChecked(ToolbarVisible()); }
void TToolbarDesignWindow::TextLabelsCmdExecute(TObject*) { SetLargeButtons(!FLargeButtons); }
void TToolbarDesignWindow::TextLabelsCmdUpdate(TObject*) { FTextLabelsCmd->SetChecked(FLargeButtons); }

namespace {
bool HelpByContext(const TCustomForm* F) { return F->HelpType() == htContext && F->HelpContext() != 0; }
} // namespace

void TToolbarDesignWindow::HelpCmdUpdate(TObject*) {
  FHelpCmd->SetEnabled(HelpByContext(this) || !HelpKeyword().empty());
}

void TToolbarDesignWindow::HelpCmdExecute(TObject*) {
  if (HelpByContext(this)) Application()->HelpContext(HelpContext());
  else Application()->HelpKeyword(HelpKeyword());
}

void TToolbarDesignWindow::Splitter1CanResize(TObject*, int& ANewSize, bool&) {
  int Small = ScaleValue(FSmallHeight);
  int Large = ScaleValue(FLargeHeight);
  if (FToolBar1->Height() < Large) ANewSize = ANewSize < Large ? Small : Large;
  else ANewSize = ANewSize <= Small ? Small : Large;
}

void TToolbarDesignWindow::Splitter1Moved(TObject*) {
  SetLargeButtons(FToolBar1->Height() >= ScaleValue(FLargeHeight));
}

} // namespace formkit
