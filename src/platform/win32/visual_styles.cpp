#include "platform/win32/visual_styles.hpp"

#include "platform/win32/handle.hpp"

namespace talutil::win32 {

namespace {

constexpr ULONG_PTR manifest_resource = 101;  // As in talutil.rc.

/// One for the whole process and never released, since windows that were made in it may outlive any owner.
HANDLE context() noexcept {
  static const HANDLE made = [] {
    ACTCTXW description{};
    description.cbSize = sizeof description;
    description.dwFlags = ACTCTX_FLAG_HMODULE_VALID | ACTCTX_FLAG_RESOURCE_NAME_VALID;
    description.hModule = own_module();
    description.lpResourceName = reinterpret_cast<const wchar_t*>(manifest_resource);
    return CreateActCtxW(&description);
  }();
  return made;
}

}  // namespace

VisualStyles::VisualStyles() noexcept {
  is_active_ = context() != INVALID_HANDLE_VALUE && ActivateActCtx(context(), &cookie_) != FALSE;
}

VisualStyles::~VisualStyles() {
  if (is_active_) DeactivateActCtx(0, cookie_);
}

}  // namespace talutil::win32
