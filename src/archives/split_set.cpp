#include "archives/split_set.hpp"

#include <algorithm>
#include <array>
#include <numeric>
#include <optional>

#include "archives/file_errors.hpp"
#include "archives/little_endian.hpp"
#include "automation/numbers.hpp"

namespace talutil::archives {

namespace {

constexpr std::uint32_t full32 = 0xFFFFFFFF;
constexpr std::uint16_t full16 = 0xFFFF;
constexpr TextView first_piece = u".001";

Text number_text(std::uint32_t number, std::size_t digits) {
  const Text text = number_to_text(static_cast<std::int32_t>(number));
  return Text(digits - std::min(digits, text.size()), u'0') + text;
}

TextView stem_of(TextView name) { return name.substr(0, name.find_last_of(u'.')); }

/// Several files, read as one.
class JoinedFiles : public StoredFile {
 public:
  explicit JoinedFiles(std::vector<std::unique_ptr<StoredFile>> files) : files_(std::move(files)) {
    for (const auto& file : files_) starts_.push_back(starts_.back() + file->size());
  }

  [[nodiscard]] std::uint64_t size() const noexcept override { return starts_.back(); }

  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    std::size_t done = 0;
    while (done < buffer.size() && offset + done < size()) {
      const auto next = std::ranges::upper_bound(starts_, offset + done);
      const auto which = static_cast<std::size_t>(next - starts_.begin()) - 1;
      const auto room =
          static_cast<std::size_t>(std::min<std::uint64_t>(*next - (offset + done), buffer.size() - done));
      const std::size_t count = files_[which]->read_at(offset + done - starts_[which], buffer.subspan(done, room));
      if (count == 0) throw Error(Code::bad_media, "a volume is too short");
      done += count;
    }
    return done;
  }

  [[nodiscard]] std::span<const std::uint64_t> starts() const noexcept {
    return std::span(starts_).first(starts_.size() - 1);
  }

