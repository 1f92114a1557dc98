// Zelta: the kit layer, one header of sub-headers: the master metadata and
// the kit's identity, the metadata factory, the model builder and master
// extraction, the reader, the writer and the driver.
#ifndef ZELTA_KIT_H
#define ZELTA_KIT_H

#include "kit_builder.h"
#include "kit_driver.h"
#include "kit_extraction.h"
#include "kit_factory.h"
#include "kit_master.h"
#include "kit_reader.h"
#include "kit_validation.h"
#include "kit_writer.h"

#endif
