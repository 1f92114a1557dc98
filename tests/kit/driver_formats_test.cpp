// Files of every format that the driver writes, read back through the kit's
// reader: their essence as the source gave it, their edit units of the
// layout's size, no report, and a verifying writer that passes over them.
#include <gtest/gtest.h>

#include <memory>
#include <sstream>
#include <string>

#include "support/kit_masters.h"
#include "support/kit_readers.h"
#include "support/kit_sources.h"

using namespace zelta_test;

namespace {

constexpr MXFRational rate25{25, 1};
constexpr MXFRational rate2997{30000, 1001};
constexpr std::uint64_t unitCount = 3;

struct FormatCase {
  std::string name;
  ZeltaEssenceFormat format;
  MXFRational rate;
  PictureKind picture;
  std::uint32_t channels;
  bool ancillary;
  std::uint32_t bitRate;  // 0: the master's own
  std::size_t soundSize;
  std::uint32_t editUnitByteCount;
};

std::shared_ptr<ZeltaDefaultMetadata> masterFor(const FormatCase& c) {
  std::shared_ptr<ZeltaDefaultMetadata> m =
      masterOf(shapeOf(c.format, c.rate, 0x0103, c.channels > 0, c.ancillary, c.picture));
  if (c.bitRate != 0) m->bitRate = c.bitRate;
  if (c.channels > 0) {
    m->audioChannelCount = c.channels;
    m->audioSamplingRates.resize(c.channels, m->audioSamplingRates.front());
    if (!m->fixedChannelStatusData.empty())
      m->fixedChannelStatusData.resize(c.channels, m->fixedChannelStatusData.front());
  }
  m->origin = 0;
  m->duration = unitCount;
  return m;
}

std::shared_ptr<TestSource> sourceFor(const FormatCase& c) {
  auto source = std::make_shared<TestSource>(masterFor(c), unitCount);
  source->uids = std::make_shared<CountingGenerator>();
  source->pictureSize = 4000;
  source->soundSize = c.soundSize;
  source->dataSize = 64;
  return source;
}

std::string driven(const std::shared_ptr<TestSource>& source) {
  auto out = std::make_shared<std::stringstream>();
  createZeltaDriver(source)->drive(createZeltaWriter(out));
  return out->str();
}

// Sizes by the rules of the layout: an element of V octets takes V + 20,
// and when that is off the 512 grid, 20 more rounded up to it.
const FormatCase cases[] = {
    // 512 + (250000: 250368) + (1920 * 32 + 4: 61952)
    {"D10 50M 625 4ch", ZeltaEssenceFormat::D10, rate25, PictureKind::plain, 4, false, 0, 61444, 312832},
    {"D10 50M 625 8ch", ZeltaEssenceFormat::D10, rate25, PictureKind::plain, 8, false, 0, 61444, 312832},
    // 512 + (150000: 150528) + (61952)
    {"D10 30M 625 4ch", ZeltaEssenceFormat::D10, rate25, PictureKind::plain, 4, false, 30000000, 61444, 212992},
    // 512 + (208541: 208896) + (1602 * 32 + 4: 51712)
    {"D10 50M 525 8ch", ZeltaEssenceFormat::D10, rate2997, PictureKind::plain, 8, false, 0, 51268, 261120},
    // 512 + (144000: 144384) + 2 * (1920 * 2: 4096)
    {"DV 625 2ch", ZeltaEssenceFormat::DV, rate25, PictureKind::plain, 2, false, 0, 3840, 153088},
    // 512 + (120000: 120320) + 2 * (1602 * 2: 3584)
    {"DV 525 2ch", ZeltaEssenceFormat::DV, rate2997, PictureKind::plain, 2, false, 0, 3204, 128000},
    // 512 + (440000000 / 25 / 8 = 2200000: 2200064) + 4 * (1920 * 3: 6144) + (6 * 1920: 11776)
    {"MPEG studio 4ch data", ZeltaEssenceFormat::MPEG, rate25, PictureKind::studio, 4, true, 0, 5760, 2236928},
    // 512 + (10190824 + 24: 10190848) + 4 * 6144 + (11520: 11776)
    {"Raw 801 4ch data", ZeltaEssenceFormat::Raw, rate25, PictureKind::plain, 4, true, 0, 5760, 10227712},
    // 512 + (568832: 569344) + 4 * 6144 + (5612 - 20: 5632)
    {"AVC intra 4ch data", ZeltaEssenceFormat::AVC, rate25, PictureKind::fullSize, 4, true, 0, 5760, 600064},
};

}  // namespace

