#include "kit/system_coder.h"

ZeltaSystemCoder::ZeltaSystemCoder(MXFGCSystemHandler* handler) : sdticp_(handler), proxy_(handler) {}

MXFSDTICPSystemHandler* ZeltaSystemCoder::getSDTICPHandler() { return &sdticp_; }

MXFQMProxySystemHandler* ZeltaSystemCoder::getProxyHandler() { return &proxy_; }
