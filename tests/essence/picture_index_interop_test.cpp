// Long-GOP files of other writers: their pictures written again through
// MXFMPEGIndexer or MXFAVCIndexer in the file's own layout, and the entries
// computed against the index tables that the writers stored.
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <iterator>
#include <map>
#include <memory>
#include <sstream>
#include <string>
#include <vector>

#include "mxf.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// ---------------------------------------------------------------------------
// What a file holds

// An element of the essence container where it stands, with the octets up
// to the next element: its own key, length and value and any fill behind it.
struct FileElement {
  enum Kind { fixedPack, localSet, variablePack, picture, sound, data, compound };
  Kind kind = picture;
  KLVKey key;
  ByteVector value;
  MXFGCLocalItems items;
  MXFGCVariableItems variableItems;
  std::uint8_t form = 0;
  std::uint64_t streamOffset = 0;
  std::uint64_t klvSize = 0;
  std::uint64_t extent = 0;
};

struct FileEditUnit {
  std::uint64_t streamOffset = 0;
  std::vector<FileElement> elements;
};

struct FileContents {
  std::vector<FileEditUnit> editUnits;
  std::vector<MXFIndexTableSegment> segments;
};

class PartitionTracker : public DullMXFStructureHandler {
public:
  void startPartition(const KLVKey&, const MXFPartitionPack& pack, std::uint64_t) override { current = pack; }
  MXFPartitionPack current;
};

class SegmentCollector : public MXFIndexHandler {
public:
  explicit SegmentCollector(std::vector<MXFIndexTableSegment>& segments) : segments_(segments) {}
  void startIndex() override {}
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment& segment) override { segments_.push_back(segment); }

private:
  std::vector<MXFIndexTableSegment>& segments_;
};

// In front of the splitter: where the element being read starts in the
// essence stream, the partition's bodyOffset plus the distance from the
// start of its essence section, and how long its KLV is.
class ElementPositions : public DullKLVFilter {
public:
  ElementPositions(KLVHandler* handler, const PartitionTracker& partitions)
      : DullKLVFilter(handler), partitions_(partitions) {}

  std::uint64_t streamOffset() const { return streamOffset_; }
  std::uint64_t klvSize() const { return klvSize_; }

  void setLocator(Locator* locator) override {
    locator_ = locator;
    DullKLVFilter::setLocator(locator);
  }
  void startStream(bool hasAccurateLengths) override {
    sectionStarted_ = false;
    DullKLVFilter::startStream(hasAccurateLengths);
  }
  void setLengthForm(std::uint8_t form) override {
    form_ = form;
    DullKLVFilter::setLengthForm(form);
  }
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    note(length);
    return DullKLVFilter::startIndividualItem(key, length, buffer);
  }
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType, KLVLengthType lengthType) override {
    note(length);
    return DullKLVFilter::startLocalSet(key, length, tagType, lengthType);
  }
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
    note(length);
    return DullKLVFilter::startFixedLengthPack(key, length, buffer);
  }
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override {
    note(length);
    return DullKLVFilter::startVariableLengthPack(key, length, lengthType);
  }

private:
  // At a start event the locator stands behind the key and length.
  void note(std::uint64_t length) {
    const std::uint64_t header = 16 + lengthFormOctets(form_);
    const std::uint64_t position = static_cast<std::uint64_t>(std::streamoff(locator_->getPosition())) - header;
    if (!sectionStarted_) {
      sectionStarted_ = true;
      sectionStart_ = position;
    }
    streamOffset_ = partitions_.current.bodyOffset + position - sectionStart_;
    klvSize_ = header + length;
  }

  const PartitionTracker& partitions_;
  Locator* locator_ = nullptr;
  bool sectionStarted_ = false;
  std::uint64_t sectionStart_ = 0;
  std::uint64_t streamOffset_ = 0;
  std::uint64_t klvSize_ = 0;
  std::uint8_t form_ = KLVFourOctetLengthForm;
};

