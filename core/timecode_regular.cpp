#include <cstdint>
#include <stdexcept>

#include "core/timecode.h"
#include "klv.h"

namespace {

constexpr std::uint32_t secondsPerMinute = 60;
constexpr std::uint32_t secondsPerHour = 3600;
constexpr std::uint32_t secondsPerDay = 86400;

}  // namespace

RegularTimecodeCalculator::RegularTimecodeCalculator(std::uint8_t rate, std::uint8_t unitsPerFrame)
    : unitsPerFrame_(unitsPerFrame == 0 ? 1 : unitsPerFrame),
      framesPerSecond_(rate),
      framesPerMinute_(rate * secondsPerMinute),
      framesPerHour_(rate * secondsPerHour),
      framesPerDay_(rate * secondsPerDay) {
  zelta::requireFrameRate(rate);
}

void RegularTimecodeCalculator::toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes,
                                           std::uint8_t& seconds, std::uint8_t& frames, std::uint8_t* field) const {
  std::uint32_t t = count / unitsPerFrame_;
  hours = static_cast<std::uint8_t>(t / framesPerHour_);
  t %= framesPerHour_;
  minutes = static_cast<std::uint8_t>(t / framesPerMinute_);
  t %= framesPerMinute_;
  seconds = static_cast<std::uint8_t>(t / framesPerSecond_);
  frames = static_cast<std::uint8_t>(t % framesPerSecond_);
  if (field) *field = static_cast<std::uint8_t>(count % unitsPerFrame_);
}

std::uint32_t RegularTimecodeCalculator::toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds,
                                                 std::uint8_t frames, std::uint8_t field) const {
  if (!isValid(hours, minutes, seconds, frames, field)) throw std::runtime_error("valid timecode");
  return (hours * framesPerHour_ + minutes * framesPerMinute_ + seconds * framesPerSecond_ + frames) *
             unitsPerFrame_ +
         field;
}

bool RegularTimecodeCalculator::isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds,
                                        std::uint8_t frames, std::uint8_t field) const {
  return isInRange(hours, minutes, seconds, frames, field);
}

bool RegularTimecodeCalculator::isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds,
                                          std::uint8_t frames, std::uint8_t field) const {
  return zelta::isTimecodeInRange(hours, minutes, seconds, frames, field, framesPerSecond_, unitsPerFrame_);
}

std::uint32_t RegularTimecodeCalculator::normalize(std::int32_t count) const {
  return zelta::wrapTimecodeCount(count, getCountPerDay());
}

std::uint32_t RegularTimecodeCalculator::getCountPerDay() const { return unitsPerFrame_ * framesPerDay_; }
