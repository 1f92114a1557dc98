// D-10 parameters: sizes, sample counts, labels and the index segment.
#include <gtest/gtest.h>

#include <functional>
#include <vector>

#include "mxf.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

KLVKey container(std::uint8_t format, std::uint8_t form) {
  KLVKey key = keyOf("06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.00.00");
  key[14] = format;
  key[15] = form;
  return key;
}

void expectSameParameters(const MXFD10Parameters& a, const MXFD10Parameters& b) {
  EXPECT_EQ(a.getBitRate(), b.getBitRate());
  EXPECT_EQ(a.getEssenceContainer(false), b.getEssenceContainer(false));
  EXPECT_EQ(a.getEssenceContainer(true), b.getEssenceContainer(true));
  EXPECT_EQ(a.getEditRate(), b.getEditRate());
  EXPECT_EQ(a.getContentPackageRate(), b.getContentPackageRate());
  EXPECT_EQ(a.getFrameSize(), b.getFrameSize());
  EXPECT_EQ(a.getPictureCoding(), b.getPictureCoding());
  EXPECT_EQ(a.getVideoSystem(), b.getVideoSystem());
  EXPECT_EQ(a.getSoundParameters().getMaximumElementLength(), b.getSoundParameters().getMaximumElementLength());
  for (std::int32_t frame = 0; frame < 5; ++frame)
    EXPECT_EQ(a.getSoundParameters().getSampleCount(frame), b.getSoundParameters().getSampleCount(frame));
}

}  // namespace

TEST(MXFD10Parameters, FiftyMegabit625LineSizesGiveAnEditUnitOf312832Octets) {
  const RegularParameters parameters(50000000, 25);
  EXPECT_EQ(parameters.getFrameSize(), 250000u);
  EXPECT_EQ(getMXFD10PictureGroupSize(parameters), 250368u);
  EXPECT_EQ(parameters.getSoundParameters().getMaximumElementLength(), 61444u);
  EXPECT_EQ(getMXFD10SoundGroupSize(parameters), 61952u);
  EXPECT_EQ(getMXFD10EditUnitSize(parameters), 312832u);
}

TEST(MXFD10Parameters, FiftyMegabit525LineFrameSizeIs208541) {
  EXPECT_EQ(NTSCParameters(50000000).getFrameSize(), 208541u);
  EXPECT_EQ(NTSCParameters(40000000).getFrameSize(), 166833u);
  EXPECT_EQ(NTSCParameters(30000000).getFrameSize(), 125125u);
}

TEST(MXFD10Parameters, FiveConsecutiveNTSCFramesFromAMultipleOfFiveCarry8008Samples) {
  const NTSCSoundParameters sound;
  for (std::int32_t first = -20; first <= 20; first += 5) {
    std::uint32_t sum = 0;
    for (std::int32_t frame = first; frame < first + 5; ++frame) sum += sound.getSampleCount(frame);
    EXPECT_EQ(sum, 8008u) << first;
  }
  EXPECT_EQ(sound.getSampleCount(0), 1602u);
  EXPECT_EQ(sound.getSampleCount(1), 1601u);
  EXPECT_EQ(sound.getSampleCount(-1), 1602u);
  EXPECT_EQ(sound.getSampleCount(-2), 1601u);
  EXPECT_EQ(sound.getSequenceNumber(0), 1u);
  EXPECT_EQ(sound.getSequenceNumber(4), 5u);
  EXPECT_EQ(sound.getSequenceNumber(-1), 5u);
  EXPECT_EQ(sound.getElementLength(1), 1601u * 32 + 4);
  EXPECT_EQ(sound.getMaximumElementLength(), 1602u * 32 + 4);
  EXPECT_EQ(sound.getMaximumSampleCount(), 1602u);
}

TEST(MXFD10Parameters, RegularSoundHasOneCountAndNoSequence) {
  const RegularSoundParameters sound(25);
  EXPECT_EQ(sound.getSampleCount(7), 1920u);
  EXPECT_EQ(sound.getMaximumSampleCount(), 1920u);
  EXPECT_EQ(sound.getElementLength(3), 61444u);
  EXPECT_EQ(sound.getSequenceNumber(3), 0u);
  EXPECT_EQ(RegularSoundParameters(50).getSampleCount(0), 960u);
}

