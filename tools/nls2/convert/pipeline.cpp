// Reading, working and writing at the same time, with the results in the order of the input.

#include "convert/pipeline.h"

#include <algorithm>
#include <thread>

namespace nls2::tool {

namespace {

constexpr unsigned mostWorkers = 8;

unsigned workerCount() { return std::clamp(std::thread::hardware_concurrency(), 1U, mostWorkers); }

} // namespace

// Beside the pieces being worked on one may be read and one written; one more a worker keeps them
// busy when one of the other two falls behind.
Pipeline::Pipeline() : workers_(workerCount()), slots_(2 * workers_ + 2) {}

void Pipeline::run(const PipelineSteps &steps) {
  std::vector<std::thread> threads;
  std::exception_ptr error;
  try {
    for (unsigned i = 0; i < workers_; ++i) {
      threads.emplace_back([&] { workOnAll(steps); });
    }
    threads.emplace_back([&] { readAll(steps); });
    writeAll(steps);
  } catch (...) {
    error = std::current_exception();
  }
  stop();
  steps.interrupt();
  for (std::thread &thread : threads) {
    thread.join();
  }
  if (error) {
    std::rethrow_exception(error);
  }
}

void Pipeline::stop() {
  const std::lock_guard lock(mutex_);
  stopped_ = true;
  slotFree_.notify_all();
  workThere_.notify_all();
}

bool Pipeline::mayRead() {
  std::unique_lock lock(mutex_);
  slotFree_.wait(lock, [&] { return stopped_ || read_ - written_ < slots_.size(); });
  return !stopped_;
}

// A failed read is a piece of its own, so that it is reported after the pieces before it.
void Pipeline::readAll(const PipelineSteps &steps) {
  bool more = true;
  while (more && mayRead()) {
    const std::size_t slot = read_ % slots_.size(); // read_ is changed by this thread only
    std::exception_ptr error;
    try {
      more = steps.read(slot);
    } catch (...) {
      error = std::current_exception();
    }
    const std::lock_guard lock(mutex_);
    ended_ = !more || error != nullptr;
    more = !ended_;
    read_ += more ? 1 : 0;
    if (error) {
      slots_[slot].error = error;
    }
    workThere_.notify_one();
    if (ended_) {
      workThere_.notify_all();
      resultThere_.notify_one();
    }
  }
}

void Pipeline::workOnAll(const PipelineSteps &steps) {
  for (;;) {
    std::unique_lock lock(mutex_);
    workThere_.wait(lock, [&] { return stopped_ || ended_ || taken_ < read_; });
    if (stopped_ || taken_ == read_) {
      return;
    }
    const std::size_t slot = taken_++ % slots_.size();
    lock.unlock();
    std::exception_ptr error;
    try {
      steps.work(slot);
    } catch (...) {
      error = std::current_exception();
    }
    finish(slot, error);
  }
}

void Pipeline::finish(std::size_t slot, const std::exception_ptr &error) {
  const std::lock_guard lock(mutex_);
  slots_[slot].done = true;
  slots_[slot].error = error;
  resultThere_.notify_one();
}

void Pipeline::writeAll(const PipelineSteps &steps) {
  for (;;) {
    std::unique_lock lock(mutex_);
    Slot &slot = slots_[written_ % slots_.size()];
    resultThere_.wait(lock, [&] { return slot.done || (ended_ && written_ == read_); });
    if (slot.error) {
      std::rethrow_exception(slot.error);
    }
    if (!slot.done) {
      return;
    }
    lock.unlock();
    steps.write(written_ % slots_.size()); // written_ is changed by this thread only
    lock.lock();
    slot.done = false;
    ++written_;
    slotFree_.notify_one();
  }
}

} // namespace nls2::tool
