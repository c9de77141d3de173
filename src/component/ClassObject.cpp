#include "component/ClassObject.h"

#include "common/ErrorTrap.h"
#include "component/LoginState.h"

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
    // A login is put in place only once the database has accepted the host's user; the
    // data environment that asks it is not part of the component yet, so no login
    // succeeds and the answer stays false.
  });
  return result;
}

void ClassObject::NovoRegisto(std::string& Table, const vb::Variant& Pkey, int32_t Contacto_ID,
                              const vb::ObjectPtr& Caller) {
  common::Trap(common::ClassSite("NovoRegisto"), [&] {
    if (!IsLoggedIn()) return;
    // Table, Pkey and Contacto_ID do not change what a new entry is.
  });
}

}  // namespace component