// Keeps every element with its place.
class ElementCollector : public DullMXFGCStructureHandler, public MXFGCSystemHandler, public MXFGCEssenceHandler {
public:
  ElementCollector(std::vector<FileEditUnit>& editUnits, const ElementPositions*& positions)
      : editUnits_(editUnits), positions_(positions) {}

  void startEditUnit() override {
    editUnits_.emplace_back();
    editUnits_.back().streamOffset = positions_->streamOffset();
  }

  bool startSystemElement(const KLVKey&) override { return begin(); }
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override {
    add(FileElement::localSet, key).items = items;
  }
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override {
    add(FileElement::fixedPack, key).value = bytes;
  }
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override {
    add(FileElement::variablePack, key).variableItems = items;
  }

  bool startEssenceElement(const KLVKey&, std::uint64_t, std::uint8_t*&) override { return begin(); }
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override {
    add(FileElement::picture, key).value.assign(data, data + length);
  }
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override {
    add(FileElement::sound, key).value.assign(data, data + length);
  }
  void dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override {
    add(FileElement::data, key).value.assign(data, data + length);
  }
  void compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override {
    add(FileElement::compound, key).value.assign(data, data + length);
  }
  void essenceLengthForm(std::uint8_t form) override { form_ = form; }

private:
  bool begin() {
    offset_ = positions_->streamOffset();
    klvSize_ = positions_->klvSize();
    return true;
  }
  FileElement& add(FileElement::Kind kind, const KLVKey& key) {
    FileElement element;
    element.kind = kind;
    element.key = key;
    element.form = form_;
    element.streamOffset = offset_;
    element.klvSize = klvSize_;
    editUnits_.back().elements.push_back(element);
    return editUnits_.back().elements.back();
  }

  std::vector<FileEditUnit>& editUnits_;
  const ElementPositions*& positions_;
  std::uint64_t offset_ = 0;
  std::uint64_t klvSize_ = 0;
  std::uint8_t form_ = KLVFourOctetLengthForm;
};

void readFile(const std::string& name, FileContents& contents) {
  std::ifstream in(dataPath(name), std::ios::binary);
  ASSERT_TRUE(in.good()) << name;
  PartitionTracker partitions;
  SegmentCollector segments(contents.segments);
  MXFIndexParser indexParser(&segments);
  const ElementPositions* positions = nullptr;
  ElementCollector collector(contents.editUnits, positions);
  MXFGCSplitter splitter(&collector, &collector, &collector);
  ElementPositions filter(&splitter, partitions);
  positions = &filter;
  MXFReader reader;
  reader.setStructureHandler(&partitions);
  reader.setIndexHandler(&indexParser);
  reader.setEssenceHandler(&filter);
  reader.read(in);
  // Each element reaches to the next; the last one of the stream has no fill.
  FileElement* previous = nullptr;
  for (FileEditUnit& unit : contents.editUnits)
    for (FileElement& element : unit.elements) {
      if (previous) previous->extent = element.streamOffset - previous->streamOffset;
      previous = &element;
    }
  if (previous) previous->extent = previous->klvSize;
}

// The entries of the file in edit unit order; a segment repeated in a later
// partition counts once.
std::vector<MXFIndexEntry> fileEntries(const FileContents& contents) {
  std::map<std::int64_t, const MXFIndexTableSegment*> byStart;
  for (const MXFIndexTableSegment& segment : contents.segments)
    if (!segment.indexEntryArray.empty()) byStart.emplace(segment.indexStartPosition, &segment);
  std::vector<MXFIndexEntry> entries;
  for (const auto& start : byStart) {
    EXPECT_EQ(start.first, static_cast<std::int64_t>(entries.size()));
    entries.insert(entries.end(), start.second->indexEntryArray.begin(), start.second->indexEntryArray.end());
  }
  return entries;
}

// The slice of each element of an edit unit, from the file's delta entries.
std::vector<std::uint8_t> elementSlices(const FileContents& contents) {
  for (const MXFIndexTableSegment& segment : contents.segments)
    if (!segment.deltaEntryArray.empty()) {
      std::vector<std::uint8_t> slices;
      for (const MXFDeltaEntry& delta : segment.deltaEntryArray) slices.push_back(delta.slice);
      return slices;
    }
  return {};
}

