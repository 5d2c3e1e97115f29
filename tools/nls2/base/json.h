// Answers of commands, as text and as JSON (by libjansson).
#pragma once

#include <concepts>
#include <initializer_list>
#include <jansson.h>
#include <memory>
#include <new>
#include <optional>
#include <string>
#include <string_view>
#include <unicode/unistr.h>
#include <utility>

namespace nls2::tool {

// A JSON value. Copies share it. Every function throws std::bad_alloc if memory runs out.
class Json {
public:
  Json(std::nullptr_t = nullptr) : Json(json_null()) {}
  Json(bool value) : Json(json_boolean(value)) {}
  Json(double value) : Json(json_real(value)) {}
  Json(std::integral auto value) : Json(json_integer(static_cast<json_int_t>(value))) {}
  Json(const std::string &text) : Json(std::string_view(text)) {}
  Json(const char *text) : Json(text != nullptr ? Json(std::string_view(text)) : Json()) {}
  template <typename Value>
  Json(const std::optional<Value> &value) : Json(value ? Json(*value) : Json()) {}

  // Invalid UTF-8 becomes U+FFFD.
  Json(std::string_view text) {
    const auto units =
        icu::UnicodeString::fromUTF8({text.data(), static_cast<int32_t>(text.size())});
    require(!units.isBogus());
    std::string valid;
    units.toUTF8String(valid);
    *this = Json(json_stringn(valid.data(), valid.size()));
  }

  // Members keep the order in which they were set.
  static Json object(std::initializer_list<std::pair<const char *, Json>> members = {}) {
    Json object(json_object());
    for (const auto &[key, value] : members) {
      object.set(key, value);
    }
    return object;
  }
  Json &set(const char *key, const Json &value) {
    require(json_object_set(value_.get(), key, value.value_.get()) == 0);
    return *this;
  }

  template <class Range = std::initializer_list<Json>>
  static Json array(const Range &range = {}) {
    Json array(json_array());
    for (const auto &each : range) {
      array.append(each);
    }
    return array;
  }
  void append(const Json &value) {
    require(json_array_append(value_.get(), value.value_.get()) == 0);
  }

  // Indented by two blanks, or in one line; with a newline at the end.
  std::string text() const { return dump(JSON_INDENT(2)); }
  std::string line() const { return dump(JSON_COMPACT); }

private:
  std::string dump(std::size_t form) const {
    const std::size_t style = form | JSON_ENCODE_ANY | JSON_REAL_PRECISION(9);
    std::string text(json_dumpb(value_.get(), nullptr, 0, style), '\0');
    require(!text.empty() &&
            json_dumpb(value_.get(), text.data(), text.size(), style) == text.size());
    return text + "\n";
  }

  explicit Json(json_t *owned) : value_(owned, json_decref) { require(owned != nullptr); }

  static void require(bool done) {
    if (!done) {
      throw std::bad_alloc();
    }
  }

  std::shared_ptr<json_t> value_;
};

// The same facts for people and for programs.
struct Answer {
  std::string text;
  Json json;

  std::string rendered(bool asJson) const { return asJson ? json.text() : text; }
};

} // namespace nls2::tool
