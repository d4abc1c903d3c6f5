#include "archives/directory.hpp"

#include <algorithm>
#include <limits>
#include <map>
#include <optional>

#include "archives/archive_error.hpp"
#include "archives/little_endian.hpp"

namespace talutil::archives {

namespace {

constexpr std::size_t end_record_size = 22;
constexpr std::size_t zip64_end_size = 56;
constexpr std::size_t zip64_locator_size = 20;
constexpr std::uint64_t longest_comment = 0xFFFF;
constexpr std::uint32_t full32 = 0xFFFFFFFF;
constexpr std::uint16_t full16 = 0xFFFF;
constexpr std::uint16_t descriptor_flag = 8;
constexpr std::uint16_t utf8_flag = 0x800;

/// The contents of the end record and its zip64 form.
struct End {
  std::uint64_t position = 0;
  std::uint32_t volume = 0;
  std::uint32_t directory_volume = 0;
  std::uint64_t entries = 0;
  std::uint64_t size = 0;
  std::uint64_t offset = 0;
  std::string comment;
  bool has_locator = false;
  std::uint32_t zip64_volume = 0;
  std::uint64_t zip64_offset = 0;
};

/// Fails for a file without an end record: an archive that is cut off, or not an archive at all.
[[noreturn]] void fail_without_end(StoredFile& file) {
  std::string head = read_exactly(file, 0, std::min<std::uint64_t>(file.size(), 4));
  head.resize(4);
  const auto signature = number_at<std::uint32_t>(head, 0);
  const bool begins_well = signature == local_signature || signature == descriptor_signature;
  throw Error(begins_well ? Code::unexpected_end : Code::bad_structure, "there is no end record");
}

End end_in(std::string_view tail, std::size_t place, std::uint64_t tail_offset) {
  End end;
  end.position = tail_offset + place;
  end.volume = number_at<std::uint16_t>(tail, place + 4);
  end.directory_volume = number_at<std::uint16_t>(tail, place + 6);
  end.entries = number_at<std::uint16_t>(tail, place + 10);
  end.size = number_at<std::uint32_t>(tail, place + 12);
  end.offset = number_at<std::uint32_t>(tail, place + 16);
  end.comment = tail.substr(place + end_record_size, number_at<std::uint16_t>(tail, place + 20));
  if (place < zip64_locator_size) return end;
  const std::size_t locator = place - zip64_locator_size;
  if (number_at<std::uint32_t>(tail, locator) != zip64_locator_signature) return end;
  end.has_locator = true;
  end.zip64_volume = number_at<std::uint32_t>(tail, locator + 4);
  end.zip64_offset = number_at<std::uint64_t>(tail, locator + 8);
  return end;
}

End read_end(StoredFile& file) {
  constexpr std::uint64_t longest_tail = end_record_size + longest_comment + zip64_locator_size;
  const auto size = static_cast<std::size_t>(std::min(file.size(), longest_tail));
  const std::string tail = read_exactly(file, file.size() - size, size);
  std::optional<End> followed;
  for (std::size_t place = size >= end_record_size ? size - end_record_size + 1 : 0; place-- > 0;) {
    if (number_at<std::uint32_t>(tail, place) != end_signature) continue;
    const std::size_t end_of_comment = place + end_record_size + number_at<std::uint16_t>(tail, place + 20);
    if (end_of_comment == size) return end_in(tail, place, file.size() - size);
    // Bytes behind the record, such as padding, are no fault if its directory fits before it.
    if (followed || end_of_comment > size) continue;
    const End end = end_in(tail, place, file.size() - size);
    if (end.has_locator || end.size <= end.position) followed = end;
  }
  if (followed) return *followed;
  fail_without_end(file);
}

std::uint64_t start_of(std::span<const std::uint64_t> volume_starts, std::uint32_t volume) {
  // A complete archive may claim any volume number; there is only one volume.
  if (volume_starts.size() == 1) return 0;
  if (volume >= volume_starts.size()) throw Error(Code::bad_media, "an entry lies on a volume that is missing");
  return volume_starts[volume];
}

/// Adds two positions without letting damaged values wrap around.
std::uint64_t placed(std::uint64_t start, std::uint64_t offset) {
  if (offset > std::numeric_limits<std::uint64_t>::max() - start)
    throw Error(Code::bad_structure, "a place is too far");
  return start + offset;
}

void read_zip64_end(StoredFile& archive, std::span<const std::uint64_t> volume_starts, End& end) {
  const std::uint64_t place = placed(start_of(volume_starts, end.zip64_volume), end.zip64_offset);
  const std::string record = read_exactly(archive, place, zip64_end_size);
  if (number_at<std::uint32_t>(record, 0) != zip64_end_signature) {
    throw Error(Code::bad_structure, "the zip64 end record is damaged");
  }
  end.volume = number_at<std::uint32_t>(record, 16);
  end.directory_volume = number_at<std::uint32_t>(record, 20);
  end.entries = number_at<std::uint64_t>(record, 32);
  end.size = number_at<std::uint64_t>(record, 40);
  end.offset = number_at<std::uint64_t>(record, 48);
}

/// Reads through the directory, some entries ahead.
class HeaderReader {
 public:
  HeaderReader(StoredFile& archive, std::uint64_t place) : archive_(archive), place_(place) {}

