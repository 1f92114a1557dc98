// The partitions of a file of the kit's kinds: alignment, status, byte
// counts and stream identifiers by format, and the partitions that the
// format requires or forbids.
#ifndef ZELTA_KIT_VALIDATORS_STRUCTURE_VALIDATOR_H
#define ZELTA_KIT_VALIDATORS_STRUCTURE_VALIDATOR_H

#include <optional>

#include "core/reports.h"
#include "kit/validators/cross_validator.h"

class ZeltaStructureValidator : public MXFStructureHandler {
 public:
  // Neither is owned.
  ZeltaStructureValidator(MXFStructureHandler* handler, ZeltaCrossValidator* cross);

  void setRunIn(std::uint32_t runIn) override;
  void startStream() override;
  void endStream(bool aborted) override;
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength) override;
  void endPartition(const KLVKey& key) override;
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries) override;

  void setErrorHandler(ErrorHandler* errorHandler);

 private:
  void checkAlignment(std::optional<ZeltaEssenceFormat> format, const MXFPartitionPack& pack);
  void header(std::optional<ZeltaEssenceFormat> format, const KLVKey& key, const MXFPartitionPack& pack);
  void body(std::optional<ZeltaEssenceFormat> format, const MXFPartitionPack& pack);
  void footer(std::optional<ZeltaEssenceFormat> format, const MXFPartitionPack& pack);

  MXFStructureHandler* handler_;
  ZeltaCrossValidator* cross_;
  zelta::Reports reports_;
  bool inPartition_ = false;
  bool headerSeen_ = false;
  bool footerSeen_ = false;
  bool randomIndexSeen_ = false;
  std::optional<KLVKey> headerKey_;
};

#endif
