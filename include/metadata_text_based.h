// Zelta: text-based descriptive metadata, a text document such as an XML
// file carried in the header metadata or named in a generic stream, and the
// composite factory of its classes. Part of metadata.h, which includes it.
#ifndef ZELTA_INCLUDE_METADATA_TEXT_BASED_H
#define ZELTA_INCLUDE_METADATA_TEXT_BASED_H

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "metadata_descriptors.h"

class TextBasedObject;

// Hangs off a DMSegment and owns the one object that describes the text.
class ZELTA_EXPORT TextBasedDMFramework : public DescriptiveMetadataFramework {
 public:
  TextBasedDMFramework();
  ~TextBasedDMFramework() override;

  static std::shared_ptr<TextBasedDMFramework> create();

  std::shared_ptr<TextBasedObject> getTextBasedObject();
  std::shared_ptr<const TextBasedObject> getTextBasedObject() const;
  void setTextBasedObject(const std::shared_ptr<TextBasedObject>& textBasedObject);

 private:
  std::shared_ptr<TextBasedObject> textBasedObject_;
};

// What the text is; concrete, although its subclasses hold or name the text.
class ZELTA_EXPORT TextBasedObject : public DescriptiveMetadataObject {
 public:
  TextBasedObject();
  ~TextBasedObject() override;

  static std::shared_ptr<TextBasedObject> create();

  const KLVKey& getTextBasedMetadataPayloadSchemeID() const { return textBasedMetadataPayloadSchemeID_; }
  void setTextBasedMetadataPayloadSchemeID(const KLVKey& schemeID) { textBasedMetadataPayloadSchemeID_ = schemeID; }
  const std::wstring& getTextMIMEMediaType() const { return textMIMEMediaType_; }
  void setTextMIMEMediaType(const std::wstring& mediaType) { textMIMEMediaType_ = mediaType; }
  const std::wstring& getTextLanguageCode() const { return textLanguageCode_; }
  void setTextLanguageCode(const std::wstring& languageCode) { textLanguageCode_ = languageCode; }
  const std::wstring& getTextDataDescription() const;
  void setTextDataDescription(const std::wstring& description) { textDataDescription_ = description; }
  bool hasTextDataDescription() const { return textDataDescription_.has_value(); }
  void removeTextDataDescription() { textDataDescription_.reset(); }

 private:
  KLVKey textBasedMetadataPayloadSchemeID_;
  std::wstring textMIMEMediaType_;
  std::wstring textLanguageCode_;
  std::optional<std::wstring> textDataDescription_;
};

// The text is in the generic stream of this stream identifier.
class ZELTA_EXPORT GenericStreamTextBasedSet : public TextBasedObject {
 public:
  GenericStreamTextBasedSet();
  ~GenericStreamTextBasedSet() override;

  static std::shared_ptr<GenericStreamTextBasedSet> create();

  const std::uint32_t& getGenericStreamSID() const { return genericStreamSID_; }
  void setGenericStreamSID(const std::uint32_t& genericStreamSID) { genericStreamSID_ = genericStreamSID; }

 private:
  std::uint32_t genericStreamSID_ = 0;
};

// The text itself, as octets that nothing checks to be UTF-8.
class ZELTA_EXPORT UTF8TextBasedSet : public TextBasedObject {
 public:
  UTF8TextBasedSet();
  ~UTF8TextBasedSet() override;

  static std::shared_ptr<UTF8TextBasedSet> create();

  const std::string& getUTF8TextData() const { return utf8TextData_; }
  void setUTF8TextData(const std::string& utf8TextData) { utf8TextData_ = utf8TextData; }

 private:
  std::string utf8TextData_;
};

// The text itself, UTF-16 in the file.
class ZELTA_EXPORT UTF16TextBasedSet : public TextBasedObject {
 public:
  UTF16TextBasedSet();
  ~UTF16TextBasedSet() override;

  static std::shared_ptr<UTF16TextBasedSet> create();

  const std::wstring& getUTF16TextData() const { return utf16TextData_; }
  void setUTF16TextData(const std::wstring& utf16TextData) { utf16TextData_ = utf16TextData; }

 private:
  std::wstring utf16TextData_;
};

class TextBasedDMFrameworkFactory
    : public MetadataClassFactory<TextBasedDMFramework, DescriptiveMetadataFrameworkFactory> {};
class TextBasedObjectFactory : public MetadataClassFactory<TextBasedObject, DescriptiveMetadataObjectFactory> {};
// A text may outgrow two-octet item lengths, so these sets may come with
// BER ones.
class ZELTA_EXPORT GenericStreamTextBasedSetFactory
    : public MetadataClassFactory<GenericStreamTextBasedSet, TextBasedObjectFactory> {
 public:
  bool allowBERLengths() const override { return true; }
};
class ZELTA_EXPORT UTF8TextBasedSetFactory : public MetadataClassFactory<UTF8TextBasedSet, TextBasedObjectFactory> {
 public:
  bool allowBERLengths() const override { return true; }
};
class ZELTA_EXPORT UTF16TextBasedSetFactory : public MetadataClassFactory<UTF16TextBasedSet, TextBasedObjectFactory> {
 public:
  bool allowBERLengths() const override { return true; }
};

// The text-based classes, in search order.
class ZELTA_EXPORT MXFTextBasedDMModelFactory : public MXFMetadataModelFactory {
 public:
  MXFTextBasedDMModelFactory();
  ~MXFTextBasedDMModelFactory() override;

  const Factories& getFactories() override;

 private:
  Factories factories_;
};

#endif
