#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "failure.h"
#include "klv.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::failureOf;
using zelta_test::keyOf;

namespace {

// The value must write as exactly these octets and read back from them.
template <typename T>
void expectRoundTrip(const T& value, const std::string& hex) {
  ByteVector written;
  externalize(written, value, true);
  EXPECT_EQ(written, bytesOf(hex));
  T read{};
  internalize(bytesOf(hex), read);
  EXPECT_TRUE(read == value) << hex;
}

template <typename T>
std::string internalizeFailure(const std::string& hex) {
  return failureOf([&] {
    T value{};
    internalize(bytesOf(hex), value);
  });
}

}  // namespace

TEST(Internalize, Uint32FromFiveOctetsFailsValidExternalLength) {
  EXPECT_EQ(internalizeFailure<std::uint32_t>("00 00 00 01 02"), "assertion failure: valid external length");
}

TEST(Internalize, Uint32FromThreeOctetsFailsSuccessfulGet) {
  EXPECT_EQ(internalizeFailure<std::uint32_t>("00 00 01"), "assertion failure: successful get()");
}

TEST(Internalize, EmptyVectorFailsForAFixedSizeValue) {
  EXPECT_EQ(internalizeFailure<std::uint16_t>(""), "assertion failure: successful get()");
}

TEST(Internalize, ShortKeyFailsSuccessfulRead) {
  EXPECT_EQ(internalizeFailure<KLVKey>("06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00"),
            "assertion failure: successful read()");
  EXPECT_EQ(internalizeFailure<MXFUID>("01 02 03"), "assertion failure: successful read()");
}

TEST(Internalize, ShortCompoundValuesFailSuccessfulGet) {
  EXPECT_EQ(internalizeFailure<MXFRational>("00 00 00 19 00 00 00"), "assertion failure: successful get()");
  EXPECT_EQ(internalizeFailure<MXFTimestamp>("07 E8 01 02 03 04 05"), "assertion failure: successful get()");
  EXPECT_EQ(internalizeFailure<MXFProductVersion>("00 04 00 00 00 00 00 00 00"), "assertion failure: successful get()");
}

TEST(Internalize, LongCompoundValuesFailValidExternalLength) {
  EXPECT_EQ(internalizeFailure<MXFRational>("00 00 00 19 00 00 00 01 00"), "assertion failure: valid external length");
  EXPECT_EQ(internalizeFailure<KLVKey>("06 0E 2B 34 01 01 01 01 03 01 02 10 01 00 00 00 00"),
            "assertion failure: valid external length");
}

// A value whose reading internalizes another value from octets of its own,
// as a batch of compound items may.
struct Nested {
  std::uint16_t outer = 0;
  std::uint32_t inner = 0;
};

void internalize(std::istream& in, Nested& value) {
  internalize(in, value.outer);
  ByteVector octets(4);
  in.read(reinterpret_cast<char*>(octets.data()), 4);
  internalize(octets, value.inner);
}

TEST(Internalize, ValueReadWithinAnotherReadKeepsBothStreams) {
  Nested value;
  internalize(bytesOf("01 02 0a 0b 0c 0d"), value);
  EXPECT_EQ(value.outer, 0x0102);
  EXPECT_EQ(value.inner, 0x0a0b0c0du);
  EXPECT_EQ(failureOf([] {
              Nested longer;
              internalize(bytesOf("01 02 0a 0b 0c 0d ff"), longer);
            }),
            "assertion failure: valid external length");
}

TEST(Internalize, FailedReadLeavesNoStateForTheNext) {
  std::uint32_t value = 0;
  EXPECT_EQ(failureOf([&] { internalize(bytesOf("01 02 03"), value); }), "assertion failure: successful get()");
  internalize(bytesOf("01 02 03 04"), value);
  EXPECT_EQ(value, 0x01020304u);
}

