#include <cstring>
#include <memory>
#include <sstream>

#include "kit/driver_impl.h"
#include "kit/essence_formats.h"
#include "kit/metadata_coder.h"
#include "kit/model_builder.h"
#include "kit/user_stamp.h"
#include "metadata/present_time.h"

namespace zelta {

namespace {

constexpr std::uint8_t systemBitmap = 0x58;
constexpr std::uint8_t soundPresent = 0x04;
constexpr std::uint8_t dataPresent = 0x02;

bool isZero(const MXFTimestamp& date) { return date == MXFTimestamp{}; }

std::uint64_t codedSize(const MXFMetadataModel& model) {
  std::ostringstream bytes;
  GenericKLVWriter sink(bytes);
  ZeltaMetadataCoder coder(&sink, createZeltaDefaultMetadataFactory());
  coder.start();
  coder.model(model);
  coder.end();
  return static_cast<std::uint64_t>(std::streamoff(bytes.tellp()));
}

// The room that the layout plans for metadata, or, for a model that it
// cannot hold with its fill, the least multiple of the KAG that can: a file
// with more room than planned beats no file.
std::uint64_t getMetadataRoom(const MXFMetadataModel& model, std::uint64_t planned) {
  constexpr std::uint64_t fillItemSize = 20;
  const std::uint64_t size = codedSize(model);
  if (size == planned || size + fillItemSize <= planned) return planned;
  return (size + fillItemSize + driverKagSize - 1) / driverKagSize * driverKagSize;
}

}  // namespace

ZeltaDriverImpl::MetadataFilter::MetadataFilter(std::shared_ptr<const ZeltaMasterMetadata> metadata)
    : DullMetadataFilter(std::move(metadata)),
      defaultVersion_(newerModelVersion),
      creationDate_(presentTimestamp()),
      modificationDate_(creationDate_) {}

std::uint16_t ZeltaDriverImpl::MetadataFilter::getPrefaceVersion() const {
  const std::uint16_t version = getMetadata().getPrefaceVersion();
  return version != 0 ? version : defaultVersion_;
}

MXFTimestamp ZeltaDriverImpl::MetadataFilter::getCreationDate() const {
  const MXFTimestamp date = getMetadata().getCreationDate();
  return isZero(date) ? creationDate_ : date;
}

MXFTimestamp ZeltaDriverImpl::MetadataFilter::getModificationDate() const {
  const MXFTimestamp date = getMetadata().getModificationDate();
  return isZero(date) ? modificationDate_ : date;
}

ZeltaDriverImpl::ZeltaDriverImpl(const std::shared_ptr<ZeltaSource>& source) : source_(source) {}

void ZeltaDriverImpl::drive(const std::shared_ptr<ZeltaWriter>& writer) {
  start(writer);
  writeAll();
  finish();
}

void ZeltaDriverImpl::checkStarted() const {
  check(writer_ != nullptr, "writer is present");
  check(source_ != nullptr, "source is present");
  check(master_ != nullptr, "master metadata is present");
}

void ZeltaDriverImpl::start(const std::shared_ptr<ZeltaWriter>& writer) {
  check(writer != nullptr, "writer is present");
  check(source_ != nullptr, "source is present");
  std::shared_ptr<const ZeltaMasterMetadata> master = source_->getMasterMetadata();
  check(master != nullptr, "master metadata is present");
  const std::uint32_t avcWrapping =
      master->getEssenceFormat() == static_cast<std::uint32_t>(ZeltaEssenceFormat::AVC) ? source_->getAVCWrapping() : 0;
  path_ = getDriverPath(*master, avcWrapping);
  format_ = static_cast<ZeltaEssenceFormat>(master->getEssenceFormat());
  master_ = std::make_shared<MetadataFilter>(master);
  if (format_ == ZeltaEssenceFormat::D10 || format_ == ZeltaEssenceFormat::DV)
    master_->setDefaultVersion(olderModelVersion);
  writer_ = writer;
  count_ = 0;

  const MXFRational rate = master_->getEditRate();
  system_ = MXFSDTICPSystemMetadata{};
  system_.rate = getContentPackageRate(rate);
  calculator_ = makeStampCalculator(rate, master_->isDropFrame());
  timecodeBase_ = getTimecodeBase(rate);

  const std::uint16_t version = master_->getPrefaceVersion();
  pack_ = MXFPartitionPack{};
  pack_.majorVersion = static_cast<std::uint16_t>(version >> 8);
  pack_.minorVersion = static_cast<std::uint16_t>(version & 0xFF);
  pack_.kagSize = driverKagSize;
  pack_.indexSID = master_->getIndexSID();
  pack_.bodySID = master_->getBodySID();
  pack_.operationalPattern = getOperationalPattern(format_);
  pack_.essenceContainers =
      getEssenceContainers(format_, master_->getBitRate(), rate, master_->getAudioChannelCount() > 0,
                           hasDataTrack(format_, master_->hasAncillaryData()));

  uids_ = source_->getUIDGenerator();
  if (!uids_) uids_ = std::make_shared<ZeltaDefaultUIDGenerator>();
  hasPictureMetadata_ = source_->hasPictureMetadata();

  layout_ = getEditUnitLayout(*master_, format_);
  system_.bitmap = systemBitmap;
  if (master_->getAudioChannelCount() > 0) system_.bitmap |= soundPresent;
  if (hasDataElement(*master_, format_)) system_.bitmap |= dataPresent;
  system_.label = getSystemItemLabel(*master_, format_);
  headerKey_ = MXFPartitionPackKey(MXFHeaderPartition, isDurationKnown() ? MXFClosedComplete : MXFOpenIncomplete);

  if (path_ == DriverPath::ConstantRate)
    startConstantRate();
  else
    startVariableRate();
}

void ZeltaDriverImpl::writeAll() {
  checkStarted();
  while (source_->hasMoreEditUnits()) writeEditUnit();
}

void ZeltaDriverImpl::writeEditUnit() {
  checkStarted();
  if (path_ == DriverPath::ConstantRate)
    writeConstantRateEditUnit();
  else
    writeVariableRateEditUnit();
}

void ZeltaDriverImpl::finish() {
  checkStarted();
  if (path_ == DriverPath::ConstantRate)
    finishConstantRate();
  else
    finishVariableRate();
  master_.reset();
  writer_.reset();
  uids_.reset();
  calculator_.reset();
  mpegIndexer_.reset();
  avcIndexer_.reset();
  segments_.clear();
  gc_ = nullptr;
  essence_ = nullptr;
}

bool ZeltaDriverImpl::isDurationKnown() const { return master_->getDuration() != ZeltaUnknownDuration; }

bool ZeltaDriverImpl::isHeaderClosed() const {
  const MXFPartitionStatus status = getMXFPartitionStatus(headerKey_);
  return status == MXFClosedIncomplete || status == MXFClosedComplete;
}

void ZeltaDriverImpl::startHeader(std::uint64_t headerByteCount, std::uint64_t indexByteCount) {
  const MXFMetadataModel model{createZeltaMetadataModel(master_, uids_)};
  pack_.headerByteCount = getMetadataRoom(model, headerByteCount);
  pack_.indexByteCount = indexByteCount;
  // A footer known in advance moves on by the room that the model took
  // beyond the plan.
  if (pack_.footerPartition != 0) pack_.footerPartition += pack_.headerByteCount - headerByteCount;
  MXFStructureHandler* structure = writer_->getStructureHandler();
  structure->startStream();
  structure->startPartition(headerKey_, pack_, partitionPackLength);
  writeMetadata(model);
}

void ZeltaDriverImpl::startFooter(const KLVKey& key) {
  MXFMetadataModel model;
  if (pack_.headerByteCount != 0) {
    if (!isHeaderClosed()) master_->setModificationDate(presentTimestamp());
    model.push_back(createZeltaMetadataModel(master_, uids_));
    pack_.headerByteCount = getMetadataRoom(model, pack_.headerByteCount);
  }
  writer_->getStructureHandler()->startPartition(key, pack_, 0);
  if (!model.empty()) writeMetadata(model);
}

void ZeltaDriverImpl::writeMetadata(const MXFMetadataModel& model) {
  ZeltaMetadataHandler* metadata = writer_->getMetadataHandler();
  metadata->start();
  metadata->model(model);
  metadata->end();
}

void ZeltaDriverImpl::writeSystemItem() {
  gc_->startPaddedElement(systemItemSize);
  system_.userStamp = source_->getUserStamp();
  if (system_.userStamp[0] == 0) {
    const std::uint64_t number = master_->getStartTimecode() + count_ - master_->getOrigin();
    system_.userStamp =
        getUserStamp(*calculator_, static_cast<std::uint32_t>(number), timecodeBase_, master_->isDropFrame());
  }
  MXFSDTICPSystemHandler* sdticp = writer_->getSDTICPHandler();
  sdticp->systemMetadata(system_);
  ++system_.continuityCount;
  sdticp->packageMetadata(source_->getPackageMetadata());
  if (hasPictureMetadata_) sdticp->pictureMetadata(source_->getPictureMetadata());
  gc_->endPaddedElement();
}

std::shared_ptr<ZeltaBuffer> ZeltaDriverImpl::fetch(const ElementSlot& slot) {
  switch (slot.source) {
    case ElementSource::D10Picture:
      return source_->getD10Picture();
    case ElementSource::D10Sound:
      return source_->getD10Sound();
    case ElementSource::DVElement:
      return source_->getDVElement();
    case ElementSource::MPEGPicture:
      return source_->getMPEGPicture();
    case ElementSource::RawPicture:
      return source_->getRawPicture();
    case ElementSource::AVCPicture:
      return source_->getAVCPicture();
    case ElementSource::Sound:
      return source_->getSound(slot.channel);
    case ElementSource::Ancillary:
      return source_->getAncillaryData();
  }
  return nullptr;
}

void ZeltaDriverImpl::writeElement(const ElementSlot& slot, const ZeltaBuffer* buffer) {
  const std::uint8_t* data = buffer ? buffer->getData() : nullptr;
  const std::uint64_t size = buffer ? buffer->getSize() : 0;
  if (slot.lengthForm != KLVNoLengthForm) essence_->essenceLengthForm(slot.lengthForm);
  std::uint8_t* offered = nullptr;
  if (essence_->startEssenceElement(slot.key, size, offered)) {
    if (offered != nullptr) {
      if (size != 0) std::memcpy(offered, data, size);
      data = offered;
    }
    switch (slot.kind) {
      case ElementKind::Picture:
        essence_->pictureElement(slot.key, data, size);
        break;
      case ElementKind::Sound:
        essence_->soundElement(slot.key, data, size);
        break;
      case ElementKind::Data:
        essence_->dataElement(slot.key, data, size);
        break;
      case ElementKind::Compound:
        essence_->compoundElement(slot.key, data, size);
        break;
    }
  }
  if (slot.lengthForm != KLVNoLengthForm) essence_->essenceLengthForm(KLVNoLengthForm);
}

void ZeltaDriverImpl::writePaddedElements(std::size_t firstSlot) {
  for (std::size_t i = firstSlot; i < layout_.size(); ++i) {
    const ElementSlot& slot = layout_[i];
    gc_->startPaddedElement(slot.paddedSize);
    writeElement(slot, fetch(slot).get());
    gc_->endPaddedElement();
  }
}

void ZeltaDriverImpl::endStream() {
  MXFStructureHandler* structure = writer_->getStructureHandler();
  // A closed D10 file is found by its header's footer offset alone.
  if (!(format_ == ZeltaEssenceFormat::D10 && isHeaderClosed())) structure->randomIndex({});
  structure->endStream(false);
}

}  // namespace zelta

ZeltaBuffer::~ZeltaBuffer() = default;
ZeltaSource::~ZeltaSource() = default;
ZeltaDriver::~ZeltaDriver() = default;

std::shared_ptr<ZeltaDriver> createZeltaDriver(const std::shared_ptr<ZeltaSource>& source) {
  return std::make_shared<zelta::ZeltaDriverImpl>(source);
}
