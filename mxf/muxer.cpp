#include "mxf.h"

// The order of construction matters: each part wraps the one before.
MXFMuxer::MXFMuxer()
    : monitor_(new KLVMonitor()),
      filter_(new KLVStreamFilter(monitor_.get())),
      metadataPadder_(new KLVStreamPadder(filter_.get())),
      indexPadder_(new KLVStreamPadder(filter_.get())),
      structureCoder_(new MXFStructureCoder(monitor_.get(), monitor_->getLocator(), metadataPadder_.get(),
                                            indexPadder_.get())) {}

MXFMuxer::MXFMuxer(KLVHandler* handler) : MXFMuxer() { setHandler(handler); }

MXFMuxer::~MXFMuxer() = default;

void MXFMuxer::setHandler(KLVHandler* handler) { monitor_->setHandler(handler); }

KLVHandler* MXFMuxer::getHandler() { return monitor_->getHandler(); }

MXFStructureHandler* MXFMuxer::getStructureHandler() { return structureCoder_.get(); }

KLVHandler* MXFMuxer::getMetadataHandler() { return metadataPadder_.get(); }

KLVHandler* MXFMuxer::getIndexHandler() { return indexPadder_.get(); }

KLVHandler* MXFMuxer::getEssenceHandler() { return filter_.get(); }
