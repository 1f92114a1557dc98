// Each rule of the kit's structure, index and system validators broken once
// in a small file made for it, read through createZeltaReader with an error
// handler: exactly the rule's report comes, once. The file that keeps every
// rule gives none. (The rules on the timeline's edit rate, the start
// timecode and the user stamps' values take their values from the header
// metadata, which the metadata validator will hand over; the unit tests of
// the cross validator break them.)
#include <gtest/gtest.h>

#include <cstdio>
#include <functional>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "kit.h"
#include "kit/validators/container_labels.h"
#include "support/kit_readers.h"
#include "support/mxf_index_segments.h"
#include "support/mxf_primed_sets.h"
#include "support/mxf_streams.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

typedef std::vector<std::string> Lines;

constexpr std::uint32_t kag = 512;

// One partition of a file: its key's kind and status, its pack (offsets and
// byte counts are filled in), index segments and essence.
struct PartitionSpec {
  std::uint8_t kind;
  std::uint8_t status;
  MXFPartitionPack pack;
  ByteVector index;
  ByteVector essence;
};

struct FileSpec {
  std::vector<PartitionSpec> partitions;
  bool randomIndex = true;
};

ByteVector padded(ByteVector bytes, std::uint64_t unit) {
  const std::uint64_t rest = bytes.size() % unit;
  if (rest == 0) return bytes;
  std::uint64_t fill = unit - rest;
  if (fill < 20) fill += unit;
  return concat({bytes, fillItem(fill)});
}

MXFPartitionPack packOf(std::uint32_t bodySID, std::uint32_t indexSID, const std::vector<KLVKey>& containers) {
  MXFPartitionPack pack;
  pack.kagSize = kag;
  pack.bodySID = bodySID;
  pack.indexSID = indexSID;
  pack.operationalPattern = op1aLabel;
  pack.essenceContainers = containers;
  return pack;
}

// A system item whose pack says, by its bitmap, whether a user stamp is
// present.
ByteVector systemItem(std::uint8_t bitmap) {
  ByteVector pack(MXFSDTICPSystemMetadataPackLength, 0);
  pack[0] = bitmap;
  pack[1] = 0x04;
  return element(MXFSDTICPSystemMetadataPackKey, pack);
}

ByteVector segment(std::uint32_t bodySID, std::uint32_t indexSID, const std::string& rate) {
  SpelledItems items = requiredItems(0, 2);
  for (auto& item : items) {
    if (item.first == 0x3F07) item.second = bytesOf("00 00 00 0" + std::to_string(bodySID));
    if (item.first == 0x3F0B) item.second = bytesOf(rate);
  }
  items.push_back({0x3F06, bytesOf("00 00 00 0" + std::to_string(indexSID))});
  return padded(segmentBytes(items), kag);
}

// An MPEG file that keeps every rule: a closed header with the labels, a
// body partition of stream 1 with two edit units, a footer with the index
// of stream 2, and a random index.
FileSpec goodFile() {
  FileSpec file;
  file.partitions.push_back({2, 4, packOf(0, 0, {mpegLabel}), {}, {}});
  file.partitions.push_back({3, 4, packOf(1, 0, {mpegLabel}), {}, concat({systemItem(0x5C), systemItem(0x5C)})});
  file.partitions.push_back({4, 4, packOf(0, 2, {mpegLabel}), segment(1, 2, "00 00 00 19 00 00 00 01"), {}});
  return file;
}

