#include "qt/demo/DemoForms.h"

#include <fmt/format.h>

namespace dvqt::demo {

using forms::ControlType;

namespace {

forms::FormDesign FinderDesign() {
  return {.name = "frmDemoFinder", .caption = "Plano de Contas", .width = 5400, .height = 5200,
          .controls = {
              {.name = "ImageList1", .type = ControlType::ImageList,
               .items = {{"raiz", "folder"}, {"grupo", "folder-open"}, {"conta", "text-x-generic"}}},
              {.name = "TreeView1", .type = ControlType::TreeView,
               .left = 120, .top = 120, .width = 3200, .height = 4000},
              {.name = "List1", .type = ControlType::ListBox,
               .left = 3440, .top = 120, .width = 1700, .height = 4000},
              {.name = "Command1", .type = ControlType::CommandButton, .left = 2760, .top = 4260,
               .width = 1140, .height = 375, .caption = "&OK", .properties = {{"Default", true}}},
              {.name = "Command2", .type = ControlType::CommandButton, .left = 4000, .top = 4260,
               .width = 1140, .height = 375, .caption = "&Cancelar", .properties = {{"Cancel", true}}},
          }};
}

forms::FormDesign EntryDesign() {
  return {.name = "frmDemoEntry", .caption = "Lançamento do Diário", .width = 9600, .height = 7400,
          .controls = {
              {.name = "Toolbar1", .type = ControlType::Toolbar, .left = 0, .top = 0, .width = 9480, .height = 420,
               .items = {{"fechar", "&Fechar Janela     "}, {"gravar", "&Gravar                "},
                         {"finalizar", "&Finalizar              "}, {"apagar", "&Apagar Registo  "}}},
              {.name = "ImageList1", .type = ControlType::ImageList, .items = {{"linha", "text-x-generic"}}},
              {.name = "Frame1", .type = ControlType::Frame, .left = 120, .top = 540, .width = 9240,
               .height = 2100, .caption = "Cabeçalho"},
              {.name = "Label1", .type = ControlType::Label, .left = 120, .top = 300, .width = 1300,
               .height = 255, .caption = "&Nº Doc.:", .container = "Frame1"},
              {.name = "FXDorvanto_No", .type = ControlType::TextBox, .left = 1440, .top = 270, .width = 1200,
               .height = 315, .caption = "2024/0153", .container = "Frame1",
               .properties = {{"Locked", true}, {"BackColor", forms::vbButtonFace}}},
              {.name = "Label2", .type = ControlType::Label, .left = 2880, .top = 300, .width = 700,
               .height = 255, .caption = "&Data:", .container = "Frame1"},
              {.name = "FXData", .type = ControlType::DTPicker, .left = 3600, .top = 270, .width = 1500,
               .height = 315, .container = "Frame1"},
              {.name = "Label3", .type = ControlType::Label, .left = 5300, .top = 300, .width = 800,
               .height = 255, .caption = "&Tipo:", .container = "Frame1"},
              {.name = "FXTipo", .type = ControlType::ComboBox, .left = 6120, .top = 270, .width = 2900,
               .height = 315, .container = "Frame1", .properties = {{"Style", 2}}},
              {.name = "Label4", .type = ControlType::Label, .left = 120, .top = 750, .width = 1300,
               .height = 255, .caption = "&Referência:", .container = "Frame1"},
              {.name = "FXReferencia", .type = ControlType::TextBox, .left = 1440, .top = 720, .width = 3660,
               .height = 315, .container = "Frame1", .properties = {{"MaxLength", 20}}},
              {.name = "Check1", .type = ControlType::CheckBox, .left = 5300, .top = 750, .width = 2300,
               .height = 255, .caption = "Documento do &sistema", .container = "Frame1"},
              {.name = "Option1", .type = ControlType::OptionButton, .left = 7000, .top = 1650, .width = 1000,
               .height = 255, .caption = "&Aberto", .container = "Frame1"},
              {.name = "Option2", .type = ControlType::OptionButton, .left = 8000, .top = 1650, .width = 1100,
               .height = 255, .caption = "Fec&hado", .container = "Frame1"},
              {.name = "Label5", .type = ControlType::Label, .left = 120, .top = 1200, .width = 1300,
               .height = 255, .caption = "&Observações:", .container = "Frame1"},
              {.name = "FXObs", .type = ControlType::TextBox, .left = 1440, .top = 1170, .width = 6300,
               .height = 315, .container = "Frame1"},
              {.name = "cmdProcurar", .type = ControlType::CommandButton, .left = 7860, .top = 1140,
               .width = 1200, .height = 375, .caption = "&Procurar...", .container = "Frame1"},
              {.name = "ListView1", .type = ControlType::ListView, .left = 120, .top = 2760, .width = 9240,
               .height = 2800,
               .items = {{"", "Nº Reg.", 900, forms::lvwColumnLeft},
                         {"", "Conta", 1400, forms::lvwColumnLeft},
                         {"", "Descrição", 3400, forms::lvwColumnLeft},
                         {"", "Débito", 1500, forms::lvwColumnRight},
                         {"", "Crédito", 1500, forms::lvwColumnRight}}},
              {.name = "Label6", .type = ControlType::Label, .left = 4200, .top = 5700, .width = 1400,
               .height = 255, .caption = "Totais:", .properties = {{"Alignment", 1}, {"FontBold", true}}},
              {.name = "FXTotal_Debitos", .type = ControlType::TextBox, .left = 5700, .top = 5670, .width = 1650,
               .height = 315, .properties = {{"Locked", true}, {"Alignment", 1}, {"BackColor", forms::vbButtonFace}}},
              {.name = "FXTotal_Creditos", .type = ControlType::TextBox, .left = 7500, .top = 5670, .width = 1650,
               .height = 315, .properties = {{"Locked", true}, {"Alignment", 1}, {"BackColor", forms::vbButtonFace}}},
              {.name = "Image1", .type = ControlType::Image, .left = 120, .top = 5670, .width = 480,
               .height = 480, .caption = "folder"},
              {.name = "ProgressBar1", .type = ControlType::ProgressBar, .left = 720, .top = 5740, .width = 3000,
               .height = 200},
              {.name = "mnLinhas", .type = ControlType::Menu, .caption = "&Linhas"},
              {.name = "mnNovo", .type = ControlType::Menu, .caption = "&Novo\tF2", .container = "mnLinhas"},
              {.name = "mnAbrir", .type = ControlType::Menu, .caption = "&Abrir", .container = "mnLinhas"},
              {.name = "mnBar1", .type = ControlType::Menu, .caption = "-", .container = "mnLinhas"},
              {.name = "mnRemover", .type = ControlType::Menu, .caption = "&Remover", .container = "mnLinhas"},
          }};
}

std::string Euros(double value) {
  // Portuguese grouping and decimal comma, as the totals show them.
  std::string digits = fmt::format("{:.2f}", value < 0 ? -value : value);
  std::string whole = digits.substr(0, digits.size() - 3), grouped;
  for (size_t i = 0; i < whole.size(); ++i) {
    if (i > 0 && (whole.size() - i) % 3 == 0) grouped += '.';
    grouped += whole[i];
  }
  return std::string("€ ") + (value < 0 ? "-" : "") + grouped + "," + digits.substr(digits.size() - 2);
}

}  // namespace

// ---- finder ----------------------------------------------------------------------------

frmDemoFinder::frmDemoFinder() : Form(FinderDesign()) {
  Command1.Click = [this] {
    if (forms::Node* node = TreeView1.SelectedItem()) chosen = node->Text();
    Hide();
  };
  Command2.Click = [this] { Hide(); };
  TreeView1.DblClick = [this] { Command1.Click(); };
}

void frmDemoFinder::Form_Load() {
  forms::NodeList& nodes = TreeView1.Nodes();
  nodes.Add("#1", "1 - Meios Financeiros Líquidos", 1).SetBold(true);
  nodes.Add("#1", forms::tvwChild, "#11", "11 - Caixa", 2);
  nodes.Add("#1", forms::tvwChild, "#12", "12 - Depósitos à ordem", 2);
  nodes.Add("#12", forms::tvwChild, "#121", "121 - Banco Comercial", 3);
  nodes.Add("#12", forms::tvwChild, "#122", "122 - Caixa Agrícola", 3);
  nodes.Add("#2", "2 - Terceiros", 1).SetBold(true);
  nodes.Add("#2", forms::tvwChild, "#21", "21 - Clientes", 2);
  nodes.Add("#2", forms::tvwChild, "#22", "22 - Fornecedores", 2);
  nodes.Add("#6", "6 - Custos e Perdas", 1).SetBold(true);
  nodes.Add("#6", forms::tvwChild, "#62", "62 - Fornecimentos e serviços externos", 3);
  nodes("#1").SetExpanded(true);
  nodes("#12").SetExpanded(true);
  nodes("#121").SetSelected(true);
  for (const char* text : {"Todas", "Movimento", "Razão", "Integração"}) List1.AddItem(text);
  List1.SetListIndex(0);
}

// ---- entry -----------------------------------------------------------------------------

frmDemoEntry::frmDemoEntry() : Form(EntryDesign()) {
  Handle(ListView1.KeyDown, &frmDemoEntry::ListView1_KeyDown);
  Handle(ListView1.MouseUp, &frmDemoEntry::ListView1_MouseUp);
  Handle(FXReferencia.Validate, &frmDemoEntry::FXReferencia_Validate);
  Handle(Toolbar1.ButtonClick, &frmDemoEntry::Toolbar1_ButtonClick);
  Handle(cmdProcurar.Click, &frmDemoEntry::cmdProcurar_Click);
  Ctl<forms::Menu>("mnNovo").Click = [this] { AddLine("62211", 100.0, 0.0); };
  Ctl<forms::Menu>("mnRemover").Click = [this] {
    if (forms::ListItem* item = ListView1.SelectedItem()) ListView1.ListItems().Remove(item->Key());
  };
}

void frmDemoEntry::Form_Load() {
  for (const char* tipo : {"Diário Geral", "Diário de Caixa", "Diário de Bancos", "Operações Diversas"})
    FXTipo.AddItem(tipo);
  FXTipo.SetListIndex(0);
  if (auto date = vb::DateSerial(2024, 3, 15)) FXData.SetValue(*date);
  FXObs.SetText("Pagamento da renda de Março");
  AddLine("2211", 0.0, 1230.0);
  AddLine("62211", 1000.0, 0.0);
  AddLine("24321", 230.0, 0.0);
  ListView1.ListItems()(2).SetSelected(true);
  ProgressBar1.SetValue(60);
  Check1.SetValue(forms::vbChecked);
  Option1.SetValue(true);
  Toolbar1.Buttons()("gravar").SetEnabled(false);
}

void frmDemoEntry::AddLine(const std::string& conta, double debito, double credito) {
  ++lines_;
  forms::ListItem& item =
      ListView1.ListItems().Add("#" + std::to_string(lines_), fmt::format("{:04}", lines_), 1);
  item.SetSubItems(1, conta);
  item.SetSubItems(2, debito > 0 ? "Fornecimentos e serviços" : "Fornecedores c/c");
  item.SetSubItems(3, debito > 0 ? Euros(debito) : "");
  item.SetSubItems(4, credito > 0 ? Euros(credito) : "");
  Toolbar1.Buttons()("gravar").SetEnabled(true);
  FXTotal_Debitos.SetText(Euros(1230.0 + (lines_ > 3 ? 100.0 * (lines_ - 3) : 0.0)));
  FXTotal_Creditos.SetText(Euros(1230.0));
}

void frmDemoEntry::ListView1_KeyDown(int& KeyCode, int Shift) {
  if (KeyCode == forms::vbKeyF2) {
    AddLine("62211", 100.0, 0.0);
    KeyCode = 0;
  }
}

void frmDemoEntry::ListView1_MouseUp(int Button, int Shift, float X, float Y) {
  if (Button == forms::vbRightButton) PopupMenu(mnLinhas, X, Y);
}

void frmDemoEntry::FXReferencia_Validate(int& Cancel) {
  if (!FXReferencia.Text().empty() && FXReferencia.Text().size() < 3) {
    forms::MsgBox("A referência tem de ter pelo menos 3 caracteres.", forms::vbInformation, Caption());
    Cancel = 1;
  }
}

void frmDemoEntry::Toolbar1_ButtonClick(forms::ToolbarButton& Button) {
  if (Button.Key() == "fechar") {
    Unload();
  } else if (Button.Key() == "gravar") {
    SetMousePointer(forms::vbHourglass);
    Button.SetEnabled(false);
    SetMousePointer(forms::vbDefault);
  } else if (Button.Key() == "apagar") {
    if (forms::MsgBox("Pretende apagar este registo?", forms::vbYesNo | forms::vbQuestion, Caption()) ==
        forms::vbYes)
      ListView1.ListItems().Clear();
  }
}

void frmDemoEntry::cmdProcurar_Click() {
  static frmDemoFinder finder;
  finder.Show(forms::vbModal, this);
  if (!finder.chosen.empty()) FXObs.SetText(finder.chosen);
}

void frmDemoEntry::Form_QueryUnload(int& Cancel, int UnloadMode) {
  if (UnloadMode == forms::vbFormControlMenu && Toolbar1.Buttons()("gravar").Enabled())
    Cancel = forms::MsgBox("Pretende sair sem gravar?", forms::vbYesNo | forms::vbQuestion, "Sair") ==
                     forms::vbNo
                 ? 1
                 : 0;
}

}  // namespace dvqt::demo
