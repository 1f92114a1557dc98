// Zelta: the kit layer, one header of sub-headers: the master metadata and
// the kit's identity.
#ifndef ZELTA_KIT_H
#define ZELTA_KIT_H

#include "kit_master.h"

#endif