ByteVector fileBytes(const FileSpec& spec) {
  std::vector<ByteVector> parts;
  std::vector<std::uint64_t> offsets;
  std::uint64_t offset = 0;
  for (const PartitionSpec& p : spec.partitions) {
    offsets.push_back(offset);
    const std::uint64_t packSize = 16 + 4 + packValue(p.pack).size();
    offset += padded(ByteVector(packSize), kag).size() + p.index.size() + padded(p.essence, kag).size();
  }
  const std::uint64_t footer = offsets.back();
  ByteVector file;
  std::vector<std::pair<std::uint32_t, std::uint64_t>> entries;
  for (std::size_t i = 0; i < spec.partitions.size(); ++i) {
    PartitionSpec p = spec.partitions[i];
    p.pack.thisPartition = offsets[i];
    p.pack.previousPartition = i == 0 ? 0 : offsets[i - 1];
    p.pack.footerPartition = footer;
    p.pack.indexByteCount = p.index.size();
    const ByteVector pack = padded(partitionPack(p.kind, p.status, p.pack), kag);
    file = concat({file, pack, p.index, p.essence.empty() ? ByteVector() : padded(p.essence, kag)});
    entries.push_back({p.pack.bodySID, offsets[i]});
  }
  if (spec.randomIndex) file = concat({file, randomIndexPack(entries)});
  return file;
}

// What the kit's validators report, as "severity NN text".
// The system side of a read: the SDTI-CP handler, which has a validator, or
// handlers of the generic container and the proxy, which have none.
enum class SystemSide { sdticp, structureAndProxy };

Lines findingsOf(const FileSpec& spec, SystemSide system = SystemSide::sdticp) {
  const ByteVector bytes = fileBytes(spec);
  auto input = std::make_shared<std::istringstream>(std::string(bytes.begin(), bytes.end()));
  ReadRecord record;
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(input);
  reader->setStructureHandler(borrowed<MXFStructureHandler>(record.structure));
  reader->setIndexHandler(borrowed<MXFIndexHandler>(record.index));
  if (system == SystemSide::sdticp) {
    reader->setSDTICPHandler(borrowed<MXFSDTICPSystemHandler>(record.sdticp));
  } else {
    reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(record.gc));
    reader->setProxyHandler(borrowed<MXFQMProxySystemHandler>(record.proxy));
  }
  reader->setErrorHandler(borrowed<ErrorHandler>(record.errors));
  reader->read();
  EXPECT_FALSE(record.index.segments.empty());
  return kitFindings(record.errors.reports);
}

FileSpec changed(const std::function<void(FileSpec&)>& change) {
  FileSpec file = goodFile();
  change(file);
  return file;
}

void setContainers(FileSpec& file, const std::vector<KLVKey>& containers) {
  for (PartitionSpec& p : file.partitions) p.pack.essenceContainers = containers;
}

TEST(RuleFiles, FileThatKeepsEveryRuleHasNoFinding) { EXPECT_EQ(findingsOf(goodFile()), Lines{}); }

TEST(RuleFiles, UnsupportedEssenceContainers) {
  // No label at all: no picture, and none left over.
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { setContainers(f, {}); })),
            Lines{"error 02 unsupported essenceContainers value"});
  // An unknown label is also one left over.
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { setContainers(f, {unknownPictureLabel}); })),
            (Lines{"error 02 unsupported essenceContainers value", "error 02 unexpected essenceContainers value"}));
}

TEST(RuleFiles, UnexpectedEssenceContainers) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              f.partitions[2].pack.essenceContainers = {mpegLabel, aes3Label};
            })),
            Lines{"error 02 unexpected essenceContainers value"});
}

TEST(RuleFiles, MissingMultipleEssenceLabel) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              setContainers(f, {mpegLabel, aes3Label});
            })),
            Lines{"warning 02 unexpected essenceContainers value (missing MULTIPLE_ESSENCE)"});
}

TEST(RuleFiles, UnsupportedOperationalPattern) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[0].pack.operationalPattern = opAtomLabel; })),
            Lines{"error 02 unsupported operationalPattern value"});
}

TEST(RuleFiles, UnexpectedBodyPartition) {
  // D-10 keeps its essence in the header partition, which names its streams.
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              setContainers(f, {d10Label});
              f.partitions[0].pack.bodySID = 1;
              f.partitions[0].pack.indexSID = 2;
              f.partitions[2].pack.indexSID = 0;
              f.partitions[2].index = segment(1, 2, "00 00 00 19 00 00 00 01");
            })),
            Lines{"error 03 unexpected body partition"});
}

