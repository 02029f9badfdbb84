//===- frameworks/kiln/KilnMessages.cpp - The message queue --------------===//
#include "frameworks/kiln/KilnMessages.h"

#include <algorithm>
#include <deque>

namespace formkit {

FK_RESOURCESTRING(SNoMessageTarget, "A message needs a target");

namespace {
struct TQueuedMessage {
  TMessageTarget* Target;
  TMessage Message;
};

/// Immortal: targets may leave the queue while statics are torn down.
std::deque<TQueuedMessage>& MessageQueue() {
  static auto* Queue = new std::deque<TQueuedMessage>;
  return *Queue;
}
} // namespace

std::intptr_t SendMessage(TMessageTarget* Target, std::uint32_t Msg, std::intptr_t WParam,
                          std::intptr_t LParam) {
  if (!Target) throw EInvalidOperation(SNoMessageTarget);
  TMessage M{Msg, WParam, LParam, 0};
  Target->WndProc(M);
  return M.Result;
}

void PostMessage(TMessageTarget* Target, std::uint32_t Msg, std::intptr_t WParam, std::intptr_t LParam) {
  if (!Target) throw EInvalidOperation(SNoMessageTarget);
  MessageQueue().push_back({Target, TMessage{Msg, WParam, LParam, 0}});
}

bool HandleMessage() {
  auto& Queue = MessageQueue();
  if (Queue.empty()) return false;
  // Taken off the queue before delivery: the handler may post, remove or destroy its
  // own target, and nothing touches the target after the handler returns.
  TQueuedMessage Q = Queue.front();
  Queue.pop_front();
  Q.Target->WndProc(Q.Message);
  return true;
}

int ProcessMessages() {
  int Count = 0;
  while (HandleMessage()) ++Count;
  return Count;
}

int RemoveMessages(TMessageTarget* Target) noexcept {
  auto& Queue = MessageQueue();
  auto Before = Queue.size();
  std::erase_if(Queue, [Target](const TQueuedMessage& Q) { return Q.Target == Target; });
  return static_cast<int>(Before - Queue.size());
}

int PendingMessageCount(TMessageTarget* Target) noexcept {
  auto& Queue = MessageQueue();
  if (!Target) return static_cast<int>(Queue.size());
  return static_cast<int>(
      std::count_if(Queue.begin(), Queue.end(), [Target](const TQueuedMessage& Q) { return Q.Target == Target; }));
}

} // namespace formkit
