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
      "MetadataObject", formatSetKey(0x01),
      {optionalValue("MetadataObject.generationUID", 0x0102, &MetadataObject::getGenerationUID,
                     &MetadataObject::setGenerationUID, &MetadataObject::hasGenerationUID)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<MetadataObject, MetadataRootFactory>;
