#include "support/mxf_index_segments.h"

#include <sstream>

#include "support/mxf_streams.h"

namespace zelta_test {

KLVKey spelledSegmentKey() { return keyOf("06.0E.2B.34.02.53.01.01.0D.01.02.01.01.10.01.00"); }

SpelledItems requiredItems(std::int64_t start, std::int64_t duration) {
  ByteVector startBytes;
  externalize(startBytes, start, true);
  ByteVector durationBytes;
  externalize(durationBytes, duration, true);
  return {{0x3C0A, bytesOf("11 11 11 11 11 11 11 11 11 11 11 11 11 11 11 11")},
          {0x3F0B, bytesOf("00 00 00 19 00 00 00 01")},
          {0x3F0C, startBytes},
          {0x3F0D, durationBytes},
          {0x3F07, bytesOf("00 00 00 02")}};
}

ByteVector segmentBytes(const SpelledItems& items) { return twoOctetSet(spelledSegmentKey(), items); }

void parseIndex(const ByteVector& bytes, IndexRun& run, bool withErrorHandler) {
  MXFIndexParser parser(&run.index);
  if (withErrorHandler) parser.setErrorHandler(&run.errors);
  readThrough(bytes, parser);
}

ByteVector codeIndex(const std::vector<MXFIndexTableSegment>& segments, std::uint32_t kagSize) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  MXFIndexCoder coder(&writer);
  coder.setKagSize(kagSize);
  coder.startIndex();
  for (const MXFIndexTableSegment& segment : segments) coder.indexTableSegment(segment);
  coder.endIndex();
  const std::string text = out.str();
  return ByteVector(text.begin(), text.end());
}

MXFIndexTableSegment sampleSegment() {
  MXFIndexTableSegment segment;
  segment.instanceUID = MXFUID(std::array<std::uint8_t, 16>{1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 16});
  segment.indexEditRate = MXFRational{25, 1};
  segment.indexStartPosition = 10;
  segment.indexDuration = 3;
  segment.indexSID = 2;
  segment.bodySID = 1;
  segment.sliceCount = 2;
  segment.deltaEntryArray = {{0, 0, 0}, {0, 1, 0}, {-1, 2, 16}};
  segment.indexEntryArray = {{0, 0, 0xC0, 0, {100, 200}, {}},
                             {1, -1, 0x22, 1000, {110, 210}, {}},
                             {-1, -2, 0x33, 2000, {120, 220}, {}}};
  return segment;
}

}  // namespace zelta_test
