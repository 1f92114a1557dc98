#include <gtest/gtest.h>

#include <memory>

#include "core/failure.h"
#include "metadata.h"
#include "metadata/test_objects.h"

using zelta_test::failureOf;
using zelta_test::Leaf;
using zelta_test::Node;

namespace {

bool isUnowned(const std::shared_ptr<Node>& node) { return node->getTopOwner() == node; }

}  // namespace

TEST(MetadataRoot, SwapOwnershipOfNullForNullChangesNothingEvenWithoutAPointer) {
  Node unheld;
  EXPECT_EQ(failureOf([&] { unheld.swapOwnership(nullptr, nullptr); }), "no failure");
  std::shared_ptr<Node> held = Node::create();
  EXPECT_EQ(failureOf([&] { held->swapOwnership(nullptr, nullptr); }), "no failure");
  EXPECT_TRUE(isUnowned(held));
}

TEST(MetadataRoot, SwapOwnershipOfAnOwnedObjectForItselfFailsAndChangesNothing) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> child = Node::create();
  owner->takeOwnership(child);
  EXPECT_EQ(failureOf([&] { owner->swapOwnership(child, child); }), "assertion failure: object is not owned");
  EXPECT_EQ(child->getTopOwner(), owner);
}

TEST(MetadataRoot, SettingAStrongPropertyToWhatItHoldsFails) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> partner = Node::create();
  owner->setPartner(partner);
  EXPECT_EQ(failureOf([&] { owner->setPartner(partner); }), "assertion failure: object is not owned");
  EXPECT_EQ(owner->getPartner(), partner);
  EXPECT_EQ(partner->getTopOwner(), owner);
}

TEST(MetadataRoot, TakingOwnershipOfTheTopOwnerFails) {
  std::shared_ptr<Node> root = Node::create();
  std::shared_ptr<Node> middle = Node::create();
  std::shared_ptr<Node> leaf = Node::create();
  root->addChild(middle);
  middle->addChild(leaf);
  EXPECT_EQ(failureOf([&] { leaf->takeOwnership(root); }), "assertion failure: object does not own this");
  EXPECT_EQ(failureOf([&] { leaf->addChild(root); }), "assertion failure: object does not own this");
  EXPECT_TRUE(isUnowned(root));
  EXPECT_EQ(leaf->getChildCount(), 0u);
}

TEST(MetadataRoot, TakingOwnershipOfItselfWhenUnownedFails) {
  std::shared_ptr<Node> node = Node::create();
  EXPECT_EQ(failureOf([&] { node->takeOwnership(node); }), "assertion failure: object does not own this");
  EXPECT_EQ(failureOf([&] { node->setPartner(node); }), "assertion failure: object does not own this");
  EXPECT_TRUE(isUnowned(node));
  EXPECT_FALSE(node->hasPartner());
}

TEST(MetadataRoot, ChildOfAnotherOwnerIsNotFreeUntilReleased) {
  std::shared_ptr<Node> first = Node::create();
  std::shared_ptr<Node> second = Node::create();
  std::shared_ptr<Node> child = Node::create();
  first->addChild(child);
  EXPECT_EQ(failureOf([&] { second->addChild(child); }), "assertion failure: object is not owned");
  EXPECT_EQ(second->getChildCount(), 0u);
  first->removeChildAt(0);
  EXPECT_TRUE(isUnowned(child));
  second->addChild(child);
  EXPECT_EQ(child->getTopOwner(), second);
}

TEST(MetadataRoot, ChildOfAnExpiredOwnerIsFreeWithoutRelease) {
  std::shared_ptr<Node> second = Node::create();
  std::shared_ptr<Node> child = Node::create();
  {
    std::shared_ptr<Node> first = Node::create();
    first->addChild(child);
    EXPECT_EQ(failureOf([&] { second->addChild(child); }), "assertion failure: object is not owned");
  }
  EXPECT_TRUE(isUnowned(child));
  second->addChild(child);
  EXPECT_EQ(child->getTopOwner(), second);
}

TEST(MetadataRoot, WholePropertyRemovalKeepsTheOwnerLinkWhileTheOwnerLives) {
  std::shared_ptr<Node> second = Node::create();
  std::shared_ptr<Node> child = Node::create();
  std::shared_ptr<Node> first = Node::create();
  first->addChild(child);
  first->removeChildren();
  EXPECT_EQ(first->getChildCount(), 0u);
  EXPECT_EQ(child->getTopOwner(), first);
  EXPECT_EQ(failureOf([&] { second->addChild(child); }), "assertion failure: object is not owned");
  first.reset();
  second->addChild(child);
  EXPECT_EQ(child->getTopOwner(), second);
}