// ---------------------------------------------------------------------------
// Writing the file's pictures again

// A muxer without a KAG of its own, behind the format's indexer.
struct Rewriter {
  explicit Rewriter(bool avc) {
    if (avc) {
      avcIndexer.reset(
          new MXFAVCIndexer(muxer.getStructureHandler(), muxer.getEssenceHandler(), muxer.getLocator(), &segment));
      structure = avcIndexer.get();
      essence = avcIndexer.get();
    } else {
      mpegIndexer.reset(
          new MXFMPEGIndexer(muxer.getStructureHandler(), muxer.getEssenceHandler(), muxer.getLocator(), &segment));
      structure = mpegIndexer.get();
      essence = mpegIndexer.get();
    }
  }

  // Each element alone in a group as long as it is in the file, so that
  // the fill comes out as long as the file's; the slices as the file's
  // delta entries say, where the system item is one entry and each essence
  // element another.
  void write(const FileContents& contents) {
    const std::vector<std::uint8_t> slices = elementSlices(contents);
    structure->start(0);
    for (const FileEditUnit& unit : contents.editUnits) {
      structure->startEditUnit();
      std::size_t delta = 0;
      int slice = -1;
      for (const FileElement& element : unit.elements) {
        if (!isSystem(element) && delta == 0 && isSystem(unit.elements.front())) ++delta;
        const std::uint8_t elementSlice = slices.empty() ? 0 : slices[std::min(delta, slices.size() - 1)];
        if (elementSlice != slice) {
          if (slice >= 0) structure->endSlice();
          structure->startSlice();
          slice = elementSlice;
        }
        write(element);
        if (!isSystem(element)) ++delta;
      }
      structure->endSlice();
      structure->endEditUnit();
    }
    structure->end();
    if (avcIndexer) avcIndexer->flushIndex();
  }

  static bool isSystem(const FileElement& element) { return element.kind < FileElement::picture; }

  void write(const FileElement& element) {
    if (element.extent == element.klvSize)
      structure->startAlignedElement(0);
    else
      structure->startPaddedElement(element.extent);
    MXFGCSystemHandler* system = muxer.getSystemHandler();
    switch (element.kind) {
      case FileElement::fixedPack:
        system->startSystemElement(element.key);
        system->systemFixedPack(element.key, element.value);
        break;
      case FileElement::localSet:
        system->startSystemElement(element.key);
        system->systemLocalSet(element.key, element.items);
        break;
      case FileElement::variablePack:
        system->startSystemElement(element.key);
        system->systemVariablePack(element.key, element.variableItems);
        break;
      default:
        writeEssence(element);
    }
    if (element.extent == element.klvSize)
      structure->endAlignedElement();
    else
      structure->endPaddedElement();
  }

  // A writer keys its one picture element ...15 01 05 00, where GStreamer
  // numbers it 01.
  static KLVKey pictureKey(const FileElement& element) {
    return element.kind == FileElement::picture ? MXFMPEGPictureElementKey : element.key;
  }

  void writeEssence(const FileElement& element) {
    if (element.form != form_) essence->essenceLengthForm(form_ = element.form);
    std::uint8_t* buffer = nullptr;
    ASSERT_TRUE(essence->startEssenceElement(pictureKey(element), element.value.size(), buffer));
    const std::uint8_t* data = element.value.data();
    const std::uint64_t length = element.value.size();
    switch (element.kind) {
      case FileElement::picture:
        essence->pictureElement(pictureKey(element), data, length);
        break;
      case FileElement::sound:
        essence->soundElement(element.key, data, length);
        break;
      case FileElement::data:
        essence->dataElement(element.key, data, length);
        break;
      default:
        essence->compoundElement(element.key, data, length);
    }
  }

  std::ostringstream out;
  GenericKLVWriter writer{out};
  MXFGCMuxer muxer{&writer};
  MXFIndexTableSegment segment;
  std::unique_ptr<MXFMPEGIndexer> mpegIndexer;
  std::unique_ptr<MXFAVCIndexer> avcIndexer;
  MXFGCIndexer* structure = nullptr;
  MXFGCEssenceHandler* essence = nullptr;
  std::uint8_t form_ = KLVFourOctetLengthForm;
};

