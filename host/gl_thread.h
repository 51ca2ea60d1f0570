// A host thread with its own OpenGL 4.1 core context, current for its whole life. The editor has
// two, render and interface, whose contexts share textures and buffers; messages run on them.
#ifndef VTPL_HOST_GL_THREAD_H
#define VTPL_HOST_GL_THREAD_H

#include <condition_variable>
#include <cstdint>
#include <exception>
#include <functional>
#include <mutex>
#include <string>
#include <thread>

namespace vtpl::host {

class GlThread {
 public:
  // Starts the thread and makes a new context current on it, sharing objects with `shareWith`
  // when given. Throws HostError when no headless GL is available.
  explicit GlThread(std::string name, const GlThread* shareWith = nullptr);
  ~GlThread();
  GlThread(const GlThread&) = delete;
  GlThread& operator=(const GlThread&) = delete;

  // Runs `task` on this thread and waits for it; an exception it throws is rethrown here.
  void run(const std::function<void()>& task);

  const std::string& name() const { return name_; }
  // The thread whose context is current on the calling thread, or null.
  static GlThread* current();
  // This context's vertex-array object and framebuffer, created on first use.
  uint32_t vertexArray();
  uint32_t framebuffer();

 private:
  void loop(const GlThread* shareWith);

  std::string name_;
  void* context_ = nullptr;  // EGLContext
  uint32_t vertexArray_ = 0;
  uint32_t framebuffer_ = 0;

  std::mutex callers_;  // one task at a time
  std::mutex mutex_;    // guards the hand-over below
  std::condition_variable wake_;
  const std::function<void()>* task_ = nullptr;
  std::exception_ptr failure_;
  bool started_ = false;
  bool stopping_ = false;
  std::string startError_;
  std::thread thread_;
};

}  // namespace vtpl::host

#endif  // VTPL_HOST_GL_THREAD_H
