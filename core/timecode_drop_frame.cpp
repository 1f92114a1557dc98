#include <cstdint>
#include <stdexcept>

#include "core/timecode.h"
#include "klv.h"

namespace {

constexpr std::uint32_t secondsPerMinute = 60;
constexpr std::uint32_t tenMinutesPerDay = 144;

// Numbers dropped at the start of a minute: 2 at base 30, 4 at base 60.
std::uint32_t droppedPerMinute(std::uint8_t rate) { return (rate / 15u) & 30u; }

std::uint8_t checkedDropFrameRate(std::uint8_t rate) {
  zelta::requireFrameRate(rate);
  if (rate % 30 != 0) throw std::runtime_error("valid drop frame rate");
  return rate;
}

}  // namespace

NTSCDropFrameCalculator::NTSCDropFrameCalculator(std::uint8_t rate, std::uint8_t unitsPerFrame)
    : unitsPerFrame_(unitsPerFrame == 0 ? 1 : unitsPerFrame),
      droppedPerMinute_(droppedPerMinute(checkedDropFrameRate(rate))),
      framesPerSecond_(rate),
      framesPerMinute_(rate * secondsPerMinute - droppedPerMinute_),
      framesPerTenMinutes_(framesPerMinute_ * 10 + droppedPerMinute_),
      framesPerDay_(framesPerTenMinutes_ * tenMinutesPerDay) {}

void NTSCDropFrameCalculator::toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes,
                                         std::uint8_t& seconds, std::uint8_t& frames, std::uint8_t* field) const {
  const std::uint32_t t = count / unitsPerFrame_;
  const std::uint32_t tens = t / framesPerTenMinutes_;
  const std::uint32_t rest = t % framesPerTenMinutes_;
  const std::uint32_t h = tens / 6;
  // Negative in the first d frames of a ten-minute block, where q is 0.
  const std::int64_t shifted = static_cast<std::int64_t>(rest) - droppedPerMinute_;
  const std::int64_t q = shifted / framesPerMinute_;
  const std::int64_t m = shifted % framesPerMinute_;
  hours = static_cast<std::uint8_t>(h);
  minutes = static_cast<std::uint8_t>((tens - h * 6) * 10 + q);
  const std::uint32_t v = static_cast<std::uint32_t>(m + droppedPerMinute_);
  seconds = static_cast<std::uint8_t>(v / framesPerSecond_);
  frames = static_cast<std::uint8_t>(v % framesPerSecond_);
  if (field) *field = static_cast<std::uint8_t>(count % unitsPerFrame_);
}

std::uint32_t NTSCDropFrameCalculator::toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds,
                                               std::uint8_t frames, std::uint8_t field) const {
  if (!isInRange(hours, minutes, seconds, frames, field)) throw std::runtime_error("valid timecode");
  const std::uint32_t k = minutes % 10u;
  const std::uint32_t ten = minutes / 10u;
  std::uint32_t base = (hours * 6u + ten) * framesPerTenMinutes_ + k * framesPerMinute_ +
                       seconds * framesPerSecond_ + frames;
  if (seconds == 0 && k != 0 && frames < droppedPerMinute_) base += droppedPerMinute_ - frames;
  return base * unitsPerFrame_ + field;
}

bool NTSCDropFrameCalculator::isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds,
                                      std::uint8_t frames, std::uint8_t field) const {
  if (!isInRange(hours, minutes, seconds, frames, field)) return false;
  return seconds != 0 || minutes % 10 == 0 || frames >= droppedPerMinute_;
}

bool NTSCDropFrameCalculator::isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds,
                                        std::uint8_t frames, std::uint8_t field) const {
  return zelta::isTimecodeInRange(hours, minutes, seconds, frames, field, framesPerSecond_, unitsPerFrame_);
}

std::uint32_t NTSCDropFrameCalculator::normalize(std::int32_t count) const {
  return zelta::wrapTimecodeCount(count, getCountPerDay());
}

std::uint32_t NTSCDropFrameCalculator::getCountPerDay() const { return unitsPerFrame_ * framesPerDay_; }
