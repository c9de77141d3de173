#include "platform/ado/Errors.h"

#include "platform/vb/Error.h"

namespace ado {

const char* const kConnectionClosedText =
    "The connection cannot be used to perform this operation. It is either closed or "
    "invalid in this context.";

const ErrorItem& Errors::Item(int32_t index) const {
  if (index < 0 || index >= Count())
    throw vb::Error(kErrItemNotFound,
                    "Item cannot be found in the collection corresponding to the requested "
                    "name or ordinal.");
  return items_[static_cast<size_t>(index)];
}

void Errors::Set(ErrorItem item) {
  items_.clear();
  items_.push_back(std::move(item));
}

}  // namespace ado
