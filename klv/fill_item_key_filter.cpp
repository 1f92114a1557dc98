#include "core/reports.h"
#include "klv.h"

KLVFillItemKeyFilter::KLVFillItemKeyFilter(KLVHandler* handler, std::uint8_t fillItemKeyVersion,
                                           ErrorHandler* errorHandler)
    : DullKLVFilter(handler), version_(fillItemKeyVersion), errorHandler_(errorHandler) {}

void KLVFillItemKeyFilter::startStream(bool hasAccurateLengths) {
  warned_ = false;
  DullKLVFilter::startStream(hasAccurateLengths);
}

bool KLVFillItemKeyFilter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  inspect(key);
  return DullKLVFilter::startIndividualItem(key, length, buffer);
}

void KLVFillItemKeyFilter::endIndividualItem(const KLVKey& key) {
  inspect(key);
  DullKLVFilter::endIndividualItem(key);
}

// Without a version of its own a stream may use either registry version of
// the fill key; one warning per stream says enough.
void KLVFillItemKeyFilter::inspect(const KLVKey& key) {
  if (warned_ || key != KLVFillItemKey) return;
  const std::uint8_t version = key[7];
  const bool expected = version_ != 0 ? version == version_ : (version == 1 || version == 2);
  if (expected) return;
  warned_ = true;
  zelta::Reports(errorHandler_)
      .warning(fillItemKeyVersionId, zelta::detailed("unexpected fill item key version", zelta::octetText(version)));
}
