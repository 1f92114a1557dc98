#include "validate.h"

#include <exception>
#include <fstream>
#include <memory>

#include "kit.h"

namespace zelta_info {

namespace {

// The first read reported what the lower layers find; of this one only the
// kit's findings (identifiers 4c50xxxx) go on.
class KitFindings : public ErrorHandler {
 public:
  explicit KitFindings(ErrorHandler& reports) : reports_(reports) {}
  void setLocator(Locator*) override {}
  void start() override {}
  void end() override {}
  void warning(const MXFUID& id, const std::string& message) override {
    if (isKit(id)) reports_.warning(id, message);
  }
  void error(const MXFUID& id, const std::string& message) override {
    if (isKit(id)) reports_.error(id, message);
  }
  void fatalError(const MXFUID&, const std::string&) override {}

 private:
  static bool isKit(const MXFUID& id) {
    return id[0] == kitEssenceContainersId[0] && id[1] == kitEssenceContainersId[1];
  }
  ErrorHandler& reports_;
};

class Models : public ZeltaMetadataHandler {
 public:
  void start() override {}
  void end() override {}
  void model(const MXFMetadataModel&) override {}
  void packageItem(const std::uint8_t*, std::size_t) override {}
};

class Segments : public MXFIndexHandler {
 public:
  void startIndex() override {}
  void endIndex() override {}
  void indexTableSegment(const MXFIndexTableSegment&) override {}
};

}  // namespace

void validateFile(const std::string& path, ErrorHandler& reports) {
  auto findings = std::make_shared<KitFindings>(reports);
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(std::make_shared<std::ifstream>(path, std::ios::binary));
  reader->setStructureHandler(std::make_shared<DullMXFStructureHandler>());
  reader->setMetadataHandler(std::make_shared<Models>());
  reader->setIndexHandler(std::make_shared<Segments>());
  reader->setSDTICPHandler(std::make_shared<DullMXFSDTICPSystemHandler>());
  reader->setErrorHandler(findings);
  try {
    reader->read();
  } catch (const std::exception&) {
    // The first read reported how the file ends.
  }
}

}  // namespace zelta_info
