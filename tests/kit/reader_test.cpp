// The kit's reader: what it assembles for the handlers that are set, the
// system parser's choice of parser, the package item, and the splitter's
// private keys.
#include <gtest/gtest.h>

#include <fstream>
#include <memory>
#include <sstream>
#include <string>
#include <typeinfo>
#include <vector>

#include "core/failure.h"
#include "kit.h"
#include "kit/essence_splitter.h"
#include "kit/metadata_parser.h"
#include "kit/system_parser.h"
#include "support/essence_recording.h"
#include "support/kit_readers.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

std::shared_ptr<std::istream> fileStream(const std::string& name) {
  return std::make_shared<std::ifstream>(dataPath(name), std::ios::binary);
}

const KLVKey packageItemKey = keyOf("06 0E 2B 34 01 01 01 05 03 01 02 20 01 00 00 00");

// A factory that counts the objects it is asked to make.
class CountingFactory : public ZeltaMetadataFactory {
 public:
  MXFParsedObject parse(const MXFPrimedSet& set) override {
    ++parsed;
    return ZeltaMetadataFactory::parse(set);
  }
  int parsed = 0;
};

// ---------------------------------------------------------------------------
// The assembly

TEST(Reader, WithNoHandlerAtAllStillWalksTheWholeFile) {
  const ByteVector bytes = readFile(dataPath("ffmpeg_d10_50m_625_noaudio.mxf"));
  auto input = std::make_shared<std::istringstream>(std::string(bytes.begin(), bytes.end()));
  createZeltaReader(input)->read();
  input->clear();
  EXPECT_EQ(static_cast<std::size_t>(input->tellg()), bytes.size());
}

TEST(Reader, WithOnlyAnErrorHandlerReportsWhatMXFReaderReports) {
  for (const char* name : {"damaged_flipped_header_partition_key_byte13.mxf", "bmx_avid_opatom_dv25_625_v1.mxf",
                           "damaged_truncated_50pct.mxf", "gst_dv25_625_420_2mono.mxf"}) {
    SCOPED_TRACE(name);
    RecordingErrorHandler lower;
    std::ifstream file(dataPath(name), std::ios::binary);
    MXFReader reader;
    reader.setSkipRunIn(true);
    reader.setErrorHandler(&lower);
    std::string lowerFailure = "none";
    try {
      reader.read(file);
    } catch (const std::exception& failure) {
      lowerFailure = failure.what();
    }
    RecordingErrorHandler kit;
    std::shared_ptr<ZeltaReader> zelta = createZeltaReader(fileStream(name));
    zelta->setErrorHandler(borrowed<ErrorHandler>(kit));
    std::string kitFailure = "none";
    try {
      zelta->read();
    } catch (const std::exception& failure) {
      kitFailure = failure.what();
    }
    EXPECT_EQ(kitFailure, lowerFailure);
    EXPECT_EQ(reportLines(kit.reports), reportLines(lower.reports));
  }
  // bmx's Avid file gives a warning of the reader's own before its fatal
  // report.
  RecordingErrorHandler errors;
  std::shared_ptr<ZeltaReader> zelta = createZeltaReader(fileStream("bmx_avid_opatom_dv25_625_v1.mxf"));
  zelta->setErrorHandler(borrowed<ErrorHandler>(errors));
  EXPECT_THROW(zelta->read(), std::exception);
  ASSERT_EQ(errors.reports.size(), 2u);
  EXPECT_EQ(errors.reports[0].message, "headerByteCount is not a multiple of kagSize");
}

// A generic container structure handler or a proxy handler without an
// SDTI-CP handler gets no system validation: RuleFiles tests it on a file
// whose system items break the rule.

TEST(Reader, OnlyAnEssenceHandlerMakesNoMetadataObjectAndParsesNoIndex) {
  auto factory = std::make_shared<CountingFactory>();
  RecordingGCHandler essence;
  RecordingErrorHandler errors;
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(fileStream("ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf"));
  reader->setMetadataFactory(factory);
  reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(essence));
  reader->read();
  EXPECT_EQ(factory->parsed, 0);
  EXPECT_FALSE(essence.elements.empty());
  // The same factory with a metadata handler does make objects.
  RecordingZeltaMetadataHandler metadata;
  std::shared_ptr<ZeltaReader> again = createZeltaReader(fileStream("ffmpeg_mpeg2lg_422hl_1080i25_cgop_8mono.mxf"));
  again->setMetadataFactory(factory);
  again->setMetadataHandler(borrowed<ZeltaMetadataHandler>(metadata));
  again->read();
  EXPECT_GT(factory->parsed, 0);
}

