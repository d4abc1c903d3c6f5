#pragma once

#include <optional>
#include <string>
#include <vector>

#include "cli/entries.hpp"
#include "texts/member_texts.hpp"

namespace talutil::cli {

/// A class that hosts create: its table and its texts.
struct PublishedClass {
  std::string_view program_id;
  std::span<const Member> members;
  const texts::ClassText* text = nullptr;

  [[nodiscard]] std::string_view name() const noexcept { return text->text.name; }
  [[nodiscard]] const texts::MemberText& text_of(const Entry& entry) const {
    return texts::text_of(*text, entry.any().name);
  }

  /// The members of the toolkit are known by their names alone, those of other classes as "Grid.Rows".
  [[nodiscard]] std::string full_name(const Entry& entry) const;
};

/// All of them, the toolkit first.
[[nodiscard]] std::vector<PublishedClass> published_classes();

/// The members of a family in the order of their names.
[[nodiscard]] std::vector<Entry> family_of(const PublishedClass& owner, std::string_view family);

/// The heading of a family: with a capital.
[[nodiscard]] std::string family_title(std::string_view family);

/// What a name stands for: a class, or a member of a class.
struct Subject {
  PublishedClass owner;
  std::optional<Entry> member;
};

/// Finds "Class", "Class.Member" or "Member", ignoring case; a member of the toolkit comes before others of its name.
/// A name that is unknown, or that several other classes have, is a usage error that says what to write.
[[nodiscard]] Subject find_subject(std::string_view name);

}  // namespace talutil::cli
