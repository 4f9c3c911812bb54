#include <Cg/Compiler/Parser.h>

#include <Cg/Compiler/Diagnostics.h>
#include <Cg/Compiler/ExpressionParser.h>

#include <algorithm>
#include <array>
#include <string>
#include <unordered_set>

namespace cg {

namespace {

constexpr Name ASSEMBLY = "asm";

/// `else if` in a row, with those of the chains around: each is one level more for what reads the tree.
constexpr int MAX_LINKS = 500;

/// Qualifiers that change nothing. They are ordinary names where no type follows.
bool isEmptyQualifier(Name word) {
    static const std::unordered_set<Name> WORDS{
        "packed", "inline",          "noinline",      "volatile", "linear", "centroid", "sample",  "precise",
        "shared", "nointerpolation", "noperspective", "export",   "extern", "lowp",     "mediump", "highp"};
    return WORDS.count(word) != 0;
}

/// Words of effect files that begin a block of states.
bool isEffectBlock(Name word) {
    static constexpr std::array WORDS{"technique", "Technique", "technique10", "technique11"};
    return std::find(WORDS.begin(), WORDS.end(), word) != WORDS.end();
}

/// Types that only effect files have; what is declared with them has no part in a program.
bool isEffectType(Name word) {
    static const std::unordered_set<Name> WORDS{
        "string",  "texture",     "texture1D",   "texture2D",    "texture3D",    "textureCUBE", "textureRECT",
        "Texture", "pixelshader", "PixelShader", "vertexshader", "VertexShader", "stateblock"};
    return WORDS.count(word) != 0;
}

class Parser : private ExpressionParser {
public:
    Parser(const std::vector<Token>& tokens, Arena& arena, Diagnostics& diagnostics)
        : ExpressionParser(tokens, arena, diagnostics) {}

    TranslationUnit* parseProgram() {
        auto* const unit = mArena.make<TranslationUnit>();
        while (!isAt(TokenKind::END)) {
            const std::size_t start = mAt;
            try {
                parseTopLevel(unit->declarations);
            } catch (const SyntaxError&) {
                recover(start, Place::GLOBAL);
            }
        }
        return unit;
    }

private:
    enum class Place { GLOBAL, MEMBER, LOCAL };

    // ---------------------------------------------------------------------------------------- recovery

    /// After an error: goes to where the next declaration or statement may begin.
    /// @param start  where the faulty one began; at least one token is passed
    void recover(std::size_t start, Place place) {
        if (mDiagnostics.isFull()) {
            mAt = mTokens.size() - 1;
            return;
        }
        for (std::size_t depth = 0; !isAt(TokenKind::END); pass()) {
            if (isAt(TokenKind::LEFT_BRACE)) {
                ++depth;
            } else if (isAt(TokenKind::RIGHT_BRACE)) {
                if (depth == 0 && place != Place::GLOBAL)
                    return;
                if (depth <= 1)
                    break;
                --depth;
            } else if (isAt(TokenKind::SEMICOLON) && depth == 0) {
                break;
            }
        }
        if (!isAt(TokenKind::END) || mAt == start)
            pass();
    }

    [[noreturn]] void refuse(SourceLocation location, const std::string& message) {
        mDiagnostics.error(location, message);
        throw SyntaxError();
    }

    /// Of braces within each other only the innermost is named.
    [[noreturn]] void refuseUnclosed(const Token& brace) {
        if (mHasUnclosed)
            throw SyntaxError();
        mHasUnclosed = true;
        refuse(brace.location, "this '{' is never closed");
    }

    /// What stands between braces, from the `{` to behind the `}`. A fault ends one piece of it, not all.
    /// @param what   "to begin a block", to follow the `{` that is expected
    /// @param place  of the pieces
    template <class ParsePiece>
    void parseBraced(const char* what, Place place, const ParsePiece& parsePiece) {
        const Token opening = token();
        expect(TokenKind::LEFT_BRACE, what);
        while (!isAt(TokenKind::RIGHT_BRACE)) {
            if (isAt(TokenKind::END))
                refuseUnclosed(opening);
            const std::size_t start = mAt;
            try {
                parsePiece();
            } catch (const SyntaxError&) {
                recover(start, place);
            }
        }
        pass();
    }

