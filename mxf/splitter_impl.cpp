#include "mxf/splitter_impl.h"

#include <algorithm>
#include <limits>
#include <stdexcept>

#include "core/reports.h"
#include "core/reservation.h"

namespace {

// Section ends come from file values and must not wrap around.
std::uint64_t saturatingSum(std::uint64_t a, std::uint64_t b) {
  return a > std::numeric_limits<std::uint64_t>::max() - b ? std::numeric_limits<std::uint64_t>::max() : a + b;
}

}  // namespace

MXFSplitter::Impl::Impl(MXFStructureHandler* structureHandler, KLVHandler* metadataHandler,
                        KLVHandler* indexHandler, KLVHandler* essenceHandler, bool validate)
    : validator_(validate ? new MXFStructureValidator(structureHandler) : nullptr),
      structureHandler_(validate ? validator_.get() : structureHandler),
      metadataHandler_(metadataHandler),
      indexHandler_(indexHandler),
      essenceHandler_(essenceHandler) {}

void MXFSplitter::Impl::setErrorHandler(ErrorHandler* errorHandler) {
  errorHandler_ = errorHandler;
  if (validator_) validator_->setErrorHandler(errorHandler);
}

void MXFSplitter::Impl::setRunIn(std::uint32_t runIn) {
  check(state_ == idle, "before start");
  structureHandler_->setRunIn(runIn);
}

// ---------------------------------------------------------------------------
// Common steps

inline bool MXFSplitter::Impl::isDelegating() const {
  return state_ == headerMetadata || state_ == indexTable || state_ == body;
}

inline KLVHandler* MXFSplitter::Impl::delegate() const {
  switch (state_) {
    case headerMetadata:
      return metadataHandler_;
    case indexTable:
      return indexHandler_;
    default:
      return essenceHandler_;
  }
}

inline std::streamoff MXFSplitter::Impl::position() { return locator_.getPosition(); }

// By its offset: the conversion state of a position means nothing to a
// binary stream, and a copy of the whole position right after the upstream
// wrote it piecewise would stall the processor at every event.
inline void MXFSplitter::Impl::storePosition() {
  check(upstream_ != nullptr, "has locator");
  locator_.setPosition(std::streampos(std::streamoff(upstream_->getPosition())));
}

void MXFSplitter::Impl::fatal(const MXFUID& identifier, const std::string& message) {
  zelta::Reports(errorHandler_).fatalError(identifier, message);
  throw std::runtime_error(message);
}

void MXFSplitter::Impl::fatal(const MXFUID& identifier, const char* text, const KLVKey& key) {
  fatal(identifier, zelta::detailed(text, zelta::keyText(key)));
}

void MXFSplitter::Impl::openPartition() {
  state_ = headerMetadata;
  check(!inPartition_, "is not in partition");
  inPartition_ = true;
  structureHandler_->startPartition(partitionKey_, pack_, packLength_);
}

// Sections are cut by byte counts alone, whatever the keys in them say.
void MXFSplitter::Impl::advanceSection() {
  if (state_ != headerMetadata && state_ != indexTable) return;
  std::uint64_t at = static_cast<std::uint64_t>(position());
  std::uint64_t headerEnd = saturatingSum(saturatingSum(static_cast<std::uint64_t>(partitionStart_), packLength_),
                                          pack_.headerByteCount);
  if (state_ == headerMetadata) {
    if (at > headerEnd) fatal(partitionByteCountId, "incorrect headerByteCount");
    if (at < headerEnd) return;
    endDelegate();
    state_ = indexTable;
  }
  std::uint64_t indexEnd = saturatingSum(headerEnd, pack_.indexByteCount);
  if (at > indexEnd) fatal(partitionByteCountId, "incorrect indexByteCount");
  if (at < indexEnd) return;
  endDelegate();
  state_ = body;
}

void MXFSplitter::Impl::endDelegate() {
  if (!delegateStarted_) return;
  delegateStarted_ = false;
  delegate()->endStream(false);
}

// Each section is a stream of its own to its delegate.
KLVHandler* MXFSplitter::Impl::prepareDelegate() {
  check(isDelegating(), "is delegating state");
  KLVHandler* handler = delegate();
  if (delegateStarted_) {
    storePosition();
    return handler;
  }
  handler->setLocator(&locator_);
  delegateStarted_ = true;
  handler->startStream(true);
  storePosition();
  handler->setLengthForm(currentForm_);
  return handler;
}