 private:
  std::vector<std::unique_ptr<StoredFile>> files_;
  std::vector<std::uint64_t> starts_{0};
};

/// The directory header of an entry that has moved; its zip64 field is rebuilt as needed.
std::string placed_header(const DirectoryEntry& entry, std::uint64_t offset, std::uint32_t volume) {
  std::string header = entry.header.substr(0, central_header_size + entry.name_length());
  std::string_view extra = std::string_view(entry.header).substr(header.size(), entry.extra_length());
  const std::string_view comment = std::string_view(entry.header).substr(header.size() + extra.size());
  std::string wide;
  const auto put = [&]<class Stored, class Wide>(std::size_t place, Stored full, Wide value) {
    if (value >= full) append_number(wide, value);
    put_number(header, place, value >= full ? full : static_cast<Stored>(value));
  };
  put(24, full32, entry.size);
  put(20, full32, entry.packed_size);
  put(42, full32, offset);
  put(34, full16, volume);

  std::string kept;
  if (!wide.empty()) {
    append_number(kept, zip64_extra);
    append_number(kept, static_cast<std::uint16_t>(wide.size()));
    kept += wide;
    constexpr std::uint16_t zip64_version = 45;
    put_number(header, 6, std::max(number_at<std::uint16_t>(header, 6), zip64_version));
  }
  while (extra.size() >= 4) {
    const std::size_t length = std::min<std::size_t>(4U + number_at<std::uint16_t>(extra, 2), extra.size());
    if (number_at<std::uint16_t>(extra, 0) != zip64_extra) kept += extra.substr(0, length);
    extra.remove_prefix(length);
  }
  put_number(header, 30, static_cast<std::uint16_t>(kept.size()));
  return header.append(kept).append(comment);
}

/// The contents of the records at the end of a directory.
struct DirectoryPlace {
  std::uint64_t entries = 0;
  std::uint64_t entries_here = 0;  ///< In the last volume only.
  std::uint64_t size = 0;
  std::uint64_t offset = 0;
  std::uint64_t end = 0;  ///< The position of the records in the last volume.
  std::uint32_t volume = 0;
  std::uint32_t last_volume = 0;
  bool is_zip64 = false;
};

std::string end_records(const DirectoryPlace& place, std::string_view comment) {
  std::string bytes;
  if (place.is_zip64 || place.entries >= full16 || place.size >= full32 || place.offset >= full32 ||
      place.last_volume >= full16) {
    constexpr std::uint64_t record_rest = 44;
    constexpr std::uint16_t version = 45;
    append_number(bytes, zip64_end_signature);
    append_number(bytes, record_rest);
    append_number(bytes, version);
    append_number(bytes, version);
    append_number(bytes, place.last_volume);
    append_number(bytes, place.volume);
    append_number(bytes, place.entries_here);
    append_number(bytes, place.entries);
    append_number(bytes, place.size);
    append_number(bytes, place.offset);
    append_number(bytes, zip64_locator_signature);
    append_number(bytes, place.last_volume);
    append_number(bytes, place.end);
    append_number(bytes, place.last_volume + 1);
  }
  const auto narrow = [&]<class Stored>(Stored full, std::uint64_t value) {
    append_number(bytes, static_cast<Stored>(std::min<std::uint64_t>(value, full)));
  };
  append_number(bytes, end_signature);
  narrow(full16, place.last_volume);
  narrow(full16, place.volume);
  narrow(full16, place.entries_here);
  narrow(full16, place.entries);
  narrow(full32, place.size);
  narrow(full32, place.offset);
  append_number(bytes, static_cast<std::uint16_t>(comment.size()));
  return bytes.append(comment);
}

/// A set presented as a single archive: the volumes up to the directory, then the directory as an archive in one piece
/// would have it.
class WholeSet final : public StoredFile {
 public:
  explicit WholeSet(std::vector<std::unique_ptr<StoredFile>> volumes) : volumes_(std::move(volumes)) {
    const Directory directory = read_directory(volumes_, volumes_.starts());
    require_separate_entries(directory);
    DirectoryPlace place;
    place.entries = place.entries_here = directory.entries.size();
    place.offset = cut_ = directory.start;
    for (const DirectoryEntry& entry : directory.entries) tail_ += placed_header(entry, entry.offset, 0);
    place.size = tail_.size();
    place.end = cut_ + tail_.size();
    tail_ += end_records(place, directory.comment);
  }

  [[nodiscard]] std::uint64_t size() const noexcept override { return cut_ + tail_.size(); }

  std::size_t read_at(std::uint64_t offset, std::span<char> buffer) override {
    std::size_t done = 0;
    if (offset < cut_) {
      done = volumes_.read_at(
          offset, buffer.first(static_cast<std::size_t>(std::min<std::uint64_t>(buffer.size(), cut_ - offset))));
      offset += done;
    }
    if (offset < cut_ || offset >= size()) return done;
    const std::string_view rest = std::string_view(tail_).substr(static_cast<std::size_t>(offset - cut_));
    return done + rest.copy(buffer.data() + done, buffer.size() - done);
  }

 private:
  JoinedFiles volumes_;
  std::uint64_t cut_ = 0;
  std::string tail_;
};

std::vector<std::unique_ptr<StoredFile>> open_pieces(Folder& folder, const Text& name) {
  std::vector<std::unique_ptr<StoredFile>> pieces;
  for (std::uint32_t number = 1;; ++number) {
    const Text piece = Text(stem_of(name)) + u"." + number_text(number, 3);
    if (!folder.facts(piece)) return pieces;
    pieces.push_back(with_code(Code::bad_media, piece, [&] { return folder.open(piece); }));
  }
}

class VolumeWriter {
 public:
  VolumeWriter(Folder& folder, TextView name, std::uint64_t limit) : folder_(folder), name_(name), limit_(limit) {
    std::string mark;
    append_number(mark, descriptor_signature);
    begin_volume();
    write(mark);
  }

