#include "klv.h"

KLVMonitor::KLVMonitor(KLVHandler* handler) : DullKLVFilter(handler) {}

Locator* KLVMonitor::getLocator() { return &locator_; }

unsigned KLVMonitor::getLengthOctets() const {
  check(count_.lengthOctets() != 0, "BER length form has been reported");
  return count_.lengthOctets();
}

// The position is computed, never told.
void KLVMonitor::setLocator(Locator*) {}

void KLVMonitor::startStream(bool hasAccurateLengths) {
  check(hasAccurateLengths, "accurate monitoring is possible");
  getHandler()->setLocator(&locator_);
  count_.reset();
  DullKLVFilter::startStream(hasAccurateLengths);
}

void KLVMonitor::endStream(bool aborted) {
  endElement();
  DullKLVFilter::endStream(aborted);
}

void KLVMonitor::setLengthForm(std::uint8_t form) {
  count_.setLengthForm(form);
  DullKLVFilter::setLengthForm(form);
}

// A declined value is never seen here; its length is added at the end event.
void KLVMonitor::endElement() { locator_.advance(count_.takeSkipped()); }

bool KLVMonitor::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startIndividualItem(key, length, buffer), length);
}

void KLVMonitor::endIndividualItem(const KLVKey& key) {
  endElement();
  DullKLVFilter::endIndividualItem(key);
}

bool KLVMonitor::startLabel(const KLVKey& key) {
  locator_.advance(KLVPrefixCount::keyOctets);
  return DullKLVFilter::startLabel(key);
}

void KLVMonitor::endLabel(const KLVKey& key) { DullKLVFilter::endLabel(key); }

bool KLVMonitor::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  locator_.advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startUniversalSet(key, length), length);
}

void KLVMonitor::endUniversalSet(const KLVKey& key) {
  endElement();
  DullKLVFilter::endUniversalSet(key);
}

bool KLVMonitor::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) {
  locator_.advance(count_.elementPrefix());
  count_.startItems(KLVTagTypeOctets(tagType), lengthType);
  return count_.noteStart(DullKLVFilter::startLocalSet(key, length, tagType, lengthType), length);
}

void KLVMonitor::endLocalSet(const KLVKey& key) {
  endElement();
  count_.endItems();
  DullKLVFilter::endLocalSet(key);
}

bool KLVMonitor::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(count_.itemPrefix());
  return count_.noteStart(DullKLVFilter::startLocalItem(tag, length, buffer), length);
}

void KLVMonitor::endLocalItem(std::uint32_t tag) {
  endElement();
  DullKLVFilter::endLocalItem(tag);
}

bool KLVMonitor::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startFixedLengthPack(key, length, buffer), length);
}

void KLVMonitor::endFixedLengthPack(const KLVKey& key) {
  endElement();
  DullKLVFilter::endFixedLengthPack(key);
}

bool KLVMonitor::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  locator_.advance(count_.elementPrefix());
  count_.startItems(0, lengthType);
  return count_.noteStart(DullKLVFilter::startVariableLengthPack(key, length, lengthType), length);
}

void KLVMonitor::endVariableLengthPack(const KLVKey& key) {
  endElement();
  count_.endItems();
  DullKLVFilter::endVariableLengthPack(key);
}

bool KLVMonitor::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(count_.itemPrefix());
  return count_.noteStart(DullKLVFilter::startVariableLengthItem(length, buffer), length);
}

void KLVMonitor::endVariableLengthItem() {
  endElement();
  DullKLVFilter::endVariableLengthItem();
}

bool KLVMonitor::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  locator_.advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startWrapper(key, length, isWrapper, buffer), length);
}

void KLVMonitor::endWrapper(const KLVKey& key) {
  endElement();
  DullKLVFilter::endWrapper(key);
}

void KLVMonitor::value(const std::uint8_t* data, std::streamsize size) {
  locator_.advance(size);
  DullKLVFilter::value(data, size);
}
