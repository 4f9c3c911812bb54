#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/NumberSpelling.h>
#include <Cg/Compiler/Preprocessor.h>
#include <Cg/Compiler/SourceFiles.h>

#include <gtest/gtest.h>

#include <limits>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace {

using Texts = std::map<std::string, std::string>;

struct Outcome {
    std::vector<cg::Token> tokens;
    std::string words; ///< every token's text, a blank between them
    std::string listing;
    std::vector<std::string> messages; ///< "file(line) : error: ..." without the excerpts
    bool hasErrors = false;
};

class CgPreprocessor : public testing::Test {
protected:
    Outcome run(std::string main, const Texts& others = {}) {
        mFiles = std::make_unique<cg::SourceFiles>();
        const std::uint32_t file = mFiles->add("shaders/main.cg", std::move(main));
        mOptions.reader = [&others](const std::string& path, std::string& text) {
            const auto found = others.find(path);
            if (found != others.end())
                text = found->second;
            return found != others.end();
        };
        cg::Diagnostics diagnostics;
        Outcome outcome;
        outcome.tokens = cg::preprocess(*mFiles, file, mOptions, diagnostics);
        EXPECT_EQ(outcome.tokens.back().kind, cg::TokenKind::END);
        for (const cg::Token& token : outcome.tokens)
            if (!token.text.empty())
                outcome.words.append(outcome.words.empty() ? "" : " ").append(token.text);
        outcome.listing = diagnostics.listing(*mFiles);
        outcome.hasErrors = diagnostics.hasErrors();
        for (const cg::Diagnostic& one : diagnostics.all()) {
            const cg::SourceFiles::Shown shown = mFiles->shown(one.location);
            const bool isError = one.severity == cg::Severity::ERROR;
            outcome.messages.push_back(std::string(shown.name) + "(" + std::to_string(shown.line) + ")" +
                                       (isError ? " : error: " : " : warning: ") + one.message);
        }
        return outcome;
    }

    cg::PreprocessorOptions mOptions;
    std::unique_ptr<cg::SourceFiles> mFiles;
};

struct Case {
    const char* name;
    std::string source;
    std::string expected;
};

