// The stream identifiers and edit rate of each index table segment, handed
// to the cross validator.
#ifndef ZELTA_KIT_VALIDATORS_INDEX_VALIDATOR_H
#define ZELTA_KIT_VALIDATORS_INDEX_VALIDATOR_H

#include "kit/validators/cross_validator.h"

class ZeltaIndexValidator : public MXFIndexHandler {
 public:
  // Neither is owned.
  ZeltaIndexValidator(MXFIndexHandler* handler, ZeltaCrossValidator* cross);

  void startIndex() override;
  void endIndex() override;
  void indexTableSegment(const MXFIndexTableSegment& segment) override;

 private:
  MXFIndexHandler* handler_;
  ZeltaCrossValidator* cross_;
};

#endif
