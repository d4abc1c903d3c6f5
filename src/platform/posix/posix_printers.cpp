#include "platform/posix/posix_printers.hpp"

#include <spawn.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <string>

#include "automation/run_time_error.hpp"
#include "documents/pdf_writer.hpp"
#include "platform/posix/posix_files.hpp"

extern char** environ;

namespace talutil::posix {

namespace {

/// A file that the destructor deletes.
class TemporaryFile {
 public:
  TemporaryFile() {
    const int descriptor = mkstemps(path_.data(), 4);
    if (descriptor < 0) raise(ErrorNumber::path_file_access);
    close(descriptor);
  }
  TemporaryFile(const TemporaryFile&) = delete;
  TemporaryFile& operator=(const TemporaryFile&) = delete;
  ~TemporaryFile() { unlink(path_.c_str()); }

  [[nodiscard]] const std::string& path() const noexcept { return path_; }

 private:
  std::string path_ = "/tmp/talutil-XXXXXX.pdf";
};

const char* sides_of(std::int32_t duplex) noexcept {
  switch (duplex) {
    case 2:
      return "sides=two-sided-long-edge";
    case 3:
      return "sides=two-sided-short-edge";
    default:
      return "sides=one-sided";
  }
}

}  // namespace

bool PosixPrinters::print(const Document& document, const PrintSettings& settings) {
  const TemporaryFile file;
  PosixFiles files;
  write_pdf(document, {.title = settings.title, .author = {}, .subject = {}, .creator = {}}, fonts_, files,
            from_utf8(file.path()));
  std::string path = file.path();
  std::string title = to_utf8(settings.title);
  std::string sides = sides_of(settings.duplex);
  std::array<char*, 7> arguments{const_cast<char*>("lp"),
                                 const_cast<char*>("-t"),
                                 title.data(),
                                 const_cast<char*>("-o"),
                                 sides.data(),
                                 path.data(),
                                 nullptr};
  pid_t child = 0;
  int status = 0;
  const bool is_started = posix_spawnp(&child, "lp", nullptr, nullptr, arguments.data(), environ) == 0;
  if (!is_started || waitpid(child, &status, 0) != child || status != 0) {
    throw RunTimeError(ErrorNumber::printer_error,
                       is_started ? u"Printer error: \"lp\" did not take the document; see \"lpstat -p -d\""
                                  : u"Printer error: there is no \"lp\" to print with; export the document instead");
  }
  return true;
}

}  // namespace talutil::posix
