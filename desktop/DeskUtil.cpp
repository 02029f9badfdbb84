//===- desktop/DeskUtil.cpp - Window registry and desktop procedures -----===//
#include "desktop/DeskUtil.h"

#include "desktop/DeskForm.h"
#include "platform/FormatSettings.h"

#include <algorithm>
#include <cmath>
#include <mutex>

namespace formkit {

// Localisable sizes of tool bars.
FK_RESOURCESTRING(SSmallToolbarSize, "30");
FK_RESOURCESTRING(SToolbarButtonHeight, "22");
FK_RESOURCESTRING(SToolbarButtonWidth, "23");
FK_RESOURCESTRING(SLargeToolbarSize, "44");
FK_RESOURCESTRING(SLargeToolbarAsListSize, "34");
FK_RESOURCESTRING(SToolbarCaptionButtonHeight, "36");
FK_RESOURCESTRING(SToolbarCaptionButtonWidth, "56");

//===----------------------------------------------------------------------===//
// What the host supplies
//===----------------------------------------------------------------------===//

std::function<TCustomIniFile*()> IDEIniFile;
std::function<TCustomForm**(const String&)> GetFieldAddress;
std::function<void(const String&, TCustomForm**)> RegisterFieldAddress;
std::function<void(const String&)> UnregisterFieldAddress;
std::function<void(const TNotifyEvent&)> AddMainFormCreatedEvent;
std::function<void(const TNotifyEvent&)> RemoveMainFormCreatedEvent;
std::function<void(const TNotifyEvent&)> AddMainFormShownEvent;
std::function<void(const TNotifyEvent&)> RemoveMainFormShownEvent;
std::function<bool(TCustomForm*)> GetDockable;
std::function<void(TDesktopForm*)> InitializeForm;
TEvent* evDesktopLoaded = nullptr;
TStringList* LoadedDesktopFormInstances = nullptr;
TWinControl* WorkspaceReferenceLeft = nullptr;
TWinControl* WorkspaceReferenceTop = nullptr;
String DesktopId;
std::vector<String> DesktopCommandLine;

bool FindCmdLineSwitch(const String& Switch) {
  for (const String& Arg : DesktopCommandLine)
    if (Arg.size() > 1 && (Arg[0] == '-' || Arg[0] == '/') && SameText(std::string_view(Arg).substr(1), Switch))
      return true;
  return false;
}

TToolbarMetrics ToolbarMetrics() {
  auto Read = [](const TResString& Res, int Fallback) {
    int Value = Fallback;
    if (!TryStrToInt(LoadResString(Res), Value)) Value = Fallback;
    return Value;
  };
  return {Read(SSmallToolbarSize, 30),       Read(SToolbarButtonHeight, 22),        Read(SToolbarButtonWidth, 23),
          Read(SLargeToolbarSize, 44),       Read(SLargeToolbarAsListSize, 34),    Read(SToolbarCaptionButtonHeight, 36),
          Read(SToolbarCaptionButtonWidth, 56)};
}

//===----------------------------------------------------------------------===//
// Window registry
//===----------------------------------------------------------------------===//

namespace {
/// One registration: the class, its section and the host variable's name.
struct TDesktopFormClassItem {
  String FDeskSection;
  String FInstanceName;
  TDesktopFormClass FFormClass = nullptr;

