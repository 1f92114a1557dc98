// Where essence values are read to: the handler's buffer, or the splitter's
// own; in both cases the reader reads straight into it and nothing is moved.
#include "gc_splitter_fixture.h"

#include "support/mxf_streams.h"

using namespace zelta_test;
using namespace zelta_test::gc;

namespace {

ByteVector counting(std::size_t size) {
  ByteVector bytes(size);
  for (std::size_t i = 0; i < size; ++i) bytes[i] = static_cast<std::uint8_t>(i * 13 + 1);
  return bytes;
}

// Writes down the buffer that the splitter gives the reader for each
// individual item, and the data pointer of each value event.
class BufferTap : public DullKLVFilter {
public:
  using DullKLVFilter::DullKLVFilter;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    const bool taken = DullKLVFilter::startIndividualItem(key, length, buffer);
    given.push_back(buffer);
    return taken;
  }
  void value(const std::uint8_t* data, std::streamsize size) override {
    values.push_back(data);
    DullKLVFilter::value(data, size);
  }
  std::vector<const std::uint8_t*> given;
  std::vector<const std::uint8_t*> values;
};

class GCSplitterOwnBuffer : public GCSplitterTest {};

class GCSplitterHandlerBuffer : public GCSplitterTest {
protected:
  GCSplitterHandlerBuffer() : GCSplitterTest(RecordingGCHandler::takeIntoBuffer) {}
};

}  // namespace

TEST_F(GCSplitterHandlerBuffer, ValueIsReadIntoTheHandlersBufferAndDeliveredFromThere) {
  const ByteVector picture = counting(1000);
  BufferTap tap(&splitter);
  readThrough(concat({element(pictureKey(), picture), element(soundKey(), counting(10))}), tap);
  ASSERT_EQ(handler.elements.size(), 2u);
  EXPECT_EQ(tap.given[0], handler.buffers[0].data());
  EXPECT_EQ(tap.values[0], handler.buffers[0].data());
  EXPECT_EQ(handler.elements[0].data, handler.buffers[0].data());
  EXPECT_EQ(handler.elements[0].length, 1000u);
  EXPECT_EQ(handler.elements[0].bytes, picture);
  EXPECT_EQ(handler.elements[1].data, handler.buffers[1].data());
  EXPECT_EQ(handler.elements[1].bytes, counting(10));
}

TEST_F(GCSplitterHandlerBuffer, ValueFromElsewhereIsMovedIntoTheHandlersBuffer) {
  open();
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 5, buffer));
  ASSERT_EQ(buffer, handler.buffers[0].data());
  const ByteVector first{1, 2};
  const ByteVector second{3, 4, 5};
  splitter.value(first.data(), 2);
  splitter.value(second.data(), 3);
  splitter.endIndividualItem(pictureKey());
  ASSERT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(handler.elements[0].data, handler.buffers[0].data());
  EXPECT_EQ(handler.elements[0].bytes, (ByteVector{1, 2, 3, 4, 5}));
}

TEST_F(GCSplitterHandlerBuffer, ValueBeyondTheHandlersBufferIsRefused) {
  open();
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 4, buffer));
  const ByteVector five(5, 1);
  EXPECT_EQ(assertionTextOf([&] { splitter.value(five.data(), 5); }),
            "assertion failure: valid essence buffer size");
}

TEST_F(GCSplitterHandlerBuffer, ElementOf0x1000000OctetsIsDeliveredIntoTheHandlersBuffer) {
  ByteVector value(0x1000000);
  value.front() = 0xAB;
  value.back() = 0xCD;
  readThrough(element(pictureKey(), value, 0x87), splitter, &errors);
  EXPECT_TRUE(errors.reports.empty());
  ASSERT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(handler.elements[0].data, handler.buffers[0].data());
  EXPECT_EQ(handler.elements[0].length, 0x1000000u);
  EXPECT_EQ(handler.elements[0].bytes.front(), 0xAB);
  EXPECT_EQ(handler.elements[0].bytes.back(), 0xCD);
}

TEST_F(GCSplitterOwnBuffer, ReaderReadsIntoTheOwnBufferAndTheHandlerGetsThatVeryMemory) {
  const ByteVector picture = counting(700);
  BufferTap tap(&splitter);
  readThrough(element(pictureKey(), picture), tap);
  ASSERT_EQ(tap.given.size(), 1u);
  ASSERT_NE(tap.given[0], nullptr);
  EXPECT_EQ(tap.values, (std::vector<const std::uint8_t*>{tap.given[0]}));
  ASSERT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(handler.elements[0].data, tap.given[0]);
  EXPECT_EQ(handler.elements[0].bytes, picture);
}

TEST_F(GCSplitterOwnBuffer, OwnBufferServesSmallerElementsWithoutGrowing) {
  BufferTap tap(&splitter);
  readThrough(concat({element(pictureKey(), counting(300)), element(soundKey(), counting(20)),
                      element(pictureKey(), counting(300))}),
              tap);
  ASSERT_EQ(tap.given.size(), 3u);
  EXPECT_EQ(tap.given[1], tap.given[0]);
  EXPECT_EQ(tap.given[2], tap.given[0]);
  ASSERT_EQ(handler.elements.size(), 3u);
  EXPECT_EQ(handler.elements[1].bytes, counting(20));
  EXPECT_EQ(handler.elements[2].bytes, counting(300));
}

