// Files that zelta-wrap writes from inputs made with ffmpeg, read back by
// ffprobe and ffmpeg: codec, size, rate, duration and channels as made,
// decoding without a complaint, and the picture and the sound of each
// channel the same octets as the inputs'.

#include <gtest/gtest.h>

#include <fstream>
#include <iterator>
#include <memory>
#include <string>

#include "support/kit_readers.h"
#include "support/kit_transwrap.h"
#include "support/run_program.h"
#include "zelta_wrap_helpers.h"

namespace {

using zelta_test::ProgramRun;
using zelta_wrap_test::md5Of;
using zelta_wrap_test::probe;
using zelta_wrap_test::runWrap;
using zelta_wrap_test::WrapTest;

// What ffprobe must tell of the picture stream.
struct PictureProbe {
  const char* codec;
  const char* width;
  const char* height;
  const char* rate;
  const char* frames;
};

const std::string openHeader = "warning 04 open or incomplete partition status";

class ZeltaWrapInterop : public WrapTest {
 protected:
  // A mono WAV of 48 kHz with a tone of its own.
  void makeTone(const std::string& name, int frequency, const std::string& duration, const std::string& codec) {
    ffmpeg("-f lavfi -i sine=frequency=" + std::to_string(frequency) + ":sample_rate=48000 -t " + duration + " -c:a " +
           codec + " " + name);
  }

  // Wraps; the run succeeds silently, the kit's reader reports in the file
  // no more than the findings given, and mediainfo and GStreamer read it.
  void wrap(const std::string& arguments, const std::vector<std::string>& findings = {}) {
    const ProgramRun run = runWrap(arguments + " -o " + path("out.mxf"));
    ASSERT_EQ(run.status, 0) << run.err;
    EXPECT_EQ(run.err, "");
    zelta_test::ReadRecord record;
    zelta_test::readThroughZeltaReader(path("out.mxf"), record, true);
    EXPECT_EQ(record.failure, "");
    EXPECT_EQ(zelta_test::kitFindings(record.errors.reports), findings);
    EXPECT_EQ(zelta_test::withoutKitReports(record.errors.reports).size(), 0U);
    const ProgramRun info = zelta_test::runProgram("mediainfo " + path("out.mxf"));
    EXPECT_NE(info.out.find("Format                                   : MXF"), std::string::npos) << info.out;
    const ProgramRun discover = zelta_test::runProgram("gst-discoverer-1.0 " + path("out.mxf"));
    EXPECT_EQ(discover.status, 0) << discover.out << discover.err;
    if (findings.empty()) expectVerified();
  }

