// Edit units and the order of system and essence elements, from KLV events
// sent by hand.
#include "gc_splitter_fixture.h"

using namespace zelta_test;
using namespace zelta_test::gc;

namespace {

class GCSplitterEvents : public GCSplitterTest {};

}  // namespace

TEST_F(GCSplitterEvents, StreamWithNoElementsYieldsStartAndEndOnly) {
  open();
  close();
  EXPECT_EQ(handler.events, (std::vector<std::string>{"start 0", "end"}));
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, TwoElementsWithTheSameKeyMakeTwoEditUnits) {
  open();
  essence(pictureKey());
  essence(pictureKey());
  close();
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"start 0", "startEditUnit", line("startEssenceElement", pictureKey(), 3),
                                      line("pictureElement", pictureKey(), 3), "endEditUnit", "startEditUnit",
                                      line("startEssenceElement", pictureKey(), 3),
                                      line("pictureElement", pictureKey(), 3), "endEditUnit", "end"}));
}

TEST_F(GCSplitterEvents, EditUnitOfSystemItemAndEssence) {
  open();
  systemPack();
  essence(pictureKey());
  essence(soundKey(), {7});
  systemPack({1});
  close();
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{
                "start 0", "startEditUnit", line("startSystemElement", systemPackKey()),
                line("systemFixedPack", systemPackKey()) + " 09 08", line("startEssenceElement", pictureKey(), 3),
                line("pictureElement", pictureKey(), 3), line("startEssenceElement", soundKey(), 1),
                line("soundElement", soundKey(), 1), "endEditUnit", "startEditUnit",
                line("startSystemElement", systemPackKey()), line("systemFixedPack", systemPackKey()) + " 01",
                "endEditUnit", "end"}));
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, FirstKeyThatRecursInsideAnEditUnitMakesABoundaryThere) {
  open();
  essence(pictureKey());
  essence(soundKey());
  essence(pictureKey());
  close();
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "startEditUnit"), 2);
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "endEditUnit"), 2);
}

TEST_F(GCSplitterEvents, InvalidFirstElementStillFixesTheFirstKeyAndOpensAnEditUnit) {
  open();
  EXPECT_FALSE(essence(kindlessKey()));
  essence(pictureKey());
  EXPECT_FALSE(essence(kindlessKey()));
  close();
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{"start 0", "startEditUnit", line("startEssenceElement", pictureKey(), 3),
                                      line("pictureElement", pictureKey(), 3), "endEditUnit", "startEditUnit",
                                      "endEditUnit", "end"}));
  ASSERT_EQ(errors.reports.size(), 2u);
  EXPECT_EQ(errors.reports[0].severity, "error");
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x01));
  EXPECT_EQ(errors.reports[0].message, message("invalid GC essence element", kindlessKey()));
}

TEST_F(GCSplitterEvents, InvalidFirstElementInAnEmptyContainerOpensAnEditUnitThatNeverEnds) {
  open();
  essence(kindlessKey());
  close();
  // Nothing valid came, so the state never left started.
  EXPECT_EQ(handler.events, (std::vector<std::string>{"start 0", "startEditUnit", "end"}));
}

TEST_F(GCSplitterEvents, FillBetweenSystemItemAndEssenceChangesNothing) {
  open();
  EXPECT_FALSE(sendIndividualItem(splitter, fillKeyOfVersion(1), {0, 0}));
  systemPack();
  EXPECT_FALSE(sendIndividualItem(splitter, fillKeyOfVersion(2), {0, 0, 0}));
  essence(pictureKey());
  EXPECT_FALSE(sendIndividualItem(splitter, fillKeyOfVersion(1), {}));
  systemPack();
  close();
  EXPECT_EQ(handler.events,
            (std::vector<std::string>{
                "start 0", "startEditUnit", line("startSystemElement", systemPackKey()),
                line("systemFixedPack", systemPackKey()) + " 09 08", line("startEssenceElement", pictureKey(), 3),
                line("pictureElement", pictureKey(), 3), "endEditUnit", "startEditUnit",
                line("startSystemElement", systemPackKey()), line("systemFixedPack", systemPackKey()) + " 09 08",
                "endEditUnit", "end"}));
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, FillItemWithAChangedVersionByteIsStillFill) {
  open();
  EXPECT_FALSE(sendIndividualItem(splitter, fillKeyOfVersion(0x7E), {0}));
  essence(pictureKey());
  EXPECT_FALSE(sendIndividualItem(splitter, fillKeyOfVersion(0x00), {0}));
  essence(pictureKey());
  close();
  // The fill fixed no first key: the picture did, and it recurred.
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "startEditUnit"), 2);
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, FillInEveryStateIsSilentEvenBeforeTheStream) {
  EXPECT_FALSE(sendIndividualItem(splitter, fillKeyOfVersion(3), {0}));
  EXPECT_TRUE(handler.events.empty());
}