  TCustomForm** Variable() const {
    if (FInstanceName.empty() || !GetFieldAddress) return nullptr;
    return GetFieldAddress(FInstanceName);
  }
  void LoadWindow(TCustomIniFile* ADesktop) const;
  void SaveWindow(TCustomIniFile* ADesktop, bool AIsProject) const;
};

std::vector<TDesktopFormClassItem>& Registrations() {
  static std::vector<TDesktopFormClassItem> List;
  return List;
}

/// Makes a window of the registration's class for `Var`, owned by the application.
TCustomForm* CreateRegisteredForm(const TDesktopFormClassItem& Item, TCustomForm** Var) {
  auto* Form = static_cast<TCustomForm*>(CreateComponent(Item.FFormClass, Application()));
  *Var = Form;
  // A class that fixes no section of its own takes the registration's.
  if (auto* D = dynamic_cast<TDesktopForm*>(Form); D && D->DeskSection().empty()) D->SetDeskSection(Item.FDeskSection);
  if (void* P = Form->GetInterfaceEntry(IDesktopFormCreator::IID))
    static_cast<IDesktopFormCreator*>(P)->SetDeskSection(Item.FDeskSection);
  return Form;
}

void TDesktopFormClassItem::LoadWindow(TCustomIniFile* ADesktop) const {
  TCustomForm** Var = Variable();
  if (!Var) return;
  if (ADesktop->ReadBool(FDeskSection, "Create", false)) {
    if (!*Var) CreateRegisteredForm(*this, Var);
    if (!ADesktop->ReadBool(FDeskSection, "Docked", false))
      if (auto* D = dynamic_cast<TDesktopForm*>(*Var)) D->LoadWindowState(ADesktop);
  } else if (*Var) {
    (*Var)->Hide();
  }
  if (*Var && LoadedDesktopFormInstances)
    if (auto* D = dynamic_cast<TDesktopForm*>(*Var)) LoadedDesktopFormInstances->AddObject(D->DeskSection(), D);
}

void TDesktopFormClassItem::SaveWindow(TCustomIniFile* ADesktop, bool AIsProject) const {
  TCustomForm** Var = Variable();
  auto* D = Var ? dynamic_cast<TDesktopForm*>(*Var) : nullptr;
  if (D && D->AutoSave()) D->SaveWindowState(ADesktop, AIsProject);
}
} // namespace

void RegisterDesktopFormClass(TDesktopFormClass AFormClass, const String& ADeskSection, const String& AInstanceName) {
  Registrations().push_back({ADeskSection, AInstanceName, AFormClass});
}

void UnregisterDesktopFormClass(TDesktopFormClass AFormClass) {
  std::erase_if(Registrations(), [&](const TDesktopFormClassItem& I) { return I.FFormClass == AFormClass; });
}

String GetInstanceName(TDesktopFormClass AFormClass, const String& ADeskSection) {
  for (const TDesktopFormClassItem& I : Registrations())
    if (I.FFormClass == AFormClass && (ADeskSection.empty() || I.FDeskSection == ADeskSection))
      return I.FInstanceName;
  return String();
}

void LoadDesktopFormClasses(TCustomIniFile* ADesktop) {
  // A copy: a window's load may register further classes.
  std::vector<TDesktopFormClassItem> Items = Registrations();
  for (const TDesktopFormClassItem& I : Items) {
    try {
      I.LoadWindow(ADesktop);
    } catch (const EAbort&) {
      // A host with nothing to hold is simply not restored.
    } catch (const Exception& E) {
      Application()->ShowException(E);
    }
  }
}

void SaveDesktopFormClasses(TCustomIniFile* ADesktop, bool AIsProject) {
  for (const TDesktopFormClassItem& I : Registrations()) I.SaveWindow(ADesktop, AIsProject);
}

//===----------------------------------------------------------------------===//
// Desktop procedures
//===----------------------------------------------------------------------===//

namespace {
/// The registered procedures: a vector of pairs that grows by 5, a pair of nils marking a
/// free entry, and the in-use entries in the order they came.
class TDesktopProcs {
public:
  void Register(TLoadDesktopProc Load, TSaveDesktopProc Save) {
    if (IndexOf(Load, Save) >= 0) return;
    if (static_cast<int>(FProcs.size()) >= FCapacity) {
      FCapacity += 5;
      FProcVec.resize(static_cast<std::size_t>(FCapacity));
    }
    auto Free = std::find(FProcVec.begin(), FProcVec.end(), TPair{nullptr, nullptr});
    *Free = {Load, Save};
    FProcs.push_back(static_cast<int>(Free - FProcVec.begin()));
  }
  void Unregister(TLoadDesktopProc Load, TSaveDesktopProc Save) {
    int I = IndexOf(Load, Save);
    if (I < 0) return;
    FProcVec[static_cast<std::size_t>(I)] = {nullptr, nullptr};
    std::erase(FProcs, I);
  }
  void Load(TCustomIniFile* Desktop) const {
    for (int I : InUse())
      if (TLoadDesktopProc P = FProcVec[static_cast<std::size_t>(I)].first) P(Desktop);
  }
  void Save(TCustomIniFile* Desktop, bool IsProject) const {
    for (int I : InUse())
      if (TSaveDesktopProc P = FProcVec[static_cast<std::size_t>(I)].second) P(Desktop, IsProject);
  }

private:
  using TPair = std::pair<TLoadDesktopProc, TSaveDesktopProc>;
  int IndexOf(TLoadDesktopProc Load, TSaveDesktopProc Save) const {
    for (int I : FProcs)
      if (FProcVec[static_cast<std::size_t>(I)] == TPair{Load, Save}) return I;
    return -1;
  }
  /// A copy, so that a procedure may register or unregister others.
  std::vector<int> InUse() const { return FProcs; }
  std::vector<int> FProcs;
  int FCapacity = 0;
  std::vector<TPair> FProcVec;
};

TDesktopProcs& DesktopProcs() {
  static TDesktopProcs Procs;
  return Procs;
}
} // namespace

void RegisterDesktopProcs(TLoadDesktopProc ALoadProc, TSaveDesktopProc ASaveProc) {
  if (ALoadProc || ASaveProc) DesktopProcs().Register(ALoadProc, ASaveProc);
}
void UnregisterDesktopProcs(TLoadDesktopProc ALoadProc, TSaveDesktopProc ASaveProc) {
  DesktopProcs().Unregister(ALoadProc, ASaveProc);
}
void DoDesktopLoadProcs(TCustomIniFile* ADesktop) { DesktopProcs().Load(ADesktop); }
void DoDesktopSaveProcs(TCustomIniFile* ADesktop, bool AIsProject) { DesktopProcs().Save(ADesktop, AIsProject); }

//===----------------------------------------------------------------------===//
// TIDEDesktopService
//===----------------------------------------------------------------------===//

namespace {
int GUpdateCount = 0;
int GDrawingLockCount = 0;

/// The batched windows, guarded by a lock as the platform's thread-safe list is.
struct TLockedForms {
  std::mutex Lock;
  std::vector<TDesktopForm*> Forms;
};
TLockedForms& LockedFormList() {
  static TLockedForms L;
  return L;
}

/// Round half to even, as the runtime's `Round` does, wrapped to 32 bits.
int RoundToInt(double Value) noexcept {
  if (!std::isfinite(Value)) return 0;
  double R = std::nearbyint(Value);
  if (R >= 9.2e18 || R <= -9.2e18) return 0;
  return static_cast<int>(static_cast<std::uint32_t>(static_cast<std::int64_t>(R)));
}

/// Visible top-level desktop windows that follow the global drawing lock.
std::vector<TDesktopForm*> DrawingLockSet() {
  std::vector<TDesktopForm*> Set;
  for (int I = 0; I < Screen()->FormCount(); ++I) {
    auto* F = dynamic_cast<TDesktopForm*>(Screen()->Forms(I));
    if (F && F->Visible() && !F->Parent() && F->FollowsGlobalDrawingLock()) Set.push_back(F);
  }
  return Set;
}
} // namespace

void TIDEDesktopService::BeginUpdate() {
  if (!FindCmdLineSwitch("UD")) ++GUpdateCount;
}

void TIDEDesktopService::EndUpdate() {
  if (GUpdateCount > 0) --GUpdateCount;
  if (GUpdateCount > 0) return;
  TCustomForm* Active = Screen()->ActiveForm();
  for (TDesktopForm* F : LockedForms()) {
    // A window an earlier one freed has left the list.
    std::vector<TDesktopForm*> Now = LockedForms();
    if (std::find(Now.begin(), Now.end(), F) != Now.end()) F->UnlockUpdates();
  }
  std::vector<TDesktopForm*> Left;
  {
    std::lock_guard<std::mutex> Guard(LockedFormList().Lock);
    LockedFormList().Forms.swap(Left);
  }
  for (int I = 0; Active && I < Screen()->FormCount(); ++I)
    if (Screen()->Forms(I) == Active) Active->Activate();
}

bool TIDEDesktopService::IsLocked() noexcept { return GUpdateCount > 0; }
int TIDEDesktopService::UpdateCount() noexcept { return GUpdateCount; }

void TIDEDesktopService::LockDrawing() {
  for (TDesktopForm* F : DrawingLockSet()) F->LockDrawing();
  ++GDrawingLockCount;
}

void TIDEDesktopService::UnLockDrawing() {
  if (GDrawingLockCount <= 0) return;
  --GDrawingLockCount;
  for (TDesktopForm* F : DrawingLockSet()) F->UnlockDrawing();
}

bool TIDEDesktopService::IsDrawingLocked() noexcept { return GDrawingLockCount > 0; }

int TIDEDesktopService::ActualToRelative(int AValue, int ARange) noexcept {
  if (ARange == 0) return 0;
  return RoundToInt(static_cast<double>(AValue) / ARange * 10000);
}

int TIDEDesktopService::RelativeToActual(int AValue, int ARange) noexcept {
  // The product wraps as a 32-bit integer would.
  auto Product = static_cast<std::int32_t>(static_cast<std::uint32_t>(static_cast<std::int64_t>(AValue) * ARange));
  return RoundToInt(static_cast<double>(Product) / 10000);
}

int TIDEDesktopService::AdjustWidth(int AValue, int ADefault, bool APercent) {
  if (AValue < 1) return ADefault;
  return APercent ? RelativeToActual(AValue, Screen()->PrimaryMonitor()->WorkareaRect().Width()) : AValue;
}

int TIDEDesktopService::AdjustHeight(int AValue, int ADefault, bool APercent) {
  if (AValue < 1) return ADefault;
  return APercent ? RelativeToActual(AValue, Screen()->PrimaryMonitor()->WorkareaRect().Height()) : AValue;
}

void TIDEDesktopService::AddLockedForm(TDesktopForm* Form) {
  std::lock_guard<std::mutex> Guard(LockedFormList().Lock);
  std::vector<TDesktopForm*>& L = LockedFormList().Forms;
  if (std::find(L.begin(), L.end(), Form) == L.end()) L.push_back(Form);
}

void TIDEDesktopService::RemoveLockedForm(TDesktopForm* Form) noexcept {
  std::lock_guard<std::mutex> Guard(LockedFormList().Lock);
  std::vector<TDesktopForm*>& L = LockedFormList().Forms;
  std::erase(L, Form);
  if (L.empty()) std::vector<TDesktopForm*>().swap(L);
}

std::vector<TDesktopForm*> TIDEDesktopService::LockedForms() {
  std::lock_guard<std::mutex> Guard(LockedFormList().Lock);
  return LockedFormList().Forms;
}

} // namespace formkit
