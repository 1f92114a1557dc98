#include "essence/gc_splitter_impl.h"

#include <algorithm>
#include <cstring>

#include "core/reservation.h"

namespace {

// From this length on an element is delivered only into a handler's buffer.
constexpr std::uint64_t largestOwnBufferElement = 0x1000000;

}  // namespace

MXFGCSplitter::Impl::Impl(const MXFGCSplitter& owner, MXFGCStructureHandler* structure,
                                     MXFGCSystemHandler* system, MXFGCEssenceHandler* essence)
    : structureHandler(structure), systemHandler(system), essenceHandler(essence), owner_(owner) {}

// ---------------------------------------------------------------------------
// Stream and edit units

void MXFGCSplitter::Impl::startStream(bool hasAccurateLengths) {
  check(state_ == idle, "before start");
  check(hasAccurateLengths, "has accurate lengths");
  form_ = KLVNoLengthForm;
  reportedForm_ = KLVNoLengthForm;
  firstKey_ = KLVKey();
  state_ = started;
  if (structureHandler) structureHandler->start(0);
}

// Idle on every path, also when a handler throws.
void MXFGCSplitter::Impl::endStream() {
  const bool openUnit = inEditUnit();
  const bool open = state_ != idle;
  state_ = idle;
  if (!structureHandler) return;
  if (openUnit) structureHandler->endEditUnit();
  if (open) structureHandler->end();
}

void MXFGCSplitter::Impl::setLengthForm(std::uint8_t form) {
  if (form != KLVFourOctetLengthForm && form != KLVEightOctetLengthForm)
    reports.warning(nonStandardLengthFormId, zelta::detailed("non-standard BER length form", zelta::octetText(form)));
  form_ = form;
}

bool MXFGCSplitter::Impl::inEditUnit() const {
  return state_ == system || state_ == essenceOnly || state_ == essenceAfterSystem;
}

bool MXFGCSplitter::Impl::inEssence() const { return state_ == essenceOnly || state_ == essenceAfterSystem; }

// Nothing in the stream marks an edit unit: it begins where the first key of
// the stream comes again.
void MXFGCSplitter::Impl::editUnitBoundary(const KLVKey& key) {
  if (firstKey_ == KLVKey()) {
    firstKey_ = key;
    if (structureHandler) structureHandler->startEditUnit();
    return;
  }
  if (key != firstKey_) return;
  if (structureHandler) {
    if (inEditUnit()) structureHandler->endEditUnit();
    structureHandler->startEditUnit();
  }
}

// ---------------------------------------------------------------------------
// Essence elements

MXFGCSplitter::Impl::Kind MXFGCSplitter::Impl::kindOf(const KLVKey& key) const {
  if (owner_.isPictureKey(key)) return picture;
  if (owner_.isSoundKey(key)) return sound;
  if (owner_.isDataKey(key)) return data;
  if (owner_.isCompoundKey(key)) return compound;
  return noKind;
}

bool MXFGCSplitter::Impl::startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) {
  if (key == KLVFillItemKey) return false;
  if (state_ == started || state_ == system)
    std::fill(std::begin(kinds_), std::end(kinds_), false);
  else
    check(inEssence(), "expected individual item");
  editUnitBoundary(key);
  handlerBuffer_ = nullptr;
  handlerFill_ = 0;
  ownBuffer_.clear();
  wanted_ = false;
  const Kind kind = owner_.isEssenceKey(key) ? kindOf(key) : noKind;
  if (kind == noKind) {
    reportKey(invalidGCElementId, "invalid GC essence element", key);
    return false;
  }
  kinds_[kind] = true;
  enterEssence(key);
  wanted_ = offerEssence(key, length);
  if (wanted_) buffer = handlerBuffer_ ? handlerBuffer_ : ownBuffer_.data();
  return wanted_;
}

// A container without a system item holds one kind of element: the first
// element of a second kind is reported once, and from then on the container
// counts as one with a system item.
void MXFGCSplitter::Impl::enterEssence(const KLVKey& key) {
  switch (state_) {
    case started:
      state_ = essenceOnly;
      break;
    case system:
      state_ = essenceAfterSystem;
      break;
    case essenceOnly:
      if (std::count(std::begin(kinds_), std::end(kinds_), true) == 2) {
        reportKey(unexpectedGCElementId, "unexpected GC essence element", key);
        state_ = essenceAfterSystem;
      }
      break;
    case essenceAfterSystem:
      break;
    default:
      check(false, "before GC essence element");
  }
}

// Whether the value is to be read, and where to.
bool MXFGCSplitter::Impl::offerEssence(const KLVKey& key, std::uint64_t length) {
  if (form_ != reportedForm_) {
    reportedForm_ = form_;
    if (essenceHandler) essenceHandler->essenceLengthForm(form_);
  }
  if (!essenceHandler || !essenceHandler->startEssenceElement(key, length, handlerBuffer_)) return false;
  if (handlerBuffer_) {
    handlerCapacity_ = length;
    return true;
  }
  if (length >= largestOwnBufferElement) {
    reports.error(unsupportedGCElementLengthId,
                  zelta::detailed("unsupported GC essence element length", zelta::hexText(length, 0)));
    deliver(key, nullptr, length);
    return false;
  }
  ownBuffer_.reserve(length);
  return true;
}

