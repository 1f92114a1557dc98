// Files read through MXFReader into partitions (pack, primed sets, index
// segments, essence octets) and written again through MXFWriter.
#ifndef ZELTA_TEST_SUPPORT_MXF_REWRAP_H
#define ZELTA_TEST_SUPPORT_MXF_REWRAP_H

#include <functional>
#include <istream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/recording.h"

namespace zelta_test {

struct Partition {
  KLVKey key;
  MXFPartitionPack pack;
  bool hasMetadata = false;
  MXFPrimerEntries primer;
  std::vector<MXFPrimedSet> sets;
  bool hasIndex = false;
  std::vector<MXFIndexTableSegment> segments;
  ByteVector essence;
};

struct Capture {
  std::vector<Partition> partitions;
  RecordingErrorHandler errors;
};

// Every partition of the stream, its essence as the KLV octets it came in.
void capture(std::istream& stream, Capture& result);
void captureFile(const std::string& name, Capture& result);

// Writes a partition's essence octets on the writer's essence port.
typedef std::function<void(const ByteVector& essence, KLVHandler* handler)> EssenceRewriter;

// The essence as it came, element for element.
void rewriteAsKLV(const ByteVector& essence, KLVHandler* handler);

// The captured partitions written again, each essence through the
// rewriter, with a random index pack.
ByteVector rewrap(const Capture& original, const EssenceRewriter& essence = rewriteAsKLV);

}  // namespace zelta_test

#endif
