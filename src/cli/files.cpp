#include "cli/files.hpp"

#include <cerrno>
#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>

#include "cli/failure.hpp"

namespace talutil::cli {

std::string read_bytes(const std::string& path) {
  const auto all_of = [](std::istream& in) { return std::string(std::istreambuf_iterator<char>(in), {}); };
  if (path == "-") return all_of(std::cin);
  const auto failed = [&](const std::string& reason) {
    return run_time_failure("cannot read \"" + path + "\": " + reason);
  };
  std::ifstream file(path, std::ios::binary);
  if (!file) throw failed(std::strerror(errno));
  try {
    return all_of(file);
  } catch (const std::ios_base::failure& error) {
    // A folder can be opened but not read.
    throw failed(error.code().message());
  }
}

void write_bytes(const std::string& path, std::string_view bytes) {
  std::ofstream file(path, std::ios::binary | std::ios::trunc);
  file.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
  file.close();
  if (!file) throw run_time_failure("cannot write \"" + path + "\": " + std::strerror(errno));
}

Text utf8_text(std::string_view bytes, const std::string& what) {
  Text text = from_utf8(bytes);
  if (to_utf8(text) != bytes) throw usage_failure(what + " is not in UTF-8; convert it first, for example with iconv");
  return text;
}

}  // namespace talutil::cli
