#pragma once
// The login of the whole loaded component: one flag, one user name and one password,
// shared by every class object and every window. The flag starts false and, once a
// login has succeeded, is never set back: the component stays logged in while loaded.

#include <string>

namespace component {

bool IsLoggedIn();
// The host's user of the last successful login; new entries record it as their creator.
const std::string& LoggedUser();
// That login's password, in the encoded form the host gave it; handed on unchanged to
// the components the line editor opens.
const std::string& LoggedPassword();

// Records the host's user and password of a login that the database accepted.
void RecordLoggedUser(const std::string& user, const std::string& password);
// Puts the login in place.
void SetLoggedIn();

}  // namespace component
