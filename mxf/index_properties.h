// The properties of an index table segment: fixed tags, keys and names.
#ifndef ZELTA_MXF_INDEX_PROPERTIES_H
#define ZELTA_MXF_INDEX_PROPERTIES_H

#include <cstdint>

#include "mxf.h"

namespace zelta::mxf {

enum IndexProperty {
  instanceUIDProperty,
  indexEditRateProperty,
  indexStartPositionProperty,
  indexDurationProperty,
  editUnitByteCountProperty,
  indexSIDProperty,
  bodySIDProperty,
  sliceCountProperty,
  posTableCountProperty,
  deltaEntryArrayProperty,
  indexEntryArrayProperty,
  indexPropertyCount
};

struct IndexPropertyInfo {
  std::uint16_t tag;
  KLVKey key;
  const char* name;
  bool required;
};

// By IndexProperty, which is also the order in which they are written.
const IndexPropertyInfo& indexProperty(IndexProperty property);
// The segment's own primer, whatever the partition's says.
const MXFTagToKeyMap& indexPrimer();

}  // namespace zelta::mxf

#endif
