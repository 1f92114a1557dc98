// The header metadata of every file of tests/data as a model of the format's
// classes: which sets stay dark, the values against the dumps of independent
// tools, and the round trip of each model through the coders.
#include <gtest/gtest.h>

#include <string>
#include <typeinfo>
#include <vector>

#include "metadata.h"
#include "support/model_reading.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

// Sets of classes that the format's composite does not know.
const char* const aes3Set = "06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.47.00";
const char* const waveSet = "06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.48.00";
const char* const mpegVideoSet = "06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.51.00";
// mxfdump omits this one as a dark triplet; its key is in the KLV trace of
// mediainfo --Details (mediainfo_details.txt), at 0x1652 of the ffmpeg file.
const char* const avcSubDescriptorSet = "06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.6E.00";

struct ExpectedFile {
  const char* name;
  // The dark sets of the header partition, in file order.
  std::vector<const char*> darkSets;
  // The lowest identifier that a set refers to and that no recognised set of
  // the header partition has; empty when every reference finds its target.
  const char* danglingTarget;
  // One line per fact, as factsOf writes them.
  std::vector<std::string> facts;
};

// Spelled from the dumps of the original of each file (see the comment
// above each entry) in the header partition: set keys, instance
// identifiers and property values from mxfdump.txt, start timecodes
// confirmed by the StartTimecodes of mxf2raw.txt (10:00:00:00 at 25 is
// 900000), sizes and rates by the PictureDescriptor and SoundDescriptor of
// mxf2raw.txt. Tracks stand in the order of the package's track vector;
// the duration is the one of the track's sequence. A MultipleDescriptor's
// count is of the sub-descriptors whose class is the format's; they follow
// it in their order.
const std::vector<ExpectedFile> expectedFiles{
    // bmx/d10_50m_625_8ch24.mxf
    {"bmx_d10_50m_625_8ch24.mxf",
     {},
     "",
     {
         "preface essenceContainers 06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.01.01",
         "material track 1 rate 25/1 duration 5 timecode 900000/25/0",
         "material track 2 rate 25/1 duration 5",
         "material track 3 rate 25/1 duration 5",
         "source track 1 rate 25/1 duration 5 timecode 900000/25/0",
         "source track 2 rate 25/1 duration 5",
         "source track 3 rate 25/1 duration 5",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.01.01 subDescriptors 2",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.01.01 stored 720x304 display "
         "720x288 layout 1 aspect 4/3",
         "descriptor SoundDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.01.01 channels 8 bits 24",
     }},
    // bmx/op1a_dv25_625_bodypart_part4.mxf
    {"bmx_op1a_dv25_625_bodypart_part4.mxf",
     {waveSet, waveSet},
     "1806c81d-cf97-4c6d-ba45-0fe8dd65baca",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.01.00 "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00",
         "material track 901 rate 25/1 duration 6 timecode 0/25/0",
         "material track 1001 rate 25/1 duration 6",
         "material track 2001 rate 25/1 duration 6",
         "material track 2002 rate 25/1 duration 6",
         "source track 901 rate 25/1 duration 6 timecode 0/25/0",
         "source track 1001 rate 25/1 duration 6",
         "source track 2001 rate 25/1 duration 6",
         "source track 2002 rate 25/1 duration 6",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00 subDescriptors 1",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 stored 720x288 display "
         "720x288 layout 1 aspect 4/3",
     }},
    // bmx/op1a_dv25_625_singlepass.mxf
    {"bmx_op1a_dv25_625_singlepass.mxf",
     {waveSet, waveSet},
     "3c699ffd-f96d-4e3a-a47a-f2e9554f8f75",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.01.00 "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00",
         "material track 901 rate 25/1 duration -1 timecode 0/25/0",
         "material track 1001 rate 25/1 duration -1",
         "material track 2001 rate 25/1 duration -1",
         "material track 2002 rate 25/1 duration -1",
         "source track 901 rate 25/1 duration -1 timecode 0/25/0",
         "source track 1001 rate 25/1 duration -1",
         "source track 2001 rate 25/1 duration -1",
         "source track 2002 rate 25/1 duration -1",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00 subDescriptors 1",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 stored 720x288 display "
         "720x288 layout 1 aspect 4/3",
     }},
    // damaged/no_rip__ffmpeg_d10_30m_625_4ch16_cc8.mxf
    {"damaged_no_rip.mxf",
     {},
     "",
     {
         "preface essenceContainers 06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.05.01",
         "material track 1 rate 25/1 duration 4 timecode 0/25/0",
         "material track 2 rate 25/1 duration 4",
         "material track 3 rate 25/1 duration 4",
         "source track 1 rate 25/1 duration 4 timecode 0/25/0",
         "source track 2 rate 25/1 duration 4",
         "source track 3 rate 25/1 duration 4",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.05.01 subDescriptors 2",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.05.01 stored 720x304 display "
         "720x288 layout 1 aspect 4/3",
         "descriptor SoundDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.05.01 channels 8 bits 16",
     }},
    // damaged/truncated_50pct__bmx_op1a_dv25_625_420_2mono.mxf
    {"damaged_truncated_50pct.mxf",
     {waveSet, waveSet},
     "2bf45db6-2938-458d-a659-c7e58f782896",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.01.00 "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00",
         "material track 901 rate 25/1 duration 6 timecode 900000/25/0",
         "material track 1001 rate 25/1 duration 6",
         "material track 2001 rate 25/1 duration 6",
         "material track 2002 rate 25/1 duration 6",
         "source track 901 rate 25/1 duration 6 timecode 900000/25/0",
         "source track 1001 rate 25/1 duration 6",
         "source track 2001 rate 25/1 duration 6",
         "source track 2002 rate 25/1 duration 6",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00 subDescriptors 1",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 stored 720x288 display "
         "720x288 layout 1 aspect 4/3",
     }},
    // ffmpeg/d10_50m_625_noaudio.mxf
    {"ffmpeg_d10_50m_625_noaudio.mxf",
     {},
     "",
     {
         "preface essenceContainers 06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.01.01",
         "material track 1 rate 25/1 duration 3 timecode 0/25/0",
         "material track 2 rate 25/1 duration 3",
         "source track 1 rate 25/1 duration 3 timecode 0/25/0",
         "source track 2 rate 25/1 duration 3",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.01.01.01 stored 720x304 display "
         "720x288 layout 1 aspect 4/3",
     }},
    // ffmpeg/dv25_625_420_2mono.mxf
    {"ffmpeg_dv25_625_420_2mono.mxf",
     {aes3Set, aes3Set},
     "adab4424-2f25-4dc7-92ff-000e00000001",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.03.00 "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00",
         "material track 1 rate 25/1 duration 6 timecode 900000/25/0",
         "material track 2 rate 25/1 duration 6",
         "material track 3 rate 25/1 duration 6",
         "material track 4 rate 25/1 duration 6",
         "source track 1 rate 25/1 duration 6 timecode 900000/25/0",
         "source track 2 rate 25/1 duration 6",
         "source track 3 rate 25/1 duration 6",
         "source track 4 rate 25/1 duration 6",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00 subDescriptors 1",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 stored 720x288 display "
         "720x288 layout 1 aspect 4/3",
     }},
    // ffmpeg/h264_high_longgop_1080p25_2mono.mxf
    {"ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
     {avcSubDescriptorSet, aes3Set, aes3Set},
     "adab4424-2f25-4dc7-92ff-000e00000001",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.0a.0d.01.03.01.02.10.60.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.03.00 "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00",
         "material track 1 rate 25/1 duration 24 timecode 0/25/0",
         "material track 2 rate 25/1 duration 24",
         "material track 3 rate 25/1 duration 24",
         "material track 4 rate 25/1 duration 24",
         "source track 1 rate 25/1 duration 24 timecode 0/25/0",
         "source track 2 rate 25/1 duration 24",
         "source track 3 rate 25/1 duration 24",
         "source track 4 rate 25/1 duration 24",
         "descriptor MultipleDescriptor container "
         "06.0e.2b.34.04.01.01.03.0d.01.03.01.02.7f.01.00 subDescriptors 1",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.0a.0d.01.03.01.02.10.60.01 stored 1920x1088 "
         "display 1920x1080 layout 0 aspect 16/9",
     }},
    // ffmpeg/opatom_dv25_625_v1.mxf
    {"ffmpeg_opatom_dv25_625_v1.mxf",
     {},
     "",
     {
         "preface essenceContainers 06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01",
         "material track 1 rate 25/1 duration 6 timecode 0/25/0",
         "material track 2 rate 25/1 duration 6",
         "source track 1 rate 25/1 duration 6 timecode 0/25/0",
         "source track 2 rate 25/1 duration 6",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.02.01 stored 720x288 display "
         "720x288 layout 1 aspect 4/3",
     }},
    // gst/dv25_625_420_2mono.mxf
    {"gst_dv25_625_420_2mono.mxf",
     {waveSet, waveSet},
     "8f69c15d-2c51-4e25-abe8-0c2a6b933996",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.7f.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.01.00",
         "material track 1 rate 25/1 duration 6 timecode 0/25/0",
         "material track 2 rate 25/1 duration 6",
         "material track 3 rate 25/1 duration 6",
         "material track 4 rate 25/1 duration 6",
         "source track 1 rate 25/1 duration 6 timecode 0/25/0",
         "source track 2 rate 25/1 duration 6",
         "source track 3 rate 25/1 duration 6",
         "source track 4 rate 25/1 duration 6",
         "descriptor MultipleDescriptor container "
         "00.00.00.00.00.00.00.00.00.00.00.00.00.00.00.00 subDescriptors 1",
         "descriptor CDCIPictureDescriptor container "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.02.7f.01 stored 720x576 display "
         "- layout 0 aspect 4/3",
     }},
    // gst/h264_high_longgop_1080p25_2mono.mxf
    {"gst_h264_high_longgop_1080p25_2mono.mxf",
     {mpegVideoSet, waveSet, waveSet},
     "2184fef2-d08c-458a-9402-48940537c22d",
     {
         "preface essenceContainers "
         "06.0e.2b.34.04.01.01.0a.0d.01.03.01.02.10.60.01 "
         "06.0e.2b.34.04.01.01.01.0d.01.03.01.02.06.01.00",
         "material track 1 rate 25/1 duration 24 timecode 0/25/0",
         "material track 2 rate 25/1 duration 24",
         "material track 3 rate 25/1 duration 24",
         "material track 4 rate 25/1 duration 24",
         "source track 1 rate 25/1 duration 24 timecode 0/25/0",
         "source track 2 rate 25/1 duration 24",
         "source track 3 rate 25/1 duration 24",
         "source track 4 rate 25/1 duration 24",
         "descriptor MultipleDescriptor container "
         "00.00.00.00.00.00.00.00.00.00.00.00.00.00.00.00 subDescriptors 0",
     }},

};

