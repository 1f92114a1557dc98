// The three handlers between the generic container splitter and a D-10
// essence handler.
#ifndef ZELTA_ESSENCE_D10_FORWARDERS_H
#define ZELTA_ESSENCE_D10_FORWARDERS_H

#include "mxf.h"

// start and end become startD10 and endD10; edit units need no event, as
// d10System opens each.
class MXFD10StructureForwarder : public DullMXFGCStructureHandler {
public:
  explicit MXFD10StructureForwarder(MXFD10EssenceHandler* handler) : handler_(handler) {}

  void start(std::uint64_t kagSize) override;
  void end() override;

private:
  MXFD10EssenceHandler* handler_;
};

// Keeps the last system metadata pack and gives it with each package
// metadata set; everything else of the system item is dropped.
class MXFD10SystemForwarder : public DullMXFSDTICPSystemHandler {
public:
  explicit MXFD10SystemForwarder(MXFD10EssenceHandler* handler) : handler_(handler) {}

  void systemMetadata(const MXFSDTICPSystemMetadata& pack) override;
  void packageMetadata(const MXFGCLocalItems& items) override;

private:
  MXFD10EssenceHandler* handler_;
  MXFD10SystemInformation system_;
};

// Wants the D-10 picture and sound elements only.
class MXFD10EssenceForwarder : public DullMXFGCEssenceHandler {
public:
  explicit MXFD10EssenceForwarder(MXFD10EssenceHandler* handler) : handler_(handler) {}

  bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;
  void soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) override;

private:
  MXFD10EssenceHandler* handler_;
};

#endif
