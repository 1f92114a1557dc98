// Edit unit and slice offsets seen by an indexer in front of a muxer.
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "essence/gc_mux_fixture.h"
#include "support/klv_output.h"
#include "support/klv_streams.h"

using namespace zelta_test;
using namespace zelta_test::gcmux;
using zelta_test::klv::assertionOf;
using zelta_test::klv::SettableLocator;

namespace {

// Writes down each structure event into a log shared with the indexer.
class LoggingStructureHandler : public MXFGCStructureHandler {
public:
  explicit LoggingStructureHandler(std::vector<std::string>& log) : log_(log) {}
  void start(std::uint64_t kagSize) override { log_.push_back("start " + std::to_string(kagSize)); }
  void end() override { log_.push_back("end"); }
  void startEditUnit() override { log_.push_back("startEditUnit"); }
  void endEditUnit() override { log_.push_back("endEditUnit"); }
  void startSlice() override { log_.push_back("startSlice"); }
  void endSlice() override { log_.push_back("endSlice"); }
  void startPaddedElement(std::uint64_t length) override {
    log_.push_back("startPaddedElement " + std::to_string(length));
  }
  void endPaddedElement() override { log_.push_back("endPaddedElement"); }
  void startAlignedElement(std::uint64_t alignment) override {
    log_.push_back("startAlignedElement " + std::to_string(alignment));
  }
  void endAlignedElement() override { log_.push_back("endAlignedElement"); }

private:
  std::vector<std::string>& log_;
};

struct IndexedEditUnit {
  std::uint64_t offset;
  std::vector<std::uint32_t> sliceOffsets;
  std::size_t octetsWritten;  // by the container at the call, when there is one
};

class RecordingIndexer : public MXFGCIndexer {
public:
  RecordingIndexer(MXFGCStructureHandler* handler, Locator* locator, std::vector<std::string>* log = nullptr,
                   MuxedContainer* container = nullptr)
      : MXFGCIndexer(handler, locator), log_(log), container_(container) {}

  void indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) override {
    if (log_) log_->push_back("indexEditUnit");
    units.push_back({editUnitOffset, sliceOffsets, container_ ? container_->out.str().size() : 0});
  }

  std::vector<IndexedEditUnit> units;

private:
  std::vector<std::string>* log_;
  MuxedContainer* container_;
};

// An indexer in front of a muxer writing into a string.
struct IndexedContainer {
  MuxedContainer container;
  RecordingIndexer indexer{container.muxer.getStructureHandler(), container.muxer.getLocator(), nullptr, &container};

  // A padded group of one picture element of value length paddedLength - 40,
  // so that it takes a fill item of 0.
  void group(std::uint64_t paddedLength) {
    const ByteVector value(paddedLength - 40, 0x11);
    indexer.startPaddedElement(paddedLength);
    container.essence().pictureElement(pictureKey, value.data(), value.size());
    indexer.endPaddedElement();
  }
};

}  // namespace

TEST(MXFGCIndexer, EditUnitOffsetsAreWhereEachEditUnitStarts) {
  IndexedContainer c;
  c.indexer.start(0);
  for (int i = 0; i < 3; ++i) {
    c.indexer.startEditUnit();
    c.indexer.startSlice();
    c.group(100);
    c.indexer.endSlice();
    c.indexer.endEditUnit();
  }
  c.indexer.end();
  ASSERT_EQ(c.indexer.units.size(), 3u);
  EXPECT_EQ(c.indexer.units[0].offset, 0u);
  EXPECT_EQ(c.indexer.units[1].offset, 100u);
  EXPECT_EQ(c.indexer.units[2].offset, 200u);
  EXPECT_EQ(c.container.bytes().size(), 300u);
}

TEST(MXFGCIndexer, SliceOffsetsOfAnEditUnitWithOneSliceAreEmpty) {
  IndexedContainer c;
  c.indexer.start(0);
  c.group(60);
  c.indexer.startEditUnit();
  c.indexer.startSlice();
  c.group(100);
  c.indexer.endSlice();
  c.indexer.endEditUnit();
  ASSERT_EQ(c.indexer.units.size(), 1u);
  EXPECT_EQ(c.indexer.units[0].offset, 60u);
  EXPECT_TRUE(c.indexer.units[0].sliceOffsets.empty());
}

