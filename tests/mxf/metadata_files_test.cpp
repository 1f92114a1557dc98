// Header metadata of files written by other tools, read as primed sets
// through the splitter, checked against independent dumps, and coded and
// parsed again.
#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/klv_output.h"
#include "support/mxf_primed_sets.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

struct Partition {
  MXFPrimerEntries primer;
  std::vector<MXFPrimedSet> sets;
  bool ended = false;
};

// One entry of partitions per metadata stream.
class PartitionCollector : public MXFMetadataHandler {
 public:
  void start() override { partitions.emplace_back(); }
  void end() override { partitions.back().ended = true; }
  void primer(const MXFPrimerEntries& entries) override { partitions.back().primer = entries; }
  bool acceptSet(const KLVKey&) override { return true; }
  void primedSet(const MXFPrimedSet& set) override { partitions.back().sets.push_back(set); }

  std::vector<Partition> partitions;
};

struct FileRead {
  PartitionCollector collector;
  RecordingErrorHandler errors;
  std::string failure;  // the text of the error that stopped the read, or "no failure"
};

void readHeaderMetadata(const std::string& name, FileRead& result) {
  MXFMetadataParser parser(&result.collector);
  parser.setErrorHandler(&result.errors);
  DullMXFStructureHandler structure;
  DullKLVHandler index;
  DullKLVHandler essence;
  MXFSplitter splitter(&structure, &parser, &index, &essence, false);
  splitter.setErrorHandler(&result.errors);
  std::ifstream in(dataPath(name), std::ios::binary);
  ASSERT_TRUE(in.good()) << name;
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  reader.setErrorHandler(&result.errors);
  result.failure = runtimeErrorTextOf([&] { reader.read(in); });
}

// A structural set key by its octet 14.
KLVKey setKey(std::uint8_t octet14) {
  KLVKey key = keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 00 00");
  key[14] = octet14;
  return key;
}

std::map<KLVKey, int> countsOf(const Partition& partition) {
  std::map<KLVKey, int> counts;
  for (const MXFPrimedSet& set : partition.sets) ++counts[set.key];
  return counts;
}

// The value of a property of the first set of a key.
ByteVector valueOf(const Partition& partition, std::uint8_t setOctet14, const char* property) {
  for (const MXFPrimedSet& set : partition.sets)
    if (set.key == setKey(setOctet14)) return set.properties.at(keyOf(property));
  return bytesOf("DEAD");
}

const char* const versionKey = "06 0E 2B 34 01 01 01 02 03 01 02 01 05 00 00 00";
const char* const companyNameKey = "06 0E 2B 34 01 01 01 02 05 20 07 01 02 01 00 00";
const char* const productNameKey = "06 0E 2B 34 01 01 01 02 05 20 07 01 03 01 00 00";
const char* const storedWidthKey = "06 0E 2B 34 01 01 01 01 04 01 05 02 02 00 00 00";
const char* const storedHeightKey = "06 0E 2B 34 01 01 01 01 04 01 05 02 01 00 00 00";

// The sets of a DV file with two sound tracks, common to the three writers:
// Preface, Identification, ContentStorage, EssenceContainerData, the two
// packages, eight tracks with their sequences, six source clips, two
// timecode components, a multiple descriptor and a CDCI descriptor.
std::map<KLVKey, int> dvCounts(std::uint8_t soundDescriptorOctet14) {
  return {{setKey(0x2F), 1},
          {setKey(0x30), 1},
          {setKey(0x18), 1},
          {setKey(0x23), 1},
          {setKey(0x36), 1},
          {setKey(0x37), 1},
          {setKey(0x3B), 8},
          {setKey(0x0F), 8},
          {setKey(0x11), 6},
          {setKey(0x14), 2},
          {setKey(0x44), 1},
          {setKey(0x28), 1},
          {setKey(soundDescriptorOctet14), 2}};
}

const std::vector<const char*> filesThatReadToTheEnd{"bmx_d10_50m_625_8ch24.mxf",
                                                     "bmx_op1a_dv25_625_bodypart_part4.mxf",
                                                     "bmx_op1a_dv25_625_singlepass.mxf",
                                                     "damaged_no_rip.mxf",
                                                     "damaged_truncated_50pct.mxf",
                                                     "ffmpeg_d10_50m_625_noaudio.mxf",
                                                     "ffmpeg_dv25_625_420_2mono.mxf",
                                                     "ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
                                                     "ffmpeg_opatom_dv25_625_v1.mxf",
                                                     "gst_dv25_625_420_2mono.mxf",
                                                     "gst_h264_high_longgop_1080p25_2mono.mxf"};

