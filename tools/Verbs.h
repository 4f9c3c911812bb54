#ifndef TOOLS_VERBS_H
#define TOOLS_VERBS_H

#include <stdexcept>

namespace CLI {
class App;
}

// Each adds one verb to the command; the verb runs when the command line has been read. It throws WrongCall
// for options that do not go together, any other std::exception for work that failed.
void addListVerb(CLI::App& command);
void addPatternVerb(CLI::App& command);
void addInfoVerb(CLI::App& command);
void addRoundTripVerb(CLI::App& command);
void addShaderVerb(CLI::App& command);
void addPlayVerb(CLI::App& command);

/// The command line asks for what cannot be; what() says it to the user.
class WrongCall : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

#endif
