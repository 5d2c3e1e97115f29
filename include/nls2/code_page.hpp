// code_page.hpp - code pages, by name and by number.
#ifndef NLS2_CODE_PAGE_HPP
#define NLS2_CODE_PAGE_HPP

#include "nls2/detail/common.hpp"
#include "nls2/error.hpp"

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace nls2 {
inline namespace NLS2_MODE {

enum class page_kind : std::int32_t {
  single_byte = NLS2F_PAGE_SINGLE_BYTE, // every byte is a character
  mixed = NLS2F_PAGE_MIXED,             // characters of one, two or more bytes
  unicode = NLS2F_PAGE_UNICODE,         // UTF-8, UTF-16, UTF-32, CESU-8, UTF-7, SCSU, BOCU-1 ...
  other = NLS2F_PAGE_OTHER              // ISO-2022, HZ, ISCII, LMBCS ...
};

struct page_facts {
  std::string name;        // ICU's canonical name: "ibm-37_P100-1995"
  std::int32_t number = 0; // one that opens the same table, or 0
  page_kind kind = page_kind::other;
  bool has_states = false;    // what a byte means depends on those before it
  bool has_signature = false; // a text begins with a byte-order mark
};

// ICU's names that look like one that does not open: "cp037, ibm-37"; empty if there are none.
[[nodiscard]] inline std::string near_page_names(std::string_view name) {
  const detail::terminated<256> text(name);
  char names[192] = "";
  return text.status() == 0 && NLS2F_NearPageNames(text.c_str(), names, sizeof names) <= 0
             ? std::string(names)
             : std::string();
}

namespace detail {
inline void close_page(NLS2F_Page *owned) noexcept { NLS2F_ClosePage(owned); }
} // namespace detail

// Owns an open code page, which any number of threads may use at once. Move-only; may be empty. It
// may be destroyed before what was opened with it. Compare and store pages by their names.
class code_page : public detail::owner<NLS2F_Page, detail::close_page> {
public:
  using owner::owner;

  // Opens a page by one of ICU's names, with its options: exactly what ICU opens for it. Digits
  // alone are a number. Empty on failure. Errors:
  //
  //   4   unknown_code_page: ICU does not know the name. The exception has similar ones
  //   37  invalid_argument: an empty name, or one with a null inside
  //   31  too_long: 256 bytes or more
  //   other  ICU's
  explicit code_page(std::string_view name, error_ref error NLS2_MAY_OMIT) {
    const detail::terminated<256> text(name);
    NLS2F_Page *opened = nullptr;
    const std::int32_t status =
        text.status() != 0 ? text.status() : NLS2F_OpenPageByName(text.c_str(), &opened);
    reset(opened);
    std::string named(name);
    if (status == U_FILE_ACCESS_ERROR) {
      const std::string similar = near_page_names(name);
      named += similar.empty() ? "" : " (similar: " + similar + ")";
    }
    error.report(status, "cannot open the code page", named);
  }

  // Opens a page by number: a CCSID, or one of the library's own from 57352 up
  // (NLS2_MapCodepageIdToName). Empty on failure. Errors: 4 (unknown_code_page) for a number that
  // this ICU has no converter for; ICU's.
  //
  // Surprise: 874, 932, 936, 949 and 950 open other tables than the names "ibm-874" and so on. If a
  // name is known, use it.
  explicit code_page(std::int32_t number, error_ref error NLS2_MAY_OMIT) {
    NLS2F_Page *opened = nullptr;
    const std::int32_t status = NLS2F_OpenPageByNumber(number, &opened);
    reset(opened);
    error.report(status, "cannot open the code page", std::to_string(number));
  }

  // What the page is like. Error: 37 (invalid_argument) for an empty page.
  [[nodiscard]] page_facts facts(error_ref error NLS2_MAY_OMIT) const {
    NLS2F_PageFacts c{};
    c.size = sizeof c;
    if (!error.report(NLS2F_PageInfo(get(), &c), "cannot describe the code page")) {
      return {};
    }
    return {c.name, c.number, static_cast<page_kind>(c.kind), c.hasStates != 0,
            c.hasSignature != 0};
  }
};

// The names of all pages that ICU has, for lists; code_page() opens each. Static texts.
[[nodiscard]] inline std::vector<std::string_view> page_names(error_ref error NLS2_MAY_OMIT) {
  std::vector<std::string_view> names;
  std::int64_t count = 0;
  std::int32_t status = NLS2F_PageCount(&count);
  for (std::int64_t i = 0; i < count && status <= 0; ++i) {
    const char *name = nullptr;
    status = NLS2F_PageAt(i, &name);
    names.emplace_back(name != nullptr ? name : "");
  }
  return error.report(status, "cannot list the code pages") ? names
                                                            : std::vector<std::string_view>();
}

// The records of ccsidMap: Windows names and their code pages, in the order in which they are
// searched (NLS2_MapWindowsNameToCCSID).
[[nodiscard]] inline std::span<const CcsidMapEntry> windows_names() noexcept {
  return {ccsidMap, NLS2_CCSID_MAP_RECORDS - 1};
}

} // namespace NLS2_MODE
} // namespace nls2

#endif