class MetadataFiles : public ::testing::TestWithParam<const char*> {};

// Codes a partition's primer and sets and parses the octets again.
Partition roundTrip(const Partition& partition, RecordingErrorHandler& errors) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFMetadataCoder coder(&writer);
  coder.start();
  coder.primer(partition.primer);
  for (const MXFPrimedSet& set : partition.sets) coder.primedSet(set);
  coder.end();
  PartitionCollector collector;
  MXFMetadataParser parser(&collector);
  parser.setErrorHandler(&errors);
  readThrough(klv::outputOf(out), parser, &errors);
  check(collector.partitions.size() == 1, "one stream");
  return collector.partitions[0];
}

}  // namespace

TEST_P(MetadataFiles, HeaderMetadataArrivesAsPrimedSets) {
  FileRead read;
  readHeaderMetadata(GetParam(), read);
  EXPECT_EQ("no failure", read.failure);
  ASSERT_FALSE(read.collector.partitions.empty());
  for (const Partition& partition : read.collector.partitions) {
    EXPECT_TRUE(partition.ended);
    EXPECT_FALSE(partition.primer.empty());
    ASSERT_FALSE(partition.sets.empty());
    EXPECT_EQ(1, countsOf(partition)[setKey(0x2F)]);
  }
  for (const Report& report : read.errors.reports) EXPECT_EQ("warning", report.severity) << report.message;
}

TEST_P(MetadataFiles, CodedAndParsedAgainGivesTheSamePrimerAndSets) {
  FileRead read;
  readHeaderMetadata(GetParam(), read);
  for (const Partition& partition : read.collector.partitions) {
    RecordingErrorHandler errors;
    Partition again = roundTrip(partition, errors);
    ASSERT_EQ(partition.primer.size(), again.primer.size());
    for (std::size_t i = 0; i < partition.primer.size(); ++i) {
      EXPECT_EQ(partition.primer[i].tag, again.primer[i].tag) << i;
      // The version octet too: keys are written as they came.
      EXPECT_EQ(partition.primer[i].key.octets(), again.primer[i].key.octets()) << i;
    }
    ASSERT_EQ(partition.sets.size(), again.sets.size());
    for (std::size_t i = 0; i < partition.sets.size(); ++i) {
      EXPECT_EQ(partition.sets[i].key.octets(), again.sets[i].key.octets()) << i;
      EXPECT_EQ(partition.sets[i].properties, again.sets[i].properties) << i;
    }
    // Every length is now in four octets and every item length in two.
    for (const Report& report : errors.reports) EXPECT_NE(nonStandardCodingId, report.identifier) << report.message;
  }
}

INSTANTIATE_TEST_SUITE_P(OtherTools, MetadataFiles, ::testing::ValuesIn(filesThatReadToTheEnd));

// Expectations from ffmpeg/dv25_625_420_2mono.mxf.mxfdump.txt: metadata in
// the header partition only, a primer of 100 entries, 34 sets.
TEST(MetadataFiles, FfmpegSetsAndValuesAgreeWithTheDump) {
  FileRead read;
  readHeaderMetadata("ffmpeg_dv25_625_420_2mono.mxf", read);
  ASSERT_EQ(1u, read.collector.partitions.size());
  const Partition& header = read.collector.partitions[0];
  EXPECT_EQ(100u, header.primer.size());
  EXPECT_EQ(34u, header.sets.size());
  EXPECT_EQ(dvCounts(0x47), countsOf(header));
  EXPECT_EQ(bytesOf("01 03"), valueOf(header, 0x2F, versionKey));
  EXPECT_EQ(bytesOf("00 46 00 46 00 6d 00 70 00 65 00 67 00 00"), valueOf(header, 0x30, companyNameKey));
  EXPECT_EQ(bytesOf("00 4f 00 50 00 31 00 61 00 20 00 4d 00 75 00 78 00 65 00 72 00 00"),
            valueOf(header, 0x30, productNameKey));
  EXPECT_EQ(bytesOf("00 00 02 d0"), valueOf(header, 0x28, storedWidthKey));
  EXPECT_EQ(bytesOf("00 00 01 20"), valueOf(header, 0x28, storedHeightKey));
}

