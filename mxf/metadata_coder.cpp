#include <cstring>
#include <set>

#include "mxf.h"
#include "mxf/primer.h"

namespace {

constexpr std::uint8_t shortForm = 1;
constexpr std::uint64_t shortFormLimit = 128;
constexpr std::uint16_t tagOctets = 2;
// From this version on the Preface starts on a multiple of this alignment.
constexpr std::uint16_t alignedPrefaceVersion = 0x0103;
constexpr std::uint64_t prefaceAlignment = 512;

// A handler that named a buffer gets the octets there, as from a reader.
void deliverValue(KLVHandler& handler, std::uint8_t* buffer, const ByteVector& bytes) {
  if (!buffer) {
    handler.value(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    return;
  }
  std::memcpy(buffer, bytes.data(), bytes.size());
  handler.value(buffer, static_cast<std::streamsize>(bytes.size()));
}

std::uint8_t itemForm(std::size_t size) { return size < shortFormLimit ? shortForm : KLVFourOctetLengthForm; }

std::uint64_t itemLengthOctets(KLVLengthType lengthType, std::size_t size) {
  if (lengthType == KLVLengthTypeBER) return lengthFormOctets(itemForm(size));
  return KLVFixedLengthTypeOctets(lengthType);
}

// The keys that are written: all but the in-memory ones.
std::set<KLVKey> writtenKeys(const MXFPrimedSet& set) {
  std::set<KLVKey> keys;
  for (const auto& property : set.properties)
    if (!MXFPrivatePropertyPattern.matches(property.first)) keys.insert(property.first);
  return keys;
}

// The keys of the order hint that are written, then the rest in key order.
std::vector<KLVKey> itemOrder(const MXFPrimedSet& set, const std::set<KLVKey>& keys) {
  const auto hint = set.properties.find(MXFPropertyOrderHintKey);
  if (hint == set.properties.end()) return std::vector<KLVKey>(keys.begin(), keys.end());
  std::vector<KLVKey> hinted;
  internalize(hint->second, hinted);
  std::set<KLVKey> seen;
  std::vector<KLVKey> order;
  for (const KLVKey& key : hinted) {
    check(seen.insert(key).second, "no repeated properties in order hint");
    if (keys.count(key) != 0) order.push_back(key);
  }
  for (const KLVKey& key : keys)
    if (seen.count(key) == 0) order.push_back(key);
  return order;
}

}  // namespace

MXFMetadataCoder::MXFMetadataCoder(KLVHandler* handler) : monitor_(handler), filler_(&monitor_) {}

void MXFMetadataCoder::start() {
  check(state_ == idle, "before start");
  state_ = started;
  tags_.clear();
  filler_.setLocator(monitor_.getLocator());
  filler_.startStream(true);
  // Every length of header metadata is written in four octets.
  filler_.setLengthForm(KLVFourOctetLengthForm);
  filler_.setFillMode(KLVFiller::alignmentMode, 0, 0);
  filler_.startFilledItem();
}

void MXFMetadataCoder::end() {
  filler_.setFillMode(KLVFiller::alignmentMode, 0, 0);
  filler_.endFilledItem();
  state_ = idle;
  filler_.endStream(false);
}

void MXFMetadataCoder::primer(const MXFPrimerEntries& entries) {
  check(state_ == started, "before primer");
  state_ = primerWritten;
  enterPrimer(entries);
  writeFixedLengthPack(filler_, MXFPrimerPackKey, zelta::mxf::encodePrimer(entries));
}

// Repeated identical entries pass; a tag or a key may not change its
// partner.
void MXFMetadataCoder::enterPrimer(const MXFPrimerEntries& entries) {
  MXFTagToKeyMap keys;
  for (const MXFPrimerEntry& entry : entries) {
    const auto byTag = keys.emplace(entry.tag, entry.key);
    check(byTag.first->second == entry.key, "consistent primer tag -> key");
    const auto byKey = tags_.emplace(entry.key, entry.tag);
    check(byKey.first->second == entry.tag, "consistent primer key -> tag");
  }
}

bool MXFMetadataCoder::acceptSet(const KLVKey&) { return true; }

void MXFMetadataCoder::primedSet(const MXFPrimedSet& set) {
  check(state_ == primerWritten, "before primed set");
  if (set.key == MXFPrefaceKey) alignPreface(set);
  codeSet(set);
}

// Closes the filled item that began with the stream, which pads what came
// before the Preface, and opens an unaligned one for the rest.
void MXFMetadataCoder::alignPreface(const MXFPrimedSet& set) {
  const auto property = set.properties.find(MXFPrefaceVersionKey);
  if (property != set.properties.end()) {
    std::uint16_t version = 0;
    try {
      internalize(property->second, version);
    } catch (const util::assertion_failure&) {
      version = 0;
    }
    if (version >= alignedPrefaceVersion) filler_.setFillMode(KLVFiller::alignmentMode, prefaceAlignment, 0);
  }
  filler_.endFilledItem();
  filler_.setFillMode(KLVFiller::alignmentMode, 0, 0);
  filler_.startFilledItem();
}

void MXFMetadataCoder::codeSet(const MXFPrimedSet& set) {
  KLVTagType tagType = KLVTagType1;
  KLVLengthType lengthType = KLVLengthTypeBER;
  const bool coded = KLVLocalSetCoding(set.key, tagType, lengthType);
  check(coded && tagType == KLVTagType2, "supported tag type");
  const std::set<KLVKey> keys = writtenKeys(set);
  std::uint64_t length = 0;
  for (const KLVKey& key : keys) {
    const std::size_t size = set.properties.at(key).size();
    length += tagOctets + itemLengthOctets(lengthType, size) + size;
  }
  const bool ber = lengthType == KLVLengthTypeBER;
  if (filler_.startLocalSet(set.key, length, tagType, lengthType)) {
    for (const KLVKey& key : itemOrder(set, keys)) {
      const auto tag = tags_.find(key);
      check(tag != tags_.end(), "valid property key");
      const ByteVector& bytes = set.properties.at(key);
      if (ber) filler_.setLengthForm(itemForm(bytes.size()));
      std::uint8_t* buffer = nullptr;
      if (filler_.startLocalItem(tag->second, bytes.size(), buffer) && !bytes.empty())
        deliverValue(filler_, buffer, bytes);
      filler_.endLocalItem(tag->second);
    }
  }
  filler_.endLocalSet(set.key);
  if (ber) filler_.setLengthForm(KLVFourOctetLengthForm);
}
