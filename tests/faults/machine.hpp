#pragma once

#include <filesystem>
#include <map>
#include <memory>
#include <string>

#include "tests/platform/native_platform.hpp"

/// What the tests in which something goes wrong need from the platform.
namespace talutil::testing {

using Contents = std::map<std::string, std::string>;  ///< Contents by path from a root on; a folder's ends in "/".

/// Everything in a folder.
[[nodiscard]] Contents read_tree(const std::filesystem::path& root);

/// Makes a folder hold exactly these files, all of one time.
void write_tree(const std::filesystem::path& root, const Contents& files);

/// A new folder for files, empty.
[[nodiscard]] std::filesystem::path make_root();

/// This machine, with its files and settings in a folder as far as the platform allows.
[[nodiscard]] std::unique_ptr<NativePlatform> native_platform(const std::filesystem::path& root);

/// That folder as a library calls it, with a separator at its end.
[[nodiscard]] Text library_path(const std::filesystem::path& root);

/// Whether settings and the registry lie in the folder, so that they can be put back.
[[nodiscard]] bool has_own_settings() noexcept;

/// Whether the next writer removes at once what an earlier one could not, or only after that one's process has ended.
[[nodiscard]] bool clears_at_once() noexcept;

/// The short form of the tests lets every such call fail.
[[nodiscard]] std::size_t stride_of_short_form() noexcept;

/// Sets the time of a file or folder to the same moment always.
void set_time(const std::filesystem::path& path);

/// Everything in the folder, with the settings' and the registry's values in the place of their files.
[[nodiscard]] Contents contents_of(const std::filesystem::path& root);

/// How many files and the like this process has open.
[[nodiscard]] std::size_t open_handles();

}  // namespace talutil::testing
