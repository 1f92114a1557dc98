// Zelta: MXF structure, partitions and the random index.
#ifndef ZELTA_MXF_H
#define ZELTA_MXF_H

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

// ---------------------------------------------------------------------------
// Primer and primed sets

inline constexpr MXFUID nonStandardCodingId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x07);
inline constexpr MXFUID invalidPrimerValueId = ZeltaErrorId(0x4C, 0x4C, 0x03, 0x01);
inline constexpr MXFUID nonStandardPrimerKeyId = ZeltaErrorId(0x4C, 0x4C, 0x03, 0x02);
inline constexpr MXFUID nonStandardPrimerTagId = ZeltaErrorId(0x4C, 0x4C, 0x03, 0x03);
inline constexpr MXFUID inconsistentPrimerKeyId = ZeltaErrorId(0x4C, 0x4C, 0x03, 0x04);
inline constexpr MXFUID inconsistentPrimerTagId = ZeltaErrorId(0x4C, 0x4C, 0x03, 0x05);
inline constexpr MXFUID repeatedPropertyId = ZeltaErrorId(0x4C, 0x4C, 0x04, 0x01);
inline constexpr MXFUID tagMissingInPrimerId = ZeltaErrorId(0x4C, 0x4C, 0x04, 0x02);

inline constexpr KLVKey MXFPrimerPackKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01, 0x0D, 0x01, 0x02, 0x01, 0x01, 0x05,
                                 0x01, 0x00}};
inline constexpr KLVKey MXFPrefaceKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x01, 0x01, 0x01, 0x01,
                                 0x2F, 0x00}};
inline constexpr KLVKey MXFPrefaceVersionKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x02, 0x03, 0x01, 0x02, 0x01, 0x05, 0x00,
                                 0x00, 0x00}};
// An in-memory property: the keys, in order, that a set's items are to be
// written in before the rest.
inline constexpr KLVKey MXFPropertyOrderHintKey{
    std::array<std::uint8_t, 16>{0x9C, 0xEF, 0x38, 0xE7, 0xD8, 0x04, 0x25, 0xC1, 0xC3, 0xD2, 0x00, 0x01, 0x9C, 0xAD,
                                 0x11, 0xE0}};
// Keys that exist in memory only and are never written or primed; octets
// 10 and 11 tell them apart.
inline constexpr KLVKeyPattern MXFPrivatePropertyPattern =
    KLVKeyPattern(std::array<std::uint8_t, 16>{0x9C, 0xEF, 0x38, 0xE7, 0xD8, 0x04, 0x25, 0x00, 0xC3, 0xD2, 0x00, 0x00,
                                               0x9C, 0xAD, 0x11, 0xE0});

struct ZELTA_EXPORT MXFPrimerEntry {
  std::uint16_t tag = 0;
  KLVKey key;

  bool operator==(const MXFPrimerEntry& o) const { return tag == o.tag && key == o.key; }
  bool operator!=(const MXFPrimerEntry& o) const { return !(*this == o); }
};

typedef std::vector<MXFPrimerEntry> MXFPrimerEntries;
typedef std::map<std::uint16_t, KLVKey> MXFTagToKeyMap;
typedef std::map<KLVKey, std::uint16_t> MXFKeyToTagMap;

// A local set with its tags resolved: the set key as found and its
// properties by full key. Where an item stood in the file is not kept.
struct ZELTA_EXPORT MXFPrimedSet {
  KLVKey key;
  std::map<KLVKey, ByteVector> properties;

  bool operator==(const MXFPrimedSet& o) const { return key == o.key && properties == o.properties; }
  bool operator!=(const MXFPrimedSet& o) const { return !(*this == o); }
};

// The primer that every file of the format may rely on: the static tags of
// the format classes and the index table segment, in three forms.
ZELTA_EXPORT const MXFPrimerEntries& getMXFStandardPrimer();
ZELTA_EXPORT const MXFTagToKeyMap& getMXFStandardPrimerKeys();  // tag to key
ZELTA_EXPORT const MXFKeyToTagMap& getMXFStandardPrimerTags();  // key to tag

class ZELTA_EXPORT MXFMetadataHandler {
public:
  virtual ~MXFMetadataHandler();
  virtual void start() = 0;
  virtual void end() = 0;
  // The primer, in file order.
  virtual void primer(const MXFPrimerEntries& entries) = 0;
  // Whether the handler wants the properties of a set of this key.
  virtual bool acceptSet(const KLVKey& key) = 0;
  virtual void primedSet(const MXFPrimedSet& set) = 0;
};

