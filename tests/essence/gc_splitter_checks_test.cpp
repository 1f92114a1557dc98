// Length forms, handlers that are absent, key tests of subclasses and the
// checks on the order of events.
#include "gc_splitter_fixture.h"

#include "support/mxf_streams.h"

using namespace zelta_test;
using namespace zelta_test::gc;

namespace {

class GCSplitterChecks : public GCSplitterTest {};

// Ends the stream from inside startEditUnit, so that the element that opened
// the edit unit finds the splitter idle.
class EndingStructureHandler : public DullMXFGCStructureHandler {
public:
  void startEditUnit() override { splitter->endStream(false); }
  MXFGCSplitter* splitter = nullptr;
};

// Knows pictures only until told otherwise.
class ForgetfulSplitter : public MXFGCSplitter {
public:
  using MXFGCSplitter::MXFGCSplitter;
  bool isPictureKey(const KLVKey& key) const override { return knowsPictures && MXFGCSplitter::isPictureKey(key); }
  bool knowsPictures = true;
};

// Takes a private key for a sound element.
class ReclassifyingSplitter : public MXFGCSplitter {
public:
  using MXFGCSplitter::MXFGCSplitter;
  bool isEssenceKey(const KLVKey& key) const override { return key == privateKey() || MXFGCSplitter::isEssenceKey(key); }
  bool isSoundKey(const KLVKey& key) const override { return key == privateKey() || MXFGCSplitter::isSoundKey(key); }
  bool isSystemKey(const KLVKey& key) const override { return key == privateSystemKey(); }
  static KLVKey privateKey() { return keyOf("06 0E 2B 34 01 02 01 01 0E 09 05 02 01 02 03 00"); }
  static KLVKey privateSystemKey() { return keyOf("06 0E 2B 34 02 05 01 01 0E 09 05 02 01 02 03 00"); }
};

}  // namespace

// ---------------------------------------------------------------------------
// Length forms

TEST_F(GCSplitterChecks, NonStandardLengthFormIsWarnedAndTravelsToTheEssenceHandler) {
  open();
  splitter.setLengthForm(0x84);
  essence(pictureKey());
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].severity, "warning");
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x02));
  EXPECT_EQ(errors.reports[0].message, "non-standard BER length form - 0x84");
  EXPECT_EQ(handler.events[2], "essenceLengthForm 0x84");
  EXPECT_EQ(handler.events[3], line("startEssenceElement", pictureKey(), 3));
}

TEST_F(GCSplitterChecks, ShortFormIsWarnedWithALeadingZero) {
  open();
  splitter.setLengthForm(0x01);
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, "non-standard BER length form - 0x01");
}

TEST_F(GCSplitterChecks, FormsOf0x83And0x87AreSilent) {
  open();
  splitter.setLengthForm(0x83);
  splitter.setLengthForm(0x87);
  close();
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterChecks, EssenceLengthFormFiresOnChangeOnly) {
  open();
  splitter.setLengthForm(0x83);
  essence(pictureKey());
  essence(pictureKey());
  splitter.setLengthForm(0x87);
  splitter.setLengthForm(0x83);
  essence(pictureKey());
  splitter.setLengthForm(0x87);
  systemPack();
  essence(pictureKey());
  close();
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "essenceLengthForm 0x83"), 1);
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "essenceLengthForm 0x87"), 1);
}

TEST_F(GCSplitterChecks, NoFormYetMeansNoEssenceLengthForm) {
  open();
  essence(pictureKey());
  close();
  EXPECT_EQ(std::count_if(handler.events.begin(), handler.events.end(),
                          [](const std::string& e) { return e.rfind("essenceLengthForm", 0) == 0; }),
            0);
}

TEST_F(GCSplitterChecks, EveryStreamReportsItsFirstFormAgain) {
  for (int i = 0; i < 2; ++i) {
    open();
    splitter.setLengthForm(0x83);
    essence(pictureKey());
    close();
  }
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "essenceLengthForm 0x83"), 2);
}

// ---------------------------------------------------------------------------
// Handlers

TEST(GCSplitterHandlers, GettersRequireTheHandlers) {
  MXFGCSplitter splitter;
  EXPECT_EQ(assertionTextOf([&] { splitter.getStructureHandler(); }),
            "assertion failure: structure handler is present");
  EXPECT_EQ(assertionTextOf([&] { splitter.getSystemHandler(); }), "assertion failure: system handler is present");
  EXPECT_EQ(assertionTextOf([&] { splitter.getEssenceHandler(); }), "assertion failure: essence handler is present");
}

