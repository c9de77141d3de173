// Finalizing and reopening: refusals, numbering from the shared counters, frozen
// account texts, the roll-back of a failure half-way, and numbering by two processes
// finalizing at the same moment.

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <set>

#include "frmMain_fixture.h"
#include "common/modFechos.h"
#include "platform/ado/Connection.h"

namespace entry::testing {
namespace {

using vb::Variant;

class FinalizeTest : public HeaderEditorTest {
 protected:
  // An open entry of 10-05-2024 09:15 in the journal "Vendas", made by the logged user.
  int32_t Entry(const std::string& columns = "", const std::string& values = "") {
    return AddEntry(", tipo_diario_id" + columns, ", " + std::to_string(Journal("Vendas")) + values);
  }
  // A line on the sub-account of that full code.
  int32_t Line(int32_t entry, const std::string& debito, const std::string& credito,
               const char* code = "11001") {
    const std::string sub = std::to_string(SubAccount(code));
    const std::string account =
        std::to_string(vb::CLng(Scalar("SELECT conta_id FROM vwPOC_SubContas WHERE sub_conta_id = " + sub)));
    return AddLine(entry, debito, credito, ", conta_id, sub_conta_id", ", " + account + ", " + sub);
  }
  int32_t SubAccount(const char* code) {
    return vb::CLng(Scalar(std::string("SELECT sub_conta_id FROM vwPOC_SubContas WHERE codigo_completo = '") +
                           code + "'"));
  }
  Variant LineColumn(int32_t line, const char* column) {
    return Scalar(std::string("SELECT ") + column + " FROM tbPOC_Dorvantos_Details WHERE diario_id = " +
                  std::to_string(line));
  }
  Variant EntryColumn(int32_t entry, const char* column) {
    return Scalar(std::string("SELECT ") + column + " FROM tbPOC_Dorvantos WHERE dorvanto_id = " +
                  std::to_string(entry));
  }
  Variant Counter(const char* name) {
    return Scalar(std::string("SELECT contador FROM tbPOC_Contadores WHERE nome = '") + name + "'");
  }
  void SetCounter(const char* name, int value) {
    Execute(std::string("INSERT INTO tbPOC_Contadores (nome, contador) VALUES ('") + name + "', " +
            std::to_string(value) + ")");
  }
  forms::ToolbarButton& FinalizeButton() { return Button(form->Toolbar1, "finalizar"); }
  std::string LastMessage() { return desktop->messages.empty() ? "" : desktop->messages.back().text; }
};

vb::Date Day(int y, int m, int d, int h = 0, int n = 0) { return *vb::DateSerial(y, m, d, h, n); }

constexpr const char* kUnbalanced =
    "Não é possível finalizar este lançamento porque o total de débitos é diferente do total de créditos.";
constexpr const char* kNoLines = "Não é possível finalizar este lançamento porque não existem registos.";

TEST_F(FinalizeTest, FirstFinalizationCreatesTheCountersNumbersTheLinesAndFreezesTheirTexts) {
  const int32_t id = Entry();
  const int32_t a = Line(id, "100", "0", "11001");
  const int32_t b = Line(id, "0", "60", "12002");
  const int32_t c = Line(id, "0", "40", "12002");
  Open(id);

  EXPECT_TRUE(form->DoFinalizar());
  EXPECT_TRUE(desktop->messages.empty()) << LastMessage();

  // The line that creates 'reg_no' takes 1; the row keeps the next number to hand out.
  EXPECT_EQ(vb::CLng(LineColumn(a, "reg_no")), 1);
  EXPECT_EQ(vb::CLng(LineColumn(b, "reg_no")), 2);
  EXPECT_EQ(vb::CLng(LineColumn(c, "reg_no")), 3);
  EXPECT_EQ(vb::CLng(Counter("reg_no")), 4);
  const int year = vb::Year(common::GetServerDate());
  EXPECT_EQ(vb::CLng(Counter("ano")), year);
  for (int32_t line : {a, b, c}) EXPECT_EQ(vb::CLng(LineColumn(line, "ano")), year);

  EXPECT_EQ(vb::CStr(LineColumn(a, "codigo_completo")), "11001");
  EXPECT_EQ(vb::CStr(LineColumn(a, "conta")), "11");
  EXPECT_EQ(vb::CStr(LineColumn(a, "sub_conta")), "001");
  EXPECT_EQ(vb::CStr(LineColumn(a, "sub_conta_descrit")), "Caixa - Sede (Lisboa)");
  EXPECT_EQ(vb::CStr(LineColumn(b, "sub_conta_descrit")), "Millennium bcp - c/ 0033 4567");
  EXPECT_FALSE(LineColumn(b, "conta_descrit").IsNull());

  // An open entry's date goes in as the day, on the header and on every line.
  EXPECT_EQ(vb::CLng(EntryColumn(id, "finalizado")), 1);
  EXPECT_EQ(vb::CDbl(EntryColumn(id, "valor")), 100);
  EXPECT_EQ(vb::CDate(EntryColumn(id, "data")), Day(2024, 5, 10));
  EXPECT_EQ(vb::CDate(LineColumn(c, "data")), Day(2024, 5, 10));

  // The window follows: numbers listed, final look, nothing unsaved, button usable.
  EXPECT_TRUE(form->Final());
  EXPECT_EQ(form->ListView1.ListItems()(Key(a)).Text(), "1");
  EXPECT_EQ(form->ListView1.ListItems()(Key(c)).Text(), "3");
  EXPECT_EQ(FinalizeButton().Caption(), kReabrirCaption);
  EXPECT_TRUE(FinalizeButton().Enabled());
  EXPECT_FALSE(form->FXData.Enabled());
  EXPECT_FALSE(form->SaveMark());
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(FinalizeTest, NumbersContinueFromTheCounterAndLinesTakeTheCountersYear) {
  SetCounter("reg_no", 57);
  SetCounter("ano", 2009);
  const int32_t id = Entry();
  const int32_t a = Line(id, "10", "0");
  const int32_t b = Line(id, "0", "4");
  const int32_t c = Line(id, "0", "6");
  Open(id);
  ASSERT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CLng(LineColumn(a, "reg_no")), 57);
  EXPECT_EQ(vb::CLng(LineColumn(b, "reg_no")), 58);
  EXPECT_EQ(vb::CLng(LineColumn(c, "reg_no")), 59);
  EXPECT_EQ(vb::CLng(Counter("reg_no")), 60);
  EXPECT_EQ(vb::CLng(Counter("ano")), 2009);
  EXPECT_EQ(vb::CLng(LineColumn(b, "ano")), 2009);
}

TEST_F(FinalizeTest, BalanceIsJudgedOnTheTotalsAsShown) {
  // Within a cent and showing the same: balanced.
  const int32_t close = Entry();
  Line(close, "100.004", "0");
  Line(close, "0", "100.001");
  Open(close);
  EXPECT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CLng(EntryColumn(close, "finalizado")), 1);
  EXPECT_DOUBLE_EQ(vb::CDbl(EntryColumn(close, "valor")), 100.001);

