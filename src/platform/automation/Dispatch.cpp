#include "platform/automation/Dispatch.h"

#include <stdexcept>

#include <fmt/format.h>

#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace automation {

std::string FoldMemberName(std::string_view name) {
  std::string folded(name);
  for (char& c : folded) {
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  }
  return folded;
}

void MemberIndex::Add(std::string_view name, size_t position) {
  if (!positions_.emplace(FoldMemberName(name), position).second) {
    throw std::logic_error(fmt::format("member '{}' declared twice", name));
  }
}

size_t MemberIndex::Find(std::string_view name) const {
  auto found = positions_.find(FoldMemberName(name));
  return found == positions_.end() ? npos : found->second;
}

// The descriptions are Basic's own, followed by the member asked for, so that a report
// says which name was at fault.
void RaiseMemberNotSupported(std::string_view member) {
  throw vb::Error(vb::kErrMemberNotSupported,
                  fmt::format("{} ({})", vb::DefaultDescription(vb::kErrMemberNotSupported), member),
                  std::string(member));
}

void RaiseArgumentNotOptional(std::string_view member) {
  throw vb::Error(449, fmt::format("Argument not optional ({})", member), std::string(member));
}

void RaiseWrongNumberOfArguments(std::string_view member) {
  throw vb::Error(450,
                  fmt::format("Wrong number of arguments or invalid property assignment ({})",
                              member),
                  std::string(member));
}

size_t PadArguments(std::string_view member, const Params& params, Args& args) {
  size_t passed = args.size();
  if (passed > params.total) RaiseWrongNumberOfArguments(member);
  for (size_t i = 0; i < params.required; ++i) {
    if (i >= passed || args[i].IsMissing()) RaiseArgumentNotOptional(member);
  }
  args.resize(params.total, vb::Variant::Missing());
  return passed;
}

void UnpadArguments(Args& args, size_t passed) {
  if (args.size() > passed) args.resize(passed);
}

std::string TextArg(const vb::Variant& arg) {
  return arg.IsMissing() ? std::string() : vb::CStr(arg);
}

int32_t LongArg(const vb::Variant& arg, int32_t omitted) {
  return arg.IsMissing() ? omitted : vb::CLng(arg);
}

bool BooleanArg(const vb::Variant& arg, bool omitted) {
  return arg.IsMissing() ? omitted : vb::CBool(arg);
}

vb::ObjectPtr ObjectArg(const vb::Variant& arg) {
  if (arg.IsMissing() || arg.IsEmpty()) return nullptr;
  return arg.AsObject();
}

void WriteBackText(vb::Variant& arg, const std::string& value) {
  if (arg.IsString()) arg = vb::Variant(value);
}

}  // namespace automation
