#include "mxf/primer.h"

#include "core/reports.h"

namespace zelta::mxf {

MXFPrimerEntries decodePrimer(const ByteVector& bytes) {
  util::LentInput lent(bytes);
  std::istream& in = lent.stream();
  std::uint32_t count = 0;
  std::uint32_t entrySize = 0;
  internalize(in, count);
  internalize(in, entrySize);
  check(entrySize >= primerEntrySize, "valid external length");
  MXFPrimerEntries entries;
  // No reservation by the count: a damaged count must fail on the octets,
  // not on memory.
  for (std::uint32_t i = 0; i < count; ++i) {
    MXFPrimerEntry entry;
    internalize(in, entry.tag);
    internalize(in, entry.key);
    if (entrySize > primerEntrySize) {
      in.seekg(entrySize - primerEntrySize, std::ios_base::cur);
      check(!in.fail(), "valid external length");
    }
    entries.push_back(entry);
  }
  util::requireExhausted(in);
  return entries;
}

ByteVector encodePrimer(const MXFPrimerEntries& entries) {
  ByteVector bytes;
  externalize(bytes, static_cast<std::uint32_t>(entries.size()), true);
  externalize(bytes, primerEntrySize, false);
  for (const MXFPrimerEntry& entry : entries) {
    externalize(bytes, entry.tag, false);
    externalize(bytes, entry.key, false);
  }
  return bytes;
}

namespace {

void compareWithStandard(const MXFPrimerEntry& entry, const zelta::Reports& errors) {
  const MXFTagToKeyMap& standardKeys = getMXFStandardPrimerKeys();
  const auto byTag = standardKeys.find(entry.tag);
  if (byTag != standardKeys.end() && byTag->second != entry.key)
    errors.error(nonStandardPrimerKeyId, zelta::detailed("non-standard primer key", entryText(entry)));
  const MXFKeyToTagMap& standardTags = getMXFStandardPrimerTags();
  const auto byKey = standardTags.find(entry.key);
  if (byKey != standardTags.end() && byKey->second != entry.tag)
    errors.warning(nonStandardPrimerTagId, zelta::detailed("non-standard primer tag", entryText(entry)));
}

}  // namespace

MXFTagToKeyMap verifyPrimer(const MXFPrimerEntries& entries, ErrorHandler* errorHandler) {
  const zelta::Reports errors(errorHandler);
  MXFTagToKeyMap keys;
  MXFKeyToTagMap tags;
  for (const MXFPrimerEntry& entry : entries) {
    if (errorHandler) compareWithStandard(entry, errors);
    const auto byTag = keys.emplace(entry.tag, entry.key);
    if (!byTag.second && byTag.first->second != entry.key)
      errors.error(inconsistentPrimerKeyId, zelta::detailed("inconsistent primer key", entryText(entry)));
    const auto byKey = tags.emplace(entry.key, entry.tag);
    if (!byKey.second && byKey.first->second != entry.tag)
      errors.warning(inconsistentPrimerTagId, zelta::detailed("inconsistent primer tag", entryText(entry)));
  }
  return keys;
}

std::string entryText(const MXFPrimerEntry& entry) {
  loomlib::ostringstream_classic out;
  out << "{ " << zelta::tagText(entry.tag) << ", " << entry.key << " }";
  return out.str();
}

}  // namespace zelta::mxf