  // All zero: balanced too.
  const int32_t zero = Entry();
  const int32_t line = Line(zero, "0", "0");
  form->DoOpen(zero);
  EXPECT_TRUE(form->DoFinalizar());
  EXPECT_FALSE(LineColumn(line, "reg_no").IsNull());

  // A cent apart: refused, nothing numbered, and the button is back for another try.
  const int32_t off = Entry();
  const int32_t debit = Line(off, "100.00", "0");
  Line(off, "0", "100.01");
  form->DoOpen(off);
  desktop->messages.clear();
  EXPECT_FALSE(form->DoFinalizar());
  ASSERT_EQ(desktop->messages.size(), 1u);
  EXPECT_EQ(desktop->messages[0].text, kUnbalanced);
  EXPECT_EQ(desktop->messages[0].Icon(), forms::MsgIcon::Information);
  EXPECT_EQ(desktop->messages[0].title, form->Caption());
  EXPECT_TRUE(LineColumn(debit, "reg_no").IsNull());
  EXPECT_EQ(vb::CLng(EntryColumn(off, "finalizado")), 0);
  EXPECT_FALSE(form->Final());
  EXPECT_TRUE(FinalizeButton().Enabled());
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(FinalizeTest, AnEntryWithoutJournalOrWithoutLinesIsRefused) {
  const int32_t noJournal = AddEntry();
  Line(noJournal, "5", "5");
  Open(noJournal);
  EXPECT_FALSE(form->DoFinalizar());
  EXPECT_EQ(LastMessage(), "Tem de indicar o Diário para poder finalizar o lançamento.");
  EXPECT_EQ(desktop->messages.back().Icon(), forms::MsgIcon::Information);
  EXPECT_EQ(form->ActiveControl(), &form->FXTipo_Diario_ID);
  EXPECT_TRUE(FinalizeButton().Enabled());

  const int32_t empty = Entry();
  form->DoOpen(empty);
  EXPECT_FALSE(form->DoFinalizar());
  EXPECT_EQ(LastMessage(), kNoLines);
  EXPECT_EQ(vb::CLng(EntryColumn(empty, "finalizado")), 0);
  EXPECT_TRUE(Counter("reg_no").IsNull());
  EXPECT_TRUE(FinalizeButton().Enabled());
}

TEST_F(FinalizeTest, AnotherUsersEntryOrAClosedPeriodIsRefusedUnlessUnlocked) {
  const int32_t theirs = Entry();
  Execute("UPDATE tbPOC_Dorvantos SET created_by = 'Ana' WHERE dorvanto_id = " + std::to_string(theirs));
  Line(theirs, "1", "1");
  Open(theirs);
  EXPECT_FALSE(form->DoFinalizar());
  ASSERT_EQ(desktop->messages.size(), 1u);
  EXPECT_EQ(desktop->messages[0].text.rfind("Não é possivel realizar o comando! Este registo está bloqueado "
                                            "porque pertence ao user 'Ana'.", 0), 0u);
  EXPECT_EQ(desktop->messages[0].title, "Sistema de Segurança");
  EXPECT_TRUE(desktop->messages[0].SystemModal());
  EXPECT_EQ(vb::CLng(EntryColumn(theirs, "finalizado")), 0);

  form->Unlock();
  EXPECT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CLng(EntryColumn(theirs, "finalizado")), 1);

