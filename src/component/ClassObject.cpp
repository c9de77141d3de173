#include "component/ClassObject.h"

#include <optional>

#include "common/ErrorTrap.h"
#include "common/PasswordCodec.h"
#include "component/Data.h"
#include "component/LoginState.h"
#include "entry/HeaderEditor.h"

namespace component {

using automation::Args;

automation::ObjectCounter& LiveObjects() {
  static automation::ObjectCounter counter;
  return counter;
}

const automation::MemberTable<ClassObject>& ClassObject::Members() {
  static const auto table =
      automation::MemberTable<ClassObject>()
          .Method("Login", {0, 2},
                  [](ClassObject& self, Args& a) {
                    std::string user = automation::TextArg(a[0]);
                    std::string password = automation::TextArg(a[1]);
                    bool loggedIn = self.Login(user, password);
                    automation::WriteBackText(a[0], user);
                    automation::WriteBackText(a[1], password);
                    return vb::Variant(loggedIn);
                  })
          .Method("NovoRegisto", {1, 4},
                  [](ClassObject& self, Args& a) {
                    std::string table = automation::TextArg(a[0]);
                    self.NovoRegisto(table, a[1], automation::LongArg(a[2]),
                                     automation::ObjectArg(a[3]));
                    automation::WriteBackText(a[0], table);
                    return vb::Variant();
                  })
          .Method("Registo", {1, 5}, [](ClassObject& self, Args& a) {
            self.Registo(a[0], a[1], automation::TextArg(a[2]), automation::TextArg(a[3]),
                         automation::ObjectArg(a[4]));
            return vb::Variant();
          });
  return table;
}

bool ClassObject::Login(std::string& User, std::string& Password) {
  bool result = false;
  common::Trap(common::LoginSite("Login"), [&] {
    DataEnvironment& data = Data();
    if (IsLoggedIn() && data.SqlServer()->State() == ado::adStateOpen) {
      result = true;
      return;
    }
    std::optional<ConnectionSettings> settings = ReadConnectionSettings();
    if (!settings) return;
    settings_ = *settings;
    // Both passwords arrive encoded; one that does not decode cannot log anybody in.
    std::optional<std::string> storedPassword = common::DecodePassword(settings_.password);
    std::optional<std::string> userPassword = common::DecodePassword(Password);
    if (!storedPassword || !userPassword) return;
    result = LoginWith(data, User, Password, *userPassword, *storedPassword);
  });
  return result;
}

bool ClassObject::LoginWith(DataEnvironment& data, const std::string& user,
                            const std::string& encodedPassword, const std::string& userPassword,
                            const std::string& storedPassword) {
  // The host's user must be a login the database accepts; a private connection asks,
  // so the shared one keeps its own login. From here on errors are answers, not reports.
  ado::ConnectionPtr probe = ado::Connection::Create();
  try {
    probe->Open(ConnectionString(settings_, user, userPassword));
  } catch (const std::exception&) {
    return false;
  }
  RecordLoggedUser(user, encodedPassword);
  const ado::ConnectionPtr& shared = data.SqlServer();
  if (shared->State() != ado::adStateOpen) {
    try {
      shared->SetConnectionString(ConnectionString(settings_, settings_.user, storedPassword));
      shared->Open();
    } catch (const std::exception&) {
      // The next statement finds it closed and offers to try again.
    }
  }
  SetLoggedIn();
  try {
    probe->Close();
  } catch (const std::exception&) {
  }
  return true;
}

void ClassObject::NovoRegisto(std::string& Table, const vb::Variant& Pkey, int32_t Contacto_ID,
                              const vb::ObjectPtr& Caller) {
  common::Trap(common::ClassSite("NovoRegisto"), [&] {
    if (!IsLoggedIn()) return;
    // Table, Pkey and Contacto_ID do not change what a new entry is.
    HeaderEditorFor(Caller).Call("DoInsert");
  });
}

vb::Object& ClassObject::HeaderEditorFor(const vb::ObjectPtr& Caller) {
  if (!headerEditor_) headerEditor_ = entry::NewHeaderEditor();
  headerEditor_->Let("MainClass", vb::Variant(shared_from_this()));
  headerEditor_->Let("CallBackClass", vb::Variant(Caller));
  return *headerEditor_;
}

void ClassObject::OpenInHeaderEditor(const vb::ObjectPtr& Caller, int32_t dorvantoId,
                                     int32_t diarioId) {
  HeaderEditorFor(Caller).Call("DoOpen", {vb::Variant(dorvantoId), vb::Variant(diarioId)});
}

}  // namespace component
