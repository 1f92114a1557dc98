#include <array>
#include <memory>
#include <vector>

#include "metadata/acquisition/acquisition_support.h"

using zelta::acquisitionKey;

UserDefinedAcquisitionMetadata::UserDefinedAcquisitionMetadata() = default;
UserDefinedAcquisitionMetadata::~UserDefinedAcquisitionMetadata() = default;
std::shared_ptr<UserDefinedAcquisitionMetadata> UserDefinedAcquisitionMetadata::create() {
  return std::make_shared<UserDefinedAcquisitionMetadata>();
}

namespace {

// The sets of one manufacturer, 96 69 08 00 46 78 03 1C 20 4F xx xx F0 C0 11
// 81, whose items have an order of their own; octet 3 is a zero that counts.
const KLVKeyPattern orderedSetIdentifiers =
    KLVKeyPattern(std::array<std::uint8_t, 16>{0x96, 0x69, 0x08, 0x00, 0x46, 0x78, 0x03, 0x1C, 0x20, 0x4F, 0x00, 0x00,
                                               0xF0, 0xC0, 0x11, 0x81})
        .withMask(3, 0xFF);

// Their dark items, in that order.
const std::array<std::uint16_t, 4> orderedItemTags{0xE203, 0xE201, 0xE202, 0x8007};

}  // namespace

namespace zelta {

template <>
const PropertyTable<UserDefinedAcquisitionMetadata>& propertyTable<UserDefinedAcquisitionMetadata>() {
  typedef UserDefinedAcquisitionMetadata C;
  static const PropertyTable<C> table(
      "UserDefinedAcquisitionMetadata", acquisitionSetKey(0x7F),
      {requiredValue("UserDefinedAcquisitionMetadata.udamSetIdentifier",
                     acquisitionKey(0xE000, {0x04, 0x06, 0x08, 0x05, 0x00, 0x00, 0x00, 0x00}), &C::getUDAMSetIdentifier,
                     &C::setUDAMSetIdentifier)});
  return table;
}

}  // namespace zelta

void UserDefinedAcquisitionMetadataFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object,
                                                           MXFPropertyMap& properties,
                                                           MXFReferencedObjects& referenced) const {
  typedef MetadataClassFactory<UserDefinedAcquisitionMetadata, AcquisitionMetadataObjectFactory> Base;
  Base::codeProperties(object, properties, referenced);
  const zelta::PropertyTable<UserDefinedAcquisitionMetadata>& table =
      zelta::propertyTable<UserDefinedAcquisitionMetadata>();
  std::vector<KLVKey> order = table.keys();
  if (orderedSetIdentifiers.matches(table.cast(object).getUDAMSetIdentifier()))
    for (const std::uint16_t tag : orderedItemTags) order.push_back(acquisitionDarkItemKey(tag));
  zelta::writeOrderHint(properties, order);
}

template class MetadataClassFactory<UserDefinedAcquisitionMetadata, AcquisitionMetadataObjectFactory>;
