#include <gtest/gtest.h>

#include <cstdint>
#include <iterator>
#include <memory>

#include "core/failure.h"
#include "metadata.h"
#include "metadata/test_objects.h"
#include "support/recording.h"

using zelta_test::bytesOf;
using zelta_test::failureOf;
using zelta_test::keyOf;
using zelta_test::Leaf;
using zelta_test::Node;

namespace {

const KLVKey darkKey = keyOf("06 0E 2B 34 01 01 01 0E 0E 01 02 03 04 05 06 07");
const KLVKey otherKey = keyOf("06 0E 2B 34 01 01 01 0E 0E 01 02 03 04 05 06 08");

bool isUnowned(const std::shared_ptr<MetadataRoot>& object) { return object->getTopOwner() == object; }

}  // namespace

TEST(MetadataRoot, ByteDarkPropertyOverAReferenceReleasesTheObject) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Leaf> leaf = Leaf::create();
  owner->setDarkProperty(darkKey, leaf);
  EXPECT_EQ(leaf->getTopOwner(), owner);
  EXPECT_TRUE(owner->isReferenceDarkProperty(darkKey));
  owner->setDarkProperty(darkKey, bytesOf("01 02"));
  EXPECT_TRUE(isUnowned(leaf));
  EXPECT_FALSE(owner->isReferenceDarkProperty(darkKey));
  EXPECT_EQ(owner->getDarkProperty(darkKey), bytesOf("01 02"));
  std::shared_ptr<Node> another = Node::create();
  another->addChild(Node::create());
  another->setDarkProperty(darkKey, leaf);
  EXPECT_EQ(leaf->getTopOwner(), another);
}

TEST(MetadataRoot, RemovingAMissingDarkPropertyDoesNothing) {
  std::shared_ptr<Node> owner = Node::create();
  owner->setDarkProperty(otherKey, bytesOf("05"));
  owner->removeDarkProperty(darkKey);
  EXPECT_EQ(owner->getDarkProperties().size(), 1u);
  EXPECT_FALSE(owner->hasDarkProperty(darkKey));
  EXPECT_TRUE(owner->hasDarkProperty(otherKey));
}

TEST(MetadataRoot, GettingAMissingDarkPropertyFails) {
  std::shared_ptr<Node> owner = Node::create();
  EXPECT_EQ(failureOf([&] { owner->getDarkProperty(darkKey); }), "assertion failure: property is present");
  EXPECT_EQ(failureOf([&] { owner->getDarkProperty<Leaf>(darkKey); }), "assertion failure: property is present");
}

TEST(MetadataRoot, IsReferenceOfAMissingDarkPropertyFails) {
  std::shared_ptr<Node> owner = Node::create();
  EXPECT_EQ(failureOf([&] { owner->isReferenceDarkProperty(darkKey); }), "assertion failure: property is present");
}

TEST(MetadataRoot, DarkPropertyGettersCheckTheKindOfValue) {
  std::shared_ptr<Node> owner = Node::create();
  owner->setDarkProperty(darkKey, bytesOf("01"));
  owner->setDarkProperty(otherKey, Leaf::create());
  EXPECT_EQ(failureOf([&] { owner->getDarkProperty(otherKey); }),
            "assertion failure: property is a non-reference value");
  EXPECT_EQ(failureOf([&] { owner->getDarkProperty<Leaf>(darkKey); }),
            "assertion failure: property is a reference value");
  EXPECT_EQ(failureOf([&] { owner->getDarkProperty<Node>(otherKey); }),
            "assertion failure: property is a T reference value");
  EXPECT_NE(owner->getDarkProperty<Leaf>(otherKey), nullptr);
  EXPECT_NE(owner->getDarkProperty<MetadataRoot>(otherKey), nullptr);
}

TEST(MetadataRoot, PlainDarkValueIsStoredBigEndian) {
  std::shared_ptr<Node> owner = Node::create();
  owner->setDarkProperty(darkKey, static_cast<std::uint16_t>(0x1234));
  EXPECT_EQ(owner->getDarkProperty(darkKey), bytesOf("12 34"));
}

TEST(MetadataRoot, DarkReferenceTakesOwnershipAndRefusesAnOwnedObject) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> other = Node::create();
  std::shared_ptr<Leaf> leaf = Leaf::create();
  other->setDarkProperty(darkKey, leaf);
  EXPECT_EQ(failureOf([&] { owner->setDarkProperty(darkKey, leaf); }), "assertion failure: object is not owned");
  EXPECT_FALSE(owner->hasDarkProperty(darkKey));
  EXPECT_EQ(failureOf([&] { other->setDarkProperty(darkKey, leaf); }), "assertion failure: object is not owned");
  EXPECT_EQ(other->getDarkProperty<Leaf>(darkKey), leaf);
  other->removeDarkProperty(darkKey);
  EXPECT_TRUE(isUnowned(leaf));
  EXPECT_FALSE(other->hasDarkProperty(darkKey));
}

TEST(MetadataRoot, ReplacingADarkReferenceReleasesTheOldObject) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Leaf> old = Leaf::create();
  std::shared_ptr<Leaf> replacement = Leaf::create();
  owner->setDarkProperty(darkKey, old);
  owner->setDarkProperty(darkKey, replacement);
  EXPECT_TRUE(isUnowned(old));
  EXPECT_EQ(replacement->getTopOwner(), owner);
}

TEST(MetadataRoot, DarkPropertiesAreInKeyOrderIgnoringTheVersionOctet) {
  std::shared_ptr<Node> owner = Node::create();
  owner->setDarkProperty(otherKey, bytesOf("02"));
  owner->setDarkProperty(darkKey, bytesOf("01"));
  owner->setDarkProperty(keyOf("06 0E 2B 34 01 01 01 01 0E 01 02 03 04 05 06 07"), bytesOf("03"));
  ASSERT_EQ(owner->getDarkProperties().size(), 2u);
  EXPECT_EQ(owner->getDarkProperties().begin()->first, darkKey);
  EXPECT_EQ(owner->getDarkProperty(darkKey), bytesOf("03"));
  EXPECT_EQ(std::next(owner->getDarkProperties().begin())->first, otherKey);
}
