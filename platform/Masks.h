//===- platform/Masks.h - Wildcard masks for names ------------------------===//
//
// `TMask` matches a name against a file-style wildcard mask, without regard to
// letter case: `*` stands for any run of characters, `?` for any one, and
// `[...]` for one of a set of characters or ranges (`[!...]` or `[^...]` for
// one not in it). A mask with an unclosed set is refused when it is made.
//
// Example:
//   TMask Mask("On*Key*");
//   Mask.Matches("OnKeyDown");   // true
//   Mask.Matches("Onclick");     // false
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <vector>

namespace formkit {

FK_RESOURCESTRING(SInvalidMask, "'%s' is an invalid mask at (%d)");
FK_EXCEPTION(EMaskException, Exception);

/// A wildcard mask, compiled once. Matching costs O(mask length x name length) at worst.
class FK_API TMask {
public:
  /// Raises `EMaskException` "'%s' is an invalid mask at (%d)" for a set that is not
  /// closed, with the mask and the 1-based position of its `[`.
  explicit TMask(const String& MaskValue);
  [[nodiscard]] bool Matches(std::string_view Name) const;
  const String& Text() const noexcept { return FText; }

private:
  enum class TKind : std::uint8_t { Literal, AnyOne, AnyRun, Set };
  struct TPart {
    TKind Kind = TKind::Literal;
    char Literal = 0;
    bool Negated = false;
    std::vector<std::pair<char, char>> Ranges;
  };
  [[nodiscard]] bool PartMatches(const TPart& Part, char C) const;
  String FText;
  std::vector<TPart> FParts;
};

/// Whether `Name` matches the mask `Mask`; raises as `TMask` does for a bad mask.
[[nodiscard]] FK_API bool MatchesMask(std::string_view Name, const String& Mask);

} // namespace formkit
