// Arbitrary text through the SQL literal rules and the embedded engine: whatever a
// person types, exactly one statement runs and the text comes back as it was typed
// (without the blanks around it, which literals trim).

#include <stdlib.h>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <string>

#include "common/modCode.h"
#include "platform/ado/Connection.h"
#include "platform/ado/Database.h"
#include "platform/ado/Recordset.h"
#include "platform/vb/Conversions.h"

namespace {

bool ValidUtf8WithoutNul(const std::string& s) {
  for (size_t i = 0; i < s.size();) {
    const unsigned char c = static_cast<unsigned char>(s[i]);
    size_t len = c < 0x80 ? 1 : (c >> 5) == 6 ? 2 : (c >> 4) == 14 ? 3 : (c >> 3) == 30 ? 4 : 0;
    if (c == 0 || len == 0 || i + len > s.size()) return false;
    uint32_t cp = len == 1 ? c : c & (0x7F >> len);
    for (size_t k = 1; k < len; ++k) {
      const unsigned char cc = static_cast<unsigned char>(s[i + k]);
      if ((cc & 0xC0) != 0x80) return false;
      cp = (cp << 6) | (cc & 0x3F);
    }
    const uint32_t min = len == 2 ? 0x80 : len == 3 ? 0x800 : len == 4 ? 0x10000 : 0;
    if (cp < min || cp > 0x10FFFF || (cp >= 0xD800 && cp <= 0xDFFF)) return false;
    i += len;
  }
  return true;
}

struct Fixture {
  ado::ConnectionPtr conn;
  int statements = 0;

  Fixture() {
    char dir[] = "/tmp/dv-fuzz-XXXXXX";
    if (!mkdtemp(dir)) abort();
    const std::string path = std::string(dir) + "/fuzz.db";
    ado::CreateOptions options;
    options.demoData = false;
    options.passwordIterations = 1000;
    ado::CreateDatabase(path, {{"fuzz", "fuzz"}}, options);
    conn = ado::Connection::Create();
    conn->Open(ado::EmbeddedConnectionString(path, "fuzz", "fuzz"));
    conn->WillExecute = [this](ado::WillExecuteEvent&) { ++statements; };
  }
};

[[noreturn]] void Fail(const char* what, const std::string& input) {
  std::fprintf(stderr, "%s for input of %zu bytes\n", what, input.size());
  abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static Fixture fixture;
  const std::string text(reinterpret_cast<const char*>(data), size);
  if (!ValidUtf8WithoutNul(text)) return 0;  // a keyboard cannot type these

  const std::string literal = common::SqlValue(vb::Variant(text), common::kSqlText);
  fixture.statements = 0;
  fixture.conn->Execute(
      "INSERT INTO tbPOC_Dorvantos (data, dorvanto_no, tipo_diario_id, created_by, obs, valor, "
      "finalizado) VALUES (GETDATE(), null, null, 'fuzz', " + literal + ", 0, 0)");
  if (fixture.statements != 1) Fail("more than one statement ran", text);

  auto rs = fixture.conn->Execute(
      "SELECT obs FROM tbPOC_Dorvantos WHERE dorvanto_id = (SELECT MAX(dorvanto_id) FROM "
      "tbPOC_Dorvantos)");
  const vb::Variant stored = rs->Fields("obs").Value();
  const std::string expected = vb::Trim(text);
  if (expected.empty() ? !stored.IsNull() : (!stored.IsString() || stored.AsString() != expected))
    Fail("the text did not come back unchanged", text);

  // The same text as a search pattern must run as one query and never fail.
  fixture.statements = 0;
  fixture.conn->Execute("SELECT * FROM tbPOC_Dorvantos WHERE obs like " +
                        common::SqlValue(vb::Variant(text), common::kSqlLikePattern));
  if (fixture.statements != 1) Fail("the search ran more than one statement", text);
  return 0;
}
