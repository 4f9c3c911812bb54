#include <Cg/Compiler/Preprocessor.h>

#include <Cg/Compiler/Condition.h>
#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/Lexer.h>
#include <Cg/Compiler/Macro.h>
#include <Cg/Compiler/NumberSpelling.h>
#include <Cg/Compiler/SourceFiles.h>

#include <algorithm>
#include <deque>
#include <filesystem>
#include <limits>
#include <optional>
#include <string_view>
#include <unordered_map>
#include <unordered_set>

namespace cg {

namespace {

constexpr std::size_t MAX_INCLUDE_DEPTH = 64;
constexpr std::size_t MAX_TOKENS = 1'000'000;

/// What an include counts beside its tokens, so that empty files are bounded as well.
constexpr std::size_t INCLUDE_COST = 200;

/// Bytes of a spelling that `#` or `##` makes that count as one token.
constexpr std::size_t SPELLING_COST_BYTES = 16;

/// Bytes of an included file that count as one token: comments and blanks are bounded too.
constexpr std::size_t INCLUDED_COST_BYTES = 16;

/// Macro calls within the arguments of macro calls.
constexpr std::size_t MAX_ARGUMENT_DEPTH = 200;

struct Conditional {
    SourceLocation location; ///< of its `#if`
    bool wasTaken = false;   ///< one of its groups has been chosen
    bool hadElse = false;
};

struct OpenFile {
    Lexer lexer;
    std::uint32_t file;
    std::string folder;
    std::vector<Conditional> conditionals;
};

/// Tokens that come before what is left of the file.
struct Expansion {
    std::vector<Token> tokens;
    Macro* macro = nullptr; ///< the one that gave them, not expanded again until they are used up
    bool isBarrier = false; ///< what follows them is out of reach
    std::size_t at = 0;
};

struct Argument {
    std::vector<Token> tokens;
    std::optional<std::vector<Token>> expanded;
};

std::string folderOf(const std::string& fileName) {
    return std::filesystem::path(fileName).parent_path().generic_string();
}

std::string pathIn(const std::string& folder, std::string name) {
    std::replace(name.begin(), name.end(), '\\', '/');
    return (std::filesystem::path(folder) / name).lexically_normal().generic_string();
}

Token numberToken(std::string_view text, SourceLocation location) {
    Token token;
    token.kind = TokenKind::NUMBER;
    token.location = location;
    token.text = text;
    return token;
}

class Preprocessor {
public:
    Preprocessor(SourceFiles& files, std::uint32_t mainFile, const PreprocessorOptions& options,
                 Diagnostics& diagnostics)
        : mFiles(files), mOptions(options), mDiagnostics(diagnostics) {
        defineSpecial("__LINE__", Macro::Special::LINE);
        defineSpecial("__FILE__", Macro::Special::FILE);
        for (const auto& [name, text] : options.macros) {
            Lexer lexer(files, files.keep(std::string(name).append(" ").append(text)), {mainFile, 0, 1},
                        diagnostics);
            define(lexer);
        }
        open(mainFile);
    }

    std::vector<Token> run() {
        std::vector<Token> program;
        for (;;) {
            const Token token = nextExpanded();
            if (token.kind == TokenKind::BAD)
                reportBad(token);
            else
                program.push_back(token);
            if (token.kind == TokenKind::END)
                return program;
        }
    }

private:
    // ------------------------------------------------------------------------------- bounds, bad bytes

    void charge(std::size_t tokens) {
        if (tokens <= mTokensLeft) {
            mTokensLeft -= tokens;
            return;
        }
        stop("the program is too long: more than " + std::to_string(MAX_TOKENS) +
             " words with what includes and macros produce");
    }

    /// Ends the program here.
    void stop(const std::string& reason) {
        if (!mHasStopped)
            mDiagnostics.error(mLastLocation, reason);
        mHasStopped = true;
    }

    void reportBad(const Token& token) {
        const bool isText = token.text.substr(0, 1) == "\"";
        mDiagnostics.error(token.location, isText ? "this text has no end: expected '\"' in the same line"
                                                  : "no character of the language: " + inQuotes(token.text));
    }

    // ------------------------------------------------------------------------------------ token streams

    Token endToken() const {
        Token end;
        end.location = mLastLocation;
        return end;
    }

