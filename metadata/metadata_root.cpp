#include <memory>
#include <variant>

#include "metadata.h"

namespace {

typedef std::shared_ptr<MetadataRoot> ObjectPointer;

}  // namespace

MetadataRoot::MetadataRoot() : instanceUID_(ZeltaDefaultUIDGenerator().generate()) {}

MetadataRoot::~MetadataRoot() = default;

ObjectPointer MetadataRoot::create() { return std::make_shared<MetadataRoot>(); }

void MetadataRoot::takeOwnership(const ObjectPointer& object) { swapOwnership(nullptr, object); }

void MetadataRoot::releaseOwnership(const ObjectPointer& object) { swapOwnership(object, nullptr); }

// All checks come first, so that a refused swap changes nothing. The new
// object is unowned once past the second check, so comparing it with the
// top owner is all it takes to keep cycles out.
void MetadataRoot::swapOwnership(const ObjectPointer& oldObject, const ObjectPointer& newObject) {
  if (oldObject) check(oldObject->owner_.lock() == shared_from_this(), "current owner is this");
  check(!newObject || newObject->owner_.expired(), "object is not owned");
  if (newObject) check(newObject != getTopOwner(), "object does not own this");
  if (oldObject) oldObject->owner_.reset();
  if (newObject) newObject->owner_ = shared_from_this();
}

void MetadataRoot::swapOwnership(const KLVKey& key, const ObjectPointer& newObject) {
  ObjectPointer oldObject;
  DarkProperties::const_iterator found = darkProperties_.find(key);
  if (found != darkProperties_.end()) {
    if (const ObjectPointer* stored = std::get_if<ObjectPointer>(&found->second)) oldObject = *stored;
  }
  swapOwnership(oldObject, newObject);
}

ObjectPointer MetadataRoot::getTopOwner() {
  ObjectPointer top = shared_from_this();
  for (ObjectPointer owner = owner_.lock(); owner; owner = owner->owner_.lock()) top = owner;
  return top;
}

void MetadataRoot::setDarkProperty(const KLVKey& key, const ByteVector& bytes) {
  swapOwnership(key, nullptr);
  darkProperties_[key] = bytes;
}

const MetadataRoot::DarkValue& MetadataRoot::darkValue(const KLVKey& key) const {
  DarkProperties::const_iterator found = darkProperties_.find(key);
  check(found != darkProperties_.end(), "property is present");
  return found->second;
}

const ByteVector& MetadataRoot::getDarkProperty(const KLVKey& key) const {
  const DarkValue& value = darkValue(key);
  check(std::holds_alternative<ByteVector>(value), "property is a non-reference value");
  return std::get<ByteVector>(value);
}

void MetadataRoot::removeDarkProperty(const KLVKey& key) {
  swapOwnership(key, nullptr);
  darkProperties_.erase(key);
}

bool MetadataRoot::hasDarkProperty(const KLVKey& key) const { return darkProperties_.count(key) != 0; }

bool MetadataRoot::isReferenceDarkProperty(const KLVKey& key) const {
  return std::holds_alternative<ObjectPointer>(darkValue(key));
}
