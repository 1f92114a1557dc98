// Files of independent writers with SDTI-CP system items: every system
// element parses without a report into the values that an independent dump
// tool prints, and codes back to the octets that the file holds.
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/essence_recording.h"
#include "support/klv_output.h"
#include "support/mxf_reports.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// The system metadata packs of a file as the dump prints them. The fields
// that all edit units share have one value; continuity counts and user
// stamps have one per edit unit.
struct FileSystemItems {
  const char* name;
  std::uint8_t bitmap;
  std::uint8_t rate;
  std::uint8_t type;
  std::uint16_t channelHandle;
  const char* label;  // all 16 octets, the version octet included
  const char* creationStamp;
  std::vector<std::uint16_t> continuityCounts;
  std::vector<const char*> userStamps;
};

const std::vector<FileSystemItems> files{
    {"ffmpeg_d10_50m_625_noaudio.mxf",
     0x58, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002},
     {"81 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00"}},
    // Damaged only by its missing random index; its content packages are whole.
    {"damaged_no_rip.mxf",
     0x5C, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.05.01",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003},
     {"81 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 03 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00"}},
    {"ffmpeg_dv25_625_420_2mono.mxf",
     0x5C, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.03.0D.01.03.01.02.7F.01.00",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003, 0x0004, 0x0005},
     {"81 00 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 03 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 04 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 05 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00"}},
    {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
     0x5C, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.03.0D.01.03.01.02.7F.01.00",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003, 0x0004, 0x0005, 0x0006, 0x0007, 0x0008, 0x0009, 0x000A, 0x000B, 0x000C, 0x000D, 0x000E, 0x000F, 0x0010, 0x0011, 0x0012, 0x0013, 0x0014, 0x0015, 0x0016, 0x0017},
     {"81 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 03 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 04 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 05 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 06 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 07 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 08 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 09 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 10 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 11 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 12 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 13 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 14 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 15 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 16 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 17 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 18 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 19 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 20 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 21 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 22 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 23 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00"}},
    {"bmx_d10_50m_625_8ch24.mxf",
     0x5C, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.01.01",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003, 0x0004},
     {"81 00 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 03 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 04 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00"}},
    {"ffmpeg_d10_50m_525_4ch16.mxf",
     0x5C, 0x07, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.01.0D.01.03.01.02.01.02.01",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003, 0x0004},
     {"81 40 00 00 01 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 41 00 00 01 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 42 00 00 01 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 43 00 00 01 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 44 00 00 01 00 00 00 00 00 00 00 00 00 00 00 00"}},
    {"ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf",
     0x5C, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.03.0D.01.03.01.02.7F.01.00",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003, 0x0004, 0x0005, 0x0006, 0x0007,
      0x0008, 0x0009, 0x000A, 0x000B, 0x000C, 0x000D, 0x000E, 0x000F,
      0x0010, 0x0011, 0x0012, 0x0013, 0x0014, 0x0015, 0x0016, 0x0017},
     {"81 00 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 03 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 04 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 05 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 06 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 07 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 08 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 09 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 10 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 11 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 12 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 13 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 14 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 15 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 16 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 17 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 18 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 19 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 20 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 21 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 22 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 23 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00"}},
    {"bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf",
     0x5C, 0x04, 0x00, 0x0000,
     "06.0E.2B.34.04.01.01.03.0D.01.03.01.02.7F.01.00",
     "00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00",
     {0x0000, 0x0001, 0x0002, 0x0003, 0x0004, 0x0005, 0x0006, 0x0007,
      0x0008, 0x0009, 0x000A, 0x000B, 0x000C, 0x000D, 0x000E, 0x000F,
      0x0010, 0x0011, 0x0012, 0x0013, 0x0014, 0x0015, 0x0016, 0x0017},
     {"81 00 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 01 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 02 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 03 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 04 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 05 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 06 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 07 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 08 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 09 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 10 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 11 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 12 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 13 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 14 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 15 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 16 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 17 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 18 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 19 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 20 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 21 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 22 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00",
      "81 23 00 00 10 00 00 00 00 00 00 00 00 00 00 00 00"}},
};