// Turns the local sets with two-octet tags of a KLV stream into primed sets
// by a primer that a subclass supplies. Sets of other tag sizes, and sets
// that acceptSet declines, are skipped.
class ZELTA_EXPORT MXFPrimedSetParser : public DullKLVHandler {
public:
  MXFPrimedSetParser();
  MXFPrimedSetParser(const MXFPrimedSetParser&) = delete;
  MXFPrimedSetParser& operator=(const MXFPrimedSetParser&) = delete;

  virtual void setErrorHandler(ErrorHandler* errorHandler);
  virtual const MXFTagToKeyMap& getPrimer() = 0;
  virtual bool acceptSet(const KLVKey& key) = 0;
  virtual void primedSet(const MXFPrimedSet& set) = 0;

  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

protected:
  enum State { idle, beforePrimer, inPrimer, betweenSets, inSet };

  State getState() const { return state_; }
  void setState(State state) { state_ = state; }
  // Null when none is set: reports then vanish.
  ErrorHandler* getErrorHandler() const { return errorHandler_; }

private:
  State state_ = idle;
  ErrorHandler* errorHandler_ = nullptr;
  MXFPrimedSet set_;
  bool wanted_ = false;
  std::map<KLVKey, ByteVector>::iterator property_;
};

// The header metadata of one partition as primer and primed sets, with the
// primer checked against the standard primer.
class ZELTA_EXPORT MXFMetadataParser : public MXFPrimedSetParser {
public:
  explicit MXFMetadataParser(MXFMetadataHandler* handler);

  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

  const MXFTagToKeyMap& getPrimer() override;
  bool acceptSet(const KLVKey& key) override;
  void primedSet(const MXFPrimedSet& set) override;

private:
  MXFMetadataHandler* handler_;
  ByteVector primerBytes_;
  MXFTagToKeyMap keys_;
  std::uint8_t lastForm_ = KLVNoLengthForm;
  bool formChanged_ = false;
  std::uint64_t largestItem_ = 0;
  KLVLengthType lengthType_ = KLVLengthTypeBER;
};

// Writes primer and primed sets as header metadata into a KLV handler, all
// lengths in the four-octet form. From version 1.3 on, the Preface starts at
// a multiple of 512 octets from the start of the stream.
class ZELTA_EXPORT MXFMetadataCoder : public MXFMetadataHandler {
public:
  explicit MXFMetadataCoder(KLVHandler* handler);
  MXFMetadataCoder(const MXFMetadataCoder&) = delete;
  MXFMetadataCoder& operator=(const MXFMetadataCoder&) = delete;

  void start() override;
  void end() override;
  void primer(const MXFPrimerEntries& entries) override;
  bool acceptSet(const KLVKey& key) override;
  void primedSet(const MXFPrimedSet& set) override;

private:
  enum State { idle, started, primerWritten };

  void enterPrimer(const MXFPrimerEntries& entries);
  void alignPreface(const MXFPrimedSet& set);
  void codeSet(const MXFPrimedSet& set);

  KLVMonitor monitor_;
  KLVFiller filler_;
  State state_ = idle;
  MXFKeyToTagMap tags_;
};

// Writes the standard primer ahead of the given entries.
class ZELTA_EXPORT MXFFormatMetadataCoder : public MXFMetadataCoder {
public:
  using MXFMetadataCoder::MXFMetadataCoder;
  void primer(const MXFPrimerEntries& entries) override;
};

// Adds the index table segment's tags that the entries lack, so that the
// segments after the metadata are served by the same primer.
class ZELTA_EXPORT MXFMetadataPlusIndexPrimerCoder : public MXFMetadataCoder {
public:
  using MXFMetadataCoder::MXFMetadataCoder;
  void primer(const MXFPrimerEntries& entries) override;
};

// ---------------------------------------------------------------------------
// Structure coding and validation

