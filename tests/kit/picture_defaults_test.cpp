#include "kit/picture_defaults.h"

#include <gtest/gtest.h>

#include "core/failure.h"
#include "kit/kit_labels.h"
#include "support/recording.h"

using zelta::StudioPicture;
using zelta_test::bytesOf;
using zelta_test::failureOf;
using zelta_test::octetsOf;
typedef ZeltaEssenceFormat F;

namespace {

StudioPicture studio(ZeltaSize size, ZeltaSize subsampling, bool progressive, MXFRational rate, std::uint32_t bitRate,
                     std::uint32_t depth) {
  StudioPicture p;
  p.displaySize = size;
  p.subsampling = subsampling;
  p.progressive = progressive;
  p.editRate = rate;
  p.bitRate = bitRate;
  p.componentDepth = depth;
  return p;
}

TEST(PictureDefaults, DisplaySizeFromProfileAndLevel) {
  EXPECT_EQ(zelta::getDefaultDisplaySize(68, true, false), ZeltaSize(1440, 1080));
  EXPECT_EQ(zelta::getDefaultDisplaySize(70, false, false), ZeltaSize(1440, 540));
  EXPECT_EQ(zelta::getDefaultDisplaySize(130, true, true), ZeltaSize(1920, 540));
  EXPECT_EQ(zelta::getDefaultDisplaySize(130, false, true), ZeltaSize(1920, 270));
  EXPECT_EQ(failureOf([] { zelta::getDefaultDisplaySize(133, true, false); }),
            "assertion failure: recognized profileAndLevel");
}

TEST(PictureDefaults, AspectRatioOfFrames) {
  EXPECT_EQ(zelta::getDefaultAspectRatio({1440, 1080}, true), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1440, 540}, true), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1280, 720}, true), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1920, 1080}, true), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1920, 540}, true), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({2048, 1080}, true), (MXFRational{256, 135}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({2048, 1556}, true), (MXFRational{512, 389}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({720, 576}, true), (MXFRational{0, 0}));
}

TEST(PictureDefaults, AspectRatioOfFields) {
  EXPECT_EQ(zelta::getDefaultAspectRatio({1440, 540}, false), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1920, 540}, false), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1280, 720}, false), (MXFRational{0, 0}));
  EXPECT_EQ(zelta::getDefaultAspectRatio({1920, 1080}, false), (MXFRational{0, 0}));
}

TEST(PictureDefaults, SubsamplingOfMPEG) {
  EXPECT_EQ(zelta::getDefaultSubsampling(F::MPEG, 68, false, false), ZeltaSize(2, 2));
  EXPECT_EQ(zelta::getDefaultSubsampling(F::MPEG, 70, false, false), ZeltaSize(2, 2));
  EXPECT_EQ(zelta::getDefaultSubsampling(F::MPEG, 130, false, false), ZeltaSize(2, 1));
  EXPECT_EQ(zelta::getDefaultSubsampling(F::MPEG, 133, false, false), ZeltaSize(2, 1));
  EXPECT_EQ(zelta::getDefaultSubsampling(F::MPEG, 0, true, true), ZeltaSize(1, 1));
  EXPECT_EQ(zelta::getDefaultSubsampling(F::MPEG, 0, true, false), ZeltaSize(2, 1));
  EXPECT_EQ(failureOf([] { zelta::getDefaultSubsampling(F::MPEG, 72, false, false); }),
            "assertion failure: recognized profileAndLevel");
}

TEST(PictureDefaults, SubsamplingOfAVCByProfile) {
  for (std::uint16_t profile : {44, 244})
    EXPECT_EQ(zelta::getDefaultSubsampling(F::AVC, static_cast<std::uint16_t>(profile << 8 | 0x29), false, false),
              ZeltaSize(1, 1));
  for (std::uint16_t profile : {66, 77, 88, 100, 110, 122})
    EXPECT_EQ(zelta::getDefaultSubsampling(F::AVC, static_cast<std::uint16_t>(profile << 8), false, false),
              ZeltaSize(2, 1));
  EXPECT_EQ(failureOf([] { zelta::getDefaultSubsampling(F::AVC, 68, false, false); }),
            "assertion failure: recognized profileAndLevel");
}

