#include <memory>

#include "metadata.h"
#include "metadata/property_table.h"

using zelta::presentValue;

TextBasedDMFramework::TextBasedDMFramework() = default;
TextBasedDMFramework::~TextBasedDMFramework() = default;
std::shared_ptr<TextBasedDMFramework> TextBasedDMFramework::create() {
  return std::make_shared<TextBasedDMFramework>();
}

std::shared_ptr<TextBasedObject> TextBasedDMFramework::getTextBasedObject() {
  check(textBasedObject_ != nullptr, "TextBasedDMFramework.textBasedObject is present");
  return textBasedObject_;
}

std::shared_ptr<const TextBasedObject> TextBasedDMFramework::getTextBasedObject() const {
  check(textBasedObject_ != nullptr, "TextBasedDMFramework.textBasedObject is present");
  return textBasedObject_;
}

void TextBasedDMFramework::setTextBasedObject(const std::shared_ptr<TextBasedObject>& textBasedObject) {
  swapOwnership(textBasedObject_, textBasedObject);
  textBasedObject_ = textBasedObject;
}

TextBasedObject::TextBasedObject() = default;
TextBasedObject::~TextBasedObject() = default;
std::shared_ptr<TextBasedObject> TextBasedObject::create() { return std::make_shared<TextBasedObject>(); }

const std::wstring& TextBasedObject::getTextDataDescription() const {
  return presentValue(textDataDescription_, "TextBasedObject.textDataDescription is present");
}

GenericStreamTextBasedSet::GenericStreamTextBasedSet() = default;
GenericStreamTextBasedSet::~GenericStreamTextBasedSet() = default;
std::shared_ptr<GenericStreamTextBasedSet> GenericStreamTextBasedSet::create() {
  return std::make_shared<GenericStreamTextBasedSet>();
}

UTF8TextBasedSet::UTF8TextBasedSet() = default;
UTF8TextBasedSet::~UTF8TextBasedSet() = default;
std::shared_ptr<UTF8TextBasedSet> UTF8TextBasedSet::create() { return std::make_shared<UTF8TextBasedSet>(); }

UTF16TextBasedSet::UTF16TextBasedSet() = default;
UTF16TextBasedSet::~UTF16TextBasedSet() = default;
std::shared_ptr<UTF16TextBasedSet> UTF16TextBasedSet::create() { return std::make_shared<UTF16TextBasedSet>(); }

MXFTextBasedDMModelFactory::MXFTextBasedDMModelFactory()
    : factories_{std::make_shared<TextBasedDMFrameworkFactory>(), std::make_shared<TextBasedObjectFactory>(),
                 std::make_shared<GenericStreamTextBasedSetFactory>(), std::make_shared<UTF8TextBasedSetFactory>(),
                 std::make_shared<UTF16TextBasedSetFactory>()} {}

MXFTextBasedDMModelFactory::~MXFTextBasedDMModelFactory() = default;

const MXFMetadataModelFactory::Factories& MXFTextBasedDMModelFactory::getFactories() { return factories_; }

