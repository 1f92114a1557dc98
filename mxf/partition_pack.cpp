#include "mxf.h"

bool MXFPartitionPack::operator==(const MXFPartitionPack& o) const {
  return majorVersion == o.majorVersion && minorVersion == o.minorVersion && kagSize == o.kagSize &&
         thisPartition == o.thisPartition && previousPartition == o.previousPartition &&
         footerPartition == o.footerPartition && headerByteCount == o.headerByteCount &&
         indexByteCount == o.indexByteCount && indexSID == o.indexSID && bodyOffset == o.bodyOffset &&
         bodySID == o.bodySID && operationalPattern == o.operationalPattern &&
         essenceContainers == o.essenceContainers;
}

void internalize(std::istream& in, MXFPartitionPack& pack) {
  internalize(in, pack.majorVersion);
  internalize(in, pack.minorVersion);
  internalize(in, pack.kagSize);
  internalize(in, pack.thisPartition);
  internalize(in, pack.previousPartition);
  internalize(in, pack.footerPartition);
  internalize(in, pack.headerByteCount);
  internalize(in, pack.indexByteCount);
  internalize(in, pack.indexSID);
  internalize(in, pack.bodyOffset);
  internalize(in, pack.bodySID);
  internalize(in, pack.operationalPattern);
  internalize(in, pack.essenceContainers);
}

void externalize(std::ostream& out, const MXFPartitionPack& pack) {
  externalize(out, pack.majorVersion);
  externalize(out, pack.minorVersion);
  externalize(out, pack.kagSize);
  externalize(out, pack.thisPartition);
  externalize(out, pack.previousPartition);
  externalize(out, pack.footerPartition);
  externalize(out, pack.headerByteCount);
  externalize(out, pack.indexByteCount);
  externalize(out, pack.indexSID);
  externalize(out, pack.bodyOffset);
  externalize(out, pack.bodySID);
  externalize(out, pack.operationalPattern);
  externalize(out, pack.essenceContainers);
}
