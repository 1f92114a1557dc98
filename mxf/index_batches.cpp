#include "mxf/index_batches.h"

#include <sstream>

namespace zelta::mxf {

namespace {

constexpr std::uint32_t deltaEntryLength = 6;
constexpr std::uint32_t indexEntryFixedLength = 11;
constexpr std::uint32_t sliceOffsetLength = 4;
constexpr std::uint32_t posTableEntryLength = 8;

void readHeader(std::istream& in, std::uint32_t& count, std::uint32_t& entryLength) {
  internalize(in, count);
  internalize(in, entryLength);
}

// Moves to the end of an entry of the declared length.
void skipToEntryEnd(std::istream& in, std::streampos start, std::uint32_t entryLength) {
  const std::streamoff used = in.tellg() - start;
  check(used <= static_cast<std::streamoff>(entryLength), "valid external length");
  if (used == static_cast<std::streamoff>(entryLength)) return;
  in.seekg(static_cast<std::streamoff>(entryLength) - used, std::ios_base::cur);
  check(!in.fail(), "successful seekg()");
}

void readIndexEntry(std::istream& in, std::uint8_t sliceCount, std::uint8_t posTableCount, MXFIndexEntry& entry) {
  internalize(in, entry.temporalOffset);
  internalize(in, entry.keyFrameOffset);
  internalize(in, entry.flags);
  internalize(in, entry.streamOffset);
  for (std::uint8_t i = 0; i < sliceCount; ++i) {
    std::uint32_t offset = 0;
    internalize(in, offset);
    entry.sliceOffsets.push_back(offset);
  }
  for (std::uint8_t i = 0; i < posTableCount; ++i) {
    MXFRational position;
    internalize(in, position);
    entry.posTable.push_back(position);
  }
}

std::uint32_t indexEntryLength(const MXFIndexEntry& entry) {
  return indexEntryFixedLength + sliceOffsetLength * static_cast<std::uint32_t>(entry.sliceOffsets.size()) +
         posTableEntryLength * static_cast<std::uint32_t>(entry.posTable.size());
}

ByteVector takeBytes(const std::ostringstream& out) {
  const std::string text = out.str();
  return ByteVector(text.begin(), text.end());
}

}  // namespace

void decodeDeltaEntries(const ByteVector& bytes, std::vector<MXFDeltaEntry>& entries) {
  util::LentInput lent(bytes);
  std::istream& in = lent.stream();
  std::uint32_t count = 0;
  std::uint32_t entryLength = 0;
  readHeader(in, count, entryLength);
  for (std::uint32_t i = 0; i < count; ++i) {
    const std::streampos start = in.tellg();
    MXFDeltaEntry entry;
    internalize(in, entry.posTableIndex);
    internalize(in, entry.slice);
    internalize(in, entry.elementDelta);
    skipToEntryEnd(in, start, entryLength);
    entries.push_back(entry);
  }
  util::requireExhausted(in);
}

void decodeIndexEntries(const ByteVector& bytes, std::uint8_t sliceCount, std::uint8_t posTableCount,
                        std::vector<MXFIndexEntry>& entries) {
  util::LentInput lent(bytes);
  std::istream& in = lent.stream();
  std::uint32_t count = 0;
  std::uint32_t entryLength = 0;
  readHeader(in, count, entryLength);
  for (std::uint32_t i = 0; i < count; ++i) {
    const std::streampos start = in.tellg();
    MXFIndexEntry entry;
    readIndexEntry(in, sliceCount, posTableCount, entry);
    skipToEntryEnd(in, start, entryLength);
    entries.push_back(entry);
  }
}

ByteVector encodeDeltaEntries(const std::vector<MXFDeltaEntry>& entries) {
  std::ostringstream out;
  externalize(out, static_cast<std::uint32_t>(entries.size()));
  externalize(out, deltaEntryLength);
  for (const MXFDeltaEntry& entry : entries) {
    externalize(out, entry.posTableIndex);
    externalize(out, entry.slice);
    externalize(out, entry.elementDelta);
  }
  return takeBytes(out);
}

ByteVector encodeIndexEntries(const std::vector<MXFIndexEntry>& entries) {
  const std::uint32_t entryLength = entries.empty() ? 0 : indexEntryLength(entries.front());
  std::ostringstream out;
  externalize(out, static_cast<std::uint32_t>(entries.size()));
  externalize(out, entryLength);
  for (const MXFIndexEntry& entry : entries) {
    check(indexEntryLength(entry) == entryLength, "valid entry externalize()");
    externalize(out, entry.temporalOffset);
    externalize(out, entry.keyFrameOffset);
    externalize(out, entry.flags);
    externalize(out, entry.streamOffset);
    for (std::uint32_t offset : entry.sliceOffsets) externalize(out, offset);
    for (const MXFRational& position : entry.posTable) externalize(out, position);
  }
  return takeBytes(out);
}

}  // namespace zelta::mxf
