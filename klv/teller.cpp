#include "klv.h"

KLVTeller::KLVTeller(std::istream& stream, KLVHandler* handler) : DullKLVFilter(handler), stream_(&stream) {}

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

// A declined value is never seen here; its length is added at the end event.
void KLVTeller::endElement() { advance(count_.takeSkipped()); }

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

bool KLVTeller::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startIndividualItem(key, length, buffer), length);
}

void KLVTeller::endIndividualItem(const KLVKey& key) {
  endElement();
  DullKLVFilter::endIndividualItem(key);
}

bool KLVTeller::startLabel(const KLVKey& key) {
  advance(KLVPrefixCount::keyOctets);
  return DullKLVFilter::startLabel(key);
}

void KLVTeller::endLabel(const KLVKey& key) {
  advance(0);
  DullKLVFilter::endLabel(key);
}

bool KLVTeller::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startUniversalSet(key, length), length);
}

void KLVTeller::endUniversalSet(const KLVKey& key) {
  endElement();
  DullKLVFilter::endUniversalSet(key);
}

bool KLVTeller::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) {
  advance(count_.elementPrefix());
  count_.startItems(KLVTagTypeOctets(tagType), lengthType);
  return count_.noteStart(DullKLVFilter::startLocalSet(key, length, tagType, lengthType), length);
}

void KLVTeller::endLocalSet(const KLVKey& key) {
  endElement();
  count_.endItems();
  DullKLVFilter::endLocalSet(key);
}

bool KLVTeller::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.itemPrefix());
  return count_.noteStart(DullKLVFilter::startLocalItem(tag, length, buffer), length);
}

void KLVTeller::endLocalItem(std::uint32_t tag) {
  endElement();
  DullKLVFilter::endLocalItem(tag);
}

bool KLVTeller::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startFixedLengthPack(key, length, buffer), length);
}

void KLVTeller::endFixedLengthPack(const KLVKey& key) {
  endElement();
  DullKLVFilter::endFixedLengthPack(key);
}

bool KLVTeller::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  advance(count_.elementPrefix());
  count_.startItems(0, lengthType);
  return count_.noteStart(DullKLVFilter::startVariableLengthPack(key, length, lengthType), length);
}

void KLVTeller::endVariableLengthPack(const KLVKey& key) {
  endElement();
  count_.endItems();
  DullKLVFilter::endVariableLengthPack(key);
}

bool KLVTeller::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.itemPrefix());
  return count_.noteStart(DullKLVFilter::startVariableLengthItem(length, buffer), length);
}

void KLVTeller::endVariableLengthItem() {
  endElement();
  DullKLVFilter::endVariableLengthItem();
}

bool KLVTeller::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startWrapper(key, length, isWrapper, buffer), length);
}

void KLVTeller::endWrapper(const KLVKey& key) {
  endElement();
  DullKLVFilter::endWrapper(key);
}

void KLVTeller::value(const std::uint8_t* data, std::streamsize size) {
  advance(size);
  DullKLVFilter::value(data, size);
}
