#include <string>

#include "core/reports.h"
#include "mxf.h"

namespace {

// Generalized operational patterns (OP1a to OP3c), item and package
// complexity in octets 12 and 13.
constexpr KLVKeyPattern generalizedPattern(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x04, 0x01, 0x01, 0x00, 0x0D, 0x01, 0x02, 0x01, 0x00, 0x00, 0x00, 0x00});

bool isGeneralizedPattern(const KLVKey& pattern) {
  return generalizedPattern.matches(pattern) && pattern[12] >= 1 && pattern[12] <= 3 && pattern[13] >= 1 &&
         pattern[13] <= 3;
}

std::string versionMessage(const char* text, const MXFPartitionPack& pack) {
  return zelta::detailed(text, std::to_string(pack.majorVersion) + "." + std::to_string(pack.minorVersion) +
                                   " (implemented 1.2-1.3)");
}

}  // namespace

class ZELTA_LOCAL MXFStructureValidator::Impl {
public:
  explicit Impl(MXFStructureHandler* handler) : handler_(handler) {}

  void setRunIn(std::uint32_t runIn);
  void startStream();
  void endStream(bool aborted);
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t packLength);
  void endPartition(const KLVKey& key);
  void randomIndex(const std::vector<MXFRandomIndexEntry>& entries);

  zelta::Reports reports;
  Locator* locator = nullptr;

private:
  enum State {
    idle,
    runInSeen,
    started,
    inPartition,
    betweenPartitions,
    inFooter,
    afterFooter,
    afterRandomIndex
  };

  void checkOrder(MXFPartitionKind kind);
  void checkRunIn(const MXFPartitionPack& pack);
  void checkVersion(const MXFPartitionPack& pack);
  void checkOffsets(MXFPartitionKind kind, const MXFPartitionPack& pack, std::uint64_t packLength);
  void checkKAG(const MXFPartitionPack& pack);
  void checkFields(MXFPartitionKind kind, const MXFPartitionPack& pack);

  MXFStructureHandler* handler_;
  State state_ = idle;
  std::uint32_t runIn_ = 0;
  std::vector<MXFRandomIndexEntry> partitions_;
  std::uint64_t footer_ = 0;
  bool headerNamesFooter_ = false;
  bool randomIndexSeen_ = false;
};

void MXFStructureValidator::Impl::setRunIn(std::uint32_t runIn) {
  check(state_ == idle, "before run-in");
  runIn_ = runIn;
  state_ = runInSeen;
  handler_->setRunIn(runIn);
}

void MXFStructureValidator::Impl::startStream() {
  check(state_ == idle || state_ == runInSeen, "before start");
  if (state_ == idle) runIn_ = 0;
  if (locator) check(std::streamoff(locator->getPosition()) == std::streamoff(runIn_), "correct runIn");
  partitions_.clear();
  footer_ = 0;
  headerNamesFooter_ = false;
  randomIndexSeen_ = false;
  state_ = started;
  handler_->startStream();
}

// A file must give a reader a way to find its end.
void MXFStructureValidator::Impl::endStream(bool aborted) {
  if (!aborted && !headerNamesFooter_ && !randomIndexSeen_)
    reports.error(randomIndexMissingId,
                  "missing random index or non-zero footerPartition in the header partition pack");
  state_ = idle;
  locator = nullptr;
  handler_->endStream(aborted);
}

void MXFStructureValidator::Impl::startPartition(const KLVKey& key, const MXFPartitionPack& pack,
                                                 std::uint64_t packLength) {
  check(isMXFPartitionKey(key), "is partition");
  const MXFPartitionKind kind = getMXFPartitionKind(key);
  checkOrder(kind);
  checkRunIn(pack);
  checkVersion(pack);
  if (locator) checkOffsets(kind, pack, packLength);
  checkKAG(pack);
  checkFields(kind, pack);
  if (kind == MXFHeaderPartition) headerNamesFooter_ = pack.footerPartition != 0;
  handler_->startPartition(key, pack, packLength);
}

// The partition is taken as what its key says, whatever was reported.
void MXFStructureValidator::Impl::checkOrder(MXFPartitionKind kind) {
  switch (state_) {
    case started:
      if (kind != MXFHeaderPartition) reports.error(partitionOrderId, "missing header partition");
      break;
    case betweenPartitions:
      if (kind == MXFHeaderPartition) reports.error(partitionOrderId, "unexpected header partition");
      break;
    case afterFooter:
      reports.error(partitionOrderId, "unexpected partition");
      break;
    case afterRandomIndex:
      reports.error(randomIndexMissingId, "unexpected partition");
      break;
    default:
      check(false, "before partition");
  }
  state_ = kind == MXFFooterPartition ? inFooter : inPartition;
}

// A run-in is allowed with the specialized patterns only.
void MXFStructureValidator::Impl::checkRunIn(const MXFPartitionPack& pack) {
  if (runIn_ != 0 && isGeneralizedPattern(pack.operationalPattern))
    reports.error(runInErrorId, "generalized operational pattern with run-in");
}

