#include "support/kit_masters.h"

#include <memory>
#include <string>
#include <vector>

#include "kit/essence_formats.h"
#include "kit/model_labels.h"

namespace zelta_test {

namespace {

bool isRate(const MXFRational& rate, std::int32_t numerator, std::int32_t denominator) {
  return rate.numerator == numerator && rate.denominator == denominator;
}
bool is625(const MXFRational& rate) { return isRate(rate, 25, 1); }
bool is525(const MXFRational& rate) { return isRate(rate, 30000, 1001); }

void setSound(ZeltaDefaultMetadata& m, std::uint32_t channels, std::uint32_t bits, const MXFRational& rate,
              bool channelStatus) {
  m.audioChannelCount = channels;
  m.quantizationBits = bits;
  m.audioSamplingRates.assign(channels, rate);
  if (!channelStatus) return;
  for (std::uint32_t i = 0; i < channels; ++i) {
    ZeltaChannelStatus status{};
    status[0] = 0x85;
    status[1] = static_cast<std::uint8_t>(i);
    m.fixedChannelStatusData.push_back(status);
  }
}

// The interlaced 720-wide pictures that their container label describes.
void setLabelledPicture(ZeltaDefaultMetadata& m, std::uint32_t displayHeight, ZeltaLineMap lineMap,
                        ZeltaSize subsampling) {
  m.progressive = false;
  m.displaySize = {720, displayHeight};
  m.videoLineMap = lineMap;
  m.aspectRatio = {16, 9};
  m.componentDepth = 8;
  m.subsampling = subsampling;
}

void setD10(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  m.bitRate = 50000000;
  if (is625(shape.editRate))
    setLabelledPicture(m, 288, {7, 320}, {2, 1});
  else
    setLabelledPicture(m, 243, {7, 270}, {2, 1});
  if (shape.sound) setSound(m, 4, 24, {48000, 1}, false);
}

void setDV(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  m.bitRate = 25000000;
  if (is625(shape.editRate))
    setLabelledPicture(m, 288, {23, 335}, {2, 2});
  else
    setLabelledPicture(m, 240, {23, 285}, {4, 1});
  if (shape.sound) setSound(m, 2, 16, {48000, 1}, true);
}

// Frames for the film and the high rates, fields for the rest.
void setHD(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  m.progressive = !(is625(shape.editRate) || is525(shape.editRate) || isRate(shape.editRate, 30, 1));
  m.displaySize = {1920, m.progressive ? 1080u : 540u};
  m.videoLineMap = m.progressive ? ZeltaLineMap(42, 0) : ZeltaLineMap(21, 584);
  m.aspectRatio = {16, 9};
}

void setMPEG(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  setHD(m, shape);
  m.singleSequence = true;
  m.closedGOP = true;
  m.identicalGOP = true;
  m.bPictureCount = 2;
  if (shape.picture == PictureKind::plain) {
    m.bitRate = 50000000;
    m.maxGOP = 12;
    m.profileAndLevel = 130;
    m.componentDepth = 8;
    m.subsampling = {2, 1};
    return;
  }
  // The lowest Simple Studio level that holds 1920x1080 at up to 60 frames.
  m.simpleStudioProfile = true;
  m.bitRate = 440000000;
  m.maxGOP = 1;
  m.profileAndLevel = 228;
  m.componentDepth = 10;
  m.rgb = shape.picture == PictureKind::studioRGB;
  m.subsampling = m.rgb ? ZeltaSize(1, 1) : ZeltaSize(2, 1);
}

// The full size AVC picture is described by its coding label alone: High
// 4:2:2 intra, whose class labels name 100 Mbit/s for 1080 lines at
// 24000/1001 and 50 frames and for fields at 25 and 30000/1001; at other
// rates the label names no bit rate. Its level is read back as the lowest
// Simple Studio level of the picture: 228 for 1920x1080 at 50 frames and
// more, else 226.
void setFullSizeAVC(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  setHD(m, shape);
  const MXFRational& rate = shape.editRate;
  const bool classed = isRate(rate, 24000, 1001) || isRate(rate, 50, 1) || is625(rate) || is525(rate);
  const bool fast = m.progressive && rate.numerator / rate.denominator >= 50;
  m.bitRate = classed ? 100000000 : 0;
  m.profileAndLevel = static_cast<std::uint16_t>((122 << 8) | (fast ? 228 : 226));
  m.profileConstraint = 16;
}

void setAVC(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  m.componentDepth = 10;
  m.subsampling = {2, 1};
  m.aspectRatio = {16, 9};
  if (shape.picture == PictureKind::fullSize) {
    setFullSizeAVC(m, shape);
    return;
  }
  m.closedGOP = true;
  m.progressive = true;
  m.displaySize = {1280, 720};
  m.videoLineMap = {26, 0};
  m.bitRate = 35000000;
  m.maxGOP = 15;
  m.bPictureCount = 2;
  m.profileAndLevel = (110 << 8) | 40;
}

void setRaw(ZeltaDefaultMetadata& m) {
  m.progressive = true;
  m.displaySize = {4096, 2160};
  m.videoLineMap = {42, 0};
  m.aspectRatio = {256, 135};
  m.profileAndLevel = 801;
}

void setProxy(ZeltaDefaultMetadata& m, const MasterShape& shape) {
  m.bitRate = zelta::proxyBitRate;
  m.progressive = false;
  m.displaySize = {352, is625(shape.editRate) ? 288u : 240u};
  m.aspectRatio = is525(shape.editRate) ? MXFRational{4, 3} : MXFRational{16, 9};
  m.componentDepth = 8;
  m.subsampling = {2, 0};
  m.videoLineMap = is625(shape.editRate)   ? ZeltaLineMap(23, 336)
                   : is525(shape.editRate) ? ZeltaLineMap(23, 286)
                                           : ZeltaLineMap(0, 0);
  setSound(m, 8, 8, {8000, 1}, false);
}

const char* formatName(ZeltaEssenceFormat format) {
  static const char* const names[] = {"D10", "DV", "MPEG", "Proxy", "Raw", "AVC"};
  return names[static_cast<std::uint32_t>(format)];
}

const char* kindName(PictureKind kind) {
  static const char* const names[] = {"", " studio", " studio RGB", " full size", " reduced"};
  return names[static_cast<int>(kind)];
}

std::vector<PictureKind> pictureKinds(ZeltaEssenceFormat format) {
  if (format == ZeltaEssenceFormat::MPEG) return {PictureKind::plain, PictureKind::studio, PictureKind::studioRGB};
  if (format == ZeltaEssenceFormat::AVC) return {PictureKind::fullSize, PictureKind::reduced};
  return {PictureKind::plain};
}

}  // namespace

MasterShape shapeOf(ZeltaEssenceFormat format, MXFRational rate, std::uint16_t version, bool sound, bool ancillary,
                    PictureKind picture) {
  MasterShape shape;
  shape.format = format;
  shape.editRate = rate;
  shape.version = version;
  shape.sound = sound;
  shape.ancillary = ancillary;
  shape.picture = picture;
  return shape;
}

std::shared_ptr<ZeltaDefaultMetadata> masterOf(const MasterShape& shape) {
  auto m = std::make_shared<ZeltaDefaultMetadata>();
  m->prefaceVersion = shape.version;
  m->identification.companyName = L"Orvane";
  m->identification.productName = L"zelta tests";
  m->identification.productVersion.major = 1;
  m->identification.productVersion.minor = 2;
  m->identification.productVersion.release = 1;
  m->identification.versionString = L"1.2";
  m->identification.productUID[0] = 0x5A;
  m->identification.productUID[15] = 0x01;
  m->creationDate = {2026, 11, 24, 10, 20, 30, 0};
  m->modificationDate = {2026, 11, 25, 11, 21, 31, 2};
  m->essenceFormat = static_cast<std::uint32_t>(shape.format);
  m->materialPackageUID = UMID::createNew(0x0F);
  m->filePackageUID = UMID::createNew(0x0F);
  m->packageName = L"clip";
  m->editRate = shape.editRate;
  m->dropFrame = is525(shape.editRate);
  m->startTimecode = 90000;
  m->origin = 3;
  m->duration = 250;
  m->indexSID = 2;
  m->bodySID = 1;
  switch (shape.format) {
    case ZeltaEssenceFormat::D10:
      setD10(*m, shape);
      break;
    case ZeltaEssenceFormat::DV:
      setDV(*m, shape);
      break;
    case ZeltaEssenceFormat::MPEG:
      setMPEG(*m, shape);
      break;
    case ZeltaEssenceFormat::Proxy:
      setProxy(*m, shape);
      break;
    case ZeltaEssenceFormat::Raw:
      setRaw(*m);
      break;
    case ZeltaEssenceFormat::AVC:
      setAVC(*m, shape);
      break;
  }
  if (shape.picture != PictureKind::reduced) m->descriptiveText = "<clip name=\"clip\"/>";
  m->ancillaryData = shape.ancillary;
  if (shape.sound && shape.format != ZeltaEssenceFormat::D10 && shape.format != ZeltaEssenceFormat::DV &&
      shape.format != ZeltaEssenceFormat::Proxy)
    setSound(*m, 4, 24, {48000, 1}, true);
  m->halfSize = false;
  return m;
}

std::vector<MasterShape> masterDomain() {
  std::vector<MasterShape> shapes;
  for (std::uint32_t f = 0; f <= static_cast<std::uint32_t>(ZeltaEssenceFormat::AVC); ++f) {
    const auto format = static_cast<ZeltaEssenceFormat>(f);
    const bool soundOptional = format != ZeltaEssenceFormat::Proxy;
    const bool ancillaryOptional =
        format == ZeltaEssenceFormat::MPEG || format == ZeltaEssenceFormat::Raw || format == ZeltaEssenceFormat::AVC;
    for (const MXFRational& rate : zelta::getEditRates(format))
      for (std::uint16_t version : {std::uint16_t{0x0102}, std::uint16_t{0x0103}})
        for (PictureKind kind : pictureKinds(format))
          for (bool sound : {false, true}) {
            if (!sound && !soundOptional) continue;
            for (bool ancillary : {false, true}) {
              // DV always carries its data track.
              if (format == ZeltaEssenceFormat::DV ? !ancillary : ancillary && !ancillaryOptional) continue;
              shapes.push_back(shapeOf(format, rate, version, sound, ancillary, kind));
            }
          }
  }
  return shapes;
}

std::string describe(const MasterShape& shape) {
  return std::string(formatName(shape.format)) + kindName(shape.picture) + " " +
         std::to_string(shape.editRate.numerator) + "/" + std::to_string(shape.editRate.denominator) + " v" +
         std::to_string(shape.version) + (shape.sound ? " sound" : "") + (shape.ancillary ? " ancillary" : "");
}

}  // namespace zelta_test
