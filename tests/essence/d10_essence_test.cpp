// D-10 edit units written by MXFD10EssenceCoder and read by
// MXFD10EssenceParser; the package metadata items.
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>
#include <string>
#include <vector>

#include "essence/d10_forwarders.h"
#include "mxf.h"
#include "support/essence_recording.h"
#include "support/klv_output.h"
#include "support/mxf_reports.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey d10Container = keyOf("06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01");
const KLVKey systemPackKey = keyOf("06.0E.2B.34.02.05.01.01.0D.01.03.01.04.01.01.00");
const KLVKey emptyPackageSetKey = keyOf("06.0E.2B.34.02.43.01.01.0D.01.03.01.04.01.02.00");

std::string stampText(const MXFSDTICPTimeStamp& stamp) { return hexOf(ByteVector(stamp.begin(), stamp.end())); }

class RecordingD10Handler : public MXFD10EssenceHandler {
public:
  void startD10() override { events.push_back("startD10"); }
  void endD10() override { events.push_back("endD10"); }
  void d10System(const MXFD10SystemInformation& system, const MXFGCLocalItems& items) override {
    std::string line = "d10System " + std::to_string(system.continuityCount) + " " +
                       toString(system.essenceContainer) + " " + stampText(system.creationStamp) + " / " +
                       stampText(system.userStamp) + " items";
    for (const auto& [tag, value] : items) line += " " + std::to_string(tag) + "=" + hexOf(value);
    events.push_back(line);
  }
  void d10Picture(const std::uint8_t* data, std::uint64_t length) override {
    events.push_back("d10Picture " + std::to_string(length));
    pictures.emplace_back(data, data + length);
  }
  void d10Sound(const std::uint8_t* data, std::uint64_t length) override {
    events.push_back("d10Sound " + std::to_string(length));
    sounds.emplace_back(data, data + length);
  }

  std::vector<std::string> events;
  std::vector<ByteVector> pictures;
  std::vector<ByteVector> sounds;
};

MXFSDTICPTimeStamp stamp(std::uint8_t first) {
  MXFSDTICPTimeStamp value{};
  value[0] = first;
  value[16] = 0x55;
  return value;
}

MXFD10SystemInformation systemInformation(std::uint16_t continuityCount) {
  MXFD10SystemInformation system;
  system.continuityCount = continuityCount;
  system.essenceContainer = d10Container;
  return system;
}

ByteVector filled(std::size_t size, std::uint8_t value) { return ByteVector(size, value); }

// Edit units of 50 Mbit/s 625-line D-10, coded into octets.
ByteVector codeEditUnits(const std::vector<MXFD10SystemInformation>& systems, const MXFGCLocalItems& items = {}) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFD10EssenceCoder coder(&writer);
  coder.startD10();
  std::uint8_t value = 1;
  for (const MXFD10SystemInformation& system : systems) {
    coder.d10System(system, items);
    const ByteVector picture = filled(250000, value++);
    coder.d10Picture(picture.data(), picture.size());
    const ByteVector sound = filled(61444, value++);
    coder.d10Sound(sound.data(), sound.size());
  }
  coder.endD10();
  return klv::outputOf(out);
}

// The offsets of the keys in coded octets, by key.
std::vector<std::pair<std::string, std::uint64_t>> keysOf(const ByteVector& bytes) {
  class Keys : public DullKLVHandler {
  public:
    void setLocator(Locator* locator) override { locator_ = locator; }
    bool startIndividualItem(const KLVKey& key, std::uint64_t, std::uint8_t*&) override { return add(key); }
    bool startLocalSet(const KLVKey& key, std::uint64_t, KLVTagType, KLVLengthType) override { return add(key); }
    bool startFixedLengthPack(const KLVKey& key, std::uint64_t, std::uint8_t*&) override { return add(key); }
    std::vector<std::pair<std::string, std::uint64_t>> keys;

  private:
    bool add(const KLVKey& key) {
      // At a start event the locator stands past the key and the four-octet length the coder writes.
      keys.emplace_back(toString(key), static_cast<std::uint64_t>(std::streamoff(locator_->getPosition())) - 20);
      return false;
    }
    Locator* locator_ = nullptr;
  } keys;
  readThrough(bytes, keys);
  return keys.keys;
}

}  // namespace