std::string keyText(const KLVKey& key) {
  static const char digits[] = "0123456789abcdef";
  std::string text;
  for (std::size_t index = 0; index < 16; ++index) {
    if (index != 0) text += '.';
    text += digits[key[index] >> 4];
    text += digits[key[index] & 0x0F];
  }
  return text;
}

std::string rationalText(const MXFRational& rational) {
  return std::to_string(rational.numerator) + "/" + std::to_string(rational.denominator);
}

std::string trackFact(const Track& track) {
  std::string fact = " track " + std::to_string(track.getTrackID());
  if (const auto* timeline = dynamic_cast<const TimelineTrack*>(&track))
    fact += " rate " + rationalText(timeline->getEditRate());
  const auto sequence = std::dynamic_pointer_cast<const Sequence>(track.getSegment());
  if (!sequence) return fact + " without sequence";
  fact += " duration " + (sequence->hasDuration() ? std::to_string(sequence->getDuration()) : std::string("-"));
  for (std::size_t index = 0; index < sequence->getComponentCount(); ++index) {
    const auto timecode = std::dynamic_pointer_cast<const TimecodeComponent>(sequence->getComponentAt(index));
    if (timecode)
      fact += " timecode " + std::to_string(timecode->getStartTimecode()) + "/" +
              std::to_string(timecode->getRoundedTimecodeBase()) + "/" + std::to_string(timecode->getDropFrame());
  }
  return fact;
}