// Writes partition packs and the random index, and fills in the offsets that
// only the place in the file decides. What the validator reports, the coder
// refuses by assertion.
class ZELTA_EXPORT MXFStructureCoder : public MXFStructureHandler {
public:
  // The padders are shared with the writers of header metadata and index
  // tables: each partition arms them with its byte counts, so that what
  // passes through them fills exactly the space that the pack promised.
  MXFStructureCoder(KLVHandler* handler, Locator* locator, KLVStreamPadder* headerPadder,
                    KLVStreamPadder* indexPadder);
  MXFStructureCoder(const MXFStructureCoder&) = delete;
  MXFStructureCoder& operator=(const MXFStructureCoder&) = delete;

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  // packLength is what the pack and its fill are to take; 0 aligns them on
  // the KAG.
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  // Writes the coder's own list of partitions; the entries given are ignored.
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  // A partition that is already in the file joins the list without being
  // written.
  virtual void addPartition(const MXFPartitionPack& pack);

private:
  KLVFiller filler_;
  Locator* locator_;
  KLVStreamPadder* headerPadder_;
  KLVStreamPadder* indexPadder_;
  std::vector<MXFRandomIndexEntry> partitions_;
};

// Reports what is wrong with the partition structure of a file being read,
// and passes every event on.
class ZELTA_EXPORT MXFStructureValidator : public MXFStructureHandler {
public:
  explicit MXFStructureValidator(MXFStructureHandler* handler);
  ~MXFStructureValidator() override;
  MXFStructureValidator(const MXFStructureValidator&) = delete;
  MXFStructureValidator& operator=(const MXFStructureValidator&) = delete;

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  // Both optional: without a locator the offset checks are skipped.
  virtual void setErrorHandler(ErrorHandler* errorHandler);
  virtual void setLocator(Locator* locator);

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

// ---------------------------------------------------------------------------
// Sequential reader

// Reads a file from start to end into the four ports, with the structure
// validated. Every handler is optional and none is owned.
class ZELTA_EXPORT MXFReader {
public:
  MXFReader();
  virtual ~MXFReader();

  virtual void setSkipRunIn(bool skipRunIn);
  virtual void setStructureHandler(MXFStructureHandler* handler);
  virtual void setMetadataHandler(KLVHandler* handler);
  virtual void setIndexHandler(KLVHandler* handler);
  virtual void setEssenceHandler(KLVHandler* handler);
  virtual void setErrorHandler(ErrorHandler* errorHandler);
  virtual void read(std::istream& stream);

private:
  bool skipRunIn_ = false;
  MXFStructureHandler* structureHandler_ = nullptr;
  KLVHandler* metadataHandler_ = nullptr;
  KLVHandler* indexHandler_ = nullptr;
  KLVHandler* essenceHandler_ = nullptr;
  ErrorHandler* errorHandler_ = nullptr;
};

// Moves a stream to the first partition pack key behind a run-in.
class ZELTA_EXPORT MXFRunInSkipper {
public:
  MXFRunInSkipper();
  virtual ~MXFRunInSkipper();

  virtual void setErrorHandler(ErrorHandler* errorHandler);
  // The run-in's length; a run-in longer than maximum is "invalid run-in".
  virtual std::uint32_t skip(std::istream& stream, std::uint32_t maximum);

private:
  ErrorHandler* errorHandler_ = nullptr;
};

// Ends a read early, by exception: before the first element at or behind a
// stop position (StopPosition), or at the next partition pack
// (EndPartition). The handler behind it sees a clean end of stream.
class ZELTA_EXPORT MXFPartitionFilter : public DullKLVFilter {
public:
  class exception {};
  class StopPosition : public exception {};
  class EndPartition : public exception {};

  // A stop position of -1 is none.
  MXFPartitionFilter(KLVHandler* handler, std::streamoff stopPosition);

  // Where the last element ended, or the stream started.
  std::streamoff getLastPosition() const;

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;

private:
  void stopIfReached();
  void refresh();

  Locator* locator_ = nullptr;
  std::streamoff stopPosition_;
  std::streamoff lastPosition_ = -1;
  bool started_ = false;
};

// ---------------------------------------------------------------------------
// Index tables

inline constexpr MXFUID inconsistentIndexSegmentId = ZeltaErrorId(0x4C, 0x4C, 0x00, 0x08);
inline constexpr MXFUID missingIndexPropertyId = ZeltaErrorId(0x4C, 0x4C, 0x04, 0x03);
inline constexpr MXFUID invalidIndexPropertyId = ZeltaErrorId(0x4C, 0x4C, 0x04, 0x04);

inline constexpr KLVKey MXFIndexTableSegmentKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x02, 0x01, 0x01, 0x10,
                                 0x01, 0x00}};