TEST(DriverFormats, EveryConstantRateFormatReadsBackWithItsEssenceItsLayoutAndNoReport) {
  for (const FormatCase& c : cases) {
    SCOPED_TRACE(c.name);
    auto source = sourceFor(c);
    const std::string bytes = driven(source);
    ReadRecord record;
    readThroughZeltaReader(std::make_shared<std::istringstream>(bytes), record, true);
    EXPECT_EQ(record.failure, "");
    EXPECT_EQ(reportLines(record.errors.reports), std::vector<std::string>{});
    ASSERT_EQ(record.index.segments.size(), 1U);
    EXPECT_EQ(record.index.segments.front().editUnitByteCount, c.editUnitByteCount);
    EXPECT_EQ(record.index.segments.front().indexDuration, static_cast<std::int64_t>(unitCount));
    EXPECT_EQ(record.sdticp.packs.size(), unitCount);

    // Picture first, then sound of each channel and data, as the source
    // numbers them.
    const bool d10 = c.format == ZeltaEssenceFormat::D10;
    const std::size_t perUnit = 1 + (d10 ? 1 : c.channels) + (c.ancillary ? 1 : 0);
    ASSERT_EQ(record.gc.elements.size(), perUnit * unitCount);
    for (std::uint64_t unit = 0; unit < unitCount; ++unit) {
      const std::size_t first = unit * perUnit;
      EXPECT_EQ(record.gc.elements[first].bytes, patternOf(unit, 0, 4000));
      for (std::uint32_t channel = 0; channel < (d10 ? 1 : c.channels); ++channel) {
        EXPECT_EQ(record.gc.elements[first + 1 + channel].bytes, patternOf(unit, d10 ? 1 : 2 + channel, c.soundSize));
      }
      if (c.ancillary) {
        EXPECT_EQ(record.gc.elements[first + perUnit - 1].bytes, patternOf(unit, 100, 64));
      }
    }
  }
}

TEST(DriverFormats, VerifyingWriterPassesOverTheFileAndFailsAtAChangedOctet) {
  for (const FormatCase& c : {cases[0], cases[6]}) {
    SCOPED_TRACE(c.name);
    const std::string bytes = driven(sourceFor(c));
    auto same = std::make_shared<std::stringstream>(bytes, std::ios::in | std::ios::out | std::ios::binary);
    std::shared_ptr<VerifyingZeltaWriter> verifier = createVerifyingZeltaWriter(same);
    verifier->setVerifying(true);
    EXPECT_NO_THROW(createZeltaDriver(sourceFor(c))->drive(verifier));
    EXPECT_EQ(same->str(), bytes);

    // The key of the first system item, which follows the header's 512
    // octets of pack, its metadata and its 512 of index.
    std::string changed = bytes;
    const std::size_t at =
        bytes.find(std::string("\x06\x0E\x2B\x34\x02\x05\x01\x01\x0D\x01\x03\x01\x04\x01\x01\x00", 16));
    ASSERT_NE(at, std::string::npos);
    changed[at + 3] = static_cast<char>(changed[at + 3] ^ 0x01);
    auto other = std::make_shared<std::stringstream>(changed, std::ios::in | std::ios::out | std::ios::binary);
    std::shared_ptr<VerifyingZeltaWriter> failing = createVerifyingZeltaWriter(other);
    failing->setVerifying(true);
    EXPECT_THROW(createZeltaDriver(sourceFor(c))->drive(failing), VerifyingKLVHandler::exception);
  }
}
