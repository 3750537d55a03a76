#include "browser/Browser.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <stdexcept>
#include <thread>

using nlohmann::json;

namespace {

constexpr int kMaxWait = 60000;  // milliseconds for one answer

struct Pipe {
  Pipe() {
    if (pipe2(ends, O_CLOEXEC) != 0) throw std::runtime_error("no pipe");
  }
  int ends[2];
};

json MouseAt(const char* inType, double inX, double inY, int inButtons) {
  return {{"type", inType},       {"x", inX},       {"y", inY}, {"button", "left"},
          {"buttons", inButtons}, {"clickCount", 1}};
}

}  // namespace

std::string FromBase64(const std::string& inText) {
  std::string bytes;
  unsigned int bits = 0;
  int count = 0;
  for (const char digit : inText) {
    const std::string digits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    const std::size_t value = digits.find(digit);
    if (value == std::string::npos) continue;
    bits = (bits << 6) | static_cast<unsigned int>(value);
    if ((count += 6) >= 8) bytes += static_cast<char>(bits >> (count -= 8));
  }
  return bytes;
}

// The sandbox cannot be had by every user who runs tests; WebGL is drawn by the processor.
Browser::Browser() {
  signal(SIGPIPE, SIG_IGN);
  const Pipe commands, answers;
  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  // By way of high numbers, since the pipes may have these two already.
  posix_spawn_file_actions_adddup2(&actions, commands.ends[0], 103);
  posix_spawn_file_actions_adddup2(&actions, answers.ends[1], 104);
  posix_spawn_file_actions_adddup2(&actions, 103, 3);
  posix_spawn_file_actions_adddup2(&actions, 104, 4);
  posix_spawn_file_actions_addopen(&actions, 2, "/dev/null", O_WRONLY, 0);
  const std::string profile = "--user-data-dir=" + profile_.Path("profile");
  const char* words[] = {CHROMIUM,
                         "--headless",
                         "--no-sandbox",
                         "--disable-dev-shm-usage",
                         "--use-angle=swiftshader",
                         "--enable-unsafe-swiftshader",
                         "--force-device-scale-factor=1",
                         "--hide-scrollbars",
                         "--lang=en",
                         "--remote-debugging-pipe",
                         profile.c_str(),
                         nullptr};
  const int failed =
      posix_spawn(&process_, CHROMIUM, &actions, nullptr, const_cast<char* const*>(words), environ);
  posix_spawn_file_actions_destroy(&actions);
  close(commands.ends[0]);
  close(answers.ends[1]);
  in_ = commands.ends[1];
  out_ = answers.ends[0];
  if (failed != 0) throw std::runtime_error("the browser does not start");
  const json target = Send("Target.createTarget", {{"url", "about:blank"}});
  session_ = Send("Target.attachToTarget",
                  {{"targetId", target["targetId"]}, {"flatten", true}})["sessionId"];
  for (const char* domain : {"Page.enable", "Runtime.enable", "Log.enable"}) Send(domain);
  std::filesystem::create_directory(profile_.Path("down"));
  Send("Page.setDownloadBehavior",
       {{"behavior", "allow"}, {"downloadPath", profile_.Path("down")}});
  Resize(1280, 900);
}

Browser::~Browser() {
  close(in_);
  close(out_);
  kill(process_, SIGTERM);
  waitpid(process_, nullptr, 0);
}

void Browser::Write(const std::string& inBytes) {
  for (std::size_t done = 0; done < inBytes.size();) {
    const ssize_t count = write(in_, inBytes.data() + done, inBytes.size() - done);
    if (count <= 0) throw std::runtime_error("the browser has gone");
    done += static_cast<std::size_t>(count);
  }
}

json Browser::Read() {
  std::size_t end = 0;
  while ((end = buffer_.find('\0')) == std::string::npos) {
    pollfd ready{out_, POLLIN, 0};
    char block[65536];
    const ssize_t count = poll(&ready, 1, kMaxWait) == 1 ? read(out_, block, sizeof block) : 0;
    if (count <= 0) throw std::runtime_error("the browser does not answer");
    buffer_.append(block, static_cast<std::size_t>(count));
  }
  json message = json::parse(buffer_.substr(0, end));
  buffer_.erase(0, end + 1);
  const std::string method = message.value("method", "");
  if (method == "Page.loadEventFired") isLoaded_ = true;
  if (method == "Runtime.consoleAPICalled" || method == "Runtime.exceptionThrown" ||
      method == "Log.entryAdded")
    messages_.push_back(message["params"].dump());
  return message;
}

