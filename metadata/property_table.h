// A class's properties as data: name, key, static tag, presence and how the
// value is read and written through the class's own accessors. A class
// factory hands its table to the set primer in its constructor and to the
// parse and code helpers below, so that each class states its properties
// once.
#ifndef ZELTA_METADATA_PROPERTY_TABLE_H
#define ZELTA_METADATA_PROPERTY_TABLE_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <type_traits>
#include <vector>

#include "metadata.h"

namespace zelta {

enum class Presence { required, optional };

// The kind of a value type of the tables, so that a builder knows its
// property's kind from the accessors that it is given.
template <typename T>
struct PropertyKindOf : std::integral_constant<MXFPropertyKind, MXFPropertyKind::opaque> {};
template <MXFPropertyKind K>
using PropertyKindIs = std::integral_constant<MXFPropertyKind, K>;
template <>
struct PropertyKindOf<std::uint8_t> : PropertyKindIs<MXFPropertyKind::uint8> {};
template <>
struct PropertyKindOf<std::uint16_t> : PropertyKindIs<MXFPropertyKind::uint16> {};
template <>
struct PropertyKindOf<std::uint32_t> : PropertyKindIs<MXFPropertyKind::uint32> {};
template <>
struct PropertyKindOf<std::uint64_t> : PropertyKindIs<MXFPropertyKind::uint64> {};
template <>
struct PropertyKindOf<std::int8_t> : PropertyKindIs<MXFPropertyKind::int8> {};
template <>
struct PropertyKindOf<std::int16_t> : PropertyKindIs<MXFPropertyKind::int16> {};
template <>
struct PropertyKindOf<std::int32_t> : PropertyKindIs<MXFPropertyKind::int32> {};
template <>
struct PropertyKindOf<std::int64_t> : PropertyKindIs<MXFPropertyKind::int64> {};
template <>
struct PropertyKindOf<bool> : PropertyKindIs<MXFPropertyKind::boolean> {};
template <>
struct PropertyKindOf<MXFRational> : PropertyKindIs<MXFPropertyKind::rational> {};
template <>
struct PropertyKindOf<MXFTimestamp> : PropertyKindIs<MXFPropertyKind::timestamp> {};
template <>
struct PropertyKindOf<MXFProductVersion> : PropertyKindIs<MXFPropertyKind::productVersion> {};
template <>
struct PropertyKindOf<KLVKey> : PropertyKindIs<MXFPropertyKind::key> {};
template <>
struct PropertyKindOf<MXFUID> : PropertyKindIs<MXFPropertyKind::uid> {};
template <>
struct PropertyKindOf<UMID> : PropertyKindIs<MXFPropertyKind::umid> {};
template <>
struct PropertyKindOf<std::wstring> : PropertyKindIs<MXFPropertyKind::wideString> {};
template <>
struct PropertyKindOf<std::string> : PropertyKindIs<MXFPropertyKind::narrowString> {};
template <>
struct PropertyKindOf<ByteVector> : PropertyKindIs<MXFPropertyKind::bytes> {};
template <>
struct PropertyKindOf<std::vector<std::uint32_t>> : PropertyKindIs<MXFPropertyKind::uint32Batch> {};
template <>
struct PropertyKindOf<std::vector<std::int32_t>> : PropertyKindIs<MXFPropertyKind::int32Batch> {};
template <>
struct PropertyKindOf<std::vector<KLVKey>> : PropertyKindIs<MXFPropertyKind::keyBatch> {};
template <>
struct PropertyKindOf<RGBALayout> : PropertyKindIs<MXFPropertyKind::rgbaLayout> {};

template <typename C>
struct PropertyDescriptor {
  // Decodes the octets into the object, or enters pending references.
  typedef std::function<void(const std::shared_ptr<C>&, const ByteVector&, MXFPendingReferences&)> Parser;
  // Writes the value; false when an optional property is unset.
  typedef std::function<bool(const C&, ByteVector&, MXFReferencedObjects&)> Coder;

  std::string name;  // class, point, property: "Sequence.components"
  KLVKey key;
  std::uint16_t tag;  // 0: dynamic
  Presence presence;
  Parser parse;
  Coder code;
  MXFPropertyKind kind;
};

template <typename C>
class PropertyTable {
 public:
  // The class name goes into the check of the object's class.
  PropertyTable(const std::string& className, std::vector<PropertyDescriptor<C>> properties)
      : className_(className), isClass_("object is a " + className), properties_(std::move(properties)) {}
  // The table of a class of the format, with the key of its sets.
  PropertyTable(const std::string& className, const KLVKey& setKey, std::vector<PropertyDescriptor<C>> properties)
      : className_(className),
        isClass_("object is a " + className),
        setKey_(setKey),
        properties_(std::move(properties)) {}

  const KLVKey& getSetKey() const { return setKey_; }
  const std::string& getClassName() const { return className_; }
  // The class's own property keys, in table order.
  std::vector<KLVKey> keys() const {
    std::vector<KLVKey> keys;
    for (const PropertyDescriptor<C>& property : properties_) keys.push_back(property.key);
    return keys;
  }

