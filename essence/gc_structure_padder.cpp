#include "mxf.h"

MXFGCStructurePadder::MXFGCStructurePadder(KLVHandler* handler, Locator* locator)
    : locator_(locator), filler_(handler) {}

void MXFGCStructurePadder::start(std::uint64_t kagSize) {
  kagSize_ = kagSize;
  filler_.setLocator(locator_);
  filler_.startStream(true);
  // Fill items carry four-octet lengths, like the packs around them.
  filler_.setLengthForm(KLVFourOctetLengthForm);
}

void MXFGCStructurePadder::end() { filler_.endStream(false); }

// Edit units and slices are the indexer's business; they take no bytes.
void MXFGCStructurePadder::startEditUnit() {}

void MXFGCStructurePadder::endEditUnit() {}

void MXFGCStructurePadder::startSlice() {}

void MXFGCStructurePadder::endSlice() {}

void MXFGCStructurePadder::startPaddedElement(std::uint64_t paddedLength) {
  filler_.setFillMode(KLVFiller::exactLengthMode, kagSize_, paddedLength);
  filler_.startFilledItem();
}

void MXFGCStructurePadder::endPaddedElement() { filler_.endFilledItem(); }

void MXFGCStructurePadder::startAlignedElement(std::uint64_t alignment) {
  if (kagSize_ != 0) check(alignment % kagSize_ == 0, "alignment is multiple of KAG size");
  filler_.setFillMode(KLVFiller::alignmentMode, alignment != 0 ? alignment : kagSize_, 0);
  filler_.startFilledItem();
}

void MXFGCStructurePadder::endAlignedElement() { filler_.endFilledItem(); }
