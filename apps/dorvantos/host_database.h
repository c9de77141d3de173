#pragma once
// The host's own connection to the component's database, opened from the same five
// settings the component reads, for what a host does beside the component: handing it
// a recordset, reading rows.

#include <stdexcept>

#include "platform/ado/Connection.h"

namespace app {

inline constexpr const char* kSettingsKey = "HKEY_LOCAL_MACHINE\\SOFTWARE\\Quorvex\\POC";

// A setting is missing or unreadable; the message names it.
class SettingsError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

ado::ConnectionPtr OpenSettingsDatabase();

}  // namespace app
