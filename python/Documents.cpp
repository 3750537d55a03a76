// Documents, results and interferences.
#include <utility>

#include "Binding.h"

namespace ZORPython {
using namespace ZORToolkit;
namespace {

std::recursive_mutex& LibraryMutex() {
  static std::recursive_mutex mutex;
  return mutex;
}

}  // namespace

LibraryScope::LibraryScope() {
  if (PyGILState_Check() == 1) released_.emplace();
  lock_ = std::unique_lock(LibraryMutex());
}

LoadedPointer Loaded::Read(const std::string& inPath) {
  const LibraryScope library;
  return {new Loaded(inPath), [](Loaded* inLoaded) {
            const LibraryScope whileDeleted;
            delete inLoaded;
          }};
}

const DocumentRecord& Loaded::About() {
  return about_ ? *about_ : about_.emplace(ReadDocument(document_));
}

const InterferenceIndex& Loaded::Index() { return index_ ? *index_ : index_.emplace(document_); }

const ReviewedResult& Loaded::Review() {
  return review_ ? *review_ : review_.emplace(ReadForReview(document_));
}

const std::vector<std::string>& Loaded::Ids() {
  return ids_ ? *ids_ : ids_.emplace(StableIds(Review()));
}

std::string PathFrom(const py::object& inPath) {
  return py::module_::import("os").attr("fsencode")(inPath).cast<std::string>();
}

LoadedPointer LoadedFrom(const py::object& inDocument) {
  if (py::isinstance<PyDocument>(inDocument)) return inDocument.cast<const PyDocument&>().loaded;
  return Loaded::Read(PathFrom(inDocument));
}

double Length(const char* inName, double inLength) {
  if (inLength >= 0) return inLength;
  throw UsageError(std::string(inName) + ": no length in millimetres");
}

namespace {

struct PyInterference {
  LoadedPointer loaded;
  InterferenceRecord record;
};

/// Some of a document's interferences, by their numbers: from the first to before the end.
struct PyInterferences {
  LoadedPointer loaded;
  int begin = 1, end = 1;
};

struct PyResultSet {
  LoadedPointer loaded;
  ResultSetRecord record;
  int begin = 1;  // the number of its first interference
};

/// What a function of Loaded or of the toolkit answers, with the library to itself.
template <class Ask>
auto WithLibrary(const Ask& inAsk) {
  const LibraryScope library;
  return inAsk();
}

DocumentRecord About(const PyDocument& inDocument) {
  return WithLibrary([&] { return inDocument.loaded->About(); });
}

PyInterferences AllInterferences(const PyDocument& inDocument) {
  const int count = WithLibrary([&] { return inDocument.loaded->Index().Count(); });
  return {inDocument.loaded, 1, count + 1};
}

PyInterference ReadNumber(const LoadedPointer& inLoaded, int inNumber) {
  const LibraryScope library;
  PyInterference interference{inLoaded, inLoaded->Index().Read(inNumber)};
  // A handle may be given up by whoever has the library only.
  interference.record.element = {};
  for (ProductRecord& product : interference.record.products) product.element = {};
  return interference;
}

PyInterference ItemAt(const PyInterferences& inList, int inPlace) {
  const int count = inList.end - inList.begin;
  const int place = inPlace < 0 ? inPlace + count : inPlace;
  if (place < 0 || place >= count) throw py::index_error("there is no such interference");
  return ReadNumber(inList.loaded, inList.begin + place);
}

py::list Slice(const PyInterferences& inList, const py::slice& inSlice) {
  Py_ssize_t start = 0, stop = 0, step = 0, count = 0;
  if (!inSlice.compute(inList.end - inList.begin, &start, &stop, &step, &count))
    throw py::error_already_set();
  py::list items;
  for (; count > 0; --count, start += step)
    items.append(ReadNumber(inList.loaded, inList.begin + static_cast<int>(start)));
  return items;
}

std::string IdOf(const PyInterference& inInterference) {
  return WithLibrary([&] {
    return inInterference.loaded->Ids()[static_cast<std::size_t>(inInterference.record.index - 1)];
  });
}

py::object RecordOf(const PyInterference& inInterference, bool inAsWritten) {
  return RecordFrom(IdentifiedRecord{inInterference.record, IdOf(inInterference)}, inAsWritten);
}

/// Reads with the library to itself and makes objects in between, a few hundred records by turns:
/// other threads run Python meanwhile.
py::list ToRecords(const PyInterferences& inList, bool inAsWritten) {
  constexpr int kAtOnce = 256;
  PythonFields fields(inAsWritten);
  py::list rows;
  std::vector<InterferenceRecord> records;
  for (int next = inList.begin; next < inList.end;) {
    const std::vector<std::string>* ids = nullptr;
    const int first = next;
    {
      const LibraryScope library;
      ids = &inList.loaded->Ids();
      records.clear();
      for (; next < inList.end && next < first + kAtOnce; ++next) {
        InterferenceRecord& record = records.emplace_back(inList.loaded->Index().Read(next));
        record.element = {};
        for (ProductRecord& product : record.products) product.element = {};
      }
    }
    for (const InterferenceRecord& record : records)
      rows.append(ValueOf(
          fields, IdentifiedRecord{record, (*ids)[static_cast<std::size_t>(record.index - 1)]}));
  }
  return rows;
}

std::vector<PyResultSet> ResultSets(const PyDocument& inDocument) {
  std::vector<PyResultSet> sets;
  int begin = 1;
  for (const ResultSetRecord& record : About(inDocument).results) {
    sets.push_back({inDocument.loaded, record, begin});
    begin += record.found;
  }
  return sets;
}

py::dict TextsFrom(const AttributeTexts& inTexts) {
  py::dict texts;
  for (const auto& [name, value] : inTexts) texts[TextFrom(name)] = TextFrom(value);
  return texts;
}

template <class Records>
py::list RowsFrom(const Records& inRecords, bool inAsWritten = false) {
  PythonFields fields(inAsWritten);
  return fields.Records(inRecords);
}

py::list Links(const PyDocument& inDocument, bool inCheck) {
  return RowsFrom(WithLibrary([&] {
    std::vector<LinkRecord> links = ReadLinks(inDocument.loaded->Document());
    if (!inCheck) return links;
    const std::vector<std::string> checks = CheckLinks(links, inDocument.loaded->Name());
    for (std::size_t i = 0; i < links.size(); ++i) links[i].check = checks[i];
    return links;
  }));
}

std::string Shown(const PyInterference& inInterference) {
  const InterferenceRecord& record = inInterference.record;
  return "<zorlyra.Interference " + std::to_string(record.index) + ": " + record.type + ' ' +
         record.value.text + '>';
}

void DefineParts(py::module_& ioModule) {
  py::class_<RuleRecord>(ioModule, "Rule", "The rule that an interference violates.")
      .def_readonly("name", &RuleRecord::name)
      .def_readonly("clearance", &RuleRecord::clearance, "Millimetres, or None.")
      .def_readonly("severity", &RuleRecord::severity)
      .def_readonly("penetration_candidate", &RuleRecord::penetrationCandidate);
  py::class_<ViewpointRecord>(ioModule, "Viewpoint", "The camera that an interference has.")
      .def_readonly("projection", &ViewpointRecord::projection)
      .def_readonly("focus_distance", &ViewpointRecord::focusDistance)
      .def_readonly("near", &ViewpointRecord::nearPlane)
      .def_readonly("far", &ViewpointRecord::farPlane)
      .def_readonly("point", &ViewpointRecord::point)
      .def_readonly("sight", &ViewpointRecord::sight);
  py::class_<ProductRecord>(ioModule, "Product", "One of the two products of an interference.")
      .def_readonly("exists", &ProductRecord::exists, "Whether the interference names it.")
      .def_readonly("id", &ProductRecord::id)
      .def_readonly("alias", &ProductRecord::alias, "The path of instance names.")
      .def_readonly("instance", &ProductRecord::instance)
      .def_readonly("label", &ProductRecord::label)
      .def_readonly("alien", &ProductRecord::alien)
      .def_readonly("process_mode", &ProductRecord::processMode)
      .def_readonly("shape", &ProductRecord::shape)
      .def_readonly("shape_source", &ProductRecord::shapeSource)
      .def_readonly("preview", &ProductRecord::preview)
      .def_property_readonly(
          "position",
          [](const ProductRecord& inProduct) -> std::optional<Placement> {
            if (!inProduct.exists) return std::nullopt;
            return inProduct.placement;
          },
          "The columns of its rotation and its translation in millimetres, twelve numbers; None "
          "without a product.")
      .def_readonly("why_misread", &ProductRecord::whyMisread,
                    "Why these are not the numbers that were written; empty when they are.")
      .def("__repr__", [](const ProductRecord& inProduct) {
        return "<zorlyra.Product " + (inProduct.alias.empty() ? inProduct.id : inProduct.alias) +
               '>';
      });
}

template <class Member>
auto Field(Member InterferenceRecord::*inMember) {
  return [inMember](const PyInterference& inInterference) -> const Member& {
    return inInterference.record.*inMember;
  };
}

void DefineInterference(py::module_& ioModule) {
  constexpr auto kInside = py::return_value_policy::reference_internal;
  using Record = InterferenceRecord;
  py::class_<PyInterference>(ioModule, "Interference",
                             "An interference. Numbers are float, None where there is no number; "
                             "texts are empty where the document has none.")
      .def_property_readonly("index", Field(&Record::index), "Its number in the document, from 1.")
      .def_property_readonly("id", &IdOf, "Stays the same when the result is computed again.")
      .def_property_readonly("result", Field(&Record::result), "The name of its result set.")
      .def_property_readonly("name", Field(&Record::name))
      .def_property_readonly("value", Field(&Record::value),
                             "Minus the depth of a clash, or a distance; millimetres.")
      .def_property_readonly("type", Field(&Record::type))
      .def_property_readonly("type_as_written", Field(&Record::typeAsWritten))
      .def_property_readonly("clearance", Field(&Record::clearance))
      .def_property_readonly("status", Field(&Record::status),
                             "'Relevant', 'Irrelevant', 'Not inspected' or 'error'.")
      .def_property_readonly("status_as_written", Field(&Record::statusAsWritten))
      .def_property_readonly("computation_case", Field(&Record::computationCase))
      .def_property_readonly("retrieve", Field(&Record::retrieve))
      .def_property_readonly("rule", Field(&Record::rule), kInside)
      .def_property_readonly("products", Field(&Record::products), kInside, "The two products.")
      .def_property_readonly("comment", Field(&Record::comment))
      .def_property_readonly("picture", Field(&Record::picture))
      .def_property_readonly("curve_length", Field(&Record::curveLength))
      .def_property_readonly("distance", Field(&Record::distance))
      .def_property_readonly("points", Field(&Record::points), "Points of the interference.")
      .def_property_readonly("viewpoint", Field(&Record::viewpoint), kInside)
      .def("to_dict", &RecordOf, py::arg("as_written") = false,
           "What `lyra show --json` prints; numbers as float or None, or as they are written.")
      .def("__repr__", &Shown);
  py::class_<PyInterferences>(ioModule, "Interferences",
                              "A sequence of interferences, each read when it is asked for.")
      .def("__len__", [](const PyInterferences& inList) { return inList.end - inList.begin; })
      .def("__getitem__", &ItemAt, py::arg("place"))
      .def("__getitem__", &Slice, py::arg("places"))
      .def("to_records", &ToRecords, py::arg("as_written") = false,
           "A list of dictionaries with the keys of `lyra list --json`, as pandas takes them; "
           "numbers as float or None, or as they are written.");
  py::class_<PyResultSet>(ioModule, "ResultSet", "A result set of a document.")
      .def_property_readonly("name", [](const PyResultSet& inSet) { return inSet.record.name; })
      .def_property_readonly("computation_case",
                             [](const PyResultSet& inSet) { return inSet.record.computationCase; })
      .def_property_readonly(
          "declared", [](const PyResultSet& inSet) { return inSet.record.declared; },
          "How many interferences it says that it has.")
      .def_property_readonly("interferences", [](const PyResultSet& inSet) {
        return PyInterferences{inSet.loaded, inSet.begin, inSet.begin + inSet.record.found};
      });
}

}  // namespace

void DefineDocuments(py::module_& ioModule) {
  DefineParts(ioModule);
  DefineInterference(ioModule);
  py::class_<PyDocument>(ioModule, "Document", "A document that is read; see read().")
      .def_property_readonly(
          "file", [](const PyDocument& inDocument) { return TextFrom(inDocument.loaded->Name()); })
      .def_property_readonly(
          "kind",
          [](const PyDocument& inDocument) {
            return RootName(inDocument.loaded->Document().Kind());
          },
          "The name of its root element, such as 'ClashElement'.")
      .def_property_readonly("version",
                             [](const PyDocument& inDocument) { return About(inDocument).version; })
      .def_property_readonly(
          "name", [](const PyDocument& inDocument) { return About(inDocument).reference; },
          "The document that was checked.")
      .def_property_readonly(
          "responsible", [](const PyDocument& inDocument) { return About(inDocument).responsible; })
      .def_property_readonly(
          "date", [](const PyDocument& inDocument) { return TextsFrom(About(inDocument).date); })
      .def_property_readonly(
          "specification",
          [](const PyDocument& inDocument) { return TextsFrom(About(inDocument).specification); })
      .def_property_readonly("results", &ResultSets)
      .def_property_readonly("interferences", &AllInterferences,
                             "All of them, in document order over all result sets.")
      .def(
          "to_records",
          [](const PyDocument& inDocument, bool inAsWritten) {
            return ToRecords(AllInterferences(inDocument), inAsWritten);
          },
          py::arg("as_written") = false,
          "A list of dictionaries with the keys of `lyra list --json`, as pandas takes them; "
          "numbers as float or None, or as they are written.")
      .def(
          "info", [](const PyDocument& inDocument) { return RecordFrom(About(inDocument)); },
          "What `lyra info --json` prints of a document.")
      .def(
          "components",
          [](const PyDocument& inDocument) {
            return RowsFrom(
                WithLibrary([&] { return ReadComponents(inDocument.loaded->Document()); }));
          },
          "What `lyra components --json` prints; empty for other documents.")
      .def(
          "specifications",
          [](const PyDocument& inDocument) {
            return RowsFrom(
                WithLibrary([&] { return ReadSpecifications(inDocument.loaded->Document()); }));
          },
          "What `lyra specs --json` prints.")
      .def("links", &Links, py::arg("check") = false,
           "What `lyra links --json` prints; empty for other documents.")
      .def("__repr__", [](const PyDocument& inDocument) {
        return TextFrom("<zorlyra.Document " + inDocument.loaded->Name() + '>');
      });
  ioModule.def(
      "read", [](const py::object& inPath) { return PyDocument{Loaded::Read(PathFrom(inPath))}; },
      py::arg("path"),
      "Read a document of any kind.\n\nRaises Error, with the place, for what cannot be read.");
}

}  // namespace ZORPython
