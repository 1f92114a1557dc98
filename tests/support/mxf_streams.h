// Byte streams of partitions, fill items, sets and random indexes spelled by
// hand, and handlers that write what they hear into one shared journal.
#ifndef ZELTA_TESTS_SUPPORT_MXF_STREAMS_H
#define ZELTA_TESTS_SUPPORT_MXF_STREAMS_H

#include <initializer_list>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace zelta_test {

// Keys of elements that the splitter only passes on.
KLVKey metadataSetKey();    // a local set with 2-octet tags and lengths
KLVKey indexSegmentKey();   // a local set with 2-octet tags and lengths
KLVKey essenceElementKey(); // an individual item
KLVKey fillKey(std::uint8_t version = 1);
// Octets 13 and 14 are the kind and the status, spelled here rather than
// taken from the library.
KLVKey partitionKey(std::uint8_t kind, std::uint8_t status, std::uint8_t version = 1);
KLVKey randomIndexKey();

ByteVector concat(std::initializer_list<ByteVector> parts);
ByteVector berLength(std::uint64_t length, std::uint8_t form = 0x83);
ByteVector element(const KLVKey& key, const ByteVector& value, std::uint8_t form = 0x83);
// A whole fill item of the given total size, key and length included.
ByteVector fillItem(std::uint64_t totalSize);
ByteVector essenceElement(std::uint64_t valueLength);
// A local set with 2-octet tags and lengths, items of the given value sizes.
ByteVector localSet(const KLVKey& key, const std::vector<std::uint64_t>& itemSizes);

// The value of a partition pack, written field by field; essence container
// labels take itemSize octets each, the excess zero.
ByteVector packValue(const MXFPartitionPack& pack, std::uint32_t itemSize = 16);
ByteVector partitionPack(std::uint8_t kind, std::uint8_t status, const MXFPartitionPack& pack);
MXFPartitionPack packWithCounts(std::uint64_t headerByteCount, std::uint64_t indexByteCount);
// Entries, then the overall length for a BER length of four octets.
ByteVector randomIndexValue(const std::vector<std::pair<std::uint32_t, std::uint64_t>>& entries);
ByteVector randomIndexPack(const std::vector<std::pair<std::uint32_t, std::uint64_t>>& entries);

// A header partition whose header metadata, after an empty primer, or whose
// index is one local set with a length far beyond the end of the file,
// followed by zero octets: a tag of 00.00, which no primer holds, and a
// length of 0 every four octets, to the end of the file.
ByteVector metadataFlood(std::uint64_t zeroOctets);
ByteVector indexFlood(std::uint64_t zeroOctets);

// Lines of events in the order they came from every journaling handler,
// with the position each handler's locator gave at that event.
struct Journal {
  std::vector<std::string> lines;
  std::vector<std::streamoff> positions;
  void add(const std::string& line, Locator* locator);
};

// Writes "<name> <event> ..." lines; takes every value without a buffer.
class JournalKLVHandler : public KLVHandler {
public:
  JournalKLVHandler(Journal& journal, const std::string& name) : journal_(journal), name_(name) {}
  Locator* locator() const { return locator_; }

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  void add(const std::string& event);
  Journal& journal_;
  std::string name_;
  Locator* locator_ = nullptr;
};

// Writes "structure <event> ..." lines, with position -1.
class JournalStructureHandler : public MXFStructureHandler {
public:
  explicit JournalStructureHandler(Journal& journal) : journal_(journal) {}

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  std::vector<MXFPartitionPack> packs;
  std::vector<MXFRandomIndexEntry> entries;

private:
  Journal& journal_;
};

// Reads bytes through GenericKLVReader into a handler; exceptions pass.
void readThrough(const ByteVector& bytes, KLVHandler& handler, ErrorHandler* errorHandler = nullptr);
// The same from a stream that cannot seek, as from a pipe.
void readThroughPipe(const ByteVector& bytes, KLVHandler& handler, ErrorHandler* errorHandler = nullptr);

// The what() of the util::assertion_failure that a call raises, or "no
// failure".
template <typename Call>
std::string assertionTextOf(Call call) {
  try {
    call();
  } catch (const util::assertion_failure& failure) {
    return failure.what();
  }
  return "no failure";
}

// The what() of the std::runtime_error that a call raises, or "no failure".
template <typename Call>
std::string runtimeErrorTextOf(Call call) {
  try {
    call();
  } catch (const std::runtime_error& failure) {
    return failure.what();
  }
  return "no failure";
}

}  // namespace zelta_test

#endif