std::string descriptorClass(const GenericDescriptor& descriptor) {
  if (typeid(descriptor) == typeid(MultipleDescriptor)) return "MultipleDescriptor";
  if (typeid(descriptor) == typeid(CDCIPictureDescriptor)) return "CDCIPictureDescriptor";
  if (typeid(descriptor) == typeid(RGBAPictureDescriptor)) return "RGBAPictureDescriptor";
  if (typeid(descriptor) == typeid(PictureDescriptor)) return "PictureDescriptor";
  if (typeid(descriptor) == typeid(SoundDescriptor)) return "SoundDescriptor";
  if (typeid(descriptor) == typeid(DataDescriptor)) return "DataDescriptor";
  return typeid(descriptor).name();
}

std::string descriptorFact(const FileDescriptor& descriptor) {
  std::string fact =
      "descriptor " + descriptorClass(descriptor) + " container " + keyText(descriptor.getEssenceContainer());
  if (const auto* multiple = dynamic_cast<const MultipleDescriptor*>(&descriptor))
    fact += " subDescriptors " + std::to_string(multiple->getSubDescriptorCount());
  if (const auto* picture = dynamic_cast<const PictureDescriptor*>(&descriptor)) {
    fact += " stored " + std::to_string(picture->getStoredWidth()) + "x" + std::to_string(picture->getStoredHeight()) +
            " display ";
    fact += picture->hasDisplayWidth()
                ? std::to_string(picture->getDisplayWidth()) + "x" + std::to_string(picture->getDisplayHeight())
                : std::string("-");
    fact +=
        " layout " + std::to_string(picture->getFrameLayout()) + " aspect " + rationalText(picture->getAspectRatio());
  }
  if (const auto* sound = dynamic_cast<const SoundDescriptor*>(&descriptor))
    fact += " channels " + std::to_string(sound->getChannelCount()) + " bits " +
            std::to_string(sound->getQuantizationBits());
  return fact;
}

