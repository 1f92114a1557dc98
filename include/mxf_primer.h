// Zelta: the primer, primed sets, and the parser and coder of header
// metadata. Part of mxf.h, which includes it.
#ifndef ZELTA_INCLUDE_MXF_PRIMER_H
#define ZELTA_INCLUDE_MXF_PRIMER_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "mxf_structure.h"

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

#endif
