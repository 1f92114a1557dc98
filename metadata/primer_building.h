// The primer of a coded model: static tags as the classes give them,
// dynamic tags for the rest.
#ifndef ZELTA_METADATA_PRIMER_BUILDING_H
#define ZELTA_METADATA_PRIMER_BUILDING_H

#include "mxf.h"

namespace zelta {

// Keys with tag 0 get the free tags from 0x8000 up, in key order; the
// entries come out in ascending tag order ("consistent primer entry",
// "dynamic tag available").
MXFPrimerEntries buildPrimerEntries(const MXFKeyToTagMap& primer);

}  // namespace zelta

#endif
