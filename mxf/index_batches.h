// The two arrays of an index table segment as batches: count, entry length,
// entries.
#ifndef ZELTA_MXF_INDEX_BATCHES_H
#define ZELTA_MXF_INDEX_BATCHES_H

#include <cstdint>
#include <vector>

#include "mxf.h"

namespace zelta::mxf {

// Entries go into entries as they are read, so that a failure leaves those
// before it. The octets must be used up.
void decodeDeltaEntries(const ByteVector& bytes, std::vector<MXFDeltaEntry>& entries);
// Each entry takes sliceCount offsets and posTableCount rationals and is then
// skipped to its declared length; octets after the last entry are ignored.
void decodeIndexEntries(const ByteVector& bytes, std::uint8_t sliceCount, std::uint8_t posTableCount,
                        std::vector<MXFIndexEntry>& entries);

ByteVector encodeDeltaEntries(const std::vector<MXFDeltaEntry>& entries);
// Every entry must have the shape of the first ("valid entry externalize()").
ByteVector encodeIndexEntries(const std::vector<MXFIndexEntry>& entries);

}  // namespace zelta::mxf

#endif