    // ------------------------------------------------------------------------------------ declarations

    void parseTopLevel(std::vector<Decl*>& declarations) {
        while (isAt(TokenKind::LEFT_BRACKET)) // `[maxvertexcount(3)]`
            skipBracketed();
        if (take(TokenKind::SEMICOLON))
            return;
        if (isAt(TokenKind::RIGHT_BRACE))
            refuse(token().location, "'}' closes nothing here");
        if (isAtAssembly())
            refuseAssembly();
        if (isAtConstantBuffer())
            parseConstantBuffer(declarations);
        else if (isAtEffectBlock())
            skipEffectBlock();
        else if (isAtEffectObject())
            skipEffectObject();
        else if (isAtWord("interface") && isAt(TokenKind::NAME, 1) && !isAtPromise())
            parseInterface(declarations);
        else
            parseDeclaration(declarations, Place::GLOBAL);
    }

    /// Behind this word and the name that it may have there is a `{` or what may stand before that.
    bool isFollowedByBraces(TokenKind between) const {
        const std::size_t behindName = isAt(TokenKind::NAME, 1) ? 2 : 1;
        return isAt(TokenKind::LEFT_BRACE, behindName) || isAt(between, behindName);
    }

    bool isAtConstantBuffer() const {
        if ((!isAtWord("cbuffer") && !isAtWord("tbuffer")) || mScopes.isDeclared(token().text))
            return false;
        return isFollowedByBraces(TokenKind::COLON);
    }

    /// `cbuffer Frame : register(b0) { float4 tint; };` declares what is in it, each by itself.
    void parseConstantBuffer(std::vector<Decl*>& declarations) {
        pass();
        if (isAt(TokenKind::NAME))
            pass();
        if (isAt(TokenKind::COLON)) {
            Semantic ignored;
            parseSemantic(ignored);
        }
        parseBraced("to begin a buffer's constants", Place::MEMBER, [&] {
            if (!take(TokenKind::SEMICOLON))
                parseDeclaration(declarations, Place::GLOBAL);
        });
    }

    bool isAtAssembly() const {
        return isAtWord(ASSEMBLY) && (isAt(TokenKind::LEFT_BRACE, 1) || isAt(TokenKind::TEXT, 1));
    }

    [[noreturn]] void refuseAssembly() {
        refuse(token().location, "assembly is not supported: 'asm' blocks cannot be translated");
    }

    bool isAtEffectBlock() const {
        if (!isAt(TokenKind::NAME) || !isEffectBlock(token().text))
            return false;
        return isFollowedByBraces(TokenKind::LESS);
    }

    void skipEffectBlock() {
        pass();
        if (isAt(TokenKind::NAME))
            pass();
        if (isAt(TokenKind::LESS))
            skipAnnotation();
        if (!isAt(TokenKind::LEFT_BRACE))
            fail("'{' after a technique's name");
        skipBracketed();
    }

    bool isAtEffectObject() const {
        if (!isAt(TokenKind::NAME) || !isAt(TokenKind::NAME, 1))
            return false;
        return isEffectType(token().text) && !mScopes.isDeclared(token().text);
    }

    /// `texture diffuse : DIFFUSE < string name = "brick.png"; >;`
    void skipEffectObject() {
        pass();
        mScopes.declareOther(token().text);
        while (!isAt(TokenKind::SEMICOLON)) {
            if (isAt(TokenKind::LESS))
                skipAnnotation();
            else if (isAt(TokenKind::LEFT_BRACE) || isAt(TokenKind::LEFT_PAREN))
                skipBracketed();
            else if (isAt(TokenKind::END))
                fail("';' after a declaration");
            else
                pass();
        }
        pass();
    }

