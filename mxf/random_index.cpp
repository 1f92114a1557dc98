#include "mxf.h"

namespace {

constexpr std::size_t entryOctets = 12;
constexpr std::size_t overallLengthOctets = 4;

// Key and BER length of the pack around a value of the given size.
std::uint64_t overallLength(std::uint8_t form, std::uint64_t valueSize) {
  return KLVKey::size() + lengthFormOctets(form) + valueSize;
}

}  // namespace

void internalize(const ByteVector& bytes, std::vector<MXFRandomIndexEntry>& entries, std::uint8_t form) {
  check(bytes.size() >= overallLengthOctets && (bytes.size() - overallLengthOctets) % entryOctets == 0,
        "valid external length");
  util::LentInput lent(bytes);
  std::istream& in = lent.stream();
  std::size_t count = (bytes.size() - overallLengthOctets) / entryOctets;
  entries.clear();
  entries.reserve(count);
  for (std::size_t i = 0; i < count; ++i) {
    MXFRandomIndexEntry entry;
    internalize(in, entry.bodySID);
    internalize(in, entry.byteOffset);
    entries.push_back(entry);
  }
  std::uint32_t length = 0;
  internalize(in, length);
  util::requireExhausted(in);
  if (form != 0) check(length == overallLength(form, bytes.size()), "correct overall length");
}

void externalize(ByteVector& bytes, const std::vector<MXFRandomIndexEntry>& entries, std::uint8_t form) {
  bytes.clear();
  ByteVector item;
  for (const MXFRandomIndexEntry& entry : entries) {
    externalize(item, entry.bodySID, true);
    externalize(item, entry.byteOffset, false);
    check(item.size() == entryOctets, "valid entry externalize()");
    bytes.insert(bytes.end(), item.begin(), item.end());
  }
  std::uint64_t valueSize = bytes.size() + overallLengthOctets;
  externalize(bytes, static_cast<std::uint32_t>(overallLength(form, valueSize)), false);
}
