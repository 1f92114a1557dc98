#include <string>

#include "core/reports.h"
#include "mxf.h"

// The timecode entries are opaque octets. Read as big-endian 64-bit numbers
// they keep their octets in order, and the batch coding of numbers brings
// the rules of the entry length with it.

namespace {

std::vector<MXFQMProxyTimecode> decodeTimecodes(const ByteVector& bytes) {
  std::vector<std::uint64_t> entries;
  internalize(bytes, entries);
  std::vector<MXFQMProxyTimecode> timecodes(entries.size());
  for (std::size_t i = 0; i < entries.size(); ++i)
    for (std::size_t octet = 0; octet < MXFQMProxyTimecode().size(); ++octet)
      timecodes[i][octet] = static_cast<std::uint8_t>(entries[i] >> (8 * (7 - octet)));
  return timecodes;
}

ByteVector encodeTimecodes(const std::vector<MXFQMProxyTimecode>& timecodes) {
  std::vector<std::uint64_t> entries;
  entries.reserve(timecodes.size());
  for (const MXFQMProxyTimecode& timecode : timecodes) {
    std::uint64_t entry = 0;
    for (std::uint8_t octet : timecode) entry = (entry << 8) | octet;
    entries.push_back(entry);
  }
  ByteVector bytes;
  externalize(bytes, entries, true);
  return bytes;
}

// One of the two items: the first of its tag counts, and a value that cannot
// be read leaves the field as it was.
class ItemReader {
public:
  ItemReader(const char* name, const zelta::Reports& reports) : name_(name), reports_(reports) {}

  template <typename T, typename Decode>
  void read(const ByteVector& bytes, T& field, Decode decode) {
    if (seen_) {
      reports_.error(repeatedQMProxyItemId, std::string("unexpected repeated ") + name_);
      return;
    }
    seen_ = true;
    try {
      field = decode(bytes);
    } catch (const util::assertion_failure& failure) {
      reports_.error(invalidQMProxyValueId,
                     zelta::detailed(std::string("invalid ") + name_ + " value", failure.what()));
    }
  }

  bool seen() const { return seen_; }

  void reportIfMissing() const {
    if (!seen_) reports_.error(missingQMProxyItemId, std::string("missing ") + name_);
  }

private:
  const char* name_;
  const zelta::Reports& reports_;
  bool seen_ = false;
};

std::uint32_t decodeFrameCount(const ByteVector& bytes) {
  std::uint32_t frameCount = 0;
  internalize(bytes, frameCount);
  return frameCount;
}

}  // namespace

MXFQMProxySystemHandler::~MXFQMProxySystemHandler() = default;

MXFQMProxySystemParser::MXFQMProxySystemParser(MXFQMProxySystemHandler* handler) : handler_(handler) {}

bool MXFQMProxySystemParser::startSystemElement(const KLVKey& key) {
  if (key == MXFQMProxySystemElementKey) return true;
  zelta::Reports(errorHandler_)
      .error(invalidQMProxySystemElementId, zelta::detailed("invalid QMProxy system element", zelta::keyText(key)));
  return false;
}

// Whatever was found is delivered: the event comes for every set.
void MXFQMProxySystemParser::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  check(key == MXFQMProxySystemElementKey, "valid QMProxy local set");
  const zelta::Reports reports(errorHandler_);
  ItemReader frameCountItem("frameCount", reports);
  ItemReader timecodesItem("timecodes", reports);
  std::uint32_t frameCount = 0;
  std::vector<MXFQMProxyTimecode> timecodes;
  for (const auto& [tag, bytes] : items) {
    if (tag == MXFQMProxyFrameCountTag)
      frameCountItem.read(bytes, frameCount, decodeFrameCount);
    else if (tag == MXFQMProxyTimecodesTag)
      timecodesItem.read(bytes, timecodes, decodeTimecodes);
    else
      reports.warning(unrecognizedQMProxyItemId,
                      zelta::detailed("unrecognized QMProxy metadata item", zelta::tagText(tag)));
  }
  frameCountItem.reportIfMissing();
  timecodesItem.reportIfMissing();
  if (frameCountItem.seen() && timecodesItem.seen() && frameCount != timecodes.size())
    reports.warning(invalidQMProxyValueId, "inconsistent frameCount and timecodes");
  handler_->proxySystem(frameCount, timecodes);
}

void MXFQMProxySystemParser::systemFixedPack(const KLVKey&, const ByteVector&) {
  check(false, "valid QMProxy fixed length pack");
}

void MXFQMProxySystemParser::systemVariablePack(const KLVKey&, const MXFGCVariableItems&) {
  check(false, "valid QMProxy variable length pack");
}

void MXFQMProxySystemParser::setErrorHandler(ErrorHandler* errorHandler) { errorHandler_ = errorHandler; }

MXFQMProxySystemCoder::MXFQMProxySystemCoder(MXFGCSystemHandler* handler) : handler_(handler) {}

// Written without asking startSystemElement: a proxy edit unit always has its
// system element.
void MXFQMProxySystemCoder::proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) {
  ByteVector frameCountBytes;
  externalize(frameCountBytes, frameCount, true);
  handler_->systemLocalSet(MXFQMProxySystemElementKey,
                           MXFGCLocalItems{{MXFQMProxyFrameCountTag, frameCountBytes},
                                           {MXFQMProxyTimecodesTag, encodeTimecodes(timecodes)}});
}
