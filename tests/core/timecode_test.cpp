#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include "klv.h"

namespace {

typedef std::unique_ptr<TimecodeCalculator> Calculator;

Calculator create(std::uint8_t rate, bool dropFrame, std::uint8_t unitsPerFrame = 1) {
  return Calculator(createTimecodeCalculator(rate, dropFrame, unitsPerFrame));
}

struct Timecode {
  int hours, minutes, seconds, frames, field;
  bool operator==(const Timecode& o) const {
    return hours == o.hours && minutes == o.minutes && seconds == o.seconds && frames == o.frames &&
           field == o.field;
  }
};

std::ostream& operator<<(std::ostream& out, const Timecode& t) {
  return out << t.hours << ":" << t.minutes << ":" << t.seconds << ":" << t.frames << "." << t.field;
}

Timecode timecodeOf(const TimecodeCalculator& calculator, std::uint32_t count) {
  std::uint8_t h = 0, m = 0, s = 0, f = 0, field = 0;
  calculator.toTimecode(count, h, m, s, f, &field);
  return Timecode{h, m, s, f, field};
}

template <typename Call>
std::string runtimeErrorOf(Call call) {
  try {
    call();
  } catch (const std::runtime_error& error) {
    return error.what();
  }
  return "no failure";
}

}  // namespace

TEST(NTSCDropFrameCalculator, Base30CountsFramesPerMinuteTenMinutesAndDay) {
  Calculator calculator = create(30, true);
  EXPECT_EQ(calculator->getCountPerDay(), 2589408u);
  EXPECT_EQ(calculator->toCount(0, 10, 0, 0, 0), 17982u);
  EXPECT_EQ(calculator->toCount(0, 2, 0, 2, 0) - calculator->toCount(0, 1, 0, 2, 0), 1798u);
  EXPECT_EQ(calculator->toCount(0, 20, 0, 0, 0) - calculator->toCount(0, 10, 0, 0, 0), 17982u);
}

TEST(NTSCDropFrameCalculator, Count1800IsOneMinuteAndTwoFrames) {
  EXPECT_EQ(timecodeOf(*create(30, true), 1800), (Timecode{0, 1, 0, 2, 0}));
}

TEST(NTSCDropFrameCalculator, Count1799IsTheLastFrameOfTheFirstMinute) {
  EXPECT_EQ(timecodeOf(*create(30, true), 1799), (Timecode{0, 0, 59, 29, 0}));
}

TEST(NTSCDropFrameCalculator, Count17982IsTenMinutes) {
  EXPECT_EQ(timecodeOf(*create(30, true), 17982), (Timecode{0, 10, 0, 0, 0}));
}

TEST(NTSCDropFrameCalculator, DroppedNumberRoundsUpToTheNextThatExists) {
  Calculator calculator = create(30, true);
  EXPECT_EQ(calculator->toCount(0, 1, 0, 0, 0), 1800u);
  EXPECT_EQ(calculator->toCount(0, 1, 0, 1, 0), 1800u);
  EXPECT_EQ(calculator->toCount(0, 1, 0, 2, 0), 1800u);
}

TEST(NTSCDropFrameCalculator, TenMinuteMarkHasNoAdjustment) {
  Calculator calculator = create(30, true);
  EXPECT_EQ(calculator->toCount(0, 10, 0, 0, 0), 17982u);
  EXPECT_EQ(calculator->toCount(0, 10, 0, 1, 0), 17983u);
}

TEST(NTSCDropFrameCalculator, DroppedNumberIsInRangeButNotValid) {
  Calculator calculator = create(30, true);
  EXPECT_FALSE(calculator->isValid(0, 1, 0, 1, 0));
  EXPECT_TRUE(calculator->isInRange(0, 1, 0, 1, 0));
  EXPECT_TRUE(calculator->isValid(0, 1, 0, 2, 0));
  EXPECT_TRUE(calculator->isValid(0, 10, 0, 0, 0));
  EXPECT_TRUE(calculator->isValid(0, 1, 1, 0, 0));
}

