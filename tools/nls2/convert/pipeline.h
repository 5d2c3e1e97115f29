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
#include <thread>
#include <vector>

namespace nls2::tool {

// `Steps` has these members, and `Piece` a weight(), its bytes after it was read:
//   bool read(Piece &)     in turn, in one thread; false at the end
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
    std::vector<std::thread> threads;
    if (!start(threads)) {
      runAlone();
      return;
    }
    std::exception_ptr error;
    try {
      writeAll();
    } catch (...) {
      error = std::current_exception();
    }
    stop();
    steps_.interrupt();
    join(threads);
    if (error) {
      std::rethrow_exception(error);
    }
  }

private:
  static constexpr unsigned mostWorkers = 8;
  static constexpr std::size_t mostWeight = std::size_t{8} << 20;

  struct Slot {
    Piece piece;
    bool done = false;
    std::exception_ptr error;
  };

  // One reader and at least one worker; fewer workers than wanted will do.
  bool start(std::vector<std::thread> &threads) {
    try {
      threads.reserve(workers_ + 1);
      threads.emplace_back([this] { workOnAll(); });
      threads.emplace_back([this] { readAll(); });
    } catch (const std::exception &) { // no thread or no memory to be had
      stop();
      join(threads);
      return false;
    }
    try {
      for (unsigned i = 1; i < workers_; ++i) {
        threads.emplace_back([this] { workOnAll(); });
      }
    } catch (const std::exception &) {
      return true;
    }
    return true;
  }

  static void join(std::vector<std::thread> &threads) {
    for (std::thread &thread : threads) {
      thread.join();
    }
  }

  void runAlone() {
    auto worker = steps_.worker();
    Piece &piece = slots_.front().piece;
    while (steps_.read(piece)) {
      steps_.work(worker, piece);
      steps_.write(piece);
    }
  }

  Slot &slot(std::size_t piece) { return slots_[piece % slots_.size()]; }

  void stop() {
    const std::lock_guard lock(mutex_);
    stopped_ = true;
    slotFree_.notify_all();
    workThere_.notify_all();
  }

  bool mayRead() {
    std::unique_lock lock(mutex_);
    slotFree_.wait(lock, [&] {
      return stopped_ || read_ == written_ ||
             (read_ - written_ < slots_.size() && weight_ < mostWeight);
    });
    return !stopped_;
  }

  // A failed read takes a slot too, so that it is reported after the pieces before it.
  void readAll() {
    bool more = true;
    while (more && mayRead()) {
      Slot &next = slot(read_); // read_ is changed by this thread only
      std::exception_ptr error;
      try {
        more = steps_.read(next.piece);
      } catch (...) {
        error = std::current_exception();
      }
      const std::lock_guard lock(mutex_);
      next.error = error;
      ended_ = !more || error != nullptr;
      more = !ended_;
      if (more) {
        ++read_;
        weight_ += next.piece.weight();
        workThere_.notify_one();
      } else {
        workThere_.notify_all();
        resultThere_.notify_one();
      }
    }
  }

  void workOnAll() {
    std::exception_ptr failed;
    try {
      auto worker = steps_.worker();
      while (Slot *next = take()) {
        std::exception_ptr error;
        try {
          steps_.work(worker, next->piece);
        } catch (...) {
          error = std::current_exception();
        }
        finish(*next, error);
      }
    } catch (...) { // no worker could be made: the next piece has the reason
      failed = std::current_exception();
    }
    if (failed) {
      if (Slot *next = take()) {
        finish(*next, failed);
      }
    }
  }

  // The next piece to work on; null when there is none left.
  Slot *take() {
    std::unique_lock lock(mutex_);
    workThere_.wait(lock, [&] { return stopped_ || ended_ || taken_ < read_; });
    return stopped_ || taken_ == read_ ? nullptr : &slot(taken_++);
  }

  void finish(Slot &worked, const std::exception_ptr &error) {
    const std::lock_guard lock(mutex_);
    worked.done = true;
    worked.error = error;
    resultThere_.notify_one();
  }

  void writeAll() {
    for (;;) {
      std::unique_lock lock(mutex_);
      Slot &next = slot(written_);
      resultThere_.wait(lock, [&] { return next.done || (ended_ && written_ == read_); });
      if (next.error) {
        std::rethrow_exception(next.error);
      }
      if (!next.done) {
        return;
      }
      lock.unlock();
      const std::size_t weight = next.piece.weight();
      steps_.write(next.piece); // written_ is changed by this thread only
      lock.lock();
      next.done = false;
      weight_ -= weight;
      ++written_;
      slotFree_.notify_one();
    }
  }

  Steps &steps_;
  const unsigned workers_;
  std::vector<Slot> slots_;
  std::mutex mutex_; // guards everything below, and `done` and `error` of the slots
  std::condition_variable slotFree_;
  std::condition_variable workThere_;
  std::condition_variable resultThere_;
  std::size_t weight_ = 0;  // of the pieces in flight
  std::size_t read_ = 0;    // pieces, since the beginning
  std::size_t taken_ = 0;   // of these, by workers
  std::size_t written_ = 0; // of these
  bool ended_ = false;      // no further piece will be read
  bool stopped_ = false;    // no further piece will be written
};

} // namespace nls2::tool
