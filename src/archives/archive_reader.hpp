#pragma once

#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "archives/container.hpp"
#include "archives/packed_files.hpp"
#include "archives/unpacked_files.hpp"
#include "archives/unpacking.hpp"

namespace talutil::archives {

/// Either the password was wrong or the entry is damaged: the traditional encryption cannot distinguish the two.
struct WrongPassword {};

/// Reads what an archive holds. Throws Error.
class Archive::Reader {
 public:
  using Sink = std::function<void(std::string_view bytes)>;

  /// Checks the structure of the archive.
  explicit Reader(std::unique_ptr<StoredFile> file);

  [[nodiscard]] zip_t* get() const noexcept { return container_.get(); }
  [[nodiscard]] std::uint64_t size() const noexcept { return file_->size(); }  ///< Of the archive's file, in bytes.
  [[nodiscard]] std::uint64_t count() const noexcept { return name_has_nul_.size(); }
  [[nodiscard]] Entry entry(std::uint64_t index) const;

  /// Fails with bad_structure if a local header contradicts the directory.
  void require_matching_headers();

  /// Passes the bytes of an entry to a sink; throws if they are not the ones that were packed, and WrongPassword if the
  /// password does not open it.
  void unpack(std::uint64_t index, const std::string& password, const Sink& sink);

  /// An entry that can be inflated as a whole and is not encrypted; nothing for another one.
  [[nodiscard]] std::optional<Deflated> deflated(std::uint64_t index);

 private:
  struct CloseEntry {
    void operator()(zip_file_t* file) const noexcept { zip_fclose(file); }
  };
  using Opened = std::unique_ptr<zip_file_t, CloseEntry>;

  StoredFile& checked(StoredFile& file);
  [[nodiscard]] zip_stat_t status_of(std::uint64_t index) const;
  [[nodiscard]] std::int64_t modified(std::uint64_t index, const zip_stat_t& status) const;
  void set_kind(std::uint64_t index, Entry& entry) const;
  [[nodiscard]] Opened open(std::uint64_t index, zip_flags_t flags, const std::string& password);
  [[nodiscard]] std::size_t read(zip_file_t& file, std::span<char> buffer);
  [[nodiscard]] Deflated read_whole(zip_file_t& file, const zip_stat_t& status);
  void unpack_by_pieces(zip_file_t& file, const zip_stat_t& status, const Sink& sink);

  std::unique_ptr<StoredFile> file_;
  std::vector<bool> name_has_nul_;
  Fault fault_{Code::bad_structure};
  Container container_;
  Inflaters inflaters_;
  std::string bytes_;
};

}  // namespace talutil::archives