TEST(MetadataRoot, ReleasingAnObjectOwnedByAnotherFails) {
  std::shared_ptr<Node> first = Node::create();
  std::shared_ptr<Node> second = Node::create();
  std::shared_ptr<Node> child = Node::create();
  first->addChild(child);
  EXPECT_EQ(failureOf([&] { second->releaseOwnership(child); }), "assertion failure: current owner is this");
  EXPECT_EQ(child->getTopOwner(), first);
}

TEST(MetadataRoot, ReplacingAStrongPropertyReleasesTheOldAndTakesTheNew) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> old = Node::create();
  std::shared_ptr<Node> replacement = Node::create();
  owner->setPartner(old);
  owner->setPartner(replacement);
  EXPECT_TRUE(isUnowned(old));
  EXPECT_EQ(replacement->getTopOwner(), owner);
  owner->setPartner(nullptr);
  EXPECT_TRUE(isUnowned(replacement));
  EXPECT_EQ(failureOf([&] { owner->getPartner(); }), "assertion failure: Node.partner is present");
}

TEST(MetadataRoot, RemoveAtTheLastIndexReleasesOnlyThatElement) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> a = Node::create();
  std::shared_ptr<Node> b = Node::create();
  std::shared_ptr<Node> c = Node::create();
  owner->addChild(a);
  owner->addChild(c);
  owner->insertChildAt(1, b);
  owner->removeChildAt(2);
  ASSERT_EQ(owner->getChildCount(), 2u);
  EXPECT_EQ(owner->getChildAt(0), a);
  EXPECT_EQ(owner->getChildAt(1), b);
  EXPECT_TRUE(isUnowned(c));
  EXPECT_EQ(a->getTopOwner(), owner);
  EXPECT_EQ(failureOf([&] { owner->removeChildAt(2); }), "assertion failure: valid index");
  EXPECT_EQ(failureOf([&] { owner->insertChildAt(3, c); }), "assertion failure: valid index");
  EXPECT_TRUE(isUnowned(c));
}

TEST(MetadataRoot, ObjectWithoutAPointerCanNotOwnOrRelease) {
  Node unheld;
  std::shared_ptr<Node> child = Node::create();
  EXPECT_THROW(unheld.takeOwnership(child), std::bad_weak_ptr);
  EXPECT_TRUE(isUnowned(child));
  EXPECT_THROW(unheld.releaseOwnership(child), std::bad_weak_ptr);
  EXPECT_THROW(unheld.getTopOwner(), std::bad_weak_ptr);
}

TEST(MetadataRoot, WeakPropertyGivesNullOnceTheTargetHasGone) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> target = Node::create();
  owner->setFavourite(target);
  EXPECT_EQ(owner->getFavourite(), target);
  EXPECT_TRUE(isUnowned(target));
  target.reset();
  EXPECT_EQ(owner->getFavourite(), nullptr);
}

TEST(MetadataRoot, EveryObjectHasItsOwnInstanceUIDFromBirth) {
  std::shared_ptr<Node> a = Node::create();
  std::shared_ptr<Leaf> b = Leaf::create();
  std::shared_ptr<MetadataRoot> c = MetadataRoot::create();
  EXPECT_NE(a->getInstanceUID(), b->getInstanceUID());
  EXPECT_NE(a->getInstanceUID(), c->getInstanceUID());
  EXPECT_NE(a->getInstanceUID(), MXFUID());
  a->setInstanceUID(b->getInstanceUID());
  EXPECT_EQ(a->getInstanceUID(), b->getInstanceUID());
}

TEST(MetadataObject, GenerationUIDIsOptional) {
  std::shared_ptr<MetadataObject> object = MetadataObject::create();
  EXPECT_FALSE(object->hasGenerationUID());
  EXPECT_EQ(failureOf([&] { object->getGenerationUID(); }),
            "assertion failure: MetadataObject.generationUID is present");
  const MXFUID generation = ZeltaDefaultUIDGenerator().generate();
  object->setGenerationUID(generation);
  EXPECT_TRUE(object->hasGenerationUID());
  EXPECT_EQ(object->getGenerationUID(), generation);
  object->removeGenerationUID();
  EXPECT_FALSE(object->hasGenerationUID());
}
