// Zelta: the metadata factory of the kit: every class that the kit's files
// hold, the format's structural classes and descriptors, the codec
// descriptors and text-based descriptive metadata. Part of kit.h, which
// includes it.
#ifndef ZELTA_INCLUDE_KIT_FACTORY_H
#define ZELTA_INCLUDE_KIT_FACTORY_H

#include <memory>

#include "metadata.h"

// The five per-family composites, in search order.
class ZELTA_EXPORT ZeltaMetadataFactory : public MXFMetadataModelFactory {
 public:
  ZeltaMetadataFactory();
  ~ZeltaMetadataFactory() override;

  const Factories& getFactories() override;

 private:
  Factories factories_;
};

ZELTA_EXPORT std::shared_ptr<MXFMetadataModelFactory> createZeltaDefaultMetadataFactory();

#endif
