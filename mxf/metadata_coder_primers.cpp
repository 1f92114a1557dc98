#include <algorithm>
#include <array>

#include "mxf.h"

namespace {

// The index table segment's own tags, and the instance identifier's, in the
// order in which they are added.
constexpr std::array<std::uint16_t, 10> indexTags{0x3C0A, 0x3F05, 0x3F06, 0x3F07, 0x3F08,
                                                  0x3F09, 0x3F0A, 0x3F0B, 0x3F0C, 0x3F0D};

}  // namespace

// Nothing is removed: the entries may name a standard key again under the
// same tag.
void MXFFormatMetadataCoder::primer(const MXFPrimerEntries& entries) {
  MXFPrimerEntries all = getMXFStandardPrimer();
  all.insert(all.end(), entries.begin(), entries.end());
  MXFMetadataCoder::primer(all);
}

void MXFMetadataPlusIndexPrimerCoder::primer(const MXFPrimerEntries& entries) {
  MXFPrimerEntries all = entries;
  for (std::uint16_t tag : indexTags) {
    const bool present =
        std::any_of(entries.begin(), entries.end(), [tag](const MXFPrimerEntry& entry) { return entry.tag == tag; });
    if (!present) all.push_back(MXFPrimerEntry{tag, getMXFStandardPrimerKeys().at(tag)});
  }
  MXFMetadataCoder::primer(all);
}
