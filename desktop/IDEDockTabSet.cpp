//===- desktop/IDEDockTabSet.cpp - The auto-hide strip of tool windows ---===//
#include "desktop/IDEDockTabSet.h"

#include "desktop/DeskUtil.h"

#include "desktop/DockForm.h"
#include "desktop/IDEDockPanel.h"

namespace formkit {

FK_IMPLEMENT(TIDEDockTabSet, "IDEDockTabSet") {}

namespace {

/// The tab of an entry's value; -1 for anything but a plain integer.
int TabOf(const String& Value) {
  try {
    return StrToInt(Value);
  } catch (const EConvertError&) {
    return -1;
  }
}
} // namespace

void TIDEDockTabSet::SaveState(TCustomIniFile* Desktop, bool, const String& ClientSection, TDesktopForm* DesktopForm) {
  String Entries;
  for (TControl* C : DockClients(this)) {
    TTabDockClientInfo* Info = GetClientInfo(C);
    auto* Form = dynamic_cast<TDesktopForm*>(C);
    if (!Info || !Form) continue;
    if (!Entries.empty()) Entries += ",";
    Entries += Form->DeskSection() + "=" + IntToStr(Info->TabIndex);
  }
  if (!Entries.empty()) Desktop->WriteString(DesktopForm->DeskSection(), ClientSection, Entries);
}

void TIDEDockTabSet::LoadState(TCustomIniFile* Desktop, const String& ClientSection, TDesktopForm* DesktopForm) {
  FUpdatesDisabled = true;
  auto Enable = Finally([this]() noexcept { FUpdatesDisabled = false; });
  const String& Section = DesktopForm->DeskSection();
  TObjectGuard<TStringList> Sections(new TStringList);
  Desktop->ReadSections(Sections.Get());
  if (Sections->IndexOf(Section) >= 0) {
    ResetDockSite(this);
    String Text = Desktop->ReadString(Section, ClientSection, String());
    for (const String& Entry : Text.empty() ? std::vector<String>() : SplitAtCommas(Text)) {
      std::size_t Eq = Entry.find('=');
      String Name = Entry.substr(0, Eq);
      int Index = LoadedDesktopFormInstances ? LoadedDesktopFormInstances->IndexOf(Name) : -1;
      auto* W = Index < 0 ? nullptr : dynamic_cast<TDesktopForm*>(LoadedDesktopFormInstances->GetObject(Index));
      if (!W) continue;
      int Tab = Eq == String::npos ? -1 : TabOf(Entry.substr(Eq + 1));
      ManualDock(W, this);
      if (TTabDockClientInfo* Info = GetClientInfo(W); Info && Tab != -1) SetTabIndex(Info, Tab);
      W->LoadWindowState(Desktop);
      W->Hide();
    }
  }
  RemoveDeadTabs();
}

void TIDEDockTabSet::RemoveDeadTabs() {
  std::vector<TControl*> Clients = DockClients(this);
  int Count = static_cast<int>(Clients.size());
  if (TabCount() == Count) return;
  std::vector<bool> Taken(Clients.size(), false);
  for (TControl* C : Clients)
    if (TTabDockClientInfo* Info = GetClientInfo(C); Info && Info->TabIndex >= 0 && Info->TabIndex < Count)
      Taken[static_cast<std::size_t>(Info->TabIndex)] = true;
  for (TControl* C : Clients) {
    TTabDockClientInfo* Info = GetClientInfo(C);
    if (!Info || (Info->TabIndex >= 0 && Info->TabIndex < Count)) continue;
    auto Free = std::find(Taken.begin(), Taken.end(), false);
    if (Free == Taken.end()) break;
    *Free = true;
    SetTabIndex(Info, static_cast<int>(Free - Taken.begin()));
  }
  while (TabCount() > Count) DeleteTab(TabCount() - 1);
}

String TIDEDockTabSet::GetTabName(TControl* AClient) {
  String Name;
  TDockHostLink* Host = DockHostLinkOf(AClient);
  if (Host && Host->HostDockType() == dtTab) {
    for (TControl* C : DockClients(dynamic_cast<TWinControl*>(AClient)))
      if (C->Visible()) Name += (Name.empty() ? "" : ", ") + C->Caption();
  } else {
    Name = TDockTabSet::GetTabName(AClient);
  }
  return Name.empty() ? String("Untitled") : Name;
}

bool TIDEDockTabSet::ShouldAutoHide(TControl* AClient) {
  auto* Form = dynamic_cast<TDesktopForm*>(AClient);
  return !Form || Form->ShouldAutoHide();
}

void TIDEDockTabSet::ShowDockClientInfo(TTabDockClientInfo* AInfo) {
  if (FUpdatesDisabled || TIDEDesktopService::IsLocked()) return;
  TDockTabSet::ShowDockClientInfo(AInfo);
}

} // namespace formkit
