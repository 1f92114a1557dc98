#include "klv/elements.h"

#include <cstring>

#include "core/reports.h"
#include "klv/ber.h"
#include "klv/stream_input.h"

using zelta::detailed;
using zelta::keyText;
using zelta::octetText;
using zelta::klv::readBERLength;
using zelta::klv::readBigEndian;
using zelta::klv::readKey;
using zelta::klv::skipValue;
using zelta::klv::smptePrefix;
using zelta::klv::transferValue;

KLVElement::parse_error::parse_error(const MXFUID& identifier, const std::string& message)
    : std::runtime_error(message), identifier_(identifier) {}

KLVElement::KLVElement(const KLVKey& key, std::istream& stream, KLVHandler& handler, std::uint8_t& currentForm,
                       Locator& locator, bool seekable)
    : key_(key),
      stream_(&stream),
      handler_(&handler),
      currentForm_(&currentForm),
      locator_(&locator),
      seekable_(seekable) {}

KLVElement::~KLVElement() = default;

namespace {

// Group codings by the low three bits of key octet 5.
constexpr std::uint8_t universalSetCoding = 1;
constexpr std::uint8_t localSetCoding = 3;
constexpr std::uint8_t variableLengthPackCoding = 4;
constexpr std::uint8_t fixedLengthPackCoding = 5;

// Contents are counted by the locator, so nested events must reach the
// position filter.
std::uint64_t octetsSince(Locator& locator, const std::streampos& start) {
  return static_cast<std::uint64_t>(static_cast<std::streamoff>(locator.getPosition() - start));
}

std::uint64_t readItemLength(std::istream& stream, KLVLengthType lengthType, std::uint8_t& currentForm,
                             KLVHandler& handler) {
  if (lengthType == KLVLengthTypeBER) return readBERLength(stream, currentForm, handler);
  return readBigEndian(stream, KLVFixedLengthTypeOctets(lengthType));
}

}  // namespace

namespace {

template <typename Element>
struct Kind {
  using type = Element;
};

// Calls make with the kind of element that key octets 4 and 5 select.
template <typename Make>
decltype(auto) withKind(const KLVKey& key, Make&& make) {
  if (std::memcmp(key.data(), smptePrefix, sizeof smptePrefix) != 0)
    throw KLVElement::parse_error(klvCodingErrorId, detailed("invalid SMPTE key", keyText(key)));
  switch (key[4]) {
    case 1:
      return make(Kind<KLVIndividualItem>());
    case 2:
      switch (key[5] & 7) {
        case universalSetCoding:
          return make(Kind<KLVUniversalSet>());
        case localSetCoding:
          return make(Kind<KLVLocalSet>());
        case variableLengthPackCoding:
          return make(Kind<KLVVariableLengthPack>());
        case fixedLengthPackCoding:
          return make(Kind<KLVFixedLengthPack>());
      }
      break;
    case 3:
      return make(Kind<KLVWrapper>());
    case 4:
      return make(Kind<KLVLabel>());
  }
  throw KLVElement::parse_error(klvCodingErrorId, detailed("unimplemented SMPTE KLV coding", keyText(key)));
}

}  // namespace

std::unique_ptr<KLVElement> KLVElement::create(const KLVKey& key, std::istream& stream, KLVHandler& handler,
                                               std::uint8_t& currentForm, Locator& locator, bool seekable) {
  return withKind(key, [&](auto kind) -> std::unique_ptr<KLVElement> {
    using Element = typename decltype(kind)::type;
    return std::make_unique<Element>(key, stream, handler, currentForm, locator, seekable);
  });
}

namespace zelta::klv {

void parseElement(const KLVKey& key, std::istream& stream, KLVHandler& handler, std::uint8_t& currentForm,
                  Locator& locator, bool seekable) {
  withKind(key, [&](auto kind) {
    typename decltype(kind)::type element(key, stream, handler, currentForm, locator, seekable);
    element.parse();
  });
}

}  // namespace zelta::klv

void KLVIndividualItem::parse() {
  const std::uint64_t length = readBERLength(*stream_, *currentForm_, *handler_);
  std::uint8_t* buffer = nullptr;
  const bool taken = handler_->startIndividualItem(key_, length, buffer);
  transferValue(*stream_, *handler_, taken, length, buffer, seekable_);
  handler_->endIndividualItem(key_);
}

void KLVFixedLengthPack::parse() {
  const std::uint64_t length = readBERLength(*stream_, *currentForm_, *handler_);
  std::uint8_t* buffer = nullptr;
  const bool taken = handler_->startFixedLengthPack(key_, length, buffer);
  transferValue(*stream_, *handler_, taken, length, buffer, seekable_);
  handler_->endFixedLengthPack(key_);
}

