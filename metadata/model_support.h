// Small pieces shared by the factories, the model parser and the model
// coder.
#ifndef ZELTA_METADATA_MODEL_SUPPORT_H
#define ZELTA_METADATA_MODEL_SUPPORT_H

#include <memory>

#include "metadata.h"

namespace zelta {

// Whether the object hangs under a live owner.
bool hasLiveOwner(const std::shared_ptr<MetadataRoot>& object);
// Keys of the in-memory family, never written or primed.
bool isPrivateProperty(const KLVKey& key);

}  // namespace zelta

#endif