TEST_F(CgPreprocessor, GivesTheWordsThatTheProgramMeans) {
    const std::vector<Case> cases{
        {"punctuators are the longest that fit", "a<<=b>>=c...d::e++f--g<=h&&i||j!=k^=l->m",
         "a <<= b >>= c ... d :: e ++ f -- g <= h && i || j != k ^= l - > m"},
        {"numbers with all suffixes and swizzles", ".5 1. 1.f 1e-3 2.5E+3h 0x1Fu 1.0.xxx 2D 3-1 0xe-1",
         ".5 1. 1.f 1e-3 2.5E+3h 0x1Fu 1.0.xxx 2D 3 - 1 0xe - 1"},
        {"both kinds of comments", "a/*x*/b//c\nd/* \n // */e // \xE9t\xE9", "a b d e"},
        {"line ends of every system, a byte order mark", "\xEF\xBB\xBF#define A 1\r\nA\rA\n\rA", "1 1 1"},
        {"a backslash joins lines anywhere", "flo\\\nat x; // no \\\r\n code\n#define M a \\ \n b\nM \\",
         "float x ; a b"},
        {"texts keep comment signs and hashes", "\"a // b\" \"#x\" \"\\\"\" x",
         "\"a // b\" \"#x\" \"\\\"\" x"},
        {"object-like macros", "#define N 4\n#define M N+N\nM; #undef\nx", "4 + 4 ; # undef x"},
        {"undef", "#define N 4\n#undef N\nN", "N"},
        {"a function-like macro without a call is its name", "#define f(x) [x]\nf f\n(1) f", "f [ 1 ] f"},
        {"arguments over lines, with nested parentheses", "#define f(a,b) b a\nf((1,\n2)\n,3)",
         "3 ( 1 , 2 )"},
        {"empty arguments", "#define f(a,b) [a|b]\n#define g() G\nf(,) f(1,) g() g( )", "[ | ] [ 1 | ] G G"},
        {"arguments are expanded first", "#define A 1\n#define f(x) x x\nf(f(A))", "1 1 1 1"},
        {"a macro does not expand itself", "#define a a b\n#define b a\n#define f(x) f(x+1)\na b f(f(1))",
         "a a a b f ( f ( 1 + 1 ) + 1 )"},
        {"a name that was protected stays so", "#define x y\n#define y x\n#define f(a) a\nf(x) f(f(y))",
         "x y"},
        {"a macro that gives a macro's name", "#define g f\n#define f(x) <x>\ng(1) g", "< 1 > f"},
        {"macros that build functions",
         "#define LUMA(T) \\\n  T luma_##T(T##3 c) { return dot(c, T##3(.3)); }\nLUMA(half)",
         "half luma_half ( half3 c ) { return dot ( c , half3 ( .3 ) ) ; }"},
        {"pasting",
         "#define P(a,b) a##b\n#define TEX(d) tex##d##proj\nP(x,1) P(,y) P(z,) TEX(2D) P(1,.5) P(P,a)",
         "x1 y z tex2Dproj 1.5 Pa"},
        {"pasted names are looked up", "#define ab 7\n#define P(a,b) a##b\nP(a,b)", "7"},
        {"operands of ## are not expanded first",
         "#define X 1\n#define P(a) a##X\n#define Q(a) P(a)\nP(X) Q(X)", "XX 1X"},
        {"stringizing", "#define S(x) #x\n#define T(x) S(x)\n#define A 1\nS( a  \"b\\n\" ) T(A) S()",
         "\"a \\\"b\\\\n\\\"\" \"1\" \"\""},
        {"variadic macros", "#define V(a, ...) a(__VA_ARGS__)\n#define W(r...) r\nV(f,1,2) V(g) V(h,) W(1,2)",
         "f ( 1 , 2 ) g ( ) h ( ) 1 , 2"},
        {"a comma before no further arguments", "#define V(a, ...) a(0, ##__VA_ARGS__)\nV(f) V(f,1,2)",
         "f ( 0 ) f ( 0 , 1 , 2 )"},
        {"predefined places", "__LINE__\n#define L __LINE__\nL __FILE__", "1 3 \"shaders/main.cg\""},
        {"directives between arguments", "#define f(a) [a]\nf(1\n#if 1\n+2\n#else\n+3\n#endif\n)",
         "[ 1 + 2 ]"},
        {"a hash that a macro gives starts no directive", "#define H #\nH define X", "# define X"},
        {"pragmas and lone hashes", "#pragma \"what' ever\n#\n# /* */\nx", "x"},
    };
    for (const Case& one : cases) {
        SCOPED_TRACE(one.name);
        const Outcome outcome = run(one.source);
        EXPECT_EQ(outcome.words, one.expected);
        EXPECT_EQ(outcome.listing, "");
    }
}

