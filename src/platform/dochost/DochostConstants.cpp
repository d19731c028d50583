#include "platform/dochost/DochostConstants.h"

namespace vantrell {
namespace {

FndData bytesOf(std::string_view text) { return FndData(text.begin(), text.end()); }

}  // namespace

const FndData& dochostInitialPageSortedByName() {
  static const FndData kPage = bytesOf("DochostInitialPageSortedByName");
  return kPage;
}

const FndData& dochostInitialPageSortedByDate() {
  static const FndData kPage = bytesOf("DochostInitialPageSortedByDate");
  return kPage;
}

}  // namespace vantrell
