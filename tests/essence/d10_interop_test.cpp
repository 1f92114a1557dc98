// D-10 files of other writers: the parameters of their labels against their
// own index tables, their pictures against the checksums another tool
// printed, and their essence containers written again by Zelta.
#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/digest.h"
#include "support/mxf_reports.h"
#include "support/mxf_rewrap.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

struct D10File {
  const char* name;
  const char* pictureMD5;  // mxf2raw --track-chksum md5 of the picture track
  std::uint32_t editUnitByteCount;
  std::uint32_t pictureDelta;
  std::size_t editUnits;
  // Why the written essence container may differ from the original: the
  // writer's fill items carry a version octet other than that of the fill
  // key the coder writes.
  bool otherFillKeyVersion;
};

const D10File d10Files[] = {
    {"bmx_d10_50m_625_8ch24.mxf", "2e5f3e694630906c3a924ee5a981c346", 0x0004C600, 512 + 250368, 5, false},
    {"ffmpeg_d10_50m_525_4ch16.mxf", "db45bb049caf7f83da11c6063b4877cb", 0x0003FC00, 209408, 5, true}};

// The events that the parser delivers, with every picture kept.
class D10Collector : public MXFD10EssenceHandler {
public:
  void startD10() override {}
  void endD10() override {}
  void d10System(const MXFD10SystemInformation& system, const MXFGCLocalItems&) override {
    systems.push_back(system);
  }
  void d10Picture(const std::uint8_t* data, std::uint64_t length) override {
    pictures.insert(pictures.end(), data, data + length);
    ++pictureCount;
  }
  void d10Sound(const std::uint8_t*, std::uint64_t) override { ++soundCount; }

  std::vector<MXFD10SystemInformation> systems;
  ByteVector pictures;
  std::size_t pictureCount = 0;
  std::size_t soundCount = 0;
};

void parseEssence(const Capture& capture, D10Collector& d10, RecordingErrorHandler& errors) {
  for (const Partition& partition : capture.partitions) {
    if (partition.essence.empty()) continue;
    MXFD10EssenceParser parser(&d10);
    parser.setErrorHandler(&errors);
    readThrough(partition.essence, parser);
  }
}

const MXFIndexTableSegment* constantRateSegment(const Capture& capture) {
  for (const Partition& partition : capture.partitions)
    for (const MXFIndexTableSegment& segment : partition.segments)
      if (segment.editUnitByteCount != 0) return &segment;
  return nullptr;
}

void rewriteThroughD10(const ByteVector& essence, KLVHandler* handler) {
  MXFD10EssenceCoder coder(handler);
  MXFD10EssenceParser parser(&coder);
  readThrough(essence, parser);
}

// The ranges where two octet strings differ, as "offset+length".
std::vector<std::string> differingRanges(const ByteVector& a, const ByteVector& b) {
  std::vector<std::string> ranges;
  const std::size_t common = std::min(a.size(), b.size());
  for (std::size_t i = 0; i < common;) {
    if (a[i] == b[i]) {
      ++i;
      continue;
    }
    std::size_t end = i;
    while (end < common && a[end] != b[end]) ++end;
    ranges.push_back(std::to_string(i) + "+" + std::to_string(end - i));
    i = end;
  }
  if (a.size() != b.size()) ranges.push_back("sizes " + std::to_string(a.size()) + " and " + std::to_string(b.size()));
  return ranges;
}