    void parseDeclaration(std::vector<Decl*>& declarations, Place place) {
        const Level level(*this);
        if (isAtPromise()) {
            parsePromise();
            return;
        }
        if (takeWord("typedef")) {
            parseTypedef(declarations);
            return;
        }
        Qualifiers qualifiers = parseQualifiers();
        TypeSyntax* const type = parseType();
        addQualifiers(qualifiers);
        if (type->definition != nullptr && take(TokenKind::SEMICOLON)) {
            declarations.push_back(type->definition);
            return;
        }
        if (place != Place::LOCAL && isAtFunction()) {
            declarations.push_back(parseFunction(type));
            return;
        }
        do {
            declarations.push_back(parseDeclarator(type, qualifiers));
        } while (take(TokenKind::COMMA));
        expect(TokenKind::SEMICOLON, "after a declaration");
    }

    void parseTypedef(std::vector<Decl*>& declarations) {
        parseQualifiers();
        TypeSyntax* const type = parseType();
        Qualifiers ignored;
        addQualifiers(ignored);
        do {
            const Token name = expectName("the new type's name in a typedef");
            auto* const alias = make<TypedefDecl>(name.location);
            alias->name = name.text;
            alias->type = type;
            alias->dimensions = parseDimensions();
            mScopes.declareType(name.text);
            declarations.push_back(alias);
        } while (take(TokenKind::COMMA));
        expect(TokenKind::SEMICOLON, "after a typedef");
    }

    Qualifiers parseQualifiers() {
        Qualifiers qualifiers;
        addQualifiers(qualifiers);
        return qualifiers;
    }

    void addQualifiers(Qualifiers& qualifiers) {
        while (isAt(TokenKind::NAME) && isAtQualifier()) {
            addQualifier(qualifiers, token().text);
            pass();
        }
    }

    /// A qualifier only where a name follows, and only unless the program has another use for the word.
    bool isAtQualifier(std::size_t ahead = 0) const {
        const Name word = token(ahead).text;
        if (word == "const" || word == "static")
            return true;
        const bool isPlace = word == "in" || word == "out" || word == "inout" || word == "uniform" ||
                             word == "varying" || word == "row_major" || word == "column_major";
        return (isPlace || isEmptyQualifier(word)) && isAt(TokenKind::NAME, ahead + 1) &&
               !mScopes.isVariableOrFunction(word) && !mScopes.isType(word);
    }

    static void addQualifier(Qualifiers& qualifiers, Name word) {
        const auto addDirection = [&qualifiers](Direction direction) {
            const Direction before = qualifiers.direction;
            const bool isBoth = before != Direction::NONE && before != direction; // `in out`
            qualifiers.direction = isBoth ? Direction::INOUT : direction;
        };
        if (word == "in")
            addDirection(Direction::IN);
        else if (word == "out")
            addDirection(Direction::OUT);
        else if (word == "inout")
            addDirection(Direction::INOUT);
        qualifiers.isConst = qualifiers.isConst || word == "const";
        qualifiers.isStatic = qualifiers.isStatic || word == "static";
        qualifiers.isUniform = qualifiers.isUniform || word == "uniform";
        qualifiers.isVarying = qualifiers.isVarying || word == "varying";
        qualifiers.isRowMajor = qualifiers.isRowMajor || word == "row_major";
        qualifiers.isColumnMajor = qualifiers.isColumnMajor || word == "column_major";
    }

    /// With a definition in place and the dimensions of `float[3] x`.
    TypeSyntax* parseType() {
        if (isAtStructDefinition()) {
            auto* const type = make<TypeSyntax>(token().location);
            pass();
            type->definition = parseStruct(false);
            type->name = type->definition->name;
            return type;
        }
        TypeSyntax* const type = parseTypeName();
        if (isAt(TokenKind::LEFT_BRACKET))
            type->dimensions = parseDimensions();
        return type;
    }

    bool isAtStructDefinition() const {
        if (!isAtWord("struct") && (!isAtWord("class") || mScopes.isDeclared("class")))
            return false;
        return isFollowedByBraces(TokenKind::COLON);
    }

