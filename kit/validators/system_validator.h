// The user stamps of SDTI-CP system items against the clip's start
// timecode; it counts edit units on the generic container's structure
// events, which it forwards when a client wants them.
#ifndef ZELTA_KIT_VALIDATORS_SYSTEM_VALIDATOR_H
#define ZELTA_KIT_VALIDATORS_SYSTEM_VALIDATOR_H

#include <cstdint>

#include "core/reports.h"
#include "kit/validators/cross_validator.h"

class ZeltaSystemValidator : public MXFSDTICPSystemHandler, public MXFGCStructureHandler {
 public:
  // The next handlers may be empty; none is owned.
  ZeltaSystemValidator(MXFSDTICPSystemHandler* handler, ZeltaCrossValidator* cross);

  void setErrorHandler(ErrorHandler* errorHandler);
  void setStructureHandler(MXFGCStructureHandler* handler);

  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override;
  void packageMetadata(const MXFGCLocalItems& items) override;
  void pictureMetadata(const MXFGCLocalItems& items) override;
  void soundMetadata(const MXFGCLocalItems& items) override;
  void dataMetadata(const MXFGCLocalItems& items) override;
  void controlData(std::uint16_t tag, const ByteVector& bytes) override;

  void start(std::uint64_t kagSize) override;
  void end() override;
  void startEditUnit() override;
  void endEditUnit() override;
  void startSlice() override;
  void endSlice() override;
  void startPaddedElement(std::uint64_t paddedLength) override;
  void endPaddedElement() override;
  void startAlignedElement(std::uint64_t alignment) override;
  void endAlignedElement() override;

 private:
  MXFSDTICPSystemHandler* handler_;
  MXFGCStructureHandler* structureHandler_ = nullptr;
  ZeltaCrossValidator* cross_;
  zelta::Reports reports_;
  // Of the edit unit in progress, from 0 through every partition.
  std::int64_t position_ = -1;
  bool stampMissingReported_ = false;
};

#endif