void addDescriptorFacts(const SourcePackage& package, std::vector<std::string>& facts) {
  const auto descriptor = std::dynamic_pointer_cast<const FileDescriptor>(package.getDescriptor());
  if (!descriptor) return;
  facts.push_back(descriptorFact(*descriptor));
  if (const auto multiple = std::dynamic_pointer_cast<const MultipleDescriptor>(descriptor))
    for (std::size_t index = 0; index < multiple->getSubDescriptorCount(); ++index)
      facts.push_back(descriptorFact(*multiple->getSubDescriptorAt(index)));
}

// The facts of a model in the words of the table above.
std::vector<std::string> factsOf(const Preface& preface) {
  std::vector<std::string> facts;
  std::string containers = "preface essenceContainers";
  for (const KLVKey& label : preface.getEssenceContainers()) containers += " " + keyText(label);
  facts.push_back(containers);
  const auto storage = preface.getContentStorage();
  for (std::size_t index = 0; index < storage->getPackageCount(); ++index) {
    const auto package = storage->getPackageAt(index);
    const auto source = std::dynamic_pointer_cast<const SourcePackage>(package);
    const std::string kind = source ? "source" : "material";
    for (std::size_t track = 0; track < package->getTrackCount(); ++track)
      facts.push_back(kind + trackFact(*package->getTrackAt(track)));
    if (source) addDescriptorFacts(*source, facts);
  }
  return facts;
}

// What the model parser is expected to say: each dark set as it comes, and
// one warning at the end for the references that they leave pending.
std::vector<std::string> expectedReports(const ExpectedFile& file) {
  std::vector<std::string> reports;
  for (const char* key : file.darkSets) reports.push_back(std::string("warning unrecognized (dark) metadata - ") + key);
  if (*file.danglingTarget != 0)
    reports.push_back(std::string("warning model has dangling references - ") + file.danglingTarget);
  return reports;
}

std::vector<std::string> reportTexts(const std::vector<Report>& reports) {
  std::vector<std::string> texts;
  for (const Report& report : reports) texts.push_back(report.severity + " " + report.message);
  return texts;
}

class HeaderModelOfFile : public testing::TestWithParam<ExpectedFile> {};

std::string testName(const testing::TestParamInfo<ExpectedFile>& info) {
  std::string name = info.param.name;
  name = name.substr(0, name.size() - 4);
  for (char& c : name)
    if (c == '-' || c == '.') c = '_';
  return name;
}

}  // namespace

TEST_P(HeaderModelOfFile, FirstRootIsThePreface) {
  const HeaderModel header = readHeaderModel(GetParam().name);
  ASSERT_EQ(1, header.modelCount);
  ASSERT_EQ(1u, header.model.size());
  EXPECT_NE(nullptr, std::dynamic_pointer_cast<Preface>(header.model.front()));
}

TEST_P(HeaderModelOfFile, ReportsAreTheDarkSetsAndTheReferencesTheyLeave) {
  const HeaderModel header = readHeaderModel(GetParam().name);
  EXPECT_EQ(expectedReports(GetParam()), reportTexts(header.modelReports));
  for (const Report& report : header.modelReports)
    EXPECT_EQ(report.message.rfind("unrecognized", 0) == 0 ? unrecognizedMetadataId : danglingReferencesId,
              report.identifier)
        << report.message;
}