// Start events other than fixed length packs. The position stays where the
// previous element ended, so that the section test sees the first octet of
// this element's key.
KLVHandler* MXFSplitter::Impl::enterElement(const char* unexpected, const KLVKey& key) {
  if (state_ == afterPartitionPack) openPartition();
  advanceSection();
  if (!isDelegating()) fatal(unexpectedElementId, unexpected, key);
  return prepareDelegate();
}

KLVHandler* MXFSplitter::Impl::delegateFor(const char* expected) {
  storePosition();
  check(isDelegating(), expected);
  return delegate();
}

// ---------------------------------------------------------------------------
// Stream events

void MXFSplitter::Impl::setLocator(Locator* locator) { upstream_ = locator; }

void MXFSplitter::Impl::startStream(bool hasAccurateLengths) {
  check(state_ == idle, "before start");
  check(hasAccurateLengths, "has accurate lengths");
  check(upstream_ != nullptr, "has locator");
  storePosition();
  if (validator_) validator_->setLocator(&locator_);
  delegateStarted_ = false;
  inPartition_ = false;
  state_ = started;
  structureHandler_->startStream();
}

void MXFSplitter::Impl::endStream(bool aborted) {
  check(upstream_ != nullptr, "has locator");
  storePosition();
  upstream_ = nullptr;
  struct BackToIdle {
    State& state;
    ~BackToIdle() { state = idle; }
  } backToIdle{state_};
  try {
    if (state_ == afterPartitionPack) openPartition();
    // While a failure unwinds, the byte counts are not checked again: the
    // first report stands alone.
    if (!aborted) {
      advanceSection();
      if (state_ == indexTable) fatal(partitionByteCountId, "incorrect indexByteCount");
      if (state_ == headerMetadata) fatal(partitionByteCountId, "incorrect headerByteCount");
    }
  } catch (...) {
    // Whoever has started still hears of the end, as of an aborted stream.
    try {
      closeStream(true);
    } catch (...) {
    }
    throw;
  }
  closeStream(aborted);
}

void MXFSplitter::Impl::closeStream(bool aborted) {
  if (delegateStarted_) {
    delegateStarted_ = false;
    delegate()->endStream(aborted);
  }
  if (inPartition_) {
    inPartition_ = false;
    structureHandler_->endPartition(partitionKey_);
  }
  if (state_ != idle) structureHandler_->endStream(aborted);
}

void MXFSplitter::Impl::setLengthForm(std::uint8_t form) {
  currentForm_ = form;
  if (delegateStarted_) delegate()->setLengthForm(form);
}

// ---------------------------------------------------------------------------
// Partition and random index packs

bool MXFSplitter::Impl::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  if (state_ == afterPartitionPack) openPartition();
  advanceSection();
  bool structural = isMXFPartitionKey(key) || isMXFRandomIndexKey(key);
  switch (state_) {
    case headerMetadata:
    case indexTable:
      return prepareDelegate()->startFixedLengthPack(key, length, buffer);
    case started:
      if (!structural) break;
      // The stored position is still where the stream or the previous
      // element ended: the first octet of this pack's key.
      partitionStart_ = position();
      return startPack(key, length, buffer);
    case body:
      if (!structural) return prepareDelegate()->startFixedLengthPack(key, length, buffer);
      endDelegate();
      if (inPartition_) {
        inPartition_ = false;
        structureHandler_->endPartition(partitionKey_);
      }
      partitionStart_ = position();
      return startPack(key, length, buffer);
    default:
      break;
  }
  fatal(unexpectedElementId, "unexpected fixed length pack", key);
}

bool MXFSplitter::Impl::startPack(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  state_ = isMXFRandomIndexKey(key) ? inRandomIndex : inPartitionPack;
  buffer_.clear();
  buffer_.reserve(zelta::reservationFor(length));
  buffer = nullptr;
  return true;
}

void MXFSplitter::Impl::endFixedLengthPack(const KLVKey& key) {
  storePosition();
  if (state_ == inPartitionPack) {
    endPartitionPack(key);
  } else if (state_ == inRandomIndex) {
    endRandomIndexPack(key);
  } else {
    check(isDelegating(), "expected fixed length pack");
    delegate()->endFixedLengthPack(key);
    advanceSection();
  }
}

void MXFSplitter::Impl::endPartitionPack(const KLVKey& key) {
  check(isMXFPartitionKey(key), "expected fixed length pack");
  MXFPartitionPack pack;
  try {
    internalize(buffer_, pack);
  } catch (const util::assertion_failure& failure) {
    fatal(partitionValueId, zelta::detailed("invalid partition value", failure.what()));
  }
  partitionKey_ = key;
  pack_ = pack;
  packLength_ = static_cast<std::uint64_t>(position() - partitionStart_);
  state_ = afterPartitionPack;
}

