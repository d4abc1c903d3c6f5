#include "platform/posix/hive.hpp"

#include <fcntl.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>

#include "automation/run_time_error.hpp"
#include "platform/posix/data_folder.hpp"
#include "platform/posix/descriptor.hpp"

namespace talutil::posix {

namespace {

constexpr int longest_wait_in_milliseconds = 10'000;

/// The form of a key or name that is used for look-up.
std::string folded(TextView name) { return to_utf8(upper_case(name)); }

std::string column_bytes(sqlite3_stmt* statement, int column) {
  const void* const bytes = sqlite3_column_blob(statement, column);
  return {static_cast<const char*>(bytes),
          bytes == nullptr ? 0 : static_cast<std::size_t>(sqlite3_column_bytes(statement, column))};
}

Hive::Value column_value(sqlite3_stmt* statement, int column) {
  return {static_cast<std::uint32_t>(sqlite3_column_int64(statement, column)), column_bytes(statement, column + 1)};
}

}  // namespace

void Hive::Close::operator()(sqlite3* database) const noexcept { sqlite3_close(database); }

void Hive::Finalize::operator()(sqlite3_stmt* statement) const noexcept { sqlite3_finalize(statement); }

Hive::Hive(std::string path) : path_(std::move(path)) {}

Hive::~Hive() = default;

std::string Hive::default_path() {
  const std::string path = environment("TALUTIL_HIVE");
  return path.empty() ? data_folder() + "/hive.db" : path;
}

void Hive::fail() const {
  const char* const reason = database_ ? sqlite3_errmsg(database_.get()) : "there is no memory";
  throw RunTimeError(ErrorNumber::device_io_error,
                     u"Cannot use the settings in " + from_utf8(path_) + u": " + from_utf8(reason));
}

void Hive::require(int status, int expected) const {
  if (status != expected) fail();
}

Hive::Statement Hive::prepare(const char* sql) const {
  sqlite3_stmt* statement = nullptr;
  require(sqlite3_prepare_v2(database_.get(), sql, -1, &statement, nullptr), SQLITE_OK);
  return Statement(statement);
}

void Hive::bind(const Statement& statement, int place, std::string_view text) const {
  require(sqlite3_bind_blob64(statement.get(), place, text.data(), text.size(), SQLITE_TRANSIENT), SQLITE_OK);
}

void Hive::bind_tree(const Statement& statement, TextView key) const {
  const std::string whole = folded(key);
  bind(statement, 1, whole);
  // "]" is the character after "\".
  bind(statement, 2, whole + '\\');
  bind(statement, 3, whole + ']');
}

void Hive::open() {
  if (database_) return;
  if (access(path_.c_str(), R_OK) == 0 && access(path_.c_str(), W_OK) != 0) return open_read_only();
  std::error_code ignored;  // If this fails, SQLite reports below that it cannot open the file.
  std::filesystem::create_directories(std::filesystem::path(path_).parent_path(), ignored);
  // Only for the user, unlike other files; SQLite gives its own files the same rights.
  static_cast<void>(Descriptor(::open(path_.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, S_IRUSR | S_IWUSR)));
  sqlite3* handle = nullptr;
  const int status = sqlite3_open(path_.c_str(), &handle);
  database_.reset(handle);
  try {
    require(status, SQLITE_OK);
    sqlite3_busy_timeout(handle, longest_wait_in_milliseconds);
    // With a write-ahead log readers never wait for writers; changes survive a crash of the process, if not a power
    // cut.
    constexpr const char* preparation = R"(
        PRAGMA journal_mode = WAL;
        PRAGMA synchronous = NORMAL;
        CREATE TABLE IF NOT EXISTS hive_values (
          folded_key BLOB, folded_name BLOB, key BLOB, name BLOB, type INTEGER, data BLOB,
          PRIMARY KEY (folded_key, folded_name)) WITHOUT ROWID;
        CREATE TABLE IF NOT EXISTS hive_keys (folded_key BLOB PRIMARY KEY, key BLOB) WITHOUT ROWID;)";
    require(sqlite3_exec(handle, preparation, nullptr, nullptr, nullptr), SQLITE_OK);
  } catch (...) {
    database_.reset();
    throw;
  }
}

