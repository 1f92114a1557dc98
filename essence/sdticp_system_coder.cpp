#include <boost/iostreams/stream.hpp>

#include "mxf.h"

namespace {

// Octet 14 of the metadata set keys.
constexpr std::uint8_t packageKind = 0x02;
constexpr std::uint8_t pictureKind = 0x03;
constexpr std::uint8_t soundKind = 0x04;
constexpr std::uint8_t dataKind = 0x05;
constexpr std::uint8_t controlKind = 0x06;

bool isMetadataSet(const KLVKey& key, std::uint8_t kind) {
  return MXFSDTICPMetadataSetPattern.matches(key) && key[14] == kind;
}

// The fields in the order of the pack, through one stream for all of them.
ByteVector encodePack(const MXFSDTICPSystemMetadata& pack) {
  ByteVector bytes;
  bytes.reserve(MXFSDTICPSystemMetadataPackLength);
  boost::iostreams::stream<util::byte_vector_device> out(bytes);
  externalize(out, pack.bitmap);
  externalize(out, pack.rate);
  externalize(out, pack.type);
  externalize(out, pack.channelHandle);
  externalize(out, pack.continuityCount);
  externalize(out, pack.label);
  out.write(reinterpret_cast<const char*>(pack.creationStamp.data()), pack.creationStamp.size());
  out.write(reinterpret_cast<const char*>(pack.userStamp.data()), pack.userStamp.size());
  out.flush();
  util::requireWritten(out);
  return bytes;
}

}  // namespace

bool isMXFSDTICPPackageMetadataSet(const KLVKey& key) { return isMetadataSet(key, packageKind); }
bool isMXFSDTICPPictureMetadataSet(const KLVKey& key) { return isMetadataSet(key, pictureKind); }
bool isMXFSDTICPSoundMetadataSet(const KLVKey& key) { return isMetadataSet(key, soundKind); }
bool isMXFSDTICPDataMetadataSet(const KLVKey& key) { return isMetadataSet(key, dataKind); }
bool isMXFSDTICPControlDataSet(const KLVKey& key) {
  return MXFSDTICPControlDataSetPattern.matches(key) && key[14] == controlKind;
}

bool operator==(const MXFSDTICPSystemMetadata& a, const MXFSDTICPSystemMetadata& b) {
  return a.bitmap == b.bitmap && a.rate == b.rate && a.type == b.type && a.channelHandle == b.channelHandle &&
         a.continuityCount == b.continuityCount && a.label == b.label && a.creationStamp == b.creationStamp &&
         a.userStamp == b.userStamp;
}

bool operator!=(const MXFSDTICPSystemMetadata& a, const MXFSDTICPSystemMetadata& b) { return !(a == b); }

MXFSDTICPSystemHandler::~MXFSDTICPSystemHandler() = default;

void DullMXFSDTICPSystemHandler::systemMetadata(const MXFSDTICPSystemMetadata&) {}
void DullMXFSDTICPSystemHandler::packageMetadata(const MXFGCLocalItems&) {}
void DullMXFSDTICPSystemHandler::pictureMetadata(const MXFGCLocalItems&) {}
void DullMXFSDTICPSystemHandler::soundMetadata(const MXFGCLocalItems&) {}
void DullMXFSDTICPSystemHandler::dataMetadata(const MXFGCLocalItems&) {}
void DullMXFSDTICPSystemHandler::controlData(std::uint16_t, const ByteVector&) {}

MXFSDTICPSystemCoder::MXFSDTICPSystemCoder(MXFGCSystemHandler* handler) : handler_(handler) {}

void MXFSDTICPSystemCoder::systemMetadata(const MXFSDTICPSystemMetadata& pack) {
  if (handler_->startSystemElement(MXFSDTICPSystemMetadataPackKey))
    handler_->systemFixedPack(MXFSDTICPSystemMetadataPackKey, encodePack(pack));
}

void MXFSDTICPSystemCoder::packageMetadata(const MXFGCLocalItems& items) { metadataSet(packageKind, items); }
void MXFSDTICPSystemCoder::pictureMetadata(const MXFGCLocalItems& items) { metadataSet(pictureKind, items); }
void MXFSDTICPSystemCoder::soundMetadata(const MXFGCLocalItems& items) { metadataSet(soundKind, items); }
void MXFSDTICPSystemCoder::dataMetadata(const MXFGCLocalItems& items) { metadataSet(dataKind, items); }

// Octet 15 of the key counts the items.
void MXFSDTICPSystemCoder::metadataSet(std::uint8_t kind, const MXFGCLocalItems& items) {
  KLVKey key = MXFSDTICPMetadataSetKey;
  key[14] = kind;
  key[15] = static_cast<std::uint8_t>(items.size());
  if (handler_->startSystemElement(key)) handler_->systemLocalSet(key, items);
}

// Always one item: a reader takes the first item of a set as the control
// data, and an empty set has none.
void MXFSDTICPSystemCoder::controlData(std::uint16_t tag, const ByteVector& bytes) {
  if (handler_->startSystemElement(MXFSDTICPControlDataSetKey))
    handler_->systemLocalSet(MXFSDTICPControlDataSetKey, MXFGCLocalItems{{tag, bytes}});
}
