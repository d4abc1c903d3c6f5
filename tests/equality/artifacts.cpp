// Makes one file of each kind that the library writes, and opens those that chance makes different each time:
//
//   artifacts write FOLDER    from FOLDER/in: settings.ini, plain.zip, report.pdf, locked.zip and cipher.txt
//   artifacts read FOLDER     decrypts cipher.txt to opened.txt, and unpacks locked.zip to unpacked
//
// Every build makes the same bytes of the first three, but for the date in the document and, in the archive, the order
// of the folder's files and their rights; every build reads the others of every build. tests/equality/compare.sh looks
// at that.
#include <cstdio>
#include <cstring>
#include <exception>
#include <fstream>
#include <iterator>

#include "archives/packing.hpp"
#include "archives/unpacking.hpp"
#include "automation/run_time_error.hpp"
#include "tests/equality/report.hpp"
#include "tests/real_host.hpp"

namespace talutil::testing {
namespace {

constexpr TextView secret = u"O\u00b4Neil, 5 \u20ac, \u041e\u043b\u044c\u0433\u0430";
constexpr TextView password = u"three \u20ac";

void write_settings(Host& host) {
  const Text file = host.folder + u"settings.ini";
  for (const TextView section : {u"Reports", u"Windows", u"Reports"}) {
    for (const TextView item : {u"Paper", u"Caf\u00e9 \u2013 5 \u20ac", u"Empty", u"Paper"}) {
      Text value = item == u"Empty" ? Text() : Text(section) + u" = " + Text(item) + u";";
      host.utils.SaveCfgFileData(Text(section), Text(item), value, file, Boolean(true));
    }
  }
}

void write_archives(Host& host) {
  archives::Progress progress;
  const Text items = u'"' + host.folder + u"in\"";
  archives::pack(host.folder + u"plain.zip", items, {.level = 9, .comment = u"5 \u20ac"}, host.platform.folders,
                 progress);
  archives::pack(host.folder + u"locked.zip", items, {.aes = true, .password = Text(password)}, host.platform.folders,
                 progress);
}

void write_cipher(Host& host) {
  std::ofstream(host.native / "cipher.txt", std::ios::binary) << to_utf8(host.utils.CryptoEncryptString(Text(secret)));
}

void read_artifacts(Host& host) {
  std::ifstream file(host.native / "cipher.txt", std::ios::binary);
  const std::string cipher{std::istreambuf_iterator<char>(file), {}};
  std::ofstream(host.native / "opened.txt", std::ios::binary)
      << to_utf8(host.utils.CryptoDecryptString(from_utf8(cipher)));
  archives::Progress progress;
  archives::Archive(host.folder + u"locked.zip", host.platform.folders)
      .extract(host.folder + u"unpacked", {.password = Text(password)}, host.platform.folders, host.platform.files, {},
               progress);
}

void write_artifacts(Host& host) {
  write_settings(host);
  write_archives(host);
  write_report(host.platform.platform(), host.folder + u"report.pdf");
  write_cipher(host);
}

}  // namespace
}  // namespace talutil::testing

int main(int count, char** arguments) {
  using namespace talutil::testing;
  const bool is_read = count == 3 && std::strcmp(arguments[1], "read") == 0;
  if (!is_read && (count != 3 || std::strcmp(arguments[1], "write") != 0)) {
    std::fputs("usage: artifacts write|read FOLDER\n", stderr);
    return 2;
  }
  try {
    Host host(std::filesystem::absolute(arguments[2]));
    (is_read ? read_artifacts : write_artifacts)(host);
    return 0;
  } catch (const std::exception& error) {
    std::fprintf(stderr, "artifacts: %s: %s\n", arguments[1], error.what());
    return 1;
  }
}