TEST(PictureDefaults, ComponentDepth) {
  EXPECT_EQ(zelta::getDefaultComponentDepth(F::MPEG, true, true), 12u);
  EXPECT_EQ(zelta::getDefaultComponentDepth(F::MPEG, true, false), 10u);
  EXPECT_EQ(zelta::getDefaultComponentDepth(F::AVC, false, false), 10u);
  EXPECT_EQ(zelta::getDefaultComponentDepth(F::MPEG, false, false), 8u);
}

TEST(PictureDefaults, FrameBaseByRate) {
  EXPECT_EQ(zelta::getFrameBase({24000, 1001}), 24u);
  EXPECT_EQ(zelta::getFrameBase({24, 1}), 24u);
  EXPECT_EQ(zelta::getFrameBase({25, 1}), 25u);
  EXPECT_EQ(zelta::getFrameBase({30000, 1001}), 30u);
  EXPECT_EQ(zelta::getFrameBase({30, 1}), 30u);
  EXPECT_EQ(zelta::getFrameBase({48000, 1001}), 30u);
  EXPECT_EQ(zelta::getFrameBase({50, 1}), 50u);
  EXPECT_EQ(zelta::getFrameBase({60000, 1001}), 60u);
  EXPECT_EQ(zelta::getFrameBase({60, 1}), 60u);
  EXPECT_EQ(zelta::getFrameBase({48, 1}), 0u);
  EXPECT_EQ(zelta::getFrameBase({25, 0}), 0u);
}

TEST(PictureDefaults, SimpleStudioLevelIsTheLowestThatHoldsAllLimits) {
  // 1920x1080 4:2:2 at 25 frames: N = 0x3F4800, L = N * 25.
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1920, 1080}, {2, 1}, true, {25, 1}, 600000000, 10)), 226);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1920, 1080}, {2, 1}, true, {25, 1}, 600000001, 10)), 227);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1920, 1080}, {2, 1}, true, {25, 1}, 100000000, 11)), 227);
  // 4:4:4 at 1920x1080: N = 0x5EEC00, over the first limit.
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1920, 1080}, {1, 1}, true, {25, 1}, 100000000, 10)), 227);
  // L over 0xB400000 at 60 frames: 0x5EEC00 * 60.
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1920, 1080}, {1, 1}, true, {60, 1}, 100000000, 10)), 228);
  // Fields count twice: 1440 * 1080 * 2 * 25 is within 0x7800000, twice that is not.
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1440, 1080}, {2, 1}, true, {25, 1}, 100000000, 10)), 226);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1440, 1080}, {2, 1}, false, {25, 1}, 100000000, 10)), 227);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({4096, 2160}, {2, 1}, true, {24, 1}, 1800000000, 12)), 235);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({4096, 2160}, {1, 1}, true, {60, 1}, 3600000000, 12)), 236);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({4096, 2160}, {1, 1}, true, {60, 1}, 3600000001, 12)), 0);
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({1920, 1080}, {2, 1}, true, {25, 1}, 100000000, 13)), 0);
}

TEST(PictureDefaults, SimpleStudioLevelOfOtherSubsamplingCountsNoSamples) {
  EXPECT_EQ(zelta::getSimpleStudioLevel(studio({8192, 8192}, {2, 2}, true, {60, 1}, 1, 8)), 226);
}

TEST(PictureDefaults, SignalStandard) {
  EXPECT_EQ(zelta::getSignalStandard({1920, 1080}, 12, true), 7);
  EXPECT_EQ(zelta::getSignalStandard({1920, 1080}, 10, true), 4);
  EXPECT_EQ(zelta::getSignalStandard({1440, 540}, 8, false), 4);
  EXPECT_EQ(zelta::getSignalStandard({2048, 1080}, 10, false), 0);
  EXPECT_EQ(zelta::getSignalStandard({1280, 720}, 10, false), 5);
  EXPECT_EQ(zelta::getSignalStandard({2048, 1556}, 10, false), 0);
}

