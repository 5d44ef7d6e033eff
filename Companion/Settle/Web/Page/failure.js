/** A request that was refused or couldn't be made, worded for people. */
export class RequestFailure extends Error {
    /**
     * @param {string} words
     * @param {number} status of HTTP; 0 where nobody answered
     */
    constructor(words, status) {
        super(words);
        this.status = status;
    }
}
