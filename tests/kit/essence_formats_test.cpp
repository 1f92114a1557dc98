#include "kit/essence_formats.h"

#include <gtest/gtest.h>

#include <vector>

#include "core/failure.h"
#include "kit/kit_labels.h"

using zelta::checkEditRate;
using zelta::getEssenceContainer;
using zelta::getEssenceContainers;
using zelta::isSameRate;
using zelta_test::failureOf;
using zelta_test::keyOf;
using zelta_test::octetsOf;
typedef ZeltaEssenceFormat F;

namespace {

const std::vector<MXFRational> tenRates{{24000, 1001}, {24, 1}, {25, 1}, {30000, 1001}, {30, 1},
                                        {48000, 1001}, {48, 1}, {50, 1}, {60000, 1001}, {60, 1}};
const F allFormats[] = {F::D10, F::DV, F::MPEG, F::Proxy, F::Raw, F::AVC};
const F invalidFormat = static_cast<F>(6);

std::vector<std::uint32_t> allowedRateIndexes(F format) {
  std::vector<std::uint32_t> indexes;
  for (std::uint32_t i = 0; i < tenRates.size(); ++i)
    if (failureOf([&] { checkEditRate(format, tenRates[i]); }) == "no failure") indexes.push_back(i);
  return indexes;
}

TEST(EssenceFormats, RatesCompareAsCrossProducts) {
  EXPECT_TRUE(isSameRate({24000, 1001}, {48000, 2002}));
  EXPECT_TRUE(isSameRate({50, 2}, {25, 1}));
  EXPECT_FALSE(isSameRate({24000, 1001}, {24, 1}));
  EXPECT_FALSE(isSameRate({30000, 1001}, {2997, 100}));
}

TEST(EssenceFormats, ZeroDenominatorRateEqualsNoTableRate) {
  for (const MXFRational& rate : tenRates) {
    EXPECT_FALSE(isSameRate({0, 0}, rate));
    EXPECT_FALSE(isSameRate({25, 0}, rate));
    EXPECT_FALSE(isSameRate(rate, {0, 0}));
  }
  EXPECT_FALSE(isSameRate({0, 0}, {0, 0}));
  for (F format : allFormats)
    EXPECT_EQ(failureOf([&] { checkEditRate(format, {25, 0}); }), "assertion failure: valid edit rate");
}

TEST(EssenceFormats, EachFormatAllowsItsRates) {
  EXPECT_EQ(allowedRateIndexes(F::D10), (std::vector<std::uint32_t>{2, 3}));
  EXPECT_EQ(allowedRateIndexes(F::DV), (std::vector<std::uint32_t>{2, 3}));
  EXPECT_EQ(allowedRateIndexes(F::MPEG), (std::vector<std::uint32_t>{0, 1, 2, 3, 4, 7, 8, 9}));
  EXPECT_EQ(allowedRateIndexes(F::Proxy), (std::vector<std::uint32_t>{0, 2, 3}));
  EXPECT_EQ(allowedRateIndexes(F::Raw), (std::vector<std::uint32_t>{0, 1, 2, 3, 4, 5, 6, 7, 8, 9}));
  EXPECT_EQ(allowedRateIndexes(F::AVC), (std::vector<std::uint32_t>{0, 1, 2, 3, 4, 7, 8, 9}));
}

TEST(EssenceFormats, UnreducedRateOfTheListIsAllowed) {
  EXPECT_EQ(failureOf([] { checkEditRate(F::D10, {50, 2}); }), "no failure");
}

TEST(EssenceFormats, RateOutsideTheListFailsValidEditRate) {
  EXPECT_EQ(failureOf([] { getEssenceContainer(F::D10, 50000000, {24, 1}); }), "assertion failure: valid edit rate");
  EXPECT_EQ(failureOf([] { getEssenceContainer(F::Proxy, 0, {30, 1}); }), "assertion failure: valid edit rate");
  EXPECT_EQ(failureOf([] { getEssenceContainer(F::MPEG, 0, {48, 1}); }), "assertion failure: valid edit rate");
}

TEST(EssenceFormats, UnknownFormatFailsValidEssenceFormat) {
  EXPECT_EQ(failureOf([] {
              getEssenceContainer(invalidFormat, 0, {25, 1});
            }),
            "assertion failure: valid essence format");
  EXPECT_EQ(failureOf([] { zelta::getSoundTrackCount(invalidFormat, 2); }), "assertion failure: valid essence format");
  EXPECT_EQ(failureOf([] { zelta::getPictureTrackNumber(invalidFormat); }), "assertion failure: valid essence format");
}

TEST(EssenceFormats, OnlyTheSixValuesAreSupportedFormats) {
  for (std::uint32_t v = 0; v < 6; ++v) EXPECT_EQ(zelta::toEssenceFormat(v), static_cast<F>(v));
  EXPECT_EQ(failureOf([] { zelta::toEssenceFormat(6); }), "assertion failure: supported essence format");
  EXPECT_EQ(failureOf([] { zelta::toEssenceFormat(ZeltaNoEssenceFormat); }),
            "assertion failure: supported essence format");
}

TEST(EssenceFormats, D10ContainerByBitRateAndRate) {
  const char* base = "06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 ";
  const struct {
    std::uint32_t bitRate;
    MXFRational rate;
    const char* tail;
  } rows[] = {{50000000, {25, 1}, "01 01"}, {50000000, {30000, 1001}, "02 01"},
              {40000000, {25, 1}, "03 01"}, {40000000, {30000, 1001}, "04 01"},
              {30000000, {25, 1}, "05 01"}, {30000000, {30000, 1001}, "06 01"}};
  for (const auto& row : rows)
    EXPECT_EQ(getEssenceContainer(F::D10, row.bitRate, row.rate).octets(), octetsOf(std::string(base) + row.tail));
}

TEST(EssenceFormats, D10OtherBitRateFailsValidBitRate) {
  EXPECT_EQ(failureOf([] { getEssenceContainer(F::D10, 25000000, {25, 1}); }), "assertion failure: valid bit rate");
}

TEST(EssenceFormats, DVContainerByRateWithBitRateExactly25Million) {
  EXPECT_EQ(getEssenceContainer(F::DV, 25000000, {30000, 1001}).octets(),
            octetsOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 01 01"));
  EXPECT_EQ(getEssenceContainer(F::DV, 25000000, {25, 1}).octets(),
            octetsOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 02 01"));
  EXPECT_EQ(failureOf([] { getEssenceContainer(F::DV, 25000001, {25, 1}); }), "assertion failure: valid bit rate");
  EXPECT_EQ(failureOf([] { getEssenceContainer(F::DV, 50000000, {25, 1}); }), "assertion failure: valid bit rate");
}

TEST(EssenceFormats, ContainersOfTheOtherFormats) {
  EXPECT_EQ(getEssenceContainer(F::MPEG, 0, {25, 1}).octets(),
            octetsOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 60 01"));
  EXPECT_EQ(getEssenceContainer(F::Proxy, 0, {25, 1}).octets(),
            octetsOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 61 07"));
  EXPECT_EQ(getEssenceContainer(F::Raw, 0, {48, 1}).octets(),
            octetsOf("06 0E 2B 34 04 01 01 06 0E 06 0D 03 02 01 01 00"));
  EXPECT_EQ(getEssenceContainer(F::AVC, 0, {60, 1}).octets(),
            octetsOf("06 0E 2B 34 04 01 01 0A 0D 01 03 01 02 10 60 01"));
}

TEST(EssenceFormats, SingleLabelWithoutSoundOrData) {
  const std::vector<KLVKey> labels = getEssenceContainers(F::MPEG, 0, {25, 1}, false, false);
  ASSERT_EQ(labels.size(), 1u);
  EXPECT_EQ(labels[0].octets(), octetsOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 60 01"));
}

TEST(EssenceFormats, SoundDataAndMultipleLabelsFollowThePicture) {
  const std::vector<KLVKey> labels = getEssenceContainers(F::AVC, 0, {25, 1}, true, true);
  ASSERT_EQ(labels.size(), 4u);
  EXPECT_EQ(labels[1].octets(), octetsOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00"));
  EXPECT_EQ(labels[2].octets(), octetsOf("06 0E 2B 34 04 01 01 09 0D 01 03 01 02 0E 00 00"));
  EXPECT_EQ(labels[3].octets(), octetsOf("06 0E 2B 34 04 01 01 03 0D 01 03 01 02 7F 01 00"));
}

TEST(EssenceFormats, ProxySoundHasItsOwnContainer) {
  const std::vector<KLVKey> labels = getEssenceContainers(F::Proxy, 0, {25, 1}, true, false);
  ASSERT_EQ(labels.size(), 3u);
  EXPECT_EQ(labels[1].octets(), octetsOf("06 0E 2B 34 04 01 01 03 0D 01 03 01 02 0A 03 00"));
  EXPECT_EQ(labels[2].octets(), octetsOf("06 0E 2B 34 04 01 01 03 0D 01 03 01 02 7F 01 00"));
  EXPECT_EQ(zelta::getSoundContainer(F::Proxy).octets(), octetsOf("06 0E 2B 34 04 01 01 03 0D 01 03 01 02 0A 03 00"));
  EXPECT_EQ(zelta::getSoundContainer(F::D10).octets(), octetsOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00"));
}

TEST(EssenceFormats, D10SoundIsInsideItsContainer) {
  EXPECT_EQ(getEssenceContainers(F::D10, 50000000, {25, 1}, true, false).size(), 1u);
}

TEST(EssenceFormats, DataAloneMakesTwoLabelsAndTheMultipleLabel) {
  const std::vector<KLVKey> labels = getEssenceContainers(F::MPEG, 50000000, {25, 1}, false, true);
  ASSERT_EQ(labels.size(), 3u);
  EXPECT_EQ(labels[1], zelta::ancillaryDataContainer);
  EXPECT_EQ(labels[2], zelta::multipleEssenceContainer);
}

TEST(EssenceFormats, DVDataTrackAddsNoLabelOfItsOwn) {
  EXPECT_EQ(getEssenceContainers(F::DV, 25000000, {25, 1}, false, true).size(), 1u);
  EXPECT_EQ(getEssenceContainers(F::DV, 25000000, {25, 1}, true, true).size(), 3u);
}

TEST(EssenceFormats, OperationalPatterns) {
  EXPECT_EQ(zelta::getOperationalPattern(F::Proxy).octets(),
            octetsOf("06 0E 2B 34 04 01 01 01 0E 06 02 01 40 01 09 00"));
  for (F format : {F::D10, F::DV, F::MPEG, F::Raw, F::AVC})
    EXPECT_EQ(zelta::getOperationalPattern(format).octets(),
              octetsOf("06 0E 2B 34 04 01 01 01 0D 01 02 01 01 01 09 00"));
}

TEST(EssenceFormats, SoundTrackCounts) {
  EXPECT_EQ(zelta::getSoundTrackCount(F::D10, 8), 1u);
  EXPECT_EQ(zelta::getSoundTrackCount(F::D10, 4), 1u);
  for (F format : {F::DV, F::MPEG, F::Raw, F::AVC}) EXPECT_EQ(zelta::getSoundTrackCount(format, 6), 6u);
  EXPECT_EQ(zelta::getSoundTrackCount(F::Proxy, 8), 4u);
}

TEST(EssenceFormats, ProxyWithSevenChannelsFailsValidChannelCount) {
  EXPECT_EQ(failureOf([] { zelta::getSoundTrackCount(F::Proxy, 7); }), "assertion failure: valid channelCount");
}

TEST(EssenceFormats, SoundRateIsTheChannelsOwnElseTheFormatsDefault) {
  EXPECT_EQ(zelta::getSoundRate(F::MPEG, {44100, 1}), (MXFRational{44100, 1}));
  EXPECT_EQ(zelta::getSoundRate(F::Proxy, {16000, 1}), (MXFRational{16000, 1}));
  EXPECT_EQ(zelta::getSoundRate(F::MPEG, {0, 1}), (MXFRational{48000, 1}));
  EXPECT_EQ(zelta::getSoundRate(F::AVC, {0, 0}), (MXFRational{48000, 1}));
  EXPECT_EQ(zelta::getSoundRate(F::Proxy, {0, 1}), (MXFRational{8000, 1}));
  EXPECT_EQ(zelta::getSoundRate(F::Proxy, {0, 0}), (MXFRational{8000, 1}));
}

TEST(EssenceFormats, DVAlwaysHasTheDataTrack) {
  EXPECT_TRUE(zelta::hasDataTrack(F::DV, false));
  for (F format : {F::MPEG, F::Raw, F::AVC}) {
    EXPECT_TRUE(zelta::hasDataTrack(format, true));
    EXPECT_FALSE(zelta::hasDataTrack(format, false));
  }
  EXPECT_FALSE(zelta::hasDataTrack(F::D10, true));
  EXPECT_FALSE(zelta::hasDataTrack(F::Proxy, true));
}

TEST(EssenceFormats, TrackNumbersAreTheLastFourOctetsOfTheElementKeys) {
  EXPECT_EQ(zelta::getPictureTrackNumber(F::D10), 0x05010100u);
  EXPECT_EQ(zelta::getPictureTrackNumber(F::DV), 0x18010100u);
  EXPECT_EQ(zelta::getPictureTrackNumber(F::MPEG), 0x15010500u);
  EXPECT_EQ(zelta::getPictureTrackNumber(F::AVC), 0x15010500u);
  EXPECT_EQ(zelta::getPictureTrackNumber(F::Proxy), 0x15010700u);
  EXPECT_EQ(zelta::getPictureTrackNumber(F::Raw), 0x15017F00u);
  EXPECT_EQ(zelta::getSoundTrackNumber(F::D10, 0, 1), 0x06011000u);
  EXPECT_EQ(zelta::getSoundTrackNumber(F::MPEG, 0, 4), 0x16040300u);
  EXPECT_EQ(zelta::getSoundTrackNumber(F::AVC, 3, 4), 0x16040303u);
  EXPECT_EQ(zelta::getSoundTrackNumber(F::Proxy, 2, 4), 0x16040A02u);
  EXPECT_EQ(zelta::getDataTrackNumber(F::MPEG, 2), 0x17010201u);
}

TEST(EssenceFormats, DVDataTrackTakesTheSoundKeyForm) { EXPECT_EQ(zelta::getDataTrackNumber(F::DV, 2), 0x16020302u); }

TEST(EssenceFormats, D10LabelsRecognisedButForVersionKindAndWrapping) {
  EXPECT_TRUE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 05 0D 01 03 01 02 01 06 7F")));
  EXPECT_TRUE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 02")));
  EXPECT_FALSE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 00 0D 01 03 01 02 01 01 01")));
  EXPECT_FALSE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 07 01")));
  EXPECT_FALSE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 00 01")));
  EXPECT_FALSE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 03")));
  EXPECT_FALSE(zelta::isD10Container(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 01 01")));
}

TEST(EssenceFormats, DVLabelsRecognisedButForVersionKindAndWrapping) {
  for (int kind : {1, 2, 3, 4, 63, 64, 65, 80, 81, 96, 97, 98, 99, 127}) {
    KLVKey label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 00 02");
    label[14] = static_cast<std::uint8_t>(kind);
    EXPECT_TRUE(zelta::isDVContainer(label)) << kind;
  }
  EXPECT_FALSE(zelta::isDVContainer(keyOf("06 0E 2B 34 04 01 01 00 0D 01 03 01 02 02 01 01")));
  EXPECT_FALSE(zelta::isDVContainer(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 05 01")));
  EXPECT_FALSE(zelta::isDVContainer(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 42 01")));
  EXPECT_FALSE(zelta::isDVContainer(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 01 03")));
}

TEST(EssenceFormats, D10BitRateReadBackFromTheKind) {
  const std::uint32_t rates[] = {50000000, 50000000, 40000000, 40000000, 30000000, 30000000};
  for (std::uint8_t kind = 1; kind <= 6; ++kind) {
    KLVKey label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 00 01");
    label[14] = kind;
    EXPECT_EQ(zelta::getD10BitRate(label), rates[kind - 1]);
  }
  EXPECT_EQ(failureOf([] { zelta::getD10BitRate(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 07 01")); }),
            "assertion failure: recognized essence container");
}

TEST(EssenceFormats, DVBitRateReadBackFromTheKind) {
  const struct {
    int kind;
    std::uint32_t bitRate;
  } rows[] = {{1, 25000000},    {4, 25000000},    {0x40, 25000000},  {0x41, 25000000},
              {0x50, 50000000}, {0x51, 50000000}, {0x60, 100000000}, {0x63, 100000000}};
  for (const auto& row : rows) {
    KLVKey label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 00 01");
    label[14] = static_cast<std::uint8_t>(row.kind);
    EXPECT_EQ(zelta::getDVBitRate(label), row.bitRate) << row.kind;
  }
  for (int kind : {0x3F, 0x7F}) {
    KLVKey label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 00 01");
    label[14] = static_cast<std::uint8_t>(kind);
    EXPECT_EQ(failureOf([&] { zelta::getDVBitRate(label); }), "assertion failure: defined DV bit rate");
  }
}

TEST(EssenceFormats, FormatOfAPictureContainer) {
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 03 7F")), F::D10);
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 02 60 02")), F::DV);
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 60 01")), F::MPEG);
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 61 07")), F::Proxy);
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 06 0E 06 0D 03 02 01 01 00")), F::Raw);
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 0A 0D 01 03 01 02 10 60 01")), F::AVC);
  EXPECT_EQ(zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 0A 0D 01 03 01 02 0F 60 01")), F::AVC);
}

TEST(EssenceFormats, OtherContainerFailsRecognizedEssenceContainer) {
  EXPECT_EQ(failureOf([] { zelta::getEssenceFormat(keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00")); }),
            "assertion failure: recognized essence container");
}

}  // namespace
