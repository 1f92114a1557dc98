#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>

#include "failure.h"
#include "klv.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::failureOf;

namespace {

Binary16 half(bool sign, std::uint8_t exponent, std::uint16_t mantissa) {
  Binary16 h;
  h.sign = sign;
  h.exponent = exponent;
  h.mantissa = mantissa;
  return h;
}

// The fields, printed so that a mismatch shows all three.
std::string fieldsOf(const Binary16& h) {
  return std::string(h.sign ? "-" : "+") + " e" + std::to_string(h.exponent) + " m" + std::to_string(h.mantissa);
}

std::string fieldsOf(float value) { return fieldsOf(Binary16(value)); }

Binary16 halfOf(const std::string& hex) {
  Binary16 h;
  internalize(bytesOf(hex), h);
  return h;
}

ByteVector bytesOfHalf(float value) {
  ByteVector bytes;
  externalize(bytes, Binary16(value), true);
  return bytes;
}

std::string decimalFailure(int exponent, unsigned mantissa) {
  Decimal16 d;
  d.exponent = static_cast<std::int8_t>(exponent);
  d.mantissa = static_cast<std::uint16_t>(mantissa);
  return failureOf([&] {
    ByteVector bytes;
    externalize(bytes, d, true);
  });
}

}  // namespace

TEST(Decimal16, ExternalF123IsExponentMinusOneMantissa123) {
  Decimal16 d;
  internalize(bytesOf("F1 23"), d);
  EXPECT_EQ(d.exponent, -1);
  EXPECT_EQ(d.mantissa, 0x123);
  ByteVector back;
  externalize(back, d, true);
  EXPECT_EQ(back, bytesOf("F1 23"));
}

TEST(Decimal16, TopNibbleIsASignedExponent) {
  Decimal16 d;
  internalize(bytesOf("7F FF"), d);
  EXPECT_EQ(d.exponent, 7);
  EXPECT_EQ(d.mantissa, 0xFFF);
  internalize(bytesOf("80 00"), d);
  EXPECT_EQ(d.exponent, -8);
  EXPECT_EQ(d.mantissa, 0);
  internalize(bytesOf("00 01"), d);
  EXPECT_EQ(d.exponent, 0);
  EXPECT_EQ(d.mantissa, 1);
}

TEST(Decimal16, ExponentOutsideMinusEightToSevenFailsValidExponent) {
  EXPECT_EQ(decimalFailure(8, 1), "assertion failure: valid exponent");
  EXPECT_EQ(decimalFailure(-9, 1), "assertion failure: valid exponent");
  EXPECT_EQ(decimalFailure(7, 1), "no failure");
  EXPECT_EQ(decimalFailure(-8, 1), "no failure");
}

TEST(Decimal16, MantissaBeyondTwelveBitsFailsValidMantissa) {
  EXPECT_EQ(decimalFailure(0, 0x1000), "assertion failure: valid mantissa");
  EXPECT_EQ(decimalFailure(0, 0x0FFF), "no failure");
}

TEST(Binary16, Of65504IsTheLargestFiniteValue) {
  EXPECT_EQ(fieldsOf(65504.0f), "+ e30 m1023");
  EXPECT_EQ(bytesOfHalf(65504.0f), bytesOf("7B FF"));
  EXPECT_EQ(Binary16(65504.0f).toFloat(), 65504.0f);
}

TEST(Binary16, Of65535StaysAtExponent30Mantissa1023) {
  EXPECT_EQ(fieldsOf(65535.0f), "+ e30 m1023");
  EXPECT_EQ(fieldsOf(65535.99f), "+ e30 m1023");
  EXPECT_EQ(fieldsOf(-65535.0f), "- e30 m1023");
}

TEST(Binary16, NormalNumbers) {
  EXPECT_EQ(bytesOfHalf(1.0f), bytesOf("3C 00"));
  EXPECT_EQ(bytesOfHalf(-2.0f), bytesOf("C0 00"));
  EXPECT_EQ(bytesOfHalf(0.5f), bytesOf("38 00"));
  EXPECT_EQ(bytesOfHalf(0.333251953125f), bytesOf("35 55"));
  EXPECT_EQ(fieldsOf(std::ldexp(1.0f, -14)), "+ e1 m0");
}

TEST(Binary16, RoundsToNearest) {
  // 1 + 2^-11 + 2^-20 lies just above the middle between mantissas 0 and 1.
  EXPECT_EQ(fieldsOf(1.0f + std::ldexp(1.0f, -11) + std::ldexp(1.0f, -20)), "+ e15 m1");
  // 1 + 2^-12 lies below the middle.
  EXPECT_EQ(fieldsOf(1.0f + std::ldexp(1.0f, -12)), "+ e15 m0");
}

TEST(Binary16, RoundingTiesGoToEven) {
  EXPECT_EQ(fieldsOf(1.0f + std::ldexp(1.0f, -11)), "+ e15 m0");
  EXPECT_EQ(fieldsOf(1.0f + 3.0f * std::ldexp(1.0f, -11)), "+ e15 m2");
  EXPECT_EQ(fieldsOf(2049.0f), "+ e26 m0");
  EXPECT_EQ(fieldsOf(2051.0f), "+ e26 m2");
}

