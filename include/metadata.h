// Zelta: the metadata model, its objects, ownership and pending references.
#ifndef ZELTA_METADATA_H
#define ZELTA_METADATA_H

#include <cstddef>
#include <list>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <type_traits>
#include <typeinfo>
#include <variant>

#include "klv.h"
#include "mxf.h"

// ---------------------------------------------------------------------------
// Metadata objects

// The base of every object of a model. Ownership makes the model a tree: an
// owning property holds its child strongly, the child links back weakly to
// its single owner, and no object can come to own its own top owner.
class ZELTA_EXPORT MetadataRoot : public std::enable_shared_from_this<MetadataRoot> {
public:
  // A dark property is either octets as they stand or an owned object.
  typedef std::variant<ByteVector, std::shared_ptr<MetadataRoot>> DarkValue;
  typedef std::map<KLVKey, DarkValue> DarkProperties;

  // A fresh instance identifier from uuid_generate.
  MetadataRoot();
  virtual ~MetadataRoot();

  static std::shared_ptr<MetadataRoot> create();

  const MXFUID& getInstanceUID() const { return instanceUID_; }
  void setInstanceUID(const MXFUID& instanceUID) { instanceUID_ = instanceUID; }

  void takeOwnership(const std::shared_ptr<MetadataRoot>& object);
  void releaseOwnership(const std::shared_ptr<MetadataRoot>& object);
  // Releases oldObject and takes newObject, either may be null; every check
  // comes before any change ("current owner is this", "object is not owned",
  // "object does not own this").
  void swapOwnership(const std::shared_ptr<MetadataRoot>& oldObject, const std::shared_ptr<MetadataRoot>& newObject);
  // The same with the object stored under a dark property key as the old one.
  void swapOwnership(const KLVKey& key, const std::shared_ptr<MetadataRoot>& newObject);
  // The end of the chain of live owners; this object when it is unowned.
  std::shared_ptr<MetadataRoot> getTopOwner();

  void setDarkProperty(const KLVKey& key, const ByteVector& bytes);
  template <typename T>
  typename std::enable_if<std::is_convertible<T*, MetadataRoot*>::value>::type setDarkProperty(
      const KLVKey& key, const std::shared_ptr<T>& value);
  // A plain value, by its big-endian octets.
  template <typename T>
  typename std::enable_if<!std::is_convertible<T, std::shared_ptr<const MetadataRoot>>::value>::type setDarkProperty(
      const KLVKey& key, const T& value);

  const ByteVector& getDarkProperty(const KLVKey& key) const;
  template <typename T>
  std::shared_ptr<T> getDarkProperty(const KLVKey& key) const;
  void removeDarkProperty(const KLVKey& key);
  bool hasDarkProperty(const KLVKey& key) const;
  bool isReferenceDarkProperty(const KLVKey& key) const;
  // In key order, for the parser and the coder.
  const DarkProperties& getDarkProperties() const { return darkProperties_; }

private:
  const DarkValue& darkValue(const KLVKey& key) const;

  std::weak_ptr<MetadataRoot> owner_;
  MXFUID instanceUID_;
  DarkProperties darkProperties_;
};

template <typename T>
typename std::enable_if<std::is_convertible<T*, MetadataRoot*>::value>::type MetadataRoot::setDarkProperty(
    const KLVKey& key, const std::shared_ptr<T>& value) {
  const std::shared_ptr<MetadataRoot> object = value;
  swapOwnership(key, object);
  darkProperties_[key] = object;
}

template <typename T>
typename std::enable_if<!std::is_convertible<T, std::shared_ptr<const MetadataRoot>>::value>::type
MetadataRoot::setDarkProperty(const KLVKey& key, const T& value) {
  ByteVector bytes;
  externalize(bytes, value, true);
  setDarkProperty(key, bytes);
}

template <typename T>
std::shared_ptr<T> MetadataRoot::getDarkProperty(const KLVKey& key) const {
  const DarkValue& value = darkValue(key);
  check(std::holds_alternative<std::shared_ptr<MetadataRoot>>(value), "property is a reference value");
  std::shared_ptr<T> object = std::dynamic_pointer_cast<T>(std::get<std::shared_ptr<MetadataRoot>>(value));
  check(object != nullptr, "property is a T reference value");
  return object;
}

// The base of the structural classes: adds the optional generation
// identifier.
class ZELTA_EXPORT MetadataObject : public MetadataRoot {
public:
  MetadataObject();
  ~MetadataObject() override;

  static std::shared_ptr<MetadataObject> create();

  const MXFUID& getGenerationUID() const;
  void setGenerationUID(const MXFUID& generationUID) { generationUID_ = generationUID; }
  bool hasGenerationUID() const { return generationUID_.has_value(); }
  void removeGenerationUID() { generationUID_.reset(); }

private:
  std::optional<MXFUID> generationUID_;
};

// ---------------------------------------------------------------------------
// Pending references
//
// A reference that has been read but whose target has not arrived yet. The
// parser keeps them under the target's identifier and resolves each when
// the target comes.

class ZELTA_EXPORT dangling_ref_base {
public:
  virtual ~dangling_ref_base();
  virtual bool isStrong() = 0;
  virtual void resolve(const std::shared_ptr<MetadataRoot>& target) = 0;
};

// A single-valued property, set through the owner's setter.
template <typename Owner, typename Value>
class ZELTA_EXPORT dangling_ref_t : public dangling_ref_base {
public:
  typedef void (Owner::*setter_type)(const std::shared_ptr<Value>&);

  dangling_ref_t(const std::shared_ptr<Owner>& owner, setter_type setter, bool strong)
      : owner_(owner), setter_(setter), strong_(strong) {}

  bool isStrong() override { return strong_; }
  void resolve(const std::shared_ptr<MetadataRoot>& target) override {
    std::shared_ptr<Value> value = std::dynamic_pointer_cast<Value>(target);
    check(value != nullptr, "object is value type");
    ((*owner_).*setter_)(value);
  }

private:
  std::shared_ptr<Owner> owner_;
  setter_type setter_;
  bool strong_;
};

// One element of a reference vector. It goes in behind the elements before
// it that are in already, so that the vector keeps the order of the
// identifiers whatever the order in which the targets arrive.
template <typename Owner, typename Value>
class ZELTA_EXPORT dangling_vector_ref_t : public dangling_ref_base {
public:
  typedef void (Owner::*inserter_type)(std::size_t, const std::shared_ptr<Value>&);

  dangling_vector_ref_t(const std::shared_ptr<Owner>& owner, inserter_type inserter,
                        const std::shared_ptr<dangling_vector_ref_t>& previous, bool strong)
      : owner_(owner), inserter_(inserter), previous_(previous), strong_(strong) {}
  // Unlinks the chain one by one, so that a long vector does not recurse.
  ~dangling_vector_ref_t() override {
    std::shared_ptr<dangling_vector_ref_t> link = std::move(previous_);
    while (link && link.use_count() == 1) link = std::move(link->previous_);
  }

  bool isStrong() override { return strong_; }
  void resolve(const std::shared_ptr<MetadataRoot>& target) override {
    check(!resolved_, "is still dangling");
    std::shared_ptr<Value> value = std::dynamic_pointer_cast<Value>(target);
    check(value != nullptr, "object is value type");
    std::size_t index = 0;
    for (const dangling_vector_ref_t* link = previous_.get(); link; link = link->previous_.get())
      if (link->resolved_) ++index;
    ((*owner_).*inserter_)(index, value);
    resolved_ = true;
  }

private:
  std::shared_ptr<Owner> owner_;
  inserter_type inserter_;
  std::shared_ptr<dangling_vector_ref_t> previous_;
  bool strong_;
  bool resolved_ = false;
};

// A dark property declared to be a reference: the object replaces the
// identifier octets under the key. Always strong.
template <typename Owner>
class ZELTA_EXPORT dangling_dark_ref_t : public dangling_ref_base {
public:
  dangling_dark_ref_t(const std::shared_ptr<Owner>& owner, const KLVKey& key) : owner_(owner), key_(key) {}

  bool isStrong() override { return true; }
  void resolve(const std::shared_ptr<MetadataRoot>& target) override {
    check(target != nullptr, "object is value type");
    owner_->template setDarkProperty<MetadataRoot>(key_, target);
  }

private:
  std::shared_ptr<Owner> owner_;
  KLVKey key_;
};

// ---------------------------------------------------------------------------
// Factories and model coding
//
// Each class has a factory that turns a primed set into an object and back;
// a composite factory finds the right one. The model parser connects the
// objects that the sets make, in whatever order they come, and the model
// coder walks the tree into a primer and primed sets.

// Reports of the model family.
inline constexpr MXFUID unrecognizedMetadataId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x01);
inline constexpr MXFUID missingPropertyId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x02);
inline constexpr MXFUID invalidPropertyValueId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x03);
inline constexpr MXFUID duplicateInstanceUIDId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x04);
inline constexpr MXFUID objectAlreadyOwnedId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x05);
inline constexpr MXFUID invalidReferenceId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x06);
inline constexpr MXFUID backwardStrongReferenceId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x07);
inline constexpr MXFUID unreferencedObjectsId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x08);
inline constexpr MXFUID danglingReferencesId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x09);
inline constexpr MXFUID firstObjectNotRootId = ZeltaErrorId(0x4C, 0x4F, 0x00, 0x0A);

