// Zelta: the MXF layer, one header of sub-headers that follow its parts:
// structure, primer and header metadata, structure coding and the reader,
// index tables, the writer, and the generic container.
#ifndef ZELTA_MXF_H
#define ZELTA_MXF_H

#include "mxf_structure.h"
#include "mxf_primer.h"
#include "mxf_reader.h"
#include "mxf_index.h"
#include "mxf_writer.h"
#include "mxf_generic_container.h"
#include "mxf_d10.h"
#include "mxf_system.h"
#include "mxf_picture_index.h"

#endif
