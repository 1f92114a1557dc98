// Zelta: partition and random index packs, structure events and MXFSplitter.
// Part of mxf.h, which includes it.
#ifndef ZELTA_INCLUDE_MXF_STRUCTURE_H
#define ZELTA_INCLUDE_MXF_STRUCTURE_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "klv.h"

inline constexpr MXFUID unexpectedElementId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x01);
inline constexpr MXFUID runInErrorId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x02);
inline constexpr MXFUID randomIndexMissingId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x03);
inline constexpr MXFUID headerByteCountKagId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x04);
inline constexpr MXFUID indexByteCountKagId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x05);
inline constexpr MXFUID randomIndexValueId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x06);
inline constexpr MXFUID partitionByteCountId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x01);
inline constexpr MXFUID partitionValueId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x02);
inline constexpr MXFUID partitionOrderId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x03);
inline constexpr MXFUID thisPartitionId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x04);
inline constexpr MXFUID previousPartitionId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x05);
inline constexpr MXFUID footerPartitionId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x06);
inline constexpr MXFUID indexSIDId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x07);
inline constexpr MXFUID bodySIDId = ZeltaErrorId(0x4C, 0x4C, 0x01, 0x08);
inline constexpr MXFUID partitionVersionErrorId = ZeltaErrorId(0x4C, 0x4C, 0x02, 0x01);
inline constexpr MXFUID partitionVersionRangeId = ZeltaErrorId(0x4C, 0x4C, 0x02, 0x02);

// ---------------------------------------------------------------------------
// Partition and random index packs

struct ZELTA_EXPORT MXFPartitionPack {
  std::uint16_t majorVersion = 1;
  std::uint16_t minorVersion = 2;
  std::uint32_t kagSize = 0;
  std::uint64_t thisPartition = 0;
  std::uint64_t previousPartition = 0;
  std::uint64_t footerPartition = 0;
  std::uint64_t headerByteCount = 0;
  std::uint64_t indexByteCount = 0;
  std::uint32_t indexSID = 0;
  std::uint64_t bodyOffset = 0;
  std::uint32_t bodySID = 0;
  KLVKey operationalPattern;
  std::vector<KLVKey> essenceContainers;

  bool operator==(const MXFPartitionPack& o) const;
  bool operator!=(const MXFPartitionPack& o) const { return !(*this == o); }
};

ZELTA_EXPORT void internalize(std::istream& in, MXFPartitionPack& pack);
ZELTA_EXPORT void externalize(std::ostream& out, const MXFPartitionPack& pack);

struct ZELTA_EXPORT MXFRandomIndexEntry {
  std::uint32_t bodySID = 0;
  std::uint64_t byteOffset = 0;

  bool operator==(const MXFRandomIndexEntry& o) const {
    return bodySID == o.bodySID && byteOffset == o.byteOffset;
  }
  bool operator!=(const MXFRandomIndexEntry& o) const { return !(*this == o); }
};

// The value of a random index pack: 12-octet entries, then the overall
// length of the pack, checked against the BER form unless form is 0
// ("correct overall length").
ZELTA_EXPORT void internalize(const ByteVector& bytes, std::vector<MXFRandomIndexEntry>& entries, std::uint8_t form);
ZELTA_EXPORT void externalize(ByteVector& bytes, const std::vector<MXFRandomIndexEntry>& entries, std::uint8_t form);

// Partition kinds (key octet 13) and statuses (key octet 14).
enum MXFPartitionKind : std::uint8_t { MXFHeaderPartition = 2, MXFBodyPartition = 3, MXFFooterPartition = 4 };
enum MXFPartitionStatus : std::uint8_t {
  MXFOpenIncomplete = 1,
  MXFClosedIncomplete = 2,
  MXFOpenComplete = 3,
  MXFClosedComplete = 4
};

ZELTA_EXPORT KLVKey MXFPartitionPackKey(MXFPartitionKind kind, MXFPartitionStatus status);
inline constexpr KLVKey MXFRandomIndexPackKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01, 0x0D, 0x01, 0x02, 0x01, 0x01, 0x11,
                                 0x01, 0x00}};

ZELTA_EXPORT bool isMXFPartitionKey(const KLVKey& key);
ZELTA_EXPORT bool isMXFRandomIndexKey(const KLVKey& key);
// Of a partition key: its kind and its status.
ZELTA_EXPORT MXFPartitionKind getMXFPartitionKind(const KLVKey& key);
ZELTA_EXPORT MXFPartitionStatus getMXFPartitionStatus(const KLVKey& key);

// ---------------------------------------------------------------------------
// Structure events

class ZELTA_EXPORT MXFStructureHandler {
public:
  virtual ~MXFStructureHandler();
  virtual void setRunIn(std::uint32_t runIn) = 0;
  virtual void startStream() = 0;
  virtual void endStream(bool aborted) = 0;
  // packLength counts from the pack's key to what follows the pack and the
  // one fill item after it.
  virtual void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) = 0;
  virtual void endPartition(const KLVKey& key) = 0;
  virtual void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) = 0;
};

class ZELTA_EXPORT DullMXFStructureHandler : public MXFStructureHandler {
public:
  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;
};

// Cuts a KLV stream into partitions by the byte counts of their packs, and
// each partition into header metadata, index and essence sections, each a
// complete KLV stream to its delegate.
class ZELTA_EXPORT MXFSplitter : public KLVHandler {
public:
  // The position that the splitter stored at the top of its current event,
  // which its delegates and validator see.
  class DelegatedLocator;

  MXFSplitter(MXFStructureHandler* structureHandler, KLVHandler* metadataHandler, KLVHandler* indexHandler,
              KLVHandler* essenceHandler, bool validate);
  ~MXFSplitter() override;
  MXFSplitter(const MXFSplitter&) = delete;
  MXFSplitter& operator=(const MXFSplitter&) = delete;

  void setErrorHandler(ErrorHandler* errorHandler);
  void setRunIn(std::uint32_t runIn);

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
  class Impl;
  std::unique_ptr<Impl> impl_;
};

#endif
