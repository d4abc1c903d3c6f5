#include "library/library.hpp"
#include "library/orv_utils.hpp"
#include "services/sequential_file.hpp"

namespace talutil {

namespace {

/// A number of the clock with zeros before it.
Text padded(std::int32_t number, std::size_t width) {
  const Text digits = number_to_text(number);
  return digits.size() < width ? Text(width - digits.size(), u'0') + digits : digits;
}

/// "DDMMYYYYHHMMSS".
Text time_stamp(const DateParts& now) {
  return padded(now.day, 2) + padded(now.month, 2) + padded(now.year, 4) + padded(now.hour, 2) + padded(now.minute, 2) +
         padded(now.second, 2);
}

}  // namespace

void ORVUtils::AppendEventLog(const Text& sEventName, const Text& sEventForm) {
  if (settings().EventLog == 0) return;
  const Text stamp = time_stamp(parts_of(library_.platform().clock.now()));
  const Text line = settings().sUserName + u':' + stamp + u':' + sEventName + u':' + sEventForm;
  // The folder's own last separator is doubled, which the file system accepts.
  library_.platform().files.append(settings().sORVPath + u"\\EventLog.txt", file_line(line));
}

}  // namespace talutil
