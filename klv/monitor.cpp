#include "klv.h"

namespace {

constexpr std::streamoff keyOctets = 16;

unsigned octetsOfForm(std::uint8_t form) { return (form & 0x80) ? (form & 0x7F) + 1u : 1u; }

}  // namespace

KLVMonitor::KLVMonitor(KLVHandler* handler) : DullKLVFilter(handler) {}

Locator* KLVMonitor::getLocator() { return &locator_; }

unsigned KLVMonitor::getLengthOctets() const {
  check(lengthOctets_ != 0, "BER length form has been reported");
  return lengthOctets_;
}

// The position is computed, never told.
void KLVMonitor::setLocator(Locator*) {}

void KLVMonitor::startStream(bool hasAccurateLengths) {
  check(hasAccurateLengths, "accurate monitoring is possible");
  getHandler()->setLocator(&locator_);
  skipped_ = 0;
  DullKLVFilter::startStream(hasAccurateLengths);
}

void KLVMonitor::endStream(bool aborted) {
  endElement();
  DullKLVFilter::endStream(aborted);
}

void KLVMonitor::setLengthForm(std::uint8_t form) {
  lengthOctets_ = octetsOfForm(form);
  if (itemLengthIsBER_) itemLengthOctets_ = lengthOctets_;
  DullKLVFilter::setLengthForm(form);
}

// A declined value is never seen here; its length is added at the end event.
bool KLVMonitor::noteStart(bool taken, std::uint64_t length) {
  skipped_ = taken ? 0 : length;
  return taken;
}

void KLVMonitor::endElement() {
  locator_.advance(static_cast<std::streamoff>(skipped_));
  skipped_ = 0;
}

bool KLVMonitor::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startIndividualItem(key, length, buffer), length);
}

void KLVMonitor::endIndividualItem(const KLVKey& key) {
  endElement();
  DullKLVFilter::endIndividualItem(key);
}

bool KLVMonitor::startLabel(const KLVKey& key) {
  locator_.advance(keyOctets);
  return DullKLVFilter::startLabel(key);
}

void KLVMonitor::endLabel(const KLVKey& key) { DullKLVFilter::endLabel(key); }

bool KLVMonitor::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  locator_.advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startUniversalSet(key, length), length);
}

void KLVMonitor::endUniversalSet(const KLVKey& key) {
  endElement();
  DullKLVFilter::endUniversalSet(key);
}

bool KLVMonitor::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) {
  locator_.advance(keyOctets + lengthOctets_);
  tagOctets_ = KLVTagTypeOctets(tagType);
  itemLengthIsBER_ = lengthType == KLVLengthTypeBER;
  itemLengthOctets_ = itemLengthIsBER_ ? lengthOctets_ : KLVFixedLengthTypeOctets(lengthType);
  return noteStart(DullKLVFilter::startLocalSet(key, length, tagType, lengthType), length);
}

void KLVMonitor::endLocalSet(const KLVKey& key) {
  endElement();
  itemLengthIsBER_ = false;
  DullKLVFilter::endLocalSet(key);
}

bool KLVMonitor::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(tagOctets_ + itemLengthOctets_);
  return noteStart(DullKLVFilter::startLocalItem(tag, length, buffer), length);
}

void KLVMonitor::endLocalItem(std::uint32_t tag) {
  endElement();
  DullKLVFilter::endLocalItem(tag);
}

bool KLVMonitor::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startFixedLengthPack(key, length, buffer), length);
}

void KLVMonitor::endFixedLengthPack(const KLVKey& key) {
  endElement();
  DullKLVFilter::endFixedLengthPack(key);
}

bool KLVMonitor::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  locator_.advance(keyOctets + lengthOctets_);
  itemLengthIsBER_ = lengthType == KLVLengthTypeBER;
  itemLengthOctets_ = itemLengthIsBER_ ? lengthOctets_ : KLVFixedLengthTypeOctets(lengthType);
  return noteStart(DullKLVFilter::startVariableLengthPack(key, length, lengthType), length);
}

void KLVMonitor::endVariableLengthPack(const KLVKey& key) {
  endElement();
  itemLengthIsBER_ = false;
  DullKLVFilter::endVariableLengthPack(key);
}

bool KLVMonitor::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  locator_.advance(itemLengthOctets_);
  return noteStart(DullKLVFilter::startVariableLengthItem(length, buffer), length);
}

void KLVMonitor::endVariableLengthItem() {
  endElement();
  DullKLVFilter::endVariableLengthItem();
}

bool KLVMonitor::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  locator_.advance(keyOctets + lengthOctets_);
  return noteStart(DullKLVFilter::startWrapper(key, length, isWrapper, buffer), length);
}

void KLVMonitor::endWrapper(const KLVKey& key) {
  endElement();
  DullKLVFilter::endWrapper(key);
}

void KLVMonitor::value(const std::uint8_t* data, std::streamsize size) {
  locator_.advance(size);
  DullKLVFilter::value(data, size);
}
