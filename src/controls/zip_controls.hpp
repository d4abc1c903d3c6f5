#pragma once

#include <chrono>
#include <map>
#include <optional>

#include "archives/packing.hpp"
#include "archives/progress.hpp"
#include "archives/unpacking.hpp"
#include "controls/table_object.hpp"

namespace talutil {

/// What the zip and unzip controls share: the result, progress reports, and settings that hosts use by identifier but
/// that have no effect here; these are stored and can be read back.
class ArchiveControl {
 public:
  std::int16_t ErrorCode = 0;  ///< The outcome of the last action; see archives::Code.
  Text ErrorText;              ///< What went wrong, for developers.

  /// Called as `handler(bytes done, total bytes, name)` from time to time during an action. Returning True, or raising
  /// an error, cancels the action with code 9.
  Variant OnProgress;

 protected:
  explicit ArchiveControl(const Platform& platform) : platform_(platform) {}
  ~ArchiveControl() = default;

  /// Runs an action and stores its outcome. An action started during another one fails with 1 at once.
  void run(const std::function<void(archives::Progress& progress)>& work);

  /// Asks the user for the password of an entry.
  [[nodiscard]] archives::PasswordQuestion question() const;

  [[nodiscard]] const Platform& platform() const noexcept { return platform_; }

  /// Stores or returns a setting without effect; returns nothing if the member is not one of those.
  std::optional<Variant> use_kept(std::int32_t member, Access access, std::span<const Variant> arguments,
                                  std::span<const std::int32_t> kept);

 private:
  [[nodiscard]] bool watch(std::uint64_t done, std::uint64_t total, TextView name);

  const Platform& platform_;
  std::map<std::int32_t, Variant> kept_;
  std::chrono::steady_clock::time_point last_watched_;
  bool is_busy_ = false;
};

/// The zip control. Action 4 packs the items of ItemList into ZIPFile.
class ZipControl final : public TableObject<ZipControl>, public ArchiveControl {
 public:
  // The identifiers that hosts use.
  static constexpr std::int32_t archive_name = 1;
  static constexpr std::int32_t item_list = 2;
  static constexpr std::int32_t no_folders = 3;
  static constexpr std::int32_t recurse = 4;
  static constexpr std::int32_t level = 5;
  static constexpr std::int32_t comment = 25;
  static constexpr std::int32_t encrypt = 34;
  static constexpr std::int32_t password = 35;
  static constexpr std::int32_t strong_encryption = 36;
  static constexpr std::int32_t multi_volume = 37;
  static constexpr std::int32_t volume_size = 38;
  static constexpr std::int32_t result = 39;
  static constexpr std::int32_t action = 40;

  static constexpr std::int32_t add = 4;  ///< The only action, apart from 0, which does nothing.
  static constexpr std::int32_t default_level = 6;
  static constexpr std::int32_t default_volume_size = 100'000'000;

  explicit ZipControl(const Platform& platform) : TableObject(platform), ArchiveControl(platform) {}

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override;

  Text ZIPFile;
  Text ItemList;
  Boolean NoDirectoryNames;
  Boolean RecurseSubdirectories{true};
  std::int32_t CompressionLevel = default_level;
  Text Comment;
  Boolean Encrypt;
  Text Password;
  Boolean StrongEncryption;
  std::int32_t MultiVolume = 0;
  std::int32_t VolumeSize = default_volume_size;
  std::int32_t Action = 0;

 private:
  void act();
};

/// The unzip control. Action 1 checks whether ZIPFile is an archive and counts its entries, 7 tests the entries in
/// ItemList, 8 extracts them to Destination.
class UnzipControl final : public TableObject<UnzipControl>, public ArchiveControl {
 public:
  static constexpr std::int32_t archive_name = 1;
  static constexpr std::int32_t item_list = 2;
  static constexpr std::int32_t largest_ratio = 3;
  static constexpr std::int32_t destination = 4;
  static constexpr std::int32_t keep_folders = 6;
  static constexpr std::int32_t overwrite = 10;
  static constexpr std::int32_t comment = 21;
  static constexpr std::int32_t result = 24;
  static constexpr std::int32_t entry_count = 27;
  static constexpr std::int32_t action = 34;
  static constexpr std::int32_t password = 35;

