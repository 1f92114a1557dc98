// Zelta: the event-level writer of the kit, which turns the events that the
// kit's reader delivers back into a file, and the verifying writer, which
// compares them with a file instead. Part of kit.h, which includes it.
#ifndef ZELTA_INCLUDE_KIT_WRITER_H
#define ZELTA_INCLUDE_KIT_WRITER_H

#include <cstdint>
#include <iostream>
#include <memory>

#include "kit_reader.h"
#include "metadata.h"
#include "mxf.h"

// Hands out one handler per kind of event; a client drives them in the
// order in which a reader would deliver the events. The handlers live as
// long as the writer.
class ZELTA_EXPORT ZeltaWriter {
 public:
  virtual ~ZeltaWriter();

  // An empty pointer is replaced by a new ZeltaMetadataFactory.
  virtual void setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory) = 0;
  // The size to which index segments are padded.
  virtual void setIndexKagSize(std::uint32_t kagSize) = 0;
  virtual MXFStructureHandler* getStructureHandler() = 0;
  virtual ZeltaMetadataHandler* getMetadataHandler() = 0;
  virtual MXFIndexHandler* getIndexHandler() = 0;
  // Where the essence stream of the body stands.
  virtual Locator* getLocator(std::uint32_t bodySID) = 0;
  virtual MXFGCStructureHandler* getGCStructureHandler() = 0;
  virtual MXFSDTICPSystemHandler* getSDTICPHandler() = 0;
  virtual MXFQMProxySystemHandler* getProxyHandler() = 0;
  virtual MXFGCEssenceHandler* getEssenceHandler() = 0;
  virtual MXFWriter* getMXFWriter() = 0;
};

// The writer over a stream that already holds a file: while verifying,
// nothing is written and every KLV item is compared with the stream's
// octets where it stands; VerifyingKLVHandler::exception at the first that
// differs.
class ZELTA_EXPORT VerifyingZeltaWriter : public ZeltaWriter {
 public:
  virtual void setVerifying(bool verifying) = 0;
};

ZELTA_EXPORT std::shared_ptr<ZeltaWriter> createZeltaWriter(const std::shared_ptr<std::ostream>& output);
// The stream must be readable too.
ZELTA_EXPORT std::shared_ptr<VerifyingZeltaWriter> createVerifyingZeltaWriter(
    const std::shared_ptr<std::iostream>& stream);

#endif