TEST(MXFD10Parameters, RateThatDoesNotDivide48000FailsIntegerSampleCount) {
  EXPECT_EQ(assertionTextOf([] { RegularSoundParameters sound(7); }),
            "assertion failure: integer sample count per frame");
  EXPECT_EQ(assertionTextOf([] { RegularParameters parameters(50000000, 7); }),
            "assertion failure: integer sample count per frame");
}

TEST(MXFD10Parameters, ExtendedContainerLabelEndsIn02AndGivesTheSameParameters) {
  const RegularParameters parameters(50000000, 25);
  EXPECT_EQ(parameters.getEssenceContainer(false), container(0x01, 0x01));
  EXPECT_EQ(parameters.getEssenceContainer(true), container(0x01, 0x02));
  const auto plain = createMXFD10Parameters(container(0x01, 0x01));
  const auto extended = createMXFD10Parameters(container(0x01, 0x02));
  expectSameParameters(*plain, *extended);
  expectSameParameters(*plain, parameters);
  const auto ntscPlain = createMXFD10Parameters(container(0x04, 0x01));
  const auto ntscExtended = createMXFD10Parameters(container(0x04, 0x02));
  expectSameParameters(*ntscPlain, *ntscExtended);
}

TEST(MXFD10Parameters, LabelsSelectBitRateAndLineCount) {
  const struct {
    std::uint8_t format;
    std::uint32_t bitRate;
    bool ntsc;
  } formats[] = {{1, 50000000, false}, {2, 50000000, true},  {3, 40000000, false},
                 {4, 40000000, true},  {5, 30000000, false}, {6, 30000000, true}};
  for (const auto& format : formats) {
    SCOPED_TRACE(int(format.format));
    const auto parameters = createMXFD10Parameters(container(format.format, 0x01));
    EXPECT_EQ(parameters->getBitRate(), format.bitRate);
    EXPECT_EQ(dynamic_cast<const NTSCParameters*>(parameters.get()) != nullptr, format.ntsc);
    EXPECT_EQ(parameters->getEssenceContainer(false), container(format.format, 0x01));
    KLVKey coding = keyOf("06.0E.2B.34.04.01.01.01.04.01.02.02.01.02.01.00");
    coding[15] = format.format;
    EXPECT_EQ(parameters->getPictureCoding(), coding);
    EXPECT_EQ(parameters->getEditRate(), format.ntsc ? (MXFRational{30000, 1001}) : (MXFRational{25, 1}));
  }
}

TEST(MXFD10Parameters, VersionOctetOfTheLabelIsIgnored) {
  KLVKey label = container(0x03, 0x01);
  label[7] = 0x05;
  EXPECT_EQ(createMXFD10Parameters(label)->getBitRate(), 40000000u);
}

TEST(MXFD10Parameters, OtherLabelsAreNotD10) {
  EXPECT_EQ(assertionTextOf([] { createMXFD10Parameters(container(0x07, 0x01)); }),
            "assertion failure: valid D-10 essenceContainer");
  EXPECT_EQ(assertionTextOf([] { createMXFD10Parameters(container(0x00, 0x01)); }),
            "assertion failure: valid D-10 essenceContainer");
  KLVKey dv = container(0x01, 0x01);
  dv[13] = 0x02;
  EXPECT_EQ(assertionTextOf([&] { createMXFD10Parameters(dv); }), "assertion failure: valid D-10 essenceContainer");
}

TEST(MXFD10Parameters, UnknownBitRateFailsInTheLabelOperations) {
  const RegularParameters regular(25000000, 25);
  EXPECT_EQ(assertionTextOf([&] { regular.getEssenceContainer(false); }), "assertion failure: valid bit rate");
  EXPECT_EQ(assertionTextOf([&] { regular.getPictureCoding(); }), "assertion failure: valid bit rate");
  const NTSCParameters ntsc(25000000);
  EXPECT_EQ(assertionTextOf([&] { ntsc.getEssenceContainer(true); }), "assertion failure: valid bit rate");
  EXPECT_EQ(assertionTextOf([&] { ntsc.getPictureCoding(); }), "assertion failure: valid bit rate");
  EXPECT_EQ(regular.getFrameSize(), 125000u);
}

