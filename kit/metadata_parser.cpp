#include "kit/metadata_parser.h"

#include <memory>

#include "core/reservation.h"
#include "kit/package_item.h"

ZeltaMetadataParser::ZeltaMetadataParser(ZeltaMetadataHandler* handler,
                                         const std::shared_ptr<MXFMetadataModelFactory>& factory)
    : modelParser_(handler, factory), metadataParser_(&modelParser_), handler_(handler) {}

// The capture keeps the buffer from item to item; a length from the file
// only hints at its size.
bool ZeltaMetadataParser::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  if (!(key == zelta::packageItemKey)) return KLVForwarder::startIndividualItem(key, length, buffer);
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