  [[nodiscard]] std::uint32_t volume() const noexcept { return static_cast<std::uint32_t>(volumes_.size()) - 1; }
  [[nodiscard]] std::uint64_t offset() const noexcept { return volumes_.back()->size(); }

  /// Writes bytes that must not be cut: begins the next volume if this one has no room for them.
  void write_whole(std::string_view bytes) {
    if (bytes.size() > limit_ - mark_size) {
      throw Error(Code::bad_volume_size, "a header is larger than a volume; give volumes more room");
    }
    make_room(bytes.size());
    write(bytes);
  }

  void make_room(std::size_t count) {
    if (offset() + count > limit_) begin_volume();
  }

  void write_cut(std::string_view bytes) {
    while (!bytes.empty()) {
      if (offset() >= limit_) begin_volume();
      const auto room = static_cast<std::size_t>(std::min<std::uint64_t>(bytes.size(), limit_ - offset()));
      write(bytes.substr(0, room));
      bytes.remove_prefix(room);
    }
  }

  void finish() {
    with_code(Code::cannot_write, [&] { volumes_.back()->finish(nullptr); });
  }

  /// Names all volumes. The last one gets the archive's name, which is why this waits until all are written.
  void take_names() {
    with_code(Code::cannot_create, [&] {
      for (std::size_t i = 0; i + 1 < volumes_.size(); ++i) volumes_[i]->take_name();
      volumes_.back()->take_name(name_);
    });
  }

 private:
  static constexpr std::uint64_t mark_size = 4;

  void begin_volume() {
    with_code(Code::cannot_create, [&] {
      if (!volumes_.empty()) volumes_.back()->finish(nullptr);
      volumes_.push_back(folder_.create(volume_name(name_, static_cast<std::uint32_t>(volumes_.size()) + 1)));
    });
  }

  void write(std::string_view bytes) {
    with_code(Code::cannot_write, [&] { volumes_.back()->write_at(offset(), bytes); });
  }

  Folder& folder_;
  TextView name_;
  std::uint64_t limit_;
  std::vector<std::unique_ptr<NewFile>> volumes_;
};

/// Copies an archive into volumes, entry by entry, in the order of their positions.
class Splitter {
 public:
  Splitter(StoredFile& archive, VolumeWriter& writer, Progress& progress)
      : archive_(archive), writer_(writer), progress_(progress), directory_(read_directory(archive, whole)) {}

  void copy() {
    progress_.start(archive_.size());
    copy_entries();
    copy_directory();
  }

 private:
  static constexpr std::array<std::uint64_t, 1> whole{0};

  struct Place {
    std::uint32_t volume = 0;
    std::uint64_t offset = 0;
  };

