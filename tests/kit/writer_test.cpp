// The kit's writer: the events that the kit's reader delivers, handed to the
// writer's handlers, make a file that reads back to the same events; the
// verifying writer passes over that file and fails at an octet changed.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "core/failure.h"
#include "kit.h"
#include "kit/fill_item_key_mode.h"
#include "support/kit_masters.h"
#include "support/kit_readers.h"
#include "support/model_reading.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// The partition offsets are the writer's to decide: a pack that names the
// footer's place in the file that was read may not name it in the copy.
class FooterOffsetCleared : public MXFStructureHandler {
 public:
  explicit FooterOffsetCleared(MXFStructureHandler* handler) : handler_(handler) {}
  void setRunIn(std::uint32_t runIn) override { handler_->setRunIn(runIn); }
  void startStream() override { handler_->startStream(); }
  void endStream(bool aborted) override { handler_->endStream(aborted); }
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override {
    MXFPartitionPack cleared = pack;
    cleared.footerPartition = 0;
    handler_->startPartition(key, cleared, packLength);
  }
  void endPartition(const KLVKey& key) override { handler_->endPartition(key); }
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override { handler_->randomIndex(entries); }

 private:
  MXFStructureHandler* handler_;
};

// The reader's events straight into the writer's handlers.
void pipe(std::shared_ptr<std::istream> input, ZeltaWriter& writer) {
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(input);
  reader->setStructureHandler(std::make_shared<FooterOffsetCleared>(writer.getStructureHandler()));
  reader->setMetadataHandler(borrowed(*writer.getMetadataHandler()));
  reader->setIndexHandler(borrowed(*writer.getIndexHandler()));
  reader->setGCStructureHandler(borrowed(*writer.getGCStructureHandler()));
  reader->setSDTICPHandler(borrowed(*writer.getSDTICPHandler()));
  reader->setProxyHandler(borrowed(*writer.getProxyHandler()));
  reader->setEssenceHandler(borrowed(*writer.getEssenceHandler()));
  reader->read();
}

std::shared_ptr<std::istream> fileStream(const std::string& name) {
  return std::make_shared<std::ifstream>(dataPath(name), std::ios::binary);
}

std::shared_ptr<std::istream> memoryStream(const std::string& bytes) {
  return std::make_shared<std::istringstream>(bytes);
}

// The file rewritten through the writer.
std::string rewritten(const std::string& name) {
  auto out = std::make_shared<std::ostringstream>();
  std::shared_ptr<ZeltaWriter> writer = createZeltaWriter(out);
  pipe(fileStream(name), *writer);
  return out->str();
}

ReadRecord readBack(const std::string& bytes) {
  ReadRecord record;
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(memoryStream(bytes));
  reader->setStructureHandler(borrowed<MXFStructureHandler>(record.structure));
  reader->setMetadataHandler(borrowed<ZeltaMetadataHandler>(record.metadata));
  reader->setIndexHandler(borrowed<MXFIndexHandler>(record.index));
  reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(record.gc));
  reader->setSDTICPHandler(borrowed<MXFSDTICPSystemHandler>(record.sdticp));
  reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(record.gc));
  reader->read();
  return record;
}

// Files whose metadata the kit codes again within the space that their
// partitions give it.
const char* const files[] = {"ffmpeg_d10_50m_525_4ch16.mxf", "ffmpeg_d10_50m_625_noaudio.mxf",
                             "bmx_d10_50m_625_8ch24.mxf", "ffmpeg_dv25_625_420_2mono.mxf",
                             "ffmpeg_h264_high_longgop_1080p25_2mono.mxf"};

TEST(Writer, ReaderEventsWrittenReadBackToTheSameEvents) {
  for (const char* name : files) {
    SCOPED_TRACE(name);
    ReadRecord original;
    readThroughZeltaReader(dataPath(name), original, false);
    const std::string bytes = rewritten(name);
    const ReadRecord copy = readBack(bytes);
    EXPECT_EQ(copy.structure.events, original.structure.events);
    ASSERT_EQ(copy.metadata.models.size(), original.metadata.models.size());
    ZeltaMetadataFactory factory;
    for (std::size_t i = 0; i < copy.metadata.models.size(); ++i)
      EXPECT_EQ(modelDifference(original.metadata.models[i], copy.metadata.models[i], factory), "");
    EXPECT_TRUE(copy.index.segments == original.index.segments);
    EXPECT_EQ(copy.gc.events, original.gc.events);
    ASSERT_EQ(copy.gc.elements.size(), original.gc.elements.size());
    for (std::size_t i = 0; i < copy.gc.elements.size(); ++i)
      EXPECT_EQ(copy.gc.elements[i].bytes, original.gc.elements[i].bytes);
    EXPECT_EQ(copy.sdticp.events, original.sdticp.events);
  }
}

TEST(Writer, EmptyMetadataFactoryKeepsTheWriterUsableWithAFreshDefault) {
  auto out = std::make_shared<std::ostringstream>();
  std::shared_ptr<ZeltaWriter> writer = createZeltaWriter(out);
  writer->setMetadataFactory(nullptr);
  pipe(fileStream(files[0]), *writer);
  EXPECT_EQ(readBack(out->str()).metadata.models.size(), 1u);
}

