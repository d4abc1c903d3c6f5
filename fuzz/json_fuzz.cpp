// Checks that whatever is read as a value in JSON is written so that it reads back as the same, and that a line of any
// bytes is answered by a line of JSON. Build with clang and run:
//   json_fuzz -max_len=512 -max_total_time=60

#include <cstdint>

#include "automation/run_time_error.hpp"
#include "calling/caller.hpp"
#include "fuzz/host.hpp"
#include "fuzz/input.hpp"

namespace talutil::calling {
namespace {

using fuzz::require;

void check_value(std::string_view bytes) {
  NumberedObjects objects;
  Variant value;
  try {
    JsonReader json(bytes);
    value = read_value(json, objects, plain_numbers);
    json.end();
  } catch (const JsonError&) {
    return;
  } catch (const RunTimeError&) {
    return;
  }
  std::string written;
  append_value(written, value, objects);
  JsonReader json(written);
  std::string again;
  append_value(again, read_value(json, objects, plain_numbers), objects);
  json.end();
  require(written == again, "a value is written so that it reads back as the same");
}

/// The line may not name a member, since some of them write files.
void check_answer(Library& library, std::string_view line) {
  Caller caller(library);
  std::string answer;
  if (line.find("call") != std::string_view::npos || line.find('\\') != std::string_view::npos) return;
  caller.answer(line, 1, answer);
  JsonReader json(answer);
  json.skip_value();
  json.end();
}

}  // namespace
}  // namespace talutil::calling

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  static talutil::fuzz::Host host;
  const std::string_view bytes(reinterpret_cast<const char*>(data), size);
  talutil::calling::check_value(bytes);
  talutil::calling::check_answer(host.utils().library(), bytes);
  return 0;
}
