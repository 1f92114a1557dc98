#include <gtest/gtest.h>

#include <fstream>
#include <string>

#include "klv.h"
#include "support/klv_output.h"
#include "support/recording.h"

using zelta_test::klv::dataFiles;

namespace {

// First after the reader's filters: keeps the locator that the reader's
// KLVTeller hands down.
class TellerKeeper : public DullKLVFilter {
public:
  using DullKLVFilter::DullKLVFilter;
  void setLocator(Locator* locator) override {
    teller = locator;
    DullKLVFilter::setLocator(locator);
  }
  Locator* teller = nullptr;
};

// Behind a KLVMonitor: compares its locator with the teller's at every
// event. At setLengthForm the teller has already read the new length, which
// the monitor counts only at the start event that follows; so the teller's
// position there is held and compared at that start event.
class PositionComparer : public DullKLVHandler {
public:
  PositionComparer(TellerKeeper& keeper, bool takeValues) : keeper_(keeper), takeValues_(takeValues) {}

  void setLocator(Locator* locator) override {
    monitor_ = locator;
    compare("setLocator");
  }
  void startStream(bool) override { compare("startStream"); }
  void endStream(bool aborted) override {
    if (!aborted) compare("endStream");
  }
  void setLengthForm(std::uint8_t) override { held_ = keeper_.teller->getPosition(); }
  bool startIndividualItem(const KLVKey&, std::uint64_t, std::uint8_t*&) override { return start("item"); }
  void endIndividualItem(const KLVKey&) override { compare("endIndividualItem"); }
  bool startLabel(const KLVKey&) override { return start("label"); }
  void endLabel(const KLVKey&) override { compare("endLabel"); }
  bool startUniversalSet(const KLVKey&, std::uint64_t) override { return start("universal set"); }
  void endUniversalSet(const KLVKey&) override { compare("endUniversalSet"); }
  bool startLocalSet(const KLVKey&, std::uint64_t, KLVTagType, KLVLengthType) override {
    return start("local set");
  }
  void endLocalSet(const KLVKey&) override { compare("endLocalSet"); }
  bool startLocalItem(std::uint32_t, std::uint64_t, std::uint8_t*&) override { return start("local item"); }
  void endLocalItem(std::uint32_t) override { compare("endLocalItem"); }
  bool startFixedLengthPack(const KLVKey&, std::uint64_t, std::uint8_t*&) override { return start("pack"); }
  void endFixedLengthPack(const KLVKey&) override { compare("endFixedLengthPack"); }
  bool startVariableLengthPack(const KLVKey&, std::uint64_t, KLVLengthType) override {
    return start("variable length pack");
  }
  void endVariableLengthPack(const KLVKey&) override { compare("endVariableLengthPack"); }
  bool startVariableLengthItem(std::uint64_t, std::uint8_t*&) override { return start("variable length item"); }
  void endVariableLengthItem() override { compare("endVariableLengthItem"); }
  bool startWrapper(const KLVKey&, std::uint64_t, bool, std::uint8_t*&) override { return start("wrapper"); }
  void endWrapper(const KLVKey&) override { compare("endWrapper"); }
  void value(const std::uint8_t*, std::streamsize) override { compare("value"); }

  int compared = 0;
  int formsCompared = 0;

private:
  bool start(const char* event) {
    compare(event);
    if (held_ != -1) {
      EXPECT_EQ(std::streamoff(monitor_->getPosition()), held_) << "length form before " << event;
      held_ = -1;
      ++formsCompared;
    }
    return takeValues_;
  }
  void compare(const char* event) {
    ASSERT_NE(keeper_.teller, nullptr);
    ASSERT_NE(monitor_, nullptr);
    EXPECT_EQ(std::streamoff(monitor_->getPosition()), std::streamoff(keeper_.teller->getPosition()))
        << "at " << event;
    ++compared;
  }

  TellerKeeper& keeper_;
  bool takeValues_;
  Locator* monitor_ = nullptr;
  std::streamoff held_ = -1;
};

// Reads every file of the data through the comparing chain; a read that
// throws is compared up to its failure.
void compareOverEveryFile(bool takeValues) {
  for (const std::string& path : dataFiles()) {
    SCOPED_TRACE(path);
    TellerKeeper keeper;
    KLVMonitor monitor;
    PositionComparer comparer(keeper, takeValues);
    keeper.setHandler(&monitor);
    monitor.setHandler(&comparer);
    std::ifstream in(path, std::ios::binary);
    GenericKLVReader reader;
    reader.setHandler(&keeper);
    try {
      reader.read(in);
    } catch (const KLVElement::parse_error&) {
    }
    EXPECT_GT(comparer.compared, 2);
    EXPECT_GT(comparer.formsCompared, 0);
  }
}

}  // namespace

TEST(KLVPositionAgreement, MonitorAndTellerAgreeAtEveryEventWhenValuesAreTaken) { compareOverEveryFile(true); }

TEST(KLVPositionAgreement, MonitorAndTellerAgreeAtEveryEventWhenValuesAreSkipped) { compareOverEveryFile(false); }
