//===- tools/ChildProcess.h - Starting, waiting for and ending a child ----===//
//
// The process primitives under the process runner: a command line cut into
// arguments (no shell ever sees it), the start information that says which
// descriptors a child gets as its standard streams, and `TProcessHandle`,
// which starts a child, waits for it with a time-out, ends it with a chosen
// exit code and reads that code. A handle owns its child: closing it ends a
// child that still runs and collects its status, so no child outlives it and
// none is left a zombie.
//
// Example:
//   TStartupInfo Info;
//   Info.Flags = StartfUseStdHandles;
//   Info.StdOutput = Out->WriteHandle();            // the others get the null device
//   TProcessHandle Child;
//   if (int Err = Child.Spawn(SplitCommandLine("make -C \"my dir\""), Env, "", Info))
//     throw Exception(SysErrorMessage(Err));
//   while (!Child.Wait(250)) Out->PartialRead();
//   std::uint32_t Code = 0;
//   (void)Child.GetExitCode(Code);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <cstdint>
#include <mutex>
#include <vector>

namespace formkit {

//===----------------------------------------------------------------------===//
// Command lines
//===----------------------------------------------------------------------===//

/// Cuts a command line into arguments. Blanks (space, tab) separate; double quotes
/// group, and `""` inside quotes is one quote; backslashes are literal except before a
/// quote, where 2n of them give n and the quote acts, and 2n+1 give n and a literal quote.
FK_API std::vector<String> SplitCommandLine(std::string_view CommandLine);
/// The argument as `SplitCommandLine` reads it back unchanged: quoted when it is empty or
/// holds blanks, line breaks or quotes.
FK_API String QuoteArgument(std::string_view Arg);
/// The arguments quoted and joined by single spaces.
FK_API String JoinCommandLine(const std::vector<String>& Args);

/// The system's text for error number `ErrorCode`, as `strerror` gives it.
FK_API String SysErrorMessage(int ErrorCode);

//===----------------------------------------------------------------------===//
// Start information
//===----------------------------------------------------------------------===//

/// `TStartupInfo::Flags`: the show-window value is given.
inline constexpr std::uint32_t StartfUseShowWindow = 0x00000001;
/// `TStartupInfo::Flags`: the standard descriptors are given.
inline constexpr std::uint32_t StartfUseStdHandles = 0x00000100;
/// The exit code read while the process still runs.
inline constexpr std::uint32_t StillActive = 259;

/// What a child is started with besides its arguments.
struct TStartupInfo {
  std::uint32_t Flags = 0;
  /// How a windowed child shows itself; console children here have no window to show.
  std::uint16_t ShowWindow = 0;
  /// With `StartfUseStdHandles`: the descriptors that become the child's standard input,
  /// output and error; -1 gives it the null device. Without the flag the child shares
  /// the parent's. Not owned.
  int StdInput = -1;
  int StdOutput = -1;
  int StdError = -1;
};

//===----------------------------------------------------------------------===//
// TProcessHandle
//===----------------------------------------------------------------------===//

/// One child process. A child runs in a process group of its own, with the default
/// signal handling and no descriptor of the parent but the three it is given. Safe to
/// call from two threads (a watching thread and the main one), except that `Spawn` and
/// `Close` must not overlap a `Wait` on the other. Not copyable.
class FK_API TProcessHandle {
public:
  TProcessHandle() = default;
  TProcessHandle(const TProcessHandle&) = delete;
  TProcessHandle& operator=(const TProcessHandle&) = delete;
  ~TProcessHandle() { Close(); }

  /// Starts `Argv[0]` (looked up along the parent's PATH when it holds no slash) with
  /// the arguments `Argv`, the environment `Env` (one NAME=value each) and, when it is
  /// not empty, the working directory `WorkingDir`. Closes the child held before.
  /// Returns 0, or the system's error number when nothing was started.
  [[nodiscard]] int Spawn(const std::vector<String>& Argv, const std::vector<String>& Env,
                          const String& WorkingDir, const TStartupInfo& Info);

  /// True from a successful `Spawn` to `Close`.
  bool IsOpen() const noexcept;
  /// The child's process identifier; 0 when none is open.
  int ProcessId() const noexcept;

  /// Waits up to `TimeoutMs` milliseconds for the child to end; true when it has ended
  /// (or none is open). Wakes as soon as the child ends.
  bool Wait(int TimeoutMs);
  /// Ends the child and its process group; the child's exit code becomes `ExitCode`.
  /// Does nothing to a child that already ended. True when it was told to end.
  bool Terminate(std::uint32_t ExitCode) noexcept;
  /// The exit code, or `StillActive` while the child runs. False when it cannot be read:
  /// no child is open, or its status was taken by someone else.
  [[nodiscard]] bool GetExitCode(std::uint32_t& Code);
  /// Ends a child that still runs, collects its status and releases the handle.
  void Close() noexcept;

private:
  bool Collect(int Options) noexcept;
  void Kill() noexcept;
  mutable std::mutex FLock;
  int FPid = 0;
  /// A descriptor that turns readable when the child ends; -1 where the system has none.
  int FPidFd = -1;
  bool FEnded = false;
  /// The status was taken by someone else: the exit code is unknown.
  bool FLost = false;
  int FStatus = 0;
  bool FTerminated = false;
  std::uint32_t FTerminateCode = 0;
};

/// A started process as its starter keeps it.
struct TProcessInformation {
  TProcessHandle Process;
  int ProcessId = 0;
};

} // namespace formkit
