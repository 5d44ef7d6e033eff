#include "Commands/DoctorCommand.h"

#include "Commands/Output.h"
#include "Doctor/Examination.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <memory>
#include <nlohmann/json.hpp>

namespace ovrin {

namespace {

std::string LineOf(const Examined& result) {
    constexpr std::size_t kWidth = 8; // of the longest state and a blank
    std::string line = HealthName(result.diagnosis.health);
    line.resize(kWidth, ' ');
    line += std::string(result.code) + ": " + result.diagnosis.text;
    if (!result.diagnosis.cure.empty()) line += ". Cure: " + result.diagnosis.cure;
    // One check is one line, whatever a program had to say.
    std::ranges::replace(line, '\n', ' ');
    return line + '\n';
}

std::string JsonOf(const std::vector<Examined>& results) {
    nlohmann::ordered_json checks = nlohmann::ordered_json::array();
    for (const auto& [code, diagnosis] : results)
        checks.push_back({{"code", code},
                          {"state", HealthName(diagnosis.health)},
                          {"text", diagnosis.text},
                          {"cure", diagnosis.cure}});
    const nlohmann::ordered_json report = {{"checks", checks}};
    return report.dump(2, ' ', false, nlohmann::json::error_handler_t::replace) + '\n';
}

bool Has(const std::vector<Examined>& results, Health health) {
    return std::ranges::any_of(results,
                               [&](const Examined& result) { return result.diagnosis.health == health; });
}

Outcome Run(bool fix, bool asJson) {
    const std::vector<Examined> results = Examine(fix);
    std::string text;
    if (asJson)
        text = JsonOf(results);
    else
        for (const Examined& result : results) text += LineOf(result);
    PrintResult(text);
    if (Has(results, Health::Unknown)) return Outcome::Failed;
    return Has(results, Health::Problem) ? Outcome::LeftOpen : Outcome::Done;
}

} // namespace

Action DescribeDoctor(CLI::App& command) {
    struct Wish {
        bool fix = false, asJson = false;
    };
    const auto wish = std::make_shared<Wish>();
    command.add_flag("--fix", wish->fix, "put right what can be put right safely");
    command.add_flag("--json", wish->asJson, "tell it for scripts");
    return [wish] { return Run(wish->fix, wish->asJson); };
}

} // namespace ovrin
