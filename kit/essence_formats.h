// What each essence format of the kit allows and how it is labelled: edit
// rates, essence containers, operational patterns, sound and data tracks and
// their track numbers, and the reading back of container labels.
#ifndef ZELTA_KIT_ESSENCE_FORMATS_H
#define ZELTA_KIT_ESSENCE_FORMATS_H

#include <cstdint>
#include <optional>
#include <vector>

#include "kit.h"
#include "klv.h"

namespace zelta {

// The edit rates of the kit's formats.
inline constexpr MXFRational rate23976{24000, 1001};
inline constexpr MXFRational rate24{24, 1};
inline constexpr MXFRational rate25{25, 1};
inline constexpr MXFRational rate2997{30000, 1001};
inline constexpr MXFRational rate30{30, 1};
inline constexpr MXFRational rate4795{48000, 1001};
inline constexpr MXFRational rate48{48, 1};
inline constexpr MXFRational rate50{50, 1};
inline constexpr MXFRational rate5994{60000, 1001};
inline constexpr MXFRational rate60{60, 1};

// Equal as cross products; a zero denominator equals no rate.
bool isSameRate(const MXFRational& a, const MXFRational& b);

// "supported essence format" for a value that names none of the six.
ZeltaEssenceFormat toEssenceFormat(std::uint32_t value);

// The format's edit rates ("valid essence format").
const std::vector<MXFRational>& getEditRates(ZeltaEssenceFormat format);
// "valid edit rate" for a rate outside the format's list.
void checkEditRate(ZeltaEssenceFormat format, const MXFRational& editRate);

// The container label of the picture: "valid edit rate", "valid bit rate"
// (D10: 30, 40 or 50 million; DV: exactly 25 million), "valid essence
// format".
KLVKey getEssenceContainer(ZeltaEssenceFormat format, std::uint32_t bitRate, const MXFRational& editRate);
// The Preface's list: the picture's container, the sound container unless
// it is inside the picture's, the data container but for DV, and the
// multiple essence label when that makes two or more.
std::vector<KLVKey> getEssenceContainers(ZeltaEssenceFormat format, std::uint32_t bitRate, const MXFRational& editRate,
                                         bool hasSound, bool hasData);
// Container label of a sound descriptor.
KLVKey getSoundContainer(ZeltaEssenceFormat format);
extern const KLVKey ancillaryDataContainer;
extern const KLVKey multipleEssenceContainer;

KLVKey getOperationalPattern(ZeltaEssenceFormat format);

// D10 carries all channels in one track, Proxy eight channels in four
// ("valid channelCount"), the others one track per channel.
std::uint32_t getSoundTrackCount(ZeltaEssenceFormat format, std::uint32_t channelCount);
// A channel's own rate when it has one, else the format's.
MXFRational getSoundRate(ZeltaEssenceFormat format, const MXFRational& rate);
// DV always has the data track, MPEG, Raw and AVC with ancillary data.
bool hasDataTrack(ZeltaEssenceFormat format, bool hasAncillaryData);

// Track numbers: the last four octets of the element key, big-endian.
std::uint32_t getPictureTrackNumber(ZeltaEssenceFormat format);
// Sound track index of trackCount, from 0.
std::uint32_t getSoundTrackNumber(ZeltaEssenceFormat format, std::uint32_t index, std::uint32_t trackCount);
// DV's data track is numbered as the sound track after the last one.
std::uint32_t getDataTrackNumber(ZeltaEssenceFormat format, std::uint32_t soundTrackCount);

// Container labels read back.
bool isD10Container(const KLVKey& label);
bool isDVContainer(const KLVKey& label);
// From octet 14 of a D-10 label ("recognized essence container").
std::uint32_t getD10BitRate(const KLVKey& label);
// From octet 14 of a DV label ("defined DV bit rate").
std::uint32_t getDVBitRate(const KLVKey& label);
// The format of a picture's container ("recognized essence container").
ZeltaEssenceFormat getEssenceFormat(const KLVKey& container);
// The same, or nothing for a container of no format of the kit.
std::optional<ZeltaEssenceFormat> findEssenceFormat(const KLVKey& container);

}  // namespace zelta

#endif
