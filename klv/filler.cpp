#include <algorithm>
#include <array>
#include <cstring>

#include "klv.h"

namespace {

constexpr std::size_t zeroBlockOctets = 4096;
const std::array<std::uint8_t, zeroBlockOctets> zeroBlock{};

}  // namespace

void writeFillItem(KLVHandler& handler, std::uint64_t length, std::uint8_t form) {
  handler.setLengthForm(form);
  std::uint8_t* buffer = nullptr;
  if (handler.startIndividualItem(KLVFillItemKey, length, buffer)) {
    // A handler that named a buffer gets the zeros there, as from a reader.
    if (buffer) {
      std::memset(buffer, 0, length);
      handler.value(buffer, static_cast<std::streamsize>(length));
    } else {
      for (std::uint64_t left = length; left > 0;) {
        const std::uint64_t piece = std::min<std::uint64_t>(left, zeroBlockOctets);
        handler.value(zeroBlock.data(), static_cast<std::streamsize>(piece));
        left -= piece;
      }
    }
  }
  handler.endIndividualItem(KLVFillItemKey);
}

// ---------------------------------------------------------------------------
// KLVFiller

KLVFiller::KLVFiller(KLVHandler* handler) : DullKLVFilter(handler) {}

Locator* KLVFiller::getLocator() {
  check(locator_ != nullptr, "locator is present");
  return locator_;
}

void KLVFiller::setFillMode(int mode, std::uint64_t alignment, std::uint64_t paddedLength) {
  if (mode == exactLengthMode && alignment != 0)
    check(paddedLength % alignment == 0, "padded length is multiple of alignment");
  mode_ = mode;
  alignment_ = alignment;
  paddedLength_ = paddedLength;
}

int KLVFiller::getFillMode() const { return mode_; }

std::uint64_t KLVFiller::getAlignment() const { return alignment_; }

std::uint64_t KLVFiller::getPaddedLength() const { return paddedLength_; }

void KLVFiller::startFilledItem() {
  check(!inFilledItem_, "not in filled item");
  start_ = getLocator()->getPosition();
  inFilledItem_ = true;
}

// The flag is cleared first, so that a fill that cannot be made does not
// leave the filler stuck inside an item.
void KLVFiller::endFilledItem() {
  check(inFilledItem_, "in filled item");
  inFilledItem_ = false;
  const std::uint64_t written = static_cast<std::uint64_t>(getLocator()->getPosition() - start_);
  if (mode_ == exactLengthMode) {
    if (written == paddedLength_) return;
    const std::uint64_t overhead = 16 + lengthFormOctets(currentForm_);
    check(written + overhead <= paddedLength_, "achievable padded length");
    writeFillItem(*getHandler(), paddedLength_ - written - overhead, currentForm_);
    return;
  }
  if (alignment_ == 0 || written % alignment_ == 0) return;
  // A remainder too small for the fill item's own key and length runs into
  // the next alignment unit.
  const std::uint64_t overhead = 16 + lengthFormOctets(currentForm_);
  const std::uint64_t r = (written % alignment_ + overhead) % alignment_;
  writeFillItem(*getHandler(), r == 0 ? 0 : alignment_ - r, currentForm_);
}

void KLVFiller::setLocator(Locator* locator) {
  locator_ = locator;
  DullKLVFilter::setLocator(locator);
}

void KLVFiller::endStream(bool aborted) {
  locator_ = nullptr;
  DullKLVFilter::endStream(aborted);
}

void KLVFiller::setLengthForm(std::uint8_t form) {
  DullKLVFilter::setLengthForm(form);
  currentForm_ = form;
}

// ---------------------------------------------------------------------------
// KLVStreamPadder

void KLVStreamPadder::startStream(bool hasAccurateLengths) {
  KLVFiller::startStream(hasAccurateLengths);
  startFilledItem();
}

void KLVStreamPadder::endStream(bool aborted) {
  endFilledItem();
  KLVFiller::endStream(aborted);
}

// ---------------------------------------------------------------------------
// KLVStreamFilter: the producers in turn never see where the stream begins
// or ends.

void KLVStreamFilter::setLocator(Locator*) {}

void KLVStreamFilter::startStream(bool) {}

void KLVStreamFilter::endStream(bool) {}
