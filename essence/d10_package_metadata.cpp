#include "mxf.h"

MXFGCLocalItems codeMXFD10PackageMetadata(const MXFD10PackageMetadata& metadata) {
  MXFGCLocalItems items;
  if (metadata.umid) items.emplace_back(MXFD10UMIDTag, metadata.umid->octets);
  if (metadata.klvMetadata) items.emplace_back(MXFD10KLVMetadataTag, *metadata.klvMetadata);
  return items;
}

MXFD10PackageMetadata parseMXFD10PackageMetadata(const MXFGCLocalItems& items) {
  MXFD10PackageMetadata metadata;
  for (const auto& [tag, value] : items) {
    if (tag == MXFD10UMIDTag)
      metadata.umid = UMID(value.size() == 64 ? UMID::extended : UMID::basic, value);
    else if (tag == MXFD10KLVMetadataTag)
      metadata.klvMetadata = value;
  }
  return metadata;
}
