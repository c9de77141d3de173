// The encoded form of passwords that hosts pass to Login and the settings keep.

#include "common/PasswordCodec.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

using common::DecodePassword;
using common::EncodePassword;

TEST(PasswordCodec, AnyPasswordComesBackAsItWent) {
  for (const std::string& plain : std::vector<std::string>{"", "demo", "s3gr3d0;Data Source=x", " a'b\"c ", "palavra-passe ção €",
                            std::string("nul\0byte", 8), std::string(300, 'x')}) {
    std::string encoded = EncodePassword(plain);
    EXPECT_EQ(encoded.rfind("dv1:", 0), 0u);
    EXPECT_EQ(DecodePassword(encoded), plain);
    // Nothing of it to read at a glance, and no two encodings alike.
    if (plain.size() > 3) {
      EXPECT_EQ(encoded.find(plain), std::string::npos);
    }
    EXPECT_NE(EncodePassword(plain), encoded);
    // Fits in one connection string value and one settings line.
    EXPECT_EQ(encoded.find_first_of(";'\"\n "), std::string::npos);
  }
}

TEST(PasswordCodec, AnythingButAnIntactEncodingIsRefused) {
  std::string encoded = EncodePassword("demo");
  EXPECT_EQ(DecodePassword("demo"), std::nullopt);
  EXPECT_EQ(DecodePassword(""), std::nullopt);
  EXPECT_EQ(DecodePassword("dv1:"), std::nullopt);
  EXPECT_EQ(DecodePassword("dv2:" + encoded.substr(4)), std::nullopt);
  EXPECT_EQ(DecodePassword("DV1:" + encoded.substr(4)), std::nullopt);
  EXPECT_EQ(DecodePassword(encoded.substr(0, encoded.size() - 4)), std::nullopt);
  EXPECT_EQ(DecodePassword(encoded + "AAAA"), std::nullopt);
  EXPECT_EQ(DecodePassword("dv1:!!!!" + encoded.substr(8)), std::nullopt);
  // Every single changed character is caught by the tag.
  const std::string alphabet = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  for (size_t i = 4; i < encoded.size(); ++i) {
    if (encoded[i] == '=') continue;
    std::string damaged = encoded;
    damaged[i] = alphabet[(alphabet.find(encoded[i]) + 1) % alphabet.size()];
    EXPECT_EQ(DecodePassword(damaged), std::nullopt) << "position " << i;
  }
}

}  // namespace
