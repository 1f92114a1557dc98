#include "clip.h"

#include <algorithm>
#include <array>
#include <utility>

#include "sound_input.h"

extern "C" {
#include <libavutil/pixdesc.h>
}

namespace zelta_wrap {

namespace {

struct RawSize {
  std::uint16_t code;
  std::uint32_t width;  // 0: any
  std::size_t octets;
};
const std::array<RawSize, 9> rawSizes{{
    {785, 0, 20381672},
    {801, 0, 10190824},
    {802, 0, 5091304},
    {817, 0, 6012904},
    {1057, 4096, 4915176},
    {1057, 2048, 1228776},
    {1073, 4096, 2949096},
    {1073, 2048, 737256},
    {0, 0, 10190824},
}};

constexpr ZeltaSize defaultRawSize{4096, 2160};

const std::array<MXFRational, 10> allRates{
    {{24000, 1001}, {24, 1}, {25, 1}, {30000, 1001}, {30, 1}, {48000, 1001}, {48, 1}, {50, 1}, {60000, 1001}, {60, 1}}};

bool sameRate(const MXFRational& a, const MXFRational& b) {
  return std::int64_t{a.numerator} * b.denominator == std::int64_t{b.numerator} * a.denominator && a.denominator != 0 &&
         b.denominator != 0;
}
bool is625(const MXFRational& rate) { return sameRate(rate, {25, 1}); }
bool is525(const MXFRational& rate) { return sameRate(rate, {30000, 1001}); }
// Only Raw has the 48 frame rates.
bool is48(const MXFRational& rate) { return sameRate(rate, {48000, 1001}) || sameRate(rate, {48, 1}); }

bool allows(ZeltaEssenceFormat format, const MXFRational& rate) {
  if (format == ZeltaEssenceFormat::D10 || format == ZeltaEssenceFormat::DV) return is625(rate) || is525(rate);
  const bool listed =
      std::any_of(allRates.begin(), allRates.end(), [&](const MXFRational& r) { return sameRate(r, rate); });
  return listed && (format == ZeltaEssenceFormat::Raw || !is48(rate));
}

std::string rateText(const MXFRational& rate) {
  return std::to_string(rate.numerator) + (rate.denominator == 1 ? "" : "/" + std::to_string(rate.denominator));
}

const char* formatName(ZeltaEssenceFormat format) {
  static const char* const names[] = {"D10", "DV", "MPEG", "Proxy", "Raw", "AVC"};
  return names[static_cast<std::uint32_t>(format)];
}

MXFRational decideRate(const Options& options, const PictureFacts& facts) {
  MXFRational rate = options.rate.value_or(facts.rate.numerator != 0 ? facts.rate : MXFRational{25, 1});
  if (!allows(options.format, rate))
    throw InputError(std::string(formatName(options.format)) + " has no rate " + rateText(rate) +
                     (options.rate ? "" : ": give --rate"));
  return rate;
}

std::uint32_t decideBitRate(const Options& options, const PictureFacts& facts) {
  const bool studio = options.format == ZeltaEssenceFormat::MPEG && options.simpleStudioProfile;
  if (options.format == ZeltaEssenceFormat::D10) {
    auto isD10 = [](std::int64_t bitRate) { return bitRate == 30000000 || bitRate == 40000000 || bitRate == 50000000; };
    if (options.bitRate && !isD10(*options.bitRate))
      throw InputError("invalid value for --bit-rate: D10 has 30, 40 or 50 Mbit/s");
    return options.bitRate.value_or(isD10(facts.bitRate) ? static_cast<std::uint32_t>(facts.bitRate) : 50000000);
  }
  if (options.format == ZeltaEssenceFormat::DV) return 25000000;
  if (options.bitRate) return *options.bitRate;
  if (facts.bitRate > 0 && facts.bitRate <= 0xFFFFFFFF && !studio) return static_cast<std::uint32_t>(facts.bitRate);
  switch (options.format) {
    case ZeltaEssenceFormat::MPEG:
      return studio ? 440000000 : 50000000;
    case ZeltaEssenceFormat::AVC:
      return 35000000;
    default:
      return 0;
  }
}

bool decideProgressive(const Options& options, const PictureFacts& facts, const MXFRational& rate) {
  const ZeltaEssenceFormat format = options.format;
  const bool fixed =
      format == ZeltaEssenceFormat::D10 || format == ZeltaEssenceFormat::DV || format == ZeltaEssenceFormat::Raw;
  if (fixed) {
    const bool progressive = format == ZeltaEssenceFormat::Raw;
    if (options.progressive && *options.progressive != progressive)
      throw InputError(std::string(formatName(format)) + " is " + (progressive ? "progressive" : "interlaced"));
    return progressive;
  }
  if (options.progressive) return *options.progressive;
  if (facts.fieldOrder == AV_FIELD_PROGRESSIVE) return true;
  if (facts.fieldOrder != AV_FIELD_UNKNOWN) return false;
  return !(is625(rate) || is525(rate) || sameRate(rate, {30, 1}));
}

// The octets that a frame may have, and whether it must have exactly them.
void decideFrameSizes(const Options& options, Clip& clip) {
  const MXFRational& rate = clip.rate;
  const std::uint64_t perFrame = std::uint64_t{clip.bitRate} * static_cast<std::uint64_t>(rate.denominator) /
                                 static_cast<std::uint64_t>(rate.numerator) / 8;
  switch (clip.format) {
    case ZeltaEssenceFormat::D10:
      clip.frameSizeLimit = is625(rate) ? RegularParameters(clip.bitRate, 25).getFrameSize()
                                        : NTSCParameters(clip.bitRate).getFrameSize();
      clip.paddedFrameSize = clip.frameSizeLimit;
      break;
    case ZeltaEssenceFormat::DV:
      clip.frameSizeLimit = is625(rate) ? 144000 : 120000;
      clip.exactFrameSize = true;
      break;
    case ZeltaEssenceFormat::MPEG:
      if (options.simpleStudioProfile) clip.frameSizeLimit = perFrame;
      break;
    case ZeltaEssenceFormat::AVC:
      if (options.avcWrapping == AVCWrapping::constant)
        clip.frameSizeLimit = is625(rate) || sameRate(rate, {50, 1}) ? 568832 : 472576;
      break;
    case ZeltaEssenceFormat::Raw:
      clip.frameSizeLimit = getChunkSize(options);
      clip.exactFrameSize = true;
      break;
    case ZeltaEssenceFormat::Proxy:
      break;
  }
}

void checkFrames(const Options& options, const Clip& clip, const PictureFacts& facts) {
  if (facts.frameCount == 0) throw InputError(options.picture + " has no frame");
  if (clip.frameSizeLimit == 0) return;
  const std::string limit = std::to_string(clip.frameSizeLimit);
  if (clip.exactFrameSize && (facts.smallestFrame != clip.frameSizeLimit || facts.largestFrame != clip.frameSizeLimit))
    throw InputError(
        options.picture + " has a frame of " +
        std::to_string(facts.smallestFrame != clip.frameSizeLimit ? facts.smallestFrame : facts.largestFrame) +
        " octets; " + formatName(clip.format) + " frames here have " + limit);
  if (facts.largestFrame > clip.frameSizeLimit)
    throw InputError(options.picture + " has a frame of " + std::to_string(facts.largestFrame) +
                     " octets, more than the " + limit + " of " + formatName(clip.format) +
                     " at this rate and bit rate");
}

std::uint32_t declaredChannels(ZeltaEssenceFormat format, std::uint32_t channels) {
  if (format != ZeltaEssenceFormat::D10 || channels == 0) return channels;
  if (channels > 8) throw InputError("D10 carries at most 8 sound channels, not " + std::to_string(channels));
  return channels <= 4 ? 4 : 8;
}

// The MPEG-2 profile-and-level byte from libavcodec's profile and level; the
// 4:2:2 profile has the escape bit.
std::uint16_t mpeg2ProfileAndLevel(const PictureFacts& facts) {
  if (facts.profile == FF_PROFILE_UNKNOWN || facts.level == FF_LEVEL_UNKNOWN) return 130;
  if (facts.profile == FF_PROFILE_MPEG2_422) return static_cast<std::uint16_t>(0x80 | facts.level);
  return static_cast<std::uint16_t>((facts.profile << 4) | facts.level);
}

std::uint16_t avcProfileAndLevel(const PictureFacts& facts) {
  if (facts.profile == FF_PROFILE_UNKNOWN || facts.level == FF_LEVEL_UNKNOWN) return (110 << 8) | 40;
  return static_cast<std::uint16_t>(((facts.profile & 0xFF) << 8) | (facts.level & 0xFF));
}

// The input's chroma subsampling and depth, when its pixel format is known.
void setComponents(ZeltaDefaultMetadata& m, const PictureFacts& facts) {
  const AVPixFmtDescriptor* pixels = av_pix_fmt_desc_get(facts.pixelFormat);
  if (pixels == nullptr || (pixels->flags & AV_PIX_FMT_FLAG_RGB) != 0) return;
  m.subsampling = {1u << pixels->log2_chroma_w, 1u << pixels->log2_chroma_h};
  m.componentDepth = static_cast<std::uint32_t>(pixels->comp[0].depth);
}

MXFRational aspectRatioOf(const PictureFacts& facts) {
  const AVRational& r = facts.displayAspectRatio;
  if ((r.num == 4 && r.den == 3) || (r.num == 16 && r.den == 9)) return {r.num, r.den};
  return {16, 9};
}

void setPictureSize(ZeltaDefaultMetadata& m, const Options& options, const PictureFacts& facts) {
  if (options.size) {
    m.displaySize = *options.size;
    return;
  }
  if (facts.width <= 0 || facts.height <= 0) throw InputError("the picture size is not known: give --size");
  const auto height = static_cast<std::uint32_t>(facts.height);
  m.displaySize = {static_cast<std::uint32_t>(facts.width), m.progressive ? height : height / 2};
}

void setGOP(ZeltaDefaultMetadata& m, const Options& options, const PictureFacts& facts, std::uint16_t defaultGOP) {
  m.maxGOP = options.maxGOP.value_or(facts.longestGOP != 0 ? facts.longestGOP : defaultGOP);
  m.bPictureCount = facts.longestGOP != 0 ? facts.longestBRun : 2;
  m.closedGOP = options.closedGOP;
  m.identicalGOP = facts.longestGOP != 0 && facts.identicalGOPs;
  m.singleSequence = true;
  m.lowDelay = facts.longestGOP != 0 && facts.longestBRun == 0;
}

void setLabelledPicture(ZeltaDefaultMetadata& m, const PictureFacts& facts, std::uint32_t height, ZeltaLineMap lineMap,
                        ZeltaSize subsampling) {
  m.displaySize = {720, height};
  m.videoLineMap = lineMap;
  m.aspectRatio = aspectRatioOf(facts);
  m.componentDepth = 8;
  m.subsampling = subsampling;
}

void setPicture(ZeltaDefaultMetadata& m, const Options& options, const Clip& clip, const PictureFacts& facts) {
  const bool ntsc = is525(clip.rate);
  switch (clip.format) {
    case ZeltaEssenceFormat::D10:
      setLabelledPicture(m, facts, ntsc ? 243 : 288, ntsc ? ZeltaLineMap(7, 270) : ZeltaLineMap(7, 320), {2, 1});
      return;
    case ZeltaEssenceFormat::DV:
      setLabelledPicture(m, facts, ntsc ? 240 : 288, ntsc ? ZeltaLineMap(23, 285) : ZeltaLineMap(23, 335),
                         ntsc ? ZeltaSize(4, 1) : ZeltaSize(2, 2));
      m.ancillaryData = true;
      return;
    case ZeltaEssenceFormat::MPEG:
      setPictureSize(m, options, facts);
      setComponents(m, facts);
      m.simpleStudioProfile = options.simpleStudioProfile;
      if (options.simpleStudioProfile) {
        m.profileAndLevel = options.profileLevel.value_or(0);
        m.maxGOP = 1;
        m.singleSequence = true;
        return;
      }
      m.profileAndLevel = options.profileLevel.value_or(mpeg2ProfileAndLevel(facts));
      setGOP(m, options, facts, 12);
      return;
    case ZeltaEssenceFormat::AVC:
      setPictureSize(m, options, facts);
      setComponents(m, facts);
      m.profileAndLevel = options.profileLevel.value_or(avcProfileAndLevel(facts));
      m.profileConstraint =
          facts.profile != FF_PROFILE_UNKNOWN && (facts.profile & FF_PROFILE_H264_INTRA) != 0 ? 16 : 0;
      setGOP(m, options, facts, 15);
      return;
    case ZeltaEssenceFormat::Raw:
      m.displaySize = options.size.value_or(defaultRawSize);
      m.profileAndLevel = options.rawCode;
      return;
    case ZeltaEssenceFormat::Proxy:
      return;
  }
}

// The start timecode as a count, by the same arithmetic as the driver's.
std::uint64_t startCount(const Options& options, const MXFRational& rate) {
  const auto base =
      static_cast<std::uint8_t>((std::int64_t{rate.numerator} * 2 + rate.denominator) / (2 * rate.denominator));
  if (options.dropFrame && (rate.denominator != 1001 || base % 30 != 0))
    throw InputError("--drop-frame needs the rate 30000/1001 or 60000/1001");
  const bool fieldCounting = sameRate(rate, {48000, 1001}) || sameRate(rate, {48, 1}) || sameRate(rate, {50, 1}) ||
                             sameRate(rate, {60000, 1001}) || sameRate(rate, {60, 1});
  std::unique_ptr<TimecodeCalculator> calculator(createTimecodeCalculator(base, options.dropFrame, fieldCounting));
  const Timecode& t = options.startTimecode;
  if (!calculator->isValid(t.hours, t.minutes, t.seconds, t.frames, 0))
    throw InputError("invalid value for --start-timecode at rate " + rateText(rate));
  return calculator->toCount(t.hours, t.minutes, t.seconds, t.frames, 0);
}

// The duration while the input goes on, or the count once it has ended.
class ClipMaster : public DullMetadataFilter {
 public:
  ClipMaster(std::shared_ptr<const ZeltaMasterMetadata> master, std::shared_ptr<const Progress> progress, bool unknown)
      : DullMetadataFilter(std::move(master)), progress_(std::move(progress)), unknown_(unknown) {}

