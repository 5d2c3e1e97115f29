// Reading, working and writing at the same time, with the results in the order of the input.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <exception>
#include <functional>
#include <mutex>
#include <vector>

namespace nls2::tool {

// What is done with the pieces of the input. A piece lives in a slot, a number below slots().
struct PipelineSteps {
  std::function<bool(std::size_t)> read;  // in turn, in a thread of its own; false: at the end
  std::function<void(std::size_t)> work;  // in any thread, several at a time
  std::function<void(std::size_t)> write; // in turn, in the thread that called run()
  std::function<void()> interrupt;        // ends a read() that is waiting for input
};

class Pipeline {
public:
  Pipeline();

  std::size_t slots() const { return slots_.size(); }

  // Returns when all is written. An exception of a step ends the run when the pieces before have
  // been written, and comes out here.
  void run(const PipelineSteps &steps);

private:
  struct Slot {
    bool done = false;
    std::exception_ptr error;
  };

  void readAll(const PipelineSteps &steps);
  void workOnAll(const PipelineSteps &steps);
  void writeAll(const PipelineSteps &steps);
  bool mayRead();
  void finish(std::size_t slot, const std::exception_ptr &error);
  void stop();

  const unsigned workers_;
  std::vector<Slot> slots_;
  std::mutex mutex_; // guards everything below, and `done` and `error` of the slots
  std::condition_variable slotFree_;
  std::condition_variable workThere_;
  std::condition_variable resultThere_;
  std::size_t read_ = 0;    // pieces, since the beginning
  std::size_t taken_ = 0;   // of these, by workers
  std::size_t written_ = 0; // of these
  bool ended_ = false;      // no further piece will be read
  bool stopped_ = false;    // no further piece will be written
};

} // namespace nls2::tool
