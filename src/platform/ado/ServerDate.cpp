#include "platform/ado/ServerDate.h"

#include <fmt/format.h>

#include <cctype>
#include <ctime>

namespace ado {

namespace {

bool IsLeap(int y) { return (y % 4 == 0 && y % 100 != 0) || y % 400 == 0; }

int DaysInMonth(int y, int m) {
  static constexpr int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  return m == 2 && IsLeap(y) ? 29 : kDays[m - 1];
}

class Reader {
 public:
  explicit Reader(std::string_view s) : s_(s) {}
  bool Done() const { return pos_ >= s_.size(); }
  char Peek() const { return Done() ? '\0' : s_[pos_]; }
  bool Accept(char c) {
    if (Peek() != c) return false;
    ++pos_;
    return true;
  }
  // Reads between min and max digits.
  std::optional<int> Digits(int min, int max) {
    int n = 0, count = 0;
    while (count < max && std::isdigit(static_cast<unsigned char>(Peek()))) {
      n = n * 10 + (s_[pos_++] - '0');
      ++count;
    }
    if (count < min) return std::nullopt;
    return n;
  }
  void SkipBlanks() {
    while (Peek() == ' ' || Peek() == '\t') ++pos_;
  }

 private:
  std::string_view s_;
  size_t pos_ = 0;
};

}  // namespace

std::optional<std::string> NormalizeDateTimeText(std::string_view text) {
  Reader r(text);
  r.SkipBlanks();
  auto year = r.Digits(4, 4);
  if (!year) return std::nullopt;
  std::optional<int> month, day;
  char sep = r.Peek();
  if (sep == '-' || sep == '.' || sep == '/') {
    r.Accept(sep);
    month = r.Digits(1, 2);
    if (!month || !r.Accept(sep)) return std::nullopt;
    day = r.Digits(1, 2);
  } else {
    month = r.Digits(2, 2);
    day = month ? r.Digits(2, 2) : std::nullopt;
  }
  if (!day || *year < 1753 || *year > 9999 || *month < 1 || *month > 12 || *day < 1 ||
      *day > DaysInMonth(*year, *month))
    return std::nullopt;
  int hour = 0, minute = 0, second = 0;
  r.SkipBlanks();
  if (!r.Done()) {
    auto h = r.Digits(1, 2);
    if (!h || !r.Accept(':')) return std::nullopt;
    auto mi = r.Digits(1, 2);
    if (!mi) return std::nullopt;
    hour = *h;
    minute = *mi;
    if (r.Accept(':')) {
      auto se = r.Digits(1, 2);
      if (!se) return std::nullopt;
      second = *se;
      if (r.Accept('.')) r.Digits(1, 9);
    }
    r.SkipBlanks();
    if (!r.Done() || hour > 23 || minute > 59 || second > 59) return std::nullopt;
  }
  return fmt::format("{:04}-{:02}-{:02} {:02}:{:02}:{:02}", *year, *month, *day, hour, minute,
                     second);
}

bool LooksLikeStoredDateTime(std::string_view t) {
  if (t.size() != 19) return false;
  for (size_t i = 0; i < t.size(); ++i) {
    char c = t[i];
    bool ok = (i == 4 || i == 7) ? c == '-'
              : i == 10          ? c == ' '
              : (i == 13 || i == 16) ? c == ':'
                                     : std::isdigit(static_cast<unsigned char>(c)) != 0;
    if (!ok) return false;
  }
  return true;
}

std::string StoredDateTimeText(vb::Date d) {
  vb::DateParts p = vb::SplitDate(d);
  return fmt::format("{:04}-{:02}-{:02} {:02}:{:02}:{:02}", p.year, p.month, p.day, p.hour,
                     p.minute, p.second);
}

std::optional<vb::Date> DateFromStoredText(std::string_view t) {
  if (!LooksLikeStoredDateTime(t)) return std::nullopt;
  auto num = [&](size_t at, size_t len) {
    int n = 0;
    for (size_t i = at; i < at + len; ++i) n = n * 10 + (t[i] - '0');
    return n;
  };
  return vb::DateSerial(num(0, 4), num(5, 2), num(8, 2), num(11, 2), num(14, 2), num(17, 2));
}

std::string LocalNowText() {
  std::time_t now = std::time(nullptr);
  std::tm local{};
  localtime_r(&now, &local);
  return fmt::format("{:04}-{:02}-{:02} {:02}:{:02}:{:02}", local.tm_year + 1900,
                     local.tm_mon + 1, local.tm_mday, local.tm_hour, local.tm_min,
                     local.tm_sec);
}

}  // namespace ado
