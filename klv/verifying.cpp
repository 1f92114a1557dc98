#include <sstream>

#include "klv.h"
#include "klv/ber.h"
#include "klv/stream_input.h"

namespace {

// Hears the lengths read from the stream; a form other than the producer's
// ends the verification, since a rewrite must keep every length's width.
class FormGuard : public DullKLVHandler {
public:
  void setLengthForm(std::uint8_t) override { throw VerifyingKLVHandler::exception("Unexpected BER length form"); }
};

KLVHandler& formGuard() {
  static FormGuard guard;
  return guard;
}

std::string unexpectedKey(const KLVKey& expected, const KLVKey& actual) {
  std::ostringstream text;
  text << "Unexpected KLV Key, expected " << expected << ", actual " << actual;
  return text.str();
}

std::string unexpectedLength(std::uint64_t expected, std::uint64_t actual) {
  return "Unexpected KLV length, expected " + std::to_string(expected) + ", actual " + std::to_string(actual);
}

}  // namespace

const std::streampos& NullLocator::getPosition() { return position_; }

VerifyingKLVHandler::VerifyingKLVHandler(std::istream& stream, KLVHandler* handler)
    : stream_(&stream), handler_(handler) {}

// Declines every value, so that a producer sends no contents, only the next
// element to compare.
bool VerifyingKLVHandler::verify(const KLVKey& key, std::uint64_t length, bool hasLength) {
  const KLVKey actual = zelta::klv::readKey(*stream_);
  if (actual != key) throw exception(unexpectedKey(key, actual));
  if (!hasLength) return false;
  std::uint8_t form = currentForm_;
  const std::uint64_t actualLength = zelta::klv::readBERLength(*stream_, form, formGuard());
  if (actualLength != length) throw exception(unexpectedLength(length, actualLength));
  zelta::klv::skipValue(*stream_, length, true);
  return false;
}

void VerifyingKLVHandler::setLocator(Locator*) {}

void VerifyingKLVHandler::startStream(bool hasAccurateLengths) {
  if (handler_) handler_->startStream(hasAccurateLengths);
}

void VerifyingKLVHandler::endStream(bool aborted) {
  if (handler_) handler_->endStream(aborted);
}

void VerifyingKLVHandler::setLengthForm(std::uint8_t form) { currentForm_ = form; }

bool VerifyingKLVHandler::startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  return verify(key, length, true);
}

void VerifyingKLVHandler::endIndividualItem(const KLVKey&) {}

bool VerifyingKLVHandler::startLabel(const KLVKey& key) { return verify(key, 0, false); }

void VerifyingKLVHandler::endLabel(const KLVKey&) {}

bool VerifyingKLVHandler::startUniversalSet(const KLVKey& key, std::uint64_t length) {
  return verify(key, length, true);
}

void VerifyingKLVHandler::endUniversalSet(const KLVKey&) {}

bool VerifyingKLVHandler::startLocalSet(const KLVKey& key, std::uint64_t length, KLVTagType, KLVLengthType) {
  return verify(key, length, true);
}

void VerifyingKLVHandler::endLocalSet(const KLVKey&) {}

bool VerifyingKLVHandler::startLocalItem(std::uint32_t, std::uint64_t, std::uint8_t*&) {
  throw util::assertion_failure("expected local item");
}

void VerifyingKLVHandler::endLocalItem(std::uint32_t) {}

bool VerifyingKLVHandler::startFixedLengthPack(const KLVKey& key, std::uint64_t length, std::uint8_t*&) {
  return verify(key, length, true);
}

void VerifyingKLVHandler::endFixedLengthPack(const KLVKey&) {}

bool VerifyingKLVHandler::startVariableLengthPack(const KLVKey& key, std::uint64_t length, KLVLengthType) {
  return verify(key, length, true);
}

void VerifyingKLVHandler::endVariableLengthPack(const KLVKey&) {}

bool VerifyingKLVHandler::startVariableLengthItem(std::uint64_t, std::uint8_t*&) {
  throw util::assertion_failure("expected variable length item");
}

void VerifyingKLVHandler::endVariableLengthItem() {}

bool VerifyingKLVHandler::startWrapper(const KLVKey& key, std::uint64_t length, bool, std::uint8_t*&) {
  return verify(key, length, true);
}

void VerifyingKLVHandler::endWrapper(const KLVKey&) {}

void VerifyingKLVHandler::value(const std::uint8_t*, std::streamsize) {}

// ---------------------------------------------------------------------------
// findKey

namespace {

constexpr std::streamoff prefixOctets = sizeof zelta::klv::smptePrefix;

// Back to the first octet of the prefix just read: within the stream's
// buffer when it still holds the prefix.
void backUpOverPrefix(std::istream& stream) {
  if (zelta::klv::backWithinBuffer(stream, prefixOctets)) return;
  if (zelta::klv::isSeekable(stream)) {
    stream.clear(stream.rdstate() & ~std::ios_base::eofbit);
    stream.seekg(-prefixOctets, std::ios_base::cur);
    check(!stream.fail(), "successful seekg()");
    return;
  }
  std::streambuf* buffer = stream.rdbuf();
  for (std::streamoff i = prefixOctets; i-- > 0;) {
    const auto octet = static_cast<char>(zelta::klv::smptePrefix[i]);
    check(buffer->sputbackc(octet) != std::istream::traits_type::eof(), "successful putback()");
  }
}

}  // namespace

bool findKey(std::istream& stream, std::streamoff limit) {
  check(stream.good(), "input stream is good()");
  {
    const std::istream::sentry sentry(stream, true);
    std::streambuf* buffer = stream.rdbuf();
    std::streamoff read = 0;
    std::streamoff matched = 0;
    while (matched < prefixOctets) {
      const std::istream::int_type c = buffer->sbumpc();
      if (c == std::istream::traits_type::eof()) {
        stream.setstate(std::ios_base::failbit | std::ios_base::eofbit);
        return false;
      }
      ++read;
      if (static_cast<std::uint8_t>(c) == zelta::klv::smptePrefix[matched])
        ++matched;
      else
        matched = static_cast<std::uint8_t>(c) == zelta::klv::smptePrefix[0] ? 1 : 0;
      if (limit != -1 && read - matched > limit) return false;
    }
  }
  check(stream.good(), "input stream is good()");
  backUpOverPrefix(stream);
  return true;
}
