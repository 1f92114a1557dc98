#include <cstring>

#include "klv.h"

// ---------------------------------------------------------------------------
// ActionKLVFilter: the next handler's result passes through untouched.

void ActionKLVFilter::setLocator(Locator* locator) {
  beforeEvent();
  DullKLVFilter::setLocator(locator);
  afterEvent();
}

void ActionKLVFilter::startStream(bool hasAccurateLengths) {
  beforeEvent();
  DullKLVFilter::startStream(hasAccurateLengths);
  afterEvent();
}

void ActionKLVFilter::endStream(bool aborted) {
  beforeEvent();
  DullKLVFilter::endStream(aborted);
  afterEvent();
}

void ActionKLVFilter::setLengthForm(std::uint8_t form) {
  beforeEvent();
  DullKLVFilter::setLengthForm(form);
  afterEvent();
}

bool ActionKLVFilter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  beforeEvent();
  const bool taken = DullKLVFilter::startIndividualItem(key, length, buffer);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endIndividualItem(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endIndividualItem(key);
  afterEvent();
}

bool ActionKLVFilter::startLabel(const KLVKey& key) {
  beforeEvent();
  const bool taken = DullKLVFilter::startLabel(key);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endLabel(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endLabel(key);
  afterEvent();
}

bool ActionKLVFilter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  beforeEvent();
  const bool taken = DullKLVFilter::startUniversalSet(key, length);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endUniversalSet(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endUniversalSet(key);
  afterEvent();
}

bool ActionKLVFilter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                    KLVLengthType lengthType) {
  beforeEvent();
  const bool taken = DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endLocalSet(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endLocalSet(key);
  afterEvent();
}

bool ActionKLVFilter::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  beforeEvent();
  const bool taken = DullKLVFilter::startLocalItem(tag, length, buffer);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endLocalItem(std::uint32_t tag) {
  beforeEvent();
  DullKLVFilter::endLocalItem(tag);
  afterEvent();
}

bool ActionKLVFilter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  beforeEvent();
  const bool taken = DullKLVFilter::startFixedLengthPack(key, length, buffer);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endFixedLengthPack(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endFixedLengthPack(key);
  afterEvent();
}

bool ActionKLVFilter::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  beforeEvent();
  const bool taken = DullKLVFilter::startVariableLengthPack(key, length, lengthType);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endVariableLengthPack(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endVariableLengthPack(key);
  afterEvent();
}

bool ActionKLVFilter::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  beforeEvent();
  const bool taken = DullKLVFilter::startVariableLengthItem(length, buffer);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endVariableLengthItem() {
  beforeEvent();
  DullKLVFilter::endVariableLengthItem();
  afterEvent();
}

bool ActionKLVFilter::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  beforeEvent();
  const bool taken = DullKLVFilter::startWrapper(key, length, isWrapper, buffer);
  afterEvent();
  return taken;
}

void ActionKLVFilter::endWrapper(const KLVKey& key) {
  beforeEvent();
  DullKLVFilter::endWrapper(key);
  afterEvent();
}

void ActionKLVFilter::value(const std::uint8_t* data, std::streamsize size) {
  beforeEvent();
  DullKLVFilter::value(data, size);
  afterEvent();
}

// ---------------------------------------------------------------------------
// KLVForwarder: the target is asked anew at every event.

void KLVForwarder::setLocator(Locator* locator) { getHandler()->setLocator(locator); }

void KLVForwarder::startStream(bool hasAccurateLengths) { getHandler()->startStream(hasAccurateLengths); }

void KLVForwarder::endStream(bool aborted) { getHandler()->endStream(aborted); }

void KLVForwarder::setLengthForm(std::uint8_t form) { getHandler()->setLengthForm(form); }

bool KLVForwarder::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startIndividualItem(key, length, buffer);
}

void KLVForwarder::endIndividualItem(const KLVKey& key) { getHandler()->endIndividualItem(key); }

