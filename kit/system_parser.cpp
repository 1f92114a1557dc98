#include "kit/system_parser.h"

#include <memory>

ZeltaSystemParser::ZeltaSystemParser() = default;
ZeltaSystemParser::~ZeltaSystemParser() = default;

// A kind nobody asked for leaves no parser in progress, and the element is
// not wanted.
bool ZeltaSystemParser::startSystemElement(const KLVKey& key) {
  current_ = MXFQMProxySystemElementPattern.matches(key) ? static_cast<MXFGCSystemHandler*>(proxyParser_.get())
                                                         : sdticpParser_.get();
  return current_ && current_->startSystemElement(key);
}

void ZeltaSystemParser::systemLocalSet(const KLVKey& key, const MXFGCLocalItems& items) {
  current().systemLocalSet(key, items);
}

void ZeltaSystemParser::systemFixedPack(const KLVKey& key, const ByteVector& bytes) {
  current().systemFixedPack(key, bytes);
}

void ZeltaSystemParser::systemVariablePack(const KLVKey& key, const MXFGCVariableItems& items) {
  current().systemVariablePack(key, items);
}

void ZeltaSystemParser::setErrorHandler(ErrorHandler* errorHandler) {
  errorHandler_ = errorHandler;
  if (sdticpParser_) sdticpParser_->setErrorHandler(errorHandler);
  if (proxyParser_) proxyParser_->setErrorHandler(errorHandler);
}

void ZeltaSystemParser::setSDTICPHandler(MXFSDTICPSystemHandler* handler) {
  current_ = nullptr;
  sdticpParser_.reset(handler ? new MXFSDTICPSystemParser(handler) : nullptr);
  if (sdticpParser_ && errorHandler_) sdticpParser_->setErrorHandler(errorHandler_);
}

void ZeltaSystemParser::setProxyHandler(MXFQMProxySystemHandler* handler) {
  current_ = nullptr;
  proxyParser_.reset(handler ? new MXFQMProxySystemParser(handler) : nullptr);
  if (proxyParser_ && errorHandler_) proxyParser_->setErrorHandler(errorHandler_);
}

MXFGCSystemHandler& ZeltaSystemParser::current() {
  check(current_ != nullptr, "current handler is present");
  return *current_;
}
