// A memory of the path: what each character becomes, for pages in which that is always the same.
#pragma once

#include "translate/path.h"
#include "translate/row.h"

#include <bitset>
#include <cstdlib>
#include <memory>
#include <string_view>

namespace zelfields {

// Rows by the code of a character of the source page: its byte or two bytes, or its code point. The
// path teaches a row when its character first occurs, so that the two cannot disagree. What has no
// row - bytes that are not valid, sequences, supplementary characters, shifts at odd places - goes
// the path.
class Table {
public:
  // `isBare`: neither page has a signature.
  Table(Path &path, bool isBare);
  // Begins with what another one for the same pages and policy has learned.
  Table(Path &path, const Table &other);

  // False if the path must translate the field.
  bool translate(std::string_view field, Room room, Done &done) {
    return run_ != nullptr && translateField(field, room, done);
  }

private:
  // A field under way.
  struct Run {
    const char *source;
    const char *end; // of the text, once it is known
    char *target;
    char *limit;
    int64_t cut; // blanks
    int64_t replaced;
  };
  using Runner = bool (Table::*)(Run &);

  void reserve();
  void chooseSource();
  template <class Source>
  void use(std::size_t rows);

  bool translateField(std::string_view field, Room room, Done &done);
  template <class Source, bool shifts>
  bool run(Run &field);
  template <class Source, bool shifts>
  bool runToEnd(Run &field);
  template <class Source>
  void trim(Run &field);
  template <class Output>
  static bool finish(Output output, Run &field);
  bool addBlanks(int64_t cut, Room room, Done &done) const;

  template <class Source>
  Row nextRow(const Row *rows, const char *&source, const char *end, bool &mode);
  Row rowOf(uint32_t code);
  Row ask(uint32_t code);

  struct Free {
    void operator()(Row *rows) const { std::free(rows); }
  };

  Path &path_;
  const bool isPadded_;
  Runner run_ = nullptr;
  std::size_t (*spell_)(uint32_t code, char *bytes) = nullptr;
  std::size_t size_ = 0; // in rows
  std::unique_ptr<Row[], Free> rows_;
  std::bitset<256> learned_; // blocks of 256 rows that have any
};

} // namespace zelfields
