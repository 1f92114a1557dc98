#include "klv.h"

KLVTeller::KLVTeller(std::istream& stream, KLVHandler* handler) : DullKLVFilter(handler), stream_(&stream) {}

Locator* KLVTeller::getLocator() { return &locator_; }

// tellg() fails on a stream at end of file, although the position is known:
// the end-of-file bit is lifted for the question and put back after.
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
}

void KLVTeller::setLocator(Locator* locator) {
  refresh();
  DullKLVFilter::setLocator(locator);
}

void KLVTeller::startStream(bool hasAccurateLengths) {
  refresh();
  getHandler()->setLocator(&locator_);
  DullKLVFilter::startStream(hasAccurateLengths);
}

void KLVTeller::endStream(bool aborted) {
  refresh();
  DullKLVFilter::endStream(aborted);
}

void KLVTeller::setLengthForm(std::uint8_t form) {
  refresh();
  DullKLVFilter::setLengthForm(form);
}

bool KLVTeller::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  refresh();
  return DullKLVFilter::startIndividualItem(key, length, buffer);
}

void KLVTeller::endIndividualItem(const KLVKey& key) {
  refresh();
  DullKLVFilter::endIndividualItem(key);
}

bool KLVTeller::startLabel(const KLVKey& key) {
  refresh();
  return DullKLVFilter::startLabel(key);
}

void KLVTeller::endLabel(const KLVKey& key) {
  refresh();
  DullKLVFilter::endLabel(key);
}

bool KLVTeller::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  refresh();
  return DullKLVFilter::startUniversalSet(key, length);
}

void KLVTeller::endUniversalSet(const KLVKey& key) {
  refresh();
  DullKLVFilter::endUniversalSet(key);
}

bool KLVTeller::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) {
  refresh();
  return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
}

void KLVTeller::endLocalSet(const KLVKey& key) {
  refresh();
  DullKLVFilter::endLocalSet(key);
}

bool KLVTeller::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  refresh();
  return DullKLVFilter::startLocalItem(tag, length, buffer);
}

void KLVTeller::endLocalItem(std::uint32_t tag) {
  refresh();
  DullKLVFilter::endLocalItem(tag);
}

bool KLVTeller::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  refresh();
  return DullKLVFilter::startFixedLengthPack(key, length, buffer);
}

void KLVTeller::endFixedLengthPack(const KLVKey& key) {
  refresh();
  DullKLVFilter::endFixedLengthPack(key);
}

bool KLVTeller::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  refresh();
  return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
}

void KLVTeller::endVariableLengthPack(const KLVKey& key) {
  refresh();
  DullKLVFilter::endVariableLengthPack(key);
}

bool KLVTeller::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  refresh();
  return DullKLVFilter::startVariableLengthItem(length, buffer);
}

void KLVTeller::endVariableLengthItem() {
  refresh();
  DullKLVFilter::endVariableLengthItem();
}

bool KLVTeller::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  refresh();
  return DullKLVFilter::startWrapper(key, length, isWrapper, buffer);
}

void KLVTeller::endWrapper(const KLVKey& key) {
  refresh();
  DullKLVFilter::endWrapper(key);
}

void KLVTeller::value(const std::uint8_t* data, std::streamsize size) {
  refresh();
  DullKLVFilter::value(data, size);
}
