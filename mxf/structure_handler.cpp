#include "mxf.h"

MXFStructureHandler::~MXFStructureHandler() = default;

void DullMXFStructureHandler::setRunIn(std::uint32_t) {}
void DullMXFStructureHandler::startStream() {}
void DullMXFStructureHandler::endStream(bool) {}
void DullMXFStructureHandler::startPartition(const KLVKey&, const MXFPartitionPack&, std::uint64_t) {}
void DullMXFStructureHandler::endPartition(const KLVKey&) {}
void DullMXFStructureHandler::randomIndex(const std::vector<MXFRandomIndexEntry>&) {}
