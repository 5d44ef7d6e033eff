const STEADY_HAND = 4;

/**
 * Tells what a pointer does on an element: it drags, or clicks, if it hardly moves between pressing and letting go.
 * @param {Element} element
 * @param {{begin: function(PointerEvent): *, move: function(number, number), click: function(*)}} tell `click` is given
 *     what `begin` returned
 */
export function watchDrags(element, { begin, move, click }) {
    element.addEventListener("pointerdown", (event) => {
        if (event.button !== 0) return;
        const begun = begin(event);
        const over = new AbortController();
        let last = event;
        element.setPointerCapture(event.pointerId);
        element.addEventListener("pointermove", (moved) => {
            move(moved.clientX - last.clientX, moved.clientY - last.clientY);
            last = moved;
        }, over);
        element.addEventListener("pointercancel", () => over.abort(), over);
        element.addEventListener("pointerup", (released) => {
            over.abort();
            const away = Math.hypot(released.clientX - event.clientX, released.clientY - event.clientY);
            if (away < STEADY_HAND) click(begun);
        }, over);
    });
}
