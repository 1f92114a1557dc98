// The SMPTE 12M user stamp of a frame count.
#include "kit/user_stamp.h"

#include <gtest/gtest.h>

#include <memory>

#include "core/failure.h"

using zelta_test::failureOf;

namespace {

// Answers one timecode whatever the count.
class FixedCalculator : public RegularTimecodeCalculator {
 public:
  FixedCalculator(std::uint8_t hours, std::uint8_t minutes, std::uint8_t seconds, std::uint8_t frames,
                  std::uint8_t field)
      : RegularTimecodeCalculator(25, 1), h_(hours), m_(minutes), s_(seconds), f_(frames), field_(field) {}
  void toTimecode(std::uint32_t, std::uint8_t& hours, std::uint8_t& minutes, std::uint8_t& seconds,
                  std::uint8_t& frames, std::uint8_t* field) const override {
    hours = h_;
    minutes = m_;
    seconds = s_;
    frames = f_;
    if (field) *field = field_;
  }

 private:
  std::uint8_t h_, m_, s_, f_, field_;
};

TEST(UserStamp, KindThenFramesSecondsMinutesHoursInBCD) {
  const MXFSDTICPTimeStamp stamp = zelta::getUserStamp(FixedCalculator(23, 59, 58, 24, 0), 0, 25, false);
  EXPECT_EQ(stamp, (MXFSDTICPTimeStamp{0x81, 0x24, 0x58, 0x59, 0x23}));
}

TEST(UserStamp, DropFrameAndFieldFlags) {
  EXPECT_EQ(zelta::getUserStamp(FixedCalculator(1, 2, 3, 4, 0), 0, 30, true),
            (MXFSDTICPTimeStamp{0x81, 0x44, 0x03, 0x02, 0x01}));
  // The field flag: in the hours at a base of 25, in the seconds at 30.
  EXPECT_EQ(zelta::getUserStamp(FixedCalculator(1, 2, 3, 4, 1), 0, 25, false),
            (MXFSDTICPTimeStamp{0x81, 0x04, 0x03, 0x02, 0x81}));
  EXPECT_EQ(zelta::getUserStamp(FixedCalculator(1, 2, 3, 4, 1), 0, 30, false),
            (MXFSDTICPTimeStamp{0x81, 0x04, 0x83, 0x02, 0x01}));
}

TEST(UserStamp, UnitsBeyondTheirTensFailValidTens) {
  EXPECT_EQ(failureOf([] { zelta::getUserStamp(FixedCalculator(30, 0, 0, 0, 0), 0, 25, false); }),
            "assertion failure: valid tens");
  EXPECT_EQ(failureOf([] { zelta::getUserStamp(FixedCalculator(0, 80, 0, 0, 0), 0, 25, false); }),
            "assertion failure: valid tens");
  EXPECT_EQ(failureOf([] { zelta::getUserStamp(FixedCalculator(0, 0, 80, 0, 0), 0, 25, false); }),
            "assertion failure: valid tens");
  EXPECT_EQ(failureOf([] { zelta::getUserStamp(FixedCalculator(0, 0, 0, 40, 0), 0, 25, false); }),
            "assertion failure: valid tens");
}

TEST(UserStamp, CalculatorAtTheTimecodeBase) {
  EXPECT_EQ(zelta::getTimecodeBase({30000, 1001}), 30u);
  EXPECT_EQ(zelta::getTimecodeBase({50, 1}), 25u);
  EXPECT_EQ(zelta::getTimecodeBase({60000, 1001}), 30u);
  // At 50 frames a second a frame counts two units: frame 51 is 00:00:01:00,
  // second field.
  std::unique_ptr<TimecodeCalculator> calculator = zelta::makeStampCalculator({50, 1}, false);
  EXPECT_EQ(zelta::getUserStamp(*calculator, 51, 25, false), (MXFSDTICPTimeStamp{0x81, 0x00, 0x01, 0x00, 0x80}));
}

}  // namespace