inline constexpr KLVKey MXFInstanceUIDKey{
    std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, 0x01, 0x01, 0x01, 0x15, 0x02, 0x00, 0x00,
                                 0x00, 0x00}};
// An in-memory property of the root: the instance identifiers of the sets
// that are to be written last, in this order.
inline constexpr KLVKey MXFPrimedSetOrderKey{
    std::array<std::uint8_t, 16>{0x9C, 0xEF, 0x38, 0xE7, 0xD8, 0x04, 0x25, 0xC1, 0xC3, 0xD2, 0x00, 0x02, 0x9C, 0xAD,
                                 0x11, 0xE0}};

typedef std::map<KLVKey, ByteVector> MXFPropertyMap;
// Pending references under the identifiers of their targets.
typedef std::multimap<MXFUID, std::shared_ptr<dangling_ref_base>> MXFPendingReferences;
// The objects that a set owns, in the order in which they were met.
typedef std::list<std::shared_ptr<const MetadataRoot>> MXFReferencedObjects;
typedef std::vector<std::shared_ptr<MetadataRoot>> MXFMetadataModel;

struct ZELTA_EXPORT MXFParsedObject {
  std::shared_ptr<MetadataRoot> object;
  MXFPendingReferences references;
};

struct ZELTA_EXPORT MXFCodedObject {
  MXFPrimedSet set;
  MXFReferencedObjects referenced;
};

// The name and kind of each property of a class chain, by key; told under
// "Property descriptions" at the end.
struct MXFPropertyDescription;
typedef std::map<KLVKey, MXFPropertyDescription> MXFPropertyDescriptions;

class ZELTA_EXPORT MXFMetadataFactory {
public:
  virtual ~MXFMetadataFactory();
  virtual void setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) = 0;
  virtual bool canParse(const KLVKey& setKey) = 0;
  virtual MXFParsedObject parse(const MXFPrimedSet& set) = 0;
  virtual const std::type_info& getType(const KLVKey& setKey) = 0;
  virtual bool canCode(const std::type_info& type) = 0;
  virtual MXFCodedObject code(const std::shared_ptr<const MetadataRoot>& object) = 0;
  virtual const MXFKeyToTagMap& getSetPrimer(const std::type_info& type) = 0;
  virtual const KLVKey& getSetKey(const std::type_info& type) = 0;
};

// The factory of one class. A class's factory derives from its base class's
// factory; each constructor adds its class's own properties to the set
// primer, which thus holds the whole class chain. A tag of 0 there means
// that the key gets a dynamic tag when coded.
class ZELTA_EXPORT MetadataRootFactory : public MXFMetadataFactory {
public:
  MetadataRootFactory();
  ~MetadataRootFactory() override;

  void setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) override;
  bool canParse(const KLVKey& setKey) override;
  MXFParsedObject parse(const MXFPrimedSet& set) override;
  const std::type_info& getType(const KLVKey& setKey) override;
  bool canCode(const std::type_info& type) override;
  MXFCodedObject code(const std::shared_ptr<const MetadataRoot>& object) override;
  const MXFKeyToTagMap& getSetPrimer(const std::type_info& type) override;
  const KLVKey& getSetKey(const std::type_info& type) override;

  virtual std::shared_ptr<MetadataRoot> create() const = 0;
  virtual const std::type_info& getType() const = 0;
  virtual const KLVKey& getSetKey() const = 0;
  // The class's own properties, then its base's, down to the instance
  // identifier and the dark properties.
  virtual void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                               MXFPendingReferences& references) const;
  // The base's properties first, then the class's own.
  virtual void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                              MXFReferencedObjects& referenced) const;
  // Whether the set may come with BER item lengths (0x13 in key octet 5).
  virtual bool allowBERLengths() const;

  MXFKeyToTagMap& getSetPrimer() { return setPrimer_; }
  const MXFKeyToTagMap& getSetPrimer() const { return setPrimer_; }
  // Null when the handler has gone.
  std::shared_ptr<ErrorHandler> getErrorHandler() const { return errorHandler_.lock(); }

  // Reports that raise nothing; the parse goes on.
  void firePropertyRequiredError(const std::string& name) const;
  void firePropertyInternalizeError(const std::string& name, const util::assertion_failure& exception) const;

  // What the set primer holds, named: every property of the class chain,
  // the instance identifier among them. The class name is the most derived
  // class's, "MetadataRoot" at the root.
  const MXFPropertyDescriptions& getPropertyDescriptions() const { return descriptions_; }
  const std::string& getClassName() const { return className_; }

protected:
  // For the constructors, which fill both beside the set primer.
  MXFPropertyDescriptions& describedProperties() { return descriptions_; }
  void setClassName(const std::string& className) { className_ = className; }

private:
  MXFKeyToTagMap setPrimer_;
  std::weak_ptr<ErrorHandler> errorHandler_;
  MXFPropertyDescriptions descriptions_;
  std::string className_;
};

// The factory of a class C whose base class's factory is Base. Its
// properties are a table beside the class, so that a concrete factory is
// one line: class SequenceFactory : public MetadataClassFactory<Sequence,
// SegmentFactory> {}. The constructor enters the class's own properties
// into the set primer, behind those of Base.
template <typename C, typename Base>
class ZELTA_EXPORT MetadataClassFactory : public Base {
public:
  MetadataClassFactory();
  ~MetadataClassFactory() override;

  std::shared_ptr<MetadataRoot> create() const override { return C::create(); }
  const std::type_info& getType() const override { return typeid(C); }
  const KLVKey& getSetKey() const override;
  void parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                       MXFPendingReferences& references) const override;
  void codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) const override;
};

class MetadataObjectFactory : public MetadataClassFactory<MetadataObject, MetadataRootFactory> {};

// A composite: asks its sub-factories in order and remembers who answered,
// by set key and by type.
class ZELTA_EXPORT MXFMetadataModelFactory : public MXFMetadataFactory {
public:
  typedef std::vector<std::shared_ptr<MXFMetadataFactory>> Factories;

  MXFMetadataModelFactory();
  ~MXFMetadataModelFactory() override;

  void setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) override;
  bool canParse(const KLVKey& setKey) override;
  MXFParsedObject parse(const MXFPrimedSet& set) override;
  const std::type_info& getType(const KLVKey& setKey) override;
  bool canCode(const std::type_info& type) override;
  MXFCodedObject code(const std::shared_ptr<const MetadataRoot>& object) override;
  const MXFKeyToTagMap& getSetPrimer(const std::type_info& type) override;
  const KLVKey& getSetKey(const std::type_info& type) override;

  virtual const Factories& getFactories() = 0;
  // Whether a dark property of sets of this key holds an object reference;
  // none does unless a subclass says so.
  virtual bool isReferenceDarkProperty(const KLVKey& setKey, const KLVKey& propertyKey);

  void fireReferenceDarkPropertyInternalizeError(const KLVKey& key, const util::assertion_failure& exception) const;

private:
  MXFMetadataFactory& byType(const std::type_info& type);
  void declareDarkReferences(const KLVKey& setKey, MXFParsedObject& parsed);

  std::map<KLVKey, std::shared_ptr<MXFMetadataFactory>> keyCache_;
  std::map<std::string, std::shared_ptr<MXFMetadataFactory>> typeCache_;
  std::weak_ptr<ErrorHandler> errorHandler_;
};

// Whole models: the root first, then objects that nothing owns.
class ZELTA_EXPORT MXFMetadataModelHandler {
public:
  virtual ~MXFMetadataModelHandler();
  virtual void start() = 0;
  virtual void end() = 0;
  virtual void model(const MXFMetadataModel& objects) = 0;
};

// Makes objects of primed sets and connects them in one sweep, each
// reference as soon as both ends are there.
class ZELTA_EXPORT MXFMetadataModelParser : public MXFMetadataHandler {
public:
  MXFMetadataModelParser(MXFMetadataModelHandler* handler, const std::shared_ptr<MXFMetadataFactory>& factory);
  MXFMetadataModelParser(const MXFMetadataModelParser&) = delete;
  MXFMetadataModelParser& operator=(const MXFMetadataModelParser&) = delete;

  void start() override;
  void end() override;
  void primer(const MXFPrimerEntries& entries) override;
  bool acceptSet(const KLVKey& key) override;
  void primedSet(const MXFPrimedSet& set) override;
  // Reports vanish without one.
  virtual void setErrorHandler(ErrorHandler* errorHandler);

private:
  bool connect(const std::shared_ptr<dangling_ref_base>& reference, const MXFUID& target, bool backward);

  MXFMetadataModel roots_;
  MXFPendingReferences pending_;
  std::map<MXFUID, std::shared_ptr<MetadataRoot>> instances_;
  MXFMetadataModelHandler* handler_;
  std::shared_ptr<MXFMetadataFactory> factory_;
  ErrorHandler* errorHandler_ = nullptr;
};

