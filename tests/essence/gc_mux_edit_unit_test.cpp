// A complete edit unit of a format with a system item, written through the
// muxer and read back as KLV.
#include <gtest/gtest.h>

#include <algorithm>

#include "essence/gc_mux_fixture.h"
#include "support/essence_recording.h"
#include "support/klv_streams.h"

using namespace zelta_test;
using namespace zelta_test::gcmux;
using zelta_test::klv::join;

namespace {

// Counting octets, so that a misplaced one shows.
ByteVector ramp(std::size_t length, std::uint8_t first) {
  ByteVector bytes(length);
  for (std::size_t i = 0; i < length; ++i) bytes[i] = static_cast<std::uint8_t>(first + i);
  return bytes;
}

const ByteVector systemPack = ramp(57, 0x40);
const MXFGCLocalItems systemItems{{0x0102, ramp(4, 0x10)}, {0x0103, ramp(8, 0x20)}};
const ByteVector picture = ramp(1000, 0x01);
const ByteVector sound = ramp(300, 0x80);
const ByteVector data = ramp(40, 0xC0);

// KAG 256. The system item is padded to one KAG unit, the picture aligned on
// the KAG, and sound and data padded together to two units.
void writeEditUnit(MXFGCMuxer& muxer) {
  MXFGCStructureHandler& structure = *muxer.getStructureHandler();
  MXFGCSystemHandler& system = *muxer.getSystemHandler();
  MXFGCEssenceHandler& essence = *muxer.getEssenceHandler();
  structure.start(256);
  structure.startEditUnit();
  structure.startSlice();
  structure.startPaddedElement(256);
  system.systemFixedPack(systemPackKey, systemPack);
  system.systemLocalSet(systemSetKey, systemItems);
  structure.endPaddedElement();
  structure.startAlignedElement(0);
  essence.pictureElement(pictureKey, picture.data(), picture.size());
  structure.endAlignedElement();
  structure.startPaddedElement(512);
  essence.soundElement(soundKey, sound.data(), sound.size());
  essence.dataElement(dataKey, data.data(), data.size());
  structure.endPaddedElement();
  structure.endSlice();
  structure.endEditUnit();
  structure.end();
}

ByteVector writtenEditUnit() {
  MuxedContainer container;
  writeEditUnit(container.muxer);
  return container.bytes();
}

const std::string fillKey = "06.0E.2B.34.01.01.01.01.03.01.02.10.01.00.00.00";

}  // namespace

