#include "kit/user_stamp.h"

#include <memory>

namespace zelta {

namespace {

constexpr std::uint32_t largestBase = 30;
constexpr std::uint32_t dropFrameBase = 30;
constexpr std::uint32_t pal = 25;
constexpr std::uint8_t dropFrameBit = 0x40;
constexpr std::uint8_t fieldBit = 0x80;

// Two BCD digits; the tens must fit the bits that the field leaves them.
std::uint8_t bcd(std::uint8_t value, std::uint8_t limit) {
  check(value < limit, "valid tens");
  return static_cast<std::uint8_t>(((value / 10) << 4) | (value % 10));
}

}  // namespace

std::uint32_t getRoundedRate(const MXFRational& rate) {
  return rate.denominator <= 0 || rate.numerator <= 0
             ? 0
             : static_cast<std::uint32_t>((static_cast<std::int64_t>(rate.numerator) + rate.denominator / 2) /
                                          rate.denominator);
}

std::uint32_t getTimecodeBase(const MXFRational& editRate) {
  const std::uint32_t rounded = getRoundedRate(editRate);
  return rounded > largestBase ? rounded / 2 : rounded;
}

std::unique_ptr<TimecodeCalculator> makeStampCalculator(const MXFRational& editRate, bool dropFrame) {
  const std::uint32_t base = getTimecodeBase(editRate);
  return std::unique_ptr<TimecodeCalculator>(createTimecodeCalculator(
      static_cast<std::uint8_t>(base), dropFrame && base == dropFrameBase, getRoundedRate(editRate) > largestBase));
}

MXFSDTICPTimeStamp getUserStamp(const TimecodeCalculator& calculator, std::uint32_t count, std::uint32_t timecodeBase,
                                bool dropFrame) {
  std::uint8_t hours = 0, minutes = 0, seconds = 0, frames = 0, field = 0;
  calculator.toTimecode(count, hours, minutes, seconds, frames, &field);
  MXFSDTICPTimeStamp stamp{};
  stamp[0] = userStampKind;
  stamp[1] = bcd(frames, 40);
  stamp[2] = bcd(seconds, 80);
  stamp[3] = bcd(minutes, 80);
  stamp[4] = bcd(hours, 30);
  if (dropFrame) stamp[1] |= dropFrameBit;
  if (field != 0) stamp[timecodeBase == pal ? 4 : 2] |= fieldBit;
  return stamp;
}

}  // namespace zelta
