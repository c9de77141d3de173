// The sub-account finder, reached by ProgID as the line editor reaches it: its own
// login, the rows narrowed by the account and by what the person types, the key handed
// back.

#include "lines/LinesFixture.h"
#include "platform/automation/CreateObject.h"

namespace {

using dvtest::LinesTest;
using forms::KeyboardUser;

forms::ListView& List(forms::Form& finder) { return finder.Ctl<forms::ListView>("ListView1"); }

std::vector<std::string> Codes(forms::Form& finder) {
  std::vector<std::string> codes;
  forms::ListItemList& items = List(finder).ListItems();
  for (int32_t i = 1; i <= items.Count(); ++i) codes.push_back(items(i).Text());
  return codes;
}

TEST_F(LinesTest, FinderNarrowsAsThePersonTypesAndHandsBackTheKey) {
  auto editor = InsertLine(NewEntry());
  std::vector<std::string> seen;
  desktop_->WhenShown("frmRecordFinder", [&](forms::Form& finder) {
    KeyboardUser person(finder);
    EXPECT_EQ(static_cast<int32_t>(Codes(finder).size()), Key("SELECT count(*) FROM vwPOC_SubContas"));
    person.TypeInto("Text1", "120");
    seen = Codes(finder);  // a code narrows by its beginning
    finder.Ctl<forms::TextBox>("Text1").SetText("");
    person.Type("LOJA");  // a name anywhere in it, letter case ignored
    EXPECT_EQ(Codes(finder), std::vector<std::string>{"11002"});
    person.Press(forms::vbKeyReturn);
  });
  KeyboardUser(*editor).ClickButton(editor->FXSubconta_Find, "procurar");

  EXPECT_EQ(seen, (std::vector<std::string>{"12001", "12002", "12003", "12004"}));
  EXPECT_EQ(editor->FXSubconta.Tag(), std::to_string(SubContaId("11002")));
  EXPECT_EQ(editor->FXSubconta.Text(), "Caixa - Loja do Porto");
  EXPECT_EQ(editor->FXConta_Codigo.Text(), "11");
  EXPECT_EQ(editor->MousePointer(), forms::vbDefault);
  EXPECT_TRUE(desktop_->leftOpen.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LinesTest, FinderShowsOnlyTheShownAccountsSubAccountsAndCancelChangesNothing) {
  auto editor = InsertLine(NewEntry());
  int32_t bancos = ContaId("12");
  editor->DoFillConta(bancos);
  int32_t subconta = SubContaId("12003");
  editor->DoFillSubConta(subconta);

  std::vector<std::string> seen;
  desktop_->WhenShown("frmRecordFinder", [&](forms::Form& finder) {
    seen = Codes(finder);
    KeyboardUser(finder).Click("Command2");
  });
  desktop_->WhenShown("frmRecordFinder", [&](forms::Form& finder) {
    KeyboardUser person(finder);
    person.DoubleClickItem(List(finder), List(finder).ListItems()(1).Key());
  });
  editor->DoProcurarSubconta();
  EXPECT_EQ(seen, (std::vector<std::string>{"12001", "12002", "12003", "12004"}));
  EXPECT_EQ(editor->FXSubconta.Tag(), std::to_string(subconta));

  // A double click chooses, and the close box is another way to choose nothing.
  editor->DoProcurarSubconta();
  EXPECT_EQ(editor->FXSubconta_codigo.Text(), "12001");
  desktop_->WhenShown("frmRecordFinder", [](forms::Form&) {});
  editor->DoProcurarSubconta();
  EXPECT_EQ(editor->FXSubconta_codigo.Text(), "12001");
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

TEST_F(LinesTest, FinderLogsInAsTheUserAndAcceptsOnlyKeyFilters) {
  vb::ObjectPtr finder = automation::CreateObject("RecordFinder.General");
  auto errorOf = [&](std::vector<vb::Variant> args) {
    try {
      finder->Call("Find", std::move(args));
    } catch (const vb::Error& e) {
      return e.Number();
    }
    return 0;
  };

  EXPECT_FALSE(vb::CBool(finder->Call("Connect", {vb::Variant(dvtest::kHostUser),
                                                 vb::Variant(common::EncodePassword("errada"))})));
  EXPECT_FALSE(vb::CBool(finder->Call("Connect", {vb::Variant(dvtest::kHostUser),
                                                 vb::Variant(dvtest::kHostPassword)})));  // not encoded
  EXPECT_EQ(errorOf({vb::Variant("POC_SUBCONTAS")}), vb::kErrInvalidProcedureCall);
  EXPECT_TRUE(desktop_->modalForms.empty());

  ASSERT_TRUE(vb::CBool(finder->Call("Connect", {vb::Variant(dvtest::kHostUser),
                                                vb::Variant(common::EncodePassword(dvtest::kHostPassword))})));
  const vb::Variant missing = vb::Variant::Missing();
  for (const char* filter : {"conta_id = 1 OR 1 = 1", "conta_id = 1; DELETE FROM tbPOC_Contas",
                             "descrit = 'x'", "conta_id = (SELECT 1)"}) {
    EXPECT_EQ(errorOf({vb::Variant("POC_SUBCONTAS"), missing, missing, missing, vb::Variant(filter),
                       vb::Variant(false), vb::Variant(true)}),
              vb::kErrInvalidProcedureCall)
        << filter;
  }
  EXPECT_EQ(errorOf({vb::Variant("POC_CONTAS")}), vb::kErrInvalidProcedureCall);
  EXPECT_TRUE(desktop_->modalForms.empty());
  EXPECT_GT(Key("SELECT count(*) FROM tbPOC_Contas"), 0);

  // Two key comparisons joined by AND are understood; the person closes the window.
  const int32_t conta = ContaId("11");
  const int32_t sub = SubContaId("11003");
  std::vector<std::string> seen;
  desktop_->WhenShown("frmRecordFinder", [&](forms::Form& f) { seen = Codes(f); });
  EXPECT_EQ(vb::CLng(finder->Call("Find", {vb::Variant("poc_subcontas"), missing, missing, missing,
                                           vb::Variant("CONTA_ID = " + std::to_string(conta) +
                                                       " and sub_conta_id=" + std::to_string(sub))})),
            0);
  EXPECT_EQ(seen, std::vector<std::string>{"11003"});
}

}  // namespace