TEST(Conversion, IntegersRoundTripBigEndian) {
  expectRoundTrip<std::uint8_t>(0xA5, "A5");
  expectRoundTrip<std::int8_t>(-2, "FE");
  expectRoundTrip<std::uint16_t>(0x1234, "12 34");
  expectRoundTrip<std::int16_t>(-2, "FF FE");
  expectRoundTrip<std::uint32_t>(0x01020304, "01 02 03 04");
  expectRoundTrip<std::int32_t>(-65536, "FF FF 00 00");
  expectRoundTrip<std::uint64_t>(0x0102030405060708ull, "01 02 03 04 05 06 07 08");
  expectRoundTrip<std::int64_t>(-1, "FF FF FF FF FF FF FF FF");
}

TEST(Conversion, BoolIsOneOctetAndAnyNonZeroReadsTrue) {
  expectRoundTrip(true, "01");
  expectRoundTrip(false, "00");
  bool value = false;
  internalize(bytesOf("80"), value);
  EXPECT_TRUE(value);
}

TEST(Conversion, RationalIsNumeratorThenDenominator) {
  MXFRational rate;
  rate.numerator = 30000;
  rate.denominator = 1001;
  expectRoundTrip(rate, "00 00 75 30 00 00 03 E9");
  MXFRational negative;
  negative.numerator = -1;
  negative.denominator = 2;
  expectRoundTrip(negative, "FF FF FF FF 00 00 00 02");
}

TEST(Conversion, TimestampIsYearThenSixOctets) {
  MXFTimestamp t;
  t.year = 2024;
  t.month = 2;
  t.day = 29;
  t.hour = 23;
  t.minute = 59;
  t.second = 58;
  t.quarterMillisecond = 249;
  expectRoundTrip(t, "07 E8 02 1D 17 3B 3A F9");
}

TEST(Conversion, ProductVersionIsFiveFieldsOfTwoOctets) {
  MXFProductVersion v;
  v.major = 4;
  v.minor = 0;
  v.tertiary = 0;
  v.patch = 74;
  v.release = 0x0102;
  expectRoundTrip(v, "00 04 00 00 00 00 00 4A 01 02");
}

TEST(Conversion, KeyAndIdentifierAreSixteenOctetsAsTheyStand) {
  expectRoundTrip(keyOf("06.0E.2B.34.01.01.01.02.03.01.02.10.01.00.00.00"),
                  "06 0E 2B 34 01 01 01 02 03 01 02 10 01 00 00 00");
  expectRoundTrip(streamFailureId, "4C 4A 00 01 95 D8 11 E1 BB B2 10 9A DD 4A C6 8C");
}

TEST(Conversion, SmallNumbersAreTwoOctets) {
  Decimal16 d;
  d.exponent = -2;
  d.mantissa = 0x0ABC;
  expectRoundTrip(d, "EA BC");
  expectRoundTrip(Binary16(1.0f), "3C 00");
}

TEST(Conversion, TextsRoundTrip) {
  expectRoundTrip(std::wstring(L"Zelta \u00e9\U0001F600"), "00 5A 00 65 00 6C 00 74 00 61 00 20 00 E9 D8 3D DE 00");
  expectRoundTrip(std::string("Zelta\xC3\xA9"), "5A 65 6C 74 61 C3 A9");
}

TEST(Conversion, BatchesRoundTrip) {
  expectRoundTrip(std::vector<std::uint16_t>{1, 0xABCD}, "00 00 00 02 00 00 00 02 00 01 AB CD");
  expectRoundTrip(std::vector<KLVKey>{keyOf("06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01")},
                  "00 00 00 01 00 00 00 10 06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 01");
  expectRoundTrip(std::vector<MXFRational>{}, "00 00 00 00 00 00 00 08");
  MXFTimestamp t;
  t.year = 1;
  expectRoundTrip(std::vector<MXFTimestamp>{t, t},
                  "00 00 00 02 00 00 00 08 00 01 00 00 00 00 00 00 00 01 00 00 00 00 00 00");
}

TEST(Externalize, ResetClearsAndOtherwiseAppends) {
  ByteVector bytes = bytesOf("FF");
  externalize(bytes, std::uint16_t(0x0102), false);
  EXPECT_EQ(bytes, bytesOf("FF 01 02"));
  externalize(bytes, std::uint16_t(0x0304), true);
  EXPECT_EQ(bytes, bytesOf("03 04"));
}