    /// `struct Light;` and `interface Lit;`, which promise a definition.
    void parsePromise() {
        pass();
        mScopes.declareType(expectName("a name").text);
        pass();
    }

    bool isAtPromise() const {
        return (isAtWord("struct") || isAtWord("interface")) && isAt(TokenKind::NAME, 1) &&
               isAt(TokenKind::SEMICOLON, 2);
    }

    void parseInterface(std::vector<Decl*>& declarations) {
        pass();
        StructDecl* const interface = parseStruct(true);
        take(TokenKind::SEMICOLON);
        declarations.push_back(interface);
    }

    /// From behind the word `struct` to the closing brace.
    StructDecl* parseStruct(bool isInterface) {
        const bool hasName = isAt(TokenKind::NAME);
        const Token name = hasName ? expectName("a struct's name") : token();
        auto* const definition = make<StructDecl>(name.location);
        definition->isInterface = isInterface;
        if (hasName)
            definition->name = name.text;
        mScopes.declareType(definition->name);
        if (take(TokenKind::COLON))
            definition->baseName = expectName("a base's name after ':'").text;
        const NameScopes::Scope scope(mScopes);
        parseBraced("to begin a struct's members", Place::MEMBER, [&] { parseMember(*definition); });
        return definition;
    }

    void parseMember(StructDecl& owner) {
        if (take(TokenKind::SEMICOLON))
            return;
        if ((isAtWord("public") || isAtWord("private") || isAtWord("protected")) &&
            isAt(TokenKind::COLON, 1)) {
            pass();
            pass();
            return;
        }
        std::vector<Decl*> declarations;
        parseDeclaration(declarations, Place::MEMBER);
        for (Decl* const declaration : declarations) {
            if (declaration->kind == Decl::Kind::VARIABLE) {
                owner.members.push_back(static_cast<VariableDecl*>(declaration));
            } else if (declaration->kind == Decl::Kind::FUNCTION) {
                auto* const method = static_cast<FunctionDecl*>(declaration);
                method->ownerName = owner.name;
                owner.methods.push_back(method);
            } else {
                refuse(declaration->location, "a struct can hold variables and functions only");
            }
        }
    }

    /// Name, dimensions, semantic, annotation and initializer.
    VariableDecl* parseDeclarator(TypeSyntax* type, const Qualifiers& qualifiers) {
        const Token name = expectName("a name after the type");
        auto* const variable = make<VariableDecl>(name.location);
        variable->type = type;
        variable->qualifiers = qualifiers;
        variable->name = name.text;
        mScopes.declareOther(name.text);
        variable->dimensions = parseDimensions();
        parseDeclaratorTail(*variable);
        return variable;
    }

    void parseDeclaratorTail(VariableDecl& variable) {
        for (;;) {
            if (isAt(TokenKind::COLON)) {
                parseSemantic(variable.semantic);
            } else if (isAt(TokenKind::LESS)) {
                if (skipAnnotation())
                    variable.initializer = parseInitializer();
            } else if (take(TokenKind::ASSIGN)) {
                variable.initializer = parseInitializer();
            } else if (isAtWord("sampler_state") && isAt(TokenKind::LEFT_BRACE, 1)) {
                pass();
                skipBracketed();
            } else {
                return;
            }
        }
    }

    /// `: TEXCOORD0`, `: state.matrix.mvp[0]`, `: register(c0)`; the first in a row counts.
    void parseSemantic(Semantic& semantic) {
        pass();
        const Token first = expectName("a semantic after ':'");
        if (isAt(TokenKind::LEFT_PAREN)) {
            skipBracketed();
            return;
        }
        std::string name(first.text);
        while (isAt(TokenKind::DOT) || isAt(TokenKind::LEFT_BRACKET)) {
            const std::size_t start = mAt;
            if (isAt(TokenKind::LEFT_BRACKET))
                skipBracketed();
            else if (take(TokenKind::DOT))
                pass();
            for (std::size_t at = start; at < mAt; ++at)
                name += mTokens[at].text;
        }
        if (semantic.name.empty())
            semantic = {first.location, name.size() == first.text.size() ? first.text : mArena.keep(name)};
    }

