#include "platform/archive/PropertyList.h"

#include <set>
#include <utility>

namespace vantrell {
namespace {

// Compares two trees. A pair of containers that has been gone into once is not gone into again:
// it was equal, or the comparison has ended, and trees that share their branches may unfold to
// more places than could ever be visited.
class Comparison {
 public:
  bool equal(const PropertyListValue& a, const PropertyListValue& b) {
    if (a.array() != nullptr && b.array() != nullptr) {
      return isKnown(a.array(), b.array()) || equalArrays(*a.array(), *b.array());
    }
    if (a.dictionary() != nullptr && b.dictionary() != nullptr) {
      return isKnown(a.dictionary(), b.dictionary()) ||
             equalDictionaries(*a.dictionary(), *b.dictionary());
    }
    return equalPointees(a.number(), b.number()) && equalPointees(a.date(), b.date()) &&
           equalPointees(a.string(), b.string()) && equalPointees(a.data(), b.data()) &&
           equalPointees(a.uid(), b.uid()) && a.array() == b.array() &&
           a.dictionary() == b.dictionary();
  }

 private:
  template <class T>
  static bool equalPointees(const T* a, const T* b) {
    if (a == b) return true;
    return a != nullptr && b != nullptr && *a == *b;
  }

  bool isKnown(const void* a, const void* b) { return a == b || !_pairs.emplace(a, b).second; }

  bool equalArrays(const PropertyListValue::Array& a, const PropertyListValue::Array& b) {
    if (a.size() != b.size()) return false;
    for (std::size_t i = 0; i < a.size(); ++i) {
      if (!equal(a[i], b[i])) return false;
    }
    return true;
  }

  bool equalDictionaries(const PropertyListValue::Dictionary& a,
                         const PropertyListValue::Dictionary& b) {
    if (a.size() != b.size()) return false;
    for (auto left = a.begin(), right = b.begin(); left != a.end(); ++left, ++right) {
      if (left->first != right->first || !equal(left->second, right->second)) return false;
    }
    return true;
  }

  std::set<std::pair<const void*, const void*>> _pairs;
};

}  // namespace

bool operator==(const PropertyListValue& a, const PropertyListValue& b) {
  return Comparison().equal(a, b);
}

}  // namespace vantrell