TEST_P(HeaderModelOfFile, ValuesAgreeWithTheIndependentDumps) {
  const HeaderModel header = readHeaderModel(GetParam().name);
  ASSERT_FALSE(header.model.empty());
  const auto preface = std::dynamic_pointer_cast<Preface>(header.model.front());
  ASSERT_NE(nullptr, preface);
  EXPECT_EQ(GetParam().facts, factsOf(*preface));
}

TEST_P(HeaderModelOfFile, RoundTripThroughTheCodersGivesAnEqualModel) {
  const HeaderModel header = readHeaderModel(GetParam().name);
  ASSERT_FALSE(header.model.empty());
  const RewrittenModel rewritten = rewriteModel(header.model);
  EXPECT_EQ(std::vector<std::string>{}, reportTexts(rewritten.reports));
  EXPECT_EQ("", modelDifference(header.model, rewritten.model));
}

INSTANTIATE_TEST_SUITE_P(FilesOfTestData, HeaderModelOfFile, testing::ValuesIn(expectedFiles), testName);

TEST(MXFFormatMetadataModelFactory, SubFactoriesAreTheFormatsClassesInSearchOrder) {
  MXFFormatMetadataModelFactory factory;
  const std::vector<const std::type_info*> types{&typeid(Preface),
                                                 &typeid(Identification),
                                                 &typeid(ContentStorage),
                                                 &typeid(EssenceContainerData),
                                                 &typeid(NetworkLocator),
                                                 &typeid(TextLocator),
                                                 &typeid(Sequence),
                                                 &typeid(SourceClip),
                                                 &typeid(TimelineTrack),
                                                 &typeid(EventTrack),
                                                 &typeid(StaticTrack),
                                                 &typeid(TimecodeComponent),
                                                 &typeid(CommentMarker),
                                                 &typeid(DMSegment),
                                                 &typeid(DMSourceClip),
                                                 &typeid(MaterialPackage),
                                                 &typeid(SourcePackage),
                                                 &typeid(MultipleDescriptor),
                                                 &typeid(PictureDescriptor),
                                                 &typeid(CDCIPictureDescriptor),
                                                 &typeid(RGBAPictureDescriptor),
                                                 &typeid(SoundDescriptor),
                                                 &typeid(DataDescriptor),
                                                 &typeid(ContainerConstraintsSubDescriptor)};
  const MXFMetadataModelFactory::Factories& factories = factory.getFactories();
  ASSERT_EQ(types.size(), factories.size());
  for (std::size_t index = 0; index < types.size(); ++index)
    EXPECT_TRUE(factories[index]->canCode(*types[index])) << types[index]->name();
}

