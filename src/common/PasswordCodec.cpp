#include "common/PasswordCodec.h"

#include <openssl/evp.h>
#include <openssl/rand.h>
#include <openssl/sha.h>

#include <array>
#include <memory>
#include <stdexcept>

namespace common {

namespace {

constexpr size_t kNonceSize = 12;
constexpr size_t kTagSize = 16;
// Changing this constant makes every stored password unreadable: it is the key.
constexpr std::string_view kKeySeed = "poc-dorvantos/password-codec/1/Quorvex-POC";
// Bound to the ciphertext, so a text from another version cannot pass for this one.
constexpr std::string_view kAssociatedData = "dv1";

using Key = std::array<unsigned char, SHA256_DIGEST_LENGTH>;
using CipherContext = std::unique_ptr<EVP_CIPHER_CTX, decltype(&EVP_CIPHER_CTX_free)>;

const Key& CodecKey() {
  static const Key key = [] {
    Key k{};
    SHA256(reinterpret_cast<const unsigned char*>(kKeySeed.data()), kKeySeed.size(), k.data());
    return k;
  }();
  return key;
}

const unsigned char* Bytes(std::string_view s) {
  return reinterpret_cast<const unsigned char*>(s.data());
}

CipherContext NewContext() {
  CipherContext ctx(EVP_CIPHER_CTX_new(), &EVP_CIPHER_CTX_free);
  if (!ctx) throw std::runtime_error("out of memory for the password codec");
  return ctx;
}

std::string Base64(const std::string& raw) {
  std::string out(4 * ((raw.size() + 2) / 3), '\0');
  int n = EVP_EncodeBlock(reinterpret_cast<unsigned char*>(out.data()), Bytes(raw),
                          static_cast<int>(raw.size()));
  out.resize(static_cast<size_t>(n));
  return out;
}

std::optional<std::string> Unbase64(std::string_view text) {
  if (text.empty() || text.size() % 4 != 0) return std::nullopt;
  std::string out(3 * (text.size() / 4), '\0');
  int n = EVP_DecodeBlock(reinterpret_cast<unsigned char*>(out.data()), Bytes(text),
                          static_cast<int>(text.size()));
  if (n < 0) return std::nullopt;
  // EVP_DecodeBlock counts the padding as zero bytes; drop them.
  size_t padding = 0;
  if (text.back() == '=') ++padding;
  if (text.size() > 1 && text[text.size() - 2] == '=') ++padding;
  out.resize(static_cast<size_t>(n) - padding);
  // Only the one spelling: bits the padding leaves over must not hide a change.
  if (Base64(out) != text) return std::nullopt;
  return out;
}

}  // namespace

std::string EncodePassword(std::string_view plain) {
  std::string sealed(kNonceSize + plain.size() + kTagSize, '\0');
  auto* nonce = reinterpret_cast<unsigned char*>(sealed.data());
  auto* body = nonce + kNonceSize;
  if (RAND_bytes(nonce, static_cast<int>(kNonceSize)) != 1)
    throw std::runtime_error("no random bytes for the password codec");

  CipherContext ctx = NewContext();
  int n = 0;
  bool ok = EVP_EncryptInit_ex(ctx.get(), EVP_aes_256_gcm(), nullptr, nullptr, nullptr) == 1 &&
            EVP_CIPHER_CTX_ctrl(ctx.get(), EVP_CTRL_GCM_SET_IVLEN, kNonceSize, nullptr) == 1 &&
            EVP_EncryptInit_ex(ctx.get(), nullptr, nullptr, CodecKey().data(), nonce) == 1 &&
            EVP_EncryptUpdate(ctx.get(), nullptr, &n, Bytes(kAssociatedData),
                              static_cast<int>(kAssociatedData.size())) == 1 &&
            EVP_EncryptUpdate(ctx.get(), body, &n, Bytes(plain), static_cast<int>(plain.size())) == 1 &&
            EVP_EncryptFinal_ex(ctx.get(), body + n, &n) == 1 &&
            EVP_CIPHER_CTX_ctrl(ctx.get(), EVP_CTRL_GCM_GET_TAG, kTagSize, body + plain.size()) == 1;
  if (!ok) throw std::runtime_error("the password codec failed");
  return std::string(kPasswordPrefix) + Base64(sealed);
}

std::optional<std::string> DecodePassword(std::string_view encoded) {
  if (!encoded.starts_with(kPasswordPrefix)) return std::nullopt;
  std::optional<std::string> sealed = Unbase64(encoded.substr(kPasswordPrefix.size()));
  if (!sealed || sealed->size() < kNonceSize + kTagSize) return std::nullopt;

  auto* nonce = reinterpret_cast<unsigned char*>(sealed->data());
  auto* body = nonce + kNonceSize;
  size_t bodySize = sealed->size() - kNonceSize - kTagSize;
  std::string plain(bodySize, '\0');
  auto* out = reinterpret_cast<unsigned char*>(plain.data());

  CipherContext ctx = NewContext();
  int n = 0;
  int tail = 0;
  bool ok = EVP_DecryptInit_ex(ctx.get(), EVP_aes_256_gcm(), nullptr, nullptr, nullptr) == 1 &&
            EVP_CIPHER_CTX_ctrl(ctx.get(), EVP_CTRL_GCM_SET_IVLEN, kNonceSize, nullptr) == 1 &&
            EVP_DecryptInit_ex(ctx.get(), nullptr, nullptr, CodecKey().data(), nonce) == 1 &&
            EVP_DecryptUpdate(ctx.get(), nullptr, &n, Bytes(kAssociatedData),
                              static_cast<int>(kAssociatedData.size())) == 1 &&
            EVP_DecryptUpdate(ctx.get(), out, &n, body, static_cast<int>(bodySize)) == 1 &&
            EVP_CIPHER_CTX_ctrl(ctx.get(), EVP_CTRL_GCM_SET_TAG, kTagSize, body + bodySize) == 1 &&
            EVP_DecryptFinal_ex(ctx.get(), out + n, &tail) == 1;
  if (!ok) return std::nullopt;
  return plain;
}

}  // namespace common
