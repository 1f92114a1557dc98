#include <array>
#include <string>

#include "core/reports.h"
#include "mxf.h"

namespace {

// A kind of metadata set: its key test, its name in reports and its event.
struct MetadataKind {
  bool (*isKind)(const KLVKey& key);
  const char* name;
  void (MXFSDTICPSystemHandler::*deliver)(const MXFGCLocalItems& items);
};

constexpr std::array<MetadataKind, 4> metadataKinds{
    {{isMXFSDTICPPackageMetadataSet, "package", &MXFSDTICPSystemHandler::packageMetadata},
     {isMXFSDTICPPictureMetadataSet, "picture", &MXFSDTICPSystemHandler::pictureMetadata},
     {isMXFSDTICPSoundMetadataSet, "sound", &MXFSDTICPSystemHandler::soundMetadata},
     {isMXFSDTICPDataMetadataSet, "data", &MXFSDTICPSystemHandler::dataMetadata}}};

// The index of the key's kind in metadataKinds, or -1 for a key that is no
// metadata set.
int metadataKindOf(const KLVKey& key) {
  for (std::size_t i = 0; i < metadataKinds.size(); ++i)
    if (metadataKinds[i].isKind(key)) return static_cast<int>(i);
  return -1;
}

// The fields in the order of the pack; the label and the stamps stay octets.
MXFSDTICPSystemMetadata decodePack(const ByteVector& bytes) {
  util::LentInput lent(bytes);
  std::istream& in = lent.stream();
  MXFSDTICPSystemMetadata pack;
  internalize(in, pack.bitmap);
  internalize(in, pack.rate);
  internalize(in, pack.type);
  internalize(in, pack.channelHandle);
  internalize(in, pack.continuityCount);
  internalize(in, pack.label);
  util::getOctets(in, pack.creationStamp.data(), pack.creationStamp.size());
  util::getOctets(in, pack.userStamp.data(), pack.userStamp.size());
  util::requireExhausted(in);
  return pack;
}

}  // namespace

class ZELTA_LOCAL MXFSDTICPSystemParser::Impl {
public:
  explicit Impl(MXFSDTICPSystemHandler* handler) : handler_(handler) {}

  bool startSystemElement(const KLVKey& key);
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items);
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes);

  zelta::Reports reports;

private:
  // What the last system metadata pack said of control data.
  enum Expectation { noSystemMetadata, controlExpected, noControlExpected };

  void metadataSet(std::size_t kind, const KLVKey& key, const MXFGCLocalItems& items);
  void controlDataSet(const MXFGCLocalItems& items);
  void clearSeen() { seen_.fill(false); }

  MXFSDTICPSystemHandler* handler_;
  Expectation expectation_ = noSystemMetadata;
  // The metadata kinds seen since the last pack.
  std::array<bool, metadataKinds.size()> seen_{};
};

bool MXFSDTICPSystemParser::Impl::startSystemElement(const KLVKey& key) {
  if (key == MXFSDTICPSystemMetadataPackKey || MXFSDTICPMetadataSetPattern.matches(key) ||
      MXFSDTICPControlDataSetPattern.matches(key))
    return true;
  reports.error(invalidSDTICPSystemElementId, zelta::detailed("invalid SDTI-CP system element", zelta::keyText(key)));
  return false;
}

// A pack that cannot be read gives no event, and nothing is then expected of
// the sets that follow it.
void MXFSDTICPSystemParser::Impl::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  check(key == MXFSDTICPSystemMetadataPackKey, "valid SDTI-CP fixed length pack");
  if (expectation_ == controlExpected) reports.error(sdticpControlDataId, "missing SDTI-CP control data");
  clearSeen();
  MXFSDTICPSystemMetadata pack;
  try {
    pack = decodePack(bytes);
  } catch (const util::assertion_failure& failure) {
    expectation_ = noControlExpected;
    reports.error(invalidSDTICPSystemMetadataId,
                  zelta::detailed("invalid SDTI-CP system metadata value", failure.what()));
    return;
  }
  expectation_ = (pack.bitmap & 0x01) != 0 ? controlExpected : noControlExpected;
  handler_->systemMetadata(pack);
}

// Only control data brings the expectation back to no pack: without control
// data, every set after the first pack is taken as belonging to a pack.
void MXFSDTICPSystemParser::Impl::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  if (expectation_ == noSystemMetadata) {
    reports.error(invalidSDTICPSystemMetadataId, "missing SDTI-CP system metadata");
    clearSeen();
    expectation_ = noControlExpected;
  }
  const int kind = metadataKindOf(key);
  if (kind >= 0)
    metadataSet(static_cast<std::size_t>(kind), key, items);
  else if (isMXFSDTICPControlDataSet(key))
    controlDataSet(items);
  else
    reports.error(invalidSDTICPSystemElementId, zelta::detailed("invalid SDTI-CP system element", zelta::keyText(key)));
}

// Reported sets are delivered all the same.
void MXFSDTICPSystemParser::Impl::metadataSet(std::size_t kind, const KLVKey& key, const MXFGCLocalItems& items) {
  const MetadataKind& metadata = metadataKinds[kind];
  const char* name = metadata.name;
  if (seen_[kind])
    reports.error(unexpectedSDTICPMetadataId, std::string("unexpected extra SDTI-CP ") + name + " metadata");
  if (key[15] != items.size())
    reports.warning(sdticpBlockCountId, std::string("incorrect SDTI-CP ") + name + " metadata block count");
  seen_[kind] = true;
  (handler_->*metadata.deliver)(items);
}

// A set of several items gives its first one; an empty set has none to give.
void MXFSDTICPSystemParser::Impl::controlDataSet(const MXFGCLocalItems& items) {
  if (expectation_ == noControlExpected) reports.error(sdticpControlDataId, "unexpected SDTI-CP control data");
  if (items.size() != 1) reports.error(sdticpControlDataId, "incorrect SDTI-CP control data block count");
  expectation_ = noSystemMetadata;
  if (!items.empty()) handler_->controlData(items.front().first, items.front().second);
}

MXFSDTICPSystemParser::MXFSDTICPSystemParser(MXFSDTICPSystemHandler* handler)
    : impl_(std::make_unique<Impl>(handler)) {}

MXFSDTICPSystemParser::~MXFSDTICPSystemParser() = default;

bool MXFSDTICPSystemParser::startSystemElement(const KLVKey& key) { return impl_->startSystemElement(key); }

void MXFSDTICPSystemParser::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  impl_->systemLocalSet(key, items);
}

void MXFSDTICPSystemParser::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  impl_->systemFixedPack(key, bytes);
}

void MXFSDTICPSystemParser::systemVariablePack(const KLVKey&, const MXFGCVariableItems&) {
  check(false, "valid SDTI-CP variable length pack");
}

void MXFSDTICPSystemParser::setErrorHandler(ErrorHandler* errorHandler) { impl_->reports.setHandler(errorHandler); }