    /// `< string x = "..."; float a = 1.0; >`
    /// @return whether its end took the `=` of an initializer with it: `>=`
    bool skipAnnotation() {
        const Token opening = token();
        pass();
        for (std::size_t depth = 1;;) {
            if (isAt(TokenKind::LEFT_BRACE) || isAt(TokenKind::LEFT_PAREN)) {
                skipBracketed();
                continue;
            }
            const TokenKind kind = token().kind;
            if (kind == TokenKind::END || kind == TokenKind::RIGHT_BRACE)
                refuse(opening.location, "this annotation is never closed: expected '>'");
            pass();
            if (kind == TokenKind::LESS)
                ++depth;
            else if (kind == TokenKind::GREATER && --depth == 0)
                return false;
            else if (kind == TokenKind::GREATER_EQUAL && --depth == 0)
                return true;
        }
    }

    // --------------------------------------------------------------------------------------- functions

    bool isAtFunction() const {
        if (!isAt(TokenKind::NAME))
            return false;
        return isAt(TokenKind::LEFT_PAREN, 1) ||
               (isAt(TokenKind::COLON_COLON, 1) && isAt(TokenKind::LEFT_PAREN, 3));
    }

    FunctionDecl* parseFunction(TypeSyntax* returnType) {
        Token name = expectName("a function's name");
        Name owner;
        if (take(TokenKind::COLON_COLON)) {
            owner = name.text;
            name = expectName("a function's name after '::'");
        }
        auto* const function = make<FunctionDecl>(name.location);
        function->name = name.text;
        function->ownerName = owner;
        function->returnType = returnType;
        mScopes.declareOther(owner.empty() ? name.text : Name());
        const NameScopes::Scope scope(mScopes);
        parseParameters(*function);
        while (isAt(TokenKind::COLON) || isAt(TokenKind::LESS)) {
            if (isAt(TokenKind::COLON))
                parseSemantic(function->semantic);
            else
                skipAnnotation();
        }
        if (isAt(TokenKind::LEFT_BRACE))
            function->body = parseBlock();
        else if (!take(TokenKind::SEMICOLON))
            fail("'{' or ';' after the parameters of function " + inQuotes(name.text));
        return function;
    }

    void parseParameters(FunctionDecl& function) {
        pass();
        if (isAtWord("void") && isAt(TokenKind::RIGHT_PAREN, 1))
            pass();
        while (!isAt(TokenKind::RIGHT_PAREN)) {
            if (!function.parameters.empty() && !take(TokenKind::COMMA))
                fail("',' or ')' after a parameter");
            function.parameters.push_back(parseParameter());
        }
        pass();
    }

    VariableDecl* parseParameter() {
        Qualifiers qualifiers = parseQualifiers();
        TypeSyntax* const type = parseType();
        addQualifiers(qualifiers);
        if (isAt(TokenKind::NAME))
            return parseDeclarator(type, qualifiers);
        auto* const nameless = make<VariableDecl>(type->location);
        nameless->type = type;
        nameless->qualifiers = qualifiers;
        nameless->dimensions = parseDimensions();
        parseDeclaratorTail(*nameless);
        return nameless;
    }

    // -------------------------------------------------------------------------------------- statements

    BlockStmt* parseBlock() {
        const Level level(*this);
        auto* const block = make<BlockStmt>(token().location);
        const NameScopes::Scope scope(mScopes);
        parseBraced("to begin a block", Place::LOCAL, [&] {
            if (Stmt* const statement = parseStatement())
                block->statements.push_back(statement);
        });
        return block;
    }

