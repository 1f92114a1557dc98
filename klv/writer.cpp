#include "klv.h"

namespace {

constexpr std::uint8_t shortForm = 1;
constexpr std::uint8_t versionNotLookedUp = 255;

bool isLongForm(std::uint8_t form) { return form > KLVNoLengthForm; }

// True when the number needs no more than the octets; eight always do.
bool fitsIn(std::uint64_t number, unsigned octets) { return octets >= 8 || (number >> (8 * octets)) == 0; }

// High octet first, in one write.
void putNumber(std::ostream& stream, std::uint64_t number, unsigned octets) {
  char bytes[8];
  for (unsigned i = 0; i < octets; ++i) bytes[i] = static_cast<char>(number >> (8 * (octets - 1 - i)));
  stream.write(bytes, octets);
  util::requireWritten(stream);
}

}  // namespace

GenericKLVWriter::GenericKLVWriter(std::ostream& stream) : stream_(&stream) {}

std::uint8_t GenericKLVWriter::getLengthForm() const { return currentForm_; }

unsigned GenericKLVWriter::getLongFormOctets() const {
  check(isLongForm(currentForm_), "long form");
  return currentForm_ & 0x7F;
}

void GenericKLVWriter::setTagType(KLVTagType tagType) { tagType_ = tagType; }

KLVTagType GenericKLVWriter::getTagType() const { return tagType_; }

void GenericKLVWriter::setLengthType(KLVLengthType lengthType) { lengthType_ = lengthType; }

KLVLengthType GenericKLVWriter::getLengthType() const { return lengthType_; }

void GenericKLVWriter::writeKey(const KLVKey& key) {
  stream_->write(reinterpret_cast<const char*>(key.data()), KLVKey::size());
  util::requireWritten(*stream_);
}

// The producer chose the form; a length is padded with leading zero octets
// to fill it.
void GenericKLVWriter::writeBERLength(std::uint64_t length) {
  if (isLongForm(currentForm_)) {
    const unsigned octets = getLongFormOctets();
    check(octets >= 1 && octets <= 8, "valid long form");
    check(fitsIn(length, octets), "enough subsequent octets");
    // The form octet and the length in one write.
    char bytes[9];
    bytes[0] = static_cast<char>(currentForm_);
    for (unsigned i = 0; i < octets; ++i) bytes[1 + i] = static_cast<char>(length >> (8 * (octets - 1 - i)));
    stream_->write(bytes, 1 + octets);
    util::requireWritten(*stream_);
    return;
  }
  check(currentForm_ == shortForm, "valid current form");
  check(length < 0x80, "valid short form length");
  putNumber(*stream_, length, 1);
}

void GenericKLVWriter::writeItemLength(std::uint64_t length) {
  if (lengthType_ == KLVLengthTypeBER) {
    writeBERLength(length);
    return;
  }
  const unsigned octets = KLVFixedLengthTypeOctets(lengthType_);
  check(fitsIn(length, octets), "enough octets");
  putNumber(*stream_, length, octets);
}

void GenericKLVWriter::setLocator(Locator*) {}

// Each length goes out before its value, so lengths must be exact when an
// element starts.
void GenericKLVWriter::startStream(bool hasAccurateLengths) {
  check(!started_, "has not started");
  check(hasAccurateLengths, "unbuffered output is possible");
  fillItemKeyVersion_ = versionNotLookedUp;
  buffered_ = false;
  started_ = true;
}

void GenericKLVWriter::endStream(bool) {
  check(started_, "has started");
  started_ = false;
}

void GenericKLVWriter::setLengthForm(std::uint8_t form) {
  check(form == shortForm || isLongForm(form), "valid form");
  currentForm_ = form;
}

// A fill key takes the stream's fill item key version, when it has one.
bool GenericKLVWriter::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  check(started_, "has started");
  if (key == KLVFillItemKey) {
    if (fillItemKeyVersion_ == versionNotLookedUp) fillItemKeyVersion_ = getFillItemKeyVersion(*stream_);
    KLVKey fillKey = key;
    if (fillItemKeyVersion_ != 0) fillKey[7] = fillItemKeyVersion_;
    writeKey(fillKey);
  } else {
    writeKey(key);
  }
  writeBERLength(length);
  return true;
}

void GenericKLVWriter::endIndividualItem(const KLVKey&) {}

bool GenericKLVWriter::startLabel(const KLVKey& key) {
  check(started_, "has started");
  writeKey(key);
  return true;
}

void GenericKLVWriter::endLabel(const KLVKey&) {}

bool GenericKLVWriter::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  check(started_, "has started");
  writeKey(key);
  writeBERLength(length);
  return true;
}

void GenericKLVWriter::endUniversalSet(const KLVKey&) {}

bool GenericKLVWriter::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType tagType,
                                     KLVLengthType lengthType) {
  check(started_, "has started");
  KLVTagType keyTagType = KLVTagType1;
  KLVLengthType keyLengthType = KLVLengthTypeBER;
  check(KLVLocalSetCoding(key, keyTagType, keyLengthType) && keyTagType == tagType && keyLengthType == lengthType,
        "correct local item type and length");
  writeKey(key);
  writeBERLength(length);
  tagType_ = tagType;
  lengthType_ = lengthType;
  return true;
}

void GenericKLVWriter::endLocalSet(const KLVKey&) {}

bool GenericKLVWriter::startLocalItem(std::uint32_t tag, std::uint64_t length, std::uint8_t*&) {
  check(started_, "has started");
  const unsigned tagOctets = KLVTagTypeOctets(tagType_);
  check(fitsIn(tag, tagOctets), "enough octets");
  putNumber(*stream_, tag, tagOctets);
  writeItemLength(length);
  return true;
}

void GenericKLVWriter::endLocalItem(std::uint32_t) {}

bool GenericKLVWriter::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  check(started_, "has started");
  writeKey(key);
  writeBERLength(length);
  return true;
}

void GenericKLVWriter::endFixedLengthPack(const KLVKey&) {}

bool GenericKLVWriter::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType lengthType) {
  check(started_, "has started");
  writeKey(key);
  writeBERLength(length);
  lengthType_ = lengthType;
  return true;
}

void GenericKLVWriter::endVariableLengthPack(const KLVKey&) {}

bool GenericKLVWriter::startVariableLengthItem(std::uint64_t length, std::uint8_t*&) {
  check(started_, "has started");
  writeItemLength(length);
  return true;
}

void GenericKLVWriter::endVariableLengthItem() {}

// The key says whether it is a wrapper.
bool GenericKLVWriter::startWrapper(const KLVKey& key, std::uint64_t length, bool, std::uint8_t*&) {
  check(started_, "has started");
  writeKey(key);
  writeBERLength(length);
  return true;
}

void GenericKLVWriter::endWrapper(const KLVKey&) {}

void GenericKLVWriter::value(const std::uint8_t* data, std::streamsize size) {
  check(started_, "has started");
  check(size >= 0, "valid streamsize");
  if (size == 0) return;
  stream_->write(reinterpret_cast<const char*>(data), size);
  util::requireWritten(*stream_);
}
