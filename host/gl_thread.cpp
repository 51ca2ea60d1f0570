#include "gl_thread.h"

#include <GL/glew.h>

#include "headless_gl.h"
#include "host_error.h"

namespace vtpl::host {
namespace {

thread_local GlThread* currentThread = nullptr;

}  // namespace

GlThread::GlThread(std::string name, const GlThread* shareWith) : name_(std::move(name)) {
  thread_ = std::thread(&GlThread::loop, this, shareWith);
  std::unique_lock<std::mutex> lock(mutex_);
  wake_.wait(lock, [this] { return started_; });
  if (!startError_.empty()) {
    lock.unlock();
    thread_.join();
    throw HostError(name_ + " thread: " + startError_);
  }
}

GlThread::~GlThread() {
  {
    const std::lock_guard<std::mutex> lock(mutex_);
    stopping_ = true;
  }
  wake_.notify_all();
  if (thread_.joinable()) {
    thread_.join();
  }
}

GlThread* GlThread::current() {
  return currentThread;
}

void GlThread::run(const std::function<void()>& task) {
  const std::lock_guard<std::mutex> oneCallerAtATime(callers_);
  std::unique_lock<std::mutex> lock(mutex_);
  task_ = &task;
  failure_ = nullptr;
  wake_.notify_all();
  wake_.wait(lock, [this] { return task_ == nullptr; });
  if (failure_) {
    std::rethrow_exception(failure_);
  }
}

uint32_t GlThread::vertexArray() {
  if (vertexArray_ == 0) {
    glGenVertexArrays(1, &vertexArray_);
  }
  return vertexArray_;
}

uint32_t GlThread::framebuffer() {
  if (framebuffer_ == 0) {
    glGenFramebuffers(1, &framebuffer_);
  }
  return framebuffer_;
}

void GlThread::loop(const GlThread* shareWith) {
  const HeadlessContext created =
      createCurrentContext(shareWith != nullptr ? shareWith->context_ : nullptr);
  void* const context = created.context;
  const std::string& error = created.error;
  {
    const std::lock_guard<std::mutex> lock(mutex_);
    context_ = context;
    startError_ = error;
    started_ = true;
  }
  wake_.notify_all();
  if (!error.empty()) {
    return;
  }
  currentThread = this;

  std::unique_lock<std::mutex> lock(mutex_);
  for (;;) {
    wake_.wait(lock, [this] { return task_ != nullptr || stopping_; });
    if (task_ == nullptr) {
      break;
    }
    const std::function<void()>* task = task_;
    std::exception_ptr failure;
    lock.unlock();
    try {
      (*task)();
    } catch (...) {
      failure = std::current_exception();
    }
    lock.lock();
    failure_ = failure;
    task_ = nullptr;
    wake_.notify_all();
  }
  lock.unlock();

  if (vertexArray_ != 0) {
    glDeleteVertexArrays(1, &vertexArray_);
  }
  if (framebuffer_ != 0) {
    glDeleteFramebuffers(1, &framebuffer_);
  }
  currentThread = nullptr;
  makeCurrent(nullptr);
  destroyContext(context);
}

}  // namespace vtpl::host
