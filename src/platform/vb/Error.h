#pragma once
// The error raised inside procedures, numbered as Basic and ADO number them, so that
// traps can tell a closed connection (3709) from everything else.

#include <cstdint>
#include <stdexcept>
#include <string>

namespace vb {

enum ErrorNumber : int32_t {
  kErrOverflow = 6,
  kErrTypeMismatch = 13,
  kErrObjectNotSet = 91,
  kErrInvalidUseOfNull = 94,
  kErrInvalidProcedureCall = 5,
  kErrMemberNotSupported = 438,
  kErrCannotCreateObject = 429,
  kErrConnectionClosed = 3709,
  kErrElementNotFound = 35601,
  kErrKeyNotUnique = 35602,
};

// The description Basic gives an error number when the raiser supplies none.
std::string DefaultDescription(int32_t number);

class Error : public std::runtime_error {
 public:
  explicit Error(int32_t number);
  Error(int32_t number, std::string description, std::string source = {});

  int32_t Number() const { return number_; }
  const std::string& Description() const { return description_; }
  const std::string& Source() const { return source_; }

 private:
  int32_t number_;
  std::string description_;
  std::string source_;
};

}  // namespace vb
