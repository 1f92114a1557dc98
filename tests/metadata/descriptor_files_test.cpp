// Descriptor sets of files written by other tools: each parses without a
// report and codes back to the same properties.
#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <string>
#include <vector>

#include "metadata.h"
#include "mxf.h"
#include "support/metadata_descriptor_sets.h"
#include "support/mxf_primed_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// The sets of the header partition's metadata.
std::vector<MXFPrimedSet> headerSets(const std::string& name) {
  RecordingMetadataHandler sets;
  RecordingErrorHandler errors;
  MXFMetadataParser parser(&sets);
  parser.setErrorHandler(&errors);
  DullMXFStructureHandler structure;
  DullKLVHandler index;
  DullKLVHandler essence;
  MXFSplitter splitter(&structure, &parser, &index, &essence, false);
  splitter.setErrorHandler(&errors);
  std::ifstream in(dataPath(name), std::ios::binary);
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  reader.setErrorHandler(&errors);
  reader.read(in);
  std::vector<MXFPrimedSet> header;
  for (std::size_t i = 0; i < sets.events.size() && sets.events[i] != "end"; ++i)
    if (sets.events[i].rfind("primedSet", 0) == 0) header.push_back(sets.sets.at(header.size()));
  return header;
}

// The properties that hold references: a single set leaves them pending.
const std::vector<KLVKey> referenceKeys{keyOf("06 0E 2B 34 01 01 01 02 06 01 01 04 06 03 00 00"),
                                        keyOf("06 0E 2B 34 01 01 01 09 06 01 01 04 06 10 00 00"),
                                        keyOf("06 0E 2B 34 01 01 01 04 06 01 01 04 06 0B 00 00")};

// The properties without the references, and the count of identifiers in
// those.
std::size_t withoutReferences(MXFPropertyMap& properties) {
  std::size_t identifiers = 0;
  for (const KLVKey& key : referenceKeys) {
    const MXFPropertyMap::const_iterator found = properties.find(key);
    if (found == properties.end()) continue;
    identifiers += found->second.at(3);
    properties.erase(found);
  }
  return identifiers;
}

// Each descriptor or locator set of the file through its factory; the
// octets 14 of their set keys in file order.
std::vector<int> expectRoundTrips(const std::string& name) {
  std::vector<std::shared_ptr<MetadataRootFactory>> factories{std::make_shared<CDCIPictureDescriptorFactory>(),
                                                              std::make_shared<RGBAPictureDescriptorFactory>(),
                                                              std::make_shared<SoundDescriptorFactory>(),
                                                              std::make_shared<DataDescriptorFactory>(),
                                                              std::make_shared<MultipleDescriptorFactory>(),
                                                              std::make_shared<NetworkLocatorFactory>(),
                                                              std::make_shared<TextLocatorFactory>()};
  std::vector<int> classes;
  for (const MXFPrimedSet& set : headerSets(name)) {
    for (const std::shared_ptr<MetadataRootFactory>& factory : factories) {
      if (!factory->canParse(set.key)) continue;
      classes.push_back(set.key[14]);
      const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
      const MXFParsedObject parsed = parseWith(*factory, set.properties, errors);
      EXPECT_EQ(std::vector<std::string>{}, modelReportLines(*errors)) << name << " " << toString(set.key);
      MXFPropertyMap read = set.properties;
      MXFPropertyMap coded = factory->code(parsed.object).set.properties;
      EXPECT_EQ(withoutReferences(read), parsed.references.size()) << name;
      withoutReferences(coded);
      EXPECT_EQ(read, coded) << name << " " << toString(set.key);
    }
  }
  return classes;
}

}  // namespace

TEST(DescriptorFiles, FFmpegD10PictureDescriptorRoundTrips) {
  EXPECT_EQ(std::vector<int>{0x28}, expectRoundTrips("ffmpeg_d10_50m_625_noaudio.mxf"));
}

TEST(DescriptorFiles, FFmpegDVDescriptorsRoundTrip) {
  EXPECT_EQ((std::vector<int>{0x44, 0x28}), expectRoundTrips("ffmpeg_dv25_625_420_2mono.mxf"));
}

TEST(DescriptorFiles, BmxD10DescriptorsRoundTrip) {
  EXPECT_EQ((std::vector<int>{0x44, 0x28, 0x42}), expectRoundTrips("bmx_d10_50m_625_8ch24.mxf"));
}

TEST(DescriptorFiles, GStreamerDVDescriptorsRoundTrip) {
  EXPECT_EQ((std::vector<int>{0x44, 0x28}), expectRoundTrips("gst_dv25_625_420_2mono.mxf"));
}
