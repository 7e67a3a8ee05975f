// The texts of all resource libraries: looked up once, then served from memory.
#pragma once

#include <memory>
#include <string>

namespace qelo::locale {

// The text `id` of the library `library`; in English where the library's language lacks it,
// and `id` itself where English does too. Never null. May be called from any thread, and
// before main and after exit handlers have run. Throws std::bad_alloc.
std::shared_ptr<const std::wstring> resourceText(const std::wstring& library,
                                                 const std::wstring& id);

} // namespace qelo::locale