    /// @return null for `;`
    Stmt* parseStatement() {
        using Handler = Stmt* (Parser::*)();
        struct Keyword {
            Name word;
            Handler handler;
        };
        static constexpr std::array KEYWORDS{
            Keyword{"if", &Parser::parseIf},         Keyword{"for", &Parser::parseFor},
            Keyword{"while", &Parser::parseWhile},   Keyword{"do", &Parser::parseDo},
            Keyword{"return", &Parser::parseReturn}, Keyword{"discard", &Parser::parseDiscard},
            Keyword{"break", &Parser::parseBreak},   Keyword{"continue", &Parser::parseBreak},
        };
        const Level level(*this);
        while (isAt(TokenKind::LEFT_BRACKET)) // `[unroll]`
            skipBracketed();
        if (take(TokenKind::SEMICOLON))
            return nullptr;
        if (isAt(TokenKind::LEFT_BRACE))
            return parseBlock();
        if (isAt(TokenKind::NAME)) {
            const auto* const keyword =
                std::find_if(KEYWORDS.begin(), KEYWORDS.end(),
                             [this](const Keyword& one) { return one.word == token().text; });
            if (keyword != KEYWORDS.end())
                return (this->*keyword->handler)();
            if (isAtWord("switch") && isAt(TokenKind::LEFT_PAREN, 1))
                return parseSwitch();
            if (mSwitchDepth > 0 && (isAtWord("case") || (isAtWord("default") && isAt(TokenKind::COLON, 1))))
                return parseCase();
            if (isAtAssembly())
                refuseAssembly();
            if (isAtWord("else"))
                refuse(token().location, "'else' without 'if'");
        }
        return isAtDeclaration() ? parseLocal() : parseExpressionStatement();
    }

    bool isAtDeclaration() const {
        if (!isAt(TokenKind::NAME))
            return false;
        if (isAtWord("typedef") || isAtWord("struct") || isAtStructDefinition() || isAtQualifier())
            return true;
        // Also with an unknown type, which the resolver can name.
        if (isAt(TokenKind::NAME, 1) || isAt(TokenKind::NAME, std::max<std::size_t>(1, behindTemplate(0))))
            return true;
        return isTypeName() && isAt(TokenKind::LEFT_BRACKET, 1) && isDeclaratorBehindBrackets();
    }

    /// `float[3] x` against `float[3](1, 2, 3)`
    bool isDeclaratorBehindBrackets() const { return isAt(TokenKind::NAME, behindBrackets(1)); }

    Stmt* parseLocal() {
        auto* const statement = make<DeclStmt>(token().location);
        parseDeclaration(statement->declarations, Place::LOCAL);
        return statement;
    }

    Stmt* parseExpressionStatement() {
        auto* const statement = make<ExprStmt>(token().location);
        statement->expression = parseExpression();
        expect(TokenKind::SEMICOLON, "after a statement");
        return statement;
    }

    Expr* parseCondition(const char* word) {
        expect(TokenKind::LEFT_PAREN, word);
        Expr* const condition = parseExpression();
        expect(TokenKind::RIGHT_PAREN, "after the condition");
        return condition;
    }

    /// With all its `else if`: a table of rules is one long chain and not nested as it is read.
    Stmt* parseIf() {
        Chain chain(*this);
        IfStmt* const first = parseThen();
        IfStmt* last = first;
        while (takeWord("else")) {
            if (!isAtWord("if")) {
                last->elseBranch = parseBranch();
                break;
            }
            chain.lengthen();
            IfStmt* const next = parseThen();
            last->elseBranch = next;
            last = next;
        }
        return first;
    }

    IfStmt* parseThen() {
        auto* const statement = make<IfStmt>(token().location);
        pass();
        statement->condition = parseCondition("after 'if'");
        statement->thenBranch = parseBranch();
        return statement;
    }

    /// The `else if` that a statement has before it, which count for as long as this lives; the bound is a
    /// syntax error.
    class Chain {
    public:
        explicit Chain(Parser& parser) : mParser(parser), mOuterLinks(parser.mLinks) {}
        ~Chain() { mParser.mLinks = mOuterLinks; }
        Chain(const Chain&) = delete;
        Chain& operator=(const Chain&) = delete;

        void lengthen() {
            if (mParser.mLinks == MAX_LINKS)
                mParser.refuse(mParser.token().location,
                               "more than " + std::to_string(MAX_LINKS) + " 'else if' in a row");
            ++mParser.mLinks;
        }

