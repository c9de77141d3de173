#include "platform/vb/Object.h"

#include "platform/vb/Error.h"
#include "platform/vb/Variant.h"

namespace vb {

// An object without properties of its own answers every property as a member it does
// not support, as a late-bound call on Windows would.
Variant Object::Get(const std::string& name) {
  throw Error(kErrMemberNotSupported,
              DefaultDescription(kErrMemberNotSupported) + " (" + name + ")");
}

void Object::Let(const std::string& name, const Variant&) {
  throw Error(kErrMemberNotSupported,
              DefaultDescription(kErrMemberNotSupported) + " (" + name + ")");
}

Variant Object::Call(const std::string& name, std::vector<Variant> args) {
  return Invoke(name, args);
}

Variant Object::Call(const std::string& name) {
  std::vector<Variant> none;
  return Invoke(name, none);
}

}  // namespace vb