// Expectations from gst/dv25_625_420_2mono.mxf.mxfdump.txt: the same 34 sets
// in the header and in the footer, each with a primer of 63 entries.
TEST(MetadataFiles, GstreamerSetsAndValuesAgreeWithTheDump) {
  FileRead read;
  readHeaderMetadata("gst_dv25_625_420_2mono.mxf", read);
  ASSERT_EQ(2u, read.collector.partitions.size());
  for (const Partition& partition : read.collector.partitions) {
    EXPECT_EQ(63u, partition.primer.size());
    EXPECT_EQ(34u, partition.sets.size());
    EXPECT_EQ(dvCounts(0x48), countsOf(partition));
    EXPECT_EQ(bytesOf("01 02"), valueOf(partition, 0x2F, versionKey));
    EXPECT_EQ(bytesOf("00 47 00 53 00 74 00 72 00 65 00 61 00 6d 00 65 00 72"),
              valueOf(partition, 0x30, companyNameKey));
    EXPECT_EQ(bytesOf("00 00 02 d0"), valueOf(partition, 0x28, storedWidthKey));
    EXPECT_EQ(bytesOf("00 00 02 40"), valueOf(partition, 0x28, storedHeightKey));
  }
}

// Expectations from bmx/op1a_dv25_625_singlepass.mxf.mxfdump.txt: 34 sets in
// the open header and in the footer, primers of 71 and 72 entries.
TEST(MetadataFiles, BmxSetsAndValuesAgreeWithTheDump) {
  FileRead read;
  readHeaderMetadata("bmx_op1a_dv25_625_singlepass.mxf", read);
  ASSERT_EQ(2u, read.collector.partitions.size());
  EXPECT_EQ(71u, read.collector.partitions[0].primer.size());
  EXPECT_EQ(72u, read.collector.partitions[1].primer.size());
  for (const Partition& partition : read.collector.partitions) {
    EXPECT_EQ(34u, partition.sets.size());
    EXPECT_EQ(dvCounts(0x48), countsOf(partition));
    EXPECT_EQ(bytesOf("01 03"), valueOf(partition, 0x2F, versionKey));
    EXPECT_EQ(bytesOf("00 42 00 42 00 43 00 00"), valueOf(partition, 0x30, companyNameKey));
    EXPECT_EQ(bytesOf("00 62 00 6d 00 78 00 00"), valueOf(partition, 0x30, productNameKey));
    EXPECT_EQ(bytesOf("00 00 02 d0"), valueOf(partition, 0x28, storedWidthKey));
    EXPECT_EQ(bytesOf("00 00 01 20"), valueOf(partition, 0x28, storedHeightKey));
  }
}

// ffmpeg writes sets and their lengths in the shortest BER form; the form
// is reported at each set where it changed away from four octets.
TEST(MetadataFiles, ShortBERFormsOfFfmpegAreReportedAsWarnings) {
  FileRead read;
  readHeaderMetadata("ffmpeg_d10_50m_625_noaudio.mxf", read);
  ASSERT_FALSE(read.errors.reports.empty());
  for (const Report& report : read.errors.reports) {
    EXPECT_EQ(nonStandardCodingId, report.identifier);
    EXPECT_EQ(0u, report.message.rfind("non-standard BER length form - 0x", 0)) << report.message;
  }
}

// The dump shows two keys of no SMPTE prefix at 5120, right after the
// primer; the read stops there, where the last element ended, and the
// primer has arrived.
TEST(MetadataFiles, AvidOpAtomStopsAfterItsPrimer) {
  FileRead read;
  readHeaderMetadata("bmx_avid_opatom_dv25_625_v1.mxf", read);
  EXPECT_EQ("invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4", read.failure);
  ASSERT_EQ(1u, read.collector.partitions.size());
  EXPECT_TRUE(read.collector.partitions[0].ended);
  EXPECT_EQ(264u, read.collector.partitions[0].primer.size());
  ASSERT_FALSE(read.errors.positions.empty());
  EXPECT_EQ(5120, read.errors.positions.back());
}
