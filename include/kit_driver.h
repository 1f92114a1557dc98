// Zelta: the driver, the shortest road from essence to a finished file: the
// client answers for its clip and its edit units, the driver decides the
// layout and writes it through a ZeltaWriter. Part of kit.h, which includes
// it.
#ifndef ZELTA_INCLUDE_KIT_DRIVER_H
#define ZELTA_INCLUDE_KIT_DRIVER_H

#include <cstdint>
#include <memory>

#include "kit_master.h"
#include "kit_writer.h"
#include "mxf.h"

// Octets that a source lends the driver for one call; the driver copies
// them out at once.
class ZELTA_EXPORT ZeltaBuffer {
 public:
  virtual ~ZeltaBuffer();
  virtual const std::uint8_t* getData() const = 0;
  virtual std::size_t getSize() const = 0;
};

// What the client implements: the clip, and the essence of the edit unit
// being written. An empty buffer is an element of no octets.
class ZELTA_EXPORT ZeltaSource {
 public:
  virtual ~ZeltaSource();

  // Asked once, at start.
  virtual std::shared_ptr<const ZeltaMasterMetadata> getMasterMetadata() = 0;
  // Empty: the driver makes a ZeltaDefaultUIDGenerator.
  virtual std::shared_ptr<MXFUIDGenerator> getUIDGenerator() = 0;
  // Whether each edit unit's system item carries picture metadata.
  virtual bool hasPictureMetadata() = 0;
  // Variable rate only: index and body partitions kept back to the footer.
  virtual bool isIndexDeferred() = 0;
  // AVC only: 1 is constant size frames.
  virtual std::uint32_t getAVCWrapping() = 0;

  virtual bool hasMoreEditUnits() = 0;
  // A first octet of 0 asks the driver to build the stamp from the count.
  virtual MXFSDTICPTimeStamp getUserStamp() = 0;
  virtual MXFGCLocalItems getPackageMetadata() = 0;
  virtual MXFGCLocalItems getPictureMetadata() = 0;
  virtual std::shared_ptr<ZeltaBuffer> getD10Picture() = 0;
  // The AES3 element of eight channels.
  virtual std::shared_ptr<ZeltaBuffer> getD10Sound() = 0;
  virtual std::shared_ptr<ZeltaBuffer> getDVElement() = 0;
  virtual std::shared_ptr<ZeltaBuffer> getMPEGPicture() = 0;
  virtual std::shared_ptr<ZeltaBuffer> getRawPicture() = 0;
  virtual std::shared_ptr<ZeltaBuffer> getAVCPicture() = 0;
  // The samples of one channel, from 0.
  virtual std::shared_ptr<ZeltaBuffer> getSound(std::uint32_t channel) = 0;
  virtual std::shared_ptr<ZeltaBuffer> getAncillaryData() = 0;
};

// Writes a whole file from a source: drive, or start, edit units one by
// one, and finish. Failures are assertions; what the source or the writer
// throws passes through, and the file is left as it stands.
class ZELTA_EXPORT ZeltaDriver {
 public:
  virtual ~ZeltaDriver();
  virtual void drive(const std::shared_ptr<ZeltaWriter>& writer) = 0;
  // The header partition: "writer is present", "source is present",
  // "master metadata is present", "valid essence format", "valid edit rate".
  virtual void start(const std::shared_ptr<ZeltaWriter>& writer) = 0;
  // Edit units while the source has more.
  virtual void writeAll() = 0;
  virtual void writeEditUnit() = 0;
  // The footer, and the random index pack but for a D10 file whose header
  // was closed; the driver may start again afterwards.
  virtual void finish() = 0;
};

ZELTA_EXPORT std::shared_ptr<ZeltaDriver> createZeltaDriver(const std::shared_ptr<ZeltaSource>& source);

#endif
