#include <algorithm>

#include "core/reports.h"
#include "core/reservation.h"
#include "mxf.h"
#include "mxf/primer.h"

namespace {

// An item that needs more than two length octets justifies BER item lengths.
constexpr std::uint64_t twoOctetLengthLimit = 0x10000;

}  // namespace

MXFMetadataHandler::~MXFMetadataHandler() = default;

MXFMetadataParser::MXFMetadataParser(MXFMetadataHandler* handler) : handler_(handler) {
  check(handler != nullptr, "handler is present");
}

void MXFMetadataParser::startStream(bool) {
  check(getState() == idle, "before start");
  setState(beforePrimer);
  primerBytes_.clear();
  keys_.clear();
  lastForm_ = KLVNoLengthForm;
  formChanged_ = false;
  handler_->start();
}

// The handler finishes with what it has, also after a failure.
void MXFMetadataParser::endStream(bool) {
  setState(idle);
  handler_->end();
}

void MXFMetadataParser::setLengthForm(std::uint8_t form) {
  lastForm_ = form;
  formChanged_ = true;
}

bool MXFMetadataParser::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                      KLVLengthType lengthType) {
  // The format asks four-octet lengths of all header metadata.
  if (formChanged_ && lastForm_ != KLVFourOctetLengthForm) {
    formChanged_ = false;
    zelta::Reports(getErrorHandler())
        .warning(nonStandardCodingId, zelta::detailed("non-standard BER length form", zelta::octetText(lastForm_)));
  }
  largestItem_ = 0;
  lengthType_ = lengthType;
  if (lengthType != KLVLengthTypeBER && lengthType != KLVLengthType2)
    zelta::Reports(getErrorHandler())
        .warning(nonStandardCodingId,
                 zelta::detailed("non-standard local item length type", KLVLengthTypeLabel(lengthType)));
  return MXFPrimedSetParser::startLocalSet(key, length, tagType, lengthType);
}

void MXFMetadataParser::endLocalSet(const KLVKey& key) {
  if (lengthType_ == KLVLengthTypeBER && largestItem_ < twoOctetLengthLimit)
    zelta::Reports(getErrorHandler())
        .warning(nonStandardCodingId,
                 zelta::detailed("non-standard local item length type", KLVLengthTypeLabel(KLVLengthTypeBER)));
  MXFPrimedSetParser::endLocalSet(key);
}

bool MXFMetadataParser::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  largestItem_ = std::max(largestItem_, length);
  return MXFPrimedSetParser::startLocalItem(tag, length, buffer);
}

// Only the first primer of the stream counts; any other pack is skipped.
bool MXFMetadataParser::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  if (getState() != beforePrimer || key != MXFPrimerPackKey) return false;
  primerBytes_.reserve(zelta::reservationFor(length));
  setState(inPrimer);
  return true;
}

void MXFMetadataParser::endFixedLengthPack(const KLVKey& key) {
  if (getState() != inPrimer || key != MXFPrimerPackKey) return;
  MXFPrimerEntries entries;
  try {
    entries = zelta::mxf::decodePrimer(primerBytes_);
  } catch (const util::assertion_failure& failure) {
    zelta::Reports(getErrorHandler())
        .error(invalidPrimerValueId, zelta::detailed("invalid primer value", failure.what()));
    entries = getMXFStandardPrimer();
  }
  keys_ = zelta::mxf::verifyPrimer(entries, getErrorHandler());
  setState(betweenSets);
  handler_->primer(entries);
}

void MXFMetadataParser::value(const std::uint8_t* data, std::streamsize size) {
  if (getState() == inPrimer) {
    primerBytes_.insert(primerBytes_.end(), data, data + size);
    return;
  }
  MXFPrimedSetParser::value(data, size);
}

const MXFTagToKeyMap& MXFMetadataParser::getPrimer() { return keys_; }

bool MXFMetadataParser::acceptSet(const KLVKey& key) { return handler_->acceptSet(key); }

void MXFMetadataParser::primedSet(const MXFPrimedSet& set) { handler_->primedSet(set); }
