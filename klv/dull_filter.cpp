#include "klv.h"

DullKLVFilter::DullKLVFilter() : handler_(nullptr) {}

DullKLVFilter::DullKLVFilter(KLVHandler* handler) : handler_(handler) {}

void DullKLVFilter::setHandler(KLVHandler* handler) { handler_ = handler; }

void DullKLVFilter::setLocator(Locator* locator) { getHandler()->setLocator(locator); }

void DullKLVFilter::startStream(bool hasAccurateLengths) { getHandler()->startStream(hasAccurateLengths); }

void DullKLVFilter::endStream(bool aborted) { getHandler()->endStream(aborted); }

void DullKLVFilter::setLengthForm(std::uint8_t form) { getHandler()->setLengthForm(form); }

bool DullKLVFilter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startIndividualItem(key, length, buffer);
}

void DullKLVFilter::endIndividualItem(const KLVKey& key) { getHandler()->endIndividualItem(key); }

bool DullKLVFilter::startLabel(const KLVKey& key) { return getHandler()->startLabel(key); }

void DullKLVFilter::endLabel(const KLVKey& key) { getHandler()->endLabel(key); }

bool DullKLVFilter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  return getHandler()->startUniversalSet(key, length);
}

void DullKLVFilter::endUniversalSet(const KLVKey& key) { getHandler()->endUniversalSet(key); }

bool DullKLVFilter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                  KLVLengthType lengthType) {
  return getHandler()->startLocalSet(key, length, tagType, lengthType);
}

void DullKLVFilter::endLocalSet(const KLVKey& key) { getHandler()->endLocalSet(key); }

bool DullKLVFilter::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startLocalItem(tag, length, buffer);
}

void DullKLVFilter::endLocalItem(std::uint32_t tag) { getHandler()->endLocalItem(tag); }

bool DullKLVFilter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startFixedLengthPack(key, length, buffer);
}

void DullKLVFilter::endFixedLengthPack(const KLVKey& key) { getHandler()->endFixedLengthPack(key); }

bool DullKLVFilter::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  return getHandler()->startVariableLengthPack(key, length, lengthType);
}

void DullKLVFilter::endVariableLengthPack(const KLVKey& key) { getHandler()->endVariableLengthPack(key); }

bool DullKLVFilter::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startVariableLengthItem(length, buffer);
}

void DullKLVFilter::endVariableLengthItem() { getHandler()->endVariableLengthItem(); }

bool DullKLVFilter::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  return getHandler()->startWrapper(key, length, isWrapper, buffer);
}

void DullKLVFilter::endWrapper(const KLVKey& key) { getHandler()->endWrapper(key); }

void DullKLVFilter::value(const std::uint8_t* data, std::streamsize size) { getHandler()->value(data, size); }
