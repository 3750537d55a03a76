#include "default_platform/ReaderProgram.h"

#include <unistd.h>

#include <Standard_Failure.hxx>
#include <Standard_OutOfMemory.hxx>
#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <exception>
#include <new>
#include <optional>
#include <utility>
#include <vector>

#include "default_platform/product_structure/model_reader/FileSandbox.h"
#include "default_platform/product_structure/model_reader/ObjFaces.h"
#include "default_platform/product_structure/model_reader/ReaderSystem.h"
#include "foundation/Descriptor.h"
#include "foundation/Process.h"
#include "foundation/ReadWholeFile.h"

namespace ZORDefault {
namespace {

int Answer(int inExitCode, std::string_view inBytes) {
  std::size_t written = 0;
  const int error = ZORFoundation::WriteAll(ModelReaderProtocol::kResult, inBytes, written);
  return error == 0 ? inExitCode : ModelReaderProtocol::kExitOutOfMemory;
}

int Refuse(const std::string& inReason) {
  return Answer(ModelReaderProtocol::kExitRefused, inReason);
}

/// What the kernel gets for the model's bytes.
void Replace(std::string& ioBytes, std::string inOther) {
  std::size_t written = 0;
  if (ftruncate(ModelReaderProtocol::kModel, 0) != 0 ||
      lseek(ModelReaderProtocol::kModel, 0, SEEK_SET) != 0 ||
      ZORFoundation::WriteAll(ModelReaderProtocol::kModel, inOther, written) != 0)
    throw std::bad_alloc();  // it is a file in memory
  ioBytes = std::move(inOther);
}

int Run(const std::vector<std::string>& inArguments) try {
  ModelRequest request;
  request.format = static_cast<ModelFormat>(std::atoi(inArguments[1].c_str()));
  request.deflection = std::atof(inArguments[2].c_str());
  SetProcessLimits(
      {std::atof(inArguments[4].c_str()), std::strtoull(inArguments[3].c_str(), nullptr, 10)});
  request.path = inArguments[5];
  ZORFoundation::Rewind(ModelReaderProtocol::kModel, request.path);
  std::string bytes = ZORFoundation::ReadToEnd(ModelReaderProtocol::kModel, request.path);
  if (request.format == ModelFormat::kObj)
    if (std::optional<std::string> other = ObjWithoutLargeFaces(bytes))
      Replace(bytes, *std::move(other));
  EnterFileSandbox(request.path, ModelReaderProtocol::kModel);
  return Answer(ModelReaderProtocol::kExitRead, AnswerTo(request, bytes));
} catch (const Refusal& refusal) {
  return Refuse(refusal.reason);
} catch (const Standard_OutOfMemory&) {
  return ModelReaderProtocol::kExitOutOfMemory;
} catch (const std::bad_alloc&) {
  return ModelReaderProtocol::kExitOutOfMemory;
} catch (const Standard_Failure& failure) {
  return Refuse("cannot be read: " + OneLine(failure.GetMessageString()));
} catch (const std::exception& error) {
  return Refuse("cannot be read: " + OneLine(error.what()));
}

}  // namespace

void ReportStatus(const std::string& inLine) {
  std::size_t written = 0;
  ZORFoundation::WriteAll(ModelReaderProtocol::kStatus, inLine + '\n', written);
}

std::string OneLine(const char* inMessage) {
  std::string line = inMessage ? inMessage : "";
  std::ranges::replace_if(
      line, [](unsigned char byte) { return byte < 0x20; }, ' ');
  return line;
}

}  // namespace ZORDefault

int main(int inCount, char** inArguments) {
  constexpr std::size_t kArguments = 6;
  const auto words = ZORFoundation::WordsOfCommandLine(inCount, inArguments);
  if (words.size() != kArguments) return ZORDefault::ModelReaderProtocol::kExitOutOfMemory + 1;
  // Without destructors: what the kernel built need not be taken apart.
  _exit(ZORDefault::Run(words));
}
