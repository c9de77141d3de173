#pragma once
// The connection's Errors collection and the error numbers ADO raises. A failed
// statement leaves its error here until the next failure replaces it or Clear empties
// it: successful statements do not clear it, which callers rely on to tell a
// connection that has gone wrong.

#include <cstdint>
#include <string>
#include <vector>

namespace ado {

// HRESULTs as a program sees them in Err.Number.
inline constexpr int32_t kErrCommandFailed = -2147217900;   // DB_E_ERRORSINCOMMAND
inline constexpr int32_t kErrLoginFailed = -2147217843;     // DB_SEC_E_AUTH_FAILED
inline constexpr int32_t kErrProviderFailed = -2147467259;  // E_FAIL
inline constexpr int32_t kErrNoNestedTransactions = -2147168227;  // XACT_E_XTIONEXISTS
inline constexpr int32_t kErrNoTransaction = -2147168242;         // XACT_E_NOTRANSACTION
// ADO's own numbers.
inline constexpr int32_t kErrNoCurrentRecord = 3021;
inline constexpr int32_t kErrItemNotFound = 3265;
inline constexpr int32_t kErrObjectOpen = 3705;
inline constexpr int32_t kErrObjectClosed = 3704;
inline constexpr int32_t kErrConnectionClosed = 3709;
inline constexpr int32_t kErrOperationCancelled = 3712;
inline constexpr int32_t kErrInvalidArgument = 3001;

extern const char* const kConnectionClosedText;

struct ErrorItem {
  int32_t Number = 0;
  std::string Description;
  std::string Source;
  std::string SQLState;
  int32_t NativeError = 0;
};

class Errors {
 public:
  int32_t Count() const { return static_cast<int32_t>(items_.size()); }
  const ErrorItem& Item(int32_t index) const;  // 0-based; out of range raises 3265
  void Clear() { items_.clear(); }
  // The collection always holds what the last failure left, so there is nothing to
  // fetch from the engine; kept for callers that ask for it.
  void Refresh() {}

  // Replaces the contents with the errors of one failed operation.
  void Set(ErrorItem item);

 private:
  std::vector<ErrorItem> items_;
};

}  // namespace ado
