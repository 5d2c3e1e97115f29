// JSON values to be written: all that a renderer of facts needs.
#pragma once

#include <concepts>
#include <cstdint>
#include <functional>
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

  // Of what `render` makes of each element.
  template <class Range, class Render = std::identity>
  static Json array(const Range &range, Render render = {}) {
    Json values = emptyArray();
    for (const auto &each : range) {
      values.append(render(each));
    }
    return values;
  }

  Json(std::nullptr_t = nullptr);
  Json(bool value);
  Json(double value);
  Json(std::integral auto value) : Json(integer(static_cast<int64_t>(value))) {}
  Json(std::string_view text); // bytes that are not valid UTF-8 become U+FFFD
  Json(const std::string &text) : Json(std::string_view(text)) {}
  Json(const char *text) : Json(std::string_view(text)) {}
  template <typename Value>
  Json(const std::optional<Value> &value) : Json(value ? Json(*value) : Json()) {}

  // Indented by two blanks, and ended by a newline.
  std::string text() const;

private:
  explicit Json(json_t *owned); // null is want of memory
  static json_t *integer(int64_t value);
  static Json emptyArray();
  void append(const Json &value);

  std::shared_ptr<json_t> value_;
};

} // namespace nls2::tool
