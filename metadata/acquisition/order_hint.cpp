#include "metadata/acquisition/acquisition_support.h"

namespace zelta {

void writeOrderHint(MXFPropertyMap& properties, const std::vector<KLVKey>& order) {
  std::vector<KLVKey> hint;
  if (properties.count(MXFInstanceUIDKey) != 0) hint.push_back(MXFInstanceUIDKey);
  for (const KLVKey& key : order)
    if (properties.count(key) != 0) hint.push_back(key);
  ByteVector bytes;
  externalize(bytes, hint, true);
  properties[MXFPropertyOrderHintKey] = bytes;
}

}  // namespace zelta