  // A closed period: refused before the save; unlocked, the save inside still refuses.
  Execute("UPDATE tbPOC_Dorvantos SET data = CONVERT(DATETIME,'2009-06-01 00:00:00',102), finalizado = 0 "
          "WHERE dorvanto_id = " + std::to_string(theirs));
  Execute("UPDATE tbPOC_Dorvantos SET created_by = 'ana' WHERE dorvanto_id = " + std::to_string(theirs));
  form->DoOpen(theirs);
  desktop->messages.clear();
  EXPECT_FALSE(form->DoFinalizar());
  ASSERT_EQ(desktop->messages.size(), 1u);
  EXPECT_EQ(desktop->messages[0].text.rfind("Não é possivel realizar o comando! Este registo está bloqueado.", 0),
            0u);
  form->Unlock();
  desktop->messages.clear();
  EXPECT_FALSE(form->DoFinalizar());
  ASSERT_EQ(desktop->messages.size(), 2u);
  EXPECT_EQ(desktop->messages[1].text, "Não foi possível finalizar este lançamento.");
  EXPECT_EQ(desktop->messages[1].Icon(), forms::MsgIcon::Critical);
  EXPECT_EQ(vb::CLng(EntryColumn(theirs, "finalizado")), 0);
}

TEST_F(FinalizeTest, ReopeningKeepsNumbersAndAFinalizationAgainNumbersOnlyNewLines) {
  const int32_t id = Entry();
  const int32_t a = Line(id, "30", "0");
  const int32_t b = Line(id, "0", "30", "12002");
  Open(id);
  ASSERT_TRUE(form->DoFinalizar());

  // No: still final, and the command counts as done (a restart moves on).
  desktop->QueueAnswer(forms::vbNo);
  EXPECT_TRUE(form->DoFinalizar());
  EXPECT_EQ(LastMessage(), "Deseja reabrir este lançamento?");
  EXPECT_EQ(desktop->messages.back().Icon(), forms::MsgIcon::Question);
  EXPECT_EQ(vb::CLng(EntryColumn(id, "finalizado")), 1);
  EXPECT_TRUE(form->Final());

  desktop->QueueAnswer(forms::vbYes);
  EXPECT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CLng(EntryColumn(id, "finalizado")), 0);
  EXPECT_FALSE(form->Final());
  EXPECT_EQ(FinalizeButton().Caption(), kFinalizarCaption);
  EXPECT_EQ(vb::CDbl(EntryColumn(id, "valor")), 30);
  EXPECT_EQ(vb::CLng(LineColumn(a, "reg_no")), 1);