bool KLVForwarder::startLabel(const KLVKey& key) { return getHandler()->startLabel(key); }

void KLVForwarder::endLabel(const KLVKey& key) { getHandler()->endLabel(key); }

bool KLVForwarder::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  return getHandler()->startUniversalSet(key, length);
}

void KLVForwarder::endUniversalSet(const KLVKey& key) { getHandler()->endUniversalSet(key); }

bool KLVForwarder::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                 KLVLengthType lengthType) {
  return getHandler()->startLocalSet(key, length, tagType, lengthType);
}

void KLVForwarder::endLocalSet(const KLVKey& key) { getHandler()->endLocalSet(key); }

bool KLVForwarder::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startLocalItem(tag, length, buffer);
}

void KLVForwarder::endLocalItem(std::uint32_t tag) { getHandler()->endLocalItem(tag); }

bool KLVForwarder::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startFixedLengthPack(key, length, buffer);
}

void KLVForwarder::endFixedLengthPack(const KLVKey& key) { getHandler()->endFixedLengthPack(key); }

bool KLVForwarder::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  return getHandler()->startVariableLengthPack(key, length, lengthType);
}

void KLVForwarder::endVariableLengthPack(const KLVKey& key) { getHandler()->endVariableLengthPack(key); }

bool KLVForwarder::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  return getHandler()->startVariableLengthItem(length, buffer);
}

void KLVForwarder::endVariableLengthItem() { getHandler()->endVariableLengthItem(); }

bool KLVForwarder::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  return getHandler()->startWrapper(key, length, isWrapper, buffer);
}

void KLVForwarder::endWrapper(const KLVKey& key) { getHandler()->endWrapper(key); }

void KLVForwarder::value(const std::uint8_t* data, std::streamsize size) { getHandler()->value(data, size); }

// ---------------------------------------------------------------------------
// Producers' helpers

namespace {

// One value event of the octets; a handler that named a buffer gets them
// there, as a reader would deliver them.
void deliverValue(KLVHandler& handler, std::uint8_t* buffer, const std::uint8_t* data, std::uint64_t length) {
  const std::streamsize size = static_cast<std::streamsize>(length);
  if (!buffer) {
    handler.value(data, size);
    return;
  }
  if (length != 0) std::memcpy(buffer, data, length);
  handler.value(buffer, size);
}

}  // namespace

void writeIndividualItem(KLVHandler& handler, const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  std::uint8_t* buffer = nullptr;
  if (handler.startIndividualItem(key, length, buffer)) deliverValue(handler, buffer, data, length);
  handler.endIndividualItem(key);
}

void writeFixedLengthPack(KLVHandler& handler, const KLVKey& key, const ByteVector& bytes) {
  std::uint8_t* buffer = nullptr;
  if (handler.startFixedLengthPack(key, bytes.size(), buffer) && !bytes.empty())
    deliverValue(handler, buffer, bytes.data(), bytes.size());
  handler.endFixedLengthPack(key);
}

void writeLocalSet(KLVHandler& handler, const KLVKey& key, const KLVLocalItems& items, std::uint8_t form) {
  KLVTagType tagType = KLVTagType1;
  KLVLengthType lengthType = KLVLengthTypeBER;
  check(KLVLocalSetCoding(key, tagType, lengthType), "valid local set key");
  const std::uint64_t itemOverhead = KLVTagTypeOctets(tagType) + lengthTypeOctets(lengthType, form);
  std::uint64_t length = 0;
  for (const auto& item : items) length += itemOverhead + item.second.size();
  if (handler.startLocalSet(key, length, tagType, lengthType)) {
    for (const auto& item : items) {
      std::uint8_t* buffer = nullptr;
      if (handler.startLocalItem(item.first, item.second.size(), buffer) && !item.second.empty())
        deliverValue(handler, buffer, item.second.data(), item.second.size());
      handler.endLocalItem(item.first);
    }
  }
  handler.endLocalSet(key);
}
