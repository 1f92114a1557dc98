#include <gtest/gtest.h>

#include <memory>
#include <set>

#include "failure.h"
#include "klv.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::failureOf;

namespace {

ByteVector head(const UMID& umid, std::size_t n) { return ByteVector(umid.octets.begin(), umid.octets.begin() + n); }

ByteVector materialNumber(const UMID& umid) { return ByteVector(umid.octets.begin() + 16, umid.octets.begin() + 32); }

// The RFC 4122 variant bits that uuid_generate always sets in octet 8.
bool hasUUIDVariant(const std::uint8_t* uuid) { return (uuid[8] & 0xC0) == 0x80; }

}  // namespace

TEST(UMID, DefaultIsBasicWith32ZeroOctets) {
  UMID umid;
  EXPECT_EQ(umid.kind, UMID::basic);
  EXPECT_EQ(umid.octets, ByteVector(32, 0));
}

TEST(UMID, KindAndSizeMustAgree) {
  EXPECT_EQ(failureOf([] { UMID u(UMID::basic, ByteVector(64, 1)); }), "assertion failure: valid size");
  EXPECT_EQ(failureOf([] { UMID u(UMID::extended, ByteVector(32, 1)); }), "assertion failure: valid size");
  EXPECT_EQ(failureOf([] { UMID u(UMID::basic, ByteVector(33, 1)); }), "assertion failure: valid size");
  UMID extended(UMID::extended, ByteVector(64, 7));
  EXPECT_EQ(extended.kind, UMID::extended);
  EXPECT_EQ(extended.octets, ByteVector(64, 7));
}

TEST(UMID, NewBasicMaterialNumberFollowsTheTable) {
  UMID umid = UMID::createNew(0x0F);
  EXPECT_EQ(umid.kind, UMID::basic);
  ASSERT_EQ(umid.octets.size(), 32u);
  EXPECT_EQ(head(umid, 16), bytesOf("06 0A 2B 34 01 01 01 05 01 01 0F 23 13 00 00 00"));
  EXPECT_TRUE(hasUUIDVariant(umid.octets.data() + 16));
}

TEST(UMID, NewExtendedMaterialNumberFollowsTheTable) {
  UMID umid = UMID::createNew(0x0D, UMID::extended);
  EXPECT_EQ(umid.kind, UMID::extended);
  ASSERT_EQ(umid.octets.size(), 64u);
  EXPECT_EQ(head(umid, 16), bytesOf("06 0A 2B 34 01 01 01 05 01 01 0D 23 33 00 00 00"));
  EXPECT_TRUE(hasUUIDVariant(umid.octets.data() + 16));
  EXPECT_EQ(ByteVector(umid.octets.begin() + 32, umid.octets.end()), ByteVector(32, 0));
}

TEST(UMID, EveryNewMaterialNumberIsDifferent) {
  std::set<ByteVector> seen;
  for (int i = 0; i < 100; ++i) seen.insert(materialNumber(UMID::createNew(0x0F)));
  EXPECT_EQ(seen.size(), 100u);
}

TEST(UMID, ReadsBasicFrom32Octets) {
  ByteVector bytes = bytesOf("06 0A 2B 34 01 01 01 05 01 01 0F 23 13 00 00 00");
  bytes.resize(32, 0xAB);
  UMID umid(UMID::extended, ByteVector(64, 0));
  internalize(bytes, umid);
  EXPECT_EQ(umid.kind, UMID::basic);
  EXPECT_EQ(umid.octets, bytes);
}

TEST(UMID, ReadsExtendedFrom64Octets) {
  ByteVector bytes(64);
  for (std::size_t i = 0; i < bytes.size(); ++i) bytes[i] = static_cast<std::uint8_t>(i);
  UMID umid;
  internalize(bytes, umid);
  EXPECT_EQ(umid.kind, UMID::extended);
  EXPECT_EQ(umid.octets, bytes);
}

TEST(UMID, OtherSizesFail) {
  auto read = [](std::size_t n) {
    return failureOf([n] {
      UMID umid;
      internalize(ByteVector(n, 1), umid);
    });
  };
  EXPECT_EQ(read(31), "assertion failure: successful read()");
  EXPECT_EQ(read(33), "assertion failure: valid size");
  EXPECT_EQ(read(63), "assertion failure: valid size");
  EXPECT_EQ(read(65), "assertion failure: valid external length");
}

TEST(UMID, WritesItsOctetsAsTheyStand) {
  ByteVector bytes(64, 0x5A);
  bytes[0] = 0x06;
  ByteVector written;
  externalize(written, UMID(UMID::extended, bytes), true);
  EXPECT_EQ(written, bytes);
  externalize(written, UMID(), true);
  EXPECT_EQ(written, ByteVector(32, 0));
}

TEST(UMID, OctetsThatDisagreeWithTheKindAreNotWritten) {
  UMID umid;
  umid.octets.push_back(0);
  EXPECT_EQ(failureOf([&] {
              ByteVector written;
              externalize(written, umid, true);
            }),
            "assertion failure: valid size");
}

TEST(UMID, EqualityComparesKindAndOctets) {
  UMID a;
  UMID b;
  EXPECT_TRUE(a == b);
  b.octets[31] = 1;
  EXPECT_TRUE(a != b);
  UMID c;
  c.kind = UMID::extended;
  EXPECT_FALSE(a == c);
}

TEST(ZeltaDefaultUIDGenerator, GivesDistinctUUIDs) {
  std::unique_ptr<MXFUIDGenerator> generator(new ZeltaDefaultUIDGenerator);
  std::set<MXFUID> seen;
  for (int i = 0; i < 100; ++i) {
    MXFUID uid = generator->generate();
    EXPECT_TRUE(hasUUIDVariant(uid.data()));
    seen.insert(uid);
  }
  EXPECT_EQ(seen.size(), 100u);
}
