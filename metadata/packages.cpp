#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"
#include "metadata/present_time.h"

using zelta::insertOwned;
using zelta::ownedAt;
using zelta::presentValue;
using zelta::removeOwned;
using zelta::standardKey;

namespace {

// Material type 0x0F: not identified. Whoever knows better sets the
// package identifier.
constexpr std::uint8_t unidentifiedMaterial = 0x0F;

}  // namespace

GenericPackage::GenericPackage()
    : packageUID_(UMID::createNew(unidentifiedMaterial)),
      packageCreationDate_(zelta::presentTimestamp()),
      packageModifiedDate_(packageCreationDate_) {}
GenericPackage::~GenericPackage() = default;
std::shared_ptr<GenericPackage> GenericPackage::create() { return std::make_shared<GenericPackage>(); }

const std::wstring& GenericPackage::getName() const { return presentValue(name_, "GenericPackage.name is present"); }

std::shared_ptr<Track> GenericPackage::getTrackAt(std::size_t index) { return ownedAt(tracks_, index); }

std::shared_ptr<const Track> GenericPackage::getTrackAt(std::size_t index) const { return ownedAt(tracks_, index); }

void GenericPackage::addTrack(const std::shared_ptr<Track>& track) { insertTrackAt(tracks_.size(), track); }

void GenericPackage::insertTrackAt(std::size_t index, const std::shared_ptr<Track>& track) {
  insertOwned(*this, tracks_, index, track);
}

void GenericPackage::removeTrackAt(std::size_t index) { removeOwned(*this, tracks_, index); }

MaterialPackage::MaterialPackage() = default;
MaterialPackage::~MaterialPackage() = default;
std::shared_ptr<MaterialPackage> MaterialPackage::create() { return std::make_shared<MaterialPackage>(); }

SourcePackage::SourcePackage() = default;
SourcePackage::~SourcePackage() = default;
std::shared_ptr<SourcePackage> SourcePackage::create() { return std::make_shared<SourcePackage>(); }

std::shared_ptr<GenericDescriptor> SourcePackage::getDescriptor() { return descriptor_; }

std::shared_ptr<const GenericDescriptor> SourcePackage::getDescriptor() const { return descriptor_; }

void SourcePackage::setDescriptor(const std::shared_ptr<GenericDescriptor>& descriptor) {
  swapOwnership(descriptor_, descriptor);
  descriptor_ = descriptor;
}

namespace zelta {

template <>
const PropertyTable<GenericPackage>& propertyTable<GenericPackage>() {
  typedef GenericPackage C;
  static const PropertyTable<C> table(
      "GenericPackage", formatSetKey(0x34),
      {requiredValue("GenericPackage.packageUID", 0x4401, &C::getPackageUID, &C::setPackageUID),
       optionalValue("GenericPackage.name", 0x4402, &C::getName, &C::setName, &C::hasName),
       requiredValue("GenericPackage.packageCreationDate", 0x4405, &C::getPackageCreationDate,
                     &C::setPackageCreationDate),
       requiredValue("GenericPackage.packageModifiedDate", 0x4404, &C::getPackageModifiedDate,
                     &C::setPackageModifiedDate),
       referenceVector<C, Track>("GenericPackage.tracks", "GenericPackage.track", 0x4403, &C::getTrackCount,
                                 &C::getTrackAt, &C::insertTrackAt)});
  return table;
}

template <>
const PropertyTable<MaterialPackage>& propertyTable<MaterialPackage>() {
  static const PropertyTable<MaterialPackage> table("MaterialPackage", formatSetKey(0x36), {});
  return table;
}

template <>
const PropertyTable<SourcePackage>& propertyTable<SourcePackage>() {
  typedef SourcePackage C;
  static const PropertyTable<C> table("SourcePackage", formatSetKey(0x37),
                                      {strongReference<C, GenericDescriptor>("SourcePackage.descriptor", 0x4701,
                                                                             &C::getDescriptor, &C::setDescriptor)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<GenericPackage, MetadataObjectFactory>;
template class MetadataClassFactory<MaterialPackage, GenericPackageFactory>;
template class MetadataClassFactory<SourcePackage, GenericPackageFactory>;
