#include "klv.h"

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
