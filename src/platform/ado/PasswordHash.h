#pragma once
// Login passwords are kept as PBKDF2-HMAC-SHA256 hashes with a random salt per login.
// The iteration count is stored with each hash, so it can be raised for new logins
// without breaking old ones (and tests can use few).

#include <string>
#include <string_view>

namespace ado {

inline constexpr int kDefaultPasswordIterations = 600000;
inline constexpr const char* kPasswordAlgorithm = "pbkdf2-sha256";

struct PasswordHash {
  std::string algorithm = kPasswordAlgorithm;
  int iterations = kDefaultPasswordIterations;
  std::string salt;  // raw bytes
  std::string hash;  // raw bytes
};

PasswordHash HashPassword(std::string_view password, int iterations = kDefaultPasswordIterations);

// Recomputes the hash with the stored salt and count; compares in constant time.
bool VerifyPassword(std::string_view password, const PasswordHash& stored);

}  // namespace ado
