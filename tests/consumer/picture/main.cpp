// picture MODEL RESULT NUMBER FILE: draws an interference of a clash result on its model.
#include <PrintPictures.h>
#include <default_platform/OpenModel.h>
#include <toolkit/scenes/InterferenceScenes.h>

#include <cstdio>
#include <cstdlib>

int main(int inCount, char** inArguments) {
  if (inCount != 5) return 2;
  try {
    const ZORDefault::OpenedModel model = ZORDefault::OpenModel(inArguments[1]);
    ZORToolkit::ClashDocument document(inArguments[2]);
    const ZORToolkit::InterferenceRecord record =
        ZORToolkit::ReadInterference(document, std::atoll(inArguments[3]));
    const ZORDefault::InterferenceScene scene = ZORToolkit::MakeScene(record, model.root);
    PrintPictures::PrintListVisuToFile(scene.products[0], "", scene.products[1], "",
                                       scene.interference, inArguments[4], "PNG", 300, 200, 1, 0);
    std::printf("%s: %s and %s\n", record.type.c_str(), record.products[0].instance.c_str(),
                record.products[1].instance.c_str());
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 1;
  }
}
