#include "platform/ado/SqliteFunctions.h"

#include <sqlite3.h>

#include <cmath>
#include <cstdlib>
#include <cstring>
#include <string>

#include "platform/ado/Collation.h"
#include "platform/ado/ServerDate.h"

namespace ado {

namespace {

std::string_view TextOf(sqlite3_value* v) {
  const char* p = reinterpret_cast<const char*>(sqlite3_value_text(v));
  return p ? std::string_view(p, static_cast<size_t>(sqlite3_value_bytes(v))) : std::string_view();
}

int CompareText(void* arg, int na, const void* a, int nb, const void* b) {
  auto* collator = static_cast<TextCollator*>(arg);
  return collator->Compare(std::string_view(static_cast<const char*>(a), static_cast<size_t>(na)),
                           std::string_view(static_cast<const char*>(b), static_cast<size_t>(nb)));
}

void DeleteFolded(void* p) { delete static_cast<std::u32string*>(p); }

// like(pattern, text [, escape]): SQLite passes the pattern first.
void Like(sqlite3_context* ctx, int argc, sqlite3_value** argv) {
  for (int i = 0; i < argc; ++i)
    if (sqlite3_value_type(argv[i]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  char32_t escape = 0;
  if (argc == 3) {
    std::u32string esc = FoldForLike(TextOf(argv[2]));
    if (esc.size() != 1)
      return sqlite3_result_error(ctx, "The escape character must be a single character.", -1);
    escape = esc[0];
  }
  // The pattern is folded once per statement, not once per row.
  auto* pattern = static_cast<std::u32string*>(sqlite3_get_auxdata(ctx, 0));
  if (!pattern) {
    pattern = new std::u32string(FoldForLike(TextOf(argv[0])));
    sqlite3_set_auxdata(ctx, 0, pattern, DeleteFolded);
    pattern = static_cast<std::u32string*>(sqlite3_get_auxdata(ctx, 0));
    if (!pattern) return sqlite3_result_error_nomem(ctx);
  }
  sqlite3_result_int(ctx, LikeMatch(*pattern, FoldForLike(TextOf(argv[1])), escape) ? 1 : 0);
}

// Reads a text as a number the way the server converts varchar: the whole text, blanks
// around allowed.
bool TextAsNumber(std::string_view text, double& out, bool& whole) {
  std::string s(text);
  const char* begin = s.c_str();
  while (*begin == ' ') ++begin;
  if (!*begin) return false;
  char* end = nullptr;
  out = std::strtod(begin, &end);
  while (end && *end == ' ') ++end;
  if (!end || *end != '\0') return false;
  whole = std::string_view(begin).find_first_of(".eE") == std::string_view::npos;
  return true;
}

void Plus(sqlite3_context* ctx, int, sqlite3_value** argv) {
  int ta = sqlite3_value_type(argv[0]), tb = sqlite3_value_type(argv[1]);
  if (ta == SQLITE_NULL || tb == SQLITE_NULL) return sqlite3_result_null(ctx);
  bool textA = ta == SQLITE_TEXT || ta == SQLITE_BLOB, textB = tb == SQLITE_TEXT || tb == SQLITE_BLOB;
  if (textA && textB) {
    std::string joined(TextOf(argv[0]));
    joined += TextOf(argv[1]);
    return sqlite3_result_text(ctx, joined.data(), static_cast<int>(joined.size()), SQLITE_TRANSIENT);
  }
  // A number meets a text: the text must read as a number, as on the server.
  double a = sqlite3_value_double(argv[0]), b = sqlite3_value_double(argv[1]);
  bool wholeA = ta == SQLITE_INTEGER, wholeB = tb == SQLITE_INTEGER;
  for (int k = 0; k < 2; ++k) {
    bool isText = k == 0 ? textA : textB;
    if (!isText) continue;
    double& n = k == 0 ? a : b;
    bool& whole = k == 0 ? wholeA : wholeB;
    if (!TextAsNumber(TextOf(argv[k]), n, whole)) {
      std::string msg = "Conversion failed when converting the varchar value '" +
                        std::string(TextOf(argv[k])) + "' to data type int.";
      return sqlite3_result_error(ctx, msg.c_str(), -1);
    }
  }
  if (wholeA && wholeB) {
    long long ia = textA ? static_cast<long long>(a) : sqlite3_value_int64(argv[0]);
    long long ib = textB ? static_cast<long long>(b) : sqlite3_value_int64(argv[1]);
    long long sum = 0;
    if (__builtin_add_overflow(ia, ib, &sum))
      return sqlite3_result_error(ctx, "Arithmetic overflow error converting expression to data type int.", -1);
    return sqlite3_result_int64(ctx, sum);
  }
  sqlite3_result_double(ctx, a + b);
}

// SQLite's aggregate memory is only 8-byte aligned, so the 128-bit totals are kept as
// bytes and copied in and out.
struct MoneySum {
  bool any = false;
  bool fractional = false;
  unsigned char whole[16];           // sum while every addend is whole
  unsigned char tenThousandths[16];  // every addend in ten-thousandths

  static __int128 Load(const unsigned char* at) {
    __int128 v;
    std::memcpy(&v, at, sizeof v);
    return v;
  }
  static void Add(unsigned char* at, __int128 delta) {
    __int128 v = Load(at) + delta;
    std::memcpy(at, &v, sizeof v);
  }
};

void SumStep(sqlite3_context* ctx, int, sqlite3_value** argv) {
  int type = sqlite3_value_numeric_type(argv[0]);
  if (type == SQLITE_NULL) return;
  // The context comes zero-filled, which is a valid empty sum.
  auto* acc = static_cast<MoneySum*>(sqlite3_aggregate_context(ctx, sizeof(MoneySum)));
  if (!acc) return sqlite3_result_error_nomem(ctx);
  acc->any = true;
  if (type == SQLITE_INTEGER) {
    long long n = sqlite3_value_int64(argv[0]);
    MoneySum::Add(acc->whole, n);
    MoneySum::Add(acc->tenThousandths, static_cast<__int128>(n) * 10000);
  } else {
    double d = sqlite3_value_double(argv[0]);
    if (!std::isfinite(d) || std::fabs(d) > 9.2e14)
      return sqlite3_result_error(ctx, "Arithmetic overflow error converting expression to data type numeric.", -1);
    acc->fractional = true;
    MoneySum::Add(acc->tenThousandths, static_cast<__int128>(std::llround(d * 10000.0)));
  }
}

void SumFinal(sqlite3_context* ctx) {
  auto* acc = static_cast<MoneySum*>(sqlite3_aggregate_context(ctx, 0));
  if (!acc || !acc->any) return sqlite3_result_null(ctx);
  if (!acc->fractional) {
    __int128 whole = MoneySum::Load(acc->whole);
    if (whole > INT64_MAX || whole < INT64_MIN)
      return sqlite3_result_error(ctx, "Arithmetic overflow error converting expression to data type bigint.", -1);
    return sqlite3_result_int64(ctx, static_cast<long long>(whole));
  }
  sqlite3_result_double(ctx, static_cast<double>(MoneySum::Load(acc->tenThousandths)) / 10000.0);
}

void DateTime(sqlite3_context* ctx, int, sqlite3_value** argv) {
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  auto stored = NormalizeDateTimeText(TextOf(argv[0]));
  if (!stored)
    return sqlite3_result_error(
        ctx, "Conversion failed when converting date and/or time from character string.", -1);
  sqlite3_result_text(ctx, stored->data(), static_cast<int>(stored->size()), SQLITE_TRANSIENT);
}

void Identity(sqlite3_context* ctx, int, sqlite3_value**) {
  sqlite3_int64 id = sqlite3_last_insert_rowid(sqlite3_context_db_handle(ctx));
  if (id == 0) return sqlite3_result_null(ctx);
  sqlite3_result_int64(ctx, id);
}

void TranCount(sqlite3_context* ctx, int, sqlite3_value**) {
  sqlite3_result_int(ctx, sqlite3_get_autocommit(sqlite3_context_db_handle(ctx)) ? 0 : 1);
}

void GetDate(sqlite3_context* ctx, int, sqlite3_value**) {
  std::string now = LocalNowText();
  sqlite3_result_text(ctx, now.data(), static_cast<int>(now.size()), SQLITE_TRANSIENT);
}

// year(), month(), day() of a stored date (or any form CONVERT accepts).
template <size_t Offset, size_t Length>
void DatePart(sqlite3_context* ctx, int, sqlite3_value** argv) {
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  auto stored = NormalizeDateTimeText(TextOf(argv[0]));
  if (!stored)
    return sqlite3_result_error(
        ctx, "Conversion failed when converting date and/or time from character string.", -1);
  sqlite3_result_int(ctx, std::atoi(stored->substr(Offset, Length).c_str()));
}

// CHAR(n): one character of the server's code page (Windows-1252), Null out of range.
void Char(sqlite3_context* ctx, int, sqlite3_value** argv) {
  if (sqlite3_value_type(argv[0]) == SQLITE_NULL) return sqlite3_result_null(ctx);
  long long n = sqlite3_value_int64(argv[0]);
  if (n < 0 || n > 255) return sqlite3_result_null(ctx);
  static constexpr char16_t kHigh[32] = {
      0x20AC, 0x81,   0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
      0x2039, 0x0152, 0x8D,   0x017D, 0x8F,   0x90,   0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
      0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0x9D,   0x017E, 0x0178};
  char32_t cp = n >= 0x80 && n < 0xA0 ? kHigh[n - 0x80] : static_cast<char32_t>(n);
  std::string utf8;
  if (cp < 0x80) {
    utf8 += static_cast<char>(cp);
  } else if (cp < 0x800) {
    utf8 += static_cast<char>(0xC0 | (cp >> 6));
    utf8 += static_cast<char>(0x80 | (cp & 0x3F));
  } else {
    utf8 += static_cast<char>(0xE0 | (cp >> 12));
    utf8 += static_cast<char>(0x80 | ((cp >> 6) & 0x3F));
    utf8 += static_cast<char>(0x80 | (cp & 0x3F));
  }
  sqlite3_result_text(ctx, utf8.data(), static_cast<int>(utf8.size()), SQLITE_TRANSIENT);
}

void Check(sqlite3* db, int rc) {
  if (rc != SQLITE_OK) throw std::runtime_error(sqlite3_errmsg(db));
}

}  // namespace

void RegisterDialectFunctions(sqlite3* db, TextCollator* collator) {
  constexpr int kPure = SQLITE_UTF8 | SQLITE_DETERMINISTIC;
  constexpr int kVolatile = SQLITE_UTF8;
  Check(db, sqlite3_create_collation(db, kTextCollation, SQLITE_UTF8, collator, CompareText));
  Check(db, sqlite3_create_function(db, "like", 2, kPure, nullptr, Like, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "like", 3, kPure, nullptr, Like, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "dv_plus", 2, kPure, nullptr, Plus, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "sum", 1, kPure, nullptr, nullptr, SumStep, SumFinal));
  Check(db, sqlite3_create_function(db, "dv_datetime", 1, kPure, nullptr, DateTime, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "dv_identity", 0, kVolatile, nullptr, Identity, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "dv_trancount", 0, kVolatile, nullptr, TranCount, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "getdate", 0, kVolatile, nullptr, GetDate, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "year", 1, kPure, nullptr, DatePart<0, 4>, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "month", 1, kPure, nullptr, DatePart<5, 2>, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "day", 1, kPure, nullptr, DatePart<8, 2>, nullptr, nullptr));
  Check(db, sqlite3_create_function(db, "char", 1, kPure, nullptr, Char, nullptr, nullptr));
}

}  // namespace ado
