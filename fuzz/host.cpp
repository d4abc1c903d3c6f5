#include "fuzz/host.hpp"

#include "library/library.hpp"
#include "tests/fakes/fake_platform.hpp"

namespace talutil::fuzz {

struct Host::Parts {
  testing::FakePlatform platform;
  Library library{platform.platform()};
  ORVUtils utils{library};
};

Host::Host() : parts_(std::make_unique<Parts>()) {}
Host::~Host() = default;

ORVUtils& Host::utils() noexcept { return parts_->utils; }
SharedSettings& Host::settings() noexcept { return parts_->library.settings(); }
Files& Host::files() noexcept { return parts_->platform.files; }
CodePage& Host::code_page() noexcept { return parts_->platform.code_page; }
void Host::put_file(const Text& path, std::string_view bytes) { parts_->platform.files.put(path, std::string(bytes)); }

}  // namespace talutil::fuzz
