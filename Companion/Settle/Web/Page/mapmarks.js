import { draw } from "./dom.js";
import { gridStep } from "./camera.js";
import { counted, markWords } from "./words.js";

const MOST_LABELS = 80;
const LETTER = 6.6;

/** Where the map shows an object: where ours has it, or theirs if it alone moved it, or else where it was. */
export function spotOf({ base, ours, theirs }) {
    const isByTheirs = theirs && (!ours || (base && !isElsewhere(base, ours)));
    return isByTheirs ? theirs : ours ?? base;
}

/** What a mark of the map says. */
export function spotWords(item, isComparison) {
    const open = item.open ? `, ${counted(item.open, "conflict")} open` : "";
    return `${item.name}: ${markWords(item.mark, item.by, isComparison)}${open}`;
}

/** What a bundle says. */
export function bundleWords(bundle) {
    const told = [counted(bundle.count, "object")];
    if (bundle.changed) told.push(`${bundle.changed} changed`);
    if (bundle.open) told.push(`${bundle.open} open`);
    return `${told.join(", ")}: zoom in`;
}

/** All objects that nobody touched, as dots of one path. */
export function drawDots(items, camera) {
    const dots = items.map((item) => camera.toScreen(spotOf(item)).map((at) => at.toFixed(1)).join(" "));
    return draw("path", { class: "dots", d: dots.map((at) => `M${at}h0`).join("") });
}

const SHAPES = {
    added: () => [draw("circle", { r: 7 }), draw("path", { class: "cut", d: "M-4 0H4M0-4V4" })],
    removed: () => [draw("circle", { r: 7 }), draw("path", { class: "cut", d: "M-3-3L3 3M3-3L-3 3" })],
    changed: () => [draw("circle", { r: 5 })],
    moved: () => [draw("rect", { x: -5, y: -5, width: 10, height: 10, rx: 1 })],
    same: () => [draw("circle", { r: 3 })],
};

/** An object that was touched: its mark, and arrows from where it was to where each side has it. */
export function drawItem(item, camera, id, words) {
    const [left, top] = camera.toScreen(spotOf(item));
    const transform = `translate(${left.toFixed(1)} ${top.toFixed(1)})`;
    const spot = draw("g", { transform, class: `spot spot-${item.mark}` },
        item.open ? draw("path", { class: "open", d: "M0-13L13 0L0 13L-13 0Z" }) : null, ...SHAPES[item.mark]());
    return draw("g", { id, role: "option", "aria-selected": "false", "aria-label": words },
        ...drawArrows(item, camera), spot);
}

function drawArrows(item, camera) {
    const moves = ["ours", "theirs"].filter((side) => item.base && item[side] && isElsewhere(item.base, item[side]));
    if (!moves.length) return [];
    const from = camera.toScreen(item.base);
    const origin = draw("circle", { class: "origin", cx: from[0].toFixed(1), cy: from[1].toFixed(1), r: 4 });
    return [origin, ...moves.map((side) => drawArrow(from, camera.toScreen(item[side]), side))];
}

function isElsewhere([x, y], [otherX, otherY]) {
    return x !== otherX || y !== otherY;
}

function drawArrow(from, to, side) {
    const [across, down] = [to[0] - from[0], to[1] - from[1]];
    const length = Math.hypot(across, down);
    if (length < 8) return null;
    const [right, low] = [across / length, down / length];
    const tip = [to[0] - right * 7, to[1] - low * 7];
    const wing = (turn) => [tip[0] - right * 9 + turn * low * 5, tip[1] - low * 9 - turn * right * 5];
    const point = (at) => at.map((pixels) => pixels.toFixed(1)).join(" ");
    return draw("g", { class: `arrow arrow-${side}` },
        draw("path", { class: "shaft", d: `M${point(from)}L${point(tip)}` }),
        draw("path", { class: "head", d: `M${point(tip)}L${point(wing(1))}L${point(wing(-1))}Z` }));
}

/** Many objects that stand close. */
export function drawBundle(bundle, camera, id) {
    const [left, top] = camera.toScreen([bundle.x, bundle.y]);
    const text = bundle.count > 9999 ? `${Math.round(bundle.count / 1000)}k` : String(bundle.count);
    const width = 12 + text.length * 7;
    const state = bundle.open ? "bundle-open" : bundle.changed ? "bundle-changed" : "";
    return draw("g", { id, role: "option", "aria-selected": "false", "aria-label": bundleWords(bundle),
        class: `bundle ${state}`, transform: `translate(${left.toFixed(1)} ${top.toFixed(1)})` },
    draw("rect", { x: -width / 2, y: -9, width, height: 18, rx: 9 }),
    draw("text", { y: 4, "text-anchor": "middle" }, text));
}

/** The names of items beside their marks, as many as fit without covering each other or any of the spots. */
export function drawLabels(items, spots, camera) {
    const taken = spots.map(({ place }) => around(camera.toScreen(place), 22, 22));
    const labels = [];
    for (const item of items) {
        if (labels.length === MOST_LABELS) break;
        const { name } = item;
        const text = name.length > 28 ? `${name.slice(0, 27)}…` : name;
        const [middle, top] = camera.toScreen(spotOf(item));
        const left = middle + (item.open ? 17 : 11);
        const box = [left, top - 8, left + text.length * LETTER, top + 8];
        if (taken.some((other) => covers(other, box))) continue;
        taken.push(box);
        labels.push(draw("text", { class: "label", x: left, y: top + 4, "aria-hidden": "true" }, text));
    }
    return labels;
}

function around([left, top], width, height) {
    return [left - width / 2, top - height / 2, left + width / 2, top + height / 2];
}

function covers(one, other) {
    return one[0] < other[2] && other[0] < one[2] && one[1] < other[3] && other[1] < one[3];
}

/** Lines by which places and distances can be told, with their numbers at the edges. */
export function drawGrid(camera, axes) {
    const step = gridStep(camera, 90);
    const [west, south, east, north] = camera.box();
    const made = [];
    for (let x = Math.ceil(west / step) * step; x <= east; x += step) {
        const left = camera.toScreen([x, 0])[0].toFixed(1);
        made.push(draw("path", { d: `M${left} 0V${camera.height}` }),
            draw("text", { x: Number(left) + 3, y: camera.height - 5 }, gridNumber(x, step)));
    }
    for (let y = Math.ceil(south / step) * step; y <= north; y += step) {
        const top = camera.toScreen([0, y])[1].toFixed(1);
        made.push(draw("path", { d: `M0 ${top}H${camera.width}` }),
            draw("text", { x: 4, y: Number(top) - 3 }, gridNumber(y, step)));
    }
    made.push(draw("text", { class: "axis-title", x: camera.width - 28, y: camera.height - 18 }, `${axes[0]} →`),
        draw("text", { class: "axis-title", x: 4, y: 14 }, `${axes[1]} ↑`));
    return draw("g", { class: "grid", "aria-hidden": "true" }, ...made);
}

function gridNumber(value, step) {
    return String(Number(value.toFixed(Math.max(0, 1 - Math.floor(Math.log10(step))))));
}
