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

std::string Json::text() const {
  struct Dump {
    std::string text;
    bool failed = false; // libjansson does not look at what it is told of a key
  };
  Dump dumped;
  const auto append = [](const char *bytes, std::size_t length, void *data) noexcept {
    auto *dump = static_cast<Dump *>(data);
    try {
      dump->text.append(bytes, length);
    } catch (const std::bad_alloc &) {
      dump->failed = true;
    }
    return dump->failed ? -1 : 0;
  };
  require(json_dump_callback(value_.get(), append, &dumped,
                             JSON_INDENT(2) | JSON_ENCODE_ANY | JSON_REAL_PRECISION(9)) == 0 &&
          !dumped.failed);
  return dumped.text + "\n";
}

} // namespace nls2::tool
