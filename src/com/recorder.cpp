#include "com/recorder.hpp"

#include "calling/json_writer.hpp"
#include "com/dispatch_object.hpp"

namespace talutil::com {

namespace {

/// Both ask for the size first, because there is usually nothing to read, and every start of the library looks.
std::wstring file_in_environment() {
  constexpr const wchar_t* name = L"TALUTIL_RECORD";
  const DWORD size = GetEnvironmentVariableW(name, nullptr, 0);
  std::wstring path(size, L'\0');
  if (size != 0) path.resize(GetEnvironmentVariableW(name, path.data(), size));
  return path;
}

std::wstring file_in_registry() {
  DWORD bytes = 0;
  const auto read = [&bytes](wchar_t* text) {
    return RegGetValueW(HKEY_CURRENT_USER, L"Software\\TALUtil", L"Record", RRF_RT_REG_SZ, nullptr, text, &bytes);
  };
  if (read(nullptr) != ERROR_SUCCESS) return {};
  std::wstring path(bytes / sizeof(wchar_t), L'\0');
  const bool is_read = read(path.data()) == ERROR_SUCCESS && bytes >= sizeof(wchar_t);
  path.resize(is_read ? bytes / sizeof(wchar_t) - 1 : 0);
  return path;
}

}  // namespace

std::unique_ptr<Recorder> Recorder::start() noexcept {
  try {
    std::wstring path = file_in_environment();
    if (path.empty()) path = file_in_registry();
    if (path.empty()) return nullptr;
    // With this right alone, the system puts every write at the end, whichever process makes it.
    const HANDLE file =
        CreateFileW(path.c_str(), FILE_APPEND_DATA, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                    OPEN_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
    if (file == INVALID_HANDLE_VALUE) {
      OutputDebugStringW((L"TALUtil: cannot record calls to " + path + L"; check TALUTIL_RECORD\n").c_str());
      return nullptr;
    }
    return std::make_unique<Recorder>(file);
  } catch (const std::bad_alloc&) {
    return nullptr;
  }
}

Recorder::~Recorder() { stop(); }

void Recorder::stop() noexcept {
  const std::lock_guard lock(mutex_);
  if (file_ != INVALID_HANDLE_VALUE) CloseHandle(std::exchange(file_, INVALID_HANDLE_VALUE));
}

void Recorder::write(const std::string& line) noexcept {
  const std::lock_guard lock(mutex_);
  if (file_ == INVALID_HANDLE_VALUE) return;
  DWORD written = 0;
  const bool fits = line.size() <= MAXDWORD;
  if (fits && WriteFile(file_, line.data(), static_cast<DWORD>(line.size()), &written, nullptr) != FALSE &&
      written == line.size()) {
    return;
  }
  OutputDebugStringW(L"TALUtil: cannot record any more calls: writing the file failed\n");
  stop();
}

Recorder::Known Recorder::known(const void* identity, bool is_ours) {
  const std::lock_guard lock(mutex_);
  const auto [place, is_new] = objects_.try_emplace(identity, Known{last_ + 1, is_ours});
  if (is_new) ++last_;
  return place->second;
}

std::int32_t Recorder::number_of(const void* identity) {
  const std::lock_guard lock(mutex_);
  const auto found = objects_.find(identity);
  return found == objects_.end() || !found->second.is_ours ? 0 : found->second.number;
}

void Recorder::give_number(const void* identity) noexcept {
  try {
    static_cast<void>(known(identity, true));
  } catch (const std::bad_alloc&) {
    stop();
  }
}

void Recorder::created(std::string_view class_name, const void* identity) noexcept {
  try {
    // The address may have been that of an object of the host's, whose end is not known here.
    released(identity);
    write(calling::creation_line(GetCurrentProcessId(), class_name, known(identity, true).number));
  } catch (const std::bad_alloc&) {
    stop();
  }
}

void Recorder::released(const void* identity) noexcept {
  try {
    const std::int32_t number = number_of(identity);
    {
      const std::lock_guard lock(mutex_);
      objects_.erase(identity);
    }
    if (number != 0) write(calling::release_line(GetCurrentProcessId(), number));
  } catch (const std::bad_alloc&) {
    stop();
  }
}

void Recorder::append(std::string& out, const ObjectRef& object) {
  const void* const theirs = identity_of_host_object(object);
  const Known found = theirs == nullptr ? known(object.get(), true) : known(theirs, false);
  out += found.is_ours ? "{\"object\": " : "{\"host_object\": ";
  calling::append_number(out, found.number);
  out += '}';
}

void RecordedCall::begin(const void* identity, const Member& member, std::span<const Argument> arguments) {
  record_.emplace(calling::CallRecord::Origin{GetCurrentProcessId(), recorder_.number_of(identity)}, member, arguments,
                  recorder_);
}

void RecordedCall::write(std::chrono::steady_clock::duration time) {
  recorder_.write(std::move(*record_).line(std::chrono::duration_cast<std::chrono::microseconds>(time).count()));
}

}  // namespace talutil::com
