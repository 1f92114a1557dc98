#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

DescriptiveMetadataFramework::DescriptiveMetadataFramework() = default;
DescriptiveMetadataFramework::~DescriptiveMetadataFramework() = default;
std::shared_ptr<DescriptiveMetadataFramework> DescriptiveMetadataFramework::create() {
  return std::make_shared<DescriptiveMetadataFramework>();
}

DescriptiveMetadataObject::DescriptiveMetadataObject() = default;
DescriptiveMetadataObject::~DescriptiveMetadataObject() = default;
std::shared_ptr<DescriptiveMetadataObject> DescriptiveMetadataObject::create() {
  return std::make_shared<DescriptiveMetadataObject>();
}

namespace zelta {

// The schemes' own classes name their sets; these two only root them.
template <>
const PropertyTable<DescriptiveMetadataFramework>& propertyTable<DescriptiveMetadataFramework>() {
  static const PropertyTable<DescriptiveMetadataFramework> table(
      "DescriptiveMetadataFramework",
      KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x04, 0x01, 0x00,
                                          0x00, 0x00, 0x00}),
      {});
  return table;
}

template <>
const PropertyTable<DescriptiveMetadataObject>& propertyTable<DescriptiveMetadataObject>() {
  static const PropertyTable<DescriptiveMetadataObject> table(
      "DescriptiveMetadataObject",
      KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x04, 0x00, 0x00,
                                          0x00, 0x00, 0x00}),
      {});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<DescriptiveMetadataFramework, MetadataObjectFactory>;
template class MetadataClassFactory<DescriptiveMetadataObject, MetadataObjectFactory>;
