#pragma once
// A Recordset as a late-bound object: what a host hands the component by reference
// (Registo's tRs) and what the component moves and reads by member name. Members:
//
//   MoveFirst, MoveNext, MoveLast, MovePrevious, Close
//   EOF, BOF, RecordCount, AbsolutePosition, State        (read-only properties)
//   Find(Criteria, [SkipRecords], [SearchDirection])
//   Fields                  the collection: Count, Item(name or 0-based index)
//   Fields(name or index)   one field: Name, Value
//
// A field object follows the cursor, as an ADO Field does: its Value is the value in
// whatever record is current when it is read.

#include <string>
#include <vector>

#include "platform/ado/Recordset.h"
#include "platform/vb/Object.h"
#include "platform/vb/Variant.h"

namespace ado {

class RecordsetObject : public vb::Object {
 public:
  // Raises 91 (object not set) for a null recordset: there is nothing to reach.
  explicit RecordsetObject(RecordsetPtr recordset);

  // The recordset wrapped as a Variant, ready to pass by reference.
  static vb::Variant Wrap(RecordsetPtr recordset);
  // The recordset inside a Variant that Wrap made. Nothing, Empty and an omitted
  // argument give null; any other value raises 13 (type mismatch).
  static RecordsetPtr From(const vb::Variant& value);

  const RecordsetPtr& Recordset() const { return recordset_; }

  vb::Variant Invoke(const std::string& name, std::vector<vb::Variant>& args) override;
  vb::Variant Get(const std::string& name) override;

 private:
  RecordsetPtr recordset_;
};

}  // namespace ado