namespace zelta {

namespace {

// 06 0E 2B 34 02 53 01 01 0D 01 04 01 04, the two octets of the class, 00.
KLVKey textBasedSetKey(std::uint8_t group, std::uint8_t member) {
  return KLVKey(std::array<std::uint8_t, 16>{0x06, 0x0E, 0x2B, 0x34, 0x02, 0x53, 0x01, 0x01, 0x0D, 0x01, 0x04, 0x01,
                                             0x04, group, member, 0x00});
}

// None of these properties has a static tag.
PropertyKey dynamicKey(const std::array<std::uint8_t, 8>& item) { return {registeredPropertyKey(0x0D, item), 0}; }

}  // namespace

template <>
const PropertyTable<TextBasedDMFramework>& propertyTable<TextBasedDMFramework>() {
  typedef TextBasedDMFramework C;
  static const PropertyTable<C> table(
      "TextBasedDMFramework", textBasedSetKey(0x01, 0x01),
      {strongReference<C, TextBasedObject>("TextBasedDMFramework.textBasedObject",
                                           dynamicKey({0x06, 0x01, 0x01, 0x04, 0x05, 0x41, 0x01, 0x00}),
                                           &C::getTextBasedObject, &C::setTextBasedObject)});
  return table;
}

template <>
const PropertyTable<TextBasedObject>& propertyTable<TextBasedObject>() {
  typedef TextBasedObject C;
  static const PropertyTable<C> table(
      "TextBasedObject", textBasedSetKey(0x03, 0x01),
      {requiredValue("TextBasedObject.textBasedMetadataPayloadSchemeID",
                     dynamicKey({0x04, 0x06, 0x08, 0x06, 0x00, 0x00, 0x00, 0x00}),
                     &C::getTextBasedMetadataPayloadSchemeID, &C::setTextBasedMetadataPayloadSchemeID),
       requiredValue("TextBasedObject.textMIMEMediaType", dynamicKey({0x04, 0x09, 0x02, 0x02, 0x00, 0x00, 0x00, 0x00}),
                     &C::getTextMIMEMediaType, &C::setTextMIMEMediaType),
       requiredValue("TextBasedObject.textLanguageCode", dynamicKey({0x03, 0x01, 0x01, 0x02, 0x02, 0x14, 0x00, 0x00}),
                     &C::getTextLanguageCode, &C::setTextLanguageCode),
       optionalValue("TextBasedObject.textDataDescription",
                     dynamicKey({0x03, 0x02, 0x01, 0x06, 0x03, 0x02, 0x00, 0x00}), &C::getTextDataDescription,
                     &C::setTextDataDescription, &C::hasTextDataDescription)});
  return table;
}

template <>
const PropertyTable<GenericStreamTextBasedSet>& propertyTable<GenericStreamTextBasedSet>() {
  typedef GenericStreamTextBasedSet C;
  static const PropertyTable<C> table("GenericStreamTextBasedSet", textBasedSetKey(0x02, 0x01),
                                      {requiredValue("GenericStreamTextBasedSet.genericStreamSID",
                                                     dynamicKey({0x01, 0x03, 0x04, 0x08, 0x00, 0x00, 0x00, 0x00}),
                                                     &C::getGenericStreamSID, &C::setGenericStreamSID)});
  return table;
}

template <>
const PropertyTable<UTF8TextBasedSet>& propertyTable<UTF8TextBasedSet>() {
  typedef UTF8TextBasedSet C;
  static const PropertyTable<C> table(
      "UTF8TextBasedSet", textBasedSetKey(0x02, 0x02),
      {requiredValue("UTF8TextBasedSet.utf8TextData", dynamicKey({0x03, 0x01, 0x02, 0x20, 0x03, 0x01, 0x00, 0x00}),
                     &C::getUTF8TextData, &C::setUTF8TextData)});
  return table;
}

template <>
const PropertyTable<UTF16TextBasedSet>& propertyTable<UTF16TextBasedSet>() {
  typedef UTF16TextBasedSet C;
  static const PropertyTable<C> table(
      "UTF16TextBasedSet", textBasedSetKey(0x02, 0x03),
      {requiredValue("UTF16TextBasedSet.utf16TextData", dynamicKey({0x03, 0x01, 0x02, 0x20, 0x03, 0x02, 0x00, 0x00}),
                     &C::getUTF16TextData, &C::setUTF16TextData)});
  return table;
}

}  // namespace zelta

template class MetadataClassFactory<TextBasedDMFramework, DescriptiveMetadataFrameworkFactory>;
template class MetadataClassFactory<TextBasedObject, DescriptiveMetadataObjectFactory>;
template class MetadataClassFactory<GenericStreamTextBasedSet, TextBasedObjectFactory>;
template class MetadataClassFactory<UTF8TextBasedSet, TextBasedObjectFactory>;
template class MetadataClassFactory<UTF16TextBasedSet, TextBasedObjectFactory>;
