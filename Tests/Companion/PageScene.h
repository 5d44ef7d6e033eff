#pragma once

#include "OpenScenes.h"
#include "Settle/Web/SettlePage.h"
#include "Words/Failure.h"

#include <map>
#include <nlohmann/json.hpp>
#include <optional>
#include <string>

namespace open_scenes {

using nlohmann::json;
using Query = std::map<std::string, std::string>;

/// A page over scenes that are unmerged in such a repository, asked as its server asks it.
struct PageScene : UnmergedFolder {
    void Serve(const std::map<std::string, ThreeTexts>& texts) {
        for (const auto& [name, three] : texts) Unmerge(name, three);
        Open();
    }
    /// What is unmerged, as the program finds it when it begins.
    void Open() {
        page.reset();
        desk.reset();
        scenes.emplace(remarks);
        scenes->Open(remarks);
        desk.emplace(*scenes);
        page.emplace(*scenes, *desk);
    }

    /// What the server makes of an answer, and of a Failure.
    PageAnswer Ask(const PageRequest& request) {
        try {
            return page->Answer(request);
        } catch (const Failure& failure) {
            return PageError(400, failure.what());
        }
    }
    json Get(const std::string& name, const Query& query = {}, int status = 200) {
        return Parsed(Ask({"GET", "api/" + name, query, ""}), status);
    }
    json Post(const std::string& name, const json& body, int status = 200) {
        return Parsed(Ask({"POST", "api/" + name, {}, body.dump()}), status);
    }
    /// A step by who has seen all before it.
    json Step(const std::string& name, json body = json::object(), int status = 200) {
        body["revision"] = Get("session")["revision"];
        return Post(name, body, status);
    }
    json Take(std::size_t item, const std::string& side, int status = 200) {
        return Step("take", {{"item", item}, {"side", side}}, status);
    }
    json TakeAll(const std::string& side) { return Step("take", {{"all", true}, {"side", side}}); }
    json Finish(bool overwrite, int status = 200) {
        return Step("finish", {{"overwrite", overwrite}}, status);
    }
    /// What of the session a step may change, without its number.
    json State() {
        json session = Get("session");
        session.erase("revision");
        session.erase("canRedo");
        return session;
    }

    Remarks remarks;
    std::optional<SettleScenes> scenes;
    std::optional<SettleDesk> desk;
    std::optional<SettlePage> page;

private:
    static json Parsed(const PageAnswer& answer, int status) {
        EXPECT_EQ(answer.status, status) << answer.body;
        EXPECT_EQ(answer.type, "application/json");
        return json::parse(answer.body);
    }
};

} // namespace open_scenes
