#pragma once
// Text compares as on the server's case-insensitive, accent-sensitive collation with
// Portuguese letters: "ç" equals "Ç", "a" differs from "á". Equality and ordering go
// through an ICU collator (Portuguese, secondary strength); LIKE folds case with ICU and
// matches code points, so both agree on what "the same letter" is.

#include <memory>
#include <string>
#include <string_view>

struct UCollator;

namespace ado {

// The name under which the collation is registered and which the schema's text columns
// declare.
inline constexpr const char* kTextCollation = "POC_CI_AS";

class TextCollator {
 public:
  TextCollator();
  ~TextCollator();
  TextCollator(const TextCollator&) = delete;
  TextCollator& operator=(const TextCollator&) = delete;

  // <0, 0, >0 as a is before, equal to, after b.
  int Compare(std::string_view a, std::string_view b) const;

 private:
  UCollator* collator_ = nullptr;
};

// The text with case folded and composed (NFC), as LIKE compares it: "Ç" and "ç" fold
// alike, "á" stays apart from "a".
std::u32string FoldForLike(std::string_view utf8);

// SQL Server's LIKE on folded texts: % any run, _ one character, [abc], [a-z], [^abc];
// escape (when not 0) makes the next pattern character literal.
bool LikeMatch(const std::u32string& pattern, const std::u32string& text, char32_t escape);

}  // namespace ado