TEST(MXFD10EssenceCoder, EditUnitIsSystemPictureAndSoundGroupsOfFixedSizes) {
  const ByteVector bytes = codeEditUnits({systemInformation(0), systemInformation(1)});
  ASSERT_EQ(bytes.size(), 2u * 312832);
  const std::string fill = toString(KLVFillItemKey);
  const std::vector<std::pair<std::string, std::uint64_t>> expected = {
      {toString(systemPackKey), 0},
      {toString(emptyPackageSetKey), 77},
      {fill, 97},
      {toString(MXFD10PictureElementKey), 512},
      {fill, 512 + 20 + 250000},
      {toString(MXFD10SoundElementKey), 512 + 250368},
      {fill, 512 + 250368 + 20 + 61444},
      {toString(systemPackKey), 312832}};
  const auto keys = keysOf(bytes);
  ASSERT_GE(keys.size(), expected.size());
  const std::vector<std::pair<std::string, std::uint64_t>> first(keys.begin(), keys.begin() + expected.size());
  EXPECT_EQ(first, expected);
}

TEST(MXFD10EssenceCoder, BitmapSaysWhichStampsArePresent) {
  const std::pair<std::pair<std::uint8_t, std::uint8_t>, std::uint8_t> cases[] = {
      {{0, 0}, 0x4C}, {{0x81, 0}, 0x6C}, {{0, 0x81}, 0x5C}, {{0x81, 0x81}, 0x7C}};
  for (const auto& [stamps, bitmap] : cases) {
    MXFD10SystemInformation system = systemInformation(9);
    system.creationStamp = stamps.first ? stamp(stamps.first) : MXFSDTICPTimeStamp{};
    system.userStamp = stamps.second ? stamp(stamps.second) : MXFSDTICPTimeStamp{};
    // An absent stamp is written as zeros, whatever follows its first octet.
    if (!stamps.first) system.creationStamp[5] = 0x77;
    const ByteVector bytes = codeEditUnits({system});
    RecordingGCHandler units;
    MXFGCSplitter splitter(&units, &units, &units);
    readThrough(bytes, splitter);
    const std::string packLine = "systemFixedPack " + toString(systemPackKey) + " ";
    auto line = std::find_if(units.events.begin(), units.events.end(),
                             [&](const std::string& event) { return event.rfind(packLine, 0) == 0; });
    ASSERT_NE(line, units.events.end());
    ByteVector pack = {bitmap, 0x04, 0x00, 0x00, 0x00, 0x00, 0x09};
    const ByteVector label(d10Container.data(), d10Container.data() + 16);
    pack.insert(pack.end(), label.begin(), label.end());
    const MXFSDTICPTimeStamp creation = stamps.first ? stamp(stamps.first) : MXFSDTICPTimeStamp{};
    const MXFSDTICPTimeStamp user = stamps.second ? stamp(stamps.second) : MXFSDTICPTimeStamp{};
    pack.insert(pack.end(), creation.begin(), creation.end());
    pack.insert(pack.end(), user.begin(), user.end());
    EXPECT_EQ(*line, packLine + hexOf(pack));
  }
}

TEST(MXFD10EssenceCoder, PictureOrSoundBeforeAnySystemFailsParametersArePresent) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFD10EssenceCoder coder(&writer);
  coder.startD10();
  const ByteVector picture(16, 0);
  EXPECT_EQ(assertionTextOf([&] { coder.d10Picture(picture.data(), picture.size()); }),
            "assertion failure: parameters are present");
  EXPECT_EQ(assertionTextOf([&] { coder.d10Sound(picture.data(), picture.size()); }),
            "assertion failure: parameters are present");
}