    /// The next token before expansion. END at a barrier and at the end of the program, again and again.
    Token read() {
        while (!mExpansions.empty() && !mHasStopped) {
            Expansion& top = mExpansions.back();
            if (top.at < top.tokens.size())
                return top.tokens[top.at++];
            if (top.isBarrier)
                return endToken();
            popExpansion();
        }
        return readSource();
    }

    /// Runs the directives on its way.
    Token readSource() {
        while (!mHasStopped) {
            const Token token = mOpen.back().lexer.next();
            mLastLocation = token.location;
            charge(1);
            if (token.kind == TokenKind::HASH && token.startsLine)
                runDirective(token);
            else if (token.kind != TokenKind::END || closeFile())
                return token;
        }
        return endToken();
    }

    void pushExpansion(std::vector<Token> tokens, Macro* macro, bool isBarrier = false) {
        if (macro != nullptr)
            macro->isBeingExpanded = true;
        mExpansions.push_back({std::move(tokens), macro, isBarrier});
    }

    void popExpansion() {
        if (mExpansions.back().macro != nullptr)
            mExpansions.back().macro->isBeingExpanded = false;
        mExpansions.pop_back();
    }

    void putBack(const Token& token) {
        if (token.kind != TokenKind::END)
            pushExpansion({token}, nullptr);
    }

    void open(std::uint32_t file) {
        mOpen.push_back({Lexer(mFiles, file, mDiagnostics), file, folderOf(mFiles.name(file)), {}});
    }

    /// @return true at the end of the program: the main file stays open
    bool closeFile() {
        for (const Conditional& conditional : mOpen.back().conditionals)
            mDiagnostics.error(conditional.location, "this condition has no '#endif'");
        mOpen.back().conditionals.clear();
        if (mOpen.size() == 1)
            return true;
        mOpen.pop_back();
        return false;
    }

    // ---------------------------------------------------------------------------------------- expansion

    Token nextExpanded() {
        for (;;) {
            Token token = read();
            Macro* const macro = token.kind == TokenKind::NAME && !token.isFinal ? find(token.text) : nullptr;
            if (macro == nullptr)
                return token;
            if (macro->isBeingExpanded) {
                token.isFinal = true;
                return token;
            }
            if (!expand(*macro, token))
                return token;
        }
    }

    /// All that is left up to the end of the line or the argument.
    std::vector<Token> expandedAlone(std::vector<Token> tokens) {
        pushExpansion(std::move(tokens), nullptr, true);
        std::vector<Token> expanded;
        for (Token token = nextExpanded(); token.kind != TokenKind::END; token = nextExpanded())
            expanded.push_back(token);
        popExpansion();
        return expanded;
    }

    /// @return false where the name stands for itself: a function-like macro without a call
    bool expand(Macro& macro, const Token& name) {
        if (macro.special != Macro::Special::NONE) {
            pushExpansion({specialToken(macro.special, name)}, nullptr);
            return true;
        }
        std::vector<Argument> arguments;
        if (macro.isFunction) {
            const Token paren = read();
            if (paren.kind != TokenKind::LEFT_PAREN) {
                putBack(paren);
                return false;
            }
            if (!readArguments(macro, name, arguments)) {
                pushExpansion({numberToken("0", name.location)}, nullptr); // one error is enough
                return true;
            }
        }
        std::vector<Token> result = substituted(macro, name, arguments);
        mFiles.noteExpansion(name.location, {macro.name, macro.location});
        charge(result.size() + 1);
        pushExpansion(std::move(result), &macro);
        return true;
    }

    Token specialToken(Macro::Special special, const Token& name) {
        const SourceFiles::Shown shown = mFiles.shown(name.location);
        if (special == Macro::Special::LINE)
            return numberToken(mFiles.keep(std::to_string(shown.line)), name.location);
        Token file = name;
        file.kind = TokenKind::TEXT;
        file.text = mFiles.keep('"' + std::string(shown.name) + '"');
        return file;
    }

    /// From behind the `(` to the `)`.
    bool readArguments(const Macro& macro, const Token& name, std::vector<Argument>& arguments) {
        arguments.resize(1);
        for (std::size_t depth = 0;;) {
            Token token = read();
            const bool isBetween = token.kind == TokenKind::COMMA && depth == 0;
            const bool takesCommas = macro.isVariadic && arguments.size() == macro.parameters.size();
            if (token.kind == TokenKind::END) {
                if (!mHasStopped)
                    mDiagnostics.error(name.location,
                                       "the call of macro " + inQuotes(macro.name) + " has no ')'");
                return false;
            }
            if (token.kind == TokenKind::RIGHT_PAREN && depth-- == 0)
                return checkArguments(macro, name, arguments);
            if (token.kind == TokenKind::LEFT_PAREN)
                ++depth;
            if (isBetween && !takesCommas) {
                arguments.emplace_back();
                continue;
            }
            const Macro* const called = token.kind == TokenKind::NAME ? find(token.text) : nullptr;
            if (called != nullptr && called->isBeingExpanded)
                token.isFinal = true;
            arguments.back().tokens.push_back(token);
            charge(1);
        }
    }

