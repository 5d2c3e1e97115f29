// A text translated piece by piece.
#pragma once

#include "translate/path.h"

#include <array>
#include <optional>
#include <string>

namespace zelfields {

// What is known of a text between two pieces. Units go to the encoder in pieces as large as those of
// Path, and what it writes waits here until the caller has room, so that neither the cuts nor the
// room can be seen in the output.
class Chunks {
public:
  explicit Chunks(Path &path);

  // False if there is a problem. `read` and `done` are right in either case.
  bool translate(std::string_view piece, bool last, Room room, int64_t &read, Done &done,
                 NLS2F_Problem &problem);
  void abandon() { encoder_.reset(); }

private:
  void begin();
  void step(bool last);
  bool encode();
  void finish(bool encodes);
  void deliver(Room &room, Done &done);
  void moveWindow();
  std::string window() const;

  Path &path_;
  const bool stops_;
  const bool holds_;               // units until there are as many as Path encodes at once
  std::optional<Encoder> encoder_; // while a text is under way
  std::array<char16_t, Path::pieceUnits> units_ = {};
  std::size_t count_ = 0;                // of units that are not encoded yet
  std::string written_;                  // what is not delivered yet
  std::optional<NLS2F_Problem> problem_; // for when all is delivered
  bool isEnded_ = false;                 // likewise

  std::string_view piece_;
  Decoder decoder_;
  int64_t position_ = 0; // of the piece in the text

  // If the policy stops: the text around the units that may still have a problem, and the converter
  // as it was after the first `before_` bytes of it.
  std::string window_;   // without what is in the piece
  std::size_t from_ = 0; // its beginning in the piece
  std::size_t before_ = 0;
  int64_t windowUnits_ = 0; // of the text before the snapshot
  icu::LocalUConverterPointer snapshot_;
};

} // namespace zelfields