    private:
        Parser& mParser;
        int mOuterLinks;
    };

    /// What is declared in it without braces is not seen behind it.
    Stmt* parseBranch() {
        const NameScopes::Scope scope(mScopes);
        return parseStatement();
    }

    Stmt* parseFor() {
        auto* const statement = make<ForStmt>(token().location);
        const NameScopes::Scope scope(mScopes);
        pass();
        expect(TokenKind::LEFT_PAREN, "after 'for'");
        if (!take(TokenKind::SEMICOLON))
            statement->initializer = isAtDeclaration() ? parseLocal() : parseExpressionStatement();
        if (!isAt(TokenKind::SEMICOLON))
            statement->condition = parseExpression();
        expect(TokenKind::SEMICOLON, "after the condition of 'for'");
        if (!isAt(TokenKind::RIGHT_PAREN))
            statement->step = parseExpression();
        expect(TokenKind::RIGHT_PAREN, "after the head of 'for'");
        statement->body = parseBranch();
        return statement;
    }

    Stmt* parseWhile() {
        auto* const statement = make<LoopStmt>(Stmt::Kind::WHILE, token().location);
        pass();
        statement->condition = parseCondition("after 'while'");
        statement->body = parseBranch();
        return statement;
    }

    Stmt* parseDo() {
        auto* const statement = make<LoopStmt>(Stmt::Kind::DO, token().location);
        pass();
        statement->body = parseBranch();
        if (!takeWord("while"))
            fail("'while' after the body of 'do'");
        statement->condition = parseCondition("after 'while'");
        expect(TokenKind::SEMICOLON, "after 'do ... while (...)'");
        return statement;
    }

    Stmt* parseSwitch() {
        auto* const statement = make<SwitchStmt>(token().location);
        pass();
        statement->selector = parseCondition("after 'switch'");
        ++mSwitchDepth;
        try {
            statement->body = parseBlock();
        } catch (const SyntaxError&) {
            --mSwitchDepth;
            throw;
        }
        --mSwitchDepth;
        return statement;
    }

    Stmt* parseCase() {
        auto* const statement = make<CaseStmt>(token().location);
        const bool isDefault = isAtWord("default");
        pass();
        if (!isDefault)
            statement->value = parseExpression();
        expect(TokenKind::COLON, "after a case");
        return statement;
    }

    Stmt* parseReturn() { return parseJump(Stmt::Kind::RETURN, "after 'return'"); }

    /// `discard;`, `discard condition;`, `discard();`
    Stmt* parseDiscard() { return parseJump(Stmt::Kind::DISCARD, "after 'discard'"); }

    Stmt* parseJump(Stmt::Kind kind, const char* where) {
        auto* const statement = make<JumpStmt>(kind, token().location);
        pass();
        const bool isEmptyCall = isAt(TokenKind::LEFT_PAREN) && isAt(TokenKind::RIGHT_PAREN, 1);
        if (kind == Stmt::Kind::DISCARD && isEmptyCall)
            skipBracketed();
        else if (!isAt(TokenKind::SEMICOLON))
            statement->value = parseExpression();
        expect(TokenKind::SEMICOLON, where);
        return statement;
    }

    Stmt* parseBreak() {
        const Stmt::Kind kind = isAtWord("break") ? Stmt::Kind::BREAK : Stmt::Kind::CONTINUE;
        const char* const where = isAtWord("break") ? "after 'break'" : "after 'continue'";
        auto* const statement = make<Stmt>(kind, token().location);
        pass();
        expect(TokenKind::SEMICOLON, where);
        return statement;
    }

    int mSwitchDepth = 0;
    int mLinks = 0;
    bool mHasUnclosed = false;
};

} // namespace

TranslationUnit* parse(const std::vector<Token>& tokens, Arena& arena, Diagnostics& diagnostics) {
    return Parser(tokens, arena, diagnostics).parseProgram();
}

} // namespace cg