// The key tests are asked again: a subclass may answer differently now, and a
// key of no kind is refused ("valid GC essence element key").
void MXFGCSplitter::Impl::deliver(const KLVKey& key, const std::uint8_t* bytes, std::uint64_t length) {
  switch (kindOf(key)) {
    case picture:
      essenceHandler->pictureElement(key, bytes, length);
      break;
    case sound:
      essenceHandler->soundElement(key, bytes, length);
      break;
    case data:
      essenceHandler->dataElement(key, bytes, length);
      break;
    case compound:
      essenceHandler->compoundElement(key, bytes, length);
      break;
    default:
      check(false, "valid GC essence element key");
  }
}

void MXFGCSplitter::Impl::endEssenceElement(const KLVKey& key) {
  if (key == KLVFillItemKey) return;
  if (state_ == started || state_ == system) return;
  check(inEssence(), "expected individual item");
  if (!wanted_ || !essenceHandler) return;
  if (handlerBuffer_)
    deliver(key, handlerBuffer_, handlerFill_);
  else
    deliver(key, ownBuffer_.data(), ownBuffer_.fill());
}

// The reader has usually read the value in place already.
void MXFGCSplitter::Impl::essenceValue(const std::uint8_t* bytes, std::streamsize size) {
  if (!handlerBuffer_) {
    ownBuffer_.append(bytes, size);
    return;
  }
  check(size >= 0 && static_cast<std::uint64_t>(size) <= handlerCapacity_ - handlerFill_,
        "valid essence buffer size");
  if (bytes != handlerBuffer_ + handlerFill_)
    std::memmove(handlerBuffer_ + handlerFill_, bytes, static_cast<std::size_t>(size));
  handlerFill_ += static_cast<std::uint64_t>(size);
}

// ---------------------------------------------------------------------------
// System elements

bool MXFGCSplitter::Impl::startSystemElement(const KLVKey& key, const char* expected) {
  check(state_ != idle, expected);
  editUnitBoundary(key);
  localItems_.clear();
  fixedPack_.clear();
  variableItems_.clear();
  filling_ = nullptr;
  wanted_ = false;
  if (!owner_.isSystemKey(key)) {
    reportKey(invalidGCElementId, "invalid GC system element", key);
    return false;
  }
  enterSystem(key);
  wanted_ = systemHandler && systemHandler->startSystemElement(key);
  return wanted_;
}

void MXFGCSplitter::Impl::enterSystem(const KLVKey& key) {
  switch (state_) {
    case started:
    case system:
    case essenceAfterSystem:
      break;
    case essenceOnly:
      reportKey(unexpectedGCElementId, "unexpected GC system element", key);
      break;
    default:
      check(false, "before GC system element");
  }
  state_ = system;
}

bool MXFGCSplitter::Impl::startFixedPack(const KLVKey& key, std::uint64_t length) {
  if (!startSystemElement(key, "expected fixed length pack")) return false;
  filling_ = &fixedPack_;
  fixedPack_.reserve(zelta::reservationFor(length));
  return true;
}

void MXFGCSplitter::Impl::requireSystem(const char* expected) const { check(state_ == system, expected); }

void MXFGCSplitter::Impl::startLocalItem(std::uint32_t tag, std::uint64_t length) {
  requireSystem("expected local item");
  localItems_.emplace_back(static_cast<std::uint16_t>(tag), ByteVector());
  filling_ = &localItems_.back().second;
  filling_->reserve(zelta::reservationFor(length));
}

void MXFGCSplitter::Impl::startVariableItem(std::uint64_t length) {
  requireSystem("expected variable length item");
  variableItems_.emplace_back();
  filling_ = &variableItems_.back();
  filling_->reserve(zelta::reservationFor(length));
}

bool MXFGCSplitter::Impl::endsSystemElement(const char* expected) const {
  if (state_ == started || inEssence()) return false;
  requireSystem(expected);
  return wanted_ && systemHandler;
}

void MXFGCSplitter::Impl::endLocalSet(const KLVKey& key) {
  if (endsSystemElement("expected local set")) systemHandler->systemLocalSet(key, localItems_);
}

void MXFGCSplitter::Impl::endFixedPack(const KLVKey& key) {
  if (endsSystemElement("expected fixed length pack")) systemHandler->systemFixedPack(key, fixedPack_);
}

void MXFGCSplitter::Impl::endVariablePack(const KLVKey& key) {
  if (endsSystemElement("expected variable length pack")) systemHandler->systemVariablePack(key, variableItems_);
}

// ---------------------------------------------------------------------------
// Values and other elements

void MXFGCSplitter::Impl::value(const std::uint8_t* bytes, std::streamsize size) {
  if (inEssence()) {
    essenceValue(bytes, size);
    return;
  }
  check(state_ == system && filling_ != nullptr, "expected value");
  filling_->insert(filling_->end(), bytes, bytes + size);
}

bool MXFGCSplitter::Impl::invalidElement(const KLVKey& key) {
  reportKey(invalidGCElementId, "invalid GC element", key);
  return false;
}

void MXFGCSplitter::Impl::reportKey(const MXFUID& identifier, const char* text, const KLVKey& key) {
  reports.error(identifier, zelta::detailed(text, zelta::keyText(key)));
}
