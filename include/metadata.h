// Zelta: the metadata model, its objects, ownership and pending references.
#ifndef ZELTA_METADATA_H
#define ZELTA_METADATA_H

#include <cstddef>
#include <map>
#include <memory>
#include <optional>
#include <type_traits>
#include <variant>

#include "klv.h"

// ---------------------------------------------------------------------------
// Metadata objects

// The base of every object of a model. Ownership makes the model a tree: an
// owning property holds its child strongly, the child links back weakly to
// its single owner, and no object can come to own its own top owner.
class MetadataRoot : public std::enable_shared_from_this<MetadataRoot> {
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
class MetadataObject : public MetadataRoot {
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

class dangling_ref_base {
public:
  virtual ~dangling_ref_base();
  virtual bool isStrong() = 0;
  virtual void resolve(const std::shared_ptr<MetadataRoot>& target) = 0;
};

// A single-valued property, set through the owner's setter.
template <typename Owner, typename Value>
class dangling_ref_t : public dangling_ref_base {
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
class dangling_vector_ref_t : public dangling_ref_base {
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
class dangling_dark_ref_t : public dangling_ref_base {
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

#endif
