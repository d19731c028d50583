#include <algorithm>
#include <utility>

#include "platform/archive/KeyedArchive.h"
#include "platform/archive/KeyedArchiveFormat.h"
#include "platform/archive/PropertyList.h"
#include "platform/archive/TreeMeasure.h"

namespace vantrell {
namespace {

using namespace keyedarchive;

// How much more an archive may unfold to than it has bytes: in values, each counted wherever it
// stands, and in bytes that are copied out of it. In our own an element takes a byte at least, an
// entry of a dictionary two and what is beyond 64 bytes of its key: they stay below it.
constexpr std::uint64_t kUnfoldedPerByte = 64;

// What an entry of a dictionary costs in memory beside its key, nearly.
constexpr std::size_t kEntrySize = 2 * sizeof(ArchiveValue);

std::unexpected<FndError> damaged(std::string_view what) {
  return std::unexpected(FndError::vantrell(VantrellErrorCode::DamagedData,
                                            "The archive is damaged: " + std::string(what) + "."));
}

std::unexpected<FndError> damagedObject(std::string_view what, std::uint32_t index) {
  return damaged(std::string(what) + " (object " + std::to_string(index) + ")");
}

const PropertyListValue* field(const PropertyListValue::Dictionary& fields, std::string_view key) {
  const auto found = fields.find(key);
  return found == fields.end() ? nullptr : &found->second;
}

const std::string* stringField(const PropertyListValue::Dictionary& fields, std::string_view key) {
  const PropertyListValue* value = field(fields, key);
  return value == nullptr ? nullptr : value->string();
}

const PropertyListValue::Array* arrayField(const PropertyListValue::Dictionary& fields,
                                           std::string_view key) {
  const PropertyListValue* value = field(fields, key);
  return value == nullptr ? nullptr : value->array();
}

// Reads what the root leads to, each object once; an object that stands in many places is shared.
class Unarchiver {
 public:
  Unarchiver(const PropertyListValue::Array& objects, std::size_t archiveSize,
             std::initializer_list<ArchiveClass> allowed)
      : _objects(objects),
        _allowed(allowed),
        _limit(archiveSize * kUnfoldedPerByte),
        _copiesLeft(_limit),
        _slots(objects.size()) {}

  Result<ArchiveValue> root(PropertyListUID uid) {
    const auto slot = object(uid, 0);
    if (!slot) return std::unexpected(slot.error());
    return (*slot)->value;
  }

 private:
  // What is known of one object.
  struct Slot {
    ArchiveValue value;
    std::uint64_t unfolded = 0;  // values in it, itself included; 0 while it has not been read
    std::size_t height = 0;      // of containers in it, itself included
    bool isOpen = false;         // it is being read: to meet it again is a cycle
  };

  using Value = Result<ArchiveValue>;
  using Fields = PropertyListValue::Dictionary;

  Result<const Slot*> object(PropertyListUID uid, std::size_t depth) {
    const std::uint32_t index = uid.value;
    if (index >= _objects.size()) return damagedObject("a reference to no object", index);
    Slot& slot = _slots[index];
    if (slot.unfolded != 0) return &slot;
    if (slot.isOpen) return damagedObject("an object holds itself", index);
    slot.isOpen = true;
    Slot read;
    read.unfolded = 1;
    auto value = index == 0 ? null() : decode(index, depth, read);
    if (!value) return std::unexpected(std::move(value.error()));
    read.value = std::move(*value);
    slot = std::move(read);
    return &slot;
  }

  Value null() const {
    if (auto allowed = require(ArchiveClass::Null); !allowed) {
      return std::unexpected(std::move(allowed.error()));
    }
    return ArchiveValue();
  }

  // `slot` learns of what a container holds.
  Value decode(std::uint32_t index, std::size_t depth, Slot& slot) {
    const PropertyListValue& object = _objects[index];
    if (object.dictionary() == nullptr) return plain(object, index);
    const Fields& fields = *object.dictionary();
    const auto name = className(fields, index);
    if (!name) return std::unexpected(name.error());
    if (**name == archiveClassName(ArchiveClass::Date)) return date(fields, index);
    if (depth >= kDeepestNesting) return damagedObject("it is nested too deep", index);
    if (**name == archiveClassName(ArchiveClass::List)) return list(fields, index, depth, slot);
    if (**name == archiveClassName(ArchiveClass::Dictionary)) {
      return dictionary(fields, index, depth, slot);
    }
    if (isReservedClassName(**name)) return damagedObject("an instance that is no record", index);
    return record(**name, fields, depth, slot);
  }

