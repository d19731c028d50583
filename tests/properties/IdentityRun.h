#pragma once

#include <chrono>
#include <string>

namespace vantrell::properties {

/// Plays random scenarios in that folder for that long, and fails the current test at the first
/// that breaks a promise. Prints its first seed; VANTRELL_SEED plays one scenario again.
void documentsKeepTheirIdentity(const std::string& parent, std::chrono::seconds duration);

}  // namespace vantrell::properties
