#pragma once

#include <string>
#include <string_view>

namespace vantrell {

/// The symbolic name of an errno value, "ENOENT" for instance; empty for one that has none here.
std::string_view posixErrorName(int osError);

/// What the system says of an errno value: "No such file or directory".
std::string posixErrorText(int osError);

/// Name and text, as log lines print an errno value: "ENOENT: No such file or directory".
std::string posixErrorDescription(int osError);

}  // namespace vantrell
