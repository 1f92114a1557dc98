#include "klv.h"

KLVTeller::KLVTeller(std::istream& stream, KLVHandler* handler) : KLVCountingFilter(handler), stream_(&stream) {}

const std::streampos& InputLocator::getPosition() { return position_; }

Locator* KLVTeller::getLocator() { return &locator_; }

// tellg() fails on a stream at end of file, although the position is known:
// the end-of-file bit is lifted for the question and put back after. The
// count starts again from every told position.
void KLVTeller::refresh() {
  const std::ios_base::iostate state = stream_->rdstate();
  if (state == std::ios_base::goodbit) {
    locator_.setPosition(stream_->tellg());
  } else if (state == std::ios_base::eofbit) {
    stream_->clear();
    locator_.setPosition(stream_->tellg());
    stream_->clear(state);
  } else {
    locator_.setPosition(-1);
    stream_->setstate(std::ios_base::failbit);
  }
  position_ = locator_.getPosition();
}

// On a file every question to the stream is a system call: between the tells
// at the ends of a stream the octets are counted from the coding instead, as
// the reader consumes them. An unknown position is asked for at each event.
void KLVTeller::advance(std::streamoff octets) {
  if (position_ < 0) {
    refresh();
    return;
  }
  position_ += octets;
  locator_.setPosition(position_);
}

void KLVTeller::setLocator(Locator* locator) {
  refresh();
  DullKLVFilter::setLocator(locator);
}

void KLVTeller::startStream(bool hasAccurateLengths) {
  refresh();
  count_.reset();
  getHandler()->setLocator(&locator_);
  DullKLVFilter::startStream(hasAccurateLengths);
}

void KLVTeller::endStream(bool aborted) {
  refresh();
  DullKLVFilter::endStream(aborted);
}

// The reader has read the new length already: the position shown is behind
// it, while the count waits for the start event that follows.
void KLVTeller::setLengthForm(std::uint8_t form) {
  count_.setLengthForm(form);
  if (position_ < 0) {
    // A told position here lies behind the length, no base for the count.
    refresh();
    position_ = -1;
  } else {
    locator_.setPosition(position_ + count_.currentPrefix());
  }
  DullKLVFilter::setLengthForm(form);
}