// Walks a model depth-first into a primer and primed sets: static tags from
// the classes, dynamic ones from 0x8000 for the rest.
class ZELTA_EXPORT MXFMetadataModelCoder : public MXFMetadataModelHandler {
public:
  MXFMetadataModelCoder(MXFMetadataHandler* handler, const std::shared_ptr<MXFMetadataFactory>& factory);

  void start() override;
  void end() override;
  void model(const MXFMetadataModel& objects) override;

private:
  MXFMetadataHandler* handler_;
  std::shared_ptr<MXFMetadataFactory> factory_;
};

// ---------------------------------------------------------------------------
// Structural metadata classes
//
// The header metadata of a file: the Preface with its Identifications, the
// ContentStorage, the packages with their tracks and components. A
// required value always has one, at worst its default; the getter of an
// optional one checks that it is present. Reference vectors own their
// elements; the count of an unset optional vector is 0.

class Identification;
class ContentStorage;
class EssenceContainerData;
class GenericPackage;
class Track;
class Component;
class Segment;
class SourceReference;
class DescriptiveMetadataFramework;
class GenericDescriptor;

class ZELTA_EXPORT Preface : public MetadataObject {
public:
  // lastModifiedDate the present UTC time, version 0x0102.
  Preface();
  ~Preface() override;

  static std::shared_ptr<Preface> create();

  const MXFTimestamp& getLastModifiedDate() const { return lastModifiedDate_; }
  void setLastModifiedDate(const MXFTimestamp& lastModifiedDate) { lastModifiedDate_ = lastModifiedDate; }
  const std::uint16_t& getVersion() const { return version_; }
  void setVersion(const std::uint16_t& version) { version_ = version; }
  const std::uint32_t& getObjectModelVersion() const;
  void setObjectModelVersion(const std::uint32_t& objectModelVersion) { objectModelVersion_ = objectModelVersion; }
  bool hasObjectModelVersion() const { return objectModelVersion_.has_value(); }
  void removeObjectModelVersion() { objectModelVersion_.reset(); }

  // The one property that does not own: null once the package has gone.
  std::shared_ptr<GenericPackage> getPrimaryPackage();
  std::shared_ptr<const GenericPackage> getPrimaryPackage() const;
  void setPrimaryPackage(const std::shared_ptr<GenericPackage>& primaryPackage);
  bool hasPrimaryPackage() const { return hasPrimaryPackage_; }
  void removePrimaryPackage();

  std::size_t getIdentificationCount() const { return identifications_.size(); }
  std::shared_ptr<Identification> getIdentificationAt(std::size_t index);
  std::shared_ptr<const Identification> getIdentificationAt(std::size_t index) const;
  void addIdentification(const std::shared_ptr<Identification>& identification);
  void insertIdentificationAt(std::size_t index, const std::shared_ptr<Identification>& identification);
  void removeIdentificationAt(std::size_t index);

  std::shared_ptr<ContentStorage> getContentStorage();
  std::shared_ptr<const ContentStorage> getContentStorage() const;
  void setContentStorage(const std::shared_ptr<ContentStorage>& contentStorage);

  const KLVKey& getOperationalPattern() const { return operationalPattern_; }
  void setOperationalPattern(const KLVKey& operationalPattern) { operationalPattern_ = operationalPattern; }
  const std::vector<KLVKey>& getEssenceContainers() const { return essenceContainers_; }
  void setEssenceContainers(const std::vector<KLVKey>& essenceContainers) { essenceContainers_ = essenceContainers; }
  const std::vector<KLVKey>& getDMSchemes() const { return dmSchemes_; }
  void setDMSchemes(const std::vector<KLVKey>& dmSchemes) { dmSchemes_ = dmSchemes; }

private:
  MXFTimestamp lastModifiedDate_;
  std::uint16_t version_;
  std::optional<std::uint32_t> objectModelVersion_;
  std::weak_ptr<GenericPackage> primaryPackage_;
  bool hasPrimaryPackage_ = false;
  std::vector<std::shared_ptr<Identification>> identifications_;
  std::shared_ptr<ContentStorage> contentStorage_;
  KLVKey operationalPattern_;
  std::vector<KLVKey> essenceContainers_;
  std::vector<KLVKey> dmSchemes_;
};

class ZELTA_EXPORT Identification : public MetadataObject {
public:
  // thisGenerationUID from uuid_generate, modificationDate the present UTC
  // time.
  Identification();
  ~Identification() override;

  static std::shared_ptr<Identification> create();

  const MXFUID& getThisGenerationUID() const { return thisGenerationUID_; }
  void setThisGenerationUID(const MXFUID& thisGenerationUID) { thisGenerationUID_ = thisGenerationUID; }
  const std::wstring& getCompanyName() const { return companyName_; }
  void setCompanyName(const std::wstring& companyName) { companyName_ = companyName; }
  const std::wstring& getProductName() const { return productName_; }
  void setProductName(const std::wstring& productName) { productName_ = productName; }
  const MXFProductVersion& getProductVersion() const;
  void setProductVersion(const MXFProductVersion& productVersion) { productVersion_ = productVersion; }
  bool hasProductVersion() const { return productVersion_.has_value(); }
  void removeProductVersion() { productVersion_.reset(); }
  const std::wstring& getVersionString() const { return versionString_; }
  void setVersionString(const std::wstring& versionString) { versionString_ = versionString; }
  const MXFUID& getProductUID() const { return productUID_; }
  void setProductUID(const MXFUID& productUID) { productUID_ = productUID; }
  const MXFTimestamp& getModificationDate() const { return modificationDate_; }
  void setModificationDate(const MXFTimestamp& modificationDate) { modificationDate_ = modificationDate; }
  const MXFProductVersion& getToolkitVersion() const;
  void setToolkitVersion(const MXFProductVersion& toolkitVersion) { toolkitVersion_ = toolkitVersion; }
  bool hasToolkitVersion() const { return toolkitVersion_.has_value(); }
  void removeToolkitVersion() { toolkitVersion_.reset(); }
  const std::wstring& getPlatform() const;
  void setPlatform(const std::wstring& platform) { platform_ = platform; }
  bool hasPlatform() const { return platform_.has_value(); }
  void removePlatform() { platform_.reset(); }

private:
  MXFUID thisGenerationUID_;
  std::wstring companyName_;
  std::wstring productName_;
  std::optional<MXFProductVersion> productVersion_;
  std::wstring versionString_;
  MXFUID productUID_;
  MXFTimestamp modificationDate_;
  std::optional<MXFProductVersion> toolkitVersion_;
  std::optional<std::wstring> platform_;
};

class ZELTA_EXPORT ContentStorage : public MetadataObject {
public:
  ContentStorage();
  ~ContentStorage() override;

  static std::shared_ptr<ContentStorage> create();

  std::size_t getPackageCount() const { return packages_.size(); }
  std::shared_ptr<GenericPackage> getPackageAt(std::size_t index);
  std::shared_ptr<const GenericPackage> getPackageAt(std::size_t index) const;
  void addPackage(const std::shared_ptr<GenericPackage>& package);
  void insertPackageAt(std::size_t index, const std::shared_ptr<GenericPackage>& package);
  void removePackageAt(std::size_t index);

  std::size_t getEssenceContainerDataCount() const { return essenceContainerData_.size(); }
  std::shared_ptr<EssenceContainerData> getEssenceContainerDataAt(std::size_t index);
  std::shared_ptr<const EssenceContainerData> getEssenceContainerDataAt(std::size_t index) const;
  void addEssenceContainerData(const std::shared_ptr<EssenceContainerData>& essenceContainerData);
  void insertEssenceContainerDataAt(std::size_t index,
                                    const std::shared_ptr<EssenceContainerData>& essenceContainerData);
  void removeEssenceContainerDataAt(std::size_t index);
  bool hasEssenceContainerData() const { return hasEssenceContainerData_; }
  // Drops the elements without releasing them.
  void removeEssenceContainerData();

private:
  std::vector<std::shared_ptr<GenericPackage>> packages_;
  std::vector<std::shared_ptr<EssenceContainerData>> essenceContainerData_;
  bool hasEssenceContainerData_ = false;
};

class ZELTA_EXPORT EssenceContainerData : public MetadataObject {
public:
  EssenceContainerData();
  ~EssenceContainerData() override;

  static std::shared_ptr<EssenceContainerData> create();

  // Binds by package identifier, not by reference.
  const UMID& getLinkedPackageUID() const { return linkedPackageUID_; }
  void setLinkedPackageUID(const UMID& linkedPackageUID) { linkedPackageUID_ = linkedPackageUID; }
  const std::uint32_t& getIndexSID() const;
  void setIndexSID(const std::uint32_t& indexSID) { indexSID_ = indexSID; }
  bool hasIndexSID() const { return indexSID_.has_value(); }
  void removeIndexSID() { indexSID_.reset(); }
  const std::uint32_t& getBodySID() const { return bodySID_; }
  void setBodySID(const std::uint32_t& bodySID) { bodySID_ = bodySID; }

private:
  UMID linkedPackageUID_;
  std::optional<std::uint32_t> indexSID_;
  std::uint32_t bodySID_ = 0;
};

