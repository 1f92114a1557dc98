// Feeds any input to the parsers of essence and system items: MPEG-2 and AVC
// pictures through their indexers, and the generic system events through
// the SDTI-CP and proxy parsers. The input is a chooser octet, then records
// of a kind octet, a two-octet length and that many octets. A broken
// bitstream may end with util::assertion_failure and nothing else: any
// other exception escapes, and libFuzzer counts it as a fault.

#include <cstddef>
#include <cstdint>
#include <type_traits>
#include <vector>

#include "klv.h"
#include "mxf.h"

namespace {

struct Record {
  std::uint8_t kind;
  const std::uint8_t* data;
  std::size_t length;
};

// The records of the input; a short last one takes what is left.
std::vector<Record> recordsOf(const std::uint8_t* data, std::size_t size) {
  std::vector<Record> records;
  std::size_t at = 0;
  while (at + 3 <= size) {
    const std::uint8_t kind = data[at];
    std::size_t length = static_cast<std::size_t>(data[at + 1]) << 8 | data[at + 2];
    at += 3;
    if (length > size - at) length = size - at;
    records.push_back({kind, data + at, length});
    at += length;
  }
  return records;
}

class Position : public Locator {
public:
  const std::streampos& getPosition() override { return position_; }
  void advance(std::size_t octets) { position_ += static_cast<std::streamoff>(octets); }

private:
  std::streampos position_ = 0;
};

class Reports : public ErrorHandler {
public:
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID&, const std::string& m) override { count_ += m.size(); }
  void error(const MXFUID&, const std::string& m) override { count_ += m.size(); }
  void fatalError(const MXFUID&, const std::string& m) override { count_ += m.size(); }

private:
  std::size_t count_ = 0;
};

// Each record is the picture element of one edit unit.
template <typename Indexer>
void indexPictures(const std::vector<Record>& records, bool flush) {
  Position position;
  DullMXFGCStructureHandler structure;
  DullMXFGCEssenceHandler essence;
  MXFIndexTableSegment segment;
  Indexer indexer(&structure, &essence, &position, &segment);
  indexer.start(0);
  for (const Record& record : records) {
    indexer.startEditUnit();
    indexer.pictureElement(MXFMPEGPictureElementKey, record.data, record.length);
    position.advance(record.length + 20);
    indexer.endEditUnit();
  }
  if constexpr (std::is_same_v<Indexer, MXFAVCIndexer>) {
    if (flush) indexer.flushIndex();
  }
  indexer.end();
}

// Local items of a record: a two-octet tag, a one-octet length and the value.
MXFGCLocalItems localItemsOf(const Record& record) {
  MXFGCLocalItems items;
  std::size_t at = 0;
  while (at + 3 <= record.length) {
    const std::uint16_t tag = static_cast<std::uint16_t>(record.data[at] << 8 | record.data[at + 1]);
    std::size_t length = record.data[at + 2];
    at += 3;
    if (length > record.length - at) length = record.length - at;
    items.emplace_back(tag, ByteVector(record.data + at, record.data + at + length));
    at += length;
  }
  return items;
}

// The record's kind picks the event and, in its high bits, octets 14 and 15
// of the key, so that every set and pack kind is reached.
void feedSystemEvents(MXFGCSystemHandler& parser, const KLVKey& base, const std::vector<Record>& records) {
  for (const Record& record : records) {
    KLVKey key = base;
    key[5] = static_cast<std::uint8_t>((record.kind & 0x04) ? 0x43 : base[5]);
    key[14] = static_cast<std::uint8_t>((record.kind >> 3) & 0x07);
    key[15] = static_cast<std::uint8_t>(record.kind >> 6);
    switch (record.kind & 0x03) {
      case 0:
        parser.startSystemElement(key);
        break;
      case 1:
        parser.systemFixedPack(key, ByteVector(record.data, record.data + record.length));
        break;
      case 2:
        parser.systemLocalSet(key, localItemsOf(record));
        break;
      default: {
        MXFGCVariableItems items;
        for (const auto& item : localItemsOf(record)) items.push_back(item.second);
        parser.systemVariablePack(key, items);
      }
    }
  }
}

class SDTICPEvents : public DullMXFSDTICPSystemHandler {};

class ProxyEvents : public MXFQMProxySystemHandler {
public:
  void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) override {
    count_ += frameCount + timecodes.size();
  }

private:
  std::uint64_t count_ = 0;
};

void parseSDTICP(const std::vector<Record>& records) {
  Reports reports;
  SDTICPEvents events;
  MXFSDTICPSystemParser parser(&events);
  parser.setErrorHandler(&reports);
  feedSystemEvents(parser, MXFSDTICPSystemMetadataPackKey, records);
}

void parseProxy(const std::vector<Record>& records) {
  Reports reports;
  ProxyEvents events;
  MXFQMProxySystemParser parser(&events);
  parser.setErrorHandler(&reports);
  feedSystemEvents(parser, MXFQMProxySystemElementKey, records);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const std::vector<Record> records = recordsOf(data + 1, size - 1);
  try {
    switch (data[0] % 4) {
      case 0:
        indexPictures<MXFMPEGIndexer>(records, false);
        break;
      case 1:
        indexPictures<MXFAVCIndexer>(records, data[0] & 0x80);
        break;
      case 2:
        parseSDTICP(records);
        break;
      default:
        parseProxy(records);
    }
  } catch (const util::assertion_failure&) {
    // A broken bitstream ends here: that is its right end.
  }
  return 0;
}
