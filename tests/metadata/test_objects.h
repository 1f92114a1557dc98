// Small metadata classes for the tests of ownership and references, built
// on the accessor pattern of the model's classes.
#ifndef ZELTA_TESTS_METADATA_TEST_OBJECTS_H
#define ZELTA_TESTS_METADATA_TEST_OBJECTS_H

#include <cstddef>
#include <memory>
#include <vector>

#include "metadata.h"

namespace zelta_test {

// A node with a strong vector (children), a single strong property
// (partner) and a weak property (favourite).
class Node : public MetadataObject {
public:
  static std::shared_ptr<Node> create() { return std::make_shared<Node>(); }

  std::size_t getChildCount() const { return children_.size(); }
  std::shared_ptr<Node> getChildAt(std::size_t index) const {
    check(index < children_.size(), "valid index");
    return children_[index];
  }
  void addChild(const std::shared_ptr<Node>& child) { insertChildAt(children_.size(), child); }
  void insertChildAt(std::size_t index, const std::shared_ptr<Node>& child) {
    check(index <= children_.size(), "valid index");
    takeOwnership(child);
    children_.insert(children_.begin() + static_cast<std::ptrdiff_t>(index), child);
  }
  void removeChildAt(std::size_t index) {
    check(index < children_.size(), "valid index");
    releaseOwnership(children_[index]);
    children_.erase(children_.begin() + static_cast<std::ptrdiff_t>(index));
  }
  // Drops the children without releasing them, as the whole-property
  // removal of an optional vector does.
  void removeChildren() { children_.clear(); }

  bool hasPartner() const { return partner_ != nullptr; }
  std::shared_ptr<Node> getPartner() const {
    check(partner_ != nullptr, "Node.partner is present");
    return partner_;
  }
  void setPartner(const std::shared_ptr<Node>& partner) {
    swapOwnership(partner_, partner);
    partner_ = partner;
  }

  // Null once the target has gone.
  std::shared_ptr<Node> getFavourite() const { return favourite_.lock(); }
  void setFavourite(const std::shared_ptr<Node>& favourite) { favourite_ = favourite; }

private:
  std::vector<std::shared_ptr<Node>> children_;
  std::shared_ptr<Node> partner_;
  std::weak_ptr<Node> favourite_;
};

// An object of another class, for the typed checks.
class Leaf : public MetadataObject {
public:
  static std::shared_ptr<Leaf> create() { return std::make_shared<Leaf>(); }
};

}  // namespace zelta_test

#endif
