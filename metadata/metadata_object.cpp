#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

MetadataObject::MetadataObject() = default;

MetadataObject::~MetadataObject() = default;

std::shared_ptr<MetadataObject> MetadataObject::create() { return std::make_shared<MetadataObject>(); }

const MXFUID& MetadataObject::getGenerationUID() const {
  check(generationUID_.has_value(), "MetadataObject.generationUID is present");
  return *generationUID_;
}

namespace zelta {

template <>
const PropertyTable<MetadataObject>& propertyTable<MetadataObject>() {
  static const PropertyTable<MetadataObject> table(
      "MetadataObject",
      KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x01, 0x01, 0x01,
                                          0x01, 0x01, 0x00}),
      {optionalValue("MetadataObject.generationUID", standardKey(0x0102), 0x0102, &MetadataObject::getGenerationUID,
                     &MetadataObject::setGenerationUID, &MetadataObject::hasGenerationUID)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<MetadataObject, MetadataRootFactory>;
