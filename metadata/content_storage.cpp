#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

using zelta::insertOwned;
using zelta::ownedAt;
using zelta::presentValue;
using zelta::removeOwned;
using zelta::standardKey;

ContentStorage::ContentStorage() = default;
ContentStorage::~ContentStorage() = default;
std::shared_ptr<ContentStorage> ContentStorage::create() { return std::make_shared<ContentStorage>(); }

std::shared_ptr<GenericPackage> ContentStorage::getPackageAt(std::size_t index) { return ownedAt(packages_, index); }

std::shared_ptr<const GenericPackage> ContentStorage::getPackageAt(std::size_t index) const {
  return ownedAt(packages_, index);
}

void ContentStorage::addPackage(const std::shared_ptr<GenericPackage>& package) {
  insertPackageAt(packages_.size(), package);
}

void ContentStorage::insertPackageAt(std::size_t index, const std::shared_ptr<GenericPackage>& package) {
  insertOwned(*this, packages_, index, package);
}

void ContentStorage::removePackageAt(std::size_t index) { removeOwned(*this, packages_, index); }

std::shared_ptr<EssenceContainerData> ContentStorage::getEssenceContainerDataAt(std::size_t index) {
  return ownedAt(essenceContainerData_, index);
}

std::shared_ptr<const EssenceContainerData> ContentStorage::getEssenceContainerDataAt(std::size_t index) const {
  return ownedAt(essenceContainerData_, index);
}

void ContentStorage::addEssenceContainerData(const std::shared_ptr<EssenceContainerData>& essenceContainerData) {
  insertEssenceContainerDataAt(essenceContainerData_.size(), essenceContainerData);
}

void ContentStorage::insertEssenceContainerDataAt(std::size_t index,
                                                  const std::shared_ptr<EssenceContainerData>& essenceContainerData) {
  insertOwned(*this, essenceContainerData_, index, essenceContainerData);
  hasEssenceContainerData_ = true;
}

void ContentStorage::removeEssenceContainerDataAt(std::size_t index) {
  removeOwned(*this, essenceContainerData_, index);
}

void ContentStorage::removeEssenceContainerData() {
  essenceContainerData_.clear();
  hasEssenceContainerData_ = false;
}

EssenceContainerData::EssenceContainerData() = default;
EssenceContainerData::~EssenceContainerData() = default;
std::shared_ptr<EssenceContainerData> EssenceContainerData::create() {
  return std::make_shared<EssenceContainerData>();
}

const std::uint32_t& EssenceContainerData::getIndexSID() const {
  return presentValue(indexSID_, "EssenceContainerData.indexSID is present");
}

namespace zelta {

template <>
const PropertyTable<ContentStorage>& propertyTable<ContentStorage>() {
  typedef ContentStorage C;
  static const PropertyTable<C> table(
      "ContentStorage", formatSetKey(0x18),
      {referenceVector<C, GenericPackage>("ContentStorage.packages", "ContentStorage.package", 0x1901,
                                          &C::getPackageCount, &C::getPackageAt, &C::insertPackageAt),
       referenceVector<C, EssenceContainerData>("ContentStorage.essenceContainerData",
                                                "ContentStorage.essenceContainerData", 0x1902,
                                                &C::getEssenceContainerDataCount, &C::getEssenceContainerDataAt,
                                                &C::insertEssenceContainerDataAt, &C::hasEssenceContainerData)});
  return table;
}

template <>
const PropertyTable<EssenceContainerData>& propertyTable<EssenceContainerData>() {
  typedef EssenceContainerData C;
  static const PropertyTable<C> table(
      "EssenceContainerData", formatSetKey(0x23),
      {requiredValue("EssenceContainerData.linkedPackageUID", 0x2701, &C::getLinkedPackageUID, &C::setLinkedPackageUID),
       optionalValue("EssenceContainerData.indexSID", 0x3F06, &C::getIndexSID, &C::setIndexSID, &C::hasIndexSID),
       requiredValue("EssenceContainerData.bodySID", 0x3F07, &C::getBodySID, &C::setBodySID)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<ContentStorage, MetadataObjectFactory>;
template class MetadataClassFactory<EssenceContainerData, MetadataObjectFactory>;
