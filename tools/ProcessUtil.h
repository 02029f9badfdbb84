//===- tools/ProcessUtil.h - Running console tools ------------------------===//
//
// The process runner: starts an external console tool, captures its standard
// output and standard error into string lists, enforces a time-out and reports
// the exit code. Three grades: `TConsoleProcess` blocks until the tool ends;
// `TReportProcess` blocks too, keeps the application's messages flowing and can
// be cancelled; `TMonitorProcess` returns at once and watches the tool from a
// background thread, telling the main thread of each new batch of lines. All
// three read the pipes on a beat of 250 milliseconds, which is also the unit of
// the time-out. `EnumProcesses` lists the processes of the system.
//
// The command line is cut into arguments as `SplitCommandLine` says and the
// program started directly: no shell sees it.
//
// Example:
//   TObjectGuard<TConsoleProcess> Tool(new TConsoleProcess);
//   Tool->SetCommandLine("cc -c \"my unit.c\"");
//   Tool->SetTimeOut(60000);           // ended with exit code 999 after a minute
//   Tool->Run();
//   if (Tool->ExitCode() != 0) ShowLines(Tool->GetErrors());
//
//   TObjectGuard<TMonitorProcess> Server(new TMonitorProcess);
//   Server->SetCommandLine("server --port 8080");
//   Server->SetOnOutputChanged([](TObject*, TStringList* Batch, int, int) { Log(Batch); });
//   Server->Run();                     // returns at once; handlers run on the main thread
//   ...
//   Server->CancelProcess();
//
//===----------------------------------------------------------------------===//
#pragma once

#include "tools/ChildProcess.h"
#include "tools/PipeUtil.h"
#include "tools/Threads.h"

#include <atomic>
#include <functional>
#include <mutex>

namespace formkit {

//===----------------------------------------------------------------------===//
// Messages, codes and event types
//===----------------------------------------------------------------------===//

FK_RESOURCESTRING(SFailedToRun, "Failed to run %s. %s");
FK_RESOURCESTRING(SFailedToCreateProcess,
                  "Failed to create process\r\nCommand line: '%s'\r\nError Message: '%s'");
FK_RESOURCESTRING(SUnableToGetExitCode, "Unable to get process exit code");
FK_RESOURCESTRING(SMonitorThreadRunning, "Monitor thread already running");
FK_RESOURCESTRING(SProcessNotManaged, "Process is not being managed");

/// The name of the thread that watches a `TMonitorProcess`.
inline constexpr const char* MonitorThreadName = "ProcessUtil Monitor Thread";
/// The beat of every reading loop, in milliseconds; also the unit of a time-out.
inline constexpr int ProcessBeat = 250;
/// The exit code of a process ended for its time-out.
inline constexpr std::uint32_t TimedOutExitCode = 999;
/// The exit code of a `TReportProcess` child stopped by `CancelProcess`.
inline constexpr std::uint32_t CancelledExitCode = 100;
/// The exit code given to a `TMonitorProcess` child ended by `CancelProcess`.
inline constexpr std::uint32_t MonitorCancelExitCode = 0;
/// The exit code left when a process could not be started or its code could not be
/// read, and `ReportFatalError` returned instead of raising.
inline constexpr std::uint32_t FatalErrorExitCode = 0x0BADF00D;

/// Tells of new lines in `AList`: the count at the last notification and the count now.
using TListChanged =
    std::function<void(TObject* ASender, TStringList* AList, int AOldCount, int ANewCount)>;
/// Tells that something happened to `Sender`.
using TNotifyReference = std::function<void(TObject* Sender)>;
/// One process of the system: its identifier and the base name of its executable.
using TEnumProcessesEvent = std::function<void(int APid, const String& AName)>;

/// The exception of `TMonitorProcess`.
FK_EXCEPTION(TMonitorProcessException, Exception);

/// The pipe a runner holds: owned, possibly none.
using TPipeRef = TObjectGuard<TPipe>&;

namespace detail {
/// The clock of a reading loop: the time-out counted down one beat at a time.
struct TBeatClock {
  bool DoTimeOut = false;
  std::int64_t Countdown = -1;
  /// Counts a beat off the time-out and ends the process with 999 once it has run out,
  /// again at every beat after that; then waits one beat for the process. True when the
  /// process has ended.
  bool Tick(TProcessHandle& Process);
};
} // namespace detail

//===----------------------------------------------------------------------===//
// TConsoleProcess
//===----------------------------------------------------------------------===//

/// Runs a console tool to its end and keeps what it wrote. `Run` blocks; the output is
/// decoded once, at the end. Owns its lists and its copy of the environment.
class FK_API TConsoleProcess : public TObject {
  FK_CLASS(TConsoleProcess, TObject)

  /// Takes a copy of the current environment and makes the empty lists.
  TConsoleProcess();

