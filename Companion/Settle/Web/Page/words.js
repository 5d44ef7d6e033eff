/** The words and signs that all parts of the page share. */

/** In the order in which they are shown. */
export const SIDES = ["base", "ours", "theirs"];

/** What became of an object, as a word and as a sign of its own shape. */
export const MARKS = {
    added: { word: "added", sign: "+" },
    removed: { word: "removed", sign: "−" },
    changed: { word: "changed", sign: "●" },
    moved: { word: "moved", sign: "➜" },
    same: { word: "unchanged", sign: "" },
    open: { word: "open", sign: "◆" },
};

/** "Ours". */
export function capital(word) {
    return word.charAt(0).toUpperCase() + word.slice(1);
}

/** "1 conflict", "3 conflicts". */
export function counted(count, noun) {
    return `${count.toLocaleString("en")} ${noun}${count === 1 ? "" : "s"}`;
}

/** "12 of 50 open", "All 50 are settled". */
export function openWords(session) {
    const total = session.total.toLocaleString("en");
    if (session.total === 0) return "No conflicts";
    if (session.open === 0) return session.total === 1 ? "Settled" : `All ${total} settled`;
    return `${session.open.toLocaleString("en")} of ${total} open`;
}

/**
 * The name of an object without what it stands under, and that: "Lantern · Light" in "Harbour/Pier". What other
 * versions call it, "(theirs: Harbour/Lamp · Light)", is left out.
 * @param {string} name
 */
export function splitName(name) {
    const others = name.search(/ \((base|ours|theirs|before|after)( and (base|ours|theirs))?: /);
    const first = others < 0 ? name : name.slice(0, others);
    const component = first.indexOf(" · ");
    const cut = first.lastIndexOf("/", component < 0 ? first.length : component);
    return { own: first.slice(cut + 1), above: first.slice(0, Math.max(0, cut)) };
}

/** What a conflict is about, within its object. That the object's id is what refers to it needn't be said. */
export function propertyWords(property) {
    return property ? property.replace(/\.fileID$/, "") : "the whole object";
}

/** "Harbour/Pier/Lantern · Light", without what other versions call it. */
export function fullName(name) {
    const { own, above } = splitName(name);
    return above ? `${above}/${own}` : own;
}

/** "added by theirs"; in a comparison of two versions nobody is told. */
export function markWords(mark, by, isComparison) {
    const word = MARKS[mark].word;
    if (mark === "same" || !by || isComparison) return word;
    return by === "both" ? `${word} by both` : `${word} by ${by}`;
}

/** The scenes whose results can be written: everything in them is decided, and they aren't written yet. */
export function readyScenes({ scenes, isSettled }) {
    const isDecided = ({ open, settled }) => open === 0 && (settled > 0 || isSettled);
    return scenes.filter((scene) => isDecided(scene) && !scene.problem && !scene.isFinished);
}