TEST(RuleFiles, UnexpectedFooterPartition) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              PartitionSpec second = f.partitions[2];
              second.index.clear();
              second.pack.indexSID = 0;
              f.partitions.push_back(second);
            })),
            Lines{"error 03 unexpected footer partition"});
}

TEST(RuleFiles, OpenOrIncompletePartitionStatus) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[0].status = 3; })),
            Lines{"warning 04 open or incomplete partition status"});
}

TEST(RuleFiles, MissingFooterPartition) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              f.partitions[1].index = f.partitions[2].index;
              f.partitions[1].pack.indexSID = 2;
              f.partitions.pop_back();
            })),
            Lines{"error 05 missing footer partition"});
}

TEST(RuleFiles, MissingRandomIndex) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.randomIndex = false; })), Lines{"error 06 missing random index"});
}

TEST(RuleFiles, UnsupportedKAG) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[1].pack.kagSize = 256; })),
            Lines{"error 07 unsupported KAG value"});
}

TEST(RuleFiles, IncorrectKLVAlignment) {
  // The body partition stands at 512, off a grid of 1024.
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[1].pack.kagSize = 1024; })),
            Lines{"error 07 incorrect KLV alignment"});
}

TEST(RuleFiles, UnsupportedHeaderByteCount) {
  // Five MiB of header metadata, all fill.
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              f.partitions[0].pack.headerByteCount = 0x500000;
              f.partitions[0].essence = fillItem(0x500000);
            })),
            Lines{"error 08 unsupported headerByteCount value"});
}

TEST(RuleFiles, NonZeroHeaderByteCountOfABody) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              f.partitions[1].essence = concat({fillItem(512), f.partitions[1].essence});
              f.partitions[1].pack.headerByteCount = 512;
            })),
            Lines{"warning 08 non-zero headerByteCount value"});
}

TEST(RuleFiles, UnexpectedBodySID) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[2].index = segment(3, 2, "00 00 00 19 00 00 00 01"); })),
            Lines{"error 09 unexpected bodySID value"});
}

TEST(RuleFiles, UnexpectedIndexSID) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[2].index = segment(1, 3, "00 00 00 19 00 00 00 01"); })),
            Lines{"error 0A unexpected indexSID value"});
}

TEST(RuleFiles, NonZeroIndexSIDInTheFooterOfAClosedD10Header) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              setContainers(f, {d10Label});
              f.partitions[0].pack.bodySID = 1;
              f.partitions[0].pack.indexSID = 2;
              f.partitions[0].essence = f.partitions[1].essence;
              f.partitions.erase(f.partitions.begin() + 1);
            })),
            Lines{"warning 0A non-zero indexSID value"});
}

TEST(RuleFiles, UnsupportedIndexEditRate) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) { f.partitions[2].index = segment(1, 2, "00 00 00 07 00 00 00 01"); })),
            Lines{"error 0C unsupported indexEditRate value"});
}

TEST(RuleFiles, UnexpectedIndexEditRate) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              f.partitions[1].index = segment(1, 2, "00 00 00 19 00 00 00 01");
              f.partitions[2].index = segment(1, 2, "00 00 00 32 00 00 00 01");
            })),
            Lines{"error 0C unexpected indexEditRate value"});
}

TEST(RuleFiles, UserStampNotPresent) {
  EXPECT_EQ(findingsOf(changed([](FileSpec& f) {
              f.partitions[1].essence = concat({systemItem(0x4C), systemItem(0x4C)});
            })),
            Lines{"warning 0E user stamp not present"});
}

// The file whose system items say that they hold no user stamp: read with
// the generic container's structure handler and a proxy handler, but no
// SDTI-CP handler, nothing validates the system items.
TEST(RuleFiles, GCStructureAndProxyHandlersHaveNoSystemValidation) {
  const FileSpec file = changed([](FileSpec& f) {
    f.partitions[1].essence = concat({systemItem(0x4C), systemItem(0x4C)});
  });
  EXPECT_EQ(findingsOf(file, SystemSide::structureAndProxy), Lines{});
  EXPECT_EQ(findingsOf(file), Lines{"warning 0E user stamp not present"});
}

}  // namespace
