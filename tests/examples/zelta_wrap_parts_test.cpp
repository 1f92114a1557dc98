// zelta-wrap's parts on their own: the command line, the sample counts of
// edit units, the D-10 sound element and the raw frame sizes.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "clip.h"
#include "options.h"
#include "sound_layout.h"

namespace {

using zelta_wrap::InputError;
using zelta_wrap::Options;
using zelta_wrap::parseOptions;
using zelta_wrap::UsageError;

Options parse(const std::vector<std::string>& arguments) { return parseOptions(arguments); }

// The text of the failure of the call, or empty.
template <typename Failure, typename Call>
std::string failureOf(Call call) {
  try {
    call();
  } catch (const Failure& e) {
    return e.what();
  }
  return std::string();
}

TEST(ZeltaWrapOptions, ReadsEveryOption) {
  const Options o = parse({"--format",
                           "D10",
                           "--rate",
                           "30000/1001",
                           "--bit-rate",
                           "40",
                           "--interlaced",
                           "--size",
                           "1920x540",
                           "--start-timecode",
                           "01:02:03:04",
                           "--drop-frame",
                           "--package-name",
                           "clip é",
                           "--unknown-duration",
                           "--avc-wrapping",
                           "constant",
                           "--max-gop",
                           "15",
                           "--closed-gop",
                           "--profile-level",
                           "130",
                           "--simple-studio-profile",
                           "--raw-code",
                           "1057",
                           "--quantization-bits",
                           "16",
                           "-o",
                           "out.mxf",
                           "in.m2v",
                           "a.wav",
                           "b.wav"});
  EXPECT_EQ(o.format, ZeltaEssenceFormat::D10);
  EXPECT_EQ(o.rate->numerator, 30000);
  EXPECT_EQ(o.rate->denominator, 1001);
  EXPECT_EQ(*o.bitRate, 40000000u);
  EXPECT_FALSE(*o.progressive);
  EXPECT_EQ(*o.size, ZeltaSize(1920, 540));
  EXPECT_EQ(o.startTimecode.hours, 1);
  EXPECT_EQ(o.startTimecode.minutes, 2);
  EXPECT_EQ(o.startTimecode.seconds, 3);
  EXPECT_EQ(o.startTimecode.frames, 4);
  EXPECT_TRUE(o.dropFrame);
  EXPECT_EQ(o.packageName, std::wstring(L"clip \u00e9"));
  EXPECT_TRUE(o.unknownDuration);
  EXPECT_EQ(o.avcWrapping, zelta_wrap::AVCWrapping::constant);
  EXPECT_EQ(*o.maxGOP, 15);
  EXPECT_TRUE(o.closedGOP);
  EXPECT_EQ(*o.profileLevel, 130);
  EXPECT_TRUE(o.simpleStudioProfile);
  EXPECT_EQ(o.rawCode, 1057);
  EXPECT_EQ(o.quantizationBits, 16u);
  EXPECT_EQ(o.output, "out.mxf");
  EXPECT_EQ(o.picture, "in.m2v");
  EXPECT_EQ(o.sounds, (std::vector<std::string>{"a.wav", "b.wav"}));
}

TEST(ZeltaWrapOptions, DefaultsWhenOnlyTheRequiredAreGiven) {
  const Options o = parse({"--format", "DV", "-o", "out.mxf", "in.dv"});
  EXPECT_EQ(o.format, ZeltaEssenceFormat::DV);
  EXPECT_FALSE(o.rate.has_value());
  EXPECT_FALSE(o.progressive.has_value());
  EXPECT_EQ(o.quantizationBits, 24u);
  EXPECT_EQ(o.avcWrapping, zelta_wrap::AVCWrapping::variable);
  EXPECT_FALSE(o.unknownDuration);
  EXPECT_TRUE(o.sounds.empty());
}

TEST(ZeltaWrapOptions, BitRateInMegabitsOrBits) {
  EXPECT_EQ(*parse({"--format", "D10", "--bit-rate", "30", "-o", "o", "i"}).bitRate, 30000000u);
  EXPECT_EQ(*parse({"--format", "D10", "--bit-rate", "50000000", "-o", "o", "i"}).bitRate, 50000000u);
}

TEST(ZeltaWrapOptions, UsageErrors) {
  EXPECT_EQ(failureOf<UsageError>([] { parse({"-o", "o", "i"}); }), "--format is required");
  EXPECT_EQ(failureOf<UsageError>([] { parse({"--format", "DV", "i"}); }), "-o OUT.mxf is required");
  EXPECT_EQ(failureOf<UsageError>([] { parse({"--format", "DV", "-o", "o"}); }), "a picture input is required");
  EXPECT_EQ(failureOf<UsageError>([] {
              parse({"--format", "DV", "--frobnicate", "-o", "o", "i"});
            }),
            "unknown option --frobnicate");
  EXPECT_EQ(failureOf<UsageError>([] { parse({"--format"}); }), "option --format needs a value");
}

TEST(ZeltaWrapOptions, HelpNeedsNothingElse) { EXPECT_TRUE(parse({"--help"}).help); }

TEST(ZeltaWrapOptions, UnknownValuesAreRefused) {
  EXPECT_EQ(failureOf<InputError>([] { parse({"--format", "Proxy"}); }), "invalid value for --format: Proxy");
  EXPECT_EQ(failureOf<InputError>([] { parse({"--rate", "25/0"}); }), "invalid value for --rate: 25/0");
  EXPECT_EQ(failureOf<InputError>([] { parse({"--rate", "fast"}); }), "invalid value for --rate: fast");
  EXPECT_EQ(failureOf<InputError>([] { parse({"--size", "720"}); }), "invalid value for --size: 720");
  EXPECT_EQ(failureOf<InputError>([] {
              parse({"--start-timecode", "1:2:3:4"});
            }),
            "invalid value for --start-timecode: 1:2:3:4");
  EXPECT_EQ(failureOf<InputError>([] {
              parse({"--avc-wrapping", "fixed"});
            }),
            "invalid value for --avc-wrapping: fixed");
  EXPECT_EQ(failureOf<InputError>([] {
              parse({"--quantization-bits", "20"});
            }),
            "invalid value for --quantization-bits: 20");
  EXPECT_EQ(failureOf<InputError>([] { parse({"--max-gop", "70000"}); }), "invalid value for --max-gop: 70000");
}

TEST(ZeltaWrapSoundLayout, SampleCountsOfTheFiveFrameSequence) {
  const std::vector<std::uint32_t> counts{1602, 1601, 1602, 1601, 1602};
  for (std::uint64_t unit = 0; unit < 10; ++unit)
    EXPECT_EQ(zelta_wrap::getSampleCount({30000, 1001}, unit), counts[unit % 5]) << unit;
  NTSCSoundParameters d10;
  for (std::int32_t frame = 0; frame < 5; ++frame)
    EXPECT_EQ(zelta_wrap::getSampleCount({30000, 1001}, static_cast<std::uint64_t>(frame)), d10.getSampleCount(frame));
}

TEST(ZeltaWrapSoundLayout, SampleCountsAddUpOverLongRuns) {
  std::uint64_t total = 0;
  for (std::uint64_t unit = 0; unit < 5005; ++unit) total += zelta_wrap::getSampleCount({60000, 1001}, unit);
  EXPECT_EQ(total, 4008004u);
  EXPECT_EQ(zelta_wrap::getSampleCount({25, 1}, 123456789), 1920u);
  EXPECT_EQ(zelta_wrap::getSampleCount({24000, 1001}, 7), 2002u);
}

TEST(ZeltaWrapSoundLayout, D10ElementOfTwoSamples) {
  // Two channels of 24-bit samples, two samples each.
  const std::vector<std::vector<std::uint8_t>> channels{{0x01, 0x02, 0x03, 0x04, 0x05, 0x06},
                                                        {0xFF, 0xFF, 0xFF, 0x00, 0x00, 0x80}};
  std::vector<std::uint8_t> element;
  zelta_wrap::codeD10Sound(channels, 3, 2, 3, 4, element);
  ASSERT_EQ(element.size(), 4u + 2 * 8 * 4);
  EXPECT_EQ(element[0], 3);  // sequence number
  EXPECT_EQ(element[1], 2);  // sample count, low octet first
  EXPECT_EQ(element[2], 0);
  EXPECT_EQ(element[3], 0x0F);  // four channels in use
  // Sample 0x030201 of channel 0 in bits 4 to 27.
  EXPECT_EQ(std::vector<std::uint8_t>(element.begin() + 4, element.begin() + 8),
            (std::vector<std::uint8_t>{0x10, 0x20, 0x30, 0x00}));
  // Sample 0xFFFFFF of channel 1, with its number.
  EXPECT_EQ(std::vector<std::uint8_t>(element.begin() + 8, element.begin() + 12),
            (std::vector<std::uint8_t>{0xF1, 0xFF, 0xFF, 0x0F}));
  // Channel 7 is silent but numbered.
  EXPECT_EQ(std::vector<std::uint8_t>(element.begin() + 32, element.begin() + 36),
            (std::vector<std::uint8_t>{0x07, 0x00, 0x00, 0x00}));
  // Sample 0x800000 of channel 1 in the second sample.
  EXPECT_EQ(std::vector<std::uint8_t>(element.begin() + 40, element.begin() + 44),
            (std::vector<std::uint8_t>{0x01, 0x00, 0x00, 0x08}));
}

TEST(ZeltaWrapSoundLayout, D10Element16BitSamplesFillTheTopBits) {
  const std::vector<std::vector<std::uint8_t>> channels{{0x34, 0x12}};
  std::vector<std::uint8_t> element;
  zelta_wrap::codeD10Sound(channels, 2, 1, 0, 8, element);
  EXPECT_EQ(element[3], 0xFF);
  // 0x1234 as the 24-bit 0x123400.
  EXPECT_EQ(std::vector<std::uint8_t>(element.begin() + 4, element.begin() + 8),
            (std::vector<std::uint8_t>{0x00, 0x40, 0x23, 0x01}));
}

TEST(ZeltaWrapSoundLayout, D10ElementOfAFullFrameHasTheDriversLength) {
  std::vector<std::uint8_t> element;
  zelta_wrap::codeD10Sound({}, 3, 1920, 0, 4, element);
  RegularSoundParameters parameters(25);
  EXPECT_EQ(element.size(), parameters.getElementLength(0));
}

TEST(ZeltaWrapClip, OptionValuesThatTheFormatRefuses) {
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(parse({"--format", "D10", "--rate", "50", "-o", "o", "i"}));
            }),
            "D10 has no rate 50");
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(parse({"--format", "MPEG", "--rate", "48", "-o", "o", "i"}));
            }),
            "MPEG has no rate 48");
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(parse({"--format", "DV", "--progressive", "-o", "o", "i"}));
            }),
            "DV is interlaced");
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(parse({"--format", "Raw", "--interlaced", "-o", "o", "i"}));
            }),
            "Raw is progressive");
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(parse({"--format", "DV", "--rate", "25", "--drop-frame", "-o", "o", "i"}));
            }),
            "--drop-frame needs the rate 30000/1001 or 60000/1001");
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(
                  parse({"--format", "DV", "--rate", "25", "--start-timecode", "00:00:00:25", "-o", "o", "i"}));
            }),
            "invalid value for --start-timecode at rate 25");
  EXPECT_EQ(failureOf<InputError>([] {
              zelta_wrap::checkOptions(parse({"--format", "Raw", "--raw-code", "786", "-o", "o", "i"}));
            }),
            "invalid value for --raw-code: 786 at width 4096");
}

