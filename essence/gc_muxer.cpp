#include "mxf.h"

// The order of construction matters: the padder and the coders all write
// to the monitor, whose locator the padder needs.
MXFGCMuxer::MXFGCMuxer()
    : monitor_(new KLVMonitor()),
      padder_(new MXFGCStructurePadder(monitor_.get(), monitor_->getLocator())),
      systemCoder_(new MXFGCSystemCoder(monitor_.get())),
      essenceCoder_(new MXFGCEssenceCoder(monitor_.get())) {}

MXFGCMuxer::MXFGCMuxer(KLVHandler* handler) : MXFGCMuxer() { setHandler(handler); }

MXFGCMuxer::~MXFGCMuxer() = default;

void MXFGCMuxer::setHandler(KLVHandler* handler) { monitor_->setHandler(handler); }

KLVHandler* MXFGCMuxer::getHandler() { return monitor_->getHandler(); }

MXFGCStructureHandler* MXFGCMuxer::getStructureHandler() { return padder_.get(); }

MXFGCSystemHandler* MXFGCMuxer::getSystemHandler() { return systemCoder_.get(); }

MXFGCEssenceHandler* MXFGCMuxer::getEssenceHandler() { return essenceCoder_.get(); }

Locator* MXFGCMuxer::getLocator() { return monitor_->getLocator(); }
