// Zelta: the model builder, which expands one master into the complete
// header metadata of a file of its essence format. Part of kit.h, which
// includes it.
#ifndef ZELTA_INCLUDE_KIT_BUILDER_H
#define ZELTA_INCLUDE_KIT_BUILDER_H

#include <memory>

#include "kit_master.h"
#include "metadata.h"

// A Preface and everything below it, every object with a fresh instance
// UID from the generator. Fails, with nothing made, on a master that no
// file of its format can describe.
ZELTA_EXPORT std::shared_ptr<Preface> createZeltaMetadataModel(const std::shared_ptr<const ZeltaMasterMetadata>& master,
                                                               const std::shared_ptr<MXFUIDGenerator>& uidGenerator);
// The same with a new ZeltaDefaultUIDGenerator.
ZELTA_EXPORT std::shared_ptr<Preface> createZeltaMetadataModel(
    const std::shared_ptr<const ZeltaMasterMetadata>& master);

#endif