TEST_F(CgPreprocessor, ChoosesGroups) {
    const std::vector<Case> expressions{
        {"precedence", "1 + 2 * 3 == 7 && (1 + 2) * 3 == 9", "yes"},
        {"comparison, shift and bits", "(1 << 4 | 3) == 19 && (0x1F & ~1) == 30 && (5 ^ 1) == 4 && 7 % 4 > 2",
         "yes"},
        {"signs and negation", "- - 1 == 1 && !0 && !!2 == 1 && -1 < 0 && 10 / -2 == -5", "yes"},
        {"conditional operator", "(0 ? 1 : 0 ? 2 : 3) == 3", "yes"},
        {"short circuits", "1 || 1 / 0", "yes"},
        {"unknown names are 0", "UNKNOWN", "no"},
        {"true is 1", "true && !false", "yes"},
        {"defined in both forms", "defined X && defined(X) && !defined Y && !defined ( Y )", "yes"},
        {"macros in conditions", "F(X) == 6 && HAS_X", "yes"},
        {"suffixes", "10u + 1L == 013", "yes"},
        {"the smallest number", "(-9223372036854775807 - 1) / -1 < 0 && (-9223372036854775807 - 1) % -1 == 0",
         "yes"},
        {"wide shifts", "(1 << 64) == 0 && (-1 >> 64) == -1 && (8 << -2) == 2", "yes"},
    };
    for (const Case& one : expressions) {
        SCOPED_TRACE(one.name);
        const Outcome outcome = run("#define X 3\n#define F(x) ((x) * 2)\n#define HAS_X defined(X)\n#if " +
                                    one.source + "\nyes\n#else\nno\n#endif");
        EXPECT_EQ(outcome.words, one.expected);
        EXPECT_EQ(outcome.listing, "");
    }
    const std::vector<Case> groups{
        {"the first true group", "#if 0\na\n#elif 1\nb\n#elif 1\nc\n#else\nd\n#endif\ne", "b e"},
        {"else after a taken group", "#ifdef X\na\n#else\nb\n#endif\n#ifndef X\nc\n#else\nd\n#endif", "b c"},
        {"nested groups", "#if 0\n#if 1\na\n#else\nb\n#endif\n#elif 1\n#if 0\nc\n#else\nd\n#endif\n#endif",
         "d"},
        {"skipped groups may hold anything",
         "#if 0\n don't \x80 \"open\n#bad\n#include <x>\n#if\n#endif\n#endif\nx", "x"},
        {"a comment hides a directive", "#if 0\n/*\n#endif\n*/\na\n#endif\nb", "b"},
        {"conditions of groups after the taken one", "#if 1\na\n#elif 1/0\nb\n#endif", "a"},
        {"defines of skipped groups", "#if 0\n#define X 1\n#endif\nX", "X"},
    };
    for (const Case& one : groups) {
        SCOPED_TRACE(one.name);
        const Outcome outcome = run(one.source);
        EXPECT_EQ(outcome.words, one.expected);
        EXPECT_EQ(outcome.listing, "");
    }
}

TEST_F(CgPreprocessor, LocatesWordsWhereTheUserWroteThem) {
    const Outcome outcome = run("#define SUM(a) (a +\\\n 1)\n\tx = SUM(\n y);\n#include \"inc.h\"\n",
                                {{"shaders/inc.h", "\r\n  z"}});
    struct Place {
        const char* text;
        cg::SourceLocation location;
    };
    const std::vector<Place> places{{"x", {0, 3, 2}}, {"=", {0, 3, 4}}, {"(", {0, 3, 6}},
                                    {"y", {0, 4, 2}}, {"+", {0, 3, 6}}, {"1", {0, 3, 6}},
                                    {")", {0, 3, 6}}, {";", {0, 4, 4}}, {"z", {1, 2, 3}}};
    ASSERT_EQ(outcome.tokens.size(), places.size() + 1);
    for (std::size_t i = 0; i < places.size(); ++i) {
        EXPECT_EQ(outcome.tokens[i].text, places[i].text);
        EXPECT_TRUE(outcome.tokens[i].location == places[i].location)
            << places[i].text << " at " << outcome.tokens[i].location.line << ":"
            << outcome.tokens[i].location.column;
    }
}

