#include <memory>

#include "core/reports.h"
#include "klv.h"
#include "klv/elements.h"
#include "klv/file_read_ahead.h"
#include "klv/stream_input.h"

namespace {

// The filter next to the reader, which also answers where the read is.
struct PositionFilter {
  std::unique_ptr<KLVFilter> filter;
  Locator* locator;
};

PositionFilter makePositionFilter(std::istream& stream, bool seekable, KLVHandler* next) {
  if (seekable) {
    auto teller = std::make_unique<KLVTeller>(stream, next);
    Locator* locator = teller->getLocator();
    return PositionFilter{std::move(teller), locator};
  }
  auto monitor = std::make_unique<KLVMonitor>(next);
  Locator* locator = monitor->getLocator();
  return PositionFilter{std::move(monitor), locator};
}

void readElements(std::istream& stream, std::streampos stop, KLVHandler& handler, Locator& locator, bool seekable) {
  std::uint8_t currentForm = KLVNoLengthForm;
  for (;;) {
    zelta::klv::parseElement(zelta::klv::readKey(stream), stream, handler, currentForm, locator, seekable);
    check(stream.good(), "successful parse() implies input stream is good");
    if (stop != std::streampos(-1) && std::streamoff(stop) <= std::streamoff(locator.getPosition())) return;
    if (zelta::klv::atEnd(stream)) return;
  }
}

// Ends an aborted read; what the handlers throw here would hide the cause.
void endAborted(KLVHandler* handler, ErrorHandler* errorHandler) {
  try {
    if (handler) handler->endStream(true);
  } catch (...) {
  }
  try {
    if (errorHandler) errorHandler->end();
  } catch (...) {
  }
}

// A stream that is bad on entry is a fatal error before any KLV event.
[[noreturn]] void failBadStream(ErrorHandler* errorHandler) {
  const KLVElement::parse_error failure(streamFailureId, "input stream is not good()");
  try {
    zelta::Reports(errorHandler).fatalError(failure.getIdentifier(), failure.what());
  } catch (...) {
    endAborted(nullptr, errorHandler);
    throw;
  }
  endAborted(nullptr, errorHandler);
  throw failure;
}

}  // namespace

KLVReader::~KLVReader() = default;

GenericKLVReader::GenericKLVReader() : handler_(nullptr), errorHandler_(nullptr) {}

void GenericKLVReader::setHandler(KLVHandler* handler) { handler_ = handler; }

KLVHandler* GenericKLVReader::getHandler() const {
  check(handler_ != nullptr, "handler is present");
  return handler_;
}

void GenericKLVReader::setErrorHandler(ErrorHandler* errorHandler) { errorHandler_ = errorHandler; }

ErrorHandler* GenericKLVReader::getErrorHandler() const {
  check(errorHandler_ != nullptr, "error handler is present");
  return errorHandler_;
}

void GenericKLVReader::read(std::istream& stream) { read(stream, std::streampos(-1)); }

void GenericKLVReader::read(std::istream& stream, std::streampos stop) {
  KLVHandler* client = getHandler();
  if (!stream.good()) failBadStream(errorHandler_);
  const zelta::klv::ReadAheadScope readAhead(stream);
  KLVFillItemKeyFilter fillFilter(client, getFillItemKeyVersion(stream), errorHandler_);
  const bool seekable = zelta::klv::isSeekable(stream);
  PositionFilter position = makePositionFilter(stream, seekable, &fillFilter);
  if (errorHandler_) {
    errorHandler_->setLocator(position.locator);
    errorHandler_->start();
  }
  try {
    try {
      position.filter->startStream(true);
      readElements(stream, stop, *position.filter, *position.locator, seekable);
    } catch (const KLVElement::parse_error& failure) {
      zelta::Reports(errorHandler_).fatalError(failure.getIdentifier(), failure.what());
      throw;
    }
  } catch (...) {
    endAborted(position.filter.get(), errorHandler_);
    throw;
  }
  try {
    position.filter->endStream(false);
  } catch (...) {
    endAborted(nullptr, errorHandler_);
    throw;
  }
  if (errorHandler_) errorHandler_->end();
}
