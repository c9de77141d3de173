#include "entry/modLayout.h"

#include <limits>
#include <stdexcept>

#include "platform/forms/Constants.h"
#include "platform/vb/Conversions.h"
#include "platform/vb/Error.h"

namespace entry {
namespace {

using R = Rpl;

// A position or size pushed beyond what a control can hold is an overflow, reported
// like any other error of the procedure, never a wrapped-around coordinate.
int32_t Checked(int64_t twips) {
  if (twips < std::numeric_limits<int32_t>::min() || twips > std::numeric_limits<int32_t>::max())
    throw vb::Error(vb::kErrOverflow);
  return static_cast<int32_t>(twips);
}

}  // namespace

const std::vector<LayoutRow>& frmMainLayout() {
  // The header fields stand in three columns: FXData, FXCreated_By and FXTipo in the
  // first (FXTipo spanning the second too, hence its two shares), FXTipo_Diario_ID and
  // FXTipo_ID in the second, FXDorvanto_No, FXReferencia and FXRelated_ID in the third.
  // FXData and FXCreated_By grow by a sixth while the column after them moves by a
  // third. The frames, the notes and the list stretch; the toolbar keeps to the right
  // edge, the totals to the bottom right corner and the counter to the bottom.
  static const std::vector<LayoutRow> table = {
      {"Frame1", R::Expand_Along, 1, 1},
      {"Frame2", R::Expand_Along, 1, 1},
      {"Frame2", R::Expand_Bottom, 1, 1},
      {"FXContador_label", R::Move_Bottom, 2, 1},
      {"FXContador", R::Move_Bottom, 2, 1},
      {"Toolbar1", R::Move_Along, 2, 1},
      {"FXData", R::Expand_Along, 1, 6},
      {"FXTipo_Diario_ID", R::Expand_Along, 2, 3},
      {"FXTipo_Diario_ID_Label", R::Move_Along, 2, 3},
      {"FXDorvanto_No", R::Expand_Along, 3, 3},
      {"FXDorvanto_No_Label", R::Move_Along, 3, 3},
      {"FXTipo_ID", R::Expand_Along, 2, 3},
      {"FXTipo_ID_Label", R::Move_Along, 2, 3},
      {"FXReferencia_Label", R::Expand_Along, 3, 3},
      {"FXReferencia", R::Expand_Along, 3, 3},
      {"FXRelated_ID", R::Expand_Along, 3, 3},
      {"FXRelated_ID_Label", R::Expand_Along, 3, 3},
      {"FXTipo", R::Expand_Along, 1, 3},
      {"FXTipo", R::Expand_Along, 1, 3},
      {"FXCreated_By", R::Expand_Along, 1, 6},
      {"FXObs", R::Expand_Along, 1, 1},
      {"ListView1_Frame", R::Expand_Along, 1, 1},
      {"ListView1_Frame", R::Expand_Bottom, 1, 1},
      {"ListView1", R::Expand_Along, 1, 1},
      {"ListView1", R::Expand_Bottom, 1, 1},
      {"FXTotal_Debitos", R::Move_Along, 2, 1},
      {"FXTotal_Debitos_Label", R::Move_Along, 2, 1},
      {"FXTotal_Creditos", R::Move_Along, 2, 1},
      {"FXTotal_Creditos_Label", R::Move_Along, 2, 1},
      {"FXTotal_Debitos", R::Move_Bottom, 2, 1},
      {"FXTotal_Debitos_Label", R::Move_Bottom, 2, 1},
      {"FXTotal_Creditos", R::Move_Bottom, 2, 1},
      {"FXTotal_Creditos_Label", R::Move_Bottom, 2, 1},
  };
  return table;
}

const std::vector<LayoutRow>& frmMainDetailsLayout() {
  // The line editor's controls never move; its pass only keeps the minimum size.
  static const std::vector<LayoutRow> table;
  return table;
}

const std::vector<LayoutRow>& frmFindContaLayout() {
  // The tree and its frames stretch, the buttons keep to the bottom right corner and
  // the progress bar with its label to the bottom.
  static const std::vector<LayoutRow> table = {
      {"Frame2", R::Expand_Along, 1, 1},
      {"Frame2", R::Expand_Bottom, 1, 1},
      {"TreeView1_Border", R::Expand_Along, 1, 1},
      {"TreeView1_Border", R::Expand_Bottom, 1, 1},
      {"TreeView1", R::Expand_Along, 1, 1},
      {"TreeView1", R::Expand_Bottom, 1, 1},
      {"Command1", R::Move_Along, 2, 1},
      {"Command1", R::Move_Bottom, 2, 1},
      {"Command2", R::Move_Along, 2, 1},
      {"Command2", R::Move_Bottom, 2, 1},
      {"ProgressBar1", R::Move_Bottom, 2, 1},
      {"ProgressBar1_Label", R::Move_Bottom, 2, 1},
  };
  return table;
}

int32_t LayoutShare(int32_t change, int32_t Taxa) {
  if (Taxa == 0) Taxa = 1;
  return Checked(static_cast<int64_t>(vb::RoundHalfEven(static_cast<double>(change) / Taxa)));
}

FormLayout::FormLayout(forms::Form& window, const std::vector<LayoutRow>& table, SiteFn site)
    : window_(window), site_(std::move(site)) {
  if (!site_) {
    site_ = [&window](const std::string& procedure) {
      return common::FormSite(window.Name(), procedure);
    };
  }
  steps_.reserve(table.size());
  for (const LayoutRow& row : table) {
    forms::Control* control = window.FindControl(row.control);
    if (!control)
      throw std::logic_error("the layout of " + window.Name() + " names " + row.control +
                             ", which the window does not have");
    steps_.push_back({control, row.procedure, row.Order, row.Taxa});
  }
}

void FormLayout::RememberDesignSize() {
  LarguraAnterior = window_.Width();
  AlturaAnterior = window_.Height();
  owed_.clear();  // the controls are back at their design sizes
}

int32_t FormLayout::Grown(const void* item, int axis, int32_t size, int32_t share) {
  // A size cannot go below 0. A window narrowed to its minimum can ask more of a
  // control than it has; the rest is remembered and taken back first when the window
  // grows again, so that widening back returns the control to its earlier size
  // instead of leaving it as many twips too wide.
  auto key = std::make_pair(item, axis);
  auto found = owed_.find(key);
  const int64_t owed = found == owed_.end() ? 0 : found->second;
  const int64_t wanted = int64_t{size} - owed + share;
  const int32_t granted = wanted < 0 ? 0 : Checked(wanted);
  if (granted == wanted) {
    if (found != owed_.end()) owed_.erase(found);
  } else {
    owed_[key] = granted - wanted;
  }
  return granted;
}

void FormLayout::WidenLinesListColumns(forms::ListView& list, int32_t widthChange) {
  // 0.333 of the change each, not a third: together the three columns stay a little
  // under the width the list itself gained.
  const int32_t share =
      Checked(static_cast<int64_t>(vb::RoundHalfEven(static_cast<double>(widthChange) * 0.333)));
  for (int32_t index : {3, 4, 5}) {
    forms::ColumnHeader& column = list.ColumnHeaders()(index);
    column.SetWidth(Grown(&column, 0, column.Width(), share));
  }
}

void FormLayout::Run(const char* procedure, bool expand, bool along, forms::Control& Ctrl,
                     int32_t& Order, int32_t& Taxa, int32_t W_Size, int32_t H_Size) {
  common::Trap(site_(procedure), [&] {
    if (Taxa == 0) Taxa = 1;
    if (Order == 0) Order = 1;
    // Once either explicit change is given, both replace the window's: a 0 given for
    // one axis means no change on that axis.
    const bool explicitChange = W_Size != 0 || H_Size != 0;
    int64_t change = 0;
    if (along)
      change = explicitChange ? W_Size : int64_t{window_.Width()} - LarguraAnterior;
    else
      change = explicitChange ? H_Size : int64_t{window_.Height()} - AlturaAnterior;
    const int32_t share = LayoutShare(Checked(change), Taxa);

    if (expand) {
      if (along)
        Ctrl.SetWidth(Grown(&Ctrl, 0, Ctrl.Width(), share));
      else
        Ctrl.SetHeight(Grown(&Ctrl, 1, Ctrl.Height(), share));
    }
    if (Order != 1) {
      const int64_t shift = int64_t{share} * (int64_t{Order} - 1);
      if (along)
        Ctrl.SetLeft(Checked(Ctrl.Left() + shift));
      else
        Ctrl.SetTop(Checked(Ctrl.Top() + shift));
    }
    Order = 0;
    Taxa = 0;
  });
}

void FormLayout::Rpl_Expand_Along(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa,
                                  int32_t& W_Size, int32_t& H_Size) {
  Run("Rpl_Expand_Along", true, true, Ctrl, Order, Taxa, W_Size, H_Size);
}

void FormLayout::Rpl_Expand_Bottom(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa,
                                   int32_t& W_Size, int32_t& H_Size) {
  Run("Rpl_Expand_Bottom", true, false, Ctrl, Order, Taxa, W_Size, H_Size);
}

void FormLayout::Rpl_Move_Along(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa,
                                int32_t& W_Size, int32_t& H_Size) {
  Run("Rpl_Move_Along", false, true, Ctrl, Order, Taxa, W_Size, H_Size);
}

void FormLayout::Rpl_Move_Bottom(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa,
                                 int32_t& W_Size, int32_t& H_Size) {
  Run("Rpl_Move_Bottom", false, false, Ctrl, Order, Taxa, W_Size, H_Size);
}

void FormLayout::Apply(const Step& step) {
  // Fresh variables for every call: the procedures clear them.
  int32_t Order = step.Order, Taxa = step.Taxa, W_Size = 0, H_Size = 0;
  switch (step.procedure) {
    case Rpl::Expand_Along: return Rpl_Expand_Along(*step.control, Order, Taxa, W_Size, H_Size);
    case Rpl::Expand_Bottom: return Rpl_Expand_Bottom(*step.control, Order, Taxa, W_Size, H_Size);
    case Rpl::Move_Along: return Rpl_Move_Along(*step.control, Order, Taxa, W_Size, H_Size);
    case Rpl::Move_Bottom: return Rpl_Move_Bottom(*step.control, Order, Taxa, W_Size, H_Size);
  }
}

void FormLayout::EnforceMinimumSize() {
  // Each change raises Resize again, inside this pass: that nested pass lays the
  // controls out for the new size and remembers it, so what follows here finds no
  // change left to apply.
  if (window_.Width() <= kMinimumWidth) window_.SetWidth(kMinimumWidth);
  if (window_.Height() <= kMinimumHeight) window_.SetHeight(kMinimumHeight);
}

void FormLayout::ResizePass(const std::function<void(int32_t widthChange)>& afterTable) {
  common::Trap(site_("Form_Resize"), [&] {
    // A minimized window keeps its layout and its remembered size, so restoring it
    // changes nothing.
    if (window_.WindowState() == forms::vbMinimized) return;
    EnforceMinimumSize();
    for (const Step& step : steps_) Apply(step);
    if (afterTable) {
      // The controls have taken this change now, whatever becomes of the window's own
      // step: the size is remembered even when that step fails, or the next pass would
      // move every control by the same change a second time.
      const int32_t widthChange = window_.Width() - LarguraAnterior;
      common::Trap(site_("Form_Resize"), [&] { afterTable(widthChange); });
    }
    LarguraAnterior = window_.Width();
    AlturaAnterior = window_.Height();
  });
}

}  // namespace entry
