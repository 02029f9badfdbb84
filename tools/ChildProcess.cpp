//===- tools/ChildProcess.cpp - Starting, waiting for and ending a child --===//
//
// Children start through `posix_spawn` with an argument vector. The child's
// status is collected only under the handle's lock, and a signal goes only to
// a child whose status was not yet collected, so its identifier cannot have
// been reused by then.
//
//===----------------------------------------------------------------------===//
#include "tools/ChildProcess.h"

#include <cerrno>
#include <chrono>
#include <cstdlib>
#include <system_error>
#include <thread>

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace formkit {

//===----------------------------------------------------------------------===//
// Command lines
//===----------------------------------------------------------------------===//

namespace {

bool IsBlank(char C) noexcept { return C == ' ' || C == '\t'; }

} // namespace

std::vector<String> SplitCommandLine(std::string_view CommandLine) {
  std::vector<String> Args;
  std::size_t I = 0;
  const std::size_t N = CommandLine.size();
  for (;;) {
    while (I < N && IsBlank(CommandLine[I])) ++I;
    if (I >= N) return Args;
    String Arg;
    bool Quoted = false;
    while (I < N && (Quoted || !IsBlank(CommandLine[I]))) {
      char C = CommandLine[I];
      if (C == '\\') {
        std::size_t Slashes = 0;
        while (I < N && CommandLine[I] == '\\') ++Slashes, ++I;
        if (I < N && CommandLine[I] == '"') {
          Arg.append(Slashes / 2, '\\');
          if (Slashes % 2 == 1) Arg += '"', ++I;
          // An even run leaves the quote to act below.
        } else {
          Arg.append(Slashes, '\\');
        }
      } else if (C == '"') {
        if (Quoted && I + 1 < N && CommandLine[I + 1] == '"') {
          Arg += '"';
          I += 2;
        } else {
          Quoted = !Quoted;
          ++I;
        }
      } else {
        Arg += C;
        ++I;
      }
    }
    Args.push_back(std::move(Arg));
  }
}

String QuoteArgument(std::string_view Arg) {
  if (!Arg.empty() && Arg.find_first_of(" \t\n\v\r\"") == std::string_view::npos) return String(Arg);
  String Out = "\"";
  std::size_t Slashes = 0;
  for (char C : Arg) {
    if (C == '\\') {
      ++Slashes;
      continue;
    }
    // Backslashes before a quote are doubled, and the quote gets one of its own.
    Out.append(C == '"' ? Slashes * 2 + 1 : Slashes, '\\');
    Slashes = 0;
    Out += C;
  }
  // Trailing backslashes stand before the closing quote: doubled.
  Out.append(Slashes * 2, '\\');
  Out += '"';
  return Out;
}

String JoinCommandLine(const std::vector<String>& Args) {
  String Out;
  for (const String& Arg : Args) {
    if (!Out.empty()) Out += ' ';
    Out += QuoteArgument(Arg);
  }
  return Out;
}

String SysErrorMessage(int ErrorCode) { return std::generic_category().message(ErrorCode); }

//===----------------------------------------------------------------------===//
// Starting a child
//===----------------------------------------------------------------------===//

namespace {

bool IsExecutableFile(const String& Path) noexcept {
  struct stat St;
  return ::stat(Path.c_str(), &St) == 0 && S_ISREG(St.st_mode) && ::access(Path.c_str(), X_OK) == 0;
}

/// The file to start for `Name`: a name with a slash is taken as it is, made absolute
/// against the parent's directory (the child may start elsewhere); a plain name is looked
/// up along the parent's PATH. Returns 0 or an error number.
int ResolveProgram(const String& Name, String& Path) {
  if (Name.find('/') != String::npos) {
    Path = Name;
    if (Name.front() != '/') {
      char Cwd[4096];
      if (!::getcwd(Cwd, sizeof Cwd)) return errno;
      Path = String(Cwd) + "/" + Name;
    }
    return 0;
  }
  const char* Env = std::getenv("PATH");
  std::string_view Dirs = Env ? Env : "/usr/local/bin:/usr/bin:/bin";
  for (;;) {
    std::size_t Colon = Dirs.find(':');
    std::string_view Dir = Dirs.substr(0, Colon);
    String Candidate = (Dir.empty() ? String(".") : String(Dir)) + "/" + Name;
    if (IsExecutableFile(Candidate)) {
      Path = std::move(Candidate);
      return 0;
    }
    if (Colon == std::string_view::npos) return ENOENT;
    Dirs.remove_prefix(Colon + 1);
  }
}

/// Pointers to the strings, ending with a null one, as `posix_spawn` takes them.
std::vector<char*> CVector(const std::vector<String>& Strings) {
  std::vector<char*> Out;
  Out.reserve(Strings.size() + 1);
  for (const String& S : Strings) Out.push_back(const_cast<char*>(S.c_str()));
  Out.push_back(nullptr);
  return Out;
}

/// Gives the child `Fd` as descriptor `Target`, or the null device when `Fd` is -1.
int AddStdStream(posix_spawn_file_actions_t& Actions, int Fd, int Target, int Mode) {
  if (Fd >= 0) return ::posix_spawn_file_actions_adddup2(&Actions, Fd, Target);
  return ::posix_spawn_file_actions_addopen(&Actions, Target, "/dev/null", Mode, 0);
}

int BuildFileActions(posix_spawn_file_actions_t& Actions, const String& WorkingDir,
                     const TStartupInfo& Info) {
  int Err = 0;
  // Output first: should a given descriptor be 0, opening the null device on 0 comes after.
  if (Info.Flags & StartfUseStdHandles) {
    if (!Err) Err = AddStdStream(Actions, Info.StdOutput, STDOUT_FILENO, O_WRONLY);
    if (!Err) Err = AddStdStream(Actions, Info.StdError, STDERR_FILENO, O_WRONLY);
    if (!Err) Err = AddStdStream(Actions, Info.StdInput, STDIN_FILENO, O_RDONLY);
  }
  if (!Err && !WorkingDir.empty()) Err = ::posix_spawn_file_actions_addchdir_np(&Actions, WorkingDir.c_str());
  // Whatever else the parent has open, even without close-on-exec, stays out of the child.
  if (!Err) Err = ::posix_spawn_file_actions_addclosefrom_np(&Actions, STDERR_FILENO + 1);
  return Err;
}

int BuildAttributes(posix_spawnattr_t& Attr) {
  sigset_t None, All;
  sigemptyset(&None);
  sigfillset(&All);
  int Err = ::posix_spawnattr_setflags(&Attr, POSIX_SPAWN_SETPGROUP | POSIX_SPAWN_SETSIGMASK |
                                                  POSIX_SPAWN_SETSIGDEF);
  if (!Err) Err = ::posix_spawnattr_setpgroup(&Attr, 0);
  if (!Err) Err = ::posix_spawnattr_setsigmask(&Attr, &None);
  if (!Err) Err = ::posix_spawnattr_setsigdefault(&Attr, &All);
  return Err;
}

} // namespace

int TProcessHandle::Spawn(const std::vector<String>& Argv, const std::vector<String>& Env,
                          const String& WorkingDir, const TStartupInfo& Info) {
  Close();
  if (Argv.empty() || Argv.front().empty()) return EINVAL;
  String Program;
  if (int Err = ResolveProgram(Argv.front(), Program)) return Err;

  posix_spawn_file_actions_t Actions;
  if (int Err = ::posix_spawn_file_actions_init(&Actions)) return Err;
  auto FreeActions = Finally([&]() noexcept { ::posix_spawn_file_actions_destroy(&Actions); });
  posix_spawnattr_t Attr;
  if (int Err = ::posix_spawnattr_init(&Attr)) return Err;
  auto FreeAttr = Finally([&]() noexcept { ::posix_spawnattr_destroy(&Attr); });
  if (int Err = BuildFileActions(Actions, WorkingDir, Info)) return Err;
  if (int Err = BuildAttributes(Attr)) return Err;

  std::vector<char*> ArgPtrs = CVector(Argv), EnvPtrs = CVector(Env);
  pid_t Pid = 0;
  if (int Err = ::posix_spawn(&Pid, Program.c_str(), &Actions, &Attr, ArgPtrs.data(), EnvPtrs.data()))
    return Err;
  std::lock_guard Guard(FLock);
  FPid = Pid;
  FPidFd = static_cast<int>(::syscall(SYS_pidfd_open, Pid, 0));
  FEnded = FLost = FTerminated = false;
  FStatus = 0;
  FTerminateCode = 0;
  return 0;
}

//===----------------------------------------------------------------------===//
// Watching and ending a child
//===----------------------------------------------------------------------===//

bool TProcessHandle::IsOpen() const noexcept {
  std::lock_guard Guard(FLock);
  return FPid != 0;
}

int TProcessHandle::ProcessId() const noexcept {
  std::lock_guard Guard(FLock);
  return FPid;
}

// Under FLock. True when the child has ended and its status is here (or lost).
bool TProcessHandle::Collect(int Options) noexcept {
  if (FEnded) return true;
  for (;;) {
    int Status = 0;
    pid_t Got = ::waitpid(FPid, &Status, Options);
    if (Got == FPid) {
      FEnded = true;
      FStatus = Status;
      return true;
    }
    if (Got == -1 && errno == EINTR) continue;
    if (Got == -1 && errno == ECHILD) {
      // Collected elsewhere (a parent that ignores SIGCHLD): ended, code unknown.
      FEnded = FLost = true;
      return true;
    }
    return false;
  }
}

// Under FLock, on a child not yet collected: its identifier is still its own.
void TProcessHandle::Kill() noexcept {
  ::kill(-FPid, SIGKILL);
  // The child may have left its group.
  ::kill(FPid, SIGKILL);
}

bool TProcessHandle::Wait(int TimeoutMs) {
  using Clock = std::chrono::steady_clock;
  const auto Deadline = Clock::now() + std::chrono::milliseconds(std::max(TimeoutMs, 0));
  int PidFd = -1;
  {
    std::lock_guard Guard(FLock);
    if (FPid == 0 || Collect(WNOHANG)) return true;
    PidFd = FPidFd;
  }
  for (;;) {
    auto Left = std::chrono::duration_cast<std::chrono::milliseconds>(Deadline - Clock::now()).count();
    if (Left <= 0) break;
    if (PidFd >= 0) {
      pollfd Ready{PidFd, POLLIN, 0};
      int Got = ::poll(&Ready, 1, static_cast<int>(Left));
      if (Got > 0 || (Got < 0 && errno != EINTR)) break;
    } else {
      // Without a descriptor for the child: look again every few milliseconds.
      std::this_thread::sleep_for(std::chrono::milliseconds(std::min<long long>(Left, 5)));
      std::lock_guard Guard(FLock);
      if (Collect(WNOHANG)) return true;
    }
  }
  std::lock_guard Guard(FLock);
  return FPid == 0 || Collect(WNOHANG);
}

bool TProcessHandle::Terminate(std::uint32_t ExitCode) noexcept {
  std::lock_guard Guard(FLock);
  if (FPid == 0 || Collect(WNOHANG)) return false;
  Kill();
  if (!FTerminated) {
    FTerminated = true;
    FTerminateCode = ExitCode;
  }
  return true;
}

bool TProcessHandle::GetExitCode(std::uint32_t& Code) {
  std::lock_guard Guard(FLock);
  if (FPid == 0) return false;
  if (!Collect(WNOHANG)) {
    Code = StillActive;
    return true;
  }
  if (FLost) return false;
  if (WIFEXITED(FStatus)) Code = static_cast<std::uint32_t>(WEXITSTATUS(FStatus));
  else if (FTerminated && WTERMSIG(FStatus) == SIGKILL) Code = FTerminateCode;
  else Code = 128 + static_cast<std::uint32_t>(WTERMSIG(FStatus)); // as shells report it
  return true;
}

void TProcessHandle::Close() noexcept {
  std::lock_guard Guard(FLock);
  if (FPid == 0) return;
  if (!Collect(WNOHANG)) {
    Kill();
    // A killed child ends at once; this wait is for the system to finish it.
    Collect(0);
  }
  if (FPidFd >= 0) ::close(FPidFd);
  FPidFd = -1;
  FPid = 0;
}

} // namespace formkit
