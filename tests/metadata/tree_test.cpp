#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "core/failure.h"
#include "metadata.h"
#include "metadata/test_objects.h"
#include "support/recording.h"

using zelta_test::failureOf;
using zelta_test::keyOf;
using zelta_test::Leaf;
using zelta_test::Node;

namespace {

const KLVKey darkKey = keyOf("06 0E 2B 34 01 01 01 0E 0E 01 02 03 04 05 06 07");

// Root, 10 branches each with a dark reference, 100 twigs each with a
// partner, 300 leaves: 521 objects, and the root's one weak reference to a
// leaf.
struct Tree {
  std::shared_ptr<Node> root = Node::create();
  std::vector<std::weak_ptr<MetadataRoot>> everyObject;
  std::weak_ptr<Node> favourite;

  Tree() {
    everyObject.push_back(root);
    for (int b = 0; b < 10; ++b) {
      std::shared_ptr<Node> branch = add(root);
      std::shared_ptr<Leaf> dark = Leaf::create();
      branch->setDarkProperty(darkKey, dark);
      everyObject.push_back(dark);
      for (int t = 0; t < 10; ++t) {
        std::shared_ptr<Node> twig = add(branch);
        std::shared_ptr<Node> partner = Node::create();
        twig->setPartner(partner);
        everyObject.push_back(partner);
        for (int l = 0; l < 3; ++l) favourite = add(twig);
      }
    }
    root->setFavourite(favourite.lock());
  }

  std::shared_ptr<Node> add(const std::shared_ptr<Node>& owner) {
    std::shared_ptr<Node> child = Node::create();
    owner->addChild(child);
    everyObject.push_back(child);
    return child;
  }
};

std::size_t liveObjects(const std::vector<std::weak_ptr<MetadataRoot>>& objects) {
  std::size_t live = 0;
  for (const std::weak_ptr<MetadataRoot>& object : objects)
    if (!object.expired()) ++live;
  return live;
}

}  // namespace

TEST(MetadataTree, ReleasingTheRootFreesEveryObject) {
  Tree tree;
  ASSERT_EQ(tree.everyObject.size(), 521u);
  EXPECT_EQ(liveObjects(tree.everyObject), 521u);
  EXPECT_EQ(tree.root->getFavourite(), tree.favourite.lock());
  for (const std::weak_ptr<MetadataRoot>& object : tree.everyObject)
    EXPECT_EQ(object.lock()->getTopOwner(), tree.root);
  tree.root.reset();
  EXPECT_EQ(liveObjects(tree.everyObject), 0u);
}

namespace {

// What ownership and the properties of a set of nodes look like, to show
// that a refused change left everything as it was.
std::string shapeOf(const std::vector<std::shared_ptr<Node>>& nodes) {
  std::string shape;
  auto indexOf = [&](const std::shared_ptr<MetadataRoot>& object) {
    for (std::size_t i = 0; i < nodes.size(); ++i)
      if (nodes[i] == object) return std::to_string(i);
    return std::string(object ? "?" : "-");
  };
  for (const std::shared_ptr<Node>& node : nodes) {
    shape += "[top " + indexOf(node->getTopOwner()) + " children";
    for (std::size_t i = 0; i < node->getChildCount(); ++i) shape += " " + indexOf(node->getChildAt(i));
    shape += " partner " + (node->hasPartner() ? indexOf(node->getPartner()) : std::string("-"));
    for (const auto& dark : node->getDarkProperties())
      shape += node->isReferenceDarkProperty(dark.first) ? " dark " + indexOf(node->getDarkProperty<Node>(dark.first))
                                                         : std::string(" dark bytes");
    shape += "]";
  }
  return shape;
}

}  // namespace

TEST(MetadataTree, NoAccessorCanFormACycle) {
  std::shared_ptr<Node> root = Node::create();
  std::shared_ptr<Node> a = Node::create();
  std::shared_ptr<Node> b = Node::create();
  std::shared_ptr<Node> c = Node::create();
  std::shared_ptr<Node> d = Node::create();
  root->addChild(a);
  a->setPartner(b);
  b->setDarkProperty(darkKey, c);
  c->addChild(d);
  const std::vector<std::shared_ptr<Node>> nodes{root, a, b, c, d};
  const std::string before = shapeOf(nodes);
  ASSERT_EQ(before,
            "[top 0 children 1 partner -][top 0 children partner 2][top 0 children partner - dark 3]"
            "[top 0 children 4 partner -][top 0 children partner -]");

  const std::string notOwned = "assertion failure: object is not owned";
  const std::string ownsThis = "assertion failure: object does not own this";
  const std::vector<std::pair<std::string, std::function<void()>>> attempts{
      {ownsThis, [&] { d->addChild(root); }},
      {ownsThis, [&] { d->insertChildAt(0, root); }},
      {ownsThis, [&] { d->setPartner(root); }},
      {ownsThis, [&] { d->setDarkProperty(darkKey, root); }},
      {ownsThis, [&] { d->takeOwnership(root); }},
      {ownsThis, [&] { d->swapOwnership(nullptr, root); }},
      {ownsThis, [&] { root->addChild(root); }},
      {ownsThis, [&] { root->setPartner(root); }},
      {ownsThis, [&] { root->setDarkProperty(darkKey, root); }},
      {ownsThis, [&] { dangling_ref_t<Node, Node>(d, &Node::setPartner, true).resolve(root); }},
      {ownsThis, [&] { dangling_vector_ref_t<Node, Node>(c, &Node::insertChildAt, nullptr, true).resolve(root); }},
      {ownsThis, [&] { dangling_dark_ref_t<MetadataRoot>(d, darkKey).resolve(root); }},
      {notOwned, [&] { d->addChild(a); }},
      {notOwned, [&] { d->insertChildAt(0, b); }},
      {notOwned, [&] { d->setPartner(c); }},
      {notOwned, [&] { d->setDarkProperty(darkKey, a); }},
      {notOwned, [&] { d->addChild(d); }},
      {notOwned, [&] { c->setPartner(c); }},
      {notOwned, [&] { b->setDarkProperty(darkKey, c); }},
      {notOwned, [&] { a->setPartner(b); }},
      {notOwned, [&] { dangling_ref_t<Node, Node>(d, &Node::setPartner, true).resolve(a); }},
  };
  for (std::size_t i = 0; i < attempts.size(); ++i) {
    EXPECT_EQ(failureOf(attempts[i].second), attempts[i].first) << "attempt " << i;
    EXPECT_EQ(shapeOf(nodes), before) << "attempt " << i;
  }
}
