import { make } from "./dom.js";
import { MARKS, capital, counted, markWords } from "./words.js";

/**
 * A row of the tree: an object, or what stands for the rest of a branch.
 * @param {object} row as Branches.rows has it
 * @param {{isOpened: boolean, isSelected: boolean, isReached: boolean, isComparison: boolean}} how
 */
export function makeTreeRow(row, how) {
    const made = row.node ? makeNodeRow(row, how) : makeRestRow(row);
    made.style.setProperty("--level", row.level);
    return made;
}

function makeNodeRow({ node, level, at, of }, how) {
    const hasChildren = node.children > 0;
    const row = make("div", {
        role: "treeitem", class: `row row-${node.mark} row-${node.kind}`, "data-id": node.id, "aria-level": level,
        "aria-setsize": of, "aria-posinset": at, "aria-selected": String(how.isSelected),
        "aria-expanded": hasChildren ? String(how.isOpened) : null, tabindex: how.isReached ? "0" : "-1",
    }, makeTwist(hasChildren, how.isOpened), make("span", { class: "name" }, node.name), " ");
    if (node.mark !== "same") row.append(makeMark(node.mark, capital(markWords(node.mark, node.by, how.isComparison))));
    if (node.open) row.append(makeMark("open", `${node.open} open`));
    if (hasChildren && !how.isOpened) row.append(makeBelow(node.below));
    return row;
}

function makeTwist(hasChildren, isOpened) {
    return make("span", { class: "twist", "aria-hidden": "true" }, hasChildren ? (isOpened ? "▾" : "▸") : "");
}

function makeMark(mark, words) {
    const sign = make("span", { class: "sign", "aria-hidden": "true" }, MARKS[mark].sign);
    return make("span", { class: `mark mark-${mark}` }, sign, ` ${words} `);
}

/** What a closed branch hides. */
function makeBelow(below) {
    const told = [];
    if (below.changed) told.push(`${below.changed.toLocaleString("en")} changed`);
    if (below.open) told.push(`${below.open.toLocaleString("en")} open`);
    return told.length ? make("span", { class: "below" }, `${told.join(", ")} below`) : "";
}

function makeRestRow({ parent, level, at, of, rest }) {
    return make("div", {
        role: "treeitem", class: "row row-rest", "data-rest": "1", "data-parent": parent ?? "", tabindex: "-1",
        "aria-level": level, "aria-setsize": of, "aria-posinset": at, "aria-selected": "false",
    }, make("span", { class: "twist", "aria-hidden": "true" }, "…"), `Show more: ${counted(rest, "other object")}`);
}
