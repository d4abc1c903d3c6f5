#pragma once

#include <memory>

#include "platform/files.hpp"
#include "platform/folders.hpp"

/// The platform's own files, for the tests that hold for both platforms.
namespace talutil::testing {

[[nodiscard]] std::unique_ptr<Files> real_files();
[[nodiscard]] std::unique_ptr<Folders> real_folders();

/// An empty folder of this run's own, with a separator at its end, on a drive.
[[nodiscard]] Text scratch_folder();

/// A new empty file that the platform holds for hidden, and its path.
Text make_hidden_file(const Text& folder);

void set_read_only(const Text& path, bool read_only);

/// Keeps others from opening a file as long as the result lives.
[[nodiscard]] std::shared_ptr<void> lock_file(const Text& path);

}  // namespace talutil::testing