TEST(MXFD10Parameters, RegularLabelsAndGeometryNeedTheRate25) {
  const RegularParameters parameters(50000000, 50);
  for (const auto& call : std::vector<std::function<void()>>{
           [&] { parameters.getEssenceContainer(false); }, [&] { parameters.getPictureGeometry(); },
           [&] { parameters.getPictureCoding(); }, [&] { parameters.getVideoSystem(); }})
    EXPECT_EQ(assertionTextOf(call), "assertion failure: valid frame rate");
  EXPECT_EQ(parameters.getContentPackageRate(), 10);
  EXPECT_EQ(parameters.getEditRate(), (MXFRational{50, 1}));
  EXPECT_EQ(parameters.getFrameSize(), 125000u);
}

TEST(MXFD10Parameters, ContentPackageRatesFollowTheFrameRate) {
  const std::pair<std::uint32_t, std::uint8_t> rates[] = {{24, 2},  {25, 4},  {30, 6},  {48, 8},
                                                          {50, 10}, {60, 12}, {75, 16},
                                                          {96, 20}, {100, 22}, {120, 24}};
  for (const auto& [frameRate, rate] : rates) EXPECT_EQ(RegularParameters(50000000, frameRate).getContentPackageRate(), rate);
  EXPECT_EQ(NTSCParameters(50000000).getContentPackageRate(), 7);
  // 72 and 90 frames have no whole number of 48 kHz samples; 80 has no package rate.
  for (const std::uint32_t frameRate : {72u, 90u})
    EXPECT_EQ(assertionTextOf([frameRate] { RegularParameters(50000000, frameRate); }),
              "assertion failure: integer sample count per frame");
  EXPECT_EQ(assertionTextOf([] { RegularParameters(50000000, 80).getContentPackageRate(); }),
            "assertion failure: valid frame rate");
}

TEST(MXFD10Parameters, GeometryAndVideoSystemOfBothLineCounts) {
  const MXFD10PictureGeometry regular = RegularParameters(50000000, 25).getPictureGeometry();
  EXPECT_EQ(regular.storedHeight, 304u);
  EXPECT_EQ(regular.sampledHeight, 304u);
  EXPECT_EQ(regular.displayHeight, 288u);
  EXPECT_EQ(regular.displayYOffset, 16);
  EXPECT_EQ(regular.videoLineMap[0], 7);
  EXPECT_EQ(regular.videoLineMap[1], 320);
  const MXFD10PictureGeometry ntsc = NTSCParameters(50000000).getPictureGeometry();
  EXPECT_EQ(ntsc.storedHeight, 256u);
  EXPECT_EQ(ntsc.sampledHeight, 256u);
  EXPECT_EQ(ntsc.displayHeight, 243u);
  EXPECT_EQ(ntsc.displayYOffset, 13);
  EXPECT_EQ(ntsc.videoLineMap[0], 7);
  EXPECT_EQ(ntsc.videoLineMap[1], 270);
  EXPECT_EQ(RegularParameters(50000000, 25).getVideoSystem(), keyOf("06.0E.2B.34.04.01.01.01.04.01.01.01.01.01.00.00"));
  EXPECT_EQ(NTSCParameters(50000000).getVideoSystem(), keyOf("06.0E.2B.34.04.01.01.01.04.01.01.01.01.02.00.00"));
}

TEST(MXFD10Parameters, IndexSegmentHasTheEditUnitSizeAndThreeDeltaEntries) {
  const MXFIndexTableSegment segment = createMXFD10IndexSegment(RegularParameters(50000000, 25), 1, 2);
  EXPECT_EQ(segment.indexEditRate, (MXFRational{25, 1}));
  EXPECT_EQ(segment.indexStartPosition, 0);
  EXPECT_EQ(segment.indexDuration, 0);
  EXPECT_EQ(segment.editUnitByteCount, 312832u);
  EXPECT_EQ(segment.indexSID, 1u);
  EXPECT_EQ(segment.bodySID, 2u);
  EXPECT_EQ(segment.sliceCount, 0);
  EXPECT_EQ(segment.posTableCount, 0);
  EXPECT_EQ(segment.deltaEntryArray,
            (std::vector<MXFDeltaEntry>{{0, 0, 0}, {0, 0, 512}, {0, 0, 512 + 250368}}));
  EXPECT_TRUE(segment.indexEntryArray.empty());
  EXPECT_EQ(segment.instanceUID, MXFUID());
}
