// The constant rate road: every element has its room fixed at start, so one
// index segment with an edit unit byte count describes the whole file.
#include "kit/driver_impl.h"

namespace zelta {

void ZeltaDriverImpl::startConstantRate() {
  gc_ = writer_->getGCStructureHandler();
  essence_ = writer_->getEssenceHandler();

  segment_ = MXFIndexTableSegment{};
  segment_.instanceUID = uids_->generate();
  segment_.indexEditRate = master_->getEditRate();
  segment_.indexDuration = isDurationKnown() ? static_cast<std::int64_t>(master_->getDuration()) : 0;
  segment_.indexSID = pack_.indexSID;
  segment_.bodySID = pack_.bodySID;
  std::uint64_t delta = systemItemSize;
  segment_.deltaEntryArray.push_back(MXFDeltaEntry{});
  for (const ElementSlot& slot : layout_) {
    segment_.deltaEntryArray.push_back(MXFDeltaEntry{0, 0, static_cast<std::uint32_t>(delta)});
    delta += slot.paddedSize;
  }
  segment_.editUnitByteCount = static_cast<std::uint32_t>(delta);

  const std::uint64_t headerByteCount = getConstantRateHeaderByteCount(*master_, format_);
  pack_.footerPartition = isDurationKnown()
                              ? headerByteCount + constantRateIndexByteCount +
                                    master_->getDuration() * segment_.editUnitByteCount + partitionPackLength
                              : 0;
  startHeader(headerByteCount, constantRateIndexByteCount);
  MXFIndexHandler* index = writer_->getIndexHandler();
  index->startIndex();
  index->indexTableSegment(segment_);
  index->endIndex();
  gc_->start(driverKagSize);
}

void ZeltaDriverImpl::writeConstantRateEditUnit() {
  gc_->startEditUnit();
  gc_->startSlice();
  writeSystemItem();
  writePaddedElements(0);
  gc_->endSlice();
  gc_->endEditUnit();
  ++count_;
}

void ZeltaDriverImpl::finishConstantRate() {
  MXFStructureHandler* structure = writer_->getStructureHandler();
  gc_->end();
  structure->endPartition(headerKey_);
  check(segment_.editUnitByteCount != 0, "non-zero editUnitByteCount");

  const bool known = isDurationKnown();
  const bool closed = isHeaderClosed();
  pack_.footerPartition = known ? pack_.headerByteCount + pack_.indexByteCount +
                                      master_->getDuration() * segment_.editUnitByteCount + partitionPackLength
                                : 0;
  pack_.bodyOffset = 0;
  pack_.bodySID = 0;
  KLVKey footerKey = MXFPartitionPackKey(MXFFooterPartition, known ? MXFClosedComplete : MXFClosedIncomplete);
  pack_.indexByteCount = 0;
  pack_.indexSID = 0;
  switch (format_) {
    case ZeltaEssenceFormat::MPEG:
    case ZeltaEssenceFormat::Raw:
      pack_.headerByteCount = getConstantRateHeaderByteCount(*master_, format_);
      break;
    case ZeltaEssenceFormat::AVC:
      pack_.headerByteCount = closed ? 0 : avcHeaderByteCount;
      break;
    default:
      footerKey = MXFPartitionPackKey(MXFFooterPartition, MXFClosedComplete);
      pack_.headerByteCount = closed ? 0 : d10DVHeaderByteCount;
      if (!closed) {
        pack_.indexByteCount = constantRateIndexByteCount;
        pack_.indexSID = segment_.indexSID;
      }
      break;
  }

  startFooter(footerKey);
  if (pack_.indexByteCount != 0) {
    // The footer's segment says how many edit units were written; the
    // header's could not.
    segment_.instanceUID = uids_->generate();
    segment_.indexDuration = static_cast<std::int64_t>(count_);
    MXFIndexHandler* index = writer_->getIndexHandler();
    index->startIndex();
    index->indexTableSegment(segment_);
    index->endIndex();
  }
  structure->endPartition(footerKey);
  endStream();
}

}  // namespace zelta
