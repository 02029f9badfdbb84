//===- frameworks/kiln/KilnMessages.h - Messages and the message queue ---===//
//
// The headless message loop: a message is a number and two parameters sent to
// a target's virtual handler. `SendMessage` delivers at once; `PostMessage`
// queues and `ProcessMessages` delivers the queue in order. A target leaves the
// queue in its teardown, so messages for a dead target are dropped, never
// delivered.
//
// Example:
//   class TWorker : public TMessageTarget {
//     void WndProc(TMessage& M) override { if (M.Msg == WM_USER + 1) Work(); }
//     ~TWorker() { RemoveMessages(this); }
//   };
//   PostMessage(&Worker, WM_USER + 1, 0, 0);
//   ProcessMessages();   // Worker.Work() runs here
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <cstdint>

namespace formkit {

/// One message: its number, two parameters and the handler's answer.
struct TMessage {
  std::uint32_t Msg = 0;
  std::intptr_t WParam = 0;
  std::intptr_t LParam = 0;
  std::intptr_t Result = 0;
};

/// Message numbers of the framework.
enum : std::uint32_t {
  WM_NULL = 0x0000,
  WM_SIZE = 0x0005,
  WM_CLOSE = 0x0010,
  /// The program is asked to end; `PeekMessage` finds it whatever the filter.
  WM_QUIT = 0x0012,
  WM_TIMER = 0x0113,
  /// The first number free for a program's own messages.
  WM_USER = 0x0400,
  /// The framework's own control messages start here.
  CM_BASE = 0xB000,
  CM_ENABLEDCHANGED = CM_BASE + 1,
  CM_COLORCHANGED = CM_BASE + 2,
  CM_FONTCHANGED = CM_BASE + 3,
  CM_TEXTCHANGED = CM_BASE + 4,
  CM_VISIBLECHANGED = CM_BASE + 5,
  CM_PARENTFONTCHANGED = CM_BASE + 6,
  /// To a windowed control: a child joined (WParam the child, LParam 1) or left (LParam 0).
  CM_CONTROLCHANGE = CM_BASE + 7,
  /// To a control: its parent changed (WParam the old parent, LParam the new one).
  CM_PARENTCHANGED = CM_BASE + 8,
  /// To a form: destroy yourself (posted by `ReleaseForm`).
  CM_RELEASE = CM_BASE + 9,
  CM_SHOWINGCHANGED = CM_BASE + 10,
  /// A key typed with Alt, as a dialog character (WParam the character): a control whose
  /// accelerator it is acts and answers 1; a windowed control passes it to its children.
  CM_DIALOGCHAR = CM_BASE + 11,
  /// To a control: it is no longer the one that is active among its siblings.
  CM_DEACTIVATE = CM_BASE + 12,
};

/// Anything that can receive messages. A target must call `RemoveMessages(this)` in its
/// teardown so that nothing queued for it is delivered afterwards.
class FK_API TMessageTarget {
public:
  /// The handler: every message to this target arrives here.
  virtual void WndProc(TMessage& Message) = 0;

protected:
  TMessageTarget() = default;
  TMessageTarget(const TMessageTarget&) = delete;
  TMessageTarget& operator=(const TMessageTarget&) = delete;
  ~TMessageTarget() = default;
};

/// Delivers a message at once and returns the handler's answer. Raises
/// `EInvalidOperation` for a null target.
FK_API std::intptr_t SendMessage(TMessageTarget* Target, std::uint32_t Msg, std::intptr_t WParam,
                                 std::intptr_t LParam);
/// Queues a message behind the ones already queued. Raises `EInvalidOperation` for a
/// null target.
FK_API void PostMessage(TMessageTarget* Target, std::uint32_t Msg, std::intptr_t WParam,
                        std::intptr_t LParam);
/// Delivers queued messages in order, including those posted while it runs, until the
/// queue is empty; returns how many were delivered. A handler that raises stops the
/// delivery: its message is gone, the rest stay queued, and the exception passes on.
FK_API int ProcessMessages();
/// Delivers the first queued message, if any; true when one was delivered.
FK_API bool HandleMessage();
/// Finds the first queued message whose number lies in [`MsgFilterMin`, `MsgFilterMax`]
/// (or that is `WM_QUIT`), into `Target` and `Message`; with `Remove` it leaves the queue
/// undelivered. False when there is none.
FK_API bool PeekMessage(TMessageTarget*& Target, TMessage& Message, std::uint32_t MsgFilterMin,
                        std::uint32_t MsgFilterMax, bool Remove);
/// Drops every queued message for `Target`; returns how many were dropped.
FK_API int RemoveMessages(TMessageTarget* Target) noexcept;
/// The number of queued messages, for `Target` alone or for all when it is null.
FK_API int PendingMessageCount(TMessageTarget* Target = nullptr) noexcept;
/// Whether a message `Msg` for `Target` waits in the queue.
[[nodiscard]] FK_API bool MessageQueued(TMessageTarget* Target, std::uint32_t Msg) noexcept;

} // namespace formkit