// The metadata validator is not there yet: the metadata handler gets the
// parser's model as it stands, and no report of the metadata rules comes
// (identifiers 4c50000b and 4c50000c), even for a file that breaks them.
TEST(Reader, MetadataHandlerGetsTheParsersEventsWithoutAMetadataValidator) {
  ReadRecord record;
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(fileStream("gst_h264_high_longgop_1080p25_2mono.mxf"));
  reader->setMetadataHandler(borrowed<ZeltaMetadataHandler>(record.metadata));
  reader->setErrorHandler(borrowed<ErrorHandler>(record.errors));
  reader->read();
  // The header's model and the footer's.
  EXPECT_EQ(record.metadata.events, (std::vector<std::string>{"start", "model 1", "end", "start", "model 1", "end"}));
  for (const Report& report : record.errors.reports)
    EXPECT_FALSE(report.identifier[0] == 0x4C && report.identifier[1] == 0x50 &&
                 (report.identifier[3] == 0x0B || report.identifier[3] == 0x0C))
        << report.message;
}

TEST(Reader, SettersReplaceAndAnEmptyPointerClears) {
  RecordingStructureHandler first;
  RecordingStructureHandler second;
  auto input = fileStream("ffmpeg_d10_50m_625_noaudio.mxf");
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(input);
  reader->setStructureHandler(borrowed<MXFStructureHandler>(first));
  reader->setStructureHandler(borrowed<MXFStructureHandler>(second));
  reader->read();
  EXPECT_TRUE(first.events.empty());
  EXPECT_FALSE(second.events.empty());
  // A second read of the same stream, rewound, with the handler cleared.
  input->clear();
  input->seekg(0);
  const std::size_t events = second.events.size();
  reader->setStructureHandler(nullptr);
  reader->read();
  EXPECT_EQ(second.events.size(), events);
}

TEST(Reader, ExceptionOfTheClientsHandlerPassesThroughRead) {
  class Stopper : public DullMXFGCStructureHandler {
   public:
    void startEditUnit() override { throw std::runtime_error("stop here"); }
  };
  Stopper stopper;
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(fileStream("ffmpeg_d10_50m_625_noaudio.mxf"));
  reader->setGCStructureHandler(borrowed<MXFGCStructureHandler>(stopper));
  try {
    reader->read();
    ADD_FAILURE() << "no exception";
  } catch (const std::runtime_error& failure) {
    EXPECT_STREQ(failure.what(), "stop here");
  }
}

TEST(Reader, MissingInputFailsAtCreation) {
  EXPECT_EQ(failureOf([] { createZeltaReader(nullptr); }), "assertion failure: input stream is present");
}

// ---------------------------------------------------------------------------
// The system parser

const KLVKey proxyElementKey = keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 02 01 00");
const KLVKey packKey = keyOf("06 0E 2B 34 02 05 01 01 0D 01 03 01 04 01 01 00");

TEST(ReaderSystemParser, KeyWithoutFourteenTwoGoesToTheSDTICPParserEvenWhenUnknown) {
  RecordingSDTICPHandler sdticp;
  RecordingProxyHandler proxy;
  RecordingErrorHandler errors;
  ZeltaSystemParser parser;
  parser.setErrorHandler(&errors);
  parser.setSDTICPHandler(&sdticp);
  parser.setProxyHandler(&proxy);
  // Bytes 12 and 13 are 14 03: no proxy element; the SDTI-CP parser refuses it.
  EXPECT_FALSE(parser.startSystemElement(keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 14 03 01 00")));
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].identifier, invalidSDTICPSystemElementId);
  EXPECT_TRUE(parser.startSystemElement(packKey));
  // The proxy element of any version goes to the proxy parser.
  EXPECT_TRUE(parser.startSystemElement(keyOf("06 0E 2B 34 02 53 01 0A 0D 01 03 01 14 02 01 00")));
  EXPECT_EQ(errors.reports.size(), 1u);
}

TEST(ReaderSystemParser, KindWithoutHandlerIsNotWantedAndLeavesNoParserInProgress) {
  RecordingSDTICPHandler sdticp;
  ZeltaSystemParser parser;
  parser.setSDTICPHandler(&sdticp);
  EXPECT_FALSE(parser.startSystemElement(proxyElementKey));
  EXPECT_EQ(failureOf([&] { parser.systemFixedPack(proxyElementKey, ByteVector(57)); }),
            "assertion failure: current handler is present");
  ZeltaSystemParser empty;
  EXPECT_FALSE(empty.startSystemElement(packKey));
  EXPECT_EQ(failureOf([&] { empty.systemLocalSet(packKey, {}); }), "assertion failure: current handler is present");
}

// ---------------------------------------------------------------------------
// The package item

TEST(ReaderMetadataParser, PackageItemOfLengthZeroYieldsPackageItemOfSizeZero) {
  RecordingZeltaMetadataHandler handler;
  ZeltaMetadataParser parser(&handler, createZeltaDefaultMetadataFactory());
  std::uint8_t* buffer = nullptr;
  EXPECT_TRUE(parser.startIndividualItem(packageItemKey, 0, buffer));
  parser.endIndividualItem(packageItemKey);
  EXPECT_EQ(handler.events, (std::vector<std::string>{"packageItem 0"}));
  ASSERT_EQ(handler.items.size(), 1u);
  EXPECT_TRUE(handler.items[0].empty());
}

