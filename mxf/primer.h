// The primer pack's value and the texts that name a tag or an entry.
#ifndef ZELTA_MXF_PRIMER_H
#define ZELTA_MXF_PRIMER_H

#include <cstdint>
#include <string>

#include "mxf.h"

namespace zelta::mxf {

// Octets of an entry as written: a two-octet tag and a key.
inline constexpr std::uint32_t primerEntrySize = 18;

// Count, entry size, entries. A larger entry size is skipped over; a smaller
// one, a cut entry or octets after the last entry fail.
MXFPrimerEntries decodePrimer(const ByteVector& bytes);
// Count, entry size 18, entries.
ByteVector encodePrimer(const MXFPrimerEntries& entries);

// The map from tag to key of a primer, after reporting to errors, when it
// is not null, each entry that departs from the standard primer or from an
// earlier entry. A tag keeps its first key; a key may have several tags.
MXFTagToKeyMap verifyPrimer(const MXFPrimerEntries& entries, ErrorHandler* errors);

// "{ 3C.0A, 06.0E.2B.34.01.01.01.01.01.01.15.02.00.00.00.00 }"
std::string entryText(const MXFPrimerEntry& entry);

}  // namespace zelta::mxf

#endif
