// Reading, working and writing at the same time, with the results in the order of the input.
//
// Why not tbb::parallel_pipeline: here everything before a failure is written before the failure
// comes out, a read that waits for input can be ended, the pieces in flight are limited by their
// bytes as well as their number, and where no thread is to be had the caller's does all the work.
#pragma once

#include <algorithm>
#include <condition_variable>
#include <cstddef>
#include <exception>
#include <mutex>
#include <optional>
#include <thread>
#include <vector>

namespace nls2::tool {

// `Steps` has these members, and `Piece` a weight(), its bytes after it was read:
//   bool read(Piece &)     in turn; false at the end
//   Worker worker()        one for each thread that works
//   void work(Worker &, Piece &)   several at a time
//   void write(Piece &)    in turn, in the thread that calls run()
//   void interrupt()       ends a read() that waits for input
template <typename Piece, typename Steps>
class Pipeline {
public:
  explicit Pipeline(Steps &steps)
      : steps_(steps), workers_(std::clamp(std::thread::hardware_concurrency(), 1U, mostWorkers)),
        slots_(workers_ + 4) {}

  // Returns when all is written. An exception of a step ends the run when the pieces before have
  // been written, and comes out here.
  void run() {
    std::vector<std::jthread> threads; // ended last
    const Ending ending{*this};
    try {
      threads.reserve(workers_);
      while (threads.size() < workers_) {
        threads.emplace_back([this] { readAndWork(); });
      }
    } catch (const std::exception &) { // fewer threads than wanted will do, and none too
    }
    threads.empty() ? runAlone() : writeAll();
  }

private:
  static constexpr unsigned mostWorkers = 8;
  static constexpr std::size_t mostWeight = std::size_t{8} << 20;

  struct Slot {
    Piece piece;
    bool done = false;
    std::exception_ptr error;
  };

  struct Ending {
    Pipeline &pipeline;

    ~Ending() {
      const std::lock_guard lock(pipeline.mutex_);
      pipeline.ended_ = true;
      pipeline.changed_.notify_all();
      pipeline.steps_.interrupt();
    }
  };

  void runAlone() {
    auto worker = steps_.worker();
    Piece &piece = slots_.front().piece;
    while (steps_.read(piece)) {
      steps_.work(worker, piece);
      steps_.write(piece);
    }
  }

  Slot &slot(std::size_t piece) { return slots_[piece % slots_.size()]; }

  void readAndWork() {
    std::optional<decltype(steps_.worker())> worker;
    while (Slot *next = readNext()) {
      try {
        if (!worker) {
          worker.emplace(steps_.worker());
        }
        if (!next->error) {
          steps_.work(*worker, next->piece);
        }
      } catch (...) {
        next->error = std::current_exception();
      }
      const std::lock_guard lock(mutex_);
      next->done = true;
      changed_.notify_all();
    }
  }

  // Null at the end. A failed read takes a slot too, so that it comes out after the pieces before
  // it.
  Slot *readNext() {
    const std::lock_guard turn(reading_);
    if (!mayRead()) {
      return nullptr;
    }
    Slot &next = slot(read_); // read_ is changed in turn only
    bool more = false;
    try {
      more = steps_.read(next.piece);
    } catch (...) {
      next.error = std::current_exception();
    }
    const std::lock_guard lock(mutex_);
    ended_ = ended_ || !more;
    if (!more && !next.error) {
      changed_.notify_all();
      return nullptr;
    }
    ++read_;
    weight_ += next.piece.weight();
    return &next;
  }

  bool mayRead() {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] {
      return ended_ || read_ == written_ ||
             (read_ - written_ < slots_.size() && weight_ < mostWeight);
    });
    return !ended_;
  }

  void writeAll() {
    for (;;) {
      std::unique_lock lock(mutex_);
      Slot &next = slot(written_);
      changed_.wait(lock, [&] { return next.done || (ended_ && written_ == read_); });
      if (!next.done) {
        return;
      }
      lock.unlock();
      if (next.error) {
        std::rethrow_exception(next.error);
      }
      const std::size_t weight = next.piece.weight();
      steps_.write(next.piece); // written_ is changed by this thread only
      lock.lock();
      next.done = false;
      weight_ -= weight;
      ++written_;
      changed_.notify_all();
    }
  }

  Steps &steps_;
  const unsigned workers_;
  std::vector<Slot> slots_;
  std::mutex reading_; // held by the thread whose turn it is to read
  std::mutex mutex_;   // guards everything below, and `done` and `error` of the slots
  std::condition_variable changed_;
  std::size_t weight_ = 0;  // of the pieces in flight
  std::size_t read_ = 0;    // pieces, since the beginning
  std::size_t written_ = 0; // of these
  bool ended_ = false;      // no further piece will be read
};

} // namespace nls2::tool
