#include "mxf/splitter_impl.h"

MXFStructureHandler::~MXFStructureHandler() = default;

void DullMXFStructureHandler::setRunIn(std::uint32_t) {}
void DullMXFStructureHandler::startStream() {}
void DullMXFStructureHandler::endStream(bool) {}
void DullMXFStructureHandler::startPartition(const KLVKey&, const MXFPartitionPack&, std::uint64_t) {}
void DullMXFStructureHandler::endPartition(const KLVKey&) {}
void DullMXFStructureHandler::randomIndex(const std::vector<MXFRandomIndexEntry>&) {}

MXFSplitter::MXFSplitter(MXFStructureHandler* structureHandler, KLVHandler* metadataHandler,
                         KLVHandler* indexHandler, KLVHandler* essenceHandler, bool validate)
    : impl_(new Impl(structureHandler, metadataHandler, indexHandler, essenceHandler, validate)) {}

MXFSplitter::~MXFSplitter() = default;

void MXFSplitter::setErrorHandler(ErrorHandler* errorHandler) { impl_->setErrorHandler(errorHandler); }
void MXFSplitter::setRunIn(std::uint32_t runIn) { impl_->setRunIn(runIn); }

void MXFSplitter::setLocator(Locator* locator) { impl_->setLocator(locator); }
void MXFSplitter::startStream(bool hasAccurateLengths) { impl_->startStream(hasAccurateLengths); }
void MXFSplitter::endStream(bool aborted) { impl_->endStream(aborted); }
void MXFSplitter::setLengthForm(std::uint8_t form) { impl_->setLengthForm(form); }

bool MXFSplitter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return impl_->startIndividualItem(key, length, buffer);
}
void MXFSplitter::endIndividualItem(const KLVKey& key) { impl_->endIndividualItem(key); }
bool MXFSplitter::startLabel(const KLVKey& key) { return impl_->startLabel(key); }
void MXFSplitter::endLabel(const KLVKey& key) { impl_->endLabel(key); }
bool MXFSplitter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  return impl_->startUniversalSet(key, length);
}
void MXFSplitter::endUniversalSet(const KLVKey& key) { impl_->endUniversalSet(key); }
bool MXFSplitter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                KLVLengthType lengthType) {
  return impl_->startLocalSet(key, length, tagType, lengthType);
}
void MXFSplitter::endLocalSet(const KLVKey& key) { impl_->endLocalSet(key); }
bool MXFSplitter::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  return impl_->startLocalItem(tag, length, buffer);
}
void MXFSplitter::endLocalItem(std::uint32_t tag) { impl_->endLocalItem(tag); }
bool MXFSplitter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return impl_->startFixedLengthPack(key, length, buffer);
}
void MXFSplitter::endFixedLengthPack(const KLVKey& key) { impl_->endFixedLengthPack(key); }
bool MXFSplitter::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  return impl_->startVariableLengthPack(key, length, lengthType);
}
void MXFSplitter::endVariableLengthPack(const KLVKey& key) { impl_->endVariableLengthPack(key); }
bool MXFSplitter::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  return impl_->startVariableLengthItem(length, buffer);
}
void MXFSplitter::endVariableLengthItem() { impl_->endVariableLengthItem(); }
bool MXFSplitter::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper, std::uint8_t*& buffer) {
  return impl_->startWrapper(key, length, isWrapper, buffer);
}
void MXFSplitter::endWrapper(const KLVKey& key) { impl_->endWrapper(key); }
void MXFSplitter::value(const std::uint8_t* data, std::streamsize size) { impl_->value(data, size); }