  void copy_entries() {
    std::vector<std::size_t> order(directory_.entries.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::ranges::sort(order, {}, [this](std::size_t i) { return directory_.entries[i].offset; });
    places_.resize(order.size());
    std::uint64_t at = 0;
    for (std::size_t i = 0; i < order.size(); ++i) {
      const std::uint64_t next = i + 1 < order.size() ? directory_.entries[order[i + 1]].offset : directory_.start;
      at = copy_entry(directory_.entries[order[i]], at, next, places_[order[i]]);
    }
    flow(at, directory_.start);
  }

  /// Copies what precedes an entry and the entry itself; returns the position where it ends.
  std::uint64_t copy_entry(const DirectoryEntry& entry, std::uint64_t at, std::uint64_t next, Place& place) {
    flow(at, entry.offset);
    const std::string fixed = read_exactly(archive_, entry.offset, local_header_size);
    const std::uint64_t length =
        local_header_size + number_at<std::uint16_t>(fixed, 26) + number_at<std::uint16_t>(fixed, 28);
    writer_.write_whole(read_exactly(archive_, entry.offset, length));
    place = {writer_.volume(), writer_.offset() - length};
    const std::uint64_t data = entry.offset + length;
    flow(data, data + entry.packed_size);
    const std::uint64_t end = data + entry.packed_size;
    constexpr std::uint64_t longest_descriptor = 24;
    if (!entry.has_descriptor || next <= end || next - end > longest_descriptor) return end;
    writer_.write_whole(read_exactly(archive_, end, next - end));
    return next;
  }

  void copy_directory() {
    DirectoryPlace place;
    place.is_zip64 = directory_.is_zip64;
    place.entries = directory_.entries.size();
    for (std::size_t i = 0; i < places_.size(); ++i) {
      const std::string header = placed_header(directory_.entries[i], places_[i].offset, places_[i].volume);
      writer_.write_whole(header);
      if (i == 0) {
        place.volume = writer_.volume();
        place.offset = writer_.offset() - header.size();
      }
      if (writer_.volume() != place.last_volume) place.entries_here = 0;
      place.last_volume = writer_.volume();
      ++place.entries_here;
      place.size += header.size();
    }
    // The length of the records does not depend on the positions in them.
    const std::size_t length = end_records(place, directory_.comment).size();
    writer_.make_room(length);
    if (writer_.volume() != place.last_volume) place.entries_here = 0;
    place.last_volume = writer_.volume();
    place.end = writer_.offset();
    writer_.write_whole(end_records(place, directory_.comment));
  }

  void flow(std::uint64_t from, std::uint64_t to) {
    std::string buffer;
    while (from < to) {
      buffer.resize(static_cast<std::size_t>(std::min<std::uint64_t>(to - from, 1U << 18U)));
      if (archive_.read_at(from, buffer) != buffer.size()) throw Error(Code::cannot_read, "the archive was cut off");
      writer_.write_cut(buffer);
      from += buffer.size();
      progress_.advance(buffer.size(), {});
    }
  }

  StoredFile& archive_;
  VolumeWriter& writer_;
  Progress& progress_;
  Directory directory_;
  std::vector<Place> places_;
};

}  // namespace

void require_volume_size(std::uint64_t bytes) {
  if (bytes >= smallest_volume && bytes <= largest_volume) return;
  throw Error(Code::bad_volume_size, "a volume has 65,536 to 2,147,483,647 bytes");
}

Text volume_name(TextView archive, std::uint32_t number) {
  return Text(stem_of(archive)) + u".z" + number_text(number, 2);
}

std::unique_ptr<StoredFile> open_archive(Folder& folder, const Text& name) {
  const auto known = folder.facts(name);
  if (!known) throw Error(Code::missing, "there is no such file");
  if (known->kind != FileKind::file) throw Error(Code::cannot_open, "it is no file");
  if (name.ends_with(first_piece)) return std::make_unique<JoinedFiles>(open_pieces(folder, name));
  auto last = with_code(Code::cannot_open, [&] { return folder.open(name); });
  const std::uint32_t before = volumes_before(*last);
  if (before == 0) return last;
  std::vector<std::unique_ptr<StoredFile>> volumes;
  for (std::uint32_t number = 1; number <= before; ++number) {
    const Text volume = volume_name(name, number);
    volumes.push_back(with_code(Code::bad_media, volume, [&] { return folder.open(volume); }));
  }
  volumes.push_back(std::move(last));
  return std::make_unique<WholeSet>(std::move(volumes));
}

void split_archive(std::unique_ptr<NewFile> archive, Folder& folder, TextView name, std::uint64_t volume_size,
                   Progress& progress) {
  if (archive->size() <= volume_size) {
    with_code(Code::cannot_create, [&] {
      archive->finish(nullptr);
      archive->take_name();
    });
    return;
  }
  VolumeWriter writer(folder, name, volume_size);
  Splitter(*archive, writer, progress).copy();
  writer.finish();
  // Discards the archive in one piece and with it the lock on the file that has its name.
  archive.reset();
  writer.take_names();
}

}  // namespace talutil::archives