TEST(Binary16, RoundingCarryMovesToTheNextExponent) {
  EXPECT_EQ(fieldsOf(2.0f - std::ldexp(1.0f, -12)), "+ e16 m0");
  EXPECT_EQ(fieldsOf(32760.0f), "+ e30 m0");
}

TEST(Binary16, SubnormalNumbers) {
  EXPECT_EQ(fieldsOf(std::ldexp(1.0f, -24)), "+ e0 m1");
  EXPECT_EQ(fieldsOf(std::ldexp(1.0f, -15)), "+ e0 m512");
  EXPECT_EQ(fieldsOf(std::ldexp(3.0f, -20)), "+ e0 m48");
  EXPECT_EQ(fieldsOf(-std::ldexp(1023.0f, -24)), "- e0 m1023");
  EXPECT_EQ(bytesOfHalf(std::ldexp(1.0f, -24)), bytesOf("00 01"));
}

TEST(Binary16, SubnormalRoundingTiesGoToEven) {
  EXPECT_EQ(fieldsOf(std::ldexp(3.0f, -25)), "+ e0 m2");
  EXPECT_EQ(fieldsOf(std::ldexp(5.0f, -25)), "+ e0 m2");
  EXPECT_EQ(fieldsOf(std::ldexp(5.0f, -26)), "+ e0 m1");
}

TEST(Binary16, SubnormalCarryBecomesTheSmallestNormal) {
  EXPECT_EQ(fieldsOf(std::ldexp(1.0f, -14) - std::ldexp(1.0f, -26)), "+ e1 m0");
}

TEST(Binary16, ExponentMinus25OrBelowGivesZeroWithSignKept) {
  EXPECT_EQ(fieldsOf(std::ldexp(1.0f, -25)), "+ e0 m0");
  EXPECT_EQ(fieldsOf(std::ldexp(1.9f, -25)), "+ e0 m0");
  EXPECT_EQ(fieldsOf(-std::ldexp(1.9f, -25)), "- e0 m0");
  EXPECT_EQ(fieldsOf(-std::ldexp(1.0f, -40)), "- e0 m0");
  EXPECT_EQ(fieldsOf(-std::numeric_limits<float>::denorm_min()), "- e0 m0");
  EXPECT_EQ(fieldsOf(0.0f), "+ e0 m0");
  EXPECT_EQ(fieldsOf(-0.0f), "- e0 m0");
  EXPECT_EQ(bytesOfHalf(-0.0f), bytesOf("80 00"));
}

TEST(Binary16, InfinityNaNAnd65536FailValidValue) {
  const float rejected[] = {std::numeric_limits<float>::infinity(),
                            -std::numeric_limits<float>::infinity(),
                            std::numeric_limits<float>::quiet_NaN(),
                            65536.0f,
                            -65536.0f,
                            1.0e9f};
  for (float value : rejected)
    EXPECT_EQ(failureOf([&] { Binary16 h(value); }), "assertion failure: valid value") << value;
}

TEST(Binary16, ToFloatGivesTheValue) {
  EXPECT_EQ(half(false, 15, 0).toFloat(), 1.0f);
  EXPECT_EQ(half(true, 16, 512).toFloat(), -3.0f);
  EXPECT_EQ(half(false, 0, 1).toFloat(), std::ldexp(1.0f, -24));
  EXPECT_EQ(half(false, 0, 1023).toFloat(), std::ldexp(1023.0f, -24));
  EXPECT_EQ(half(false, 30, 1023).toFloat(), 65504.0f);
  EXPECT_TRUE(std::signbit(half(true, 0, 0).toFloat()));
}

TEST(Binary16, ToFloatOfInfinityAndNaNBitPatterns) {
  EXPECT_EQ(halfOf("7C 00").toFloat(), std::numeric_limits<float>::infinity());
  EXPECT_EQ(halfOf("FC 00").toFloat(), -std::numeric_limits<float>::infinity());
  EXPECT_TRUE(std::isnan(halfOf("7E 00").toFloat()));
}

TEST(Binary16, ExactValuesSurviveTheRoundTrip) {
  const float values[] = {
      1.0f, -1.5f, std::ldexp(1638.0f, -14), 1024.0f, 65504.0f, std::ldexp(1.0f, -24), std::ldexp(717.0f, -24)};
  for (float value : values) EXPECT_EQ(Binary16(value).toFloat(), value) << value;
}

TEST(Binary16, ExternalFormIsSignExponentMantissa) {
  Binary16 h = halfOf("B5 55");
  EXPECT_EQ(fieldsOf(h), "- e13 m341");
  ByteVector back;
  externalize(back, h, true);
  EXPECT_EQ(back, bytesOf("B5 55"));
}

TEST(Binary16, OutOfRangeFieldsAreNotWritten) {
  EXPECT_EQ(failureOf([] {
              ByteVector bytes;
              externalize(bytes, half(false, 1, 1024), true);
            }),
            "assertion failure: valid mantissa");
  EXPECT_EQ(failureOf([] {
              ByteVector bytes;
              externalize(bytes, half(false, 32, 0), true);
            }),
            "assertion failure: valid exponent");
}