  Value plain(const PropertyListValue& object, std::uint32_t index) {
    ArchiveValue value;
    if (const auto* number = object.number()) {
      value = ArchiveValue(*number);
    } else if (const auto* moment = object.date()) {
      value = ArchiveValue(*moment);
    } else if (const auto* text = object.string()) {
      if (!copy(text->size())) return unfoldsTooFar();
      value = ArchiveValue(*text);
    } else if (const auto* bytes = object.data()) {
      if (!copy(bytes->size())) return unfoldsTooFar();
      value = ArchiveValue(*bytes);
    } else {
      return damagedObject("an object without a class", index);
    }
    if (auto allowed = require(value.archiveClass()); !allowed) {
      return std::unexpected(std::move(allowed.error()));
    }
    return value;
  }

  Result<const std::string*> className(const Fields& fields, std::uint32_t index) const {
    const PropertyListValue* reference = field(fields, kClassKey);
    if (reference == nullptr || reference->uid() == nullptr ||
        reference->uid()->value >= _objects.size()) {
      return damagedObject("an object without a class", index);
    }
    const auto* definition = _objects[reference->uid()->value].dictionary();
    if (definition == nullptr || arrayField(*definition, kClassesKey) == nullptr ||
        stringField(*definition, kClassNameKey) == nullptr) {
      return damagedObject("a class without a name", index);
    }
    return stringField(*definition, kClassNameKey);
  }

  Value date(const Fields& fields, std::uint32_t index) const {
    if (auto allowed = require(ArchiveClass::Date); !allowed) {
      return std::unexpected(std::move(allowed.error()));
    }
    const PropertyListValue* time = field(fields, kTimeKey);
    if (time == nullptr || time->number() == nullptr || time->number()->isBool()) {
      return damagedObject("a date without its time", index);
    }
    const auto moment = FndDate::fromSecondsSinceReferenceDate(time->number()->doubleValue());
    if (!moment) return damagedObject("a date that is no moment", index);
    return ArchiveValue(*moment);
  }

  Value list(const Fields& fields, std::uint32_t index, std::size_t depth, Slot& slot) {
    if (auto allowed = require(ArchiveClass::List); !allowed) {
      return std::unexpected(std::move(allowed.error()));
    }
    const auto* elements = arrayField(fields, kElementsKey);
    if (elements == nullptr) return damagedObject("a list without its elements", index);
    if (!copy(elements->size() * sizeof(ArchiveValue))) return unfoldsTooFar();
    ArchiveValue::List result;
    result.reserve(elements->size());
    for (const PropertyListValue& element : *elements) {
      auto value = held(element, index, depth, slot);
      if (!value) return value;
      result.push_back(std::move(*value));
    }
    ++slot.height;
    return ArchiveValue(std::move(result));
  }

  Value dictionary(const Fields& fields, std::uint32_t index, std::size_t depth, Slot& slot) {
    if (auto allowed = require(ArchiveClass::Dictionary); !allowed) {
      return std::unexpected(std::move(allowed.error()));
    }
    const auto* keys = arrayField(fields, kKeysKey);
    const auto* elements = arrayField(fields, kElementsKey);
    if (keys == nullptr || elements == nullptr || keys->size() != elements->size()) {
      return damagedObject("a dictionary without as many keys as elements", index);
    }
    ArchiveValue::Dictionary result;
    for (std::size_t i = 0; i < keys->size(); ++i) {
      const std::string* key = keyAt((*keys)[i]);
      if (key == nullptr) return damagedObject("a key that is no string", index);
      if (!copy(key->size() + kEntrySize)) return unfoldsTooFar();
      auto value = held((*elements)[i], index, depth, slot);
      if (!value) return value;
      if (!result.emplace(*key, std::move(*value)).second) {
        return damagedObject("a key that stands twice", index);
      }
    }
    ++slot.height;
    return ArchiveValue(std::move(result));
  }

  const std::string* keyAt(const PropertyListValue& reference) const {
    const PropertyListUID* uid = reference.uid();
    if (uid == nullptr || uid->value == 0 || uid->value >= _objects.size()) return nullptr;
    return _objects[uid->value].string();
  }

