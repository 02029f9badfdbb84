//===- tests/desktop/DesktopTestWindows.h - Window classes for the tests -===//
#pragma once

#include "tests/desktop/DesktopTestSupport.h"

namespace formkit::desktoptest {

/// A plain environment window.
class TPaneWindow : public TDesktopForm {
  FK_CLASS(TPaneWindow, TDesktopForm)
};

/// A window that wants to know the section the registry made it for.
class TSectionAwareWindow : public TDesktopForm, public IDesktopFormCreator {
  FK_CLASS(TSectionAwareWindow, TDesktopForm)
  FK_INTERFACES(IDesktopFormCreator)
  void SetDeskSection(const String& ASection) override {
    TDesktopForm::SetDeskSection(ASection);
    Told.push_back(ASection);
  }
  std::vector<String> Told;
};

/// Keeps the arrangement of a site as the sections of its clients, "A|B".
class TSectionListManager : public TInterfacedObject, public IDockManager {
  FK_CLASS(TSectionListManager, TInterfacedObject)
  FK_INTERFACES(IDockManager)
  explicit TSectionListManager(TWinControl* Site) : FSite(Site) {}
  void SaveToStream(TStream* Stream) override {
    String Text;
    for (TControl* C : DockClients(FSite))
      Text += (Text.empty() ? "" : "|") + static_cast<TDesktopForm*>(C)->DeskSection();
    Stream->WriteBuffer(Text.data(), static_cast<std::int64_t>(Text.size()));
  }
  void LoadFromStream(TStream* Stream) override {
    Loaded.assign(static_cast<std::size_t>(Stream->Size()), '\0');
    if (!Loaded.empty()) Stream->ReadBuffer(Loaded.data(), Stream->Size());
  }
  String Loaded;

private:
  TWinControl* FSite;
};

/// A window that others dock into; keeps its clients under "DockClients" and its
/// arrangement under "DockSiteData".
class THostWindow : public TDesktopForm {
  FK_CLASS(THostWindow, TDesktopForm)
  void Create(TComponent* AOwner) override {
    inherited::Create(AOwner);
    SetDockSite(this, true);
    Manager = New<TSectionListManager>(this);
    SetDockManager(this, Manager);
  }
  void SaveWindowState(TCustomIniFile* ADesktop, bool AIsProject) override {
    inherited::SaveWindowState(ADesktop, AIsProject);
    SaveDockClients(ADesktop, AIsProject, "DockClients", this);
    SaveDockStream(ADesktop, "DockSiteData", this);
  }
  void LoadWindowState(TCustomIniFile* ADesktop) override {
    inherited::LoadWindowState(ADesktop);
    if (LoadDockClients(ADesktop, "DockClients", this)) LoadDockStream(ADesktop, "DockSiteData", this);
  }
  IPtr<TSectionListManager> Manager;
};

/// A window whose load fails.
class TBrokenWindow : public TDesktopForm {
  FK_CLASS(TBrokenWindow, TDesktopForm)
  void LoadWindowState(TCustomIniFile*) override { throw EReadError("bad section"); }
};

} // namespace formkit::desktoptest
