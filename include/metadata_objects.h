// Zelta: metadata objects, pending references, factories and model coding.
// Part of metadata.h, which includes it.
#ifndef ZELTA_INCLUDE_METADATA_OBJECTS_H
#define ZELTA_INCLUDE_METADATA_OBJECTS_H

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

#endif
