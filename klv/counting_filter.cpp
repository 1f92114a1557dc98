#include "klv.h"

bool KLVCountingFilter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startIndividualItem(key, length, buffer), length);
}

void KLVCountingFilter::endIndividualItem(const KLVKey& key) {
  endElement();
  DullKLVFilter::endIndividualItem(key);
}

bool KLVCountingFilter::startLabel(const KLVKey& key) {
  advance(KLVPrefixCount::keyOctets);
  return DullKLVFilter::startLabel(key);
}

// A teller whose position is unknown asks the stream here too.
void KLVCountingFilter::endLabel(const KLVKey& key) {
  advance(0);
  DullKLVFilter::endLabel(key);
}

bool KLVCountingFilter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startUniversalSet(key, length), length);
}

void KLVCountingFilter::endUniversalSet(const KLVKey& key) {
  endElement();
  DullKLVFilter::endUniversalSet(key);
}

bool KLVCountingFilter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) {
  advance(count_.elementPrefix());
  count_.startItems(KLVTagTypeOctets(tagType), lengthType);
  return count_.noteStart(DullKLVFilter::startLocalSet(key, length, tagType, lengthType), length);
}

void KLVCountingFilter::endLocalSet(const KLVKey& key) {
  endElement();
  count_.endItems();
  DullKLVFilter::endLocalSet(key);
}

bool KLVCountingFilter::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.itemPrefix());
  return count_.noteStart(DullKLVFilter::startLocalItem(tag, length, buffer), length);
}

void KLVCountingFilter::endLocalItem(std::uint32_t tag) {
  endElement();
  DullKLVFilter::endLocalItem(tag);
}

bool KLVCountingFilter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startFixedLengthPack(key, length, buffer), length);
}

void KLVCountingFilter::endFixedLengthPack(const KLVKey& key) {
  endElement();
  DullKLVFilter::endFixedLengthPack(key);
}

bool KLVCountingFilter::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  advance(count_.elementPrefix());
  count_.startItems(0, lengthType);
  return count_.noteStart(DullKLVFilter::startVariableLengthPack(key, length, lengthType), length);
}

void KLVCountingFilter::endVariableLengthPack(const KLVKey& key) {
  endElement();
  count_.endItems();
  DullKLVFilter::endVariableLengthPack(key);
}

bool KLVCountingFilter::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  advance(count_.itemPrefix());
  return count_.noteStart(DullKLVFilter::startVariableLengthItem(length, buffer), length);
}

void KLVCountingFilter::endVariableLengthItem() {
  endElement();
  DullKLVFilter::endVariableLengthItem();
}

bool KLVCountingFilter::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  advance(count_.elementPrefix());
  return count_.noteStart(DullKLVFilter::startWrapper(key, length, isWrapper, buffer), length);
}

void KLVCountingFilter::endWrapper(const KLVKey& key) {
  endElement();
  DullKLVFilter::endWrapper(key);
}

void KLVCountingFilter::value(const std::uint8_t* data, std::streamsize size) {
  advance(size);
  DullKLVFilter::value(data, size);
}
