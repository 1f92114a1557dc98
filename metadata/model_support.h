// Small pieces shared by the factories, the model parser and the model
// coder.
#ifndef ZELTA_METADATA_MODEL_SUPPORT_H
#define ZELTA_METADATA_MODEL_SUPPORT_H

#include <memory>
#include <string>

#include "metadata.h"

namespace zelta {

// 32 lower-case hexadecimal digits in the groups 8-4-4-4-12.
std::string instanceUIDText(const MXFUID& identifier);
// 16 upper-case hexadecimal pairs joined by points.
std::string keyText(const KLVKey& key);
// Whether the object hangs under a live owner.
bool hasLiveOwner(const std::shared_ptr<MetadataRoot>& object);
// Keys of the in-memory family, never written or primed.
bool isPrivateProperty(const KLVKey& key);

}  // namespace zelta

#endif