TEST(Writer, PackageItemOfZeroBytesWritesTheKeyAndAFourOctetZeroLength) {
  auto out = std::make_shared<std::ostringstream>();
  std::shared_ptr<ZeltaWriter> writer = createZeltaWriter(out);
  ZeltaMetadataHandler& metadata = *writer->getMetadataHandler();
  MXFStructureHandler& structure = *writer->getStructureHandler();
  MasterShape shape;
  shape.format = ZeltaEssenceFormat::D10;
  shape.editRate = {25, 1};
  MXFPartitionPack pack;
  pack.kagSize = 512;
  pack.headerByteCount = 65536;
  pack.operationalPattern = keyOf("06 0E 2B 34 04 01 01 01 0D 01 02 01 01 01 09 00");
  structure.startStream();
  structure.startPartition(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 02 04 00"), pack, 0);
  metadata.start();
  metadata.model({createZeltaMetadataModel(masterOf(shape))});
  metadata.packageItem(nullptr, 0);
  metadata.end();
  structure.endPartition(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 02 04 00"));
  MXFPartitionPack footer = pack;
  footer.headerByteCount = 0;
  structure.startPartition(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 04 04 00"), footer, 0);
  structure.endPartition(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 04 04 00"));
  structure.randomIndex({});
  structure.endStream(false);
  const std::string bytes = out->str();
  const std::string item("\x06\x0E\x2B\x34\x01\x01\x01\x05\x03\x01\x02\x20\x01\x00\x00\x00\x83\x00\x00\x00", 20);
  EXPECT_NE(bytes.find(item), std::string::npos);
  // The reader hands it back as an item of size 0, as it meets it; the model
  // comes when the metadata ends.
  const ReadRecord record = readBack(bytes);
  EXPECT_EQ(record.metadata.events, (std::vector<std::string>{"start", "packageItem 0", "model 1", "end"}));
}

TEST(Writer, VerifyingWriterOnAStreamThatCannotBeReadFailsAtTheFirstItemCompared) {
  auto stream = std::make_shared<std::stringstream>(std::ios::out);
  std::shared_ptr<VerifyingZeltaWriter> writer;
  ASSERT_NO_THROW(writer = createVerifyingZeltaWriter(stream));
  writer->setVerifying(true);
  MXFPartitionPack pack;
  writer->getStructureHandler()->startStream();
  EXPECT_THROW(
      writer->getStructureHandler()->startPartition(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 02 04 00"), pack, 0),
      std::exception);
}

TEST(Writer, VerifyingAFileAgainstTheEventsThatWroteItPassesAndChangesNoOctet) {
  for (const char* name : files) {
    SCOPED_TRACE(name);
    const std::string bytes = rewritten(name);
    auto stream = std::make_shared<std::stringstream>(bytes, std::ios::in | std::ios::out | std::ios::binary);
    std::shared_ptr<VerifyingZeltaWriter> writer = createVerifyingZeltaWriter(stream);
    writer->setVerifying(true);
    EXPECT_NO_THROW(pipe(fileStream(name), *writer));
    EXPECT_EQ(stream->str(), bytes);
  }
}

// The verifier compares keys and lengths: an octet of the header partition
// pack's key, or of its length, changed.
TEST(Writer, VerifyingFailsAtAChangedKeyOrLength) {
  const std::string bytes = rewritten(files[0]);
  for (std::size_t at : {std::size_t(12), std::size_t(19)}) {
    SCOPED_TRACE(at);
    std::string changed = bytes;
    changed[at] = static_cast<char>(changed[at] ^ 0x01);
    auto stream = std::make_shared<std::stringstream>(changed, std::ios::in | std::ios::out | std::ios::binary);
    std::shared_ptr<VerifyingZeltaWriter> writer = createVerifyingZeltaWriter(stream);
    writer->setVerifying(true);
    EXPECT_THROW(pipe(fileStream(files[0]), *writer), VerifyingKLVHandler::exception);
  }
}

// Older MPEG files write their fill items under the key of registry
// version 2; the header partition decides, once.
TEST(WriterFillItemKeyMode, OlderMPEGHeaderWithMetadataChoosesTheSecondKeyForm) {
  const KLVKey header = keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 02 04 00");
  const KLVKey body = keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 03 04 00");
  MXFPartitionPack mpeg;
  mpeg.minorVersion = 2;
  mpeg.headerByteCount = 512;
  mpeg.essenceContainers = {keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 60 01")};
  struct Case {
    KLVKey key;
    std::uint16_t minorVersion;
    std::uint64_t headerByteCount;
    std::uint8_t expected;
  };
  for (const Case& c :
       {Case{header, 2, 512, 2}, Case{header, 3, 512, 0}, Case{header, 2, 0, 0}, Case{body, 2, 512, 0}}) {
    std::ostringstream stream;
    RecordingStructureHandler next;
    FillItemKeyModeStructureFilter filter(&next, stream);
    MXFPartitionPack pack = mpeg;
    pack.minorVersion = c.minorVersion;
    pack.headerByteCount = c.headerByteCount;
    filter.startPartition(c.key, pack, 0);
    EXPECT_EQ(getFillItemKeyVersion(stream), c.expected);
    EXPECT_EQ(next.packs.size(), 1u);
  }
  // A mode that the stream has already stays.
  std::ostringstream stream;
  setFillItemKeyVersion(stream, 1);
  RecordingStructureHandler next;
  FillItemKeyModeStructureFilter filter(&next, stream);
  filter.startPartition(header, mpeg, 0);
  EXPECT_EQ(getFillItemKeyVersion(stream), 1);
}

TEST(Writer, MissingStreamsFailAtCreation) {
  EXPECT_EQ(failureOf([] { createZeltaWriter(nullptr); }), "assertion failure: output stream is present");
  EXPECT_EQ(failureOf([] { createVerifyingZeltaWriter(nullptr); }),
            "assertion failure: input-output stream is present");
}

}  // namespace