  void enterInto(MXFKeyToTagMap& setPrimer) const {
    for (const PropertyDescriptor<C>& property : properties_) setPrimer[property.key] = property.tag;
  }

  void describeInto(MXFPropertyDescriptions& descriptions) const {
    for (const PropertyDescriptor<C>& property : properties_)
      descriptions[property.key] = MXFPropertyDescription{property.name, property.kind};
  }

  // Reports what is missing or can't be read, and goes on.
  void parse(const MetadataRootFactory& factory, const MXFPropertyMap& properties,
             const std::shared_ptr<MetadataRoot>& object, MXFPendingReferences& references) const {
    const std::shared_ptr<C> typed = std::dynamic_pointer_cast<C>(object);
    check(typed != nullptr, isClass_);
    for (const PropertyDescriptor<C>& property : properties_) {
      const MXFPropertyMap::const_iterator found = properties.find(property.key);
      if (found == properties.end()) {
        if (property.presence == Presence::required) factory.firePropertyRequiredError(property.name);
        continue;
      }
      try {
        property.parse(typed, found->second, references);
      } catch (const util::assertion_failure& exception) {
        factory.firePropertyInternalizeError(property.name, exception);
      }
    }
  }

  const C& cast(const std::shared_ptr<const MetadataRoot>& object) const {
    const C* typed = dynamic_cast<const C*>(object.get());
    check(typed != nullptr, isClass_);
    return *typed;
  }

  void code(const C& object, MXFPropertyMap& properties, MXFReferencedObjects& referenced) const {
    for (const PropertyDescriptor<C>& property : properties_) {
      ByteVector bytes;
      if (property.code(object, bytes, referenced)) properties[property.key] = std::move(bytes);
    }
  }

 private:
  std::string className_;
  std::string isClass_;
  KLVKey setKey_;
  std::vector<PropertyDescriptor<C>> properties_;
};

// The table of class C, defined beside the class's factory.
template <typename C>
const PropertyTable<C>& propertyTable();

// A property key of the standard primer, by its static tag, so that the
// class tables do not spell the keys a second time.
inline const KLVKey& standardKey(std::uint16_t tag) { return getMXFStandardPrimerKeys().at(tag); }

// Where a property stands: its key and its static local tag, 0 for a key
// that gets a dynamic tag when coded. A tag alone names the key that the
// standard primer gives it, so that a table row spells each tag once.
struct PropertyKey {
  PropertyKey(std::uint16_t standardTag) : key(standardKey(standardTag)), tag(standardTag) {}
  PropertyKey(const KLVKey& key, std::uint16_t tag) : key(key), tag(tag) {}

  KLVKey key;
  std::uint16_t tag;
};

// A property key of the registry as the class tables spell it: 06 0E 2B 34
// 01 01 01, the version octet, then the eight octets of the item.
inline KLVKey registeredPropertyKey(std::uint8_t version, const std::array<std::uint8_t, 8>& item) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, version, item[0], item[1],
                                             item[2], item[3], item[4], item[5], item[6], item[7]});
}

// A property that the standard primer doesn't name, with its static tag.
inline PropertyKey formatPropertyKey(std::uint8_t version, const std::array<std::uint8_t, 8>& tail,
                                     std::uint16_t tag) {
  return PropertyKey(registeredPropertyKey(version, tail), tag);
}

// The set key of a class of the format: 06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01,
// the class octet, 00.
inline KLVKey formatSetKey(std::uint8_t classOctet) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x01, 0x01,
                                             0x01, 0x01, classOctet, 0x00});
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

// Descriptors by kind of property, over the accessors of the class.

template <typename C, typename T>
PropertyDescriptor<C> requiredValue(const std::string& name, const PropertyKey& property, const T& (C::*getter)() const,
                                    void (C::*setter)(const T&)) {
  return {name,
          property.key,
          property.tag,
          Presence::required,
          [setter](const std::shared_ptr<C>& object, const ByteVector& bytes, MXFPendingReferences&) {
            T value;
            internalize(bytes, value);
            ((*object).*setter)(value);
          },
          [getter](const C& object, ByteVector& bytes, MXFReferencedObjects&) {
            externalize(bytes, (object.*getter)(), true);
            return true;
          },
          PropertyKindOf<T>::value};
}

template <typename C, typename T>
PropertyDescriptor<C> optionalValue(const std::string& name, const PropertyKey& property, const T& (C::*getter)() const,
                                    void (C::*setter)(const T&), bool (C::*has)() const) {
  PropertyDescriptor<C> descriptor = requiredValue(name, property, getter, setter);
  descriptor.presence = Presence::optional;
  descriptor.code = [getter, has](const C& object, ByteVector& bytes, MXFReferencedObjects&) {
    if (!(object.*has)()) return false;
    externalize(bytes, (object.*getter)(), true);
    return true;
  };
  return descriptor;
}