TEST_F(GCSplitterEvents, SystemElementAfterEssenceOnlyIsUnexpectedAndTheStreamGoesOnWithASystemItem) {
  open();
  essence(pictureKey());
  systemPack();
  essence(soundKey());
  essence(pictureKey());
  systemPack();
  essence(dataKey());
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].severity, "error");
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x03));
  EXPECT_EQ(errors.reports[0].message, message("unexpected GC system element", systemPackKey()));
  // The system element was delivered all the same.
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(),
                       line("systemFixedPack", systemPackKey()) + " 09 08"),
            2);
  EXPECT_EQ(handler.elements.size(), 4u);
}

TEST_F(GCSplitterEvents, SecondKindInEssenceOnlyIsReportedOnce) {
  open();
  essence(pictureKey());
  essence(soundKey());
  essence(dataKey());
  essence(pictureKey());
  essence(compoundKey());
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x03));
  EXPECT_EQ(errors.reports[0].message, message("unexpected GC essence element", soundKey()));
  // Reported, but delivered.
  EXPECT_EQ(handler.elements.size(), 5u);
}

TEST_F(GCSplitterEvents, KindFlagsLastAcrossEditUnitsWithoutASystemItem) {
  open();
  essence(pictureKey());
  essence(pictureKey());
  essence(pictureKey());
  EXPECT_TRUE(errors.reports.empty());
  essence(soundKey());
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, message("unexpected GC essence element", soundKey()));
}

TEST_F(GCSplitterEvents, KindFlagsAreClearedByASystemItem) {
  open();
  systemPack();
  essence(pictureKey());
  essence(soundKey());
  essence(dataKey());
  essence(compoundKey());
  systemPack();
  essence(soundKey());
  close();
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, SystemElementsInARowStayInTheSystemItem) {
  open();
  systemPack();
  EXPECT_TRUE(sendLocalSet(splitter, systemSetKey(), {{0x8101, {1}}}));
  EXPECT_TRUE(sendVariableLengthPack(splitter, systemVariablePackKey(), {{2}}));
  essence(pictureKey());
  close();
  EXPECT_TRUE(errors.reports.empty());
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "startEditUnit"), 1);
}

TEST_F(GCSplitterEvents, InvalidSystemElementIsReportedAndLeavesTheStateAlone) {
  const KLVKey otherSet = keyOf("06 0E 2B 34 02 53 01 01 0D 01 03 01 05 01 01 00");
  open();
  essence(pictureKey());
  EXPECT_FALSE(sendLocalSet(splitter, otherSet, {{0x8101, {1}}}));
  essence(soundKey());
  close();
  ASSERT_EQ(errors.reports.size(), 2u);
  EXPECT_EQ(errors.reports[0].severity, "error");
  EXPECT_EQ(errors.reports[0].identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x01));
  EXPECT_EQ(errors.reports[0].message, message("invalid GC system element", otherSet));
  // Still essence only: the second kind is the unexpected one.
  EXPECT_EQ(errors.reports[1].message, message("unexpected GC essence element", soundKey()));
}

TEST_F(GCSplitterEvents, InvalidEssenceElementLeavesTheSystemState) {
  open();
  systemPack();
  EXPECT_FALSE(essence(kindlessKey()));
  systemPack();
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, message("invalid GC essence element", kindlessKey()));
}

TEST_F(GCSplitterEvents, KeyOutsideTheEssenceFamilyIsAnInvalidEssenceElement) {
  const KLVKey foreign = keyOf("06 0E 2B 34 01 01 01 01 0D 01 03 01 15 01 05 00");
  open();
  EXPECT_FALSE(essence(foreign));
  close();
  ASSERT_EQ(errors.reports.size(), 1u);
  EXPECT_EQ(errors.reports[0].message, message("invalid GC essence element", foreign));
}

