// The labels that the validators' tests put in partition packs, spelled as
// the registry has them.
#ifndef ZELTA_TESTS_KIT_VALIDATORS_CONTAINER_LABELS_H
#define ZELTA_TESTS_KIT_VALIDATORS_CONTAINER_LABELS_H

#include "support/recording.h"

namespace zelta_test {

inline const KLVKey d10Label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 01 01 01");
inline const KLVKey mpegLabel = keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 60 01");
inline const KLVKey proxyLabel = keyOf("06 0E 2B 34 04 01 01 02 0D 01 03 01 02 04 61 07");
inline const KLVKey aes3Label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 03 00");
inline const KLVKey waveLabel = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 06 01 00");
inline const KLVKey proxySoundLabel = keyOf("06 0E 2B 34 04 01 01 03 0D 01 03 01 02 0A 03 00");
inline const KLVKey ancLabel = keyOf("06 0E 2B 34 04 01 01 09 0D 01 03 01 02 0E 00 00");
inline const KLVKey multipleLabel = keyOf("06 0E 2B 34 04 01 01 03 0D 01 03 01 02 7F 01 00");
inline const KLVKey unknownPictureLabel = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 02 7E 01 00");
inline const KLVKey op1aLabel = keyOf("06 0E 2B 34 04 01 01 01 0D 01 02 01 01 01 09 00");
inline const KLVKey proxyPatternLabel = keyOf("06 0E 2B 34 04 01 01 01 0E 06 02 01 40 01 09 00");
inline const KLVKey opAtomLabel = keyOf("06 0E 2B 34 04 01 01 02 0D 01 02 01 10 03 00 00");

}  // namespace zelta_test

#endif
