// Zelta: the system items of the generic container: the SDTI-CP system
// element and the proxy system element, in typed events both ways.
// Part of mxf.h, which includes it.
#ifndef ZELTA_INCLUDE_MXF_SYSTEM_H
#define ZELTA_INCLUDE_MXF_SYSTEM_H

#include <array>
#include <cstdint>
#include <vector>

#include "mxf_generic_container.h"

// ---------------------------------------------------------------------------
// SDTI-CP system element

inline constexpr MXFUID invalidSDTICPSystemElementId = ZeltaErrorId(0x4C, 0x4E, 0x00, 0x01);
inline constexpr MXFUID invalidSDTICPSystemMetadataId = ZeltaErrorId(0x4C, 0x4E, 0x00, 0x02);
inline constexpr MXFUID unexpectedSDTICPMetadataId = ZeltaErrorId(0x4C, 0x4E, 0x00, 0x03);
inline constexpr MXFUID sdticpControlDataId = ZeltaErrorId(0x4C, 0x4E, 0x00, 0x04);
inline constexpr MXFUID sdticpBlockCountId = ZeltaErrorId(0x4C, 0x4E, 0x00, 0x05);

inline constexpr KLVKey MXFSDTICPSystemMetadataPackKey = KLVKey(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x05, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x04, 0x01, 0x01, 0x00});
// Octet 14 is the kind of set (2 package, 3 picture, 4 sound, 5 data) and
// octet 15 its number of items.
inline constexpr KLVKey MXFSDTICPMetadataSetKey = KLVKey(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x43, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x04, 0x01, 0x02, 0x00});
inline constexpr KLVKey MXFSDTICPControlDataSetKey = KLVKey(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x63, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x04, 0x01, 0x06, 0x00});
// The two set families, octets 14 and 15 free; octet 5 keeps each family to
// its own local set coding.
inline constexpr KLVKeyPattern MXFSDTICPMetadataSetPattern = KLVKeyPattern(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x43, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x04, 0x01, 0x00, 0x00});
inline constexpr KLVKeyPattern MXFSDTICPControlDataSetPattern = KLVKeyPattern(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x63, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x04, 0x01, 0x00, 0x00});

inline constexpr std::size_t MXFSDTICPSystemMetadataPackLength = 57;

typedef std::array<std::uint8_t, 17> MXFSDTICPTimeStamp;

// The 57 octets of the system metadata pack. The label and the two stamps
// are carried as octets.
struct ZELTA_EXPORT MXFSDTICPSystemMetadata {
  std::uint8_t bitmap = 0;  // bit 0: a control data set follows
  std::uint8_t rate = 0;
  std::uint8_t type = 0;
  std::uint16_t channelHandle = 0;
  std::uint16_t continuityCount = 0;
  KLVKey label;
  MXFSDTICPTimeStamp creationStamp{};
  MXFSDTICPTimeStamp userStamp{};
};

ZELTA_EXPORT bool operator==(const MXFSDTICPSystemMetadata& a, const MXFSDTICPSystemMetadata& b);
ZELTA_EXPORT bool operator!=(const MXFSDTICPSystemMetadata& a, const MXFSDTICPSystemMetadata& b);

class ZELTA_EXPORT MXFSDTICPSystemHandler {
public:
  virtual ~MXFSDTICPSystemHandler();
  virtual void systemMetadata(const MXFSDTICPSystemMetadata& pack) = 0;
  virtual void packageMetadata(const MXFGCLocalItems& items) = 0;
  virtual void pictureMetadata(const MXFGCLocalItems& items) = 0;
  virtual void soundMetadata(const MXFGCLocalItems& items) = 0;
  virtual void dataMetadata(const MXFGCLocalItems& items) = 0;
  virtual void controlData(std::uint16_t tag, const ByteVector& bytes) = 0;
};

class ZELTA_EXPORT DullMXFSDTICPSystemHandler : public MXFSDTICPSystemHandler {
public:
  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override;
  void packageMetadata(const MXFGCLocalItems& items) override;
  void pictureMetadata(const MXFGCLocalItems& items) override;
  void soundMetadata(const MXFGCLocalItems& items) override;
  void dataMetadata(const MXFGCLocalItems& items) override;
  void controlData(std::uint16_t tag, const ByteVector& bytes) override;
};