  [[nodiscard]] std::string_view peek(std::size_t count) {
    if (buffer_.size() - used_ < count) {
      place_ += used_;
      used_ = 0;
      buffer_.resize(std::max<std::size_t>(count, ahead));
      buffer_.resize(archive_.read_at(place_, buffer_));
      if (buffer_.size() < count) throw Error(Code::unexpected_end, "the directory is cut off");
    }
    return std::string_view(buffer_).substr(used_, count);
  }

  std::string take(std::size_t count) {
    std::string bytes(peek(count));
    used_ += count;
    return bytes;
  }

 private:
  static constexpr std::size_t ahead = 1U << 16U;

  StoredFile& archive_;
  std::uint64_t place_;
  std::string buffer_;
  std::size_t used_ = 0;
};

/// The data of a header's zip64 extra field; empty if there is none.
std::string_view zip64_field(std::string_view header, std::size_t name_length, std::size_t extra_length) {
  std::string_view extra = header.substr(central_header_size + name_length, extra_length);
  while (extra.size() >= 4) {
    const std::size_t length = number_at<std::uint16_t>(extra, 2);
    if (4 + length > extra.size()) break;
    if (number_at<std::uint16_t>(extra, 0) == zip64_extra) return extra.substr(4, length);
    extra.remove_prefix(4 + length);
  }
  return {};
}

/// Takes the next number from a zip64 field if the header's own field was at its maximum.
template <class Number, class Stored>
void take_wide(std::string_view& field, Number& value, Stored full) {
  if (value != full) return;
  if (field.size() < sizeof(Number)) throw Error(Code::bad_structure, "a zip64 field is too short");
  value = number_at<Number>(field, 0);
  field.remove_prefix(sizeof(Number));
}

DirectoryEntry read_entry(HeaderReader& reader, std::span<const std::uint64_t> volume_starts) {
  const std::string_view fixed = reader.peek(central_header_size);
  if (number_at<std::uint32_t>(fixed, 0) != central_signature) {
    throw Error(Code::bad_structure, "the directory is damaged or encrypted");
  }
  const std::size_t length = central_header_size + number_at<std::uint16_t>(fixed, 28) +
                             number_at<std::uint16_t>(fixed, 30) + number_at<std::uint16_t>(fixed, 32);
  DirectoryEntry entry;
  entry.header = reader.take(length);
  entry.has_descriptor = (number_at<std::uint16_t>(entry.header, 8) & descriptor_flag) != 0;
  entry.packed_size = number_at<std::uint32_t>(entry.header, 20);
  entry.size = number_at<std::uint32_t>(entry.header, 24);
  entry.offset = number_at<std::uint32_t>(entry.header, 42);
  std::uint32_t volume = number_at<std::uint16_t>(entry.header, 34);
  std::string_view field = zip64_field(entry.header, entry.name_length(), entry.extra_length());
  take_wide(field, entry.size, full32);
  take_wide(field, entry.packed_size, full32);
  take_wide(field, entry.offset, full32);
  if (volume_starts.size() > 1) take_wide(field, volume, full16);
  entry.offset = placed(start_of(volume_starts, volume), entry.offset);
  return entry;
}

}  // namespace

std::size_t DirectoryEntry::name_length() const { return number_at<std::uint16_t>(header, 28); }
std::size_t DirectoryEntry::extra_length() const { return number_at<std::uint16_t>(header, 30); }

std::string read_exactly(StoredFile& file, std::uint64_t offset, std::uint64_t count) {
  if (offset > file.size() || count > file.size() - offset) {
    throw Error(Code::unexpected_end, "the archive ends too early");
  }
  std::string bytes(static_cast<std::size_t>(count), '\0');
  if (file.read_at(offset, bytes) != bytes.size()) throw Error(Code::unexpected_end, "the archive ends too early");
  return bytes;
}

void require_matching_headers(StoredFile& archive, const Directory& directory) {
  constexpr std::size_t names_part = 26;  // Of a local header: the lengths of the name and the extra fields.
  for (const DirectoryEntry& entry : directory.entries) {
    const std::string local = read_exactly(archive, entry.offset, local_header_size + entry.name_length());
    const std::string_view name = std::string_view(entry.header).substr(central_header_size, entry.name_length());
    const auto is_same = [&](std::size_t local_place, std::size_t central_place, std::size_t count) {
      return local.compare(local_place, count, entry.header, central_place, count) == 0;
    };
    const bool is_wide = number_at<std::uint32_t>(local, 18) == full32 || number_at<std::uint32_t>(local, 22) == full32;
    // Checksum and sizes follow the data where a descriptor has them.
    const bool has_same_sizes = entry.has_descriptor || is_wide || is_same(14, 16, 12);
    if (number_at<std::uint32_t>(local, 0) != local_signature ||
        number_at<std::uint16_t>(local, names_part) != name.size() ||
        std::string_view(local).substr(local_header_size) != name || !is_same(8, 10, 2) || !has_same_sizes) {
      throw Error(Code::bad_structure, std::string(name) + ": its two headers contradict each other");
    }
  }
}

std::uint64_t prefix_length(StoredFile& archive) {
  End end = read_end(archive);
  const auto has = [&](std::uint64_t place, std::uint32_t signature) {
    return place <= archive.size() && archive.size() - place >= 4 &&
           number_at<std::uint32_t>(read_exactly(archive, place, 4), 0) == signature;
  };
  if (end.has_locator) {
    constexpr std::uint64_t records = zip64_end_size + zip64_locator_size;
    if (has(end.zip64_offset, zip64_end_signature) || end.position < records) return 0;
    const std::uint64_t place = end.position - records;
    return place > end.zip64_offset && has(place, zip64_end_signature) ? place - end.zip64_offset : 0;
  }
  if (end.entries == 0 || end.size > end.position) return 0;
  // Before the end record and not where it says: the bytes before may be an archive too, with a directory there.
  const std::uint64_t place = end.position - end.size;
  return place > end.offset && has(place, central_signature) ? place - end.offset : 0;
}

std::unique_ptr<StoredFile> without_prefix(std::unique_ptr<StoredFile> archive) {
  class Rest final : public StoredFile {
   public:
    Rest(std::unique_ptr<StoredFile> whole, std::uint64_t start) : whole_(std::move(whole)), start_(start) {}
    [[nodiscard]] std::uint64_t size() const noexcept override { return whole_->size() - start_; }
    std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
      return whole_->read_at(start_ + offset, buffer);
    }

   private:
    std::unique_ptr<StoredFile> whole_;
    std::uint64_t start_;
  };
  const std::uint64_t start = prefix_length(*archive);
  return start == 0 ? std::move(archive) : std::make_unique<Rest>(std::move(archive), start);
}

