#pragma once

#include <cstdint>
#include <functional>
#include <vector>

#include "automation/text.hpp"
#include "cli/failure.hpp"

namespace talutil::cli {

/// The input itself cannot be read on, unlike a single row.
class InputFailure : public Failure {
 public:
  explicit InputFailure(const Failure& failure) : Failure(failure) {}
};

/// Appends the next piece of an input to a text; returns false at its end.
using TextSource = std::function<bool(Text& text)>;

/// Reads the rows of a table; the first row has the names of the columns.
class RowReader {
 public:
  virtual ~RowReader() = default;

  /// Reads the next row; returns false at the end. Fails with the line number for a row that cannot be read; the next
  /// call then goes on with the following line.
  virtual bool read(std::vector<Text>& row) = 0;

  /// The line of the input, from 1, on which the most recently read row begins.
  [[nodiscard]] virtual std::size_t line() const noexcept = 0;

  /// That row as it is in the input, without its line end. Valid until the next row is read.
  [[nodiscard]] virtual TextView raw() const noexcept = 0;
};

/// The text of an input of which only the part from a position on is still needed.
class PieceBuffer {
 public:
  explicit PieceBuffer(TextSource source) : source_(std::move(source)) {}

  /// Drops the text before a position and appends at least as much as is left, so that whoever needs more does not look
  /// through the same text again for every piece. Returns false if there was nothing more. Throws
  /// InputFailure, also for a row that is too long.
  bool fetch(std::size_t from, std::size_t line);

  [[nodiscard]] const Text& text() const noexcept { return text_; }
  [[nodiscard]] bool has_ended() const noexcept { return has_ended_; }

 private:
  TextSource source_;
  Text text_;
  bool has_ended_ = false;
};

}  // namespace talutil::cli