TEST(ReaderMetadataParser, PackageItemOfAnyVersionIsCapturedWholeAcrossValues) {
  RecordingZeltaMetadataHandler handler;
  ZeltaMetadataParser parser(&handler, createZeltaDefaultMetadataFactory());
  const KLVKey otherVersion = keyOf("06 0E 2B 34 01 01 01 01 03 01 02 20 01 00 00 00");
  std::uint8_t* buffer = nullptr;
  const ByteVector octets{1, 2, 3, 4, 5};
  EXPECT_TRUE(parser.startIndividualItem(otherVersion, octets.size(), buffer));
  parser.value(octets.data(), 2);
  parser.value(octets.data() + 2, 3);
  parser.endIndividualItem(otherVersion);
  ASSERT_EQ(handler.items.size(), 1u);
  EXPECT_EQ(handler.items[0], octets);
  // Another item goes on to the metadata parser, which does not want it.
  EXPECT_FALSE(parser.startIndividualItem(keyOf("06 0E 2B 34 01 01 01 05 03 01 02 20 02 00 00 00"), 3, buffer));
  EXPECT_EQ(handler.items.size(), 1u);
}

// ---------------------------------------------------------------------------
// The splitter's keys

class Classifier : public ZeltaKeyClassifier {
 public:
  bool isEssenceKey(const KLVKey& key) const override { return key == clientKey; }
  bool isPictureKey(const KLVKey&) const override { return false; }
  bool isSoundKey(const KLVKey& key) const override { return key == clientKey; }
  bool isDataKey(const KLVKey&) const override { return false; }
  bool isCompoundKey(const KLVKey&) const override { return false; }
  const KLVKey clientKey = keyOf("06 0E 2B 34 01 02 01 01 0E 77 01 02 03 04 05 06");
};

TEST(ReaderEssenceSplitter, KnowsTheThreePrivateKeysOfAnyVersion) {
  const ZeltaEssenceSplitter splitter(nullptr);
  const KLVKey raw = keyOf("06 0E 2B 34 01 02 01 0C 0E 06 7F 03 15 01 7F 00");
  const KLVKey proxyPicture = keyOf("06 0E 2B 34 01 02 01 01 0E 06 03 01 15 01 40 00");
  const KLVKey proxyData = keyOf("06 0E 2B 34 01 02 01 02 0E 06 03 01 17 01 40 00");
  for (const KLVKey& key : {raw, proxyPicture}) {
    EXPECT_TRUE(splitter.isEssenceKey(key));
    EXPECT_TRUE(splitter.isPictureKey(key));
    EXPECT_FALSE(splitter.isDataKey(key));
  }
  EXPECT_TRUE(splitter.isEssenceKey(proxyData));
  EXPECT_TRUE(splitter.isDataKey(proxyData));
  EXPECT_FALSE(splitter.isPictureKey(proxyData));
  // One octet off is no key of the kit's.
  EXPECT_FALSE(splitter.isEssenceKey(keyOf("06 0E 2B 34 01 02 01 01 0E 06 03 01 15 01 41 00")));
}

TEST(ReaderEssenceSplitter, AsksTheClassifierLastAndWithoutOneAnswersNo) {
  const Classifier classifier;
  const ZeltaEssenceSplitter withClassifier(&classifier);
  const ZeltaEssenceSplitter without(nullptr);
  EXPECT_TRUE(withClassifier.isEssenceKey(classifier.clientKey));
  EXPECT_TRUE(withClassifier.isSoundKey(classifier.clientKey));
  EXPECT_FALSE(without.isEssenceKey(classifier.clientKey));
  EXPECT_FALSE(without.isSoundKey(classifier.clientKey));
  // A generic container key is the splitter's own, whatever the classifier.
  const KLVKey gcPicture = keyOf("06 0E 2B 34 01 02 01 01 0D 01 03 01 15 01 05 00");
  EXPECT_TRUE(without.isPictureKey(gcPicture));
  EXPECT_TRUE(withClassifier.isPictureKey(gcPicture));
}

TEST(ReaderEssenceSplitter, ClientsKeyReachesTheEssenceHandler) {
  class Counting : public DullMXFGCEssenceHandler {
   public:
    bool startEssenceElement(const KLVKey&, std::uint64_t, std::uint8_t*&) override { return true; }
    void pictureElement(const KLVKey&, const std::uint8_t*, std::uint64_t) override { ++pictures; }
    int pictures = 0;
  };
  // The file's picture key as a client's own: the splitter already knows it,
  // so the answer is the same with or without the classifier.
  Counting counting;
  std::shared_ptr<ZeltaReader> reader = createZeltaReader(fileStream("ffmpeg_d10_50m_625_noaudio.mxf"));
  reader->setEssenceKeyClassifier(std::make_shared<Classifier>());
  reader->setEssenceHandler(borrowed<MXFGCEssenceHandler>(counting));
  reader->read();
  EXPECT_EQ(counting.pictures, 3);
}

}  // namespace
