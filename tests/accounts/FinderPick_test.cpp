// The person's pick and how the finder hands it back, or leaves without one.

#include "FinderFixture.h"

namespace accounts::testing {
namespace {

class FinderPickTest : public FinderTest {
 protected:
  void SetUp() override {
    FinderTest::SetUp();
    OpenChart({{"1", "Disponibilidades"},
               {"11", "Caixa", 1},
               {"12", "Depósitos à ordem", 1},
               {"2", "Terceiros"},
               {"21", "Clientes", 1}});
  }

  forms::KeyboardUser Person() { return forms::KeyboardUser(Finder()); }
};

TEST_F(FinderPickTest, SelecionarHandsTheLastClickedAccountToTheOpenerAndCloses) {
  OpenFinderFromWindow();
  forms::KeyboardUser person = Person();
  ASSERT_TRUE(person.ClickNode(Finder().TreeView1, "#11"));
  ASSERT_TRUE(person.ClickNode(Finder().TreeView1, "#21"));
  ASSERT_TRUE(person.Click(Finder().Command2));

  EXPECT_EQ(opener->received, std::vector<int32_t>{ContaId("21")});
  EXPECT_FALSE(Finder().Loaded());
  // A pick leaves the line editor open for the rest of the line.
  EXPECT_TRUE(opener->Showing());

  // Confirming before any click hands over no account.
  OpenFinder(opener);
  ASSERT_TRUE(Person().Click(Finder().Command2));
  EXPECT_EQ(opener->received.back(), 0);
  EXPECT_TRUE(opener->Showing());
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderPickTest, DoubleClickingANodeConfirmsIt) {
  OpenFinderFromWindow();
  forms::KeyboardUser person = Person();
  ASSERT_TRUE(person.DoubleClickNode(Finder().TreeView1, "#12"));

  EXPECT_EQ(opener->received, std::vector<int32_t>{ContaId("12")});
  EXPECT_FALSE(Finder().Loaded());
  EXPECT_TRUE(opener->Showing());
}

TEST_F(FinderPickTest, CancelarAndTheCloseBoxLeaveTheOpenerToo) {
  for (bool closeBox : {false, true}) {
    SCOPED_TRACE(closeBox ? "close box" : "Cancelar");
    OpenFinderFromWindow();
    forms::KeyboardUser person = Person();
    ASSERT_TRUE(person.ClickNode(Finder().TreeView1, "#11"));
    if (closeBox)
      ASSERT_TRUE(person.CloseWindow());
    else
      ASSERT_TRUE(person.Click(Finder().Command1));

    EXPECT_FALSE(Finder().Loaded());
    EXPECT_FALSE(opener->Loaded());
    EXPECT_TRUE(opener->received.empty());
  }
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderPickTest, AnOpenerKnownOnlyByNameIsCalledBackAndUnloadedByName) {
  auto object = std::make_shared<RecordingObject>();
  OpenFinder(object);
  ASSERT_TRUE(Person().DoubleClickNode(Finder().TreeView1, "#2"));
  EXPECT_EQ(object->calls, std::vector<std::string>{"DoFillConta"});
  EXPECT_EQ(object->received, std::vector<int32_t>{ContaId("2")});

  object->calls.clear();
  OpenFinder(object);
  ASSERT_TRUE(Person().Click(Finder().Command1));
  EXPECT_EQ(object->calls, std::vector<std::string>{"Unload"});
}

TEST_F(FinderPickTest, AFailingCallBackIsReportedUnderTheFinder) {
  // An opener without DoFillConta: the call fails with 438.
  struct Mute : vb::Object {
    vb::Variant Invoke(const std::string&, std::vector<vb::Variant>&) override {
      throw vb::Error(vb::kErrMemberNotSupported);
    }
  };
  auto mute = std::make_shared<Mute>();
  OpenFinder(mute);
  ASSERT_TRUE(Person().Click(Finder().Command2));

  std::vector<nlohmann::json> reports = Reports();
  ASSERT_EQ(reports.size(), 1u);
  EXPECT_EQ(reports[0]["project"], "Cordavel");
  EXPECT_EQ(reports[0]["module"], "frmFindConta");
  EXPECT_EQ(reports[0]["procedure"], "DoSair");
}

TEST_F(FinderPickTest, TheOpenerIsNotKeptAliveByItsFinder) {
  OpenFinderFromWindow();
  std::weak_ptr<RecordingOpener> gone = opener;
  opener.reset();
  EXPECT_TRUE(gone.expired());
  EXPECT_EQ(finder->Get("MainForm").AsObject(), nullptr);
  // Leaving without a pick has nothing left to unload.
  ASSERT_TRUE(Person().Click(Finder().Command1));
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderPickTest, ClosingTheFinderWhileItBuildsStopsTheBuild) {
  OpenFinderFromWindow();  // loaded once, so the hook below finds controls to touch
  int pumps = 0;
  desktop->whileMessagesRun = [&] {
    if (++pumps == 1) forms::KeyboardUser(Finder()).Click(Finder().Command1);
  };
  finder->Call("DoOpen");

  // The build stopped without bringing the window back, and the opener left with it.
  EXPECT_EQ(pumps, 1);
  EXPECT_FALSE(Finder().Loaded());
  EXPECT_FALSE(opener->Loaded());
  EXPECT_TRUE(Reports().empty());
}

}  // namespace
}  // namespace accounts::testing
