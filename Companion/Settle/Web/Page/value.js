import { differenceOf } from "./difference.js";
import { draw, make } from "./dom.js";

const AXES = { vector: ["x", "y", "z", "w"], colour: ["r", "g", "b", "a"] };

/**
 * A value for people, with what became of it since another one.
 * @param {{text: string, numbers?: number[], target?: string, isShortened?: boolean}|null} value null: there is none
 * @param {object|null|undefined} before the value to compare with; undefined for no comparison
 * @param {string} type as rows have it
 * @param {function(string)} follow goes to the object of that id
 */
export function showValue(value, before, type, follow) {
    if (!value) return make("span", { class: "none" }, before ? "removed" : "none");
    const shown = make("div", { class: `value value-${type}` }, showContent(value, before, type, follow));
    if (value.isShortened) shown.append(make("p", { class: "aside" }, "The rest is too long to be shown here."));
    return shown;
}

function showContent(value, before, type, follow) {
    const numbers = value.numbers ?? [];
    if (type === "colour" && numbers.length >= 3) return showColour(numbers, before?.numbers);
    if (type === "vector" && numbers.length) return showNumbers(numbers, before?.numbers, AXES.vector);
    if (type === "number" && numbers.length === 1) return showNumber(value.text, numbers[0], before?.numbers?.[0]);
    if (type === "reference") return showReference(value, follow);
    return showText(value.text, before);
}

function showColour(numbers, before) {
    return make("div", { class: "colour" }, drawSwatch(numbers), showNumbers(numbers, before, AXES.colour));
}

/** A colour over light and dark squares, by which one sees how much shines through. */
function drawSwatch(numbers) {
    const [red, green, blue] = numbers.map((part) => Math.round(255 * Math.min(1, Math.max(0, part))));
    const opacity = Math.min(1, Math.max(0, numbers[3] ?? 1));
    const square = (x, y) => draw("rect", { x, y, width: 12, height: 12, fill: "#999" });
    return draw("svg", { class: "swatch", viewBox: "0 0 24 24", width: 36, height: 36, "aria-hidden": "true" },
        draw("rect", { width: 24, height: 24, fill: "#fff" }), square(0, 0), square(12, 12),
        draw("rect", { width: 24, height: 24, fill: `rgb(${red} ${green} ${blue})`, "fill-opacity": opacity }));
}

function showNumbers(numbers, before, axes) {
    const list = make("span", { class: "numbers" });
    numbers.forEach((number, at) => {
        list.append(make("span", { class: "axis" }, make("span", { class: "axis-name" }, axes[at] ?? String(at)), " ",
            String(number), showChange(number, before?.[at])), " ");
    });
    return list;
}

function showNumber(text, number, before) {
    return make("span", { class: "numbers" }, text, showChange(number, before));
}

function showChange(number, before) {
    if (before === undefined || before === number) return null;
    const change = Number((number - before).toPrecision(6));
    return make("span", { class: "change" }, ` (${change > 0 ? "+" : "−"}${Math.abs(change)})`);
}

function showReference(value, follow) {
    if (!value.target) return value.text;
    const go = () => follow(value.target);
    return make("button", { type: "button", class: "link", title: "Show that object", onclick: go }, value.text);
}

function showText(text, before) {
    if (text === "") return make("span", { class: "none" }, "empty");
    const isLong = text.length > 400 || text.split("\n").length > 12;
    const shown = make("pre", { class: "text", tabindex: isLong ? "0" : null });
    if (!before || before.text === text) shown.append(text);
    else shown.append(...markDifference(before.text, text));
    return shown;
}

function markDifference(before, after) {
    const tags = { same: "span", removed: "del", added: "ins" };
    return differenceOf(before, after).map(([kind, text]) => make(tags[kind], {}, text));
}
