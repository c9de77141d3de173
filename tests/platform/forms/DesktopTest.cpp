#include "platform/forms/Desktop.h"

#include <gtest/gtest.h>

#include "FormsTestSupport.h"

namespace forms::testing {
namespace {

TEST(MessageBoxStyle, DecodesButtonsIconAndDefaultAnswer) {
  MessageBox question{"Remover?", "t", vbYesNo + vbQuestion + vbDefaultButton2};
  EXPECT_EQ(question.Buttons(), MsgButtons::YesNo);
  EXPECT_EQ(question.Icon(), MsgIcon::Question);
  EXPECT_EQ(question.DefaultAnswer(), vbNo);
  EXPECT_TRUE(question.Offers(vbYes));
  EXPECT_FALSE(question.Offers(vbCancel));

  MessageBox lock{"Bloqueado", "Sistema de Segurança", vbCritical + vbSystemModal};
  EXPECT_TRUE(lock.SystemModal());
  EXPECT_EQ(lock.Icon(), MsgIcon::Critical);
  EXPECT_EQ(lock.DefaultAnswer(), vbOK);

  // A third default button on a two-button box falls back to the first.
  MessageBox odd{"x", "t", vbOKCancel + vbDefaultButton3};
  EXPECT_EQ(odd.DefaultAnswer(), vbOK);
  EXPECT_EQ((MessageBox{"x", "t", vbYesNoCancel + vbInformation}).Icon(), MsgIcon::Information);
}

TEST_F(FormsTest, ScriptedBoxesAreRecordedAndAnsweredInOrder) {
  desktop->QueueAnswer(vbCancel);
  EXPECT_EQ(MsgBox("Pretende gravar as alterações e sair?", vbYesNoCancel, "Sair"), vbCancel);
  EXPECT_EQ(MsgBox("Sem título"), vbOK);  // empty queue: the default button
  ASSERT_EQ(desktop->messages.size(), 2u);
  EXPECT_EQ(desktop->messages[0].title, "Sair");
  EXPECT_EQ(desktop->messages[1].title, "POC_Dorvantos");

  desktop->QueueAnswer(vbYes);
  EXPECT_THROW(MsgBox("Só OK"), std::logic_error);

  desktop->QueueInput("abc");
  desktop->QueueInputCancel();
  EXPECT_EQ(InputBox("Senha", "", "x"), "abc");
  EXPECT_EQ(InputBox("Senha", "", "x"), "");
  EXPECT_EQ(InputBox("Senha", "", "x"), "x");
  EXPECT_EQ(desktop->inputs.size(), 3u);
}

TEST(ConsoleDesktop, AnswersTheDefaultButtonWhenNothingIsInstalled) {
  Desktop::Install(nullptr);
  EXPECT_EQ(MsgBox("?", vbYesNo + vbDefaultButton2), vbNo);
  EXPECT_EQ(InputBox("?", "", "proposto"), "proposto");
}

TEST(ConsoleDesktop, ModalFormIsClosedInsteadOfWaitingForever) {
  Desktop::Install(nullptr);
  SampleForm form;
  form.Show(vbModal);
  EXPECT_FALSE(form.Loaded());
  EXPECT_EQ(form.lastUnloadMode, vbFormControlMenu);
}

}  // namespace
}  // namespace forms::testing
