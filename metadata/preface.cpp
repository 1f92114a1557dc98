#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"
#include "metadata/present_time.h"

using zelta::insertOwned;
using zelta::ownedAt;
using zelta::presentValue;
using zelta::removeOwned;
using zelta::standardKey;

Preface::Preface() : lastModifiedDate_(zelta::presentTimestamp()), version_(0x0102) {}
Preface::~Preface() = default;
std::shared_ptr<Preface> Preface::create() { return std::make_shared<Preface>(); }

const std::uint32_t& Preface::getObjectModelVersion() const {
  return presentValue(objectModelVersion_, "Preface.objectModelVersion is present");
}

std::shared_ptr<GenericPackage> Preface::getPrimaryPackage() {
  check(hasPrimaryPackage_, "Preface.primaryPackage is present");
  return primaryPackage_.lock();
}

std::shared_ptr<const GenericPackage> Preface::getPrimaryPackage() const {
  check(hasPrimaryPackage_, "Preface.primaryPackage is present");
  return primaryPackage_.lock();
}

// Names the package without owning it: the content storage does.
void Preface::setPrimaryPackage(const std::shared_ptr<GenericPackage>& primaryPackage) {
  primaryPackage_ = primaryPackage;
  hasPrimaryPackage_ = true;
}

void Preface::removePrimaryPackage() {
  primaryPackage_.reset();
  hasPrimaryPackage_ = false;
}

std::shared_ptr<Identification> Preface::getIdentificationAt(std::size_t index) {
  return ownedAt(identifications_, index);
}

std::shared_ptr<const Identification> Preface::getIdentificationAt(std::size_t index) const {
  return ownedAt(identifications_, index);
}

void Preface::addIdentification(const std::shared_ptr<Identification>& identification) {
  insertIdentificationAt(identifications_.size(), identification);
}

void Preface::insertIdentificationAt(std::size_t index, const std::shared_ptr<Identification>& identification) {
  insertOwned(*this, identifications_, index, identification);
}

void Preface::removeIdentificationAt(std::size_t index) { removeOwned(*this, identifications_, index); }

std::shared_ptr<ContentStorage> Preface::getContentStorage() { return contentStorage_; }

std::shared_ptr<const ContentStorage> Preface::getContentStorage() const { return contentStorage_; }

void Preface::setContentStorage(const std::shared_ptr<ContentStorage>& contentStorage) {
  swapOwnership(contentStorage_, contentStorage);
  contentStorage_ = contentStorage;
}

Identification::Identification()
    : thisGenerationUID_(ZeltaDefaultUIDGenerator().generate()), modificationDate_(zelta::presentTimestamp()) {}
Identification::~Identification() = default;
std::shared_ptr<Identification> Identification::create() { return std::make_shared<Identification>(); }

const MXFProductVersion& Identification::getProductVersion() const {
  return presentValue(productVersion_, "Identification.productVersion is present");
}

const MXFProductVersion& Identification::getToolkitVersion() const {
  return presentValue(toolkitVersion_, "Identification.toolkitVersion is present");
}

const std::wstring& Identification::getPlatform() const {
  return presentValue(platform_, "Identification.platform is present");
}

namespace zelta {

template <>
const PropertyTable<Preface>& propertyTable<Preface>() {
  typedef Preface C;
  static const PropertyTable<C> table(
      "Preface", formatSetKey(0x2F),
      {requiredValue("Preface.lastModifiedDate", 0x3B02, &C::getLastModifiedDate, &C::setLastModifiedDate),
       requiredValue("Preface.version", 0x3B05, &C::getVersion, &C::setVersion),
       optionalValue("Preface.objectModelVersion", 0x3B07, &C::getObjectModelVersion, &C::setObjectModelVersion,
                     &C::hasObjectModelVersion),
       weakReference<C, GenericPackage>("Preface.primaryPackage", 0x3B08, &C::getPrimaryPackage, &C::setPrimaryPackage,
                                        &C::hasPrimaryPackage),
       referenceVector<C, Identification>("Preface.identifications", "Preface.identification", 0x3B06,
                                          &C::getIdentificationCount, &C::getIdentificationAt,
                                          &C::insertIdentificationAt),
       strongReference<C, ContentStorage>("Preface.contentStorage", 0x3B03, &C::getContentStorage,
                                          &C::setContentStorage),
       requiredValue("Preface.operationalPattern", 0x3B09, &C::getOperationalPattern, &C::setOperationalPattern),
       requiredValue("Preface.essenceContainers", 0x3B0A, &C::getEssenceContainers, &C::setEssenceContainers),
       requiredValue("Preface.dmSchemes", 0x3B0B, &C::getDMSchemes, &C::setDMSchemes)});
  return table;
}

template <>
const PropertyTable<Identification>& propertyTable<Identification>() {
  typedef Identification C;
  static const PropertyTable<C> table(
      "Identification", formatSetKey(0x30),
      {requiredValue("Identification.thisGenerationUID", 0x3C09, &C::getThisGenerationUID, &C::setThisGenerationUID),
       requiredValue("Identification.companyName", 0x3C01, &C::getCompanyName, &C::setCompanyName),
       requiredValue("Identification.productName", 0x3C02, &C::getProductName, &C::setProductName),
       optionalValue("Identification.productVersion", 0x3C03, &C::getProductVersion, &C::setProductVersion,
                     &C::hasProductVersion),
       requiredValue("Identification.versionString", 0x3C04, &C::getVersionString, &C::setVersionString),
       requiredValue("Identification.productUID", 0x3C05, &C::getProductUID, &C::setProductUID),
       requiredValue("Identification.modificationDate", 0x3C06, &C::getModificationDate, &C::setModificationDate),
       optionalValue("Identification.toolkitVersion", 0x3C07, &C::getToolkitVersion, &C::setToolkitVersion,
                     &C::hasToolkitVersion),
       optionalValue("Identification.platform", 0x3C08, &C::getPlatform, &C::setPlatform, &C::hasPlatform)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<Preface, MetadataObjectFactory>;
template class MetadataClassFactory<Identification, MetadataObjectFactory>;
