// Zelta: index entries of long-GOP pictures, MPEG-2 and AVC. Part of mxf.h,
// which includes it.
#ifndef ZELTA_INCLUDE_MXF_PICTURE_INDEX_H
#define ZELTA_INCLUDE_MXF_PICTURE_INDEX_H

#include <cstdint>
#include <memory>
#include <vector>

#include "mxf_generic_container.h"
#include "mxf_index.h"

// ---------------------------------------------------------------------------
// Long-GOP picture indexing
//
// A writer of a long-GOP stream learns from the bitstream what an index
// entry needs: the picture type, the display order and where GOPs start.

// The only picture element key whose value is parsed.
inline constexpr KLVKey MXFMPEGPictureElementKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x02, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x15, 0x01,
                                 0x05, 0x00}};

// The index entries of pictures taken one by one in stored order; MPEG-2 and
// AVC share it. Positions count pictures from 0 and stand at -1 before the
// first.
class ZELTA_EXPORT MPEGIndexer {
public:
  // What the bitstream says of one picture.
  struct Picture {
    bool sequenceHeader = false;     // sequence header, or AVC sequence parameter set
    bool closed = false;             // closed GOP, or AVC IDR picture
    bool brokenLink = false;         // MPEG-2 only, and of no use here
    bool reference = false;          // AVC only: nal_ref_idc is not 0
    std::uint8_t pictureType = 0;    // 1 I, 2 P, 3 B, as MPEG-2 picture_coding_type
    std::uint16_t displayIndex = 0;  // temporal_reference, or the AVC rank in its GOP
  };

  // The next picture ("expected MPEG-2 picture_coding_type").
  void addPicture(const Picture& picture);
  // The entry of the last picture added; both offsets are cut to 8 bits.
  MXFIndexEntry indexEntry(std::uint64_t streamOffset, const std::vector<std::uint32_t>& sliceOffsets) const;

  std::int64_t getPosition() const { return position_; }
  std::int64_t getKeyPosition() const { return keyPosition_; }
  std::int64_t getIntraPosition() const { return intraPosition_; }
  std::int64_t getAnchorPosition() const { return anchorPosition_; }
  std::int64_t getAnchorDisplayPosition() const { return anchorDisplayPosition_; }
  std::uint8_t getFlags() const { return flags_; }

private:
  std::int64_t position_ = -1;
  std::int64_t keyPosition_ = -1;
  std::int64_t intraPosition_ = -1;
  std::int64_t anchorPosition_ = -1;
  std::int64_t anchorDisplayPosition_ = -1;
  std::uint8_t flags_ = 0;
};

// Stands between a producer of edit units and a muxer: passes every event
// on unchanged, and appends one entry per edit unit to the segment, raising
// its indexDuration. The picture of an edit unit is read from its MPEG-2
// picture element as it passes ("valid MPEG-2 frame buffer").
class ZELTA_EXPORT MXFMPEGIndexer : public MXFGCIndexer, public MXFGCEssenceHandler {
public:
  // Nothing is owned; the segment must outlive the indexer.
  MXFMPEGIndexer(MXFGCStructureHandler* structureHandler, MXFGCEssenceHandler* essenceHandler, Locator* locator,
                 MXFIndexTableSegment* segment);

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void essenceLengthForm(std::uint8_t form) override;

  void indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) override;

private:
  MXFGCEssenceHandler* nextEssence();

  MXFGCEssenceHandler* essenceHandler_;
  MXFIndexTableSegment* segment_;
  MPEGIndexer calculation_;
};

// The same for AVC access units ("valid AVC access unit"). Display order is
// known only when the next GOP begins, so entries come a GOP late, and those
// of the last GOP only from flushIndex.
class ZELTA_EXPORT MXFAVCIndexer : public MXFGCIndexer, public MXFGCEssenceHandler {
public:
  MXFAVCIndexer(MXFGCStructureHandler* structureHandler, MXFGCEssenceHandler* essenceHandler, Locator* locator,
                MXFIndexTableSegment* segment);
  ~MXFAVCIndexer() override;
  MXFAVCIndexer(const MXFAVCIndexer&) = delete;
  MXFAVCIndexer& operator=(const MXFAVCIndexer&) = delete;

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void essenceLengthForm(std::uint8_t form) override;

  // "has picture element": the edit unit's access unit came first.
  void indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) override;

  // Appends the entries of the pictures still held; once, when the stream
  // ends, before the segment is used.
  virtual void flushIndex();

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

#endif