  // A verifying writer fed the events of the file's own master and essence
  // passes over it and changes nothing; with an octet of the first system
  // item's key changed, it fails there.
  void expectVerified() {
    const std::string out = path("out.mxf");
    const std::string before = md5Of("cat " + out);
    EXPECT_NO_THROW(verify(out));
    EXPECT_EQ(md5Of("cat " + out), before);
    std::string bytes;
    {
      std::ifstream in(out, std::ios::binary);
      bytes.assign(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
    }
    const std::size_t at =
        bytes.find(std::string("\x06\x0E\x2B\x34\x02\x05\x01\x01\x0D\x01\x03\x01\x04\x01\x01\x00", 16));
    ASSERT_NE(at, std::string::npos);
    bytes[at + 13] = static_cast<char>(bytes[at + 13] ^ 0x01);
    const std::string changed = path("changed.mxf");
    std::ofstream(changed, std::ios::binary) << bytes;
    EXPECT_THROW(verify(changed, out), VerifyingKLVHandler::exception);
  }

  // Drives the events of the file given (by default the one verified).
  static void verify(const std::string& file, const std::string& events = "") {
    auto source = std::make_shared<zelta_test::TranswrapSource>(events.empty() ? file : events);
    auto stream = std::make_shared<std::fstream>(file, std::ios::in | std::ios::out | std::ios::binary);
    std::shared_ptr<VerifyingZeltaWriter> verifier = createVerifyingZeltaWriter(stream);
    verifier->setVerifying(true);
    createZeltaDriver(source)->drive(verifier);
  }

  void expectPicture(const std::string& input, const PictureProbe& expected) {
    const std::string out = path("out.mxf");
    EXPECT_EQ(probe(out, "v:0", "stream=codec_name,width,height,r_frame_rate,nb_read_packets"),
              std::string(expected.codec) + "\n" + expected.width + "\n" + expected.height + "\n" + expected.rate +
                  "\n" + expected.frames);
    const ProgramRun decode = zelta_test::runProgram("ffmpeg -nostdin -v error -i " + out + " -f null -");
    EXPECT_EQ(decode.status, 0);
    EXPECT_EQ(decode.err, "");
    EXPECT_EQ(md5Of("ffmpeg -nostdin -v error -i " + out + " -map 0:v -c copy -f rawvideo -"),
              md5Of("cat " + path(input)));
  }

  // The samples of the sound stream equal those of the WAV file.
  void expectSound(const std::string& stream, const std::string& wav, const std::string& channels,
                   const std::string& format) {
    const std::string out = path("out.mxf");
    EXPECT_EQ(probe(out, stream, "stream=channels"), channels);
    EXPECT_EQ(md5Of("ffmpeg -nostdin -v error -i " + out + " -map 0:" + stream + " -f " + format + " -"),
              md5Of("ffmpeg -nostdin -v error -i " + path(wav) + " -f " + format + " -"));
  }

  // 720 lines at 50 frames in GOPs of fifteen, thirty frames.
  void makeLongGOPAVC() {
    ffmpeg(
        "-f lavfi -i testsrc=size=1280x720:rate=50 -t 0.6 -c:v libx264 -pix_fmt yuv422p10le -g 15 -bf 2 -f h264 "
        "avc.h264");
  }

  void makeD10(const std::string& duration) {
    ffmpeg("-f lavfi -i testsrc=size=720x608:rate=25 -t " + duration +
           " -c:v mpeg2video -pix_fmt yuv422p -g 1 -bf 0 -flags +ildct+ilme -top 1 -b:v 50M -minrate 50M -maxrate 50M "
           "-bufsize 2000000 -rc_init_occupancy 2000000 -f mpeg2video d10.m2v");
  }
};

TEST_F(ZeltaWrapInterop, D10WithFourChannelsOfOneFile) {
  makeD10("0.4");
  ffmpeg(
      "-f lavfi -i sine=frequency=440:sample_rate=48000 -f lavfi -i sine=frequency=880:sample_rate=48000 "
      "-filter_complex [0][1][0][1]amerge=inputs=4 -t 0.4 -c:a pcm_s24le quad.wav");
  wrap("--format D10 " + path("d10.m2v") + " " + path("quad.wav"));
  expectPicture("d10.m2v", {"mpeg2video", "720", "608", "25/1", "10"});
  expectSound("a:0", "quad.wav", "4", "s24le");
  EXPECT_EQ(probe(path("out.mxf"), "", "format=duration"), "0.400000");
}

TEST_F(ZeltaWrapInterop, D10WithUnknownDurationAtStart) {
  makeD10("0.2");
  makeTone("tone.wav", 1000, "0.2", "pcm_s24le");
  // The kit's reader warns of the open header, as of any.
  wrap("--format D10 --unknown-duration " + path("d10.m2v") + " " + path("tone.wav"), {openHeader});
  expectPicture("d10.m2v", {"mpeg2video", "720", "608", "25/1", "5"});
  const ProgramRun info = zelta_test::runZeltaInfo("--json " + path("out.mxf"));
  EXPECT_EQ(info.status, 0) << info.err;
  EXPECT_NE(info.out.find("\"kind\": \"header\", \"status\": \"open incomplete\""), std::string::npos) << info.out;
  EXPECT_NE(info.out.find("\"kind\": \"footer\", \"status\": \"closed complete\""), std::string::npos) << info.out;
  // The footer's metadata and index give the duration to the other tools.
  EXPECT_EQ(probe(path("out.mxf"), "", "format=duration"), "0.200000");
  const ProgramRun mediainfo =
      zelta_test::runProgram("mediainfo --Inform='General;%Duration%|%FrameCount%' " + path("out.mxf"));
  EXPECT_EQ(mediainfo.out, "200|5\n");
}

TEST_F(ZeltaWrapInterop, D10TakesTheBitRateOfItsInput) {
  ffmpeg(
      "-f lavfi -i testsrc=size=720x608:rate=25 -t 0.2 -c:v mpeg2video -pix_fmt yuv422p -g 1 -bf 0 "
      "-flags +ildct+ilme -top 1 -b:v 30M -minrate 30M -maxrate 30M -bufsize 1200000 -rc_init_occupancy 1200000 "
      "-f mpeg2video d10.m2v");
  wrap("--format D10 " + path("d10.m2v"));
  expectPicture("d10.m2v", {"mpeg2video", "720", "608", "25/1", "5"});
  const ProgramRun info = zelta_test::runZeltaInfo("--master " + path("out.mxf"));
  EXPECT_NE(info.out.find("  bitRate: 30000000\n"), std::string::npos) << info.out;
}

TEST_F(ZeltaWrapInterop, DVWithTwoMonoFilesOf16Bits) {
  ffmpeg("-f lavfi -i testsrc=size=720x576:rate=25 -t 0.4 -pix_fmt yuv420p -c:v dvvideo -f dv dv.dv");
  makeTone("left.wav", 440, "0.4", "pcm_s16le");
  makeTone("right.wav", 660, "0.4", "pcm_s16le");
  wrap("--format DV --quantization-bits 16 --package-name 'clip \u00e9' " + path("dv.dv") + " " + path("left.wav") +
       " " + path("right.wav"));
  expectPicture("dv.dv", {"dvvideo", "720", "576", "25/1", "10"});
  expectSound("a:0", "left.wav", "1", "s16le");
  expectSound("a:1", "right.wav", "1", "s16le");
  const ProgramRun info = zelta_test::runZeltaInfo("--master " + path("out.mxf"));
  EXPECT_NE(info.out.find("  packageName: clip \u00e9\n"), std::string::npos) << info.out;
  EXPECT_NE(info.out.find("  audioChannelCount: 2\n  quantizationBits: 16\n"), std::string::npos) << info.out;
}

TEST_F(ZeltaWrapInterop, MPEGLongGOPWithStartTimecode) {
  ffmpeg(
      "-f lavfi -i testsrc=size=1920x1080:rate=25 -t 0.96 -c:v mpeg2video -pix_fmt yuv422p -b:v 50M -g 12 -bf 2 "
      "-flags +ildct+ilme -top 1 -f mpeg2video hd.m2v");
  makeTone("tone.wav", 1000, "0.96", "pcm_s24le");
  wrap("--format MPEG --start-timecode 10:00:00:00 " + path("hd.m2v") + " " + path("tone.wav"));
  expectPicture("hd.m2v", {"mpeg2video", "1920", "1080", "25/1", "24"});
  expectSound("a:0", "tone.wav", "1", "s24le");
  EXPECT_EQ(probe(path("out.mxf"), "", "format_tags=timecode"), "10:00:00:00");
}

TEST_F(ZeltaWrapInterop, MPEGWithUnknownDurationAtStart) {
  ffmpeg(
      "-f lavfi -i testsrc=size=1920x1080:rate=25 -t 0.96 -c:v mpeg2video -pix_fmt yuv422p -b:v 50M -g 12 -bf 2 "
      "-flags +ildct+ilme -top 1 -f mpeg2video hd.m2v");
  wrap("--format MPEG --unknown-duration " + path("hd.m2v"), {openHeader});
  expectPicture("hd.m2v", {"mpeg2video", "1920", "1080", "25/1", "24"});
  const ProgramRun info = zelta_test::runZeltaInfo("--json " + path("out.mxf"));
  EXPECT_EQ(info.status, 0) << info.err;
  EXPECT_NE(info.out.find("\"kind\": \"header\", \"status\": \"open incomplete\""), std::string::npos) << info.out;
  EXPECT_NE(info.out.find("\"kind\": \"footer\", \"status\": \"closed complete\""), std::string::npos) << info.out;
}

TEST_F(ZeltaWrapInterop, SoundThatEndsEarlyGoesOnInSilenceAndLongerSoundIsCut) {
  ffmpeg("-f lavfi -i testsrc=size=720x576:rate=25 -t 0.4 -pix_fmt yuv420p -c:v dvvideo -f dv dv.dv");
  makeTone("short.wav", 440, "0.2", "pcm_s24le");
  makeTone("long.wav", 660, "0.6", "pcm_s24le");
  wrap("--format DV " + path("dv.dv") + " " + path("short.wav") + " " + path("long.wav"));
  // Ten frames of 1920 samples.
  const std::string out = "ffmpeg -nostdin -v error -i " + path("out.mxf");
  EXPECT_EQ(md5Of(out + " -map 0:a:0 -f s24le -"),
            md5Of("ffmpeg -nostdin -v error -i " + path("short.wav") + " -af apad=whole_len=19200 -f s24le -"));
  EXPECT_EQ(md5Of(out + " -map 0:a:1 -f s24le -"),
            md5Of("ffmpeg -nostdin -v error -i " + path("long.wav") + " -af atrim=end_sample=19200 -f s24le -"));
}

TEST_F(ZeltaWrapInterop, AVCVariableWrapping) {
  makeLongGOPAVC();
  makeTone("tone.wav", 1000, "0.6", "pcm_s24le");
  wrap("--format AVC " + path("avc.h264") + " " + path("tone.wav"));
  expectPicture("avc.h264", {"h264", "1280", "720", "50/1", "30"});
  expectSound("a:0", "tone.wav", "1", "s24le");
}

TEST_F(ZeltaWrapInterop, D10At30000Over1001PadsFramesAndCountsTheFiveFrameSequence) {
  // Frames of 30 Mbit/s in the room of 50: each padded to 208541 octets.
  ffmpeg(
      "-f lavfi -i testsrc=size=720x512:rate=30000/1001 -t 0.5 -c:v mpeg2video -pix_fmt yuv422p -g 1 -bf 0 "
      "-flags +ildct+ilme -top 0 -b:v 30M -minrate 30M -maxrate 30M -bufsize 1200000 -rc_init_occupancy 1200000 "
      "-f mpeg2video ntsc.m2v");
  // Fifteen frames hold three sequences of 8008 samples.
  ffmpeg("-f lavfi -i sine=frequency=440:sample_rate=48000 -af atrim=end_sample=24024 -ac 4 -c:a pcm_s24le quad.wav");
  wrap("--format D10 --bit-rate 50 --drop-frame --start-timecode 01:00:00:00 " + path("ntsc.m2v") + " " +
       path("quad.wav"));
  EXPECT_EQ(probe(path("out.mxf"), "v:0", "stream=codec_name,width,height,r_frame_rate,nb_read_packets"),
            "mpeg2video\n720\n512\n30000/1001\n15");
  EXPECT_EQ(zelta_test::runProgram("ffmpeg -nostdin -v error -i " + path("out.mxf") + " -f null -").err, "");
  EXPECT_EQ(probe(path("out.mxf"), "", "format_tags=timecode"), "01:00:00;00");
  expectSound("a:0", "quad.wav", "4", "s24le");
  const std::string frames =
      zelta_test::runProgram("ffprobe -v error -show_entries packet=size -of csv=p=0 -select_streams v " +
                             path("out.mxf"))
          .out;
  EXPECT_EQ(zelta_test::occurrences(frames, "208541\n"), 15u) << frames;
}

TEST_F(ZeltaWrapInterop, AVCConstantWrappingOfIntraFrames) {
  ffmpeg(
      "-f lavfi -i testsrc=size=1920x1080:rate=25 -t 0.4 -c:v libx264 -pix_fmt yuv422p10le -x264-params keyint=1 "
      "-f h264 intra.h264");
  makeTone("tone.wav", 1000, "0.4", "pcm_s24le");
  wrap("--format AVC --avc-wrapping constant " + path("intra.h264") + " " + path("tone.wav"));
  expectPicture("intra.h264", {"h264", "1920", "1080", "25/1", "10"});
  expectSound("a:0", "tone.wav", "1", "s24le");
}

TEST_F(ZeltaWrapInterop, MPEGSimpleStudioProfileInFramesOfConstantRoom) {
  // ffmpeg writes no Simple Studio Profile; an MPEG-4 intra stream stands in for it.
  ffmpeg("-f lavfi -i testsrc=size=1920x1080:rate=25 -t 0.4 -c:v mpeg4 -g 1 -q:v 3 -f m4v studio.m4v");
  wrap("--format MPEG --simple-studio-profile --progressive " + path("studio.m4v"));
  expectPicture("studio.m4v", {"mpeg4", "1920", "1080", "25/1", "10"});
}

TEST_F(ZeltaWrapInterop, RawFramesReadBackByZeltaInfo) {
  ffmpeg("-f lavfi -i testsrc=size=1024x720:rate=24 -frames:v 1 -pix_fmt gray -f rawvideo -s 1024x720 one.gray");
  // Three frames of 737256 octets out of the test picture's octets.
  ASSERT_EQ(
      zelta_test::runProgram("cd " + folder_ + " && cat one.gray one.gray one.gray | head -c 2211768 >raw.bin").status,
      0);
  makeTone("tone.wav", 1000, "0.125", "pcm_s24le");
  wrap("--format Raw --raw-code 1073 --size 2048x1080 --rate 24 " + path("raw.bin") + " " + path("tone.wav"));
  const ProgramRun info = zelta_test::runZeltaInfo("--json --essence --md5 " + path("out.mxf"));
  EXPECT_EQ(info.status, 0) << info.err;
  EXPECT_NE(info.out.find("\"essence\": {\"editUnits\": 3,"), std::string::npos) << info.out;
  const std::string sound = "\"kind\": \"sound\", \"count\": 3, \"bytes\": 18000, \"md5\": \"" +
                            md5Of("ffmpeg -nostdin -v error -i " + path("tone.wav") + " -f s24le -") + "\"";
  EXPECT_NE(info.out.find(sound), std::string::npos) << info.out;
}

TEST_F(ZeltaWrapInterop, ProgressOnATerminal) {
  makeD10("0.4");
  const ProgramRun run = zelta_test::runProgram("script -qec '" + std::string(ZELTA_WRAP) + " --format D10 -o " +
                                                path("out.mxf") + " " + path("d10.m2v") + "' /dev/null");
  EXPECT_EQ(run.status, 0);
  EXPECT_EQ(run.out, "\rwrapped 1 frames\rwrapped 10 frames\r\n");
}

}  // namespace

TEST_F(ZeltaWrapInterop, D10At30MbitWithEightChannelsOfOneFile) {
  ffmpeg(
      "-f lavfi -i testsrc=size=720x608:rate=25 -t 0.2 -c:v mpeg2video -pix_fmt yuv422p -g 1 -bf 0 -flags +ildct+ilme "
      "-top 1 -b:v 30M -minrate 30M -maxrate 30M -bufsize 1200000 -rc_init_occupancy 1200000 -f mpeg2video d10.m2v");
  ffmpeg("-f lavfi -i sine=frequency=440:sample_rate=48000 -t 0.2 -ac 8 -c:a pcm_s24le octo.wav");
  wrap("--format D10 " + path("d10.m2v") + " " + path("octo.wav"));
  expectPicture("d10.m2v", {"mpeg2video", "720", "608", "25/1", "5"});
  expectSound("a:0", "octo.wav", "8", "s24le");
  const ProgramRun info =
      zelta_test::runProgram("mediainfo --Inform='Video;%Format_Commercial_IfAny%' " + path("out.mxf"));
  EXPECT_EQ(info.out, "IMX 30\n");
}

TEST_F(ZeltaWrapInterop, DVAt30000Over1001WithTwoChannelsOfOneFile) {
  ffmpeg("-f lavfi -i testsrc=size=720x480:rate=30000/1001 -t 0.4 -pix_fmt yuv411p -c:v dvvideo -f dv ntsc.dv");
  ffmpeg("-f lavfi -i sine=frequency=440:sample_rate=48000 -t 0.4 -ac 2 -c:a pcm_s16le stereo.wav");
  wrap("--format DV --quantization-bits 16 " + path("ntsc.dv") + " " + path("stereo.wav"));
  expectPicture("ntsc.dv", {"dvvideo", "720", "480", "30000/1001", "12"});
  EXPECT_EQ(probe(path("out.mxf"), "v:0", "stream=field_order"), "bb");
  EXPECT_EQ(probe(path("out.mxf"), "a", "stream=channels"), "1\n1");
}

// 720 lines at 50 frames, in GOPs of twelve, open and closed.
TEST_F(ZeltaWrapInterop, MPEG720pAt50OfOpenAndClosedGOPs) {
  for (const bool closed : {false, true}) {
    SCOPED_TRACE(closed);
    ffmpeg(std::string("-f lavfi -i testsrc=size=1280x720:rate=50 -t 0.96 -c:v mpeg2video -pix_fmt yuv422p -b:v 50M ") +
           "-g 12 -bf 2 " + (closed ? "-flags +cgop -sc_threshold 1000000000 " : "") + "-f mpeg2video p50.m2v");
    makeTone("tone.wav", 1000, "0.96", "pcm_s24le");
    wrap("--format MPEG --progressive " + std::string(closed ? "--closed-gop " : "") + path("p50.m2v") + " " +
         path("tone.wav"));
    expectPicture("p50.m2v", {"mpeg2video", "1280", "720", "50/1", "48"});
    expectSound("a:0", "tone.wav", "1", "s24le");
    const ProgramRun info =
        zelta_test::runProgram("mediainfo --Inform='Video;%Format_Commercial_IfAny%' " + path("out.mxf"));
    EXPECT_EQ(info.out, "XDCAM HD422\n");
  }
}

TEST_F(ZeltaWrapInterop, AVCIntra100Of1080InterlacedLinesAtConstantSize) {
  ffmpeg(
      "-f lavfi -i testsrc=size=1920x1080:rate=25 -t 0.4 -c:v libx264 -avcintra-class 100 -pix_fmt yuv422p10le "
      "-flags +ildct+ilme -f h264 avci.h264");
  makeTone("tone.wav", 1000, "0.4", "pcm_s24le");
  wrap("--format AVC --avc-wrapping constant --interlaced " + path("avci.h264") + " " + path("tone.wav"));
  expectPicture("avci.h264", {"h264", "1920", "1080", "25/1", "10"});
  EXPECT_EQ(probe(path("out.mxf"), "v:0", "stream=field_order"), "tt");
  expectSound("a:0", "tone.wav", "1", "s24le");
  const ProgramRun info = zelta_test::runProgram("mediainfo --Inform='Video;%Format_Profile%' " + path("out.mxf"));
  EXPECT_EQ(info.out, "High 4:2:2 Intra@L4.1\n");
}

TEST_F(ZeltaWrapInterop, AVCLongGOPWithUnknownDurationAtStart) {
  makeLongGOPAVC();
  wrap("--format AVC --unknown-duration " + path("avc.h264"), {openHeader});
  expectPicture("avc.h264", {"h264", "1280", "720", "50/1", "30"});
  EXPECT_EQ(probe(path("out.mxf"), "", "format=duration"), "0.600000");
}