    bool checkArguments(const Macro& macro, const Token& name, std::vector<Argument>& arguments) {
        const std::size_t wanted = macro.parameters.size();
        if (wanted == 0 && arguments.size() == 1 && arguments[0].tokens.empty())
            arguments.clear();
        if (macro.isVariadic && arguments.size() == wanted - 1)
            arguments.emplace_back();
        if (arguments.size() == wanted)
            return true;
        mDiagnostics.error(name.location, "macro " + inQuotes(macro.name) + " takes " +
                                              std::to_string(wanted) +
                                              (wanted == 1 ? " argument" : " arguments") + ", found " +
                                              std::to_string(arguments.size()));
        mDiagnostics.note(macro.location, "the macro is defined here");
        return false;
    }

    const std::vector<Token>& expandedArgument(Argument& argument) {
        if (argument.expanded)
            return *argument.expanded;
        if (mArgumentDepth == MAX_ARGUMENT_DEPTH)
            stop("macro calls are nested more than " + std::to_string(MAX_ARGUMENT_DEPTH) + " deep");
        ++mArgumentDepth;
        argument.expanded = mHasStopped ? std::vector<Token>() : expandedAlone(argument.tokens);
        --mArgumentDepth;
        return *argument.expanded;
    }

    /// The macro's body with the arguments in place, located where the macro's name is written.
    std::vector<Token> substituted(const Macro& macro, const Token& name, std::vector<Argument>& arguments) {
        std::vector<Token> result;
        std::size_t operandStart = 0;
        for (std::size_t i = 0; i < macro.body.size(); ++i) {
            const Macro::Piece& piece = macro.body[i];
            if (!piece.isPasted)
                operandStart = result.size();
            const bool isRaw = piece.isPasted || (i + 1 < macro.body.size() && macro.body[i + 1].isPasted);
            std::vector<Token> operand = operandOf(piece, name, arguments, isRaw);
            const bool isAfterComma = i > 0 && macro.body[i - 1].token.kind == TokenKind::COMMA;
            const bool isRest = macro.isVariadic && piece.parameter + 1 == macro.parameters.size();
            if (piece.isPasted && isAfterComma && isRest && !piece.isStringized) {
                // `, ## rest` drops the comma where there is no rest, and glues nothing.
                if (operand.empty())
                    result.pop_back();
            } else if (piece.isPasted && result.size() > operandStart && !operand.empty()) {
                paste(result, operand);
            }
            charge(operand.size());
            result.insert(result.end(), operand.begin(), operand.end());
        }
        if (!result.empty()) {
            result.front().spaceBefore = name.spaceBefore;
            result.front().startsLine = name.startsLine;
        }
        return result;
    }

    std::vector<Token> operandOf(const Macro::Piece& piece, const Token& name,
                                 std::vector<Argument>& arguments, bool isRaw) {
        std::vector<Token> operand;
        if (piece.isStringized) {
            operand = {stringized(arguments[piece.parameter].tokens, mFiles)};
            charge(operand[0].text.size() / SPELLING_COST_BYTES);
        } else if (piece.parameter != Macro::NO_PARAMETER) {
            Argument& argument = arguments[piece.parameter];
            operand = isRaw ? argument.tokens : expandedArgument(argument);
        } else {
            operand = {piece.token};
        }
        if (!operand.empty())
            operand.front().spaceBefore = piece.token.spaceBefore;
        if (piece.isStringized || piece.parameter == Macro::NO_PARAMETER)
            operand.front().location = name.location;
        return operand;
    }

    /// Glues the first token of the operand to the last one of the result.
    void paste(std::vector<Token>& result, std::vector<Token>& operand) {
        charge((result.back().text.size() + operand.front().text.size()) / SPELLING_COST_BYTES);
        if (const std::optional<Token> whole = pasted(result.back(), operand.front(), mFiles)) {
            result.back() = *whole;
            operand.erase(operand.begin());
            return;
        }
        mDiagnostics.warning(result.back().location, inQuotes(result.back().text) + " and " +
                                                         inQuotes(operand.front().text) +
                                                         " make no single word: '##' leaves them apart");
    }

