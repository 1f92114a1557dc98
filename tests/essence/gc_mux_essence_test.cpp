// Essence elements coded by the muxer's essence handler.
#include <gtest/gtest.h>

#include "essence/gc_mux_fixture.h"
#include "support/klv_streams.h"

using namespace zelta_test;
using namespace zelta_test::gcmux;
using zelta_test::klv::join;

namespace {

// Offers a buffer of its own for every item and notes where the values
// came from.
class BufferOfferingHandler : public DullKLVHandler {
public:
  bool startIndividualItem(const KLVKey&, std::uint64_t length, std::uint8_t*& buffer) override {
    own.resize(length);
    buffer = own.data();
    return true;
  }
  void value(const std::uint8_t* data, std::streamsize size) override {
    sources.push_back(data);
    sizes.push_back(size);
  }

  ByteVector own;
  std::vector<const std::uint8_t*> sources;
  std::vector<std::streamsize> sizes;
};

// The key and length written for an element of `length` zero octets, whose
// value is to follow them.
ByteVector headOfElement(std::uint64_t length, std::size_t octets) {
  MuxedContainer container;
  const ByteVector value(length, 0);
  container.structure().start(0);
  container.essence().pictureElement(pictureKey, value.data(), value.size());
  const std::string text = container.out.str();
  EXPECT_EQ(text.size(), octets + length);
  return ByteVector(text.begin(), text.begin() + static_cast<std::ptrdiff_t>(octets));
}

}  // namespace

TEST(MXFGCEssenceCoder, AnswersThatEveryElementIsWantedWithoutABuffer) {
  MuxedContainer container;
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(container.essence().startEssenceElement(pictureKey, 10, buffer));
  EXPECT_EQ(buffer, nullptr);
}

TEST(MXFGCEssenceCoder, ElementUnderTheAutomaticFormIsOneItemWithAFourOctetLength) {
  MuxedContainer container;
  container.structure().start(0);
  const ByteVector value = bytesOf("01 02 03");
  container.essence().pictureElement(pictureKey, value.data(), value.size());
  EXPECT_EQ(container.bytes(), bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 83 00 00 03 01 02 03"));
}

TEST(MXFGCEssenceCoder, ElementOfExactly0xFFFFFFOctetsIsCodedWith0x83) {
  EXPECT_EQ(headOfElement(0xFFFFFF, 20),
            bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 83 FF FF FF"));
}

TEST(MXFGCEssenceCoder, ElementOfExactly0x1000000OctetsIsCodedWith0x87) {
  EXPECT_EQ(headOfElement(0x1000000, 24),
            bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 87 00 00 00 01 00 00 00"));
}

TEST(MXFGCEssenceCoder, EveryKindOfElementIsCodedAlike) {
  MuxedContainer container;
  container.structure().start(0);
  const ByteVector value = bytesOf("0A");
  container.essence().soundElement(soundKey, value.data(), value.size());
  container.essence().dataElement(dataKey, value.data(), value.size());
  container.essence().compoundElement(compoundKey, value.data(), value.size());
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 01 01 00 83 00 00 01 0A"),
                                     bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 17 01 02 00 83 00 00 01 0A"),
                                     bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 18 01 02 00 83 00 00 01 0A")}));
}

TEST(MXFGCEssenceCoder, EssenceLengthFormIsKeptForTheNextElements) {
  MuxedContainer container;
  container.structure().start(0);
  container.essence().essenceLengthForm(0x84);
  const ByteVector value = bytesOf("0A 0B");
  container.essence().pictureElement(pictureKey, value.data(), value.size());
  container.essence().soundElement(soundKey, value.data(), value.size());
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 84 00 00 00 02 0A 0B"),
                                     bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 01 01 00 84 00 00 00 02 0A 0B")}));
}

TEST(MXFGCEssenceCoder, EssenceLengthFormOf0x80ReturnsToTheAutomaticChoice) {
  MuxedContainer container;
  container.structure().start(0);
  const ByteVector value = bytesOf("0A");
  container.essence().essenceLengthForm(0x81);
  container.essence().pictureElement(pictureKey, value.data(), value.size());
  container.essence().essenceLengthForm(0x80);
  container.essence().pictureElement(pictureKey, value.data(), value.size());
  EXPECT_EQ(container.bytes(), join({bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 81 01 0A"),
                                     bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 83 00 00 01 0A")}));
}

TEST(MXFGCEssenceCoder, ValueIsWrittenStraightFromTheCallersMemory) {
  BufferOfferingHandler handler;
  MXFGCEssenceCoder coder(&handler);
  const ByteVector value = bytesOf("01 02 03 04");
  coder.pictureElement(pictureKey, value.data(), value.size());
  ASSERT_EQ(handler.sources.size(), 1u);
  EXPECT_EQ(handler.sources[0], value.data());
  EXPECT_EQ(handler.sizes[0], 4);
}
