// The splitter behind GenericKLVReader on spelled bytes, and behind
// MXFReader on files of independent writers.
#include "gc_splitter_fixture.h"

#include <fstream>

#include "support/mxf_streams.h"

using namespace zelta_test;
using namespace zelta_test::gc;

namespace {

class GCSplitterReader : public GCSplitterTest {};

// The essence of a whole file through MXFReader.
void readFileEssence(const std::string& name, MXFGCSplitter& splitter) {
  std::ifstream in(dataPath(name), std::ios::binary);
  ASSERT_TRUE(in.good());
  MXFReader reader;
  reader.setEssenceHandler(&splitter);
  reader.read(in);
}

ByteVector slice(const ByteVector& bytes, std::size_t offset, std::size_t size) {
  return ByteVector(bytes.begin() + static_cast<std::ptrdiff_t>(offset),
                    bytes.begin() + static_cast<std::ptrdiff_t>(offset + size));
}

// The SDTI-CP system metadata pack key in both files.
const KLVKey fileSystemKey = keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00");

}  // namespace

TEST_F(GCSplitterReader, LocalSetItemsArriveInStreamOrder) {
  // Two-octet tags and lengths.
  const ByteVector bytes = concat({bytesOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00 83 00 00 0F"),
                                   bytesOf("81 02 00 02 0A 0B"), bytesOf("81 01 00 00"), bytesOf("81 03 00 01 0C")});
  readThrough(bytes, splitter, &errors);
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"start 0", "startEditUnit", line("startSystemElement", systemSetKey()),
                                      line("systemLocalSet", systemSetKey()) + " 8102=0A 0B;8101=;8103=0C;",
                                      "endEditUnit", "end"}));
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterReader, VariablePackItemsArriveInStreamOrder) {
  const ByteVector bytes = concat({bytesOf("06 0E 2B 34 02 04 01 01 0D 01 03 01 14 03 01 00 83 00 00 0A"),
                                   bytesOf("83 00 00 02 01 02"), bytesOf("83 00 00 00")});
  readThrough(bytes, splitter, &errors);
  EXPECT_EQ(handler.events[3], line("systemVariablePack", systemVariablePackKey()) + " 01 02;;");
}

TEST_F(GCSplitterReader, FixedPackArrivesWhole) {
  readThrough(element(systemPackKey(), {1, 2, 3, 4}), splitter, &errors);
  ASSERT_EQ(handler.fixedPacks.size(), 1u);
  EXPECT_EQ(handler.fixedPacks[0], (ByteVector{1, 2, 3, 4}));
}

TEST_F(GCSplitterReader, UnwantedLocalSetIsSkippedWhole) {
  handler.wantSystem = false;
  const ByteVector bytes = concat({bytesOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00 83 00 00 06"),
                                   bytesOf("81 02 00 02 0A 0B"), element(pictureKey(), {5})});
  readThrough(bytes, splitter, &errors);
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"start 0", "startEditUnit", line("startSystemElement", systemSetKey()),
                                      "essenceLengthForm 0x83", line("startEssenceElement", pictureKey(), 1),
                                      line("pictureElement", pictureKey(), 1), "endEditUnit", "end"}));
}

TEST_F(GCSplitterReader, LocalItemsAreTakenAlsoForAnUnwantedSet) {
  handler.wantSystem = false;
  open();
  std::uint8_t* buffer = nullptr;
  EXPECT_FALSE(splitter.startLocalSet(systemSetKey(), 5, KLVTagType2, KLVLengthType2));
  EXPECT_TRUE(splitter.startLocalItem(0x8101, 1, buffer));
  EXPECT_EQ(buffer, nullptr);
  const std::uint8_t octet = 1;
  splitter.value(&octet, 1);
  splitter.endLocalItem(0x8101);
  splitter.endLocalSet(systemSetKey());
  close();
  EXPECT_EQ(std::count_if(handler.events.begin(), handler.events.end(),
                          [](const std::string& e) { return e.rfind("systemLocalSet", 0) == 0; }),
            0);
}

TEST_F(GCSplitterReader, NonStandardFormOfTheStreamIsWarnedOnce) {
  readThrough(concat({element(pictureKey(), {1}, 0x84), element(pictureKey(), {2}, 0x84)}), splitter, &errors);
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x02));
  EXPECT_EQ(errors.reports[0].message, "non-standard BER length form - 0x84");
  EXPECT_EQ(handler.events[2], "essenceLengthForm 0x84");
}

