#include "support/metadata_structural.h"

#include <cstdio>

#include <gtest/gtest.h>

#include "support/mxf_primed_sets.h"

namespace zelta_test {

KLVKey propertyKeyOf(const std::string& tableKey) { return keyOf("06 0E 2B 34 01 01 01 " + tableKey); }

MXFKeyToTagMap structuralPrimer(const PrimerRows& rows) {
  MXFKeyToTagMap primer{{propertyKeyOf("01: 01 01 15 02 00 00 00 00"), 0x3C0A},
                        {propertyKeyOf("02: 05 20 07 01 08 00 00 00"), 0x0102}};
  for (const std::pair<std::string, std::uint16_t>& row : rows) primer[propertyKeyOf(row.first)] = row.second;
  return primer;
}

namespace {

std::vector<std::string> linesOf(const RecordingErrorHandler& errors) {
  std::vector<std::string> lines;
  for (const Report& report : errors.reports) {
    char octet[3];
    std::snprintf(octet, sizeof octet, "%02X", static_cast<unsigned>(report.identifier[3]));
    lines.push_back(report.severity + " " + octet + " " + report.message);
  }
  return lines;
}

}  // namespace

MXFParsedObject FactoryParse::parse(MXFMetadataFactory& factory, const MXFPrimedSet& set) {
  factory.setErrorHandler(errors);
  return factory.parse(set);
}

std::vector<std::string> FactoryParse::reports() const {
  for (const Report& report : errors->reports)
    EXPECT_EQ(ZeltaErrorId(0x4C, 0x4F, 0x00, report.identifier[3]), report.identifier);
  return linesOf(*errors);
}

MXFPropertyMap codeWith(MetadataRootFactory& factory, const std::shared_ptr<const MetadataRoot>& object,
                        MXFReferencedObjects& referenced) {
  MXFPropertyMap properties;
  factory.codeProperties(object, properties, referenced);
  return properties;
}

MXFPropertyMap codeWith(MetadataRootFactory& factory, const std::shared_ptr<const MetadataRoot>& object) {
  MXFReferencedObjects referenced;
  return codeWith(factory, object, referenced);
}

StructuralModelFactory::StructuralModelFactory()
    : factories_{std::make_shared<PrefaceFactory>(),           std::make_shared<IdentificationFactory>(),
                 std::make_shared<ContentStorageFactory>(),    std::make_shared<EssenceContainerDataFactory>(),
                 std::make_shared<SequenceFactory>(),          std::make_shared<SourceClipFactory>(),
                 std::make_shared<TimelineTrackFactory>(),     std::make_shared<EventTrackFactory>(),
                 std::make_shared<StaticTrackFactory>(),       std::make_shared<TimecodeComponentFactory>(),
                 std::make_shared<CommentMarkerFactory>(),     std::make_shared<DMSegmentFactory>(),
                 std::make_shared<DMSourceClipFactory>(),      std::make_shared<MaterialPackageFactory>(),
                 std::make_shared<SourcePackageFactory>(),     std::make_shared<GenericDescriptorFactory>(),
                 std::make_shared<DescriptiveMetadataFrameworkFactory>()} {}

std::vector<KLVKey> codedSetKeys(const std::shared_ptr<MetadataRoot>& root) {
  RecordingMetadataHandler sets;
  MXFMetadataModelCoder coder(&sets, std::make_shared<StructuralModelFactory>());
  coder.model(MXFMetadataModel{root});
  std::vector<KLVKey> keys;
  for (const MXFPrimedSet& set : sets.sets) keys.push_back(set.key);
  return keys;
}

namespace {

class KeepingModelHandler : public MXFMetadataModelHandler {
public:
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel& objects) override { kept = objects; }
  MXFMetadataModel kept;
};

}  // namespace

MXFMetadataModel ModelParse::parse(const std::vector<MXFPrimedSet>& sets) {
  KeepingModelHandler models;
  std::shared_ptr<StructuralModelFactory> factory = std::make_shared<StructuralModelFactory>();
  factory->setErrorHandler(errors);
  MXFMetadataModelParser parser(&models, factory);
  parser.setErrorHandler(errors.get());
  parser.start();
  for (const MXFPrimedSet& set : sets)
    if (parser.acceptSet(set.key)) parser.primedSet(set);
  parser.end();
  return models.kept;
}

std::vector<std::string> ModelParse::reports() const {
  for (const Report& report : errors->reports)
    EXPECT_EQ(ZeltaErrorId(0x4C, 0x4F, 0x00, report.identifier[3]), report.identifier);
  return linesOf(*errors);
}

}  // namespace zelta_test
