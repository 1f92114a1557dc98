// The SMPTE 12M user stamp of a system item, as the kit writes it and
// checks it.
#ifndef ZELTA_KIT_USER_STAMP_H
#define ZELTA_KIT_USER_STAMP_H

#include <cstdint>
#include <memory>

#include "mxf.h"

namespace zelta {

inline constexpr std::uint8_t userStampKind = 0x81;

// A calculator at the timecode base of a rate: the rate rounded, halved
// above 30, where a frame counts two units. Drop frame counting only at a
// base of 30.
std::unique_ptr<TimecodeCalculator> makeStampCalculator(const MXFRational& editRate, bool dropFrame);
std::uint32_t getTimecodeBase(const MXFRational& editRate);
// The rate rounded to whole frames a second; 0 for a rate of no frames.
std::uint32_t getRoundedRate(const MXFRational& editRate);

// The stamp of a count: the kind octet, then frames, seconds, minutes and
// hours in BCD ("valid tens"), the drop frame flag in bit 6 of the frames,
// the field flag in bit 7 of the hours at a base of 25 and of the seconds
// at 24 and 30; all other octets 0.
MXFSDTICPTimeStamp getUserStamp(const TimecodeCalculator& calculator, std::uint32_t count, std::uint32_t timecodeBase,
                                bool dropFrame);

}  // namespace zelta

#endif