TEST_F(CgPreprocessor, FindsIncludes) {
    mOptions.includeFolders = {"lib"};
    mOptions.macros = {{"FROM_OPTIONS", "7"}, {"twice(x)", "x x"}};
    const Texts files{{"shaders/a.h", "a FROM_OPTIONS\n#include \"sub/b.h\""},
                      {"shaders/sub/b.h", "b\n#include <c.h>\n#include \"../up.h\"\n#include \"beside.h\""},
                      {"shaders/sub/c.h", "near_c"},
                      {"shaders/c.h", "far_c"},
                      {"shaders/up.h", "up"},
                      {"shaders/beside.h", "chain"},
                      {"lib/only.h", "only"},
                      {"shaders/once.h", "#pragma once\nonce"},
                      {"shaders/guarded.h", "#ifndef G\n#define G\nguarded\n#endif"},
                      {"shaders/no_line_end.h", "#define LAST last"}};
    const Outcome outcome =
        run("#include \"a.h\"\n#include <only.h>\n#include \"sub\\c.h\"\n"
            "#include \"once.h\"\n#include \"./once.h\"\n#include \"guarded.h\"\n"
            "#include \"guarded.h\"\n#include \"up.h\"\n#include \"up.h\"\n"
            "#define NAME \"c.h\"\n#include NAME\n#include \"no_line_end.h\"\nLAST twice(x)",
            files);
    EXPECT_EQ(outcome.words, "a 7 b near_c up chain only near_c once guarded up up far_c last x x");
    EXPECT_EQ(outcome.listing, "");
}

TEST_F(CgPreprocessor, ListsErrorsWithFileLineAndCaret) {
    const Outcome outcome =
        run("x\n#include \"inc.h\"\n\t@ \"\xC3\xA4\n#line 100 \"generated.cg\"\n#error no\n",
            {{"shaders/inc.h", "\n#foo\n"}});
    EXPECT_EQ(outcome.listing,
              "shaders/main.cg(3) : error: no character of the language: '@'\n"
              "    \t@ \"\xC3\xA4\n"
              "    \t^\n"
              "shaders/main.cg(3) : error: this text has no end: expected '\"' in the same line\n"
              "    \t@ \"\xC3\xA4\n"
              "    \t  ^\n"
              "generated.cg(100) : error: #error no\n"
              "    #error no\n"
              "     ^\n"
              "shaders/inc.h(2) : error: no directive of the preprocessor: '#foo'\n"
              "    #foo\n"
              "    ^\n");
}

