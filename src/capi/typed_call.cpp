#include "capi/typed_call.hpp"

#include <array>

#include "automation/late_call.hpp"
#include "automation/run_time_error.hpp"
#include "capi/handle.hpp"
#include "capi/texts.hpp"
#include "library/interface_table.hpp"

namespace talutil::capi {

namespace {

/// UTF-8 as a text. Raises 5 for anything else, rather than changing it silently.
Text text_of(const char* bytes) {
  const std::string_view given = bytes == nullptr ? "" : bytes;
  Text text = from_utf8(given);
  // U+FFFD stands for what is not UTF-8, unless it was there before.
  if (text.find(u'\uFFFD') != Text::npos && to_utf8(text) != given) {
    throw RunTimeError(ErrorNumber::invalid_procedure_call, u"A text is not UTF-8: \"" + text + u"\"");
  }
  return text;
}

Variant variant_of(const Given& given) {
  return std::visit(
      []<class T>(T value) -> Variant {
        if constexpr (std::is_same_v<T, const char*>)
          return text_of(value);
        else if constexpr (std::is_same_v<T, bool>)
          return Boolean(value);
        else
          return value;
      },
      given);
}

void clear(const Place& place) noexcept {
  if (auto* const* const text = std::get_if<char**>(&place); text != nullptr && *text != nullptr) **text = nullptr;
}

/// Converts the value to the type of the place, which is the one that the interface declares.
void store(const Place& place, const Variant& value, const Locale& locale) {
  std::visit(
      [&]<class P>(P target) {
        if constexpr (!std::is_same_v<P, std::monostate>) {
          if (target == nullptr) return;
          if constexpr (std::is_same_v<P, bool*>) {
            *target = bool(convert<Boolean>(value, locale));
          } else if constexpr (std::is_same_v<P, char**>) {
            *target = new_text(to_utf8(up_to_nul(convert<Text>(value, locale))));
            if (*target == nullptr) throw std::bad_alloc();
          } else {
            *target = convert<std::remove_pointer_t<P>>(value, locale);
          }
        }
      },
      place);
}

std::int32_t run(talutil_library& library, std::int32_t slot, std::initializer_list<Given> given,
                 std::initializer_list<After> written_back, const Place& result) {
  const Locale locale = library.library.locale();
  std::array<Argument, most_parameters> all;
  std::size_t count = 0;
  for (const Given& argument : given) all[count++].value = variant_of(argument);
  const auto store_arguments = [&] {
    for (const After& after : written_back) store(after.place, all[after.argument].value, locale);
  };
  try {
    const Variant answer = late_interface<ORVUtils>().call(&library.utils, slot, std::span(all).first(count), locale);
    store_arguments();
    store(result, answer, locale);
    return 0;
  } catch (...) {
    store_arguments();
    throw;
  }
}

}  // namespace

std::int32_t call(talutil_library* library, std::int32_t slot, std::initializer_list<Given> given,
                  std::initializer_list<After> written_back, Place result) noexcept {
  clear(result);
  for (const After& after : written_back) clear(after.place);
  if (library == nullptr) return static_cast<std::int32_t>(ErrorNumber::object_variable_not_set);
  try {
    return run(*library, slot, given, written_back, result);
  } catch (...) {
    const RunTimeError error = current_error();
    try {
      library->description = error.what();
    } catch (...) {
      library->description.clear();  // There is not enough memory for it; the number says so.
    }
    return error.number();
  }
}

}  // namespace talutil::capi
