#include "Verbs.h"

#include <OutputFile.h>

#include <CLI/CLI.hpp>

#include <csignal>
#include <exception>
#include <iostream>
#include <sstream>
#include <string>

#include <fcntl.h>
#include <unistd.h>

namespace {

constexpr int FAILED = 1;
constexpr int WRONG_CALL = 2;

/// A file opened later would take the number of a standard stream that the caller closed, and get its text.
/// Whatever writes to the placeholder fails, as it would have on the closed stream.
void keepStandardStreamNumbers() {
    for (const int stream : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO})
        if (fcntl(stream, F_GETFD) == -1)
            open("/dev/null", O_RDONLY | O_NOFOLLOW);
}

int report(const std::string& message, int exitCode) {
    std::cerr << "fwzel: " << message << '\n';
    return exitCode;
}

/// --help and --version arrive as errors with the exit code 0; their text is data.
void answer(const CLI::App& command, const CLI::ParseError& question) {
    std::ostringstream text;
    command.exit(question, text, text);
    host::OutputFile output("-");
    output.write(text.str());
    output.close();
}

int run(CLI::App& command, int argc, char** argv) {
    try {
        command.parse(argc, argv);
        if (command.get_subcommands().empty())
            throw WrongCall("a verb is missing; fwzel --help tells them");
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() != 0)
            return report(std::string(error.what()) +
                              "\nfwzel --help and fwzel VERB --help tell the options.",
                          WRONG_CALL);
        answer(command, error);
    }
    return 0;
}

} // namespace

int main(int argc, char** argv) {
    keepStandardStreamNumbers();
    std::signal(SIGPIPE, SIG_IGN);
    try {
        CLI::App command("Test patterns and pictures for FwZel, the rendering support library.", "fwzel");
        command.set_version_flag("--version", "fwzel " FWZEL_VERSION);
        // With a lower bound of one, CLI11 would not say which word it took for no verb.
        command.require_subcommand(0, 1);
        command.footer("Exit status: 0 done, 1 failed, 2 wrong call.");
        addListVerb(command);
        addPatternVerb(command);
        addInfoVerb(command);
        addRoundTripVerb(command);
        addShaderVerb(command);
        addPlayVerb(command);
        return run(command, argc, argv);
    } catch (const WrongCall& error) {
        return report(error.what(), WRONG_CALL);
    } catch (const std::bad_alloc&) {
        return report("out of memory", FAILED);
    } catch (const std::exception& error) {
        return report(error.what(), FAILED);
    }
}