    // --------------------------------------------------------------------------------------- directives

    void runDirective(const Token& hash) {
        using Handler = void (Preprocessor::*)(const Token&);
        static const std::unordered_map<std::string_view, Handler> HANDLERS{
            {"if", &Preprocessor::runIf},           {"ifdef", &Preprocessor::runIfdef},
            {"ifndef", &Preprocessor::runIfdef},    {"elif", &Preprocessor::runElse},
            {"else", &Preprocessor::runElse},       {"endif", &Preprocessor::runEndif},
            {"define", &Preprocessor::runDefine},   {"undef", &Preprocessor::runUndef},
            {"include", &Preprocessor::runInclude}, {"line", &Preprocessor::runLine},
            {"error", &Preprocessor::runMessage},   {"warning", &Preprocessor::runMessage},
            {"pragma", &Preprocessor::runPragma}};
        const Token name = nextInLine();
        const auto handler = HANDLERS.find(name.text);
        if (name.kind == TokenKind::NUMBER) // `# 12 "file"`, as preprocessors write `#line`
            renumber(restOfLine({name}));
        else if (handler != HANDLERS.end())
            (this->*handler->second)(name);
        else if (name.kind != TokenKind::END)
            mDiagnostics.error(hash.location,
                               "no directive of the preprocessor: " + inQuotes("#" + std::string(name.text)));
        if (handler == HANDLERS.end() || handler->second != &Preprocessor::runInclude)
            restOfLine();
    }

    Token nextInLine() {
        const Token token = mOpen.back().lexer.nextInLine();
        mLastLocation = token.location;
        if (!mHasStopped)
            charge(1);
        return token;
    }

    std::vector<Token> restOfLine(std::vector<Token> tokens = {}) {
        for (Token token = nextInLine(); token.kind != TokenKind::END; token = nextInLine())
            tokens.push_back(token);
        return tokens;
    }

    void expectLineEnd(const Token& directive) {
        const Token stray = nextInLine();
        if (stray.kind != TokenKind::END)
            mDiagnostics.warning(stray.location, "nothing is expected here after " +
                                                     inQuotes("#" + std::string(directive.text)) +
                                                     ", found " + inQuotes(stray.text));
    }

    void runIf(const Token& name) {
        const bool isTrue = readCondition();
        beginConditional(name, isTrue);
    }

    void runIfdef(const Token& name) {
        const bool isDefined = readDefinedName(name);
        beginConditional(name, isDefined == (name.text == "ifdef"));
    }

    bool readDefinedName(const Token& directive) {
        const Token macro = nextInLine();
        if (macro.kind != TokenKind::NAME)
            mDiagnostics.error(macro.location,
                               "expected a name after " + inQuotes("#" + std::string(directive.text)));
        else
            expectLineEnd(directive);
        return find(macro.text) != nullptr;
    }

    void beginConditional(const Token& name, bool isTaken) {
        mOpen.back().conditionals.push_back({name.location, isTaken, false});
        if (!isTaken)
            skipGroups();
    }

    /// The end of a group that was chosen: none of the others is.
    void runElse(const Token& name) {
        if (enterElse(name))
            skipGroups();
    }

    /// Checks that an `#else` or `#elif` has its place.
    bool enterElse(const Token& name) {
        if (mOpen.back().conditionals.empty()) {
            mDiagnostics.error(name.location, inQuotes("#" + std::string(name.text)) + " without '#if'");
            return false;
        }
        Conditional& conditional = mOpen.back().conditionals.back();
        if (conditional.hadElse) {
            mDiagnostics.error(name.location, inQuotes("#" + std::string(name.text)) + " after '#else'");
            mDiagnostics.note(conditional.location, "the condition begins here");
        }
        if (name.text == "else") {
            expectLineEnd(name);
            conditional.hadElse = true;
        }
        return true;
    }

    void runEndif(const Token& name) {
        expectLineEnd(name);
        if (mOpen.back().conditionals.empty())
            mDiagnostics.error(name.location, "'#endif' without '#if'");
        else
            mOpen.back().conditionals.pop_back();
    }