  /// The command line, cut into the program and its arguments as `SplitCommandLine` says.
  const String& CommandLine() const noexcept { return FCommandLine; }
  virtual void SetCommandLine(const String& AValue);
  /// Only named in the message of a failed start.
  const String& ExeFileName() const noexcept { return FExeFileName; }
  virtual void SetExeFileName(const String& AValue);
  /// The child's working directory; empty for the parent's.
  const String& WorkingDir() const noexcept { return FWorkingDir; }
  virtual void SetWorkingDir(const String& AValue);
  std::uint32_t ExitCode() const noexcept { return FExitCode; }
  virtual void SetExitCode(std::uint32_t AValue);
  /// What the child wrote to its standard output, one line each. Not for the caller to free.
  virtual TStringList* GetOutput();
  /// Replaces the lines by a copy of `AValue`'s.
  virtual void SetOutput(TStringList* AValue);
  /// What the child wrote to its standard error.
  virtual TStringList* GetErrors();
  virtual void SetErrors(TStringList* AValue);
  /// The child's environment, one NAME=value each; sorted when a run starts.
  virtual TStrings* GetEnvList();
  /// The show-window value handed to the child; 0 (hidden) by default.
  std::uint8_t Visibility() const noexcept { return FVisibility; }
  void SetVisibility(std::uint8_t AValue) noexcept { FVisibility = AValue; }
  /// The time-out in milliseconds; -1 by default, which means none.
  int TimeOut() const noexcept { return FTimeOut; }
  /// Stores the time-out; 0 or more also switches the time-out on. A negative value
  /// does not switch it off.
  virtual void SetTimeOut(int AValue);

  /// Starts the child and reads its pipes every beat until it ends. A start that fails
  /// goes to `ReportFatalError`, which raises by default.
  virtual void Run();

  void BeforeDestruction() override;

protected:
  /// Raises `Exception` with `AMessage`. An override that returns lets the run go on with
  /// the exit code `FatalErrorExitCode`.
  virtual void ReportFatalError(const String& AMessage);
  /// Makes the three pipes (in, out, error) and fills the start information: the child
  /// writes into the out and error pipes; its input is the null device.
  virtual void Startup(TStartupInfo& AStartupInfo, TProcessInformation& AProcessInfo,
                       TPipeRef AInPipe, TPipeRef AOutPipe, TPipeRef AErrorPipe);
  /// Starts the child with the sorted environment. False (after `ReportFatalError`)
  /// when it could not be started.
  [[nodiscard]] virtual bool Execute(TStartupInfo& AStartupInfo, TProcessInformation& AProcessInfo);
  /// The reading loop; ends when the child has ended.
  virtual void Running(TStartupInfo& AStartupInfo, TProcessInformation& AProcessInfo,
                       TPipeRef AInPipe, TPipeRef AOutPipe, TPipeRef AErrorPipe);
  /// Frees the pipes and closes the process; a child still running is ended first.
  virtual void Cleanup(TStartupInfo& AStartupInfo, TProcessInformation& AProcessInfo,
                       TPipeRef AInPipe, TPipeRef AOutPipe, TPipeRef AErrorPipe) noexcept;

  /// `ReportFatalError`, then, if it returns, the exit code `FatalErrorExitCode`.
  void DoReportFatalError(const String& AMessage);
  /// The clock of a reading loop that starts now.
  detail::TBeatClock StartClock() const noexcept { return {FDoTimeOut, FTimeOut}; }
  /// Reads the exit code into `FExitCode`; `DoReportFatalError` when it cannot be read.
  void ReadExitCode(TProcessHandle& AProcess);

  String FCommandLine;
  String FExeFileName;
  String FWorkingDir;
  TObjectGuard<TStringList> FOutput;
  TObjectGuard<TStringList> FErrors;
  TObjectGuard<TStringList> FEnvList;
  std::uint32_t FExitCode = 0;
  std::uint8_t FVisibility = 0;
  bool FDoTimeOut = false;
  int FTimeOut = -1;
};

//===----------------------------------------------------------------------===//
// TReportProcess
//===----------------------------------------------------------------------===//

/// A console process that lets the application process its messages every beat while
/// it waits, can be cancelled, and tells of the lines it captured when it ends. Its
/// caller must be ready for events during `Run`.
class FK_API TReportProcess : public TConsoleProcess {
  FK_CLASS(TReportProcess, TConsoleProcess)

  /// Asked every beat; True stops the child with exit code 100. False here.
  [[nodiscard]] virtual bool CancelProcess();
  const TListChanged& OnOutputChanged() const noexcept { return FOnOutputChanged; }
  virtual void SetOnOutputChanged(TListChanged AHandler);
  const TListChanged& OnErrorChanged() const noexcept { return FOnErrorChanged; }
  virtual void SetOnErrorChanged(TListChanged AHandler);

protected:
  void Running(TStartupInfo& AStartupInfo, TProcessInformation& AProcessInfo, TPipeRef AInPipe,
               TPipeRef AOutPipe, TPipeRef AErrorPipe) override;
  /// Hands `AList` to `AHandler` when its count is no longer `AOldCount`.
  void NotifyChanged(const TListChanged& AHandler, TStringList* AList, int AOldCount);

