#include "support/kit_sources.h"

#include <algorithm>

#include "support/mpeg2_frames.h"

namespace zelta_test {

ByteVector patternOf(std::uint64_t unit, std::uint32_t element, std::size_t size) {
  ByteVector bytes(size);
  for (std::size_t i = 0; i < size; ++i) bytes[i] = static_cast<std::uint8_t>((unit * 7 + element * 13 + i) % 251);
  return bytes;
}

ByteVector mpeg2Frame(std::uint16_t temporalReference, std::uint8_t codingType, bool closedGOP, std::size_t size) {
  const bool intra = codingType == 1;
  ByteVector bytes = frame(intra, intra ? (closedGOP ? closedGop : openGop) : noGop, temporalReference, codingType);
  if (bytes.size() < size) bytes.resize(size, 0xAA);
  return bytes;
}

std::vector<ByteVector> mpeg2Frames(std::size_t count, bool closedGOP, std::size_t size) {
  // Stored order of a GOP of twelve and the display rank of each picture.
  static const std::uint8_t types[] = {1, 3, 3, 2, 3, 3, 2, 3, 3, 2, 3, 3};
  static const std::uint16_t closedRanks[] = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11};
  static const std::uint16_t openRanks[] = {2, 0, 1, 5, 3, 4, 8, 6, 7, 11, 9, 10};
  std::vector<ByteVector> frames;
  for (std::size_t i = 0; i < count; ++i) {
    const std::size_t place = i % 12;
    const std::uint16_t rank = closedGOP ? closedRanks[place] : openRanks[place];
    ByteVector frame = mpeg2Frame(rank, types[place], closedGOP, size);
    const ByteVector tail = patternOf(i, 0, size / 2);
    std::copy(tail.begin(), tail.end(), frame.end() - static_cast<std::ptrdiff_t>(tail.size()));
    frames.push_back(frame);
  }
  return frames;
}

TestSource::TestSource(std::shared_ptr<ZeltaDefaultMetadata> master, std::uint64_t units)
    : master(std::move(master)), units(units) {}

std::uint32_t TestSource::getAVCWrapping() {
  const std::size_t question = std::min(avcWrappingQuestions, avcWrappings.size() - 1);
  ++avcWrappingQuestions;
  return avcWrappings[question];
}

std::shared_ptr<ZeltaBuffer> TestSource::picture() {
  const std::uint64_t unit = served++;
  if (!frames.empty()) return std::make_shared<VectorBuffer>(frames[unit % frames.size()]);
  return std::make_shared<VectorBuffer>(patternOf(unit, 0, pictureSize));
}

std::shared_ptr<ZeltaBuffer> TestSource::element(std::uint32_t number, std::size_t size) {
  if (size == 0) return nullptr;
  return std::make_shared<VectorBuffer>(patternOf(served - 1, number, size));
}

}  // namespace zelta_test
