#include "support/model_reading.h"

#include <exception>
#include <fstream>
#include <memory>
#include <sstream>
#include <typeinfo>

#include "klv.h"
#include "mxf.h"

namespace zelta_test {

namespace {

// Counts the partitions that began, so that the handlers below can tell the
// header partition from the others.
class PartitionCounter : public DullMXFStructureHandler {
public:
  explicit PartitionCounter(int& count) : count_(count) {}
  void startPartition(const KLVKey&, const MXFPartitionPack&, std::uint64_t) override { ++count_; }

private:
  int& count_;
};

// Keeps reports: all of them, or with a partition count only those made
// while the first partition is read.
class KeptReports : public ErrorHandler {
public:
  explicit KeptReports(std::vector<Report>& reports, const int* partitions = nullptr)
      : reports_(reports), partitions_(partitions) {}
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID& id, const std::string& message) override { add("warning", id, message); }
  void error(const MXFUID& id, const std::string& message) override { add("error", id, message); }
  void fatalError(const MXFUID& id, const std::string& message) override { add("fatal", id, message); }

private:
  void add(const char* severity, const MXFUID& id, const std::string& message) {
    if (partitions_ == nullptr || *partitions_ == 1) reports_.push_back(Report{severity, id, message});
  }
  std::vector<Report>& reports_;
  const int* partitions_;
};

// Keeps the models of the first partition.
class HeaderModelKeeper : public MXFMetadataModelHandler {
public:
  explicit HeaderModelKeeper(HeaderModel& result) : result_(result) {}
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel& objects) override {
    if (result_.partitions != 1) return;
    ++result_.modelCount;
    result_.model = objects;
  }

private:
  HeaderModel& result_;
};

// Keeps every model, for the stream read back from memory.
class ModelKeeper : public MXFMetadataModelHandler {
public:
  explicit ModelKeeper(MXFMetadataModel& model) : model_(model) {}
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel& objects) override { model_ = objects; }

private:
  MXFMetadataModel& model_;
};

std::string typeName(const MetadataRoot& object) { return typeid(object).name(); }

std::string propertyDifference(const MXFPropertyMap& expected, const MXFPropertyMap& actual, const std::string& path) {
  for (const auto& [key, value] : expected) {
    const auto found = actual.find(key);
    if (found == actual.end()) return path + ": property " + toString(key) + " is missing";
    // Key order skips the version octet; the keys themselves must agree in all.
    if (toString(found->first) != toString(key)) return path + ": property " + toString(key) + " changed its key";
    if (found->second != value) return path + ": property " + toString(key) + " differs";
  }
  for (const auto& entry : actual)
    if (expected.count(entry.first) == 0) return path + ": property " + toString(entry.first) + " is extra";
  return {};
}

std::string objectDifference(MXFMetadataFactory& factory, const std::shared_ptr<const MetadataRoot>& expected,
                             const std::shared_ptr<const MetadataRoot>& actual, const std::string& path) {
  if (!expected || !actual) return path + ": null object";
  const MetadataRoot& object = *expected;
  const std::string here = path + "/" + typeName(object);
  if (typeName(object) != typeName(*actual)) return here + ": class " + typeName(*actual);
  if (!factory.canCode(typeid(object))) return here + ": class that the factory can't code";
  const MXFCodedObject left = factory.code(expected);
  const MXFCodedObject right = factory.code(actual);
  if (toString(left.set.key) != toString(right.set.key)) return here + ": set key " + toString(right.set.key);
  const std::string properties = propertyDifference(left.set.properties, right.set.properties, here);
  if (!properties.empty()) return properties;
  if (left.referenced.size() != right.referenced.size()) return here + ": number of owned objects";
  auto other = right.referenced.begin();
  for (const std::shared_ptr<const MetadataRoot>& child : left.referenced) {
    const std::string difference = objectDifference(factory, child, *other++, here);
    if (!difference.empty()) return difference;
  }
  return {};
}

std::shared_ptr<MXFMetadataModelFactory> formatFactory() { return std::make_shared<MXFFormatMetadataModelFactory>(); }

}  // namespace

HeaderModel readHeaderModel(const std::string& name) { return readHeaderModel(name, formatFactory); }

HeaderModel readHeaderModel(const std::string& name, const ModelFactoryMaker& makeFactory) {
  HeaderModel result;
  RecordingErrorHandler readerErrors;
  PartitionCounter counter(result.partitions);
  HeaderModelKeeper keeper(result);
  auto modelErrors = std::make_shared<KeptReports>(result.modelReports, &result.partitions);
  const std::shared_ptr<MXFMetadataModelFactory> factory = makeFactory();
  factory->setErrorHandler(modelErrors);
  MXFMetadataModelParser modelParser(&keeper, factory);
  modelParser.setErrorHandler(modelErrors.get());
  MXFMetadataParser metadataParser(&modelParser);

  MXFReader reader;
  reader.setStructureHandler(&counter);
  reader.setMetadataHandler(&metadataParser);
  reader.setErrorHandler(&readerErrors);
  std::ifstream stream(dataPath(name), std::ios::binary);
  try {
    reader.read(stream);
  } catch (const std::exception& exception) {
    result.failure = exception.what();
  }
  result.readerReports = readerErrors.reports;
  return result;
}

RewrittenModel rewriteModel(const MXFMetadataModel& model) { return rewriteModel(model, formatFactory); }

RewrittenModel rewriteModel(const MXFMetadataModel& model, const ModelFactoryMaker& makeFactory) {
  RewrittenModel result;
  std::ostringstream out;
  {
    GenericKLVWriter writer(out);
    MXFMetadataCoder metadataCoder(&writer);
    MXFMetadataModelCoder modelCoder(&metadataCoder, makeFactory());
    modelCoder.start();
    modelCoder.model(model);
    modelCoder.end();
  }
  const std::string octets = out.str();
  result.bytes.assign(octets.begin(), octets.end());

  auto errors = std::make_shared<KeptReports>(result.reports);
  const std::shared_ptr<MXFMetadataModelFactory> factory = makeFactory();
  factory->setErrorHandler(errors);
  ModelKeeper keeper(result.model);
  MXFMetadataModelParser modelParser(&keeper, factory);
  modelParser.setErrorHandler(errors.get());
  MXFMetadataParser metadataParser(&modelParser);
  metadataParser.setErrorHandler(errors.get());
  GenericKLVReader reader;
  reader.setHandler(&metadataParser);
  reader.setErrorHandler(errors.get());
  std::istringstream in(octets);
  reader.read(in);
  return result;
}

std::string modelDifference(const MXFMetadataModel& expected, const MXFMetadataModel& actual) {
  MXFFormatMetadataModelFactory factory;
  return modelDifference(expected, actual, factory);
}

std::string modelDifference(const MXFMetadataModel& expected, const MXFMetadataModel& actual,
                            MXFMetadataFactory& factory) {
  if (expected.size() != actual.size()) return "number of roots";
  for (std::size_t index = 0; index < expected.size(); ++index) {
    const std::string difference = objectDifference(factory, expected[index], actual[index], "");
    if (!difference.empty()) return difference;
  }
  return {};
}

}  // namespace zelta_test
