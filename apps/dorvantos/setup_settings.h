#pragma once
// What every setup leaves behind for the component: a login for its shared connection
// with a password nobody types, and the five connection settings it reads.

#include <string>

namespace app {

// The login of the component's shared connection.
inline constexpr const char* kSharedLogin = "poc_dorvantos";

// 32 characters from a 62-letter alphabet, drawn from the system's random source.
std::string RandomPassword();

// The five values the component's Login reads, in one write: a host never sees half of
// them. The password is stored encoded.
void WriteConnectionSettings(const std::string& dataSource, const std::string& catalog,
                             const std::string& sharedPassword);

}  // namespace app
