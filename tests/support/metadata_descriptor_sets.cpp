#include "support/metadata_descriptor_sets.h"

#include <gtest/gtest.h>

namespace zelta_test {

namespace {

class KeepingModelHandler : public MXFMetadataModelHandler {
public:
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel& objects) override { models.push_back(objects); }

  std::vector<MXFMetadataModel> models;
};

}  // namespace

KLVKey propertyKeyOf(std::uint8_t version, const std::string& tail) {
  ByteVector octets{0x06, 0x0E, 0x2B, 0x34, 0x01, 0x01, 0x01, version};
  const ByteVector rest = bytesOf(tail);
  octets.insert(octets.end(), rest.begin(), rest.end());
  return KLVKey(octets.data());
}

KLVKey keyOfTag(const StaticTags& tags, std::uint16_t tag) {
  for (const auto& entry : tags)
    if (entry.first == tag) return entry.second;
  return KLVKey();
}

void expectTags(const MXFKeyToTagMap& primer, const StaticTags& tags) {
  for (const auto& tag : tags) {
    ASSERT_EQ(1u, primer.count(tag.second)) << std::hex << tag.first;
    EXPECT_EQ(tag.first, primer.at(tag.second)) << std::hex << tag.first;
  }
}

MXFParsedObject parseWith(MetadataRootFactory& factory, const MXFPropertyMap& properties,
                          const std::shared_ptr<RecordingErrorHandler>& errors) {
  factory.setErrorHandler(errors);
  MXFPrimedSet set;
  set.key = factory.getSetKey();
  set.properties = properties;
  return factory.parse(set);
}

std::vector<std::string> modelReportLines(const RecordingErrorHandler& errors) {
  std::vector<std::string> lines;
  for (const Report& report : errors.reports)
    lines.push_back(report.severity + " " + std::to_string(report.identifier[3]) + " " + report.message);
  return lines;
}

DescriptorModelFactory::DescriptorModelFactory()
    : factories_{std::make_shared<NetworkLocatorFactory>(),
                 std::make_shared<TextLocatorFactory>(),
                 std::make_shared<ContainerConstraintsSubDescriptorFactory>(),
                 std::make_shared<CDCIPictureDescriptorFactory>(),
                 std::make_shared<RGBAPictureDescriptorFactory>(),
                 std::make_shared<SoundDescriptorFactory>(),
                 std::make_shared<DataDescriptorFactory>(),
                 std::make_shared<MultipleDescriptorFactory>()} {}

std::vector<MXFMetadataModel> parseModels(const std::vector<MXFPrimedSet>& sets,
                                          const std::shared_ptr<RecordingErrorHandler>& errors) {
  const std::shared_ptr<DescriptorModelFactory> factory = std::make_shared<DescriptorModelFactory>();
  factory->setErrorHandler(errors);
  KeepingModelHandler handler;
  MXFMetadataModelParser parser(&handler, factory);
  parser.setErrorHandler(errors.get());
  parser.start();
  for (const MXFPrimedSet& set : sets)
    if (parser.acceptSet(set.key)) parser.primedSet(set);
  parser.end();
  return handler.models;
}

}  // namespace zelta_test
