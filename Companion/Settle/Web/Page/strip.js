import { make, makeButton, part, refill } from "./dom.js";
import { SIDES, capital, propertyWords, splitName } from "./words.js";

const STRIP_KEYS = { base: "B", ours: "O", theirs: "T" };

/**
 * Below the hierarchy and the map: the selected object and its conflict, with the buttons that decide it.
 * @param {import("./state.js").PageState} page
 * @param {import("./steps.js").Steps} steps
 */
export function showStrip(page, steps) {
    const show = async () => {
        const strip = part("strip");
        strip.hidden = page.view === "values" || (!page.object && !page.item);
        if (strip.hidden) return;
        const { scene, object, item } = page;
        const told = item ? null
            : await page.objectAt(scene, object).catch((failure) => ({ heading: failure.message }));
        if (page.object !== object || page.item !== item) return;
        refill(strip, item ? makeConflict(page, steps, item) : makeObjectLine(page, told.heading), part("main"));
    };
    page.addEventListener("selection", show);
    page.addEventListener("view", show);
}

function makeObjectLine(page, heading) {
    return [make("p", {}, make("strong", {}, heading)), makeValuesButton(page)];
}

function makeConflict(page, steps, item) {
    const property = item.property ? ` · ${propertyWords(item.property)}` : "";
    const taken = item.decided ? `you took ${item.decided}` : "";
    const state = item.isOpen ? ["open", taken].filter(Boolean).join(", ") : taken || "another decision settled it";
    const name = make("strong", {}, `${splitName(item.object).own}${property}`);
    const sides = SIDES.map((side) => makeStripSide(page, steps, item, side));
    return [make("p", {}, name, ` — ${item.what}; ${state}`), make("div", { class: "strip-sides" }, ...sides),
        makeValuesButton(page)];
}

function makeStripSide(page, steps, item, side) {
    const words = make("span", { class: "strip-value" }, item.words[side]);
    const name = make("strong", {}, `${capital(side)} `);
    if (!page.canDecide) return make("span", { class: `strip-side chip-${side}` }, name, words);
    const label = make("span", {}, name, words);
    const button = makeButton(label, () => steps.take(side), {
        key: STRIP_KEYS[side], focus: `strip-${side}`, className: `take-${side}`, title: capital(item.choices[side]),
    });
    button.setAttribute("aria-pressed", String(item.decided === side));
    return button;
}

function makeValuesButton(page) {
    return makeButton("All values", () => page.show("values"), { key: "1", focus: "strip-values", className: "quiet" });
}