namespace {

/// Bytes that are to be read in the place of others.
using Patches = std::map<std::uint64_t, std::string>;

bool is_readable_utf8(std::string_view name) {
  const bool has_control = std::ranges::any_of(name, [](unsigned char byte) { return byte < 0x20; });
  return !has_control && to_utf8(from_utf8(name)) == name;
}

void add_patches(const DirectoryEntry& entry, std::uint64_t place, Patches& patches) {
  const std::string_view header = entry.header;
  const std::string_view name = header.substr(central_header_size, entry.name_length());
  const auto flags = number_at<std::uint16_t>(header, 8);
  if ((flags & utf8_flag) != 0 && !is_readable_utf8(name)) {
    patches[place + 8] = {header[8], static_cast<char>(header[9] & ~(utf8_flag >> 8U))};
  }
  std::size_t at = central_header_size + entry.name_length();
  const std::size_t end = at + entry.extra_length();
  while (end - at >= 4) {
    const std::size_t rest = end - at - 4;
    const std::size_t length = number_at<std::uint16_t>(header, at + 2);
    if (length > rest) {
      patches[place + at] = {'\xFE', '\xFF', static_cast<char>(rest & 0xFFU), static_cast<char>(rest >> 8U)};
      return;
    }
    at += 4 + length;
  }
  if (at < end) patches[place + at] = std::string(end - at, '\0');
}

/// A file in which some bytes are others.
class PatchedFile final : public StoredFile {
 public:
  PatchedFile(std::unique_ptr<StoredFile> whole, Patches patches)
      : whole_(std::move(whole)), patches_(std::move(patches)) {}
  [[nodiscard]] std::uint64_t size() const noexcept override { return whole_->size(); }
  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    constexpr std::uint64_t longest = 4;
    const std::size_t count = whole_->read_at(offset, buffer);
    for (auto patch = patches_.lower_bound(offset - std::min(offset, longest));
         patch != patches_.end() && patch->first < offset + count; ++patch) {
      for (std::size_t i = 0; i < patch->second.size(); ++i) {
        const std::uint64_t at = patch->first + i;
        if (at >= offset && at < offset + count) buffer[static_cast<std::size_t>(at - offset)] = patch->second[i];
      }
    }
    return count;
  }