  Value record(const std::string& name, const Fields& fields, std::size_t depth, Slot& slot) {
    if (auto allowed = require(ArchiveClass::Record, name); !allowed) {
      return std::unexpected(std::move(allowed.error()));
    }
    if (!copy(name.size())) return unfoldsTooFar();
    ArchiveValue::Record result{name, {}};
    for (const auto& [key, object] : fields) {
      if (key == kClassKey) continue;
      if (!copy(key.size() + kEntrySize)) return unfoldsTooFar();
      auto value =
          object.uid() == nullptr ? plainField(object, slot) : held(object, 0, depth, slot);
      if (!value) return value;
      result.fields.emplace(key.starts_with("$$") ? key.substr(1) : key, std::move(*value));
    }
    ++slot.height;
    return ArchiveValue(std::move(result));
  }

  Value plainField(const PropertyListValue& object, Slot& slot) {
    ++slot.unfolded;
    return plain(object, 0);
  }

  // The object that `reference` names, as an element of the container that `slot` stands for.
  Value held(const PropertyListValue& reference, std::uint32_t index, std::size_t depth,
             Slot& slot) {
    if (reference.uid() == nullptr) return damagedObject("an element that is no reference", index);
    const auto element = object(*reference.uid(), depth + 1);
    if (!element) return std::unexpected(element.error());
    slot.unfolded += (*element)->unfolded;
    if (slot.unfolded > _limit) return unfoldsTooFar();
    // Checked from below as well: a shared object may stand deeper than where it was read.
    slot.height = std::max(slot.height, (*element)->height);
    if (slot.height >= kDeepestNesting) return damagedObject("it is nested too deep", index);
    return (*element)->value;
  }

  // False when more has been copied out of the archive than its size allows.
  bool copy(std::size_t amount) {
    if (amount > _copiesLeft) return false;
    _copiesLeft -= amount;
    return true;
  }

  static std::unexpected<FndError> unfoldsTooFar() {
    return damaged("what it shares would unfold to far more than its size");
  }

  Result<void> require(ArchiveClass found, std::string_view name = {}) const {
    if (std::find(_allowed.begin(), _allowed.end(), found) != _allowed.end()) return {};
    std::string expected;
    for (const ArchiveClass archiveClass : _allowed) {
      if (!expected.empty()) expected += ", ";
      expected += archiveClassName(archiveClass);
    }
    std::string actual(name.empty() ? archiveClassName(found) : name);
    std::string message =
        "The archive holds an object of class " + actual + ", not of " + expected + ".";
    return std::unexpected(FndError(kVantrellErrorDomain,
                                    static_cast<std::int64_t>(VantrellErrorCode::DamagedData),
                                    {{"message", std::any(std::move(message))},
                                     {"expected", std::any(std::move(expected))},
                                     {"actual", std::any(std::move(actual))}}));
  }

  const PropertyListValue::Array& _objects;
  const std::initializer_list<ArchiveClass> _allowed;
  const std::uint64_t _limit;
  std::uint64_t _copiesLeft;
  std::vector<Slot> _slots;
};

// The objects of an archive and the place of its root.
struct Envelope {
  const PropertyListValue::Array* objects;
  PropertyListUID root;
};

Result<Envelope> envelope(const PropertyListValue& archive) {
  const auto* fields = archive.dictionary();
  if (fields == nullptr) return damaged("it is no dictionary");
  const PropertyListValue* version = field(*fields, kVersionKey);
  if (version == nullptr || version->number() == nullptr ||
      version->number()->exactUInt64() != kVersion) {
    return damaged("it is of another version");
  }
  if (stringField(*fields, kArchiverKey) == nullptr) return damaged("it names no archiver");
  const auto* objects = arrayField(*fields, kObjectsKey);
  if (objects == nullptr || objects->empty() || objects->front().string() == nullptr ||
      *objects->front().string() != kNull) {
    return damaged("it has no objects");
  }
  const PropertyListValue* top = field(*fields, kTopKey);
  const auto* topFields = top == nullptr ? nullptr : top->dictionary();
  const PropertyListValue* root = topFields == nullptr ? nullptr : field(*topFields, kRootKey);
  if (root == nullptr || root->uid() == nullptr) return damaged("it has no root");
  return Envelope{objects, *root->uid()};
}

}  // namespace

Result<ArchiveValue> unarchivedObjectOfClasses(FndDataView bytes,
                                               std::initializer_list<ArchiveClass> allowed) {
  const auto archive = valueFromBinaryPropertyList(bytes);
  if (!archive) return std::unexpected(archive.error());
  const auto found = envelope(*archive);
  if (!found) return std::unexpected(found.error());
  return Unarchiver(*found->objects, bytes.size(), allowed).root(found->root);
}

}  // namespace vantrell