struct ZELTA_EXPORT MXFDeltaEntry {
  std::int8_t posTableIndex = 0;
  std::uint8_t slice = 0;
  std::uint32_t elementDelta = 0;

  bool operator==(const MXFDeltaEntry& o) const {
    return posTableIndex == o.posTableIndex && slice == o.slice && elementDelta == o.elementDelta;
  }
  bool operator!=(const MXFDeltaEntry& o) const { return !(*this == o); }
};

// One edit unit; flags are left to the indexers to interpret.
struct ZELTA_EXPORT MXFIndexEntry {
  std::int8_t temporalOffset = 0;
  std::int8_t keyFrameOffset = 0;
  std::uint8_t flags = 0;
  std::uint64_t streamOffset = 0;
  std::vector<std::uint32_t> sliceOffsets;
  std::vector<MXFRational> posTable;

  bool operator==(const MXFIndexEntry& o) const {
    return temporalOffset == o.temporalOffset && keyFrameOffset == o.keyFrameOffset && flags == o.flags &&
           streamOffset == o.streamOffset && sliceOffsets == o.sliceOffsets && posTable == o.posTable;
  }
  bool operator!=(const MXFIndexEntry& o) const { return !(*this == o); }
};

// An all-zero instanceUID asks the coder for a fresh one.
struct ZELTA_EXPORT MXFIndexTableSegment {
  MXFUID instanceUID;
  MXFRational indexEditRate;
  std::int64_t indexStartPosition = 0;
  std::int64_t indexDuration = 0;
  std::uint32_t editUnitByteCount = 0;
  std::uint32_t indexSID = 0;
  std::uint32_t bodySID = 0;
  std::uint8_t sliceCount = 0;
  std::uint8_t posTableCount = 0;
  std::vector<MXFDeltaEntry> deltaEntryArray;
  std::vector<MXFIndexEntry> indexEntryArray;

  bool operator==(const MXFIndexTableSegment& o) const;
  bool operator!=(const MXFIndexTableSegment& o) const { return !(*this == o); }
};

class ZELTA_EXPORT MXFIndexHandler {
public:
  virtual ~MXFIndexHandler();
  virtual void startIndex() = 0;
  virtual void endIndex() = 0;
  // The handler copies what it keeps.
  virtual void indexTableSegment(const MXFIndexTableSegment& segment) = 0;
};

// Index table segments of an index region, by their own fixed tags whatever
// the partition's primer says.
class ZELTA_EXPORT MXFIndexParser : public MXFPrimedSetParser {
public:
  explicit MXFIndexParser(MXFIndexHandler* handler);

  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;

  const MXFTagToKeyMap& getPrimer() override;
  bool acceptSet(const KLVKey& key) override;
  void primedSet(const MXFPrimedSet& set) override;

private:
  void reportInconsistencies(const MXFIndexTableSegment& segment);

  MXFIndexHandler* handler_;
};

// Writes segments into a KLV handler, each but the last followed by fill up
// to the KAG.
class ZELTA_EXPORT MXFIndexCoder : public MXFIndexHandler {
public:
  explicit MXFIndexCoder(KLVHandler* handler);
  MXFIndexCoder(const MXFIndexCoder&) = delete;
  MXFIndexCoder& operator=(const MXFIndexCoder&) = delete;

  void startIndex() override;
  void endIndex() override;
  void indexTableSegment(const MXFIndexTableSegment& segment) override;

  virtual void setKagSize(std::uint32_t kagSize);
  // Whether editUnitByteCount, indexSID, sliceCount and indexEntryArray are
  // written also when zero or empty.
  virtual bool codesAllIndexProperties();

private:
  KLVMonitor monitor_;
  KLVFiller filler_;
  std::uint32_t kagSize_ = 512;
  bool open_ = false;
};

// ---------------------------------------------------------------------------
// Writer and multiplexer

// The four ports of a file being written, over one KLV handler: structure
// events reach the byte counter directly, the others pass a filter that hides
// their stream boundaries, metadata and index also a padder that keeps the
// byte counts that the partition pack promised.
class ZELTA_EXPORT MXFMuxer {
public:
  MXFMuxer();
  explicit MXFMuxer(KLVHandler* handler);
  virtual ~MXFMuxer();
  MXFMuxer(const MXFMuxer&) = delete;
  MXFMuxer& operator=(const MXFMuxer&) = delete;

