#include <memory>

#include "metadata.h"
#include "metadata/descriptor_tables.h"

using zelta::insertOwned;
using zelta::ownedAt;
using zelta::presentValue;
using zelta::removeOwned;

SubDescriptor::SubDescriptor() = default;
SubDescriptor::~SubDescriptor() = default;
std::shared_ptr<SubDescriptor> SubDescriptor::create() { return std::make_shared<SubDescriptor>(); }

ContainerConstraintsSubDescriptor::ContainerConstraintsSubDescriptor() = default;
ContainerConstraintsSubDescriptor::~ContainerConstraintsSubDescriptor() = default;
std::shared_ptr<ContainerConstraintsSubDescriptor> ContainerConstraintsSubDescriptor::create() {
  return std::make_shared<ContainerConstraintsSubDescriptor>();
}

GenericDescriptor::GenericDescriptor() = default;
GenericDescriptor::~GenericDescriptor() = default;
std::shared_ptr<GenericDescriptor> GenericDescriptor::create() { return std::make_shared<GenericDescriptor>(); }

std::shared_ptr<GenericLocator> GenericDescriptor::getLocatorAt(std::size_t index) { return ownedAt(locators_, index); }

std::shared_ptr<const GenericLocator> GenericDescriptor::getLocatorAt(std::size_t index) const {
  return ownedAt(locators_, index);
}

void GenericDescriptor::addLocator(const std::shared_ptr<GenericLocator>& locator) {
  insertLocatorAt(locators_.size(), locator);
}

void GenericDescriptor::insertLocatorAt(std::size_t index, const std::shared_ptr<GenericLocator>& locator) {
  insertOwned(*this, locators_, index, locator);
  hasLocators_ = true;
}

void GenericDescriptor::removeLocatorAt(std::size_t index) { removeOwned(*this, locators_, index); }

void GenericDescriptor::removeLocators() {
  locators_.clear();
  hasLocators_ = false;
}

std::shared_ptr<SubDescriptor> GenericDescriptor::getGenericSubDescriptorAt(std::size_t index) {
  return ownedAt(genericSubDescriptors_, index);
}

std::shared_ptr<const SubDescriptor> GenericDescriptor::getGenericSubDescriptorAt(std::size_t index) const {
  return ownedAt(genericSubDescriptors_, index);
}

void GenericDescriptor::addGenericSubDescriptor(const std::shared_ptr<SubDescriptor>& subDescriptor) {
  insertGenericSubDescriptorAt(genericSubDescriptors_.size(), subDescriptor);
}

void GenericDescriptor::insertGenericSubDescriptorAt(std::size_t index,
                                                     const std::shared_ptr<SubDescriptor>& subDescriptor) {
  insertOwned(*this, genericSubDescriptors_, index, subDescriptor);
  hasGenericSubDescriptors_ = true;
}

void GenericDescriptor::removeGenericSubDescriptorAt(std::size_t index) {
  removeOwned(*this, genericSubDescriptors_, index);
}

void GenericDescriptor::removeGenericSubDescriptors() {
  genericSubDescriptors_.clear();
  hasGenericSubDescriptors_ = false;
}

FileDescriptor::FileDescriptor() = default;
FileDescriptor::~FileDescriptor() = default;
std::shared_ptr<FileDescriptor> FileDescriptor::create() { return std::make_shared<FileDescriptor>(); }

const std::uint32_t& FileDescriptor::getLinkedTrackID() const {
  return presentValue(linkedTrackID_, "FileDescriptor.linkedTrackID is present");
}

const std::int64_t& FileDescriptor::getContainerDuration() const {
  return presentValue(containerDuration_, "FileDescriptor.containerDuration is present");
}

const MXFUID& FileDescriptor::getCodec() const { return presentValue(codec_, "FileDescriptor.codec is present"); }

MultipleDescriptor::MultipleDescriptor() = default;
MultipleDescriptor::~MultipleDescriptor() = default;
std::shared_ptr<MultipleDescriptor> MultipleDescriptor::create() { return std::make_shared<MultipleDescriptor>(); }

std::shared_ptr<FileDescriptor> MultipleDescriptor::getSubDescriptorAt(std::size_t index) {
  return ownedAt(subDescriptors_, index);
}

std::shared_ptr<const FileDescriptor> MultipleDescriptor::getSubDescriptorAt(std::size_t index) const {
  return ownedAt(subDescriptors_, index);
}

void MultipleDescriptor::addSubDescriptor(const std::shared_ptr<FileDescriptor>& subDescriptor) {
  insertSubDescriptorAt(subDescriptors_.size(), subDescriptor);
}

