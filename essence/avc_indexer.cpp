#include "essence/avc_indexer.h"

#include <algorithm>
#include <numeric>
#include <vector>

namespace {

constexpr std::uint32_t nonIDRSlice = 1;
constexpr std::uint32_t idrSlice = 5;
constexpr std::uint32_t sequenceParameterSet = 7;
constexpr std::uint32_t pictureParameterSet = 8;
constexpr std::uint32_t accessUnitDelimiter = 9;

constexpr std::uint8_t intraPicture = 1;
// MPEG-2 picture_coding_type by slice_type: P, B, I, SP, SI twice.
constexpr std::uint8_t pictureTypeOfSlice[10] = {2, 3, 1, 2, 1, 2, 3, 1, 2, 1};

// The expected delta method multiplies values of the stream: a count that
// leaves 64 bits is no stream to follow.
std::int64_t sum(std::int64_t a, std::int64_t b) {
  std::int64_t result = 0;
  check(!__builtin_add_overflow(a, b, &result), "valid picture order count");
  return result;
}

std::int64_t product(std::int64_t a, std::int64_t b) {
  std::int64_t result = 0;
  check(!__builtin_mul_overflow(a, b, &result), "valid picture order count");
  return result;
}

}  // namespace

// ---------------------------------------------------------------------------
// Access units

