//===- tools/Threads.cpp - Worker threads and calls to the main thread ----===//
//
// One queue of handed-over calls for the whole process, under one lock. A
// synchronous call waits on its own flag; the main thread wakes when a call
// arrives or a thread ends, so that `WaitFor` needs no polling of its own.
//
//===----------------------------------------------------------------------===//
#include "tools/Threads.h"

#include "platform/TypInfoBuilder.h"

#include <condition_variable>
#include <deque>
#include <memory>

#include <pthread.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace formkit {

FK_RESOURCESTRING(SThreadAlreadyStarted, "Thread already started");
FK_RESOURCESTRING(SThreadWaitForSelf, "A thread cannot wait for itself");

namespace {

/// The `TThread` whose `Execute` runs on this thread, if any.
thread_local const TThread* CurrentThread = nullptr;

/// One call handed to the main thread.
struct TSyncCall {
  const void* Owner = nullptr;
  std::function<void()> Call;
  /// True for a synchronous call: its caller waits for it.
  bool Waited = false;
  /// Synchronous calls: set under the queue's lock once the call has run.
  bool Done = false;
};

/// The calls waiting for the main thread, and the signals around them.
struct TSyncQueue {
  std::mutex Lock;
  /// A call arrived or a thread ended.
  std::condition_variable Arrived;
  /// A synchronous call has run.
  std::condition_variable Ran;
  std::deque<std::shared_ptr<TSyncCall>> Calls;
  std::function<void()> Pump;
};

TSyncQueue& SyncQueue() {
  static TSyncQueue Queue;
  return Queue;
}

/// Marks a synchronous call as run and wakes its caller; queued calls need nothing.
void Finish(TSyncQueue& Q, TSyncCall& Call) noexcept {
  std::lock_guard Guard(Q.Lock);
  Call.Done = true;
  Q.Ran.notify_all();
}

/// Runs the calls handed over, in order, until the queue is empty. When it is empty at
/// first, waits up to `TimeoutMs` for a call or for `Stop` to turn true.
bool ServeCalls(int TimeoutMs, const std::function<bool()>& Stop) {
  TSyncQueue& Q = SyncQueue();
  bool RanOne = false;
  std::unique_lock Guard(Q.Lock);
  if (Q.Calls.empty() && TimeoutMs > 0)
    Q.Arrived.wait_for(Guard, std::chrono::milliseconds(TimeoutMs),
                       [&] { return !Q.Calls.empty() || (Stop && Stop()); });
  while (!Q.Calls.empty()) {
    std::shared_ptr<TSyncCall> Next = std::move(Q.Calls.front());
    Q.Calls.pop_front();
    Guard.unlock();
    {
      // Whatever the call does, its caller must be released.
      auto Release = Finally([&]() noexcept { Finish(Q, *Next); });
      Next->Call();
    }
    RanOne = true;
    Guard.lock();
  }
  return RanOne;
}

void Hand(const void* Owner, std::function<void()> Call, bool Wait) {
  TSyncQueue& Q = SyncQueue();
  auto Entry = std::make_shared<TSyncCall>();
  Entry->Owner = Owner;
  Entry->Call = std::move(Call);
  Entry->Waited = Wait;
  std::unique_lock Guard(Q.Lock);
  Q.Calls.push_back(Entry);
  Q.Arrived.notify_all();
  if (Wait) Q.Ran.wait(Guard, [&] { return Entry->Done; });
}

} // namespace

//===----------------------------------------------------------------------===//
// Calls to the main thread
//===----------------------------------------------------------------------===//

bool IsMainThread() noexcept {
  return static_cast<pid_t>(::syscall(SYS_gettid)) == ::getpid();
}

void Synchronize(const void* Owner, std::function<void()> Call) {
  if (IsMainThread()) {
    Call();
    return;
  }
  Hand(Owner, std::move(Call), true);
}

void Queue(const void* Owner, std::function<void()> Call) { Hand(Owner, std::move(Call), false); }

int RemoveQueuedEvents(const void* Owner) noexcept {
  TSyncQueue& Q = SyncQueue();
  std::lock_guard Guard(Q.Lock);
  int Dropped = 0;
  // Synchronous calls stay: their callers wait for them.
  for (auto It = Q.Calls.begin(); It != Q.Calls.end();) {
    if ((*It)->Owner == Owner && !(*It)->Waited) {
      It = Q.Calls.erase(It);
      ++Dropped;
    } else {
      ++It;
    }
  }
  return Dropped;
}

bool CheckSynchronize(int TimeoutMs) {
  if (!IsMainThread()) return false;
  return ServeCalls(TimeoutMs, nullptr);
}

void SetApplicationMessagePump(std::function<void()> Pump) {
  TSyncQueue& Q = SyncQueue();
  std::lock_guard Guard(Q.Lock);
  Q.Pump = std::move(Pump);
}

void ProcessApplicationMessages() {
  if (!IsMainThread()) return;
  CheckSynchronize(0);
  std::function<void()> Pump;
  {
    TSyncQueue& Q = SyncQueue();
    std::lock_guard Guard(Q.Lock);
    Pump = Q.Pump;
  }
  if (Pump) Pump();
}

//===----------------------------------------------------------------------===//
// TThread
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TThread, "Threads") {}

void TThread::Start() {
  if (FThread.joinable() || FFinished.load()) throw EInvalidOperation(SThreadAlreadyStarted);
  FThread = std::thread([this] { Main(); });
}

void TThread::Main() noexcept {
  CurrentThread = this;
  try {
    Execute();
  } catch (...) {
    FFatalException = std::current_exception();
  }
  TSyncQueue& Q = SyncQueue();
  std::lock_guard Guard(Q.Lock);
  FFinished.store(true);
  Q.Arrived.notify_all();
}

void TThread::WaitFor() {
  // Asked first: the thread must not look at its own `std::thread`, which its starter
  // may still be filling in.
  if (CurrentThread == this) throw EInvalidOperation(SThreadWaitForSelf);
  if (!FThread.joinable()) return;
  std::exception_ptr Raised;
  if (IsMainThread()) {
    // Beats only bound the wait should a wake-up be missed; arrivals and the end wake it.
    constexpr int Beat = 50;
    while (!FFinished.load()) {
      try {
        ServeCalls(Beat, [this] { return FFinished.load(); });
      } catch (...) {
        if (!Raised) Raised = std::current_exception();
      }
    }
  }
  FThread.join();
  if (Raised) std::rethrow_exception(Raised);
}

String TThread::Name() const {
  std::lock_guard Guard(FNameLock);
  return FName;
}

void TThread::NameThreadForDebugging(const String& AName) {
  {
    std::lock_guard Guard(FNameLock);
    FName = AName;
  }
  // The system keeps 15 bytes and a terminating zero.
  ::pthread_setname_np(::pthread_self(), AName.substr(0, 15).c_str());
}

void TThread::BeforeDestruction() {
  Terminate();
  RunIgnoringExceptions([this] { WaitFor(); });
  inherited::BeforeDestruction();
}

} // namespace formkit
