#include "support/mxf_primed_sets.h"

#include "support/mxf_streams.h"
#include "support/recording.h"

namespace zelta_test {

namespace {

void putBigEndian(ByteVector& out, std::uint64_t value, unsigned octets) {
  for (unsigned i = octets; i-- > 0;) out.push_back(static_cast<std::uint8_t>(value >> (8 * i)));
}

void append(ByteVector& out, const ByteVector& part) { out.insert(out.end(), part.begin(), part.end()); }

}  // namespace

void RecordingMetadataHandler::start() { events.push_back("start"); }

void RecordingMetadataHandler::end() { events.push_back("end"); }

void RecordingMetadataHandler::primer(const MXFPrimerEntries& entries) {
  events.push_back("primer " + std::to_string(entries.size()));
  primers.push_back(entries);
}

bool RecordingMetadataHandler::acceptSet(const KLVKey& key) {
  events.push_back("acceptSet " + toString(key));
  return accept_;
}

void RecordingMetadataHandler::primedSet(const MXFPrimedSet& set) {
  events.push_back("primedSet " + toString(set.key) + " " + std::to_string(set.properties.size()));
  sets.push_back(set);
}

ByteVector primerValue(const std::vector<SpelledEntry>& entries, std::uint32_t entrySize) {
  ByteVector value;
  putBigEndian(value, entries.size(), 4);
  putBigEndian(value, entrySize, 4);
  for (const SpelledEntry& entry : entries) {
    append(value, bytesOf(entry.tag));
    append(value, bytesOf(entry.key));
    value.insert(value.end(), entrySize - 18, 0xEE);
  }
  return value;
}

ByteVector primerPack(const ByteVector& value) {
  return element(keyOf("06 0E 2B 34 02 05 01 01 0D 01 02 01 01 05 01 00"), value, 0x83);
}

ByteVector twoOctetSet(const KLVKey& key, const SpelledItems& items) {
  ByteVector value;
  for (const auto& item : items) {
    putBigEndian(value, item.first, 2);
    putBigEndian(value, item.second.size(), 2);
    append(value, item.second);
  }
  return element(key, value, 0x83);
}

ByteVector berItemSet(const KLVKey& key, const SpelledItems& items, std::uint8_t itemForm) {
  ByteVector value;
  for (const auto& item : items) {
    putBigEndian(value, item.first, 2);
    append(value, berLength(item.second.size(), itemForm));
    append(value, item.second);
  }
  return element(key, value, 0x83);
}

KLVKey identificationKey() { return keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 30 00"); }

KLVKey berIdentificationKey() { return keyOf("06 0E 2B 34 02 13 01 01 0D 01 01 01 01 01 30 00"); }

}  // namespace zelta_test
