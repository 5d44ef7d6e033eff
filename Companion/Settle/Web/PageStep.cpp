#include "Settle/Web/PageStep.h"

#include "Names/PrintableText.h"
#include "Words/Failure.h"

#include <nlohmann/json.hpp>
#include <set>

namespace ovrin {

namespace {

using nlohmann::json;

/// What the text says; something else than an object if it is no JSON. Throws Failure where an object tells
/// something twice, of which no reader knows what was meant.
json ParsedOnce(const std::string& text) {
    std::set<std::string> keys;
    const auto look = [&](int depth, json::parse_event_t event, json& parsed) {
        if (depth == 1 && event == json::parse_event_t::key && !keys.insert(parsed.get<std::string>()).second)
            throw Failure("The request tells \"" + Printable(parsed.get<std::string>()) + "\" twice");
        return true;
    };
    return json::parse(text, look, false);
}

/// The values of an object, each of which is to be read once.
class Fields {
public:
    explicit Fields(const std::string& body) : m_Object(ParsedOnce(body)) {
        if (!m_Object.is_object()) throw Failure("The request is no object in JSON");
    }

    bool Has(const char* name) const { return m_Object.contains(name); }
    std::uint64_t Number(const char* name) {
        const json value = Take(name);
        if (!value.is_number_unsigned()) throw Wrong(name, "a number from 0 on");
        return value;
    }
    std::size_t Index(const char* name) { return static_cast<std::size_t>(Number(name)); }
    bool Flag(const char* name) {
        const json value = Take(name);
        if (!value.is_boolean()) throw Wrong(name, "true or false");
        return value;
    }
    void Yes(const char* name) {
        if (!Flag(name)) throw Wrong(name, "true, or not there");
    }
    Side SideOf(const char* name) {
        const json value = Take(name);
        if (!value.is_string()) throw Wrong(name, "base, ours or theirs");
        return SideNamed(value.get<std::string>());
    }
    /// All that is there was read.
    void End() const {
        if (!m_Object.empty())
            throw Failure("The request has \"" + Printable(m_Object.begin().key()) +
                          "\", which isn't known there");
    }

private:
    json Take(const char* name) {
        const auto found = m_Object.find(name);
        if (found == m_Object.end()) throw Failure(std::string("The request lacks \"") + name + "\"");
        json value = std::move(*found);
        m_Object.erase(found);
        return value;
    }
    static Failure Wrong(const char* name, const char* wanted) {
        return Failure(std::string("\"") + name + "\" has to be " + wanted);
    }

    json m_Object;
};

std::variant<TakeItem, TakeBelow, TakeRest, TakeProposals, TakeRemedy> ReadTake(Fields& fields) {
    if (fields.Has("item")) return TakeItem{fields.Index("item"), fields.SideOf("side")};
    if (fields.Has("under")) return TakeBelow{fields.Index("under"), fields.SideOf("side")};
    if (fields.Has("problem")) return TakeRemedy{fields.Index("problem"), fields.Index("remedy")};
    if (fields.Has("proposed")) {
        fields.Yes("proposed");
        return TakeProposals{};
    }
    fields.Yes("all");
    return TakeRest{fields.SideOf("side")};
}

} // namespace

PageStep ReadStep(const std::string& body) {
    Fields fields(body);
    const std::uint64_t revision = fields.Number("revision");
    const PageStep step{revision, ReadTake(fields)};
    fields.End();
    return step;
}

std::uint64_t ReadRevision(const std::string& body) {
    Fields fields(body);
    const std::uint64_t revision = fields.Number("revision");
    fields.End();
    return revision;
}

PageFinish ReadFinish(const std::string& body) {
    Fields fields(body);
    const PageFinish finish{fields.Number("revision"), fields.Flag("overwrite")};
    fields.End();
    return finish;
}

void ReadNothing(const std::string& body) {
    Fields(body).End();
}

} // namespace ovrin
