// JSON values to be written, by libjansson.

#include "json.h"

#include <jansson.h>
#include <new>
#include <unicode/unistr.h>

namespace nls2::tool {

namespace {

void require(bool done) {
  if (!done) {
    throw std::bad_alloc();
  }
}

std::string validUtf8(std::string_view text) {
  const auto units = icu::UnicodeString::fromUTF8({text.data(), static_cast<int32_t>(text.size())});
  require(!units.isBogus());
  std::string valid;
  return units.toUTF8String(valid);
}

json_t *makeString(std::string_view text) {
  const std::string valid = validUtf8(text);
  return json_stringn(valid.data(), valid.size());
}

} // namespace

void Json::Release::operator()(json_t *value) const noexcept { json_decref(value); }

Json::Json(json_t *owned) : value_(owned) { require(owned != nullptr); }
Json::Json(std::nullptr_t) : Json(json_null()) {}
Json::Json(bool value) : Json(json_boolean(value)) {}
Json::Json(double value) : Json(json_real(value)) {}
Json::Json(Exact number) : Json(json_integer(number.value)) {}
Json::Json(std::string_view text) : Json(makeString(text)) {}

Json Json::array() { return Json(json_array()); }
Json Json::object() { return Json(json_object()); }

// The setters with "new" in their names take the value over, also where they fail.
Json &Json::append(Json value) {
  require(json_array_append_new(value_.get(), value.value_.release()) == 0);
  return *this;
}

Json &Json::set(const char *key, Json value) {
  require(json_object_set_new(value_.get(), key, value.value_.release()) == 0);
  return *this;
}

// The dump does not pass on every failure of its callback, so that is kept here.
std::string Json::text() const {
  struct Output {
    std::string text;
    bool isWhole = true;
  } output;
  const auto append = [](const char *bytes, std::size_t length, void *to) noexcept {
    auto &out = *static_cast<Output *>(to);
    try {
      out.text.append(bytes, length);
    } catch (const std::bad_alloc &) {
      out.isWhole = false;
    }
    return out.isWhole ? 0 : -1;
  };
  const int result = json_dump_callback(value_.get(), append, &output,
                                        JSON_INDENT(2) | JSON_ENCODE_ANY | JSON_REAL_PRECISION(9));
  require(result == 0 && output.isWhole);
  return output.text + "\n";
}

} // namespace nls2::tool
