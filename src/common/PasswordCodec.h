#pragma once
// Passwords as hosts hand them to Login and as the settings keep them ("dtPassword"):
// never as plain text. The form is versioned so it can change without breaking what
// is stored:
//
//   "dv1:" + base64( nonce[12] || AES-256-GCM ciphertext || tag[16] )
//
// The key is derived (SHA-256) from a constant of the component, so anyone with the
// component can decode: this keeps a password from being read at a glance, or pasted
// from one field into another by mistake. What protects it is the settings file's
// private mode, not this encoding.

#include <optional>
#include <string>
#include <string_view>

namespace common {

inline constexpr std::string_view kPasswordPrefix = "dv1:";

// The encoded form; a fresh random nonce each time, so equal passwords encode apart.
// Throws std::runtime_error only when the system cannot supply random bytes.
std::string EncodePassword(std::string_view plain);

// The plain password, or nullopt for text that is not an intact encoded password
// (no prefix, damaged base64, a tag that does not verify).
std::optional<std::string> DecodePassword(std::string_view encoded);

}  // namespace common