// Each matches its set pattern (octets 14 and 15 free) and octet 14.
ZELTA_EXPORT bool isMXFSDTICPPackageMetadataSet(const KLVKey& key);
ZELTA_EXPORT bool isMXFSDTICPPictureMetadataSet(const KLVKey& key);
ZELTA_EXPORT bool isMXFSDTICPSoundMetadataSet(const KLVKey& key);
ZELTA_EXPORT bool isMXFSDTICPDataMetadataSet(const KLVKey& key);
ZELTA_EXPORT bool isMXFSDTICPControlDataSet(const KLVKey& key);

// Typed events from the generic system events; checks their order and
// counts, reports and carries on.
class ZELTA_EXPORT MXFSDTICPSystemParser : public MXFGCSystemHandler {
public:
  explicit MXFSDTICPSystemParser(MXFSDTICPSystemHandler* handler);
  ~MXFSDTICPSystemParser() override;
  MXFSDTICPSystemParser(const MXFSDTICPSystemParser&) = delete;
  MXFSDTICPSystemParser& operator=(const MXFSDTICPSystemParser&) = delete;

  bool startSystemElement(const KLVKey& key) override;
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  // "valid SDTI-CP variable length pack"
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

  virtual void setErrorHandler(ErrorHandler* errorHandler);

private:
  class Impl;
  std::unique_ptr<Impl> impl_;
};

// The generic system events of typed ones.
class ZELTA_EXPORT MXFSDTICPSystemCoder : public MXFSDTICPSystemHandler {
public:
  explicit MXFSDTICPSystemCoder(MXFGCSystemHandler* handler);

  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override;
  void packageMetadata(const MXFGCLocalItems& items) override;
  void pictureMetadata(const MXFGCLocalItems& items) override;
  void soundMetadata(const MXFGCLocalItems& items) override;
  void dataMetadata(const MXFGCLocalItems& items) override;
  void controlData(std::uint16_t tag, const ByteVector& bytes) override;

private:
  void metadataSet(std::uint8_t kind, const MXFGCLocalItems& items);

  MXFGCSystemHandler* handler_;
};

// ---------------------------------------------------------------------------
// Proxy system element

inline constexpr MXFUID invalidQMProxySystemElementId = ZeltaErrorId(0x4C, 0x51, 0x00, 0x01);
inline constexpr MXFUID repeatedQMProxyItemId = ZeltaErrorId(0x4C, 0x51, 0x00, 0x02);
inline constexpr MXFUID unrecognizedQMProxyItemId = ZeltaErrorId(0x4C, 0x51, 0x00, 0x03);
inline constexpr MXFUID missingQMProxyItemId = ZeltaErrorId(0x4C, 0x51, 0x00, 0x04);
inline constexpr MXFUID invalidQMProxyValueId = ZeltaErrorId(0x4C, 0x51, 0x00, 0x05);

inline constexpr KLVKey MXFQMProxySystemElementKey = KLVKey(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x03, 0x01, 0x14, 0x02, 0x01, 0x00});
// Tells a proxy system element from an SDTI-CP one whatever its coding.
inline constexpr KLVKeyPattern MXFQMProxySystemElementPattern = KLVKeyPattern(std::array<std::uint8_t, 16>{
    0x06, 0x0E, 0x2B, 0x34, 0x02, 0x00, 0x01, 0x00, 0x0D, 0x01, 0x03, 0x01, 0x14, 0x02, 0x00, 0x00});
inline constexpr std::uint16_t MXFQMProxyFrameCountTag = 0x0101;
inline constexpr std::uint16_t MXFQMProxyTimecodesTag = 0x0102;

typedef std::array<std::uint8_t, 8> MXFQMProxyTimecode;

class ZELTA_EXPORT MXFQMProxySystemHandler {
public:
  virtual ~MXFQMProxySystemHandler();
  virtual void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) = 0;
};

class ZELTA_EXPORT MXFQMProxySystemParser : public MXFGCSystemHandler {
public:
  explicit MXFQMProxySystemParser(MXFQMProxySystemHandler* handler);

  bool startSystemElement(const KLVKey& key) override;
  // "valid QMProxy local set"
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override;
  // "valid QMProxy fixed length pack"
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override;
  // "valid QMProxy variable length pack"
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override;

  virtual void setErrorHandler(ErrorHandler* errorHandler);

private:
  MXFQMProxySystemHandler* handler_;
  ErrorHandler* errorHandler_ = nullptr;
};

class ZELTA_EXPORT MXFQMProxySystemCoder : public MXFQMProxySystemHandler {
public:
  explicit MXFQMProxySystemCoder(MXFGCSystemHandler* handler);

  void proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) override;

private:
  MXFGCSystemHandler* handler_;
};

#endif
