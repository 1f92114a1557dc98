#include <gtest/gtest.h>

#include <memory>
#include <vector>

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

typedef dangling_vector_ref_t<Node, Node> ChildRef;
typedef dangling_ref_t<Node, Node> PartnerRef;

std::vector<std::shared_ptr<Node>> childrenOf(const Node& node) {
  std::vector<std::shared_ptr<Node>> children;
  for (std::size_t i = 0; i < node.getChildCount(); ++i) children.push_back(node.getChildAt(i));
  return children;
}

// The index at which each insertion happened.
class IndexRecordingNode : public Node {
public:
  void insertRecordedAt(std::size_t index, const std::shared_ptr<Node>& child) {
    indices.push_back(index);
    insertChildAt(index, child);
  }
  std::vector<std::size_t> indices;
};

}  // namespace

TEST(DanglingVectorRef, TargetsArrivingOutOfOrderKeepTheOrderOfTheIdentifiers) {
  std::shared_ptr<IndexRecordingNode> owner = std::make_shared<IndexRecordingNode>();
  typedef dangling_vector_ref_t<IndexRecordingNode, Node> Ref;
  auto refA = std::make_shared<Ref>(owner, &IndexRecordingNode::insertRecordedAt, nullptr, true);
  auto refB = std::make_shared<Ref>(owner, &IndexRecordingNode::insertRecordedAt, refA, true);
  auto refC = std::make_shared<Ref>(owner, &IndexRecordingNode::insertRecordedAt, refB, true);
  std::shared_ptr<Node> a = Node::create();
  std::shared_ptr<Node> b = Node::create();
  std::shared_ptr<Node> c = Node::create();
  refC->resolve(c);
  refA->resolve(a);
  refB->resolve(b);
  EXPECT_EQ(owner->indices, (std::vector<std::size_t>{0, 0, 1}));
  EXPECT_EQ(childrenOf(*owner), (std::vector<std::shared_ptr<Node>>{a, b, c}));
}

TEST(DanglingVectorRef, UnresolvedElementLeavesNoGap) {
  std::shared_ptr<Node> owner = Node::create();
  auto refA = std::make_shared<ChildRef>(owner, &Node::insertChildAt, nullptr, true);
  auto refB = std::make_shared<ChildRef>(owner, &Node::insertChildAt, refA, true);
  auto refC = std::make_shared<ChildRef>(owner, &Node::insertChildAt, refB, true);
  std::shared_ptr<Node> a = Node::create();
  std::shared_ptr<Node> c = Node::create();
  refC->resolve(c);
  refA->resolve(a);
  EXPECT_EQ(childrenOf(*owner), (std::vector<std::shared_ptr<Node>>{a, c}));
}

TEST(DanglingVectorRef, SecondResolveFails) {
  std::shared_ptr<Node> owner = Node::create();
  ChildRef ref(owner, &Node::insertChildAt, nullptr, true);
  ref.resolve(Node::create());
  EXPECT_EQ(failureOf([&] { ref.resolve(Node::create()); }), "assertion failure: is still dangling");
  EXPECT_EQ(owner->getChildCount(), 1u);
}

TEST(DanglingVectorRef, TargetOfAnotherClassFailsAndStaysDangling) {
  std::shared_ptr<Node> owner = Node::create();
  ChildRef ref(owner, &Node::insertChildAt, nullptr, true);
  EXPECT_EQ(failureOf([&] { ref.resolve(Leaf::create()); }), "assertion failure: object is value type");
  EXPECT_EQ(owner->getChildCount(), 0u);
  std::shared_ptr<Node> child = Node::create();
  ref.resolve(child);
  EXPECT_EQ(owner->getChildAt(0), child);
}

TEST(DanglingVectorRef, StrengthIsAsGiven) {
  std::shared_ptr<Node> owner = Node::create();
  EXPECT_TRUE(ChildRef(owner, &Node::insertChildAt, nullptr, true).isStrong());
  EXPECT_FALSE(ChildRef(owner, &Node::insertChildAt, nullptr, false).isStrong());
}

TEST(DanglingVectorRef, LongChainIsReleasedWithoutDeepRecursion) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<ChildRef> last;
  for (int i = 0; i < 200000; ++i) last = std::make_shared<ChildRef>(owner, &Node::insertChildAt, last, true);
  last.reset();
  EXPECT_EQ(owner.use_count(), 1);
}

TEST(DanglingRef, ResolveCallsTheSetter) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> partner = Node::create();
  PartnerRef ref(owner, &Node::setPartner, true);
  EXPECT_TRUE(ref.isStrong());
  ref.resolve(partner);
  EXPECT_EQ(owner->getPartner(), partner);
  EXPECT_EQ(partner->getTopOwner(), owner);
}

TEST(DanglingRef, WeakReferenceUsesTheWeakSetter) {
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Node> target = Node::create();
  PartnerRef ref(owner, &Node::setFavourite, false);
  EXPECT_FALSE(ref.isStrong());
  ref.resolve(target);
  EXPECT_EQ(owner->getFavourite(), target);
  EXPECT_EQ(target->getTopOwner(), target);
}

TEST(DanglingRef, TargetOfAnotherClassFails) {
  std::shared_ptr<Node> owner = Node::create();
  PartnerRef ref(owner, &Node::setPartner, true);
  EXPECT_EQ(failureOf([&] { ref.resolve(Leaf::create()); }), "assertion failure: object is value type");
  EXPECT_EQ(failureOf([&] { ref.resolve(nullptr); }), "assertion failure: object is value type");
  EXPECT_FALSE(owner->hasPartner());
}

TEST(DanglingDarkRef, ResolveReplacesTheIdentifierByTheObject) {
  const KLVKey key = keyOf("06 0E 2B 34 01 01 01 0E 0E 7F 00 00 00 00 00 01");
  std::shared_ptr<Node> owner = Node::create();
  std::shared_ptr<Leaf> target = Leaf::create();
  ByteVector identifier(target->getInstanceUID().data(), target->getInstanceUID().data() + 16);
  owner->setDarkProperty(key, identifier);
  dangling_dark_ref_t<MetadataRoot> ref(owner, key);
  EXPECT_TRUE(ref.isStrong());
  ref.resolve(target);
  EXPECT_TRUE(owner->isReferenceDarkProperty(key));
  EXPECT_EQ(owner->getDarkProperty<Leaf>(key), target);
  EXPECT_EQ(target->getTopOwner(), owner);
}

TEST(DanglingDarkRef, NullTargetFails) {
  const KLVKey key = keyOf("06 0E 2B 34 01 01 01 0E 0E 7F 00 00 00 00 00 01");
  std::shared_ptr<Node> owner = Node::create();
  owner->setDarkProperty(key, bytesOf("00 01"));
  dangling_dark_ref_t<MetadataRoot> ref(owner, key);
  EXPECT_EQ(failureOf([&] { ref.resolve(nullptr); }), "assertion failure: object is value type");
  EXPECT_EQ(owner->getDarkProperty(key), bytesOf("00 01"));
}
