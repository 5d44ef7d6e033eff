#include "Reading/DocumentLoader.h"

#include "Reading/TreeBuilder.h"
#include "Values/SeededHash.h"
#include "Values/YAMLError.h"
#include "Values/YAMLScalar.h"

#include <yaml.h>

#include <algorithm>
#include <cstring>
#include <new>
#include <unordered_map>
#include <vector>

namespace ovrin_yaml {

namespace {

/// libyaml's time is quadratic in unclosed brackets, and trees are walked by recursion.
constexpr std::size_t kMaximumDepth = 1000;

const char* const kUTF16Problem =
    "YAML file is not UTF-8 encoded, all files must be UTF-8 encoded for performance reasons";
const char* const kVersionProblem = "found incompatible YAML document";
const char* const kDepthProblem = "Document is nested too deeply";

/// A libyaml parser over a text; the text must outlive it.
class Parser {
public:
    explicit Parser(std::string_view text) {
        if (!yaml_parser_initialize(&m_Parser)) throw std::bad_alloc();
        yaml_parser_set_input_string(&m_Parser, reinterpret_cast<const unsigned char*>(text.data()),
                                     text.size());
    }
    ~Parser() { yaml_parser_delete(&m_Parser); }
    Parser(const Parser&) = delete;
    Parser& operator=(const Parser&) = delete;

    yaml_parser_t& operator*() { return m_Parser; }
    yaml_parser_t* operator->() { return &m_Parser; }

    /// Called behind each failure. Throws std::bad_alloc if it was a lack of memory.
    void RequireMemory() const {
        if (m_Parser.error == YAML_MEMORY_ERROR) throw std::bad_alloc();
    }
    /// The problem as the system words it: those of the decoding stage begin with a capital.
    std::string Problem() const {
        RequireMemory();
        std::string problem = m_Parser.problem ? m_Parser.problem : "unknown problem";
        if (m_Parser.error == YAML_READER_ERROR && problem[0] >= 'a' && problem[0] <= 'z')
            problem[0] = static_cast<char>(problem[0] - 'a' + 'A');
        return problem;
    }

private:
    yaml_parser_t m_Parser;
};

/// One libyaml event, released with its scope.
class Event {
public:
    Event() { std::memset(&m_Event, 0, sizeof m_Event); }
    ~Event() { yaml_event_delete(&m_Event); }
    Event(const Event&) = delete;
    Event& operator=(const Event&) = delete;

    yaml_event_t* operator->() { return &m_Event; }
    yaml_event_t* Get() { return &m_Event; }

private:
    yaml_event_t m_Event;
};

/// Whether the first %YAML directive of a text names another version than 1.1. Asked only for a text that was
/// refused, since libyaml 0.2 may have passed the directive and stumbled over something behind it.
bool HasIncompatibleVersion(std::string_view text) {
    Parser parser(text);
    bool incompatible = false;
    for (bool looking = true; looking;) {
        yaml_token_t token;
        if (!yaml_parser_scan(&*parser, &token)) {
            parser.RequireMemory();
            return false;
        }
        if (token.type == YAML_VERSION_DIRECTIVE_TOKEN) {
            const auto& version = token.data.version_directive;
            incompatible = version.major != 1 || version.minor != 1;
            looking = false;
        } else if (token.type != YAML_STREAM_START_TOKEN && token.type != YAML_TAG_DIRECTIVE_TOKEN) {
            looking = false;
        }
        yaml_token_delete(&token);
    }
    return incompatible;
}

std::string_view Text(const yaml_char_t* text) {
    return text ? reinterpret_cast<const char*>(text) : "";
}

/// Turns the events between the start and the end of a document into a tree.
class EventComposer {
public:
    EventComposer(LoadedDocument& result, AliasBudget& budget, std::uint32_t firstLine)
        : m_Result(result), m_Budget(budget), m_FirstLine(firstLine) {}

