// The verbs of the command: one file each, one table of all.
#ifndef ZOR_TOOLS_LYRA_VERBS_H
#define ZOR_TOOLS_LYRA_VERBS_H

#include <functional>
#include <span>

#include "lyra/Arguments.h"
#include "lyra/terminal/Output.h"

namespace lyra {

/// What a verb does once its arguments are read. @return the exit code.
using VerbAction = std::function<int(Output& ioOutput)>;

struct Verb {
  const char* name;
  const char* summary;
  VerbAction (*declare)(Arguments& ioArguments);  ///< declares the arguments of the action
};

/// In the order in which help shows them.
std::span<const Verb> Verbs();

VerbAction DeclareInfo(Arguments& ioArguments);
VerbAction DeclareList(Arguments& ioArguments);
VerbAction DeclareShow(Arguments& ioArguments);
VerbAction DeclareComponents(Arguments& ioArguments);
VerbAction DeclareSpecs(Arguments& ioArguments);
VerbAction DeclareLinks(Arguments& ioArguments);
VerbAction DeclareConvert(Arguments& ioArguments);
VerbAction DeclareDiff(Arguments& ioArguments);
VerbAction DeclareCarry(Arguments& ioArguments);
VerbAction DeclareGroup(Arguments& ioArguments);
VerbAction DeclareReview(Arguments& ioArguments);
VerbAction DeclareRules(Arguments& ioArguments);
VerbAction DeclareGate(Arguments& ioArguments);
VerbAction DeclareMerge(Arguments& ioArguments);
VerbAction DeclareFederate(Arguments& ioArguments);
VerbAction DeclareReport(Arguments& ioArguments);
VerbAction DeclarePublish(Arguments& ioArguments);
VerbAction DeclareExtract(Arguments& ioArguments);
VerbAction DeclareGather(Arguments& ioArguments);
VerbAction DeclareTree(Arguments& ioArguments);
VerbAction DeclareRender(Arguments& ioArguments);
VerbAction DeclareDetect(Arguments& ioArguments);
VerbAction DeclarePath(Arguments& ioArguments);
VerbAction DeclareEscape(Arguments& ioArguments);
VerbAction DeclareFilename(Arguments& ioArguments);

}  // namespace lyra

#endif