  std::uint64_t getDuration() const override {
    if (!unknown_) return getMetadata().getDuration();
    return progress_->ended ? progress_->count : ZeltaUnknownDuration;
  }

 private:
  std::shared_ptr<const Progress> progress_;
  bool unknown_;
};

}  // namespace

std::size_t getRawFrameSize(std::uint16_t code, std::uint32_t width) {
  const auto row = std::find_if(rawSizes.begin(), rawSizes.end(),
                                [&](const RawSize& r) { return r.code == code && (r.width == 0 || r.width == width); });
  if (row == rawSizes.end())
    throw InputError("invalid value for --raw-code: " + std::to_string(code) + " at width " + std::to_string(width));
  return row->octets;
}

std::size_t getChunkSize(const Options& options) {
  if (options.format != ZeltaEssenceFormat::Raw) return 0;
  return getRawFrameSize(options.rawCode, options.size.value_or(defaultRawSize).first);
}

void checkOptions(const Options& options) {
  const PictureFacts unknown;
  const MXFRational rate = decideRate(options, unknown);
  decideBitRate(options, unknown);
  decideProgressive(options, unknown, rate);
  getChunkSize(options);
  if (options.rate) startCount(options, rate);
}

PictureFacts scanPicture(PictureInput& input) {
  PictureFacts facts;
  std::unique_ptr<PictureTypes> types;
  if (const MediaFile* media = input.getMedia()) {
    const AVCodecParameters& p = media->getParameters();
    const AVStream& stream = media->getStream();
    AVRational rate = stream.avg_frame_rate.num > 0 ? stream.avg_frame_rate : stream.r_frame_rate;
    if (rate.num > 0 && rate.den > 0) facts.rate = {rate.num, rate.den};
    facts.width = p.width;
    facts.height = p.height;
    facts.fieldOrder = p.field_order;
    facts.bitRate = p.bit_rate;
    facts.profile = p.profile;
    facts.level = p.level;
    facts.pixelFormat = static_cast<AVPixelFormat>(p.format);
    if (p.sample_aspect_ratio.num > 0 && p.width > 0 && p.height > 0)
      av_reduce(&facts.displayAspectRatio.num, &facts.displayAspectRatio.den,
                std::int64_t{p.width} * p.sample_aspect_ratio.num, std::int64_t{p.height} * p.sample_aspect_ratio.den,
                1 << 20);
    types = std::make_unique<PictureTypes>(p);
  }
  std::vector<std::uint8_t> frame;
  std::uint32_t gop = 0;
  std::uint32_t bRun = 0;
  std::uint32_t firstGOP = 0;
  while (input.next(frame)) {
    facts.smallestFrame = facts.frameCount == 0 ? frame.size() : std::min(facts.smallestFrame, frame.size());
    facts.largestFrame = std::max(facts.largestFrame, frame.size());
    ++facts.frameCount;
    const AVPictureType type = types ? types->of(frame) : AV_PICTURE_TYPE_NONE;
    if (type == AV_PICTURE_TYPE_NONE) continue;
    if (type == AV_PICTURE_TYPE_I && gop != 0) {
      if (firstGOP == 0) firstGOP = gop;
      facts.identicalGOPs = facts.identicalGOPs && gop == firstGOP;
      gop = 0;
    }
    ++gop;
    bRun = type == AV_PICTURE_TYPE_B ? bRun + 1 : 0;
    facts.longestGOP =
        static_cast<std::uint16_t>(std::min<std::uint32_t>(std::max<std::uint32_t>(facts.longestGOP, gop), 0xFFFF));
    facts.longestBRun =
        static_cast<std::uint16_t>(std::min<std::uint32_t>(std::max<std::uint32_t>(facts.longestBRun, bRun), 0xFFFF));
  }
  return facts;
}

Clip decideClip(const Options& options, const PictureFacts& facts, std::uint32_t soundChannels) {
  Clip clip;
  clip.format = options.format;
  clip.rate = decideRate(options, facts);
  clip.bitRate = decideBitRate(options, facts);
  clip.progressive = decideProgressive(options, facts, clip.rate);
  decideFrameSizes(options, clip);
  checkFrames(options, clip, facts);
  clip.soundChannels = soundChannels;
  clip.declaredChannels = declaredChannels(clip.format, soundChannels);
  clip.quantizationBits = options.quantizationBits;
  return clip;
}

std::shared_ptr<ZeltaMasterMetadata> createMaster(const Options& options, const Clip& clip, const PictureFacts& facts,
                                                  const std::shared_ptr<const Progress>& progress) {
  auto m = std::make_shared<ZeltaDefaultMetadata>();
  // The driver's own choice, given here so that the model built ahead is the
  // one that the driver builds.
  const bool labelled = clip.format == ZeltaEssenceFormat::D10 || clip.format == ZeltaEssenceFormat::DV;
  m->prefaceVersion = labelled ? 0x0102 : 0x0103;
  m->identification.companyName = L"Orvane";
  m->identification.productName = L"zelta-wrap";
  m->identification.productVersion = getZeltaToolkitVersion();
  m->identification.versionString = L"4.0.0";
  const std::array<std::uint8_t, 16> productUID{0x5A, 0x57, 0x52, 0x41, 0x50, 0x00, 0x40, 0x00,
                                                0x80, 0x00, 0x7A, 0x65, 0x6C, 0x74, 0x61, 0x01};
  for (std::size_t i = 0; i < productUID.size(); ++i) m->identification.productUID[i] = productUID[i];
  m->essenceFormat = static_cast<std::uint32_t>(clip.format);
  m->materialPackageUID = UMID::createNew(0x0F);
  m->filePackageUID = UMID::createNew(0x0F);
  m->packageName = options.packageName;
  m->editRate = clip.rate;
  m->bitRate = clip.bitRate;
  m->progressive = clip.progressive;
  setPicture(*m, options, clip, facts);
  m->audioChannelCount = clip.declaredChannels;
  m->quantizationBits = clip.quantizationBits;
  m->audioSamplingRates.assign(clip.declaredChannels, MXFRational{soundSamplingRate, 1});
  m->dropFrame = options.dropFrame;
  m->startTimecode = startCount(options, clip.rate);
  m->duration = facts.frameCount;
  m->indexSID = 2;
  m->bodySID = 1;
  return std::make_shared<ClipMaster>(m, progress, options.unknownDuration);
}

}  // namespace zelta_wrap
