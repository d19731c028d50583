#include "platform/archive/KeyedArchive.h"

#include "platform/archive/KeyedArchiveFormat.h"

namespace vantrell {
namespace {

// Null pointers are values of another class.
template <class T>
bool equalPointees(const T* a, const T* b) {
  if (a == b) return true;
  return a != nullptr && b != nullptr && *a == *b;
}

std::string counted(std::string_view what, std::size_t count) {
  return std::string(what) + " of " + std::to_string(count);
}

}  // namespace

std::string_view archiveClassName(ArchiveClass archiveClass) {
  switch (archiveClass) {
    case ArchiveClass::Null:
      return "FndNull";
    case ArchiveClass::Number:
      return "FndNumber";
    case ArchiveClass::String:
      return "FndString";
    case ArchiveClass::Date:
      return "FndDate";
    case ArchiveClass::Data:
      return "FndData";
    case ArchiveClass::List:
      return "FndArray";
    case ArchiveClass::Dictionary:
      return "FndDictionary";
    case ArchiveClass::Record:
      return "FndObject";
  }
  return {};
}

bool keyedarchive::isReservedClassName(std::string_view name) {
  for (int i = 0; i <= static_cast<int>(ArchiveClass::Record); ++i) {
    if (name == archiveClassName(static_cast<ArchiveClass>(i))) return true;
  }
  return false;
}

bool ArchiveValue::Record::operator==(const Record& other) const {
  return className == other.className && fields == other.fields;
}

ArchiveClass ArchiveValue::archiveClass() const {
  if (number() != nullptr) return ArchiveClass::Number;
  if (string() != nullptr) return ArchiveClass::String;
  if (date() != nullptr) return ArchiveClass::Date;
  if (data() != nullptr) return ArchiveClass::Data;
  if (list() != nullptr) return ArchiveClass::List;
  if (dictionary() != nullptr) return ArchiveClass::Dictionary;
  if (record() != nullptr) return ArchiveClass::Record;
  return ArchiveClass::Null;
}

std::string ArchiveValue::className() const {
  if (record() != nullptr) return record()->className;
  return std::string(archiveClassName(archiveClass()));
}

std::string ArchiveValue::description() const {
  if (number() != nullptr) return number()->description();
  if (string() != nullptr) return *string();
  if (date() != nullptr) return date()->description();
  if (data() != nullptr) return counted(className(), data()->size());
  if (list() != nullptr) return counted(className(), list()->size());
  if (dictionary() != nullptr) return counted(className(), dictionary()->size());
  if (record() != nullptr) return counted(className(), record()->fields.size());
  return "null";
}

bool operator==(const ArchiveValue& a, const ArchiveValue& b) {
  return a.archiveClass() == b.archiveClass() && equalPointees(a.number(), b.number()) &&
         equalPointees(a.string(), b.string()) && equalPointees(a.date(), b.date()) &&
         equalPointees(a.data(), b.data()) && equalPointees(a.list(), b.list()) &&
         equalPointees(a.dictionary(), b.dictionary()) && equalPointees(a.record(), b.record());
}

}  // namespace vantrell
