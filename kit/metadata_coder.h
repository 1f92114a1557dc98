// The metadata side of the kit's writer: a model is coded into primed sets
// behind a primer that also serves the index segments, and the package item
// goes out as it stands.
#ifndef ZELTA_KIT_METADATA_CODER_H
#define ZELTA_KIT_METADATA_CODER_H

#include <memory>

#include "kit.h"

class ZeltaMetadataCoder : public ZeltaMetadataHandler {
 public:
  ZeltaMetadataCoder(KLVHandler* sink, const std::shared_ptr<MXFMetadataModelFactory>& factory);
  ~ZeltaMetadataCoder() override;
  ZeltaMetadataCoder(const ZeltaMetadataCoder&) = delete;
  ZeltaMetadataCoder& operator=(const ZeltaMetadataCoder&) = delete;

  void start() override;
  void end() override;
  void model(const MXFMetadataModel& objects) override;
  // Under the package item key, in the four-octet length form.
  void packageItem(const std::uint8_t* data, std::size_t size) override;

  void setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory);

 private:
  class ItemSink;
  std::unique_ptr<ItemSink> sink_;
  MXFMetadataPlusIndexPrimerCoder primerCoder_;
  std::unique_ptr<MXFMetadataModelCoder> modelCoder_;
};

#endif
