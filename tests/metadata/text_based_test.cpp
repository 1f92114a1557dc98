#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <typeinfo>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "metadata/model_test_classes.h"
#include "support/metadata_structural.h"
#include "support/mxf_primed_sets.h"
#include "support/recording.h"

using namespace zelta_test;

namespace {

const std::string schemeID = "06 0E 2B 34 04 01 01 0D 0D 01 04 01 04 01 01 00";

KLVKey frameworkObjectKey() { return propertyKeyOf("0D: 06 01 01 04 05 41 01 00"); }
KLVKey schemeIDKey() { return propertyKeyOf("0D: 04 06 08 06 00 00 00 00"); }
KLVKey mimeTypeKey() { return propertyKeyOf("0D: 04 09 02 02 00 00 00 00"); }
KLVKey languageKey() { return propertyKeyOf("0D: 03 01 01 02 02 14 00 00"); }
KLVKey descriptionKey() { return propertyKeyOf("0D: 03 02 01 06 03 02 00 00"); }
KLVKey streamSIDKey() { return propertyKeyOf("0D: 01 03 04 08 00 00 00 00"); }
KLVKey utf8Key() { return propertyKeyOf("0D: 03 01 02 20 03 01 00 00"); }
KLVKey utf16Key() { return propertyKeyOf("0D: 03 01 02 20 03 02 00 00"); }

// The properties that every text-based object needs: scheme, "text/xml", "en".
MXFPropertyMap objectProperties() {
  return {{schemeIDKey(), bytesOf(schemeID)},
          {mimeTypeKey(), bytesOf("00 74 00 65 00 78 00 74 00 2F 00 78 00 6D 00 6C")},
          {languageKey(), bytesOf("00 65 00 6E")}};
}

MXFPropertyMap with(MXFPropertyMap properties, const KLVKey& key, const ByteVector& value) {
  properties[key] = value;
  return properties;
}

template <typename T>
void describeText(T& object) {
  object.setTextBasedMetadataPayloadSchemeID(keyOf(schemeID));
  object.setTextMIMEMediaType(L"text/xml");
  object.setTextLanguageCode(L"en");
}

// Codes a model through the text-based composite and parses the sets back
// through a fresh one; the reports of the parse are kept.
struct TextRoundTrip {
  MXFMetadataModel run(const std::shared_ptr<MetadataRoot>& root) {
    MXFMetadataModelCoder coder(&sets, std::make_shared<MXFTextBasedDMModelFactory>());
    coder.model({root});
    return parse(sets.sets);
  }

  MXFMetadataModel parse(const std::vector<MXFPrimedSet>& input) {
    RecordingModelHandler models;
    std::shared_ptr<MXFTextBasedDMModelFactory> factory = std::make_shared<MXFTextBasedDMModelFactory>();
    factory->setErrorHandler(errors);
    MXFMetadataModelParser parser(&models, factory);
    parser.setErrorHandler(errors.get());
    parser.start();
    for (const MXFPrimedSet& set : input)
      if (parser.acceptSet(set.key)) parser.primedSet(set);
    parser.end();
    return models.models.empty() ? MXFMetadataModel() : models.models.at(0);
  }

  RecordingMetadataHandler sets;
  std::shared_ptr<RecordingErrorHandler> errors = std::make_shared<RecordingErrorHandler>();
};

// The set key under which a factory codes an object.
KLVKey codedKey(MXFMetadataFactory& factory, const std::shared_ptr<const MetadataRoot>& object) {
  return factory.code(object).set.key;
}

}  // namespace

TEST(TextBasedFactories, SetKeysAreThoseOfTheTables) {
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 01 01 00"), TextBasedDMFrameworkFactory().getSetKey());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 03 01 00"), TextBasedObjectFactory().getSetKey());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 02 01 00"), GenericStreamTextBasedSetFactory().getSetKey());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 02 02 00"), UTF8TextBasedSetFactory().getSetKey());
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 02 03 00"), UTF16TextBasedSetFactory().getSetKey());
}