TEST_F(CgPreprocessor, NamesWhatIsWrong) {
    const std::string at = "shaders/main.cg";
    const std::vector<Case> cases{
        {"missing file", "\n#include \"gone.h\"\nx",
         at + "(2) : error: cannot open the included file 'gone.h'"},
        {"include of nothing", "#include\nx",
         at + "(1) : error: expected \"file\" or <file> after '#include'"},
        {"comment without end", "x\n /* y", at + "(2) : error: this comment has no end: expected '*/'"},
        {"condition without end", "x\n#if 1\n", at + "(2) : error: this condition has no '#endif'"},
        {"skipped condition without end", "#ifdef A\n#if 1\n#endif",
         at + "(1) : error: this condition has no '#endif'"},
        {"endif without if", "x\n#endif", at + "(2) : error: '#endif' without '#if'"},
        {"else without if", "#else\nx", at + "(1) : error: '#else' without '#if'"},
        {"second else", "#if 0\n#else\n#else\n#endif", at + "(3) : error: '#else' after '#else'"},
        {"no condition", "#if\n#endif", at + "(1) : error: expected a condition after '#if' or '#elif'"},
        {"half a condition", "#if 1 +\n#endif",
         at + "(1) : error: expected a number, a name or '(' in the condition of '#if', found the end of the "
              "line"},
        {"a word too many", "#if 1 2\n#endif",
         at + "(1) : error: expected an operator in the condition of '#if', found '2'"},
        {"assignment in a condition", "#if A = 2\n#endif",
         at + "(1) : error: expected an operator in the condition of '#if', found '='"},
        {"division by zero", "#if 1 / 0\n#endif",
         at + "(1) : error: division by zero in the condition of '#if'"},
        {"no number", "#if 1.5y\n#endif",
         at + "(1) : error: expected a number in the condition of '#if', found '1.5y'"},
        {"define without a name", "#define 3 4",
         at + "(1) : error: expected a macro's name after '#define', found '3'"},
        {"parameters", "#define f(a b) a\nx",
         at + "(1) : error: expected the parameters of macro 'f' as in '(a, b)', found 'b'"},
        {"parameter twice", "#define f(a, a) a\nx",
         at + "(1) : error: macro 'f' has two parameters named 'a'"},
        {"too few arguments", "#define f(a, b) a\n\nf(1)",
         at + "(3) : error: macro 'f' takes 2 arguments, found 1"},
        {"call without end", "#define f(a) a\nf(1\n\n", at + "(2) : error: the call of macro 'f' has no ')'"},
        {"glue at the edge", "#define f(a) ## a\nx",
         at + "(1) : error: '##' needs a word on either side in the body of macro 'f'"},
        {"line number", "#line x", at + "(1) : error: expected a line number after '#line'"},
        {"bad bytes", "a \x80\xFF b", at + "(1) : error: no character of the language: '\\x80\\xff'"},
        {"warning", "#warning it's late", at + "(1) : warning: #warning it's late"},
        {"words after else", "#if 1\n#else if X\n#endif",
         at + "(2) : warning: nothing is expected here after '#else', found 'if'"},
        {"words after endif and ifdef", "#ifdef A ||\n#endif",
         at + "(1) : warning: nothing is expected here after '#ifdef', found '||'"},
        {"fraction in a condition", "#if 1.5 == 1\n#endif",
         at + "(1) : warning: '1.5' in a condition is cut to 1"},
        {"another definition", "#define A 1\n#define A 1\n#define A 2\n",
         at + "(3) : warning: macro 'A' is defined anew"},
        {"glue of strangers", "#define D(x) a.##x\nD(b)",
         at + "(2) : warning: '.' and 'b' make no single word: '##' leaves them apart"},
    };
    for (const Case& one : cases) {
        SCOPED_TRACE(one.name);
        const Outcome outcome = run(one.source);
        EXPECT_EQ(outcome.messages, std::vector<std::string>{one.expected});
    }
}

std::string repeated(const std::string& text, std::size_t count) {
    std::string result;
    for (std::size_t i = 0; i < count; ++i)
        result += text;
    return result;
}

/// Each of these would take for ever, or all memory, or all of the stack, without a bound.
TEST_F(CgPreprocessor, EndsOnEveryText) {
    std::string doubling = "#define A0 x x\n";
    std::string gluing = "#define G(x) x##x\n#define H(x) G(x)\n";
    for (int i = 1; i < 64; ++i)
        doubling += "#define A" + std::to_string(i) + " A" + std::to_string(i - 1) + " A" +
                    std::to_string(i - 1) + "\n";
    const std::vector<Case> cases{
        {"file that includes itself", "#include \"main.cg\"", ""},
        {"file that includes itself twice", "#include \"self.h\"\n#include \"self.h\"", ""},
        {"large file included often", repeated("#include \"large.h\"\n", 4000), ""},
        {"macros that double", doubling + "A63", ""},
        {"spellings that double", gluing + repeated("H(", 60) + "a" + repeated(")", 60), ""},
        {"nested calls", "#define f(x) x\n" + repeated("f(", 50000) + repeated(")", 50000), ""},
        {"calls without end", "#define f(x) x\n" + repeated("f(", 50000), ""},
        {"nested conditions", repeated("#if 1\n", 50000), ""},
        {"nested parentheses", "#if " + repeated("(", 50000) + "\n", ""},
        {"questions", "#if " + repeated("1?", 50000) + "\n", ""},
    };
    const Texts files{{"shaders/self.h", "#include \"self.h\"\n#include \"self.h\"\n"},
                      {"shaders/large.h", "//" + repeated("x", 1 << 20)}};
    for (const Case& one : cases) {
        SCOPED_TRACE(one.name);
        EXPECT_TRUE(run(one.source, files).hasErrors);
    }
    EXPECT_FALSE(run("#if " + repeated("!", 100000) + "0\n#endif").hasErrors);
    EXPECT_FALSE(run("#define f(x) x f\nf" + repeated("(1)", 20000)).hasErrors);
}