TEST(GCSplitterHandlers, ConstructorAndSettersBindTheHandlers) {
  RecordingGCHandler first;
  RecordingGCHandler second;
  MXFGCSplitter splitter(&first, &first, &first);
  EXPECT_EQ(splitter.getStructureHandler(), &first);
  EXPECT_EQ(splitter.getSystemHandler(), &first);
  EXPECT_EQ(splitter.getEssenceHandler(), &first);
  splitter.setStructureHandler(&second);
  splitter.setSystemHandler(&second);
  splitter.setEssenceHandler(&second);
  EXPECT_EQ(splitter.getStructureHandler(), &second);
  EXPECT_EQ(splitter.getSystemHandler(), &second);
  EXPECT_EQ(splitter.getEssenceHandler(), &second);
}

TEST(GCSplitterHandlers, WithoutEssenceHandlerElementsPassWithKindsCheckedAndNoValueRead) {
  RecordingGCHandler structure;
  RecordingErrorHandler errors;
  MXFGCSplitter splitter(&structure, nullptr, nullptr);
  splitter.setErrorHandler(&errors);
  // Through the reader, so that a wanted value would show up as value events.
  class Tap : public DullKLVFilter {
  public:
    using DullKLVFilter::DullKLVFilter;
    bool startIndividualItem(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
      const bool taken = DullKLVFilter::startIndividualItem(key, length, buffer);
      answers.push_back(taken);
      return taken;
    }
    void value(const std::uint8_t*, std::streamsize) override { ++values; }
    std::vector<bool> answers;
    int values = 0;
  } tap(&splitter);
  readThrough(concat({element(pictureKey(), {1, 2}), element(soundKey(), {3}), element(kindlessKey(), {4}),
                      element(pictureKey(), {5})}),
              tap);
  EXPECT_EQ(tap.answers, (std::vector<bool>{false, false, false, false}));
  EXPECT_EQ(tap.values, 0);
  ASSERT_EQ(errors.reports.size(), 2u);
  EXPECT_EQ(errors.reports[0].message, message("unexpected GC essence element", soundKey()));
  EXPECT_EQ(errors.reports[1].message, message("invalid GC essence element", kindlessKey()));
  EXPECT_EQ(structure.events, (std::vector<std::string>{"start 0", "startEditUnit", "endEditUnit", "startEditUnit",
                                                        "endEditUnit", "end"}));
}

TEST(GCSplitterHandlers, NoHandlersAtAllIsAQuietSplitter) {
  MXFGCSplitter splitter;
  splitter.startStream(true);
  splitter.setLengthForm(0x83);
  EXPECT_FALSE(sendFixedLengthPack(splitter, systemPackKey(), {1}));
  EXPECT_FALSE(sendIndividualItem(splitter, pictureKey(), {1}));
  splitter.endStream(false);
}

// ---------------------------------------------------------------------------
// Key tests of subclasses

TEST(GCSplitterKeyTests, SplitterAsksTheOverriddenTests) {
  RecordingGCHandler handler;
  RecordingErrorHandler errors;
  ReclassifyingSplitter splitter(&handler, &handler, &handler);
  splitter.setErrorHandler(&errors);
  splitter.startStream(true);
  sendFixedLengthPack(splitter, ReclassifyingSplitter::privateSystemKey(), {1});
  sendIndividualItem(splitter, ReclassifyingSplitter::privateKey(), {2});
  sendFixedLengthPack(splitter, systemPackKey(), {1});
  splitter.endStream(false);
  ASSERT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(handler.elements[0].kind, "sound");
  EXPECT_EQ(handler.elements[0].key, ReclassifyingSplitter::privateKey());
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, message("invalid GC system element", systemPackKey()));
}

TEST(GCSplitterKeyTests, KeyOfNoKindAtTheEndIsRefused) {
  RecordingGCHandler handler;
  ForgetfulSplitter splitter(&handler, &handler, &handler);
  splitter.startStream(true);
  std::uint8_t* buffer = nullptr;
  ASSERT_TRUE(splitter.startIndividualItem(pictureKey(), 0, buffer));
  splitter.knowsPictures = false;
  EXPECT_EQ(assertionTextOf([&] { splitter.endIndividualItem(pictureKey()); }),
            "assertion failure: valid GC essence element key");
}

TEST(GCSplitterKeyTests, KeyOfNoKindForALongElementIsRefused) {
  RecordingGCHandler handler;
  class ForgettingAtStart : public RecordingGCHandler {
  public:
    bool startEssenceElement(const KLVKey& key, std::uint64_t length, std::uint8_t*& buffer) override {
      splitter->knowsPictures = false;
      return RecordingGCHandler::startEssenceElement(key, length, buffer);
    }
    ForgetfulSplitter* splitter = nullptr;
  } forgetting;
  ForgetfulSplitter splitter(&handler, &handler, &forgetting);
  forgetting.splitter = &splitter;
  splitter.startStream(true);
  std::uint8_t* buffer = nullptr;
  EXPECT_EQ(assertionTextOf([&] { splitter.startIndividualItem(pictureKey(), 0x1000000, buffer); }),
            "assertion failure: valid GC essence element key");
}

// ---------------------------------------------------------------------------
// Order of events

