// The file form of an RGBALayout: its 16 octets as they stand.
#ifndef ZELTA_METADATA_RGBA_LAYOUT_H
#define ZELTA_METADATA_RGBA_LAYOUT_H

#include <istream>
#include <ostream>

#include "metadata.h"

// Reads to the end: anything but 16 octets fails "valid size".
void internalize(std::istream& in, RGBALayout& v);
void externalize(std::ostream& out, const RGBALayout& v);

#endif
