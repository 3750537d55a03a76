// A host's whole reading loop over the public operations, written as hosts write it: every
// interference, specification and component is asked for by its number.
#include <array>
#include <bit>
#include <memory>
#include <utility>

#include "Measurement.h"
#include "ZORClashParsing.h"
#include "ZORLyraXMLServices.h"
#include "ZORTree.h"

namespace {
template <class Sink, std::size_t kCount>
void AddAll(const std::array<ZORUnicodeString, kCount>& inAnswers, Sink& ioSink) {
  for (const ZORUnicodeString& answer : inAnswers) ioSink.Add(Units(answer));
}

template <class Sink>
void AskGeneral(ZORClashParsing& ioReader, Sink& ioSink) {
  ZORUnicodeString version, reference, responsible;
  DOM_Node date, specification;
  int count = 0;
  ioReader.GetClashGeneralInfos(version, reference, date, specification, count, responsible);
  ioSink.Add(Units(version));
  ioSink.Add(Units(reference));
  ioSink.Add(Units(responsible));
  ioSink.Add(static_cast<std::uint64_t>(count));
}

template <class Sink>
void AskShort(ZORClashParsing& ioReader, int inCount, Sink& ioSink) {
  for (int i = 1; i <= inCount; ++i) {
    ZORUnicodeString value, resultType, ruleName, firstAlias, secondAlias;
    ioReader.GetClashInfos(i, value, resultType, ruleName, firstAlias, secondAlias);
    for (const ZORUnicodeString* answer :
         {&value, &resultType, &ruleName, &firstAlias, &secondAlias})
      ioSink.Add(Units(*answer));
  }
}

template <std::size_t kCount, std::size_t... kPlace>
void GetAllInfos(ZORClashParsing& ioReader, int inIndex,
                 std::array<ZORUnicodeString, kCount>& outAnswers, std::index_sequence<kPlace...>) {
  ioReader.GetClashInfos("1.2", inIndex, outAnswers[kPlace]...);
}

template <class Sink>
void AskFull(ZORClashParsing& ioReader, int inCount, Sink& ioSink) {
  for (int i = 1; i <= inCount; ++i) {
    std::array<ZORUnicodeString, 42> answers;
    GetAllInfos(ioReader, i, answers, std::make_index_sequence<answers.size()>());
    AddAll(answers, ioSink);
  }
}

template <class Sink>
void AskCopies(ZORClashParsing& ioReader, int inCount, Sink& ioSink) {
  for (int i = 1; i <= inCount; ++i) {
    DOM_Node interference;
    ZORUnicodeString firstLabel, secondLabel, firstPreview, secondPreview;
    ioReader.GetithInterference(i, interference, firstLabel, secondLabel, firstPreview,
                                secondPreview);
    for (const ZORUnicodeString* answer :
         {&firstLabel, &secondLabel, &firstPreview, &secondPreview})
      ioSink.Add(Units(*answer));
    ioSink.Add(Units(interference.getAttributes().getNamedItem("Name").getNodeValue()));
    ioSink.Add(std::uint64_t{interference.getChildNodes().getLength()});
  }
}

template <class Sink>
void AskSpecifications(ZORClashParsing& ioReader, Sink& ioSink) {
  int count = 0;
  ioReader.GetSpecInfos(count);
  for (int i = 1; i <= count; ++i) {
    std::array<ZORUnicodeString, 10> a;
    ioReader.GetProductsInSpec(i, a[0], a[1], a[2], a[3], a[4], a[5], a[6], a[7], a[8], a[9]);
    AddAll(a, ioSink);
  }
}

template <class Sink>
void AskComponent(ZORClashParsing& ioReader, int inPosition, Sink& ioSink) {
  ioSink.Add(Units(ioReader.GetPrdId(inPosition)));
  ioSink.Add(Units(ioReader.GetPrdType(inPosition)));
  ioSink.Add(Units(ioReader.GetCompoAttr(inPosition, "PartNumber")));
  ioSink.Add(Units(ioReader.GetAttrValue(inPosition, "Supplier")));
  for (int i = 1; i <= ioReader.GetNbRealAttr(inPosition); ++i) {
    ZORUnicodeString name, type, value;
    ioReader.GetSetOfRealAttr(inPosition, i, name, type, value);
    for (const ZORUnicodeString* answer : {&name, &type, &value}) ioSink.Add(Units(*answer));
  }
  for (int i = 0; i < ioReader.GetNbShapes(inPosition); ++i)
    ioSink.Add(Units(ioReader.GetShapeAttrValue(inPosition, i, "ShapeName")));
  double* position = nullptr;
  ioReader.GetPosition(inPosition, position);
  const std::unique_ptr<double[]> owned(position);
  for (int i = 0; i < 12; ++i) ioSink.Add(std::bit_cast<std::uint64_t>(position[i]));
}

template <class Sink>
void AskComponents(ZORClashParsing& ioReader, Sink& ioSink) {
  for (int position = 0; position < ioReader.GetNbProd(); ++position)
    if (ioReader.IsValideNode(position, "Component") == 1) AskComponent(ioReader, position, ioSink);
}

// Only the lengths of the answers are looked at while the loop is timed; their hash comes from a
// second pass, after all times and the peak of memory have been taken.
struct Loop {
  const char* name;
  std::uint64_t (*timed)(ZORClashParsing& ioReader, int inCount);
  std::uint64_t (*hashed)(ZORClashParsing& ioReader, int inCount);
};

template <class Sink, auto kAsk>
std::uint64_t Run(ZORClashParsing& ioReader, int inCount) {
  Sink sink;
  if constexpr (std::is_invocable_v<decltype(kAsk), ZORClashParsing&, int, Sink&>)
    kAsk(ioReader, inCount, sink);
  else
    kAsk(ioReader, sink);
  return sink.Value();
}

void Load(ZORClashParsing& ioReader) {
  ZORUnicodeString kind, reference, version;
  if (FAILED(ioReader.LoadSequence(kind, reference, version)))
    throw std::runtime_error("the document was not loaded");
}

constexpr Loop kClashLoops[] = {
    {"general", Run<LengthSum, AskGeneral<LengthSum>>, Run<ResultHash, AskGeneral<ResultHash>>},
    {"short", Run<LengthSum, AskShort<LengthSum>>, Run<ResultHash, AskShort<ResultHash>>},
    {"full", Run<LengthSum, AskFull<LengthSum>>, Run<ResultHash, AskFull<ResultHash>>},
    {"copy", Run<LengthSum, AskCopies<LengthSum>>, Run<ResultHash, AskCopies<ResultHash>>},
    {"specifications", Run<LengthSum, AskSpecifications<LengthSum>>,
     Run<ResultHash, AskSpecifications<ResultHash>>}};

constexpr Loop kComponentLoop = {"components", Run<LengthSum, AskComponents<LengthSum>>,
                                 Run<ResultHash, AskComponents<ResultHash>>};

int DeclaredCount(ZORClashParsing& ioReader) {
  ZORUnicodeString name;
  int count = 0;
  ioReader.GetClashGeneralInfos(name, count);
  return count;
}
}  // namespace

