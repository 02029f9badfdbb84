//===- core/EditorGroups.cpp - Design package groups ---------------------===//
#include "core/EditorGroups.h"

#include <algorithm>

namespace formkit {

namespace {
std::vector<TGroupChangeProc>& GroupChangeList() {
  static std::vector<TGroupChangeProc> List;
  return List;
}
} // namespace

void NotifyGroupChange(TGroupChangeProc Proc) {
  if (!Proc) return;
  UnnotifyGroupChange(Proc);
  GroupChangeList().push_back(Proc); // a repeat moves to the end: it is told first
}

void UnnotifyGroupChange(TGroupChangeProc Proc) {
  auto& L = GroupChangeList();
  auto It = std::find(L.begin(), L.end(), Proc);
  if (It != L.end()) L.erase(It);
}

void NotifyGroupChangeSubscribers(int Group) {
  auto& L = GroupChangeList();
  for (size_t I = L.size(); I-- > 0;) {
    if (I >= L.size()) continue; // a subscriber may unsubscribe others
    L[I](Group);
  }
}

} // namespace formkit
