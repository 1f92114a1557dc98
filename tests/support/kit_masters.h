// Masters over the whole domain of the model builder: every essence format
// at every edit rate it allows, both Preface versions, with and without
// sound and ancillary data where the format allows them, and the picture
// kinds of the formats that have several. DV masters say that they carry
// ancillary data, as every DV file does. Each master holds the values that
// its built model shows, so that a model made of it gives it back.
#ifndef ZELTA_TESTS_SUPPORT_KIT_MASTERS_H
#define ZELTA_TESTS_SUPPORT_KIT_MASTERS_H

#include <memory>
#include <string>
#include <vector>

#include "kit.h"

namespace zelta_test {

enum class PictureKind { plain, studio, studioRGB, fullSize, reduced };

struct MasterShape {
  ZeltaEssenceFormat format = ZeltaEssenceFormat::D10;
  MXFRational editRate;
  std::uint16_t version = 0x0102;
  bool sound = false;
  bool ancillary = false;
  PictureKind picture = PictureKind::plain;
};

MasterShape shapeOf(ZeltaEssenceFormat format, MXFRational rate, std::uint16_t version, bool sound = true,
                    bool ancillary = false, PictureKind picture = PictureKind::plain);
std::shared_ptr<ZeltaDefaultMetadata> masterOf(const MasterShape& shape);
std::vector<MasterShape> masterDomain();
// "MPEG studio 25/1 v259 sound ancillary"
std::string describe(const MasterShape& shape);

}  // namespace zelta_test

#endif