class ZELTA_EXPORT GenericPackage : public MetadataObject {
public:
  // Both dates the present UTC time, and a new packageUID.
  GenericPackage();
  ~GenericPackage() override;

  static std::shared_ptr<GenericPackage> create();

  const UMID& getPackageUID() const { return packageUID_; }
  void setPackageUID(const UMID& packageUID) { packageUID_ = packageUID; }
  const std::wstring& getName() const;
  void setName(const std::wstring& name) { name_ = name; }
  bool hasName() const { return name_.has_value(); }
  void removeName() { name_.reset(); }
  const MXFTimestamp& getPackageCreationDate() const { return packageCreationDate_; }
  void setPackageCreationDate(const MXFTimestamp& packageCreationDate) { packageCreationDate_ = packageCreationDate; }
  const MXFTimestamp& getPackageModifiedDate() const { return packageModifiedDate_; }
  void setPackageModifiedDate(const MXFTimestamp& packageModifiedDate) { packageModifiedDate_ = packageModifiedDate; }

  std::size_t getTrackCount() const { return tracks_.size(); }
  std::shared_ptr<Track> getTrackAt(std::size_t index);
  std::shared_ptr<const Track> getTrackAt(std::size_t index) const;
  void addTrack(const std::shared_ptr<Track>& track);
  void insertTrackAt(std::size_t index, const std::shared_ptr<Track>& track);
  void removeTrackAt(std::size_t index);

private:
  UMID packageUID_;
  std::optional<std::wstring> name_;
  MXFTimestamp packageCreationDate_;
  MXFTimestamp packageModifiedDate_;
  std::vector<std::shared_ptr<Track>> tracks_;
};

class ZELTA_EXPORT MaterialPackage : public GenericPackage {
public:
  MaterialPackage();
  ~MaterialPackage() override;

  static std::shared_ptr<MaterialPackage> create();
};

class ZELTA_EXPORT SourcePackage : public GenericPackage {
public:
  SourcePackage();
  ~SourcePackage() override;

  static std::shared_ptr<SourcePackage> create();

  std::shared_ptr<GenericDescriptor> getDescriptor();
  std::shared_ptr<const GenericDescriptor> getDescriptor() const;
  void setDescriptor(const std::shared_ptr<GenericDescriptor>& descriptor);

private:
  std::shared_ptr<GenericDescriptor> descriptor_;
};

class ZELTA_EXPORT Track : public MetadataObject {
public:
  Track();
  ~Track() override;

  static std::shared_ptr<Track> create();

  const std::uint32_t& getTrackID() const { return trackID_; }
  void setTrackID(const std::uint32_t& trackID) { trackID_ = trackID; }
  const std::uint32_t& getTrackNumber() const;
  void setTrackNumber(const std::uint32_t& trackNumber) { trackNumber_ = trackNumber; }
  bool hasTrackNumber() const { return trackNumber_.has_value(); }
  void removeTrackNumber() { trackNumber_.reset(); }
  const std::wstring& getTrackName() const;
  void setTrackName(const std::wstring& trackName) { trackName_ = trackName; }
  bool hasTrackName() const { return trackName_.has_value(); }
  void removeTrackName() { trackName_.reset(); }

  std::shared_ptr<Segment> getSegment();
  std::shared_ptr<const Segment> getSegment() const;
  void setSegment(const std::shared_ptr<Segment>& segment);

private:
  std::uint32_t trackID_ = 0;
  std::optional<std::uint32_t> trackNumber_;
  std::optional<std::wstring> trackName_;
  std::shared_ptr<Segment> segment_;
};

class ZELTA_EXPORT TimelineTrack : public Track {
public:
  TimelineTrack();
  ~TimelineTrack() override;

  static std::shared_ptr<TimelineTrack> create();

  const MXFRational& getEditRate() const { return editRate_; }
  void setEditRate(const MXFRational& editRate) { editRate_ = editRate; }
  const std::int64_t& getOrigin() const { return origin_; }
  void setOrigin(const std::int64_t& origin) { origin_ = origin; }

private:
  MXFRational editRate_;
  std::int64_t origin_ = 0;
};

class ZELTA_EXPORT EventTrack : public Track {
public:
  EventTrack();
  ~EventTrack() override;

  static std::shared_ptr<EventTrack> create();

  const MXFRational& getEditRate() const { return editRate_; }
  void setEditRate(const MXFRational& editRate) { editRate_ = editRate; }
  const std::int64_t& getOrigin() const;
  void setOrigin(const std::int64_t& origin) { origin_ = origin; }
  bool hasOrigin() const { return origin_.has_value(); }
  void removeOrigin() { origin_.reset(); }

private:
  MXFRational editRate_;
  std::optional<std::int64_t> origin_;
};

class ZELTA_EXPORT StaticTrack : public Track {
public:
  StaticTrack();
  ~StaticTrack() override;

  static std::shared_ptr<StaticTrack> create();
};

class ZELTA_EXPORT Component : public MetadataObject {
public:
  Component();
  ~Component() override;

  static std::shared_ptr<Component> create();

  const KLVKey& getDataDefinition() const { return dataDefinition_; }
  void setDataDefinition(const KLVKey& dataDefinition) { dataDefinition_ = dataDefinition; }
  const std::int64_t& getDuration() const;
  void setDuration(const std::int64_t& duration) { duration_ = duration; }
  bool hasDuration() const { return duration_.has_value(); }
  void removeDuration() { duration_.reset(); }

private:
  KLVKey dataDefinition_;
  std::optional<std::int64_t> duration_;
};

class ZELTA_EXPORT Segment : public Component {
public:
  Segment();
  ~Segment() override;

  static std::shared_ptr<Segment> create();
};

class ZELTA_EXPORT Sequence : public Segment {
public:
  Sequence();
  ~Sequence() override;

  static std::shared_ptr<Sequence> create();

  std::size_t getComponentCount() const { return components_.size(); }
  std::shared_ptr<Component> getComponentAt(std::size_t index);
  std::shared_ptr<const Component> getComponentAt(std::size_t index) const;
  void addComponent(const std::shared_ptr<Component>& component);
  void insertComponentAt(std::size_t index, const std::shared_ptr<Component>& component);
  void removeComponentAt(std::size_t index);

private:
  std::vector<std::shared_ptr<Component>> components_;
};

class ZELTA_EXPORT SourceReference : public Segment {
public:
  SourceReference();
  ~SourceReference() override;

  static std::shared_ptr<SourceReference> create();

  // Binds by package identifier, not by reference.
  const UMID& getSourcePackageID() const { return sourcePackageID_; }
  void setSourcePackageID(const UMID& sourcePackageID) { sourcePackageID_ = sourcePackageID; }
  const std::uint32_t& getSourceTrackID() const { return sourceTrackID_; }
  void setSourceTrackID(const std::uint32_t& sourceTrackID) { sourceTrackID_ = sourceTrackID; }

private:
  UMID sourcePackageID_;
  std::uint32_t sourceTrackID_ = 0;
};

class ZELTA_EXPORT SourceClip : public SourceReference {
public:
  SourceClip();
  ~SourceClip() override;

  static std::shared_ptr<SourceClip> create();

  const std::int64_t& getStartPosition() const { return startPosition_; }
  void setStartPosition(const std::int64_t& startPosition) { startPosition_ = startPosition; }

private:
  std::int64_t startPosition_ = 0;
};

class ZELTA_EXPORT DMSourceClip : public SourceClip {
public:
  DMSourceClip();
  ~DMSourceClip() override;

  static std::shared_ptr<DMSourceClip> create();

  const std::vector<std::uint32_t>& getTargetTrackIDs() const;
  void setTargetTrackIDs(const std::vector<std::uint32_t>& targetTrackIDs) { targetTrackIDs_ = targetTrackIDs; }
  bool hasTargetTrackIDs() const { return targetTrackIDs_.has_value(); }
  void removeTargetTrackIDs() { targetTrackIDs_.reset(); }

private:
  std::optional<std::vector<std::uint32_t>> targetTrackIDs_;
};

class ZELTA_EXPORT TimecodeComponent : public Segment {
public:
  TimecodeComponent();
  ~TimecodeComponent() override;

  static std::shared_ptr<TimecodeComponent> create();

  const std::int64_t& getStartTimecode() const { return startTimecode_; }
  void setStartTimecode(const std::int64_t& startTimecode) { startTimecode_ = startTimecode; }
  const std::uint16_t& getRoundedTimecodeBase() const { return roundedTimecodeBase_; }
  void setRoundedTimecodeBase(const std::uint16_t& roundedTimecodeBase) { roundedTimecodeBase_ = roundedTimecodeBase; }
  const bool& getDropFrame() const { return dropFrame_; }
  void setDropFrame(const bool& dropFrame) { dropFrame_ = dropFrame; }

private:
  std::int64_t startTimecode_ = 0;
  std::uint16_t roundedTimecodeBase_ = 0;
  bool dropFrame_ = false;
};

