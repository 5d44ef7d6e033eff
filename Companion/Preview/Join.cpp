#include "Preview/Join.h"

#include "Words/Failure.h"

#include <algorithm>
#include <iterator>

namespace ovrin {

namespace {

bool IsOfSameQuestion(const PreviewAnswer& a, const PreviewAnswer& b) {
    return a.ours.id == b.ours.id && a.theirs.id == b.theirs.id && a.part.parts == b.part.parts &&
           a.question == b.question && a.count == b.count;
}

std::string QuestionOf(const PreviewAnswer& answer) {
    return answer.theirs.name + " (" + answer.theirs.id + ") merged into " + answer.ours.name + " (" +
           answer.ours.id + "), in " + std::to_string(answer.part.parts) + " parts, of " +
           std::to_string(answer.count) + " scenes";
}

void CheckQuestion(const AnswerFile& first, const AnswerFile& other) {
    if (IsOfSameQuestion(first.answer, other.answer)) return;
    const std::string one = QuestionOf(first.answer), two = QuestionOf(other.answer);
    throw Failure("Answers to different questions can't be joined:\n" + first.name + ": " + one + "\n" +
                  other.name + ": " + two +
                  (one != two ? ""
                              : "\nThe jobs saw other scenes there: let all have the same version and "
                                "settings of git"));
}

/// Of parts in their order.
void CheckParts(const std::vector<AnswerFile>& files) {
    std::string missing;
    std::size_t next = 1;
    const auto missUpTo = [&](std::size_t number) {
        for (; next < number; ++next) missing += (missing.empty() ? "" : ", ") + std::to_string(next);
    };
    for (const AnswerFile& file : files) {
        const std::size_t number = file.answer.part.number;
        if (number < next)
            throw Failure("Part " + std::to_string(number) + " is there more than once, the last time in " +
                          file.name);
        missUpTo(number);
        next = number + 1;
    }
    const std::size_t parts = files.front().answer.part.parts;
    missUpTo(parts + 1);
    if (!missing.empty()) throw Failure("Of " + std::to_string(parts) + " parts there is no " + missing);
}

} // namespace

PreviewAnswer Join(std::vector<AnswerFile> files) {
    for (const AnswerFile& file : files) CheckQuestion(files.front(), file);
    std::ranges::stable_sort(files, {}, [](const AnswerFile& file) { return file.answer.part.number; });
    CheckParts(files);
    PreviewAnswer whole = std::move(files.front().answer);
    for (std::size_t i = 1; i < files.size(); ++i)
        std::ranges::move(files[i].answer.scenes, std::back_inserter(whole.scenes));
    whole.part = {};
    std::ranges::sort(whole.scenes, {}, &PreviewedScene::number);
    for (std::size_t i = 0; i < std::max(whole.count, whole.scenes.size()); ++i)
        if (i >= whole.scenes.size() || whole.scenes[i].number != i + 1)
            throw Failure("The parts don't make a whole: scene " + std::to_string(i + 1) +
                          " isn't there once. Were the files changed?");
    return whole;
}

} // namespace ovrin
