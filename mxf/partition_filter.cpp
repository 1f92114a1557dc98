#include "mxf.h"

MXFPartitionFilter::MXFPartitionFilter(KLVHandler* handler, std::streamoff stopPosition)
    : DullKLVFilter(handler), stopPosition_(stopPosition) {}

std::streamoff MXFPartitionFilter::getLastPosition() const { return lastPosition_; }

void MXFPartitionFilter::refresh() { lastPosition_ = locator_->getPosition(); }

// Tested only where an element starts, against where the last one ended, so
// that an element is always delivered whole.
void MXFPartitionFilter::stopIfReached() {
  if (stopPosition_ == -1 || stopPosition_ > lastPosition_) return;
  endStream(false);
  throw StopPosition();
}

void MXFPartitionFilter::setLocator(Locator* locator) {
  locator_ = locator;
  DullKLVFilter::setLocator(locator);
}

void MXFPartitionFilter::startStream(bool hasAccurateLengths) {
  check(locator_ != nullptr, "has locator");
  check(hasAccurateLengths, "has accurate lengths");
  refresh();
  stopIfReached();
  started_ = true;
  DullKLVFilter::startStream(hasAccurateLengths);
}

// A stop closes the stream cleanly; the end that the unwinding read sends
// afterwards is not passed on again.
void MXFPartitionFilter::endStream(bool aborted) {
  locator_ = nullptr;
  if (!started_) return;
  started_ = false;
  DullKLVFilter::endStream(aborted);
}

bool MXFPartitionFilter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  stopIfReached();
  return DullKLVFilter::startIndividualItem(key, length, buffer);
}

void MXFPartitionFilter::endIndividualItem(const KLVKey& key) {
  refresh();
  DullKLVFilter::endIndividualItem(key);
}

bool MXFPartitionFilter::startLabel(const KLVKey& key) {
  stopIfReached();
  return DullKLVFilter::startLabel(key);
}

void MXFPartitionFilter::endLabel(const KLVKey& key) {
  refresh();
  DullKLVFilter::endLabel(key);
}

bool MXFPartitionFilter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  stopIfReached();
  return DullKLVFilter::startUniversalSet(key, length);
}

void MXFPartitionFilter::endUniversalSet(const KLVKey& key) {
  refresh();
  DullKLVFilter::endUniversalSet(key);
}

bool MXFPartitionFilter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                       KLVLengthType lengthType) {
  stopIfReached();
  return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
}

void MXFPartitionFilter::endLocalSet(const KLVKey& key) {
  refresh();
  DullKLVFilter::endLocalSet(key);
}

// A partition pack ends the partition being read; the random index pack
// does not.
bool MXFPartitionFilter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  stopIfReached();
  if (isMXFPartitionKey(key)) {
    endStream(false);
    throw EndPartition();
  }
  return DullKLVFilter::startFixedLengthPack(key, length, buffer);
}

void MXFPartitionFilter::endFixedLengthPack(const KLVKey& key) {
  refresh();
  DullKLVFilter::endFixedLengthPack(key);
}

bool MXFPartitionFilter::startVariableLengthPack(const KLVKey& key, std::uint64_t length,
                                                 KLVLengthType lengthType) {
  stopIfReached();
  return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
}

void MXFPartitionFilter::endVariableLengthPack(const KLVKey& key) {
  refresh();
  DullKLVFilter::endVariableLengthPack(key);
}

bool MXFPartitionFilter::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper,
                                      std::uint8_t*& buffer) {
  stopIfReached();
  return DullKLVFilter::startWrapper(key, length, isWrapper, buffer);
}

void MXFPartitionFilter::endWrapper(const KLVKey& key) {
  refresh();
  DullKLVFilter::endWrapper(key);
}