void MXFStructureValidator::Impl::checkVersion(const MXFPartitionPack& pack) {
  if (pack.majorVersion > 0xFF || pack.minorVersion > 0xFF)
    reports.error(partitionVersionErrorId, versionMessage("invalid version", pack));
  else if (pack.majorVersion != 1)
    reports.error(partitionVersionErrorId, versionMessage("incompatible version", pack));
  else if (pack.minorVersion < 2)
    reports.error(partitionVersionRangeId, versionMessage("earlier version", pack));
  else if (pack.minorVersion > 3)
    reports.warning(partitionVersionRangeId, versionMessage("later version", pack));
}

// Offsets count from the end of the run-in.
void MXFStructureValidator::Impl::checkOffsets(MXFPartitionKind kind, const MXFPartitionPack& pack,
                                               std::uint64_t packLength) {
  const std::uint64_t at =
      static_cast<std::uint64_t>(std::streamoff(locator->getPosition())) - packLength - runIn_;
  if (at != pack.thisPartition) reports.warning(thisPartitionId, "incorrect thisPartition");
  const std::uint64_t previous = partitions_.empty() ? 0 : partitions_.back().byteOffset;
  if (previous != pack.previousPartition) reports.warning(previousPartitionId, "incorrect previousPartition");
  if (kind == MXFFooterPartition) {
    if (at != pack.footerPartition) reports.warning(footerPartitionId, "incorrect footerPartition");
    if (footer_ != 0 && footer_ != at) reports.warning(footerPartitionId, "incorrect previous footerPartition");
  } else if (pack.footerPartition != 0) {
    if (footer_ != 0 && footer_ != pack.footerPartition)
      reports.warning(footerPartitionId, "inconsistent footerPartition");
    footer_ = pack.footerPartition;
  }
  partitions_.push_back(MXFRandomIndexEntry{pack.bodySID, at});
}

void MXFStructureValidator::Impl::checkKAG(const MXFPartitionPack& pack) {
  if (pack.kagSize == 0) return;
  if (pack.headerByteCount % pack.kagSize != 0)
    reports.warning(headerByteCountKagId, "headerByteCount is not a multiple of kagSize");
  if (pack.indexByteCount % pack.kagSize != 0)
    reports.warning(indexByteCountKagId, "indexByteCount is not a multiple of kagSize");
}

void MXFStructureValidator::Impl::checkFields(MXFPartitionKind kind, const MXFPartitionPack& pack) {
  if ((pack.indexSID == 0) != (pack.indexByteCount == 0))
    reports.warning(indexSIDId, "inconsistent indexSID and indexByteCount");
  if (pack.bodySID == 0 && pack.bodyOffset != 0) reports.warning(bodySIDId, "inconsistent bodySID and bodyOffset");
  if (kind == MXFFooterPartition && pack.bodySID != 0) reports.warning(bodySIDId, "non-zero bodySID in footer");
}

void MXFStructureValidator::Impl::endPartition(const KLVKey& key) {
  const bool isPartition = isMXFPartitionKey(key);
  if (state_ == inFooter) {
    check(isPartition && getMXFPartitionKind(key) == MXFFooterPartition, "is footer partition");
    state_ = afterFooter;
  } else if (state_ == inPartition) {
    check(isPartition && getMXFPartitionKind(key) != MXFFooterPartition, "is header or body partition");
    state_ = betweenPartitions;
  } else {
    check(false, "in partition");
  }
  handler_->endPartition(key);
}

void MXFStructureValidator::Impl::randomIndex(const std::vector<MXFRandomIndexEntry>& entries) {
  randomIndexSeen_ = true;
  if (state_ == started || state_ == afterRandomIndex) {
    reports.error(randomIndexMissingId, "unexpected random index");
  } else {
    check(state_ == betweenPartitions || state_ == afterFooter, "before random index");
  }
  state_ = afterRandomIndex;
  if (locator && entries != partitions_) reports.warning(randomIndexValueId, "incorrect random index value");
  handler_->randomIndex(entries);
}

// ---------------------------------------------------------------------------

MXFStructureValidator::MXFStructureValidator(MXFStructureHandler* handler) : impl_(new Impl(handler)) {}

MXFStructureValidator::~MXFStructureValidator() = default;

void MXFStructureValidator::setRunIn(std::uint32_t runIn) { impl_->setRunIn(runIn); }
void MXFStructureValidator::startStream() { impl_->startStream(); }
void MXFStructureValidator::endStream(bool aborted) { impl_->endStream(aborted); }
void MXFStructureValidator::startPartition(const KLVKey& key, const MXFPartitionPack& pack,
                                           std::uint64_t packLength) {
  impl_->startPartition(key, pack, packLength);
}
void MXFStructureValidator::endPartition(const KLVKey& key) { impl_->endPartition(key); }
void MXFStructureValidator::randomIndex(const std::vector<MXFRandomIndexEntry>& entries) {
  impl_->randomIndex(entries);
}
void MXFStructureValidator::setErrorHandler(ErrorHandler* errorHandler) { impl_->reports.setHandler(errorHandler); }
void MXFStructureValidator::setLocator(Locator* locator) { impl_->locator = locator; }