/// A store that this user may only read. Where its folder does not allow the write-ahead log's index either, nobody who
/// writes can be noticed, and the file is taken as it is.
void Hive::open_read_only() {
  const std::string folder = std::filesystem::path(path_).parent_path().string();
  const bool allows_index = access(folder.empty() ? "." : folder.c_str(), W_OK) == 0;
  std::string name = "file:";
  for (const char c : path_) {
    constexpr std::string_view special = "?#%";
    constexpr std::string_view digits = "0123456789ABCDEF";
    const auto code = static_cast<unsigned char>(c);
    if (special.find(c) == std::string_view::npos)
      name += c;
    else
      name.append(1, '%').append(1, digits[code >> 4U]).append(1, digits[code & 15U]);
  }
  name += allows_index ? "?mode=ro" : "?immutable=1";
  sqlite3* handle = nullptr;
  const int status = sqlite3_open_v2(name.c_str(), &handle, SQLITE_OPEN_READONLY | SQLITE_OPEN_URI, nullptr);
  database_.reset(handle);
  try {
    require(status, SQLITE_OK);
    sqlite3_busy_timeout(handle, longest_wait_in_milliseconds);
  } catch (...) {
    database_.reset();
    throw;
  }
}

sqlite3_stmt* Hive::start(Statement& statement, const char* sql) {
  open();
  if (!statement) statement = prepare(sql);
  sqlite3_reset(statement.get());
  return statement.get();
}

std::optional<Hive::Value> Hive::value(TextView key, TextView name) {
  sqlite3_stmt* const row =
      start(select_, "SELECT type, data FROM hive_values WHERE folded_key = ?1 AND folded_name = ?2");
  bind(select_, 1, folded(key));
  bind(select_, 2, folded(name));
  const int status = sqlite3_step(row);
  std::optional<Value> result;
  if (status == SQLITE_ROW)
    result = column_value(row, 0);
  else
    require(status, SQLITE_DONE);
  sqlite3_reset(row);
  return result;
}

void Hive::put(TextView key, TextView name, const Value& value) {
  sqlite3_stmt* const row = start(insert_,
                                  "INSERT INTO hive_values VALUES (?1, ?2, ?3, ?4, ?5, ?6) "
                                  "ON CONFLICT DO UPDATE SET type = ?5, data = ?6");
  bind(insert_, 1, folded(key));
  bind(insert_, 2, folded(name));
  bind(insert_, 3, to_utf8(key));
  bind(insert_, 4, to_utf8(name));
  require(sqlite3_bind_int64(row, 5, value.type), SQLITE_OK);
  bind(insert_, 6, value.data);
  const int status = sqlite3_step(row);
  // The reset discards the error message, so check first.
  require(status, SQLITE_DONE);
  sqlite3_reset(row);
}

bool Hive::remove(TextView key, TextView name) {
  open();
  const Statement statement = prepare("DELETE FROM hive_values WHERE folded_key = ?1 AND folded_name = ?2");
  bind(statement, 1, folded(key));
  bind(statement, 2, folded(name));
  require(sqlite3_step(statement.get()), SQLITE_DONE);
  return sqlite3_changes(database_.get()) > 0;
}

std::vector<Hive::NamedValue> Hive::values_below(TextView key) {
  open();
  const Statement statement = prepare(
      "SELECT key, name, type, data FROM hive_values "
      "WHERE folded_key = ?1 OR (folded_key >= ?2 AND folded_key < ?3) ORDER BY folded_key, folded_name");
  bind_tree(statement, key);
  std::vector<NamedValue> values;
  int status = SQLITE_DONE;
  while ((status = sqlite3_step(statement.get())) == SQLITE_ROW) {
    sqlite3_stmt* const row = statement.get();
    values.push_back({from_utf8(column_bytes(row, 0)), from_utf8(column_bytes(row, 1)), column_value(row, 2)});
  }
  require(status, SQLITE_DONE);
  return values;
}

bool Hive::has_key(TextView key) {
  open();
  const Statement statement = prepare(
      "SELECT 1 FROM hive_keys WHERE folded_key = ?1 OR (folded_key >= ?2 AND folded_key < ?3) UNION ALL "
      "SELECT 1 FROM hive_values WHERE folded_key = ?1 OR (folded_key >= ?2 AND folded_key < ?3) LIMIT 1");
  bind_tree(statement, key);
  const int status = sqlite3_step(statement.get());
  if (status != SQLITE_ROW) require(status, SQLITE_DONE);
  return status == SQLITE_ROW;
}

void Hive::add_key(TextView key) {
  open();
  const Statement statement = prepare("INSERT INTO hive_keys VALUES (?1, ?2) ON CONFLICT DO NOTHING");
  bind(statement, 1, folded(key));
  bind(statement, 2, to_utf8(key));
  require(sqlite3_step(statement.get()), SQLITE_DONE);
}

}  // namespace talutil::posix
