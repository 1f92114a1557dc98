#include "klv.h"

namespace {

constexpr std::streamoff keyOctets = 16;

unsigned octetsOfForm(std::uint8_t form) { return (form & 0x80) ? (form & 0x7F) + 1u : 1u; }

}  // namespace

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
bool KLVTeller::noteStart(bool taken, std::uint64_t length) {
  skipped_ = taken ? 0 : length;
  return taken;
}

void KLVTeller::endElement() {
  advance(static_cast<std::streamoff>(skipped_));
  skipped_ = 0;
}

void KLVTeller::setLocator(Locator* locator) {
  refresh();
  DullKLVFilter::setLocator(locator);
}

void KLVTeller::startStream(bool hasAccurateLengths) {
  refresh();
  itemLengthIsBER_ = false;
  skipped_ = 0;
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
  lengthOctets_ = octetsOfForm(form);
  if (itemLengthIsBER_) itemLengthOctets_ = lengthOctets_;
  if (position_ < 0) {
    // A told position here lies behind the length, no base for the count.
    refresh();
    position_ = -1;
  } else {
    const unsigned prefix = itemLengthIsBER_ ? tagOctets_ + itemLengthOctets_ : keyOctets + lengthOctets_;
    locator_.setPosition(position_ + prefix);
  }
  DullKLVFilter::setLengthForm(form);
}

bool KLVTeller::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startIndividualItem(key, length, buffer), length);
}

void KLVTeller::endIndividualItem(const KLVKey& key) {
  endElement();
  DullKLVFilter::endIndividualItem(key);
}

bool KLVTeller::startLabel(const KLVKey& key) {
  advance(keyOctets);
  return DullKLVFilter::startLabel(key);
}

void KLVTeller::endLabel(const KLVKey& key) {
  advance(0);
  DullKLVFilter::endLabel(key);
}

bool KLVTeller::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startUniversalSet(key, length), length);
}

void KLVTeller::endUniversalSet(const KLVKey& key) {
  endElement();
  DullKLVFilter::endUniversalSet(key);
}

bool KLVTeller::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) {
  advance(keyOctets + lengthOctets_);
  tagOctets_ = KLVTagTypeOctets(tagType);
  itemLengthIsBER_ = lengthType == KLVLengthTypeBER;
  itemLengthOctets_ = itemLengthIsBER_ ? lengthOctets_ : KLVFixedLengthTypeOctets(lengthType);
  return noteStart(DullKLVFilter::startLocalSet(key, length, tagType, lengthType), length);
}

void KLVTeller::endLocalSet(const KLVKey& key) {
  endElement();
  itemLengthIsBER_ = false;
  DullKLVFilter::endLocalSet(key);
}

bool KLVTeller::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  advance(tagOctets_ + itemLengthOctets_);
  return noteStart(DullKLVFilter::startLocalItem(tag, length, buffer), length);
}

void KLVTeller::endLocalItem(std::uint32_t tag) {
  endElement();
  DullKLVFilter::endLocalItem(tag);
}

bool KLVTeller::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startFixedLengthPack(key, length, buffer), length);
}

void KLVTeller::endFixedLengthPack(const KLVKey& key) {
  endElement();
  DullKLVFilter::endFixedLengthPack(key);
}

bool KLVTeller::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  advance(keyOctets + lengthOctets_);
  tagOctets_ = 0;
  itemLengthIsBER_ = lengthType == KLVLengthTypeBER;
  itemLengthOctets_ = itemLengthIsBER_ ? lengthOctets_ : KLVFixedLengthTypeOctets(lengthType);
  return noteStart(DullKLVFilter::startVariableLengthPack(key, length, lengthType), length);
}

void KLVTeller::endVariableLengthPack(const KLVKey& key) {
  endElement();
  itemLengthIsBER_ = false;
  DullKLVFilter::endVariableLengthPack(key);
}

bool KLVTeller::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  advance(itemLengthOctets_);
  return noteStart(DullKLVFilter::startVariableLengthItem(length, buffer), length);
}

void KLVTeller::endVariableLengthItem() {
  endElement();
  DullKLVFilter::endVariableLengthItem();
}

bool KLVTeller::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startWrapper(key, length, isWrapper, buffer), length);
}

void KLVTeller::endWrapper(const KLVKey& key) {
  endElement();
  DullKLVFilter::endWrapper(key);
}

void KLVTeller::value(const std::uint8_t* data, std::streamsize size) {
  advance(size);
  DullKLVFilter::value(data, size);
}
