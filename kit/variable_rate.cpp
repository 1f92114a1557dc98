// The variable rate road: long-GOP pictures of any size, each aligned on
// its own, indexed by what their bitstream says. Body partitions begin at a
// GOP about every ten seconds; AVC and a deferred index keep every segment
// for the footer.
#include "essence/mpeg_indexer.h"
#include "kit/driver_impl.h"

namespace zelta {

namespace {

constexpr std::uint64_t pictureAlignment = 2048;
constexpr std::uint64_t partitionSeconds = 10;

std::uint64_t getPartitionTarget(const MXFRational& rate) {
  const std::uint64_t numerator = static_cast<std::uint64_t>(rate.numerator) * partitionSeconds;
  const auto denominator = static_cast<std::uint64_t>(rate.denominator);
  return (numerator + denominator - 1) / denominator;
}

}  // namespace

void ZeltaDriverImpl::startVariableRate() {
  indexDeferred_ = source_->isIndexDeferred();
  const MXFRational rate = master_->getEditRate();
  bodyIndexByteCount_ = getBodyIndexByteCount(rate);
  writer_->setIndexKagSize(bodyIndexByteCount_);
  partitionTarget_ = getPartitionTarget(rate);
  unitsInPartition_ = 0;
  gopParser_ = AVCAccessUnitParser();
  segments_.clear();
  bodyKey_ = MXFPartitionPackKey(MXFBodyPartition, isDurationKnown() ? MXFClosedComplete : MXFClosedIncomplete);

  segment_ = MXFIndexTableSegment{};
  segment_.instanceUID = uids_->generate();
  segment_.indexEditRate = rate;
  segment_.indexSID = master_->getIndexSID();
  segment_.bodySID = master_->getBodySID();
  segment_.deltaEntryArray.push_back(MXFDeltaEntry{});
  segment_.deltaEntryArray.push_back(MXFDeltaEntry{0, 0, static_cast<std::uint32_t>(systemItemSize)});
  std::uint64_t delta = 0;
  for (std::size_t i = 1; i < layout_.size(); ++i) {
    segment_.deltaEntryArray.push_back(MXFDeltaEntry{0, 1, static_cast<std::uint32_t>(delta)});
    delta += layout_[i].paddedSize;
  }
  segment_.sliceCount = layout_.size() > 1 ? 1 : 0;

  Locator* locator = writer_->getLocator(master_->getBodySID());
  if (format_ == ZeltaEssenceFormat::AVC) {
    avcIndexer_ = std::make_unique<MXFAVCIndexer>(writer_->getGCStructureHandler(), writer_->getEssenceHandler(),
                                                  locator, &segment_);
    gc_ = avcIndexer_.get();
    essence_ = avcIndexer_.get();
  } else {
    mpegIndexer_ = std::make_unique<MXFMPEGIndexer>(writer_->getGCStructureHandler(), writer_->getEssenceHandler(),
                                                    locator, &segment_);
    gc_ = mpegIndexer_.get();
    essence_ = mpegIndexer_.get();
  }

  // The header partition carries essence for AVC alone, and never index;
  // the body partitions take their SIDs from the segment.
  if (format_ != ZeltaEssenceFormat::AVC) pack_.bodySID = 0;
  pack_.indexSID = 0;
  startHeader(getVariableRateHeaderByteCount(*master_, format_), 0);
  if (format_ != ZeltaEssenceFormat::AVC) startBodyPartition(nullptr);
  gc_->start(driverKagSize);
}

void ZeltaDriverImpl::startBodyPartition(const MXFIndexTableSegment* index) {
  pack_.headerByteCount = 0;
  pack_.indexByteCount = index ? bodyIndexByteCount_ : 0;
  pack_.indexSID = index ? segment_.indexSID : 0;
  pack_.bodySID = segment_.bodySID;
  pack_.bodyOffset = static_cast<std::uint64_t>(std::streamoff(writer_->getLocator(pack_.bodySID)->getPosition()));
  writer_->getStructureHandler()->startPartition(bodyKey_, pack_, partitionPackLength);
  if (index) {
    MXFIndexHandler* handler = writer_->getIndexHandler();
    handler->startIndex();
    handler->indexTableSegment(*index);
    handler->endIndex();
  }
}

bool ZeltaDriverImpl::startsGOP(const ZeltaBuffer* picture) {
  const std::uint8_t* data = picture ? picture->getData() : nullptr;
  const std::uint64_t size = picture ? picture->getSize() : 0;
  if (format_ == ZeltaEssenceFormat::AVC) return gopParser_.parse(data, size).pictureOrderCount == 0;
  return scanMPEG2Picture(data, size).pictureType == 1;
}

void ZeltaDriverImpl::cutPartition() {
  if (avcIndexer_) avcIndexer_->flushIndex();
  const MXFIndexTableSegment finished = segment_;
  segment_.instanceUID = uids_->generate();
  segment_.indexStartPosition = static_cast<std::int64_t>(count_);
  segment_.indexDuration = 0;
  segment_.indexEntryArray.clear();
  unitsInPartition_ = 0;
  if (format_ == ZeltaEssenceFormat::AVC || indexDeferred_) {
    segments_.push_back(finished);
    return;
  }
  writer_->getStructureHandler()->endPartition(bodyKey_);
  startBodyPartition(&finished);
}

void ZeltaDriverImpl::writeVariableRateEditUnit() {
  const ElementSlot& pictureSlot = layout_.front();
  const std::shared_ptr<ZeltaBuffer> picture = fetch(pictureSlot);
  // AVC's order counts run on from picture to picture, so the parser sees
  // every one.
  const bool inWindow = partitionTarget_ < master_->getMaxGOP() + unitsInPartition_;
  const bool gopStart = (format_ == ZeltaEssenceFormat::AVC || inWindow) && startsGOP(picture.get());
  if (inWindow && gopStart && unitsInPartition_ > 0) cutPartition();

  gc_->startEditUnit();
  gc_->startSlice();
  writeSystemItem();
  gc_->startAlignedElement(pictureAlignment);
  writeElement(pictureSlot, picture.get());
  gc_->endAlignedElement();
  if (layout_.size() > 1) {
    gc_->endSlice();
    gc_->startSlice();
    writePaddedElements(1);
  }
  gc_->endSlice();
  gc_->endEditUnit();
  ++count_;
  ++unitsInPartition_;
}

void ZeltaDriverImpl::finishVariableRate() {
  MXFStructureHandler* structure = writer_->getStructureHandler();
  gc_->end();
  if (format_ != ZeltaEssenceFormat::AVC) structure->endPartition(bodyKey_);
  if (avcIndexer_) avcIndexer_->flushIndex();
  segments_.push_back(segment_);

  const bool closed = isHeaderClosed();
  pack_.bodyOffset = 0;
  pack_.bodySID = 0;
  pack_.footerPartition = 0;
  pack_.indexByteCount =
      format_ == ZeltaEssenceFormat::AVC ? avcFooterIndexByteCount : segments_.size() * bodyIndexByteCount_;
  pack_.indexSID = segment_.indexSID;
  pack_.headerByteCount = closed ? 0 : getVariableRateHeaderByteCount(*master_, format_);
  const KLVKey footerKey = MXFPartitionPackKey(MXFFooterPartition, MXFClosedComplete);
  startFooter(footerKey);
  MXFIndexHandler* index = writer_->getIndexHandler();
  index->startIndex();
  for (const MXFIndexTableSegment& segment : segments_) index->indexTableSegment(segment);
  index->endIndex();
  structure->endPartition(footerKey);
  endStream();
}

}  // namespace zelta
