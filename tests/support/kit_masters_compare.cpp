#include "support/kit_masters_compare.h"

#include <sstream>
#include <string>
#include <vector>

namespace zelta_test {

namespace {

std::string text(const std::wstring& value) { return std::string(value.begin(), value.end()); }
std::string text(const std::string& value) { return value; }
std::string text(const MXFRational& r) { return std::to_string(r.numerator) + "/" + std::to_string(r.denominator); }
std::string text(const MXFTimestamp& t) {
  std::ostringstream out;
  out << t.year << "-" << int(t.month) << "-" << int(t.day) << " " << int(t.hour) << ":" << int(t.minute) << ":"
      << int(t.second) << "." << int(t.quarterMillisecond);
  return out.str();
}
std::string text(const MXFProductVersion& v) {
  return std::to_string(v.major) + "." + std::to_string(v.minor) + "." + std::to_string(v.tertiary) + "." +
         std::to_string(v.patch) + "." + std::to_string(v.release);
}
std::string text(const UMID& u) {
  std::ostringstream out;
  for (std::uint8_t octet : u.octets) out << std::hex << int(octet) << ".";
  return out.str();
}
std::string text(const MXFUID& u) {
  return text(UMID(UMID::basic, std::vector<std::uint8_t>(u.data(), u.data() + 16)));
}
template <typename A, typename B>
std::string text(const std::pair<A, B>& p) {
  return std::to_string(p.first) + "," + std::to_string(p.second);
}
std::string text(const ZeltaChannelStatus& status) {
  std::ostringstream out;
  for (std::uint8_t octet : status) out << std::hex << int(octet) << ".";
  return out.str();
}
template <typename T>
std::string text(const T& value) {
  return std::to_string(value);
}

class Differences {
 public:
  template <typename T>
  void compare(const std::string& name, const T& expected, const T& actual) {
    if (!(expected == actual)) found.push_back(name + ": " + text(expected) + " / " + text(actual));
  }
  std::vector<std::string> found;
};

}  // namespace

std::vector<std::string> masterDifferences(const ZeltaMasterMetadata& e, const ZeltaMasterMetadata& a) {
  Differences d;
  d.compare("prefaceVersion", e.getPrefaceVersion(), a.getPrefaceVersion());
  const ZeltaIdentification ei = e.getIdentification();
  const ZeltaIdentification ai = a.getIdentification();
  d.compare("companyName", ei.companyName, ai.companyName);
  d.compare("productName", ei.productName, ai.productName);
  d.compare("productVersion", ei.productVersion, ai.productVersion);
  d.compare("versionString", ei.versionString, ai.versionString);
  d.compare("productUID", ei.productUID, ai.productUID);
  d.compare("creationDate", e.getCreationDate(), a.getCreationDate());
  d.compare("modificationDate", e.getModificationDate(), a.getModificationDate());
  d.compare("essenceFormat", e.getEssenceFormat(), a.getEssenceFormat());
  d.compare("materialPackageUID", e.getMaterialPackageUID(), a.getMaterialPackageUID());
  d.compare("filePackageUID", e.getFilePackageUID(), a.getFilePackageUID());
  d.compare("packageName", e.getPackageName(), a.getPackageName());
  d.compare("editRate", e.getEditRate(), a.getEditRate());
  d.compare("descriptiveText", e.getDescriptiveText(), a.getDescriptiveText());
  d.compare("bitRate", e.getBitRate(), a.getBitRate());
  d.compare("progressive", e.isProgressive(), a.isProgressive());
  d.compare("displaySize", e.getDisplaySize(), a.getDisplaySize());
  d.compare("videoLineMap", e.getVideoLineMap(), a.getVideoLineMap());
  d.compare("aspectRatio", e.getAspectRatio(), a.getAspectRatio());
  d.compare("rgb", e.isRGB(), a.isRGB());
  d.compare("wideRangeRGB", e.isWideRangeRGB(), a.isWideRangeRGB());
  d.compare("componentDepth", e.getComponentDepth(), a.getComponentDepth());
  d.compare("subsampling", e.getSubsampling(), a.getSubsampling());
  d.compare("simpleStudioProfile", e.isSimpleStudioProfile(), a.isSimpleStudioProfile());
  d.compare("singleSequence", e.isSingleSequence(), a.isSingleSequence());
  d.compare("constantBFrames", e.hasConstantBFrames(), a.hasConstantBFrames());
  d.compare("lowDelay", e.isLowDelay(), a.isLowDelay());
  d.compare("closedGOP", e.isClosedGOP(), a.isClosedGOP());
  d.compare("identicalGOP", e.isIdenticalGOP(), a.isIdenticalGOP());
  d.compare("maxGOP", e.getMaxGOP(), a.getMaxGOP());
  d.compare("bPictureCount", e.getBPictureCount(), a.getBPictureCount());
  d.compare("profileAndLevel", e.getProfileAndLevel(), a.getProfileAndLevel());
  d.compare("profileConstraint", e.getProfileConstraint(), a.getProfileConstraint());
  d.compare("halfSize", e.isHalfSize(), a.isHalfSize());
  d.compare("audioChannelCount", e.getAudioChannelCount(), a.getAudioChannelCount());
  d.compare("quantizationBits", e.getQuantizationBits(), a.getQuantizationBits());
  // Every channel of either, and the first one beyond, which both answer
  // with their defaults.
  const std::uint32_t channels = std::max(e.getAudioChannelCount(), a.getAudioChannelCount()) + 1;
  for (std::uint32_t c = 0; c < channels; ++c) {
    d.compare("audioSamplingRate " + std::to_string(c), e.getAudioSamplingRate(c), a.getAudioSamplingRate(c));
    d.compare("fixedChannelStatusData " + std::to_string(c), e.getFixedChannelStatusData(c),
              a.getFixedChannelStatusData(c));
  }
  d.compare("ancillaryData", e.hasAncillaryData(), a.hasAncillaryData());
  d.compare("dropFrame", e.isDropFrame(), a.isDropFrame());
  d.compare("startTimecode", e.getStartTimecode(), a.getStartTimecode());
  d.compare("origin", e.getOrigin(), a.getOrigin());
  d.compare("duration", e.getDuration(), a.getDuration());
  d.compare("indexSID", e.getIndexSID(), a.getIndexSID());
  d.compare("bodySID", e.getBodySID(), a.getBodySID());
  return d.found;
}

}  // namespace zelta_test
