#include "kit/validators/cross_validator.h"

#include <algorithm>
#include <memory>
#include <vector>

#include "kit/essence_formats.h"
#include "kit/user_stamp.h"

namespace {

constexpr MXFRational halfFrameRate{1, 2};
constexpr MXFRational ntscHalfFrameRate{500, 1001};
constexpr MXFRational pal{25, 1};
constexpr MXFRational ntsc{30000, 1001};
constexpr MXFRational film{24000, 1001};

// The octets of a user stamp that carry flags which may differ freely: the
// hours and the minutes, masked by the rate class.
constexpr std::size_t hoursOctet = 4;
constexpr std::size_t minutesOctet = 3;
constexpr std::uint8_t palHoursMask = 0x3F;
constexpr std::uint8_t ntscHoursMask = 0xBF;
constexpr std::uint8_t palMinutesMask = 0x7F;
constexpr std::uint8_t ntscMinutesMask = 0xFF;
constexpr std::uint32_t palBase = 25;

bool removeLabel(std::vector<KLVKey>& labels, const KLVKey& label) {
  const auto found = std::find(labels.begin(), labels.end(), label);
  if (found == labels.end()) return false;
  labels.erase(found);
  return true;
}

bool isAnyRate(const MXFRational& rate) {
  const std::vector<MXFRational>& rates = zelta::getEditRates(ZeltaEssenceFormat::Raw);
  return std::any_of(rates.begin(), rates.end(), [&](const MXFRational& r) { return zelta::isSameRate(r, rate); });
}

MXFSDTICPTimeStamp masked(MXFSDTICPTimeStamp stamp, std::uint32_t base) {
  stamp[hoursOctet] &= base == palBase ? palHoursMask : ntscHoursMask;
  stamp[minutesOctet] &= base == palBase ? palMinutesMask : ntscMinutesMask;
  return stamp;
}

}  // namespace

ZeltaCrossValidator::ZeltaCrossValidator() = default;
ZeltaCrossValidator::~ZeltaCrossValidator() = default;

void ZeltaCrossValidator::setErrorHandler(ErrorHandler* errorHandler) { reports_.setHandler(errorHandler); }

std::optional<ZeltaEssenceFormat> ZeltaCrossValidator::format() const {
  if (!pictureContainer_) return std::nullopt;
  return zelta::findEssenceFormat(*pictureContainer_);
}

void ZeltaCrossValidator::setEssenceContainers(const std::vector<KLVKey>& labels) {
  const std::set<KLVKey> set(labels.begin(), labels.end());
  if (essenceContainers_) {
    if (set != *essenceContainers_) reports_.error(kitEssenceContainersId, "unexpected essenceContainers value");
    return;
  }
  essenceContainers_ = set;
  selectContainers(labels);
}

// The picture's container first; then what may stand beside it, each once.
void ZeltaCrossValidator::selectContainers(const std::vector<KLVKey>& labels) {
  std::vector<KLVKey> left(labels);
  const auto picture = std::find_if(left.begin(), left.end(),
                                    [](const KLVKey& label) { return zelta::findEssenceFormat(label).has_value(); });
  if (picture == left.end()) {
    reports_.error(kitEssenceContainersId, "unsupported essenceContainers value");
  } else {
    pictureContainer_ = *picture;
    left.erase(picture);
  }
  const std::optional<ZeltaEssenceFormat> kind = format();
  if (kind == ZeltaEssenceFormat::D10) {
    // D-10 sound is inside the picture's container.
    if (!left.empty()) reports_.error(kitEssenceContainersId, "unexpected essenceContainers value");
    return;
  }
  const KLVKey auxiliary = zelta::getSoundContainer(kind.value_or(ZeltaEssenceFormat::MPEG));
  if (removeLabel(left, auxiliary)) auxiliaryContainer_ = auxiliary;
  if (kind == ZeltaEssenceFormat::MPEG || kind == ZeltaEssenceFormat::Raw || kind == ZeltaEssenceFormat::AVC)
    removeLabel(left, zelta::ancillaryDataContainer);
  if (labels.size() >= 2 && !removeLabel(left, zelta::multipleEssenceContainer) && kind != ZeltaEssenceFormat::Proxy)
    reports_.warning(kitEssenceContainersId, "unexpected essenceContainers value (missing MULTIPLE_ESSENCE)");
  if (!left.empty()) reports_.error(kitEssenceContainersId, "unexpected essenceContainers value");
}

void ZeltaCrossValidator::setOperationalPattern(const KLVKey& label) {
  const KLVKey op1a = zelta::getOperationalPattern(ZeltaEssenceFormat::MPEG);
  const KLVKey proxy = zelta::getOperationalPattern(ZeltaEssenceFormat::Proxy);
  const std::optional<ZeltaEssenceFormat> kind = format();
  const bool supported = !kind ? (label == op1a || label == proxy) : label == zelta::getOperationalPattern(*kind);
  if (!supported) reports_.error(kitEssenceContainersId, "unsupported operationalPattern value");
}

