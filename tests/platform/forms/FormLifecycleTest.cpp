#include <gtest/gtest.h>

#include <algorithm>

#include "FormsTestSupport.h"

namespace forms::testing {
namespace {

bool IsLoaded(const Form& form) {
  const auto& loaded = LoadedForms();
  return std::find(loaded.begin(), loaded.end(), &form) != loaded.end();
}

TEST_F(FormsTest, TouchingAControlLoadsTheFormAndUnloadRestoresTheDesign) {
  SampleForm form;
  EXPECT_FALSE(form.Loaded());
  EXPECT_EQ(form.Text2.Text(), "design");
  EXPECT_EQ(form.loads, 1);
  EXPECT_TRUE(IsLoaded(form));
  EXPECT_FALSE(form.Visible());

  form.Text2.SetText("mudado");
  ASSERT_TRUE(form.Unload());
  EXPECT_FALSE(IsLoaded(form));
  // The next touch brings the form back as designed, and runs Load again.
  EXPECT_EQ(form.Text2.Text(), "design");
  EXPECT_EQ(form.loads, 2);
  EXPECT_EQ(std::count(form.log.begin(), form.log.end(), "Text1.Change "), 0)
      << "applying the design raises no events";
}

TEST_F(FormsTest, UnloadCancelledByItsHandlerKeepsTheFormLoadedAndShown) {
  SampleForm form;
  form.Show();
  form.cancelUnload = 1;
  EXPECT_FALSE(KeyboardUser(form).CloseWindow());
  EXPECT_EQ(form.lastUnloadMode, vbFormControlMenu);
  EXPECT_TRUE(form.Showing());
  EXPECT_TRUE(IsLoaded(form));

  form.cancelUnload = 0;
  EXPECT_TRUE(form.Unload());
  EXPECT_EQ(form.lastUnloadMode, vbFormCode);
  EXPECT_FALSE(form.Loaded());
}

TEST_F(FormsTest, ModalShowReturnsWhenTheFormHidesItself) {
  SampleForm dialog;
  dialog.hideOnOK = true;
  desktop->WhenShown("frmSample", [](Form& shown) { KeyboardUser(shown).Click("Command1"); });
  dialog.Show(vbModal);
  EXPECT_FALSE(dialog.Showing());
  EXPECT_TRUE(dialog.Loaded()) << "hidden, so its opener can still read it";
  EXPECT_EQ(desktop->modalForms, std::vector<std::string>{"frmSample"});
  EXPECT_TRUE(desktop->leftOpen.empty());
  EXPECT_NE(std::find(dialog.log.begin(), dialog.log.end(), "Command1.Click"), dialog.log.end());
  EXPECT_EQ(std::count(dialog.log.begin(), dialog.log.end(), "Form_QueryUnload 0"), 0)
      << "the close box was not needed";
}

TEST_F(FormsTest, ModalFormThatRefusesToCloseIsHiddenAndReported) {
  SampleForm stubborn;
  stubborn.cancelUnload = 1;
  stubborn.Show(vbModal);
  EXPECT_FALSE(stubborn.Showing());
  EXPECT_EQ(desktop->leftOpen, std::vector<std::string>{"frmSample"});
}

TEST_F(FormsTest, WaitWhileVisibleRunsTheScriptOfAModelessDialog) {
  SampleForm dialog;
  dialog.unloadOnOK = true;
  desktop->WhenShown("frmSample", [](Form& shown) { KeyboardUser(shown).Click("Command1"); });
  dialog.Show();
  Desktop::Current().WaitWhileVisible(dialog);
  EXPECT_FALSE(dialog.Loaded());
}

// A window that never gets smaller than 4000 x 2000 twips, as the editors keep it.
class MinimumSizeForm : public SampleForm {
 public:
  std::vector<std::pair<int32_t, int32_t>> passes;

 protected:
  void Form_Resize() override {
    if (WindowState() == vbMinimized) return;
    if (Width() <= 4000) SetWidth(4000);  // nests a complete pass
    if (Height() <= 2000) SetHeight(2000);
    passes.emplace_back(Width(), Height());
  }
};

TEST_F(FormsTest, ResizeNestsWhenAHandlerEnforcesAMinimumSize) {
  MinimumSizeForm form;
  form.Show();
  form.passes.clear();
  KeyboardUser(form).Resize(3000, 1000);
  EXPECT_EQ(form.Width(), 4000);
  EXPECT_EQ(form.Height(), 2000);
  // Inner passes first: the height snap inside the width snap, then the outer passes.
  ASSERT_EQ(form.passes.size(), 3u);
  for (const auto& pass : form.passes) EXPECT_EQ(pass, std::make_pair(4000, 2000));

  form.passes.clear();
  KeyboardUser(form).Minimize();
  KeyboardUser(form).Restore();
  EXPECT_EQ(form.passes.size(), 1u) << "minimize raises Resize too; the handler skips it";
}

TEST_F(FormsTest, ActivateAndZOrderAreRecorded) {
  SampleForm first, second;
  first.Show();
  second.Show();
  EXPECT_EQ(ActiveForm(), &second);
  SetWindowPos(second, HWND_TOPMOST, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
  EXPECT_TRUE(second.TopMost());
  SetWindowPos(second, HWND_NOTOPMOST, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE);
  EXPECT_FALSE(second.TopMost());
  EXPECT_EQ(desktop->windowOrders.size(), 2u);
  // Closing the active window activates the one used before it.
  first.log.clear();
  second.Unload();
  EXPECT_EQ(ActiveForm(), &first);
  EXPECT_EQ(first.log, std::vector<std::string>{"Form_Activate"});
}

TEST_F(FormsTest, MousePointerChangesReachTheDesktop) {
  SampleForm form;
  form.SetMousePointer(vbHourglass);
  form.SetMousePointer(vbHourglass);
  form.SetMousePointer(vbDefault);
  ASSERT_EQ(desktop->pointers.size(), 2u);
  EXPECT_EQ(desktop->pointers[0].pointer, vbHourglass);
  EXPECT_EQ(desktop->pointers[1].pointer, vbDefault);
}

class Recorder : public FormListener {
 public:
  std::vector<std::string> seen;
  void FormLoaded(Form& f) override { seen.push_back("loaded " + f.Name()); }
  void FormShown(Form& f, bool modal) override { seen.push_back("shown " + f.Name()); }
  void FormUnloaded(Form& f) override { seen.push_back("unloaded " + f.Name()); }
  void ControlChanged(Control& c, std::string_view p) override {
    seen.push_back(c.Name() + "." + std::string(p));
  }
};

TEST_F(FormsTest, ListenersSeeLifecycleAndPropertyChangesButNotTheDesign) {
  Recorder recorder;
  AddListener(&recorder);
  SampleForm form;
  form.Show();
  form.Text1.SetText("x");
  form.Unload();
  RemoveListener(&recorder);
  EXPECT_EQ(recorder.seen, (std::vector<std::string>{"loaded frmSample", "shown frmSample",
                                                     "Text1.Text", "unloaded frmSample"}));
}

}  // namespace
}  // namespace forms::testing
