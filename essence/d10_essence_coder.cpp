#include "mxf.h"

namespace {

// Bits of the system metadata bitmap: a creation stamp, a user stamp, and
// the items that every D-10 system item has.
constexpr std::uint8_t d10Bitmap = 0x4C;
constexpr std::uint8_t creationStampBit = 0x20;
constexpr std::uint8_t userStampBit = 0x10;

bool isPresent(const MXFSDTICPTimeStamp& stamp) { return stamp[0] != 0; }

}  // namespace

class ZELTA_LOCAL MXFD10EssenceCoder::Impl {
public:
  explicit Impl(KLVHandler* handler) : muxer(handler), systemCoder(muxer.getSystemHandler()) {}

  const MXFD10Parameters& parameters() const {
    check(parameters_ != nullptr, "parameters are present");
    return *parameters_;
  }

  bool parametersSet() const { return parameters_ != nullptr; }

  void setParameters(const KLVKey& essenceContainer) {
    parameters_ = createMXFD10Parameters(essenceContainer);
    pictureGroupSize = getMXFD10PictureGroupSize(*parameters_);
    soundGroupSize = getMXFD10SoundGroupSize(*parameters_);
  }

  MXFGCMuxer muxer;
  MXFSDTICPSystemCoder systemCoder;
  std::uint32_t pictureGroupSize = 0;
  std::uint32_t soundGroupSize = 0;

private:
  std::unique_ptr<MXFD10Parameters> parameters_;
};

MXFD10EssenceCoder::MXFD10EssenceCoder(KLVHandler* handler) : impl_(std::make_unique<Impl>(handler)) {}

MXFD10EssenceCoder::~MXFD10EssenceCoder() = default;

void MXFD10EssenceCoder::startD10() { impl_->muxer.getStructureHandler()->start(MXFD10KAGSize); }

void MXFD10EssenceCoder::endD10() { impl_->muxer.getStructureHandler()->end(); }

// The edit unit opens here and closes with its sound.
void MXFD10EssenceCoder::d10System(const MXFD10SystemInformation& system, const MXFGCLocalItems& packageMetadata) {
  if (!impl_->parametersSet()) impl_->setParameters(system.essenceContainer);
  const MXFD10Parameters& parameters = impl_->parameters();
  MXFGCStructureHandler* structure = impl_->muxer.getStructureHandler();
  structure->startEditUnit();
  structure->startSlice();
  structure->startPaddedElement(MXFD10SystemItemSize);
  MXFSDTICPSystemMetadata pack;
  pack.bitmap = static_cast<std::uint8_t>(d10Bitmap | (isPresent(system.creationStamp) ? creationStampBit : 0) |
                                          (isPresent(system.userStamp) ? userStampBit : 0));
  pack.rate = parameters.getContentPackageRate();
  pack.continuityCount = system.continuityCount;
  pack.label = parameters.getEssenceContainer(false);
  if (isPresent(system.creationStamp)) pack.creationStamp = system.creationStamp;
  if (isPresent(system.userStamp)) pack.userStamp = system.userStamp;
  impl_->systemCoder.systemMetadata(pack);
  impl_->systemCoder.packageMetadata(packageMetadata);
  structure->endPaddedElement();
}

void MXFD10EssenceCoder::d10Picture(const std::uint8_t* data, std::uint64_t length) {
  impl_->parameters();
  MXFGCStructureHandler* structure = impl_->muxer.getStructureHandler();
  structure->startPaddedElement(impl_->pictureGroupSize);
  impl_->muxer.getEssenceHandler()->pictureElement(MXFD10PictureElementKey, data, length);
  structure->endPaddedElement();
}

void MXFD10EssenceCoder::d10Sound(const std::uint8_t* data, std::uint64_t length) {
  impl_->parameters();
  MXFGCStructureHandler* structure = impl_->muxer.getStructureHandler();
  structure->startPaddedElement(impl_->soundGroupSize);
  impl_->muxer.getEssenceHandler()->soundElement(MXFD10SoundElementKey, data, length);
  structure->endPaddedElement();
  structure->endSlice();
  structure->endEditUnit();
}

Locator* MXFD10EssenceCoder::getLocator() { return impl_->muxer.getLocator(); }