  static constexpr std::int32_t look = 1;
  static constexpr std::int32_t test = 7;
  static constexpr std::int32_t extract = 8;
  static constexpr std::int32_t default_largest_ratio = 1100;

  explicit UnzipControl(const Platform& platform) : TableObject(platform), ArchiveControl(platform) {}

  Variant invoke(std::int32_t member, Access access, std::span<const Variant> arguments) override;

  Text ZIPFile;
  Text ItemList;
  std::int32_t MaxRatio = default_largest_ratio;
  Text Destination;
  Boolean KeepDirectories{true};
  Boolean Overwrite;
  Text Comment;
  std::int32_t EntryCount = 0;
  Text Password;
  std::int32_t Action = 0;

 private:
  void act();
};

template <class P>
constexpr auto members_of(std::type_identity<ZipControl>) {
  using C = ZipControl;
  return P::rows(
      P::template property<&C::ZIPFile>({"ZIPFile", C::archive_name}, "The path of the archive."),
      P::template property<&C::ItemList>({"ItemList", C::item_list},
                                         "What is packed: names and patterns between blanks, some in quotes."),
      P::template property<&C::NoDirectoryNames>({"NoDirectoryNames", C::no_folders},
                                                 "Entries are named without their folders."),
      P::template property<&C::RecurseSubdirectories>({"RecurseSubdirectories", C::recurse},
                                                      "Folders are packed with what is in them."),
      P::template property<&C::CompressionLevel>({"CompressionLevel", C::level}, "0 stores, 1 is fast, 9 small."),
      P::template property<&C::Comment>({"Comment", C::comment}, "The comment of the archive."),
      P::template property<&C::Encrypt>({"Encrypt", C::encrypt}, "Entries are encrypted, where there is a password."),
      P::template property<&C::Password>({"Password", C::password}, "The password."),
      P::template property<&C::StrongEncryption>(
          {"StrongEncryption", C::strong_encryption},
          "Encrypts with AES-256; else in the traditional way, which every program reads."),
      P::template property<&C::MultiVolume>({"MultiVolume", C::multi_volume}, "1 makes a split set."),
      P::template property<&C::VolumeSize>({"VolumeSize", C::volume_size}, "Bytes of a volume, 65,536 or more."),
      P::template property<&C::ErrorCode>({"ErrorCode", C::result}, "How the last action ended; 0 is well."),
      P::template property<&C::Action>({"Action", C::action}, "Putting 4 packs the items."),
      P::template get_only<&C::ErrorText>("ErrorText", "What was wrong, in words."),
      P::template property<&C::OnProgress>("OnProgress", "An object that is called while an action works."));
}

template <class P>
constexpr auto members_of(std::type_identity<UnzipControl>) {
  using C = UnzipControl;
  return P::rows(
      P::template property<&C::ZIPFile>({"ZIPFile", C::archive_name}, "The path of the archive."),
      P::template property<&C::ItemList>({"ItemList", C::item_list}, "Which entries; empty or *.* for all."),
      P::template property<&C::MaxRatio>({"MaxRatio", C::largest_ratio},
                                         "How many times its own size an archive may unpack to, above a gibibyte."),
      P::template property<&C::Destination>({"Destination", C::destination}, "The folder to unpack below."),
      P::template property<&C::KeepDirectories>({"KeepDirectories", C::keep_folders},
                                                "Entries are written into their folders."),
      P::template property<&C::Overwrite>({"Overwrite", C::overwrite}, "Files that are there are replaced."),
      P::template property<&C::Comment>({"Comment", C::comment}, "The comment of the archive that was looked at."),
      P::template property<&C::ErrorCode>({"ErrorCode", C::result}, "How the last action ended; 0 is well."),
      P::template property<&C::EntryCount>({"EntryCount", C::entry_count}, "The entries that were counted."),
      P::template property<&C::Action>({"Action", C::action}, "Putting 1 looks, 7 tests, 8 extracts."),
      P::template property<&C::Password>({"Password", C::password}, "The password that is tried first."),
      P::template get_only<&C::ErrorText>("ErrorText", "What was wrong, in words."),
      P::template property<&C::OnProgress>("OnProgress", "An object that is called while an action works."));
}

}  // namespace talutil
