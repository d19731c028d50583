#include "cli/Reporter.h"

#include <cstdio>

#include "cli/Json.h"
#include "platform/foundation/FndURL.h"

namespace vantrell::cli {
namespace {

// There is nobody left to tell when standard error fails too.
void tell(const std::string& text) { std::fputs(text.c_str(), stderr); }

}  // namespace

void Reporter::error(std::string_view subject, const FndError& error) const {
  if (_asJson) return tell(lineOf(recordOfError(error)));
  const std::string prefix = subject.empty() ? "" : displayText(subject) + ": ";
  tell("vantrell: " + prefix + displayText(error.description()) + "\n");
}

void Reporter::warning(const std::string& text) const {
  if (_asJson) return tell(lineOf(Json{{"warning", text}}));
  tell("vantrell: warning: " + displayText(text) + "\n");
}

void Reporter::wrongUsage(const std::string& reason) const {
  if (_asJson) {
    return tell(
        lineOf(recordOfError(FndError::vantrell(VantrellErrorCode::InvalidArgument, reason))));
  }
  tell("vantrell: " + displayText(reason) + "\nTry: vantrell --help\n");
}

}  // namespace vantrell::cli
