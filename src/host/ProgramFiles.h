#pragma once

#include <string>

namespace vantrell::host {

// What comes with the program is looked for where an installation has it, counted from the
// program itself so that the whole can be moved; else in the tree that it was built in.

/// The extension's module. The environment variable VANTRELL_MODULE names another one.
std::string extensionModulePath();

/// The folder with the package declarations.
std::string packageTypeFolder();

}  // namespace vantrell::host
