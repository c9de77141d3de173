#include "platform/ado/OdbcConnectionString.h"

#include <unicode/locid.h>
#include <unicode/unistr.h>

#include <memory>
#include <stdexcept>

#include "platform/registry/Store.h"

namespace ado {

const char* const kOdbcDriversKey = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\ODBC";

namespace {

constexpr std::string_view kPostgresScheme = "postgresql://";

// "host:port" or "[v6addr]:port"; a bare v6 address has colons of its own.
void SplitHostPort(std::string_view text, std::string& host, std::string& port) {
  if (!text.empty() && text.front() == '[') {
    size_t close = text.find(']');
    if (close != std::string_view::npos) {
      host = std::string(text.substr(1, close - 1));
      if (close + 1 < text.size() && text[close + 1] == ':') port = std::string(text.substr(close + 2));
      return;
    }
  }
  size_t colon = text.rfind(':');
  if (colon != std::string_view::npos && text.find(':') == colon) {
    host = std::string(text.substr(0, colon));
    port = std::string(text.substr(colon + 1));
  } else {
    host = std::string(text);
  }
}

}  // namespace

ServerAddress ParseServerAddress(std::string_view dataSource) {
  ServerAddress address;
  std::string source(Trim(dataSource));
  if (source.size() >= kPostgresScheme.size() &&
      EqualsNoCase(std::string_view(source).substr(0, kPostgresScheme.size()), kPostgresScheme)) {
    address.kind = ServerKind::PostgreSQL;
    std::string_view rest = std::string_view(source).substr(kPostgresScheme.size());
    // A path after the address (postgresql://host/db) is not ours to read: the
    // catalog comes from Initial Catalog.
    rest = rest.substr(0, rest.find('/'));
    SplitHostPort(rest, address.host, address.port);
    return address;
  }
  address.kind = ServerKind::SqlServer;
  if (size_t comma = source.find(','); comma != std::string::npos) {
    address.host = Trim(std::string_view(source).substr(0, comma));
    address.port = Trim(std::string_view(source).substr(comma + 1));
  } else if (size_t slash = source.find('\\'); slash != std::string::npos) {
    address.host = source.substr(0, slash);
    address.instance = source.substr(slash + 1);
  } else {
    address.host = source;
  }
  // Windows habits: "(local)" and "." mean this computer.
  if (address.host == "(local)" || address.host == ".") address.host = "127.0.0.1";
  return address;
}

OdbcDrivers ReadOdbcDrivers() {
  OdbcDrivers drivers;
  try {
    std::shared_ptr<const registry::Hive> hive = registry::Store::Default().Snapshot();
    if (const registry::Key* key = hive->Find(kOdbcDriversKey)) {
      auto text = [&](std::string_view name, std::string& into) {
        const registry::Value* value = key->Find(name);
        if (value && registry::IsStringType(value->type) && !value->data.empty()) into = value->data;
      };
      text("SQL Server", drivers.sqlServer);
      text("PostgreSQL", drivers.postgreSQL);
    }
  } catch (const std::exception&) {
    // An unreadable settings file leaves the defaults; opening the connection is what
    // tells the person something is wrong.
  }
  return drivers;
}

std::string FoldLoginName(std::string_view name) {
  std::string folded;
  icu::UnicodeString::fromUTF8(icu::StringPiece(name.data(), static_cast<int32_t>(name.size())))
      .toLower(icu::Locale::getRoot())
      .toUTF8String(folded);
  return folded;
}

std::string OdbcElement(std::string_view key, std::string_view value) {
  std::string out(key);
  out += "={";
  for (char c : value) {
    out += c;
    if (c == '}') out += '}';
  }
  out += "};";
  return out;
}

std::string BareElement(std::string_view key, const std::string& value) {
  if (value.find_first_of(";{}") != std::string::npos || value != Trim(value))
    throw std::invalid_argument("the " + std::string(key == "UID" ? "login" : key == "Database" ? "database" : "server") +
                                " name holds a character the PostgreSQL driver cannot take");
  return std::string(key) + "=" + value + ";";
}

std::string OdbcConnectionString(const ConnectionStringParts& parts, const OdbcDrivers& drivers) {
  ServerAddress address = ParseServerAddress(parts.GetOr("Data Source", ""));
  std::string catalog = parts.GetOr("Initial Catalog", "");
  std::string out;
  if (address.kind == ServerKind::PostgreSQL) {
    // psqlODBC takes braces around the password only; every other value goes in bare,
    // so one that could end early or open braces is refused instead.
    std::string port = address.port.empty() ? std::string("5432") : address.port;
    if (port.find_first_not_of("0123456789") != std::string::npos)
      throw std::invalid_argument("the port of the PostgreSQL server is not a number");
    out += OdbcElement("Driver", drivers.postgreSQL);
    out += BareElement("Server", address.host.empty() ? std::string("127.0.0.1") : address.host);
    out += "Port=" + port + ";";
    out += BareElement("Database", catalog);
    out += BareElement("UID", FoldLoginName(parts.GetOr("User ID", "")));
    out += OdbcElement("PWD", parts.GetOr("Password", ""));
    // A failed statement inside a transaction undoes only itself, as on SQL Server;
    // text types come back as plain varchar rather than long data.
    out += "Protocol=7.4-2;TextAsLongVarchar=0;UnknownsAsLongVarchar=0;MaxVarcharSize=65535;";
    out += "UseServerSidePrepare=1;BoolsAsChar=0;";
    return out;
  }
  out += OdbcElement("Driver", drivers.sqlServer);
  out += OdbcElement("Server", address.instance.empty() ? address.host : address.host + "\\" + address.instance);
  if (!address.port.empty()) out += OdbcElement("Port", address.port);
  out += OdbcElement("Database", catalog);
  out += OdbcElement("UID", parts.GetOr("User ID", ""));
  out += OdbcElement("PWD", parts.GetOr("Password", ""));
  out += "TDS_Version=7.4;ClientCharset=UTF-8;";
  return out;
}

}  // namespace ado
