//===- tools/ProcessUtil.cpp - Running console tools to their end ---------===//
//
// The blocking grades of the process runner and the list of the system's
// processes. The monitored grade is in ProcessMonitor.cpp.
//
//===----------------------------------------------------------------------===//
#include "tools/ProcessUtil.h"

#include "platform/TypInfoBuilder.h"

#include <cstdio>

#include <dirent.h>
#include <unistd.h>

extern char** environ;

namespace formkit {

FK_IMPLEMENT(TConsoleProcess, "ProcessUtil") {}
FK_IMPLEMENT(TReportProcess, "ProcessUtil") {}

bool detail::TBeatClock::Tick(TProcessHandle& Process) {
  if (DoTimeOut) {
    Countdown -= ProcessBeat;
    if (Countdown < 1) Process.Terminate(TimedOutExitCode);
  }
  return Process.Wait(ProcessBeat);
}

//===----------------------------------------------------------------------===//
// TConsoleProcess
//===----------------------------------------------------------------------===//

TConsoleProcess::TConsoleProcess()
    : FOutput(new TStringList), FErrors(new TStringList), FEnvList(new TStringList) {
  for (char** Var = environ; Var && *Var; ++Var) FEnvList->Add(*Var);
}

void TConsoleProcess::SetCommandLine(const String& AValue) { FCommandLine = AValue; }
void TConsoleProcess::SetExeFileName(const String& AValue) { FExeFileName = AValue; }
void TConsoleProcess::SetWorkingDir(const String& AValue) { FWorkingDir = AValue; }
void TConsoleProcess::SetExitCode(std::uint32_t AValue) { FExitCode = AValue; }
TStringList* TConsoleProcess::GetOutput() { return FOutput.Get(); }
void TConsoleProcess::SetOutput(TStringList* AValue) { FOutput->Assign(AValue); }
TStringList* TConsoleProcess::GetErrors() { return FErrors.Get(); }
void TConsoleProcess::SetErrors(TStringList* AValue) { FErrors->Assign(AValue); }
TStrings* TConsoleProcess::GetEnvList() { return FEnvList.Get(); }

void TConsoleProcess::SetTimeOut(int AValue) {
  FTimeOut = AValue;
  if (AValue >= 0) FDoTimeOut = true;
}

void TConsoleProcess::ReportFatalError(const String& AMessage) { throw Exception(AMessage); }

void TConsoleProcess::DoReportFatalError(const String& AMessage) {
  ReportFatalError(AMessage);
  FExitCode = FatalErrorExitCode;
}

void TConsoleProcess::Run() {
  TStartupInfo StartupInfo;
  TProcessInformation ProcessInfo;
  TObjectGuard<TPipe> InPipe, OutPipe, ErrorPipe;
  Startup(StartupInfo, ProcessInfo, InPipe, OutPipe, ErrorPipe);
  auto Release = Finally([&]() noexcept { Cleanup(StartupInfo, ProcessInfo, InPipe, OutPipe, ErrorPipe); });
  if (Execute(StartupInfo, ProcessInfo)) Running(StartupInfo, ProcessInfo, InPipe, OutPipe, ErrorPipe);
}

void TConsoleProcess::Startup(TStartupInfo& AStartupInfo, TProcessInformation&, TPipeRef AInPipe,
                              TPipeRef AOutPipe, TPipeRef AErrorPipe) {
  // A pipe that cannot be made takes the ones made before it along.
  auto Undo = OnFailure([&]() noexcept {
    AInPipe.Reset();
    AOutPipe.Reset();
    AErrorPipe.Reset();
  });
  AInPipe.Reset(new TPipe);
  AOutPipe.Reset(new TPipe);
  AErrorPipe.Reset(new TPipe);
  AStartupInfo = TStartupInfo();
  AStartupInfo.Flags = StartfUseShowWindow | StartfUseStdHandles;
  AStartupInfo.ShowWindow = FVisibility;
  AStartupInfo.StdOutput = AOutPipe->WriteHandle();
  AStartupInfo.StdError = AErrorPipe->WriteHandle();
}

bool TConsoleProcess::Execute(TStartupInfo& AStartupInfo, TProcessInformation& AProcessInfo) {
  FEnvList->Sort();
  std::vector<String> Env;
  Env.reserve(static_cast<std::size_t>(FEnvList->Count()));
  for (int I = 0; I < FEnvList->Count(); ++I) Env.push_back(FEnvList->Get(I));
  int Err = AProcessInfo.Process.Spawn(SplitCommandLine(FCommandLine), Env, FWorkingDir, AStartupInfo);
  if (Err != 0) {
    DoReportFatalError(FExeFileName.empty()
                           ? Format(LoadResString(SFailedToCreateProcess), FCommandLine, SysErrorMessage(Err))
                           : Format(LoadResString(SFailedToRun), FExeFileName, SysErrorMessage(Err)));
    return false;
  }
  AProcessInfo.ProcessId = AProcessInfo.Process.ProcessId();
  return true;
}

void TConsoleProcess::Running(TStartupInfo&, TProcessInformation& AProcessInfo, TPipeRef,
                              TPipeRef AOutPipe, TPipeRef AErrorPipe) {
  detail::TBeatClock Clock = StartClock();
  do {
    AOutPipe->PartialRead();
    AErrorPipe->PartialRead();
  } while (!Clock.Tick(AProcessInfo.Process));
  AOutPipe->GetList(FOutput.Get());
  AErrorPipe->GetList(FErrors.Get());
  ReadExitCode(AProcessInfo.Process);
}

void TConsoleProcess::ReadExitCode(TProcessHandle& AProcess) {
  std::uint32_t Code = 0;
  if (AProcess.GetExitCode(Code)) FExitCode = Code;
  else DoReportFatalError(LoadResString(SUnableToGetExitCode));
}

void TConsoleProcess::Cleanup(TStartupInfo&, TProcessInformation& AProcessInfo, TPipeRef AInPipe,
                              TPipeRef AOutPipe, TPipeRef AErrorPipe) noexcept {
  AInPipe.Reset();
  AOutPipe.Reset();
  AErrorPipe.Reset();
  AProcessInfo.Process.Close();
}

void TConsoleProcess::BeforeDestruction() {
  FOutput.Reset();
  FErrors.Reset();
  FEnvList.Reset();
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// TReportProcess
//===----------------------------------------------------------------------===//

bool TReportProcess::CancelProcess() { return false; }
void TReportProcess::SetOnOutputChanged(TListChanged AHandler) { FOnOutputChanged = std::move(AHandler); }
void TReportProcess::SetOnErrorChanged(TListChanged AHandler) { FOnErrorChanged = std::move(AHandler); }

void TReportProcess::Running(TStartupInfo&, TProcessInformation& AProcessInfo, TPipeRef,
                             TPipeRef AOutPipe, TPipeRef AErrorPipe) {
  TProcessHandle& Process = AProcessInfo.Process;
  const int OldOut = 0, OldErr = 0;
  detail::TBeatClock Clock = StartClock();
  for (;;) {
    ProcessApplicationMessages();
    AOutPipe->PartialRead();
    AErrorPipe->PartialRead();
    if (Clock.Tick(Process) || CancelProcess()) break;
  }
  if (CancelProcess()) Process.Terminate(CancelledExitCode);
  ProcessApplicationMessages();
  AOutPipe->GetList(FOutput.Get());
  NotifyChanged(FOnOutputChanged, FOutput.Get(), OldOut);
  AErrorPipe->GetList(FErrors.Get());
  NotifyChanged(FOnErrorChanged, FErrors.Get(), OldErr);
  ReadExitCode(Process);
  if (CancelProcess()) FExitCode = CancelledExitCode;
}

void TReportProcess::NotifyChanged(const TListChanged& AHandler, TStringList* AList, int AOldCount) {
  int NewCount = AList->Count();
  if (NewCount != AOldCount && AHandler) AHandler(this, AList, AOldCount, NewCount);
}

//===----------------------------------------------------------------------===//
// Processes of the system
//===----------------------------------------------------------------------===//

namespace {

/// The process identifier a directory of /proc stands for, or 0.
int ProcessIdOf(const char* Name) noexcept {
  int Pid = 0;
  for (const char* C = Name; *C; ++C) {
    if (*C < '0' || *C > '9' || Pid > 100000000) return 0;
    Pid = Pid * 10 + (*C - '0');
  }
  return Pid;
}

/// The path of the process's executable; false when the process cannot be looked into.
bool ExecutableOf(int Pid, String& Path) {
  char Link[64];
  std::snprintf(Link, sizeof Link, "/proc/%d/exe", Pid);
  char Target[4096];
  ssize_t Len = ::readlink(Link, Target, sizeof Target);
  if (Len <= 0 || Len >= static_cast<ssize_t>(sizeof Target)) return false;
  Path.assign(Target, static_cast<std::size_t>(Len));
  constexpr std::string_view Deleted = " (deleted)";
  if (Path.size() > Deleted.size() && Path.ends_with(Deleted)) Path.resize(Path.size() - Deleted.size());
  return true;
}

} // namespace

void EnumProcesses(const TEnumProcessesEvent& ACallback) {
  DIR* Proc = ::opendir("/proc");
  if (!Proc) return;
  auto Close = Finally([&]() noexcept { ::closedir(Proc); });
  while (dirent* Entry = ::readdir(Proc)) {
    int Pid = ProcessIdOf(Entry->d_name);
    String Path;
    if (Pid <= 0 || !ExecutableOf(Pid, Path)) continue;
    if (ACallback) ACallback(Pid, ExtractFileName(Path));
  }
}

} // namespace formkit