 private:
  std::unique_ptr<StoredFile> whole_;
  Patches patches_;
};

}  // namespace

std::unique_ptr<StoredFile> with_readable_headers(std::unique_ptr<StoredFile> archive) {
  Patches patches;
  try {
    const std::uint64_t start = 0;
    const Directory directory = read_directory(*archive, {&start, 1});
    std::uint64_t place = directory.start;
    for (const DirectoryEntry& entry : directory.entries) {
      add_patches(entry, place, patches);
      place += entry.header.size();
    }
  } catch (const Error&) {
    return archive;  // It is reported when it is opened.
  }
  return patches.empty() ? std::move(archive) : std::make_unique<PatchedFile>(std::move(archive), std::move(patches));
}

std::uint32_t volumes_before(StoredFile& last_volume) {
  const End end = read_end(last_volume);
  return end.volume == full16 && end.has_locator ? end.zip64_volume : end.volume;
}

Directory read_directory(StoredFile& archive, std::span<const std::uint64_t> volume_starts) {
  End end = read_end(archive);
  Directory directory;
  directory.is_zip64 = end.has_locator;
  if (end.has_locator) read_zip64_end(archive, volume_starts, end);
  if (volume_starts.size() > 1 && end.volume + 1 != volume_starts.size()) {
    throw Error(Code::bad_media, "the set has another number of volumes");
  }
  directory.comment = std::move(end.comment);
  directory.start = placed(start_of(volume_starts, end.directory_volume), end.offset);
  if (placed(directory.start, end.size) > end.position) throw Error(Code::bad_structure, "the directory has no place");
  if (end.entries > end.size / central_header_size) throw Error(Code::bad_structure, "the directory is too small");
  HeaderReader reader(archive, directory.start);
  directory.entries.reserve(static_cast<std::size_t>(end.entries));
  for (std::uint64_t i = 0; i < end.entries; ++i) directory.entries.push_back(read_entry(reader, volume_starts));
  return directory;
}

void require_separate_entries(const Directory& directory) {
  struct Place {
    std::uint64_t offset;
    std::uint64_t size;
  };
  std::vector<Place> places;
  places.reserve(directory.entries.size() + 1);
  for (const DirectoryEntry& entry : directory.entries) {
    places.push_back({entry.offset, placed(local_header_size + entry.name_length(), entry.packed_size)});
  }
  std::ranges::sort(places, {}, &Place::offset);
  places.push_back({directory.start, 0});
  for (std::size_t i = 0; i + 1 < places.size(); ++i) {
    if (placed(places[i].offset, places[i].size) <= places[i + 1].offset) continue;
    const bool is_last = i + 2 == places.size();
    throw Error(is_last ? Code::unexpected_end : Code::bad_structure, "entries lie over one another");
  }
}

}  // namespace talutil::archives
