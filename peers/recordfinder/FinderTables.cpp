#include "FinderTables.h"

#include <cctype>
#include <charconv>

#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace recordfinder {

namespace {

constexpr const char* kSubContas = "POC_SUBCONTAS";
// The columns a filter may compare: the view's whole-number keys.
constexpr const char* kFilterColumns[] = {"sub_conta_id", "conta_id"};

std::string Lower(std::string_view text) {
  std::string out(text);
  for (char& c : out) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  return out;
}

[[noreturn]] void Refuse(const std::string& what) {
  throw vb::Error(vb::kErrInvalidProcedureCall, what, "RecordFinder.General");
}

// Words of a filter: names, whole numbers (with their sign) and "=".
std::vector<std::string> Words(const std::string& filter) {
  std::vector<std::string> words;
  size_t at = 0;
  while (at < filter.size()) {
    unsigned char c = static_cast<unsigned char>(filter[at]);
    if (std::isspace(c)) {
      ++at;
    } else if (c == '=') {
      words.emplace_back("=");
      ++at;
    } else if (std::isalnum(c) || c == '_' || c == '-') {
      size_t end = at + 1;
      while (end < filter.size() &&
             (std::isalnum(static_cast<unsigned char>(filter[end])) || filter[end] == '_'))
        ++end;
      words.push_back(filter.substr(at, end - at));
      at = end;
    } else {
      Refuse("RecordFinder: filtro não suportado: " + filter);
    }
  }
  return words;
}

bool IsFilterColumn(const std::string& word) {
  for (const char* column : kFilterColumns)
    if (Lower(word) == column) return true;
  return false;
}

bool IsWholeNumber(const std::string& word) {
  int32_t value = 0;
  auto [end, error] = std::from_chars(word.data(), word.data() + word.size(), value);
  return error == std::errc() && end == word.data() + word.size();
}

std::string Text(const vb::Variant& value) { return value.IsNull() ? std::string() : vb::CStr(value); }

// Folds letter case the way a Portuguese name needs: ASCII and the accented capitals
// of Latin-1 (À to Þ, in UTF-8 two bytes after 0xC3).
std::string FoldCase(std::string_view text) {
  std::string out(text);
  for (size_t i = 0; i < out.size(); ++i) {
    unsigned char c = static_cast<unsigned char>(out[i]);
    if (c >= 'A' && c <= 'Z') {
      out[i] = static_cast<char>(c + 32);
    } else if (c == 0xC3 && i + 1 < out.size()) {
      unsigned char next = static_cast<unsigned char>(out[i + 1]);
      if (next >= 0x80 && next <= 0x9E && next != 0x97) out[i + 1] = static_cast<char>(next + 0x20);
      ++i;
    }
  }
  return out;
}

}  // namespace

std::string FilterCondition(const std::string& filter) {
  const std::vector<std::string> words = Words(filter);
  std::string condition;
  size_t at = 0;
  while (at < words.size()) {
    if (at + 3 > words.size() || !IsFilterColumn(words[at]) || words[at + 1] != "=" ||
        !IsWholeNumber(words[at + 2]))
      Refuse("RecordFinder: filtro não suportado: " + filter);
    if (!condition.empty()) condition += " AND ";
    condition += Lower(words[at]) + " = " + words[at + 2];
    at += 3;
    if (at < words.size()) {
      if (Lower(words[at]) != "and" || at + 1 == words.size())
        Refuse("RecordFinder: filtro não suportado: " + filter);
      ++at;
    }
  }
  return condition;
}

FinderTable LoadFinderTable(const ado::ConnectionPtr& connection, const std::string& tableKey,
                            const std::string& filter) {
  if (Lower(tableKey) != Lower(kSubContas)) Refuse("RecordFinder: tabela desconhecida: " + tableKey);
  const std::string condition = FilterCondition(filter);
  std::string sql =
      "SELECT sub_conta_id, codigo_completo, descrit, conta_descrit FROM vwPOC_SubContas";
  if (!condition.empty()) sql += " WHERE " + condition;
  sql += " ORDER BY codigo_completo";

  FinderTable table{.title = "Sub-contas", .rows = {}};
  ado::RecordsetPtr rs = ado::Recordset::Create();
  rs->Open(sql, connection);
  for (; !rs->Eof(); rs->MoveNext()) {
    table.rows.push_back({.key = vb::CLng(rs->Fields("sub_conta_id").Value()),
                          .code = Text(rs->Fields("codigo_completo").Value()),
                          .name = Text(rs->Fields("descrit").Value()),
                          .account = Text(rs->Fields("conta_descrit").Value())});
  }
  rs->Close();
  return table;
}

bool RowMatches(const FinderRow& row, const std::string& typed) {
  const std::string text = FoldCase(vb::Trim(typed));
  if (text.empty()) return true;
  if (FoldCase(row.code).rfind(text, 0) == 0) return true;
  return FoldCase(row.name).find(text) != std::string::npos;
}

}  // namespace recordfinder
