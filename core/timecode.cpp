#include "core/timecode.h"

#include <cstdint>
#include <stdexcept>

#include "klv.h"

namespace zelta {

std::uint32_t wrapTimecodeCount(std::int32_t count, std::uint32_t countPerDay) {
  std::int64_t wrapped = static_cast<std::int64_t>(count) % static_cast<std::int64_t>(countPerDay);
  if (wrapped < 0) wrapped += countPerDay;
  if (wrapped < 0) throw std::logic_error("positive result");
  return static_cast<std::uint32_t>(wrapped);
}

bool isTimecodeInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                       std::uint8_t field, std::uint32_t rate, std::uint32_t unitsPerFrame) {
  return hours <= 23 && minutes <= 59 && seconds <= 59 && frames < rate && field < unitsPerFrame;
}

void requireFrameRate(std::uint8_t rate) {
  if (rate == 0) throw std::runtime_error("non-zero frame rate");
}

}  // namespace zelta

TimecodeCalculator::~TimecodeCalculator() = default;

TimecodeCalculator* createTimecodeCalculator(std::uint8_t rate, bool dropFrame, std::uint8_t unitsPerFrame) {
  if (dropFrame) return new NTSCDropFrameCalculator(rate, unitsPerFrame);
  return new RegularTimecodeCalculator(rate, unitsPerFrame);
}

TimecodeCalculator* createTimecodeCalculator(std::uint8_t rate, bool dropFrame, bool fieldCounting) {
  return createTimecodeCalculator(rate, dropFrame, static_cast<std::uint8_t>(fieldCounting ? 2 : 1));
}

// Only the multiples of 30000/1001 drop frames; 24000/1001 rounds to a
// regular 24.
TimecodeCalculator* createTimecodeCalculator(int numerator, int denominator) {
  if (denominator == 0) throw std::runtime_error("non-zero frame rate denominator");
  if (numerator == 0) throw std::runtime_error("non-zero frame rate");
  if ((numerator > 0) != (denominator > 0)) throw std::runtime_error("positive frame rate");
  const std::int64_t num = numerator;
  const std::int64_t den = denominator;
  const std::uint8_t oneUnit = 1;
  if (num % den == 0) return createTimecodeCalculator(static_cast<std::uint8_t>(num / den), false, oneUnit);
  if (num % 30000 == 0 && den % 1001 == 0 && (num / 30000) % (den / 1001) == 0)
    return createTimecodeCalculator(static_cast<std::uint8_t>((num * 1001) / (den * 1000)), true, oneUnit);
  return createTimecodeCalculator(static_cast<std::uint8_t>((num + den / 2) / den), false, oneUnit);
}
