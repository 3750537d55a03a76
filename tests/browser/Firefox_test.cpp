// A published page in Firefox, driven over its own protocol (Marionette: the length of a message, a colon, JSON).
#include <arpa/inet.h>
#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <netinet/in.h>
#include <signal.h>
#include <spawn.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <chrono>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <thread>

#include "tools/Command.h"

using nlohmann::json;

namespace {

/// One browser with one page.
class Firefox {
 public:
  Firefox() {
    profile_.Write("user.js",
                   "user_pref('marionette.port', 0);\nuser_pref('app.update.auto', false);\n"
                   "user_pref('webgl.force-enabled', true);\n");
    const std::string profile = profile_.Path("");
    const char* words[] = {
        FIREFOX,       "--headless", "--marionette",  "-remote-allow-system-access",
        "--no-remote", "--profile",  profile.c_str(), nullptr};
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    for (const int output : {1, 2})
      posix_spawn_file_actions_addopen(&actions, output, "/dev/null", O_WRONLY, 0);
    const int failed = posix_spawn(&process_, FIREFOX, &actions, nullptr,
                                   const_cast<char* const*>(words), environ);
    posix_spawn_file_actions_destroy(&actions);
    if (failed != 0) throw std::runtime_error("the browser does not start");
    Connect();
    Read();  // who is there
    Send("WebDriver:NewSession", {{"capabilities", json::object()}});
    Send("WebDriver:SetTimeouts", {{"script", 120000}, {"pageLoad", 120000}});
  }
  ~Firefox() {
    if (socket_ >= 0) close(socket_);
    kill(process_, SIGKILL);
    waitpid(process_, nullptr, 0);
  }
  Firefox(const Firefox&) = delete;
  Firefox& operator=(const Firefox&) = delete;

  void Open(const std::string& inPath) {
    Send("WebDriver:Navigate", {{"url", "file://" + inPath}});
  }
  /// What a function answers, after its promises are kept.
  json Value(const std::string& inBody) {
    return Send("WebDriver:ExecuteAsyncScript",
                {{"script", "const done = arguments[0]; (async () => {" + inBody +
                                "})().then(done, e => done('error: ' + e))"},
                 {"args", json::array()}});
  }
  /// What pages from disk said on the console: errors, warnings, refused loads.
  json Messages() {
    Send("Marionette:SetContext", {{"value", "chrome"}});
    const json messages =
        Send("WebDriver:ExecuteScript",
             {{"script",
               "return Services.console.getMessageArray().map(m => String(m.message || m))"
               ".filter(m => /file:\\/\\/|Content-Security-Policy/.test(m))"},
              {"args", json::array()}});
    Send("Marionette:SetContext", {{"value", "content"}});
    return messages;
  }

 private:
  /// The browser writes its port when it listens.
  void Connect() {
    int port = 0;
    for (int i = 0; i < 6000 && port == 0; ++i) {
      std::this_thread::sleep_for(std::chrono::milliseconds(20));
      port = std::atoi(
          RunShell("cat " + profile_.Path("MarionetteActivePort") + " 2>/dev/null").out.c_str());
    }
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_port = htons(static_cast<std::uint16_t>(port));
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socket_ = socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    if (port == 0 || connect(socket_, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0)
      throw std::runtime_error("the browser does not listen");
  }

  json Send(const std::string& inCommand, const json& inArguments) {
    const std::string text = json::array({0, ++last_, inCommand, inArguments}).dump();
    const std::string message = std::to_string(text.size()) + ":" + text;
    if (send(socket_, message.data(), message.size(), MSG_NOSIGNAL) !=
        static_cast<ssize_t>(message.size()))
      throw std::runtime_error("the browser has gone");
    const json answer = Read();
    if (!answer.at(2).is_null()) throw std::runtime_error(inCommand + ": " + answer[2].dump());
    return answer.at(3).is_object() && answer[3].contains("value") ? answer[3]["value"] : answer[3];
  }

  json Read() {
    for (;;) {
      const std::size_t colon = buffer_.find(':');
      const std::size_t size = colon == std::string::npos ? 0 : std::stoul(buffer_);
      if (colon != std::string::npos && buffer_.size() > colon + size) {
        const json message = json::parse(buffer_.substr(colon + 1, size));
        buffer_.erase(0, colon + 1 + size);
        return message;
      }
      char bytes[65536];
      const ssize_t count = recv(socket_, bytes, sizeof bytes, 0);
      if (count <= 0) throw std::runtime_error("the browser has gone");
      buffer_.append(bytes, static_cast<std::size_t>(count));
    }
  }

  TemporaryDirectory profile_;
  pid_t process_ = 0;
  int socket_ = -1, last_ = 0;
  std::string buffer_;
};

}  // namespace

TEST(Firefox, ShowsSettlesAndTurnsAPage) {
  const TemporaryDirectory directory;
  const std::string page = directory.Path("as1.html");
  const CommandResult made = RunCommand({"publish", "samples/as1.clash.xml", "--model",
                                         "samples/as1-oc-214.stp", "--size", "126x84", "-o", page});
  ASSERT_EQ(made.code, 0) << made.error;
  Firefox browser;
  browser.Open(page);
  EXPECT_EQ(browser.Value("const p = document.images; await Promise.all([...p].filter(i => "
                          "i.getAttribute('src')).map(i => i.decode()));"
                          "return document.querySelectorAll('tr[data-n]').length"),
            32);
  EXPECT_EQ(browser.Value("for (const key of ['j', 'r']) document.body.dispatchEvent("
                          "new KeyboardEvent('keydown', {key, bubbles: true}));"
                          "return document.querySelector('tr[data-n=\"1\"]').dataset.status"),
            "Relevant");
  EXPECT_EQ(browser.Messages(), json::array());
  // Turned, or where the machine has no WebGL the picture stays and says so
  const json turned = browser.Value(
      "document.querySelector('#i3 .picture > a').click();"
      "for (let i = 0; i < 2000; ++i) { const section = document.querySelector('#i3');"
      "const canvas = section.querySelector('canvas'), said = section.querySelector('figcaption');"
      "if (canvas?.dataset.still) return 'turned'; if (!canvas && said) return said.textContent;"
      "await new Promise(done => setTimeout(done, 50)); } return 'nothing'");
  EXPECT_THAT(turned, testing::AnyOf("turned",
                                     "The picture cannot be turned: this browser has no WebGL 2."));
  for (const json& message : browser.Messages())  // the browser itself says that it has no WebGL
    EXPECT_THAT(message.get<std::string>(), testing::HasSubstr("WebGL"));
  // What shows that a message would be seen
  browser.Value("new Image().src = 'http://127.0.0.1/refused.png'");
  const auto isSeen = [&] {
    return browser.Messages().dump().find("refused.png") != std::string::npos;
  };
  for (int i = 0; i < 600 && !isSeen(); ++i)
    browser.Value("await new Promise(done => setTimeout(done, 50))");
  EXPECT_TRUE(isSeen());
}