  virtual void setHandler(KLVHandler* handler);  // not owned
  virtual KLVHandler* getHandler();
  virtual MXFStructureHandler* getStructureHandler();
  virtual KLVHandler* getMetadataHandler();
  virtual KLVHandler* getIndexHandler();
  virtual KLVHandler* getEssenceHandler();

private:
  std::unique_ptr<KLVMonitor> monitor_;
  std::unique_ptr<KLVStreamFilter> filter_;
  std::unique_ptr<KLVStreamPadder> metadataPadder_;
  std::unique_ptr<KLVStreamPadder> indexPadder_;
  std::unique_ptr<MXFStructureCoder> structureCoder_;
};

// A muxer bound to an output stream.
class ZELTA_EXPORT MXFWriter {
public:
  explicit MXFWriter(std::ostream& stream);
  virtual ~MXFWriter();
  MXFWriter(const MXFWriter&) = delete;
  MXFWriter& operator=(const MXFWriter&) = delete;

  virtual MXFStructureHandler* getStructureHandler();
  virtual KLVHandler* getMetadataHandler();
  virtual KLVHandler* getIndexHandler();
  virtual KLVHandler* getEssenceHandler();
  // Diverts the output, for instance to a verifying handler; not owned.
  virtual void setHandler(KLVHandler* handler);
  // Back to the writer on the stream.
  virtual void resetHandler();
  virtual KLVHandler* getHandler();

private:
  MXFMuxer muxer_;
  GenericKLVWriter writer_;
};

// ---------------------------------------------------------------------------
// Generic container: events
//
// A generic container is a run of edit units, each an optional system item
// and essence elements. Reading, the splitter calls these; writing, the
// muxer implements them, so that a reader pipes into a writer.

typedef std::vector<std::pair<std::uint16_t, ByteVector>> MXFGCLocalItems;
typedef std::vector<ByteVector> MXFGCVariableItems;

class ZELTA_EXPORT MXFGCStructureHandler {
public:
  virtual ~MXFGCStructureHandler();
  // kagSize is 0 when reading.
  virtual void start(std::uint64_t kagSize) = 0;
  virtual void end() = 0;
  virtual void startEditUnit() = 0;
  virtual void endEditUnit() = 0;
  // Writing only: how a producer of edit units asks for a layout.
  virtual void startSlice() = 0;
  virtual void endSlice() = 0;
  virtual void startPaddedElement(std::uint64_t paddedLength) = 0;
  virtual void endPaddedElement() = 0;
  virtual void startAlignedElement(std::uint64_t alignment) = 0;
  virtual void endAlignedElement() = 0;
};

class ZELTA_EXPORT MXFGCSystemHandler {
public:
  virtual ~MXFGCSystemHandler();
  // True when the element is wanted.
  virtual bool startSystemElement(const KLVKey& key) = 0;
  virtual void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) = 0;
  virtual void systemFixedPack(const KLVKey& key, const ByteVector& bytes) = 0;
  virtual void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) = 0;
};

class ZELTA_EXPORT MXFGCEssenceHandler {
public:
  virtual ~MXFGCEssenceHandler();
  // True when the element is wanted. The handler may point buffer at memory
  // of its own of at least length octets, which the value is read into.
  virtual bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) = 0;
  virtual void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) = 0;
  virtual void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) = 0;
  virtual void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) = 0;
  virtual void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) = 0;
  virtual void essenceLengthForm(std::uint8_t form) = 0;
};

// ---------------------------------------------------------------------------
// Generic container splitting

inline constexpr MXFUID invalidGCElementId = ZeltaErrorId(0x4C, 0x4D, 0x00, 0x01);
inline constexpr MXFUID nonStandardLengthFormId = ZeltaErrorId(0x4C, 0x4D, 0x00, 0x02);
inline constexpr MXFUID unexpectedGCElementId = ZeltaErrorId(0x4C, 0x4D, 0x00, 0x03);
inline constexpr MXFUID unsupportedGCElementLengthId = ZeltaErrorId(0x4C, 0x4D, 0x00, 0x04);

// Octet 5 of a system element says its set or pack coding, so the pattern
// leaves it free; octet 12 tells the kind of an element.
inline constexpr KLVKeyPattern MXFGCSystemElementPattern =
    KLVKeyPattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x00, 0x01, 0x00, 0x0D, 0x01, 0x03, 0x01,
                                               0x00, 0x00, 0x00, 0x00});
