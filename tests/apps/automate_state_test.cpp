// What the driver reads off the form model and how it names keys and controls, checked
// in-process on a window of the test's own.

#include <gtest/gtest.h>

#include <memory>

#include "automate_state.h"
#include "automate_windows.h"
#include "platform/forms/Forms.h"
#include "platform/forms/ScriptedDesktop.h"

namespace {

using app::automate::Json;
using forms::ControlType;

class frmSample : public forms::Form {
 public:
  explicit frmSample(std::string name = "frmSample") : Form(Design(std::move(name))) {}

  forms::TextBox& FXObs = Ctl<forms::TextBox>("FXObs");
  forms::ComboBox& FXDiario = Ctl<forms::ComboBox>("FXDiario");
  forms::ListView& lvDetails = Ctl<forms::ListView>("lvDetails");
  forms::TreeView& tvContas = Ctl<forms::TreeView>("tvContas");
  forms::Toolbar& tbMain = Ctl<forms::Toolbar>("tbMain");

 private:
  static forms::FormDesign Design(std::string name) {
    return {.name = std::move(name),
            .caption = "Lançamento",
            .width = 9000,
            .height = 6000,
            .controls = {
                {.name = "FXObs", .type = ControlType::TextBox, .left = 120, .top = 120,
                 .width = 3000, .height = 315, .caption = "nota",
                 .properties = {{"Locked", true}}},
                {.name = "FXDiario", .type = ControlType::ComboBox, .left = 120, .top = 600,
                 .width = 3000, .height = 315, .properties = {{"Style", 2}}},
                {.name = "Label2", .type = ControlType::Label, .caption = "Primeira", .index = 0},
                {.name = "Label2", .type = ControlType::Label, .caption = "Segunda", .index = 1},
                {.name = "lvDetails", .type = ControlType::ListView, .width = 6000,
                 .height = 2000,
                 .items = {{.key = "conta", .caption = "Conta", .width = 1500},
                           {.key = "debito", .caption = "Débito", .width = 1200},
                           {.key = "credito", .caption = "Crédito", .width = 1200}}},
                {.name = "tvContas", .type = ControlType::TreeView, .width = 3000, .height = 2000},
                {.name = "tbMain", .type = ControlType::Toolbar,
                 .items = {{.key = "gravar", .caption = "Gravar"},
                           {.key = "remover", .caption = "Remover"}}},
            }};
  }
};

class AutomateStateTest : public ::testing::Test {
 protected:
  void SetUp() override { forms::Desktop::Install(desktop_); }
  void TearDown() override { forms::Desktop::Install(nullptr); }
  std::shared_ptr<forms::ScriptedDesktop> desktop_ = std::make_shared<forms::ScriptedDesktop>();
};

TEST(AutomateKeys, EveryNamedKeyGivesItsCodeAndWhatItTypes) {
  struct Case {
    const char* name;
    int keyCode;
    int character;
  } cases[] = {
      {"Enter", 13, 13},   {"Tab", 9, 0},        {"Left", 37, 0},   {"Right", 39, 0},
      {"Up", 38, 0},       {"Down", 40, 0},      {"Delete", 46, 0}, {"Backspace", 8, 8},
      {"Escape", 27, 27},  {"F1", 112, 0},       {"F2", 113, 0},    {"F3", 114, 0},
      {"F12", 123, 0},     {"Add", 107, '+'},    {"enter", 13, 13}, {"f10", 121, 0},
  };
  for (const Case& c : cases) {
    auto key = app::automate::KeyFromName(c.name);
    ASSERT_TRUE(key) << c.name;
    EXPECT_EQ(key->keyCode, c.keyCode) << c.name;
    EXPECT_EQ(key->character, c.character) << c.name;
    EXPECT_EQ(key->shift, 0) << c.name;
  }
}

TEST(AutomateKeys, ModifiersAddTheirMaskAndCtrlOrAltTypeNothing) {
  auto shiftTab = app::automate::KeyFromName("Shift+Tab");
  ASSERT_TRUE(shiftTab);
  EXPECT_EQ(shiftTab->keyCode, forms::vbKeyTab);
  EXPECT_EQ(shiftTab->shift, forms::vbShiftMask);

  auto ctrlEnter = app::automate::KeyFromName("ctrl+alt+Enter");
  ASSERT_TRUE(ctrlEnter);
  EXPECT_EQ(ctrlEnter->shift, forms::vbCtrlMask | forms::vbAltMask);
  EXPECT_EQ(ctrlEnter->character, 0);
}

TEST(AutomateKeys, NamesThatAreNoKeyAreRefused) {
  for (const char* name : {"", "F0", "F13", "F01", "F", "Enterx", "Shift+", "Shift+Shift", "+",
                           "Ctrl+F99", "Plus"})
    EXPECT_FALSE(app::automate::KeyFromName(name)) << name;
}

TEST(AutomateControlNames, ArraysAreWrittenAndReadWithTheirIndex) {
  auto plain = app::automate::ParseControlName("FXObs");
  ASSERT_TRUE(plain);
  EXPECT_EQ(plain->name, "FXObs");
  EXPECT_EQ(plain->index, -1);

  auto indexed = app::automate::ParseControlName("Label2(12)");
  ASSERT_TRUE(indexed);
  EXPECT_EQ(indexed->name, "Label2");
  EXPECT_EQ(indexed->index, 12);

  for (const char* bad : {"", "(1)", "Label2(", "Label2()", "Label2(x)", "Label2(-1)", "a)b",
                          "Label2(1)x", "Label2(99999999)"})
    EXPECT_FALSE(app::automate::ParseControlName(bad)) << bad;
}

TEST(AutomateValues, EachKindOfValueBecomesItsJson) {
  using app::automate::ValueJson;
  EXPECT_EQ(ValueJson(vb::Variant::Null()), Json(nullptr));
  EXPECT_EQ(ValueJson(vb::Variant()), Json(nullptr));
  EXPECT_EQ(ValueJson(vb::Variant(int32_t{-7})), Json(-7));
  EXPECT_EQ(ValueJson(vb::Variant(12.5)), Json(12.5));
  EXPECT_EQ(ValueJson(vb::Variant(std::numeric_limits<double>::quiet_NaN())), Json(nullptr));
  EXPECT_EQ(ValueJson(vb::Variant(true)), Json(true));
  EXPECT_EQ(ValueJson(vb::Variant("€ 1.234,50")), Json("€ 1.234,50"));
  EXPECT_EQ(ValueJson(vb::Variant(*vb::DateSerial(2009, 12, 31, 13, 5, 9))),
            Json("2009-12-31 13:05:09"));
  EXPECT_EQ(app::automate::ColorText(forms::vbButtonFace), "&H8000000F");
  EXPECT_EQ(app::automate::ColorText(forms::vbWindowBackground), "&H80000005");
  EXPECT_EQ(app::automate::ColorText(0xFFFFFF), "&HFFFFFF");
}

TEST(AutomateBoxes, StyleBitsBecomeIconButtonsAndSystemModality) {
  forms::MessageBox box{"Remover?", "", forms::vbYesNo | forms::vbQuestion | forms::vbSystemModal};
  Json event = app::automate::MsgBoxEvent(box);
  EXPECT_EQ(event["event"], "msgbox");
  EXPECT_EQ(event["title"], forms::ApplicationTitle());
  EXPECT_EQ(event["icon"], "question");
  EXPECT_EQ(event["buttons"], "yesno");
  EXPECT_EQ(event["system"], true);

  forms::MessageBox critical{"Erro", "Título", forms::vbCritical | 7};
  EXPECT_EQ(app::automate::MsgBoxEvent(critical)["buttons"], "ok");
  EXPECT_EQ(app::automate::MsgBoxEvent(critical)["icon"], "critical");
}

TEST(AutomateBoxes, ClosingABoxGivesCancelElseNoElseOk) {
  using app::automate::CancelAnswer;
  EXPECT_EQ(CancelAnswer({"", "", forms::vbYesNoCancel}), forms::vbCancel);
  EXPECT_EQ(CancelAnswer({"", "", forms::vbYesNo | forms::vbDefaultButton1}), forms::vbNo);
  EXPECT_EQ(CancelAnswer({"", "", forms::vbOKOnly}), forms::vbOK);
  EXPECT_EQ(app::automate::AnswerFromName("Yes"), forms::vbYes);
  EXPECT_FALSE(app::automate::AnswerFromName("talvez"));
}

TEST_F(AutomateStateTest, AWindowsStateCarriesEveryControlWithItsOwnProperties) {
  frmSample form;
  form.Show();
  form.FXDiario.AddItem("Caixa");
  form.FXDiario.SetItemData(form.FXDiario.NewIndex(), 1);
  form.FXDiario.AddItem("Bancos");
  form.FXDiario.SetItemData(form.FXDiario.NewIndex(), 2);
  form.FXDiario.SetListIndex(1);
  forms::ListItem& item = form.lvDetails.ListItems().Add("#7", "2111");
  item.SetSubItems(1, "€ 10,00");
  item.SetSelected(true);
  form.tvContas.Nodes().Add("#1", "Meios monetários");
  form.tvContas.Nodes().Add("#1", forms::tvwChild, "#11", "Caixa").SetTag(vb::Variant(int32_t{11}));
  form.tbMain.Buttons()("gravar").SetEnabled(false);
  form.SetMousePointer(forms::vbHourglass);
  form.FXDiario.SetFocus();

  Json state = app::automate::FormState(form);
  EXPECT_EQ(state["caption"], "Lançamento");
  EXPECT_EQ(state["visible"], true);
  EXPECT_EQ(state["mousePointer"], "hourglass");
  EXPECT_EQ(state["focus"], "FXDiario");
  EXPECT_EQ(state["width"], 9000);

  const Json& controls = state["controls"];
  EXPECT_EQ(controls["FXObs"]["type"], "TextBox");
  EXPECT_EQ(controls["FXObs"]["text"], "nota");
  EXPECT_EQ(controls["FXObs"]["locked"], true);
  EXPECT_EQ(controls["FXObs"]["backColor"], "&H80000005");
  EXPECT_EQ(controls["FXObs"]["left"], 120);

  EXPECT_EQ(controls["FXDiario"]["text"], "Bancos");
  EXPECT_EQ(controls["FXDiario"]["listIndex"], 1);
  EXPECT_EQ(controls["FXDiario"]["items"],
            Json::parse(R"([{"text":"Caixa","itemData":1},{"text":"Bancos","itemData":2}])"));

  EXPECT_EQ(controls["Label2(0)"]["caption"], "Primeira");
  EXPECT_EQ(controls["Label2(1)"]["caption"], "Segunda");
  EXPECT_FALSE(controls.contains("Label2"));

  EXPECT_EQ(controls["lvDetails"]["columns"],
            Json::parse(R"([{"text":"Conta","width":1500},{"text":"Débito","width":1200},
                            {"text":"Crédito","width":1200}])"));
  // One sub-item per column after the first, those never written included.
  EXPECT_EQ(controls["lvDetails"]["items"],
            Json::parse(R"([{"key":"#7","text":"2111","subItems":["€ 10,00",""],"selected":true}])"));

  const Json& nodes = controls["tvContas"]["items"];
  ASSERT_EQ(nodes.size(), 2u);
  EXPECT_EQ(nodes[0]["parent"], nullptr);
  EXPECT_EQ(nodes[1]["parent"], "#1");
  EXPECT_EQ(nodes[1]["tag"], 11);
  EXPECT_EQ(nodes[1]["expanded"], false);

  EXPECT_EQ(controls["tbMain"]["buttons"]["gravar"]["enabled"], false);
  EXPECT_EQ(controls["tbMain"]["buttons"]["remover"]["caption"], "Remover");
}

TEST_F(AutomateStateTest, ReadingTheStateChangesNothingAndRaisesNoEvent) {
  frmSample form;
  form.Show();
  int changes = 0;
  form.FXObs.Change = [&] { ++changes; };
  form.FXObs.GotFocus = [&] { ++changes; };
  Json before = app::automate::FormState(form);
  Json after = app::automate::FormState(form);
  EXPECT_EQ(before, after);
  EXPECT_EQ(changes, 0);
}

TEST_F(AutomateStateTest, InstancesCountPerNameAndAreNeverGivenAgain) {
  app::automate::WindowIndex windows;
  auto first = std::make_shared<frmSample>("frmMainDetails");
  auto second = std::make_shared<frmSample>("frmMainDetails");
  auto other = std::make_shared<frmSample>("frmMain");
  first->Show();
  other->Show();
  second->Show();
  EXPECT_EQ(windows.InstanceOf(*first), 1);
  EXPECT_EQ(windows.InstanceOf(*second), 2);
  EXPECT_EQ(windows.InstanceOf(*other), 1);

  // Without an instance: the newest loaded one; names ignore letter case.
  EXPECT_EQ(windows.Find("FRMMAINDETAILS"), second.get());
  EXPECT_EQ(windows.Find("frmMainDetails", 1), first.get());
  EXPECT_EQ(windows.Find("frmMainDetails", 3), nullptr);
  EXPECT_EQ(windows.Find("frmNada"), nullptr);

  // An unloaded window keeps its number but is not found; it gets it back on reload.
  second->Unload();
  EXPECT_EQ(windows.Find("frmMainDetails"), first.get());
  EXPECT_EQ(windows.Find("frmMainDetails", 2), nullptr);
  second->Show();
  EXPECT_EQ(windows.Find("frmMainDetails", 2), second.get());

  // A window that is gone leaves its number unused, even when a new one takes its place.
  second.reset();
  auto third = std::make_shared<frmSample>("frmMainDetails");
  third->Show();
  EXPECT_EQ(windows.InstanceOf(*third), 3);
  EXPECT_EQ(windows.Find("frmMainDetails", 2), nullptr);
}

}  // namespace
