#include <istream>
#include <memory>
#include <optional>

#include "kit.h"
#include "kit/essence_splitter.h"
#include "kit/metadata_parser.h"
#include "kit/system_parser.h"
#include "kit/validators/index_validator.h"
#include "kit/validators/structure_validator.h"
#include "kit/validators/system_validator.h"

namespace {

class ZeltaReaderImpl : public ZeltaReader {
 public:
  explicit ZeltaReaderImpl(const std::shared_ptr<std::istream>& input) : input_(input) {}

  void setMetadataFactory(const std::shared_ptr<MXFMetadataModelFactory>& factory) override { factory_ = factory; }
  void setEssenceKeyClassifier(const std::shared_ptr<ZeltaKeyClassifier>& classifier) override {
    classifier_ = classifier;
  }
  void setStructureHandler(const std::shared_ptr<MXFStructureHandler>& handler) override {
    structureHandler_ = handler;
  }
  void setMetadataHandler(const std::shared_ptr<ZeltaMetadataHandler>& handler) override { metadataHandler_ = handler; }
  void setIndexHandler(const std::shared_ptr<MXFIndexHandler>& handler) override { indexHandler_ = handler; }
  void setGCStructureHandler(const std::shared_ptr<MXFGCStructureHandler>& handler) override {
    gcStructureHandler_ = handler;
  }
  void setSDTICPHandler(const std::shared_ptr<MXFSDTICPSystemHandler>& handler) override { sdticpHandler_ = handler; }
  void setProxyHandler(const std::shared_ptr<MXFQMProxySystemHandler>& handler) override { proxyHandler_ = handler; }
  void setEssenceHandler(const std::shared_ptr<MXFGCEssenceHandler>& handler) override { essenceHandler_ = handler; }
  void setErrorHandler(const std::shared_ptr<ErrorHandler>& errorHandler) override { errorHandler_ = errorHandler; }

  void read() override;

 private:
  std::shared_ptr<std::istream> input_;
  std::shared_ptr<MXFMetadataModelFactory> factory_;
  std::shared_ptr<ZeltaKeyClassifier> classifier_;
  std::shared_ptr<MXFStructureHandler> structureHandler_;
  std::shared_ptr<ZeltaMetadataHandler> metadataHandler_;
  std::shared_ptr<MXFIndexHandler> indexHandler_;
  std::shared_ptr<MXFGCStructureHandler> gcStructureHandler_;
  std::shared_ptr<MXFSDTICPSystemHandler> sdticpHandler_;
  std::shared_ptr<MXFQMProxySystemHandler> proxyHandler_;
  std::shared_ptr<MXFGCEssenceHandler> essenceHandler_;
  std::shared_ptr<ErrorHandler> errorHandler_;
};

// The chain of one read: a parser in front of each handler that is set,
// nothing for a handler that is not. It lives for the read only.
class ReadChain {
 public:
  ReadChain(MXFReader& reader, const std::shared_ptr<ErrorHandler>& errorHandler)
      : reader_(reader), errorHandler_(errorHandler), errors_(errorHandler.get()) {
    if (errors_) reader_.setErrorHandler(errors_);
  }

  // With an error handler, a validator in front of each handler of the
  // structure, metadata, index and SDTI-CP events, all sharing one cross
  // validator. The metadata validator is still to come: its handler hears
  // the parser directly.
  void validate(MXFStructureHandler* structure, ZeltaMetadataHandler* metadata, MXFIndexHandler* index,
                MXFSDTICPSystemHandler* sdticp) {
    if (!errors_ || !(structure || metadata || index || sdticp)) return;
    cross_.emplace();
    cross_->setErrorHandler(errors_);
    if (structure) {
      structureValidator_.emplace(structure, &*cross_);
      structureValidator_->setErrorHandler(errors_);
    }
    if (index) indexValidator_.emplace(index, &*cross_);
    if (sdticp) {
      systemValidator_.emplace(sdticp, &*cross_);
      systemValidator_->setErrorHandler(errors_);
    }
  }

