// Reaching servers through ODBC: which engine a Data Source names, how the ODBC
// connection string quotes what the settings and the person typed, and the stored
// form of a PostgreSQL password.

#include <gtest/gtest.h>

#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <future>
#include <regex>

#include "platform/ado/Connection.h"
#include "platform/ado/OdbcConnectionString.h"
#include "platform/ado/ServerDatabase.h"
#include "support/ClosedPort.h"

namespace ado {
namespace {

TEST(ServerAddress, NamesTheServerAndHowToReachIt) {
  ServerAddress pg = ParseServerAddress("postgresql://db.escritorio.pt:5433");
  EXPECT_EQ(pg.kind, ServerKind::PostgreSQL);
  EXPECT_EQ(pg.host, "db.escritorio.pt");
  EXPECT_EQ(pg.port, "5433");
  ServerAddress v6 = ParseServerAddress("POSTGRESQL://[::1]:6000/ignored");
  EXPECT_EQ(v6.kind, ServerKind::PostgreSQL);
  EXPECT_EQ(v6.host, "::1");
  EXPECT_EQ(v6.port, "6000");

  ServerAddress plain = ParseServerAddress("SERVIDOR01");
  EXPECT_EQ(plain.kind, ServerKind::SqlServer);
  EXPECT_EQ(plain.host, "SERVIDOR01");
  EXPECT_TRUE(plain.port.empty());
  ServerAddress port = ParseServerAddress("10.0.0.5, 1444");
  EXPECT_EQ(port.host, "10.0.0.5");
  EXPECT_EQ(port.port, "1444");
  ServerAddress instance = ParseServerAddress("SERVIDOR\\SQL2000");
  EXPECT_EQ(instance.host, "SERVIDOR");
  EXPECT_EQ(instance.instance, "SQL2000");
  EXPECT_EQ(ParseServerAddress("(local)").host, "127.0.0.1");
}

// Every value sits inside braces with "}" doubled: whatever it holds, it cannot end
// early and add a key of its own.
TEST(OdbcConnectionString, QuotesEveryValue) {
  EXPECT_EQ(OdbcElement("PWD", "a}b;UID=sa"), "PWD={a}}b;UID=sa};");
  EXPECT_EQ(OdbcElement("PWD", "}}"), "PWD={}}}}};");
  EXPECT_EQ(OdbcElement("UID", "{x"), "UID={{x};");

  ConnectionStringParts parts = ConnectionStringParts::Parse(
      "Provider=SQLOLEDB.1;User ID=\"ana;Trusted_Connection=yes\";Password=\"}pw;Server={evil}\";"
      "Initial Catalog=POC;Data Source=SERVIDOR,1444");
  std::string odbc = OdbcConnectionString(parts, OdbcDrivers{});
  EXPECT_EQ(odbc.rfind("Driver={FreeTDS};Server={SERVIDOR};Port={1444};Database={POC};", 0), 0u) << odbc;
  EXPECT_NE(odbc.find("UID={ana;Trusted_Connection=yes};"), std::string::npos) << odbc;
  EXPECT_NE(odbc.find("PWD={}}pw;Server={evil}}};"), std::string::npos) << odbc;

  // Read back key by key as a driver reads it, the string holds exactly one of each.
  auto count = [&](const std::string& key) {
    size_t n = 0;
    bool inBraces = false;
    for (size_t i = 0; i < odbc.size(); ++i) {
      char c = odbc[i];
      if (inBraces) {
        if (c == '}') {
          if (i + 1 < odbc.size() && odbc[i + 1] == '}') ++i;
          else inBraces = false;
        }
        continue;
      }
      if (c == '{') { inBraces = true; continue; }
      if ((i == 0 || odbc[i - 1] == ';') && odbc.compare(i, key.size() + 1, key + "=") == 0) ++n;
    }
    return n;
  };
  for (const char* key : {"Driver", "Server", "UID", "PWD", "Database", "Trusted_Connection"})
    EXPECT_EQ(count(key), std::string(key) == "Trusted_Connection" ? 0u : 1u) << key << " in " << odbc;
}

TEST(OdbcConnectionString, TakesTheDriversTheSiteNames) {
  ConnectionStringParts parts = ConnectionStringParts::Parse("Data Source=SRV\\CONTAB;Initial Catalog=POC");
  std::string odbc = OdbcConnectionString(parts, OdbcDrivers{"ODBC Driver 18 for SQL Server", "PG"});
  EXPECT_EQ(odbc.rfind("Driver={ODBC Driver 18 for SQL Server};Server={SRV\\CONTAB};Database={POC};", 0), 0u)
      << odbc;
  parts = ConnectionStringParts::Parse("Data Source=postgresql://127.0.0.1:5999;Initial Catalog=poc");
  odbc = OdbcConnectionString(parts, OdbcDrivers{"x", "PostgreSQL ANSI"});
  EXPECT_EQ(odbc.rfind("Driver={PostgreSQL ANSI};Server=127.0.0.1;Port=5999;Database=poc;", 0), 0u) << odbc;
}

TEST(OdbcConnection, AServerThatIsNotThereFailsTheOpen) {
  for (std::string source : {"127.0.0.1," + std::to_string(dvtest::ClosedPort()),
                             "postgresql://127.0.0.1:" + std::to_string(dvtest::ClosedPort())}) {
    auto connection = Connection::Create();
    try {
      connection->Open(ServerConnectionString(source, "POC", "ana", "segredo"));
      ADD_FAILURE() << "opened " << source;
    } catch (const vb::Error& e) {
      EXPECT_EQ(e.Number(), kErrProviderFailed) << source << ": " << e.Description();
      EXPECT_EQ(e.Description().find("segredo"), std::string::npos);
    }
    EXPECT_EQ(connection->State(), adStateClosed);
    ASSERT_EQ(connection->Errors().Count(), 1);
    EXPECT_EQ(connection->Errors().Item(0).SQLState.substr(0, 2), "08") << source;
  }
}

// A port that takes one connection and hangs up: whether a driver came knocking tells
// that it read the server and port out of our quoting.
class OneCallListener {
 public:
  OneCallListener() {
    fd_ = dvtest::LoopbackSocket(&port_);
    ::listen(fd_, 4);
    called_ = std::async(std::launch::async, [fd = fd_] {
      pollfd p{fd, POLLIN, 0};
      if (::poll(&p, 1, 20000) <= 0) return false;
      ::close(::accept(fd, nullptr, nullptr));
      return true;
    });
  }
  ~OneCallListener() { ::close(fd_); }
  int Port() const { return port_; }
  bool Called() { return called_.wait_for(std::chrono::seconds(20)) == std::future_status::ready && called_.get(); }

