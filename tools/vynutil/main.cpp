// vynutil: the command-line face of the library. main reads the tool's own options, finds the
// subcommand by name in the command table and reports the failures it throws.

#include <cstdio>
#include <new>
#include <string_view>

#include "command.h"
#include "tool_error.h"
#include "vynutil/exception.h"
#include "vynutil/vynstring.h"

#ifndef VYNUTIL_VERSION
#error "the build defines VYNUTIL_VERSION as the project version"
#endif

namespace vyntool {
namespace {

void PrintHelp() {
  std::fputs(
      "Usage: vynutil [--help] [--version] COMMAND [ARGS...]\n"
      "\n"
      "Text and settings tools built on the vynutil library.\n"
      "\n"
      "Commands:\n",
      stdout);
  for (const Command& command : Commands()) {
    std::printf("  %-10.*s %.*s\n", static_cast<int>(command.name.size()), command.name.data(),
                static_cast<int>(command.summary.size()), command.summary.data());
  }
  std::fputs(
      "\n"
      "Run 'vynutil COMMAND --help' for a command's options.\n"
      "Exit status: 0 success, 1 the work failed, 2 bad usage or unusable input.\n",
      stdout);
}

const Command* FindCommand(std::string_view name) {
  for (const Command& command : Commands()) {
    if (command.name == name) return &command;
  }
  return nullptr;
}

int Dispatch(Arguments args) {
  if (args.empty()) throw UsageError("no command given");
  const std::string_view first = args[0];
  if (first == "--help" || first == "-h" || first == "help") {
    PrintHelp();
    return 0;
  }
  if (first == "--version") {
    std::puts("vynutil " VYNUTIL_VERSION);
    return 0;
  }
  if (first.starts_with('-')) throw UsageError("unknown option " + Quoted(first));
  const Command* command = FindCommand(first);
  if (!command) throw UsageError("unknown command " + Quoted(first));
  return command->run(args.subspan(1));
}

int Report(const ToolError& error) {
  std::fprintf(stderr, "vynutil: %s\n", error.what());
  if (!error.Hint().empty()) std::fprintf(stderr, "%s\n", error.Hint().c_str());
  return error.ExitCode();
}

// The library signals an operation it cannot carry out with its own exception types.
int ReportLibraryException(const VynSDK::Util::Exception& error) {
  const auto message = VynSDK::Util::VynString::FromUTF16(error.What()).ToUTF8();
  std::fprintf(stderr, "vynutil: %s\n", message.Get() ? message.Get() : "the library failed");
  return kExitFailure;
}

}  // namespace
}  // namespace vyntool

int main(int argc, char** argv) {
  using namespace vyntool;
  try {
    return Dispatch(Arguments(argv + 1, static_cast<std::size_t>(argc > 0 ? argc - 1 : 0)));
  } catch (const ToolError& error) {
    return Report(error);
  } catch (const std::bad_alloc&) {
    std::fputs("vynutil: out of memory\n", stderr);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "vynutil: %s\n", error.what());
  } catch (VynSDK::Util::Exception* error) {  // thrown by pointer; the catcher deletes it
    const int status = ReportLibraryException(*error);
    delete error;
    return status;
  } catch (const VynSDK::Util::Exception& error) {
    return ReportLibraryException(error);
  } catch (...) {
    std::fputs("vynutil: unexpected failure\n", stderr);
  }
  return kExitFailure;
}
