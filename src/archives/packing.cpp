#include "archives/packing.hpp"

#include <algorithm>
#include <unordered_map>
#include <utility>

#include "archives/file_errors.hpp"
#include "archives/item_list.hpp"
#include "archives/little_endian.hpp"
#include "archives/packed_files.hpp"
#include "archives/split_set.hpp"
#include "platform/file_names.hpp"

namespace talutil::archives {

namespace {

constexpr std::size_t longest_comment = 0xFFFF;

struct Target {
  std::unique_ptr<Folder> folder;
  Text name;
};

Target open_target(const Text& archive, Folders& folders) {
  with_code(Code::missing, [&] { require_file_name(archive); });
  Target target;
  target.name = last_part(archive);
  if (target.name.empty()) throw Error(Code::missing, "the path names no file");
  const Text folder = archive.substr(0, archive.size() - target.name.size());
  target.folder = with_code(Code::temporary_file, [&] { return folders.open(folder); });
  return target;
}

/// Creates the new archive; it locks the existing one of that name.
std::unique_ptr<NewFile> create(Target& target) {
  const bool replaces = target.folder->facts(target.name).has_value();
  try {
    return target.folder->create(target.name);
  } catch (const RunTimeError& error) {
    Code code = Code::temporary_file;
    const auto number = static_cast<ErrorNumber>(error.number());
    if (number == ErrorNumber::permission_denied && replaces) code = Code::cannot_open;
    if (number == ErrorNumber::path_file_access) code = Code::cannot_create;
    if (number == ErrorNumber::disk_full) code = Code::cannot_write;
    throw Error(code, error.what());
  }
}

void require_archive(StoredFile* old) {
  if (old == nullptr || old->size() == 0) return;
  if (volumes_before(*old) != 0) throw Error(Code::split_set_in_use, "a split set cannot be added to");
  const auto require_beginning = [](std::uint64_t first) {
    if (first != 0) throw Error(Code::bad_parameters, "a program stands before the archive, which would be lost");
  };
  require_beginning(prefix_length(*old));
  constexpr std::uint64_t whole[] = {0};
  const Directory directory = read_directory(*old, whole);
  require_separate_entries(directory);
  std::uint64_t first = directory.start;
  for (const DirectoryEntry& entry : directory.entries) first = std::min(first, entry.offset);
  require_beginning(first);
}

/// Adds the items of a collection to a container.
class Packer {
 public:
  Packer(Container& container, PackedFiles& files, const PackingOptions& options)
      : container_(container), options_(options), password_(to_utf8(options.password)), files_(files) {
    if (password_.find('\0') != std::string::npos) throw Error(Code::bad_parameters, "a password has no NUL");
  }

  void add_all(const std::vector<Item>& items) {
    delete_replaced(items);
    for (const Item& item : items) add(item);
  }

 private:
  void delete_replaced(const std::vector<Item>& items) {
    zip_t* const archive = container_.get();
    const zip_int64_t count = zip_get_num_entries(archive, 0);
    if (count == 0) return;
    std::unordered_multimap<std::string, zip_uint64_t> old;
    for (zip_int64_t i = 0; i < count; ++i) {
      const char* const name = zip_get_name(archive, static_cast<zip_uint64_t>(i), 0);
      if (name != nullptr) old.emplace(folded(name), static_cast<zip_uint64_t>(i));
    }
    for (const Item& item : items) {
      const auto [first, last] = old.equal_range(folded(item.entry));
      for (auto entry = first; entry != last; ++entry) require(zip_delete(archive, entry->second) == 0);
      old.erase(first, last);
    }
  }

  static std::string folded(std::string_view name) { return to_utf8(upper_case(from_utf8(name))); }

