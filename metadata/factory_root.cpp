#include <algorithm>

#include "core/reports.h"
#include "metadata.h"
#include "metadata/model_support.h"

namespace {

const char instanceUIDName[] = "MetadataRoot.instanceUID";
constexpr std::uint16_t instanceUIDTag = 0x3C0A;
constexpr std::size_t lengthTypeOctet = 5;
constexpr std::uint8_t twoOctetItemLengths = 0x53;
constexpr std::uint8_t berItemLengths = 0x13;
// Below this an item length fits two octets.
constexpr std::size_t largeValueSize = 0x10000;

void codeDarkProperty(const KLVKey& key, const MetadataRoot::DarkValue& value, MXFPropertyMap& properties,
                      MXFReferencedObjects& referenced) {
  if (const ByteVector* bytes = std::get_if<ByteVector>(&value)) {
    properties[key] = *bytes;
    return;
  }
  const std::shared_ptr<MetadataRoot>& object = std::get<std::shared_ptr<MetadataRoot>>(value);
  check(object != nullptr, "MetadataRoot.referenceDarkProperty is present");
  referenced.push_back(object);
  externalize(properties[key], object->getInstanceUID(), true);
}

}  // namespace

MXFMetadataFactory::~MXFMetadataFactory() = default;

MetadataRootFactory::MetadataRootFactory() : className_("MetadataRoot") {
  setPrimer_[MXFInstanceUIDKey] = instanceUIDTag;
  descriptions_[MXFInstanceUIDKey] = MXFPropertyDescription{instanceUIDName, MXFPropertyKind::uid};
}

MetadataRootFactory::~MetadataRootFactory() = default;

void MetadataRootFactory::setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) {
  errorHandler_ = errorHandler;
}

// The same set coded with BER item lengths differs only in octet 5.
bool MetadataRootFactory::canParse(const KLVKey& setKey) {
  const KLVKey& own = getSetKey();
  if (setKey == own) return true;
  if (!allowBERLengths() || setKey[lengthTypeOctet] != berItemLengths || own[lengthTypeOctet] != twoOctetItemLengths)
    return false;
  KLVKey asTwoOctet = setKey;
  asTwoOctet[lengthTypeOctet] = twoOctetItemLengths;
  return asTwoOctet == own;
}

MXFParsedObject MetadataRootFactory::parse(const MXFPrimedSet& set) {
  MXFParsedObject parsed;
  parsed.object = create();
  parseProperties(set.properties, parsed.object, parsed.references);
  return parsed;
}

const std::type_info& MetadataRootFactory::getType(const KLVKey& setKey) {
  check(canParse(setKey), "expected set key");
  return getType();
}

bool MetadataRootFactory::canCode(const std::type_info& type) { return getType() == type; }

MXFCodedObject MetadataRootFactory::code(const std::shared_ptr<const MetadataRoot>& object) {
  MXFCodedObject coded;
  coded.set.key = getSetKey();
  codeProperties(object, coded.set.properties, coded.referenced);
  const bool large = std::any_of(coded.set.properties.begin(), coded.set.properties.end(),
                                 [](const MXFPropertyMap::value_type& p) { return p.second.size() >= largeValueSize; });
  if (allowBERLengths() && large) coded.set.key[lengthTypeOctet] = berItemLengths;
  return coded;
}

const MXFKeyToTagMap& MetadataRootFactory::getSetPrimer(const std::type_info& type) {
  check(canCode(type), "expected type");
  return setPrimer_;
}

const KLVKey& MetadataRootFactory::getSetKey(const std::type_info& type) {
  check(canCode(type), "expected type");
  return getSetKey();
}

// What no class on the chain claimed stays with the object as dark
// properties, so that it survives a rewrite.
void MetadataRootFactory::parseProperties(const MXFPropertyMap& properties, const std::shared_ptr<MetadataRoot>& object,
                                          MXFPendingReferences&) const {
  const MXFPropertyMap::const_iterator found = properties.find(MXFInstanceUIDKey);
  if (found == properties.end()) {
    firePropertyRequiredError(instanceUIDName);
  } else {
    try {
      MXFUID identifier;
      internalize(found->second, identifier);
      object->setInstanceUID(identifier);
    } catch (const util::assertion_failure& exception) {
      firePropertyInternalizeError(instanceUIDName, exception);
    }
  }
  for (const MXFPropertyMap::value_type& property : properties)
    if (setPrimer_.count(property.first) == 0) object->setDarkProperty(property.first, property.second);
}

void MetadataRootFactory::codeProperties(const std::shared_ptr<const MetadataRoot>& object, MXFPropertyMap& properties,
                                         MXFReferencedObjects& referenced) const {
  externalize(properties[MXFInstanceUIDKey], object->getInstanceUID(), true);
  for (const MetadataRoot::DarkProperties::value_type& dark : object->getDarkProperties())
    codeDarkProperty(dark.first, dark.second, properties, referenced);
}

bool MetadataRootFactory::allowBERLengths() const { return false; }

// The handler is kept weakly: it stays alive for the report, or is gone.
void MetadataRootFactory::firePropertyRequiredError(const std::string& name) const {
  const std::shared_ptr<ErrorHandler> errors = getErrorHandler();
  zelta::Reports(errors.get()).error(missingPropertyId, "missing " + name);
}

void MetadataRootFactory::firePropertyInternalizeError(const std::string& name,
                                                       const util::assertion_failure& exception) const {
  const std::shared_ptr<ErrorHandler> errors = getErrorHandler();
  zelta::Reports(errors.get())
      .error(invalidPropertyValueId, zelta::detailed("invalid " + name + " value", exception.what()));
}
