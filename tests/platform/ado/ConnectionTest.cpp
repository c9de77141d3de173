// Connection and Recordset behaviour: events, closed-connection errors, logins, the
// Errors collection, transactions, navigation and Find.

#include <cctype>
#include <string>
#include <vector>

#include "AdoFixture.h"
#include "platform/ado/ConnectionString.h"
#include "platform/ado/Errors.h"
#include "platform/vb/Error.h"

namespace ado::testing {
namespace {

int32_t ErrorNumberOf(const std::function<void()>& action) {
  try {
    action();
  } catch (const vb::Error& e) {
    return e.Number();
  }
  return 0;
}

using ConnectionBehaviour = DemoDatabase;

TEST_F(ConnectionBehaviour, events_wrap_every_statement_including_recordset_opens) {
  std::vector<std::string> log;
  conn_->WillExecute = [&](WillExecuteEvent& e) {
    log.push_back("will:" + e.Source + (e.pRecordset ? ":rs" : ""));
    EXPECT_EQ(e.pConnection, conn_.get());
  };
  conn_->ExecuteComplete = [&](ExecuteCompleteEvent& e) {
    log.push_back(std::string("done:") + (e.pError ? std::to_string(e.pError->Number()) : "ok"));
  };
  conn_->Execute("UPDATE tbFechos SET anulado = 0 WHERE fecho_id = 0");
  Query("SELECT * FROM tbFechos");
  EXPECT_THROW(conn_->Execute("SELECT nonsense FROM tbFechos"), vb::Error);
  std::vector<std::string> expected = {
      "will:UPDATE tbFechos SET anulado = 0 WHERE fecho_id = 0", "done:ok",
      "will:SELECT * FROM tbFechos:rs", "done:ok",
      "will:SELECT nonsense FROM tbFechos",
      "done:" + std::to_string(kErrCommandFailed)};
  EXPECT_EQ(log, expected);
}

TEST_F(ConnectionBehaviour, reconnect_probe_inside_will_execute_runs_and_may_reopen) {
  // What the data environment does: probe with @@TRANCOUNT, guarded by a flag, and
  // re-open a connection found closed before the statement runs.
  bool probing = false;
  int probes = 0;
  std::string cs = ConnectionString(kUser, kPassword);
  conn_->WillExecute = [&](WillExecuteEvent&) {
    if (probing) return;
    probing = true;
    try {
      conn_->Execute("SELECT @@TRANCOUNT as flTrans");
      ++probes;
    } catch (const vb::Error& e) {
      EXPECT_EQ(e.Number(), vb::kErrConnectionClosed);
      conn_->Open(cs);
    }
    probing = false;
  };
  conn_->BeginTrans();
  EXPECT_EQ(Scalar("SELECT @@TRANCOUNT as valor"), vb::Variant(int32_t{1}));  // the probe starts nothing
  conn_->CommitTrans();
  conn_->Close();
  EXPECT_EQ(conn_->State(), adStateClosed);
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbFechos"), vb::Variant(int32_t{2}));
  EXPECT_EQ(conn_->State(), adStateOpen);
  EXPECT_EQ(probes, 1);  // the second probe found the connection closed
}

TEST_F(ConnectionBehaviour, closed_connection_raises_3709_and_cancel_raises_3712) {
  conn_->Close();
  EXPECT_EQ(ErrorNumberOf([&] { conn_->Execute("SELECT 1"); }), 3709);
  EXPECT_EQ(ErrorNumberOf([&] { Query("SELECT 1"); }), 3709);
  EXPECT_EQ(ErrorNumberOf([&] { conn_->BeginTrans(); }), 3709);
  EXPECT_EQ(conn_->Errors().Count(), 0);  // not a provider error
  try {
    conn_->Execute("SELECT 1");
  } catch (const vb::Error& e) {
    EXPECT_EQ(e.Description(),
              "The connection cannot be used to perform this operation. It is either closed or "
              "invalid in this context.");
  }
  conn_->Open();
  conn_->WillExecute = [](WillExecuteEvent& e) { e.adStatus = adStatusCancel; };
  EXPECT_EQ(ErrorNumberOf([&] { conn_->Execute("DELETE FROM tbFechos"); }), 3712);
  conn_->WillExecute = nullptr;
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbFechos"), vb::Variant(int32_t{2}));
}

TEST_F(ConnectionBehaviour, logins_are_checked_at_open) {
  auto other = Connection::Create();
  try {
    other->Open(ConnectionString(kUser, "wrong"));
    FAIL() << "a wrong password opened the database";
  } catch (const vb::Error& e) {
    EXPECT_EQ(e.Number(), kErrLoginFailed);
    EXPECT_EQ(e.Description(), "Login failed for user 'contabilista'.");
  }
  EXPECT_EQ(other->State(), adStateClosed);
  EXPECT_EQ(other->Errors().Count(), 1);
  EXPECT_EQ(ErrorNumberOf([&] { other->Open(ConnectionString("ninguem", kPassword)); }),
            kErrLoginFailed);
  // Login names ignore case; the password (with its ";") is taken whole from the quoted value.
  other->Open(ConnectionString("CONTABILISTA", kPassword));
  EXPECT_EQ(other->State(), adStateOpen);
  other->Close();
  // User and password given to Open take the place of those in the string.
  other->Open(ConnectionString("", ""), kUser, kPassword);
  EXPECT_EQ(other->State(), adStateOpen);

  auto missing = Connection::Create();
  EXPECT_EQ(ErrorNumberOf([&] { missing->Open(EmbeddedConnectionString((dir_ / "none.db").string(), kUser, kPassword)); }),
            kErrProviderFailed);
  EXPECT_EQ(ErrorNumberOf([&] { missing->Open("Provider=SQLOLEDB.1;Data Source=SERVIDOR01;User ID=sa"); }),
            kErrProviderFailed);
}

// As ADO does: once open, the property no longer shows the password unless the string
// asks to persist it; the connection still opens again with it.
TEST_F(ConnectionBehaviour, the_password_is_not_shown_after_open_unless_persisted) {
  EXPECT_EQ(conn_->ConnectionString().find("s3gr3d0"), std::string::npos) << conn_->ConnectionString();
  EXPECT_NE(conn_->ConnectionString().find("User ID=contabilista"), std::string::npos);
  conn_->Close();
  conn_->Open();
  EXPECT_EQ(conn_->State(), adStateOpen);
  conn_->Close();

  ConnectionStringParts parts = ConnectionStringParts::Parse(ConnectionString(kUser, kPassword));
  parts.Set("Persist Security Info", "True");
  conn_->Open(parts.ToString());
  EXPECT_NE(conn_->ConnectionString().find("s3gr3d0"), std::string::npos);
  conn_->Close();
  // A new string is shown as given until it opens.
  conn_->SetConnectionString(ConnectionString(kUser, kPassword));
  EXPECT_NE(conn_->ConnectionString().find("s3gr3d0"), std::string::npos);
}

TEST_F(ConnectionBehaviour, errors_collection_keeps_the_last_failure_until_cleared) {
  EXPECT_EQ(conn_->Errors().Count(), 0);
  EXPECT_EQ(ErrorNumberOf([&] { conn_->Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES (null, 1)"); }),
            kErrCommandFailed);
  ASSERT_EQ(conn_->Errors().Count(), 1);
  std::string description = conn_->Errors().Item(0).Description;
  for (char& c : description) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  EXPECT_NE(description.find("null"), std::string::npos) << description;
  EXPECT_EQ(conn_->Errors().Item(0).SQLState, "23000");
  conn_->Execute("SELECT 1 AS x");
  EXPECT_EQ(conn_->Errors().Count(), 1);
  conn_->Errors().Clear();
  EXPECT_EQ(conn_->Errors().Count(), 0);
}

TEST_F(ConnectionBehaviour, transactions_commit_roll_back_and_never_nest) {
  conn_->BeginTrans();
  EXPECT_EQ(ErrorNumberOf([&] { conn_->BeginTrans(); }), kErrNoNestedTransactions);
  conn_->Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('reg_no', 2)");
  conn_->RollbackTrans();
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbPOC_Contadores"), vb::Variant(int32_t{0}));
  EXPECT_EQ(ErrorNumberOf([&] { conn_->CommitTrans(); }), kErrNoTransaction);
  EXPECT_EQ(ErrorNumberOf([&] { conn_->RollbackTrans(); }), kErrNoTransaction);

  conn_->BeginTrans();
  conn_->Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('reg_no', 2)");
  // A second counter row of the same name is refused, not silently duplicated.
  EXPECT_EQ(ErrorNumberOf([&] { conn_->Execute("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('REG_NO', 5)"); }),
            kErrCommandFailed);
  conn_->CommitTrans();
  EXPECT_EQ(Scalar("SELECT contador FROM tbPOC_Contadores WHERE nome = 'reg_no'"), vb::Variant(int32_t{2}));

  // Closing with a transaction open rolls it back.
  conn_->BeginTrans();
  conn_->Execute("DELETE FROM tbPOC_Contadores");
  conn_->Close();
  conn_->Open();
  EXPECT_EQ(Scalar("SELECT COUNT(*) AS n FROM tbPOC_Contadores"), vb::Variant(int32_t{1}));
}

TEST_F(ConnectionBehaviour, recordset_navigation_and_field_access) {
  auto rs = Query("SELECT * FROM tbPOC_Diario_Tipos ORDER BY tipo_diario_id");
  EXPECT_EQ(rs->State(), adStateOpen);
  EXPECT_FALSE(rs->Bof());
  EXPECT_EQ(rs->Fields().Count(), 2);
  EXPECT_EQ(rs->Fields(1).Name(), "descrit");
  EXPECT_EQ(rs->Fields("TIPO_DIARIO_ID").Value(), vb::Variant(int32_t{1}));
  EXPECT_EQ(ErrorNumberOf([&] { rs->Fields("nao_existe"); }), kErrItemNotFound);
  int rows = 0;
  for (; !rs->Eof(); rs->MoveNext()) ++rows;
  EXPECT_EQ(rows, rs->RecordCount());
  EXPECT_EQ(ErrorNumberOf([&] { rs->Fields(0).Value(); }), kErrNoCurrentRecord);
  EXPECT_EQ(ErrorNumberOf([&] { rs->MoveNext(); }), kErrNoCurrentRecord);
  rs->MoveLast();
  EXPECT_EQ(rs->Fields("descrit").Value(), vb::Variant("Abertura e encerramento"));
  rs->Close();
  EXPECT_EQ(rs->State(), adStateClosed);
  EXPECT_EQ(ErrorNumberOf([&] { rs->Eof(); }), kErrObjectClosed);

  auto empty = Query("SELECT * FROM tbPOC_Diario_Tipos WHERE tipo_diario_id = 0");
  EXPECT_TRUE(empty->Eof());
  EXPECT_TRUE(empty->Bof());
  // A statement without rows gives a closed recordset.
  EXPECT_EQ(conn_->Execute("UPDATE tbFechos SET anulado = 0 WHERE 1 = 0")->State(), adStateClosed);
  int64_t affected = 0;
  conn_->Execute("UPDATE tbFechos SET anulado = anulado", &affected);
  EXPECT_EQ(affected, 2);
}

TEST_F(ConnectionBehaviour, find_searches_forward_from_the_current_record) {
  auto rs = Query("SELECT * FROM tbPOC_Dorvantos_Codigos ORDER BY codigo");
  rs->Find("descrit_id=5");
  ASSERT_FALSE(rs->Eof());
  EXPECT_EQ(rs->Fields("descrit_id").Value(), vb::Variant(int32_t{5}));
  rs->Find("descrit_id = 5");  // the current record counts
  EXPECT_EQ(rs->Fields("descrit_id").Value(), vb::Variant(int32_t{5}));
  rs->Find("descrit_id = 5", 1);  // skipping it, there is no other
  EXPECT_TRUE(rs->Eof());
  rs->MoveFirst();
  rs->Find("codigo = 'ncf'");
  EXPECT_EQ(rs->Fields("descrit").Value(), vb::Variant("Nota de crédito de fornecedor"));
  rs->MoveFirst();
  rs->Find("descrit LIKE 'PAGAMENTO*'");
  EXPECT_EQ(rs->Fields("codigo").Value(), vb::Variant("AGU"));
  rs->MoveFirst();
  rs->Find("descrit = 'Nota de credito de fornecedor'");  // accents count
  EXPECT_TRUE(rs->Eof());
  rs->MoveFirst();
  EXPECT_EQ(ErrorNumberOf([&] { rs->Find("codigo"); }), kErrInvalidArgument);

  auto closings = Query("SELECT * FROM tbFechos ORDER BY data");
  closings->Find("data > #2010-01-01#");
  EXPECT_EQ(closings->Fields("anulado").Value(), vb::Variant(int32_t{1}));
}

}  // namespace
}  // namespace ado::testing