  void add(const Item& item) {
    const bool is_folder = item.facts.kind == FileKind::folder;
    zip_t* const archive = container_.get();
    zip_int64_t added = -1;
    if (is_folder) {
      added = zip_dir_add(archive, item.entry.c_str(), ZIP_FL_ENC_UTF_8);
    } else {
      zip_source_t* const source = files_.source_of(item, archive);
      require(source != nullptr);
      added = zip_file_add(archive, item.entry.c_str(), source, ZIP_FL_ENC_UTF_8);
      if (added < 0) zip_source_free(source);
    }
    require(added >= 0);
    const auto index = static_cast<zip_uint64_t>(added);
    set_facts(index, item.facts);
    if (is_folder) return;
    if (options_.level == 0) {
      require(zip_set_file_compression(archive, index, ZIP_CM_STORE, 0) == 0);
    } else if (item.facts.size > PackedFiles::longest_in_memory) {
      require(zip_set_file_compression(archive, index, ZIP_CM_DEFLATE, static_cast<zip_uint32_t>(options_.level)) == 0);
    }
    if (password_.empty()) return;
    const zip_uint16_t method = options_.aes ? ZIP_EM_AES_256 : ZIP_EM_TRAD_PKWARE;
    require(zip_file_set_encryption(archive, index, method, password_.c_str()) == 0);
  }

  void set_facts(zip_uint64_t index, const FileFacts& facts) {
    zip_t* const archive = container_.get();
    const zip_uint8_t system = facts.mode != 0 ? ZIP_OPSYS_UNIX : ZIP_OPSYS_DOS;
    const zip_uint32_t attributes = facts.mode << 16U | facts.attributes;
    require(zip_file_set_external_attributes(archive, index, 0, system, attributes) == 0);
    // The time of a file comes from its source.
    if (facts.kind == FileKind::folder) {
      require(zip_file_set_mtime(archive, index, PackedFiles::storable_time(facts.modified), 0) == 0);
    }
    // The time in the directory has a resolution of two seconds and is local; this one is exact.
    if (!std::in_range<std::int32_t>(facts.modified)) return;
    constexpr zip_uint16_t extended_time = 0x5455;
    std::string field(1, '\1');
    append_number(field, static_cast<std::uint32_t>(facts.modified));
    require(zip_file_extra_field_set(archive, index, extended_time, ZIP_EXTRA_FIELD_NEW,
                                     reinterpret_cast<const zip_uint8_t*>(field.data()),
                                     static_cast<zip_uint16_t>(field.size()), ZIP_FL_LOCAL | ZIP_FL_CENTRAL) == 0);
  }

  void require(bool is_done) const {
    if (!is_done) container_.fail();
  }

  Container& container_;
  const PackingOptions& options_;
  std::string password_;
  PackedFiles& files_;
};

std::uint64_t bytes_of(const std::vector<Item>& items) {
  std::uint64_t total = 0;
  for (const Item& item : items) total += item.facts.size;
  return total;
}

}  // namespace

void pack(const Text& archive, TextView items, const PackingOptions& options, Folders& folders, Progress& progress) {
  if (options.level < 0 || options.level > 9) throw Error(Code::bad_parameters, "a level is 0 to 9");
  const std::string comment = to_utf8(options.comment);
  if (comment.size() > longest_comment) throw Error(Code::bad_comment, "a comment has at most 65,535 bytes");
  if (options.volume_size) require_volume_size(*options.volume_size);
  Target target = open_target(archive, folders);
  Collection collection(folders, {target.folder->path(), target.name});
  for (const Text& item : read_item_list(items)) {
    const bool has_matched = collection.add(item, options.recurse, options.keep_folders);
    if (has_matched || !options.needs_every_item) continue;
    throw Error(Code::nothing_to_do, "there is no \"" + to_utf8(item) + "\"; nothing was packed");
  }
  if (collection.items().empty()) collection.left_out().throw_if_any();
  if (collection.items().empty()) throw Error(Code::nothing_to_do, "no item matches");
  collection.drop_repeated();

  std::unique_ptr<NewFile> output = create(target);
  require_archive(output->replaced());
  progress.start(bytes_of(collection.items()));
  {
    Fault fault(Code::internal);
    SerialTasks serial;
    Tasks& tasks = options.tasks == nullptr ? serial : *options.tasks;
    PackedFiles files(collection, options.level, tasks, fault, progress);
    Container container(*output, fault, progress);
    Packer(container, files, options).add_all(collection.items());
    if (!comment.empty() &&
        zip_set_archive_comment(container.get(), comment.data(), static_cast<zip_uint16_t>(comment.size())) != 0) {
      container.fail();
    }
    container.write();
  }
  if (options.volume_size) {
    split_archive(std::move(output), *target.folder, target.name, *options.volume_size, progress);
  } else {
    with_code(Code::cannot_create, [&] {
      output->finish(nullptr);
      output->take_name();
    });
  }
  collection.left_out().throw_if_any();
}

}  // namespace talutil::archives