class ZELTA_EXPORT Event : public Segment {
public:
  Event();
  ~Event() override;

  static std::shared_ptr<Event> create();

  const std::int64_t& getPosition() const;
  void setPosition(const std::int64_t& position) { position_ = position; }
  bool hasPosition() const { return position_.has_value(); }
  void removePosition() { position_.reset(); }
  const std::wstring& getComment() const;
  void setComment(const std::wstring& comment) { comment_ = comment; }
  bool hasComment() const { return comment_.has_value(); }
  void removeComment() { comment_.reset(); }

private:
  std::optional<std::int64_t> position_;
  std::optional<std::wstring> comment_;
};

class ZELTA_EXPORT CommentMarker : public Event {
public:
  CommentMarker();
  ~CommentMarker() override;

  static std::shared_ptr<CommentMarker> create();

  std::shared_ptr<SourceReference> getAnnotation();
  std::shared_ptr<const SourceReference> getAnnotation() const;
  void setAnnotation(const std::shared_ptr<SourceReference>& annotation);
  bool hasAnnotation() const { return annotation_ != nullptr; }
  // Drops the object without releasing it.
  void removeAnnotation() { annotation_.reset(); }

private:
  std::shared_ptr<SourceReference> annotation_;
};

class ZELTA_EXPORT DMSegment : public CommentMarker {
public:
  DMSegment();
  ~DMSegment() override;

  static std::shared_ptr<DMSegment> create();

  const std::vector<std::uint32_t>& getTargetTrackIDs() const;
  void setTargetTrackIDs(const std::vector<std::uint32_t>& targetTrackIDs) { targetTrackIDs_ = targetTrackIDs; }
  bool hasTargetTrackIDs() const { return targetTrackIDs_.has_value(); }
  void removeTargetTrackIDs() { targetTrackIDs_.reset(); }

  std::shared_ptr<DescriptiveMetadataFramework> getDMFramework();
  std::shared_ptr<const DescriptiveMetadataFramework> getDMFramework() const;
  void setDMFramework(const std::shared_ptr<DescriptiveMetadataFramework>& dmFramework);
  bool hasDMFramework() const { return dmFramework_ != nullptr; }
  // Drops the object without releasing it.
  void removeDMFramework() { dmFramework_.reset(); }

private:
  std::optional<std::vector<std::uint32_t>> targetTrackIDs_;
  std::shared_ptr<DescriptiveMetadataFramework> dmFramework_;
};

// The bases of the descriptive metadata schemes.
class ZELTA_EXPORT DescriptiveMetadataFramework : public MetadataObject {
public:
  DescriptiveMetadataFramework();
  ~DescriptiveMetadataFramework() override;

  static std::shared_ptr<DescriptiveMetadataFramework> create();
};

class ZELTA_EXPORT DescriptiveMetadataObject : public MetadataObject {
public:
  DescriptiveMetadataObject();
  ~DescriptiveMetadataObject() override;

  static std::shared_ptr<DescriptiveMetadataObject> create();
};

// Their factories. Those of Component, Segment, GenericPackage, Track and the
// two descriptive bases serve as bases only: no composite registers them.
class PrefaceFactory : public MetadataClassFactory<Preface, MetadataObjectFactory> {};
class IdentificationFactory : public MetadataClassFactory<Identification, MetadataObjectFactory> {};
class ContentStorageFactory : public MetadataClassFactory<ContentStorage, MetadataObjectFactory> {};
class EssenceContainerDataFactory : public MetadataClassFactory<EssenceContainerData, MetadataObjectFactory> {};
class GenericPackageFactory : public MetadataClassFactory<GenericPackage, MetadataObjectFactory> {};
class MaterialPackageFactory : public MetadataClassFactory<MaterialPackage, GenericPackageFactory> {};
class SourcePackageFactory : public MetadataClassFactory<SourcePackage, GenericPackageFactory> {};
class TrackFactory : public MetadataClassFactory<Track, MetadataObjectFactory> {};
class TimelineTrackFactory : public MetadataClassFactory<TimelineTrack, TrackFactory> {};
class EventTrackFactory : public MetadataClassFactory<EventTrack, TrackFactory> {};
class StaticTrackFactory : public MetadataClassFactory<StaticTrack, TrackFactory> {};
class ComponentFactory : public MetadataClassFactory<Component, MetadataObjectFactory> {};
class SegmentFactory : public MetadataClassFactory<Segment, ComponentFactory> {};
class SequenceFactory : public MetadataClassFactory<Sequence, SegmentFactory> {};
class SourceReferenceFactory : public MetadataClassFactory<SourceReference, SegmentFactory> {};
class SourceClipFactory : public MetadataClassFactory<SourceClip, SourceReferenceFactory> {};
class DMSourceClipFactory : public MetadataClassFactory<DMSourceClip, SourceClipFactory> {};
class TimecodeComponentFactory : public MetadataClassFactory<TimecodeComponent, SegmentFactory> {};
class EventFactory : public MetadataClassFactory<Event, SegmentFactory> {};
class CommentMarkerFactory : public MetadataClassFactory<CommentMarker, EventFactory> {};
class DMSegmentFactory : public MetadataClassFactory<DMSegment, CommentMarkerFactory> {};
class DescriptiveMetadataFrameworkFactory
    : public MetadataClassFactory<DescriptiveMetadataFramework, MetadataObjectFactory> {};
class DescriptiveMetadataObjectFactory
    : public MetadataClassFactory<DescriptiveMetadataObject, MetadataObjectFactory> {};

// ---------------------------------------------------------------------------
// Locators and descriptors

// Where essence outside the file is to be found.
class ZELTA_EXPORT GenericLocator : public MetadataObject {
public:
  GenericLocator();
  ~GenericLocator() override;

  static std::shared_ptr<GenericLocator> create();
};

class ZELTA_EXPORT NetworkLocator : public GenericLocator {
public:
  NetworkLocator();
  ~NetworkLocator() override;

  static std::shared_ptr<NetworkLocator> create();

  const std::wstring& getURLString() const { return urlString_; }
  void setURLString(const std::wstring& urlString) { urlString_ = urlString; }

private:
  std::wstring urlString_;
};

class ZELTA_EXPORT TextLocator : public GenericLocator {
public:
  TextLocator();
  ~TextLocator() override;

  static std::shared_ptr<TextLocator> create();

  const std::wstring& getLocatorName() const { return locatorName_; }
  void setLocatorName(const std::wstring& locatorName) { locatorName_ = locatorName; }

private:
  std::wstring locatorName_;
};

class GenericLocatorFactory : public MetadataClassFactory<GenericLocator, MetadataObjectFactory> {};
class NetworkLocatorFactory : public MetadataClassFactory<NetworkLocator, GenericLocatorFactory> {};
class TextLocatorFactory : public MetadataClassFactory<TextLocator, GenericLocatorFactory> {};

// Eight pairs of a component code and its depth in bits, kept as they stand
// in the file: exactly 16 octets.
struct ZELTA_EXPORT RGBALayout {
  struct Component {
    std::uint8_t code = 0;
    std::uint8_t depth = 0;
    bool operator==(const Component& o) const { return code == o.code && depth == o.depth; }
    bool operator!=(const Component& o) const { return !(*this == o); }
  };

  std::array<Component, 8> components{};
  bool operator==(const RGBALayout& o) const { return components == o.components; }
  bool operator!=(const RGBALayout& o) const { return !(*this == o); }
};

// A further description that hangs under a descriptor.
class ZELTA_EXPORT SubDescriptor : public MetadataObject {
public:
  SubDescriptor();
  ~SubDescriptor() override;

  static std::shared_ptr<SubDescriptor> create();
};

class ZELTA_EXPORT ContainerConstraintsSubDescriptor : public SubDescriptor {
public:
  ContainerConstraintsSubDescriptor();
  ~ContainerConstraintsSubDescriptor() override;

  static std::shared_ptr<ContainerConstraintsSubDescriptor> create();
};

// The base of the essence descriptors: locators and sub-descriptors, both
// optional vectors that the descriptor owns.
class ZELTA_EXPORT GenericDescriptor : public MetadataObject {
public:
  GenericDescriptor();
  ~GenericDescriptor() override;

  static std::shared_ptr<GenericDescriptor> create();

  std::size_t getLocatorCount() const { return locators_.size(); }
  std::shared_ptr<GenericLocator> getLocatorAt(std::size_t index);
  std::shared_ptr<const GenericLocator> getLocatorAt(std::size_t index) const;
  void addLocator(const std::shared_ptr<GenericLocator>& locator);
  void insertLocatorAt(std::size_t index, const std::shared_ptr<GenericLocator>& locator);
  void removeLocatorAt(std::size_t index);
  bool hasLocators() const { return hasLocators_; }
  // Drops the locators without releasing them.
  void removeLocators();

