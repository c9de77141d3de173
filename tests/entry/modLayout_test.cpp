#include "entry/modLayout.h"

#include <gtest/gtest.h>

#include <limits>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "entry/LayoutTestForm.h"
#include "platform/automation/TestSandbox.h"
#include "platform/forms/ScriptedDesktop.h"

namespace {

using entry::testing::HeaderEditorLayoutForm;

struct Geometry {
  int32_t left, top, width, height;
  friend bool operator==(const Geometry&, const Geometry&) = default;
};

struct Snapshot {
  std::map<std::string, Geometry> controls;
  std::vector<int32_t> columns;
  friend bool operator==(const Snapshot&, const Snapshot&) = default;
};

Snapshot Take(HeaderEditorLayoutForm& form) {
  Snapshot shot;
  for (const auto& control : form.Controls())
    shot.controls[control->Name()] = {control->Left(), control->Top(), control->Width(),
                                      control->Height()};
  for (int32_t i = 1; i <= form.ListView1.ColumnHeaders().Count(); ++i)
    shot.columns.push_back(form.ListView1.ColumnHeaders()(i).Width());
  return shot;
}

void PrintTo(const Snapshot& shot, std::ostream* os) {
  for (const auto& [name, g] : shot.controls)
    *os << name << "(" << g.left << "," << g.top << "," << g.width << "," << g.height << ") ";
  for (int32_t width : shot.columns) *os << width << " ";
}

class ProportionalLayout : public ::testing::Test {
 protected:
  void SetUp() override {
    forms::Desktop::Install(desktop);
    form.Show();
    design = Take(form);
  }
  void TearDown() override {
    form.Unload();
    forms::Desktop::Install(nullptr);
  }

  void ResizeBy(int32_t dw, int32_t dh) {
    user.Resize(form.Width() + dw, form.Height() + dh);
  }

