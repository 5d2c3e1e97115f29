// field_translator.hpp - fields of records from one code page to another, one after another.
//
//   nls2::field_translator to_utf8(nls2::code_page(37), nls2::code_page(1208),
//                                  {.padding = nls2::padding::strip});
//   std::string line;
//   if (const nls2::field_result result = to_utf8.translate(field, line); !result) {
//     // result.problem, result.offset, result.source_bytes(), result.code_point
//   }
//
// NLS2_TranslateString opens two converters a call; a translator opens them once and then neither
// opens nor allocates anything. What it says is exact: lengths are bytes, a shift state is closed
// and counted, a page with a signature writes one a field, and what is a null is asked of the text,
// not of its bytes. With padding as_is and on_bad::replace the bytes are those of
// NLS2_TranslateString with options 0, unless drop_ignorable is false.
#ifndef NLS2_FIELD_TRANSLATOR_HPP
#define NLS2_FIELD_TRANSLATOR_HPP

#include "nls2/detail/byte_table.hpp"
#include "nls2/detail/field_path.hpp"
#include "nls2/field_types.hpp"

#include <memory>
#include <new>
#include <span>
#include <string>
#include <utility>

namespace nls2 {

// One translator is for one thread at a time; a copy is cheap enough to give one to each thread.
// Move-only where exceptions are off: use clone().
//
// Where a byte of the source page always becomes the same bytes of the destination (a single-byte
// page to one without shift states and signature), a table of 256 rows translates; ICU made its
// rows.
class field_translator {
public:
  // error: that of NLS2_MapCodepageIdToName for either page; NLS2_ERR_INVALID_OPTION for
  // padding::fill with a width of 0 or a width of more than 1 GiB; NLS2_ERR_NO_MEMORY. A translator
  // that was not made must not be used.
  field_translator(code_page from, code_page to, const field_policy &policy,
                   std::error_code &error) noexcept
      : from_(from), to_(to) {
    make(policy, error);
    if (!error && policy.use_table) {
      learn_table(error);
    }
  }

  field_translator(field_translator &&) noexcept = default;
  field_translator &operator=(field_translator &&) noexcept = default;

  // Another translator for the same pages and policy, made without learning the table again.
  field_translator clone(std::error_code &error) const noexcept {
    field_translator copy(not_made(), from_, to_);
    copy.make(policy(), error);
    if (!error) {
      copy.state_->table = state_->table;
      copy.state_->has_table = state_->has_table;
    }
    return copy;
  }

#if NLS2_HAS_EXCEPTIONS
  field_translator(code_page from, code_page to, const field_policy &policy = {})
      : from_(from), to_(to) {
    std::error_code error;
    *this = field_translator(from, to, policy, error);
    throw_if(error);
  }
  field_translator(const field_translator &other) : from_(other.from_), to_(other.to_) {
    std::error_code error;
    *this = other.clone(error);
    throw_if(error);
  }
  field_translator &operator=(const field_translator &other) {
    return *this = field_translator(other);
  }
#endif

  code_page from() const noexcept { return from_; }
  code_page to() const noexcept { return to_; }
  const field_policy &policy() const noexcept { return state_->path.policy(); }

  // Translates a field into `out`; result.written tells how much of it was written. What is in the
  // rest of it afterwards, and in all of it on failure, is not defined. The two must not overlap.
  field_result translate(std::span<const char> field, std::span<char> out) noexcept {
    field_result result;
    if (state_->has_table) {
      state_->table.translate(state_->path, field, out, result);
    } else {
      state_->path.translate(field, out, result);
    }
    return result;
  }

  // Appends the translation to `out`, which is as it was on failure. May allocate for `out`.
  field_result translate(std::span<const char> field, std::string &out) {
    const std::size_t before = out.size();
#if NLS2_HAS_EXCEPTIONS
    try {
      out.resize(before + max_size(field.size()));
    } catch (...) {
      return detail::failed_field(field_problem::no_memory);
    }
#else
    out.resize(before + max_size(field.size()));
#endif
    const field_result result = translate(field, std::span(out).subspan(before));
    out.resize(before + result.written);
    return result;
  }

  // Bytes of output that are enough for any field of `field_bytes` bytes.
  std::size_t max_size(std::size_t field_bytes) const noexcept {
    if (policy().width != 0) {
      return policy().width;
    }
    // A blank that is kept may take more bytes than it took.
    return state_->has_table
               ? field_bytes * std::max(state_->table.longest(), state_->path.blank_size())
               : state_->path.max_size(field_bytes);
  }

private:
  struct state {
    state(code_page from, code_page to, const field_policy &policy, std::error_code &error) noexcept
        : path(from, to, policy, error) {}

    detail::field_path path;
    detail::byte_table table;
    bool has_table = false;
  };

  struct not_made {};
  field_translator(not_made, code_page from, code_page to) noexcept : from_(from), to_(to) {}

  void make(const field_policy &policy, std::error_code &error) noexcept {
    error.clear();
    if (policy.width > detail::longest_field ||
        (policy.padding == padding::fill && policy.width == 0)) {
      error = make_status(NLS2_ERR_INVALID_OPTION);
      return;
    }
    state_.reset(new (std::nothrow) state(from_, to_, policy, error));
    if (!state_) {
      error = make_status(NLS2_ERR_NO_MEMORY);
    }
  }

  void learn_table(std::error_code &error) noexcept {
    const bool drops = policy().drop_ignorable;
    detail::field_path teacher(from_, to_, {.bad = on_bad::replace, .drop_ignorable = drops},
                               error);
    state_->has_table = !error && state_->table.build(teacher);
  }

#if NLS2_HAS_EXCEPTIONS
  static void throw_if(const std::error_code &error) {
    if (error) {
      throw nls2::error(error.value(), "cannot make a field translator");
    }
  }
#endif

  code_page from_;
  code_page to_;
  std::unique_ptr<state> state_;
};

} // namespace nls2

#endif
