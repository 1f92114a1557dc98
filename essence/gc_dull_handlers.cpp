#include "mxf.h"

MXFGCStructureHandler::~MXFGCStructureHandler() = default;

MXFGCSystemHandler::~MXFGCSystemHandler() = default;

MXFGCEssenceHandler::~MXFGCEssenceHandler() = default;

void DullMXFGCStructureHandler::start(std::uint64_t) {}
void DullMXFGCStructureHandler::end() {}
void DullMXFGCStructureHandler::startEditUnit() {}
void DullMXFGCStructureHandler::endEditUnit() {}
void DullMXFGCStructureHandler::startSlice() {}
void DullMXFGCStructureHandler::endSlice() {}
void DullMXFGCStructureHandler::startPaddedElement(std::uint64_t) {}
void DullMXFGCStructureHandler::endPaddedElement() {}
void DullMXFGCStructureHandler::startAlignedElement(std::uint64_t) {}
void DullMXFGCStructureHandler::endAlignedElement() {}

bool DullMXFGCSystemHandler::startSystemElement(const KLVKey&) { return false; }
void DullMXFGCSystemHandler::systemLocalSet(const KLVKey&, const MXFGCLocalItems&) {}
void DullMXFGCSystemHandler::systemFixedPack(const KLVKey&, const ByteVector&) {}
void DullMXFGCSystemHandler::systemVariablePack(const KLVKey&, const MXFGCVariableItems&) {}

bool DullMXFGCEssenceHandler::startEssenceElement(const KLVKey&, std::uint64_t, std::uint8_t*&) { return false; }
void DullMXFGCEssenceHandler::pictureElement(const KLVKey&, const std::uint8_t*, std::uint64_t) {}
void DullMXFGCEssenceHandler::soundElement(const KLVKey&, const std::uint8_t*, std::uint64_t) {}
void DullMXFGCEssenceHandler::dataElement(const KLVKey&, const std::uint8_t*, std::uint64_t) {}
void DullMXFGCEssenceHandler::compoundElement(const KLVKey&, const std::uint8_t*, std::uint64_t) {}
void DullMXFGCEssenceHandler::essenceLengthForm(std::uint8_t) {}