namespace zelta {

// Only the first slice is read: it decides for the picture, and an access
// unit delimiter before it has said I only until then.
AVCPicture AVCAccessUnitParser::parse(const std::uint8_t* data, std::uint64_t length) {
  AVCBitReader reader(data, static_cast<std::size_t>(length));
  AVCPicture result;
  MPEGIndexer::Picture& picture = result.picture;
  std::uint32_t refIdc = 0;
  std::uint32_t type = 0;
  for (;;) {
    check(reader.findStartCode(), "valid AVC access unit");
    check(reader.remaining() > 0 && (reader.peek() & 0x80) == 0, "valid AVC NAL");
    reader.enterNAL();
    reader.bits(1);  // forbidden_zero_bit
    refIdc = reader.bits(2);
    type = reader.bits(5);
    if (type == nonIDRSlice || type == idrSlice) break;
    switch (type) {
      case sequenceParameterSet:
        picture.sequenceHeader = true;
        sets_.readSequenceParameterSet(reader);
        break;
      case pictureParameterSet:
        sets_.readPictureParameterSet(reader);
        break;
      case accessUnitDelimiter:
        check(reader.remaining() > 0, "valid AVC Access unit delimiter");
        if (reader.bits(3) == 0) picture.pictureType = intraPicture;  // primary_pic_type
        break;
      default:
        break;
    }
    reader.leaveNAL();
  }
  const bool idr = type == idrSlice;
  picture.closed = idr;
  picture.reference = refIdc != 0;
  const AVCSliceHeader slice = sets_.readSliceHeader(reader, idr, picture.reference);
  if (slice.sliceType < 10) picture.pictureType = pictureTypeOfSlice[slice.sliceType];
  result.pictureOrderCount = pictureOrderCount(slice, idr, picture.reference);
  return result;
}

// A frame takes the lesser of its two fields' counts.
std::int64_t AVCAccessUnitParser::pictureOrderCount(const AVCSliceHeader& slice, bool idr, bool reference) {
  const AVCSequenceParameterSet& sequence = *slice.sequenceSet;
  std::int64_t top = 0;
  std::int64_t bottom = 0;
  switch (sequence.picOrderCntType) {
    case 0: {
      if (idr) previousMsb_ = previousLsb_ = 0;
      const std::int64_t maxLsb = std::int64_t(1) << sequence.log2MaxPicOrderCntLsb;
      const std::int64_t lsb = slice.picOrderCntLsb;
      std::int64_t msb = previousMsb_;
      if (lsb < previousLsb_ && previousLsb_ - lsb >= maxLsb / 2)
        msb += maxLsb;
      else if (lsb > previousLsb_ && lsb - previousLsb_ > maxLsb / 2)
        msb -= maxLsb;
      top = msb + lsb;
      bottom = slice.fieldPic ? top : top + slice.deltaPicOrderCntBottom;
      // Only reference pictures carry the count to the next.
      if (reference) {
        previousMsb_ = slice.resetsMemory ? 0 : msb;
        previousLsb_ = slice.resetsMemory ? (slice.bottomField ? 0 : top) : lsb;
      }
      break;
    }
    case 1: {
      const std::int64_t offset = frameNumOffset(slice, idr);
      const std::vector<std::int32_t>& cycle = sequence.offsetForRefFrame;
      const std::int64_t cycleLength = static_cast<std::int64_t>(cycle.size());
      std::int64_t frame = cycle.empty() ? 0 : offset + slice.frameNum;
      if (!reference && frame > 0) --frame;
      std::int64_t expected = 0;
      if (frame > 0) {
        std::int64_t deltaPerCycle = 0;
        for (std::int32_t delta : cycle) deltaPerCycle = sum(deltaPerCycle, delta);
        expected = product((frame - 1) / cycleLength, deltaPerCycle);
        for (std::int64_t i = 0; i <= (frame - 1) % cycleLength; ++i) expected = sum(expected, cycle[i]);
      }
      if (!reference) expected = sum(expected, sequence.offsetForNonRefPic);
      if (!slice.fieldPic) {
        top = sum(expected, slice.deltaPicOrderCnt[0]);
        bottom = sum(sum(top, sequence.offsetForTopToBottomField), slice.deltaPicOrderCnt[1]);
      } else if (!slice.bottomField) {
        top = sum(expected, slice.deltaPicOrderCnt[0]);
      } else {
        bottom = sum(sum(expected, sequence.offsetForTopToBottomField), slice.deltaPicOrderCnt[0]);
      }
      carryFrameNum(slice, offset);
      break;
    }
    case 2: {
      const std::int64_t offset = frameNumOffset(slice, idr);
      if (!idr) top = 2 * (offset + slice.frameNum) - (reference ? 0 : 1);
      bottom = top;
      carryFrameNum(slice, offset);
      break;
    }
    default:
      check(false, "supported pic_order_cnt_type");
  }
  if (slice.fieldPic) return slice.bottomField ? bottom : top;
  return std::min(top, bottom);
}

// FrameNumOffset: frame_num wraps at MaxFrameNum.
std::int64_t AVCAccessUnitParser::frameNumOffset(const AVCSliceHeader& slice, bool idr) const {
  if (idr) return 0;
  const std::int64_t maxFrameNum = std::int64_t(1) << slice.sequenceSet->log2MaxFrameNum;
  return previousFrameNum_ > slice.frameNum ? previousFrameNumOffset_ + maxFrameNum : previousFrameNumOffset_;
}

void AVCAccessUnitParser::carryFrameNum(const AVCSliceHeader& slice, std::int64_t offset) {
  previousFrameNum_ = slice.frameNum;
  previousFrameNumOffset_ = slice.resetsMemory ? 0 : offset;
}

}  // namespace zelta

// ---------------------------------------------------------------------------
// MXFAVCIndexer

class ZELTA_LOCAL MXFAVCIndexer::Impl {
public:
  Impl(MXFGCEssenceHandler* essenceHandler, MXFIndexTableSegment* segment)
      : essenceHandler_(essenceHandler), segment_(segment) {}

  MXFGCEssenceHandler* nextEssence();
  void addPicture(const std::uint8_t* data, std::uint64_t length);
  void indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets);
  void flush(bool streamEnds);

private:
  // A picture whose entry waits for the display order of its GOP; its
  // offset is -1 until its edit unit has ended.
  struct PendingPicture {
    zelta::AVCPicture picture;
    std::int64_t streamOffset = -1;
    std::vector<std::uint32_t> sliceOffsets;
  };

  MXFGCEssenceHandler* essenceHandler_;
  MXFIndexTableSegment* segment_;
  zelta::AVCAccessUnitParser parser_;
  std::vector<PendingPicture> pending_;
  std::vector<std::size_t> displayOrder_;
  MPEGIndexer calculation_;
};