  // The chart changes, a line is added, and the entry is finalized again.
  Execute("UPDATE tbPOC_SubContas SET descrit = 'Millennium - conta nova' WHERE sub_conta_id = " +
          std::to_string(SubAccount("12002")));
  const int32_t c = Line(id, "5", "0");
  const int32_t d = Line(id, "0", "5", "12002");
  form->DoFillDorvantos();
  ASSERT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CLng(LineColumn(a, "reg_no")), 1);
  EXPECT_EQ(vb::CLng(LineColumn(b, "reg_no")), 2);
  EXPECT_EQ(vb::CLng(LineColumn(c, "reg_no")), 3);
  EXPECT_EQ(vb::CLng(LineColumn(d, "reg_no")), 4);
  EXPECT_EQ(vb::CLng(Counter("reg_no")), 5);
  EXPECT_EQ(vb::CStr(LineColumn(b, "sub_conta_descrit")), "Millennium - conta nova");
  EXPECT_EQ(vb::CDbl(EntryColumn(id, "valor")), 35);
}

TEST_F(FinalizeTest, ALockedSystemDocumentKeepsItsHeaderDateAndItsLinesTakeTheFieldsValue) {
  const int32_t id = Entry(", sistema", ", 1");
  const int32_t line = Line(id, "8", "8");
  Open(id);
  ASSERT_FALSE(form->FXData.Enabled());
  ASSERT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CDate(EntryColumn(id, "data")), Day(2024, 5, 10, 9, 15));
  EXPECT_EQ(vb::CDate(LineColumn(line, "data")), Day(2024, 5, 10, 9, 15));
  EXPECT_EQ(vb::CLng(LineColumn(line, "reg_no")), 1);
}

TEST_F(FinalizeTest, AFailureHalfWayLeavesNothingNumberedAndTheCountersAsTheyWere) {
  SetCounter("reg_no", 10);
  const int32_t id = Entry();
  const int32_t a = Line(id, "3", "0");
  const int32_t b = Line(id, "0", "1");
  const int32_t c = Line(id, "0", "2");
  Open(id);
  int numbered = 0;
  common::SqlServer()->WillExecute = [&](ado::WillExecuteEvent& e) {
    if (e.Source.rfind("UPDATE tbPOC_Dorvantos_Details SET reg_no", 0) == 0 && ++numbered == 3)
      e.adStatus = ado::adStatusCancel;
  };
  EXPECT_FALSE(form->DoFinalizar());
  common::SqlServer()->WillExecute = nullptr;
  EXPECT_NE(TakeErrors().find("DoFinalizar"), std::string::npos);

  EXPECT_FALSE(common::IsTransactionOpen());
  for (int32_t line : {a, b, c}) {
    EXPECT_TRUE(LineColumn(line, "reg_no").IsNull());
    EXPECT_TRUE(LineColumn(line, "conta").IsNull());
  }
  EXPECT_EQ(vb::CLng(Counter("reg_no")), 10);
  EXPECT_TRUE(Counter("ano").IsNull());
  EXPECT_EQ(vb::CLng(EntryColumn(id, "finalizado")), 0);
  EXPECT_FALSE(form->Final());
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
  EXPECT_TRUE(FinalizeButton().Enabled());

  // Nothing was lost: the next try numbers from where the counter stood.
  ASSERT_TRUE(form->DoFinalizar());
  EXPECT_EQ(vb::CLng(LineColumn(a, "reg_no")), 10);
  EXPECT_EQ(vb::CLng(LineColumn(c, "reg_no")), 12);
  EXPECT_EQ(vb::CLng(Counter("reg_no")), 13);
}

