// The driver: one class whose two roads, constant and variable rate, live in
// sources of their own.
#ifndef ZELTA_KIT_DRIVER_IMPL_H
#define ZELTA_KIT_DRIVER_IMPL_H

#include <cstdint>
#include <memory>
#include <vector>

#include "essence/avc_indexer.h"
#include "kit.h"
#include "kit/driver_layout.h"

namespace zelta {

class ZeltaDriverImpl : public ZeltaDriver {
 public:
  // The master as the driver writes it: a version where the master has
  // none, and dates where the master's are zero.
  class MetadataFilter : public DullMetadataFilter {
   public:
    explicit MetadataFilter(std::shared_ptr<const ZeltaMasterMetadata> metadata);

    std::uint16_t getPrefaceVersion() const override;
    MXFTimestamp getCreationDate() const override;
    MXFTimestamp getModificationDate() const override;

    void setDefaultVersion(std::uint16_t version) { defaultVersion_ = version; }
    void setModificationDate(const MXFTimestamp& date) { modificationDate_ = date; }

   private:
    std::uint16_t defaultVersion_;
    MXFTimestamp creationDate_;
    MXFTimestamp modificationDate_;
  };

  explicit ZeltaDriverImpl(const std::shared_ptr<ZeltaSource>& source);

  void drive(const std::shared_ptr<ZeltaWriter>& writer) override;
  void start(const std::shared_ptr<ZeltaWriter>& writer) override;
  void writeAll() override;
  void writeEditUnit() override;
  void finish() override;

 private:
  void checkStarted() const;
  // The header partition and its metadata, in the room planned or in more
  // when the model needs it.
  void startHeader(std::uint64_t headerByteCount, std::uint64_t indexByteCount);
  // The footer partition, with metadata when its pack says so.
  void startFooter(const KLVKey& key);
  void writeMetadata(const MXFMetadataModel& model);
  void writeSystemItem();
  void writeElement(const ElementSlot& slot, const ZeltaBuffer* buffer);
  void writePaddedElements(std::size_t firstSlot);
  std::shared_ptr<ZeltaBuffer> fetch(const ElementSlot& slot);
  bool isHeaderClosed() const;
  bool isDurationKnown() const;
  void endStream();

  void startConstantRate();
  void writeConstantRateEditUnit();
  void finishConstantRate();

  void startVariableRate();
  void writeVariableRateEditUnit();
  void finishVariableRate();
  bool startsGOP(const ZeltaBuffer* picture);
  // A body partition, with the index of the one before it when given.
  void startBodyPartition(const MXFIndexTableSegment* index);
  // Ends the partition's index segment, and the partition itself unless
  // the segments wait for the footer.
  void cutPartition();

  std::shared_ptr<ZeltaSource> source_;
  std::shared_ptr<MetadataFilter> master_;
  std::shared_ptr<ZeltaWriter> writer_;
  std::uint64_t count_ = 0;
  bool hasPictureMetadata_ = false;
  MXFPartitionPack pack_;
  MXFSDTICPSystemMetadata system_;
  std::unique_ptr<TimecodeCalculator> calculator_;
  std::shared_ptr<MXFUIDGenerator> uids_;
  MXFIndexTableSegment segment_;

  ZeltaEssenceFormat format_ = ZeltaEssenceFormat::D10;
  DriverPath path_ = DriverPath::ConstantRate;
  std::uint32_t timecodeBase_ = 0;
  KLVKey headerKey_;
  std::vector<ElementSlot> layout_;
  // Where the edit units go: the writer's handlers, or the indexer in front
  // of them.
  MXFGCStructureHandler* gc_ = nullptr;
  MXFGCEssenceHandler* essence_ = nullptr;

  // The variable rate road.
  bool indexDeferred_ = false;
  std::unique_ptr<MXFMPEGIndexer> mpegIndexer_;
  std::unique_ptr<MXFAVCIndexer> avcIndexer_;
  std::vector<MXFIndexTableSegment> segments_;
  AVCAccessUnitParser gopParser_;
  KLVKey bodyKey_;
  std::uint64_t partitionTarget_ = 0;
  std::uint64_t unitsInPartition_ = 0;
  std::uint32_t bodyIndexByteCount_ = 0;
};

}  // namespace zelta

#endif