    /// Throws YAMLError for what the library's own composing stage refuses.
    void Take(yaml_event_t& event) {
        if (event.start_mark.line > UINT32_MAX - m_FirstLine) throw YAMLError("Document has too many lines");
        const auto line = m_FirstLine + static_cast<std::uint32_t>(event.start_mark.line);
        switch (event.type) {
        case YAML_SCALAR_EVENT: {
            const auto& scalar = event.data.scalar;
            TakeRootTag(scalar.tag, YAML_DEFAULT_SCALAR_TAG);
            AddNode(YAMLScalar::Lookup({reinterpret_cast<const char*>(scalar.value), scalar.length}, line));
            DefineAnchor(scalar.anchor, m_NodeCount - 1, m_Last);
            break;
        }
        case YAML_MAPPING_START_EVENT: {
            const auto& start = event.data.mapping_start;
            TakeRootTag(start.tag, YAML_DEFAULT_MAPPING_TAG);
            Open(YAMLNode::Kind::Mapping, start.style == YAML_FLOW_MAPPING_STYLE, start.anchor, line);
            break;
        }
        case YAML_SEQUENCE_START_EVENT: {
            const auto& start = event.data.sequence_start;
            TakeRootTag(start.tag, YAML_DEFAULT_SEQUENCE_TAG);
            Open(YAMLNode::Kind::Sequence, start.style == YAML_FLOW_SEQUENCE_STYLE, start.anchor, line);
            break;
        }
        case YAML_MAPPING_END_EVENT:
        case YAML_SEQUENCE_END_EVENT:
            Close();
            break;
        case YAML_ALIAS_EVENT:
            ExpandAlias(std::string(Text(event.data.alias.anchor)));
            break;
        default:
            break;
        }
    }

    YAMLNode* TakeRoot() { return m_Builder.TakeRoot(); }

private:
    struct Anchor {
        YAMLNode* node; // null while the node is open
        std::uint64_t firstNode;
        std::uint64_t nodeCount;
        std::size_t levels; // containers inside each other, 0 for a scalar
    };

    struct OpenContainer {
        Anchor* anchor;         // null without one
        std::size_t levels = 1; // of what it holds so far, itself included
    };

    void TakeRootTag(const yaml_char_t* tag, const char* implicitTag) {
        if (m_NodeCount) return;
        const std::string_view text = Text(tag);
        m_Result.tag = text.empty() || text == "!" ? std::string_view(implicitTag) : text;
    }

    void AddNode(YAMLNode* node) {
        m_Builder.AddNode(node);
        m_Last = node;
        ++m_NodeCount;
    }

    void Open(YAMLNode::Kind kind, bool flow, const yaml_char_t* anchor, std::uint32_t line) {
        if (m_Builder.Depth() == kMaximumDepth) throw YAMLError(kDepthProblem);
        m_Open.push_back({DefineAnchor(anchor, m_NodeCount, nullptr)});
        m_Builder.Open(kind, flow, line);
        ++m_NodeCount;
    }

    void Close() {
        YAMLNode* node = m_Builder.Close();
        const OpenContainer closed = m_Open.back();
        m_Open.pop_back();
        if (Anchor* anchor = closed.anchor)
            *anchor = {node, anchor->firstNode, m_NodeCount - anchor->firstNode, closed.levels};
        NoteLevels(closed.levels);
    }

    void NoteLevels(std::size_t levels) {
        if (!m_Open.empty()) m_Open.back().levels = std::max(m_Open.back().levels, levels + 1);
    }

    /// Node addresses in an unordered_map stay valid, so the open anchors may be pointed at.
    Anchor* DefineAnchor(const yaml_char_t* name, std::uint64_t firstNode, YAMLNode* node) {
        if (!name) return nullptr;
        const auto [position, isNew] =
            m_Anchors.try_emplace(std::string(Text(name)), Anchor{node, firstNode, 1, 0});
        // What the library says of a duplicate anchor: the rest of its sentence is context, not problem.
        if (!isNew) throw YAMLError("second occurrence");
        return &position->second;
    }