TEST_F(FinalizeTest, RestartFinalizesForRealAndMovesOnFromAFinalEntryWhateverTheAnswer) {
  const int32_t id = Entry();
  Line(id, "2", "2");
  Open(id);
  form->realFinalize = true;
  form->DoRestart();
  EXPECT_EQ(vb::CLng(EntryColumn(id, "finalizado")), 1);
  ASSERT_EQ(headerEditors.size(), 1u);

  auto again = NewForm();
  again->realFinalize = true;
  again->DoOpen(id);
  desktop->QueueAnswer(forms::vbNo);
  again->DoRestart();
  EXPECT_EQ(headerEditors.size(), 2u);
  EXPECT_EQ(vb::CLng(EntryColumn(id, "finalizado")), 1);
}

// Four processes finalize entries of the same database at the same moment, each on its
// own connection: every line gets its own number and no number is skipped.
TEST_F(FinalizeTest, ConcurrentFinalizationsNeverShareOrSkipANumber) {
  constexpr int kProcesses = 4;
  constexpr int kEntriesEach = 6;
  constexpr int kLinesEach = 3;
  SetCounter("reg_no", 100);
  std::vector<std::vector<int32_t>> entries(kProcesses);
  for (auto& mine : entries)
    for (int e = 0; e < kEntriesEach; ++e) {
      const int32_t id = Entry();
      for (int l = 0; l < kLinesEach; ++l) Line(id, l == 0 ? "6" : "0", l == 0 ? "0" : "3");
      mine.push_back(id);
    }
  const std::string connection = ledger_->ConnectionString("ana", "segredo");
  form.reset();
  common::SqlServer()->Close();

  int start[2];
  ASSERT_EQ(::pipe(start), 0);
  std::vector<pid_t> children;
  for (const auto& mine : entries) {
    const pid_t pid = ::fork();
    ASSERT_GE(pid, 0);
    if (pid == 0) {
      ::close(start[1]);
      char go;
      if (::read(start[0], &go, 1) < 0) ::_exit(3);
      int failures = 0;
      common::SqlServer()->Open(connection);
      auto window = NewForm();
      for (int32_t id : mine) {
        window->DoOpen(id);
        if (!window->DoFinalizar()) ++failures;
      }
      window.reset();
      common::SqlServer()->Close();
      ::_exit(failures == 0 ? 0 : 1);
    }
    children.push_back(pid);
  }
  ::close(start[0]);
  ASSERT_EQ(::write(start[1], std::string(kProcesses, 'g').data(), kProcesses), kProcesses);
  ::close(start[1]);
  for (pid_t pid : children) {
    int status = 0;
    ASSERT_EQ(::waitpid(pid, &status, 0), pid);
    EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << status;
  }

  common::SqlServer()->Open(connection);
  std::set<int32_t> numbers;
  auto rs = ado::Recordset::Create();
  rs->Open("SELECT reg_no FROM tbPOC_Dorvantos_Details", common::SqlServer());
  int lines = 0;
  for (; !rs->Eof(); rs->MoveNext(), ++lines) numbers.insert(vb::CLng(rs->Fields(0).Value()));
  constexpr int kAll = kProcesses * kEntriesEach * kLinesEach;
  EXPECT_EQ(lines, kAll);
  ASSERT_EQ(numbers.size(), static_cast<size_t>(kAll));
  EXPECT_EQ(*numbers.begin(), 100);
  EXPECT_EQ(*numbers.rbegin(), 100 + kAll - 1);
  EXPECT_EQ(vb::CLng(Counter("reg_no")), 100 + kAll);
}

}  // namespace
}  // namespace entry::testing