// A damaged random index costs the client the index, not the read.
void MXFSplitter::Impl::endRandomIndexPack(const KLVKey& key) {
  check(isMXFRandomIndexKey(key), "expected fixed length pack");
  state_ = finished;
  std::vector<MXFRandomIndexEntry> entries;
  try {
    internalize(buffer_, entries, currentForm_);
    check(!entries.empty(), "has entries");
  } catch (const util::assertion_failure& failure) {
    zelta::Reports(errorHandler_)
        .error(randomIndexValueId, zelta::detailed("invalid random index value", failure.what()));
    return;
  }
  structureHandler_->randomIndex(entries);
}

void MXFSplitter::Impl::value(const std::uint8_t* data, std::streamsize size) {
  storePosition();
  if (state_ == body) {
    essenceHandler_->value(data, size);
    return;
  }
  if (state_ == inPartitionPack || state_ == inRandomIndex) {
    buffer_.insert(buffer_.end(), data, data + size);
    return;
  }
  check(isDelegating(), "expected value");
  delegate()->value(data, size);
}

// ---------------------------------------------------------------------------
// Elements handed to the delegates

// Most elements of a file are individual items of a body whose delegate has
// started; for them the common steps come to passing the element on.
bool MXFSplitter::Impl::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  if (state_ == body && delegateStarted_) {
    storePosition();
    return essenceHandler_->startIndividualItem(key, length, buffer);
  }
  // The one fill item behind a pack belongs to the pack.
  if (state_ == afterPartitionPack && key == KLVFillItemKey) return false;
  return enterElement("unexpected individual item", key)->startIndividualItem(key, length, buffer);
}

void MXFSplitter::Impl::endIndividualItem(const KLVKey& key) {
  if (state_ == body) {
    storePosition();
    essenceHandler_->endIndividualItem(key);
    return;
  }
  if (state_ == afterPartitionPack) {
    storePosition();
    check(key == KLVFillItemKey, "expected individual item");
    packLength_ = static_cast<std::uint64_t>(position() - partitionStart_);
    openPartition();
  } else {
    delegateFor("expected individual item")->endIndividualItem(key);
  }
  advanceSection();
}

bool MXFSplitter::Impl::startLabel(const KLVKey& key) {
  return enterElement("unexpected label", key)->startLabel(key);
}

void MXFSplitter::Impl::endLabel(const KLVKey& key) {
  delegateFor("expected label")->endLabel(key);
  advanceSection();
}

bool MXFSplitter::Impl::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  return enterElement("unexpected universal set", key)->startUniversalSet(key, length);
}

void MXFSplitter::Impl::endUniversalSet(const KLVKey& key) {
  delegateFor("expected universal set")->endUniversalSet(key);
  advanceSection();
}

bool MXFSplitter::Impl::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                      KLVLengthType lengthType) {
  return enterElement("unexpected local set", key)->startLocalSet(key, length, tagType, lengthType);
}

void MXFSplitter::Impl::endLocalSet(const KLVKey& key) {
  delegateFor("expected local set")->endLocalSet(key);
  advanceSection();
}

bool MXFSplitter::Impl::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*& buffer) {
  return delegateFor("expected local item")->startLocalItem(tag, length, buffer);
}

void MXFSplitter::Impl::endLocalItem(std::uint32_t tag) { delegateFor("expected local item")->endLocalItem(tag); }

bool MXFSplitter::Impl::startVariableLengthPack(const KLVKey& key, std::uint64_t length,
                                                KLVLengthType lengthType) {
  return enterElement("unexpected variable length pack", key)->startVariableLengthPack(key, length, lengthType);
}

void MXFSplitter::Impl::endVariableLengthPack(const KLVKey& key) {
  delegateFor("expected variable length pack")->endVariableLengthPack(key);
  advanceSection();
}

bool MXFSplitter::Impl::startVariableLengthItem(std::uint64_t length, std::uint8_t*& buffer) {
  return delegateFor("expected variable length item")->startVariableLengthItem(length, buffer);
}

void MXFSplitter::Impl::endVariableLengthItem() {
  delegateFor("expected variable length item")->endVariableLengthItem();
}

bool MXFSplitter::Impl::startWrapper(const KLVKey& key, std::uint64_t length, bool isWrapper,
                                     std::uint8_t*& buffer) {
  return enterElement("unexpected wrapper", key)->startWrapper(key, length, isWrapper, buffer);
}

void MXFSplitter::Impl::endWrapper(const KLVKey& key) {
  delegateFor("expected wrapper")->endWrapper(key);
  advanceSection();
}
