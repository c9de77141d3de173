#include "platform/ado/Collation.h"

#include <unicode/ucol.h>
#include <unicode/unorm2.h>
#include <unicode/ustring.h>
#include <unicode/utf8.h>

#include <stdexcept>
#include <vector>

#include "platform/ado/Utf16.h"

namespace ado {

TextCollator::TextCollator() {
  UErrorCode status = U_ZERO_ERROR;
  collator_ = ucol_open("pt", &status);
  if (U_FAILURE(status)) throw std::runtime_error("cannot open the Portuguese collation");
  // Secondary strength: base letters and accents count, case does not.
  ucol_setStrength(collator_, UCOL_SECONDARY);
  ucol_setAttribute(collator_, UCOL_NORMALIZATION_MODE, UCOL_ON, &status);
}

TextCollator::~TextCollator() { ucol_close(collator_); }

int TextCollator::Compare(std::string_view a, std::string_view b) const {
  UErrorCode status = U_ZERO_ERROR;
  UCollationResult r = ucol_strcollUTF8(collator_, a.data(), static_cast<int32_t>(a.size()),
                                        b.data(), static_cast<int32_t>(b.size()), &status);
  if (U_FAILURE(status)) return a.compare(b);  // ill-formed text: fall back to bytes
  return r == UCOL_LESS ? -1 : r == UCOL_GREATER ? 1 : 0;
}

namespace {

std::u16string Fold(const std::u16string& in) {
  UErrorCode status = U_ZERO_ERROR;
  int32_t need = u_strFoldCase(nullptr, 0, in.data(), static_cast<int32_t>(in.size()),
                               U_FOLD_CASE_DEFAULT, &status);
  std::u16string out(static_cast<size_t>(need), u'\0');
  status = U_ZERO_ERROR;
  u_strFoldCase(out.data(), need, in.data(), static_cast<int32_t>(in.size()),
                U_FOLD_CASE_DEFAULT, &status);
  return out;
}

std::u16string Compose(const std::u16string& in) {
  UErrorCode status = U_ZERO_ERROR;
  const UNormalizer2* nfc = unorm2_getNFCInstance(&status);
  if (U_FAILURE(status)) return in;
  int32_t need = unorm2_normalize(nfc, in.data(), static_cast<int32_t>(in.size()), nullptr, 0,
                                  &status);
  std::u16string out(static_cast<size_t>(need), u'\0');
  status = U_ZERO_ERROR;
  unorm2_normalize(nfc, in.data(), static_cast<int32_t>(in.size()), out.data(), need, &status);
  return U_SUCCESS(status) ? out : in;
}

std::u32string ToUtf32(const std::u16string& in) {
  std::u32string out;
  out.reserve(in.size());
  for (size_t i = 0; i < in.size();) {
    char32_t c = in[i++];
    if (c >= 0xD800 && c < 0xDC00 && i < in.size() && in[i] >= 0xDC00 && in[i] < 0xE000)
      c = 0x10000 + ((c - 0xD800) << 10) + (in[i++] - 0xDC00);
    out.push_back(c);
  }
  return out;
}

// Matches a bracket class at p (just after "["); sets p after "]". An unclosed "[" is
// taken literally, as the server does.
bool MatchClass(const std::u32string& pat, size_t& p, char32_t c, bool& wellFormed) {
  size_t q = p;
  bool negate = q < pat.size() && pat[q] == U'^';
  if (negate) ++q;
  bool hit = false;
  size_t first = q;
  while (q < pat.size() && (pat[q] != U']' || q == first)) {
    if (q + 2 < pat.size() && pat[q + 1] == U'-' && pat[q + 2] != U']') {
      if (c >= pat[q] && c <= pat[q + 2]) hit = true;
      q += 3;
    } else {
      if (c == pat[q]) hit = true;
      ++q;
    }
  }
  wellFormed = q < pat.size();
  if (!wellFormed) return false;
  p = q + 1;
  return hit != negate;
}

}  // namespace

std::u32string FoldForLike(std::string_view utf8) { return ToUtf32(Compose(Fold(ToUtf16(utf8)))); }

bool LikeMatch(const std::u32string& pat, const std::u32string& text, char32_t escape) {
  // Iterative matching with one backtrack point for the last "%": linear for the
  // patterns people type, never exponential.
  size_t p = 0, t = 0, starP = std::u32string::npos, starT = 0;
  while (t < text.size()) {
    bool advanced = false;
    if (p < pat.size()) {
      char32_t pc = pat[p];
      if (escape != 0 && pc == escape && p + 1 < pat.size()) {
        if (pat[p + 1] == text[t]) {
          p += 2;
          ++t;
          advanced = true;
        }
      } else if (pc == U'%') {
        starP = ++p;
        starT = t;
        continue;
      } else if (pc == U'_') {
        ++p;
        ++t;
        advanced = true;
      } else if (pc == U'[') {
        size_t q = p + 1;
        bool wellFormed = true;
        bool hit = MatchClass(pat, q, text[t], wellFormed);
        if (!wellFormed) {
          if (text[t] == U'[') {
            ++p;
            ++t;
            advanced = true;
          }
        } else if (hit) {
          p = q;
          ++t;
          advanced = true;
        }
      } else if (pc == text[t]) {
        ++p;
        ++t;
        advanced = true;
      }
    }
    if (advanced) continue;
    if (starP == std::u32string::npos) return false;
    p = starP;
    t = ++starT;
  }
  while (p < pat.size() && pat[p] == U'%') ++p;
  return p == pat.size();
}

}  // namespace ado
