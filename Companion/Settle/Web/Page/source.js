import { EmbeddedSource } from "./embedded.js";
import { RequestFailure } from "./failure.js";

const NOBODY = "ovrin doesn't answer.";

/** Sends requests to the program that serves the page. */
export class ServerSource {
    isWhole = true;

    /**
     * @param {string} name of the request
     * @param {Object<string, *>} query
     * @returns {Promise<object>} its answer
     * @throws {RequestFailure}
     */
    get(name, query = {}) {
        const text = new URLSearchParams(query).toString();
        return this.ask(`api/${name}${text ? `?${text}` : ""}`, { method: "GET" });
    }

    /** Asks for a step; the rest as in `get`. */
    post(name, body) {
        const headers = { "Content-Type": "application/json" };
        return this.ask(`api/${name}`, { method: "POST", headers, body: JSON.stringify(body) });
    }

    /** Calls `onChange` with whether the program is there, when that changes. */
    watch(onChange) {
        this.alive = new EventSource("api/alive");
        this.alive.addEventListener("open", () => onChange(true));
        this.alive.addEventListener("error", () => onChange(false));
    }

    /** From now on the program may end. */
    stopWatching() {
        this.alive.close();
    }

    async ask(address, request) {
        let response;
        try {
            response = await fetch(address, { ...request, cache: "no-store" });
        } catch {
            throw new RequestFailure(NOBODY, 0);
        }
        const answer = await response.json().catch(() => null);
        if (response.ok && answer !== null) return answer;
        throw new RequestFailure(answer?.error ?? `${NOBODY} (status ${response.status})`, response.status);
    }
}

/** The source of this page: what is embedded in it, or the program that serves it. */
export function openSource() {
    const data = document.getElementById("data");
    return data ? new EmbeddedSource(JSON.parse(data.textContent)) : new ServerSource();
}
