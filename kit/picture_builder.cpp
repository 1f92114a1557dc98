#include <cstdint>
#include <memory>
#include <vector>

#include "kit/essence_formats.h"
#include "kit/model_builder.h"
#include "kit/model_labels.h"
#include "kit/picture_defaults.h"
#include "kit/picture_labels.h"

namespace zelta {

namespace {

constexpr std::uint8_t fullFrame = 0;
constexpr std::uint8_t separateFields = 1;
constexpr std::uint8_t progressiveContent = 1;
constexpr std::uint8_t interlacedContent = 2;
constexpr std::uint32_t largestMPEGProfileAndLevel = 255;
constexpr ZeltaSize fullSizeAVCFrame{1920, 1080};
constexpr ZeltaSize fullSizeAVCField{1920, 540};
constexpr std::uint32_t proxyComponentDepth = 8;
constexpr std::uint32_t proxyHorizontalSubsampling = 2;

// RGB component codes, the wide range ones apart.
constexpr std::uint8_t red = 'R';
constexpr std::uint8_t green = 'G';
constexpr std::uint8_t blue = 'B';
constexpr std::uint8_t wideRed = 217;
constexpr std::uint8_t wideGreen = 218;
constexpr std::uint8_t wideBlue = 216;

bool isZero(const ZeltaSize& size) { return size.first == 0 && size.second == 0; }
bool isZero(const ZeltaLineMap& lineMap) { return lineMap.first == 0 && lineMap.second == 0; }
std::vector<std::int32_t> lineMapOf(const ZeltaLineMap& lineMap) { return {lineMap.first, lineMap.second}; }

// The picture as the descriptor shows it: the master's values, or their
// defaults, each decided in turn because a later default reads the earlier.
struct Picture {
  bool progressive = false;
  bool simpleStudio = false;
  bool rgb = false;
  bool wideRangeRGB = false;
  ZeltaSize displaySize;
  MXFRational aspectRatio;
  ZeltaSize subsampling;
  std::uint32_t componentDepth = 0;
  std::uint16_t profileAndLevel = 0;
};

Picture computedPicture(const ModelBuild& build) {
  const ZeltaMasterMetadata& master = build.master;
  Picture p;
  p.progressive = master.isProgressive();
  p.simpleStudio = build.format == ZeltaEssenceFormat::MPEG && master.isSimpleStudioProfile();
  p.wideRangeRGB = master.isWideRangeRGB();
  p.rgb = master.isRGB() || p.wideRangeRGB;
  p.profileAndLevel = master.getProfileAndLevel();
  p.displaySize = master.getDisplaySize();
  if (isZero(p.displaySize))
    p.displaySize = getDefaultDisplaySize(p.profileAndLevel, p.progressive, master.isHalfSize());
  p.aspectRatio = master.getAspectRatio();
  if (p.aspectRatio.numerator == 0) p.aspectRatio = getDefaultAspectRatio(p.displaySize, p.progressive);
  p.subsampling = master.getSubsampling();
  if (isZero(p.subsampling))
    p.subsampling = getDefaultSubsampling(build.format, p.profileAndLevel, p.simpleStudio, p.rgb);
  p.componentDepth = master.getComponentDepth();
  if (p.componentDepth == 0) p.componentDepth = getDefaultComponentDepth(build.format, p.simpleStudio, p.wideRangeRGB);
  if (p.simpleStudio && p.profileAndLevel == 0)
    p.profileAndLevel = getSimpleStudioLevel(
        {p.displaySize, p.subsampling, p.progressive, build.editRate, master.getBitRate(), p.componentDepth});
  return p;
}

template <typename Descriptor>
std::shared_ptr<Descriptor> fileDescriptor(const ModelBuild& build) {
  std::shared_ptr<Descriptor> d = build.make<Descriptor>();
  d->setLinkedTrackID(pictureTrackID);
  d->setSampleRate(build.editRate);
  d->setEssenceContainer(build.container);
  return d;
}

KLVKey pictureCoding(const ModelBuild& build, const Picture& p) {
  if (build.format == ZeltaEssenceFormat::AVC) {
    AVCPictureKind kind;
    kind.profileConstraint = build.master.getProfileConstraint();
    kind.bitRate = build.master.getBitRate();
    kind.displayHeight = p.displaySize.second;
    kind.progressive = p.progressive;
    kind.editRate = build.editRate;
    return getAVCPictureCoding(static_cast<std::uint8_t>(p.profileAndLevel >> 8), kind);
  }
  return getMPEGPictureCoding(p.profileAndLevel, p.simpleStudio,
                              !p.simpleStudio && isHalfSizeHeight(p.displaySize.second, p.progressive));
}

// What every computed picture descriptor holds, whatever its class.
void fillPicture(PictureDescriptor& d, const ModelBuild& build, const Picture& p) {
  const std::uint32_t width = p.displaySize.first;
  const std::uint32_t height = p.displaySize.second;
  d.setSignalStandard(getSignalStandard(p.displaySize, p.componentDepth, p.wideRangeRGB));
  d.setFrameLayout(p.progressive ? fullFrame : separateFields);
  d.setStoredWidth(width);
  d.setStoredHeight(getStoredHeight(height));
  if (!p.progressive) d.setStoredF2Offset(0);
  d.setSampledWidth(width);
  d.setSampledHeight(height);
  d.setSampledXOffset(0);
  d.setSampledYOffset(0);
  d.setDisplayWidth(width);
  d.setDisplayHeight(height);
  d.setDisplayXOffset(0);
  d.setDisplayYOffset(0);
  if (!p.progressive) d.setDisplayF2Offset(0);
  d.setAspectRatio(p.aspectRatio);
  const ZeltaLineMap lineMap = build.master.getVideoLineMap();
  d.setVideoLineMap(lineMapOf(isZero(lineMap) ? getDefaultVideoLineMap(height, p.progressive) : lineMap));
  d.setCaptureGamma(getCaptureGamma(p.wideRangeRGB));
  d.setImageAlignmentOffset(0);
  d.setImageStartOffset(0);
  d.setImageEndOffset(0);
  if (!p.progressive) d.setFieldDominance(1);
  d.setPictureEssenceCoding(pictureCoding(build, p));
}

void fillCDCI(CDCIPictureDescriptor& d, const ModelBuild& build, const Picture& p) {
  fillPicture(d, build, p);
  d.setComponentDepth(p.componentDepth);
  d.setHorizontalSubsampling(p.subsampling.first);
  d.setVerticalSubsampling(p.subsampling.second);
  d.setColourSiting(getColourSiting(p.subsampling, build.version));
  d.setReversedByteOrder(false);
  d.setPaddingBits(0);
  const ReferenceLevels levels = getReferenceLevels(p.componentDepth);
  d.setBlackReferenceLevel(levels.black);
  d.setWhiteReferenceLevel(levels.white);
  d.setColourRange(levels.colourRange);
}

// Three components of the picture's depth; the highest code value tells
// a reader the range when the layout does not.
void fillRGBA(RGBAPictureDescriptor& d, const ModelBuild& build, const Picture& p) {
  fillPicture(d, build, p);
  const auto depth = static_cast<std::uint8_t>(p.componentDepth);
  RGBALayout layout;
  layout.components[0] = {p.wideRangeRGB ? wideRed : red, depth};
  layout.components[1] = {p.wideRangeRGB ? wideGreen : green, depth};
  layout.components[2] = {p.wideRangeRGB ? wideBlue : blue, depth};
  d.setPixelLayout(layout);
  if (!p.wideRangeRGB) d.setComponentMaxReferenceLevel(getReferenceLevels(p.componentDepth).white);
}

std::uint8_t codedContent(const Picture& p) { return p.progressive ? progressiveContent : interlacedContent; }

void checkMPEGProfileAndLevel(const ZeltaMasterMetadata& master) {
  check(master.getProfileAndLevel() <= largestMPEGProfileAndLevel, "valid profile and level");
}

void fillMPEGValues(MPEGVideoDescriptor& d, const ZeltaMasterMetadata& master, const Picture& p) {
  d.setSingleSequence(master.isSingleSequence());
  d.setConstantBFrames(master.hasConstantBFrames());
  d.setCodedContentType(codedContent(p));
  d.setLowDelay(master.isLowDelay());
  d.setClosedGOP(master.isClosedGOP());
  d.setIdenticalGOP(master.isIdenticalGOP());
  d.setMaxGOP(master.getMaxGOP());
  d.setBPictureCount(master.getBPictureCount());
  d.setBitRate(master.getBitRate());
  d.setProfileAndLevel(static_cast<std::uint8_t>(p.profileAndLevel));
}

std::shared_ptr<SubDescriptor> mpeg4SubDescriptor(const ModelBuild& build, const Picture& p) {
  const ZeltaMasterMetadata& master = build.master;
  std::shared_ptr<MPEG4VideoSubDescriptor> d = build.make<MPEG4VideoSubDescriptor>();
  d->setSingleSequence(master.isSingleSequence());
  d->setConstantBVOPs(master.hasConstantBFrames());
  d->setCodedContentType(codedContent(p));
  d->setLowDelay(master.isLowDelay());
  d->setClosedGOV(master.isClosedGOP());
  d->setIdenticalGOV(master.isIdenticalGOP());
  d->setMaxGOV(master.getMaxGOP());
  d->setBVOPCount(master.getBPictureCount());
  d->setBitRate(master.getBitRate());
  d->setProfileAndLevel(static_cast<std::uint8_t>(p.profileAndLevel));
  return d;
}

// An intra-only stream needs no reordering and no references.
std::shared_ptr<SubDescriptor> avcSubDescriptor(const ModelBuild& build, const Picture& p) {
  const ZeltaMasterMetadata& master = build.master;
  const bool intra = master.getMaxGOP() == 1;
  std::shared_ptr<AVCVideoSubDescriptor> d = build.make<AVCVideoSubDescriptor>();
  d->setConstantBPicture(master.hasConstantBFrames());
  d->setCodedContentKind(codedContent(p));
  d->setClosedGOP(master.isClosedGOP());
  d->setIdenticalGOP(master.isIdenticalGOP());
  d->setMaxGOP(master.getMaxGOP());
  d->setBPictureCount(master.getBPictureCount());
  d->setMaximumBitRate(master.getBitRate());
  d->setProfile(static_cast<std::uint8_t>(p.profileAndLevel >> 8));
  d->setProfileConstraint(master.getProfileConstraint());
  d->setLevel(static_cast<std::uint8_t>(p.profileAndLevel & 0xFF));
  d->setDecodingDelay(intra ? 0 : 1);
  d->setMaximumRefFrames(intra ? 0 : 2);
  d->setSequenceParameterSetFlag(intra ? 16 : 24);
  d->setPictureParameterSetFlag(intra ? 16 : 24);
  return d;
}

// A CDCI or RGBA picture under its sub-descriptors.
template <typename CDCI>
std::shared_ptr<PictureDescriptor> componentPicture(const ModelBuild& build, const Picture& p) {
  if (p.rgb) {
    std::shared_ptr<RGBAPictureDescriptor> d = fileDescriptor<RGBAPictureDescriptor>(build);
    fillRGBA(*d, build, p);
    return d;
  }
  std::shared_ptr<CDCI> d = fileDescriptor<CDCI>(build);
  fillCDCI(*d, build, p);
  return d;
}

std::shared_ptr<FileDescriptor> mpegPicture(const ModelBuild& build) {
  checkMPEGProfileAndLevel(build.master);
  const Picture p = computedPicture(build);
  if (!p.simpleStudio) {
    std::shared_ptr<MPEGVideoDescriptor> d = fileDescriptor<MPEGVideoDescriptor>(build);
    fillCDCI(*d, build, p);
    fillMPEGValues(*d, build.master, p);
    return d;
  }
  std::shared_ptr<PictureDescriptor> d;
  if (build.isNewerModel()) {
    d = componentPicture<CDCIPictureDescriptor>(build, p);
    d->addGenericSubDescriptor(build.make<ContainerConstraintsSubDescriptor>());
  } else {
    d = componentPicture<MPEGVideoDescriptor>(build, p);
  }
  d->addGenericSubDescriptor(mpeg4SubDescriptor(build, p));
  return d;
}

std::shared_ptr<FileDescriptor> avcPicture(const ModelBuild& build) {
  const Picture p = computedPicture(build);
  std::shared_ptr<CDCIPictureDescriptor> d;
  if (isFullSizeAVC(build.master)) {
    d = fileDescriptor<MPEGVideoDescriptor>(build);
    fillCDCI(*d, build, p);
  } else {
    d = fileDescriptor<CDCIPictureDescriptor>(build);
    fillCDCI(*d, build, p);
    d->addGenericSubDescriptor(build.make<ContainerConstraintsSubDescriptor>());
    d->addGenericSubDescriptor(avcSubDescriptor(build, p));
  }
  d->setContainerDuration(build.master.getOrigin() + static_cast<std::int64_t>(build.master.getDuration()));
  return d;
}

std::shared_ptr<FileDescriptor> proxyPicture(const ModelBuild& build) {
  const ZeltaMasterMetadata& master = build.master;
  check(!master.isProgressive(), "valid frame layout");
  std::shared_ptr<CDCIPictureDescriptor> d = fileDescriptor<CDCIPictureDescriptor>(build);
  d->setFrameLayout(separateFields);
  d->setStoredWidth(proxyStoredWidth);
  d->setStoredHeight(getProxyStoredHeight(build.editRate));
  d->setAspectRatio(master.getAspectRatio());
  const ZeltaLineMap lineMap = master.getVideoLineMap();
  d->setVideoLineMap(lineMapOf(isZero(lineMap) ? getProxyDefaultVideoLineMap(build.editRate) : lineMap));
  d->setPictureEssenceCoding(proxyPictureCoding);
  d->setComponentDepth(proxyComponentDepth);
  d->setHorizontalSubsampling(proxyHorizontalSubsampling);
  d->setDarkProperty(proxyDecoderSpecificInfoKey, getProxyDecoderSpecificInfo(build.editRate, master.getAspectRatio()));
  return d;
}

// Raw pictures are stored in a larger frame around the displayed one.
std::shared_ptr<FileDescriptor> rawPicture(const ModelBuild& build) {
  const ZeltaMasterMetadata& master = build.master;
  check(master.isProgressive(), "valid frame layout");
  ZeltaSize displaySize = master.getDisplaySize();
  if (isZero(displaySize)) displaySize = defaultRawDisplaySize;
  const std::uint16_t code = master.getProfileAndLevel() == 0 ? defaultRawCode : master.getProfileAndLevel();
  const RawLayout layout = getRawLayout(code, displaySize);
  std::shared_ptr<PictureDescriptor> d = fileDescriptor<PictureDescriptor>(build);
  d->setFrameLayout(fullFrame);
  d->setStoredWidth(layout.storedWidth);
  d->setStoredHeight(layout.storedHeight);
  d->setSampledWidth(layout.storedWidth);
  d->setSampledHeight(layout.storedHeight);
  d->setDisplayWidth(displaySize.first);
  d->setDisplayHeight(displaySize.second);
  d->setDisplayXOffset(layout.displayXOffset);
  d->setDisplayYOffset(layout.displayYOffset);
  const ZeltaLineMap lineMap = master.getVideoLineMap();
  d->setVideoLineMap(lineMapOf(isZero(lineMap) ? getRawDefaultVideoLineMap(displaySize) : lineMap));
  d->setPictureEssenceCoding(getRawPictureCoding(code));
  const MXFRational aspectRatio = master.getAspectRatio();
  d->setAspectRatio(aspectRatio.numerator == 0 ? getRawDefaultAspectRatio(displaySize) : aspectRatio);
  return d;
}

// D-10 and DV pictures as their container label describes them.
std::shared_ptr<FileDescriptor> labelledPicture(const ModelBuild& build) {
  std::shared_ptr<CDCIPictureDescriptor> d = build.format == ZeltaEssenceFormat::D10
                                                 ? createD10PictureDescriptor(build.container)
                                                 : createDVPictureDescriptor(build.container, build.version);
  d->setInstanceUID(build.uids.generate());
  d->setLinkedTrackID(pictureTrackID);
  const MXFRational aspectRatio = build.master.getAspectRatio();
  if (aspectRatio.numerator != 0) d->setAspectRatio(aspectRatio);
  return d;
}

}  // namespace

bool isFullSizeAVC(const ZeltaMasterMetadata& master) {
  return master.getDisplaySize() == (master.isProgressive() ? fullSizeAVCFrame : fullSizeAVCField);
}

std::shared_ptr<FileDescriptor> buildPictureDescriptor(const ModelBuild& build) {
  switch (build.format) {
    case ZeltaEssenceFormat::D10:
    case ZeltaEssenceFormat::DV:
      return labelledPicture(build);
    case ZeltaEssenceFormat::MPEG:
      return mpegPicture(build);
    case ZeltaEssenceFormat::Proxy:
      return proxyPicture(build);
    case ZeltaEssenceFormat::Raw:
      return rawPicture(build);
    case ZeltaEssenceFormat::AVC:
      return avcPicture(build);
  }
  check(false, "valid essence format");
  return nullptr;
}

}  // namespace zelta