TEST(TextBasedFactories, EveryPropertyHasADynamicTag) {
  EXPECT_EQ(structuralPrimer({{"0D: 06 01 01 04 05 41 01 00", 0}}), TextBasedDMFrameworkFactory().getSetPrimer());
  const PrimerRows objectRows{{"0D: 04 06 08 06 00 00 00 00", 0},
                              {"0D: 04 09 02 02 00 00 00 00", 0},
                              {"0D: 03 01 01 02 02 14 00 00", 0},
                              {"0D: 03 02 01 06 03 02 00 00", 0}};
  EXPECT_EQ(structuralPrimer(objectRows), TextBasedObjectFactory().getSetPrimer());
  PrimerRows rows = objectRows;
  rows.push_back({"0D: 01 03 04 08 00 00 00 00", 0});
  EXPECT_EQ(structuralPrimer(rows), GenericStreamTextBasedSetFactory().getSetPrimer());
  rows.back() = {"0D: 03 01 02 20 03 01 00 00", 0};
  EXPECT_EQ(structuralPrimer(rows), UTF8TextBasedSetFactory().getSetPrimer());
  rows.back() = {"0D: 03 01 02 20 03 02 00 00", 0};
  EXPECT_EQ(structuralPrimer(rows), UTF16TextBasedSetFactory().getSetPrimer());
}

TEST(TextBasedFactories, OnlyTheTextSetsAllowBERLengths) {
  EXPECT_FALSE(TextBasedDMFrameworkFactory().allowBERLengths());
  EXPECT_FALSE(TextBasedObjectFactory().allowBERLengths());
  EXPECT_TRUE(GenericStreamTextBasedSetFactory().allowBERLengths());
  EXPECT_TRUE(UTF8TextBasedSetFactory().allowBERLengths());
  EXPECT_TRUE(UTF16TextBasedSetFactory().allowBERLengths());
}

