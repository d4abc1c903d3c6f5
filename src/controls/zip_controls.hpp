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
  /// How the last action ended: 0 well, 9 cancelled, 12 nothing matched, 13 no such archive, 17 done except for some
  /// entries. An action never raises an error; look here after putting Action. The others are 1 another action of this
  /// control is at work, 2 the archive is cut off, 3 it is damaged or none, 4 out of memory, 5 an internal error, 7 the
  /// comment is longer than 65,535 bytes, 8 the test found damage, 10 the archive's folder is missing or accepts no
  /// files, 11 a file cannot be read, 14 the disk is full, 15 the new file could not be given its name, 16 an unknown
  /// action or a missing or wrong password, 18 the archive is locked or may not be read, 19 a volume is missing or too
  /// short, 20 VolumeSize is too small, 21 a split set cannot be added to.
  /// @family archives
  /// @see Action, ErrorText
  /// @example
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = folder & "\missing.zip"
  ///     x.Action = 1
  ///     Print x.ErrorCode
  ///     ' 13
  std::int16_t ErrorCode = 0;

  /// What went wrong in the last action, in English, for developers and logs; empty if nothing did.
  /// @family archives
  /// @see ErrorCode
  /// @example
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.Action = 3
  ///     Print z.ErrorCode & ": " & z.ErrorText
  ///     ' 16: there is no such action; 4 packs
  Text ErrorText;

  /// An object whose default member is called during an action, with the bytes done, the bytes in all, and the file's
  /// name. If it returns True or raises an error, the action is cancelled with code 9: no archive is made, and files
  /// that were already extracted stay. It is called some twenty times a second. In VBScript it is an object of a class
  /// with a Public Default Function of three parameters; in JScript a function will do.
  /// @family archives
  /// @see ErrorCode, Action
  /// @example
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     Print IsEmpty(z.OnProgress)
  ///     ' True
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

  /// The path of the archive that action 4 creates or adds to. The old archive stays as it is until the new one is
  /// complete. A name without a folder is in the current folder.
  /// @family archives
  /// @see ItemList, Action
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Print z.ErrorCode & " " & u.FileExists(z.ZIPFile)
  ///     ' 0 True
  Text ZIPFile;

  /// What is packed: paths separated by blanks, those with blanks in double quotes; the last part may have wildcards. A
  /// folder is packed with what is in it, unless RecurseSubdirectories is False. Files of other writers' temporary
  /// names (".talutil-") are left out.
  /// @family archives
  /// @see RecurseSubdirectories, NoDirectoryNames
  /// @example
  ///     u.SaveTextBox "a", folder & "\one.txt"
  ///     u.SaveTextBox "b", folder & "\two words.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\both.zip"
  ///     z.ItemList = folder & "\one.txt " & Chr(34) & folder & "\two words.txt" & Chr(34)
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Action = 1
  ///     Print x.EntryCount
  ///     ' 2
  Text ItemList;

  /// Whether entries are named without their folders; with False, as at first, the names keep the folders of the items.
  /// @family archives
  /// @see RecurseSubdirectories, ItemList
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.NoDirectoryNames = True
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.ItemList = "notes.txt"
  ///     x.Destination = folder & "\restored"
  ///     x.Action = 8
  ///     Print u.FileExists(folder & "\restored\notes.txt")
  ///     ' True
  Boolean NoDirectoryNames;

  /// Whether folders are packed with everything in them; with False, only files that the items name directly.
  /// @family archives
  /// @see ItemList, NoDirectoryNames
  /// @example
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     Print z.RecurseSubdirectories
  ///     ' True
  Boolean RecurseSubdirectories{true};

  /// How hard entries are compressed: 0 stores them, 1 is fastest, 9 makes the smallest archive; 6 at first.
  /// @family archives
  /// @see Action
  /// @example
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     Print z.CompressionLevel
  ///     ' 6
  ///     z.CompressionLevel = 9
  ///     Print z.CompressionLevel
  ///     ' 9
  std::int32_t CompressionLevel = default_level;

  /// The comment that the archive gets, of at most 65,535 bytes as UTF-8; empty for none.
  /// @family archives
  /// @see ErrorCode
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Comment = "March 2009"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Action = 1
  ///     Print x.Comment
  ///     ' March 2009
  Text Comment;

  /// Whether entries are encrypted with Password; without a password they are not.
  /// @family archives
  /// @see Password, StrongEncryption
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Encrypt = True
  ///     z.StrongEncryption = True
  ///     z.Password = "7dB!s2"
  ///     z.Action = 4
  ///     Print z.ErrorCode
  ///     ' 0
  Boolean Encrypt;

  /// The password with which entries are encrypted, if Encrypt is True; empty for none. Its characters are encoded as
  /// UTF-8, which other programs must also do to open the archive.
  /// @family archives
  /// @see Encrypt, StrongEncryption
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Encrypt = True
  ///     z.Password = "7dB!s2"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Password = "7dB!s2"
  ///     x.Action = 7
  ///     Print x.ErrorCode
  ///     ' 0
  Text Password;

  /// Whether entries are encrypted by AES-256; with False, as at first, in the traditional way, which is weak. Every
  /// program reads the traditional encryption, but it can be broken; older programs cannot read AES.
  /// @family archives
  /// @see Encrypt, Password
  /// @example
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.StrongEncryption = True
  ///     Print z.StrongEncryption
  ///     ' True
  Boolean StrongEncryption;

  /// Whether the archive is a split set: with 1, in volumes of VolumeSize bytes; with any other number, a single file.
  /// The last volume has the name in ZIPFile; the others before it end in z01, z02 and so on. A split set cannot be
  /// added to.
  /// @family archives
  /// @see VolumeSize
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.MultiVolume = 1
  ///     z.VolumeSize = 65536
  ///     z.Action = 4
  ///     Print z.ErrorCode
  ///     ' 0
  std::int32_t MultiVolume = 0;

  /// The size of a volume of a split set, in bytes: at least 65,536; 100,000,000 at first.
  /// @family archives
  /// @see MultiVolume, ErrorCode
  /// @example A volume that is too small
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.MultiVolume = 1
  ///     z.VolumeSize = 1000
  ///     z.Action = 4
  ///     Print z.ErrorCode
  ///     ' 20
  std::int32_t VolumeSize = default_volume_size;

  /// Putting 4 packs the items of ItemList into ZIPFile; 0 does nothing. ErrorCode then says how it ended. Entries of
  /// the same name, regardless of case, are replaced and others kept. While it works, the host's messages are handled,
  /// so its user can press a button; another action of the same control then fails with code 1.
  /// @reads ZIPFile, ItemList, NoDirectoryNames, RecurseSubdirectories, CompressionLevel, Comment, Encrypt, Password,
  ///   StrongEncryption, MultiVolume, VolumeSize
  /// @changes ErrorCode, ErrorText
  /// @family archives
  /// @see ErrorCode, ItemList, CallZIPFiles
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Print z.ErrorCode
  ///     ' 0
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

  /// The path of the archive, or of the last volume of a split set.
  /// @family archives
  /// @see Action
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = folder & "\backup.zip"
  ///     x.Action = 1
  ///     Print x.EntryCount
  ///     ' 1
  Text ZIPFile;

  /// Which entries are tested or extracted: names separated by blanks, with wildcards; empty or "*.*" for all. A name
  /// without a folder is compared with the last part of an entry's name; any item also with its first parts, so that a
  /// folder selects all that is in it. Names with blanks are in double quotes.
  /// @family archives
  /// @see Action
  /// @example Nothing matches
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.ItemList = "other.txt"
  ///     x.Action = 7
  ///     Print x.ErrorCode
  ///     ' 12
  Text ItemList;

  /// How many times its own size an archive may unpack to; more is refused, but never less than a gibibyte. 1100 at
  /// first. Deflate cannot exceed 1100, so only archives that lie about their sizes do.
  /// @family archives
  /// @see Action
  /// @example
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     Print x.MaxRatio
  ///     ' 1100
  std::int32_t MaxRatio = default_largest_ratio;

  /// The folder to extract into, which is created if it is missing. Names that lead out of it are refused, and the
  /// action then ends with code 17.
  /// @family archives
  /// @see KeepDirectories, Overwrite
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.NoDirectoryNames = True
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Destination = folder & "\restored"
  ///     x.Action = 8
  ///     Print u.FileExists(folder & "\restored\notes.txt")
  ///     ' True
  Text Destination;

  /// Whether entries are written into their folders; with False, all of them into Destination itself.
  /// @family archives
  /// @see Destination
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Destination = folder & "\flat"
  ///     x.KeepDirectories = False
  ///     x.Action = 8
  ///     Print u.FileExists(folder & "\flat\notes.txt")
  ///     ' True
  Boolean KeepDirectories{true};

  /// Whether existing files are replaced; with False, as at first, they stay as they are.
  /// @family archives
  /// @see Destination
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.NoDirectoryNames = True
  ///     z.Action = 4
  ///     u.SaveTextBox "new", folder & "\notes.txt"
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Destination = folder
  ///     x.Action = 8
  ///     Print Len(u.LoadTextBox(folder & "\notes.txt"))
  ///     ' 5
  ///     x.Overwrite = True
  ///     x.Action = 8
  ///     Print Len(u.LoadTextBox(folder & "\notes.txt"))
  ///     ' 9
  Boolean Overwrite;

  /// The comment of the archive that the last action opened.
  /// @family archives
  /// @see Action
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Comment = "March 2009"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Action = 1
  ///     Print x.Comment
  ///     ' March 2009
  Text Comment;

  /// The number of entries of the archive that the last action opened, whatever ItemList selects.
  /// @family archives
  /// @see Action
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Action = 1
  ///     Print x.EntryCount
  ///     ' 1
  std::int32_t EntryCount = 0;

  /// The password that is tried first for encrypted entries; if it is wrong or missing, the user is asked.
  /// @family archives
  /// @see Action
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Encrypt = True
  ///     z.Password = "7dB!s2"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Password = "7dB!s2"
  ///     x.Action = 7
  ///     Print x.ErrorCode
  ///     ' 0
  Text Password;

  /// Putting 1 counts the entries of ZIPFile, 7 tests those in ItemList, 8 extracts them to Destination; 0 does
  /// nothing. ErrorCode then says how it ended. A file gets its name only once its checksum has proved right. Entries
  /// that cannot be unpacked (refused names, links, unknown methods, damage) are passed over, and the code is then 17
  /// or that of the first.
  /// @reads ZIPFile, ItemList, MaxRatio, Destination, KeepDirectories, Overwrite, Password
  /// @changes ErrorCode, ErrorText, EntryCount, Comment
  /// @family archives
  /// @see ErrorCode, CallUnZIPFiles
  /// @example
  ///     u.SaveTextBox "minutes", folder & "\notes.txt"
  ///     Set z = CreateObject("TALUtil.ZipControl")
  ///     z.ZIPFile = folder & "\backup.zip"
  ///     z.ItemList = folder & "\notes.txt"
  ///     z.Action = 4
  ///     Set x = CreateObject("TALUtil.UnzipControl")
  ///     x.ZIPFile = z.ZIPFile
  ///     x.Action = 7
  ///     Print x.ErrorCode
  ///     ' 0
  std::int32_t Action = 0;

 private:
  void act();
};