// Per edit unit, what the typed events gave; every event is passed on.
class EditUnitCollector : public DullMXFGCStructureHandler, public MXFSDTICPSystemHandler {
public:
  struct Unit {
    std::vector<MXFSDTICPSystemMetadata> packs;
    int packageSets = 0;
    int otherElements = 0;  // picture, sound and data sets, and control data
  };

  explicit EditUnitCollector(MXFSDTICPSystemHandler* next) : next_(next) {}

  void startEditUnit() override { units.emplace_back(); }
  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override {
    units.back().packs.push_back(pack);
    next_->systemMetadata(pack);
  }
  void packageMetadata(const MXFGCLocalItems& items) override {
    ++units.back().packageSets;
    next_->packageMetadata(items);
  }
  void pictureMetadata(const MXFGCLocalItems& items) override {
    ++units.back().otherElements;
    next_->pictureMetadata(items);
  }
  void soundMetadata(const MXFGCLocalItems& items) override {
    ++units.back().otherElements;
    next_->soundMetadata(items);
  }
  void dataMetadata(const MXFGCLocalItems& items) override {
    ++units.back().otherElements;
    next_->dataMetadata(items);
  }
  void controlData(std::uint16_t tag, const ByteVector& bytes) override {
    ++units.back().otherElements;
    next_->controlData(tag, bytes);
  }

  std::vector<Unit> units;

private:
  MXFSDTICPSystemHandler* next_;
};

// The octets of every system element as the file holds them: key, length
// and value, found from where the value starts and the length form in force.
class SystemElementCapture : public DullKLVFilter {
public:
  SystemElementCapture(KLVHandler* handler, const ByteVector& file) : DullKLVFilter(handler), file_(file) {}

  void setLocator(Locator* locator) override {
    locator_ = locator;
    DullKLVFilter::setLocator(locator);
  }
  void setLengthForm(std::uint8_t form) override {
    form_ = form;
    DullKLVFilter::setLengthForm(form);
  }
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override {
    capture(key, length);
    return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
  }
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    capture(key, length);
    return DullKLVFilter::startFixedLengthPack(key, length, buffer);
  }
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override {
    capture(key, length);
    return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
  }

  ByteVector octets;
  int elements = 0;

private:
  void capture(const KLVKey& key, std::uint64_t length) {
    if (!isMXFGCSystemKey(key)) return;
    const auto value = static_cast<std::size_t>(std::streamoff(locator_->getPosition()));
    const std::size_t start = value - KLVKey::size() - lengthFormOctets(form_);
    octets.insert(octets.end(), file_.begin() + static_cast<std::ptrdiff_t>(start),
                  file_.begin() + static_cast<std::ptrdiff_t>(value + length));
    ++elements;
  }

  const ByteVector& file_;
  Locator* locator_ = nullptr;
  std::uint8_t form_ = KLVNoLengthForm;
};

// One read of a file: the splitter gives its system elements to the parser,
// whose events are collected and coded again into octets.
struct SystemItemsRead {
  explicit SystemItemsRead(const std::string& name) : file(readFile(dataPath(name))) {
    parser.setErrorHandler(&errors);
    splitter.setErrorHandler(&errors);
    writer.startStream(true);
    std::ifstream in(dataPath(name), std::ios::binary);
    MXFReader reader;
    reader.setEssenceHandler(&capture);
    reader.read(in);
    writer.endStream(false);
  }

  ByteVector file;
  RecordingErrorHandler errors;
  std::ostringstream out;
  GenericKLVWriter writer{out};
  MXFGCSystemCoder systemCoder{&writer};
  MXFSDTICPSystemCoder coder{&systemCoder};
  EditUnitCollector collector{&coder};
  MXFSDTICPSystemParser parser{&collector};
  MXFGCSplitter splitter{&collector, &parser, nullptr};
  SystemElementCapture capture{&splitter, file};
};

std::string stampText(const MXFSDTICPTimeStamp& stamp) { return hexOf(ByteVector(stamp.begin(), stamp.end())); }

