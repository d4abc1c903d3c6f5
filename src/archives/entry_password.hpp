#pragma once

#include "archives/archive_reader.hpp"

namespace talutil::archives {

/// The password of the entries; asks again while it is wrong.
class Password {
 public:
  Password(const Text& given, const PasswordQuestion& ask) : bytes_(to_utf8(given)), ask_(ask) {}

  /// Repeats an attempt on an entry until the password is right.
  template <class Attempt>
  void with(const Archive::Entry& entry, Attempt&& attempt) {
    if (!entry.is_encrypted) return attempt(std::string());
    if (bytes_.empty()) ask(entry.name, false);
    for (;;) {
      try {
        attempt(bytes_);
        is_proved_ = true;
        return;
      } catch (const WrongPassword&) {
      } catch (const Error& error) {
        const bool is_garbage = error.code() == Code::bad_structure || error.code() == Code::unexpected_end;
        if (is_proved_ || !is_garbage) throw;
      }
      ask(entry.name, true);
    }
  }

 private:
  static constexpr int most_questions = 3;

  void ask(const Text& entry, bool was_wrong) {
    if (!ask_ || questions_ == most_questions)
      throw Error(Code::bad_parameters, to_utf8(entry) + ": the password is missing or wrong");
    ++questions_;
    const std::optional<Text> answer = ask_(entry, was_wrong);
    if (!answer) {
      throw Error(Code::cancelled,
                  to_utf8(entry) + (was_wrong ? ": the password is wrong" : ": no password was given"));
    }
    bytes_ = to_utf8(*answer);
  }

  std::string bytes_;
  const PasswordQuestion& ask_;
  int questions_ = 0;
  bool is_proved_ = false;
};

}  // namespace talutil::archives
