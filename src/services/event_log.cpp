#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "services/sequential_file.hpp"

namespace talutil {

void ORVUtils::AppendEventLog(const Text& sEventName, const Text& sEventForm) {
  if (settings().EventLog == 0) return;
  const Text stamp = format_date(library_.platform().clock.now(), u"DDMMYYYYHHMMSS");
  const Text line = settings().sUserName + u':' + stamp + u':' + sEventName + u':' + sEventForm;
  // This doubles the separator if the folder ends in one, which the file system accepts.
  const Platform& platform = library_.platform();
  platform.files.append(settings().sORVPath + u"\\EventLog.txt", file_line(platform.code_page, line));
}

}  // namespace talutil
