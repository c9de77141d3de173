#include "common/modControlFill.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "common/SqlServer.h"
#include "platform/ado/Database.h"
#include "platform/automation/TestSandbox.h"
#include "platform/forms/Forms.h"

namespace {

class frmFill : public forms::Form {
 public:
  frmFill()
      : Form({.name = "frmFill",
              .controls = {{.name = "FXTipo_ID", .type = forms::ControlType::ComboBox,
                            .properties = {{"Style", forms::vbComboDropDownList}}},
                           {.name = "List1", .type = forms::ControlType::ListBox}}}) {}
  forms::ComboBox& FXTipo_ID = Ctl<forms::ComboBox>("FXTipo_ID");
  forms::ListBox& List1 = Ctl<forms::ListBox>("List1");
};

// The shared connection opened on a fresh database whose integration codes are known:
// 1 Clientes, 2 without a text, 3 Fornecedores.
class ControlFillTest : public ::testing::Test {
 protected:
  void SetUp() override {
    path_ = sandbox_.Directory() + "/fill.db";
    ado::CreateOptions options;
    options.demoData = false;
    options.passwordIterations = 1000;
    ado::CreateDatabase(path_, {{"contabilista", "segredo"}}, options);
    if (common::SqlServer()->State() == ado::adStateOpen) common::SqlServer()->Close();
    common::SqlServer()->Open(ado::EmbeddedConnectionString(path_, "contabilista", "segredo"));
    for (const char* row : {"(1, 'Clientes')", "(2, null)", "(3, 'Fornecedores')"})
      common::SqlServer()->Execute(
          std::string("INSERT INTO tbContactos_ContasCorrentes_Tipos (tipo_id, descrit) VALUES ") +
          row);
    form_.FXTipo_ID.AddItem("anterior");
    form_.FXTipo_ID.SetItemData(0, 77);
  }
  void TearDown() override {
    form_.Unload();
    common::SqlServer()->Close();
  }

  std::vector<std::string> Entries(forms::ListControl& list) {
    std::vector<std::string> entries;
    for (int32_t i = 0; i < list.ListCount(); ++i)
      entries.push_back(list.List(i) + "=" + std::to_string(list.ItemData(i)));
    return entries;
  }

  static constexpr const char* kSql =
      "SELECT tipo_id, descrit FROM tbContactos_ContasCorrentes_Tipos ORDER BY tipo_id";

  dvtest::Sandbox sandbox_;
  std::string path_;
  frmFill form_;
};

TEST_F(ControlFillTest, FillsTextAndItemDataSkippingRowsWithoutText) {
  common::ControlFill(form_.FXTipo_ID, kSql, "descrit", "tipo_id");
  EXPECT_EQ(Entries(form_.FXTipo_ID),
            (std::vector<std::string>{"Clientes=1", "Fornecedores=3"}));

  // Without an item data field the entries keep the default item data.
  common::ControlFill(form_.List1, kSql, "descrit", "");
  EXPECT_EQ(Entries(form_.List1), (std::vector<std::string>{"Clientes=0", "Fornecedores=0"}));
}

TEST_F(ControlFillTest, LeavesTheControlAsItWasWhenTheQueryDoesNotFit) {
  const std::vector<std::string> before = Entries(form_.FXTipo_ID);

  common::ControlFill(form_.FXTipo_ID,
                      "SELECT tipo_id, descrit FROM tbContactos_ContasCorrentes_Tipos "
                      "WHERE tipo_id > 100",
                      "descrit", "tipo_id");
  EXPECT_EQ(Entries(form_.FXTipo_ID), before) << "no rows";

  // Field names must match exactly, letter case included.
  common::ControlFill(form_.FXTipo_ID, kSql, "Descrit", "tipo_id");
  EXPECT_EQ(Entries(form_.FXTipo_ID), before) << "text field spelt differently";
  common::ControlFill(form_.FXTipo_ID, kSql, "descrit", "TIPO_ID");
  EXPECT_EQ(Entries(form_.FXTipo_ID), before) << "item data field spelt differently";
  common::ControlFill(form_.FXTipo_ID, kSql, "nome", "");
  EXPECT_EQ(Entries(form_.FXTipo_ID), before) << "missing text field";
}

TEST_F(ControlFillTest, AFailingQueryIsReportedAndNeverThrown) {
  testing::internal::CaptureStderr();
  EXPECT_NO_THROW(common::ControlFill(form_.FXTipo_ID, "SELECT * FROM tbNada", "descrit", ""));
  const std::string console = testing::internal::GetCapturedStderr();
  EXPECT_NE(console.find("modControlFill.ControlFill"), std::string::npos) << console;
  EXPECT_EQ(Entries(form_.FXTipo_ID), (std::vector<std::string>{"anterior=77"}));
}

}  // namespace