Steps LoopWithZORLyra(const Arguments& inArguments) {
  std::string clashPath = inArguments.at(0), componentsPath = inArguments.at(1);
  Steps steps;
  ZORClashParsing clashes(clashPath.data()), components(componentsPath.data());
  TimeStep("load", steps, [&] { Load(clashes); });
  const int count = DeclaredCount(clashes);
  for (const Loop& loop : kClashLoops)
    TimeStep(loop.name, steps, [&] { loop.timed(clashes, count); });
  TimeStep("load components", steps, [&] { Load(components); });
  TimeStep(kComponentLoop.name, steps, [&] { kComponentLoop.timed(components, 0); });

  std::size_t step = 1;
  for (const Loop& loop : kClashLoops) steps[step++].hash = loop.hashed(clashes, count);
  steps.back().hash = kComponentLoop.hashed(components, 0);
  return steps;
}

Steps WholeWithZORLyra(const Arguments& inArguments) {
  std::string path = inArguments.at(0), morePath = inArguments.at(1);
  const std::string& output = inArguments.at(2);
  Steps steps;
  ZORClashParsing reader(path.data()), more(morePath.data());
  DOM_Document document, moreDocument;
  ZORUnicodeString kind, trace;
  const auto require = [](HRESULT inResult) {
    if (FAILED(inResult)) throw std::runtime_error("the document could not be worked on");
  };
  TimeStep("load", steps, [&] { require(reader.LoadSequence(document, kind)); });
  const int count = DeclaredCount(reader);
  TimeStep("read in full", steps, [&] {
    for (const Loop& loop : kClashLoops) loop.timed(reader, count);
  });
  TimeStep("merge", steps, [&] {
    require(more.LoadSequence(moreDocument, kind));
    require(reader.MergeDocuments(document, moreDocument, trace));
  });
  TimeStep("dump", steps, [&] {
    ZORLyraXMLServices writer;
    require(writer.DumpDocument(document, output.c_str(), "", "", "", 0, 0));
  });
  steps.back().hash = HashOfBytes(output);
  return steps;
}
