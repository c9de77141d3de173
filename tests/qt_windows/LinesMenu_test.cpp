// The context menu of the header editor's lines list, opened with the right button on
// the real list: what it offers for a line, for no line and for a final entry, and
// what its commands do.

#include <QMenu>

#include "qt_windows/WindowsFixture.h"

namespace dvqt::windows {
namespace {

class LinesMenu : public WindowsTest {
 protected:
  void SetUp() override {
    WindowsTest::SetUp();
    common::SqlServer()->Execute(
        "INSERT INTO tbPOC_Dorvantos (data, created_by, valor, finalizado, tipo_diario_id) VALUES "
        "(CONVERT(DATETIME,'2024-05-10 00:00:00',102), 'ana', 0, 0, 1)");
    entry_ = Number("SELECT @@Identity as last");
    for (const char* amounts : {"120, 0", "0, 120"}) {
      common::SqlServer()->Execute("INSERT INTO tbPOC_Dorvantos_Details (dorvanto_id, debito, credito, descrit) "
                                   "VALUES (" + std::to_string(entry_) + ", " + amounts + ", 'Renda de maio')");
      lines_.push_back(Number("SELECT @@Identity as last"));
    }
  }

  void OpenEntry(bool final = false) {
    if (final)
      common::SqlServer()->Execute("UPDATE tbPOC_Dorvantos SET finalizado = 1 WHERE dorvanto_id = " +
                                   std::to_string(entry_));
    header_ = std::dynamic_pointer_cast<entry::frmMain>(entry::NewHeaderEditor());
    header_->DoOpen(entry_);
    ASSERT_TRUE(WaitForWindow("frmMain"));
    list_ = ControlWidget<QTreeWidget>(QStringLiteral("frmMain"), QStringLiteral("ListView1"));
    ASSERT_NE(list_, nullptr);
    ASSERT_TRUE(QTest::qWaitFor([&] { return list_->topLevelItemCount() == 2; }, kPatienceMs));
  }

  // Right-clicks the list at a point, reads the menu that opens (caption, "+" for an
  // enabled entry, "-" for a disabled one) and chooses the entry captioned `choose`,
  // or none.
  std::vector<std::string> RightClick(QPoint at, const char* choose = nullptr) {
    std::vector<std::string> shown;
    WhenReadyMenu([&shown, choose](QMenu& menu) {
      QAction* chosen = nullptr;
      for (QAction* action : menu.actions()) {
        if (action->isSeparator() || !action->isVisible()) continue;
        shown.push_back(action->text().toStdString() + (action->isEnabled() ? "+" : "-"));
        if (choose && action->text() == QString::fromUtf8(choose)) chosen = action;
      }
      if (chosen)
        QTest::mouseClick(&menu, Qt::LeftButton, {}, menu.actionGeometry(chosen).center());
      else
        QTest::keyClick(&menu, Qt::Key_Escape);
    });
    QTest::mouseClick(list_->viewport(), Qt::RightButton, {}, at);
    Settle();
    return shown;
  }
  void WhenReadyMenu(std::function<void(QMenu&)> act) {
    menuAnswer_ = std::make_unique<WhenReady>(
        [] { return qobject_cast<QMenu*>(QApplication::activePopupWidget()) != nullptr; },
        [act = std::move(act)] { act(*qobject_cast<QMenu*>(QApplication::activePopupWidget())); });
  }
  QPoint Row(int index) const { return list_->visualItemRect(list_->topLevelItem(index)).center(); }
  QPoint BelowTheRows() const {
    QRect last = list_->visualItemRect(list_->topLevelItem(list_->topLevelItemCount() - 1));
    return {last.center().x(), last.bottom() + 3 * last.height()};
  }

  int32_t entry_ = 0;
  std::vector<int32_t> lines_;
  QTreeWidget* list_ = nullptr;
  std::unique_ptr<WhenReady> menuAnswer_;
};

TEST_F(LinesMenu, OffersEveryLineCommandOnALineAndOnlyNewBesideTheLines) {
  OpenEntry();
  EXPECT_EQ(RightClick(Row(1)), (std::vector<std::string>{"&Abrir+", "&Novo (F2)+", "&Remover+",
                                                           "&Importar+", "&Predefinidos+"}));
  ASSERT_TRUE(menuAnswer_->Done() && !menuAnswer_->GaveUp()) << "no menu opened on the line";
  EXPECT_EQ(RightClick(BelowTheRows()), (std::vector<std::string>{"&Abrir-", "&Novo (F2)+", "&Remover-",
                                                                   "&Importar+", "&Predefinidos+"}));
  ASSERT_TRUE(menuAnswer_->Done() && !menuAnswer_->GaveUp()) << "no menu opened beside the lines";
  EXPECT_EQ(WindowNamed(QStringLiteral("frmMainDetails")), nullptr);
}

TEST_F(LinesMenu, AFinalEntryOffersNoNewLineAndNoRemoval) {
  OpenEntry(/*final=*/true);
  EXPECT_EQ(RightClick(Row(0)), (std::vector<std::string>{"&Abrir+", "&Novo (F2)-", "&Remover-",
                                                           "&Importar+", "&Predefinidos+"}));
}

TEST_F(LinesMenu, OpenShowsTheRightClickedLine) {
  OpenEntry();
  RightClick(Row(1), "&Abrir");
  ASSERT_TRUE(WaitForWindow("frmMainDetails"));
  EXPECT_EQ(ShownText("frmMainDetails", "FXCredito").toStdString(), "€ 120,00");
  EXPECT_EQ(ShownText("frmMainDetails", "FXDebito").toStdString(), "€ 0,00");
}

TEST_F(LinesMenu, RemoveAsksThenTakesTheLineFromTheListAndTheDatabase) {
  OpenEntry();
  AnswerMessageBox(QMessageBox::Yes);
  RightClick(Row(0), "&Remover");
  ASSERT_TRUE(AllAnswered());
  EXPECT_EQ(messages_, std::vector<std::string>{"Deseja mesmo remover esta linha do lançamento?"});
  EXPECT_EQ(Number("SELECT count(*) FROM tbPOC_Dorvantos_Details WHERE diario_id = " + std::to_string(lines_[0])), 0);
  EXPECT_EQ(Number("SELECT count(*) FROM tbPOC_Dorvantos_Details"), 1);
  EXPECT_TRUE(QTest::qWaitFor([&] { return list_->topLevelItemCount() == 1; }, kPatienceMs));
}

TEST_F(LinesMenu, NewOpensALineEditorForTheEntry) {
  OpenEntry();
  RightClick(BelowTheRows(), "&Novo (F2)");
  ASSERT_TRUE(WaitForWindow("frmMainDetails"));
  EXPECT_TRUE(FocusOn("frmMainDetails", "FXConta_Codigo"));
}

}  // namespace
}  // namespace dvqt::windows
