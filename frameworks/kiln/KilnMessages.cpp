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

bool PeekMessage(TMessageTarget*& Target, TMessage& Message, std::uint32_t MsgFilterMin, std::uint32_t MsgFilterMax,
                 bool Remove) {
  auto& Queue = MessageQueue();
  auto It = std::find_if(Queue.begin(), Queue.end(), [&](const TQueuedMessage& Q) {
    return Q.Message.Msg == WM_QUIT || (Q.Message.Msg >= MsgFilterMin && Q.Message.Msg <= MsgFilterMax);
  });
  if (It == Queue.end()) return false;
  Target = It->Target;
  Message = It->Message;
  if (Remove) Queue.erase(It);
  return true;
}

int RemoveMessages(TMessageTarget* Target) noexcept {
  auto& Queue = MessageQueue();
  auto Before = Queue.size();
  std::erase_if(Queue, [Target](const TQueuedMessage& Q) { return Q.Target == Target; });
  return static_cast<int>(Before - Queue.size());
}

bool MessageQueued(TMessageTarget* Target, std::uint32_t Msg) noexcept {
  auto& Queue = MessageQueue();
  return std::any_of(Queue.begin(), Queue.end(),
                     [&](const TQueuedMessage& Q) { return Q.Target == Target && Q.Message.Msg == Msg; });
}

int PendingMessageCount(TMessageTarget* Target) noexcept {
  auto& Queue = MessageQueue();
  if (!Target) return static_cast<int>(Queue.size());
  return static_cast<int>(
      std::count_if(Queue.begin(), Queue.end(), [Target](const TQueuedMessage& Q) { return Q.Target == Target; }));
}

} // namespace formkit