TEST(ZeltaWrapClip, OptionValuesThatTheFormatTakes) {
  EXPECT_EQ(
      failureOf<InputError>([] {
        zelta_wrap::checkOptions(parse({"--format", "Raw", "--rate", "48000/1001", "--progressive", "-o", "o", "i"}));
        zelta_wrap::checkOptions(parse({"--format", "D10", "--rate", "30000/1001", "--drop-frame", "--start-timecode",
                                        "00:01:00:02", "-o", "o", "i"}));
        zelta_wrap::checkOptions(parse({"--format", "AVC", "--rate", "60000/1001", "--interlaced", "-o", "o", "i"}));
      }),
      "");
}

TEST(ZeltaWrapClip, RawFrameSizes) {
  EXPECT_EQ(zelta_wrap::getRawFrameSize(801, 4096), 10190824u);
  EXPECT_EQ(zelta_wrap::getRawFrameSize(0, 4096), 10190824u);
  EXPECT_EQ(zelta_wrap::getRawFrameSize(1057, 2048), 1228776u);
  EXPECT_EQ(zelta_wrap::getRawFrameSize(1073, 4096), 2949096u);
  EXPECT_EQ(failureOf<InputError>([] { zelta_wrap::getRawFrameSize(786, 4096); }),
            "invalid value for --raw-code: 786 at width 4096");
  EXPECT_EQ(failureOf<InputError>([] { zelta_wrap::getRawFrameSize(1057, 3840); }),
            "invalid value for --raw-code: 1057 at width 3840");
}

}  // namespace