json Browser::Send(const std::string& inMethod, const json& inArguments) {
  json message = {{"id", ++last_}, {"method", inMethod}};
  if (!inArguments.is_null()) message["params"] = inArguments;
  if (!session_.empty()) message["sessionId"] = session_;
  Write(message.dump() + '\0');
  for (;;) {
    json answer = Read();
    if (answer.value("id", 0) != last_) continue;
    if (answer.contains("error"))
      throw std::runtime_error(inMethod + ": " + answer["error"].dump());
    return answer["result"];
  }
}

void Browser::Open(const std::string& inPath) {
  Send("Page.navigate", {{"url", "about:blank"}});
  while (!isLoaded_) Read();
  isLoaded_ = false;
  messages_.clear();
  Send("Page.navigate", {{"url", "file://" + inPath}});
  while (!isLoaded_) Read();
  isLoaded_ = false;
}

json Browser::Value(const std::string& inExpression) {
  const json answer =
      Send("Runtime.evaluate",
           {{"expression", inExpression}, {"awaitPromise", true}, {"returnByValue", true}});
  if (answer.contains("exceptionDetails"))
    throw std::runtime_error(inExpression + ": " + answer["exceptionDetails"].dump());
  return answer["result"].value("value", json());
}

bool Browser::Wait(const std::string& inExpression) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
  while (Value(inExpression) != true) {
    if (std::chrono::steady_clock::now() > end) return false;
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
  }
  return true;
}

void Browser::Key(const std::string& inKey) {
  json key = {{"type", "keyDown"}, {"key", inKey}};
  if (inKey.size() == 1) key["text"] = inKey;
  if (inKey == "Enter") key.update({{"text", "\r"}, {"windowsVirtualKeyCode", 13}});
  if (inKey == "Escape") key["windowsVirtualKeyCode"] = 27;
  Send("Input.dispatchKeyEvent", key);
  Send("Input.dispatchKeyEvent", {{"type", "keyUp"}, {"key", inKey}});
}

void Browser::Type(const std::string& inText) { Send("Input.insertText", {{"text", inText}}); }

/// The middle of an element that was brought into view. Pictures that come into view load only then, and
/// move what stands below them.
constexpr const char* kPlaceOf = R"(async selector => {
    const element = document.querySelector(selector);
    element.scrollIntoView({block: 'center', behavior: 'instant'});
    const isLoading = image => !image.complete &&
        image.getBoundingClientRect().bottom > 0 && image.getBoundingClientRect().top < innerHeight;
    let last = '';
    for (let frame = 0, still = 0; frame < 600 && still < 3; ++frame) {
      await new Promise(requestAnimationFrame);
      const box = element.getBoundingClientRect();
      const now = [box.x, box.y, box.width, box.height].join();
      still = now === last && ![...document.images].some(isLoading) ? still + 1 : 0;
      last = now;
    }
    const box = element.getBoundingClientRect();
    return [box.x + box.width / 2, box.y + box.height / 2];
  })";

void Browser::Click(const std::string& inSelector) {
  const json place = Value(std::string("(") + kPlaceOf + ")(" + json(inSelector).dump() + ")");
  Send("Input.dispatchMouseEvent", MouseAt("mousePressed", place[0], place[1], 1));
  Send("Input.dispatchMouseEvent", MouseAt("mouseReleased", place[0], place[1], 0));
}

void Browser::Drag(int inFromX, int inFromY, int inToX, int inToY) {
  Send("Input.dispatchMouseEvent", MouseAt("mousePressed", inFromX, inFromY, 1));
  Send("Input.dispatchMouseEvent", MouseAt("mouseMoved", inToX, inToY, 1));
  Send("Input.dispatchMouseEvent", MouseAt("mouseReleased", inToX, inToY, 0));
}

void Browser::Resize(int inWidth, int inHeight) {
  Send("Emulation.setDeviceMetricsOverride",
       {{"width", inWidth}, {"height", inHeight}, {"deviceScaleFactor", 1}, {"mobile", false}});
}

std::string Browser::Screenshot() {
  return FromBase64(Send("Page.captureScreenshot", {{"format", "png"}})["data"]);
}

std::vector<std::string> Browser::Messages() {
  Value("0");  // what came before it has been read then
  return messages_;
}
