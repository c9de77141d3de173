#pragma once
// The value that crosses every procedure: Empty, Null, Missing (an omitted optional
// argument), Boolean, Long (32-bit), Double, Date, String (UTF-8) or Object.

#include <cstdint>
#include <string>
#include <string_view>
#include <variant>

#include "platform/vb/Date.h"
#include "platform/vb/Object.h"

namespace vb {

enum class VarType { Empty, Null, Missing, Boolean, Long, Double, Date, String, Object };

class Variant {
 public:
  Variant() = default;
  Variant(bool b) : v_(b) {}
  Variant(int32_t n) : v_(n) {}
  Variant(double d) : v_(d) {}
  Variant(Date d) : v_(d) {}
  Variant(const char* s) : v_(std::string(s)) {}
  Variant(std::string s) : v_(std::move(s)) {}
  Variant(std::string_view s) : v_(std::string(s)) {}
  Variant(ObjectPtr o) : v_(std::move(o)) {}
  // Whole numbers wider than a Long become Double, as the database's bigint would.
  static Variant FromInt64(int64_t n);

  static Variant Null() { Variant v; v.v_ = NullTag{}; return v; }
  static Variant Missing() { Variant v; v.v_ = MissingTag{}; return v; }

  VarType Type() const { return static_cast<VarType>(v_.index()); }
  bool IsEmpty() const { return Type() == VarType::Empty; }
  bool IsNull() const { return Type() == VarType::Null; }
  bool IsMissing() const { return Type() == VarType::Missing; }
  bool IsObject() const { return Type() == VarType::Object; }
  bool IsString() const { return Type() == VarType::String; }

  // Direct access when the type is known; the wrong type raises error 13.
  bool AsBoolean() const;
  int32_t AsLong() const;
  double AsDouble() const;
  Date AsDate() const;
  const std::string& AsString() const;
  // Nothing (an empty Object variant) gives a null pointer; other types raise 13.
  const ObjectPtr& AsObject() const;

  // Same type and same value (Objects by identity). Not Basic's "=", which converts.
  friend bool operator==(const Variant& a, const Variant& b);

  // A readable form for messages, logs and test failures.
  std::string Debug() const;

 private:
  struct NullTag { bool operator==(const NullTag&) const = default; };
  struct MissingTag { bool operator==(const MissingTag&) const = default; };
  std::variant<std::monostate, NullTag, MissingTag, bool, int32_t, double, Date, std::string,
               ObjectPtr>
      v_;
};

// The Basic keyword Nothing: an Object variant that refers to no object.
inline Variant Nothing() { return Variant(ObjectPtr{}); }

}  // namespace vb
