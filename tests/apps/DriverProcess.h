#pragma once
// "dorvantos automate" as a script meets it: a child process with a pipe each way.
// Every read has a deadline, so a driver that hangs fails the test instead of blocking it.

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include <nlohmann/json.hpp>

extern char** environ;

namespace dvtest {

// The build's bin/ directory: $POC_TEST_BIN under ctest, else the test's own folder.
inline std::string BinDirectory() {
  if (const char* bin = std::getenv("POC_TEST_BIN"); bin && *bin) return bin;
  return std::filesystem::canonical("/proc/self/exe").parent_path().string();
}

// The build's lib/ directory, where the component and its peers are.
inline std::string LibDirectory() {
  if (const char* lib = std::getenv("POC_TEST_LIB"); lib && *lib) return lib;
  return (std::filesystem::path(BinDirectory()).parent_path() / "lib").string();
}

class DriverProcess {
 public:
  using Json = nlohmann::json;
  static constexpr std::chrono::seconds kDeadline{60};

  explicit DriverProcess(const std::vector<std::string>& arguments) {
    int toChild[2], fromChild[2];
    if (pipe2(toChild, O_CLOEXEC) != 0 || pipe2(fromChild, O_CLOEXEC) != 0) return;
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_adddup2(&actions, toChild[0], STDIN_FILENO);
    posix_spawn_file_actions_adddup2(&actions, fromChild[1], STDOUT_FILENO);
    std::string program = BinDirectory() + "/dorvantos";
    std::vector<std::string> all{program};
    all.insert(all.end(), arguments.begin(), arguments.end());
    std::vector<char*> argv;
    for (std::string& argument : all) argv.push_back(argument.data());
    argv.push_back(nullptr);
    if (posix_spawn(&pid_, program.c_str(), &actions, nullptr, argv.data(), environ) != 0) pid_ = -1;
    posix_spawn_file_actions_destroy(&actions);
    close(toChild[0]);
    close(fromChild[1]);
    in_ = toChild[1];
    out_ = fromChild[0];
  }

  ~DriverProcess() {
    CloseInput();
    if (out_ >= 0) close(out_);
    if (pid_ > 0 && !exited_) {
      kill(pid_, SIGKILL);
      waitpid(pid_, nullptr, 0);
    }
  }

  bool Started() const { return pid_ > 0; }

  void Send(const std::string& line) {
    std::string text = line + "\n";
    for (size_t done = 0; done < text.size();) {
      ssize_t n = write(in_, text.data() + done, text.size() - done);
      if (n <= 0) return;
      done += static_cast<size_t>(n);
    }
  }
  void Send(const Json& request) { Send(request.dump()); }

  // The next line, or nothing when the driver closed its output or the deadline passed.
  std::optional<std::string> ReadLine() {
    auto deadline = std::chrono::steady_clock::now() + kDeadline;
    for (;;) {
      if (size_t end = buffer_.find('\n'); end != std::string::npos) {
        std::string line = buffer_.substr(0, end);
        buffer_.erase(0, end + 1);
        return line;
      }
      auto left = std::chrono::duration_cast<std::chrono::milliseconds>(
          deadline - std::chrono::steady_clock::now());
      if (left.count() <= 0) return std::nullopt;
      pollfd fd{out_, POLLIN, 0};
      if (poll(&fd, 1, static_cast<int>(left.count())) <= 0) continue;
      char chunk[4096];
      ssize_t n = read(out_, chunk, sizeof chunk);
      if (n <= 0) return std::nullopt;
      buffer_.append(chunk, static_cast<size_t>(n));
    }
  }

  // The next line as JSON; a line that is not JSON, or none, is a discarded value.
  Json Read() {
    std::optional<std::string> line = ReadLine();
    if (!line) return Json(Json::value_t::discarded);
    return Json::parse(*line, nullptr, false);
  }

  // Sends a request and reads up to its response: the events before it, then it.
  struct Reply {
    std::vector<Json> events;
    Json response;
  };
  Reply Request(const Json& request) {
    Send(request);
    return ReadReply();
  }
  Reply ReadReply() {
    Reply reply;
    for (;;) {
      Json line = Read();
      if (line.is_discarded() || line.contains("ok")) {
        reply.response = line;
        return reply;
      }
      reply.events.push_back(line);
    }
  }

  void CloseInput() {
    if (in_ >= 0) close(in_);
    in_ = -1;
  }

  // The exit status once the driver ends, -1 when it does not within the deadline.
  int Wait() {
    auto deadline = std::chrono::steady_clock::now() + kDeadline;
    while (std::chrono::steady_clock::now() < deadline) {
      int status = 0;
      pid_t done = waitpid(pid_, &status, WNOHANG);
      if (done == pid_) {
        exited_ = true;
        return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
      }
      usleep(20000);
    }
    return -1;
  }

 private:
  pid_t pid_ = -1;
  int in_ = -1;
  int out_ = -1;
  bool exited_ = false;
  std::string buffer_;
};

}  // namespace dvtest
