#include "archives/unpacked_files.hpp"

#include <new>
#include <unordered_set>

#include "archives/file_errors.hpp"
#include "archives/packed_files.hpp"
#include "archives/passed_over.hpp"

namespace talutil::archives {

void Inflaters::inflate(const Deflated& entry, const std::function<void(std::string_view bytes)>& sink) {
  std::unique_ptr<Inflater> inflater = take();
  const auto size = static_cast<std::size_t>(entry.size);
  if (inflater->bytes.size() < size) inflater->bytes.resize(size);
  char* const bytes = inflater->bytes.data();
  std::size_t made = 0;
  const libdeflate_result result = libdeflate_deflate_decompress(inflater->decompressor.get(), entry.bytes.data(),
                                                                 entry.bytes.size(), bytes, size, &made);
  if (result != LIBDEFLATE_SUCCESS || made != size) throw Error(Code::bad_structure, "an entry is damaged");
  if (entry.checksum && libdeflate_crc32(0, bytes, size) != entry.checksum) {
    throw Error(Code::bad_structure, "a checksum is wrong");
  }
  sink({bytes, size});
  const std::lock_guard lock(mutex_);
  free_.push_back(std::move(inflater));
}

std::unique_ptr<Inflaters::Inflater> Inflaters::take() {
  const std::lock_guard lock(mutex_);
  if (free_.empty()) {
    auto made = std::make_unique<Inflater>();
    made->decompressor.reset(libdeflate_alloc_decompressor());
    if (!made->decompressor) throw std::bad_alloc();
    return made;
  }
  std::unique_ptr<Inflater> inflater = std::move(free_.back());
  free_.pop_back();
  return inflater;
}

UnpackedFiles::UnpackedFiles(Tasks& tasks, Progress& progress, PassOver pass_over)
    : tasks_(tasks), progress_(progress), pass_over_(std::move(pass_over)) {}

UnpackedFiles::~UnpackedFiles() {
  is_over_ = true;
  for (const auto& pending : pending_) {
    if (pending->task) pending->task->wait();
  }
}

void UnpackedFiles::add(File file, Deflated entry) {
  auto pending = std::make_unique<Pending>(Pending{.file = std::move(file), .entry = std::move(entry)});
  pending->in_memory = pending->entry.bytes.size() + pending->entry.size;
  begin(std::move(pending));
}

void UnpackedFiles::add(File file) {
  begin(std::make_unique<Pending>(Pending{.file = std::move(file), .is_written = true}));
}

void UnpackedFiles::begin(std::unique_ptr<Pending> pending) {
  // Each has a few files open. A process that is killed leaves no more temporary files than these.
  constexpr std::size_t most_files = 32;
  constexpr std::uint64_t most_in_memory = 2 * PackedFiles::longest_in_memory;
  while (pending_.size() == most_files || (!pending_.empty() && in_memory_ + pending->in_memory > most_in_memory)) {
    settle((pending_.size() + 1) / 2);
  }
  pending_.push_back(std::move(pending));
  Pending& last = *pending_.back();
  try {
    if (!last.is_written) last.task = tasks_.start([this, &last] { write(last); });
  } catch (...) {
    pending_.pop_back();
    throw;
  }
  in_memory_ += last.in_memory;
  if (tasks_.at_once() == 1) settle();
}

void UnpackedFiles::write(Pending& pending) {
  if (is_over_) return;
  inflaters_.inflate(pending.entry, [&](std::string_view bytes) {
    with_code(Code::cannot_write, [&] { pending.file.file->write_at(0, bytes); });
  });
  pending.entry.bytes = {};
  pending.file.file->begin_flush();
}

/// Does part of the work on an entry. Returns false if that has failed and the entry was passed over.
template <class Work>
bool UnpackedFiles::done_for(const Text& entry, Work&& work) {
  try {
    work();
    return true;
  } catch (const Error& error) {
    if (!concerns_one_entry(error.code())) throw;
    pass_over_(entry, error);
    return false;
  }
}

/// Waits for the first files and names them.
void UnpackedFiles::settle(std::size_t count) {
  std::vector<File> written;
  if (is_over_) return;
  try {
    for (; count > 0; --count) {
      const std::unique_ptr<Pending> first = std::move(pending_.front());
      pending_.pop_front();
      in_memory_ -= first->in_memory;
      const bool is_done = done_for(first->file.entry, [&] {
        if (first->is_written) return;
        first->task->finish();
        progress_.advance(first->file.facts.size, first->file.entry);
      });
      if (is_done) written.push_back(std::move(first->file));
    }
  } catch (...) {
    is_over_ = true;
    take_names(written);
    throw;
  }
  take_names(written);
}

void UnpackedFiles::take_names(std::vector<File>& files) {
  const auto for_each = [&](auto work) {
    for (File& file : files) {
      if (!file.file) continue;
      if (!done_for(file.entry, [&] { with_code(Code::cannot_create, [&] { work(file); }); })) file.file.reset();
    }
  };
  const auto flush_names = [&] {
    std::unordered_set<Text> folders;
    for (const File& file : files) {
      if (file.file && folders.insert(file.folder).second) file.file->flush_names();
    }
  };
  // All contents before the first name: the disk writes them at once.
  try {
    for_each([](File& file) { file.file->finish(&file.facts); });
    for_each([](File& file) { file.file->flush_contents(); });
    for_each([](File& file) { file.file->take_name_unflushed(); });
  } catch (...) {
    is_over_ = true;
    flush_names();
    throw;
  }
  flush_names();
}

}  // namespace talutil::archives
