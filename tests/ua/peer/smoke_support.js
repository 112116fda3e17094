"use strict";
// Shared by the peer's own checks: the endpoint from the fixture's URL file, a
// connected session of node-opcua's client, and a runner that names each check.

const fs = require("node:fs");
const { OPCUAClient } = require("node-opcua");

const OVERALL_TIMEOUT_MS = 30000;

function endpointUrl() {
    const file = process.env.CV_UA_PEER_URL_FILE;
    if (!file) {
        throw new Error("CV_UA_PEER_URL_FILE is not set; run this under CTest's peer fixture");
    }
    return fs.readFileSync(file, "utf8").trim();
}

async function connect(url, clientOptions = {}) {
    const client = OPCUAClient.create({
        endpointMustExist: false,
        connectionStrategy: { maxRetry: 0 },
        ...clientOptions
    });
    await client.connect(url);
    const session = await client.createSession();
    return { client, session };
}

// Waits until predicate(value) holds for an event's value, or fails after ms.
function waitFor(emitter, event, predicate, ms, what) {
    return new Promise((resolve, reject) => {
        const timer = setTimeout(() => {
            emitter.removeListener(event, listener);
            reject(new Error(`timed out waiting for ${what}`));
        }, ms);
        function listener(...args) {
            if (predicate(...args)) {
                clearTimeout(timer);
                emitter.removeListener(event, listener);
                resolve(args);
            }
        }
        emitter.on(event, listener);
    });
}

// Runs the named checks in order against a context; exits 0 when all pass.
async function runChecks(title, setUp, checks, tearDown) {
    setTimeout(() => {
        console.error(`${title}: not finished after ${OVERALL_TIMEOUT_MS} ms`);
        process.exit(1);
    }, OVERALL_TIMEOUT_MS).unref();
    let failed = 0;
    const context = await setUp();
    for (const [name, check] of checks) {
        const start = performance.now();
        try {
            await check(context);
            console.log(`ok      ${name} (${Math.round(performance.now() - start)} ms)`);
        } catch (error) {
            failed += 1;
            console.log(`FAILED  ${name}: ${error.message}`);
        }
    }
    await tearDown(context);
    console.log(`${title}: ${checks.length - failed} of ${checks.length} checks passed`);
    process.exit(failed === 0 ? 0 : 1);
}

function main(title, setUp, checks, tearDown) {
    runChecks(title, setUp, checks, tearDown).catch((error) => {
        console.error(`${title}: ${error.stack || error}`);
        process.exit(1);
    });
}

module.exports = { endpointUrl, connect, waitFor, main };