MXFGCEssenceHandler* MXFAVCIndexer::Impl::nextEssence() {
  check(essenceHandler_ != nullptr, "handler is present");
  return essenceHandler_;
}

void MXFAVCIndexer::Impl::addPicture(const std::uint8_t* data, std::uint64_t length) {
  PendingPicture pending;
  pending.picture = parser_.parse(data, length);
  pending_.push_back(std::move(pending));
}

// A count of 0 starts a GOP, and with it the display order of the previous
// one is complete.
void MXFAVCIndexer::Impl::indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) {
  check(!pending_.empty() && pending_.back().streamOffset == -1, "has picture element");
  PendingPicture& last = pending_.back();
  last.streamOffset = static_cast<std::int64_t>(editUnitOffset);
  last.sliceOffsets = sliceOffsets;
  if (last.picture.pictureOrderCount == 0) flush(false);
}

// Display indexes are the ranks of the counts; the entries go out in stored
// order.
void MXFAVCIndexer::Impl::flush(bool streamEnds) {
  check(segment_ != nullptr, "segment is present");
  std::size_t count = pending_.size();
  if (!streamEnds && count > 0 && pending_.back().picture.pictureOrderCount == 0) --count;
  // Equal counts keep their stored order; the order's memory is kept from
  // one GOP to the next.
  displayOrder_.resize(count);
  std::iota(displayOrder_.begin(), displayOrder_.end(), std::size_t(0));
  std::sort(displayOrder_.begin(), displayOrder_.end(), [this](std::size_t a, std::size_t b) {
    const std::int64_t countA = pending_[a].picture.pictureOrderCount;
    const std::int64_t countB = pending_[b].picture.pictureOrderCount;
    return countA < countB || (countA == countB && a < b);
  });
  for (std::size_t rank = 0; rank < count; ++rank)
    pending_[displayOrder_[rank]].picture.picture.displayIndex = static_cast<std::uint16_t>(rank);
  for (std::size_t i = 0; i < count; ++i) {
    calculation_.addPicture(pending_[i].picture.picture);
    segment_->indexEntryArray.push_back(
        calculation_.indexEntry(static_cast<std::uint64_t>(pending_[i].streamOffset), pending_[i].sliceOffsets));
    ++segment_->indexDuration;
  }
  pending_.erase(pending_.begin(), pending_.begin() + static_cast<std::ptrdiff_t>(count));
}

MXFAVCIndexer::MXFAVCIndexer(MXFGCStructureHandler* structureHandler, MXFGCEssenceHandler* essenceHandler,
                             Locator* locator, MXFIndexTableSegment* segment)
    : MXFGCIndexer(structureHandler, locator), impl_(new Impl(essenceHandler, segment)) {}

MXFAVCIndexer::~MXFAVCIndexer() = default;

bool MXFAVCIndexer::startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return impl_->nextEssence()->startEssenceElement(key, length, buffer);
}

// The access unit is read before the element goes on: one that can't be
// indexed is not written.
void MXFAVCIndexer::pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  if (key == MXFMPEGPictureElementKey) impl_->addPicture(data, length);
  impl_->nextEssence()->pictureElement(key, data, length);
}

void MXFAVCIndexer::soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  impl_->nextEssence()->soundElement(key, data, length);
}

void MXFAVCIndexer::dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  impl_->nextEssence()->dataElement(key, data, length);
}

void MXFAVCIndexer::compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  impl_->nextEssence()->compoundElement(key, data, length);
}

void MXFAVCIndexer::essenceLengthForm(std::uint8_t form) { impl_->nextEssence()->essenceLengthForm(form); }

void MXFAVCIndexer::indexEditUnit(std::uint64_t editUnitOffset, const std::vector<std::uint32_t>& sliceOffsets) {
  impl_->indexEditUnit(editUnitOffset, sliceOffsets);
}

void MXFAVCIndexer::flushIndex() { impl_->flush(true); }
