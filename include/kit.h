// Zelta: the kit layer, one header of sub-headers: the master metadata and
// the kit's identity, the metadata factory, and the model builder.
#ifndef ZELTA_KIT_H
#define ZELTA_KIT_H

#include "kit_builder.h"
#include "kit_factory.h"
#include "kit_master.h"

#endif
