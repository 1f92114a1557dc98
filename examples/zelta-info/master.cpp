#include "master.h"

#include <cstdio>

#include "kit.h"
#include "summary.h"

namespace zelta_info {

namespace {

ModelValue number(unsigned long long value) { return literalValue(std::to_string(value)); }
ModelValue signedNumber(long long value) { return literalValue(std::to_string(value)); }
ModelValue truth(bool value) { return literalValue(value ? "true" : "false"); }
ModelValue rational(const MXFRational& r) {
  return textValue(std::to_string(r.numerator) + "/" + std::to_string(r.denominator));
}
ModelValue pair(unsigned long long first, unsigned long long second) {
  return ModelValue{ModelValue::list, std::string(), {number(first), number(second)}, nullptr};
}

const char* formatName(std::uint32_t format) {
  switch (static_cast<ZeltaEssenceFormat>(format)) {
    case ZeltaEssenceFormat::D10:
      return "D10";
    case ZeltaEssenceFormat::DV:
      return "DV";
    case ZeltaEssenceFormat::MPEG:
      return "MPEG";
    case ZeltaEssenceFormat::Proxy:
      return "Proxy";
    case ZeltaEssenceFormat::Raw:
      return "Raw";
    case ZeltaEssenceFormat::AVC:
      return "AVC";
  }
  return nullptr;
}

NamedValues masterValues(const ZeltaMasterMetadata& m) {
  const char* format = formatName(m.getEssenceFormat());
  // The identification's five fields stand in its place.
  const ZeltaIdentification id = m.getIdentification();
  NamedValues values = {
      {"prefaceVersion", number(m.getPrefaceVersion())},
      {"companyName", textValue(utf8Text(id.companyName))},
      {"productName", textValue(utf8Text(id.productName))},
      {"productVersion", textValue(versionText(id.productVersion))},
      {"versionString", textValue(utf8Text(id.versionString))},
      {"productUID", textValue(identifierText(id.productUID))},
      {"creationDate", textValue(timestampText(m.getCreationDate()))},
      {"modificationDate", textValue(timestampText(m.getModificationDate()))},
      {"essenceFormat", format ? textValue(format) : number(m.getEssenceFormat())},
      {"materialPackageUID", textValue(hexText(m.getMaterialPackageUID().octets))},
      {"filePackageUID", textValue(hexText(m.getFilePackageUID().octets))},
      {"packageName", textValue(utf8Text(m.getPackageName()))},
      {"editRate", rational(m.getEditRate())},
      {"descriptiveText", textValue(m.getDescriptiveText())},
      {"bitRate", number(m.getBitRate())},
      {"progressive", truth(m.isProgressive())},
      {"displaySize", pair(m.getDisplaySize().first, m.getDisplaySize().second)},
      {"videoLineMap", ModelValue{ModelValue::list,
                                  std::string(),
                                  {signedNumber(m.getVideoLineMap().first), signedNumber(m.getVideoLineMap().second)},
                                  nullptr}},
      {"aspectRatio", rational(m.getAspectRatio())},
      {"rgb", truth(m.isRGB())},
      {"wideRangeRGB", truth(m.isWideRangeRGB())},
      {"componentDepth", number(m.getComponentDepth())},
      {"subsampling", pair(m.getSubsampling().first, m.getSubsampling().second)},
      {"simpleStudioProfile", truth(m.isSimpleStudioProfile())},
      {"singleSequence", truth(m.isSingleSequence())},
      {"constantBFrames", truth(m.hasConstantBFrames())},
      {"lowDelay", truth(m.isLowDelay())},
      {"closedGOP", truth(m.isClosedGOP())},
      {"identicalGOP", truth(m.isIdenticalGOP())},
      {"maxGOP", number(m.getMaxGOP())},
      {"bPictureCount", number(m.getBPictureCount())},
      {"profileAndLevel", number(m.getProfileAndLevel())},
      {"profileConstraint", number(m.getProfileConstraint())},
      {"halfSize", truth(m.isHalfSize())},
      {"audioChannelCount", number(m.getAudioChannelCount())},
      {"quantizationBits", number(m.getQuantizationBits())}};
  // Per channel: every channel of the count.
  ModelValue rates{ModelValue::list, std::string(), {}, nullptr};
  ModelValue status{ModelValue::list, std::string(), {}, nullptr};
  for (std::uint32_t channel = 0; channel < m.getAudioChannelCount(); ++channel) {
    rates.items.push_back(rational(m.getAudioSamplingRate(channel)));
    const auto data = m.getFixedChannelStatusData(channel);
    status.items.push_back(textValue(hexText(ByteVector(data.begin(), data.end()))));
  }
  values.emplace_back("audioSamplingRates", rates);
  values.emplace_back("fixedChannelStatusData", status);
  values.emplace_back("ancillaryData", truth(m.hasAncillaryData()));
  values.emplace_back("dropFrame", truth(m.isDropFrame()));
  values.emplace_back("startTimecode", number(m.getStartTimecode()));
  values.emplace_back("origin", signedNumber(m.getOrigin()));
  values.emplace_back("duration", number(m.getDuration()));
  values.emplace_back("indexSID", number(m.getIndexSID()));
  values.emplace_back("bodySID", number(m.getBodySID()));
  return values;
}

}  // namespace

Master extractMaster(const Model& model) {
  Master master;
  if (!model.present) return master;
  master.present = true;
  try {
    master.values = masterValues(*createZeltaMasterMetadata(model.preface));
  } catch (const util::assertion_failure& failure) {
    master.failure = failure.what();
  }
  return master;
}

void printMasterText(std::ostream& out, const Master& master) {
  if (!master.present) {
    out << "master: no header metadata\n";
    return;
  }
  if (!master.failure.empty()) {
    out << "master: not collapsed: " << master.failure << "\n";
    return;
  }
  out << "master:\n";
  printNamedText(out, master.values, "  ");
}

void printMasterJson(std::ostream& out, const Master& master) {
  if (!master.present) {
    out << "null";
    return;
  }
  if (!master.failure.empty()) {
    out << "{\"failure\": " << jsonString(master.failure) << "}";
    return;
  }
  printNamedJson(out, master.values);
}

}  // namespace zelta_info
