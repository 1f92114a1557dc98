#include "essence/gc_splitter_impl.h"

MXFGCSplitter::MXFGCSplitter() : MXFGCSplitter(nullptr, nullptr, nullptr) {}

MXFGCSplitter::MXFGCSplitter(MXFGCStructureHandler* structureHandler, MXFGCSystemHandler* systemHandler,
                             MXFGCEssenceHandler* essenceHandler)
    : impl_(new Impl(*this, structureHandler, systemHandler, essenceHandler)) {}

MXFGCSplitter::~MXFGCSplitter() = default;

void MXFGCSplitter::setStructureHandler(MXFGCStructureHandler* handler) { impl_->structureHandler = handler; }

MXFGCStructureHandler* MXFGCSplitter::getStructureHandler() const {
  check(impl_->structureHandler != nullptr, "structure handler is present");
  return impl_->structureHandler;
}

void MXFGCSplitter::setSystemHandler(MXFGCSystemHandler* handler) { impl_->systemHandler = handler; }

MXFGCSystemHandler* MXFGCSplitter::getSystemHandler() const {
  check(impl_->systemHandler != nullptr, "system handler is present");
  return impl_->systemHandler;
}

void MXFGCSplitter::setEssenceHandler(MXFGCEssenceHandler* handler) { impl_->essenceHandler = handler; }

MXFGCEssenceHandler* MXFGCSplitter::getEssenceHandler() const {
  check(impl_->essenceHandler != nullptr, "essence handler is present");
  return impl_->essenceHandler;
}

void MXFGCSplitter::setErrorHandler(ErrorHandler* errorHandler) { impl_->reports.setHandler(errorHandler); }

void MXFGCSplitter::startStream(bool hasAccurateLengths) { impl_->startStream(hasAccurateLengths); }
void MXFGCSplitter::endStream(bool) { impl_->endStream(); }
void MXFGCSplitter::setLengthForm(std::uint8_t form) { impl_->setLengthForm(form); }

bool MXFGCSplitter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  return impl_->startEssenceElement(key, length, buffer);
}
void MXFGCSplitter::endIndividualItem(const KLVKey& key) { impl_->endEssenceElement(key); }

bool MXFGCSplitter::startLabel(const KLVKey& key) { return impl_->invalidElement(key); }
bool MXFGCSplitter::startUniversalSet(const KLVKey& key, std::uint64_t) { return impl_->invalidElement(key); }
bool MXFGCSplitter::startWrapper(const KLVKey& key, std::uint64_t, bool, std::uint8_t*&) {
  return impl_->invalidElement(key);
}

bool MXFGCSplitter::startLocalSet(const KLVKey& key, std::uint64_t, KLVTagType, KLVLengthType) {
  return impl_->startSystemElement(key, "expected local set");
}
void MXFGCSplitter::endLocalSet(const KLVKey& key) { impl_->endLocalSet(key); }

bool MXFGCSplitter::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*&) {
  impl_->startLocalItem(tag, length);
  return true;
}
void MXFGCSplitter::endLocalItem(std::uint32_t) { impl_->requireSystem("expected local item"); }

bool MXFGCSplitter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  return impl_->startFixedPack(key, length);
}
void MXFGCSplitter::endFixedLengthPack(const KLVKey& key) { impl_->endFixedPack(key); }

bool MXFGCSplitter::startVariableLengthPack(const KLVKey& key, std::uint64_t, KLVLengthType) {
  return impl_->startSystemElement(key, "expected variable length pack");
}
void MXFGCSplitter::endVariableLengthPack(const KLVKey& key) { impl_->endVariablePack(key); }

bool MXFGCSplitter::startVariableLengthItem(std::uint64_t length, std::uint8_t*&) {
  impl_->startVariableItem(length);
  return true;
}
void MXFGCSplitter::endVariableLengthItem() { impl_->requireSystem("expected variable length item"); }

void MXFGCSplitter::value(const std::uint8_t* data, std::streamsize size) { impl_->value(data, size); }
