#include "support/mxf_rewrap.h"

#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <sstream>

#include "support/mxf_streams.h"

namespace zelta_test {

namespace {

class PartitionCollector : public DullMXFStructureHandler {
public:
  explicit PartitionCollector(Capture& capture) : capture_(capture) {}
  void startPartition(const KLVKey& key, const MXFPartitionPack& pack, std::uint64_t) override {
    capture_.partitions.emplace_back();
    capture_.partitions.back().key = key;
    capture_.partitions.back().pack = pack;
  }

private:
  Capture& capture_;
};

class MetadataCollector : public MXFMetadataHandler {
public:
  explicit MetadataCollector(Capture& capture) : capture_(capture) {}
  void start() override { capture_.partitions.back().hasMetadata = true; }
  void end() override {}
  void primer(const MXFPrimerEntries& entries) override { capture_.partitions.back().primer = entries; }
  bool acceptSet(const KLVKey&) override { return true; }
  void primedSet(const MXFPrimedSet& set) override { capture_.partitions.back().sets.push_back(set); }

private:
  Capture& capture_;
};

class IndexCollector : public MXFIndexHandler {
public:
  explicit IndexCollector(Capture& capture) : capture_(capture) {}
  void startIndex() override { capture_.partitions.back().hasIndex = true; }
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment& segment) override {
    capture_.partitions.back().segments.push_back(segment);
  }

private:
  Capture& capture_;
};

// Writes each essence section back into octets, as it came; a section that
// begins without a length form gets the last one seen.
class EssenceCollector : public DullKLVFilter {
public:
  explicit EssenceCollector(Capture& capture) : capture_(capture) {}
  void setLocator(Locator*) override {}
  void startStream(bool hasAccurateLengths) override {
    out_.reset(new std::ostringstream);
    writer_.reset(new GenericKLVWriter(*out_));
    setHandler(writer_.get());
    DullKLVFilter::startStream(hasAccurateLengths);
    if (form_ != 0) DullKLVFilter::setLengthForm(form_);
  }
  void setLengthForm(std::uint8_t form) override {
    form_ = form;
    DullKLVFilter::setLengthForm(form);
  }
  void endStream(bool aborted) override {
    DullKLVFilter::endStream(aborted);
    const std::string text = out_->str();
    ByteVector& essence = capture_.partitions.back().essence;
    essence.insert(essence.end(), text.begin(), text.end());
  }

private:
  Capture& capture_;
  std::unique_ptr<std::ostringstream> out_;
  std::unique_ptr<GenericKLVWriter> writer_;
  std::uint8_t form_ = 0;
};

void codeMetadata(const Partition& partition, KLVHandler* handler) {
  MXFMetadataCoder coder(handler);
  coder.start();
  coder.primer(partition.primer);
  for (const MXFPrimedSet& set : partition.sets) coder.primedSet(set);
  coder.end();
}

void codeIndex(const Partition& partition, KLVHandler* handler) {
  MXFIndexCoder coder(handler);
  coder.setKagSize(partition.pack.kagSize);
  coder.startIndex();
  for (const MXFIndexTableSegment& segment : partition.segments) coder.indexTableSegment(segment);
  coder.endIndex();
}

// What a region takes when coded alone, with room for a fill item, rounded
// up to the KAG.
template <typename Code>
std::uint64_t regionSize(const Partition& partition, Code code) {
  std::ostringstream out;
  GenericKLVWriter writer(out);
  code(partition, &writer);
  const std::uint64_t kag = partition.pack.kagSize == 0 ? 1 : partition.pack.kagSize;
  const std::uint64_t needed = out.str().size() + 20;
  return (needed + kag - 1) / kag * kag;
}

void writePartition(MXFWriter& writer, const Partition& partition, const EssenceRewriter& rewriteEssence) {
  MXFPartitionPack pack = partition.pack;
  pack.footerPartition = 0;
  pack.headerByteCount = partition.hasMetadata ? regionSize(partition, codeMetadata) : 0;
  pack.indexByteCount = partition.hasIndex ? regionSize(partition, codeIndex) : 0;
  writer.getStructureHandler()->startPartition(partition.key, pack, 0);
  if (partition.hasMetadata) codeMetadata(partition, writer.getMetadataHandler());
  if (partition.hasIndex) codeIndex(partition, writer.getIndexHandler());
  if (!partition.essence.empty()) rewriteEssence(partition.essence, writer.getEssenceHandler());
  writer.getStructureHandler()->endPartition(partition.key);
}

}  // namespace

void capture(std::istream& stream, Capture& result) {
  PartitionCollector structure(result);
  MetadataCollector metadata(result);
  MXFMetadataParser metadataParser(&metadata);
  IndexCollector index(result);
  MXFIndexParser indexParser(&index);
  EssenceCollector essence(result);
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setStructureHandler(&structure);
  reader.setMetadataHandler(&metadataParser);
  reader.setIndexHandler(&indexParser);
  reader.setEssenceHandler(&essence);
  reader.setErrorHandler(&result.errors);
  reader.read(stream);
}

void captureFile(const std::string& name, Capture& result) {
  std::ifstream stream(dataPath(name), std::ios::binary);
  ASSERT_TRUE(stream.good()) << name;
  capture(stream, result);
}

void rewriteAsKLV(const ByteVector& essence, KLVHandler* handler) { readThrough(essence, *handler); }

ByteVector rewrap(const Capture& original, const EssenceRewriter& essence) {
  std::ostringstream out;
  {
    MXFWriter writer(out);
    writer.getStructureHandler()->startStream();
    for (const Partition& partition : original.partitions) writePartition(writer, partition, essence);
    writer.getStructureHandler()->randomIndex({});
    writer.getStructureHandler()->endStream(false);
  }
  const std::string text = out.str();
  return ByteVector(text.begin(), text.end());
}

}  // namespace zelta_test
