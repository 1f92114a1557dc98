// zelta-info --model: the object model of the header metadata, against the
// values that bmx's mxf2raw and the KLV dump of another library show for the
// original files. Identifiers are the dump's octets in the 8-4-4-4-12 form,
// UMIDs mxf2raw's without its points.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <string>

#include "support/recording.h"
#include "support/run_program.h"

namespace {

using zelta_test::dataPath;
using zelta_test::occurrences;
using zelta_test::ProgramRun;
using zelta_test::runZeltaInfo;

const char* const ffmpegDV = "ffmpeg_dv25_625_420_2mono.mxf";
const char* const gstDV = "gst_dv25_625_420_2mono.mxf";
const char* const bmxSinglePass = "bmx_op1a_dv25_625_singlepass.mxf";

ProgramRun modelJson(const std::string& path) {
  const ProgramRun run = runZeltaInfo("--json --model " + path);
  EXPECT_EQ(run.status, 0) << run.err;
  return run;
}

bool has(const std::string& text, const std::string& what) { return text.find(what) != std::string::npos; }

// The JSON object that starts at the first occurrence of `start`.
std::string objectAt(const std::string& json, const std::string& start) {
  const std::size_t begin = json.find(start);
  if (begin == std::string::npos) return std::string();
  int depth = 0;
  bool quoted = false;
  for (std::size_t i = begin; i < json.size(); ++i) {
    const char c = json[i];
    if (quoted) {
      if (c == '\\') ++i;
      if (c == '"') quoted = false;
    } else if (c == '"') {
      quoted = true;
    } else if (c == '{') {
      ++depth;
    } else if (c == '}' && --depth == 0) {
      return json.substr(begin, i - begin + 1);
    }
  }
  return std::string();
}

TEST(ZeltaInfoModel, FfmpegRootIsThePrefaceOfTheHeaderPartition) {
  const ProgramRun run = modelJson(dataPath(ffmpegDV));
  EXPECT_TRUE(has(run.out,
                  "\"model\": {\"partition\": 0, \"root\": {\"class\": \"Preface\", "
                  "\"instanceUID\": \"adab4424-2f25-4dc7-92ff-000b00000000\""))
      << run.out;
  EXPECT_TRUE(has(run.out, "\"unreferenced\": []}")) << run.out;
}

TEST(ZeltaInfoModel, FfmpegIdentificationNamesKeepTheirTerminator) {
  // ffmpeg ends each UTF-16 string with a zero code unit, which the dump shows.
  const ProgramRun run = modelJson(dataPath(ffmpegDV));
  EXPECT_TRUE(has(run.out, "\"Identification.companyName\": \"FFmpeg\\u0000\"")) << run.out;
  EXPECT_TRUE(has(run.out, "\"Identification.productName\": \"OP1a Muxer\\u0000\"")) << run.out;
  EXPECT_TRUE(has(run.out, "\"Identification.productVersion\": \"59.27.100.0.0\"")) << run.out;
  EXPECT_TRUE(has(run.out, "\"Identification.thisGenerationUID\": \"adab4424-2f25-4dc7-92ff-000c00000001\""))
      << run.out;
}

TEST(ZeltaInfoModel, FfmpegStrongReferencesNestTheOwnedObjects) {
  const ProgramRun run = modelJson(dataPath(ffmpegDV));
  const std::string storage = objectAt(run.out, "{\"class\": \"ContentStorage\"");
  ASSERT_FALSE(storage.empty()) << run.out;
  EXPECT_TRUE(has(run.out, "\"Preface.contentStorage\": {\"class\": \"ContentStorage\"")) << run.out;
  EXPECT_TRUE(has(storage, "\"ContentStorage.packages\": [{\"class\": \"MaterialPackage\"")) << storage;
  EXPECT_TRUE(has(storage, "\"Track.segment\": {\"class\": \"Sequence\"")) << storage;
  EXPECT_TRUE(has(storage, "\"SourcePackage.descriptor\": {\"class\": \"MultipleDescriptor\"")) << storage;
  EXPECT_TRUE(has(run.out, "\"Preface.identifications\": [{\"class\": \"Identification\"")) << run.out;
}

TEST(ZeltaInfoModel, FfmpegPackageUMIDsAndEditRates) {
  const ProgramRun run = modelJson(dataPath(ffmpegDV));
  const std::string material = objectAt(run.out, "{\"class\": \"MaterialPackage\"");
  EXPECT_TRUE(has(material,
                  "\"GenericPackage.packageUID\": "
                  "\"060a2b340101010501010d0013e467d852947134c5e467d80052947134c5e400\""))
      << material;
  const std::string source = objectAt(run.out, "{\"class\": \"SourcePackage\"");
  EXPECT_TRUE(has(source,
                  "\"GenericPackage.packageUID\": "
                  "\"060a2b340101010501010d0013e467d852947134c5e467d80052947134c5e401\""))
      << source;
  // Four tracks in each package, all at 25/1.
  EXPECT_EQ(occurrences(run.out, "\"TimelineTrack.editRate\": \"25/1\""), 8u) << run.out;
}

TEST(ZeltaInfoModel, FfmpegPictureDescriptorStoredSize) {
  const ProgramRun run = modelJson(dataPath(ffmpegDV));
  const std::string picture = objectAt(run.out, "{\"class\": \"CDCIPictureDescriptor\"");
  ASSERT_FALSE(picture.empty()) << run.out;
  EXPECT_TRUE(has(picture, "\"instanceUID\": \"adab4424-2f25-4dc7-92ff-000e00000000\"")) << picture;
  EXPECT_TRUE(has(picture, "\"PictureDescriptor.storedWidth\": 720,")) << picture;
  EXPECT_TRUE(has(picture, "\"PictureDescriptor.storedHeight\": 288,")) << picture;
  EXPECT_TRUE(has(picture, "\"PictureDescriptor.videoLineMap\": [23, 335]")) << picture;
  EXPECT_TRUE(has(picture, "\"FileDescriptor.essenceContainer\": \"06.0E.2B.34.04.01.01.01.0D.01.03.01.02.02.02.01\""))
      << picture;
  EXPECT_TRUE(has(picture, "\"dark\": {}")) << picture;
}

// ffmpeg/dv25_625_420_2mono.mxf.mxfdump.txt: two MXFAES3PCMDescriptor sets
// under the MultipleDescriptor beside the CDCI descriptor.
TEST(ZeltaInfoModel, FfmpegSoundDescriptorsAreAES3DescriptorsUnderTheMultipleDescriptor) {
  const ProgramRun run = modelJson(dataPath(ffmpegDV));
  EXPECT_FALSE(has(run.err, "unrecognized (dark) metadata")) << run.err;
  EXPECT_FALSE(has(run.err, "dangling references")) << run.err;
  const std::string multiple = objectAt(run.out, "{\"class\": \"MultipleDescriptor\"");
  EXPECT_EQ(occurrences(multiple, "\"class\": \"AES3AudioDescriptor\""), 2u) << multiple;
  EXPECT_EQ(occurrences(multiple, "\"class\": \"CDCIPictureDescriptor\""), 1u) << multiple;
  EXPECT_TRUE(has(multiple, "\"WaveAudioDescriptor.blockAlign\": 2")) << multiple;
  EXPECT_TRUE(has(multiple, "\"WaveAudioDescriptor.averageBytesPerSecond\": 96000")) << multiple;
}

// The kit's factory knows every descriptor that the three writers use: no
// object of any file's model fails to show, no set stays dark, and no
// sub-descriptor of a multiple descriptor is lost to a dangling reference.
TEST(ZeltaInfoModel, EveryFilesDescriptorsAreKnownToTheModel) {
  for (const char* name :
       {"bmx_avid_opatom_dv25_625_v1.mxf", "bmx_d10_50m_625_8ch24.mxf",
        "bmx_lgop_mpeg2lg_422hl_1080i25_cgop_8mono_part12.mxf", "bmx_op1a_dv25_625_bodypart_part4.mxf",
        "bmx_op1a_dv25_625_singlepass.mxf", "bmx_op1a_h264_high422_longgop_1080p25_2mono.mxf",
        "bmx_op1a_mpeg2lg_422hl_1080i25_ogop_8mono.mxf", "ffmpeg_d10_50m_525_4ch16.mxf",
        "ffmpeg_d10_50m_625_noaudio.mxf", "ffmpeg_dv25_625_420_2mono.mxf", "ffmpeg_h264_high_longgop_1080p25_2mono.mxf",
        "ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf", "ffmpeg_opatom_dv25_625_v1.mxf", "gst_dv25_625_420_2mono.mxf",
        "gst_h264_high_longgop_1080p25_2mono.mxf"}) {
    SCOPED_TRACE(name);
    const ProgramRun run = runZeltaInfo("--json --model " + dataPath(name));
    EXPECT_FALSE(has(run.out, "\"failure\"")) << run.out;
    EXPECT_FALSE(has(run.err, "dangling references")) << run.err;
    EXPECT_FALSE(has(run.err, "unrecognized (dark) metadata - 06.0E.2B.34.02.53.01.01.0D.01.01.01.01.01")) << run.err;
  }
}

TEST(ZeltaInfoModel, GStreamerPrimaryPackageIsTheMaterialPackageIdentifier) {
  const ProgramRun run = modelJson(dataPath(gstDV));
  EXPECT_TRUE(has(run.out, "\"Preface.primaryPackage\": \"3709140d-7099-45f0-a089-7e2e82692885\"")) << run.out;
  const std::string material = objectAt(run.out, "{\"class\": \"MaterialPackage\"");
  EXPECT_TRUE(has(material, "\"instanceUID\": \"3709140d-7099-45f0-a089-7e2e82692885\"")) << material;
  EXPECT_TRUE(has(material, "\"GenericPackage.name\": \"Material package\"")) << material;
  EXPECT_TRUE(has(material,
                  "\"GenericPackage.packageUID\": "
                  "\"060a2b340101010501010d2213f2a882c82ee11062f34f8d8180aa24f2d7ac5f\""))
      << material;
}

TEST(ZeltaInfoModel, GStreamerIdentificationAndTimestamps) {
  const ProgramRun run = modelJson(dataPath(gstDV));
  const std::string identification = objectAt(run.out, "{\"class\": \"Identification\"");
  EXPECT_TRUE(has(identification, "\"Identification.companyName\": \"GStreamer\"")) << identification;
  EXPECT_TRUE(has(identification, "\"Identification.productName\": \"GStreamer Multimedia Framework\""))
      << identification;
  EXPECT_TRUE(has(identification, "\"Identification.modificationDate\": \"2026-10-22 04:01:01.364\""))
      << identification;
  EXPECT_TRUE(has(run.out, "\"PictureDescriptor.storedWidth\": 720,")) << run.out;
  EXPECT_TRUE(has(run.out, "\"PictureDescriptor.storedHeight\": 576,")) << run.out;
  EXPECT_TRUE(has(run.out, "\"TimelineTrack.editRate\": \"25/1\"")) << run.out;
}

TEST(ZeltaInfoModel, BmxOpenHeaderShowsTheHeaderPartitionsMetadata) {
  // The header is open: its durations are still -1, the footer's repeat of
  // the metadata has 6.
  const ProgramRun run = modelJson(dataPath(bmxSinglePass));
  EXPECT_TRUE(has(run.out,
                  "\"model\": {\"partition\": 0, \"root\": {\"class\": \"Preface\", "
                  "\"instanceUID\": \"21654aeb-5f9b-44e4-b1f5-19a9959303e5\""))
      << run.out;
  EXPECT_TRUE(has(run.out, "\"Component.duration\": -1")) << run.out;
  EXPECT_FALSE(has(run.out, "\"Component.duration\": 6")) << run.out;
  EXPECT_TRUE(has(run.out, "\"Identification.companyName\": \"BBC\\u0000\"")) << run.out;
  EXPECT_TRUE(has(run.out, "\"Identification.modificationDate\": \"2026-11-22 04:01:02.132\"")) << run.out;
  EXPECT_TRUE(has(run.out,
                  "\"GenericPackage.packageUID\": "
                  "\"060a2b340101010501010f201300000053144df2fe5a41caa33af111203231c9\""))
      << run.out;
}

TEST(ZeltaInfoModel, TextFormNestsOwnedObjectsUnderTheirProperty) {
  const ProgramRun run = runZeltaInfo("--model " + dataPath(ffmpegDV));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_TRUE(has(run.out, "model of partition at 0:\n  Preface adab4424-2f25-4dc7-92ff-000b00000000\n")) << run.out;
  EXPECT_TRUE(has(run.out, "    Preface.contentStorage:\n      ContentStorage adab4424-2f25-4dc7-92ff-000d00000000\n"))
      << run.out;
  EXPECT_TRUE(has(run.out, "        ContentStorage.packages: 2 objects\n          MaterialPackage ")) << run.out;
  EXPECT_TRUE(has(run.out, "Identification.companyName: FFmpeg\\u0000\n")) << run.out;
  EXPECT_TRUE(has(run.out, "PictureDescriptor.storedWidth: 720\n")) << run.out;
}

// A copy of the ffmpeg file with one octet changed: the one at `offset` in
// the first occurrence of `octets`.
std::string changedCopy(const std::string& octets, std::size_t offset, std::uint8_t value, const std::string& name) {
  ByteVector bytes = zelta_test::readFile(dataPath(ffmpegDV));
  const ByteVector pattern = zelta_test::bytesOf(octets);
  const ByteVector::iterator found = std::search(bytes.begin(), bytes.end(), pattern.begin(), pattern.end());
  EXPECT_NE(found, bytes.end()) << octets;
  if (found != bytes.end()) *(found + static_cast<std::ptrdiff_t>(offset)) = value;
  const std::string path = ::testing::TempDir() + name;
  std::ofstream out(path, std::ios::binary | std::ios::trunc);
  out.write(reinterpret_cast<const char*>(bytes.data()), static_cast<std::streamsize>(bytes.size()));
  return path;
}

// The first primer names the Preface's object model version (tag 3B07) by a
// key that no class knows.
std::string fileWithUnknownPrimerKey() {
  return changedCopy("3b 07 06 0e 2b 34 01 01 01 02 03 01 02 01 04 00 00 00", 2 + 12, 0x7F,
                     "zelta-info-model-dark.mxf");
}

TEST(ZeltaInfoModel, PropertyUnknownToTheClassIsDarkByKeyWithItsOctets) {
  const std::string path = fileWithUnknownPrimerKey();
  const ProgramRun run = modelJson(path);
  const std::string preface = objectAt(run.out, "{\"class\": \"Preface\"");
  EXPECT_TRUE(has(preface, "\"dark\": {\"06.0E.2B.34.01.01.01.02.03.01.02.01.7F.00.00.00\": \"00000001\"}")) << preface;
  EXPECT_FALSE(has(preface, "Preface.objectModelVersion")) << preface;
  const ProgramRun text = runZeltaInfo("--model " + path);
  EXPECT_TRUE(has(text.out, "    dark 06.0E.2B.34.01.01.01.02.03.01.02.01.7F.00.00.00: 00000001\n")) << text.out;
  std::remove(path.c_str());
}

TEST(ZeltaInfoModel, ObjectThatNothingOwnsFollowsTheRootAndTheRootCannotBeCoded) {
  // The Preface's contentStorage names ...0077 instead of the ContentStorage
  // ...000d00000000, which is then owned by nothing.
  const std::string path = changedCopy("3b 03 00 10 ad ab 44 24 2f 25 4d c7 92 ff 00 0d 00 00 00 00", 4 + 15, 0x77,
                                       "zelta-info-model-unreferenced.mxf");
  const ProgramRun run = modelJson(path);
  EXPECT_TRUE(has(run.out,
                  "\"root\": {\"class\": \"Preface\", \"instanceUID\": "
                  "\"adab4424-2f25-4dc7-92ff-000b00000000\", "
                  "\"failure\": \"assertion failure: Preface.contentStorage is present\", "
                  "\"properties\": {}, \"dark\": {}}"))
      << run.out;
  EXPECT_TRUE(has(run.out,
                  "\"unreferenced\": [{\"class\": \"ContentStorage\", "
                  "\"instanceUID\": \"adab4424-2f25-4dc7-92ff-000d00000000\""))
      << run.out;
  EXPECT_TRUE(has(run.err, "warning: unreferenced objects - adab4424-2f25-4dc7-92ff-000d00000000\n")) << run.err;
  const ProgramRun text = runZeltaInfo("--model " + path);
  EXPECT_TRUE(has(text.out, "\n  unreferenced ContentStorage adab4424-2f25-4dc7-92ff-000d00000000\n")) << text.out;
  EXPECT_TRUE(has(text.out,
                  "  Preface adab4424-2f25-4dc7-92ff-000b00000000\n"
                  "    not coded: assertion failure: Preface.contentStorage is present\n"))
      << text.out;
  std::remove(path.c_str());
}

TEST(ZeltaInfoModel, TruncatedFileEndsNormallyWithTheClosedHeadersModel) {
  // Cut inside a body element: the header metadata is whole and closed.
  const ProgramRun run = runZeltaInfo("--json --model " + dataPath("damaged_truncated_50pct.mxf"));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_TRUE(has(run.out, "\"result\": \"ok\"")) << run.out;
  EXPECT_TRUE(has(run.out, "\"model\": {\"partition\": 0, \"root\": {\"class\": \"Preface\"")) << run.out;
  EXPECT_FALSE(has(run.out, "\"Component.duration\": -1")) << run.out;
}

TEST(ZeltaInfoModel, FileWithoutHeaderPartitionExitsOneWithoutModel) {
  const ProgramRun run = runZeltaInfo("--json --model " + dataPath("damaged_flipped_header_partition_key_byte13.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_TRUE(has(run.out, "\"model\": null, \"reports\": [{\"severity\": \"fatal\"")) << run.out;
  const ProgramRun text = runZeltaInfo("--model " + dataPath("damaged_flipped_header_partition_key_byte13.mxf"));
  EXPECT_EQ(text.status, 1);
  EXPECT_TRUE(has(text.out, "model: no header metadata\n")) << text.out;
}

TEST(ZeltaInfoModel, FatalErrorBeforeAnySetExitsOneWithAnEmptyModel) {
  // The non-SMPTE key at 5120 stops the read inside the header metadata,
  // before its first set.
  const ProgramRun run = runZeltaInfo("--json --model " + dataPath("bmx_avid_opatom_dv25_625_v1.mxf"));
  EXPECT_EQ(run.status, 1);
  EXPECT_TRUE(has(run.out, "\"model\": {\"partition\": 0, \"root\": null, \"unreferenced\": []}")) << run.out;
  EXPECT_EQ(run.err,
            "warning: headerByteCount is not a multiple of kagSize\n"
            "fatal: invalid SMPTE key - 80.53.08.00.36.21.08.04.B3.B3.98.A5.1C.90.11.D4\n");
}

TEST(ZeltaInfoModel, UsageErrorsKeepExitTwo) {
  EXPECT_EQ(runZeltaInfo("--model").status, 2);
  EXPECT_EQ(runZeltaInfo("--model --md5 " + dataPath(ffmpegDV)).status, 2);
}

TEST(ZeltaInfoModel, WithoutTheOptionThereIsNoModel) {
  const ProgramRun run = runZeltaInfo("--json " + dataPath(ffmpegDV));
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_FALSE(has(run.out, "\"model\"")) << run.out;
}

}  // namespace