inline constexpr KLVKeyPattern MXFGCEssenceElementPattern =
    KLVKeyPattern(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x00, 0x0D, 0x01, 0x03, 0x01,
                                               0x00, 0x00, 0x00, 0x00});

// Octet 12: system 0x14 or 0x04, picture 0x15 or 0x05, sound 0x16 or 0x06,
// data 0x17 or 0x07, compound 0x18 only.
ZELTA_EXPORT bool isMXFGCSystemKey(const KLVKey& key);
ZELTA_EXPORT bool isMXFGCEssenceKey(const KLVKey& key);
ZELTA_EXPORT bool isMXFGCPictureKey(const KLVKey& key);
ZELTA_EXPORT bool isMXFGCSoundKey(const KLVKey& key);
ZELTA_EXPORT bool isMXFGCDataKey(const KLVKey& key);
ZELTA_EXPORT bool isMXFGCCompoundKey(const KLVKey& key);

class ZELTA_EXPORT DullMXFGCStructureHandler : public MXFGCStructureHandler {
public:
  void start(std::uint64_t kagSize) override;
  void end() override;
  void startEditUnit() override;
  void endEditUnit() override;
  void startSlice() override;
  void endSlice() override;
  void startPaddedElement(std::uint64_t paddedLength) override;
  void endPaddedElement() override;
  void startAlignedElement(std::uint64_t alignment) override;
  void endAlignedElement() override;
};

// Wants no element.
class ZELTA_EXPORT DullMXFGCSystemHandler : public MXFGCSystemHandler {
public:
  bool startSystemElement(const KLVKey& key) override;
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;
};

// Wants no element.
class ZELTA_EXPORT DullMXFGCEssenceHandler : public MXFGCEssenceHandler {
public:
  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void essenceLengthForm(std::uint8_t form) override;
};

// Turns the KLV stream of an essence container into edit units, system
// elements and essence elements. An edit unit starts wherever the first key
// of the stream comes again. Essence values are read straight into the
// handler's buffer, or else into the splitter's own; elements of 0x1000000
// octets or more need the handler's. Every handler is optional, none is
// owned. Defects of the stream are reported and skipped.
//
// Whatever buffer a client gives its std::ifstream, the reader reads a large
// value from the file straight into the handler's buffer; small values come
// out of the reader's read-ahead.
class ZELTA_EXPORT MXFGCSplitter : public DullKLVHandler {
public:
  MXFGCSplitter();
  MXFGCSplitter(MXFGCStructureHandler* structureHandler, MXFGCSystemHandler* systemHandler,
                MXFGCEssenceHandler* essenceHandler);
  ~MXFGCSplitter() override;
  MXFGCSplitter(const MXFGCSplitter&) = delete;
  MXFGCSplitter& operator=(const MXFGCSplitter&) = delete;

  // Requires lengths that can be trusted ("has accurate lengths").
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
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
  void value(const std::uint8_t* data, std::streamsize size) override;

  virtual void setStructureHandler(MXFGCStructureHandler* handler);
  virtual MXFGCStructureHandler* getStructureHandler() const;  // "structure handler is present"
  virtual void setSystemHandler(MXFGCSystemHandler* handler);
  virtual MXFGCSystemHandler* getSystemHandler() const;  // "system handler is present"
  virtual void setEssenceHandler(MXFGCEssenceHandler* handler);
  virtual MXFGCEssenceHandler* getEssenceHandler() const;  // "essence handler is present"
  virtual void setErrorHandler(ErrorHandler* errorHandler);

  // How the splitter classifies keys; a subclass may know more keys. The
  // kinds are asked in the order picture, sound, data, compound.
  virtual bool isSystemKey(const KLVKey& key) const;
  virtual bool isEssenceKey(const KLVKey& key) const;
  virtual bool isPictureKey(const KLVKey& key) const;
  virtual bool isSoundKey(const KLVKey& key) const;
  virtual bool isDataKey(const KLVKey& key) const;
  virtual bool isCompoundKey(const KLVKey& key) const;

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

// ---------------------------------------------------------------------------
// Generic container multiplexing
//
// Writing, a producer of edit units drives the three handlers of a muxer;
// fill is only ever written when a padded or aligned group ends, so the
// offsets of what follows a padded group are known from its length alone.

// Brings each group of elements to an exact length (padded) or to an
// alignment with one fill item at the group's end.
class ZELTA_EXPORT MXFGCStructurePadder : public MXFGCStructureHandler {
public:
  MXFGCStructurePadder(KLVHandler* handler, Locator* locator);
  MXFGCStructurePadder(const MXFGCStructurePadder&) = delete;
  MXFGCStructurePadder& operator=(const MXFGCStructurePadder&) = delete;

