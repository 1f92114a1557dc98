#include "metadata/primer_building.h"

namespace zelta {

namespace {

constexpr std::uint16_t beforeFirstDynamicTag = 0x7FFF;
constexpr std::uint16_t lastTag = 0xFFFF;

// Static tags go in first, so that the dynamic ones step over them.
void enterStaticTags(const MXFKeyToTagMap& primer, MXFTagToKeyMap& keys) {
  for (const MXFKeyToTagMap::value_type& entry : primer) {
    if (entry.second == 0) continue;
    check(keys.emplace(entry.second, entry.first).second, "consistent primer entry");
  }
}

// A search that ends on a taken last tag gives no tag and leaves the next
// tag there, so that the following dynamic entry fails.
void enterDynamicTags(const MXFKeyToTagMap& primer, MXFTagToKeyMap& keys) {
  std::uint16_t next = beforeFirstDynamicTag;
  for (const MXFKeyToTagMap::value_type& entry : primer) {
    if (entry.second != 0) continue;
    check(next < lastTag, "dynamic tag available");
    do ++next;
    while (next < lastTag && keys.count(next) != 0);
    if (keys.count(next) == 0) keys.emplace(next, entry.first);
  }
}

}  // namespace

MXFPrimerEntries buildPrimerEntries(const MXFKeyToTagMap& primer) {
  MXFTagToKeyMap keys;
  enterStaticTags(primer, keys);
  enterDynamicTags(primer, keys);
  MXFPrimerEntries entries;
  entries.reserve(keys.size());
  for (const MXFTagToKeyMap::value_type& entry : keys) entries.push_back(MXFPrimerEntry{entry.first, entry.second});
  return entries;
}

}  // namespace zelta
