#include <iostream>

#include "cli/failure.hpp"
#include "cli/files.hpp"
#include "cli/json.hpp"
#include "cli/options.hpp"
#include "cli/session.hpp"

namespace talutil::cli {

namespace {

struct SecretOptions {
  bool json = false;
  bool exact = false;  ///< The text is read or printed exactly, without removing or adding a line break.
};

struct PasswordOptions {
  std::int16_t length = 16;
  std::string mix = "all";
  int count = 1;
  bool json = false;
};

/// Standard input without the final line break that echo and here-documents add.
std::string read_input(bool is_exact) {
  std::string bytes = read_bytes("-");
  if (!is_exact && bytes.ends_with('\n')) bytes.pop_back();
  if (!is_exact && bytes.ends_with('\r')) bytes.pop_back();
  return bytes;
}

void print(const Text& text, bool is_exact, bool as_json) {
  if (as_json)
    std::cout << json::object({{"text", json::text(text)}}) << '\n';
  else
    std::cout << to_utf8(text) << (is_exact ? "" : "\n");
}

void encrypt(const SecretOptions& options) {
  Session session;
  const Text text = utf8_text(read_input(options.exact), "standard input");
  // Cipher text is ASCII on a single line, so always end it with a line break.
  print(session.utils().CryptoEncryptString(text), false, options.json);
}

void decrypt(const SecretOptions& options) {
  Session session;
  const Text cipher = utf8_text(read_input(false), "standard input");
  try {
    print(session.utils().CryptoDecryptString(cipher), options.exact, options.json);
  } catch (const RunTimeError& error) {
    throw run_time_failure("standard input", error);
  }
}

void password(const PasswordOptions& options) {
  struct Mix {
    const char* name;
    std::int16_t mix;
    std::int16_t hex;
  };
  constexpr Mix mixes[] = {{"digits", 0, 0}, {"letters", 1, 0}, {"all", 2, 0}, {"hex", 2, 1}};
  for (const Mix& known : mixes) {
    if (options.mix != known.name) continue;
    Session session;
    for (int i = 0; i < options.count; ++i) {
      print(session.utils().GenerateFilePassword(options.length, known.mix, known.hex), false, options.json);
    }
    return;
  }
  throw usage_failure("--mix " + options.mix + ": there is no such mix; there are digits, letters, all and hex");
}

}  // namespace

void add_secrets(CLI::App& app, Work& work) {
  const auto secret = std::make_shared<SecretOptions>();
  auto* const encrypting = app.add_subcommand("encrypt", "Encrypt the text on standard input, in the library's format");
  encrypting->add_flag("--exact", secret->exact, "Treat a final line break as part of the text");
  encrypting->footer("  printf %s \"$secret\" | talutil encrypt");
  add_json(*encrypting, secret->json, "Print {\"text\": ...}");
  choose(*encrypting, work, secret, &encrypt);
  auto* const decrypting = app.add_subcommand("decrypt", "Decrypt the cipher text on standard input");
  decrypting->add_flag("--exact", secret->exact, "Print no line break after the text");
  add_json(*decrypting, secret->json, "Print {\"text\": ...}");
  choose(*decrypting, work, secret, &decrypt);

  const auto options = std::make_shared<PasswordOptions>();
  auto* const making = app.add_subcommand("password", "Print a random password");
  making->add_option("--length", options->length, "Its length")->check(CLI::Range(1, 32767))->capture_default_str();
  making->add_option("--mix", options->mix, "The characters: digits, letters (and symbols), all or hex")
      ->capture_default_str();
  making->add_option("--count", options->count, "How many, one per line")
      ->check(CLI::Range(1, 1'000'000))
      ->capture_default_str();
  add_json(*making, options->json, "Print {\"text\": ...} for each");
  choose(*making, work, options, &password);
}

}  // namespace talutil::cli