TEST(MXFD10EssenceCoder, LabelThatIsNotD10FailsAtTheFirstSystem) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFD10EssenceCoder coder(&writer);
  coder.startD10();
  MXFD10SystemInformation system = systemInformation(0);
  system.essenceContainer = keyOf("06.0E.2B.34.04.01.01.01.0D.01.03.01.02.02.01.00");
  EXPECT_EQ(assertionTextOf([&] { coder.d10System(system, {}); }),
            "assertion failure: valid D-10 essenceContainer");
}

TEST(MXFD10EssenceParser, CodedEditUnitsReadBackAsTheSameEvents) {
  MXFD10SystemInformation first = systemInformation(7);
  first.userStamp = stamp(0x81);
  MXFD10SystemInformation second = systemInformation(8);
  second.creationStamp = stamp(0x82);
  const MXFGCLocalItems items = {{0x83, ByteVector(32, 0xAB)}};
  const ByteVector bytes = codeEditUnits({first, second}, items);
  RecordingD10Handler d10;
  RecordingErrorHandler errors;
  MXFD10EssenceParser parser(&d10);
  parser.setErrorHandler(&errors);
  readThrough(bytes, parser);
  EXPECT_EQ(reportLines(errors), std::vector<std::string>());
  const std::string label = toString(d10Container);
  const std::string zero = stampText(MXFSDTICPTimeStamp{});
  const std::string umid = "131=" + hexOf(ByteVector(32, 0xAB));
  EXPECT_EQ(d10.events,
            (std::vector<std::string>{"startD10",
                                      "d10System 7 " + label + " " + zero + " / " + stampText(stamp(0x81)) +
                                          " items " + umid,
                                      "d10Picture 250000", "d10Sound 61444",
                                      "d10System 8 " + label + " " + stampText(stamp(0x82)) + " / " + zero +
                                          " items " + umid,
                                      "d10Picture 250000", "d10Sound 61444", "endD10"}));
  ASSERT_EQ(d10.pictures.size(), 2u);
  EXPECT_EQ(d10.pictures[1], filled(250000, 3));
  EXPECT_EQ(d10.sounds[0], filled(61444, 2));
}

TEST(MXFD10EssenceParser, PackageMetadataWithoutAPackBeforeItKeepsThePackOfTheLastEditUnit) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  {
    MXFGCMuxer muxer(&writer);
    MXFSDTICPSystemCoder system(muxer.getSystemHandler());
    muxer.getStructureHandler()->start(512);
    MXFSDTICPSystemMetadata pack;
    pack.bitmap = 0x4C;
    pack.rate = 4;
    pack.continuityCount = 41;
    pack.label = d10Container;
    system.systemMetadata(pack);
    system.packageMetadata({});
    const ByteVector picture(8, 0x11);
    muxer.getEssenceHandler()->pictureElement(MXFD10PictureElementKey, picture.data(), picture.size());
    // The next edit unit has lost its pack.
    system.packageMetadata({{0x88, {1, 2}}});
    muxer.getStructureHandler()->end();
  }
  RecordingD10Handler d10;
  MXFD10EssenceParser parser(&d10);
  readThrough(klv::outputOf(out), parser);
  const std::string prefix = "d10System 41 " + toString(d10Container) + " ";
  const std::string zero = stampText(MXFSDTICPTimeStamp{});
  EXPECT_EQ(d10.events, (std::vector<std::string>{"startD10", prefix + zero + " / " + zero + " items",
                                                  "d10Picture 8", prefix + zero + " / " + zero + " items 136=01 02", "endD10"}));
}

