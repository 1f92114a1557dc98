// Sources of the driver made up in the test: a master, and essence of the
// sizes that the test asks for, each octet telling its edit unit and place
// so that what is read back can be matched.
#ifndef ZELTA_TESTS_SUPPORT_KIT_SOURCES_H
#define ZELTA_TESTS_SUPPORT_KIT_SOURCES_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

#include "kit.h"

namespace zelta_test {

class VectorBuffer : public ZeltaBuffer {
 public:
  explicit VectorBuffer(ByteVector bytes) : bytes_(std::move(bytes)) {}
  const std::uint8_t* getData() const override { return bytes_.data(); }
  std::size_t getSize() const override { return bytes_.size(); }

 private:
  ByteVector bytes_;
};

// A generator that counts what it handed out, so that two runs make the
// same instance UIDs.
class CountingGenerator : public MXFUIDGenerator {
 public:
  MXFUID generate() override {
    MXFUID uid;
    uid[15] = static_cast<std::uint8_t>(++count);
    uid[14] = static_cast<std::uint8_t>(count >> 8);
    return uid;
  }
  int count = 0;
};

// Octets of one element: (unit * 7 + element * 13 + index) mod 251.
ByteVector patternOf(std::uint64_t unit, std::uint32_t element, std::size_t size);

// An MPEG-2 frame that says as much as an indexer reads: a sequence and GOP
// header before an I picture, then the picture header with its temporal
// reference and coding type (1 I, 2 P, 3 B), filled up to size octets.
ByteVector mpeg2Frame(std::uint16_t temporalReference, std::uint8_t codingType, bool closedGOP, std::size_t size);

// Serves a fixed number of edit units. Each getter counts its calls; the
// picture getter of the master's format starts a new edit unit.
class TestSource : public ZeltaSource {
 public:
  TestSource(std::shared_ptr<ZeltaDefaultMetadata> master, std::uint64_t units);

  std::shared_ptr<const ZeltaMasterMetadata> getMasterMetadata() override { return master; }
  std::shared_ptr<MXFUIDGenerator> getUIDGenerator() override { return uids; }
  bool hasPictureMetadata() override { return !pictureItems.empty(); }
  bool isIndexDeferred() override { return indexDeferred; }
  std::uint32_t getAVCWrapping() override;
  bool hasMoreEditUnits() override { return served < units; }
  MXFSDTICPTimeStamp getUserStamp() override { return userStamp; }
  MXFGCLocalItems getPackageMetadata() override { return packageItems; }
  MXFGCLocalItems getPictureMetadata() override { return pictureItems; }
  std::shared_ptr<ZeltaBuffer> getD10Picture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getD10Sound() override { return element(1, soundSize); }
  std::shared_ptr<ZeltaBuffer> getDVElement() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getMPEGPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getRawPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getAVCPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getSound(std::uint32_t channel) override { return element(2 + channel, soundSize); }
  std::shared_ptr<ZeltaBuffer> getAncillaryData() override { return element(100, dataSize); }

  std::shared_ptr<ZeltaDefaultMetadata> master;
  std::shared_ptr<MXFUIDGenerator> uids;
  std::uint64_t units;
  std::uint64_t served = 0;
  // Picture frames in stored order; when empty, patterned frames of
  // pictureSize octets.
  std::vector<ByteVector> frames;
  std::size_t pictureSize = 0;
  std::size_t soundSize = 0;
  std::size_t dataSize = 0;
  bool indexDeferred = false;
  std::vector<std::uint32_t> avcWrappings{1};
  std::size_t avcWrappingQuestions = 0;
  MXFSDTICPTimeStamp userStamp{};
  MXFGCLocalItems packageItems;
  MXFGCLocalItems pictureItems;

 private:
  std::shared_ptr<ZeltaBuffer> picture();
  std::shared_ptr<ZeltaBuffer> element(std::uint32_t number, std::size_t size);
};

// Long GOPs of twelve in stored order, I B B P B B P B B P B B, closed or
// open; frames of size octets.
std::vector<ByteVector> mpeg2Frames(std::size_t count, bool closedGOP, std::size_t size);

}  // namespace zelta_test

#endif
