// Zelta: timecode arithmetic. Part of klv.h, which includes it.
#ifndef ZELTA_INCLUDE_KLV_TIMECODE_H
#define ZELTA_INCLUDE_KLV_TIMECODE_H

#include <cstdint>

#include "klv_values.h"

// ---------------------------------------------------------------------------
// Timecode
//
// A count is the number of units from 00:00:00:00; a unit is a frame, or a
// field when a frame counts two units. Failures are std::runtime_error, and
// std::logic_error for the guard of normalize.

class ZELTA_EXPORT TimecodeCalculator {
public:
  virtual ~TimecodeCalculator();
  // The field output is skipped when null.
  virtual void toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                          std::uint8_t& frames, std::uint8_t* field = nullptr) const = 0;
  virtual std::uint32_t toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                                std::uint8_t field) const = 0;
  virtual bool isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                       std::uint8_t field) const = 0;
  virtual bool isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                         std::uint8_t field) const = 0;
  // The count wrapped into one day.
  virtual std::uint32_t normalize(std::int32_t count) const = 0;
  virtual std::uint32_t getCountPerDay() const = 0;
};

// Every frame number exists. unitsPerFrame 0 means 1.
class ZELTA_EXPORT RegularTimecodeCalculator : public TimecodeCalculator {
public:
  RegularTimecodeCalculator(std::uint8_t rate, std::uint8_t unitsPerFrame);

  void toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                  std::uint8_t& frames, std::uint8_t* field = nullptr) const override;
  std::uint32_t toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                        std::uint8_t field) const override;
  bool isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
               std::uint8_t field) const override;
  bool isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                 std::uint8_t field) const override;
  std::uint32_t normalize(std::int32_t count) const override;
  std::uint32_t getCountPerDay() const override;

private:
  std::uint32_t unitsPerFrame_;
  std::uint32_t framesPerSecond_;
  std::uint32_t framesPerMinute_;
  std::uint32_t framesPerHour_;
  std::uint32_t framesPerDay_;
};

// NTSC drop frame counting: the first d frame numbers of every minute but
// each tenth do not exist, d being 2 at base 30 and 4 at base 60.
class ZELTA_EXPORT NTSCDropFrameCalculator : public TimecodeCalculator {
public:
  NTSCDropFrameCalculator(std::uint8_t rate, std::uint8_t unitsPerFrame);

  void toTimecode(std::uint32_t count, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                  std::uint8_t& frames, std::uint8_t* field = nullptr) const override;
  // Checks the range only: a dropped number moves up to the next one that
  // exists.
  std::uint32_t toCount(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                        std::uint8_t field) const override;
  bool isValid(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
               std::uint8_t field) const override;
  bool isInRange(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                 std::uint8_t field) const override;
  std::uint32_t normalize(std::int32_t count) const override;
  std::uint32_t getCountPerDay() const override;

private:
  std::uint32_t unitsPerFrame_;
  std::uint32_t droppedPerMinute_;
  std::uint32_t framesPerSecond_;
  std::uint32_t framesPerMinute_;
  std::uint32_t framesPerTenMinutes_;
  std::uint32_t framesPerDay_;
};

// The caller owns the result. Drop frame needs a multiple of 30 ("valid drop
// frame rate"); unitsPerFrame 0 means 1.
ZELTA_EXPORT TimecodeCalculator* createTimecodeCalculator(std::uint8_t rate, bool dropFrame,
                                                          std::uint8_t unitsPerFrame);
// Two units a frame when fieldCounting is true.
ZELTA_EXPORT TimecodeCalculator* createTimecodeCalculator(std::uint8_t rate, bool dropFrame, bool fieldCounting);
// A rational frame rate: only multiples of 30000/1001 drop frames.
ZELTA_EXPORT TimecodeCalculator* createTimecodeCalculator(int numerator, int denominator);

#endif