// ---------------------------------------------------------------------------
// The files

const char* const ffmpegH264 = "ffmpeg_h264_high_longgop_1080p25_2mono.mxf";
const char* const bmxH264 = "bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf";
const char* const gstH264 = "gst_h264_high_longgop_1080p25_2mono.mxf";

struct InteropFile {
  const char* name;
  bool avc;
  std::size_t editUnits;
};

// Every long-GOP file of the test data; all of them hold index entries.
const InteropFile interopFiles[] = {
    {"ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf", false, 24},
    {"bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf", false, 24},
    {"bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf", false, 16},
    {ffmpegH264, true, 24},
    {bmxH264, true, 24},
    {gstH264, true, 24},
};

enum Field { temporalOffset, keyFrameOffset, flags };
const char* const fieldNames[] = {"temporalOffset", "keyFrameOffset", "flags"};

int valueOf(const MXFIndexEntry& entry, Field field) {
  switch (field) {
    case temporalOffset:
      return entry.temporalOffset;
    case keyFrameOffset:
      return entry.keyFrameOffset;
    default:
      return entry.flags;
  }
}

// Where a writer's entry says otherwise than the calculation, and why. The
// MPEG-2 files agree in every entry.
struct ExpectedDifference {
  const char* file;
  std::size_t entry;
  Field field;
  int stored;
  int computed;
  const char* reason;
};

const char* const ffmpegNoReordering =
    "ffmpeg writes temporalOffset 0 in every H.264 entry: it keeps no display order for AVC";
const char* const ffmpegReferenceB =
    "ffmpeg sets 0x04 on I and P pictures only; this B picture, the middle of x264's B pyramid, has nal_ref_idc "
    "not 0";
const char* const bmxReferenceOnIDROnly =
    "bmx sets 0x04 on IDR pictures only; this P or B picture has nal_ref_idc not 0";
const char* const gstNoReordering = "GStreamer writes temporalOffset 0 in every entry: it keeps no display order";
const char* const gstKeyDistance = "GStreamer writes the distance back to the key frame as a positive number";
const char* const gstFlags =
    "GStreamer writes 0x80 for a key frame and 0x20 for any other picture: no sequence header, reference or B "
    "picture flags";

