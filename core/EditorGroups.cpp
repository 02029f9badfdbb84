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
  auto& L = GroupChangeList();
  if (Proc && std::find(L.begin(), L.end(), Proc) == L.end()) L.push_back(Proc);
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