TEST(NTSCDropFrameCalculator, Base60DropsFourNumbers) {
  Calculator calculator = create(60, true);
  EXPECT_EQ(timecodeOf(*calculator, 3599), (Timecode{0, 0, 59, 59, 0}));
  EXPECT_EQ(timecodeOf(*calculator, 3600), (Timecode{0, 1, 0, 4, 0}));
  EXPECT_FALSE(calculator->isValid(0, 1, 0, 3, 0));
  EXPECT_TRUE(calculator->isValid(0, 1, 0, 4, 0));
  EXPECT_EQ(calculator->toCount(0, 1, 0, 0, 0), 3600u);
  EXPECT_EQ(calculator->getCountPerDay(), ((60u * 60 - 4) * 10 + 4) * 144);
}

TEST(NTSCDropFrameCalculator, ToCountChecksTheRange) {
  Calculator calculator = create(30, true);
  EXPECT_EQ(runtimeErrorOf([&] { calculator->toCount(24, 0, 0, 0, 0); }), "valid timecode");
  EXPECT_EQ(runtimeErrorOf([&] { calculator->toCount(0, 0, 0, 30, 0); }), "valid timecode");
  EXPECT_EQ(runtimeErrorOf([&] { calculator->toCount(0, 0, 0, 0, 1); }), "valid timecode");
}

TEST(RegularTimecodeCalculator, ToCountRejectsATimecodeThatDoesNotExist) {
  Calculator calculator = create(25, false);
  EXPECT_EQ(runtimeErrorOf([&] { calculator->toCount(0, 0, 0, 25, 0); }), "valid timecode");
  EXPECT_EQ(runtimeErrorOf([&] { calculator->toCount(0, 60, 0, 0, 0); }), "valid timecode");
  EXPECT_EQ(calculator->toCount(23, 59, 59, 24, 0), 25u * 86400 - 1);
}

TEST(TimecodeCalculator, NormalizeOfMinusOneIsTheLastCountOfTheDay) {
  for (bool dropFrame : {false, true}) {
    Calculator calculator = create(30, dropFrame, 2);
    EXPECT_EQ(calculator->normalize(-1), calculator->getCountPerDay() - 1);
    EXPECT_EQ(calculator->normalize(static_cast<std::int32_t>(calculator->getCountPerDay()) + 5), 5u);
    EXPECT_EQ(calculator->normalize(7), 7u);
  }
}

TEST(RegularTimecodeCalculator, TwoUnitsPerFrameCountFields) {
  Calculator calculator = create(25, false, 2);
  EXPECT_EQ(timecodeOf(*calculator, 3), (Timecode{0, 0, 0, 1, 1}));
  EXPECT_EQ(calculator->toCount(0, 0, 0, 1, 1), 3u);
  EXPECT_EQ(calculator->getCountPerDay(), 2u * 25 * 86400);
}

TEST(TimecodeCalculator, NullFieldOutputIsSkipped) {
  Calculator calculator = create(25, false, 2);
  std::uint8_t h = 9, m = 9, s = 9, f = 9;
  calculator->toTimecode(25 * 2 * 61 + 1, h, m, s, f);
  EXPECT_EQ((Timecode{h, m, s, f, 0}), (Timecode{0, 1, 1, 0, 0}));
}

TEST(TimecodeCalculator, UnitsPerFrameZeroMeansOne) {
  EXPECT_EQ(create(25, false, 0)->getCountPerDay(), 25u * 86400);
  EXPECT_EQ(create(30, true, 0)->getCountPerDay(), 2589408u);
}

TEST(TimecodeCalculator, FieldCountingGivesTwoUnitsPerFrame) {
  EXPECT_EQ(Calculator(createTimecodeCalculator(25, false, true))->getCountPerDay(), 2u * 25 * 86400);
  EXPECT_EQ(Calculator(createTimecodeCalculator(25, false, false))->getCountPerDay(), 25u * 86400);
  EXPECT_EQ(Calculator(createTimecodeCalculator(30, true, true))->getCountPerDay(), 2u * 2589408);
}

