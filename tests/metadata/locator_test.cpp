#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "support/metadata_descriptor_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const KLVKey urlStringKey = propertyKeyOf(0x01, "01 02 01 01 01 00 00 00");
const KLVKey locatorNameKey = propertyKeyOf(0x02, "01 04 01 02 01 00 00 00");
const ByteVector instance = bytesOf("11111111 11111111 11111111 11111111");

}  // namespace

TEST(GenericLocatorFactory, SetKeyAndPrimerHoldOnlyTheBaseProperties) {
  GenericLocatorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 31 00"), factory.getSetKey());
  EXPECT_EQ(2u, factory.getSetPrimer().size());
}

TEST(NetworkLocatorFactory, SetKeyAndStaticTagOfURLString) {
  NetworkLocatorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 32 00"), factory.getSetKey());
  EXPECT_EQ(0x4001, factory.getSetPrimer().at(urlStringKey));
  EXPECT_EQ(3u, factory.getSetPrimer().size());
}

TEST(TextLocatorFactory, SetKeyAndStaticTagOfLocatorName) {
  TextLocatorFactory factory;
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 01 01 01 01 33 00"), factory.getSetKey());
  EXPECT_EQ(0x4101, factory.getSetPrimer().at(locatorNameKey));
  EXPECT_EQ(3u, factory.getSetPrimer().size());
}

TEST(NetworkLocatorFactory, ParsesURLStringFromUTF16AndCodesTheSameMap) {
  const MXFPropertyMap properties{{MXFInstanceUIDKey, instance}, {urlStringKey, bytesOf("0061 002E 006D 0078 0066")}};
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  NetworkLocatorFactory factory;
  const MXFParsedObject parsed = parseWith(factory, properties, errors);
  const std::shared_ptr<NetworkLocator> locator = std::dynamic_pointer_cast<NetworkLocator>(parsed.object);
  ASSERT_NE(nullptr, locator);
  EXPECT_EQ(L"a.mxf", locator->getURLString());
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ(properties, factory.code(locator).set.properties);
}

TEST(TextLocatorFactory, ParsesLocatorNameAndCodesTheSameMap) {
  const MXFPropertyMap properties{{MXFInstanceUIDKey, instance}, {locatorNameKey, bytesOf("0074 0061 0070 0065")}};
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  TextLocatorFactory factory;
  const std::shared_ptr<TextLocator> locator =
      std::dynamic_pointer_cast<TextLocator>(parseWith(factory, properties, errors).object);
  ASSERT_NE(nullptr, locator);
  EXPECT_EQ(L"tape", locator->getLocatorName());
  EXPECT_TRUE(errors->reports.empty());
  EXPECT_EQ(properties, factory.code(locator).set.properties);
}

TEST(NetworkLocatorFactory, SetWithoutURLStringReportsMissingAndLeavesItEmpty) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  NetworkLocatorFactory factory;
  const std::shared_ptr<NetworkLocator> locator =
      std::dynamic_pointer_cast<NetworkLocator>(parseWith(factory, {{MXFInstanceUIDKey, instance}}, errors).object);
  ASSERT_NE(nullptr, locator);
  EXPECT_EQ(L"", locator->getURLString());
  ASSERT_EQ(1u, errors->reports.size());
  EXPECT_EQ(missingPropertyId, errors->reports[0].identifier);
  EXPECT_EQ("missing NetworkLocator.urlString", errors->reports[0].message);
}

TEST(TextLocatorFactory, OddOctetCountOfLocatorNameIsReportedAsInvalidValue) {
  const std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
  TextLocatorFactory factory;
  parseWith(factory, {{MXFInstanceUIDKey, instance}, {locatorNameKey, bytesOf("00 74 00")}}, errors);
  EXPECT_EQ(std::vector<std::string>{"error 3 invalid TextLocator.locatorName value - assertion failure: correct size "
                                     "of UTF-16 string"},
            modelReportLines(*errors));
  EXPECT_EQ(invalidPropertyValueId, errors->reports.at(0).identifier);
}

TEST(NetworkLocatorFactory, CodingAnotherClassFailsWithTheClassName) {
  NetworkLocatorFactory factory;
  MXFPropertyMap properties;
  MXFReferencedObjects referenced;
  EXPECT_EQ("assertion failure: object is a NetworkLocator",
            failureOf([&] { factory.codeProperties(TextLocator::create(), properties, referenced); }));
}
