#include "mxf/index_batches.h"
#include "mxf/index_properties.h"

namespace {

template <typename T>
ByteVector bytesOf(const T& value) {
  ByteVector bytes;
  externalize(bytes, value, true);
  return bytes;
}

bool isZero(const MXFUID& identifier) { return identifier == MXFUID(); }

class ItemList {
public:
  template <typename T>
  void add(zelta::mxf::IndexProperty property, const T& value) {
    items.emplace_back(zelta::mxf::indexProperty(property).tag, bytesOf(value));
  }
  void addBytes(zelta::mxf::IndexProperty property, const ByteVector& bytes) {
    items.emplace_back(zelta::mxf::indexProperty(property).tag, bytes);
  }

  KLVLocalItems items;
};

// The items in the order of the property table; the optional ones only when
// they say something, unless all are to be coded.
KLVLocalItems segmentItems(const MXFIndexTableSegment& segment, bool all) {
  using namespace zelta::mxf;
  ItemList list;
  list.add(instanceUIDProperty,
           isZero(segment.instanceUID) ? ZeltaDefaultUIDGenerator().generate() : segment.instanceUID);
  list.add(indexEditRateProperty, segment.indexEditRate);
  list.add(indexStartPositionProperty, segment.indexStartPosition);
  list.add(indexDurationProperty, segment.indexDuration);
  if (all || segment.editUnitByteCount != 0) list.add(editUnitByteCountProperty, segment.editUnitByteCount);
  if (all || segment.indexSID != 0) list.add(indexSIDProperty, segment.indexSID);
  list.add(bodySIDProperty, segment.bodySID);
  if (all || segment.sliceCount != 0) list.add(sliceCountProperty, segment.sliceCount);
  if (segment.posTableCount != 0) list.add(posTableCountProperty, segment.posTableCount);
  if (!segment.deltaEntryArray.empty())
    list.addBytes(deltaEntryArrayProperty, encodeDeltaEntries(segment.deltaEntryArray));
  if (all || !segment.indexEntryArray.empty())
    list.addBytes(indexEntryArrayProperty, encodeIndexEntries(segment.indexEntryArray));
  return list.items;
}

}  // namespace

MXFIndexCoder::MXFIndexCoder(KLVHandler* handler) : monitor_(handler), filler_(&monitor_) {}

void MXFIndexCoder::setKagSize(std::uint32_t kagSize) { kagSize_ = kagSize; }

bool MXFIndexCoder::codesAllIndexProperties() { return true; }

void MXFIndexCoder::startIndex() {
  check(!open_, "before start");
  open_ = true;
  filler_.setLocator(monitor_.getLocator());
  filler_.startStream(true);
  // Every length of an index region is written in four octets.
  filler_.setLengthForm(KLVFourOctetLengthForm);
  filler_.setFillMode(KLVFiller::alignmentMode, kagSize_, 0);
  filler_.startFilledItem();
}

// The filled item that ends here holds the segment before, which is thus
// padded to the KAG from its own first octet.
void MXFIndexCoder::indexTableSegment(const MXFIndexTableSegment& segment) {
  check(open_, "before index table segment");
  filler_.endFilledItem();
  filler_.startFilledItem();
  writeLocalSet(filler_, MXFIndexTableSegmentKey, segmentItems(segment, codesAllIndexProperties()),
                KLVFourOctetLengthForm);
}

// The last segment gets no fill: the padder of the region takes over.
void MXFIndexCoder::endIndex() {
  filler_.setFillMode(KLVFiller::alignmentMode, 0, 0);
  filler_.endFilledItem();
  open_ = false;
  filler_.endStream(false);
}
