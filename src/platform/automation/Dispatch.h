#pragma once
// Classes reached by member name declare their members once, in a table, and are
// otherwise written as plain C++:
//
//   class Echo : public automation::Dispatch<Echo> {
//    public:
//     static const automation::MemberTable<Echo>& Members() {
//       static const auto table = automation::MemberTable<Echo>()
//           .Method("Say", {1, 1}, [](Echo& self, automation::Args& a) { return self.Say(a[0]); })
//           .Property("Count", [](Echo& self) { return vb::Variant(self.count); });
//       return table;
//     }
//   };
//
// Names compare ignoring letter case, as IDispatch::GetIDsOfNames does; an unknown name
// raises 438. A method sees exactly as many arguments as it declares: the ones its
// caller left out arrive as Missing, and whatever it writes into the others goes back
// to the caller, which is how by-reference parameters work.

#include <cstddef>
#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "platform/vb/Object.h"
#include "platform/vb/Variant.h"

namespace automation {

using Args = std::vector<vb::Variant>;

// A member name folded for lookup (ASCII letters to lower case).
std::string FoldMemberName(std::string_view name);

// How many arguments a method takes: the first `required` must be given.
struct Params {
  size_t required = 0;
  size_t total = 0;
};

// The lookup part of a member table, apart from the member types: name to position.
class MemberIndex {
 public:
  // Raises std::logic_error for a name declared twice: a table is written once, by hand.
  void Add(std::string_view name, size_t position);
  // The position of a member, or npos.
  size_t Find(std::string_view name) const;
  static constexpr size_t npos = static_cast<size_t>(-1);

 private:
  std::unordered_map<std::string, size_t> positions_;
};

// Raise the errors Basic raises for a call that does not fit the member.
[[noreturn]] void RaiseMemberNotSupported(std::string_view member);     // 438
[[noreturn]] void RaiseArgumentNotOptional(std::string_view member);    // 449
[[noreturn]] void RaiseWrongNumberOfArguments(std::string_view member); // 450

// Checks the caller's arguments against the method's parameters, then pads them with
// Missing to the declared count. Returns how many the caller passed, for UnpadArguments.
size_t PadArguments(std::string_view member, const Params& params, Args& args);
// Gives the caller back its own argument list, written-back values included.
void UnpadArguments(Args& args, size_t passed);

// Typed parameters, converted as automation converts a Variant for a typed parameter.
// An omitted optional text arrives as "", an omitted number as its default.
std::string TextArg(const vb::Variant& arg);
int32_t LongArg(const vb::Variant& arg, int32_t omitted = 0);
bool BooleanArg(const vb::Variant& arg, bool omitted = false);
// Nothing, Empty and an omitted argument give a null object; other non-objects raise 13.
vb::ObjectPtr ObjectArg(const vb::Variant& arg);
// Hands a by-reference text parameter back to its caller. Only a text the caller passed
// is written: an omitted argument or one of another type went in as a converted copy.
void WriteBackText(vb::Variant& arg, const std::string& value);

template <class T>
class MemberTable {
 public:
  using MethodFn = std::function<vb::Variant(T&, Args&)>;
  using GetterFn = std::function<vb::Variant(T&)>;
  using SetterFn = std::function<void(T&, const vb::Variant&)>;

  MemberTable& Method(std::string_view name, Params params, MethodFn fn) {
    return Add(Member{std::string(name), params, std::move(fn), {}, {}});
  }
  // A property without a setter is read-only; assigning it raises 438.
  MemberTable& Property(std::string_view name, GetterFn get, SetterFn let = {}) {
    return Add(Member{std::string(name), {}, {}, std::move(get), std::move(let)});
  }

  vb::Variant Invoke(T& self, std::string_view name, Args& args) const {
    const Member& member = Find(name);
    if (member.method) {
      size_t passed = PadArguments(member.name, member.params, args);
      try {
        vb::Variant result = member.method(self, args);
        UnpadArguments(args, passed);
        return result;
      } catch (...) {
        UnpadArguments(args, passed);
        throw;
      }
    }
    // Reading a property through a call, as Basic does for obj.Prop in an expression.
    if (!args.empty()) RaiseWrongNumberOfArguments(member.name);
    return member.get(self);
  }

  vb::Variant Get(T& self, std::string_view name) const {
    const Member& member = Find(name);
    if (member.get) return member.get(self);
    // A method without arguments can be read like a property, as IDispatch allows.
    Args none;
    return Invoke(self, name, none);
  }

  void Let(T& self, std::string_view name, const vb::Variant& value) const {
    const Member& member = Find(name);
    if (!member.let) RaiseMemberNotSupported(member.name);
    member.let(self, value);
  }

 private:
  struct Member {
    std::string name;
    Params params;
    MethodFn method;
    GetterFn get;
    SetterFn let;
  };

  MemberTable& Add(Member member) {
    index_.Add(member.name, members_.size());
    members_.push_back(std::move(member));
    return *this;
  }

  const Member& Find(std::string_view name) const {
    size_t position = index_.Find(name);
    if (position == MemberIndex::npos) RaiseMemberNotSupported(name);
    return members_[position];
  }

  std::vector<Member> members_;
  MemberIndex index_;
};

// The dispatch interface of a class T that publishes `static const MemberTable<T>&
// Members()`. A class hierarchy publishes one table at the class that derives from this.
template <class T>
class Dispatch : public vb::Object {
 public:
  vb::Variant Invoke(const std::string& name, Args& args) override {
    return T::Members().Invoke(Self(), name, args);
  }
  vb::Variant Get(const std::string& name) override { return T::Members().Get(Self(), name); }
  void Let(const std::string& name, const vb::Variant& value) override {
    T::Members().Let(Self(), name, value);
  }

 private:
  T& Self() { return static_cast<T&>(*this); }
};

}  // namespace automation
