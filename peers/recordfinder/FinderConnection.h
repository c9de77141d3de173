#pragma once
// The finder's own connection. It runs in the host's process but outside the
// component, so it cannot borrow the component's connection: it reads the same five
// settings under "HKEY_LOCAL_MACHINE\SOFTWARE\Quorvex\POC" and logs in as the user the
// component hands it, which also checks that user's password.

#include <string>

#include "platform/ado/Connection.h"

namespace recordfinder {

// An open connection for the user, the password in the encoded form the host gave the
// component's Login; null when a setting is missing, the password cannot be decoded
// or the database refuses the login.
ado::ConnectionPtr OpenFinderConnection(const std::string& user, const std::string& encodedPassword);

}  // namespace recordfinder
