//===- platform/Masks.cpp - Wildcard masks for names ----------------------===//
#include "platform/Masks.h"

#include <cctype>

namespace formkit {

namespace {
char Folded(char C) { return static_cast<char>(std::tolower(static_cast<unsigned char>(C))); }
} // namespace

TMask::TMask(const String& MaskValue) : FText(MaskValue) {
  for (std::size_t I = 0; I < MaskValue.size(); ++I) {
    char C = MaskValue[I];
    TPart Part;
    if (C == '*') {
      if (!FParts.empty() && FParts.back().Kind == TKind::AnyRun) continue; // one run is as good as two
      Part.Kind = TKind::AnyRun;
    } else if (C == '?') {
      Part.Kind = TKind::AnyOne;
    } else if (C == '[') {
      std::size_t Open = I;
      Part.Kind = TKind::Set;
      ++I;
      if (I < MaskValue.size() && (MaskValue[I] == '!' || MaskValue[I] == '^')) {
        Part.Negated = true;
        ++I;
      }
      while (I < MaskValue.size() && MaskValue[I] != ']') {
        char From = Folded(MaskValue[I]), To = From;
        if (I + 2 < MaskValue.size() && MaskValue[I + 1] == '-' && MaskValue[I + 2] != ']') {
          To = Folded(MaskValue[I + 2]);
          I += 2;
        }
        Part.Ranges.emplace_back(From, To);
        ++I;
      }
      if (I >= MaskValue.size()) throw EMaskException(SInvalidMask, MaskValue, static_cast<int>(Open + 1));
    } else {
      Part.Literal = Folded(C);
    }
    FParts.push_back(std::move(Part));
  }
}

bool TMask::PartMatches(const TPart& Part, char C) const {
  switch (Part.Kind) {
  case TKind::Literal: return Folded(C) == Part.Literal;
  case TKind::AnyOne: return true;
  case TKind::Set: {
    char F = Folded(C);
    bool In = false;
    for (auto [From, To] : Part.Ranges) In = In || (F >= From && F <= To);
    return In != Part.Negated;
  }
  case TKind::AnyRun: return true;
  }
  return false;
}

bool TMask::Matches(std::string_view Name) const {
  // Greedy with one point of return: the last run seen, and where it may resume.
  std::size_t P = 0, N = 0, RunPart = FParts.size(), RunName = 0;
  while (N < Name.size()) {
    if (P < FParts.size() && FParts[P].Kind == TKind::AnyRun) {
      RunPart = P++;
      RunName = N;
    } else if (P < FParts.size() && PartMatches(FParts[P], Name[N])) {
      ++P;
      ++N;
    } else if (RunPart < FParts.size()) {
      P = RunPart + 1;
      N = ++RunName;
    } else {
      return false;
    }
  }
  while (P < FParts.size() && FParts[P].Kind == TKind::AnyRun) ++P;
  return P == FParts.size();
}

bool MatchesMask(std::string_view Name, const String& Mask) { return TMask(Mask).Matches(Name); }

} // namespace formkit
