import { make, makeButton, part } from "./dom.js";
import { capital } from "./words.js";

/**
 * Shows what the result lacks, with what would mend it. It is an alert, so it changes only when the problems do.
 * @param {import("./state.js").PageState} page
 * @param {import("./steps.js").Steps} steps
 */
export function showProblems(page, steps) {
    let shown = "";
    page.addEventListener("session", () => {
        const { problems } = page.session;
        const told = JSON.stringify(problems);
        if (told === shown) return;
        shown = told;
        const section = part("problems");
        const hadFocus = section.contains(document.activeElement);
        section.replaceChildren(...problems.map((problem, at) => showProblem(page, steps, problem, at)));
        section.hidden = problems.length === 0;
        if (hadFocus) (section.querySelector("button") ?? part("main")).focus();
    });
}

function showProblem(page, steps, problem, at) {
    const scene = page.session.scenes.length > 1 ? `${page.session.scenes[problem.scene].path}: ` : "";
    const remedies = page.canDecide ? problem.remedies : [];
    const buttons = remedies.map((remedy, choice) =>
        makeButton(capital(remedy), () => steps.mend(at, choice, remedy)));
    return make("div", { class: "problem" }, make("p", {}, `${scene}${problem.text}`), ...buttons);
}