bool KLVWrapper::isWrapper() const {
  bool wrapper = false;
  if (!KLVWrapperCoding(key_, wrapper))
    throw parse_error(klvCodingErrorId, detailed("invalid wrapper type", octetText(key_[5])));
  return wrapper;
}

void KLVWrapper::parse() {
  const std::uint64_t length = readBERLength(*stream_, *currentForm_, *handler_);
  std::uint8_t* buffer = nullptr;
  const bool taken = handler_->startWrapper(key_, length, isWrapper(), buffer);
  transferValue(*stream_, *handler_, taken, length, buffer, seekable_);
  handler_->endWrapper(key_);
}

// A label is a key alone: the next octet is the next key.
void KLVLabel::parse() {
  handler_->startLabel(key_);
  handler_->endLabel(key_);
}

void KLVUniversalSet::parse() {
  const std::uint64_t length = readBERLength(*stream_, *currentForm_, *handler_);
  if (!handler_->startUniversalSet(key_, length)) {
    skipValue(*stream_, length, seekable_);
  } else {
    const std::streampos start = locator_->getPosition();
    while (octetsSince(*locator_, start) < length)
      zelta::klv::parseElement(readKey(*stream_), *stream_, *handler_, *currentForm_, *locator_, seekable_);
    if (octetsSince(*locator_, start) != length) throw parse_error(klvLengthErrorId, "incorrect universal set length");
  }
  handler_->endUniversalSet(key_);
}

void KLVLocalSet::coding(KLVTagType& tagType, KLVLengthType& lengthType) const {
  if (!KLVLocalSetCoding(key_, tagType, lengthType))
    throw parse_error(klvCodingErrorId, detailed("invalid local set type", octetText(key_[5])));
}

KLVTagType KLVLocalSet::getTagType() const {
  KLVTagType tagType = 0;
  KLVLengthType lengthType = 0;
  coding(tagType, lengthType);
  return tagType;
}

KLVLengthType KLVLocalSet::getLengthType() const {
  KLVTagType tagType = 0;
  KLVLengthType lengthType = 0;
  coding(tagType, lengthType);
  return lengthType;
}

void KLVLocalSet::parse() {
  const std::uint64_t length = readBERLength(*stream_, *currentForm_, *handler_);
  KLVTagType tagType = 0;
  KLVLengthType lengthType = 0;
  coding(tagType, lengthType);
  if (!handler_->startLocalSet(key_, length, tagType, lengthType)) {
    skipValue(*stream_, length, seekable_);
  } else {
    const unsigned tagOctets = KLVTagTypeOctets(tagType);
    const std::streampos start = locator_->getPosition();
    while (octetsSince(*locator_, start) < length) {
      const auto tag = static_cast<std::uint32_t>(readBigEndian(*stream_, tagOctets));
      const std::uint64_t itemLength = readItemLength(*stream_, lengthType, *currentForm_, *handler_);
      std::uint8_t* buffer = nullptr;
      const bool taken = handler_->startLocalItem(tag, itemLength, buffer);
      transferValue(*stream_, *handler_, taken, itemLength, buffer, seekable_);
      handler_->endLocalItem(tag);
    }
    if (octetsSince(*locator_, start) != length) throw parse_error(klvLengthErrorId, "incorrect local set length");
  }
  handler_->endLocalSet(key_);
}

KLVLengthType KLVVariableLengthPack::getLengthType() const {
  KLVLengthType lengthType = 0;
  if (!KLVVariableLengthPackCoding(key_, lengthType))
    throw parse_error(klvCodingErrorId, detailed("invalid variable length pack type", octetText(key_[5])));
  return lengthType;
}

void KLVVariableLengthPack::parse() {
  const std::uint64_t length = readBERLength(*stream_, *currentForm_, *handler_);
  const KLVLengthType lengthType = getLengthType();
  if (!handler_->startVariableLengthPack(key_, length, lengthType)) {
    skipValue(*stream_, length, seekable_);
  } else {
    const std::streampos start = locator_->getPosition();
    while (octetsSince(*locator_, start) < length) {
      const std::uint64_t itemLength = readItemLength(*stream_, lengthType, *currentForm_, *handler_);
      std::uint8_t* buffer = nullptr;
      const bool taken = handler_->startVariableLengthItem(itemLength, buffer);
      transferValue(*stream_, *handler_, taken, itemLength, buffer, seekable_);
      handler_->endVariableLengthItem();
    }
    if (octetsSince(*locator_, start) != length)
      throw parse_error(klvLengthErrorId, "incorrect variable length pack length");
  }
  handler_->endVariableLengthPack(key_);
}
