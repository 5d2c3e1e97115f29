// JSON values to be written: all that a renderer of facts needs.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <type_traits>

struct json_t;

namespace nls2::tool {

// Every function throws std::bad_alloc without memory.
class Json {
public:
  static Json array();
  static Json object();

  Json(std::nullptr_t = nullptr);
  Json(bool value);
  Json(double value);
  Json(std::string_view text); // bytes that are not valid UTF-8 become U+FFFD
  Json(const std::string &text) : Json(std::string_view(text)) {}
  Json(const char *text) : Json(std::string_view(text)) {}
  template <typename Integer>
  requires std::is_integral_v<Integer> Json(Integer value)
      : Json(Exact{static_cast<int64_t>(value)}) {}
  template <typename Value>
  Json(const std::optional<Value> &value) : Json(value ? Json(*value) : Json()) {}

  // Arrays.
  Json &append(Json value);
  // Objects; members are written in the order in which they were set.
  Json &set(const char *key, Json value);

  // Indented by two blanks, and ended by a newline.
  std::string text() const;

private:
  struct Exact {
    int64_t value;
  };
  struct Release {
    void operator()(json_t *value) const noexcept;
  };
  explicit Json(Exact number);
  explicit Json(json_t *owned); // null is want of memory

  std::unique_ptr<json_t, Release> value_;
};

} // namespace nls2::tool
