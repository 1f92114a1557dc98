#include "support/kit_readers.h"

#include <cstdio>
#include <exception>
#include <fstream>
#include <memory>
#include <string>
#include <vector>

namespace zelta_test {

namespace {

// Each system element to the parser of its kind, as the kit's reader does.
class SystemDispatch : public MXFGCSystemHandler {
 public:
  SystemDispatch(MXFGCSystemHandler& sdticp, MXFGCSystemHandler& proxy) : sdticp_(sdticp), proxy_(proxy) {}
  bool startSystemElement(const KLVKey& key) override {
    current_ = MXFQMProxySystemElementPattern.matches(key) ? &proxy_ : &sdticp_;
    return current_->startSystemElement(key);
  }
  void systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) override {
    current_->systemLocalSet(key, items);
  }
  void systemFixedPack(const KLVKey& key, const ByteVector& bytes) override { current_->systemFixedPack(key, bytes); }
  void systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) override {
    current_->systemVariablePack(key, items);
  }

 private:
  MXFGCSystemHandler& sdticp_;
  MXFGCSystemHandler& proxy_;
  MXFGCSystemHandler* current_ = nullptr;
};

template <typename Read>
void recordFailure(ReadRecord& record, Read read) {
  try {
    read();
  } catch (const std::exception& failure) {
    record.failure = failure.what();
  }
}

bool isKitReport(const Report& report) { return report.identifier[0] == 0x4C && report.identifier[1] == 0x50; }

}  // namespace

void RecordingZeltaMetadataHandler::model(const MXFMetadataModel& objects) {
  events.push_back("model " + std::to_string(objects.size()));
  models.push_back(objects);
}

void RecordingZeltaMetadataHandler::packageItem(const std::uint8_t* data, std::size_t size) {
  events.push_back("packageItem " + std::to_string(size));
  items.emplace_back(data, data + size);
}

void RecordingProxyHandler::proxySystem(std::uint32_t frameCount, const std::vector<MXFQMProxyTimecode>& timecodes) {
  events.push_back("proxySystem " + std::to_string(frameCount) + " " + std::to_string(timecodes.size()));
}

void readThroughLowerLayers(const std::string& path, ReadRecord& record) {
  std::ifstream file(path, std::ios::binary);
  MXFReader reader;
  reader.setSkipRunIn(true);
  reader.setErrorHandler(&record.errors);
  reader.setStructureHandler(&record.structure);
  std::shared_ptr<MXFMetadataModelFactory> factory = createZeltaDefaultMetadataFactory();
  const std::shared_ptr<ErrorHandler> errors = borrowed<ErrorHandler>(record.errors);
  factory->setErrorHandler(errors);
  MXFMetadataModelParser modelParser(&record.metadata, factory);
  modelParser.setErrorHandler(&record.errors);
  MXFMetadataParser metadataParser(&modelParser);
  metadataParser.setErrorHandler(&record.errors);
  reader.setMetadataHandler(&metadataParser);
  MXFIndexParser indexParser(&record.index);
  indexParser.setErrorHandler(&record.errors);
  reader.setIndexHandler(&indexParser);
  MXFSDTICPSystemParser sdticp(&record.sdticp);
  sdticp.setErrorHandler(&record.errors);
  MXFQMProxySystemParser proxy(&record.proxy);
  proxy.setErrorHandler(&record.errors);
  SystemDispatch system(sdticp, proxy);
  MXFGCSplitter splitter(&record.gc, &system, &record.gc);
  splitter.setErrorHandler(&record.errors);
  reader.setEssenceHandler(&splitter);
  recordFailure(record, [&] { reader.read(file); });
}

void readThroughZeltaReader(const std::string& path, ReadRecord& record, bool withErrorHandler) {
  readThroughZeltaReader(std::make_shared<std::ifstream>(path, std::ios::binary), record, withErrorHandler);
}

void readThroughZeltaReader(const std::shared_ptr<std::istream>& input, ReadRecord& record, bool withErrorHandler) {
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(input);
  reader->setStructureHandler(borrowed<MXFStructureHandler>(record.structure));
  reader->setMetadataHandler(borrowed<ZeltaMetadataHandler>(record.metadata));
  reader->setIndexHandler(borrowed<MXFIndexHandler>(record.index));
  reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(record.gc));
  reader->setSDTICPHandler(borrowed<MXFSDTICPSystemHandler>(record.sdticp));
  reader->setProxyHandler(borrowed<MXFQMProxySystemHandler>(record.proxy));
  reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(record.gc));
  if (withErrorHandler) reader->setErrorHandler(borrowed<ErrorHandler>(record.errors));
  recordFailure(record, [&] { reader->read(); });
}

std::vector<std::string> reportLines(const std::vector<Report>& reports) {
  std::vector<std::string> lines;
  for (const Report& report : reports)
    lines.push_back(report.severity + " " + hexOf(ByteVector(report.identifier.data(), report.identifier.data() + 16)) +
                    " " + report.message);
  return lines;
}

std::vector<Report> withoutKitReports(const std::vector<Report>& reports) {
  std::vector<Report> kept;
  for (const Report& report : reports)
    if (!isKitReport(report)) kept.push_back(report);
  return kept;
}

std::vector<Report> kitReports(const std::vector<Report>& reports) {
  std::vector<Report> kept;
  for (const Report& report : reports)
    if (isKitReport(report)) kept.push_back(report);
  return kept;
}

std::vector<std::string> kitFindings(const std::vector<Report>& reports) {
  std::vector<std::string> lines;
  for (const Report& report : kitReports(reports)) {
    char code[3];
    std::snprintf(code, sizeof code, "%02X", report.identifier[3]);
    lines.push_back(report.severity + " " + code + " " + report.message);
  }
  return lines;
}

}  // namespace zelta_test