TEST_F(CgPreprocessor, MacrosHaveUpTo256Parameters) {
    std::string parameters = "p1";
    for (int i = 2; i <= 256; ++i)
        parameters += ", p" + std::to_string(i);
    const Outcome all = run("#define f(" + parameters + ") p256\nf(" + repeated("0, ", 255) + "1)");
    EXPECT_EQ(all.listing, "");
    EXPECT_EQ(all.words, "1");
    EXPECT_EQ(run("#define f(" + parameters + ", p257) p257").messages,
              std::vector<std::string>{"shaders/main.cg(1) : error: macro 'f' has more than 256 parameters"});
}

TEST(CgNumberSpelling, ReadsEveryForm) {
    using Kind = cg::NumberSpelling::Kind;
    struct Number {
        const char* text;
        Kind kind;
        double value;
        std::size_t length;
    };
    const std::vector<Number> numbers{
        {"0", Kind::INTEGER, 0, 1},       {"42", Kind::INTEGER, 42, 2},
        {"017", Kind::INTEGER, 15, 3},    {"0x1F", Kind::INTEGER, 31, 4},
        {"7u", Kind::UNSIGNED, 7, 2},     {"0xFFFFFFFFUL", Kind::UNSIGNED, 4294967295.0, 12},
        {"1f", Kind::FLOAT, 1, 2},        {"1h", Kind::HALF, 1, 2},
        {"2x", Kind::FIXED, 2, 2},        {"0x", Kind::FIXED, 0, 2},
        {"09.5", Kind::FLOAT, 9.5, 4},    {"010f", Kind::FLOAT, 10, 4},
        {".5", Kind::FLOAT, .5, 2},       {"1.", Kind::FLOAT, 1, 2},
        {"1.f", Kind::FLOAT, 1, 3},       {"1.h", Kind::HALF, 1, 3},
        {"1.5F", Kind::FLOAT, 1.5, 4},    {"1.5H", Kind::HALF, 1.5, 4},
        {"1e-3", Kind::FLOAT, 1e-3, 4},   {"1.e3", Kind::FLOAT, 1000, 4},
        {"2.5E+2x", Kind::FIXED, 250, 7}, {"1.0.xxx", Kind::FLOAT, 1, 3},
        {"1.5h.xy", Kind::HALF, 1.5, 4},  {"3.xyz", Kind::INTEGER, 3, 1},
        {"1.x", Kind::FIXED, 1, 3},       {"1e999", Kind::FLOAT, std::numeric_limits<double>::infinity(), 5},
        {"1e-999", Kind::FLOAT, 0, 6},    {"2.0lf", Kind::FLOAT, 2, 5},
        {"08f", Kind::FLOAT, 8, 3},       {"2E", Kind::INVALID, 0, 0},
        {"1.2.3", Kind::INVALID, 0, 0},   {"09", Kind::INVALID, 0, 0},
        {"1e+", Kind::INVALID, 0, 0},     {"0x1G", Kind::INVALID, 0, 0},
        {"1ff", Kind::INVALID, 0, 0},     {"1.5d", Kind::FLOAT, 1.5, 4},
        {"2D", Kind::FLOAT, 2, 2},        {"7us", Kind::UNSIGNED, 7, 3},
        {"7i", Kind::INTEGER, 7, 2},
    };
    for (const Number& one : numbers) {
        SCOPED_TRACE(one.text);
        const cg::NumberSpelling read = cg::readNumber(one.text);
        EXPECT_EQ(read.kind, one.kind);
        EXPECT_EQ(read.value, one.value);
        EXPECT_EQ(read.length, one.length);
    }
}

} // namespace
