#include "platform/ado/Recordset.h"

#include "platform/ado/ConnectionString.h"
#include "platform/ado/FindCriteria.h"
#include "platform/vb/Error.h"

namespace ado {

namespace {

[[noreturn]] void NotFound() {
  throw vb::Error(kErrItemNotFound,
                  "Item cannot be found in the collection corresponding to the requested name "
                  "or ordinal.",
                  "ADODB.Fields");
}

}  // namespace

const std::string& Field::Name() const { return owner_->fields_.names_[static_cast<size_t>(index_)]; }

const vb::Variant& Field::Value() const { return owner_->Cell(index_); }

const Field& Fields::Item(int32_t index) const {
  if (index < 0 || index >= Count()) NotFound();
  return items_[static_cast<size_t>(index)];
}

int32_t Fields::IndexOf(std::string_view name) const {
  for (size_t i = 0; i < names_.size(); ++i)
    if (EqualsNoCase(names_[i], name)) return static_cast<int32_t>(i);
  return -1;
}

const Field& Fields::Item(std::string_view name) const {
  int32_t i = IndexOf(name);
  if (i < 0) NotFound();
  return items_[static_cast<size_t>(i)];
}

void Recordset::Open(std::string_view source, const ConnectionPtr& activeConnection,
                     CursorTypeEnum cursorType, LockTypeEnum lockType, long options) {
  if (open_)
    throw vb::Error(kErrObjectOpen, "Operation is not allowed when the object is open.",
                    "ADODB.Recordset");
  if (!activeConnection) throw vb::Error(kErrConnectionClosed, kConnectionClosedText, "ADODB.Recordset");
  auto keepAlive = weak_from_this().lock();
  ResultTable rows = activeConnection->Run(std::string(source), this, cursorType, lockType, options);
  // A statement that returns no rows leaves the recordset closed, as ADO does.
  if (rows.returnsRows) Attach(std::move(rows));
}

void Recordset::Attach(ResultTable rows) {
  table_ = std::move(rows);
  fields_.items_.clear();
  fields_.names_ = table_.columns;
  for (size_t i = 0; i < table_.columns.size(); ++i) fields_.items_.emplace_back(this, static_cast<int>(i));
  open_ = true;
  position_ = 0;
}

void Recordset::Close() {
  RequireOpen();
  open_ = false;
  table_ = ResultTable{};
  fields_ = ado::Fields{};
}

void Recordset::RequireOpen() const {
  if (!open_)
    throw vb::Error(kErrObjectClosed, "Operation is not allowed when the object is closed.",
                    "ADODB.Recordset");
}

void Recordset::RequireRecord() const {
  RequireOpen();
  if (position_ < 0 || position_ >= static_cast<int64_t>(table_.RowCount()))
    throw vb::Error(kErrNoCurrentRecord,
                    "Either BOF or EOF is True, or the current record has been deleted. "
                    "Requested operation requires a current record.",
                    "ADODB.Recordset");
}

const vb::Variant& Recordset::Cell(int index) const {
  RequireRecord();
  return table_.cells[static_cast<size_t>(position_) * table_.columns.size() + static_cast<size_t>(index)];
}

bool Recordset::Eof() const {
  RequireOpen();
  return position_ >= static_cast<int64_t>(table_.RowCount());
}

bool Recordset::Bof() const {
  RequireOpen();
  return position_ < 0 || table_.RowCount() == 0;
}

void Recordset::MoveFirst() {
  RequireOpen();
  position_ = 0;
}

void Recordset::MoveLast() {
  RequireOpen();
  position_ = static_cast<int64_t>(table_.RowCount()) - 1;
  if (position_ < 0) position_ = 0;
}

void Recordset::MoveNext() {
  RequireOpen();
  if (Eof()) RequireRecord();  // moving past EOF is an error
  ++position_;
}

void Recordset::MovePrevious() {
  RequireOpen();
  if (position_ < 0) RequireRecord();
  --position_;
}

int32_t Recordset::RecordCount() const {
  RequireOpen();
  return static_cast<int32_t>(table_.RowCount());
}

int32_t Recordset::AbsolutePosition() const {
  RequireRecord();
  return static_cast<int32_t>(position_ + 1);
}

ado::Fields& Recordset::Fields() {
  RequireOpen();
  return fields_;
}

void Recordset::Find(std::string_view criteria, int32_t skipRecords, SearchDirectionEnum direction) {
  RequireRecord();
  FindCriteria criterion = FindCriteria::Parse(criteria);
  int32_t column = fields_.IndexOf(criterion.field);
  if (column < 0) NotFound();
  int64_t rows = static_cast<int64_t>(table_.RowCount());
  int64_t step = direction == adSearchBackward ? -1 : 1;
  for (int64_t row = position_ + step * skipRecords; row >= 0 && row < rows; row += step) {
    const vb::Variant& v = table_.cells[static_cast<size_t>(row) * table_.columns.size() + static_cast<size_t>(column)];
    if (criterion.Matches(v)) {
      position_ = row;
      return;
    }
  }
  position_ = direction == adSearchBackward ? -1 : rows;
}

}  // namespace ado
