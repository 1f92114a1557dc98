#include "klv.h"

const std::streampos& NullLocator::getPosition() { return position_; }

const std::streampos& InputLocator::getPosition() { return position_; }

const std::streampos& KLVMonitor::MonitoredLocator::getPosition() { return position_; }
