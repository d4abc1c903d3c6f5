#include "documents/bidi_levels.hpp"

#include <algorithm>
#include <optional>

#include "documents/bidi_sequence.hpp"

// The rules are named as in UAX #9, which explains them.
namespace talutil {

namespace {

using enum BidiClass;

constexpr BidiLevel deepest = 125;

bool is_initiator(BidiClass kind) noexcept { return kind == LRI || kind == RLI || kind == FSI; }

bool is_removed(BidiClass kind) noexcept {
  return kind == BN || kind == LRE || kind == LRO || kind == RLE || kind == RLO || kind == PDF;
}

/// P2 and P3. The contents of an isolate end where it does; in a paragraph, what closes no isolate ends nothing.
BidiLevel first_strong_level(std::span<const BidiCharacter> characters, bool is_isolate) {
  std::size_t isolates = 0;
  for (const auto& [kind, code] : characters) {
    if (is_initiator(kind)) ++isolates;
    if (kind == PDI && isolates == 0 && is_isolate) return 0;
    if (kind == PDI && isolates > 0) --isolates;
    if (isolates == 0 && (kind == L || kind == R || kind == AL)) return kind == L ? 0 : 1;
  }
  return 0;
}

/// X1 to X8: levels by the embeddings, overrides and isolates that the line contains.
class Embeddings {
 public:
  Embeddings(std::span<const BidiCharacter> line, BidiLevel base) : line_(line), stack_{{base, std::nullopt, false}} {}

  void apply(std::vector<BidiLevel>& levels, std::vector<BidiClass>& kinds) {
    for (std::size_t i = 0; i < line_.size(); ++i) {
      const BidiClass kind = line_[i].kind;
      if (kind == PDI) close_isolate();
      if (kind == PDF) close_embedding();
      levels[i] = kind == B ? stack_.front().level : stack_.back().level;
      if (stack_.back().override && !is_removed(kind) && kind != B) kinds[i] = *stack_.back().override;
      if (is_initiator(kind)) open_isolate(i);
      if (kind == LRE || kind == RLE || kind == LRO || kind == RLO) open_embedding(kind);
    }
  }

 private:
  struct Entry {
    BidiLevel level;
    std::optional<BidiClass> override;
    bool is_isolate;
  };

  [[nodiscard]] BidiLevel next_level(bool is_right_to_left) const noexcept {
    const BidiLevel level = stack_.back().level;
    return static_cast<BidiLevel>(is_right_to_left ? (level + 1) | 1 : (level + 2) & ~1);
  }

  void open_isolate(std::size_t at) {
    const bool is_nested_too_deep = overflowing_isolates_ > 0 || overflowing_embeddings_ > 0;
    BidiClass kind = line_[at].kind;
    if (!is_nested_too_deep && kind == FSI) kind = first_strong_level(line_.subspan(at + 1), true) == 1 ? RLI : LRI;
    const BidiLevel level = next_level(kind == RLI);
    if (is_nested_too_deep || level > deepest) {
      ++overflowing_isolates_;
      return;
    }
    ++open_isolates_;
    stack_.push_back({level, std::nullopt, true});
  }

  void close_isolate() {
    if (overflowing_isolates_ > 0) {
      --overflowing_isolates_;
    } else if (open_isolates_ > 0) {
      overflowing_embeddings_ = 0;
      while (!stack_.back().is_isolate) stack_.pop_back();
      stack_.pop_back();
      --open_isolates_;
    }
  }

  void open_embedding(BidiClass kind) {
    const BidiLevel level = next_level(kind == RLE || kind == RLO);
    if (overflowing_isolates_ > 0 || overflowing_embeddings_ > 0 || level > deepest) {
      if (overflowing_isolates_ == 0) ++overflowing_embeddings_;
      return;
    }
    std::optional<BidiClass> override;
    if (kind == LRO) override = L;
    if (kind == RLO) override = R;
    stack_.push_back({level, override, false});
  }

  void close_embedding() {
    if (overflowing_isolates_ > 0) return;
    if (overflowing_embeddings_ > 0) {
      --overflowing_embeddings_;
    } else if (!stack_.back().is_isolate && stack_.size() > 1) {
      stack_.pop_back();
    }
  }

