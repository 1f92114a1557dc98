// Zelta: the sequential reader of the kit, which delivers a whole file to
// the handlers that a client sets and, with an error handler, checks it
// against the kit's rules. Part of kit.h, which includes it.
#ifndef ZELTA_INCLUDE_KIT_READER_H
#define ZELTA_INCLUDE_KIT_READER_H

#include <cstddef>
#include <cstdint>
#include <istream>
#include <memory>

#include "metadata.h"
#include "mxf.h"

// The client's own element keys, for files that hold keys the kit does not
// know; each test is asked after the kit's.
class ZELTA_EXPORT ZeltaKeyClassifier {
 public:
  virtual ~ZeltaKeyClassifier();
  virtual bool isEssenceKey(const KLVKey& key) const = 0;
  virtual bool isPictureKey(const KLVKey& key) const = 0;
  virtual bool isSoundKey(const KLVKey& key) const = 0;
  virtual bool isDataKey(const KLVKey& key) const = 0;
  virtual bool isCompoundKey(const KLVKey& key) const = 0;
};

// The metadata model, and the value of the one individual item that the
// kit's files carry beside the metadata sets.
class ZELTA_EXPORT ZeltaMetadataHandler : public MXFMetadataModelHandler {
 public:
  virtual void packageItem(const std::uint8_t* data, std::size_t size) = 0;
};

// Assembles, for each read, a chain from the file to the handlers that are
// set; nothing is parsed for a handler that is not. Each setter replaces
// what was there, an empty pointer clears it.
class ZELTA_EXPORT ZeltaReader {
 public:
  virtual ~ZeltaReader();

  // A fresh ZeltaMetadataFactory is made at each read when none is set.
  virtual void setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory) = 0;
  virtual void setEssenceKeyClassifier(const std::shared_ptr<ZeltaKeyClassifier>& classifier) = 0;
  virtual void setStructureHandler(const std::shared_ptr<MXFStructureHandler>& handler) = 0;
  virtual void setMetadataHandler(const std::shared_ptr<ZeltaMetadataHandler>& handler) = 0;
  virtual void setIndexHandler(const std::shared_ptr<MXFIndexHandler>& handler) = 0;
  virtual void setGCStructureHandler(const std::shared_ptr<MXFGCStructureHandler>& handler) = 0;
  virtual void setSDTICPHandler(const std::shared_ptr<MXFSDTICPSystemHandler>& handler) = 0;
  virtual void setProxyHandler(const std::shared_ptr<MXFQMProxySystemHandler>& handler) = 0;
  virtual void setEssenceHandler(const std::shared_ptr<MXFGCEssenceHandler>& handler) = 0;
  // Its presence also switches the kit's validation on.
  virtual void setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) = 0;
  // The whole file, in file order; what the chain raises passes through.
  virtual void read() = 0;
};

// The reader shares the stream; it reads on from where the stream stands.
ZELTA_EXPORT std::shared_ptr<ZeltaReader> createZeltaReader(const std::shared_ptr<std::istream>& input);

#endif
