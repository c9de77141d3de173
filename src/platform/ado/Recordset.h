#pragma once
// An ADO Recordset, static: Open reads every row at once, then the cursor moves over
// the copy. Fields are found by position or by name ignoring case.
//
//   position:  BOF (before the first row) | a row | EOF (after the last row)
//   An empty recordset is at BOF and EOF together.
//
// EOF is a macro of the C library, so the flags are spelt Eof() and Bof().

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "platform/ado/Connection.h"
#include "platform/ado/Engine.h"
#include "platform/vb/Variant.h"

namespace ado {

enum SearchDirectionEnum { adSearchForward = 1, adSearchBackward = -1 };

class Field {
 public:
  Field(const class Recordset* owner, int index) : owner_(owner), index_(index) {}
  const std::string& Name() const;
  // The value in the current record; raises 3021 when there is none.
  const vb::Variant& Value() const;

 private:
  const class Recordset* owner_;
  int index_;
};

class Fields {
 public:
  int32_t Count() const { return static_cast<int32_t>(items_.size()); }
  // By position (0-based) or by name ignoring case; raises 3265 when there is no such
  // field.
  const Field& Item(int32_t index) const;
  const Field& Item(std::string_view name) const;
  // -1 when there is no such field.
  int32_t IndexOf(std::string_view name) const;

 private:
  friend class Recordset;
  friend class Field;
  std::vector<Field> items_;
  std::vector<std::string> names_;
};

class Recordset : public std::enable_shared_from_this<Recordset> {
 public:
  static RecordsetPtr Create() { return std::make_shared<Recordset>(); }

  void Open(std::string_view source, const ConnectionPtr& activeConnection,
            CursorTypeEnum cursorType = adOpenUnspecified,
            LockTypeEnum lockType = adLockUnspecified, long options = adOptionUnspecified);
  void Close();
  ObjectStateEnum State() const { return open_ ? adStateOpen : adStateClosed; }

  bool Eof() const;
  bool Bof() const;
  void MoveFirst();
  void MoveLast();
  void MoveNext();
  void MovePrevious();
  int32_t RecordCount() const;
  // 1-based position of the current record.
  int32_t AbsolutePosition() const;

  // Moves to the first record from the current one on (after skipping skipRecords)
  // that meets a criterion such as "dorvanto_id=12", "descrit LIKE 'Caixa*'" or
  // "data >= #2009-12-31#"; to EOF (or BOF backwards) when none does.
  void Find(std::string_view criteria, int32_t skipRecords = 0,
            SearchDirectionEnum direction = adSearchForward);

  ado::Fields& Fields();
  const Field& Fields(int32_t index) { return Fields().Item(index); }
  const Field& Fields(std::string_view name) { return Fields().Item(name); }
  const Field& Fields(const char* name) { return Fields().Item(std::string_view(name)); }

  // Takes the rows of a statement (used by Connection::Execute).
  void Attach(ResultTable rows);

 private:
  friend class Field;
  void RequireOpen() const;
  void RequireRecord() const;
  const vb::Variant& Cell(int index) const;

  bool open_ = false;
  ResultTable table_;
  int64_t position_ = 0;  // -1 BOF, RowCount() EOF
  ado::Fields fields_;
};

}  // namespace ado