TEST(PictureDefaults, StoredHeight) {
  EXPECT_EQ(zelta::getStoredHeight(540), 544u);
  EXPECT_EQ(zelta::getStoredHeight(1080), 1088u);
  EXPECT_EQ(zelta::getStoredHeight(720), 720u);
  EXPECT_EQ(zelta::getStoredHeight(2160), 2160u);
  EXPECT_EQ(zelta::getStoredHeight(1556), 1568u);
  EXPECT_EQ(failureOf([] { zelta::getStoredHeight(576); }), "assertion failure: recognized displayHeight");
}

TEST(PictureDefaults, VideoLineMap) {
  EXPECT_EQ(zelta::getDefaultVideoLineMap(1556, true), ZeltaLineMap(32, 0));
  EXPECT_EQ(zelta::getDefaultVideoLineMap(720, true), ZeltaLineMap(26, 0));
  EXPECT_EQ(zelta::getDefaultVideoLineMap(540, false), ZeltaLineMap(21, 584));
  EXPECT_EQ(zelta::getDefaultVideoLineMap(1080, true), ZeltaLineMap(42, 0));
}

TEST(PictureDefaults, CaptureGamma) {
  EXPECT_EQ(zelta::getCaptureGamma(false).octets(), octetsOf("06 0E 2B 34 04 01 01 01 04 01 01 01 01 02 00 00"));
  EXPECT_EQ(zelta::getCaptureGamma(true).octets(), octetsOf("06 0E 2B 34 04 01 01 08 04 01 01 01 01 07 00 00"));
}

TEST(PictureDefaults, ColourSitingBySubsamplingAndVersion) {
  EXPECT_EQ(zelta::getColourSiting({2, 2}, 0x0103), 6);
  EXPECT_EQ(zelta::getColourSiting({2, 2}, 0x0102), 255);
  EXPECT_EQ(zelta::getColourSiting({2, 1}, 0x0102), 0);
  EXPECT_EQ(zelta::getColourSiting({1, 1}, 0x0103), 0);
  EXPECT_EQ(zelta::getColourSiting({0, 0}, 0x0103), 255);
}

TEST(PictureDefaults, ReferenceLevelsByDepth) {
  const zelta::ReferenceLevels eight = zelta::getReferenceLevels(8);
  EXPECT_EQ(eight.black, 16u);
  EXPECT_EQ(eight.white, 235u);
  EXPECT_EQ(eight.colourRange, 225u);
  const zelta::ReferenceLevels ten = zelta::getReferenceLevels(10);
  EXPECT_EQ(ten.black, 64u);
  EXPECT_EQ(ten.white, 940u);
  EXPECT_EQ(ten.colourRange, 897u);
  EXPECT_EQ(failureOf([] { zelta::getReferenceLevels(7); }), "assertion failure: recognized componentDepth");
}

TEST(PictureDefaults, RawStoredSizesAndOffsets) {
  const zelta::RawLayout dci = zelta::getRawLayout(1057, {4096, 2160});
  EXPECT_EQ(dci.storedWidth, 4128u);
  EXPECT_EQ(dci.storedHeight, 2192u);
  EXPECT_EQ(dci.displayXOffset, 16);
  EXPECT_EQ(dci.displayYOffset, 16);
  const zelta::RawLayout twoK = zelta::getRawLayout(1073, {2048, 1080});
  EXPECT_EQ(twoK.storedWidth, 2064u);
  EXPECT_EQ(twoK.storedHeight, 1096u);
  const zelta::RawLayout uhd = zelta::getRawLayout(785, {3840, 2160});
  EXPECT_EQ(uhd.storedWidth, 4160u);
  EXPECT_EQ(uhd.storedHeight, 2204u);
  EXPECT_EQ(uhd.displayXOffset, 160);
  EXPECT_EQ(uhd.displayYOffset, 22);
  EXPECT_EQ(zelta::getRawLayout(834, {4096, 2160}).storedWidth, 4160u);
  EXPECT_EQ(zelta::getRawLayout(0, {4096, 2160}).storedHeight, 2204u);
}

