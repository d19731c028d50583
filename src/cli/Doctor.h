#pragma once

#include <memory>

#include "cli/Json.h"
#include "host/EmbeddedHost.h"

namespace vantrell::cli {

/// What is recorded, where, by which means, and what is wrong. Without a host, only the places.
Json doctorReport(const host::HostPlaces& places,
                  const Result<std::unique_ptr<host::EmbeddedHost>>& host);

}  // namespace vantrell::cli
