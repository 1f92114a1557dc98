// Zelta: the metadata model, one header of sub-headers: objects, factories
// and model coding; the structural classes; locators and descriptors; the
// codec descriptors; text-based descriptive metadata; acquisition metadata
// objects.
#ifndef ZELTA_METADATA_H
#define ZELTA_METADATA_H

#include "metadata_objects.h"
#include "metadata_structural.h"
#include "metadata_descriptors.h"
#include "metadata_codec_descriptors.h"
#include "metadata_text_based.h"
#include "metadata_acquisition.h"

#endif