TEST_F(GCSplitterReader, LabelIsReportedAndTheStreamGoesOn) {
  const KLVKey label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 15 01 05 00");
  readThrough(concat({element(pictureKey(), {1}), bytesOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 15 01 05 00"),
                      element(pictureKey(), {2})}),
              splitter, &errors);
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, message("invalid GC element", label));
  EXPECT_EQ(handler.elements.size(), 2u);
}

// ffmpeg, D-10 50 Mbit/s 625 lines without sound: three edit units, each a
// system pack of 57 octets, a package set of 55 octets in all, key and
// length included, that stands 77 octets behind the pack's key, and a
// picture element of 250000 octets.
TEST(GCSplitterFiles, D10FileHasThreeEditUnitsOfSystemPackAndPicture) {
  RecordingGCHandler handler;
  RecordingErrorHandler errors;
  MXFGCSplitter splitter(&handler, &handler, &handler);
  splitter.setErrorHandler(&errors);
  readFileEssence("ffmpeg_d10_50m_625_noaudio.mxf", splitter);
  const ByteVector file = readFile(dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  const KLVKey packageSetKey(slice(file, 0x1600 + 77, 16).data());
  ASSERT_TRUE(slice(file, 0x1600 + 77 + 16, 4) == bytesOf("83 00 00 23"));
  // One item: a one-octet tag, a two-octet length, 32 octets.
  const ByteVector item = slice(file, 0x1600 + 77 + 20, 35);
  ASSERT_TRUE(slice(item, 0, 3) == bytesOf("83 00 20"));
  const std::string packageSetItems = "0083=" + hexOf(slice(item, 3, 32)) + ";";
  const KLVKey picture = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 05 01 01 00");
  std::vector<std::string> expected{"start 0"};
  for (int unit = 0; unit < 3; ++unit) {
    expected.push_back("startEditUnit");
    expected.push_back(line("startSystemElement", fileSystemKey));
    expected.push_back(line("systemFixedPack", fileSystemKey) + " " + hexOf(handler.fixedPacks.at(unit)));
    expected.push_back(line("startSystemElement", packageSetKey));
    expected.push_back(line("systemLocalSet", packageSetKey) + " " + packageSetItems);
    if (unit == 0) expected.push_back("essenceLengthForm 0x83");
    expected.push_back(line("startEssenceElement", picture, 250000));
    expected.push_back(line("pictureElement", picture, 250000));
    expected.push_back("endEditUnit");
  }
  expected.push_back("end");
  EXPECT_EQ(handler.events, expected);
  EXPECT_TRUE(errors.reports.empty());
  for (const ByteVector& pack : handler.fixedPacks) EXPECT_EQ(pack.size(), 57u);
  // The values, against the octets of the file: the elements' keys stand at
  // 0x1800, 0x3EC00 and 0x7C000, the values 20 octets behind.
  const std::size_t keys[] = {0x1800, 0x3EC00, 0x7C000};
  for (int unit = 0; unit < 3; ++unit)
    EXPECT_TRUE(handler.elements[unit].bytes == slice(file, keys[unit] + 20, 250000)) << unit;
  EXPECT_TRUE(handler.fixedPacks[0] == slice(file, 0x1600 + 20, 57));
}

// ffmpeg, DV 25 Mbit/s 4:2:0 with two mono sound tracks: six edit units, each
// a system pack, a compound element of 144000 octets and two sound elements
// of 3840.
TEST(GCSplitterFiles, DVFileHasSixEditUnitsOfCompoundAndTwoSounds) {
  RecordingGCHandler handler(RecordingGCHandler::takeIntoBuffer);
  RecordingErrorHandler errors;
  MXFGCSplitter splitter(&handler, &handler, &handler);
  splitter.setErrorHandler(&errors);
  readFileEssence("ffmpeg_dv25_625_420_2mono.mxf", splitter);
  EXPECT_TRUE(errors.reports.empty());
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "startEditUnit"), 6);
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "endEditUnit"), 6);
  EXPECT_EQ(handler.fixedPacks.size(), 6u);
  ASSERT_EQ(handler.elements.size(), 18u);
  const KLVKey compound = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 18 01 01 00");
  const KLVKey firstSound = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 02 03 00");
  const KLVKey secondSound = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 02 03 01");
  for (std::size_t unit = 0; unit < 6; ++unit) {
    const RecordingGCHandler::Element* e = &handler.elements[unit * 3];
    EXPECT_EQ(e[0].kind, "compound");
    EXPECT_EQ(e[0].key, compound);
    EXPECT_EQ(e[0].length, 144000u);
    EXPECT_EQ(e[1].kind, "sound");
    EXPECT_EQ(e[1].key, firstSound);
    EXPECT_EQ(e[1].length, 3840u);
    EXPECT_EQ(e[2].key, secondSound);
    EXPECT_EQ(e[2].length, 3840u);
  }
  // Read into the handler's own buffers, and delivered from there.
  for (std::size_t i = 0; i < handler.elements.size(); ++i)
    EXPECT_EQ(handler.elements[i].data, handler.buffers[i].data()) << i;
  const ByteVector file = readFile(dataPath("ffmpeg_dv25_625_420_2mono.mxf"));
  EXPECT_TRUE(handler.elements[0].bytes == slice(file, 0x2000 + 20, 144000));
  EXPECT_TRUE(handler.elements[1].bytes == slice(file, 0x25400 + 20, 3840));
  EXPECT_TRUE(handler.elements[2].bytes == slice(file, 0x26400 + 20, 3840));
  EXPECT_TRUE(handler.elements[15].bytes == slice(file, 0xBCE00 + 20, 144000));
  EXPECT_TRUE(handler.elements[17].bytes == slice(file, 0xE1200 + 20, 3840));
}

