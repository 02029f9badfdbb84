//===- tools/Threads.h - Worker threads and calls to the main thread ------===//
//
// A small thread class for the tool services and the two ways a worker hands
// work to the main thread: `Synchronize` (run it there and wait) and `Queue`
// (run it there later, without waiting). The main thread runs what was handed
// over whenever it calls `CheckSynchronize`, `ProcessApplicationMessages`, or
// waits for a worker with `WaitFor`. The main thread is the process's first
// thread.
//
// Example:
//   class TCounter : public TThread {
//     void Execute() override {
//       while (!Terminated()) Synchronize(this, [&] { ++Ticks; });   // Ticks: main thread only
//     }
//   };
//   TObjectGuard<TCounter> Counter(new TCounter);
//   Counter->Start();
//   ProcessApplicationMessages();      // the increments run here
//   Counter->Terminate();
//   Counter->WaitFor();                // serves the increments still asked for
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"

#include <atomic>
#include <exception>
#include <functional>
#include <mutex>
#include <thread>

namespace formkit {

//===----------------------------------------------------------------------===//
// Calls to the main thread
//===----------------------------------------------------------------------===//

/// True on the process's first thread, the one that owns the user interface.
FK_API bool IsMainThread() noexcept;

/// Runs `Call` on the main thread and waits until it has run. On the main thread it runs
/// at once. What `Call` raises passes out of the main thread's `CheckSynchronize` (or the
/// `WaitFor` that served it), not to the caller, which goes on. `Owner` only tags the call.
FK_API void Synchronize(const void* Owner, std::function<void()> Call);

/// Hands `Call` to the main thread and returns at once; it runs there in order with the
/// other calls handed over. Dropped unrun by `RemoveQueuedEvents(Owner)`.
FK_API void Queue(const void* Owner, std::function<void()> Call);

/// Drops the queued calls of `Owner` that have not run: an object calls it in its teardown.
/// Returns how many were dropped.
FK_API int RemoveQueuedEvents(const void* Owner) noexcept;

/// On the main thread: runs the calls handed over, waiting up to `TimeoutMs` milliseconds
/// for the first when there is none. Returns true when a call ran. A call that raises
/// stops the run: the rest stay queued, and the exception passes on. Elsewhere: false.
FK_API bool CheckSynchronize(int TimeoutMs = 0);

/// The host's message pump, run by `ProcessApplicationMessages` after the handed-over
/// calls; a host with a message loop installs it. Empty to remove it.
FK_API void SetApplicationMessagePump(std::function<void()> Pump);

/// Lets the application process its messages: the calls handed to the main thread, then
/// the host's message pump if one is installed. Only on the main thread.
FK_API void ProcessApplicationMessages();

//===----------------------------------------------------------------------===//
// TThread
//===----------------------------------------------------------------------===//

/// A worker thread: `Execute` runs on it once `Start` is called. Destroying a started
/// thread asks it to terminate and waits for it. Not copyable; freed by `Destroy`.
class FK_API TThread : public TObject {
  FK_CLASS(TThread, TObject)

  /// Starts `Execute` on a new thread. Raises `EInvalidOperation` "Thread already started"
  /// when called twice.
  void Start();
  /// Asks the thread to stop: `Terminated` turns true. `Execute` decides when to look.
  void Terminate() noexcept { FTerminated.store(true); }
  bool Terminated() const noexcept { return FTerminated.load(); }
  /// True once `Execute` has returned (or raised).
  bool Finished() const noexcept { return FFinished.load(); }
  /// Waits until the thread has ended; on the main thread it serves the calls the thread
  /// (or any other) hands over meanwhile, so a thread waiting in `Synchronize` can finish.
  /// A served call that raises is rethrown once the thread has ended. Does nothing for a
  /// thread never started. Raises `EInvalidOperation` "A thread cannot wait for itself"
  /// on the thread itself.
  void WaitFor();
  /// The name given by `NameThreadForDebugging`; empty when none.
  String Name() const;
  /// What `Execute` raised, if anything; the thread ended with it.
  std::exception_ptr FatalException() const noexcept { return FFatalException; }

  void BeforeDestruction() override;

protected:
  /// The body of the thread.
  virtual void Execute() = 0;
  /// Names the thread: `Name` keeps it whole, the system sees its first 15 bytes.
  /// Call it from `Execute`.
  void NameThreadForDebugging(const String& AName);

private:
  void Main() noexcept;
  std::thread FThread;
  std::atomic<bool> FTerminated{false};
  std::atomic<bool> FFinished{false};
  mutable std::mutex FNameLock;
  String FName;
  std::exception_ptr FFatalException;
};

} // namespace formkit
