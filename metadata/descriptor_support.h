// Pieces shared by the locator and descriptor classes: their set keys, their
// properties whose keys are in the standard primer, the check of an optional
// value, and the owned vectors of references.
#ifndef ZELTA_METADATA_DESCRIPTOR_SUPPORT_H
#define ZELTA_METADATA_DESCRIPTOR_SUPPORT_H

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "metadata.h"
#include "metadata/property_table.h"

namespace zelta {

// The tables of the locator and descriptor classes, declared before any
// factory of a derived class uses them.
template <>
const PropertyTable<GenericLocator>& propertyTable<GenericLocator>();
template <>
const PropertyTable<NetworkLocator>& propertyTable<NetworkLocator>();
template <>
const PropertyTable<TextLocator>& propertyTable<TextLocator>();
template <>
const PropertyTable<SubDescriptor>& propertyTable<SubDescriptor>();
template <>
const PropertyTable<ContainerConstraintsSubDescriptor>& propertyTable<ContainerConstraintsSubDescriptor>();
template <>
const PropertyTable<GenericDescriptor>& propertyTable<GenericDescriptor>();
template <>
const PropertyTable<FileDescriptor>& propertyTable<FileDescriptor>();
template <>
const PropertyTable<PictureDescriptor>& propertyTable<PictureDescriptor>();
template <>
const PropertyTable<CDCIPictureDescriptor>& propertyTable<CDCIPictureDescriptor>();
template <>
const PropertyTable<RGBAPictureDescriptor>& propertyTable<RGBAPictureDescriptor>();
template <>
const PropertyTable<SoundDescriptor>& propertyTable<SoundDescriptor>();
template <>
const PropertyTable<DataDescriptor>& propertyTable<DataDescriptor>();
template <>
const PropertyTable<MultipleDescriptor>& propertyTable<MultipleDescriptor>();

// 06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01, the class octet, 00.
inline KLVKey descriptorSetKey(std::uint8_t classOctet) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x01, 0x01,
                                             0x01, 0x01, classOctet, 0x00});
}

// A value of class C whose key is in the standard primer, by its tag.
template <typename C, typename T>
PropertyDescriptor<C> optionalStandard(const std::string& name, std::uint16_t tag, const T& (C::*getter)() const,
                                       void (C::*setter)(const T&), bool (C::*has)() const) {
  return optionalValue(name, standardKey(tag), tag, getter, setter, has);
}

template <typename C, typename T>
PropertyDescriptor<C> requiredStandard(const std::string& name, std::uint16_t tag, const T& (C::*getter)() const,
                                       void (C::*setter)(const T&)) {
  return requiredValue(name, standardKey(tag), tag, getter, setter);
}

template <typename T>
const T& presentValue(const std::optional<T>& value, const char* isPresent) {
  check(value.has_value(), isPresent);
  return *value;
}

template <typename T>
const std::shared_ptr<T>& ownedAt(const std::vector<std::shared_ptr<T>>& elements, std::size_t index) {
  check(index < elements.size(), "valid index");
  return elements[index];
}

// The owner takes the element before it goes in, so that a failed check
// leaves the vector as it was.
template <typename T>
void insertOwned(MetadataRoot& owner, std::vector<std::shared_ptr<T>>& elements, std::size_t index,
                 const std::shared_ptr<T>& element) {
  check(index <= elements.size(), "valid index");
  owner.takeOwnership(element);
  elements.insert(elements.begin() + static_cast<std::ptrdiff_t>(index), element);
}

template <typename T>
void removeOwned(MetadataRoot& owner, std::vector<std::shared_ptr<T>>& elements, std::size_t index) {
  check(index < elements.size(), "valid index");
  owner.releaseOwnership(elements[index]);
  elements.erase(elements.begin() + static_cast<std::ptrdiff_t>(index));
}

}  // namespace zelta

#endif
