#include "talutil_c.h"

#include <cstdlib>
#include <cstring>
#include <memory>

#include "capi/handle.hpp"
#include "capi/texts.hpp"
#include "library/version.hpp"

using namespace talutil;

namespace talutil::capi {

char* new_text(std::string_view bytes) noexcept {
  auto* const text = static_cast<char*>(std::malloc(bytes.size() + 1));
  if (text == nullptr) return nullptr;
  std::memcpy(text, bytes.data(), bytes.size());
  text[bytes.size()] = '\0';
  return text;
}

namespace {

/// The thread's last failure to open a library, which has no handle to keep it.
thread_local std::string open_failure;

/// Reads the options of talutil_open.
std::uint32_t code_page_of(const char* options) {
  if (options == nullptr) return posix::chosen_code_page();
  calling::JsonReader json(options);
  std::uint32_t code_page = posix::chosen_code_page();
  Text key;
  json.begin_object();
  while (json.next_key(key)) {
    if (key != u"code_page") json.fail("\"code_page\", the only option, before this");
    const std::string digits(json.read_number());
    char* end = nullptr;
    const unsigned long number = std::strtoul(digits.c_str(), &end, 10);
    if (*end != '\0' || number > UINT32_MAX) json.fail("the number of a code page before this");
    code_page = static_cast<std::uint32_t>(number);
  }
  json.end();
  return code_page;
}

}  // namespace

}  // namespace talutil::capi

extern "C" {

talutil_library* talutil_open(const char* options) {
  try {
    capi::open_failure.clear();
    return std::make_unique<talutil_library>(capi::code_page_of(options)).release();
  } catch (const calling::JsonError& error) {
    capi::open_failure = std::string("the options: ") + error.what();
  } catch (const std::exception& error) {
    capi::open_failure = error.what();
  }
  return nullptr;
}

const char* talutil_open_failure(void) { return capi::open_failure.c_str(); }

char* talutil_call(talutil_library* library, const char* request) {
  if (library == nullptr) return nullptr;
  try {
    std::string answer;
    library->caller.answer(request == nullptr ? "" : request, 1, answer);
    return capi::new_text(answer);
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

void talutil_free(char* text) { std::free(text); }

void talutil_close(talutil_library* library) { delete library; }

const char* talutil_description(const talutil_library* library) {
  return library == nullptr ? "" : library->description.c_str();
}

const char* talutil_version(void) { return version_text; }
}