TEST_F(GCSplitterOwnBuffer, OwnBufferGrowsForALargerElement) {
  readThrough(concat({element(pictureKey(), counting(10)), element(pictureKey(), counting(5000))}), splitter);
  ASSERT_EQ(handler.elements.size(), 2u);
  EXPECT_EQ(handler.elements[1].bytes, counting(5000));
}

TEST_F(GCSplitterOwnBuffer, ElementOfExactly0xFFFFFFOctetsGoesThroughTheOwnBuffer) {
  ByteVector value(0xFFFFFF);
  value.front() = 0x12;
  value.back() = 0x34;
  BufferTap tap(&splitter);
  readThrough(element(pictureKey(), value), tap, &errors);
  EXPECT_TRUE(errors.reports.empty());
  ASSERT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(handler.elements[0].data, tap.given[0]);
  EXPECT_EQ(handler.elements[0].length, 0xFFFFFFu);
  EXPECT_EQ(handler.elements[0].bytes.front(), 0x12);
  EXPECT_EQ(handler.elements[0].bytes.back(), 0x34);
}

TEST_F(GCSplitterOwnBuffer, ElementOf0x1000000OctetsWithoutHandlerBufferReachesTheHandlerAsNullAndLength) {
  BufferTap tap(&splitter);
  readThrough(concat({element(pictureKey(), ByteVector(0x1000000, 7), 0x87), element(pictureKey(), {1, 2}, 0x87)}), tap,
              &errors);
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].severity, "error");
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x04));
  EXPECT_EQ(errors.reports[0].message, "unsupported GC essence element length - 0x1000000");
  ASSERT_EQ(handler.elements.size(), 2u);
  EXPECT_EQ(handler.elements[0].kind, "picture");
  EXPECT_EQ(handler.elements[0].data, nullptr);
  EXPECT_EQ(handler.elements[0].length, 0x1000000u);
  // Not taken: no value was read, and the stream went on.
  EXPECT_EQ(tap.given[0], nullptr);
  EXPECT_EQ(tap.values.size(), 1u);
  EXPECT_EQ(handler.elements[1].bytes, (ByteVector{1, 2}));
  EXPECT_EQ(handler.events[2], "essenceLengthForm 0x87");
  EXPECT_EQ(handler.events[3], line("startEssenceElement", pictureKey(), 0x1000000));
  EXPECT_EQ(handler.events[4], line("pictureElement", pictureKey(), 0x1000000));
}

TEST_F(GCSplitterOwnBuffer, ZeroLengthElementIsDeliveredEmpty) {
  readThrough(concat({element(pictureKey(), {}), element(soundKey(), {})}), splitter);
  ASSERT_EQ(handler.elements.size(), 2u);
  EXPECT_EQ(handler.elements[0].length, 0u);
  EXPECT_EQ(handler.elements[1].length, 0u);
}

TEST_F(GCSplitterOwnBuffer, ChunksFromElsewhereAreAppendedKeepingWhatCameBefore) {
  open();
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 2, buffer));
  const ByteVector first{1, 2};
  const ByteVector second{3, 4, 5};
  splitter.value(first.data(), 2);
  splitter.value(second.data(), 3);
  splitter.endIndividualItem(pictureKey());
  ASSERT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(handler.elements[0].length, 5u);
  EXPECT_EQ(handler.elements[0].bytes, (ByteVector{1, 2, 3, 4, 5}));
}

TEST_F(GCSplitterOwnBuffer, ValueInPlaceBeyondTheOwnBufferIsRefused) {
  open();
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 4, buffer));
  ASSERT_NE(buffer, nullptr);
  EXPECT_EQ(assertionTextOf([&] { splitter.value(buffer, 5); }), "assertion failure: valid essence buffer size");
}

TEST_F(GCSplitterOwnBuffer, NegativeSizeIsNoRangeToAppend) {
  open();
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 4, buffer));
  const ByteVector elsewhere{1};
  EXPECT_EQ(assertionTextOf([&] { splitter.value(elsewhere.data(), -1); }),
            "assertion failure: valid range to append");
}

TEST_F(GCSplitterOwnBuffer, AppendBeyondAnyMemoryFailsTheAllocation) {
  open();
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 4, buffer));
  const ByteVector elsewhere{1};
  EXPECT_EQ(assertionTextOf([&] { splitter.value(elsewhere.data(), std::streamsize(1) << 62); }),
            "assertion failure: successful allocation");
}

TEST_F(GCSplitterOwnBuffer, PipeGivesTheSameElements) {
  const ByteVector bytes = concat({element(systemPackKey(), {1, 2, 3}), fillItem(40), element(pictureKey(), counting(99)),
                                   element(systemPackKey(), {4, 5, 6}), element(pictureKey(), counting(98))});
  readThroughPipe(bytes, splitter);
  RecordingGCHandler seekable;
  MXFGCSplitter other(&seekable, &seekable, &seekable);
  readThrough(bytes, other);
  EXPECT_EQ(handler.events, seekable.events);
  ASSERT_EQ(handler.elements.size(), 2u);
  EXPECT_EQ(handler.elements[1].bytes, counting(98));
}