TEST(TimecodeCalculator, RationalRatesChooseDropFrameOnlyForMultiplesOf30000Over1001) {
  Calculator ntsc60(createTimecodeCalculator(60000, 1001));
  ASSERT_NE(dynamic_cast<NTSCDropFrameCalculator*>(ntsc60.get()), nullptr);
  EXPECT_EQ(ntsc60->getCountPerDay(), ((60u * 60 - 4) * 10 + 4) * 144);

  Calculator ntsc30(createTimecodeCalculator(30000, 1001));
  ASSERT_NE(dynamic_cast<NTSCDropFrameCalculator*>(ntsc30.get()), nullptr);
  EXPECT_EQ(ntsc30->getCountPerDay(), 2589408u);

  Calculator film(createTimecodeCalculator(24000, 1001));
  ASSERT_NE(dynamic_cast<RegularTimecodeCalculator*>(film.get()), nullptr);
  EXPECT_EQ(film->getCountPerDay(), 24u * 86400);

  Calculator pal(createTimecodeCalculator(25, 1));
  ASSERT_NE(dynamic_cast<RegularTimecodeCalculator*>(pal.get()), nullptr);
  EXPECT_EQ(pal->getCountPerDay(), 25u * 86400);

  Calculator negative(createTimecodeCalculator(-50, -2));
  EXPECT_EQ(negative->getCountPerDay(), 25u * 86400);
}

TEST(TimecodeCalculator, DropFrameNeedsAMultipleOf30) {
  EXPECT_EQ(runtimeErrorOf([] { create(25, true); }), "valid drop frame rate");
  EXPECT_EQ(runtimeErrorOf([] { createTimecodeCalculator(25, true, true); }), "valid drop frame rate");
}

TEST(TimecodeCalculator, RateMustNotBeZero) {
  EXPECT_EQ(runtimeErrorOf([] { create(0, false); }), "non-zero frame rate");
  EXPECT_EQ(runtimeErrorOf([] { create(0, true); }), "non-zero frame rate");
  EXPECT_EQ(runtimeErrorOf([] { createTimecodeCalculator(0, 1001); }), "non-zero frame rate");
}

TEST(TimecodeCalculator, RationalRateNeedsANonZeroDenominatorAndOneSign) {
  EXPECT_EQ(runtimeErrorOf([] { createTimecodeCalculator(25, 0); }), "non-zero frame rate denominator");
  EXPECT_EQ(runtimeErrorOf([] { createTimecodeCalculator(-25, 1); }), "positive frame rate");
  EXPECT_EQ(runtimeErrorOf([] { createTimecodeCalculator(25, -1); }), "positive frame rate");
}

// Every count of a day goes to a valid timecode and back to itself.
struct RoundTripCase {
  std::uint8_t rate;
  bool dropFrame;
  std::uint8_t unitsPerFrame;
};

class TimecodeRoundTrip : public ::testing::TestWithParam<RoundTripCase> {};

TEST_P(TimecodeRoundTrip, EveryCountOfADayComesBack) {
  const RoundTripCase& c = GetParam();
  Calculator calculator = create(c.rate, c.dropFrame, c.unitsPerFrame);
  const std::uint32_t perDay = calculator->getCountPerDay();
  std::uint32_t failures = 0;
  std::uint32_t firstFailure = 0;
  for (std::uint32_t n = 0; n < perDay; ++n) {
    std::uint8_t h, m, s, f, field;
    calculator->toTimecode(n, h, m, s, f, &field);
    if (!calculator->isValid(h, m, s, f, field) || calculator->toCount(h, m, s, f, field) != n) {
      if (failures++ == 0) firstFailure = n;
    }
  }
  EXPECT_EQ(failures, 0u) << "first at count " << firstFailure;
  EXPECT_EQ(timecodeOf(*calculator, perDay - 1),
            (Timecode{23, 59, 59, c.rate - 1, c.unitsPerFrame - 1}));
}

INSTANTIATE_TEST_SUITE_P(
    AllBases, TimecodeRoundTrip,
    ::testing::Values(RoundTripCase{24, false, 1}, RoundTripCase{24, false, 2}, RoundTripCase{25, false, 1},
                      RoundTripCase{25, false, 2}, RoundTripCase{30, false, 1}, RoundTripCase{30, false, 2},
                      RoundTripCase{50, false, 1}, RoundTripCase{50, false, 2}, RoundTripCase{60, false, 1},
                      RoundTripCase{60, false, 2}, RoundTripCase{30, true, 1}, RoundTripCase{30, true, 2},
                      RoundTripCase{60, true, 1}, RoundTripCase{60, true, 2}),
    [](const ::testing::TestParamInfo<RoundTripCase>& info) {
      return std::to_string(info.param.rate) + (info.param.dropFrame ? "DropFrame" : "Regular") +
             std::to_string(info.param.unitsPerFrame) + "UnitsPerFrame";
    });
