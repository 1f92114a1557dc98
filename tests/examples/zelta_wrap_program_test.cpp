// zelta-wrap as a user meets it: its help, its usage errors, and the inputs
// that it refuses before writing anything, leaving no file behind.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "zelta_wrap_helpers.h"

namespace {

using zelta_test::ProgramRun;
using zelta_wrap_test::runWrap;
using zelta_wrap_test::WrapTest;

TEST(ZeltaWrapProgram, HelpDescribesEveryOption) {
  const ProgramRun run = runWrap("--help");
  EXPECT_EQ(run.status, 0);
  EXPECT_TRUE(run.err.empty()) << run.err;
  for (const char* option : {"--format D10|DV|MPEG|AVC|Raw", "--rate", "--bit-rate", "--interlaced", "--progressive",
                             "--size", "--start-timecode", "--drop-frame", "--package-name", "--unknown-duration",
                             "--avc-wrapping", "--max-gop", "--closed-gop", "--profile-level",
                             "--simple-studio-profile", "--raw-code", "--quantization-bits", "-o OUT.mxf"})
    EXPECT_NE(run.out.find(option), std::string::npos) << option;
}

TEST(ZeltaWrapProgram, UnknownOptionIsAUsageError) {
  const ProgramRun run = runWrap("--format DV --frobnicate -o out.mxf in.dv");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(run.err, "zelta-wrap: unknown option --frobnicate (see zelta-wrap --help)\n");
}

TEST(ZeltaWrapProgram, MissingPictureIsAUsageError) {
  const ProgramRun run = runWrap("--format DV -o out.mxf");
  EXPECT_EQ(run.status, 2);
  EXPECT_EQ(run.err, "zelta-wrap: a picture input is required (see zelta-wrap --help)\n");
}

TEST(ZeltaWrapProgram, UnknownOptionValueIsRefused) {
  const ProgramRun run = runWrap("--format D10 --bit-rate 45 -o out.mxf in.m2v");
  EXPECT_EQ(run.status, 1);
  EXPECT_EQ(run.err, "zelta-wrap: invalid value for --bit-rate: D10 has 30, 40 or 50 Mbit/s\n");
}

class ZeltaWrapRefusal : public WrapTest {
 protected:
  // The run fails with the message and leaves only the inputs.
  void expectRefused(const std::string& arguments, const std::string& message) {
    const std::vector<std::string> before = files();
    const ProgramRun run = runWrap(arguments);
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.err, "zelta-wrap: " + message + "\n");
    EXPECT_EQ(files(), before);
  }

  void makeD10() {
    ffmpeg(
        "-f lavfi -i testsrc=size=720x608:rate=25 -t 0.2 -c:v mpeg2video -pix_fmt yuv422p -g 1 -bf 0 "
        "-flags +ildct+ilme -top 1 -b:v 50M -minrate 50M -maxrate 50M -bufsize 2000000 -rc_init_occupancy 2000000 "
        "-f mpeg2video d10.m2v");
  }
};

TEST_F(ZeltaWrapRefusal, D10FrameLargerThanTheConstantSize) {
  makeD10();
  expectRefused(
      "--format D10 --bit-rate 30 -o " + path("out.mxf") + " " + path("d10.m2v"),
      path("d10.m2v") + " has a frame of 250000 octets, more than the 150000 of D10 at this rate and bit rate");
}

TEST_F(ZeltaWrapRefusal, DVFrameOfAnotherSize) {
  makeD10();
  expectRefused("--format DV -o " + path("out.mxf") + " " + path("d10.m2v"),
                path("d10.m2v") + " has a frame of 250000 octets; DV frames here have 144000");
}

TEST_F(ZeltaWrapRefusal, RawInputNotAMultipleOfTheFrameSize) {
  ffmpeg("-f lavfi -i testsrc=size=1024x720:rate=25 -frames:v 1 -pix_fmt gray -f rawvideo raw.bin");
  expectRefused("--format Raw --raw-code 1073 --size 2048x1080 -o " + path("out.mxf") + " " + path("raw.bin"),
                path("raw.bin") + " is not a whole number of frames of 737256 octets");
}

TEST_F(ZeltaWrapRefusal, SoundAt44100Hz) {
  makeD10();
  ffmpeg("-f lavfi -i sine=sample_rate=44100 -t 0.2 -c:a pcm_s24le cd.wav");
  expectRefused("--format D10 -o " + path("out.mxf") + " " + path("d10.m2v") + " " + path("cd.wav"),
                path("cd.wav") + " is sampled at 44100 Hz, not 48000 Hz");
}

TEST_F(ZeltaWrapRefusal, SoundOfAnotherBitDepth) {
  makeD10();
  ffmpeg("-f lavfi -i sine=sample_rate=48000 -t 0.2 -c:a pcm_s16le s16.wav");
  expectRefused("--format D10 -o " + path("out.mxf") + " " + path("d10.m2v") + " " + path("s16.wav"),
                path("s16.wav") + " has 16 bit samples, not 24");
}

TEST_F(ZeltaWrapRefusal, MoreThanEightChannelsForD10) {
  makeD10();
  ffmpeg("-f lavfi -i sine=sample_rate=48000 -t 0.2 -ac 3 -c:a pcm_s24le three.wav");
  const std::string three = " " + path("three.wav");
  expectRefused("--format D10 -o " + path("out.mxf") + " " + path("d10.m2v") + three + three + three,
                "D10 carries at most 8 sound channels, not 9");
}

TEST_F(ZeltaWrapRefusal, RateThatTheFormatLacks) {
  makeD10();
  expectRefused("--format D10 --rate 50 -o " + path("out.mxf") + " " + path("d10.m2v"), "D10 has no rate 50");
}

TEST_F(ZeltaWrapRefusal, ClipThatTheKitCannotDescribe) {
  // The kit's long GOP MPEG pictures are high definition.
  ffmpeg("-f lavfi -i testsrc=size=720x576:rate=25 -t 0.2 -c:v mpeg2video -pix_fmt yuv420p -f mpeg2video sd.m2v");
  expectRefused("--format MPEG -o " + path("out.mxf") + " " + path("sd.m2v"),
                "cannot describe the clip: assertion failure: recognized displayHeight");
}

TEST_F(ZeltaWrapRefusal, PictureThatCannotBeRead) {
  expectRefused("--format DV -o " + path("out.mxf") + " " + path("absent.dv"), "cannot read " + path("absent.dv") + ": No such file or directory");
}

TEST_F(ZeltaWrapRefusal, ExistingOutputStaysWhenRefused) {
  makeD10();
  ffmpeg("-f lavfi -i sine=sample_rate=44100 -t 0.2 -c:a pcm_s24le cd.wav");
  ffmpeg("-f lavfi -i sine=sample_rate=44100 -t 0.1 -c:a pcm_s24le out.mxf.wav");
  const std::string before = zelta_wrap_test::md5Of("cat " + path("out.mxf.wav"));
  expectRefused("--format D10 -o " + path("out.mxf.wav") + " " + path("d10.m2v") + " " + path("cd.wav"),
                path("cd.wav") + " is sampled at 44100 Hz, not 48000 Hz");
  EXPECT_EQ(zelta_wrap_test::md5Of("cat " + path("out.mxf.wav")), before);
}

}  // namespace
