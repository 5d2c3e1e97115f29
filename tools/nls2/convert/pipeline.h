// Processes the pieces of an input in several threads and keeps the results in order.
//
// Why not tbb::parallel_pipeline: here everything before a failure is written before the failure is
// reported, a read that waits for input can be interrupted, the pieces in progress are limited by
// bytes as well as by number, and if no thread can be started, the caller's does all the work.
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
//   Worker worker()        one for each thread
//   void work(Worker &, Piece &)   several at a time
//   void write(Piece &)    in turn, in the order of the reads
//   void interrupt()       ends a read() that waits for input
template <typename Piece, typename Steps>
class Pipeline {
public:
  explicit Pipeline(Steps &steps) : steps_(steps) {}

  // Returns when everything is written. The first exception of a step ends the run after the pieces
  // before it are written, and is thrown here.
  void run() {
    // One thread more than processors, since one mostly reads or writes.
    const unsigned workers = std::clamp(std::thread::hardware_concurrency(), 1U, mostWorkers);
    std::vector<std::jthread> threads;
    try {
      while (threads.size() < workers) {
        threads.emplace_back([this] { takePieces(); });
      }
    } catch (const std::exception &) { // the threads that started are enough
    }
    takePieces();
    threads.clear(); // when they have ended
    if (error_) {
      std::rethrow_exception(error_);
    }
  }

private:
  static constexpr unsigned mostWorkers = 8;
  static constexpr std::size_t mostWeight = std::size_t{8} << 20;

  // Takes one piece after another through all steps.
  void takePieces() {
    Piece piece;
    std::optional<decltype(steps_.worker())> worker;
    std::exception_ptr error;
    while (const auto number = readNext(piece, error)) {
      attempt(error,
              [&] { steps_.work(worker ? *worker : worker.emplace(steps_.worker()), piece); });
      writeInTurn(*number, piece, error);
    }
  }

  template <typename Step>
  static void attempt(std::exception_ptr &error, Step step) {
    try {
      if (!error) {
        step();
      }
    } catch (...) {
      error = std::current_exception();
    }
  }

  // The number of the piece; nothing at the end. A failed read also has a number, so that it is
  // reported after the pieces before it.
  std::optional<std::size_t> readNext(Piece &piece, std::exception_ptr &error) {
    const std::lock_guard turn(reading_);
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] { return ended_ || read_ == written_ || weight_ < mostWeight; });
    if (ended_) {
      return {};
    }
    lock.unlock();
    bool more = false;
    attempt(error, [&] { more = steps_.read(piece); });
    lock.lock();
    ended_ = ended_ || !more;
    if (!more && !error) {
      return {};
    }
    weight_ += piece.weight();
    return read_++;
  }

  // Writes no piece after the first failure.
  void writeInTurn(std::size_t number, Piece &piece, std::exception_ptr &error) {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] { return written_ == number; });
    if (!error_) {
      lock.unlock();
      attempt(error, [&] { steps_.write(piece); });
      lock.lock();
      error_ = error;
    }
    ++written_;
    weight_ -= piece.weight();
    if (error_ && !ended_) {
      ended_ = true;
      steps_.interrupt();
    }
    changed_.notify_all();
  }

  Steps &steps_;
  std::mutex reading_; // held by the thread whose turn it is to read
  std::mutex mutex_;   // guards everything below
  std::condition_variable changed_;
  std::size_t weight_ = 0;  // of the pieces in flight
  std::size_t read_ = 0;    // pieces, since the beginning
  std::size_t written_ = 0; // of these
  std::exception_ptr error_;
  bool ended_ = false; // no further piece will be read
};

} // namespace nls2::tool
