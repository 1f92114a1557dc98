// A source that serves what the kit's reader finds in a file: its master
// and its edit units, so that the driver writes the file again.
#ifndef ZELTA_TESTS_SUPPORT_KIT_TRANSWRAP_H
#define ZELTA_TESTS_SUPPORT_KIT_TRANSWRAP_H

#include <memory>
#include <string>
#include <vector>

#include "kit.h"

namespace zelta_test {

// The essence of one edit unit: the picture or compound element, the sound
// elements in file order and the data element.
struct UnitEssence {
  ByteVector picture;
  std::vector<ByteVector> sounds;
  ByteVector data;
};

class TranswrapSource : public ZeltaSource {
 public:
  // Reads the whole file; "model has a Preface" when it has none.
  explicit TranswrapSource(const std::string& path);

  std::shared_ptr<const ZeltaMasterMetadata> getMasterMetadata() override { return master_; }
  std::shared_ptr<MXFUIDGenerator> getUIDGenerator() override { return nullptr; }
  bool hasPictureMetadata() override { return false; }
  bool isIndexDeferred() override { return false; }
  // Constant size frames when the file's index counts octets per edit unit.
  std::uint32_t getAVCWrapping() override { return constantSize_ ? 1 : 0; }
  bool hasMoreEditUnits() override { return next_ < units_.size(); }
  MXFSDTICPTimeStamp getUserStamp() override { return MXFSDTICPTimeStamp{}; }
  MXFGCLocalItems getPackageMetadata() override { return {}; }
  MXFGCLocalItems getPictureMetadata() override { return {}; }
  std::shared_ptr<ZeltaBuffer> getD10Picture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getD10Sound() override { return sound(0); }
  std::shared_ptr<ZeltaBuffer> getDVElement() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getMPEGPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getRawPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getAVCPicture() override { return picture(); }
  std::shared_ptr<ZeltaBuffer> getSound(std::uint32_t channel) override { return sound(channel); }
  std::shared_ptr<ZeltaBuffer> getAncillaryData() override;

  const std::vector<UnitEssence>& getUnits() const { return units_; }

 private:
  // The picture getter begins the next edit unit.
  std::shared_ptr<ZeltaBuffer> picture();
  std::shared_ptr<ZeltaBuffer> sound(std::size_t index);

  std::shared_ptr<const ZeltaMasterMetadata> master_;
  std::vector<UnitEssence> units_;
  std::size_t next_ = 0;
  bool constantSize_ = false;
};

}  // namespace zelta_test

#endif
