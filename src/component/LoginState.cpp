#include "component/LoginState.h"

namespace component {

namespace {

struct LoginState {
  bool loggedIn = false;
  std::string user;
  std::string password;
};

LoginState& State() {
  static LoginState state;
  return state;
}

}  // namespace

bool IsLoggedIn() { return State().loggedIn; }
const std::string& LoggedUser() { return State().user; }
const std::string& LoggedPassword() { return State().password; }

void RecordLoggedUser(const std::string& user, const std::string& password) {
  State().user = user;
  State().password = password;
}

void SetLoggedIn() { State().loggedIn = true; }

}  // namespace component
