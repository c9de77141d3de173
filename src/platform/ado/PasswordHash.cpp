#include "platform/ado/PasswordHash.h"

#include <openssl/crypto.h>
#include <openssl/evp.h>
#include <openssl/rand.h>

#include <stdexcept>

namespace ado {

namespace {

constexpr size_t kSaltBytes = 16;
constexpr size_t kHashBytes = 32;

std::string Derive(std::string_view password, const std::string& salt, int iterations) {
  std::string out(kHashBytes, '\0');
  if (PKCS5_PBKDF2_HMAC(password.data(), static_cast<int>(password.size()),
                        reinterpret_cast<const unsigned char*>(salt.data()),
                        static_cast<int>(salt.size()), iterations, EVP_sha256(),
                        static_cast<int>(out.size()),
                        reinterpret_cast<unsigned char*>(out.data())) != 1)
    throw std::runtime_error("password hashing failed");
  return out;
}

}  // namespace

PasswordHash HashPassword(std::string_view password, int iterations) {
  if (iterations < 1) throw std::invalid_argument("iteration count must be positive");
  PasswordHash h;
  h.iterations = iterations;
  h.salt.assign(kSaltBytes, '\0');
  if (RAND_bytes(reinterpret_cast<unsigned char*>(h.salt.data()), static_cast<int>(kSaltBytes)) != 1)
    throw std::runtime_error("no random bytes for the password salt");
  h.hash = Derive(password, h.salt, iterations);
  return h;
}

bool VerifyPassword(std::string_view password, const PasswordHash& stored) {
  if (stored.algorithm != kPasswordAlgorithm || stored.iterations < 1 ||
      stored.hash.size() != kHashBytes)
    return false;
  std::string computed = Derive(password, stored.salt, stored.iterations);
  return CRYPTO_memcmp(computed.data(), stored.hash.data(), kHashBytes) == 0;
}

}  // namespace ado
