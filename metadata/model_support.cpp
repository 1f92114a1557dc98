#include "metadata/model_support.h"

namespace zelta {

bool hasLiveOwner(const std::shared_ptr<MetadataRoot>& object) { return object->getTopOwner() != object; }

bool isPrivateProperty(const KLVKey& key) { return MXFPrivatePropertyPattern.matches(key); }

}  // namespace zelta
