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

/// The user's registry hive where the platform has no registry: keys with named values, in one SQLite file that all
/// processes of the user share. Keys and names are found regardless of case and keep their original spelling.
///
/// The file is opened on first use. Writes wait up to ten seconds for other writers and are complete when the call
/// returns. SQLite errors raise 57 with a description that names the file and the reason.
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

  /// Returns whether there was such a value.
  bool remove(TextView key, TextView name);

  /// All values of a key and of the keys below it, sorted by key and name.
  [[nodiscard]] std::vector<NamedValue> values_below(TextView key);

  /// Whether a key was added, or a value exists in it or below it.
  [[nodiscard]] bool has_key(TextView key);

  /// Adds a key without values; does nothing if it exists.
  void add_key(TextView key);

  [[nodiscard]] const std::string& path() const noexcept { return path_; }

  /// The user's hive: TALUTIL_HIVE, or talutil/hive.db in the user's data folder.
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
  void open_read_only();
  [[noreturn]] void fail() const;
  void require(int status, int expected) const;
  [[nodiscard]] Statement prepare(const char* sql) const;
  void bind(const Statement& statement, int place, std::string_view text) const;
  /// Binds the key as ?1, and the bounds of the keys below it as ?2 and ?3.
  void bind_tree(const Statement& statement, TextView key) const;
  [[nodiscard]] sqlite3_stmt* start(Statement& statement, const char* sql);

  std::string path_;
  std::unique_ptr<sqlite3, Close> database_;
  Statement select_;
  Statement insert_;
};

}  // namespace talutil::posix