  std::size_t getGenericSubDescriptorCount() const { return genericSubDescriptors_.size(); }
  std::shared_ptr<SubDescriptor> getGenericSubDescriptorAt(std::size_t index);
  std::shared_ptr<const SubDescriptor> getGenericSubDescriptorAt(std::size_t index) const;
  void addGenericSubDescriptor(const std::shared_ptr<SubDescriptor>& subDescriptor);
  void insertGenericSubDescriptorAt(std::size_t index, const std::shared_ptr<SubDescriptor>& subDescriptor);
  void removeGenericSubDescriptorAt(std::size_t index);
  bool hasGenericSubDescriptors() const { return hasGenericSubDescriptors_; }
  // Drops the sub-descriptors without releasing them.
  void removeGenericSubDescriptors();

private:
  // An empty batch read from a file is present all the same, so that writing
  // the object again keeps it; only the class's table marks it, through
  // the library's own class that names the markers.
  friend class GenericDescriptorPresence;
  void markLocatorsPresent() { hasLocators_ = true; }
  void markGenericSubDescriptorsPresent() { hasGenericSubDescriptors_ = true; }

  std::vector<std::shared_ptr<GenericLocator>> locators_;
  bool hasLocators_ = false;
  std::vector<std::shared_ptr<SubDescriptor>> genericSubDescriptors_;
  bool hasGenericSubDescriptors_ = false;
};

class ZELTA_EXPORT FileDescriptor : public GenericDescriptor {
public:
  FileDescriptor();
  ~FileDescriptor() override;

  static std::shared_ptr<FileDescriptor> create();

  const std::uint32_t& getLinkedTrackID() const;
  void setLinkedTrackID(const std::uint32_t& linkedTrackID) { linkedTrackID_ = linkedTrackID; }
  bool hasLinkedTrackID() const { return linkedTrackID_.has_value(); }
  void removeLinkedTrackID() { linkedTrackID_.reset(); }

  const MXFRational& getSampleRate() const { return sampleRate_; }
  void setSampleRate(const MXFRational& sampleRate) { sampleRate_ = sampleRate; }

  const std::int64_t& getContainerDuration() const;
  void setContainerDuration(const std::int64_t& containerDuration) { containerDuration_ = containerDuration; }
  bool hasContainerDuration() const { return containerDuration_.has_value(); }
  void removeContainerDuration() { containerDuration_.reset(); }

  const KLVKey& getEssenceContainer() const { return essenceContainer_; }
  void setEssenceContainer(const KLVKey& essenceContainer) { essenceContainer_ = essenceContainer; }

  const MXFUID& getCodec() const;
  void setCodec(const MXFUID& codec) { codec_ = codec; }
  bool hasCodec() const { return codec_.has_value(); }
  void removeCodec() { codec_.reset(); }

private:
  std::optional<std::uint32_t> linkedTrackID_;
  MXFRational sampleRate_;
  std::optional<std::int64_t> containerDuration_;
  KLVKey essenceContainer_;
  std::optional<MXFUID> codec_;
};

class ZELTA_EXPORT PictureDescriptor : public FileDescriptor {
public:
  PictureDescriptor();
  ~PictureDescriptor() override;

  static std::shared_ptr<PictureDescriptor> create();

  const std::uint8_t& getSignalStandard() const;
  void setSignalStandard(const std::uint8_t& signalStandard) { signalStandard_ = signalStandard; }
  bool hasSignalStandard() const { return signalStandard_.has_value(); }
  void removeSignalStandard() { signalStandard_.reset(); }

  const std::uint8_t& getFrameLayout() const { return frameLayout_; }
  void setFrameLayout(const std::uint8_t& frameLayout) { frameLayout_ = frameLayout; }

  const std::uint32_t& getStoredWidth() const { return storedWidth_; }
  void setStoredWidth(const std::uint32_t& storedWidth) { storedWidth_ = storedWidth; }

  const std::uint32_t& getStoredHeight() const { return storedHeight_; }
  void setStoredHeight(const std::uint32_t& storedHeight) { storedHeight_ = storedHeight; }

  const std::int32_t& getStoredF2Offset() const;
  void setStoredF2Offset(const std::int32_t& storedF2Offset) { storedF2Offset_ = storedF2Offset; }
  bool hasStoredF2Offset() const { return storedF2Offset_.has_value(); }
  void removeStoredF2Offset() { storedF2Offset_.reset(); }

  const std::uint32_t& getSampledWidth() const;
  void setSampledWidth(const std::uint32_t& sampledWidth) { sampledWidth_ = sampledWidth; }
  bool hasSampledWidth() const { return sampledWidth_.has_value(); }
  void removeSampledWidth() { sampledWidth_.reset(); }

  const std::uint32_t& getSampledHeight() const;
  void setSampledHeight(const std::uint32_t& sampledHeight) { sampledHeight_ = sampledHeight; }
  bool hasSampledHeight() const { return sampledHeight_.has_value(); }
  void removeSampledHeight() { sampledHeight_.reset(); }

  const std::int32_t& getSampledXOffset() const;
  void setSampledXOffset(const std::int32_t& sampledXOffset) { sampledXOffset_ = sampledXOffset; }
  bool hasSampledXOffset() const { return sampledXOffset_.has_value(); }
  void removeSampledXOffset() { sampledXOffset_.reset(); }

  const std::int32_t& getSampledYOffset() const;
  void setSampledYOffset(const std::int32_t& sampledYOffset) { sampledYOffset_ = sampledYOffset; }
  bool hasSampledYOffset() const { return sampledYOffset_.has_value(); }
  void removeSampledYOffset() { sampledYOffset_.reset(); }

  const std::uint32_t& getDisplayHeight() const;
  void setDisplayHeight(const std::uint32_t& displayHeight) { displayHeight_ = displayHeight; }
  bool hasDisplayHeight() const { return displayHeight_.has_value(); }
  void removeDisplayHeight() { displayHeight_.reset(); }

  const std::uint32_t& getDisplayWidth() const;
  void setDisplayWidth(const std::uint32_t& displayWidth) { displayWidth_ = displayWidth; }
  bool hasDisplayWidth() const { return displayWidth_.has_value(); }
  void removeDisplayWidth() { displayWidth_.reset(); }

  const std::int32_t& getDisplayXOffset() const;
  void setDisplayXOffset(const std::int32_t& displayXOffset) { displayXOffset_ = displayXOffset; }
  bool hasDisplayXOffset() const { return displayXOffset_.has_value(); }
  void removeDisplayXOffset() { displayXOffset_.reset(); }

  const std::int32_t& getDisplayYOffset() const;
  void setDisplayYOffset(const std::int32_t& displayYOffset) { displayYOffset_ = displayYOffset; }
  bool hasDisplayYOffset() const { return displayYOffset_.has_value(); }
  void removeDisplayYOffset() { displayYOffset_.reset(); }

  const std::int32_t& getDisplayF2Offset() const;
  void setDisplayF2Offset(const std::int32_t& displayF2Offset) { displayF2Offset_ = displayF2Offset; }
  bool hasDisplayF2Offset() const { return displayF2Offset_.has_value(); }
  void removeDisplayF2Offset() { displayF2Offset_.reset(); }

  const MXFRational& getAspectRatio() const { return aspectRatio_; }
  void setAspectRatio(const MXFRational& aspectRatio) { aspectRatio_ = aspectRatio; }

  const std::uint8_t& getActiveFormatDescriptor() const;
  void setActiveFormatDescriptor(const std::uint8_t& activeFormatDescriptor) {
    activeFormatDescriptor_ = activeFormatDescriptor;
  }
  bool hasActiveFormatDescriptor() const { return activeFormatDescriptor_.has_value(); }
  void removeActiveFormatDescriptor() { activeFormatDescriptor_.reset(); }

  const std::vector<std::int32_t>& getVideoLineMap() const { return videoLineMap_; }
  void setVideoLineMap(const std::vector<std::int32_t>& videoLineMap) { videoLineMap_ = videoLineMap; }

  const std::uint8_t& getAlphaTransparency() const;
  void setAlphaTransparency(const std::uint8_t& alphaTransparency) { alphaTransparency_ = alphaTransparency; }
  bool hasAlphaTransparency() const { return alphaTransparency_.has_value(); }
  void removeAlphaTransparency() { alphaTransparency_.reset(); }

  const KLVKey& getCaptureGamma() const;
  void setCaptureGamma(const KLVKey& captureGamma) { captureGamma_ = captureGamma; }
  bool hasCaptureGamma() const { return captureGamma_.has_value(); }
  void removeCaptureGamma() { captureGamma_.reset(); }

  const std::uint32_t& getImageAlignmentOffset() const;
  void setImageAlignmentOffset(const std::uint32_t& imageAlignmentOffset) {
    imageAlignmentOffset_ = imageAlignmentOffset;
  }
  bool hasImageAlignmentOffset() const { return imageAlignmentOffset_.has_value(); }
  void removeImageAlignmentOffset() { imageAlignmentOffset_.reset(); }

  const std::uint32_t& getImageStartOffset() const;
  void setImageStartOffset(const std::uint32_t& imageStartOffset) { imageStartOffset_ = imageStartOffset; }
  bool hasImageStartOffset() const { return imageStartOffset_.has_value(); }
  void removeImageStartOffset() { imageStartOffset_.reset(); }

