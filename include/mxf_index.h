// Zelta: index table segments, their parser and their coder. Part of mxf.h,
// which includes it.
#ifndef ZELTA_INCLUDE_MXF_INDEX_H
#define ZELTA_INCLUDE_MXF_INDEX_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <vector>

#include "mxf_reader.h"

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

#endif
