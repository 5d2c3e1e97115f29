// The translation of one field: text, digits or a number, in one record or in many.
#pragma once

#include "convert/plan.h"
#include "io/byte_buffer.h"

#include <optional>
#include <string>
#include <vector>

namespace nls2::tool {

// Kinds of problems beside those of nls2_fields.h.
enum : int32_t { notReversible = 101, invalidHex, wrongFields };

// What is wrong with a field.
struct FieldFault {
  NLS2F_Problem found = sized<NLS2F_Problem>(); // with the place in the field
  std::string words;
};

// What became of a field.
struct FieldResult {
  std::optional<FieldFault> fault; // also of what was replaced
  int64_t replaced = 0;            // characters; with a fault and none the field failed

  bool failed() const { return fault && replaced == 0; }
};

// Open translators, each used for all fields that need the same one. For one thread.
class Translators {
public:
  NLS2F_Translator *get(const CodePage &from, const CodePage &to, int32_t padding, int32_t onBad,
                        int64_t width);
  void clear() { open_.clear(); }

private:
  struct Entry {
    const NLS2F_Page *from;
    const NLS2F_Page *to;
    int32_t padding;
    int32_t onBad;
    int64_t width;
    Translator translator;
  };
  std::vector<Entry> open_;
};

// The same field of many records, a stride apart.
struct FieldColumn {
  const char *first;
  int64_t stride;
  int64_t rows;

  const char *row(int64_t i) const { return first + i * stride; }
};

class FieldTranslator {
public:
  FieldTranslator(const FieldPlan &plan, const Plan &run, bool replaces);

  // Appends the field to the bytes. The value is where it is in them; of a text that is to be
  // filled it may be shorter, without its blanks.
  FieldResult translate(std::string_view field, Translators &open, ByteBuffer &bytes,
                        NLS2F_Span &value) const;
  // The fields of many records. Those whose bit of good is 0 are to be translated alone.
  void translateAll(const FieldColumn &column, Translators &open, ByteBuffer &bytes,
                    std::vector<NLS2F_Span> &values, std::vector<uint8_t> &good) const;
  // The difference, if a translated field does not come back as it was.
  std::optional<FieldFault> verify(std::string_view field, std::string_view value,
                                   Translators &open) const;

  const FieldPlan &plan() const { return *plan_; }

private:
  FieldResult translateText(std::string_view field, Translators &open, ByteBuffer &bytes) const;
  bool convert(std::string_view field, ByteBuffer &bytes, FieldFault &fault) const;
  bool convertBack(std::string_view value, std::string &back, Translators &open) const;
  bool numberOf(std::string_view field, bool toText, ByteBuffer &bytes,
                NLS2F_Problem &problem) const;

  const FieldPlan *plan_;
  const bool readsText_; // of a field that is not text in the records
  const bool writesText_;
  const bool replaces_;
};

} // namespace nls2::tool
