#include <algorithm>

#include "core/reports.h"
#include "core/reservation.h"
#include "mxf.h"
#include "mxf/primer.h"

MXFPrimedSetParser::MXFPrimedSetParser() : property_(set_.properties.end()) {}

void MXFPrimedSetParser::setErrorHandler(ErrorHandler* errorHandler) { errorHandler_ = errorHandler; }

bool MXFPrimedSetParser::startLocalSet(const KLVKey& key, std::uint64_t, KLVTagType tagType, KLVLengthType) {
  wanted_ = false;
  if (tagType != KLVTagType2) return false;
  check(state_ == betweenSets, "before primed set");
  wanted_ = acceptSet(key);
  if (!wanted_) return false;
  set_.key = key;
  set_.properties.clear();
  property_ = set_.properties.end();
  state_ = inSet;
  return true;
}

void MXFPrimedSetParser::endLocalSet(const KLVKey&) {
  if (!wanted_) return;
  wanted_ = false;
  state_ = betweenSets;
  property_ = set_.properties.end();
  primedSet(set_);
}

bool MXFPrimedSetParser::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*&) {
  check(state_ == inSet, "in primed set");
  const MXFTagToKeyMap& primer = getPrimer();
  const auto known = primer.find(static_cast<std::uint16_t>(tag));
  if (known == primer.end()) {
    zelta::Reports(errorHandler_)
        .error(tagMissingInPrimerId, zelta::detailed("tag missing in primer", zelta::tagText(tag)));
    return false;
  }
  const auto inserted = set_.properties.emplace(known->second, ByteVector());
  if (!inserted.second) {
    zelta::Reports(errorHandler_)
        .error(repeatedPropertyId, zelta::detailed("unexpected repeated property", zelta::tagText(tag)));
    return false;
  }
  property_ = inserted.first;
  property_->second.reserve(zelta::reservationFor(length));
  return true;
}

void MXFPrimedSetParser::value(const std::uint8_t* data, std::streamsize size) {
  check(state_ == inSet && property_ != set_.properties.end(), "in primed set");
  property_->second.insert(property_->second.end(), data, data + size);
}
