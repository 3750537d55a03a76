// Chromium, driven through its debugging pipe as a reader would use it: by clicks and keys.
#ifndef ZOR_TESTS_BROWSER_BROWSER_H
#define ZOR_TESTS_BROWSER_BROWSER_H

#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "tools/Command.h"

/// One browser with one page. Whatever it answers with an error is raised as std::runtime_error.
class Browser {
 public:
  Browser();
  ~Browser();
  Browser(const Browser&) = delete;
  Browser& operator=(const Browser&) = delete;

  /// Opens a file and waits until it is loaded. What was told before is forgotten.
  void Open(const std::string& inPath);
  /// The value of an expression, after a promise is kept. Not subject to the page's policy.
  nlohmann::json Value(const std::string& inExpression);
  /// Waits until an expression holds. @return whether it did within half a minute.
  bool Wait(const std::string& inExpression);

  /// Presses and releases a key such as "j", "Enter" or "Escape".
  void Key(const std::string& inKey);
  /// Types into what has the focus.
  void Type(const std::string& inText);
  /// Clicks in the middle of an element, which is scrolled into view. Raises when there is none.
  void Click(const std::string& inSelector);
  void Drag(int inFromX, int inFromY, int inToX, int inToY);

  nlohmann::json Send(const std::string& inMethod, const nlohmann::json& inArguments = {});
  void Resize(int inWidth, int inHeight);
  /// PNG bytes of what is seen.
  std::string Screenshot();
  /// All that the page said on its console since it was opened: messages, errors, refused loads.
  std::vector<std::string> Messages();
  /// Where downloads go.
  std::string Download(const std::string& inName) const { return profile_.Path("down/" + inName); }

 private:
  nlohmann::json Read();
  void Write(const std::string& inBytes);

  TemporaryDirectory profile_;
  int process_ = 0, in_ = -1, out_ = -1, last_ = 0;
  std::string buffer_, session_;
  std::vector<std::string> messages_;
  bool isLoaded_ = false;
};

std::string FromBase64(const std::string& inText);

#endif
