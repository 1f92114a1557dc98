#include "metadata/model_support.h"

#include <iomanip>

namespace zelta {

std::string instanceUIDText(const MXFUID& identifier) {
  loomlib::ostringstream_classic out;
  out << std::hex << std::nouppercase << std::setfill('0');
  for (std::size_t i = 0; i < 16; ++i) {
    if (i == 4 || i == 6 || i == 8 || i == 10) out << '-';
    out << std::setw(2) << static_cast<unsigned>(identifier[i]);
  }
  return out.str();
}

std::string keyText(const KLVKey& key) {
  loomlib::ostringstream_classic out;
  out << key;
  return out.str();
}

bool hasLiveOwner(const std::shared_ptr<MetadataRoot>& object) { return object->getTopOwner() != object; }

bool isPrivateProperty(const KLVKey& key) { return MXFPrivatePropertyPattern.matches(key); }

}  // namespace zelta
