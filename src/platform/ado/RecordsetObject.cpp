#include "platform/ado/RecordsetObject.h"

#include <memory>
#include <string_view>

#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace ado {

namespace {

std::string Folded(std::string_view name) {
  std::string folded(name);
  for (char& c : folded)
    if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
  return folded;
}

[[noreturn]] void NotSupported(const std::string& name) {
  throw vb::Error(vb::kErrMemberNotSupported,
                  vb::DefaultDescription(vb::kErrMemberNotSupported) + " (" + name + ")");
}

[[noreturn]] void WrongArguments(const std::string& name) {
  throw vb::Error(450, "Wrong number of arguments or invalid property assignment (" + name + ")");
}

bool Given(const std::vector<vb::Variant>& args, size_t i) {
  return i < args.size() && !args[i].IsMissing();
}

void ExpectNoArguments(const std::string& name, const std::vector<vb::Variant>& args) {
  if (!args.empty()) WrongArguments(name);
}

// Fields by a name or a 0-based position, as Fields(x) takes either.
int32_t FieldIndex(const ado::Fields& fields, const vb::Variant& which) {
  if (which.IsString()) {
    int32_t index = fields.IndexOf(which.AsString());
    // Item raises the "not found in this collection" error with the name in it.
    if (index < 0) fields.Item(std::string_view(which.AsString()));
    return index;
  }
  int32_t index = vb::CLng(which);
  fields.Item(index);  // raises for a position out of range
  return index;
}

class FieldObject : public vb::Object {
 public:
  FieldObject(RecordsetPtr recordset, int32_t index)
      : recordset_(std::move(recordset)), index_(index) {}

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    ExpectNoArguments(name, args);
    return Get(name);
  }
  vb::Variant Get(const std::string& name) override {
    std::string member = Folded(name);
    // Value is a field's default member, reached with an empty name.
    if (member == "value" || member.empty()) return recordset_->Fields(index_).Value();
    if (member == "name") return vb::Variant(recordset_->Fields(index_).Name());
    NotSupported(name);
  }

 private:
  RecordsetPtr recordset_;
  int32_t index_;
};

class FieldsObject : public vb::Object {
 public:
  explicit FieldsObject(RecordsetPtr recordset) : recordset_(std::move(recordset)) {}

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override {
    std::string member = Folded(name);
    if (member == "count") {
      ExpectNoArguments(name, args);
      return vb::Variant(recordset_->Fields().Count());
    }
    // Item is the collection's default member: Fields("x") and Fields.Item("x").
    if (member == "item" || member.empty()) {
      if (args.size() != 1) WrongArguments(name);
      return vb::Variant(vb::ObjectPtr(std::make_shared<FieldObject>(
          recordset_, FieldIndex(recordset_->Fields(), args[0]))));
    }
    NotSupported(name);
  }
  vb::Variant Get(const std::string& name) override {
    std::vector<vb::Variant> none;
    return Invoke(name, none);
  }

 private:
  RecordsetPtr recordset_;
};

}  // namespace

RecordsetObject::RecordsetObject(RecordsetPtr recordset) : recordset_(std::move(recordset)) {
  if (!recordset_) throw vb::Error(vb::kErrObjectNotSet);
}

vb::Variant RecordsetObject::Wrap(RecordsetPtr recordset) {
  return vb::Variant(vb::ObjectPtr(std::make_shared<RecordsetObject>(std::move(recordset))));
}

RecordsetPtr RecordsetObject::From(const vb::Variant& value) {
  if (value.IsEmpty() || value.IsMissing()) return nullptr;
  if (!value.IsObject()) throw vb::Error(vb::kErrTypeMismatch);
  const vb::ObjectPtr& object = value.AsObject();
  if (!object) return nullptr;
  auto* wrapped = dynamic_cast<RecordsetObject*>(object.get());
  if (!wrapped) throw vb::Error(vb::kErrTypeMismatch);
  return wrapped->recordset_;
}

vb::Variant RecordsetObject::Invoke(const std::string& name, std::vector<vb::Variant>& args) {
  const std::string member = Folded(name);
  ado::Recordset& rs = *recordset_;
  if (member == "movefirst") { ExpectNoArguments(name, args); rs.MoveFirst(); return {}; }
  if (member == "movenext") { ExpectNoArguments(name, args); rs.MoveNext(); return {}; }
  if (member == "movelast") { ExpectNoArguments(name, args); rs.MoveLast(); return {}; }
  if (member == "moveprevious") { ExpectNoArguments(name, args); rs.MovePrevious(); return {}; }
  if (member == "close") { ExpectNoArguments(name, args); rs.Close(); return {}; }
  if (member == "eof") { ExpectNoArguments(name, args); return vb::Variant(rs.Eof()); }
  if (member == "bof") { ExpectNoArguments(name, args); return vb::Variant(rs.Bof()); }
  if (member == "recordcount") { ExpectNoArguments(name, args); return vb::Variant(rs.RecordCount()); }
  if (member == "absoluteposition") {
    ExpectNoArguments(name, args);
    return vb::Variant(rs.AbsolutePosition());
  }
  if (member == "state") {
    ExpectNoArguments(name, args);
    return vb::Variant(static_cast<int32_t>(rs.State()));
  }
  if (member == "find") {
    if (args.empty() || args.size() > 4 || args[0].IsMissing()) WrongArguments(name);
    int32_t skip = Given(args, 1) ? vb::CLng(args[1]) : 0;
    SearchDirectionEnum direction = adSearchForward;
    if (Given(args, 2)) direction = vb::CLng(args[2]) < 0 ? adSearchBackward : adSearchForward;
    // A bookmark to start from (the fourth argument) is not kept by this recordset.
    if (Given(args, 3)) NotSupported(name + " with a start bookmark");
    rs.Find(vb::CStr(args[0]), skip, direction);
    return {};
  }
  if (member == "fields") {
    if (args.empty()) return vb::Variant(vb::ObjectPtr(std::make_shared<FieldsObject>(recordset_)));
    if (args.size() != 1) WrongArguments(name);
    return vb::Variant(vb::ObjectPtr(
        std::make_shared<FieldObject>(recordset_, FieldIndex(rs.Fields(), args[0]))));
  }
  NotSupported(name);
}

vb::Variant RecordsetObject::Get(const std::string& name) {
  std::vector<vb::Variant> none;
  return Invoke(name, none);
}

}  // namespace ado
