#include "core/reports.h"
#include "mxf/index_batches.h"
#include "mxf/index_properties.h"

using zelta::mxf::IndexProperty;
using zelta::mxf::indexProperty;

namespace {

// Reads one property of the set into its field, and tells the error handler
// what is missing or cannot be read; the field keeps what was read.
class SegmentReader {
public:
  SegmentReader(const MXFPrimedSet& set, ErrorHandler* errors) : set_(set), reports_(errors) {}

  template <typename Decode>
  void read(IndexProperty property, Decode decode) {
    const zelta::mxf::IndexPropertyInfo& info = indexProperty(property);
    const auto found = set_.properties.find(info.key);
    if (found == set_.properties.end()) {
      if (info.required) reports_.error(missingIndexPropertyId, std::string("missing ") + info.name);
      return;
    }
    try {
      decode(found->second);
    } catch (const util::assertion_failure& failure) {
      reports_.error(invalidIndexPropertyId,
                     zelta::detailed(std::string("invalid ") + info.name + " value", failure.what()));
    }
  }

  template <typename T>
  void readValue(IndexProperty property, T& field) {
    read(property, [&field](const ByteVector& bytes) { internalize(bytes, field); });
  }

private:
  const MXFPrimedSet& set_;
  zelta::Reports reports_;
};

void readSegment(const MXFPrimedSet& set, ErrorHandler* errors, MXFIndexTableSegment& segment) {
  SegmentReader reader(set, errors);
  reader.readValue(zelta::mxf::instanceUIDProperty, segment.instanceUID);
  reader.readValue(zelta::mxf::indexEditRateProperty, segment.indexEditRate);
  reader.readValue(zelta::mxf::indexStartPositionProperty, segment.indexStartPosition);
  reader.readValue(zelta::mxf::indexDurationProperty, segment.indexDuration);
  reader.readValue(zelta::mxf::editUnitByteCountProperty, segment.editUnitByteCount);
  reader.readValue(zelta::mxf::indexSIDProperty, segment.indexSID);
  reader.readValue(zelta::mxf::bodySIDProperty, segment.bodySID);
  reader.readValue(zelta::mxf::sliceCountProperty, segment.sliceCount);
  reader.readValue(zelta::mxf::posTableCountProperty, segment.posTableCount);
  reader.read(zelta::mxf::deltaEntryArrayProperty, [&segment](const ByteVector& bytes) {
    zelta::mxf::decodeDeltaEntries(bytes, segment.deltaEntryArray);
  });
  reader.read(zelta::mxf::indexEntryArrayProperty, [&segment](const ByteVector& bytes) {
    zelta::mxf::decodeIndexEntries(bytes, segment.sliceCount, segment.posTableCount, segment.indexEntryArray);
  });
}

// Whatever was reported, the entries must have the batch's shape.
void checkEntryShapes(const MXFIndexTableSegment& segment) {
  for (const MXFIndexEntry& entry : segment.indexEntryArray) {
    check(entry.sliceOffsets.size() == segment.sliceCount, "valid sliceOffsets");
    check(entry.posTable.size() == segment.posTableCount, "valid posTables");
  }
}

}  // namespace

MXFIndexParser::MXFIndexParser(MXFIndexHandler* handler) : handler_(handler) {
  check(handler != nullptr, "handler is present");
}

// No primer to wait for: the segment's tags are fixed.
void MXFIndexParser::startStream(bool) {
  check(getState() == idle, "before start");
  setState(betweenSets);
  handler_->startIndex();
}

void MXFIndexParser::endStream(bool) {
  setState(idle);
  handler_->endIndex();
}

const MXFTagToKeyMap& MXFIndexParser::getPrimer() { return zelta::mxf::indexPrimer(); }

bool MXFIndexParser::acceptSet(const KLVKey& key) { return key == MXFIndexTableSegmentKey; }

void MXFIndexParser::primedSet(const MXFPrimedSet& set) {
  MXFIndexTableSegment segment;
  readSegment(set, getErrorHandler(), segment);
  if (getErrorHandler()) reportInconsistencies(segment);
  checkEntryShapes(segment);
  handler_->indexTableSegment(segment);
}

void MXFIndexParser::reportInconsistencies(const MXFIndexTableSegment& segment) {
  const zelta::Reports reports(getErrorHandler());
  const bool constantSize = segment.editUnitByteCount != 0;
  const bool hasEntries = !segment.indexEntryArray.empty();
  if (segment.indexDuration == 0 && !constantSize)
    reports.warning(inconsistentIndexSegmentId, "inconsistent indexDuration and editUnitByteCount");
  if (hasEntries && static_cast<std::int64_t>(segment.indexEntryArray.size()) != segment.indexDuration)
    reports.warning(inconsistentIndexSegmentId, "inconsistent indexDuration and indexEntryArray");
  if (constantSize && segment.indexStartPosition != 0)
    reports.warning(inconsistentIndexSegmentId, "inconsistent editUnitByteCount and indexStartPosition");
  if (constantSize == hasEntries)
    reports.warning(inconsistentIndexSegmentId, "inconsistent editUnitByteCount and indexEntryArray");
}
