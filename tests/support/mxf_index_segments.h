// Index table segments spelled by hand, and an index handler that writes
// down what it hears.
#ifndef ZELTA_TESTS_SUPPORT_MXF_INDEX_SEGMENTS_H
#define ZELTA_TESTS_SUPPORT_MXF_INDEX_SEGMENTS_H

#include <string>
#include <vector>

#include "klv.h"
#include "mxf.h"
#include "support/mxf_primed_sets.h"
#include "support/recording.h"

namespace zelta_test {

// Keeps "startIndex", "segment" and "endIndex" lines and every segment.
class RecordingIndexHandler : public MXFIndexHandler {
public:
  void startIndex() override { events.push_back("startIndex"); }
  void endIndex() override { events.push_back("endIndex"); }
  void indexTableSegment(const MXFIndexTableSegment& segment) override {
    events.push_back("segment");
    segments.push_back(segment);
  }

  std::vector<std::string> events;
  std::vector<MXFIndexTableSegment> segments;
};

// The segment key as the text spells it.
KLVKey spelledSegmentKey();
// The required items of a segment: instanceUID 0x11..., rate 25/1, start
// and duration as given, bodySID 2.
SpelledItems requiredItems(std::int64_t start, std::int64_t duration);
// A whole segment with two-octet tags and lengths.
ByteVector segmentBytes(const SpelledItems& items);

// The segments of an index region read by MXFIndexParser.
struct IndexRun {
  RecordingIndexHandler index;
  RecordingErrorHandler errors;
};
void parseIndex(const ByteVector& bytes, IndexRun& run, bool withErrorHandler = true);

// Segments coded by MXFIndexCoder with the KAG given.
ByteVector codeIndex(const std::vector<MXFIndexTableSegment>& segments, std::uint32_t kagSize);

// A variable-size segment of three entries with two slices and no position
// table.
MXFIndexTableSegment sampleSegment();

}  // namespace zelta_test

#endif
