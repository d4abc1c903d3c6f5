#pragma once

#include <string>

namespace talutil::cli {

/// Describes a class or a member as a JSON object on a line; with an empty name, every member of every class.
void help_json(const std::string& name);

}  // namespace talutil::cli