  void structure(MXFStructureHandler* handler) {
    if (!handler) return;
    reader_.setStructureHandler(structureValidator_ ? &*structureValidator_ : handler);
  }

  // A factory of the read's own hears of its troubles; one the client set
  // is used as it stands.
  void metadata(ZeltaMetadataHandler* handler, std::shared_ptr<MXFMetadataModelFactory> factory) {
    if (!handler) return;
    if (!factory) {
      factory = createZeltaDefaultMetadataFactory();
      if (errorHandler_) factory->setErrorHandler(errorHandler_);
    }
    metadataParser_.emplace(handler, factory);
    metadataParser_->setErrorHandler(errors_);
    reader_.setMetadataHandler(&*metadataParser_);
  }

  void index(MXFIndexHandler* handler) {
    if (!handler) return;
    indexParser_.emplace(indexValidator_ ? &*indexValidator_ : handler);
    indexParser_->setErrorHandler(errors_);
    reader_.setIndexHandler(&*indexParser_);
  }

  // The system validator counts edit units, whether the client wants them
  // or not. Essence is never validated.
  void genericContainer(const ZeltaKeyClassifier* classifier, MXFGCStructureHandler* structure,
                        MXFSDTICPSystemHandler* sdticp, MXFQMProxySystemHandler* proxy, MXFGCEssenceHandler* essence) {
    if (!structure && !sdticp && !proxy && !essence) return;
    splitter_.emplace(classifier);
    if (systemValidator_) {
      systemValidator_->setStructureHandler(structure);
      splitter_->setStructureHandler(&*systemValidator_);
    } else if (structure) {
      splitter_->setStructureHandler(structure);
    }
    if (sdticp || proxy) {
      systemParser_.emplace();
      systemParser_->setSDTICPHandler(systemValidator_ ? &*systemValidator_ : sdticp);
      systemParser_->setProxyHandler(proxy);
      systemParser_->setErrorHandler(errors_);
      splitter_->setSystemHandler(&*systemParser_);
    }
    if (essence) splitter_->setEssenceHandler(essence);
    if (errors_) splitter_->setErrorHandler(errors_);
    reader_.setEssenceHandler(&*splitter_);
  }

 private:
  MXFReader& reader_;
  // The factory holds its handler weakly.
  const std::shared_ptr<ErrorHandler>& errorHandler_;
  ErrorHandler* errors_;
  std::optional<ZeltaCrossValidator> cross_;
  std::optional<ZeltaStructureValidator> structureValidator_;
  std::optional<ZeltaIndexValidator> indexValidator_;
  std::optional<ZeltaSystemValidator> systemValidator_;
  std::optional<ZeltaMetadataParser> metadataParser_;
  std::optional<MXFIndexParser> indexParser_;
  std::optional<ZeltaSystemParser> systemParser_;
  std::optional<ZeltaEssenceSplitter> splitter_;
};

void ZeltaReaderImpl::read() {
  MXFReader reader;
  reader.setSkipRunIn(true);
  ReadChain chain(reader, errorHandler_);
  chain.validate(structureHandler_.get(), metadataHandler_.get(), indexHandler_.get(), sdticpHandler_.get());
  chain.structure(structureHandler_.get());
  chain.metadata(metadataHandler_.get(), factory_);
  chain.index(indexHandler_.get());
  chain.genericContainer(classifier_.get(), gcStructureHandler_.get(), sdticpHandler_.get(), proxyHandler_.get(),
                         essenceHandler_.get());
  reader.read(*input_);
}

}  // namespace

ZeltaKeyClassifier::~ZeltaKeyClassifier() = default;
ZeltaReader::~ZeltaReader() = default;

std::shared_ptr<ZeltaReader> createZeltaReader(const std::shared_ptr<std::istream>& input) {
  check(input != nullptr, "input stream is present");
  return std::make_shared<ZeltaReaderImpl>(input);
}
