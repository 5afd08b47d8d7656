#include "foundation/library_module.h"

#include "win32/module.h"

namespace vyn {

HINSTANCE LibraryModule() noexcept {
  static const HINSTANCE module =
      win32::detail::ModuleOfAddress(reinterpret_cast<const void*>(&LibraryModule));
  return module;
}

}  // namespace vyn