const ExpectedDifference expectedDifferences[] = {
    {ffmpegH264, 1, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 2, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 2, flags, 0x33, 0x37, ffmpegReferenceB},
    {ffmpegH264, 3, temporalOffset, 0, -2, ffmpegNoReordering},
    {ffmpegH264, 4, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 5, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 5, flags, 0x33, 0x37, ffmpegReferenceB},
    {ffmpegH264, 6, temporalOffset, 0, -2, ffmpegNoReordering},
    {ffmpegH264, 8, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 9, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 9, flags, 0x33, 0x37, ffmpegReferenceB},
    {ffmpegH264, 10, temporalOffset, 0, -2, ffmpegNoReordering},
    {ffmpegH264, 13, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 14, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 14, flags, 0x33, 0x37, ffmpegReferenceB},
    {ffmpegH264, 15, temporalOffset, 0, -2, ffmpegNoReordering},
    {ffmpegH264, 17, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 18, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 18, flags, 0x33, 0x37, ffmpegReferenceB},
    {ffmpegH264, 19, temporalOffset, 0, -2, ffmpegNoReordering},
    {ffmpegH264, 20, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 21, temporalOffset, 0, 1, ffmpegNoReordering},
    {ffmpegH264, 21, flags, 0x33, 0x37, ffmpegReferenceB},
    {ffmpegH264, 22, temporalOffset, 0, -2, ffmpegNoReordering},
    {bmxH264, 1, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 2, flags, 0x33, 0x37, bmxReferenceOnIDROnly},
    {bmxH264, 4, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 5, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 6, flags, 0x33, 0x37, bmxReferenceOnIDROnly},
    {bmxH264, 8, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 9, flags, 0x33, 0x37, bmxReferenceOnIDROnly},
    {bmxH264, 11, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 13, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 14, flags, 0x33, 0x37, bmxReferenceOnIDROnly},
    {bmxH264, 16, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 17, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 18, flags, 0x33, 0x37, bmxReferenceOnIDROnly},
    {bmxH264, 20, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {bmxH264, 21, flags, 0x33, 0x37, bmxReferenceOnIDROnly},
    {bmxH264, 23, flags, 0x22, 0x26, bmxReferenceOnIDROnly},
    {gstH264, 0, flags, 0x80, 0xC4, gstFlags},
    {gstH264, 1, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 1, keyFrameOffset, 1, -1, gstKeyDistance},
    {gstH264, 1, flags, 0x20, 0x26, gstFlags},
    {gstH264, 2, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 2, keyFrameOffset, 2, -2, gstKeyDistance},
    {gstH264, 2, flags, 0x20, 0x37, gstFlags},
    {gstH264, 3, temporalOffset, 0, -2, gstNoReordering},
    {gstH264, 3, keyFrameOffset, 3, -3, gstKeyDistance},
    {gstH264, 3, flags, 0x20, 0x33, gstFlags},
    {gstH264, 4, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 4, keyFrameOffset, 4, -4, gstKeyDistance},
    {gstH264, 4, flags, 0x20, 0x26, gstFlags},
    {gstH264, 5, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 5, keyFrameOffset, 5, -5, gstKeyDistance},
    {gstH264, 5, flags, 0x20, 0x37, gstFlags},
    {gstH264, 6, temporalOffset, 0, -2, gstNoReordering},
    {gstH264, 6, keyFrameOffset, 6, -6, gstKeyDistance},
    {gstH264, 6, flags, 0x20, 0x33, gstFlags},
    {gstH264, 7, keyFrameOffset, 7, -7, gstKeyDistance},
    {gstH264, 7, flags, 0x20, 0x26, gstFlags},
    {gstH264, 8, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 8, keyFrameOffset, 8, -8, gstKeyDistance},
    {gstH264, 8, flags, 0x20, 0x26, gstFlags},
    {gstH264, 9, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 9, keyFrameOffset, 9, -9, gstKeyDistance},
    {gstH264, 9, flags, 0x20, 0x37, gstFlags},
    {gstH264, 10, temporalOffset, 0, -2, gstNoReordering},
    {gstH264, 10, keyFrameOffset, 10, -10, gstKeyDistance},
    {gstH264, 10, flags, 0x20, 0x33, gstFlags},
    {gstH264, 11, keyFrameOffset, 11, -11, gstKeyDistance},
    {gstH264, 11, flags, 0x20, 0x26, gstFlags},
    {gstH264, 12, flags, 0x80, 0xC4, gstFlags},
    {gstH264, 13, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 13, keyFrameOffset, 1, -1, gstKeyDistance},
    {gstH264, 13, flags, 0x20, 0x26, gstFlags},
    {gstH264, 14, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 14, keyFrameOffset, 2, -2, gstKeyDistance},
    {gstH264, 14, flags, 0x20, 0x37, gstFlags},
    {gstH264, 15, temporalOffset, 0, -2, gstNoReordering},
    {gstH264, 15, keyFrameOffset, 3, -3, gstKeyDistance},
    {gstH264, 15, flags, 0x20, 0x33, gstFlags},
    {gstH264, 16, keyFrameOffset, 4, -4, gstKeyDistance},
    {gstH264, 16, flags, 0x20, 0x26, gstFlags},
    {gstH264, 17, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 17, keyFrameOffset, 5, -5, gstKeyDistance},
    {gstH264, 17, flags, 0x20, 0x26, gstFlags},
    {gstH264, 18, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 18, keyFrameOffset, 6, -6, gstKeyDistance},
    {gstH264, 18, flags, 0x20, 0x37, gstFlags},
    {gstH264, 19, temporalOffset, 0, -2, gstNoReordering},
    {gstH264, 19, keyFrameOffset, 7, -7, gstKeyDistance},
    {gstH264, 19, flags, 0x20, 0x33, gstFlags},
    {gstH264, 20, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 20, keyFrameOffset, 8, -8, gstKeyDistance},
    {gstH264, 20, flags, 0x20, 0x26, gstFlags},
    {gstH264, 21, temporalOffset, 0, 1, gstNoReordering},
    {gstH264, 21, keyFrameOffset, 9, -9, gstKeyDistance},
    {gstH264, 21, flags, 0x20, 0x37, gstFlags},
    {gstH264, 22, temporalOffset, 0, -2, gstNoReordering},
    {gstH264, 22, keyFrameOffset, 10, -10, gstKeyDistance},
    {gstH264, 22, flags, 0x20, 0x33, gstFlags},
    {gstH264, 23, keyFrameOffset, 11, -11, gstKeyDistance},
    {gstH264, 23, flags, 0x20, 0x26, gstFlags},
};

const ExpectedDifference* expectedDifference(const char* file, std::size_t entry, Field field) {
  for (const ExpectedDifference& difference : expectedDifferences)
    if (difference.file == std::string(file) && difference.entry == entry && difference.field == field)
      return &difference;
  return nullptr;
}

std::size_t expectedDifferenceCount(const char* file) {
  return static_cast<std::size_t>(std::count_if(std::begin(expectedDifferences), std::end(expectedDifferences),
                                                [&](const ExpectedDifference& d) { return d.file == std::string(file); }));
}

class PictureIndexInterop : public ::testing::TestWithParam<InteropFile> {};

}  // namespace