// A single reference; a null has means required. Strong references list
// their target among the owned objects, weak ones only name it.
template <typename C, typename V>
PropertyDescriptor<C> singleReference(const std::string& name, const PropertyKey& property, bool strong,
                                      std::shared_ptr<const V> (C::*getter)() const,
                                      void (C::*setter)(const std::shared_ptr<V>&), bool (C::*has)() const) {
  const std::string isPresent = name + " is present";
  return {name,
          property.key,
          property.tag,
          has ? Presence::optional : Presence::required,
          [setter, strong](const std::shared_ptr<C>& object, const ByteVector& bytes, MXFPendingReferences& pending) {
            MXFUID target;
            internalize(bytes, target);
            pending.emplace(target, std::make_shared<dangling_ref_t<C, V>>(object, setter, strong));
          },
          [getter, has, strong, isPresent](const C& object, ByteVector& bytes, MXFReferencedObjects& referenced) {
            if (has && !(object.*has)()) return false;
            const std::shared_ptr<const V> target = (object.*getter)();
            check(target != nullptr, isPresent);
            if (strong) referenced.push_back(target);
            externalize(bytes, target->getInstanceUID(), true);
            return true;
          },
          strong ? MXFPropertyKind::strongReference : MXFPropertyKind::weakReference};
}

template <typename C, typename V>
PropertyDescriptor<C> strongReference(const std::string& name, const PropertyKey& property,
                                      std::shared_ptr<const V> (C::*getter)() const,
                                      void (C::*setter)(const std::shared_ptr<V>&), bool (C::*has)() const = nullptr) {
  return singleReference<C, V>(name, property, true, getter, setter, has);
}

template <typename C, typename V>
PropertyDescriptor<C> weakReference(const std::string& name, const PropertyKey& property,
                                    std::shared_ptr<const V> (C::*getter)() const,
                                    void (C::*setter)(const std::shared_ptr<V>&), bool (C::*has)() const = nullptr) {
  return singleReference<C, V>(name, property, false, getter, setter, has);
}

// A vector of strong references, written as a batch of identifiers; the
// element's name ("Sequence.component") goes into the check of a null
// element. A null has means required; an optional vector is marked present
// as soon as it is read, so that an empty batch stays present.
template <typename C, typename V>
PropertyDescriptor<C> referenceVector(const std::string& name, const std::string& elementName,
                                      const PropertyKey& property, std::size_t (C::*count)() const,
                                      std::shared_ptr<const V> (C::*at)(std::size_t) const,
                                      void (C::*inserter)(std::size_t, const std::shared_ptr<V>&),
                                      bool (C::*has)() const = nullptr, void (C::*markPresent)() = nullptr) {
  typedef dangling_vector_ref_t<C, V> Element;
  const std::string isPresent = elementName + " is present";
  return {name,
          property.key,
          property.tag,
          has ? Presence::optional : Presence::required,
          [inserter, markPresent](const std::shared_ptr<C>& object, const ByteVector& bytes,
                                  MXFPendingReferences& pending) {
            std::vector<MXFUID> targets;
            internalize(bytes, targets);
            if (markPresent != nullptr) ((*object).*markPresent)();
            std::shared_ptr<Element> previous;
            for (const MXFUID& target : targets) {
              previous = std::make_shared<Element>(object, inserter, previous, true);
              pending.emplace(target, previous);
            }
          },
          [count, at, has, isPresent](const C& object, ByteVector& bytes, MXFReferencedObjects& referenced) {
            if (has && !(object.*has)()) return false;
            std::vector<MXFUID> targets;
            for (std::size_t i = 0; i < (object.*count)(); ++i) {
              const std::shared_ptr<const V> target = (object.*at)(i);
              check(target != nullptr, isPresent);
              referenced.push_back(target);
              targets.push_back(target->getInstanceUID());
            }
            externalize(bytes, targets, true);
            return true;
          },
          MXFPropertyKind::strongReferenceVector};
}

}  // namespace zelta

// The class factory template over the tables. Each class's source file
// instantiates it explicitly, so that the library exports every factory.

template <typename C, typename Base>
MetadataClassFactory<C, Base>::MetadataClassFactory() {
  const zelta::PropertyTable<C>& table = zelta::propertyTable<C>();
  table.enterInto(this->getSetPrimer());
  table.describeInto(this->describedProperties());
  this->setClassName(table.getClassName());
}

template <typename C, typename Base>
MetadataClassFactory<C, Base>::~MetadataClassFactory() = default;

template <typename C, typename Base>
const KLVKey& MetadataClassFactory<C, Base>::getSetKey() const {
  return zelta::propertyTable<C>().getSetKey();
}

template <typename C, typename Base>
void MetadataClassFactory<C, Base>::parseProperties(const MXFPropertyMap& properties,
                                                    const std::shared_ptr<MetadataRoot>& object,
                                                    MXFPendingReferences& references) const {
  zelta::propertyTable<C>().parse(*this, properties, object, references);
  Base::parseProperties(properties, object, references);
}

template <typename C, typename Base>
void MetadataClassFactory<C, Base>::codeProperties(const std::shared_ptr<const MetadataRoot>& object,
                                                   MXFPropertyMap& properties, MXFReferencedObjects& referenced) const {
  const zelta::PropertyTable<C>& table = zelta::propertyTable<C>();
  const C& typed = table.cast(object);
  Base::codeProperties(object, properties, referenced);
  table.code(typed, properties, referenced);
}

#endif
