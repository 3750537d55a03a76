// The Python module: it calls the toolkit, as the command does, and holds nothing of its own.
#include <exception>
#include <string>

#include "Binding.h"
#include "default_platform/OpenModel.h"
#include "foundation/Descriptor.h"
#include "foundation/TerminationSignals.h"

namespace ZORPython {
namespace {

PyObject* errorType = nullptr;  // zorlyra.Error, as long as the process lives

py::object NumberOrNone(std::size_t inNumber) {
  return inNumber == 0 ? py::object(py::none()) : py::object(py::int_(inNumber));
}

void Raise(const char* inText, const std::string& inFile, ZORToolkit::FilePlace inPlace = {}) {
  const py::object error = py::handle(errorType)(TextFrom(inText));
  error.attr("file") = inFile.empty() ? py::object(py::none()) : TextFrom(inFile);
  error.attr("line") = NumberOrNone(inPlace.line);
  error.attr("column") = NumberOrNone(inPlace.column);
  PyErr_SetObject(errorType, error.ptr());
}

void Translate(std::exception_ptr inError) {
  try {
    if (inError) std::rethrow_exception(inError);
  } catch (const ZORToolkit::Error& error) {
    Raise(error.what(), error.File(), error.Place());
  } catch (const ZORFoundation::FileError& error) {
    Raise(error.what(), error.Path());
  } catch (const ZORDefault::ModelError& error) {
    Raise(error.what(), error.GetPath());
  } catch (const ZORToolkit::UsageError& error) {
    PyErr_SetString(PyExc_ValueError, error.what());
  } catch (const ZORFoundation::Interrupted&) {
    PyErr_SetNone(PyExc_KeyboardInterrupt);
  }
}

void DefineError(py::module_& ioModule) {
  errorType = PyErr_NewExceptionWithDoc(
      "zorlyra.Error",
      "What was asked for cannot be done with this input or output.\n\nIts text is one line; file, "
      "line and column say where, None as far as there is no place.",
      nullptr, nullptr);
  if (errorType == nullptr) throw py::error_already_set();
  const py::handle type(errorType);
  for (const char* const name : {"file", "line", "column"}) type.attr(name) = py::none();
  ioModule.add_object("Error", type);
  py::register_exception_translator(&Translate);
}

}  // namespace
}  // namespace ZORPython

PYBIND11_MODULE(_zorlyra, ioModule) {
  ioModule.attr("__version__") = ZOR_VERSION;
  ZORPython::DefineError(ioModule);
  ZORPython::DefineDocuments(ioModule);
  ZORPython::DefineReview(ioModule);
  ZORPython::DefineMaking(ioModule);
}