TEST(TextBasedFactories, TextSetKeysAreRecognisedWithBERItemLengths) {
  EXPECT_TRUE(UTF8TextBasedSetFactory().canParse(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 02 02 00")));
  EXPECT_TRUE(UTF16TextBasedSetFactory().canParse(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 02 03 00")));
  EXPECT_TRUE(GenericStreamTextBasedSetFactory().canParse(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 02 01 00")));
  EXPECT_FALSE(TextBasedObjectFactory().canParse(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 03 01 00")));
  EXPECT_FALSE(TextBasedDMFrameworkFactory().canParse(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 01 01 00")));
}

TEST(MXFTextBasedDMModelFactory, SubFactoriesInSearchOrder) {
  MXFTextBasedDMModelFactory composite;
  std::vector<std::string> types;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : composite.getFactories())
    types.push_back(dynamic_cast<MetadataRootFactory&>(*factory).getType().name());
  EXPECT_EQ((std::vector<std::string>{typeid(TextBasedDMFramework).name(), typeid(TextBasedObject).name(),
                                      typeid(GenericStreamTextBasedSet).name(), typeid(UTF8TextBasedSet).name(),
                                      typeid(UTF16TextBasedSet).name()}),
            types);
}

TEST(MXFTextBasedDMModelFactory, TextBasedObjectIsConcreteHere) {
  MXFTextBasedDMModelFactory composite;
  EXPECT_TRUE(composite.canParse(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 03 01 00")));
  EXPECT_TRUE(composite.canCode(typeid(TextBasedObject)));
}

TEST(MXFTextBasedDMModelFactory, FormatCompositeDoesNotKnowTheTextBasedClasses) {
  MXFFormatMetadataModelFactory format;
  EXPECT_FALSE(format.canParse(TextBasedDMFrameworkFactory().getSetKey()));
  EXPECT_FALSE(format.canParse(UTF8TextBasedSetFactory().getSetKey()));
}

TEST(TextBasedDMFramework, NullTextBasedObjectFailsTheGetter) {
  std::shared_ptr<TextBasedDMFramework> framework = TextBasedDMFramework::create();
  EXPECT_EQ("assertion failure: TextBasedDMFramework.textBasedObject is present",
            failureOf([&] { framework->getTextBasedObject(); }));
}

TEST(TextBasedDMFramework, SetterTakesAndReleasesOwnership) {
  std::shared_ptr<TextBasedDMFramework> framework = TextBasedDMFramework::create();
  std::shared_ptr<UTF8TextBasedSet> first = UTF8TextBasedSet::create();
  std::shared_ptr<UTF16TextBasedSet> second = UTF16TextBasedSet::create();
  framework->setTextBasedObject(first);
  EXPECT_EQ(framework, first->getTopOwner());
  framework->setTextBasedObject(second);
  EXPECT_EQ(first, first->getTopOwner());
  EXPECT_EQ(framework, second->getTopOwner());
  EXPECT_EQ(second, framework->getTextBasedObject());
}

TEST(TextBasedObject, DefaultsAndOptionalDescription) {
  std::shared_ptr<TextBasedObject> object = TextBasedObject::create();
  EXPECT_EQ(KLVKey(), object->getTextBasedMetadataPayloadSchemeID());
  EXPECT_EQ(L"", object->getTextMIMEMediaType());
  EXPECT_EQ(L"", object->getTextLanguageCode());
  EXPECT_FALSE(object->hasTextDataDescription());
  EXPECT_EQ("assertion failure: TextBasedObject.textDataDescription is present",
            failureOf([&] { object->getTextDataDescription(); }));
  object->setTextDataDescription(L"notes");
  EXPECT_TRUE(object->hasTextDataDescription());
  EXPECT_EQ(L"notes", object->getTextDataDescription());
  object->removeTextDataDescription();
  EXPECT_FALSE(object->hasTextDataDescription());
}

TEST(TextBasedSets, DefaultsOfTheTextSets) {
  EXPECT_EQ(0u, GenericStreamTextBasedSet::create()->getGenericStreamSID());
  EXPECT_EQ("", UTF8TextBasedSet::create()->getUTF8TextData());
  EXPECT_EQ(L"", UTF16TextBasedSet::create()->getUTF16TextData());
}

TEST(TextBasedObjectFactory, ParseAndCodeOfEveryProperty) {
  TextBasedObjectFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1, with(objectProperties(), descriptionKey(), bytesOf("00 41")));
  std::shared_ptr<TextBasedObject> object = std::dynamic_pointer_cast<TextBasedObject>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(keyOf(schemeID), object->getTextBasedMetadataPayloadSchemeID());
  EXPECT_EQ(L"text/xml", object->getTextMIMEMediaType());
  EXPECT_EQ(L"en", object->getTextLanguageCode());
  EXPECT_EQ(L"A", object->getTextDataDescription());
  EXPECT_EQ(set.properties, codeWith(factory, object));
}

TEST(TextBasedObjectFactory, MissingRequiredPropertiesAreReportedByTheirNames) {
  TextBasedObjectFactory factory;
  FactoryParse run;
  run.parse(factory, primedSetOf(factory.getSetKey(), 1, {}));
  EXPECT_EQ((std::vector<std::string>{"error 02 missing TextBasedObject.textBasedMetadataPayloadSchemeID",
                                      "error 02 missing TextBasedObject.textMIMEMediaType",
                                      "error 02 missing TextBasedObject.textLanguageCode"}),
            run.reports());
  EXPECT_EQ(missingPropertyId, run.errors->reports.at(0).identifier);
}

TEST(TextBasedDMFrameworkFactory, MissingTextBasedObjectIsReported) {
  TextBasedDMFrameworkFactory factory;
  FactoryParse run;
  run.parse(factory, primedSetOf(factory.getSetKey(), 1, {}));
  EXPECT_EQ(std::vector<std::string>{"error 02 missing TextBasedDMFramework.textBasedObject"}, run.reports());
}

TEST(UTF16TextBasedSetFactory, OddTextIsReportedAsInvalidValue) {
  UTF16TextBasedSetFactory factory;
  FactoryParse run;
  std::shared_ptr<UTF16TextBasedSet> set = std::dynamic_pointer_cast<UTF16TextBasedSet>(
      run.parse(factory, primedSetOf(factory.getSetKey(), 1, with(objectProperties(), utf16Key(), bytesOf("00 41 00"))))
          .object);
  EXPECT_EQ(std::vector<std::string>{"error 03 invalid UTF16TextBasedSet.utf16TextData value - assertion failure: "
                                     "correct size of UTF-16 string"},
            run.reports());
  EXPECT_EQ(invalidPropertyValueId, run.errors->reports.at(0).identifier);
  EXPECT_EQ(L"", set->getUTF16TextData());
}

TEST(UTF16TextBasedSetFactory, SurrogatePairIsOneCodePoint) {
  UTF16TextBasedSetFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1, with(objectProperties(), utf16Key(), bytesOf("D8 3D DE 00")));
  std::shared_ptr<UTF16TextBasedSet> text =
      std::dynamic_pointer_cast<UTF16TextBasedSet>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(std::wstring(1, static_cast<wchar_t>(0x1F600)), text->getUTF16TextData());
  EXPECT_EQ(set.properties, codeWith(factory, text));
}

TEST(UTF16TextBasedSetFactory, IllegalCodePointFailsTheCoder) {
  UTF16TextBasedSetFactory factory;
  std::shared_ptr<UTF16TextBasedSet> text = UTF16TextBasedSet::create();
  text->setUTF16TextData(std::wstring(1, static_cast<wchar_t>(0x110000)));
  EXPECT_EQ("assertion failure: expected legal UTF-32 code point", failureOf([&] { codeWith(factory, text); }));
}

TEST(UTF8TextBasedSetFactory, OctetsAreKeptAsTheyStandWithoutAnyCheck) {
  UTF8TextBasedSetFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1, with(objectProperties(), utf8Key(), bytesOf("FF FE 00 C3")));
  std::shared_ptr<UTF8TextBasedSet> text = std::dynamic_pointer_cast<UTF8TextBasedSet>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(std::string("\xFF\xFE\x00\xC3", 4), text->getUTF8TextData());
  EXPECT_EQ(set.properties, codeWith(factory, text));
}

TEST(UTF8TextBasedSetFactory, CodingAnotherClassFailsWithTheClassName) {
  UTF8TextBasedSetFactory factory;
  EXPECT_EQ("assertion failure: object is a UTF8TextBasedSet",
            failureOf([&] { codeWith(factory, UTF16TextBasedSet::create()); }));
}

TEST(GenericStreamTextBasedSetFactory, ParseAndCodeOfTheStreamIdentifier) {
  GenericStreamTextBasedSetFactory factory;
  FactoryParse run;
  MXFPrimedSet set = primedSetOf(factory.getSetKey(), 1, with(objectProperties(), streamSIDKey(), uint32Bytes(3)));
  std::shared_ptr<GenericStreamTextBasedSet> text =
      std::dynamic_pointer_cast<GenericStreamTextBasedSet>(run.parse(factory, set).object);
  EXPECT_TRUE(run.reports().empty());
  EXPECT_EQ(3u, text->getGenericStreamSID());
  EXPECT_EQ(set.properties, codeWith(factory, text));
}

TEST(UTF8TextBasedSetFactory, TextOf0xFFFFOctetsKeepsTwoOctetItemLengths) {
  UTF8TextBasedSetFactory factory;
  std::shared_ptr<UTF8TextBasedSet> text = UTF8TextBasedSet::create();
  text->setUTF8TextData(std::string(0xFFFF, 'a'));
  EXPECT_EQ(keyOf("06 0E 2B 34 02 53 01 01 0D 01 04 01 04 02 02 00"), codedKey(factory, text));
}

TEST(UTF8TextBasedSetFactory, TextOf0x10000OctetsIsCodedWithBERItemLengths) {
  UTF8TextBasedSetFactory factory;
  std::shared_ptr<UTF8TextBasedSet> text = UTF8TextBasedSet::create();
  text->setUTF8TextData(std::string(0x10000, 'a'));
  const KLVKey key = codedKey(factory, text);
  EXPECT_EQ(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 02 02 00"), key);
  EXPECT_EQ(0x13, key[5]);
}

TEST(UTF16TextBasedSetFactory, Text0f0x7FFFCharactersKeepsTwoOctetItemLengths) {
  UTF16TextBasedSetFactory factory;
  std::shared_ptr<UTF16TextBasedSet> text = UTF16TextBasedSet::create();
  text->setUTF16TextData(std::wstring(0x7FFF, L'a'));
  EXPECT_EQ(0x53, codedKey(factory, text)[5]);
}

TEST(UTF16TextBasedSetFactory, TextOf0x8000CharactersIsCodedWithBERItemLengths) {
  UTF16TextBasedSetFactory factory;
  std::shared_ptr<UTF16TextBasedSet> text = UTF16TextBasedSet::create();
  text->setUTF16TextData(std::wstring(0x8000, L'a'));
  EXPECT_EQ(keyOf("06 0E 2B 34 02 13 01 01 0D 01 04 01 04 02 03 00"), codedKey(factory, text));
}

TEST(TextBasedModel, RoundTripOfAFrameworkWithItsUTF16Text) {
  std::shared_ptr<TextBasedDMFramework> framework = TextBasedDMFramework::create();
  std::shared_ptr<UTF16TextBasedSet> text = UTF16TextBasedSet::create();
  describeText(*text);
  text->setTextDataDescription(L"clip notes");
  text->setUTF16TextData(L"<notes>\u00e9t\u00e9</notes>");
  framework->setTextBasedObject(text);

  TextRoundTrip trip;
  MXFMetadataModel model = trip.run(framework);
  EXPECT_TRUE(trip.errors->reports.empty());
  ASSERT_EQ(2u, trip.sets.sets.size());
  EXPECT_EQ(TextBasedDMFrameworkFactory().getSetKey(), trip.sets.sets[0].key);
  EXPECT_EQ(UTF16TextBasedSetFactory().getSetKey(), trip.sets.sets[1].key);
  // The instance identifier keeps its static tag; the six others are dynamic.
  std::vector<std::uint16_t> tags;
  for (const MXFPrimerEntry& entry : trip.sets.primers.at(0)) tags.push_back(entry.tag);
  EXPECT_EQ((std::vector<std::uint16_t>{0x3C0A, 0x8000, 0x8001, 0x8002, 0x8003, 0x8004, 0x8005}), tags);

  ASSERT_EQ(1u, model.size());
  std::shared_ptr<TextBasedDMFramework> parsed = std::dynamic_pointer_cast<TextBasedDMFramework>(model[0]);
  ASSERT_NE(parsed, nullptr);
  EXPECT_EQ(framework->getInstanceUID(), parsed->getInstanceUID());
  std::shared_ptr<UTF16TextBasedSet> parsedText =
      std::dynamic_pointer_cast<UTF16TextBasedSet>(parsed->getTextBasedObject());
  ASSERT_NE(parsedText, nullptr);
  EXPECT_EQ(text->getInstanceUID(), parsedText->getInstanceUID());
  EXPECT_EQ(keyOf(schemeID), parsedText->getTextBasedMetadataPayloadSchemeID());
  EXPECT_EQ(L"text/xml", parsedText->getTextMIMEMediaType());
  EXPECT_EQ(L"en", parsedText->getTextLanguageCode());
  EXPECT_EQ(L"clip notes", parsedText->getTextDataDescription());
  EXPECT_EQ(L"<notes>\u00e9t\u00e9</notes>", parsedText->getUTF16TextData());
}

TEST(TextBasedModel, RoundTripOfUTF8AndGenericStreamTexts) {
  for (const bool inStream : {false, true}) {
    std::shared_ptr<TextBasedDMFramework> framework = TextBasedDMFramework::create();
    std::shared_ptr<TextBasedObject> text;
    if (inStream) {
      std::shared_ptr<GenericStreamTextBasedSet> stream = GenericStreamTextBasedSet::create();
      stream->setGenericStreamSID(7);
      text = stream;
    } else {
      std::shared_ptr<UTF8TextBasedSet> utf8 = UTF8TextBasedSet::create();
      utf8->setUTF8TextData("<a/>");
      text = utf8;
    }
    describeText(*text);
    framework->setTextBasedObject(text);

    TextRoundTrip trip;
    MXFMetadataModel model = trip.run(framework);
    EXPECT_TRUE(trip.errors->reports.empty());
    ASSERT_EQ(1u, model.size());
    std::shared_ptr<const TextBasedObject> parsed =
        std::dynamic_pointer_cast<TextBasedDMFramework>(model[0])->getTextBasedObject();
    EXPECT_FALSE(parsed->hasTextDataDescription());
    EXPECT_EQ(L"text/xml", parsed->getTextMIMEMediaType());
    if (inStream)
      EXPECT_EQ(7u, std::dynamic_pointer_cast<const GenericStreamTextBasedSet>(parsed)->getGenericStreamSID());
    else
      EXPECT_EQ("<a/>", std::dynamic_pointer_cast<const UTF8TextBasedSet>(parsed)->getUTF8TextData());
  }
}

TEST(TextBasedModel, LargeTextRoundTripsThroughItsBERKey) {
  std::shared_ptr<TextBasedDMFramework> framework = TextBasedDMFramework::create();
  std::shared_ptr<UTF8TextBasedSet> text = UTF8TextBasedSet::create();
  describeText(*text);
  text->setUTF8TextData(std::string(0x10000, 'x'));
  framework->setTextBasedObject(text);
  TextRoundTrip trip;
  MXFMetadataModel model = trip.run(framework);
  EXPECT_EQ(0x13, trip.sets.sets.at(1).key[5]);
  EXPECT_TRUE(trip.errors->reports.empty());
  EXPECT_EQ(std::string(0x10000, 'x'),
            std::dynamic_pointer_cast<const UTF8TextBasedSet>(
                std::dynamic_pointer_cast<TextBasedDMFramework>(model.at(0))->getTextBasedObject())
                ->getUTF8TextData());
}

TEST(TextBasedModel, CoderFailsOnANullTextBasedObject) {
  RecordingMetadataHandler sets;
  MXFMetadataModelCoder coder(&sets, std::make_shared<MXFTextBasedDMModelFactory>());
  EXPECT_EQ("assertion failure: TextBasedDMFramework.textBasedObject is present",
            failureOf([&] { coder.model({TextBasedDMFramework::create()}); }));
  EXPECT_TRUE(sets.events.empty());
}

TEST(TextBasedModel, TextSetThatNeverArrivesLeavesTheReferenceUnsetWithOneWarning) {
  TextRoundTrip trip;
  MXFMetadataModel model =
      trip.parse({primedSetOf(TextBasedDMFrameworkFactory().getSetKey(), 1, {{frameworkObjectKey(), uidBytes(2)}})});
  ASSERT_EQ(1u, trip.errors->reports.size());
  EXPECT_EQ("warning", trip.errors->reports[0].severity);
  EXPECT_EQ(danglingReferencesId, trip.errors->reports[0].identifier);
  EXPECT_EQ("model has dangling references - " + uidText(2), trip.errors->reports[0].message);
  ASSERT_EQ(1u, model.size());
  std::shared_ptr<TextBasedDMFramework> framework = std::dynamic_pointer_cast<TextBasedDMFramework>(model[0]);
  EXPECT_EQ("assertion failure: TextBasedDMFramework.textBasedObject is present",
            failureOf([&] { framework->getTextBasedObject(); }));
}

TEST(TextBasedModel, TextSetWithBERKeyIsParsed) {
  TextRoundTrip trip;
  KLVKey berKey = UTF8TextBasedSetFactory().getSetKey();
  berKey[5] = 0x13;
  MXFMetadataModel model =
      trip.parse({primedSetOf(TextBasedDMFrameworkFactory().getSetKey(), 1, {{frameworkObjectKey(), uidBytes(2)}}),
                  primedSetOf(berKey, 2, with(objectProperties(), utf8Key(), bytesOf("41")))});
  EXPECT_TRUE(trip.errors->reports.empty());
  ASSERT_EQ(1u, model.size());
  EXPECT_EQ("A", std::dynamic_pointer_cast<const UTF8TextBasedSet>(
                     std::dynamic_pointer_cast<TextBasedDMFramework>(model[0])->getTextBasedObject())
                     ->getUTF8TextData());
}

TEST(TextBasedModel, FrameworkHangsOffADMSegment) {
  std::shared_ptr<DMSegment> segment = DMSegment::create();
  std::shared_ptr<TextBasedDMFramework> framework = TextBasedDMFramework::create();
  segment->setDMFramework(framework);
  EXPECT_EQ(framework, segment->getDMFramework());
  EXPECT_EQ(segment, framework->getTopOwner());
}

TEST(TextBasedFactories, EveryClassDescribesItsWholeSetPrimer) {
  MXFTextBasedDMModelFactory composite;
  for (const std::shared_ptr<MXFMetadataFactory>& factory : composite.getFactories()) {
    const MetadataRootFactory& single = dynamic_cast<const MetadataRootFactory&>(*factory);
    EXPECT_EQ(single.getSetPrimer().size(), single.getPropertyDescriptions().size()) << single.getClassName();
  }
  const UTF8TextBasedSetFactory utf8;
  const MXFPropertyDescription& text = utf8.getPropertyDescriptions().at(utf8Key());
  EXPECT_EQ("UTF8TextBasedSet.utf8TextData", text.name);
  EXPECT_EQ(MXFPropertyKind::narrowString, text.kind);
  EXPECT_EQ(MXFPropertyKind::wideString, UTF16TextBasedSetFactory().getPropertyDescriptions().at(utf16Key()).kind);
}