  const std::uint32_t& getImageEndOffset() const;
  void setImageEndOffset(const std::uint32_t& imageEndOffset) { imageEndOffset_ = imageEndOffset; }
  bool hasImageEndOffset() const { return imageEndOffset_.has_value(); }
  void removeImageEndOffset() { imageEndOffset_.reset(); }

  const std::uint8_t& getFieldDominance() const;
  void setFieldDominance(const std::uint8_t& fieldDominance) { fieldDominance_ = fieldDominance; }
  bool hasFieldDominance() const { return fieldDominance_.has_value(); }
  void removeFieldDominance() { fieldDominance_.reset(); }

  const KLVKey& getPictureEssenceCoding() const;
  void setPictureEssenceCoding(const KLVKey& pictureEssenceCoding) { pictureEssenceCoding_ = pictureEssenceCoding; }
  bool hasPictureEssenceCoding() const { return pictureEssenceCoding_.has_value(); }
  void removePictureEssenceCoding() { pictureEssenceCoding_.reset(); }

  const KLVKey& getCodingEquations() const;
  void setCodingEquations(const KLVKey& codingEquations) { codingEquations_ = codingEquations; }
  bool hasCodingEquations() const { return codingEquations_.has_value(); }
  void removeCodingEquations() { codingEquations_.reset(); }

  const KLVKey& getColourPrimaries() const;
  void setColourPrimaries(const KLVKey& colourPrimaries) { colourPrimaries_ = colourPrimaries; }
  bool hasColourPrimaries() const { return colourPrimaries_.has_value(); }
  void removeColourPrimaries() { colourPrimaries_.reset(); }

private:
  std::optional<std::uint8_t> signalStandard_;
  std::uint8_t frameLayout_ = 0;
  std::uint32_t storedWidth_ = 0;
  std::uint32_t storedHeight_ = 0;
  std::optional<std::int32_t> storedF2Offset_;
  std::optional<std::uint32_t> sampledWidth_;
  std::optional<std::uint32_t> sampledHeight_;
  std::optional<std::int32_t> sampledXOffset_;
  std::optional<std::int32_t> sampledYOffset_;
  std::optional<std::uint32_t> displayHeight_;
  std::optional<std::uint32_t> displayWidth_;
  std::optional<std::int32_t> displayXOffset_;
  std::optional<std::int32_t> displayYOffset_;
  std::optional<std::int32_t> displayF2Offset_;
  MXFRational aspectRatio_;
  std::optional<std::uint8_t> activeFormatDescriptor_;
  std::vector<std::int32_t> videoLineMap_;
  std::optional<std::uint8_t> alphaTransparency_;
  std::optional<KLVKey> captureGamma_;
  std::optional<std::uint32_t> imageAlignmentOffset_;
  std::optional<std::uint32_t> imageStartOffset_;
  std::optional<std::uint32_t> imageEndOffset_;
  std::optional<std::uint8_t> fieldDominance_;
  std::optional<KLVKey> pictureEssenceCoding_;
  std::optional<KLVKey> codingEquations_;
  std::optional<KLVKey> colourPrimaries_;
};

// Colour difference component pictures.
class ZELTA_EXPORT CDCIPictureDescriptor : public PictureDescriptor {
public:
  CDCIPictureDescriptor();
  ~CDCIPictureDescriptor() override;

  static std::shared_ptr<CDCIPictureDescriptor> create();

  const std::uint32_t& getComponentDepth() const { return componentDepth_; }
  void setComponentDepth(const std::uint32_t& componentDepth) { componentDepth_ = componentDepth; }

  const std::uint32_t& getHorizontalSubsampling() const { return horizontalSubsampling_; }
  void setHorizontalSubsampling(const std::uint32_t& horizontalSubsampling) {
    horizontalSubsampling_ = horizontalSubsampling;
  }

  const std::uint32_t& getVerticalSubsampling() const;
  void setVerticalSubsampling(const std::uint32_t& verticalSubsampling) { verticalSubsampling_ = verticalSubsampling; }
  bool hasVerticalSubsampling() const { return verticalSubsampling_.has_value(); }
  void removeVerticalSubsampling() { verticalSubsampling_.reset(); }

  const std::uint8_t& getColourSiting() const;
  void setColourSiting(const std::uint8_t& colourSiting) { colourSiting_ = colourSiting; }
  bool hasColourSiting() const { return colourSiting_.has_value(); }
  void removeColourSiting() { colourSiting_.reset(); }

  const bool& getReversedByteOrder() const;
  void setReversedByteOrder(const bool& reversedByteOrder) { reversedByteOrder_ = reversedByteOrder; }
  bool hasReversedByteOrder() const { return reversedByteOrder_.has_value(); }
  void removeReversedByteOrder() { reversedByteOrder_.reset(); }

  const std::int16_t& getPaddingBits() const;
  void setPaddingBits(const std::int16_t& paddingBits) { paddingBits_ = paddingBits; }
  bool hasPaddingBits() const { return paddingBits_.has_value(); }
  void removePaddingBits() { paddingBits_.reset(); }

  const std::uint32_t& getAlphaSamplingDepth() const;
  void setAlphaSamplingDepth(const std::uint32_t& alphaSamplingDepth) { alphaSamplingDepth_ = alphaSamplingDepth; }
  bool hasAlphaSamplingDepth() const { return alphaSamplingDepth_.has_value(); }
  void removeAlphaSamplingDepth() { alphaSamplingDepth_.reset(); }

  const std::uint32_t& getBlackReferenceLevel() const;
  void setBlackReferenceLevel(const std::uint32_t& blackReferenceLevel) { blackReferenceLevel_ = blackReferenceLevel; }
  bool hasBlackReferenceLevel() const { return blackReferenceLevel_.has_value(); }
  void removeBlackReferenceLevel() { blackReferenceLevel_.reset(); }

  const std::uint32_t& getWhiteReferenceLevel() const;
  void setWhiteReferenceLevel(const std::uint32_t& whiteReferenceLevel) { whiteReferenceLevel_ = whiteReferenceLevel; }
  bool hasWhiteReferenceLevel() const { return whiteReferenceLevel_.has_value(); }
  void removeWhiteReferenceLevel() { whiteReferenceLevel_.reset(); }

  const std::uint32_t& getColourRange() const;
  void setColourRange(const std::uint32_t& colourRange) { colourRange_ = colourRange; }
  bool hasColourRange() const { return colourRange_.has_value(); }
  void removeColourRange() { colourRange_.reset(); }

private:
  std::uint32_t componentDepth_ = 0;
  std::uint32_t horizontalSubsampling_ = 0;
  std::optional<std::uint32_t> verticalSubsampling_;
  std::optional<std::uint8_t> colourSiting_;
  std::optional<bool> reversedByteOrder_;
  std::optional<std::int16_t> paddingBits_;
  std::optional<std::uint32_t> alphaSamplingDepth_;
  std::optional<std::uint32_t> blackReferenceLevel_;
  std::optional<std::uint32_t> whiteReferenceLevel_;
  std::optional<std::uint32_t> colourRange_;
};

// Component pictures, red, green, blue and alpha.
class ZELTA_EXPORT RGBAPictureDescriptor : public PictureDescriptor {
public:
  RGBAPictureDescriptor();
  ~RGBAPictureDescriptor() override;

  static std::shared_ptr<RGBAPictureDescriptor> create();

  const std::uint32_t& getComponentMaxReferenceLevel() const;
  void setComponentMaxReferenceLevel(const std::uint32_t& level) { componentMaxReferenceLevel_ = level; }
  bool hasComponentMaxReferenceLevel() const { return componentMaxReferenceLevel_.has_value(); }
  void removeComponentMaxReferenceLevel() { componentMaxReferenceLevel_.reset(); }

  const std::uint32_t& getComponentMinReferenceLevel() const;
  void setComponentMinReferenceLevel(const std::uint32_t& level) { componentMinReferenceLevel_ = level; }
  bool hasComponentMinReferenceLevel() const { return componentMinReferenceLevel_.has_value(); }
  void removeComponentMinReferenceLevel() { componentMinReferenceLevel_.reset(); }

  const std::uint32_t& getAlphaMaxReferenceLevel() const;
  void setAlphaMaxReferenceLevel(const std::uint32_t& level) { alphaMaxReferenceLevel_ = level; }
  bool hasAlphaMaxReferenceLevel() const { return alphaMaxReferenceLevel_.has_value(); }
  void removeAlphaMaxReferenceLevel() { alphaMaxReferenceLevel_.reset(); }

  const std::uint32_t& getAlphaMinReferenceLevel() const;
  void setAlphaMinReferenceLevel(const std::uint32_t& level) { alphaMinReferenceLevel_ = level; }
  bool hasAlphaMinReferenceLevel() const { return alphaMinReferenceLevel_.has_value(); }
  void removeAlphaMinReferenceLevel() { alphaMinReferenceLevel_.reset(); }

