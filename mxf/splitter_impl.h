// The state and the algorithms of MXFSplitter.
#ifndef ZELTA_MXF_SPLITTER_IMPL_H
#define ZELTA_MXF_SPLITTER_IMPL_H

#include <memory>
#include <string>

#include "mxf.h"

class ZELTA_LOCAL MXFSplitter::DelegatedLocator : public Locator {
public:
  const std::streampos& getPosition() override { return position_; }
  void setPosition(const std::streampos& position) { position_ = position; }

private:
  std::streampos position_ = -1;
};

class ZELTA_LOCAL MXFSplitter::Impl final : public KLVHandler {
public:
  Impl(MXFStructureHandler* structureHandler, KLVHandler* metadataHandler, KLVHandler* indexHandler,
       KLVHandler* essenceHandler, bool validate);

  void setErrorHandler(ErrorHandler* errorHandler);
  void setRunIn(std::uint32_t runIn);

  void setLocator(Locator* locator) override;
  void startStream(bool hasAccurateLengths) override;
  void endStream(bool aborted) override;
  void setLengthForm(std::uint8_t form) override;
  bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endIndividualItem(const KLVKey& key) override;
  bool startLabel(const KLVKey& key) override;
  void endLabel(const KLVKey& key) override;
  bool startUniversalSet(const KLVKey& key, std::uint64_t length) override;
  void endUniversalSet(const KLVKey& key) override;
  bool startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                     KLVLengthType lengthType) override;
  void endLocalSet(const KLVKey& key) override;
  bool startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) override;
  void endLocalItem(std::uint32_t tag) override;
  bool startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override;
  void endFixedLengthPack(const KLVKey& key) override;
  bool startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) override;
  void endVariableLengthPack(const KLVKey& key) override;
  bool startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) override;
  void endVariableLengthItem() override;
  bool startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) override;
  void endWrapper(const KLVKey& key) override;
  void value(const std::uint8_t* data, std::streamsize size) override;

private:
  enum State {
    idle,
    started,
    inPartitionPack,
    afterPartitionPack,
    headerMetadata,
    indexTable,
    body,
    inRandomIndex,
    finished
  };

  bool isDelegating() const;
  KLVHandler* delegate() const;
  std::streamoff position();
  void storePosition();

  KLVHandler* enterElement(const char* unexpected, const KLVKey& key);
  KLVHandler* delegateFor(const char* expected);
  void openPartition();
  void advanceSection();
  void endDelegate();
  KLVHandler* prepareDelegate();

  bool startPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer);
  void endPartitionPack(const KLVKey& key);
  void endRandomIndexPack(const KLVKey& key);
  void closeStream(bool aborted);

  [[noreturn]] void fatal(const MXFUID& identifier, const std::string& message);
  [[noreturn]] void fatal(const MXFUID& identifier, const char* text, const KLVKey& key);

  // In front of the client's structure handler when validating.
  std::unique_ptr<MXFStructureValidator> validator_;
  // The head of the structure chain: the validator or the client's handler.
  MXFStructureHandler* structureHandler_;
  KLVHandler* metadataHandler_;
  KLVHandler* indexHandler_;
  KLVHandler* essenceHandler_;
  ErrorHandler* errorHandler_ = nullptr;
  Locator* upstream_ = nullptr;
  std::uint8_t currentForm_ = KLVNoLengthForm;
  std::streamoff partitionStart_ = 0;
  KLVKey partitionKey_;
  MXFPartitionPack pack_;
  std::uint64_t packLength_ = 0;
  DelegatedLocator locator_;
  bool inPartition_ = false;
  bool delegateStarted_ = false;
  State state_ = idle;
  ByteVector buffer_;
};

#endif