// The version octets of the fill keys that differ from the coder's fill key,
// as "offset+1" within the essence container.
std::vector<std::string> otherFillKeyVersions(const ByteVector& essence) {
  class Fills : public DullKLVHandler {
  public:
    explicit Fills(const ByteVector& bytes) : bytes_(bytes) {}
    void setLocator(Locator* locator) override { locator_ = locator; }
    bool startIndividualItem(const KLVKey& key, std::uint64_t, std::uint8_t*&) override {
      // Key equality leaves the version octet out.
      if (key != KLVFillItemKey || key[7] == KLVFillItemKey[7]) return false;
      // The locator stands past the length, whose size the writer chose.
      const std::size_t value = static_cast<std::size_t>(std::streamoff(locator_->getPosition()));
      for (std::size_t start = value - 17; start + 25 >= value; --start)
        if (std::equal(key.data(), key.data() + KLVKey::size(), bytes_.begin() + start)) {
          ranges.push_back(std::to_string(start + 7) + "+1");
          break;
        }
      return false;
    }
    std::vector<std::string> ranges;

  private:
    const ByteVector& bytes_;
    Locator* locator_ = nullptr;
  } fills(essence);
  readThrough(essence, fills);
  return fills.ranges;
}

}  // namespace

TEST(MXFD10Interop, ParametersOfTheLabelGiveTheFilesOwnEditUnitSizeAndDeltaEntries) {
  for (const D10File& file : d10Files) {
    SCOPED_TRACE(file.name);
    Capture capture;
    captureFile(file.name, capture);
    D10Collector d10;
    RecordingErrorHandler errors;
    parseEssence(capture, d10, errors);
    ASSERT_EQ(d10.systems.size(), file.editUnits);
    const std::unique_ptr<MXFD10Parameters> parameters = createMXFD10Parameters(d10.systems.front().essenceContainer);
    const MXFIndexTableSegment* own = constantRateSegment(capture);
    ASSERT_NE(own, nullptr);
    const MXFIndexTableSegment segment = createMXFD10IndexSegment(*parameters, own->indexSID, own->bodySID);
    EXPECT_EQ(segment.editUnitByteCount, file.editUnitByteCount);
    EXPECT_EQ(segment.editUnitByteCount, own->editUnitByteCount);
    EXPECT_EQ(segment.deltaEntryArray, own->deltaEntryArray);
    EXPECT_EQ(segment.deltaEntryArray.back().elementDelta, file.pictureDelta);
    EXPECT_EQ(segment.indexEditRate, own->indexEditRate);
  }
}

TEST(MXFD10Interop, PicturesOfTheParserHaveTheChecksumThatAnotherToolPrinted) {
  for (const D10File& file : d10Files) {
    SCOPED_TRACE(file.name);
    Capture capture;
    captureFile(file.name, capture);
    D10Collector d10;
    RecordingErrorHandler errors;
    parseEssence(capture, d10, errors);
    EXPECT_EQ(reportLines(errors), std::vector<std::string>());
    EXPECT_EQ(d10.pictureCount, file.editUnits);
    EXPECT_EQ(d10.soundCount, file.editUnits);
    EXPECT_EQ(md5Hex(d10.pictures), file.pictureMD5);
  }
}

TEST(MXFD10Interop, EssenceContainerWrittenAgainThroughTheD10CoderIsTheSameOctets) {
  for (const D10File& file : d10Files) {
    SCOPED_TRACE(file.name);
    Capture original;
    captureFile(file.name, original);
    const ByteVector bytes = rewrap(original, rewriteThroughD10);
    Capture again;
    util::vector_istream in(bytes);
    capture(in, again);
    EXPECT_EQ(reportLines(again.errors), std::vector<std::string>());
    ASSERT_EQ(again.partitions.size(), original.partitions.size());
    std::size_t essenceOctets = 0;
    for (std::size_t i = 0; i < original.partitions.size(); ++i) {
      SCOPED_TRACE(i);
      essenceOctets += original.partitions[i].essence.size();
      const ByteVector& essence = original.partitions[i].essence;
      const std::vector<std::string> expected = file.otherFillKeyVersion && !essence.empty()
                                                    ? otherFillKeyVersions(essence)
                                                    : std::vector<std::string>();
      EXPECT_EQ(differingRanges(again.partitions[i].essence, essence), expected);
      if (file.otherFillKeyVersion && !essence.empty()) {
        EXPECT_FALSE(expected.empty());
      }
    }
    EXPECT_EQ(essenceOctets, file.editUnits * file.editUnitByteCount);
  }
}
