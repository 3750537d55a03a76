// What the parts of the Python module share.
#ifndef ZOR_PYTHON_BINDING_H
#define ZOR_PYTHON_BINDING_H

#include <pybind11/pybind11.h>
#include <pybind11/stl.h>

#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "toolkit/records/RecordFields.h"
#include "toolkit/review/StableIds.h"

namespace pybind11::detail {

/// A number of a document: a float, or None where there is none.
template <>
struct type_caster<ZORToolkit::Number> {
  PYBIND11_TYPE_CASTER(ZORToolkit::Number, const_name("Optional[float]"));
  bool load(handle, bool) { return false; }
  static handle cast(const ZORToolkit::Number& inNumber, return_value_policy, handle) {
    if (!inNumber.value) return none().release();
    return PyFloat_FromDouble(*inNumber.value);
  }
};

}  // namespace pybind11::detail

namespace ZORPython {
namespace py = pybind11;

/// Neither readers nor writers of documents lock anything, so the module's calls take turns: while
/// this lives, this thread has the library to itself and other threads may run Python. Whoever waits
/// for the library does not hold the interpreter, so a callback may take that.
class LibraryScope {
 public:
  LibraryScope();
  LibraryScope(const LibraryScope&) = delete;
  LibraryScope& operator=(const LibraryScope&) = delete;

 private:
  std::optional<py::gil_scoped_release> released_;
  std::unique_lock<std::recursive_mutex> lock_;
};

/// A document with what was asked of it so far. Its calls need a LibraryScope.
class Loaded {
 public:
  static std::shared_ptr<Loaded> Read(const std::string& inPath);

  ZORToolkit::ClashDocument& Document() { return document_; }
  const std::string& Name() const { return document_.Name(); }
  const ZORToolkit::DocumentRecord& About();
  const ZORToolkit::InterferenceIndex& Index();
  const ZORToolkit::ReviewedResult& Review();
  const std::vector<std::string>& Ids();

 private:
  explicit Loaded(const std::string& inPath) : document_(inPath) {}

  ZORToolkit::ClashDocument document_;
  std::optional<ZORToolkit::DocumentRecord> about_;
  std::optional<ZORToolkit::InterferenceIndex> index_;
  std::optional<ZORToolkit::ReviewedResult> review_;
  std::optional<std::vector<std::string>> ids_;
};
using LoadedPointer = std::shared_ptr<Loaded>;

/// A document as Python has it.
struct PyDocument {
  LoadedPointer loaded;
};

/// str, bytes or os.PathLike, as the system has it.
std::string PathFrom(const py::object& inPath);
/// Of a Document, or of a path that is read.
LoadedPointer LoadedFrom(const py::object& inDocument);
/// Raises UsageError for what is no length.
double Length(const char* inName, double inLength);

/// Bytes that are no UTF-8 become U+FFFD.
inline py::object TextFrom(std::string_view inText) {
  return py::reinterpret_steal<py::object>(
      PyUnicode_DecodeUTF8(inText.data(), static_cast<Py_ssize_t>(inText.size()), "replace"));
}

/// Records as dictionaries and lists.
class PythonFields : public ZORToolkit::FieldMaker<PythonFields> {
 public:
  using Value = py::object;

  /// @param inAsWritten numbers of documents are texts, else float or None.
  explicit PythonFields(bool inAsWritten) : asWritten_(inAsWritten) {}

  Value Text(std::string_view inText) { return TextFrom(inText); }
  Value Integer(long long inNumber) { return py::int_(inNumber); }
  Value Real(double inNumber) { return py::float_(inNumber); }
  Value Written(const ZORToolkit::Number& inNumber) {
    return asWritten_ ? Text(inNumber.text) : py::cast(inNumber);
  }
  Value Null() { return py::none(); }
  Value NewObject() { return py::dict(); }
  Value NewArray() { return py::list(); }
  void Set(Value& ioObject, const char* inName, const Value& inValue) {
    if (PyDict_SetItem(ioObject.ptr(), Key(inName).ptr(), inValue.ptr()) != 0)
      throw py::error_already_set();
  }
  void Append(Value& ioArray, const Value& inValue) {
    if (PyList_Append(ioArray.ptr(), inValue.ptr()) != 0) throw py::error_already_set();
  }

 private:
  const py::object& Key(const char* inName) {
    py::object& key = keys_[inName];
    if (!key) key = py::reinterpret_steal<py::object>(PyUnicode_InternFromString(inName));
    return key;
  }

  bool asWritten_;
  std::unordered_map<const char*, py::object> keys_;  // each name is one literal
};

template <class Record>
py::object RecordFrom(const Record& inRecord, bool inAsWritten = false) {
  PythonFields fields(inAsWritten);
  return ValueOf(fields, inRecord);
}

void DefineDocuments(py::module_& ioModule);
void DefineReview(py::module_& ioModule);
void DefineMaking(py::module_& ioModule);

}  // namespace ZORPython

#endif
