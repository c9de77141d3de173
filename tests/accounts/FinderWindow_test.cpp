// The finder's window: where it opens and how its controls follow its size.

#include "FinderFixture.h"

namespace accounts::testing {
namespace {

// Distances that must not change when the window is resized.
struct Anchors {
  int32_t buttonsFromRight, buttonsFromBottom, progressFromBottom, treeNarrowerBy, treeShorterBy;
  bool operator==(const Anchors&) const = default;
};

Anchors AnchorsOf(frmFindConta& f) {
  return {f.Width() - f.Command1.Left(), f.Height() - f.Command2.Top(),
          f.Height() - f.ProgressBar1.Top(), f.Width() - f.TreeView1.Width(),
          f.Height() - f.TreeView1.Height()};
}

TEST_F(FinderTest, TheWindowOpensBesideTheScreenEdgesAndItsControlsFollowItsSize) {
  OpenChart({{"1", "Disponibilidades"}});
  desktop->screenWidth = 1600 * 15;
  desktop->screenHeight = 900 * 15;
  OpenFinder(nullptr);
  frmFindConta& f = Finder();

  EXPECT_EQ(f.Left(), 1500);
  EXPECT_EQ(f.Top(), 1500);
  EXPECT_EQ(f.Width(), 1600 * 15 - 8400);
  EXPECT_EQ(f.Height(), 900 * 15 - 3000);

  // The first sizing spread from the design: the buttons sit in the bottom right
  // corner and the tree fills the width.
  const int32_t rightMargin = f.Width() - (f.Command1.Left() + f.Command1.Width());
  EXPECT_GE(rightMargin, 0);
  EXPECT_LT(rightMargin, 600);
  EXPECT_GT(f.Command1.Top(), f.Height() - 1500);
  EXPECT_GT(f.TreeView1.Width(), f.Width() - 1000);
  EXPECT_LT(f.Label1.Width(), f.Width() / 2);  // the heading keeps its design width
  const Anchors opened = AnchorsOf(f);

  forms::KeyboardUser person(f);
  person.Resize(9000, 6000);
  EXPECT_EQ(AnchorsOf(f), opened);
  person.Minimize();
  person.Restore();
  EXPECT_EQ(AnchorsOf(f), opened);

  // Never smaller than 4000 x 2000.
  person.Resize(3000, 1500);
  EXPECT_EQ(f.Width(), 4000);
  EXPECT_EQ(f.Height(), 2000);
  EXPECT_EQ(f.Width() - f.Command1.Left(), opened.buttonsFromRight);
  EXPECT_TRUE(Reports().empty());
}

TEST_F(FinderTest, AScreenTooSmallForTheMarginsGivesTheSmallestWindow) {
  OpenChart({{"1", "Disponibilidades"}});
  desktop->screenWidth = 400 * 15;
  desktop->screenHeight = 150 * 15;
  OpenFinder(nullptr);
  EXPECT_EQ(Finder().Width(), 4000);
  EXPECT_EQ(Finder().Height(), 2000);
  EXPECT_EQ(Nodes().Count(), 1);
  EXPECT_TRUE(Reports().empty());
}

}  // namespace
}  // namespace accounts::testing