TEST(MXFGCIndexer, SliceOffsetsAfterTheFirstAreRelativeToTheEditUnit) {
  IndexedContainer c;
  c.indexer.start(0);
  c.group(100);
  c.indexer.startEditUnit();
  for (std::uint64_t length : {200, 60, 80}) {
    c.indexer.startSlice();
    c.group(length);
    c.indexer.endSlice();
  }
  c.indexer.endEditUnit();
  ASSERT_EQ(c.indexer.units.size(), 1u);
  EXPECT_EQ(c.indexer.units[0].offset, 100u);
  EXPECT_EQ(c.indexer.units[0].sliceOffsets, (std::vector<std::uint32_t>{200, 260}));
}

TEST(MXFGCIndexer, SliceOffsetsStartAfreshWithEachEditUnit) {
  IndexedContainer c;
  c.indexer.start(0);
  for (int i = 0; i < 2; ++i) {
    c.indexer.startEditUnit();
    c.indexer.startSlice();
    c.group(100);
    c.indexer.startSlice();
    c.group(50);
    c.indexer.endEditUnit();
  }
  ASSERT_EQ(c.indexer.units.size(), 2u);
  EXPECT_EQ(c.indexer.units[1].offset, 150u);
  EXPECT_EQ(c.indexer.units[0].sliceOffsets, (std::vector<std::uint32_t>{100}));
  EXPECT_EQ(c.indexer.units[1].sliceOffsets, (std::vector<std::uint32_t>{100}));
}

TEST(MXFGCIndexer, SliceOffsetIsCutTo32Bits) {
  std::vector<std::string> log;
  LoggingStructureHandler next(log);
  SettableLocator locator;
  RecordingIndexer indexer(&next, &locator);
  locator.setPosition(0x10);
  indexer.startEditUnit();
  indexer.startSlice();
  locator.setPosition(0x100000030);
  indexer.startSlice();
  indexer.endEditUnit();
  ASSERT_EQ(indexer.units.size(), 1u);
  EXPECT_EQ(indexer.units[0].offset, 0x10u);
  EXPECT_EQ(indexer.units[0].sliceOffsets, (std::vector<std::uint32_t>{0x20}));
}

TEST(MXFGCIndexer, EveryEventIsForwardedUnchanged) {
  std::vector<std::string> log;
  LoggingStructureHandler next(log);
  SettableLocator locator;
  RecordingIndexer indexer(&next, &locator);
  indexer.start(512);
  indexer.startEditUnit();
  indexer.startSlice();
  indexer.startPaddedElement(1024);
  indexer.endPaddedElement();
  indexer.startAlignedElement(2048);
  indexer.endAlignedElement();
  indexer.endSlice();
  indexer.endEditUnit();
  indexer.end();
  EXPECT_EQ(log, (std::vector<std::string>{"start 512", "startEditUnit", "startSlice", "startPaddedElement 1024",
                                           "endPaddedElement", "startAlignedElement 2048", "endAlignedElement",
                                           "endSlice", "endEditUnit", "end"}));
}

TEST(MXFGCIndexer, IndexEditUnitComesAfterTheNextHandlerEndedTheEditUnit) {
  std::vector<std::string> log;
  LoggingStructureHandler next(log);
  SettableLocator locator;
  RecordingIndexer indexer(&next, &locator, &log);
  indexer.startEditUnit();
  indexer.endEditUnit();
  EXPECT_EQ(log, (std::vector<std::string>{"startEditUnit", "endEditUnit", "indexEditUnit"}));
}

TEST(MXFGCIndexer, PaddersFillIsWrittenBeforeIndexEditUnit) {
  IndexedContainer c;
  c.indexer.start(256);
  c.indexer.startEditUnit();
  c.indexer.startSlice();
  c.indexer.startPaddedElement(512);
  const ByteVector value(100, 0x22);
  c.container.essence().pictureElement(pictureKey, value.data(), value.size());
  c.indexer.endPaddedElement();
  c.indexer.endSlice();
  c.indexer.endEditUnit();
  ASSERT_EQ(c.indexer.units.size(), 1u);
  EXPECT_EQ(c.indexer.units[0].octetsWritten, 512u);
  EXPECT_EQ(slice(c.container.bytes(), 120, 140), fillHeader(512 - 140));
}

TEST(MXFGCIndexer, ForwardingNeedsANextHandler) {
  SettableLocator locator;
  RecordingIndexer indexer(nullptr, &locator);
  EXPECT_EQ(assertionOf([&] { indexer.start(0); }), "assertion failure: handler is present");
}

TEST(MXFGCIndexer, EditUnitStartNeedsALocator) {
  std::vector<std::string> log;
  LoggingStructureHandler next(log);
  RecordingIndexer indexer(&next, nullptr);
  EXPECT_EQ(assertionOf([&] { indexer.startEditUnit(); }), "assertion failure: locator is present");
}
