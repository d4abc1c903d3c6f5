// What other programs read from the PDF files.
#include <gtest/gtest.h>
#include <stdlib.h>
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <map>
#include <sstream>

#include "documents/pdf_writer.hpp"
#include "documents/report_composer.hpp"
#include "platform/posix/posix_platform.hpp"

namespace talutil {

namespace {

std::string output_of(const std::string& command) {
  std::string output;
  FILE* const pipe = popen(command.c_str(), "r");
  char buffer[4096];
  while (const std::size_t size = fread(buffer, 1, sizeof buffer, pipe)) output.append(buffer, size);
  pclose(pipe);
  return output;
}

struct SinglePage final : PageSource {
  explicit SinglePage(const Page& given) : page(given) {}
  [[nodiscard]] std::size_t count() const noexcept override { return 1; }
  [[nodiscard]] Page compose(std::size_t /*index*/) const override { return page; }
  Page page;
};

struct PdfTest : ::testing::Test {
  posix::PosixFontFiles fonts;
  posix::PosixFiles files;
  std::string path = ::testing::TempDir() + "talutil-" + std::to_string(getpid()) + ".pdf";

  ~PdfTest() override { remove(path.c_str()); }

  void write(const Document& document) {
    write_pdf(document, {u"Title \u041F\u0440\u0438 \u20AC", u"Author", u"Subject", u"Creator"}, fonts, files,
              from_utf8(path));
  }

  /// A document of a single page.
  void write_page(const Page& page) {
    Document document;
    document.pages = PageList(std::make_unique<SinglePage>(page));
    write(document);
  }
};

TEST_F(PdfTest, WordsLieWhereTheyWereLaidOut) {
  const auto metrics = std::make_shared<FontMetrics>(fonts);
  PageSetup setup;
  setup.width = 11906;
  setup.height = 16838;
  setup.margin_left = setup.margin_top = setup.margin_right = setup.margin_bottom = 1134;
  setup.header = u"  Report";
  ReportComposer composer(metrics, setup);
  for (const FontFamily family : {FontFamily::courier, FontFamily::helvetica, FontFamily::times}) {
    for (const float points : {8.0F, 10.0F, 24.0F}) {
      composer.add_text(u"one\ttwo caf\u00E9 \u041F\u0440\u0438\u0432\u0435\u0442 end\r\n",
                        {family, points == 24, points});
    }
  }
  composer.add_text(u"second page\f", {});
  composer.add_text(u"last", {});
  Document document = composer.finish();
  document.bookmarks.push_back({u"Columns 1 to 2", 1, 1});
  write(document);
  EXPECT_EQ(output_of("qpdf --check " + path + " 2>&1 | grep -c 'No syntax or stream encoding errors'"), "1\n");
  EXPECT_EQ(output_of("pdfinfo " + path + " | grep -c -E 'Title: +Title При €|Author: +Author|Pages: +2'"), "3\n");

  EXPECT_EQ(output_of("qpdf --qdf --object-streams=disable " + path +
                      " - | grep -a -c -E '/Lang .en-GB.|/DisplayDocTitle true|/PageMode /UseOutlines|/Count 1$'"),
            "4\n")
      << "the language, the title bar, the bookmarks opened, one of them below another";

  // Each run that is a single word, is a word of the file at the same place.
  std::multimap<std::string, std::pair<double, double>> found;
  std::istringstream lines(output_of("pdftotext -bbox " + path + " -"));
  for (std::string line; std::getline(lines, line);) {
    double left = 0;
    double right = 0;
    char text[100] = "";
    constexpr const char* format = " <word xMin=\"%lf\" yMin=\"%*f\" xMax=\"%lf\" yMax=\"%*f\">%99[^<]";
    if (sscanf(line.c_str(), format, &left, &right, text) == 3) found.insert({text, {left, right}});
  }
  std::size_t compared = 0;
  for (std::size_t i = 0; i < document.pages.size(); ++i) {
    for (const PageItem& item : document.pages[i].items) {
      const auto* const run = std::get_if<TextRun>(&item);
      if (run == nullptr || run->text.find(u' ') != Text::npos) continue;
      const std::string text = to_utf8(run->text);
      const bool is_there = std::ranges::any_of(found, [&](const auto& word) {
        const auto& [left, right] = word.second;
        return word.first == text && std::abs(left * 20 - run->left) < 20 &&
               std::abs(right * 20 - (run->left + run->width)) < 20;
      });
      EXPECT_TRUE(is_there) << text << " at " << run->left << ", width " << run->width;
      ++compared;
    }
  }
  EXPECT_GT(compared, 18U);
  const auto width = [&](FontFamily family) { return metrics->width(u'\u0416', {family, false, 10}); };
  EXPECT_NE(width(FontFamily::courier), width(FontFamily::helvetica)) << "each family has a wide font of its own";
}

// In the embedded font, the letter is made of others, and the accented one is made of it.
TEST_F(PdfTest, LettersMadeOfOthersAreWhole) {
  const auto second_letter = [&](const Text& first) {
    Page page{1440, 720, {}};
    page.items.emplace_back(TextRun{0, 0, 400, {FontFamily::courier, false, 20}, true, 0, first});
    page.items.emplace_back(TextRun{720, 0, 400, {FontFamily::courier, false, 20}, true, 0, u"\u03B5"});
    write_page(page);
    return output_of("pdftoppm -r 72 -gray -x 36 -y 0 -W 36 -H 36 " + path + " | od -An -tx1");
  };
  EXPECT_EQ(second_letter(u"\u03AD"), second_letter(u"\u03B5"));
}

TEST_F(PdfTest, BoxesHaveTheirColours) {
  Page page{1440, 480, {}};
  constexpr std::uint32_t colours[] = {0x000000FF, 0x0000FF00, 0x00FF0000};
  for (std::int32_t i = 0; i < 3; ++i)
    page.items.emplace_back(Box{.place = {480 * i, 0, 480, 480}, .fill = colours[i]});
  write_page(page);
  // One pixel a box: the three bytes of each, red first.
  EXPECT_EQ(output_of("pdftoppm -r 3 " + path + " | tail -c 9 | od -An -tx1"), " ff 00 00 00 ff 00 00 00 ff\n");
}

// Characters with a meaning in the format, and what is set for an embedded font but not for the text after it.
TEST_F(PdfTest, TextsAreWrittenAsTheyAre) {
  Page page{4320, 1440, {}};
  const FontStyle font{FontFamily::helvetica, false, 10.5F};
  const FontStyle bold{FontFamily::helvetica, true, 10.5F};
  page.items.emplace_back(TextRun{20, 0, 400, font, false, 0, u"(a\\b) 50% <c> \u20AC\u00E9"});
  page.items.emplace_back(TextRun{20, 400, 400, bold, true, 0x0000FF, u"\u041F\u0440\u0438"});
  page.items.emplace_back(TextRun{20, 800, 400, font, false, 0, u"((after"});
  write_page(page);
  EXPECT_EQ(output_of("pdftotext " + path + " - | grep -v '^$'"), "(a\\b) 50% <c> €é\nПри\n((after\n\f\n");
  EXPECT_EQ(output_of("qpdf --qdf --object-streams=disable " + path + " - | grep -a -A1 ' Tr$' | tail -2"),
            "0 Tr\n1 22.55 Td\n");
  EXPECT_EQ(output_of("qpdf --qdf --object-streams=disable " + path + " - | grep -a -c -E '^1 0 0 (rg|RG)$'"), "2\n")
      << "the letters of the embedded font are red, and the strokes that make them bold";
}

}  // namespace

}  // namespace talutil
