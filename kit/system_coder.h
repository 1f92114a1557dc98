// The system side of the kit's writer: SDTI-CP and proxy system elements
// onto the generic container's system events.
#ifndef ZELTA_KIT_SYSTEM_CODER_H
#define ZELTA_KIT_SYSTEM_CODER_H

#include "mxf.h"

class ZeltaSystemCoder {
 public:
  explicit ZeltaSystemCoder(MXFGCSystemHandler* handler);

  MXFSDTICPSystemHandler* getSDTICPHandler();
  MXFQMProxySystemHandler* getProxyHandler();

 private:
  MXFSDTICPSystemCoder sdticp_;
  MXFQMProxySystemCoder proxy_;
};

#endif
