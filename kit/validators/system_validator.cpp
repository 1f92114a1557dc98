#include "kit/validators/system_validator.h"

namespace {

constexpr std::uint8_t userStampPresent = 0x10;

}  // namespace

ZeltaSystemValidator::ZeltaSystemValidator(MXFSDTICPSystemHandler* handler, ZeltaCrossValidator* cross)
    : handler_(handler), cross_(cross) {}

void ZeltaSystemValidator::setErrorHandler(ErrorHandler* errorHandler) { reports_.setHandler(errorHandler); }

void ZeltaSystemValidator::setStructureHandler(MXFGCStructureHandler* handler) { structureHandler_ = handler; }

void ZeltaSystemValidator::systemMetadata(const MXFSDTICPSystemMetadata& pack) {
  if (pack.bitmap & userStampPresent) {
    cross_->checkUserStamp(pack.userStamp, position_);
  } else if (!stampMissingReported_) {
    reports_.warning(kitTimecodeId, "user stamp not present");
    stampMissingReported_ = true;
  }
  if (handler_) handler_->systemMetadata(pack);
}

void ZeltaSystemValidator::packageMetadata(const MXFGCLocalItems& items) {
  if (handler_) handler_->packageMetadata(items);
}
void ZeltaSystemValidator::pictureMetadata(const MXFGCLocalItems& items) {
  if (handler_) handler_->pictureMetadata(items);
}
void ZeltaSystemValidator::soundMetadata(const MXFGCLocalItems& items) {
  if (handler_) handler_->soundMetadata(items);
}
void ZeltaSystemValidator::dataMetadata(const MXFGCLocalItems& items) {
  if (handler_) handler_->dataMetadata(items);
}
void ZeltaSystemValidator::controlData(std::uint16_t tag, const ByteVector& bytes) {
  if (handler_) handler_->controlData(tag, bytes);
}

void ZeltaSystemValidator::start(std::uint64_t kagSize) {
  if (structureHandler_) structureHandler_->start(kagSize);
}
void ZeltaSystemValidator::end() {
  if (structureHandler_) structureHandler_->end();
}
void ZeltaSystemValidator::startEditUnit() {
  ++position_;
  if (structureHandler_) structureHandler_->startEditUnit();
}
void ZeltaSystemValidator::endEditUnit() {
  if (structureHandler_) structureHandler_->endEditUnit();
}
void ZeltaSystemValidator::startSlice() {
  if (structureHandler_) structureHandler_->startSlice();
}
void ZeltaSystemValidator::endSlice() {
  if (structureHandler_) structureHandler_->endSlice();
}
void ZeltaSystemValidator::startPaddedElement(std::uint64_t paddedLength) {
  if (structureHandler_) structureHandler_->startPaddedElement(paddedLength);
}
void ZeltaSystemValidator::endPaddedElement() {
  if (structureHandler_) structureHandler_->endPaddedElement();
}
void ZeltaSystemValidator::startAlignedElement(std::uint64_t alignment) {
  if (structureHandler_) structureHandler_->startAlignedElement(alignment);
}
void ZeltaSystemValidator::endAlignedElement() {
  if (structureHandler_) structureHandler_->endAlignedElement();
}
