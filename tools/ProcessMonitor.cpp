//===- tools/ProcessMonitor.cpp - A process watched from a thread ---------===//
//
// The monitored grade of the process runner. The monitor thread owns the
// reading of the pipes; the main thread hears of new batches through
// `Synchronize` and of the end through `Queue`. The object's teardown waits
// for the monitor and drops a queued end notice, so no call reaches a freed
// object.
//
//===----------------------------------------------------------------------===//
#include "tools/ProcessUtil.h"

#include "platform/TypInfoBuilder.h"

namespace formkit {

FK_IMPLEMENT(TMonitorProcess, "ProcessUtil") {}
FK_IMPLEMENT(TMonitorThread, "ProcessUtil") {}

//===----------------------------------------------------------------------===//
// Running and cancelling
//===----------------------------------------------------------------------===//

bool TMonitorProcess::IsRunning() const noexcept { return FMonitor && !FTerminated.load(); }

void TMonitorProcess::CheckNotRunning() const {
  if (IsRunning()) throw TMonitorProcessException(SMonitorThreadRunning);
}

void TMonitorProcess::ReleaseProcess() noexcept {
  FMonitor.Reset();
  Cleanup(FStartupInfo, FProcessInfo, FInPipe, FOutPipe, FErrorPipe);
  FProcessInfo.ProcessId = 0;
}

void TMonitorProcess::ReleaseRun() noexcept {
  ReleaseProcess();
  // An end notice of that run must not end the next one, nor reach a freed object.
  RemoveQueuedEvents(this);
}

void TMonitorProcess::Run() {
  CheckNotRunning();
  ReleaseRun();
  FTerminated.store(false);
  if (FWatch) {
    Startup(FStartupInfo, FProcessInfo, FInPipe, FOutPipe, FErrorPipe);
  } else {
    // Nothing will read from the child: it gets the null device for all three streams.
    FStartupInfo = TStartupInfo();
    FStartupInfo.Flags = StartfUseShowWindow | StartfUseStdHandles;
    FStartupInfo.ShowWindow = FVisibility;
  }
  auto Undo = OnFailure([this]() noexcept { ReleaseRun(); });
  if (!Execute(FStartupInfo, FProcessInfo)) {
    ReleaseRun();
    return;
  }
  if (FWatch) {
    FMonitor.Reset(new TMonitorThread(this));
    FMonitor->Start();
  }
}

bool TMonitorProcess::CancelProcess() {
  if (!FWatch || !IsRunning()) throw TMonitorProcessException(SProcessNotManaged);
  FMonitor->Terminate();
  FProcessInfo.Process.Terminate(MonitorCancelExitCode);
  // The monitor has ended by the time this runs, even when a handler it waited on raised.
  auto Release = Finally([this]() noexcept { ReleaseProcess(); });
  FMonitor->WaitFor();
  return true;
}

void TMonitorProcess::BeforeDestruction() {
  if (FWatch && IsRunning()) RunIgnoringExceptions([this] { (void)CancelProcess(); });
  ReleaseRun();
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// Properties
//===----------------------------------------------------------------------===//

void TMonitorProcess::SetWatch(bool AValue) {
  CheckNotRunning();
  FWatch = AValue;
}

void TMonitorProcess::SetExeFileName(const String& AValue) {
  CheckNotRunning();
  inherited::SetExeFileName(AValue);
}

void TMonitorProcess::SetCommandLine(const String& AValue) {
  CheckNotRunning();
  inherited::SetCommandLine(AValue);
}

void TMonitorProcess::SetWorkingDir(const String& AValue) {
  CheckNotRunning();
  inherited::SetWorkingDir(AValue);
}

void TMonitorProcess::SetOnOutputChanged(TListChanged AHandler) {
  CheckNotRunning();
  inherited::SetOnOutputChanged(std::move(AHandler));
}

void TMonitorProcess::SetOnErrorChanged(TListChanged AHandler) {
  CheckNotRunning();
  inherited::SetOnErrorChanged(std::move(AHandler));
}

void TMonitorProcess::SetOnTerminate(TNotifyReference AHandler) { FOnTerminate = std::move(AHandler); }

TStringList* TMonitorProcess::GetOutput() {
  std::lock_guard Guard(FOnOutputLock);
  return inherited::GetOutput();
}

void TMonitorProcess::SetOutput(TStringList* AValue) {
  std::lock_guard Guard(FOnOutputLock);
  inherited::SetOutput(AValue);
}

TStringList* TMonitorProcess::GetErrors() {
  std::lock_guard Guard(FOnErrorsLock);
  return inherited::GetErrors();
}

void TMonitorProcess::SetErrors(TStringList* AValue) {
  std::lock_guard Guard(FOnErrorsLock);
  inherited::SetErrors(AValue);
}

//===----------------------------------------------------------------------===//
// The monitor
//===----------------------------------------------------------------------===//

void TMonitorProcess::Poll() {
  if (!FOutPipe) return;
  PollPipe(FOutPipe.Get(), FOnOutputLock, FOutput.Get(), FLastOut, &TMonitorProcess::DoOutputChanged);
  PollPipe(FErrorPipe.Get(), FOnErrorsLock, FErrors.Get(), FLastErr, &TMonitorProcess::DoErrorChanged);
}

void TMonitorProcess::PollPipe(TPipe* APipe, std::mutex& ALock, TStringList* AList, int& ALast,
                               void (TMonitorProcess::*ANotify)()) {
  APipe->PartialRead();
  int Count = 0;
  {
    // Held across the load too, so that a main thread that assigns the list meanwhile
    // waits instead of meeting a half-loaded list.
    std::lock_guard Guard(ALock);
    APipe->GetList(AList);
    Count = AList->Count();
  }
  if (Count != ALast) Synchronize(this, [this, ANotify] { (this->*ANotify)(); });
  ALast = Count;
}

void TMonitorProcess::DoOutputChanged() {
  if (FOnOutputChanged) FOnOutputChanged(this, FOutput.Get(), FLastOut, FOutput->Count());
}

void TMonitorProcess::DoErrorChanged() {
  if (FOnErrorChanged) FOnErrorChanged(this, FErrors.Get(), FLastErr, FErrors->Count());
}

void TMonitorProcess::DoTerminate() {
  FTerminated.store(true);
  if (FOnTerminate) FOnTerminate(this);
}

TMonitorThread::TMonitorThread(TMonitorProcess* AMonitorProcess)
    : FMonitorProcess(AMonitorProcess), FClock(AMonitorProcess->StartClock()) {}

void TMonitorThread::Execute() {
  NameThreadForDebugging(MonitorThreadName);
  TMonitorProcess& P = *FMonitorProcess;
  TProcessHandle& Process = P.FProcessInfo.Process;
  P.FLastOut = 0;
  P.FLastErr = 0;
  do {
    P.Poll();
  } while (!FClock.Tick(Process));
  P.Poll();
  // The child has ended; its code is final once the system has collected it.
  for (std::uint32_t Code = StillActive; Process.GetExitCode(Code) && Code == StillActive;)
    Process.Wait(ProcessBeat);
  if (P.FWatch) {
    P.FTerminated.store(true);
    Queue(&P, [&P] { P.DoTerminate(); });
  }
}

} // namespace formkit
