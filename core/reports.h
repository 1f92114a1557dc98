// Reports to a client's error handler, and the forms in which their texts
// name keys, octets, tags and identifiers.
#ifndef ZELTA_CORE_REPORTS_H
#define ZELTA_CORE_REPORTS_H

#include <cstdint>
#include <string>

#include "klv.h"

namespace zelta {

// An error handler that may be missing: a report to a missing one vanishes.
// A fatal report is thrown by its reporter all the same.
class Reports {
public:
  explicit Reports(ErrorHandler* handler = nullptr) : handler_(handler) {}

  void setHandler(ErrorHandler* handler) { handler_ = handler; }
  ErrorHandler* handler() const { return handler_; }

  void warning(const MXFUID& identifier, const std::string& message) const {
    if (handler_) handler_->warning(identifier, message);
  }
  void error(const MXFUID& identifier, const std::string& message) const {
    if (handler_) handler_->error(identifier, message);
  }
  void fatalError(const MXFUID& identifier, const std::string& message) const {
    if (handler_) handler_->fatalError(identifier, message);
  }

private:
  ErrorHandler* handler_;
};

// A report's text with a detail: the text, " - " and the detail.
std::string detailed(const std::string& text, const std::string& detail);

// Sixteen upper-case two-digit hexadecimal octets joined by ".".
std::string keyText(const KLVKey& key);
// "0x" and the octet in two upper-case hexadecimal digits.
std::string octetText(std::uint8_t octet);
// "0x" and the number in upper-case hexadecimal digits, at least digits of
// them.
std::string hexText(std::uint64_t value, int digits);
// The two octets of a local tag, each in two upper-case hexadecimal digits,
// joined by ".".
std::string tagText(std::uint32_t tag);
// The sixteen octets in lower-case hexadecimal digits, grouped 8-4-4-4-12 by
// "-".
std::string identifierText(const MXFUID& identifier);

}  // namespace zelta

#endif
