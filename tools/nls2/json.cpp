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

json_t *makeString(std::string_view text) {
  const auto units = icu::UnicodeString::fromUTF8({text.data(), static_cast<int32_t>(text.size())});
  require(!units.isBogus());
  std::string valid;
  units.toUTF8String(valid);
  return json_stringn(valid.data(), valid.size());
}

} // namespace

Json::Json(json_t *owned) : value_(owned, json_decref) { require(owned != nullptr); }
Json::Json(std::nullptr_t) : Json(json_null()) {}
Json::Json(bool value) : Json(json_boolean(value)) {}
Json::Json(double value) : Json(json_real(value)) {}
Json::Json(std::string_view text) : Json(makeString(text)) {}
json_t *Json::integer(int64_t value) { return json_integer(value); }
Json Json::array() { return Json(json_array()); }

Json Json::object(std::initializer_list<std::pair<const char *, Json>> members) {
  Json object(json_object());
  for (const auto &[key, value] : members) {
    object.set(key, value);
  }
  return object;
}

Json &Json::set(const char *key, const Json &value) {
  require(json_object_set(value_.get(), key, value.value_.get()) == 0);
  return *this;
}

void Json::append(const Json &value) {
  require(json_array_append(value_.get(), value.value_.get()) == 0);
}

std::string Json::text() const {
  const auto dump = [this](char *to, std::size_t size) {
    return json_dumpb(value_.get(), to, size,
                      JSON_INDENT(2) | JSON_ENCODE_ANY | JSON_REAL_PRECISION(9));
  };
  std::string text(dump(nullptr, 0), '\0');
  require(!text.empty() && dump(text.data(), text.size()) == text.size());
  return text + "\n";
}

} // namespace nls2::tool