TEST_F(GCSplitterChecks, StartTwiceIsRefused) {
  open();
  EXPECT_EQ(assertionTextOf([&] { open(); }), "assertion failure: before start");
}

TEST_F(GCSplitterChecks, InaccurateLengthsAreRefused) {
  EXPECT_EQ(assertionTextOf([&] { splitter.startStream(false); }), "assertion failure: has accurate lengths");
}

TEST_F(GCSplitterChecks, ElementsBeforeTheStreamAreRefused) {
  std::uint8_t* buffer = nullptr;
  EXPECT_EQ(assertionTextOf([&] { splitter.startIndividualItem(pictureKey(), 1, buffer); }),
            "assertion failure: expected individual item");
  EXPECT_EQ(assertionTextOf([&] { splitter.endIndividualItem(pictureKey()); }),
            "assertion failure: expected individual item");
  EXPECT_EQ(assertionTextOf([&] { splitter.startLocalSet(systemSetKey(), 1, KLVTagType2, KLVLengthType2); }),
            "assertion failure: expected local set");
  EXPECT_EQ(assertionTextOf([&] { splitter.endLocalSet(systemSetKey()); }), "assertion failure: expected local set");
  EXPECT_EQ(assertionTextOf([&] { splitter.startFixedLengthPack(systemPackKey(), 1, buffer); }),
            "assertion failure: expected fixed length pack");
  EXPECT_EQ(assertionTextOf([&] { splitter.endFixedLengthPack(systemPackKey()); }),
            "assertion failure: expected fixed length pack");
  EXPECT_EQ(assertionTextOf([&] { splitter.startVariableLengthPack(systemVariablePackKey(), 1, KLVLengthTypeBER); }),
            "assertion failure: expected variable length pack");
  EXPECT_EQ(assertionTextOf([&] { splitter.endVariableLengthPack(systemVariablePackKey()); }),
            "assertion failure: expected variable length pack");
  EXPECT_EQ(assertionTextOf([&] { splitter.value(nullptr, 0); }), "assertion failure: expected value");
}

TEST_F(GCSplitterChecks, ItemsOutsideTheSystemItemAreRefused) {
  std::uint8_t* buffer = nullptr;
  open();
  essence(pictureKey());
  EXPECT_EQ(assertionTextOf([&] { splitter.startLocalItem(0x8101, 1, buffer); }),
            "assertion failure: expected local item");
  EXPECT_EQ(assertionTextOf([&] { splitter.endLocalItem(0x8101); }), "assertion failure: expected local item");
  EXPECT_EQ(assertionTextOf([&] { splitter.startVariableLengthItem(1, buffer); }),
            "assertion failure: expected variable length item");
  EXPECT_EQ(assertionTextOf([&] { splitter.endVariableLengthItem(); }),
            "assertion failure: expected variable length item");
}

TEST_F(GCSplitterChecks, EndsOfSystemElementsOutsideTheSystemItemDoNothing) {
  open();
  splitter.endLocalSet(systemSetKey());
  essence(pictureKey());
  splitter.endFixedLengthPack(systemPackKey());
  splitter.endVariableLengthPack(systemVariablePackKey());
  close();
  EXPECT_EQ(handler.elements.size(), 1u);
  EXPECT_EQ(std::count_if(handler.events.begin(), handler.events.end(),
                          [](const std::string& e) { return e.rfind("system", 0) == 0; }),
            0);
}

TEST_F(GCSplitterChecks, ValueOfASystemElementWithNothingToFillIsRefused) {
  open();
  handler.wantSystem = false;
  std::uint8_t* buffer = nullptr;
  EXPECT_FALSE(splitter.startFixedLengthPack(systemPackKey(), 1, buffer));
  const std::uint8_t octet = 1;
  EXPECT_EQ(assertionTextOf([&] { splitter.value(&octet, 1); }), "assertion failure: expected value");
}

TEST(GCSplitterOrder, EssenceElementThatFindsTheSplitterEndedIsRefused) {
  EndingStructureHandler ending;
  RecordingGCHandler handler;
  MXFGCSplitter splitter(&ending, &handler, &handler);
  ending.splitter = &splitter;
  splitter.startStream(true);
  std::uint8_t* buffer = nullptr;
  EXPECT_EQ(assertionTextOf([&] { splitter.startIndividualItem(pictureKey(), 1, buffer); }),
            "assertion failure: before GC essence element");
}

TEST(GCSplitterOrder, SystemElementThatFindsTheSplitterEndedIsRefused) {
  EndingStructureHandler ending;
  RecordingGCHandler handler;
  MXFGCSplitter splitter(&ending, &handler, &handler);
  ending.splitter = &splitter;
  splitter.startStream(true);
  EXPECT_EQ(assertionTextOf([&] { splitter.startLocalSet(systemSetKey(), 1, KLVTagType2, KLVLengthType2); }),
            "assertion failure: before GC system element");
}
