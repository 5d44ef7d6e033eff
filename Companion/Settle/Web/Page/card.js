import { make, makeButton } from "./dom.js";
import { showValue } from "./value.js";
import { SIDES, capital, propertyWords, splitName } from "./words.js";

/** Why a conflict that was decided is open. */
const STILL_LOOP = "with the sides that are taken, the objects would still be below each other: take one side for " +
    "all of them";

const KEYS = { base: "B", ours: "O", theirs: "T" };

/**
 * The selected conflict with the values of all sides and, where something can be decided, a button for each.
 * @param {import("./state.js").PageState} page
 * @param {import("./steps.js").Steps} steps
 * @param {object|null} row the values as far as they are there
 * @param {function(string)} follow
 */
export function makeCard(page, steps, row, follow) {
    const { item } = page;
    const name = splitName(item.object || "The order of fields");
    return make("article", { class: "card", "aria-labelledby": "card-title" },
        make("h2", { id: "card-title" },
            make("span", { class: "above" }, name.above ? `${name.above} / ` : ""), name.own,
            make("span", { class: "property" }, item.property ? ` · ${propertyWords(item.property)}` : "")),
        make("p", { class: "what" }, stateWords(item)),
        make("div", { class: "columns" }, ...SIDES.map((side) => makeColumn(page, steps, side, row, follow))),
        makeResult(item, row, follow),
        page.canDecide ? makeUnder(page, steps) : null);
}

function stateWords(item) {
    const what = `${capital(item.what)}.`;
    if (!item.isOpen) return `${what} ${item.decided ? `You took ${item.decided}.` : "Another decision settled it."}`;
    if (item.decided) return `${what} Open: you took ${item.decided}, but ${STILL_LOOP}.`;
    return item.proposed ? `${what} Open; it was decided before: ${item.proposed}.` : `${what} Open.`;
}

function makeColumn(page, steps, side, row, follow) {
    const { item } = page;
    const { title, label } = page.columns.find((column) => column.side === side);
    const isTaken = item.decided === side;
    const before = side === "base" || !item.property ? undefined : row?.values.base;
    const value = row ? showValue(row.values[side], before, typeOf(item, row), follow)
        : make("div", { class: "value" }, item.words[side]);
    const sign = isTaken ? make("span", { class: "taken" }, "✓ taken") : null;
    return make("div", { class: `side side-${side}${isTaken ? " is-taken" : ""}`, role: "group", "aria-label": title },
        make("h3", {}, title, label ? make("span", { class: "label" }, ` — ${label}`) : null, sign),
        make("div", { class: "side-value" }, value),
        page.canDecide ? makeChoice(page, steps, side, isTaken) : null);
}

function makeChoice(page, steps, side, isTaken) {
    const { item } = page;
    const isProposed = item.isOpen && item.proposed === side;
    const words = make("span", {}, capital(item.choices[side]), isProposed ? make("em", {}, " (as before)") : null);
    const button = makeButton(words, () => steps.take(side), {
        key: KEYS[side], focus: `take-${side}`, className: `choice take-${side}`, title: `Take ${side}`,
    });
    button.setAttribute("aria-pressed", String(isTaken));
    return button;
}

function makeResult(item, row, follow) {
    if (!row) return make("div", { class: "result" }, make("h3", {}, "Result"), item.isOpen ? "not decided" : "…");
    const note = item.isOpen ? make("span", { class: "aside" }, " until it is decided") : null;
    return make("div", { class: `result${item.isOpen ? " is-open" : ""}` }, make("h3", {}, "Result"),
        showValue(row.values.result, undefined, typeOf(item, row), follow), note);
}

/** Of an object as a whole the values say what happened to it. */
function typeOf(item, row) {
    return item.property ? row.type : "text";
}

function makeUnder(page, steps) {
    const buttons = SIDES.map((side) => makeButton(capital(side),
        () => steps.takeUnder(side), { key: `Shift+${KEYS[side]}`, focus: `under-${side}`, className: `take-${side}`,
            title: `Take ${side} for all that is open here and below` }));
    return make("p", { class: "under" }, "All that is open here and below: ", ...buttons);
}
