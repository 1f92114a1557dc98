#include <iostream>
#include <memory>

#include "kit.h"
#include "kit/fill_item_key_mode.h"
#include "kit/metadata_coder.h"
#include "kit/system_coder.h"
#include "kit/write_gatherer.h"

namespace {

// Each coder is built on the KLV sink that the one before it exposes.
class ZeltaWriterImpl : public ZeltaWriter {
 public:
  explicit ZeltaWriterImpl(const std::shared_ptr<std::ostream>& output)
      : output_(output),
        gathered_(*output),
        writer_(gathered_),
        structureFilter_(writer_.getStructureHandler(), gathered_),
        factory_(createZeltaDefaultMetadataFactory()),
        metadataCoder_(writer_.getMetadataHandler(), factory_),
        indexCoder_(writer_.getIndexHandler()),
        essenceCoder_(writer_.getEssenceHandler()),
        systemCoder_(essenceCoder_.getSystemHandler()) {}

  void setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory) override {
    factory_ = factory ? factory : createZeltaDefaultMetadataFactory();
    metadataCoder_.setMetadataFactory(factory_);
  }
  void setIndexKagSize(std::uint32_t kagSize) override { indexCoder_.setKagSize(kagSize); }
  MXFStructureHandler* getStructureHandler() override { return &structureFilter_; }
  ZeltaMetadataHandler* getMetadataHandler() override { return &metadataCoder_; }
  MXFIndexHandler* getIndexHandler() override { return &indexCoder_; }
  Locator* getLocator(std::uint32_t) override { return essenceCoder_.getLocator(); }
  MXFGCStructureHandler* getGCStructureHandler() override { return essenceCoder_.getStructureHandler(); }
  MXFSDTICPSystemHandler* getSDTICPHandler() override { return systemCoder_.getSDTICPHandler(); }
  MXFQMProxySystemHandler* getProxyHandler() override { return systemCoder_.getProxyHandler(); }
  MXFGCEssenceHandler* getEssenceHandler() override { return essenceCoder_.getEssenceHandler(); }
  MXFWriter* getMXFWriter() override { return &writer_; }

  // What is gathered reaches the client's stream.
  void flush() {
    gathered_.flush();
    util::requireWritten(gathered_);
  }

 private:
  std::shared_ptr<std::ostream> output_;
  zelta::GatheringStream gathered_;
  MXFWriter writer_;
  FillItemKeyModeStructureFilter structureFilter_;
  std::shared_ptr<MXFMetadataModelFactory> factory_;
  ZeltaMetadataCoder metadataCoder_;
  MXFIndexCoder indexCoder_;
  MXFGCMuxer essenceCoder_;
  ZeltaSystemCoder systemCoder_;
};

// While verifying, the writer's output goes to a handler that compares it
// with the stream.
class VerifyingZeltaWriterImpl : public VerifyingZeltaWriter {
 public:
  explicit VerifyingZeltaWriterImpl(const std::shared_ptr<std::iostream>& stream)
      : writer_(std::make_shared<ZeltaWriterImpl>(stream)), verifier_(*stream, writer_->getMXFWriter()->getHandler()) {}

  void setVerifying(bool verifying) override {
    writer_->flush();
    if (verifying)
      writer_->getMXFWriter()->setHandler(&verifier_);
    else
      writer_->getMXFWriter()->resetHandler();
  }

  void setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory) override {
    writer_->setMetadataFactory(factory);
  }
  void setIndexKagSize(std::uint32_t kagSize) override { writer_->setIndexKagSize(kagSize); }
  MXFStructureHandler* getStructureHandler() override { return writer_->getStructureHandler(); }
  ZeltaMetadataHandler* getMetadataHandler() override { return writer_->getMetadataHandler(); }
  MXFIndexHandler* getIndexHandler() override { return writer_->getIndexHandler(); }
  Locator* getLocator(std::uint32_t bodySID) override { return writer_->getLocator(bodySID); }
  MXFGCStructureHandler* getGCStructureHandler() override { return writer_->getGCStructureHandler(); }
  MXFSDTICPSystemHandler* getSDTICPHandler() override { return writer_->getSDTICPHandler(); }
  MXFQMProxySystemHandler* getProxyHandler() override { return writer_->getProxyHandler(); }
  MXFGCEssenceHandler* getEssenceHandler() override { return writer_->getEssenceHandler(); }
  MXFWriter* getMXFWriter() override { return writer_->getMXFWriter(); }

 private:
  std::shared_ptr<ZeltaWriterImpl> writer_;
  VerifyingKLVHandler verifier_;
};

}  // namespace

ZeltaWriter::~ZeltaWriter() = default;

std::shared_ptr<ZeltaWriter> createZeltaWriter(const std::shared_ptr<std::ostream>& output) {
  check(output != nullptr, "output stream is present");
  return std::make_shared<ZeltaWriterImpl>(output);
}

std::shared_ptr<VerifyingZeltaWriter> createVerifyingZeltaWriter(const std::shared_ptr<std::iostream>& stream) {
  check(stream != nullptr, "input-output stream is present");
  return std::make_shared<VerifyingZeltaWriterImpl>(stream);
}
