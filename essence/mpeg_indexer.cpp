#include "essence/mpeg_indexer.h"

#include <cstring>

namespace {

constexpr std::uint8_t intraPicture = 1;
constexpr std::uint8_t predictedPicture = 2;
constexpr std::uint8_t bidirectionalPicture = 3;

constexpr std::uint8_t randomAccessFlag = 0x80;
constexpr std::uint8_t sequenceHeaderFlag = 0x40;
constexpr std::uint8_t predictedFlags = 0x22;
constexpr std::uint8_t bidirectionalFlags = 0x33;
constexpr std::uint8_t backwardOnlyFlags = 0x13;
constexpr std::uint8_t foreignReferenceFlag = 0x08;
constexpr std::uint8_t referencePictureFlag = 0x04;

constexpr std::uint8_t sequenceHeaderCode = 0xB3;
constexpr std::uint8_t groupOfPicturesCode = 0xB8;
constexpr std::uint8_t pictureCode = 0x00;

// An index entry holds signed octets.
std::int8_t cut(std::int64_t value) { return static_cast<std::int8_t>(static_cast<std::uint8_t>(value)); }

}  // namespace

// ---------------------------------------------------------------------------
// The calculation

// The state is left as it was when the type is refused.
void MPEGIndexer::addPicture(const Picture& picture) {
  check(picture.pictureType >= intraPicture && picture.pictureType <= bidirectionalPicture,
        "expected MPEG-2 picture_coding_type");
  ++position_;
  flags_ = picture.reference ? referencePictureFlag : 0;
  switch (picture.pictureType) {
    case intraPicture:
      // An I picture of an open GOP is no key of its own: its leading B
      // pictures need the previous GOP.
      if (picture.closed) {
        keyPosition_ = position_;
        if (picture.sequenceHeader) flags_ |= randomAccessFlag;
      } else {
        keyPosition_ = intraPosition_;
      }
      if (picture.sequenceHeader) flags_ |= sequenceHeaderFlag;
      intraPosition_ = position_;
      anchorPosition_ = position_;
      anchorDisplayPosition_ = picture.displayIndex + position_;
      break;
    case predictedPicture:
      flags_ |= predictedFlags;
      anchorPosition_ = position_;
      anchorDisplayPosition_ = picture.displayIndex + intraPosition_;
      keyPosition_ = intraPosition_;
      break;
    case bidirectionalPicture:
      flags_ |= anchorPosition_ == keyPosition_ ? backwardOnlyFlags : bidirectionalFlags;
      if (keyPosition_ < 0) flags_ |= foreignReferenceFlag;
      break;
  }
}

// Stored order puts a B picture right after the anchor that is displayed
// after it, so B pictures move by 1 and the anchor's own entry jumps back.
MXFIndexEntry MPEGIndexer::indexEntry(std::uint64_t streamOffset, const std::vector<std::uint32_t>& sliceOffsets) const {
  MXFIndexEntry entry;
  entry.temporalOffset = anchorDisplayPosition_ == position_ ? cut(anchorPosition_ - position_) : 1;
  entry.keyFrameOffset = intraPosition_ != position_ ? cut(keyPosition_ - position_) : 0;
  entry.flags = flags_;
  entry.streamOffset = streamOffset;
  entry.sliceOffsets = sliceOffsets;
  return entry;
}

// ---------------------------------------------------------------------------
// The MPEG-2 picture scan

namespace zelta {

// Every 00 00 01 xx of the buffer in order, as a window of its last four
// octets would see them; 01 is rare in coded data, so it is searched for.
MPEGIndexer::Picture scanMPEG2Picture(const std::uint8_t* data, std::uint64_t length) {
  MPEGIndexer::Picture picture;
  const std::uint8_t* const end = data + length;
  const std::uint8_t* from = length >= 2 ? data + 2 : end;
  while (from < end) {
    const auto* one = static_cast<const std::uint8_t*>(std::memchr(from, 0x01, static_cast<std::size_t>(end - from)));
    if (!one || one + 1 == end) break;
    from = one + 1;
    if (one[-1] != 0 || one[-2] != 0) continue;
    const std::uint8_t* const header = one + 2;
    const std::uint64_t available = static_cast<std::uint64_t>(end - header);
    switch (*from) {
      case sequenceHeaderCode:
        picture.sequenceHeader = true;
        break;
      case groupOfPicturesCode:
        // After the 25 bits of the time code.
        check(available >= 4, "valid MPEG-2 group_of_pictures_header");
        picture.closed = (header[3] & 0x40) != 0;
        picture.brokenLink = (header[3] & 0x20) != 0;
        break;
      case pictureCode:
        check(available >= 2, "valid MPEG-2 picture_header");
        picture.displayIndex = static_cast<std::uint16_t>((header[0] << 2) | (header[1] >> 6));
        picture.pictureType = static_cast<std::uint8_t>((header[1] >> 3) & 0x07);
        return picture;
      default:
        break;
    }
  }
  check(false, "valid MPEG-2 frame buffer");
  return picture;
}

}  // namespace zelta

// ---------------------------------------------------------------------------
// MXFMPEGIndexer

MXFMPEGIndexer::MXFMPEGIndexer(MXFGCStructureHandler* structureHandler, MXFGCEssenceHandler* essenceHandler,
                               Locator* locator, MXFIndexTableSegment* segment)
    : MXFGCIndexer(structureHandler, locator), essenceHandler_(essenceHandler), segment_(segment) {}

MXFGCEssenceHandler* MXFMPEGIndexer::nextEssence() {
  check(essenceHandler_ != nullptr, "handler is present");
  return essenceHandler_;
}

bool MXFMPEGIndexer::startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return nextEssence()->startEssenceElement(key, length, buffer);
}

// The picture is taken before the element goes on: a frame that can't be
// indexed is not written.
void MXFMPEGIndexer::pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  if (key == MXFMPEGPictureElementKey) calculation_.addPicture(zelta::scanMPEG2Picture(data, length));
  nextEssence()->pictureElement(key, data, length);
}

void MXFMPEGIndexer::soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  nextEssence()->soundElement(key, data, length);
}

void MXFMPEGIndexer::dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  nextEssence()->dataElement(key, data, length);
}

void MXFMPEGIndexer::compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  nextEssence()->compoundElement(key, data, length);
}

void MXFMPEGIndexer::essenceLengthForm(std::uint8_t form) { nextEssence()->essenceLengthForm(form); }

void MXFMPEGIndexer::indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) {
  check(segment_ != nullptr, "segment is present");
  segment_->indexEntryArray.push_back(calculation_.indexEntry(editUnitOffset, sliceOffsets));
  ++segment_->indexDuration;
}
