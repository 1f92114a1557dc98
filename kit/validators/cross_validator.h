// What the kit's validators check across the partitions, the metadata, the
// index and the system items of one file: values that each side states and
// that must agree.
#ifndef ZELTA_KIT_VALIDATORS_CROSS_VALIDATOR_H
#define ZELTA_KIT_VALIDATORS_CROSS_VALIDATOR_H

#include <cstdint>
#include <memory>
#include <optional>
#include <set>
#include <vector>

#include "core/reports.h"
#include "kit.h"

class ZeltaCrossValidator {
 public:
  ZeltaCrossValidator();
  ~ZeltaCrossValidator();
  ZeltaCrossValidator(const ZeltaCrossValidator&) = delete;
  ZeltaCrossValidator& operator=(const ZeltaCrossValidator&) = delete;

  void setErrorHandler(ErrorHandler* errorHandler);
  // The first set chooses the picture and auxiliary containers; later ones
  // must equal it.
  void setEssenceContainers(const std::vector<KLVKey>& labels);
  void setOperationalPattern(const KLVKey& label);
  void setBodySID(std::uint32_t bodySID);
  void setIndexSID(std::uint32_t indexSID);
  void setEditRate(const MXFRational& editRate);
  void setIndexEditRate(const MXFRational& indexEditRate);
  // Only until the first finding, and only inside the clip.
  void checkUserStamp(const MXFSDTICPTimeStamp& stamp, std::int64_t position);
  void setStartTimecode(std::int64_t startTimecode, std::int64_t origin, std::int64_t duration, bool dropFrame);
  // Empty while unknown.
  std::optional<KLVKey> getEssenceContainer() const;
  std::optional<KLVKey> getAuxiliaryContainer() const;
  void clearEssenceContainers();

 private:
  std::optional<ZeltaEssenceFormat> format() const;
  void selectContainers(const std::vector<KLVKey>& labels);
  bool isSuitableEditRate(const MXFRational& rate) const;

  zelta::Reports reports_;
  std::optional<std::set<KLVKey>> essenceContainers_;
  std::optional<KLVKey> pictureContainer_;
  std::optional<KLVKey> auxiliaryContainer_;
  std::uint32_t bodySID_ = 0;
  std::uint32_t indexSID_ = 0;
  MXFRational editRate_{0, 0};
  std::optional<std::int64_t> startTimecode_;
  std::int64_t origin_ = 0;
  std::int64_t duration_ = 0;
  bool dropFrame_ = false;
  std::unique_ptr<TimecodeCalculator> calculator_;
  bool userStampFailed_ = false;
};

#endif
