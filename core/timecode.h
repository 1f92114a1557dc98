// What the timecode calculators share.
#ifndef ZELTA_CORE_TIMECODE_H
#define ZELTA_CORE_TIMECODE_H

#include <cstdint>

namespace zelta {

// The count wrapped into [0, countPerDay).
std::uint32_t wrapTimecodeCount(std::int32_t count, std::uint32_t countPerDay);

// Hours to 23, minutes and seconds to 59, frames below the rate, field below
// the units per frame.
bool isTimecodeInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                       std::uint8_t field, std::uint32_t rate, std::uint32_t unitsPerFrame);

// A rate of 0 can't divide anything ("non-zero frame rate").
void requireFrameRate(std::uint8_t rate);

}  // namespace zelta

#endif
