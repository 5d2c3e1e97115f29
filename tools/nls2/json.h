// What commands find, as text and as JSON.
#pragma once

#include <concepts>
#include <cstdint>
#include <initializer_list>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

struct json_t;

namespace nls2::tool {

// Every function throws std::bad_alloc without memory. Copies share the value.
class Json {
public:
  // Members are written in the order in which they were set.
  static Json object(std::initializer_list<std::pair<const char *, Json>> members = {});
  Json &set(const char *key, const Json &value);

  static Json array();
  template <class Range>
  static Json array(const Range &range) {
    Json values = array();
    for (const auto &each : range) {
      values.append(each);
    }
    return values;
  }
  void append(const Json &value);

  Json(std::nullptr_t = nullptr);
  Json(bool value);
  Json(double value);
  Json(std::integral auto value) : Json(integer(static_cast<int64_t>(value))) {}
  Json(std::string_view text); // bytes that are not valid UTF-8 become U+FFFD
  Json(const std::string &text) : Json(std::string_view(text)) {}
  Json(const char *text) : Json(text != nullptr ? Json(std::string_view(text)) : Json()) {}
  template <typename Value>
  Json(const std::optional<Value> &value) : Json(value ? Json(*value) : Json()) {}

  // Indented by two blanks, and ended by a newline.
  std::string text() const;

private:
  explicit Json(json_t *owned); // null is want of memory
  static json_t *integer(int64_t value);

  std::shared_ptr<json_t> value_;
};

// The same facts for people and for programs.
struct Answer {
  std::string text;
  Json json;

  std::string rendered(bool asJson) const { return asJson ? json.text() : text; }
};

} // namespace nls2::tool