  // Errors go to the standard error stream when no reporter is registered.
  dvtest::Sandbox sandbox;
  std::shared_ptr<forms::ScriptedDesktop> desktop = std::make_shared<forms::ScriptedDesktop>();
  HeaderEditorLayoutForm form;
  forms::KeyboardUser user{form};
  Snapshot design;
};

TEST(LayoutShare, RoundsToWholeTwipsHalvesToEven) {
  EXPECT_EQ(entry::LayoutShare(1000, 3), 333);
  EXPECT_EQ(entry::LayoutShare(3, 2), 2);
  EXPECT_EQ(entry::LayoutShare(5, 2), 2);
  EXPECT_EQ(entry::LayoutShare(7, 2), 4);
  EXPECT_EQ(entry::LayoutShare(-1000, 3), -333);
  EXPECT_EQ(entry::LayoutShare(-3, 2), -2);
  EXPECT_EQ(entry::LayoutShare(900, 0), 900);
}

TEST_F(ProportionalLayout, WideningSpreadsTheChangeOverTheColumns) {
  ResizeBy(3000, 1000);

  // Changes of left, top, width and height expected for each control; every other
  // control keeps its design place.
  const std::map<std::string, Geometry> moved = {
      {"Frame1", {0, 0, 3000, 0}},
      {"Frame2", {0, 0, 3000, 1000}},
      {"FXContador_label", {0, 1000, 0, 0}},
      {"FXContador", {0, 1000, 0, 0}},
      {"Toolbar1", {3000, 0, 0, 0}},
      {"FXData", {0, 0, 500, 0}},
      {"FXCreated_By", {0, 0, 500, 0}},
      {"FXTipo", {0, 0, 2000, 0}},
      {"FXTipo_Diario_ID", {1000, 0, 1000, 0}},
      {"FXTipo_Diario_ID_Label", {1000, 0, 0, 0}},
      {"FXTipo_ID", {1000, 0, 1000, 0}},
      {"FXTipo_ID_Label", {1000, 0, 0, 0}},
      {"FXDorvanto_No", {2000, 0, 1000, 0}},
      {"FXDorvanto_No_Label", {2000, 0, 0, 0}},
      {"FXReferencia", {2000, 0, 1000, 0}},
      {"FXReferencia_Label", {2000, 0, 1000, 0}},
      {"FXRelated_ID", {2000, 0, 1000, 0}},
      {"FXRelated_ID_Label", {2000, 0, 1000, 0}},
      {"FXObs", {0, 0, 3000, 0}},
      {"ListView1_Frame", {0, 0, 3000, 1000}},
      {"ListView1", {0, 0, 3000, 1000}},
      {"FXTotal_Debitos", {3000, 1000, 0, 0}},
      {"FXTotal_Debitos_Label", {3000, 1000, 0, 0}},
      {"FXTotal_Creditos", {3000, 1000, 0, 0}},
      {"FXTotal_Creditos_Label", {3000, 1000, 0, 0}},
  };
  const Snapshot now = Take(form);
  for (const auto& [name, was] : design.controls) {
    SCOPED_TRACE(name);
    auto change = moved.find(name);
    const Geometry d = change == moved.end() ? Geometry{0, 0, 0, 0} : change->second;
    EXPECT_EQ(now.controls.at(name), (Geometry{was.left + d.left, was.top + d.top,
                                               was.width + d.width, was.height + d.height}));
  }
  // Columns 3, 4 and 5 of the list take 0.333 of the width change each.
  const std::vector<int32_t> columns = {600, 1200, 2400 + 999, 1800 + 999, 2400 + 999, 1200, 1200};
  EXPECT_EQ(now.columns, columns);
  EXPECT_EQ(form.layout.LarguraAnterior, 11520 + 3000);
  EXPECT_EQ(form.layout.AlturaAnterior, 8000 + 1000);
}

TEST_F(ProportionalLayout, ShrinkingBackReturnsEveryControlToItsDesignPlace) {
  // Odd changes round each share; growing and shrinking by the same amount round the
  // same way, so nothing drifts.
  for (auto [dw, dh] : {std::pair{3001, 7}, {1, 1}, {2999, 1001}, {5, 0}}) {
    ResizeBy(dw, dh);
    ResizeBy(-dw, -dh);
    EXPECT_EQ(Take(form), design) << dw << " x " << dh;
  }

  // Many small steps add up to one large one, give or take a twip a pass.
  for (int i = 0; i < 6; ++i) ResizeBy(500, 100);
  HeaderEditorLayoutForm once;
  once.Show();
  forms::KeyboardUser(once).Resize(11520 + 3000, 8000 + 600);
  const Snapshot stepped = Take(form), direct = Take(once);
  for (const auto& [name, g] : stepped.controls) {
    SCOPED_TRACE(name);
    const Geometry& d = direct.controls.at(name);
    EXPECT_NEAR(g.left, d.left, 6);
    EXPECT_NEAR(g.top, d.top, 6);
    EXPECT_NEAR(g.width, d.width, 6);
    EXPECT_NEAR(g.height, d.height, 6);
  }
  once.Unload();
}

TEST_F(ProportionalLayout, TheWindowIsNeverSmallerThanTheMinimum) {
  testing::internal::CaptureStderr();
  user.Resize(3000, 1500);
  EXPECT_EQ(form.Width(), entry::kMinimumWidth);
  EXPECT_EQ(form.Height(), entry::kMinimumHeight);
  EXPECT_EQ(form.layout.LarguraAnterior, 4000);
  EXPECT_EQ(form.layout.AlturaAnterior, 2000);
  EXPECT_GE(form.resizePasses, 3) << "the snapping raises Resize inside the pass";
  const Snapshot snapped = Take(form);

  // The nested passes applied the change once: the same as going to 4000 x 2000.
  HeaderEditorLayoutForm twin;
  twin.Show();
  forms::KeyboardUser(twin).Resize(4000, 2000);
  EXPECT_EQ(snapped, Take(twin));
  twin.Unload();

  // So small a window asks more width of some controls and columns than they have:
  // they stop at 0 and get exactly their design size back with the window's.
  EXPECT_EQ(snapped.controls.at("FXReferencia_Label").width, 0);
  EXPECT_EQ(snapped.columns[2], 0);
  user.Resize(9000, 1000);
  EXPECT_EQ(form.Width(), 9000);
  EXPECT_EQ(form.Height(), 2000);
  user.Resize(11520, 8000);
  EXPECT_EQ(Take(form), design);
  EXPECT_EQ(testing::internal::GetCapturedStderr(), "") << "a resize is no error";
}

TEST_F(ProportionalLayout, MinimizingAndRestoringLeavesEveryControlWhereItWas) {
  ResizeBy(1500, 500);
  const Snapshot before = Take(form);
  user.Minimize();
  EXPECT_EQ(Take(form), before);
  EXPECT_EQ(form.layout.LarguraAnterior, 11520 + 1500);
  user.Restore();
  EXPECT_EQ(Take(form), before);
  user.Maximize();
  user.Restore();
  EXPECT_EQ(Take(form), before);
}

TEST_F(ProportionalLayout, ProceduresUseExplicitChangesAndClearTheirArguments) {
  forms::Control& box = *form.FindControl("FXObs");
  const Geometry was = design.controls.at("FXObs");

  int32_t Order = 0, Taxa = 0, W_Size = 300, H_Size = 0;
  form.layout.Rpl_Expand_Along(box, Order, Taxa, W_Size, H_Size);  // 0 counts as 1
  EXPECT_EQ(box.Width(), was.width + 300);
  EXPECT_EQ(box.Left(), was.left);
  EXPECT_EQ(Order, 0);
  EXPECT_EQ(Taxa, 0);

  // An explicit change on one axis means none on the other, whatever the window did.
  form.SetHeight(form.Height() + 5000);
  Order = 3, Taxa = 2, W_Size = 300, H_Size = 0;
  form.layout.Rpl_Expand_Bottom(box, Order, Taxa, W_Size, H_Size);
  EXPECT_EQ(box.Height(), was.height);
  Order = 3, Taxa = 2, W_Size = 0, H_Size = 300;
  form.layout.Rpl_Move_Bottom(box, Order, Taxa, W_Size, H_Size);
  EXPECT_EQ(box.Top(), was.top + 2 * 150);
  EXPECT_EQ(box.Height(), was.height);
  Order = 1, Taxa = 1, W_Size = 900, H_Size = 0;
  form.layout.Rpl_Move_Along(box, Order, Taxa, W_Size, H_Size);
  EXPECT_EQ(box.Left(), was.left) << "the first column does not move";
  EXPECT_EQ(Taxa, 0);
}

TEST_F(ProportionalLayout, AControlThatFailsIsReportedAndThePassGoesOn) {
  forms::Control& toolbar = *form.FindControl("Toolbar1");
  toolbar.SetLeft(std::numeric_limits<int32_t>::max() - 1000);
  testing::internal::CaptureStderr();
  ResizeBy(3000, 0);  // Toolbar1 cannot move that far right
  const std::string console = testing::internal::GetCapturedStderr();
  EXPECT_NE(console.find("frmMain.Rpl_Move_Along"), std::string::npos) << console;
  EXPECT_EQ(toolbar.Left(), std::numeric_limits<int32_t>::max() - 1000);
  EXPECT_EQ(form.FindControl("FXTotal_Creditos")->Left(),
            design.controls.at("FXTotal_Creditos").left + 3000);
  EXPECT_EQ(form.layout.LarguraAnterior, 11520 + 3000);
}

TEST_F(ProportionalLayout, AFailedColumnWideningDoesNotMoveTheControlsTwice) {
  form.ListView1.ColumnHeaders()(3).SetWidth(std::numeric_limits<int32_t>::max() - 10);
  testing::internal::CaptureStderr();
  ResizeBy(3000, 0);
  const std::string console = testing::internal::GetCapturedStderr();
  EXPECT_NE(console.find("frmMain.Form_Resize"), std::string::npos) << console;
  EXPECT_EQ(form.layout.LarguraAnterior, 11520 + 3000);

  ResizeBy(0, 500);  // no width change: nothing moves along
  EXPECT_EQ(form.FindControl("FXDorvanto_No")->Left(),
            design.controls.at("FXDorvanto_No").left + 2000);
  EXPECT_EQ(form.FindControl("Toolbar1")->Left(), design.controls.at("Toolbar1").left + 3000);
}

TEST(LayoutTables, EveryRowNamesAControlOfItsWindow) {
  HeaderEditorLayoutForm form;  // builds its layout from frmMain's table
  EXPECT_EQ(entry::frmMainLayout().size(), 33u);
  EXPECT_TRUE(entry::frmMainDetailsLayout().empty());
  EXPECT_EQ(entry::frmFindContaLayout().size(), 12u);

  forms::Form other({.name = "frmOther", .controls = {{.name = "Frame2"}}});
  EXPECT_THROW(entry::FormLayout(other, entry::frmFindContaLayout()), std::logic_error);
}

}  // namespace