    /// Passes over groups up to the one that is chosen or to the `#endif`.
    void skipGroups() {
        Conditional& conditional = mOpen.back().conditionals.back();
        for (std::size_t nested = 0; !mHasStopped;) {
            const Token hash = mOpen.back().lexer.next();
            charge(1);
            if (hash.kind == TokenKind::END)
                return;
            if (hash.kind != TokenKind::HASH || !hash.startsLine)
                continue;
            const Token name = nextInLine();
            if (name.text == "if" || name.text == "ifdef" || name.text == "ifndef") {
                ++nested;
            } else if (name.text == "endif" && nested-- == 0) {
                runEndif(name);
                return;
            } else if (nested == 0 && (name.text == "else" || name.text == "elif")) {
                enterElse(name);
                if (conditional.wasTaken || (name.text == "elif" && !readCondition()))
                    continue;
                conditional.wasTaken = true;
                return;
            }
        }
    }

    bool readCondition() {
        const SourceLocation start = mLastLocation;
        std::vector<Token> line = restOfLine();
        if (line.empty()) {
            mDiagnostics.error(start, "expected a condition after '#if' or '#elif'");
            return false;
        }
        const Token end = endToken();
        pushExpansion(std::move(line), nullptr, true);
        std::vector<Token> condition;
        for (Token token = nextExpanded(); token.kind != TokenKind::END; token = nextExpanded())
            condition.push_back(token.text == "defined" ? readDefined(token) : token);
        popExpansion();
        if (condition.empty()) {
            mDiagnostics.warning(start, "this condition is empty when its macros are expanded: taken as 0");
            return false;
        }
        condition.push_back(end);
        return evaluateCondition(condition, mDiagnostics).value_or(0) != 0;
    }

    /// `defined X` or `defined(X)`, from behind the word, as 0 or 1.
    Token readDefined(const Token& word) {
        Token name = read();
        const bool hasParen = name.kind == TokenKind::LEFT_PAREN;
        if (hasParen)
            name = read();
        if (name.kind != TokenKind::NAME)
            mDiagnostics.error(word.location, "expected a name after 'defined'");
        else if (hasParen && read().kind != TokenKind::RIGHT_PAREN)
            mDiagnostics.error(word.location, "expected ')' after 'defined(" + std::string(name.text) + "'");
        return numberToken(find(name.text) != nullptr ? "1" : "0", word.location);
    }

    void runDefine(const Token& /*name*/) { define(mOpen.back().lexer); }

    void runUndef(const Token& directive) {
        const Token name = nextInLine();
        if (name.kind != TokenKind::NAME)
            mDiagnostics.error(name.location, "expected a name after '#undef'");
        else
            expectLineEnd(directive);
        mMacros.erase(name.text);
    }

    void runInclude(const Token& directive) {
        std::vector<Token> line = restOfLine();
        if (!line.empty() && line[0].kind == TokenKind::NAME)
            line = expandedAlone(std::move(line));
        const auto isClosing = [](const Token& token) { return token.kind == TokenKind::GREATER; };
        const bool isText = !line.empty() && line[0].kind == TokenKind::TEXT;
        const bool isAngle = !line.empty() && line[0].kind == TokenKind::LESS;
        const auto last = isAngle ? std::find_if(line.begin(), line.end(), isClosing) : line.begin();
        if (!isText && (!isAngle || last == line.end())) {
            mDiagnostics.error(directive.location, "expected \"file\" or <file> after '#include'");
            return;
        }
        if (last + 1 != line.end())
            mDiagnostics.warning((last + 1)->location,
                                 "nothing is expected here after the file's name, found " +
                                     inQuotes((last + 1)->text));
        const std::string name = joined({line.begin(), last + 1});
        include(name.substr(1, name.size() - 2), directive);
    }

    void include(const std::string& name, const Token& directive) {
        charge(INCLUDE_COST);
        const std::optional<std::uint32_t> file = findInclude(name);
        if (!file) {
            mDiagnostics.error(directive.location, "cannot open the included file " + inQuotes(name));
            return;
        }
        if (mOnce.count(*file) != 0)
            return;
        if (mOpen.size() > MAX_INCLUDE_DEPTH) {
            mLastLocation = directive.location;
            stop("includes are nested more than " + std::to_string(MAX_INCLUDE_DEPTH) + " deep: does " +
                 inQuotes(name) + " include itself?");
            return;
        }
        charge(mFiles.text(*file).size() / INCLUDED_COST_BYTES);
        open(*file);
    }

