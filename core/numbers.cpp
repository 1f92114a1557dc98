#include <cmath>
#include <cstdint>
#include <cstring>
#include <istream>
#include <limits>
#include <ostream>

#include "klv.h"

namespace {

constexpr int floatBias = 127;
constexpr int halfBias = 15;
constexpr unsigned floatFractionBits = 23;
constexpr unsigned halfMantissaBits = 10;
constexpr std::uint32_t floatHiddenBit = 1u << floatFractionBits;
constexpr std::uint32_t halfMantissaLimit = 1u << halfMantissaBits;
constexpr std::uint8_t halfInfinityExponent = 31;
// A carry out of the mantissa at this exponent would make infinity.
constexpr std::uint8_t halfLargestCarryExponent = 30;

// significand >> shift, rounded to nearest with ties to even.
std::uint32_t roundedShift(std::uint32_t significand, unsigned shift) {
  std::uint32_t quotient = significand >> shift;
  std::uint32_t rest = significand & ((1u << shift) - 1);
  std::uint32_t half = 1u << (shift - 1);
  if (rest > half || (rest == half && (quotient & 1) != 0)) ++quotient;
  return quotient;
}

}  // namespace

Binary16::Binary16(float value) {
  check(std::isfinite(value) && value > -65536.0f && value < 65536.0f, "valid value");
  std::uint32_t bits = 0;
  std::memcpy(&bits, &value, sizeof bits);
  sign = (bits >> 31) != 0;
  int biased = static_cast<int>((bits >> floatFractionBits) & 0xFF);
  std::uint32_t fraction = bits & (floatHiddenBit - 1);
  int unbiased = biased - floatBias;
  if (unbiased <= -25) return;
  std::uint32_t rounded = 0;
  if (unbiased >= 1 - halfBias) {
    exponent = static_cast<std::uint8_t>(unbiased + halfBias);
    rounded = roundedShift(fraction, floatFractionBits - halfMantissaBits);
  } else {
    exponent = 0;
    rounded = roundedShift(fraction | floatHiddenBit, static_cast<unsigned>(126 - biased));
  }
  if (rounded == halfMantissaLimit) {
    // Saturate rather than overflow into infinity.
    if (exponent < halfLargestCarryExponent) {
      ++exponent;
      rounded = 0;
    } else {
      rounded = halfMantissaLimit - 1;
    }
  }
  mantissa = static_cast<std::uint16_t>(rounded);
}

float Binary16::toFloat() const {
  float magnitude = 0.0f;
  if (exponent == 0)
    magnitude = std::ldexp(static_cast<float>(mantissa), 1 - halfBias - static_cast<int>(halfMantissaBits));
  else if (exponent == halfInfinityExponent)
    magnitude = mantissa == 0 ? std::numeric_limits<float>::infinity() : std::numeric_limits<float>::quiet_NaN();
  else
    magnitude = std::ldexp(static_cast<float>(halfMantissaLimit + mantissa),
                           exponent - halfBias - static_cast<int>(halfMantissaBits));
  return sign ? -magnitude : magnitude;
}

void internalize(std::istream& in, Decimal16& v) {
  std::uint16_t bits = util::getBigEndian<std::uint16_t>(in);
  int nibble = bits >> 12;
  v.exponent = static_cast<std::int8_t>(nibble >= 8 ? nibble - 16 : nibble);
  v.mantissa = static_cast<std::uint16_t>(bits & 0x0FFF);
}

void externalize(std::ostream& out, const Decimal16& v) {
  check(v.exponent >= -8 && v.exponent <= 7, "valid exponent");
  check(v.mantissa <= 0x0FFF, "valid mantissa");
  std::uint16_t nibble = static_cast<std::uint16_t>(v.exponent & 0x0F);
  util::putBigEndian(out, static_cast<std::uint16_t>((nibble << 12) | v.mantissa));
}

void internalize(std::istream& in, Binary16& v) {
  std::uint16_t bits = util::getBigEndian<std::uint16_t>(in);
  v.sign = (bits >> 15) != 0;
  v.exponent = static_cast<std::uint8_t>((bits >> halfMantissaBits) & 0x1F);
  v.mantissa = static_cast<std::uint16_t>(bits & (halfMantissaLimit - 1));
}

void externalize(std::ostream& out, const Binary16& v) {
  check(v.exponent <= halfInfinityExponent, "valid exponent");
  check(v.mantissa < halfMantissaLimit, "valid mantissa");
  std::uint16_t bits =
      static_cast<std::uint16_t>((v.sign ? 0x8000 : 0) | (v.exponent << halfMantissaBits) | v.mantissa);
  util::putBigEndian(out, bits);
}
