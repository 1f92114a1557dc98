#include "kit/validators/structure_validator.h"

#include "kit/essence_formats.h"

namespace {

constexpr std::uint32_t kagUnit = 512;
// Header metadata that a reader of the kit's files can hold at once.
constexpr std::uint64_t largestHeaderByteCount = 0x4FFE01;
constexpr std::size_t versionOctet = 7;

bool isOneOf(std::optional<ZeltaEssenceFormat> format, std::initializer_list<ZeltaEssenceFormat> formats) {
  if (!format) return false;
  for (ZeltaEssenceFormat f : formats)
    if (f == *format) return true;
  return false;
}

bool isClosed(const KLVKey& key) {
  const MXFPartitionStatus status = getMXFPartitionStatus(key);
  return status == MXFClosedIncomplete || status == MXFClosedComplete;
}

}  // namespace

ZeltaStructureValidator::ZeltaStructureValidator(MXFStructureHandler* handler, ZeltaCrossValidator* cross)
    : handler_(handler), cross_(cross) {}

void ZeltaStructureValidator::setErrorHandler(ErrorHandler* errorHandler) { reports_.setHandler(errorHandler); }

void ZeltaStructureValidator::setRunIn(std::uint32_t runIn) { handler_->setRunIn(runIn); }

void ZeltaStructureValidator::startStream() {
  inPartition_ = false;
  headerSeen_ = false;
  footerSeen_ = false;
  randomIndexSeen_ = false;
  headerKey_.reset();
  handler_->startStream();
}

// A stream that ended early has no end to check.
void ZeltaStructureValidator::endStream(bool aborted) {
  if (!aborted && !inPartition_ && headerSeen_) {
    const std::optional<KLVKey> picture = cross_->getEssenceContainer();
    const std::optional<ZeltaEssenceFormat> format = picture ? zelta::findEssenceFormat(*picture) : std::nullopt;
    if (!footerSeen_) reports_.error(kitFooterPartitionId, "missing footer partition");
    if (isOneOf(format, {ZeltaEssenceFormat::MPEG, ZeltaEssenceFormat::AVC}) && !randomIndexSeen_)
      reports_.error(kitRandomIndexId, "missing random index");
  }
  handler_->endStream(aborted);
}

void ZeltaStructureValidator::startPartition(const KLVKey& key, const MXFPartitionPack& pack,
                                             std::uint64_t packLength) {
  check(!inPartition_, "valid state change, entering MXF partition");
  inPartition_ = true;
  cross_->setEssenceContainers(pack.essenceContainers);
  const std::optional<KLVKey> picture = cross_->getEssenceContainer();
  const std::optional<ZeltaEssenceFormat> format = picture ? zelta::findEssenceFormat(*picture) : std::nullopt;
  checkAlignment(format, pack);
  cross_->setOperationalPattern(pack.operationalPattern);
  check(isMXFPartitionKey(key) && key[versionOctet] != 0, "valid partition key");
  if (getMXFPartitionKind(key) == MXFHeaderPartition)
    header(format, key, pack);
  else if (getMXFPartitionKind(key) == MXFBodyPartition)
    body(format, pack);
  else
    footer(format, pack);
  handler_->startPartition(key, pack, packLength);
}

// Proxy files are not aligned; the others on a KAG of whole 512 octets.
void ZeltaStructureValidator::checkAlignment(std::optional<ZeltaEssenceFormat> format, const MXFPartitionPack& pack) {
  if (format) {
    const bool proxy = format == ZeltaEssenceFormat::Proxy;
    const bool supported = proxy ? pack.kagSize == 0 : pack.kagSize != 0 && pack.kagSize % kagUnit == 0;
    if (!supported) reports_.error(kitKAGId, "unsupported KAG value");
  }
  if (pack.kagSize != 0 && pack.thisPartition % pack.kagSize != 0) reports_.error(kitKAGId, "incorrect KLV alignment");
}

void ZeltaStructureValidator::header(std::optional<ZeltaEssenceFormat> format, const KLVKey& key,
                                     const MXFPartitionPack& pack) {
  headerSeen_ = true;
  headerKey_ = key;
  if (getMXFPartitionStatus(key) != MXFClosedComplete)
    reports_.warning(kitPartitionStatusId, "open or incomplete partition status");
  if (pack.headerByteCount >= largestHeaderByteCount)
    reports_.error(kitHeaderByteCountId, "unsupported headerByteCount value");
  if (isOneOf(format, {ZeltaEssenceFormat::D10, ZeltaEssenceFormat::DV})) {
    cross_->setBodySID(pack.bodySID);
    cross_->setIndexSID(pack.indexSID);
  }
}

// D-10 and DV keep their essence in the header partition; the Proxy's and
// Raw's own body partitions are allowed.
void ZeltaStructureValidator::body(std::optional<ZeltaEssenceFormat> format, const MXFPartitionPack& pack) {
  if (isOneOf(format, {ZeltaEssenceFormat::D10, ZeltaEssenceFormat::DV}))
    reports_.error(kitPartitionId, "unexpected body partition");
  if (isOneOf(format, {ZeltaEssenceFormat::MPEG, ZeltaEssenceFormat::Proxy, ZeltaEssenceFormat::Raw})) {
    if (pack.headerByteCount != 0) reports_.warning(kitHeaderByteCountId, "non-zero headerByteCount value");
    cross_->setBodySID(pack.bodySID);
    if (pack.indexSID != 0) cross_->setIndexSID(pack.indexSID);
  }
}

void ZeltaStructureValidator::footer(std::optional<ZeltaEssenceFormat> format, const MXFPartitionPack& pack) {
  if (footerSeen_) reports_.error(kitPartitionId, "unexpected footer partition");
  footerSeen_ = true;
  if (isOneOf(format, {ZeltaEssenceFormat::MPEG, ZeltaEssenceFormat::Proxy, ZeltaEssenceFormat::Raw})) {
    if (pack.indexSID != 0) cross_->setIndexSID(pack.indexSID);
  } else if (isOneOf(format, {ZeltaEssenceFormat::D10, ZeltaEssenceFormat::DV})) {
    if (headerKey_ && isClosed(*headerKey_)) {
      if (pack.indexSID != 0) reports_.warning(kitIndexSIDId, "non-zero indexSID value");
    } else if (pack.indexSID != 0) {
      cross_->setIndexSID(pack.indexSID);
    }
  }
}

void ZeltaStructureValidator::endPartition(const KLVKey& key) {
  check(inPartition_, "valid state change, leaving MXF partition");
  inPartition_ = false;
  handler_->endPartition(key);
}

void ZeltaStructureValidator::randomIndex(const std::vector<MXFRandomIndexEntry>& entries) {
  check(!inPartition_, "valid state, between MXF partitions");
  randomIndexSeen_ = true;
  handler_->randomIndex(entries);
}
