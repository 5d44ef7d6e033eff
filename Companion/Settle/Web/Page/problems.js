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
        const { problems, isSettled, open, scenes } = page.session;
        const unions = page.canDecide && !isSettled && open === 0 ? scenes.filter(({ bothAdded }) => bothAdded) : [];
        const unreadable = scenes.filter(({ problem }) => problem);
        const told = JSON.stringify([problems, unions.length, unreadable.length]);
        if (told === shown) return;
        shown = told;
        const section = part("problems");
        const hadFocus = section.contains(document.activeElement);
        section.replaceChildren(...problems.map((problem, at) => showProblem(page, steps, problem, at)),
            ...unreadable.map(({ path, problem }) => showWords(`${path} can't be settled here: ${problem}`)),
            ...(unions.length ? [showUnions(steps, unions)] : []));
        section.hidden = !section.firstChild;
        if (hadFocus) (section.querySelector("button") ?? part("main")).focus();
    });
}

function showProblem(page, steps, problem, at) {
    const scene = page.session.scenes.length > 1 ? `${page.session.scenes[problem.scene].path}: ` : "";
    const remedies = page.canDecide ? problem.remedies : [];
    const buttons = remedies.map((remedy, choice) =>
        makeButton(capital(remedy), () => steps.mend(at, choice, remedy)));
    return showWords(`${scene}${problem.text}`, ...buttons);
}

/** Scenes that both sides added have no conflict, and are to be looked through nevertheless. */
function showUnions(steps, unions) {
    const words = `Both sides added ${unions.map(({ path }) => path).join(", ")}. The result has what either of ` +
        "them has: look through it, then take it.";
    const take = makeButton("Take it as it is", () => steps.takeAll("ours"), { className: "primary" });
    return showWords(words, take);
}

function showWords(words, ...buttons) {
    return make("div", { class: "problem" }, make("p", {}, words), ...buttons);
}