template <class P>
constexpr auto members_of(std::type_identity<ZipControl>) {
  using C = ZipControl;
  return P::rows(P::template property<&C::ZIPFile>({"ZIPFile", C::archive_name}),
                 P::template property<&C::ItemList>({"ItemList", C::item_list}),
                 P::template property<&C::NoDirectoryNames>({"NoDirectoryNames", C::no_folders}),
                 P::template property<&C::RecurseSubdirectories>({"RecurseSubdirectories", C::recurse}),
                 P::template property<&C::CompressionLevel>({"CompressionLevel", C::level}),
                 P::template property<&C::Comment>({"Comment", C::comment}),
                 P::template property<&C::Encrypt>({"Encrypt", C::encrypt}),
                 P::template property<&C::Password>({"Password", C::password}),
                 P::template property<&C::StrongEncryption>({"StrongEncryption", C::strong_encryption}),
                 P::template property<&C::MultiVolume>({"MultiVolume", C::multi_volume}),
                 P::template property<&C::VolumeSize>({"VolumeSize", C::volume_size}),
                 P::template property<&C::ErrorCode>({"ErrorCode", C::result}),
                 P::template property<&C::Action>({"Action", C::action}),
                 P::template get_only<&C::ErrorText>("ErrorText"), P::template property<&C::OnProgress>("OnProgress"));
}

template <class P>
constexpr auto members_of(std::type_identity<UnzipControl>) {
  using C = UnzipControl;
  return P::rows(P::template property<&C::ZIPFile>({"ZIPFile", C::archive_name}),
                 P::template property<&C::ItemList>({"ItemList", C::item_list}),
                 P::template property<&C::MaxRatio>({"MaxRatio", C::largest_ratio}),
                 P::template property<&C::Destination>({"Destination", C::destination}),
                 P::template property<&C::KeepDirectories>({"KeepDirectories", C::keep_folders}),
                 P::template property<&C::Overwrite>({"Overwrite", C::overwrite}),
                 P::template property<&C::Comment>({"Comment", C::comment}),
                 P::template property<&C::ErrorCode>({"ErrorCode", C::result}),
                 P::template property<&C::EntryCount>({"EntryCount", C::entry_count}),
                 P::template property<&C::Action>({"Action", C::action}),
                 P::template property<&C::Password>({"Password", C::password}),
                 P::template get_only<&C::ErrorText>("ErrorText"), P::template property<&C::OnProgress>("OnProgress"));
}

}  // namespace talutil