void MultipleDescriptor::insertSubDescriptorAt(std::size_t index,
                                               const std::shared_ptr<FileDescriptor>& subDescriptor) {
  insertOwned(*this, subDescriptors_, index, subDescriptor);
}

void MultipleDescriptor::removeSubDescriptorAt(std::size_t index) { removeOwned(*this, subDescriptors_, index); }

namespace zelta {

namespace {

// Not in the standard primer: each file gives it a dynamic tag.
const KLVKey genericSubDescriptorsKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x09, 0x06,
                                                                   0x01, 0x01, 0x04, 0x06, 0x10, 0x00, 0x00});

}  // namespace

template <>
const PropertyTable<SubDescriptor>& propertyTable<SubDescriptor>() {
  static const PropertyTable<SubDescriptor> table("SubDescriptor", formatSetKey(0x59), {});
  return table;
}

template <>
const PropertyTable<ContainerConstraintsSubDescriptor>& propertyTable<ContainerConstraintsSubDescriptor>() {
  static const PropertyTable<ContainerConstraintsSubDescriptor> table("ContainerConstraintsSubDescriptor",
                                                                      formatSetKey(0x67), {});
  return table;
}

}  // namespace zelta

class GenericDescriptorPresence {
public:
  GenericDescriptorPresence() = delete;
  static constexpr auto locators = &GenericDescriptor::markLocatorsPresent;
  static constexpr auto genericSubDescriptors = &GenericDescriptor::markGenericSubDescriptorsPresent;
};

namespace zelta {

template <>
const PropertyTable<GenericDescriptor>& propertyTable<GenericDescriptor>() {
  typedef GenericDescriptor C;
  static const PropertyTable<C> table(
      "GenericDescriptor", formatSetKey(0x24),
      {referenceVector<C, GenericLocator>("GenericDescriptor.locators", "GenericDescriptor.locator", 0x2F01,
                                          &C::getLocatorCount, &C::getLocatorAt, &C::insertLocatorAt, &C::hasLocators,
                                          GenericDescriptorPresence::locators),
       referenceVector<C, SubDescriptor>(
           "GenericDescriptor.genericSubDescriptors", "GenericDescriptor.genericSubDescriptor",
           {genericSubDescriptorsKey, 0}, &C::getGenericSubDescriptorCount, &C::getGenericSubDescriptorAt,
           &C::insertGenericSubDescriptorAt, &C::hasGenericSubDescriptors, GenericDescriptorPresence::genericSubDescriptors)});
  return table;
}

template <>
const PropertyTable<FileDescriptor>& propertyTable<FileDescriptor>() {
  typedef FileDescriptor C;
  static const PropertyTable<C> table(
      "FileDescriptor", formatSetKey(0x25),
      {optionalValue("FileDescriptor.linkedTrackID", 0x3006, &C::getLinkedTrackID, &C::setLinkedTrackID,
                     &C::hasLinkedTrackID),
       requiredValue("FileDescriptor.sampleRate", 0x3001, &C::getSampleRate, &C::setSampleRate),
       optionalValue("FileDescriptor.containerDuration", 0x3002, &C::getContainerDuration, &C::setContainerDuration,
                     &C::hasContainerDuration),
       requiredValue("FileDescriptor.essenceContainer", 0x3004, &C::getEssenceContainer, &C::setEssenceContainer),
       optionalValue("FileDescriptor.codec", 0x3005, &C::getCodec, &C::setCodec, &C::hasCodec)});
  return table;
}

template <>
const PropertyTable<MultipleDescriptor>& propertyTable<MultipleDescriptor>() {
  typedef MultipleDescriptor C;
  static const PropertyTable<C> table(
      "MultipleDescriptor", formatSetKey(0x44),
      {referenceVector<C, FileDescriptor>("MultipleDescriptor.subDescriptors", "MultipleDescriptor.subDescriptor",
                                          0x3F01, &C::getSubDescriptorCount, &C::getSubDescriptorAt,
                                          &C::insertSubDescriptorAt)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<SubDescriptor, MetadataObjectFactory>;
template class MetadataClassFactory<ContainerConstraintsSubDescriptor, SubDescriptorFactory>;
template class MetadataClassFactory<GenericDescriptor, MetadataObjectFactory>;
template class MetadataClassFactory<FileDescriptor, GenericDescriptorFactory>;
template class MetadataClassFactory<MultipleDescriptor, FileDescriptorFactory>;
