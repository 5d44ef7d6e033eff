/**
 * Elements. Names and texts of a scene come into the page as text and attribute values alone, never as markup, whatever
 * they look like.
 */

const SVG = "http://www.w3.org/2000/svg";

function furnish(element, attributes, children) {
    for (const [name, value] of Object.entries(attributes)) {
        if (value === null || value === undefined || value === false) continue;
        if (name.startsWith("on")) element.addEventListener(name.slice(2), value);
        else element.setAttribute(name, value === true ? "" : value);
    }
    element.append(...children.filter((child) => child !== null && child !== undefined));
    return element;
}

/**
 * An element of HTML.
 * @param {string} tag
 * @param {Object<string, *>} attributes by name; null, undefined and false are left out, "onclick" and the like listen
 * @param {...(Node|string|null)} children null is left out
 */
export function make(tag, attributes = {}, ...children) {
    return furnish(document.createElement(tag), attributes, children);
}

/** An element of SVG, made as by `make`. */
export function draw(tag, attributes = {}, ...children) {
    return furnish(document.createElementNS(SVG, tag), attributes, children);
}

/** @param {string} id of an element that index.html has */
export function part(id) {
    return document.getElementById(id);
}

/**
 * A button. One that can't do its work now stays where it is and can be reached: `reason` tells why, when it is pressed
 * as well.
 * @param {Node|string} label
 * @param {function} act
 * @param {{title?: string, key?: string, className?: string, focus?: string, reason?: string,
 *     onRefused?: function(string)}} more `focus` names it for `refill`
 */
export function makeButton(label, act, more = {}) {
    const key = more.key ? make("kbd", { "aria-hidden": "true" }, more.key) : null;
    const isRefused = Boolean(more.reason);
    const hint = more.key ? ` (key ${more.key})` : "";
    return make("button", {
        type: "button",
        class: more.className,
        "data-focus": more.focus,
        title: isRefused ? more.reason : (more.title ?? "") + hint || null,
        "aria-disabled": isRefused ? "true" : null,
        "aria-keyshortcuts": more.key && more.key.length === 1 ? more.key.toLowerCase() : null,
        onclick: (event) => (isRefused ? more.onRefused?.(more.reason) : act(event)),
    }, label, key);
}

/**
 * Fills an element anew. If the focus was on something in it with a `data-focus`, it comes to what has the same now, or
 * else to `otherwise`.
 * @param {Element} element
 * @param {Array<Node|null>} children
 * @param {Element} [otherwise]
 */
export function refill(element, children, otherwise) {
    const focused = element.contains(document.activeElement) ? document.activeElement : null;
    element.replaceChildren(...children.filter((child) => child !== null));
    if (!focused) return;
    const name = focused.dataset.focus;
    const same = name && element.querySelector(`[data-focus="${CSS.escape(name)}"]`);
    (same || otherwise)?.focus({ preventScroll: true });
}