void ZeltaCrossValidator::setBodySID(std::uint32_t bodySID) {
  if (bodySID_ == 0 && bodySID != 0)
    bodySID_ = bodySID;
  else if (bodySID == 0 || bodySID != bodySID_)
    reports_.error(kitBodySIDId, "unexpected bodySID value");
}

void ZeltaCrossValidator::setIndexSID(std::uint32_t indexSID) {
  if (indexSID_ == 0 && indexSID != 0)
    indexSID_ = indexSID;
  else if (indexSID == 0 || indexSID != indexSID_)
    reports_.error(kitIndexSIDId, "unexpected indexSID value");
}

bool ZeltaCrossValidator::isSuitableEditRate(const MXFRational& rate) const {
  const std::optional<ZeltaEssenceFormat> kind = format();
  if (!kind) return isAnyRate(rate);
  const std::vector<MXFRational>& rates = zelta::getEditRates(*kind);
  return std::any_of(rates.begin(), rates.end(), [&](const MXFRational& r) { return zelta::isSameRate(r, rate); });
}

void ZeltaCrossValidator::setEditRate(const MXFRational& editRate) {
  if (editRate_.denominator == 0) {
    if (!isSuitableEditRate(editRate)) reports_.error(kitValueId, "unsupported TimelineTrack.editRate value");
    editRate_ = editRate;
    return;
  }
  if (!zelta::isSameRate(editRate, editRate_)) reports_.error(kitValueId, "unexpected TimelineTrack.editRate value");
}

// A proxy's index has one entry per 50 or 60 frames.
void ZeltaCrossValidator::setIndexEditRate(const MXFRational& indexEditRate) {
  const std::optional<ZeltaEssenceFormat> kind = format();
  const bool timelineKnown = editRate_.denominator != 0;
  const bool halfFrame = zelta::isSameRate(indexEditRate, halfFrameRate);
  const bool ntscHalfFrame = zelta::isSameRate(indexEditRate, ntscHalfFrameRate);
  if (!kind) {
    if (!isAnyRate(indexEditRate) && !halfFrame && !ntscHalfFrame)
      reports_.error(kitValueId, "unsupported indexEditRate value");
    return;
  }
  if (kind == ZeltaEssenceFormat::Proxy) {
    const bool suitable =
        !timelineKnown
            ? halfFrame || ntscHalfFrame
            : (halfFrame && zelta::isSameRate(editRate_, pal)) ||
                  (ntscHalfFrame && (zelta::isSameRate(editRate_, ntsc) || zelta::isSameRate(editRate_, film)));
    if (!suitable) reports_.error(kitValueId, "unsupported indexEditRate value");
    return;
  }
  if (timelineKnown) {
    if (!zelta::isSameRate(indexEditRate, editRate_)) reports_.error(kitValueId, "unexpected indexEditRate value");
    return;
  }
  if (!isSuitableEditRate(indexEditRate)) {
    reports_.error(kitValueId, "unsupported indexEditRate value");
    return;
  }
  editRate_ = indexEditRate;
}

void ZeltaCrossValidator::setStartTimecode(std::int64_t startTimecode, std::int64_t origin, std::int64_t duration,
                                           bool dropFrame) {
  if (startTimecode_ && *startTimecode_ != startTimecode)
    reports_.warning(kitTimecodeId, "inconsistent startTimecodes");
  startTimecode_ = startTimecode;
  origin_ = origin;
  duration_ = duration;
  dropFrame_ = dropFrame;
  calculator_.reset();
  if (zelta::getTimecodeBase(editRate_) != 0) calculator_ = zelta::makeStampCalculator(editRate_, dropFrame);
}

void ZeltaCrossValidator::checkUserStamp(const MXFSDTICPTimeStamp& stamp, std::int64_t position) {
  if (userStampFailed_ || !calculator_ || position < origin_ || position - origin_ >= duration_) return;
  const std::uint32_t base = zelta::getTimecodeBase(editRate_);
  const auto count = static_cast<std::uint32_t>(position - origin_ + *startTimecode_);
  const MXFSDTICPTimeStamp expected = zelta::getUserStamp(*calculator_, count, base, dropFrame_);
  if (stamp[0] != zelta::userStampKind) {
    reports_.warning(kitTimecodeId, "expected SMPTE12M userstamp");
    userStampFailed_ = true;
  } else if (masked(stamp, base) != masked(expected, base)) {
    reports_.warning(kitTimecodeId, "inconsistent user stamp and startTimecode");
    userStampFailed_ = true;
  }
}

std::optional<KLVKey> ZeltaCrossValidator::getEssenceContainer() const { return pictureContainer_; }
std::optional<KLVKey> ZeltaCrossValidator::getAuxiliaryContainer() const { return auxiliaryContainer_; }

void ZeltaCrossValidator::clearEssenceContainers() {
  essenceContainers_.reset();
  pictureContainer_.reset();
  auxiliaryContainer_.reset();
}
