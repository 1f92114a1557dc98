#include "mxf.h"

MXFWriter::MXFWriter(std::ostream& stream) : writer_(stream) { muxer_.setHandler(&writer_); }

MXFWriter::~MXFWriter() = default;

MXFStructureHandler* MXFWriter::getStructureHandler() { return muxer_.getStructureHandler(); }

KLVHandler* MXFWriter::getMetadataHandler() { return muxer_.getMetadataHandler(); }

KLVHandler* MXFWriter::getIndexHandler() { return muxer_.getIndexHandler(); }

KLVHandler* MXFWriter::getEssenceHandler() { return muxer_.getEssenceHandler(); }

void MXFWriter::setHandler(KLVHandler* handler) { muxer_.setHandler(handler); }

void MXFWriter::resetHandler() { muxer_.setHandler(&writer_); }

KLVHandler* MXFWriter::getHandler() { return muxer_.getHandler(); }