class SystemItemsInterop : public ::testing::TestWithParam<FileSystemItems> {};

std::string testName(const ::testing::TestParamInfo<FileSystemItems>& info) {
  std::string name = info.param.name;
  for (char& c : name)
    if (c == '.') c = '_';
  return name;
}

}  // namespace

TEST_P(SystemItemsInterop, EveryEditUnitParsesWithoutReportIntoTheDumpedPack) {
  const FileSystemItems& expected = GetParam();
  const SystemItemsRead read(expected.name);
  EXPECT_TRUE(reportLines(read.errors).empty()) << ::testing::PrintToString(reportLines(read.errors));
  ASSERT_EQ(expected.continuityCounts.size(), expected.userStamps.size());
  ASSERT_EQ(read.collector.units.size(), expected.continuityCounts.size());
  for (std::size_t i = 0; i < read.collector.units.size(); ++i) {
    SCOPED_TRACE("edit unit " + std::to_string(i));
    const EditUnitCollector::Unit& unit = read.collector.units[i];
    ASSERT_EQ(unit.packs.size(), 1u);
    EXPECT_EQ(unit.packageSets, 1);
    EXPECT_EQ(unit.otherElements, 0);
    const MXFSDTICPSystemMetadata& pack = unit.packs[0];
    EXPECT_EQ(pack.bitmap, expected.bitmap);
    EXPECT_EQ(pack.rate, expected.rate);
    EXPECT_EQ(pack.type, expected.type);
    EXPECT_EQ(pack.channelHandle, expected.channelHandle);
    EXPECT_EQ(pack.continuityCount, expected.continuityCounts[i]);
    EXPECT_EQ(toString(pack.label), expected.label);
    EXPECT_EQ(stampText(pack.creationStamp), expected.creationStamp);
    EXPECT_EQ(stampText(pack.userStamp), expected.userStamps[i]);
  }
}

TEST_P(SystemItemsInterop, SystemElementsCodeBackToTheOctetsOfTheFile) {
  const SystemItemsRead read(GetParam().name);
  // A pack and a package metadata set in each edit unit.
  EXPECT_EQ(read.capture.elements, static_cast<int>(2 * GetParam().continuityCounts.size()));
  EXPECT_EQ(klv::outputOf(read.out), read.capture.octets);
}

// The table above holds every file of the test data that has system items.
TEST(SystemItemsInterop, NoOtherTestFileCarriesSystemItems) {
  class SystemKeys : public DullKLVHandler {
  public:
    bool startIndividualItem(const KLVKey& key, std::uint64_t, std::uint8_t*&) override { return count(key); }
    bool startLocalSet(const KLVKey& key, std::uint64_t, KLVTagType, KLVLengthType) override { return count(key); }
    bool startFixedLengthPack(const KLVKey& key, std::uint64_t, std::uint8_t*&) override { return count(key); }
    bool startVariableLengthPack(const KLVKey& key, std::uint64_t, KLVLengthType) override { return count(key); }
    int elements = 0;

  private:
    bool count(const KLVKey& key) {
      if (isMXFGCSystemKey(key)) ++elements;
      return false;
    }
  };
  int others = 0;
  for (const auto& entry : std::filesystem::directory_iterator(ZELTA_TEST_DATA)) {
    const std::string name = entry.path().filename().string();
    if (entry.path().extension() != ".mxf" ||
        std::any_of(files.begin(), files.end(), [&](const FileSystemItems& file) { return name == file.name; }))
      continue;
    SCOPED_TRACE(name);
    SystemKeys keys;
    MXFReader reader;
    reader.setEssenceHandler(&keys);
    std::ifstream in(entry.path(), std::ios::binary);
    try {
      reader.read(in);
    } catch (const std::exception&) {
      // A damaged file is looked at up to its damage.
    }
    EXPECT_EQ(keys.elements, 0);
    ++others;
  }
  EXPECT_GT(others, 0);
}

INSTANTIATE_TEST_SUITE_P(Files, SystemItemsInterop, ::testing::ValuesIn(files), testName);
