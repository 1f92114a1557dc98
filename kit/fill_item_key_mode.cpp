#include "kit/fill_item_key_mode.h"

#include <algorithm>

#include "kit/essence_formats.h"

namespace {

constexpr std::uint32_t newerVersion = 0x0103;
// Older MPEG files of the kind write their fill items under the key of
// registry version 2.
constexpr std::uint8_t olderMPEGFillKeyVersion = 2;

bool holdsMPEG(const std::vector<KLVKey>& labels) {
  return std::any_of(labels.begin(), labels.end(),
                     [](const KLVKey& label) { return zelta::findEssenceFormat(label) == ZeltaEssenceFormat::MPEG; });
}

}  // namespace

FillItemKeyModeStructureFilter::FillItemKeyModeStructureFilter(MXFStructureHandler* handler, std::ostream& stream)
    : handler_(handler), stream_(stream) {}

void FillItemKeyModeStructureFilter::setRunIn(std::uint32_t runIn) { handler_->setRunIn(runIn); }
void FillItemKeyModeStructureFilter::startStream() { handler_->startStream(); }
// The file's last octets reach the stream's own buffer when the file ends.
void FillItemKeyModeStructureFilter::endStream(bool aborted) {
  handler_->endStream(aborted);
  stream_.flush();
  util::requireWritten(stream_);
}

// The header partition decides, unless the stream has a mode already.
void FillItemKeyModeStructureFilter::startPartition(const KLVKey& key, const MXFPartitionPack& pack,
                                                    std::uint64_t packLength) {
  check(isMXFPartitionKey(key), "valid partition key");
  const std::uint32_t version = (std::uint32_t{pack.majorVersion} << 8) | pack.minorVersion;
  if (getMXFPartitionKind(key) == MXFHeaderPartition && getFillItemKeyVersion(stream_) == 0 && version < newerVersion &&
      holdsMPEG(pack.essenceContainers) && pack.headerByteCount != 0)
    setFillItemKeyVersion(stream_, olderMPEGFillKeyVersion);
  handler_->startPartition(key, pack, packLength);
}

void FillItemKeyModeStructureFilter::endPartition(const KLVKey& key) { handler_->endPartition(key); }

void FillItemKeyModeStructureFilter::randomIndex(const std::vector<MXFRandomIndexEntry>& entries) {
  handler_->randomIndex(entries);
}
