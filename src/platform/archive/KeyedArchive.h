#pragma once

#include <initializer_list>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndDate.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndNumber.h"

namespace vantrell {

/// What an archived object may be, for the reader to say which it accepts.
enum class ArchiveClass : std::uint8_t {
  Null,
  Number,
  String,
  Date,
  Data,
  List,
  Dictionary,
  Record
};

/// "FndNumber", "FndArray", …: the class names as archives and messages spell them.
std::string_view archiveClassName(ArchiveClass archiveClass);

/// An object of a keyed archive: a tree of values. Strings, data and containers are shared by
/// copies.
///
/// Threads: a value; what copies share is never written to.
class ArchiveValue {
 public:
  using List = std::vector<ArchiveValue>;
  using Dictionary = std::map<std::string, ArchiveValue, std::less<>>;
  /// An instance of a class of our own: its class name and its coded fields.
  struct Record {
    std::string className;
    Dictionary fields;
    bool operator==(const Record&) const;
  };

  ArchiveValue() = default;  ///< null
  explicit ArchiveValue(FndNumber value) : _value(std::move(value)) {}
  explicit ArchiveValue(FndDate value) : _value(value) {}
  explicit ArchiveValue(std::string value)
      : _value(std::make_shared<const std::string>(std::move(value))) {}
  explicit ArchiveValue(FndData value)
      : _value(std::make_shared<const FndData>(std::move(value))) {}
  explicit ArchiveValue(List value) : _value(std::make_shared<const List>(std::move(value))) {}
  explicit ArchiveValue(Dictionary value)
      : _value(std::make_shared<const Dictionary>(std::move(value))) {}
  explicit ArchiveValue(Record value) : _value(std::make_shared<const Record>(std::move(value))) {}

  ArchiveClass archiveClass() const;
  /// A record's own class name, else the name of `archiveClass()`.
  std::string className() const;

  /// Null when the value is of another class. The value keeps what is pointed to.
  const FndNumber* number() const { return std::get_if<FndNumber>(&_value); }
  const FndDate* date() const { return std::get_if<FndDate>(&_value); }
  const std::string* string() const { return pointee<std::string>(); }
  const FndData* data() const { return pointee<FndData>(); }
  const List* list() const { return pointee<List>(); }
  const Dictionary* dictionary() const { return pointee<Dictionary>(); }
  const Record* record() const { return pointee<Record>(); }

  /// For log lines: the value's text, its count for containers and data.
  std::string description() const;

  /// Deep equality.
  friend bool operator==(const ArchiveValue& a, const ArchiveValue& b);

 private:
  template <class T>
  const T* pointee() const {
    const auto* shared = std::get_if<std::shared_ptr<const T>>(&_value);
    return shared == nullptr ? nullptr : shared->get();
  }

  std::variant<std::monostate, FndNumber, FndDate, std::shared_ptr<const std::string>,
               std::shared_ptr<const FndData>, std::shared_ptr<const List>,
               std::shared_ptr<const Dictionary>, std::shared_ptr<const Record>>
      _value;
};

/// The keyed archive of `root`, in its compact (binary property list) form. The same value gives
/// the same bytes. Errors: as `binaryPropertyListFromValue`, and DamagedData for a record whose
/// class name is one of `archiveClassName`.
Result<FndData> archivedDataWithRootObject(const ArchiveValue& root);

/// Decodes a keyed archive that anybody may have written, and only when every object in it is
/// of one of `allowed`. An archive in which an object holds itself is damaged; one that shares
/// objects so that its tree would be larger than a fixed multiple of its bytes is refused.
/// Errors: DamagedData with what is wrong; its userInfo holds "expected" and "actual", class
/// names, when the class was the reason.
Result<ArchiveValue> unarchivedObjectOfClasses(FndDataView bytes,
                                               std::initializer_list<ArchiveClass> allowed);

}  // namespace vantrell
