#include "klv.h"

namespace util {

assertion_failure::assertion_failure(const std::string& condition) : message_("assertion failure: " + condition) {}

const char* assertion_failure::what() const noexcept { return message_.c_str(); }

}  // namespace util

Locator::~Locator() = default;

ErrorHandler::~ErrorHandler() = default;
