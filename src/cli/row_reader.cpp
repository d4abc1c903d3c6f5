#include "cli/row_reader.hpp"

namespace talutil::cli {

bool PieceBuffer::fetch(std::size_t from, std::size_t line) {
  // Far beyond any real row; without a limit, an unclosed quote would take the rest of any input into memory.
  constexpr std::size_t longest_row = std::size_t{1} << 28U;
  if (has_ended_) return false;
  text_.erase(0, from);
  if (text_.size() > longest_row) {
    throw InputFailure(run_time_failure("line " + std::to_string(line) +
                                        ": the row is longer than 268 million characters; is a quote never closed?"));
  }
  const std::size_t goal = text_.size() * 2;
  try {
    do {
      has_ended_ = !source_(text_);
    } while (!has_ended_ && text_.size() <= goal);
  } catch (const Failure& failure) {
    throw InputFailure(failure);
  }
  return true;
}

}  // namespace talutil::cli