TEST(PictureDefaults, RawSizeThatNoRuleNamesFails) {
  EXPECT_EQ(failureOf([] { zelta::getRawLayout(801, {2048, 2160}); }), "assertion failure: recognized displayWidth");
  EXPECT_EQ(failureOf([] { zelta::getRawLayout(1057, {3840, 2160}); }), "assertion failure: recognized displayWidth");
  EXPECT_EQ(failureOf([] { zelta::getRawLayout(801, {4096, 1080}); }), "assertion failure: recognized displayHeight");
}

TEST(PictureDefaults, RawLineMapAndAspectRatio) {
  EXPECT_EQ(zelta::defaultRawDisplaySize, ZeltaSize(4096, 2160));
  EXPECT_EQ(zelta::getRawDefaultVideoLineMap({4096, 2160}), ZeltaLineMap(42, 0));
  EXPECT_EQ(zelta::getRawDefaultVideoLineMap({3840, 2160}), ZeltaLineMap(42, 0));
  EXPECT_EQ(zelta::getRawDefaultVideoLineMap({2048, 1080}), ZeltaLineMap(0, 0));
  EXPECT_EQ(zelta::getRawDefaultAspectRatio({4096, 2160}), (MXFRational{256, 135}));
  EXPECT_EQ(zelta::getRawDefaultAspectRatio({3840, 2160}), (MXFRational{16, 9}));
  EXPECT_EQ(zelta::getRawDefaultAspectRatio({2048, 1080}), (MXFRational{0, 0}));
}

TEST(PictureDefaults, ProxyDecoderSpecificInfoByRateAndAspect) {
  const struct {
    MXFRational rate;
    MXFRational aspect;
    const char* middle;
  } rows[] = {{{24000, 1001}, {16, 9}, "05 14 57 70 28 58 20 F0"},
              {{30000, 1001}, {4, 3}, "05 0C 5D 4C 28 58 20 F0"},
              {{30000, 1001}, {16, 9}, "05 14 5D 4C 28 58 20 F0"},
              {{25, 1}, {4, 3}, "05 08 40 06 68 58 21 20"},
              {{25, 1}, {16, 9}, "05 10 40 06 68 58 21 20"}};
  for (const auto& row : rows)
    EXPECT_EQ(zelta::getProxyDecoderSpecificInfo(row.rate, row.aspect),
              bytesOf(std::string("00 00 01 04 00 00 01 20 ") + row.middle + " A3 1F"));
}

TEST(PictureDefaults, ProxyOtherRateAndAspectFails) {
  EXPECT_EQ(failureOf([] {
              zelta::getProxyDecoderSpecificInfo({24000, 1001}, {4, 3});
            }),
            "assertion failure: valid combination of editRate and aspectRatio");
  EXPECT_EQ(failureOf([] {
              zelta::getProxyDecoderSpecificInfo({25, 1}, {0, 0});
            }),
            "assertion failure: valid combination of editRate and aspectRatio");
}

TEST(PictureDefaults, ProxyStoredHeightAndLineMap) {
  EXPECT_EQ(zelta::proxyStoredWidth, 352u);
  EXPECT_EQ(zelta::getProxyStoredHeight({24000, 1001}), 240u);
  EXPECT_EQ(zelta::getProxyStoredHeight({30000, 1001}), 240u);
  EXPECT_EQ(zelta::getProxyStoredHeight({25, 1}), 288u);
  EXPECT_EQ(failureOf([] { zelta::getProxyStoredHeight({50, 1}); }), "assertion failure: valid editRate");
  EXPECT_EQ(zelta::getProxyDefaultVideoLineMap({30000, 1001}), ZeltaLineMap(23, 286));
  EXPECT_EQ(zelta::getProxyDefaultVideoLineMap({25, 1}), ZeltaLineMap(23, 336));
  EXPECT_EQ(zelta::getProxyDefaultVideoLineMap({24000, 1001}), ZeltaLineMap(0, 0));
}

}  // namespace
