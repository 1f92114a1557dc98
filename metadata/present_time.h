// The present time as the date properties of new objects hold it.
#ifndef ZELTA_METADATA_PRESENT_TIME_H
#define ZELTA_METADATA_PRESENT_TIME_H

#include "klv.h"

namespace zelta {

// UTC to the second; the quarter-millisecond is 0.
MXFTimestamp presentTimestamp();

}  // namespace zelta

#endif
