#include "support/kit_transwrap.h"

#include <fstream>

#include "support/kit_readers.h"
#include "support/kit_sources.h"

namespace zelta_test {

namespace {

// Each edit unit's elements, copied as they pass.
class UnitCollector : public DullMXFGCStructureHandler, public DullMXFGCEssenceHandler {
 public:
  explicit UnitCollector(std::vector<UnitEssence>& units) : units_(units) {}

  void startEditUnit() override { units_.emplace_back(); }
  bool startEssenceElement(const KLVKey&, std::uint64_t, std::uint8_t*&) override { return !units_.empty(); }
  void pictureElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    units_.back().picture.assign(data, data + length);
  }
  void compoundElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    units_.back().picture.assign(data, data + length);
  }
  void soundElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    units_.back().sounds.emplace_back(data, data + length);
  }
  void dataElement(const KLVKey&, const std::uint8_t* data, std::uint64_t length) override {
    units_.back().data.assign(data, data + length);
  }

 private:
  std::vector<UnitEssence>& units_;
};

std::shared_ptr<ZeltaBuffer> bufferOf(const ByteVector& bytes) { return std::make_shared<VectorBuffer>(bytes); }

}  // namespace

TranswrapSource::TranswrapSource(const std::string& path) {
  RecordingZeltaMetadataHandler metadata;
  RecordingIndexHandler index;
  UnitCollector collector(units_);
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(std::make_shared<std::ifstream>(path, std::ios::binary));
  reader->setMetadataHandler(borrowed<ZeltaMetadataHandler>(metadata));
  reader->setIndexHandler(borrowed<MXFIndexHandler>(index));
  reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(collector));
  reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(collector));
  reader->read();
  check(!metadata.models.empty() && !metadata.models.front().empty(), "model has a Preface");
  for (const MXFIndexTableSegment& segment : index.segments)
    if (segment.editUnitByteCount != 0) constantSize_ = true;
  master_ = createZeltaMasterMetadata(std::dynamic_pointer_cast<const Preface>(metadata.models.front().front()));
}

std::shared_ptr<ZeltaBuffer> TranswrapSource::picture() { return bufferOf(units_.at(next_++).picture); }

std::shared_ptr<ZeltaBuffer> TranswrapSource::sound(std::size_t index) {
  const UnitEssence& unit = units_.at(next_ - 1);
  return index < unit.sounds.size() ? bufferOf(unit.sounds[index]) : nullptr;
}

std::shared_ptr<ZeltaBuffer> TranswrapSource::getAncillaryData() { return bufferOf(units_.at(next_ - 1).data); }

}  // namespace zelta_test