  std::span<const BidiCharacter> line_;
  std::vector<Entry> stack_;
  std::size_t open_isolates_ = 0;
  std::size_t overflowing_isolates_ = 0;
  std::size_t overflowing_embeddings_ = 0;
};

/// BD13: the runs of one level that isolates separate, joined. `kept` are the characters that X9 leaves.
std::vector<std::vector<std::size_t>> isolating_runs(std::span<const BidiCharacter> line,
                                                     const std::vector<BidiLevel>& levels,
                                                     const std::vector<std::size_t>& kept) {
  std::vector<std::vector<std::size_t>> runs;
  std::vector<std::size_t> open;  // The runs that the isolates not yet closed began in.
  std::optional<std::size_t> current;
  for (std::size_t i = 0; i < kept.size(); ++i) {
    const std::size_t at = kept[i];
    const bool begins_run = i == 0 || levels[at] != levels[kept[i - 1]];
    std::optional<std::size_t> closed;
    if (line[at].kind == PDI && !open.empty()) {
      closed = open.back();
      open.pop_back();
    }
    if (begins_run) {
      current = closed.value_or(runs.size());
      if (!closed) runs.emplace_back();
    }
    runs[*current].push_back(at);
    if (is_initiator(line[at].kind)) open.push_back(*current);
  }
  return runs;
}

/// X10: the direction of a boundary is that of the higher level beside it.
BidiClass boundary(BidiLevel one, BidiLevel other) noexcept { return std::max(one, other) % 2 == 0 ? L : R; }

/// L1: blanks and isolates before a separator and at the end of the line have the base level.
void reset_blanks(std::span<const BidiCharacter> line, BidiLevel base, std::vector<BidiLevel>& levels) {
  bool is_at_end = true;
  for (std::size_t i = line.size(); i-- > 0;) {
    const BidiClass kind = line[i].kind;
    if (kind == B || kind == S) {
      levels[i] = base;
      is_at_end = true;
    } else if (kind == WS || kind == PDI || is_initiator(kind)) {
      if (is_at_end) levels[i] = base;
    } else if (!is_removed(kind)) {
      is_at_end = false;
    }
  }
}

}  // namespace

BidiClass bidi_class(char32_t code) {
  return std::prev(std::ranges::upper_bound(class_starts, code, {}, &ClassStart::first))->kind;
}

BidiLevel base_level(std::span<const BidiCharacter> line) { return first_strong_level(line, false); }

std::vector<BidiLevel> bidi_levels(std::span<const BidiCharacter> line, BidiLevel base) {
  std::vector<BidiLevel> levels(line.size(), base);
  std::vector<BidiClass> kinds(line.size());
  std::ranges::transform(line, kinds.begin(), &BidiCharacter::kind);
  Embeddings(line, base).apply(levels, kinds);
  const std::vector<BidiLevel> explicit_levels = levels;
  std::vector<std::size_t> kept;
  std::vector<std::size_t> place(line.size());  // Of each character among those kept.
  for (std::size_t i = 0; i < line.size(); ++i) {
    place[i] = kept.size();
    if (!is_removed(line[i].kind)) kept.push_back(i);
  }
  for (const std::vector<std::size_t>& run : isolating_runs(line, explicit_levels, kept)) {
    const std::size_t first = place[run.front()];
    const std::size_t next = place[run.back()] + 1;
    const BidiLevel level = explicit_levels[run.front()];
    const BidiLevel before = first == 0 ? base : explicit_levels[kept[first - 1]];
    // Behind an isolate that is never closed there is nothing but the end.
    const bool is_last = next == kept.size() || is_initiator(line[run.back()].kind);
    const BidiLevel after = is_last ? base : explicit_levels[kept[next]];
    BidiSequence sequence(line, run, level, boundary(before, level), boundary(after, level));
    sequence.resolve(kinds, levels);
  }
  reset_blanks(line, base, levels);
  for (std::size_t i = 0; i < line.size(); ++i) {
    if (is_removed(line[i].kind)) levels[i] = no_level;
  }
  return levels;
}

std::vector<std::size_t> visual_order(std::span<const BidiLevel> levels) {
  std::vector<std::size_t> order;
  BidiLevel highest = 0;
  for (std::size_t i = 0; i < levels.size(); ++i) {
    if (levels[i] == no_level) continue;
    order.push_back(i);
    highest = std::max(highest, levels[i]);
  }
  // L2: from the highest level down to the lowest odd one, what is at that level or above is reversed.
  for (BidiLevel level = highest; level > 0; --level) {
    for (auto first = order.begin(); first != order.end();) {
      first = std::find_if(first, order.end(), [&](std::size_t at) { return levels[at] >= level; });
      const auto end = std::find_if(first, order.end(), [&](std::size_t at) { return levels[at] < level; });
      std::reverse(first, end);
      first = end;
    }
  }
  return order;
}

}  // namespace talutil