    /// Alias failures wait for the end of the document: a syntax error behind them is told first. The empty
    /// scalar stands in for what can't be expanded.
    void ExpandAlias(const std::string& name) {
        const auto position = m_Anchors.find(name);
        if (position == m_Anchors.end()) throw YAMLError("found undefined alias");
        const Anchor& anchor = position->second;
        if (!anchor.node) return FailAlias("Recursive alias");
        if (anchor.nodeCount > m_Budget.nodes) return FailAlias("Too many aliased nodes");
        if (m_Builder.Depth() + anchor.levels > kMaximumDepth) return FailAlias(kDepthProblem);
        NoteLevels(anchor.levels);
        m_Budget.nodes -= anchor.nodeCount;
        m_NodeCount += anchor.nodeCount - 1;
        AddNode(CopyExactly(anchor.node));
    }

    void FailAlias(const char* failure) {
        if (m_Result.aliasFailure.empty()) m_Result.aliasFailure = failure;
        AddNode(YAMLScalar::empty);
    }

    LoadedDocument& m_Result;
    AliasBudget& m_Budget;
    const std::uint32_t m_FirstLine;
    TreeBuilder m_Builder;
    YAMLNode* m_Last = nullptr;
    std::uint64_t m_NodeCount = 0; // aliases expanded
    std::unordered_map<std::string, Anchor, SeededHash> m_Anchors;
    std::vector<OpenContainer> m_Open;
};

std::string ProblemOfHeader(const Parser& parser, std::string_view text) {
    const std::string problem = parser.Problem();
    return HasIncompatibleVersion(text) ? kVersionProblem : problem;
}

/// Parses up to the start of the document. False if there is none.
bool StartDocument(Parser& parser, std::string_view text, LoadedDocument& result) {
    for (;;) {
        Event event;
        if (!yaml_parser_parse(&*parser, event.Get())) throw YAMLError(ProblemOfHeader(parser, text));
        if (event->type == YAML_STREAM_END_EVENT) return false;
        if (event->type != YAML_DOCUMENT_START_EVENT) continue;
        const auto& start = event->data.document_start;
        if (start.version_directive &&
            (start.version_directive->major != 1 || start.version_directive->minor != 1))
            throw YAMLError(kVersionProblem);
        if (start.tag_directives.start != start.tag_directives.end) {
            result.hasTagDirective = true;
            result.tagPrefixLength = Text(start.tag_directives.start->prefix).size();
        }
        return true;
    }
}

void NoteWhereItStopped(Parser& parser, LoadedDocument& result) {
    result.stoppedAt = parser->mark.index;
    if (parser->tokens.head == parser->tokens.tail)
        result.next = LoadedDocument::Next::Unknown;
    else if (parser->tokens.head->type == YAML_STREAM_END_TOKEN)
        result.next = LoadedDocument::Next::End;
    else
        result.next = LoadedDocument::Next::Marker;
}

} // namespace

LoadedDocument LoadDocument(std::string_view text, AliasBudget& budget, std::uint32_t firstLine) {
    // libyaml would decode UTF-16.
    if (text.starts_with("\xff\xfe") || text.starts_with("\xfe\xff")) throw YAMLError(kUTF16Problem);

    LoadedDocument result;
    Parser parser(text);
    if (!StartDocument(parser, text, result)) {
        result.next = LoadedDocument::Next::End;
        return result;
    }
    EventComposer composer(result, budget, firstLine);
    for (bool open = true; open;) {
        Event event;
        if (!yaml_parser_parse(&*parser, event.Get())) throw YAMLError(parser.Problem());
        open = event->type != YAML_DOCUMENT_END_EVENT;
        composer.Take(*event.Get());
    }
    result.root = composer.TakeRoot();
    NoteWhereItStopped(parser, result);
    return result;
}

} // namespace ovrin_yaml
