#include <string>
#include <unordered_map>
#include <utility>

#include "platform/archive/KeyedArchive.h"
#include "platform/archive/KeyedArchiveFormat.h"
#include "platform/archive/PropertyList.h"
#include "platform/archive/TreeMeasure.h"

namespace vantrell {
namespace {

using namespace keyedarchive;

struct ArchiveShape {
  static const void* container(const ArchiveValue& value) {
    if (value.list() != nullptr) return value.list();
    if (value.dictionary() != nullptr) return value.dictionary();
    return value.record();
  }

  template <class Each>
  static void forEachChild(const ArchiveValue& value, const Each& each) {
    if (const auto* list = value.list()) {
      for (const ArchiveValue& element : *list) {
        if (!each(element)) return;
      }
      return;
    }
    const auto* fields = value.dictionary();
    if (const auto* record = value.record()) fields = &record->fields;
    if (fields == nullptr) return;
    for (const auto& [key, element] : *fields) {
      if (!each(element)) return;
    }
  }
};

std::unexpected<FndError> refused(std::string why) {
  return std::unexpected(FndError::vantrell(VantrellErrorCode::DamagedData,
                                            "This cannot be archived: " + std::move(why) + "."));
}

class Archiver {
 public:
  Result<FndData> archive(const ArchiveValue& root) {
    if (!TreeMeasure<ArchiveValue, ArchiveShape>().fits(root)) {
      return refused("it is nested too deep or has too many values");
    }
    const auto top = add(root);
    if (!top) return std::unexpected(top.error());
    PropertyListValue::Dictionary archive;
    archive.emplace(kVersionKey, FndNumber(kVersion));
    archive.emplace(kArchiverKey, std::string(kArchiver));
    archive.emplace(kTopKey, PropertyListValue::Dictionary{{std::string(kRootKey), *top}});
    archive.emplace(kObjectsKey, std::move(_objects));
    return binaryPropertyListFromValue(PropertyListValue(std::move(archive)));
  }

 private:
  using Fields = PropertyListValue::Dictionary;

  // These give the UID of the object.
  Result<PropertyListValue> add(const ArchiveValue& value) {
    switch (value.archiveClass()) {
      case ArchiveClass::Null:
        return uid(0);
      case ArchiveClass::Number:
        return addNumber(*value.number());
      case ArchiveClass::String:
        return addString(*value.string());
      case ArchiveClass::Date:
        return addDate(*value.date());
      case ArchiveClass::Data:
        return addData(*value.data());
      case ArchiveClass::List:
        return addList(*value.list());
      case ArchiveClass::Dictionary:
        return addDictionary(*value.dictionary());
      case ArchiveClass::Record:
        return addRecord(*value.record());
    }
    return refused("a value of an unknown class");
  }

  static PropertyListValue uid(std::size_t index) {
    return PropertyListValue(PropertyListUID{static_cast<std::uint32_t>(index)});
  }

  // The kind keeps a number apart from the string that spells it.
  PropertyListValue shared(char kind, std::string_view bytes, const PropertyListValue& object) {
    if (bytes.size() > kLongestShared) return append(object);
    const auto [known, isNew] = _shared.try_emplace(kind + std::string(bytes), _objects.size());
    return isNew ? append(object) : uid(known->second);
  }

  PropertyListValue append(PropertyListValue object) {
    _objects.push_back(std::move(object));
    return uid(_objects.size() - 1);
  }

  PropertyListValue addNumber(const FndNumber& number) {
    const char kind = number.isBool() ? 'b' : number.isReal() ? 'r' : 'i';
    return shared(kind, number.description(), PropertyListValue(number));
  }

  PropertyListValue addString(const std::string& text) {
    return shared('s', text, PropertyListValue(text));
  }

  PropertyListValue addData(const FndData& data) {
    return shared('d', std::string(data.begin(), data.end()), PropertyListValue(data));
  }

  Result<PropertyListValue> addDate(const FndDate& date) {
    const double seconds = date.secondsSinceReferenceDate();
    if (!FndDate::fromSecondsSinceReferenceDate(seconds)) return refused("a date is too far away");
    const FndNumber time(seconds);
    const auto [known, isNew] = _shared.try_emplace('t' + time.description(), _objects.size());
    if (!isNew) return uid(known->second);
    const std::size_t index = reserve();
    return fill(index, archiveClassName(ArchiveClass::Date),
                {{std::string(kTimeKey), PropertyListValue(time)}});
  }

  Result<PropertyListValue> addList(const ArchiveValue::List& list) {
    const std::size_t index = reserve();
    PropertyListValue::Array elements;
    elements.reserve(list.size());
    for (const ArchiveValue& element : list) {
      auto added = add(element);
      if (!added) return added;
      elements.push_back(std::move(*added));
    }
    return fill(index, archiveClassName(ArchiveClass::List),
                {{std::string(kElementsKey), PropertyListValue(std::move(elements))}});
  }

  Result<PropertyListValue> addDictionary(const ArchiveValue::Dictionary& dictionary) {
    const std::size_t index = reserve();
    PropertyListValue::Array keys;
    PropertyListValue::Array elements;
    for (const auto& [key, element] : dictionary) {
      keys.push_back(addString(key));
      auto added = add(element);
      if (!added) return added;
      elements.push_back(std::move(*added));
    }
    return fill(index, archiveClassName(ArchiveClass::Dictionary),
                {{std::string(kKeysKey), PropertyListValue(std::move(keys))},
                 {std::string(kElementsKey), PropertyListValue(std::move(elements))}});
  }

  Result<PropertyListValue> addRecord(const ArchiveValue::Record& record) {
    if (isReservedClassName(record.className)) {
      return refused("a record has the class name " + record.className);
    }
    const std::size_t index = reserve();
    Fields fields;
    for (const auto& [name, value] : record.fields) {
      auto added = add(value);
      if (!added) return added;
      fields.emplace(name.starts_with('$') ? '$' + name : name, std::move(*added));
    }
    return fill(index, record.className, std::move(fields));
  }

  // Takes the place of an object whose content is not known yet.
  std::size_t reserve() {
    _objects.emplace_back(std::string(kNull));
    return _objects.size() - 1;
  }

  PropertyListValue fill(std::size_t index, std::string_view className, Fields fields) {
    fields.emplace(kClassKey, classNamed(className));
    _objects[index] = PropertyListValue(std::move(fields));
    return uid(index);
  }

  PropertyListValue classNamed(std::string_view name) {
    const auto [known, isNew] = _classes.try_emplace(std::string(name), _objects.size());
    if (!isNew) return uid(known->second);
    Fields fields;
    fields.emplace(kClassNameKey, std::string(name));
    fields.emplace(kClassesKey,
                   PropertyListValue::Array{PropertyListValue(std::string(name)),
                                            PropertyListValue(std::string(kBaseClass))});
    return append(PropertyListValue(std::move(fields)));
  }

  PropertyListValue::Array _objects = {PropertyListValue(std::string(kNull))};
  std::unordered_map<std::string, std::size_t> _shared;
  std::unordered_map<std::string, std::size_t> _classes;
};

}  // namespace

Result<FndData> archivedDataWithRootObject(const ArchiveValue& root) {
  return Archiver().archive(root);
}

}  // namespace vantrell
