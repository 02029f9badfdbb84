//===- core/DesignCore.cpp - Start and stop of the design core -----------===//
#include "core/DesignCore.h"

#include "core/CustomModules.h"
#include "core/Designers.h"
#include "core/DesignNotifications.h"
#include "core/Events.h"
#include "core/TopLevels.h"

#include <algorithm>

namespace formkit {

namespace {

struct Step {
  TCoreStage Stage;
  String Name;
  std::function<void()> Start;
  std::function<void()> Stop;
};

struct CoreState {
  std::vector<Step> Steps;
  std::vector<size_t> Started; // indices into Steps, in start order
  bool Running = false;
};

CoreState& State() {
  static CoreState* S = [] {
    auto* New = new CoreState; // immortal: stopping may run during static teardown
    // The core's own units, in the order the design core needs them.
    New->Steps = {
        {TCoreStage::Core, "DesignNotifications", &InitializeDesignNotifications, nullptr},
        {TCoreStage::Core, "NoIconClasses", &InitializeNoIconClasses, nullptr},
        {TCoreStage::Core, "Designers", &InitializeDesignersUnit, &FinalizeDesignersUnit},
        {TCoreStage::Core, "CustomModules", &InitializeCustomModules, &FinalizeCustomModules},
        {TCoreStage::Core, "DesignNotificationHooks", &InstallDesignNotificationHooks, &FinalizeDesignNotifications},
        {TCoreStage::Core, "Events", &CreateGlobalEvents, &FreeGlobalEvents},
        {TCoreStage::Core, "TopLevels", &InitializeTopLevels, &FinalizeTopLevels},
        // Registered by InitializeDesigners; unregistered first when the core stops.
        {TCoreStage::Core, "StringsFileSystem", nullptr,
         [] {
           if (RegisterStringsFileSystemProc) RegisterStringsFileSystemProc(false);
         }},
    };
    return New;
  }();
  return *S;
}

/// The order of start: by stage, then by addition.
std::vector<size_t> StartOrder(const CoreState& S) {
  std::vector<size_t> Order(S.Steps.size());
  for (size_t I = 0; I < Order.size(); ++I) Order[I] = I;
  std::stable_sort(Order.begin(), Order.end(),
                   [&](size_t A, size_t B) { return S.Steps[A].Stage < S.Steps[B].Stage; });
  return Order;
}

} // namespace

void AddDesignCoreStep(TCoreStage Stage, String Name, std::function<void()> Start, std::function<void()> Stop) {
  CoreState& S = State();
  S.Steps.push_back({Stage, std::move(Name), std::move(Start), std::move(Stop)});
  if (S.Running) {
    if (S.Steps.back().Start) S.Steps.back().Start();
    S.Started.push_back(S.Steps.size() - 1);
  }
}

void RemoveDesignCoreStep(const String& Name) {
  CoreState& S = State();
  for (size_t I = S.Steps.size(); I-- > 0;) {
    if (S.Steps[I].Name != Name) continue;
    auto Started = std::find(S.Started.begin(), S.Started.end(), I);
    if (Started != S.Started.end()) {
      S.Started.erase(Started);
      if (S.Steps[I].Stop) S.Steps[I].Stop();
    }
    S.Steps.erase(S.Steps.begin() + static_cast<std::ptrdiff_t>(I));
    for (size_t& Index : S.Started)
      if (Index > I) --Index;
  }
}

void StartDesignCore() {
  CoreState& S = State();
  if (S.Running) return;
  S.Running = true;
  for (size_t I : StartOrder(S)) {
    try {
      if (S.Steps[I].Start) S.Steps[I].Start();
    } catch (...) {
      StopDesignCore(); // undo what started, then report
      throw;
    }
    S.Started.push_back(I);
  }
}

void StopDesignCore() noexcept {
  CoreState& S = State();
  if (!S.Running) return;
  while (!S.Started.empty()) {
    Step& St = S.Steps[S.Started.back()];
    S.Started.pop_back();
    if (St.Stop) St.Stop();
  }
  S.Running = false;
}

bool DesignCoreRunning() noexcept { return State().Running; }

std::vector<String> DesignCoreStepNames() {
  CoreState& S = State();
  std::vector<String> Names;
  for (size_t I : StartOrder(S)) Names.push_back(S.Steps[I].Name);
  return Names;
}

} // namespace formkit
