#include <memory>

#include "metadata.h"
#include "metadata/descriptor_tables.h"

GenericLocator::GenericLocator() = default;
GenericLocator::~GenericLocator() = default;
std::shared_ptr<GenericLocator> GenericLocator::create() { return std::make_shared<GenericLocator>(); }

NetworkLocator::NetworkLocator() = default;
NetworkLocator::~NetworkLocator() = default;
std::shared_ptr<NetworkLocator> NetworkLocator::create() { return std::make_shared<NetworkLocator>(); }

TextLocator::TextLocator() = default;
TextLocator::~TextLocator() = default;
std::shared_ptr<TextLocator> TextLocator::create() { return std::make_shared<TextLocator>(); }

namespace zelta {

template <>
const PropertyTable<GenericLocator>& propertyTable<GenericLocator>() {
  static const PropertyTable<GenericLocator> table("GenericLocator", formatSetKey(0x31), {});
  return table;
}

template <>
const PropertyTable<NetworkLocator>& propertyTable<NetworkLocator>() {
  static const PropertyTable<NetworkLocator> table(
      "NetworkLocator", formatSetKey(0x32),
      {requiredValue("NetworkLocator.urlString", 0x4001, &NetworkLocator::getURLString,
                     &NetworkLocator::setURLString)});
  return table;
}

template <>
const PropertyTable<TextLocator>& propertyTable<TextLocator>() {
  static const PropertyTable<TextLocator> table(
      "TextLocator", formatSetKey(0x33),
      {requiredValue("TextLocator.locatorName", 0x4101, &TextLocator::getLocatorName, &TextLocator::setLocatorName)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<GenericLocator, MetadataObjectFactory>;
template class MetadataClassFactory<NetworkLocator, GenericLocatorFactory>;
template class MetadataClassFactory<TextLocator, GenericLocatorFactory>;