  // Starts the KLV stream; a KAG of 0 leaves aligned groups of alignment 0
  // unfilled.
  void start(std::uint64_t kagSize) override;
  void end() override;
  void startEditUnit() override;
  void endEditUnit() override;
  void startSlice() override;
  void endSlice() override;
  // A multiple of the KAG ("padded length is multiple of alignment").
  void startPaddedElement(std::uint64_t paddedLength) override;
  void endPaddedElement() override;
  // A multiple of the KAG ("alignment is multiple of KAG size"); 0 is the KAG.
  void startAlignedElement(std::uint64_t alignment) override;
  void endAlignedElement() override;

private:
  Locator* locator_;
  std::uint64_t kagSize_ = 0;
  KLVFiller filler_;
};

// Writes system elements as local sets, fixed length packs and variable
// length packs with four-octet BER lengths; the key's octet 5 says the
// coding of a set or pack.
class ZELTA_EXPORT MXFGCSystemCoder : public MXFGCSystemHandler {
public:
  explicit MXFGCSystemCoder(KLVHandler* handler);

  bool startSystemElement(const KLVKey& key) override;
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  // "valid variable length pack key"
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

private:
  KLVHandler* handler_;
};

// Writes each essence element as one individual item, straight from the
// caller's memory. The length form is the one last given to
// essenceLengthForm, or, while that is 0x80, 0x83 below 0x1000000 octets
// and 0x87 from there.
class ZELTA_EXPORT MXFGCEssenceCoder : public MXFGCEssenceHandler {
public:
  explicit MXFGCEssenceCoder(KLVHandler* handler);

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void essenceLengthForm(std::uint8_t form) override;

private:
  void writeElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length);

  KLVHandler* handler_;
  std::uint8_t lengthForm_ = KLVNoLengthForm;
};

// The KLV stream of an essence container from the three generic-container
// event streams; its locator gives the position in what it wrote.
class ZELTA_EXPORT MXFGCMuxer {
public:
  MXFGCMuxer();
  explicit MXFGCMuxer(KLVHandler* handler);
  virtual ~MXFGCMuxer();
  MXFGCMuxer(const MXFGCMuxer&) = delete;
  MXFGCMuxer& operator=(const MXFGCMuxer&) = delete;

  virtual void setHandler(KLVHandler* handler);  // not owned
  virtual KLVHandler* getHandler();
  virtual MXFGCStructureHandler* getStructureHandler();
  virtual MXFGCSystemHandler* getSystemHandler();
  virtual MXFGCEssenceHandler* getEssenceHandler();
  virtual Locator* getLocator();

private:
  std::unique_ptr<KLVMonitor> monitor_;
  std::unique_ptr<MXFGCStructurePadder> padder_;
  std::unique_ptr<MXFGCSystemCoder> systemCoder_;
  std::unique_ptr<MXFGCEssenceCoder> essenceCoder_;
};

// Stands in front of a muxer's structure handler and tells, when an edit
// unit has ended, where it started and where its slices after the first
// started, relative to it. Everything is passed on ("handler is present").
class ZELTA_EXPORT MXFGCIndexer : public MXFGCStructureHandler {
public:
  MXFGCIndexer(MXFGCStructureHandler* handler, Locator* locator);
  MXFGCIndexer(const MXFGCIndexer&) = delete;
  MXFGCIndexer& operator=(const MXFGCIndexer&) = delete;

  void start(std::uint64_t kagSize) override;
  void end() override;
  void startEditUnit() override;
  // Called after the next handler has ended the edit unit, so after its
  // fill.
  void endEditUnit() override;
  void startSlice() override;
  void endSlice() override;
  void startPaddedElement(std::uint64_t paddedLength) override;
  void endPaddedElement() override;
  void startAlignedElement(std::uint64_t alignment) override;
  void endAlignedElement() override;

  virtual void indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) = 0;

private:
  MXFGCStructureHandler* next();
  std::uint64_t position();

  MXFGCStructureHandler* handler_;
  Locator* locator_;
  std::uint64_t editUnitOffset_ = 0;
  std::vector<std::uint32_t> sliceOffsets_;
  bool firstSlice_ = false;
};

#endif
