#include "mxf.h"

namespace {

// The automatic choice: four-octet lengths, and eight-octet ones for what
// four cannot hold.
constexpr std::uint64_t longElementLength = 0x1000000;

}  // namespace

MXFGCEssenceCoder::MXFGCEssenceCoder(KLVHandler* handler) : handler_(handler) {}

bool MXFGCEssenceCoder::startEssenceElement(const KLVKey&, std::uint64_t, std::uint8_t*&) { return true; }

void MXFGCEssenceCoder::pictureElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  writeElement(key, data, length);
}

void MXFGCEssenceCoder::soundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  writeElement(key, data, length);
}

void MXFGCEssenceCoder::dataElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  writeElement(key, data, length);
}

void MXFGCEssenceCoder::compoundElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  writeElement(key, data, length);
}

// A reader piped into this coder thus keeps the forms of the file it reads.
void MXFGCEssenceCoder::essenceLengthForm(std::uint8_t form) { lengthForm_ = form; }

// Elements are large: the value goes out straight from the caller's memory
// and is never copied, not even into a buffer offered downstream.
void MXFGCEssenceCoder::writeElement(const KLVKey& key, const std::uint8_t* data, std::uint64_t length) {
  std::uint8_t form = lengthForm_;
  if (form == KLVNoLengthForm) form = length < longElementLength ? KLVFourOctetLengthForm : KLVEightOctetLengthForm;
  handler_->setLengthForm(form);
  std::uint8_t* buffer = nullptr;
  if (handler_->startIndividualItem(key, length, buffer))
    handler_->value(data, static_cast<std::streamsize>(length));
  handler_->endIndividualItem(key);
}
