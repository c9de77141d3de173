// Login when the settings name a database server that is not there: the host's user is
// refused quietly, as for a wrong password; nothing is shown and nothing reported.

#include <gtest/gtest.h>

#include "component/data/ComponentFixture.h"
#include "support/ClosedPort.h"

namespace {

class ServerLoginTest : public dvtest::ComponentTest {};

TEST_F(ServerLoginTest, AClosedPortAnswersFalseWithoutAMessage) {
  const std::string port = std::to_string(dvtest::ClosedPort());
  for (const std::string& source : {"127.0.0.1," + port, "postgresql://127.0.0.1:" + port}) {
    SCOPED_TRACE(source);
    Set("dtDataSource", source);
    EXPECT_FALSE(LoginAsAna());
    EXPECT_EQ(common::SqlServer()->State(), ado::adStateClosed);
  }
  EXPECT_TRUE(desktop_->messages.empty());
  EXPECT_TRUE(sandbox_.ErrorLogLines().empty());
}

}  // namespace
