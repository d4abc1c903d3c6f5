#pragma once

#include <utility>

#include "archives/archive_error.hpp"
#include "automation/run_time_error.hpp"
#include "automation/text.hpp"

namespace talutil::archives {

/// Runs file operations. Errors of the platform become the given code, except that a full disk becomes cannot_write and
/// a lack of memory out_of_memory.
template <class Work>
decltype(auto) with_code(Code code, Work&& work) {
  try {
    return std::forward<Work>(work)();
  } catch (const RunTimeError& error) {
    const auto number = static_cast<ErrorNumber>(error.number());
    if (number == ErrorNumber::disk_full) code = Code::cannot_write;
    if (number == ErrorNumber::out_of_memory) code = Code::out_of_memory;
    throw Error(code, error.what());
  }
}

/// The same; the error names the file that the operations are on.
template <class Work>
decltype(auto) with_code(Code code, TextView file, Work&& work) {
  try {
    return with_code(code, std::forward<Work>(work));
  } catch (const Error& error) {
    throw Error(error.code(), to_utf8(file) + ": " + error.what());
  }
}

}  // namespace talutil::archives
