#pragma once
// An automation object reached by member name, as an IDispatch is: the windows, the
// public classes, the peers and the host's call-back objects all meet through this.

#include <memory>
#include <string>
#include <vector>

namespace vb {

class Variant;

class Object : public std::enable_shared_from_this<Object> {
 public:
  virtual ~Object() = default;

  // Calls a method. Arguments are passed by reference: a callee may write back into
  // them, which is how by-reference parameters reach the caller. Unknown members raise
  // error 438.
  virtual Variant Invoke(const std::string& name, std::vector<Variant>& args) = 0;
  // Reads and writes a property.
  virtual Variant Get(const std::string& name);
  virtual void Let(const std::string& name, const Variant& value);

  // Convenience for callers that pass arguments by value.
  Variant Call(const std::string& name, std::vector<Variant> args);
  Variant Call(const std::string& name);
};

using ObjectPtr = std::shared_ptr<Object>;

}  // namespace vb