 private:
  int fd_ = -1;
  int port_ = 0;
  std::future<bool> called_;
};

TEST(OdbcConnection, TheDriversReadTheQuotedAddressAndRefuseWhatTheyCannotQuote) {
  {
    OneCallListener server;
    auto connection = Connection::Create();
    EXPECT_ANY_THROW(connection->Open(ServerConnectionString("127.0.0.1," + std::to_string(server.Port()), "P}O;C",
                                                             "ana;UID=sa", "}x;PWD={y}")));
    EXPECT_TRUE(server.Called()) << "FreeTDS did not read the braced server and port";
  }
  {
    OneCallListener server;
    auto connection = Connection::Create();
    EXPECT_ANY_THROW(connection->Open(
        ServerConnectionString("postgresql://127.0.0.1:" + std::to_string(server.Port()), "poc", "ana", "}x;y")));
    EXPECT_TRUE(server.Called()) << "psqlODBC did not read the server and port";
  }
  for (auto [catalog, user] : {std::pair{"poc;UID=postgres", "ana"}, {"poc", "ana;Database=postgres"},
                               {"{poc}", "ana"}, {"poc", " ana"}}) {
    auto connection = Connection::Create();
    try {
      connection->Open(ServerConnectionString("postgresql://127.0.0.1:" + std::to_string(dvtest::ClosedPort()),
                                              catalog, user, "x"));
      ADD_FAILURE() << "opened";
    } catch (const vb::Error& e) {
      EXPECT_NE(e.Description().find("cannot take"), std::string::npos) << catalog << " / " << user << ": "
                                                                         << e.Description();
    }
  }
}

TEST(ScramVerifier, IsTheStoredFormWithAFreshSalt) {
  const std::regex form(R"(SCRAM-SHA-256\$4096:[A-Za-z0-9+/]{22}==\$[A-Za-z0-9+/]{43}=:[A-Za-z0-9+/]{43}=)");
  std::string a = ScramVerifier("segredo ç");
  std::string b = ScramVerifier("segredo ç");
  EXPECT_TRUE(std::regex_match(a, form)) << a;
  EXPECT_NE(a, b);
  EXPECT_EQ(a.find("segredo"), std::string::npos);
}

}  // namespace
}  // namespace ado
