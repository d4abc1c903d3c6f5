#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "automation/text.hpp"

struct sqlite3;
struct sqlite3_stmt;

namespace talutil::posix {

/// The registry hive of the user where the platform has no registry: keys with named values, in one SQLite file that
/// every process of the user shares. Keys and names are found without case and keep the spelling they were first given.
///
/// The file is opened at the first use. Writes wait for those of others (at most ten seconds) and are complete when the
/// call returns. Whatever SQLite refuses raises 57 with a description that names the file and the reason.
class Hive {
 public:
  struct Value {
    std::uint32_t type = 0;
    std::string data;
  };

  struct NamedValue {
    Text key;
    Text name;
    Value value;
  };

  explicit Hive(std::string path);
  Hive(const Hive&) = delete;
  Hive& operator=(const Hive&) = delete;
  ~Hive();

  [[nodiscard]] std::optional<Value> value(TextView key, TextView name);
  void put(TextView key, TextView name, const Value& value);

  /// All values of a key and of the keys below it, by key and name.
  [[nodiscard]] std::vector<NamedValue> values_below(TextView key);

  /// Whether a key was added, or it or one below it has a value.
  [[nodiscard]] bool has_key(TextView key);

  /// Makes a key that exists without values; one that exists stays as it is.
  void add_key(TextView key);

  [[nodiscard]] const std::string& path() const noexcept { return path_; }

  /// The user's own: TALUTIL_HIVE, or talutil/hive.db in the user's data folder.
  [[nodiscard]] static std::string default_path();

 private:
  struct Close {
    void operator()(sqlite3* database) const noexcept;
  };
  struct Finalize {
    void operator()(sqlite3_stmt* statement) const noexcept;
  };
  using Statement = std::unique_ptr<sqlite3_stmt, Finalize>;

  void open();
  [[noreturn]] void fail() const;
  void require(int status, int expected) const;
  [[nodiscard]] Statement prepare(const char* sql) const;
  void bind(const Statement& statement, int place, std::string_view text) const;
  /// A key as ?1, and the bounds of the keys below it as ?2 and ?3.
  void bind_tree(const Statement& statement, TextView key) const;
  [[nodiscard]] sqlite3_stmt* start(Statement& statement, const char* sql);

  std::string path_;
  std::unique_ptr<sqlite3, Close> database_;
  Statement select_;
  Statement insert_;
};

}  // namespace talutil::posix