  const std::uint8_t& getScanningDirection() const;
  void setScanningDirection(const std::uint8_t& scanningDirection) { scanningDirection_ = scanningDirection; }
  bool hasScanningDirection() const { return scanningDirection_.has_value(); }
  void removeScanningDirection() { scanningDirection_.reset(); }

  const RGBALayout& getPixelLayout() const { return pixelLayout_; }
  void setPixelLayout(const RGBALayout& pixelLayout) { pixelLayout_ = pixelLayout; }

  const ByteVector& getPalette() const;
  void setPalette(const ByteVector& palette) { palette_ = palette; }
  bool hasPalette() const { return palette_.has_value(); }
  void removePalette() { palette_.reset(); }

  const RGBALayout& getPaletteLayout() const;
  void setPaletteLayout(const RGBALayout& paletteLayout) { paletteLayout_ = paletteLayout; }
  bool hasPaletteLayout() const { return paletteLayout_.has_value(); }
  void removePaletteLayout() { paletteLayout_.reset(); }

private:
  std::optional<std::uint32_t> componentMaxReferenceLevel_;
  std::optional<std::uint32_t> componentMinReferenceLevel_;
  std::optional<std::uint32_t> alphaMaxReferenceLevel_;
  std::optional<std::uint32_t> alphaMinReferenceLevel_;
  std::optional<std::uint8_t> scanningDirection_;
  RGBALayout pixelLayout_;
  std::optional<ByteVector> palette_;
  std::optional<RGBALayout> paletteLayout_;
};

class ZELTA_EXPORT SoundDescriptor : public FileDescriptor {
public:
  // The audio sampling rate starts at 0/1.
  SoundDescriptor();
  ~SoundDescriptor() override;

  static std::shared_ptr<SoundDescriptor> create();

  const MXFRational& getAudioSamplingRate() const { return audioSamplingRate_; }
  void setAudioSamplingRate(const MXFRational& audioSamplingRate) { audioSamplingRate_ = audioSamplingRate; }

  const bool& getLocked() const { return locked_; }
  void setLocked(const bool& locked) { locked_ = locked; }

  const std::int8_t& getAudioReferenceLevel() const;
  void setAudioReferenceLevel(const std::int8_t& audioReferenceLevel) { audioReferenceLevel_ = audioReferenceLevel; }
  bool hasAudioReferenceLevel() const { return audioReferenceLevel_.has_value(); }
  void removeAudioReferenceLevel() { audioReferenceLevel_.reset(); }

  const std::uint8_t& getElectroSpatialFormulation() const;
  void setElectroSpatialFormulation(const std::uint8_t& formulation) { electroSpatialFormulation_ = formulation; }
  bool hasElectroSpatialFormulation() const { return electroSpatialFormulation_.has_value(); }
  void removeElectroSpatialFormulation() { electroSpatialFormulation_.reset(); }

  const std::uint32_t& getChannelCount() const { return channelCount_; }
  void setChannelCount(const std::uint32_t& channelCount) { channelCount_ = channelCount; }

  const std::uint32_t& getQuantizationBits() const { return quantizationBits_; }
  void setQuantizationBits(const std::uint32_t& quantizationBits) { quantizationBits_ = quantizationBits; }

  const std::int8_t& getDialNorm() const;
  void setDialNorm(const std::int8_t& dialNorm) { dialNorm_ = dialNorm; }
  bool hasDialNorm() const { return dialNorm_.has_value(); }
  void removeDialNorm() { dialNorm_.reset(); }

  const KLVKey& getSoundEssenceCompression() const;
  void setSoundEssenceCompression(const KLVKey& compression) { soundEssenceCompression_ = compression; }
  bool hasSoundEssenceCompression() const { return soundEssenceCompression_.has_value(); }
  void removeSoundEssenceCompression() { soundEssenceCompression_.reset(); }

private:
  MXFRational audioSamplingRate_;
  bool locked_ = false;
  std::optional<std::int8_t> audioReferenceLevel_;
  std::optional<std::uint8_t> electroSpatialFormulation_;
  std::uint32_t channelCount_ = 0;
  std::uint32_t quantizationBits_ = 0;
  std::optional<std::int8_t> dialNorm_;
  std::optional<KLVKey> soundEssenceCompression_;
};

class ZELTA_EXPORT DataDescriptor : public FileDescriptor {
public:
  DataDescriptor();
  ~DataDescriptor() override;

  static std::shared_ptr<DataDescriptor> create();

  const KLVKey& getDataEssenceCoding() const;
  void setDataEssenceCoding(const KLVKey& dataEssenceCoding) { dataEssenceCoding_ = dataEssenceCoding; }
  bool hasDataEssenceCoding() const { return dataEssenceCoding_.has_value(); }
  void removeDataEssenceCoding() { dataEssenceCoding_.reset(); }

private:
  std::optional<KLVKey> dataEssenceCoding_;
};

// The descriptor of a container that interleaves several essences: one
// file descriptor for each.
class ZELTA_EXPORT MultipleDescriptor : public FileDescriptor {
public:
  MultipleDescriptor();
  ~MultipleDescriptor() override;

  static std::shared_ptr<MultipleDescriptor> create();

  std::size_t getSubDescriptorCount() const { return subDescriptors_.size(); }
  std::shared_ptr<FileDescriptor> getSubDescriptorAt(std::size_t index);
  std::shared_ptr<const FileDescriptor> getSubDescriptorAt(std::size_t index) const;
  void addSubDescriptor(const std::shared_ptr<FileDescriptor>& subDescriptor);
  void insertSubDescriptorAt(std::size_t index, const std::shared_ptr<FileDescriptor>& subDescriptor);
  void removeSubDescriptorAt(std::size_t index);

private:
  std::vector<std::shared_ptr<FileDescriptor>> subDescriptors_;
};

class SubDescriptorFactory : public MetadataClassFactory<SubDescriptor, MetadataObjectFactory> {};
class ContainerConstraintsSubDescriptorFactory
    : public MetadataClassFactory<ContainerConstraintsSubDescriptor, SubDescriptorFactory> {};
class GenericDescriptorFactory : public MetadataClassFactory<GenericDescriptor, MetadataObjectFactory> {};
class FileDescriptorFactory : public MetadataClassFactory<FileDescriptor, GenericDescriptorFactory> {};
class PictureDescriptorFactory : public MetadataClassFactory<PictureDescriptor, FileDescriptorFactory> {};
class CDCIPictureDescriptorFactory : public MetadataClassFactory<CDCIPictureDescriptor, PictureDescriptorFactory> {};
class RGBAPictureDescriptorFactory : public MetadataClassFactory<RGBAPictureDescriptor, PictureDescriptorFactory> {};
class SoundDescriptorFactory : public MetadataClassFactory<SoundDescriptor, FileDescriptorFactory> {};
class DataDescriptorFactory : public MetadataClassFactory<DataDescriptor, FileDescriptorFactory> {};
class MultipleDescriptorFactory : public MetadataClassFactory<MultipleDescriptor, FileDescriptorFactory> {};

// Complete picture descriptors from an essence container label, every
// value the label implies filled in. A DV label names a kind (octet 14) and
// a wrapping (octet 15); the Preface version decides the colour siting of
// 625-line pictures. A D-10 label names a kind (octet 14) and a wrapping
// (octet 15). Both fail on a label that they can't describe.
ZELTA_EXPORT std::shared_ptr<CDCIPictureDescriptor> createDVPictureDescriptor(const KLVKey& essenceContainer,
                                                                 std::uint16_t prefaceVersion);
ZELTA_EXPORT std::shared_ptr<CDCIPictureDescriptor> createD10PictureDescriptor(const KLVKey& essenceContainer);

// ---------------------------------------------------------------------------
// The composite of the format's classes

// Every class of the format that a file may hold as a set, in search order:
// the structural classes, the locators and the descriptors. Sets of other
// classes are dark to it.
class ZELTA_EXPORT MXFFormatMetadataModelFactory : public MXFMetadataModelFactory {
public:
  MXFFormatMetadataModelFactory();
  ~MXFFormatMetadataModelFactory() override;

  const Factories& getFactories() override;

private:
  Factories factories_;
};

// ---------------------------------------------------------------------------
// Property descriptions
//
// How a client that holds only a factory can show an object: the factory's
// code gives each property's octets under its key, and the description of
// the key says what the octets hold.

// The value types of the class tables. A batch is a counted vector; opaque
// is a value type without a kind of its own, shown by its octets.
enum class MXFPropertyKind {
  uint8,
  uint16,
  uint32,
  uint64,
  int8,
  int16,
  int32,
  int64,
  boolean,
  rational,
  timestamp,
  productVersion,
  key,
  uid,
  umid,
  wideString,
  bytes,
  uint32Batch,
  int32Batch,
  keyBatch,
  rgbaLayout,
  strongReference,
  weakReference,
  strongReferenceVector,
  opaque
};

struct ZELTA_EXPORT MXFPropertyDescription {
  std::string name;  // class, point, property: "Track.trackID"
  MXFPropertyKind kind;
};

#endif
