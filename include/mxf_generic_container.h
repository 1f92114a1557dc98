// Zelta: the generic container: its events, splitting and multiplexing.
// Part of mxf.h, which includes it.
#ifndef ZELTA_INCLUDE_MXF_GENERIC_CONTAINER_H
#define ZELTA_INCLUDE_MXF_GENERIC_CONTAINER_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "mxf_writer.h"

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