TEST_F(GCSplitterEvents, LabelsUniversalSetsAndWrappersAreInvalidElements) {
  const KLVKey label = keyOf("06 0E 2B 34 04 01 01 01 0D 01 03 01 15 01 05 00");
  const KLVKey set = keyOf("06 0E 2B 34 02 01 01 01 0D 01 03 01 04 01 01 00");
  const KLVKey wrapper = keyOf("06 0E 2B 34 03 01 01 01 0D 01 03 01 15 01 05 00");
  std::uint8_t* buffer = nullptr;
  open();
  EXPECT_FALSE(splitter.startLabel(label));
  splitter.endLabel(label);
  EXPECT_FALSE(splitter.startUniversalSet(set, 10));
  splitter.endUniversalSet(set);
  EXPECT_FALSE(splitter.startWrapper(wrapper, 10, true, buffer));
  splitter.endWrapper(wrapper);
  close();
  EXPECT_EQ(buffer, nullptr);
  ASSERT_EQ(errors.reports.size(), 3u);
  for (const Report& report : errors.reports) {
    EXPECT_EQ(report.severity, "error");
    EXPECT_EQ(report.identifier, ZeltaErrorId(0x4C, 0x4D, 0x00, 0x01));
  }
  EXPECT_EQ(errors.reports[0].message, message("invalid GC element", label));
  EXPECT_EQ(errors.reports[1].message, message("invalid GC element", set));
  EXPECT_EQ(errors.reports[2].message, message("invalid GC element", wrapper));
  // They are no elements of an edit unit.
  EXPECT_EQ(handler.events, (std::vector<std::string>{"start 0", "end"}));
}

TEST_F(GCSplitterEvents, WithoutErrorHandlerNothingIsReportedAndTheStreamGoesOn) {
  splitter.setErrorHandler(nullptr);
  open();
  essence(kindlessKey());
  essence(pictureKey());
  close();
  EXPECT_EQ(handler.elements.size(), 1u);
}

TEST_F(GCSplitterEvents, StreamCanBeReadAgainAndForgetsItsFirstKey) {
  open();
  essence(pictureKey());
  close();
  handler.events.clear();
  open();
  systemPack();
  essence(pictureKey());
  close();
  EXPECT_EQ(std::count(handler.events.begin(), handler.events.end(), "startEditUnit"), 1);
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, EndStreamClosesTheEditUnitWhenAborted) {
  open();
  systemPack();
  splitter.endStream(true);
  EXPECT_EQ(handler.events.back(), "end");
  EXPECT_EQ(handler.events[handler.events.size() - 2], "endEditUnit");
}

TEST_F(GCSplitterEvents, WithoutStructureHandlerElementsStillArrive) {
  splitter.setStructureHandler(nullptr);
  open();
  essence(pictureKey());
  essence(pictureKey());
  close();
  EXPECT_EQ(handler.events, (std::vector<std::string>{line("startEssenceElement", pictureKey(), 3),
                                                      line("pictureElement", pictureKey(), 3),
                                                      line("startEssenceElement", pictureKey(), 3),
                                                      line("pictureElement", pictureKey(), 3)}));
}

TEST_F(GCSplitterEvents, WithoutSystemHandlerSystemElementsAreNotWantedButCount) {
  splitter.setSystemHandler(nullptr);
  open();
  EXPECT_FALSE(systemPack());
  essence(pictureKey());
  essence(soundKey());
  close();
  EXPECT_TRUE(errors.reports.empty());
}

TEST_F(GCSplitterEvents, UnwantedSystemElementIsNotDelivered) {
  handler.wantSystem = false;
  open();
  EXPECT_FALSE(systemPack());
  close();
  EXPECT_EQ(handler.events, (std::vector<std::string>{"start 0", "startEditUnit",
                                                      line("startSystemElement", systemPackKey()), "endEditUnit",
                                                      "end"}));
}

TEST_F(GCSplitterEvents, EndStreamBecomesIdleWhenAHandlerThrows) {
  class ThrowingAtEnd : public DullMXFGCStructureHandler {
  public:
    void endEditUnit() override { throw std::runtime_error("handler failed"); }
  } throwing;
  splitter.setStructureHandler(&throwing);
  open();
  essence(pictureKey());
  EXPECT_THROW(close(), std::runtime_error);
  // Idle again: a new stream may start.
  splitter.setStructureHandler(&handler);
  EXPECT_NO_THROW(open());
}
