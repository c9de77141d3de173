#include <gtest/gtest.h>

#include "FormsTestSupport.h"
#include "platform/vb/Error.h"

namespace forms::testing {
namespace {

using Log = std::vector<std::string>;

class FocusAndKeys : public FormsTest {
 protected:
  void SetUp() override {
    FormsTest::SetUp();
    form.Show();
    form.log.clear();
  }
  SampleForm form;
  KeyboardUser user{form};
};

TEST_F(FocusAndKeys, ShowingFocusesTheFirstControlInTabOrder) {
  SampleForm fresh;
  fresh.Show();
  EXPECT_EQ(fresh.ActiveControl(), &fresh.Text1);
  EXPECT_EQ(fresh.log, (Log{"Form_Load", "Form_Resize", "Form_Activate", "Text1.GotFocus"}));
}

TEST_F(FocusAndKeys, FocusMoveRaisesValidateLostFocusGotFocusInOrder) {
  ASSERT_TRUE(user.Focus("Text2"));
  EXPECT_EQ(form.log, (Log{"Text1.Validate", "Text1.LostFocus", "Text2.GotFocus"}));
}

TEST_F(FocusAndKeys, ValidateCancelKeepsTheFocusAndStopsTheClick) {
  form.refuseText1 = 1;
  EXPECT_FALSE(user.Focus("Text2"));
  EXPECT_EQ(form.ActiveControl(), &form.Text1);
  EXPECT_FALSE(user.Click("Command1"));
  EXPECT_EQ(form.log, (Log{"Text1.Validate", "Text1.Validate"}));
  // By code too: SetFocus asks the same question.
  form.Text2.SetFocus();
  EXPECT_EQ(form.ActiveControl(), &form.Text1);
  // A control that does not cause validation is reached anyway.
  form.Command2.SetCausesValidation(false);
  EXPECT_TRUE(user.Click("Command2"));
  EXPECT_EQ(form.log.back(), "Command2.Click");
}

TEST_F(FocusAndKeys, OneKeystrokeRaisesKeyDownKeyPressChangeKeyUp) {
  user.Type("a");
  EXPECT_EQ(form.log, (Log{"Text1.KeyDown 65", "Text1.KeyPress 97", "Text1.Change a", "Text1.KeyUp 65"}));
  form.log.clear();
  user.Press(vbKeyBack);
  EXPECT_EQ(form.log, (Log{"Text1.KeyDown 8", "Text1.KeyPress 8", "Text1.Change ", "Text1.KeyUp 8"}));
  form.log.clear();
  // Enter produces a character but puts nothing into a one-line box.
  user.Press(vbKeyReturn);
  EXPECT_EQ(form.log, (Log{"Text1.KeyDown 13", "Text1.KeyPress 13", "Text1.KeyUp 13"}));
}

TEST_F(FocusAndKeys, HandlersSwallowKeysBySettingThemToZero) {
  form.swallowKeyAscii = '1';
  form.swallowKeyCode = '2';
  user.Type("123");
  EXPECT_EQ(form.Text1.Text(), "3");
  form.log.clear();
  // Delete has no character: KeyDown then the box's own deletion.
  form.Text1.SetSelStart(0);
  user.Press(vbKeyDelete);
  EXPECT_EQ(form.Text1.Text(), "");
  EXPECT_EQ(form.log, (Log{"Text1.KeyDown 46", "Text1.Change ", "Text1.KeyUp 46"}));
}

TEST_F(FocusAndKeys, TypingEditsAtTheCaretInCharactersAndHonoursMaxLengthAndLocked) {
  form.Text1.SetText("€ 12");
  form.Text1.SetSelStart(1);
  form.Text1.SetSelLength(3);  // " 12"
  user.Type("çã");
  EXPECT_EQ(form.Text1.Text(), "€çã");
  EXPECT_EQ(form.Text1.SelStart(), 3);
  form.Text1.SetMaxLength(4);
  user.Type("xy");
  EXPECT_EQ(form.Text1.Text(), "€çãx");
  form.Text1.SetLocked(true);
  user.Press(vbKeyBack);
  EXPECT_EQ(form.Text1.Text(), "€çãx");
}

TEST_F(FocusAndKeys, DefaultAndCancelButtonsTakeEnterAndEscape) {
  form.Command1.SetDefault(true);
  form.Command2.SetCancel(true);
  user.Press(vbKeyReturn);
  user.Press(vbKeyEscape);
  EXPECT_EQ(form.log, (Log{"Command1.Click", "Command2.Click"}));
  // Only one default button per form.
  form.Command2.SetDefault(true);
  EXPECT_FALSE(form.Command1.Default());
}

TEST_F(FocusAndKeys, CodeRaisesTheEventsOfAUsersEdit) {
  form.Text1.SetText("12,5");
  form.Text1.SetText("12,5");  // no change, no event
  form.Check1.SetValue(vbChecked);
  form.Combo1.AddItem("Caixa");
  form.Combo1.AddItem("Banco");
  form.Combo1.SetListIndex(1);
  EXPECT_EQ(form.log, (Log{"Text1.Change 12,5", "Check1.Click 1", "Combo1.Click 1"}));
  EXPECT_EQ(form.Combo1.Text(), "Banco");
  EXPECT_THROW(form.Combo1.SetText("Outro"), vb::Error);  // a drop-down list takes only entries
}

TEST_F(FocusAndKeys, UnloadingFromKeyDownEndsTheKeystroke) {
  form.Text1.KeyDown = [&](int&, int) { form.Unload(); };
  user.Type("a");
  EXPECT_FALSE(form.Loaded()) << "the rest of the keystroke must not load the form again";
}

}  // namespace
}  // namespace forms::testing
