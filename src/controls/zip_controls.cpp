#include "controls/zip_controls.hpp"

#include <algorithm>
#include <array>
#include <limits>
#include <new>

namespace talutil {

namespace {

using archives::Code;

// Settings that hosts use but that have no effect here.
constexpr std::array<std::int32_t, 30> kept_by_zip = {6,  7,  8,  9,  10, 11, 12, 13, 14, 15, 16, 17, 18, 19, 20,
                                                      21, 22, 23, 24, 26, 27, 28, 29, 30, 31, 32, 33, 41, 42, 44};
constexpr std::array<std::int32_t, 30> kept_by_unzip = {5,  7,  8,  9,  11, 12, 13, 14, 15, 16, 17, 18, 19, 20, 22,
                                                        23, 25, 26, 28, 29, 30, 31, 32, 33, 36, 37, 39, 41, 42, 43};

}  // namespace

void ArchiveControl::run(const std::function<void(archives::Progress& progress)>& work) {
  if (is_busy_) {
    ErrorCode = static_cast<std::int16_t>(Code::busy);
    ErrorText = u"another action of this control is still at work";
    return;
  }
  is_busy_ = true;
  last_watched_ = {};
  Code code = Code::ok;
  Text text;
  try {
    archives::Progress progress(
        [this](std::uint64_t done, std::uint64_t total, TextView name) { return watch(done, total, name); });
    work(progress);
  } catch (const archives::Error& error) {
    code = error.code();
    text = from_utf8(error.what());
  } catch (const std::bad_alloc&) {
    code = Code::out_of_memory;
  } catch (const std::exception& error) {
    code = Code::internal;
    text = from_utf8(error.what());
  }
  is_busy_ = false;
  ErrorCode = static_cast<std::int16_t>(code);
  ErrorText = std::move(text);
}

bool ArchiveControl::watch(std::uint64_t done, std::uint64_t total, TextView name) {
  constexpr std::chrono::milliseconds pause{50};
  const auto now = std::chrono::steady_clock::now();
  if (now - last_watched_ < pause && done < total) return true;
  last_watched_ = now;
  // On a request to quit, nobody is left to wait for the archive.
  if (!platform_.message_pump.handle_waiting()) return false;
  const auto* const handler = OnProgress.get_if<ObjectRef>();
  if (handler == nullptr || *handler == nullptr) return true;
  const ObjectRef kept_alive = *handler;
  try {
    const std::array<Variant, 3> arguments{static_cast<double>(done), static_cast<double>(total), Variant(name)};
    const Variant answer = kept_alive->invoke(default_member, Access::call, arguments);
    return answer.to_boolean(platform_.computer.locale()) == Boolean(false);
  } catch (const RunTimeError&) {
    return false;
  }
}

archives::PasswordQuestion ArchiveControl::question() const {
  return [this](const Text& entry, bool was_wrong) {
    const Text prompt = (was_wrong ? u"That is not the password of " : u"Password of ") + entry + u":";
    return platform_.input_boxes.ask(prompt, u"Encrypted archive", Entry::masked);
  };
}

std::optional<Variant> ArchiveControl::use_kept(std::int32_t member, Access access, std::span<const Variant> arguments,
                                                std::span<const std::int32_t> kept) {
  if (std::ranges::find(kept, member) == kept.end()) return std::nullopt;
  if (access != Access::put) return kept_[member];
  if (arguments.size() != 1) raise(ErrorNumber::wrong_argument_count);
  kept_[member] = arguments.front();
  return Variant();
}

Variant ZipControl::invoke(std::int32_t member, Access access, std::span<const Variant> arguments) {
  if (auto kept = use_kept(member, access, arguments, kept_by_zip)) return std::move(*kept);
  Variant value = TableObject::invoke(member, access, arguments);
  if (member == action && access == Access::put) act();
  return value;
}

void ZipControl::act() {
  if (Action == 0) return;
  run([this](archives::Progress& progress) {
    if (Action != add) throw archives::Error(Code::bad_parameters, "there is no such action; 4 packs");
    archives::PackingOptions options;
    options.recurse = static_cast<bool>(RecurseSubdirectories);
    options.keep_folders = !static_cast<bool>(NoDirectoryNames);
    options.aes = static_cast<bool>(StrongEncryption);
    options.level = CompressionLevel;
    if (static_cast<bool>(Encrypt)) options.password = Password;
    options.comment = Comment;
    if (MultiVolume == 1) options.volume_size = static_cast<std::uint64_t>(std::max(VolumeSize, 0));
    // Copies, because a host that gets to run meanwhile may change the settings.
    const Text archive = ZIPFile;
    const Text items = ItemList;
    archives::pack(archive, items, options, platform().folders, progress);
  });
}

Variant UnzipControl::invoke(std::int32_t member, Access access, std::span<const Variant> arguments) {
  if (auto kept = use_kept(member, access, arguments, kept_by_unzip)) return std::move(*kept);
  Variant value = TableObject::invoke(member, access, arguments);
  if (member == action && access == Access::put) act();
  return value;
}

void UnzipControl::act() {
  if (Action == 0) return;
  run([this](archives::Progress& progress) {
    const std::int32_t wanted = Action;
    if (wanted != look && wanted != test && wanted != extract) {
      throw archives::Error(Code::bad_parameters, "there is no such action; 1 looks, 7 tests, 8 extracts");
    }
    archives::UnpackingOptions options;
    options.items = ItemList;
    options.password = Password;
    options.overwrite = static_cast<bool>(Overwrite);
    options.keep_folders = static_cast<bool>(KeepDirectories);
    options.largest_ratio = static_cast<std::uint32_t>(std::max(MaxRatio, 1));
    const Text target = Destination;
    archives::Archive archive(ZIPFile, platform().folders);
    EntryCount =
        static_cast<std::int32_t>(std::min<std::uint64_t>(archive.count(), std::numeric_limits<std::int32_t>::max()));
    Comment = archive.comment();
    if (wanted == test) archive.test(options, question(), progress);
    if (wanted == extract) archive.extract(target, options, platform().folders, platform().files, question(), progress);
  });
}

}  // namespace talutil