TEST(Batch, CountZeroReadsEightOctetsWhateverTheItemSize) {
  for (const char* itemSize : {"00 00 00 00", "00 00 00 04", "FF FF FF FF"}) {
    ByteVector bytes = bytesOf(std::string("00 00 00 00 ") + itemSize + " AA");
    util::vector_istream in(bytes);
    std::vector<std::uint32_t> items{7, 8};
    internalize(in, items);
    EXPECT_TRUE(items.empty()) << itemSize;
    EXPECT_EQ(static_cast<std::streamoff>(in.tellg()), 8) << itemSize;
    EXPECT_EQ(in.get(), 0xAA) << itemSize;
  }
}

TEST(Batch, CountZeroFromByteVectorIsEmpty) {
  std::vector<KLVKey> keys{KLVKey()};
  internalize(bytesOf("00 00 00 00 FF FF FF FF"), keys);
  EXPECT_TRUE(keys.empty());
}

TEST(Batch, ItemSizeAboveTheTypeSizeSkipsTheExcess) {
  std::vector<std::uint32_t> items;
  internalize(bytesOf("00 00 00 02 00 00 00 06 00 00 00 01 EE EE 00 00 00 02 EE EE"), items);
  EXPECT_EQ(items, (std::vector<std::uint32_t>{1, 2}));
}

TEST(Batch, PaddedItemsDoNotOverReadIntoTheNeighbour) {
  ByteVector bytes = bytesOf("00 00 00 01 00 00 00 03 00 05 EE 42");
  util::vector_istream in(bytes);
  std::vector<std::uint16_t> items;
  internalize(in, items);
  EXPECT_EQ(items, (std::vector<std::uint16_t>{5}));
  std::uint8_t neighbour = 0;
  internalize(in, neighbour);
  EXPECT_EQ(neighbour, 0x42);
}

TEST(Batch, ItemSizeBelowTheTypeSizeFailsValidExternalLength) {
  EXPECT_EQ(internalizeFailure<std::vector<std::uint32_t>>("00 00 00 01 00 00 00 02 00 00 00 01"),
            "assertion failure: valid external length");
}

TEST(Batch, MissingItemFailsSuccessfulGet) {
  EXPECT_EQ(internalizeFailure<std::vector<std::uint16_t>>("00 00 00 02 00 00 00 02 00 01"),
            "assertion failure: successful get()");
}

TEST(Batch, TruncatedHeaderFailsSuccessfulGet) {
  EXPECT_EQ(internalizeFailure<std::vector<std::uint16_t>>("00 00 00 00 00 00"), "assertion failure: successful get()");
}

TEST(ValueEquality, TimestampComparesEveryField) {
  MXFTimestamp base;
  base.year = 2024;
  base.month = 5;
  base.day = 6;
  base.hour = 7;
  base.minute = 8;
  base.second = 9;
  base.quarterMillisecond = 10;
  EXPECT_TRUE(base == base);
  std::vector<MXFTimestamp> changed(7, base);
  changed[0].year = 2025;
  changed[1].month = 6;
  changed[2].day = 7;
  changed[3].hour = 8;
  changed[4].minute = 9;
  changed[5].second = 10;
  changed[6].quarterMillisecond = 11;
  for (const MXFTimestamp& other : changed) {
    EXPECT_FALSE(base == other);
    EXPECT_TRUE(base != other);
  }
}

TEST(ValueEquality, ProductVersionComparesEveryField) {
  MXFProductVersion base;
  base.major = 4;
  base.patch = 74;
  EXPECT_TRUE(base == base);
  std::vector<MXFProductVersion> changed(5, base);
  changed[0].major = 5;
  changed[1].minor = 1;
  changed[2].tertiary = 1;
  changed[3].patch = 75;
  changed[4].release = 1;
  for (const MXFProductVersion& other : changed) {
    EXPECT_FALSE(base == other);
    EXPECT_TRUE(base != other);
  }
}
