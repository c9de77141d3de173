#include "platform/vb/Error.h"

#include <fmt/format.h>

namespace vb {

std::string DefaultDescription(int32_t number) {
  switch (number) {
    case kErrInvalidProcedureCall: return "Invalid procedure call or argument";
    case kErrOverflow: return "Overflow";
    case kErrTypeMismatch: return "Type mismatch";
    case kErrObjectNotSet: return "Object variable or With block variable not set";
    case kErrInvalidUseOfNull: return "Invalid use of Null";
    case kErrCannotCreateObject: return "ActiveX component can't create object";
    case kErrMemberNotSupported: return "Object doesn't support this property or method";
    case kErrConnectionClosed:
      return "The connection cannot be used to perform this operation. It is either closed "
             "or invalid in this context.";
    case kErrElementNotFound: return "Element not found";
    case kErrKeyNotUnique: return "Key is not unique in collection";
    default: return fmt::format("Application-defined or object-defined error {}", number);
  }
}

Error::Error(int32_t number) : Error(number, DefaultDescription(number)) {}

Error::Error(int32_t number, std::string description, std::string source)
    : std::runtime_error(description),
      number_(number),
      description_(std::move(description)),
      source_(std::move(source)) {}

}  // namespace vb
