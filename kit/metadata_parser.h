// The metadata side of the kit's reader: the sets become a model, and the
// one individual item that the kit's files carry beside them goes to the
// handler as it stands.
#ifndef ZELTA_KIT_METADATA_PARSER_H
#define ZELTA_KIT_METADATA_PARSER_H

#include <cstdint>
#include <memory>

#include "kit.h"

class ZeltaMetadataParser : public KLVForwarder {
 public:
  ZeltaMetadataParser(ZeltaMetadataHandler* handler, const std::shared_ptr<MXFMetadataModelFactory>& factory);
  ZeltaMetadataParser(const ZeltaMetadataParser&) = delete;
  ZeltaMetadataParser& operator=(const ZeltaMetadataParser&) = delete;

  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;
  KLVHandler* getHandler() override;

  void setErrorHandler(ErrorHandler* errorHandler);

 private:
  MXFMetadataModelParser modelParser_;
  MXFMetadataParser metadataParser_;
  ZeltaMetadataHandler* handler_;
  ByteVector item_;
  bool capturing_ = false;
};

#endif
