// The header editor as a window: loading, the front, closing, toolbars, list and menu.

#include "frmMain_fixture.h"

namespace entry::testing {
namespace {

using forms::KeyboardUser;

TEST_F(HeaderEditorTest, LoadingCoversTheScreenFillsTheListsAndSpreadsTheLayout) {
  const int32_t designToolbarLeft = form->Toolbar1.Design().left;
  const int32_t designWidth = 12000;
  form->Load();
  EXPECT_EQ(form->Left(), 1000);
  EXPECT_EQ(form->Top(), 1000);
  EXPECT_EQ(form->Width(), desktop->screenWidth - 2000);
  EXPECT_EQ(form->Height(), desktop->screenHeight - 2000);
  // The toolbar keeps to the right edge from the design on.
  EXPECT_EQ(form->Toolbar1.Left(), designToolbarLeft + form->Width() - designWidth);

  EXPECT_EQ(form->FXTipo_Diario_ID.ListCount(), 7);
  EXPECT_EQ(form->FXTipo_Diario_ID.List(0), "Abertura e encerramento");  // by name
  // Only integration types tied to a journal are offered.
  EXPECT_EQ(form->FXTipo.ListCount(), 9);
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
  EXPECT_FALSE(form->SaveMark());
}

TEST_F(HeaderEditorTest, ComingToTheFrontGoesAboveAllWithoutStayingOnTop) {
  Open(AddEntry());
  ASSERT_GE(desktop->windowOrders.size(), 2u);
  const auto& orders = desktop->windowOrders;
  EXPECT_EQ(orders[orders.size() - 2].insertAfter, forms::HWND_TOPMOST);
  EXPECT_EQ(orders.back().insertAfter, forms::HWND_NOTOPMOST);
  EXPECT_FALSE(form->TopMost());
}

TEST_F(HeaderEditorTest, AnOpenEntryCannotBeClosedAndTheHostHearsOfItAnyway) {
  const int32_t id = AddEntry();
  Open(id);
  form->FXObs.SetText("por gravar");
  desktop->QueueAnswer(forms::vbOK);
  desktop->QueueAnswer(forms::vbNo);
  EXPECT_FALSE(KeyboardUser(*form).CloseWindow());
  ASSERT_EQ(desktop->messages.size(), 2u);
  EXPECT_EQ(desktop->messages[0].text, "Não pode fechar este lançamento sem finalizar.");
  EXPECT_EQ(desktop->messages[0].style, forms::vbInformation);
  EXPECT_EQ(desktop->messages[0].title, "Lançamento no Diário");
  EXPECT_EQ(desktop->messages[1].text, "Pretende gravar as alterações e sair?");
  EXPECT_EQ(desktop->messages[1].title, "Sair");
  EXPECT_EQ(desktop->messages[1].Buttons(), forms::MsgButtons::YesNoCancel);
  EXPECT_TRUE(form->Showing());
  EXPECT_EQ(vb::CLng(caller->OnlyCall("RemoteKey").at(0)), id);
}

TEST_F(HeaderEditorTest, AFinalEntryClosesAtOnceOrAfterItsChangesAreSaved) {
  const int32_t id = AddEntry(", finalizado", ", 1");
  Open(id);
  EXPECT_TRUE(KeyboardUser(*form).CloseWindow());
  EXPECT_TRUE(desktop->messages.empty());
  EXPECT_EQ(vb::CLng(caller->OnlyCall("RemoteKey").at(0)), id);

  // Cancel keeps it; Yes saves and closes.
  Open(id);
  form->FXObs.SetText("nota final");
  desktop->QueueAnswer(forms::vbCancel);
  EXPECT_FALSE(KeyboardUser(*form).CloseWindow());
  desktop->QueueAnswer(forms::vbYes);
  EXPECT_TRUE(KeyboardUser(*form).CloseWindow());
  EXPECT_EQ(vb::CStr(Scalar("SELECT obs FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id))),
            "nota final");
  EXPECT_EQ(caller->calls.size(), 3u);
}

TEST_F(HeaderEditorTest, ASaveThatFailsOnClosingKeepsTheWindowAndACallerThatFailsIsIgnored) {
  const int32_t id = AddEntry(", finalizado", ", 1");
  Open(id);
  form->FXData.SetValue(*vb::DateSerial(2009, 3, 1));
  desktop->QueueAnswer(forms::vbYes);
  EXPECT_FALSE(KeyboardUser(*form).CloseWindow());
  EXPECT_EQ(desktop->messages.back().title, "Sistema de Segurança");

  caller->failing = true;
  form->DoOpen(id);
  EXPECT_TRUE(KeyboardUser(*form).CloseWindow());
  EXPECT_EQ(caller->calls.size(), 2u);
}

TEST_F(HeaderEditorTest, TheWindowToolbarRunsItsCommandsUnderTheHourglass) {
  const int32_t id = AddEntry();
  Open(id);
  KeyboardUser user(*form);
  form->FXReferencia.SetText("R-1");
  desktop->pointers.clear();
  ASSERT_TRUE(user.ClickButton(form->Toolbar1, "gravar"));
  EXPECT_EQ(vb::CStr(Scalar("SELECT referencia FROM tbPOC_Dorvantos WHERE dorvanto_id = " + std::to_string(id))),
            "R-1");
  ASSERT_FALSE(desktop->pointers.empty());
  EXPECT_EQ(desktop->pointers.front().pointer, forms::vbHourglass);
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);

  ASSERT_TRUE(user.ClickButton(form->Toolbar1, "finalizar"));
  EXPECT_EQ(form->finalizations, 1);

  desktop->QueueAnswer(forms::vbNo);
  ASSERT_TRUE(user.ClickButton(form->Toolbar1, "apagar"));
  EXPECT_EQ(desktop->messages.back().text, "Deseja mesmo remover este lançamento ?");

  desktop->QueueAnswer(forms::vbOK);
  ASSERT_TRUE(user.ClickButton(form->Toolbar1, "fechar"));
  EXPECT_TRUE(form->Showing());  // open entries stay
  EXPECT_EQ(form->MousePointer(), forms::vbDefault);
}

TEST_F(HeaderEditorTest, TheLineCommandsOpenFreshLineEditorsOnTheSelectedLine) {
  const int32_t id = AddEntry();
  const int32_t first = AddLine(id, "10", "0");
  const int32_t second = AddLine(id, "0", "10");
  Open(id);
  KeyboardUser user(*form);

  ASSERT_TRUE(user.ClickButton(form->Toolbar2, "novo"));
  ASSERT_EQ(lineEditors.size(), 1u);
  EXPECT_EQ(vb::CLng(lineEditors[0]->OnlyCall("DoInsert").at(0)), id);
  EXPECT_EQ(lineEditors[0]->objects["MainClass"].lock(), form);

  ASSERT_TRUE(user.ClickItem(form->ListView1, Key(second)));
  ASSERT_TRUE(user.DoubleClickItem(form->ListView1, Key(second)));
  ASSERT_EQ(lineEditors.size(), 2u);
  EXPECT_EQ(vb::CLng(lineEditors[1]->OnlyCall("DoOpen").at(0)), second);

  ASSERT_TRUE(user.ClickButton(form->Toolbar2, "abrir"));
  EXPECT_EQ(vb::CLng(lineEditors[2]->OnlyCall("DoOpen").at(0)), second);

  // A removal the line editor confirms takes exactly that item; the totals wait.
  ASSERT_TRUE(user.ClickButton(form->Toolbar2, "remover"));
  EXPECT_EQ(vb::CLng(lineEditors[3]->OnlyCall("DoRemove").at(0)), second);
  EXPECT_EQ(Keys(), std::vector<std::string>{Key(first)});
  EXPECT_EQ(form->FXTotal_Creditos.Text(), "€ 10,00");

  lineRemoved = false;
  ASSERT_TRUE(user.ClickItem(form->ListView1, Key(first)));
  ASSERT_TRUE(user.ClickButton(form->Toolbar2, "remover"));
  EXPECT_EQ(Keys(), std::vector<std::string>{Key(first)});

  const size_t before = lineEditors.size();
  // Disabled on an ordinary entry, and inert even when a system document enables them.
  EXPECT_FALSE(user.ClickButton(form->Toolbar2, "importar"));
  form->Toolbar2.ButtonClick(Button(form->Toolbar2, "importar"));
  form->Toolbar2.ButtonClick(Button(form->Toolbar2, "predefinidos"));
  EXPECT_EQ(lineEditors.size(), before);
}

TEST_F(HeaderEditorTest, OpeningOrRemovingWithoutALineDoesNothingOrReports) {
  const int32_t id = AddEntry();
  Open(id);
  KeyboardUser user(*form);
  // An empty list opens nothing.
  ASSERT_TRUE(user.Click(form->ListView1));
  ASSERT_TRUE(user.DoubleClick(form->ListView1));
  EXPECT_TRUE(lineEditors.empty());

  // Lines but none selected: there is no key to read, and that is reported.
  AddLine(id, "1", "0");
  form->DoFillDorvantos();
  ASSERT_TRUE(user.ClickButton(form->Toolbar2, "abrir"));
  EXPECT_TRUE(lineEditors.empty());
  EXPECT_NE(TakeErrors().find("frmMain.Toolbar2_ButtonClick"), std::string::npos);
}

TEST_F(HeaderEditorTest, TheContextMenuOffersWhatTheEntryAndTheClickAllow) {
  const int32_t id = AddEntry();
  const int32_t line = AddLine(id, "10", "0");
  Open(id);
  KeyboardUser user(*form);
  auto enabled = [&](const std::string& name) {
    for (const auto& item : desktop->menus.back().items)
      if (item.name == name) return item.enabled;
    ADD_FAILURE() << name;
    return false;
  };

  ASSERT_TRUE(user.RightClick(form->ListView1));
  EXPECT_TRUE(enabled("mnNovo"));
  EXPECT_FALSE(enabled("mnAbrir"));
  EXPECT_FALSE(enabled("mnRemover"));

  desktop->QueueMenuChoice("mnAbrir");
  ASSERT_TRUE(user.ClickItem(form->ListView1, Key(line), forms::vbRightButton));
  EXPECT_TRUE(enabled("mnAbrir"));
  EXPECT_TRUE(enabled("mnRemover"));
  ASSERT_EQ(lineEditors.size(), 1u);
  EXPECT_EQ(vb::CLng(lineEditors[0]->OnlyCall("DoOpen").at(0)), line);

  // A final entry takes no new lines from the menu, but F2 still asks the line editor.
  Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1 WHERE dorvanto_id = " + std::to_string(id));
  form->DoOpen(id);
  ASSERT_TRUE(user.ClickItem(form->ListView1, Key(line), forms::vbRightButton));
  EXPECT_FALSE(enabled("mnNovo"));
  EXPECT_FALSE(enabled("mnRemover"));
  ASSERT_TRUE(user.Focus(form->ListView1));
  user.Press(forms::vbKeyF2);
  ASSERT_EQ(lineEditors.size(), 2u);
  EXPECT_EQ(vb::CLng(lineEditors[1]->OnlyCall("DoInsert").at(0)), id);

  EXPECT_FALSE(user.EditLabel(form->ListView1, Key(line)));
}

}  // namespace
}  // namespace entry::testing
