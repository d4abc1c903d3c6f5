#pragma once

#include <vector>

#include "documents/grid_layout.hpp"
#include "documents/page_setup.hpp"
#include "documents/text_store.hpp"

namespace talutil {

/// A line of a text. Flowing text begins at the margin and has tab stops; any other line stands at its place.
struct PlacedLine {
  const char16_t* units = nullptr;
  std::uint32_t length = 0;
  std::int32_t left = 0;  ///< Not of flowing text.
  std::int32_t top = 0;
  FontStyle font;
  bool flows = false;
  bool is_right_to_left = false;
};

/// Rows of a grid below each other.
struct PlacedRows {
  std::uint32_t grid = 0;
  std::uint32_t part = 0;
  std::uint32_t first = 0;
  std::uint32_t end = 0;
  std::int32_t top = 0;
  bool repeats_headings = false;  ///< Above them.
};

struct PlacedPicture {
  std::size_t picture = 0;
};

/// The pages of a report, as far as they are known before they are drawn: which lines and which rows stand on each.
class ReportPages final : public PageSource {
 public:
  using Piece = std::variant<PlacedLine, PlacedRows, PlacedPicture>;

  ReportPages(std::shared_ptr<FontMetrics> metrics, PageSetup setup);

  [[nodiscard]] std::size_t count() const noexcept override { return starts_.size(); }
  [[nodiscard]] Page compose(std::size_t index) const override;

  [[nodiscard]] const PageSetup& setup() const noexcept { return setup_; }

  /// Begins a page, whose footer has the note that was set last.
  void begin_page();

  /// Sets the note in the footer of the last page and of those that follow; an empty one only for those that follow.
  void set_note(Text note);

  /// Keeps a text for lines to refer to.
  TextView keep(TextView text) { return texts_.keep(text); }

  /// Adds something to the last page.
  void add(const Piece& piece) { pieces_.push_back(piece); }
  void add(Picture picture);

  /// Keeps a grid for rows to refer to; it is the last of `grids`.
  const GridLayout& add(GridLayout grid) { return grids_.emplace_back(std::move(grid)); }
  [[nodiscard]] const std::vector<GridLayout>& grids() const noexcept { return grids_; }

 private:
  /// The header as it fits above the top margin.
  struct Header {
    FontStyle font;
    std::vector<Text> lines;
    bool is_right_to_left = false;
  };
  struct PageStart {
    std::size_t first_piece = 0;
    std::size_t note = 0;
  };

  [[nodiscard]] std::vector<Text> lines_of(TextView text, const FontStyle& font) const;
  [[nodiscard]] Header fitting_header() const;
  void draw(Page& page, const PlacedLine& line) const;
  void draw(Page& page, const PlacedRows& rows) const;
  void draw(Page& page, const PlacedPicture& placed) const { page.items.emplace_back(pictures_[placed.picture]); }
  void draw_header(Page& page) const;
  void draw_footer(Page& page, std::size_t index) const;

  std::shared_ptr<FontMetrics> metrics_;
  PageSetup setup_;
  Header header_;
  bool has_title_ = false;
  std::vector<PageStart> starts_;
  std::vector<Piece> pieces_;
  std::vector<Text> notes_;
  std::size_t note_ = 0;  ///< Of pages that begin now.
  std::vector<GridLayout> grids_;
  std::vector<Picture> pictures_;
  TextStore texts_;
};

}  // namespace talutil
