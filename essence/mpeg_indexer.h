// The picture of an MPEG-2 frame, as the indexer reads it.
#ifndef ZELTA_ESSENCE_MPEG_INDEXER_H
#define ZELTA_ESSENCE_MPEG_INDEXER_H

#include <cstdint>

#include "mxf.h"

namespace zelta {

// Notes a sequence header and the GOP header's flags up to the first
// picture header, whose temporal_reference becomes the displayIndex ("valid
// MPEG-2 group_of_pictures_header", "valid MPEG-2 picture_header", "valid
// MPEG-2 frame buffer"). Any octets are safe to give.
MPEGIndexer::Picture scanMPEG2Picture(const std::uint8_t* data, std::uint64_t length);

}  // namespace zelta

#endif
