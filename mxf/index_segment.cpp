#include "mxf.h"

bool MXFIndexTableSegment::operator==(const MXFIndexTableSegment& o) const {
  return instanceUID == o.instanceUID && indexEditRate == o.indexEditRate &&
         indexStartPosition == o.indexStartPosition && indexDuration == o.indexDuration &&
         editUnitByteCount == o.editUnitByteCount && indexSID == o.indexSID && bodySID == o.bodySID &&
         sliceCount == o.sliceCount && posTableCount == o.posTableCount && deltaEntryArray == o.deltaEntryArray &&
         indexEntryArray == o.indexEntryArray;
}

MXFIndexHandler::~MXFIndexHandler() = default;
