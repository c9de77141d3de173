#include "entry/SystemDocumentPassword.h"

#include <string>

#include "platform/ado/PasswordHash.h"

namespace entry {

namespace {

constexpr unsigned char kSalt[] = {0xd5, 0x4d, 0xb0, 0x6e, 0x49, 0xa4, 0x67, 0x5e,
                                   0x0f, 0x89, 0xa5, 0x4a, 0xbf, 0xe5, 0xc2, 0xc9};
constexpr unsigned char kHash[] = {0x2f, 0x35, 0x01, 0x6d, 0xb1, 0x3b, 0xc3, 0x94,
                                   0x77, 0x02, 0x95, 0x52, 0x2c, 0x46, 0x46, 0x72,
                                   0xa6, 0x34, 0xc3, 0xac, 0x0a, 0x6d, 0x93, 0x01,
                                   0xef, 0x91, 0x40, 0x77, 0x89, 0x1c, 0x2c, 0xa2};
constexpr int kIterations = 210000;

}  // namespace

bool IsSystemDocumentPassword(std::string_view typed) {
  ado::PasswordHash stored;
  stored.iterations = kIterations;
  stored.salt.assign(reinterpret_cast<const char*>(kSalt), sizeof kSalt);
  stored.hash.assign(reinterpret_cast<const char*>(kHash), sizeof kHash);
  return ado::VerifyPassword(typed, stored);
}

}  // namespace entry
