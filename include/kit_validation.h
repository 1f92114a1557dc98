// Zelta: the identifiers of the reports by which the kit's reader tells
// where a file breaks the rules of the kit's file kinds. Part of kit.h,
// which includes it.
#ifndef ZELTA_INCLUDE_KIT_VALIDATION_H
#define ZELTA_INCLUDE_KIT_VALIDATION_H

#include "klv_values.h"

// Essence container labels and the operational pattern.
inline constexpr MXFUID kitEssenceContainersId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x02);
// A body or footer partition where the kind allows none.
inline constexpr MXFUID kitPartitionId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x03);
inline constexpr MXFUID kitPartitionStatusId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x04);
inline constexpr MXFUID kitFooterPartitionId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x05);
inline constexpr MXFUID kitRandomIndexId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x06);
// The KAG and the alignment of partitions.
inline constexpr MXFUID kitKAGId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x07);
inline constexpr MXFUID kitHeaderByteCountId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x08);
inline constexpr MXFUID kitBodySIDId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x09);
inline constexpr MXFUID kitIndexSIDId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x0A);
// Edit rates, and the values and counts of metadata.
inline constexpr MXFUID kitValueId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x0C);
// Start timecodes and the user stamps of system items.
inline constexpr MXFUID kitTimecodeId = ZeltaErrorId(0x4C, 0x50, 0x00, 0x0E);

#endif
