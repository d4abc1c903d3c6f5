#pragma once

#include <optional>
#include <string_view>
#include <utility>
#include <vector>

#include "calling/value_forms.hpp"

namespace talutil::calling {

/// What a line asks for, and what it answered when it was recorded. Parts of the line are kept as its bytes, so the
/// line must outlive it.
struct Request {
  std::string_view id;  ///< Empty if there is none.
  std::optional<Text> call;
  std::optional<Text> create;
  std::optional<std::int32_t> release;
  std::optional<std::int32_t> on;  ///< The object; by default the toolkit.
  std::vector<Argument> arguments;
  std::vector<std::pair<Text, Variant>> settings;

  void clear();
};

/// Reads a request. Fails with JsonError for anything that is not one; whatever was read by then, such as the id, stays
/// in it. Raises the errors of converting the elements of lists.
void read_request(JsonReader& json, const ObjectNumbers& objects, const Locale& locale, Request& request);

}  // namespace talutil::calling
