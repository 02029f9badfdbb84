//===- tests/tools/ProcessUtilTest.cpp - The process runner ---------------===//
//
// Children are small /bin/sh scripts: the runner itself never uses a shell, so
// the shell here is just a program that prints what it was given. Each process
// test checks at its end that no descriptor and no child was left behind.
//
// The test command also runs the runner's threads under ThreadSanitizer, in a build
// directory of its own without the address sanitizer (`make threads`, preset "threads").
//
//===----------------------------------------------------------------------===//
#include "tools/ProcessUtil.h"

#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fstream>
#include <set>

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

using namespace formkit;

namespace {

using Clock = std::chrono::steady_clock;

long long MillisecondsSince(Clock::time_point Start) {
  return std::chrono::duration_cast<std::chrono::milliseconds>(Clock::now() - Start).count();
}

/// The descriptors open in this process.
int OpenDescriptors() {
  int Count = 0;
  DIR* Dir = ::opendir("/proc/self/fd");
  while (dirent* E = ::readdir(Dir))
    if (E->d_name[0] != '.') ++Count;
  ::closedir(Dir);
  return Count - 1; // the directory itself
}

/// True when this process has no child at all: none running, none unreaped.
bool HasNoChildren() {
  siginfo_t Info{};
  return ::waitid(P_ALL, 0, &Info, WEXITED | WNOHANG | WNOWAIT) == -1 && errno == ECHILD;
}

/// The command line that runs `Script` in /bin/sh with the further arguments.
String Sh(const String& Script, std::vector<String> Args = {}) {
  Args.insert(Args.begin(), {"/bin/sh", "-c", Script, "sh"});
  return JoinCommandLine(Args);
}

std::vector<String> Lines(TStrings* List) {
  std::vector<String> Out;
  for (int I = 0; I < List->Count(); ++I) Out.push_back(List->Get(I));
  return Out;
}

template <class T> String MessageOf(T&& Call) {
  try {
    Call();
  } catch (const Exception& E) {
    return E.Message();
  }
  return "(nothing raised)";
}

/// Checks at the end of a test that it left no descriptor and no child behind.
class ProcessTest : public ::testing::Test {
protected:
  void SetUp() override {
    ASSERT_TRUE(HasNoChildren());
    FDescriptors = OpenDescriptors();
  }
  void TearDown() override {
    // A call a test left queued for the main thread must not reach the next test.
    while (CheckSynchronize(0)) {}
    EXPECT_EQ(OpenDescriptors(), FDescriptors);
    EXPECT_TRUE(HasNoChildren());
  }
  int FDescriptors = 0;
};

/// Serves the main thread's queue until `Done` or two seconds have passed.
template <class Pred> bool ServeUntil(Pred Done, int LimitMs = 3000) {
  auto Start = Clock::now();
  while (!Done()) {
    if (MillisecondsSince(Start) > LimitMs) return false;
    CheckSynchronize(20);
  }
  return true;
}

//===----------------------------------------------------------------------===//
// Command lines
//===----------------------------------------------------------------------===//

TEST(CommandLineTest, SplitsLikeTheCommandLineRulesSay) {
  using V = std::vector<String>;
  EXPECT_EQ(SplitCommandLine(""), V{});
  EXPECT_EQ(SplitCommandLine("  \t "), V{});
  EXPECT_EQ(SplitCommandLine("a  b\tc"), (V{"a", "b", "c"}));
  EXPECT_EQ(SplitCommandLine("\"a b\" c\" d\"e"), (V{"a b", "c de"}));
  EXPECT_EQ(SplitCommandLine("\"\" x"), (V{"", "x"}));
  EXPECT_EQ(SplitCommandLine(R"(a\\b c\"d "e\\" f\\\"g)"), (V{R"(a\\b)", R"(c"d)", R"(e\)", R"(f\"g)"}));
  EXPECT_EQ(SplitCommandLine(R"("say ""hi""" x)"), (V{R"(say "hi")", "x"}));
  EXPECT_EQ(SplitCommandLine("\"open quote  runs"), (V{"open quote  runs"}));
}

TEST(CommandLineTest, QuotingRoundTripsEveryArgument) {
  std::vector<String> Args = {"plain", "", "two words", "tab\there", "quote\"inside", "trailing\\",
                              "back\\\\slashes\\\"quote", "\"", "new\nline", "$HOME;|&*?<>`'(x)",
                              "trailing space ", "\\\\server\\share\\"};
  EXPECT_EQ(SplitCommandLine(JoinCommandLine(Args)), Args);
  EXPECT_EQ(QuoteArgument("plain"), "plain");
  EXPECT_EQ(QuoteArgument(""), "\"\"");
  EXPECT_EQ(QuoteArgument("a b\\"), "\"a b\\\\\"");
  EXPECT_EQ(QuoteArgument("a\"b"), "\"a\\\"b\"");
}

//===----------------------------------------------------------------------===//
// The pipe
//===----------------------------------------------------------------------===//

TEST_F(ProcessTest, PipeReadsWithoutWaitingAndHandsOverBatches) {
  TObjectGuard<TPipe> Pipe(new TPipe);
  TStringList List;
  List.Add("old");
  auto Start = Clock::now();
  Pipe->PartialRead(); // nothing there: returns at once
  EXPECT_LT(MillisecondsSince(Start), 100);
  Pipe->GetList(&List);
  EXPECT_EQ(List.Count(), 0);

  // More than one read takes, with no final line break.
  String Text;
  for (int I = 0; I < 5000; ++I) Text += "line " + IntToStr(I) + "\n";
  Text += "last";
  ASSERT_GT(Text.size(), std::size_t(PipeBufferSize));
  std::size_t Written = 0;
  while (Written < Text.size()) {
    ssize_t N = ::write(Pipe->WriteHandle(), Text.data() + Written, std::min<std::size_t>(8192, Text.size() - Written));
    ASSERT_GT(N, 0);
    Written += static_cast<std::size_t>(N);
    Pipe->PartialRead();
  }
  Pipe->GetList(&List);
  ASSERT_EQ(List.Count(), 5001);
  EXPECT_EQ(List[0], "line 0");
  EXPECT_EQ(List[4999], "line 4999");
  EXPECT_EQ(List[5000], "last");

  // The next batch starts empty; a null list just drops it.
  ASSERT_EQ(::write(Pipe->WriteHandle(), "x\r\ny", 4), 4);
  Pipe->GetList(nullptr);
  Pipe->GetList(&List);
  EXPECT_EQ(List.Count(), 0);

  // Both ends stay out of children.
  EXPECT_EQ(::fcntl(Pipe->ReadHandle(), F_GETFD) & FD_CLOEXEC, FD_CLOEXEC);
  EXPECT_EQ(::fcntl(Pipe->WriteHandle(), F_GETFD) & FD_CLOEXEC, FD_CLOEXEC);
}

//===----------------------------------------------------------------------===//
// The process handle
//===----------------------------------------------------------------------===//

TEST_F(ProcessTest, ProcessHandleEndsAChildWithTheFirstCodeGiven) {
  TProcessHandle Child;
  std::uint32_t Code = 1;
  EXPECT_FALSE(Child.GetExitCode(Code));
  EXPECT_TRUE(Child.Wait(1000)); // nothing to wait for
  EXPECT_FALSE(Child.Terminate(5));
  TStartupInfo Info;
  Info.Flags = StartfUseStdHandles;
  ASSERT_EQ(Child.Spawn({"sleep", "5"}, {}, "", Info), 0);
  EXPECT_TRUE(Child.IsOpen());
  EXPECT_GT(Child.ProcessId(), 0);
  EXPECT_FALSE(Child.Wait(0));
  ASSERT_TRUE(Child.GetExitCode(Code));
  EXPECT_EQ(Code, StillActive);
  EXPECT_TRUE(Child.Terminate(42));
  ASSERT_TRUE(Child.Wait(2000));
  EXPECT_FALSE(Child.Terminate(7)); // ended: nothing happens
  ASSERT_TRUE(Child.GetExitCode(Code));
  EXPECT_EQ(Code, 42u);
  Child.Close();
  EXPECT_FALSE(Child.IsOpen());
  EXPECT_EQ(Child.ProcessId(), 0);
  EXPECT_FALSE(Child.GetExitCode(Code));

  // A child that ended by itself keeps its own code; a handle that goes ends its child.
  ASSERT_EQ(Child.Spawn({"/bin/sh", "-c", "exit 6"}, {}, "", Info), 0);
  ASSERT_TRUE(Child.Wait(2000));
  EXPECT_FALSE(Child.Terminate(9));
  ASSERT_TRUE(Child.GetExitCode(Code));
  EXPECT_EQ(Code, 6u);
  auto Start = Clock::now();
  {
    TProcessHandle Running;
    ASSERT_EQ(Running.Spawn({"sleep", "5"}, {}, "", Info), 0);
  }
  EXPECT_LT(MillisecondsSince(Start), 1500);
  EXPECT_EQ(Child.Spawn({}, {}, "", Info), EINVAL);
  EXPECT_FALSE(Child.IsOpen()); // the child held before went with the new start
}

//===----------------------------------------------------------------------===//
// TConsoleProcess
//===----------------------------------------------------------------------===//

TEST_F(ProcessTest, ConsoleCapturesOutputErrorsAndExitCodesExactly) {
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  EXPECT_EQ(P->TimeOut(), -1);
  EXPECT_EQ(P->Visibility(), 0);
  P->SetCommandLine(Sh("printf 'a\\nb\\r\\n\\n'; printf 'e1\\n' >&2; printf 'tail'; exit 7"));
  P->Run();
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"a", "b", "", "tail"}));
  EXPECT_EQ(Lines(P->GetErrors()), (std::vector<String>{"e1"}));
  EXPECT_EQ(P->ExitCode(), 7u);

  // Interleaved writes land in their own lists, each in order.
  P->SetCommandLine(Sh("for i in 1 2 3 4 5; do echo out$i; echo err$i >&2; done"));
  P->Run();
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"out1", "out2", "out3", "out4", "out5"}));
  EXPECT_EQ(Lines(P->GetErrors()), (std::vector<String>{"err1", "err2", "err3", "err4", "err5"}));
  EXPECT_EQ(P->ExitCode(), 0u);

  // A run replaces the lists; a child that dies of a signal reports 128 + the signal.
  P->SetCommandLine(Sh("kill -TERM $$"));
  P->Run();
  EXPECT_EQ(P->GetOutput()->Count(), 0);
  EXPECT_EQ(P->ExitCode(), 128u + SIGTERM);

  P->SetCommandLine(Sh("exit 255"));
  P->Run();
  EXPECT_EQ(P->ExitCode(), 255u);

  // Assignment copies.
  TStringList Mine;
  Mine.Add("x");
  P->SetOutput(&Mine);
  Mine.Add("y");
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"x"}));
}

TEST_F(ProcessTest, ConsoleDrainsOutputLargerThanThePipeWhileTheChildWaits) {
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  // 100000 bytes in one line, 3000 numbered lines, then a pause, all without a final break.
  P->SetCommandLine(Sh("head -c 100000 /dev/zero | tr '\\0' x; echo; i=0; "
                       "while [ $i -lt 3000 ]; do echo \"line $i\"; i=$((i+1)); done; "
                       "sleep 0.3; printf end; printf 'E%.0s' $(seq 40000) >&2"));
  P->Run();
  ASSERT_EQ(P->GetOutput()->Count(), 3002);
  EXPECT_EQ(P->GetOutput()->Get(0), String(100000, 'x'));
  EXPECT_EQ(P->GetOutput()->Get(1), "line 0");
  EXPECT_EQ(P->GetOutput()->Get(3000), "line 2999");
  EXPECT_EQ(P->GetOutput()->Get(3001), "end");
  ASSERT_EQ(P->GetErrors()->Count(), 1);
  EXPECT_EQ(P->GetErrors()->Get(0), String(40000, 'E'));
  EXPECT_EQ(P->ExitCode(), 0u);
}

TEST_F(ProcessTest, ConsolePassesArgumentsEnvironmentAndDirectoryUnchanged) {
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  std::vector<String> Args = {"two words", "", "\"quoted\"", "$HOME", "a;b|c&d", "*", "`id`",
                              "back\\slash\\", "'single'", "x > y", "tab\there"};
  P->SetCommandLine(Sh("for a; do printf '[%s]\\n' \"$a\"; done", Args));
  P->Run();
  std::vector<String> Expected;
  for (const String& A : Args) Expected.push_back("[" + A + "]");
  EXPECT_EQ(Lines(P->GetOutput()), Expected);

  // The environment starts as this process's own and is handed over sorted.
  const char* Path = std::getenv("PATH");
  ASSERT_NE(Path, nullptr);
  EXPECT_EQ(P->GetEnvList()->Values("PATH"), Path);
  P->GetEnvList()->Clear();
  P->GetEnvList()->Add("ZED=last");
  P->GetEnvList()->Add("FK_VALUE=two  spaces; $NOT_EXPANDED");
  P->SetWorkingDir("/proc");
  P->SetCommandLine(Sh("printf '%s|%s|%s' \"$FK_VALUE\" \"$(pwd)\" \"${HOME-unset}\""));
  P->Run();
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"two  spaces; $NOT_EXPANDED|/proc|unset"}));
  EXPECT_EQ(P->GetEnvList()->Get(0), "FK_VALUE=two  spaces; $NOT_EXPANDED");

  // A program named without a directory is looked up along this process's PATH, and a
  // relative one is found from this process's directory, not from the child's.
  P->GetEnvList()->Clear();
  P->SetWorkingDir("/");
  P->SetCommandLine("sh -c \"echo found\"");
  P->Run();
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"found"}));
  char Cwd[4096];
  ASSERT_NE(::getcwd(Cwd, sizeof Cwd), nullptr);
  ASSERT_EQ(::chdir("/bin"), 0);
  auto Back = Finally([&]() noexcept { (void)::chdir(Cwd); });
  P->SetWorkingDir("/tmp");
  P->SetCommandLine("./sh -c pwd");
  P->Run();
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"/tmp"}));
}

TEST_F(ProcessTest, ConsoleChildGetsNullInputAndNoOtherDescriptor) {
  // A descriptor this process opened without close-on-exec must still stay out.
  int Null = ::open("/dev/null", O_RDONLY);
  ASSERT_GE(Null, 0);
  int Stray = ::fcntl(Null, F_DUPFD, 200);
  ::close(Null);
  ASSERT_GE(Stray, 0);
  auto CloseStray = Finally([&]() noexcept { ::close(Stray); });
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  P->SetCommandLine(Sh("if read line; then echo got; else echo eof; fi; "
                       "for f in /proc/$$/fd/*; do echo \"${f##*/}\"; done"));
  P->Run();
  std::vector<String> Out = Lines(P->GetOutput());
  ASSERT_FALSE(Out.empty());
  EXPECT_EQ(Out[0], "eof");
  std::set<String> Fds(Out.begin() + 1, Out.end());
  EXPECT_TRUE(Fds.count("0") && Fds.count("1") && Fds.count("2"));
  EXPECT_EQ(Fds.count(IntToStr(Stray)), 0u);
  for (const String& Fd : Fds) EXPECT_TRUE(Fd.size() == 1 || Fd == "10") << Fd; // 10: the shell's own
}

TEST_F(ProcessTest, ConsoleTimeOutEndsTheChildWith999AndKeepsItsOutput) {
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  P->SetCommandLine(Sh("echo started; echo warn >&2; exec sleep 5"));
  P->SetTimeOut(600);
  auto Start = Clock::now();
  P->Run();
  long long Took = MillisecondsSince(Start);
  EXPECT_EQ(P->ExitCode(), TimedOutExitCode);
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"started"}));
  EXPECT_EQ(Lines(P->GetErrors()), (std::vector<String>{"warn"}));
  EXPECT_GE(Took, 450); // two beats at least: the countdown is 600, 350, 100, -150
  EXPECT_LT(Took, 2500);

  // Time-out 0: ended in the first round.
  P->SetTimeOut(0);
  P->SetCommandLine(Sh("exec sleep 5"));
  Start = Clock::now();
  P->Run();
  EXPECT_EQ(P->ExitCode(), TimedOutExitCode);
  EXPECT_LT(MillisecondsSince(Start), 1500);

  // A negative value after a time-out keeps it on, with a countdown that has run out.
  TObjectGuard<TConsoleProcess> Q(new TConsoleProcess);
  Q->SetTimeOut(5000);
  Q->SetTimeOut(-1);
  EXPECT_EQ(Q->TimeOut(), -1);
  Q->SetCommandLine(Sh("exec sleep 5"));
  Start = Clock::now();
  Q->Run();
  EXPECT_EQ(Q->ExitCode(), TimedOutExitCode);
  EXPECT_LT(MillisecondsSince(Start), 1500);

  // No time-out by default: a child that outlives several beats ends by itself.
  TObjectGuard<TConsoleProcess> R(new TConsoleProcess);
  R->SetCommandLine(Sh("sleep 0.6; exit 3"));
  R->Run();
  EXPECT_EQ(R->ExitCode(), 3u);
}

/// A console process whose fatal errors are recorded instead of raised.
class TQuietProcess : public TConsoleProcess {
public:
  std::vector<String> Reported;

protected:
  void ReportFatalError(const String& AMessage) override { Reported.push_back(AMessage); }
};

TEST_F(ProcessTest, ConsoleReportsAFailedStartWithTheExactMessage) {
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  P->SetCommandLine("/no/such/tool --flag \"a b\"");
  EXPECT_EQ(MessageOf([&] { P->Run(); }),
            "Failed to create process\r\nCommand line: '/no/such/tool --flag \"a b\"'\r\n"
            "Error Message: 'No such file or directory'");
  P->SetExeFileName("tool");
  EXPECT_EQ(MessageOf([&] { P->Run(); }), "Failed to run tool. No such file or directory");
  P->SetCommandLine("no-such-tool-on-the-path");
  EXPECT_EQ(MessageOf([&] { P->Run(); }), "Failed to run tool. No such file or directory");
  P->SetCommandLine("/tmp"); // a directory cannot be run
  EXPECT_EQ(MessageOf([&] { P->Run(); }), "Failed to run tool. Permission denied");
  P->SetExeFileName("");
  P->SetCommandLine("   ");
  EXPECT_EQ(MessageOf([&] { P->Run(); }),
            "Failed to create process\r\nCommand line: '   '\r\nError Message: 'Invalid argument'");
  P->SetCommandLine("/bin/sh");
  P->SetWorkingDir("/no/such/dir");
  EXPECT_EQ(MessageOf([&] { P->Run(); }),
            "Failed to create process\r\nCommand line: '/bin/sh'\r\nError Message: 'No such file or directory'");
  EXPECT_EQ(P->GetOutput()->Count(), 0);
  EXPECT_EQ(P->GetErrors()->Count(), 0);
  EXPECT_EQ(P->ExitCode(), 0u);

  // A report that returns leaves the code that says so, and nothing runs.
  TObjectGuard<TQuietProcess> Q(new TQuietProcess);
  Q->SetExeFileName("tool");
  Q->SetCommandLine("/no/such/tool");
  Q->Run();
  EXPECT_EQ(Q->Reported, (std::vector<String>{"Failed to run tool. No such file or directory"}));
  EXPECT_EQ(Q->ExitCode(), FatalErrorExitCode);
  EXPECT_EQ(Q->GetOutput()->Count(), 0);
}

TEST_F(ProcessTest, ConsoleReportsAnExitCodeThatCannotBeRead) {
  // A parent that ignores SIGCHLD has its children collected by the system.
  struct sigaction Ignore{}, Old{};
  Ignore.sa_handler = SIG_IGN;
  ASSERT_EQ(::sigaction(SIGCHLD, &Ignore, &Old), 0);
  auto Restore = Finally([&]() noexcept { ::sigaction(SIGCHLD, &Old, nullptr); });
  TObjectGuard<TConsoleProcess> P(new TConsoleProcess);
  P->SetCommandLine(Sh("echo done; exit 4"));
  EXPECT_EQ(MessageOf([&] { P->Run(); }), "Unable to get process exit code");

  TObjectGuard<TQuietProcess> Q(new TQuietProcess);
  Q->SetCommandLine(Sh("echo done; exit 4"));
  Q->Run();
  EXPECT_EQ(Q->Reported, (std::vector<String>{"Unable to get process exit code"}));
  EXPECT_EQ(Q->ExitCode(), FatalErrorExitCode);
  EXPECT_EQ(Lines(Q->GetOutput()), (std::vector<String>{"done"}));
}

//===----------------------------------------------------------------------===//
// TReportProcess
//===----------------------------------------------------------------------===//

struct TChange {
  String List;
  std::vector<String> Lines;
  int OldCount;
  int NewCount;
  friend bool operator==(const TChange&, const TChange&) = default;
};

/// Records change notifications of either list.
struct TChangeLog {
  std::vector<TChange> Changes;
  TListChanged For(const String& Name) {
    return [this, Name](TObject*, TStringList* List, int Old, int New) {
      EXPECT_TRUE(IsMainThread());
      Changes.push_back({Name, ::Lines(List), Old, New});
    };
  }
};

TEST_F(ProcessTest, ReportProcessFillsBothListsAndTellsOnceAtTheEnd) {
  TObjectGuard<TReportProcess> P(new TReportProcess);
  P->SetCommandLine(Sh("echo one; echo two; sleep 0.3; echo bad >&2"));
  P->Run(); // no handlers
  EXPECT_EQ(Lines(P->GetOutput()), (std::vector<String>{"one", "two"}));
  EXPECT_EQ(Lines(P->GetErrors()), (std::vector<String>{"bad"}));

  TChangeLog Log;
  P->SetOnOutputChanged(Log.For("out"));
  P->SetOnErrorChanged(Log.For("err"));
  int Pumped = 0;
  SetApplicationMessagePump([&] { ++Pumped; });
  auto Unpump = Finally([]() noexcept { SetApplicationMessagePump(nullptr); });
  P->Run();
  EXPECT_GE(Pumped, 3); // every beat, and once more at the end
  EXPECT_EQ(Log.Changes, (std::vector<TChange>{{"out", {"one", "two"}, 0, 2}, {"err", {"bad"}, 0, 1}}));
  EXPECT_EQ(P->ExitCode(), 0u);

  // An empty list is no change.
  Log.Changes.clear();
  P->SetCommandLine(Sh("exit 0"));
  P->Run();
  EXPECT_TRUE(Log.Changes.empty());
}

/// A report process that the message pump cancels after a few beats.
class TCancelledReport : public TReportProcess {
public:
  bool Cancel = false;
  bool CancelProcess() override { return Cancel; }
};

TEST_F(ProcessTest, ReportProcessCancelledEndsTheChildWith100) {
  TObjectGuard<TCancelledReport> P(new TCancelledReport);
  TChangeLog Log;
  P->SetOnOutputChanged(Log.For("out"));
  P->SetCommandLine(Sh("echo before; exec sleep 5"));
  int Beats = 0;
  SetApplicationMessagePump([&] {
    if (++Beats == 3) P->Cancel = true;
  });
  auto Unpump = Finally([]() noexcept { SetApplicationMessagePump(nullptr); });
  auto Start = Clock::now();
  P->Run();
  EXPECT_LT(MillisecondsSince(Start), 2500);
  EXPECT_EQ(P->ExitCode(), CancelledExitCode);
  EXPECT_EQ(Log.Changes, (std::vector<TChange>{{"out", {"before"}, 0, 1}}));
}

TEST_F(ProcessTest, ReportProcessEndsTheChildWhenAHandlerRaises) {
  TObjectGuard<TReportProcess> P(new TReportProcess);
  P->SetOnOutputChanged([](TObject*, TStringList*, int, int) { throw EAbort("stop"); });
  P->SetCommandLine(Sh("echo x; echo y >&2"));
  EXPECT_THROW(P->Run(), EAbort);
  // The pump raising in the middle of a run: the child still goes with the run.
  SetApplicationMessagePump([] { throw EAbort("pump"); });
  auto Unpump = Finally([]() noexcept { SetApplicationMessagePump(nullptr); });
  P->SetCommandLine(Sh("exec sleep 5"));
  auto Start = Clock::now();
  EXPECT_THROW(P->Run(), EAbort);
  EXPECT_LT(MillisecondsSince(Start), 1500);
}

//===----------------------------------------------------------------------===//
// TMonitorProcess
//===----------------------------------------------------------------------===//

/// The names the system knows the threads of this process by.
std::set<String> ThreadNames() {
  std::set<String> Names;
  DIR* Dir = ::opendir("/proc/self/task");
  while (dirent* E = ::readdir(Dir)) {
    if (E->d_name[0] == '.') continue;
    std::ifstream Comm(String("/proc/self/task/") + E->d_name + "/comm");
    String Name;
    std::getline(Comm, Name);
    Names.insert(Name);
  }
  ::closedir(Dir);
  return Names;
}

TEST_F(ProcessTest, MonitorTellsTheMainThreadOfEachBatchInOrder) {
  TObjectGuard<TMonitorProcess> P(new TMonitorProcess);
  TChangeLog Log;
  std::vector<String> Events;
  String SeenName;
  bool SeenSystemName = false;
  auto Out = Log.For("out");
  P->SetOnOutputChanged([&](TObject* S, TStringList* L, int O, int N) {
    Out(S, L, O, N);
    Events.push_back("out");
    if (SeenName.empty()) {
      SeenName = P->Monitor()->Name();
      SeenSystemName = ThreadNames().count("ProcessUtil Mon") == 1;
    }
  });
  P->SetOnErrorChanged(Log.For("err"));
  int Terminated = 0;
  P->SetOnTerminate([&](TObject* Sender) {
    EXPECT_EQ(Sender, P.Get());
    EXPECT_TRUE(IsMainThread());
    ++Terminated;
    Events.push_back("end");
  });
  P->SetCommandLine(Sh("echo $$; sleep 0.6; printf 'b\\nc\\n'; echo oops >&2; sleep 0.6; "
                       "printf 'd\\ne\\nf'; exit 3"));
  EXPECT_FALSE(P->IsRunning());
  P->Run();
  EXPECT_TRUE(P->IsRunning());
  ASSERT_NE(P->Monitor(), nullptr);
  ASSERT_TRUE(ServeUntil([&] { return Terminated > 0; }));
  EXPECT_FALSE(P->IsRunning());
  EXPECT_EQ(SeenName, "ProcessUtil Monitor Thread");
  EXPECT_TRUE(SeenSystemName);

  // Every batch once, in order, each telling the count of the one before; then the end.
  std::vector<String> All, Errors;
  int Previous = 0;
  for (const TChange& C : Log.Changes) {
    if (C.List == "err") {
      Errors.insert(Errors.end(), C.Lines.begin(), C.Lines.end());
      continue;
    }
    EXPECT_EQ(C.OldCount, Previous);
    EXPECT_NE(C.NewCount, C.OldCount);
    EXPECT_EQ(static_cast<int>(C.Lines.size()), C.NewCount);
    Previous = C.NewCount;
    All.insert(All.end(), C.Lines.begin(), C.Lines.end());
  }
  ASSERT_EQ(All.size(), 6u);
  EXPECT_EQ(All[0], IntToStr(P->GetProcessId()));
  EXPECT_EQ(std::vector<String>(All.begin() + 1, All.end()), (std::vector<String>{"b", "c", "d", "e", "f"}));
  EXPECT_EQ(Errors, (std::vector<String>{"oops"}));
  EXPECT_EQ(Events.back(), "end");
  EXPECT_EQ(Terminated, 1);

  // The exit code is not published; the process has it.
  std::uint32_t Code = 0;
  ASSERT_TRUE(P->GetProcess()->GetExitCode(Code));
  EXPECT_EQ(Code, 3u);
  EXPECT_EQ(P->ExitCode(), 0u);

  // A silent child: no change, one end.
  Log.Changes.clear();
  Terminated = 0;
  P->SetCommandLine(Sh("sleep 0.3"));
  P->Run();
  ASSERT_TRUE(ServeUntil([&] { return Terminated > 0; }));
  EXPECT_TRUE(Log.Changes.empty());
  ServeUntil([] { return false; }, 300);
  EXPECT_EQ(Terminated, 1);
}

TEST_F(ProcessTest, MonitorRefusesChangesWhileRunningAndCancels) {
  TObjectGuard<TMonitorProcess> P(new TMonitorProcess);
  int Terminated = 0;
  P->SetOnTerminate([&](TObject*) { ++Terminated; });
  EXPECT_EQ(MessageOf([&] { (void)P->CancelProcess(); }), "Process is not being managed");
  P->SetCommandLine(Sh("exec sleep 5"));
  P->Run();
  int Pid = P->GetProcessId();
  ASSERT_GT(Pid, 0);
  const String Running = "Monitor thread already running";
  EXPECT_EQ(MessageOf([&] { P->SetCommandLine("other"); }), Running);
  EXPECT_EQ(MessageOf([&] { P->SetExeFileName("other"); }), Running);
  EXPECT_EQ(MessageOf([&] { P->SetWorkingDir("/"); }), Running);
  EXPECT_EQ(MessageOf([&] { P->SetWatch(false); }), Running);
  EXPECT_EQ(MessageOf([&] { P->SetOnOutputChanged(nullptr); }), Running);
  EXPECT_EQ(MessageOf([&] { P->SetOnErrorChanged(nullptr); }), Running);
  EXPECT_EQ(MessageOf([&] { P->Run(); }), Running);
  EXPECT_EQ(P->CommandLine(), Sh("exec sleep 5"));
  EXPECT_EQ(P->ExeFileName(), "");
  EXPECT_TRUE(P->Watch());
  EXPECT_EQ(P->GetProcessId(), Pid);

  auto Start = Clock::now();
  EXPECT_TRUE(P->CancelProcess());
  EXPECT_LT(MillisecondsSince(Start), 1500);
  EXPECT_FALSE(P->IsRunning());
  EXPECT_EQ(P->Monitor(), nullptr);
  EXPECT_EQ(::kill(Pid, 0), -1); // gone and collected
  EXPECT_EQ(MessageOf([&] { (void)P->CancelProcess(); }), "Process is not being managed");
  while (CheckSynchronize(0)) {}
  EXPECT_EQ(Terminated, 1);

  // Settable again; a failed start leaves nothing running and nothing open.
  P->SetCommandLine("/no/such/tool");
  EXPECT_EQ(MessageOf([&] { P->Run(); }),
            "Failed to create process\r\nCommand line: '/no/such/tool'\r\nError Message: 'No such file or directory'");
  EXPECT_FALSE(P->IsRunning());
}

TEST_F(ProcessTest, MonitorTimeOutAndTeardownLeaveNoChild) {
  {
    TObjectGuard<TMonitorProcess> P(new TMonitorProcess);
    bool Ended = false;
    P->SetOnTerminate([&](TObject*) { Ended = true; });
    P->SetTimeOut(300);
    P->SetCommandLine(Sh("exec sleep 5"));
    P->Run();
    ASSERT_TRUE(ServeUntil([&] { return Ended; }));
    std::uint32_t Code = 0;
    ASSERT_TRUE(P->GetProcess()->GetExitCode(Code));
    EXPECT_EQ(Code, TimedOutExitCode);
  }
  {
    // Destroyed while it runs, with an end notice that never gets delivered.
    TObjectGuard<TMonitorProcess> P(new TMonitorProcess);
    bool Ended = false;
    P->SetOnTerminate([&](TObject*) { Ended = true; });
    P->SetCommandLine(Sh("echo hello; exec sleep 5"));
    P->Run();
    auto Start = Clock::now();
    P.Reset();
    EXPECT_LT(MillisecondsSince(Start), 1500);
    while (CheckSynchronize(0)) {}
  }
  {
    // Unwatched: no pipes, no thread; its runner ends it when it goes.
    TObjectGuard<TMonitorProcess> P(new TMonitorProcess);
    P->SetWatch(false);
    P->SetCommandLine("sleep 5");
    int Before = OpenDescriptors();
    P->Run();
    EXPECT_FALSE(P->IsRunning());
    EXPECT_EQ(P->Monitor(), nullptr);
    EXPECT_GT(P->GetProcessId(), 0);
    EXPECT_LE(OpenDescriptors(), Before + 1); // at most the descriptor that tells of the end
    EXPECT_EQ(MessageOf([&] { (void)P->CancelProcess(); }), "Process is not being managed");

    // While it runs, the process list knows it.
    String Name;
    EnumProcesses([&](int Pid, const String& AName) {
      if (Pid == P->GetProcessId()) Name = AName;
    });
    EXPECT_EQ(Name, "sleep");
  }
}

TEST_F(ProcessTest, MonitorHandlerThatRaisesStopsTheMainLoopNotTheMonitor) {
  TObjectGuard<TMonitorProcess> P(new TMonitorProcess);
  int Calls = 0;
  bool Ended = false;
  P->SetOnOutputChanged([&](TObject*, TStringList*, int, int) {
    if (++Calls == 1) throw EConvertError("bad line");
  });
  P->SetOnTerminate([&](TObject*) { Ended = true; });
  P->SetCommandLine(Sh("echo a; sleep 0.6; echo b; echo c"));
  P->Run();
  String Caught;
  auto Start = Clock::now();
  while (!Ended && MillisecondsSince(Start) < 3000) {
    try {
      CheckSynchronize(20);
    } catch (const EConvertError& E) {
      Caught = E.Message();
    }
  }
  EXPECT_EQ(Caught, "bad line");
  EXPECT_TRUE(Ended);
  EXPECT_GE(Calls, 2);

  // Raised while a cancel waits for the monitor: the cancel completes, then it passes on.
  TObjectGuard<TMonitorProcess> Q(new TMonitorProcess);
  Q->SetOnOutputChanged([](TObject*, TStringList*, int, int) { throw EConvertError("late"); });
  Q->SetCommandLine(Sh("echo a; exec sleep 5"));
  Q->Run();
  ::usleep(400 * 1000); // the monitor now waits for the handler
  EXPECT_EQ(MessageOf([&] { (void)Q->CancelProcess(); }), "late");
  EXPECT_FALSE(Q->IsRunning());
  EXPECT_EQ(Q->Monitor(), nullptr);
}

//===----------------------------------------------------------------------===//
// Processes of the system
//===----------------------------------------------------------------------===//

TEST(EnumProcessesTest, ListsThisProcessByItsExecutablesName) {
  char Self[4096];
  ssize_t Len = ::readlink("/proc/self/exe", Self, sizeof Self - 1);
  ASSERT_GT(Len, 0);
  Self[Len] = 0;
  int Count = 0;
  String Mine;
  EnumProcesses([&](int Pid, const String& Name) {
    ++Count;
    if (Pid == ::getpid()) Mine = Name;
  });
  EXPECT_GE(Count, 1);
  EXPECT_EQ(Mine, ExtractFileName(Self));
  EnumProcesses(nullptr); // walks with no calls
}

//===----------------------------------------------------------------------===//
// Threads and calls to the main thread
//===----------------------------------------------------------------------===//

/// A thread that hands calls to the main thread and may fail.
class TWorker : public TThread {
public:
  std::function<void()> Body;

protected:
  void Execute() override { Body(); }
};

TEST(ThreadTest, CallsReachTheMainThreadInOrder) {
  std::vector<String> Order;
  int Owner = 0;
  std::atomic<bool> Go{false};
  TObjectGuard<TWorker> W(new TWorker);
  W->Body = [&] {
    Queue(&Owner, [&] { Order.push_back("queued 1"); });
    Synchronize(&Owner, [&] { Order.push_back("sync"); });
    while (!Go) ::usleep(1000);
    Queue(&Owner, [&] { Order.push_back("dropped"); });
    Queue(nullptr, [&] { Order.push_back("queued 2"); });
  };
  EXPECT_TRUE(IsMainThread());
  W->Start();
  EXPECT_EQ(MessageOf([&] { W->Start(); }), "Thread already started");
  ASSERT_TRUE(ServeUntil([&] { return Order.size() == 2; }));
  Go = true;
  while (!W->Finished()) ::usleep(1000);
  EXPECT_EQ(RemoveQueuedEvents(&Owner), 1);
  while (CheckSynchronize(0)) {}
  EXPECT_EQ(Order, (std::vector<String>{"queued 1", "sync", "queued 2"}));
  W->WaitFor();

  // A thread that raises ends with it; waiting for itself is refused.
  TObjectGuard<TWorker> F(new TWorker);
  String SelfWait;
  F->Body = [&] {
    SelfWait = MessageOf([&] { F->WaitFor(); });
    throw EListError("worker failed");
  };
  F->Start();
  F->WaitFor();
  EXPECT_EQ(SelfWait, "A thread cannot wait for itself");
  ASSERT_TRUE(F->FatalException());
  EXPECT_EQ(MessageOf([&] { std::rethrow_exception(F->FatalException()); }), "worker failed");
  EXPECT_FALSE(CheckSynchronize(0));
}

} // namespace