  TListChanged FOnOutputChanged;
  TListChanged FOnErrorChanged;
};

//===----------------------------------------------------------------------===//
// TMonitorProcess
//===----------------------------------------------------------------------===//

class TMonitorThread;

/// A process that runs beside the application. `Run` starts it and returns; with `Watch`
/// (the default) a `TMonitorThread` reads its pipes every beat, and each poll replaces a
/// list with the batch of lines that came in since the one before. Handlers run on the
/// main thread: the change handlers while the monitor waits for them, `OnTerminate` later,
/// from the queue of handed-over calls (`CheckSynchronize`). Without `Watch` the child
/// gets no pipes and nothing watches it. Destroying the object cancels a watched child
/// that still runs and ends an unwatched one: no child outlives its runner.
class FK_API TMonitorProcess : public TReportProcess {
  FK_CLASS(TMonitorProcess, TReportProcess)

  /// Starts the child, and the monitor when watched. Raises `TMonitorProcessException`
  /// "Monitor thread already running" while one runs.
  void Run() override;
  /// True from `Run` until the monitor has seen the child end, or the run is cancelled.
  bool IsRunning() const noexcept;
  /// The child; its exit code is read there. Not owned by the caller.
  TProcessHandle* GetProcess() noexcept { return &FProcessInfo.Process; }
  int GetProcessId() const noexcept { return FProcessInfo.ProcessId; }
  /// The thread that watches the child; null before `Run` and after a cancel.
  TMonitorThread* Monitor() const noexcept { return FMonitor.Get(); }

  bool Watch() const noexcept { return FWatch; }
  // Each setter below raises `TMonitorProcessException` "Monitor thread already running"
  // while `IsRunning`, and changes nothing then.
  void SetWatch(bool AValue);
  void SetExeFileName(const String& AValue) override;
  void SetCommandLine(const String& AValue) override;
  void SetWorkingDir(const String& AValue) override;
  void SetOnOutputChanged(TListChanged AHandler) override;
  void SetOnErrorChanged(TListChanged AHandler) override;
  void SetOnTerminate(TNotifyReference AHandler);

  // The lists are fetched and assigned under their locks; read them in the handlers or
  // once the child has ended, while the monitor leaves them alone.
  TStringList* GetOutput() override;
  void SetOutput(TStringList* AValue) override;
  TStringList* GetErrors() override;
  void SetErrors(TStringList* AValue) override;

  /// Stops a watched running child with exit code 0, waits for the monitor (serving
  /// its calls to the main thread meanwhile) and releases the child and the pipes. True.
  /// Raises `TMonitorProcessException` "Process is not being managed" otherwise. Never
  /// from inside a change handler: the monitor is waiting for that handler.
  [[nodiscard]] bool CancelProcess() override;

  void BeforeDestruction() override;

private:
  friend class TMonitorThread;
  void CheckNotRunning() const;
  /// Lets go of the run's thread (waiting for it), child and pipes.
  void ReleaseProcess() noexcept;
  /// `ReleaseProcess`, and drops the run's end notice if it is still queued.
  void ReleaseRun() noexcept;
  /// On the monitor: reads both pipes, hands each new batch to the main thread.
  void Poll();
  void PollPipe(TPipe* APipe, std::mutex& ALock, TStringList* AList, int& ALast,
                void (TMonitorProcess::*ANotify)());
  void DoOutputChanged();
  void DoErrorChanged();
  void DoTerminate();

  TNotifyReference FOnTerminate;
  TObjectGuard<TMonitorThread> FMonitor;
  bool FWatch = true;
  std::mutex FOnOutputLock;
  std::mutex FOnErrorsLock;
  TProcessInformation FProcessInfo;
  TStartupInfo FStartupInfo;
  TObjectGuard<TPipe> FInPipe;
  TObjectGuard<TPipe> FOutPipe;
  TObjectGuard<TPipe> FErrorPipe;
  int FLastOut = 0;
  int FLastErr = 0;
  std::atomic<bool> FTerminated{false};
};

/// The thread that watches one `TMonitorProcess`, named "ProcessUtil Monitor Thread".
class FK_API TMonitorThread : public TThread {
  FK_CLASS(TMonitorThread, TThread)

  /// Made by `AMonitorProcess`'s `Run`, on the main thread: the time-out starts then.
  explicit TMonitorThread(TMonitorProcess* AMonitorProcess);

protected:
  void Execute() override;

private:
  /// The process watched; it owns this thread.
  TMonitorProcess* FMonitorProcess = nullptr;
  /// The time-out as it stood at `Run`, so that the thread never reads the settings.
  detail::TBeatClock FClock;
};

//===----------------------------------------------------------------------===//
// Processes of the system
//===----------------------------------------------------------------------===//

/// Calls `ACallback` with the identifier and the executable's base name of each process
/// whose executable can be read; the others are skipped. A null callback is allowed.
FK_API void EnumProcesses(const TEnumProcessesEvent& ACallback);

} // namespace formkit
