#include "support/mxf_streams.h"

#include "support/recording.h"

namespace zelta_test {

namespace {

void putBigEndian(ByteVector& out, std::uint64_t value, unsigned octets) {
  for (unsigned i = octets; i-- > 0;) out.push_back(static_cast<std::uint8_t>(value >> (8 * i)));
}

void putKey(ByteVector& out, const KLVKey& key) { out.insert(out.end(), key.data(), key.data() + 16); }

}  // namespace

KLVKey metadataSetKey() { return keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.2F.00"); }
KLVKey indexSegmentKey() { return keyOf("06.0E.2B.34.02.53.01.01.0D.01.02.01.01.10.01.00"); }
KLVKey essenceElementKey() { return keyOf("06.0E.2B.34.01.02.01.01.0D.01.03.01.15.01.01.00"); }

KLVKey fillKey(std::uint8_t version) {
  KLVKey key = keyOf("06.0E.2B.34.01.01.01.01.03.01.02.10.01.00.00.00");
  key[7] = version;
  return key;
}

KLVKey partitionKey(std::uint8_t kind, std::uint8_t status, std::uint8_t version) {
  KLVKey key = keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.00.00.00");
  key[7] = version;
  key[13] = kind;
  key[14] = status;
  return key;
}

KLVKey randomIndexKey() { return keyOf("06.0E.2B.34.02.05.01.01.0D.01.02.01.01.11.01.00"); }

ByteVector concat(std::initializer_list<ByteVector> parts) {
  ByteVector out;
  for (const ByteVector& part : parts) out.insert(out.end(), part.begin(), part.end());
  return out;
}

ByteVector berLength(std::uint64_t length, std::uint8_t form) {
  ByteVector out;
  if (form == 1) {
    out.push_back(static_cast<std::uint8_t>(length));
    return out;
  }
  out.push_back(form);
  putBigEndian(out, length, form & 0x7F);
  return out;
}

ByteVector element(const KLVKey& key, const ByteVector& value, std::uint8_t form) {
  ByteVector out;
  putKey(out, key);
  ByteVector length = berLength(value.size(), form);
  out.insert(out.end(), length.begin(), length.end());
  out.insert(out.end(), value.begin(), value.end());
  return out;
}

ByteVector fillItem(std::uint64_t totalSize) { return element(fillKey(), ByteVector(totalSize - 20, 0)); }

ByteVector essenceElement(std::uint64_t valueLength) {
  ByteVector value(valueLength);
  for (std::uint64_t i = 0; i < valueLength; ++i) value[i] = static_cast<std::uint8_t>(i);
  return element(essenceElementKey(), value);
}

ByteVector localSet(const KLVKey& key, const std::vector<std::uint64_t>& itemSizes) {
  ByteVector value;
  std::uint16_t tag = 0x3C01;
  for (std::uint64_t size : itemSizes) {
    putBigEndian(value, tag++, 2);
    putBigEndian(value, size, 2);
    value.insert(value.end(), size, 0xAB);
  }
  return element(key, value);
}

ByteVector packValue(const MXFPartitionPack& pack, std::uint32_t itemSize) {
  ByteVector out;
  putBigEndian(out, pack.majorVersion, 2);
  putBigEndian(out, pack.minorVersion, 2);
  putBigEndian(out, pack.kagSize, 4);
  putBigEndian(out, pack.thisPartition, 8);
  putBigEndian(out, pack.previousPartition, 8);
  putBigEndian(out, pack.footerPartition, 8);
  putBigEndian(out, pack.headerByteCount, 8);
  putBigEndian(out, pack.indexByteCount, 8);
  putBigEndian(out, pack.indexSID, 4);
  putBigEndian(out, pack.bodyOffset, 8);
  putBigEndian(out, pack.bodySID, 4);
  putKey(out, pack.operationalPattern);
  putBigEndian(out, pack.essenceContainers.size(), 4);
  putBigEndian(out, itemSize, 4);
  for (const KLVKey& label : pack.essenceContainers) {
    putKey(out, label);
    out.insert(out.end(), itemSize - 16, 0);
  }
  return out;
}

ByteVector partitionPack(std::uint8_t kind, std::uint8_t status, const MXFPartitionPack& pack) {
  return element(partitionKey(kind, status), packValue(pack));
}

MXFPartitionPack packWithCounts(std::uint64_t headerByteCount, std::uint64_t indexByteCount) {
  MXFPartitionPack pack;
  pack.headerByteCount = headerByteCount;
  pack.indexByteCount = indexByteCount;
  return pack;
}

namespace {

ByteVector endlessSet(const KLVKey& key, std::uint64_t zeroOctets) {
  const ByteVector longest{0x88, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF};
  ByteVector bytes(key.data(), key.data() + KLVKey::size());
  bytes.insert(bytes.end(), longest.begin(), longest.end());
  bytes.resize(bytes.size() + zeroOctets, 0);
  return bytes;
}

}  // namespace

ByteVector metadataFlood(std::uint64_t zeroOctets) {
  const ByteVector primer = element(MXFPrimerPackKey, ByteVector{0, 0, 0, 0, 0, 0, 0, 18});
  const ByteVector set = endlessSet(metadataSetKey(), zeroOctets);
  return concat({partitionPack(2, 4, packWithCounts(primer.size() + set.size(), 0)), primer, set});
}

ByteVector indexFlood(std::uint64_t zeroOctets) {
  const ByteVector segment = endlessSet(indexSegmentKey(), zeroOctets);
  MXFPartitionPack pack = packWithCounts(0, segment.size());
  pack.indexSID = 1;
  return concat({partitionPack(2, 4, pack), segment});
}

ByteVector randomIndexValue(const std::vector<std::pair<std::uint32_t, std::uint64_t>>& entries) {
  ByteVector out;
  for (const auto& entry : entries) {
    putBigEndian(out, entry.first, 4);
    putBigEndian(out, entry.second, 8);
  }
  putBigEndian(out, 16 + 4 + out.size() + 4, 4);
  return out;
}

ByteVector randomIndexPack(const std::vector<std::pair<std::uint32_t, std::uint64_t>>& entries) {
  return element(randomIndexKey(), randomIndexValue(entries));
}

void Journal::add(const std::string& line, Locator* locator) {
  lines.push_back(line);
  positions.push_back(locator ? static_cast<std::streamoff>(locator->getPosition()) : -1);
}

void JournalKLVHandler::add(const std::string& event) { journal_.add(name_ + " " + event, locator_); }

void JournalKLVHandler::setLocator(Locator* locator) {
  locator_ = locator;
  add("setLocator");
}
void JournalKLVHandler::startStream(bool accurate) { add(std::string("startStream ") + (accurate ? "1" : "0")); }
void JournalKLVHandler::endStream(bool aborted) { add(std::string("endStream ") + (aborted ? "1" : "0")); }
void JournalKLVHandler::setLengthForm(std::uint8_t form) { add("setLengthForm " + std::to_string(form)); }
bool JournalKLVHandler::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  add("startIndividualItem " + toString(key) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endIndividualItem(const KLVKey& key) { add("endIndividualItem " + toString(key)); }
bool JournalKLVHandler::startLabel(const KLVKey& key) {
  add("startLabel " + toString(key));
  return true;
}
void JournalKLVHandler::endLabel(const KLVKey& key) { add("endLabel " + toString(key)); }
bool JournalKLVHandler::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  add("startUniversalSet " + toString(key) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endUniversalSet(const KLVKey& key) { add("endUniversalSet " + toString(key)); }
bool JournalKLVHandler::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType, KLVLengthType) {
  add("startLocalSet " + toString(key) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endLocalSet(const KLVKey& key) { add("endLocalSet " + toString(key)); }
bool JournalKLVHandler::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*&) {
  add("startLocalItem " + std::to_string(tag) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endLocalItem(std::uint32_t tag) { add("endLocalItem " + std::to_string(tag)); }
bool JournalKLVHandler::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  add("startFixedLengthPack " + toString(key) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endFixedLengthPack(const KLVKey& key) { add("endFixedLengthPack " + toString(key)); }
bool JournalKLVHandler::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType) {
  add("startVariableLengthPack " + toString(key) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endVariableLengthPack(const KLVKey& key) { add("endVariableLengthPack " + toString(key)); }
bool JournalKLVHandler::startVariableLengthItem(std::uint64_t length, std::uint8_t*&) {
  add("startVariableLengthItem " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endVariableLengthItem() { add("endVariableLengthItem"); }
bool JournalKLVHandler::startWrapper(const KLVKey& key, std::uint64_t length, bool, std::uint8_t*&) {
  add("startWrapper " + toString(key) + " " + std::to_string(length));
  return true;
}
void JournalKLVHandler::endWrapper(const KLVKey& key) { add("endWrapper " + toString(key)); }
void JournalKLVHandler::value(const std::uint8_t*, std::streamsize size) { add("value " + std::to_string(size)); }

void JournalStructureHandler::setRunIn(std::uint32_t runIn) {
  journal_.add("structure setRunIn " + std::to_string(runIn), nullptr);
}
void JournalStructureHandler::startStream() { journal_.add("structure startStream", nullptr); }
void JournalStructureHandler::endStream(bool aborted) {
  journal_.add(std::string("structure endStream ") + (aborted ? "1" : "0"), nullptr);
}
void JournalStructureHandler::startPartition(const KLVKey& key, const MXFPartitionPack& pack,
                                             std::uint64_t packLength) {
  journal_.add("structure startPartition " + toString(key) + " " + std::to_string(packLength), nullptr);
  packs.push_back(pack);
}
void JournalStructureHandler::endPartition(const KLVKey& key) {
  journal_.add("structure endPartition " + toString(key), nullptr);
}
void JournalStructureHandler::randomIndex(const std::vector<MXFRandomIndexEntry>& e) {
  journal_.add("structure randomIndex " + std::to_string(e.size()), nullptr);
  entries = e;
}

namespace {

// Hands out the bytes one buffer at a time and cannot tell where it is.
class PipeBuffer : public std::streambuf {
public:
  explicit PipeBuffer(const ByteVector& bytes) : bytes_(bytes) {}

protected:
  int_type underflow() override {
    if (next_ == bytes_.size()) return traits_type::eof();
    chunk_ = static_cast<char>(bytes_[next_++]);
    setg(&chunk_, &chunk_, &chunk_ + 1);
    return traits_type::to_int_type(chunk_);
  }

private:
  const ByteVector& bytes_;
  std::size_t next_ = 0;
  char chunk_ = 0;
};

void readFrom(std::istream& in, KLVHandler& handler, ErrorHandler* errorHandler) {
  GenericKLVReader reader;
  reader.setHandler(&handler);
  if (errorHandler) reader.setErrorHandler(errorHandler);
  reader.read(in);
}

}  // namespace

void readThrough(const ByteVector& bytes, KLVHandler& handler, ErrorHandler* errorHandler) {
  util::vector_istream in(bytes);
  readFrom(in, handler, errorHandler);
}

void readThroughPipe(const ByteVector& bytes, KLVHandler& handler, ErrorHandler* errorHandler) {
  PipeBuffer buffer(bytes);
  std::istream in(&buffer);
  readFrom(in, handler, errorHandler);
}

}  // namespace zelta_test
