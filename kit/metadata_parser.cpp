#include "kit/metadata_parser.h"

#include <memory>

#include "core/reservation.h"

namespace {

// 06 0E 2B 34 01 01 01 vv 03 01 02 20 01 00 00 00; KLVKey equality ignores
// the version.
constexpr KLVKey packageItemKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x00, 0x03, 0x01,
                                                             0x02, 0x20, 0x01, 0x00, 0x00, 0x00});

}  // namespace

ZeltaMetadataParser::ZeltaMetadataParser(ZeltaMetadataHandler* handler,
                                         const std::shared_ptr<MXFMetadataModelFactory>& factory)
    : modelParser_(handler, factory), metadataParser_(&modelParser_), handler_(handler) {}

// The capture keeps the buffer from item to item; a length from the file
// only hints at its size.
bool ZeltaMetadataParser::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  if (!(key == packageItemKey)) return KLVForwarder::startIndividualItem(key, length, buffer);
  item_.clear();
  item_.reserve(zelta::reservationFor(length));
  capturing_ = true;
  return true;
}

void ZeltaMetadataParser::value(const std::uint8_t* data, std::streamsize size) {
  if (capturing_)
    item_.insert(item_.end(), data, data + size);
  else
    KLVForwarder::value(data, size);
}

void ZeltaMetadataParser::endIndividualItem(const KLVKey& key) {
  if (!capturing_) {
    KLVForwarder::endIndividualItem(key);
    return;
  }
  capturing_ = false;
  handler_->packageItem(item_.data(), item_.size());
}

KLVHandler* ZeltaMetadataParser::getHandler() { return &metadataParser_; }

void ZeltaMetadataParser::setErrorHandler(ErrorHandler* errorHandler) {
  modelParser_.setErrorHandler(errorHandler);
  metadataParser_.setErrorHandler(errorHandler);
}