TEST_P(PictureIndexInterop, ComputedEntriesMatchTheWritersIndexTable) {
  const InteropFile& file = GetParam();
  FileContents contents;
  readFile(file.name, contents);
  ASSERT_EQ(contents.editUnits.size(), file.editUnits);
  const std::vector<MXFIndexEntry> stored = fileEntries(contents);
  ASSERT_EQ(stored.size(), file.editUnits);

  Rewriter rewriter(file.avc);
  rewriter.write(contents);
  const std::vector<MXFIndexEntry>& computed = rewriter.segment.indexEntryArray;
  ASSERT_EQ(computed.size(), file.editUnits);
  EXPECT_EQ(rewriter.segment.indexDuration, static_cast<std::int64_t>(file.editUnits));

  // Each file's essence stream begins with its first edit unit, as the
  // rewritten one does.
  ASSERT_EQ(contents.editUnits[0].streamOffset, 0u);
  std::size_t differences = 0;
  for (std::size_t i = 0; i < stored.size(); ++i) {
    SCOPED_TRACE("entry " + std::to_string(i));
    // The file's offsets against its own element positions, and against
    // what the indexer saw of the same layout written again.
    EXPECT_EQ(stored[i].streamOffset, contents.editUnits[i].streamOffset);
    EXPECT_EQ(computed[i].streamOffset, stored[i].streamOffset);
    EXPECT_EQ(computed[i].sliceOffsets, stored[i].sliceOffsets);
    for (Field field : {temporalOffset, keyFrameOffset, flags}) {
      const int storedValue = valueOf(stored[i], field);
      const int computedValue = valueOf(computed[i], field);
      if (storedValue == computedValue) continue;
      const ExpectedDifference* expected = expectedDifference(file.name, i, field);
      if (!expected) {
        ADD_FAILURE() << fieldNames[field] << " stored " << storedValue << ", computed " << computedValue;
        continue;
      }
      EXPECT_EQ(expected->stored, storedValue) << fieldNames[field];
      EXPECT_EQ(expected->computed, computedValue) << fieldNames[field] << ": " << expected->reason;
      ++differences;
    }
  }
  // No row of the table stands for a difference that is gone.
  EXPECT_EQ(differences, expectedDifferenceCount(file.name));
}

INSTANTIATE_TEST_SUITE_P(Files, PictureIndexInterop, ::testing::ValuesIn(interopFiles),
                         [](const ::testing::TestParamInfo<InteropFile>& info) {
                           const std::string name = info.param.name;
                           return name.substr(0, name.find('.'));
                         });
