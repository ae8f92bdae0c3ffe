// zurevazidu: the Translate window, or one unattended translation with -t.

#include <cstdlib>
#include <iostream>
#include <string>

#include "app/AppContext.h"
#include "app/Startup.h"
#include "platform/ConsoleUi.h"
#ifdef ZV_GUI
#include "app/dialogs/GuiMain.h"
#endif

namespace {

const char* kUsage =
    "Usage: zurevazidu                                   open the Translate window\n"
    "       zurevazidu '-s|view|inputFolder|outputFolder|stem'\n"
    "                                                    open it with presets\n"
    "       zurevazidu '-t|definition|input|output[|configuration]'\n"
    "                                                    run one translation unattended\n"
    "       zurevazidu '-t||tccin.tmp|tccout.tmp'        answer a batch coordinate request\n"
    "       zurevazidu --help | --version\n"
    "\n"
    "The definition is the name of a file in UTIFiles/ of the application folder\n"
    "(the folder of this program), without its .uti ending. Fields are separated\n"
    "by '|'; quote the whole argument in a shell. A reprojection (CTLREPROJ,\n"
    "PACREPROJ, ...) takes its conversion settings from the configuration file,\n"
    "a [Coordinate Conversion] section as in TRNFiles/UTM16N-METRES.TRN, or else\n"
    "from those last accepted in the window.\n"
    "Exit status: 0 done, 1 refused, failed or cancelled, 2 command-line error.\n"
    "Without a display, messages go to standard error and questions read their\n"
    "answer from standard input (y/n; end of input answers No or Cancel).\n";

}  // namespace

int main(int argc, char** argv) {
  const std::string text = zv::ArgumentText(argc, argv);
  if (text == "--help" || text == "-h") {
    std::cout << kUsage;
    return 0;
  }
  if (text == "--version") {
    std::cout << zv::kTitleAndVersion << '\n';
    return 0;
  }
#ifdef ZV_GUI
  return zv::RunWithChosenUi(argc, argv, text);
#else
  zv::ConsoleUi ui(std::cin, std::cout, std::cerr);
  zv::AppContext ctx(ui, zv::ExecutableFolder());
  int status = zv::RunProgram(ctx, text, nullptr, std::cout);
  // The run is over: end without freeing a work area of perhaps millions of
  // points one by one.
  std::cout.flush();
  std::cerr.flush();
  std::_Exit(status);
#endif
}