TEST(MXFGCMuxer, EditUnitWithASystemItemHasItsGroupsWhereTheirLengthsPutThem) {
  const ByteVector bytes = writtenEditUnit();
  ASSERT_EQ(bytes.size(), 256u + 1280u + 512u);
  // System item: pack of 77, set of 40, fill.
  EXPECT_EQ(slice(bytes, 0, 20), bytesOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00 83 00 00 39"));
  EXPECT_EQ(slice(bytes, 20, 77), systemPack);
  EXPECT_EQ(slice(bytes, 77, 117),
            join({bytesOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00 83 00 00 14"), bytesOf("01 02 00 04"),
                  ramp(4, 0x10), bytesOf("01 03 00 08"), ramp(8, 0x20)}));
  EXPECT_EQ(slice(bytes, 117, 137), fillHeader(256 - 137));
  // Picture: 1020 octets from 256, fill to 1536.
  EXPECT_EQ(slice(bytes, 256, 276), bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 83 00 03 E8"));
  EXPECT_EQ(slice(bytes, 276, 1276), picture);
  EXPECT_EQ(slice(bytes, 1276, 1296), fillHeader(1536 - 1296));
  // Sound and data: 380 octets from 1536, fill to 2048.
  EXPECT_EQ(slice(bytes, 1536, 1556), bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 01 01 00 83 00 01 2C"));
  EXPECT_EQ(slice(bytes, 1556, 1856), sound);
  EXPECT_EQ(slice(bytes, 1856, 1876), bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 17 01 02 00 83 00 00 28"));
  EXPECT_EQ(slice(bytes, 1876, 1916), data);
  EXPECT_EQ(slice(bytes, 1916, 1936), fillHeader(2048 - 1936));
  EXPECT_TRUE(std::all_of(bytes.begin() + 1936, bytes.end(), [](std::uint8_t b) { return b == 0; }));
}

TEST(MXFGCMuxer, EditUnitWithASystemItemReadsBackAsKLV) {
  const ByteVector bytes = writtenEditUnit();
  util::vector_istream in(bytes);
  RecordingKLVHandler recorder;
  GenericKLVReader reader;
  reader.setHandler(&recorder);
  reader.read(in);
  std::vector<std::string> starts;
  for (const std::string& event : recorder.events)
    if (event.rfind("start", 0) == 0 && event.rfind("startStream", 0) != 0) starts.push_back(event);
  EXPECT_EQ(starts, (std::vector<std::string>{
                        "startFixedLengthPack " + toString(systemPackKey) + " 57",
                        "startLocalSet " + toString(systemSetKey) + " 20 1 2",
                        "startLocalItem 258 4",
                        "startLocalItem 259 8",
                        "startIndividualItem " + fillKey + " 119",
                        "startIndividualItem " + toString(pictureKey) + " 1000",
                        "startIndividualItem " + fillKey + " 240",
                        "startIndividualItem " + toString(soundKey) + " 300",
                        "startIndividualItem " + toString(dataKey) + " 40",
                        "startIndividualItem " + fillKey + " 112",
                    }));
  EXPECT_EQ(recorder.values, join({systemPack, ramp(4, 0x10), ramp(8, 0x20), ByteVector(119, 0), picture,
                                   ByteVector(240, 0), sound, data, ByteVector(112, 0)}));
}

TEST(MXFGCMuxer, EditUnitWithASystemItemReadsBackThroughTheSplitter) {
  const ByteVector bytes = writtenEditUnit();
  util::vector_istream in(bytes);
  RecordingGCHandler recorder;
  MXFGCSplitter splitter(&recorder, &recorder, &recorder);
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  reader.read(in);
  EXPECT_EQ(recorder.events,
            (std::vector<std::string>{
                "start 0",
                "startEditUnit",
                "startSystemElement " + toString(systemPackKey),
                "systemFixedPack " + toString(systemPackKey) + " " + hexOf(systemPack),
                "startSystemElement " + toString(systemSetKey),
                "systemLocalSet " + toString(systemSetKey) + " 0102=10 11 12 13;0103=" + hexOf(ramp(8, 0x20)) + ";",
                "essenceLengthForm 0x83",
                "startEssenceElement " + toString(pictureKey) + " 1000",
                "pictureElement " + toString(pictureKey) + " 1000",
                "startEssenceElement " + toString(soundKey) + " 300",
                "soundElement " + toString(soundKey) + " 300",
                "startEssenceElement " + toString(dataKey) + " 40",
                "dataElement " + toString(dataKey) + " 40",
                "endEditUnit",
                "end",
            }));
  ASSERT_EQ(recorder.elements.size(), 3u);
  EXPECT_EQ(recorder.elements[0].bytes, picture);
  EXPECT_EQ(recorder.elements[1].bytes, sound);
  EXPECT_EQ(recorder.elements[2].bytes, data);
}

// Without padding the muxer puts out again what a reader and a splitter
// piped into it heard, the file's length forms included.
TEST(MXFGCMuxer, SplitterPipedIntoTheMuxerKeepsTheFilesLengthForms) {
  const ByteVector original =
      join({bytesOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00 83 00 00 02 0A 0B"),
            bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 87 00 00 00 00 00 00 03 01 02 03"),
            bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 01 01 00 87 00 00 00 00 00 00 01 04"),
            bytesOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00 83 00 00 02 0C 0D"),
            bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00 87 00 00 00 00 00 00 01 05"),
            bytesOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 01 01 00 87 00 00 00 00 00 00 01 06")});
  MuxedContainer container;
  MXFGCSplitter splitter(container.muxer.getStructureHandler(), container.muxer.getSystemHandler(),
                         container.muxer.getEssenceHandler());
  util::vector_istream in(original);
  GenericKLVReader reader;
  reader.setHandler(&splitter);
  reader.read(in);
  EXPECT_EQ(container.bytes(), original);
}

TEST(MXFGCMuxer, HandlerIsTheMonitorsNextHandlerAndTheLocatorCountsWhatPassed) {
  RecordingKLVHandler first;
  RecordingKLVHandler second;
  MXFGCMuxer muxer;
  muxer.setHandler(&first);
  EXPECT_EQ(muxer.getHandler(), &first);
  muxer.setHandler(&second);
  EXPECT_EQ(muxer.getHandler(), &second);
  writeEditUnit(muxer);
  EXPECT_TRUE(first.events.empty());
  EXPECT_EQ(second.locator, muxer.getLocator());
  EXPECT_EQ(muxer.getLocator()->getPosition(), 2048);
}