    std::optional<std::uint32_t> findInclude(const std::string& name) {
        for (auto includer = mOpen.rbegin(); includer != mOpen.rend(); ++includer)
            if (const auto file = findFile(pathIn(includer->folder, name)))
                return file;
        for (const std::string& folder : mOptions.includeFolders)
            if (const auto file = findFile(pathIn(folder, name)))
                return file;
        return std::nullopt;
    }

    std::optional<std::uint32_t> findFile(const std::string& path) {
        if (const auto known = mFiles.find(path))
            return known;
        std::string text;
        if (!mOptions.reader || mMissing.count(path) != 0)
            return std::nullopt;
        if (mOptions.reader(path, text))
            return mFiles.add(path, std::move(text));
        mMissing.insert(path);
        return std::nullopt;
    }

    void runLine(const Token& /*name*/) { renumber(expandedAlone(restOfLine())); }

    /// `#line 12 "name"`: concerns what follows this line.
    void renumber(const std::vector<Token>& line) {
        const NumberSpelling number = line.empty() ? NumberSpelling() : readNumber(line[0].text);
        const bool isName = line.size() > 1 && line[1].kind == TokenKind::TEXT;
        if (number.kind != NumberSpelling::Kind::INTEGER ||
            number.integer > std::numeric_limits<std::int32_t>::max()) {
            mDiagnostics.error(mLastLocation, "expected a line number after '#line'");
            return;
        }
        const std::string_view name = isName ? line[1].text.substr(1, line[1].text.size() - 2) : "";
        mFiles.renumber(mOpen.back().file, mLastLocation.line + 1, static_cast<std::uint32_t>(number.integer),
                        name);
    }

    void runMessage(const Token& directive) {
        const std::string message = "#" + std::string(directive.text) + " " + joined(restOfLine());
        if (directive.text == "error")
            mDiagnostics.error(directive.location, message);
        else
            mDiagnostics.warning(directive.location, message);
    }

    void runPragma(const Token& /*name*/) {
        if (nextInLine().text == "once")
            mOnce.insert(mOpen.back().file);
    }

    // ------------------------------------------------------------------------------------------- macros

    Macro* find(std::string_view name) const {
        const auto found = mMacros.find(name);
        return found == mMacros.end() ? nullptr : found->second;
    }

    void defineSpecial(std::string_view name, Macro::Special special) {
        Macro macro;
        macro.name = name;
        macro.special = special;
        mMacros[name] = &mMacroStore.emplace_back(std::move(macro));
    }

    /// What follows `#define`.
    void define(Lexer& lexer) {
        const Token name = lexer.nextInLine();
        mLastLocation = name.location;
        if (name.kind != TokenKind::NAME || name.text == "defined") {
            mDiagnostics.error(name.location,
                               "expected a macro's name after '#define'" +
                                   (name.text.empty() ? "" : ", found " + inQuotes(name.text)));
            return;
        }
        std::optional<Macro> macro = readMacro(lexer, name, mDiagnostics);
        if (!macro)
            return;
        charge(macro->body.size() + macro->parameters.size());
        const Macro* const earlier = find(name.text);
        if (earlier != nullptr && isSameMacro(*earlier, *macro))
            return;
        if (earlier != nullptr) {
            mDiagnostics.warning(name.location, "macro " + inQuotes(name.text) + " is defined anew");
            mDiagnostics.note(earlier->location, "it was defined here");
        }
        mMacros[name.text] = &mMacroStore.emplace_back(std::move(*macro));
    }

    SourceFiles& mFiles;
    const PreprocessorOptions& mOptions;
    Diagnostics& mDiagnostics;

    std::deque<OpenFile> mOpen; ///< the main file first; a deque: lexers stay where they are
    std::vector<Expansion> mExpansions;
    std::unordered_map<std::string_view, Macro*> mMacros;
    std::deque<Macro> mMacroStore; ///< also those that are no longer defined: they may still be in use
    std::unordered_set<std::uint32_t> mOnce;
    std::unordered_set<std::string> mMissing;
    SourceLocation mLastLocation;
    std::size_t mTokensLeft = MAX_TOKENS;
    std::size_t mArgumentDepth = 0;
    bool mHasStopped = false;
};

} // namespace

std::vector<Token> preprocess(SourceFiles& files, std::uint32_t mainFile, const PreprocessorOptions& options,
                              Diagnostics& diagnostics) {
    return Preprocessor(files, mainFile, options, diagnostics).run();
}

} // namespace cg