TEST(MXFFormatMetadataModelFactory, SetsOfLaterAndOfAbstractClassesAreNotRecognised) {
  MXFFormatMetadataModelFactory factory;
  EXPECT_FALSE(factory.canParse(keyOf(aes3Set)));
  EXPECT_FALSE(factory.canParse(keyOf(waveSet)));
  EXPECT_FALSE(factory.canParse(keyOf(mpegVideoSet)));
  EXPECT_FALSE(factory.canParse(keyOf(avcSubDescriptorSet)));
  EXPECT_FALSE(factory.canParse(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.25.00")));  // FileDescriptor
  EXPECT_FALSE(factory.canParse(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.38.00")));  // Track
  EXPECT_TRUE(factory.canParse(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.2F.00")));   // Preface
  EXPECT_TRUE(factory.canParse(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.67.00")));
  EXPECT_EQ(typeid(ContainerConstraintsSubDescriptor),
            factory.getType(keyOf("06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01.67.00")));
}

TEST(ModelRoundTrip, DarkPropertyOfAFileModelComesBackUnderItsKey) {
  const HeaderModel header = readHeaderModel("ffmpeg_d10_50m_625_noaudio.mxf");
  ASSERT_FALSE(header.model.empty());
  const KLVKey key = keyOf("06.0E.2B.34.01.01.01.0E.0E.7F.01.02.03.04.05.06");
  header.model.front()->setDarkProperty(key, bytesOf("01 02 03"));
  const RewrittenModel rewritten = rewriteModel(header.model);
  EXPECT_EQ("", modelDifference(header.model, rewritten.model));
  ASSERT_FALSE(rewritten.model.empty());
  EXPECT_EQ(bytesOf("01 02 03"), rewritten.model.front()->getDarkProperty(key));
}

TEST(ModelDifference, TwoReadsOfOneFileAreEqual) {
  EXPECT_EQ("", modelDifference(readHeaderModel("gst_dv25_625_420_2mono.mxf").model,
                                readHeaderModel("gst_dv25_625_420_2mono.mxf").model));
}

TEST(ModelDifference, FindsADarkPropertyThatDiffersDeepInTheTree) {
  const HeaderModel left = readHeaderModel("ffmpeg_dv25_625_420_2mono.mxf");
  const HeaderModel right = readHeaderModel("ffmpeg_dv25_625_420_2mono.mxf");
  ASSERT_FALSE(left.model.empty());
  ASSERT_FALSE(right.model.empty());
  const KLVKey key = keyOf("06.0E.2B.34.01.01.01.0E.0E.7F.01.02.03.04.05.06");
  const auto track =
      std::dynamic_pointer_cast<Preface>(right.model.front())->getContentStorage()->getPackageAt(1)->getTrackAt(2);
  track->setDarkProperty(key, bytesOf("01"));
  const std::string difference = modelDifference(left.model, right.model);
  EXPECT_NE(std::string::npos, difference.find(toString(key))) << difference;
}

TEST(ModelDifference, FindsAnOwnedObjectThatIsMissing) {
  const HeaderModel left = readHeaderModel("ffmpeg_dv25_625_420_2mono.mxf");
  const HeaderModel right = readHeaderModel("ffmpeg_dv25_625_420_2mono.mxf");
  ASSERT_FALSE(left.model.empty());
  ASSERT_FALSE(right.model.empty());
  std::dynamic_pointer_cast<Preface>(right.model.front())->getContentStorage()->getPackageAt(0)->removeTrackAt(3);
  EXPECT_NE("", modelDifference(left.model, right.model));
}

// The reader refuses the OP-Atom file of bmx: behind the primer, at 0x1400,
// stands an element whose key does not begin with 06 0E 2B 34 (mediainfo
// loses its synchronisation there, the README of the files counts two
// non-SMPTE keys at 5120). The metadata stream ends before any set, so no
// model comes. Its header pack has a headerByteCount of 0x3FF20 and a
// kagSize of 0x100 (mxfdump.txt).
TEST(HeaderModelOfRefusedFile, AvidOpAtomFileOfBmxStopsAtItsNonSMPTEKeyWithoutModel) {
  const HeaderModel header = readHeaderModel("bmx_avid_opatom_dv25_625_v1.mxf");
  EXPECT_EQ("invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4", header.failure);
  EXPECT_EQ(0, header.modelCount);
  EXPECT_TRUE(header.model.empty());
  EXPECT_TRUE(header.modelReports.empty());
  EXPECT_EQ((std::vector<std::string>{"warning headerByteCount is not a multiple of kagSize",
                                      "fatal invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4"}),
            reportTexts(header.readerReports));
  ASSERT_EQ(2u, header.readerReports.size());
  EXPECT_EQ(headerByteCountKagId, header.readerReports[0].identifier);
  EXPECT_EQ(klvCodingErrorId, header.readerReports[1].identifier);
}

// Octet 13 of the header partition key is flipped to FD, which mxfdump
// answers with "is not an MXF file": the first element is a pack that no
// partition starts with, and the read ends before any partition.
TEST(HeaderModelOfRefusedFile, FileWithFlippedHeaderKeyEndsBeforeAnyPartition) {
  const HeaderModel header = readHeaderModel("damaged_flipped_header_partition_key_byte13.mxf");
  EXPECT_EQ("unexpected fixed length pack - 06.0E.2B.34.02.05.01.01.0D.01.02.01.01.FD.04.00", header.failure);
  EXPECT_EQ(0, header.partitions);
  EXPECT_EQ(0, header.modelCount);
  EXPECT_TRUE(header.modelReports.empty());
  ASSERT_EQ(1u, header.readerReports.size());
  EXPECT_EQ("fatal", header.readerReports[0].severity);
  EXPECT_EQ(unexpectedElementId, header.readerReports[0].identifier);
}

// The file cut at half its length ends inside an essence element of the
// second body partition (the README: H, B x2, the KLV at 326097 runs past
// the end). The essence is skipped, so the read ends normally, and the
// header model is complete, as the table above shows.
TEST(HeaderModelOfDamagedFile, TruncatedFileReadsToItsEndAndGivesItsHeaderModel) {
  const HeaderModel header = readHeaderModel("damaged_truncated_50pct.mxf");
  EXPECT_EQ("", header.failure);
  EXPECT_EQ(3, header.partitions);
  EXPECT_EQ(1, header.modelCount);
}
