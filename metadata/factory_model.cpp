#include <variant>

#include "core/reports.h"
#include "metadata.h"
#include "metadata/model_support.h"

MXFMetadataModelFactory::MXFMetadataModelFactory() = default;

MXFMetadataModelFactory::~MXFMetadataModelFactory() = default;

void MXFMetadataModelFactory::setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) {
  errorHandler_ = errorHandler;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : getFactories()) factory->setErrorHandler(errorHandler);
}

bool MXFMetadataModelFactory::canParse(const KLVKey& setKey) {
  if (keyCache_.count(setKey) != 0) return true;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : getFactories()) {
    check(factory != nullptr, "factory is present");
    if (factory->canParse(setKey)) {
      keyCache_[setKey] = factory;
      typeCache_[factory->getType(setKey).name()] = factory;
      return true;
    }
  }
  return false;
}

// Only a key that canParse has seen is known here.
MXFParsedObject MXFMetadataModelFactory::parse(const MXFPrimedSet& set) {
  const auto found = keyCache_.find(set.key);
  check(found != keyCache_.end(), "can handle set key");
  MXFParsedObject parsed = found->second->parse(set);
  check(parsed.object != nullptr, "factory has created object");
  declareDarkReferences(set.key, parsed);
  return parsed;
}

const std::type_info& MXFMetadataModelFactory::getType(const KLVKey& setKey) {
  check(canParse(setKey), "can handle set key");
  return keyCache_[setKey]->getType(setKey);
}

bool MXFMetadataModelFactory::canCode(const std::type_info& type) {
  if (typeCache_.count(type.name()) != 0) return true;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : getFactories()) {
    check(factory != nullptr, "factory is present");
    if (factory->canCode(type)) {
      typeCache_[type.name()] = factory;
      keyCache_[factory->getSetKey(type)] = factory;
      return true;
    }
  }
  return false;
}

MXFCodedObject MXFMetadataModelFactory::code(const std::shared_ptr<const MetadataRoot>& object) {
  check(object != nullptr, "can handle type");
  const MetadataRoot& root = *object;
  return byType(typeid(root)).code(object);
}

const MXFKeyToTagMap& MXFMetadataModelFactory::getSetPrimer(const std::type_info& type) {
  return byType(type).getSetPrimer(type);
}

const KLVKey& MXFMetadataModelFactory::getSetKey(const std::type_info& type) { return byType(type).getSetKey(type); }

bool MXFMetadataModelFactory::isReferenceDarkProperty(const KLVKey&, const KLVKey&) { return false; }

void MXFMetadataModelFactory::fireReferenceDarkPropertyInternalizeError(
    const KLVKey& key, const util::assertion_failure& exception) const {
  const std::shared_ptr<ErrorHandler> errors = errorHandler_.lock();
  zelta::Reports(errors.get())
      .error(invalidPropertyValueId,
             zelta::detailed("invalid reference dark property (" + zelta::keyText(key) + ") value", exception.what()));
}

MXFMetadataFactory& MXFMetadataModelFactory::byType(const std::type_info& type) {
  const auto found = typeCache_.find(type.name());
  check(found != typeCache_.end(), "can handle type");
  return *found->second;
}

// A declared reference waits for its target like any other; octets that
// are no identifier stay a value.
void MXFMetadataModelFactory::declareDarkReferences(const KLVKey& setKey, MXFParsedObject& parsed) {
  for (const MetadataRoot::DarkProperties::value_type& dark : parsed.object->getDarkProperties()) {
    const ByteVector* bytes = std::get_if<ByteVector>(&dark.second);
    if (!bytes || !isReferenceDarkProperty(setKey, dark.first)) continue;
    try {
      MXFUID target;
      internalize(*bytes, target);
      parsed.references.emplace(target,
                                std::make_shared<dangling_dark_ref_t<MetadataRoot>>(parsed.object, dark.first));
    } catch (const util::assertion_failure& exception) {
      fireReferenceDarkPropertyInternalizeError(dark.first, exception);
    }
  }
}
