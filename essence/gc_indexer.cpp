#include "mxf.h"

MXFGCIndexer::MXFGCIndexer(MXFGCStructureHandler* handler, Locator* locator)
    : handler_(handler), locator_(locator) {}

MXFGCStructureHandler* MXFGCIndexer::next() {
  check(handler_ != nullptr, "handler is present");
  return handler_;
}

std::uint64_t MXFGCIndexer::position() {
  check(locator_ != nullptr, "locator is present");
  return static_cast<std::uint64_t>(std::streamoff(locator_->getPosition()));
}

void MXFGCIndexer::start(std::uint64_t kagSize) { next()->start(kagSize); }

void MXFGCIndexer::end() { next()->end(); }

void MXFGCIndexer::startEditUnit() {
  editUnitOffset_ = position();
  sliceOffsets_.clear();
  firstSlice_ = true;
  next()->startEditUnit();
}

// The next handler ends the edit unit first, so that any fill it writes
// belongs to this edit unit before the index hears of it.
void MXFGCIndexer::endEditUnit() {
  next()->endEditUnit();
  indexEditUnit(editUnitOffset_, sliceOffsets_);
}

// An index entry holds no offset for the first slice, which starts with the
// edit unit.
void MXFGCIndexer::startSlice() {
  if (firstSlice_)
    firstSlice_ = false;
  else
    sliceOffsets_.push_back(static_cast<std::uint32_t>(position() - editUnitOffset_));
  next()->startSlice();
}

void MXFGCIndexer::endSlice() { next()->endSlice(); }

void MXFGCIndexer::startPaddedElement(std::uint64_t paddedLength) { next()->startPaddedElement(paddedLength); }

void MXFGCIndexer::endPaddedElement() { next()->endPaddedElement(); }

void MXFGCIndexer::startAlignedElement(std::uint64_t alignment) { next()->startAlignedElement(alignment); }

void MXFGCIndexer::endAlignedElement() { next()->endAlignedElement(); }
