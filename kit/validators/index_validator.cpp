#include "kit/validators/index_validator.h"

ZeltaIndexValidator::ZeltaIndexValidator(MXFIndexHandler* handler, ZeltaCrossValidator* cross)
    : handler_(handler), cross_(cross) {}

void ZeltaIndexValidator::startIndex() { handler_->startIndex(); }

void ZeltaIndexValidator::endIndex() { handler_->endIndex(); }

void ZeltaIndexValidator::indexTableSegment(const MXFIndexTableSegment& segment) {
  cross_->setBodySID(segment.bodySID);
  cross_->setIndexSID(segment.indexSID);
  cross_->setIndexEditRate(segment.indexEditRate);
  handler_->indexTableSegment(segment);
}
