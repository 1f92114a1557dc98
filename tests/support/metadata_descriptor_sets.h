// Helpers for the tests of locators and descriptors: keys spelled as the
// tables give them, one-set parses through a class factory, and a composite
// over the locator and descriptor factories.
#ifndef ZELTA_TESTS_SUPPORT_METADATA_DESCRIPTOR_SETS_H
#define ZELTA_TESTS_SUPPORT_METADATA_DESCRIPTOR_SETS_H

#include <cstdint>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "metadata.h"
#include "support/recording.h"

namespace zelta_test {

// 06 0E 2B 34 01 01 01, the version octet, then the eight octets of tail
// ("04 01 05 03 0A 00 00 00").
KLVKey propertyKeyOf(std::uint8_t version, const std::string& tail);

// A static tag and its property key.
typedef std::vector<std::pair<std::uint16_t, KLVKey>> StaticTags;

// The key of a tag among them; a default key when it isn't there.
KLVKey keyOfTag(const StaticTags& tags, std::uint16_t tag);

// Expects each of the tags under its key in a set primer.
void expectTags(const MXFKeyToTagMap& primer, const StaticTags& tags);

// One set through a class factory whose reports go to errors.
MXFParsedObject parseWith(MetadataRootFactory& factory, const MXFPropertyMap& properties,
                          const std::shared_ptr<RecordingErrorHandler>& errors);

// The same through a new factory, as the factory's class; null when the
// factory made something else.
template <typename Factory, typename Object>
std::shared_ptr<Object> parsedAs(const MXFPropertyMap& properties,
                                 const std::shared_ptr<RecordingErrorHandler>& errors) {
  Factory factory;
  return std::dynamic_pointer_cast<Object>(parseWith(factory, properties, errors).object);
}

// Each report as "error 2 missing X": severity, octet 3 of the identifier,
// message.
std::vector<std::string> modelReportLines(const RecordingErrorHandler& errors);

// The locator and descriptor factories under one composite.
class DescriptorModelFactory : public MXFMetadataModelFactory {
public:
  DescriptorModelFactory();
  const Factories& getFactories() override { return factories_; }

private:
  Factories factories_;
};

// The models of one parse through the composite.
std::vector<MXFMetadataModel> parseModels(const std::vector<MXFPrimedSet>& sets,
                                          const std::shared_ptr<RecordingErrorHandler>& errors);

}  // namespace zelta_test

#endif
