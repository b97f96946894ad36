#include "Comparison.h"

#include <algorithm>
#include <cstddef>
#include <unordered_set>

#include "TextIndex.h"

namespace migration {

namespace {

// The definition that counts under the OID of `entry`.
bool counts(const Installation& installation, const Entry& entry) {
  return installation.byOid(entry.kind(), entry.kept->object->oidInPlace()) == &entry;
}

using Entries = std::unordered_set<const Entry*>;

// Of `right`, what has the first name of `entry` and no partner by OID.
const Entry* partnerByName(const Installation& right, const Entries& taken, const Entry& entry) {
  const std::vector<std::string>& names = entry.kept->object->namesInPlace();
  if (names.empty()) {
    return nullptr;
  }
  for (const Entry* const candidate : right.byAnyName(entry.kind(), names.front())) {
    const std::vector<std::string>& others = candidate->kept->object->namesInPlace();
    if (equalsFolded(others.front(), names.front()) && taken.count(candidate) == 0 &&
        counts(right, *candidate)) {
      return candidate;
    }
  }
  return nullptr;
}

Compared pairOf(const Entry* left, const Entry* right) {
  const bool isEqual = areEqual(*left->kept, *right->kept);
  return {left->kind(), isEqual ? Comparison::kEqual : Comparison::kDifferent, left, right};
}

}  // namespace

bool areEqual(const KeptDefinition& left, const KeptDefinition& right) {
  if (left.kind != right.kind) {
    return false;
  }
  switch (left.kind) {
    case Kind::kAttributeType:
      return left.attribute().isEqualTo(right.attribute()) &&
             right.attribute().isEqualTo(left.attribute());
    case Kind::kObjectClass:
      return left.objectClass().isEqualTo(right.objectClass()) &&
             right.objectClass().isEqualTo(left.objectClass());
    default:
      return left.extension().isEqualTo(right.extension()) &&
             right.extension().isEqualTo(left.extension());
  }
}

std::vector<Compared> compare(const Installation& left, const Installation& right) {
  std::vector<Compared> result;
  Entries taken;
  for (const Entry& entry : left.entries()) {
    if (counts(left, entry)) {
      const Entry* const partner = right.byOid(entry.kind(), entry.kept->object->oidInPlace());
      result.push_back({entry.kind(), Comparison::kOnlyLeft, &entry, partner});
      taken.insert(partner);
    }
  }
  for (Compared& pair : result) {
    if (pair.right == nullptr && pair.kind != Kind::kVendorExtension) {
      pair.right = partnerByName(right, taken, *pair.left);
      taken.insert(pair.right);
    }
    if (pair.right != nullptr) {
      pair = pairOf(pair.left, pair.right);
    }
  }
  for (const Entry& entry : right.entries()) {
    if (counts(right, entry) && taken.count(&entry) == 0) {
      result.push_back({entry.kind(), Comparison::kOnlyRight, nullptr, &entry});
    }
  }
  return result;
}

}  // namespace migration