TEST(MXFD10EssenceParser, OtherElementsAndSystemItemsAreDropped) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  {
    MXFGCMuxer muxer(&writer);
    MXFSDTICPSystemCoder system(muxer.getSystemHandler());
    muxer.getStructureHandler()->start(0);
    MXFSDTICPSystemMetadata pack;
    pack.bitmap = 0x4D;
    pack.label = d10Container;
    system.systemMetadata(pack);
    system.pictureMetadata({{1, {2}}});
    system.controlData(3, {4});
    const ByteVector bytes(8, 0x11);
    MXFGCEssenceHandler* essence = muxer.getEssenceHandler();
    essence->pictureElement(keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00"), bytes.data(), bytes.size());
    essence->dataElement(keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.17.01.01.00"), bytes.data(), bytes.size());
    essence->pictureElement(MXFD10PictureElementKey, bytes.data(), bytes.size());
    essence->soundElement(MXFD10SoundElementKey, bytes.data(), 4);
    muxer.getStructureHandler()->end();
  }
  RecordingD10Handler d10;
  MXFD10EssenceParser parser(&d10);
  readThrough(klv::outputOf(out), parser);
  EXPECT_EQ(d10.events, (std::vector<std::string>{"startD10", "d10Picture 8", "d10Sound 4", "endD10"}));
}

TEST(MXFD10EssenceParser, EssenceForwarderWantsOnlyTheTwoD10KeysWhateverTheirVersion) {
  RecordingD10Handler d10;
  MXFD10EssenceForwarder forwarder(&d10);
  std::uint8_t* buffer = nullptr;
  KLVKey picture = MXFD10PictureElementKey;
  picture[7] = 0x05;
  EXPECT_TRUE(forwarder.startEssenceElement(picture, 10, buffer));
  EXPECT_TRUE(forwarder.startEssenceElement(MXFD10SoundElementKey, 10, buffer));
  EXPECT_FALSE(forwarder.startEssenceElement(keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.06.01.10.01"), 10, buffer));
  EXPECT_FALSE(forwarder.startEssenceElement(keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.05.00"), 10, buffer));
}

TEST(MXFD10PackageMetadata, UMIDAndKLVMetadataAreTags83And88) {
  MXFD10PackageMetadata metadata;
  EXPECT_TRUE(codeMXFD10PackageMetadata(metadata).empty());
  metadata.umid = UMID();
  metadata.klvMetadata = ByteVector{1, 2, 3};
  EXPECT_EQ(codeMXFD10PackageMetadata(metadata),
            (MXFGCLocalItems{{0x83, ByteVector(32, 0)}, {0x88, ByteVector{1, 2, 3}}}));
  metadata.umid = UMID(UMID::extended, ByteVector(64, 0x42));
  EXPECT_EQ(codeMXFD10PackageMetadata(metadata).front(), (std::pair<std::uint16_t, ByteVector>{0x83, ByteVector(64, 0x42)}));
}

TEST(MXFD10PackageMetadata, ReadingIgnoresOtherTagsAndTakesTheLastItemOfATag) {
  const MXFD10PackageMetadata metadata = parseMXFD10PackageMetadata(
      {{0x83, ByteVector(32, 1)}, {0x84, ByteVector{9}}, {0x88, ByteVector{5}}, {0x83, ByteVector(64, 2)}});
  ASSERT_TRUE(metadata.umid);
  EXPECT_EQ(*metadata.umid, UMID(UMID::extended, ByteVector(64, 2)));
  ASSERT_TRUE(metadata.klvMetadata);
  EXPECT_EQ(*metadata.klvMetadata, ByteVector{5});
  const MXFD10PackageMetadata none = parseMXFD10PackageMetadata({{0x84, ByteVector{9}}});
  EXPECT_FALSE(none.umid);
  EXPECT_FALSE(none.klvMetadata);
}

TEST(MXFD10PackageMetadata, UMIDOfAnotherSizeFailsValidSize) {
  EXPECT_EQ(assertionTextOf([] { parseMXFD10PackageMetadata({{0x83, ByteVector(33, 0)}}); }),
            "assertion failure: valid size");
}
