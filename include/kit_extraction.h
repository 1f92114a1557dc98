// Zelta: master extraction, the inverse of the model builder: a model
// collapsed into the flat master metadata of its clip. Part of kit.h, which
// includes it.
#ifndef ZELTA_INCLUDE_KIT_EXTRACTION_H
#define ZELTA_INCLUDE_KIT_EXTRACTION_H

#include <memory>

#include "kit_master.h"
#include "metadata.h"

// A new ZeltaDefaultMetadata with all values the model gives; the model is
// neither changed nor kept. Fails on a model that lacks what a master needs.
ZELTA_EXPORT std::shared_ptr<ZeltaMasterMetadata> createZeltaMasterMetadata(
    const std::shared_ptr<const Preface>& preface);

#endif