TEST(GCSplitterFiles, DVFileWithoutEssenceHandlerStillHasItsEditUnits) {
  RecordingGCHandler structure;
  MXFGCSplitter splitter;
  splitter.setStructureHandler(&structure);
  readFileEssence("ffmpeg_dv25_625_420_2mono.mxf", splitter);
  EXPECT_EQ(std::count(structure.events.begin(), structure.events.end(), "startEditUnit"), 6);
  EXPECT_TRUE(structure.elements.empty());
}

// GStreamer, the same DV without a system item: six edit units of a
// compound element with a four-octet length and two sound elements with
// three-octet lengths. Two kinds in a container without a system item are
// reported once, at the first sound element, and every change to the
// three-octet form is warned of.
TEST(GCSplitterFiles, DVFileWithoutSystemItemReportsItsSecondKindOnce) {
  RecordingGCHandler handler;
  RecordingErrorHandler errors;
  MXFGCSplitter splitter(&handler, &handler, &handler);
  splitter.setErrorHandler(&errors);
  readFileEssence("gst_dv25_625_420_2mono.mxf", splitter);
  const KLVKey compound = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 18 01 01 01");
  const KLVKey firstSound = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 02 01 01");
  const KLVKey secondSound = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 16 02 01 02");
  std::vector<std::string> expected{"start 0"};
  for (int unit = 0; unit < 6; ++unit) {
    expected.insert(expected.end(), {"startEditUnit", "essenceLengthForm 0x83",
                                     line("startEssenceElement", compound, 144000),
                                     line("compoundElement", compound, 144000), "essenceLengthForm 0x82",
                                     line("startEssenceElement", firstSound, 3840),
                                     line("soundElement", firstSound, 3840),
                                     line("startEssenceElement", secondSound, 3840),
                                     line("soundElement", secondSound, 3840), "endEditUnit"});
  }
  expected.push_back("end");
  EXPECT_EQ(handler.events, expected);
  std::vector<std::string> messages;
  for (const Report& report : errors.reports) messages.push_back(report.severity + " " + report.message);
  std::vector<std::string> expectedMessages;
  for (int unit = 0; unit < 6; ++unit) {
    expectedMessages.push_back("warning non-standard BER length form - 0x82");
    if (unit == 0) expectedMessages.push_back("error " + message("unexpected GC essence element", firstSound));
  }
  // The footer pack's length is in short form, and its form reaches the
  // essence stream before the pack ends that stream.
  expectedMessages.push_back("warning non-standard BER length form - 0x01");
  EXPECT_EQ(messages, expectedMessages);
}
