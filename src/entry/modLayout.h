#pragma once
// The proportional layout of the resizable windows (frmMain, frmMainDetails,
// frmFindConta). On every resize a window hands each control of its table a share of
// the change of its width or height since the last pass, as growth or as a shift:
//
//   Order  the control's column (or row), 1-based, among those sharing the change
//   Taxa   how many shares the change is split into
//
// so n side-by-side columns given Taxa n and Order 1..n each grow by one n-th of the
// change and shift right by the shares of the columns before them: they keep their
// proportions and their gaps. Order 2 with Taxa 1 follows the right or bottom edge;
// Order 1 with Taxa 1 and an expand procedure stretches with it.
//
// Each window embeds one FormLayout, which keeps its own LarguraAnterior and
// AlturaAnterior and runs the four procedures and the resize pass for it:
//
//     void Form_Load() override { layout_.RememberDesignSize(); ... }
//     void Form_Resize() override { layout_.ResizePass(); }
//
// A size never goes below 0: what a control cannot give up when the window shrinks is
// taken back first when it grows again, so a window sized back to where it was puts
// every control back where it was.

#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "common/ErrorTrap.h"
#include "platform/forms/Control.h"
#include "platform/forms/Form.h"
#include "platform/forms/ListView.h"

namespace entry {

enum class Rpl { Expand_Along, Expand_Bottom, Move_Along, Move_Bottom };

// One call of a window's resize pass.
struct LayoutRow {
  const char* control;
  Rpl procedure;
  int32_t Order;
  int32_t Taxa;
};

// The tables of the three windows, in call order.
const std::vector<LayoutRow>& frmMainLayout();
const std::vector<LayoutRow>& frmMainDetailsLayout();  // empty: only the minimum size
const std::vector<LayoutRow>& frmFindContaLayout();

// A window is never made smaller than this, in twips.
inline constexpr int32_t kMinimumWidth = 4000;
inline constexpr int32_t kMinimumHeight = 2000;

// The share of a change split into Taxa parts, rounded to whole twips with halves to
// the even neighbour (a change of 3 in 2 parts gives 2).
int32_t LayoutShare(int32_t change, int32_t Taxa);

class FormLayout {
 public:
  // The labels the window's errors are reported with, by procedure name.
  using SiteFn = std::function<common::TrapSite(const std::string& procedure)>;

  // The table's controls are looked up now: a table naming a control the window does
  // not have is a mistake of the program, raised as std::logic_error. Without a site
  // function errors are reported as the window's own (FormSite).
  FormLayout(forms::Form& window, const std::vector<LayoutRow>& table, SiteFn site = {});

  // The window's width and height at the last pass, in twips.
  int32_t LarguraAnterior = 0;
  int32_t AlturaAnterior = 0;

  // Called when the window loads, before it is moved or sized: its size then is the
  // design size, from which the first change is spread.
  void RememberDesignSize();

  // The four procedures. The change is the window's since the last pass, unless
  // W_Size or H_Size is not 0: then they are the changes on each axis. Order and Taxa
  // of 0 count as 1; both are 0 again on return. Errors are reported, not thrown.
  void Rpl_Expand_Along(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa, int32_t& W_Size,
                        int32_t& H_Size);
  void Rpl_Expand_Bottom(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa, int32_t& W_Size,
                         int32_t& H_Size);
  void Rpl_Move_Along(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa, int32_t& W_Size,
                      int32_t& H_Size);
  void Rpl_Move_Bottom(forms::Control& Ctrl, int32_t& Order, int32_t& Taxa, int32_t& W_Size,
                       int32_t& H_Size);

  // The window's resize pass: nothing while minimized; the minimum size; the table;
  // then the window's own step, given the width change (frmMain widens its list's
  // columns); the size remembered.
  void ResizePass(const std::function<void(int32_t widthChange)>& afterTable = {});

  // frmMain's step: the columns 3, 4 and 5 of its lines list (the sub-account's
  // description, the account, the description) widen by 0.333 of the change each.
  void WidenLinesListColumns(forms::ListView& list, int32_t widthChange);

 private:
  struct Step {
    forms::Control* control;
    Rpl procedure;
    int32_t Order;
    int32_t Taxa;
  };
  void Run(const char* procedure, bool expand, bool along, forms::Control& Ctrl, int32_t& Order,
           int32_t& Taxa, int32_t W_Size, int32_t H_Size);
  void Apply(const Step& step);
  void EnforceMinimumSize();
  int32_t Grown(const void* item, int axis, int32_t size, int32_t share);

  forms::Form& window_;
  std::vector<Step> steps_;
  SiteFn site_;
  // What a size could not give up when the window shrank, by control (or column) and
  // axis: taken back first when the window grows again.
  std::map<std::pair<const void*, int>, int64_t> owed_;
};

}  // namespace entry
