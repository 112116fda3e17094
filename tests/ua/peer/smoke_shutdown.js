#!/usr/bin/env node
"use strict";
// Checks that writing true to Control.Shutdown shuts the peer down the way a
// real server does: State becomes Shutdown (4) with the written reason, then the
// connection closes and the process ends. Needs a fixture of its own.

const assert = require("node:assert/strict");
const fs = require("node:fs");
const path = require("node:path");
const { AttributeIds, DataType, Variant } = require("node-opcua");
const { endpointUrl, connect, main } = require("./smoke_support");

const REASON = "Shut down by the peer's own check";
const STATE_SHUTDOWN = 4;
const POLL_MS = 100;
const WAIT_MS = 10000;

function valueOf(nodeId) {
    return { nodeId, attributeId: AttributeIds.Value };
}

function write(nodeId, dataType, value) {
    return { ...valueOf(nodeId), value: { value: new Variant({ dataType, value }) } };
}

function sleep(ms) {
    return new Promise((resolve) => setTimeout(resolve, ms));
}

async function poll(what, probe) {
    for (let waited = 0; waited < WAIT_MS; waited += POLL_MS) {
        if (await probe()) {
            return;
        }
        await sleep(POLL_MS);
    }
    throw new Error(`timed out waiting for ${what}`);
}

function isRunning(pid) {
    try {
        process.kill(pid, 0);
        return true;
    } catch (error) {
        return error.code === "EPERM";
    }
}

async function checkRunning({ session }) {
    const state = await session.read(valueOf("i=2259"));
    assert.equal(state.value.value, 0);
}

async function checkShutdownWrite({ session }) {
    const statuses = await session.write([
        write("ns=1;s=Control.ShutdownReason", DataType.String, REASON),
        write("ns=1;s=Control.ShutdownDelay", DataType.Int32, 500),
        write("ns=1;s=Control.Shutdown", DataType.Boolean, true)
    ]);
    statuses.forEach((status) => assert.equal(status.value, 0, status.name));
}

async function checkStateAndReason({ session }) {
    let reason;
    await poll("State Shutdown", async () => {
        const [state, text] = await session.read([valueOf("i=2259"), valueOf("i=2993")]);
        reason = text.value.value && text.value.value.text;
        return state.value.value === STATE_SHUTDOWN;
    });
    assert.equal(reason, REASON);
}

async function checkProcessEnds({ pid }) {
    await poll(`process ${pid} to end`, async () => !isRunning(pid));
}

async function setUp() {
    const url = endpointUrl();
    const pidFile = path.join(path.dirname(process.env.CV_UA_PEER_URL_FILE), "pid");
    const pid = Number(fs.readFileSync(pidFile, "utf8"));
    return { pid, ...(await connect(url)) };
}

async function tearDown({ client }) {
    await client.disconnect();
}

main("peer shutdown check", setUp, [
    ["the peer runs", checkRunning],
    ["Control.Shutdown accepts the write", checkShutdownWrite],
    ["State becomes Shutdown with the reason", checkStateAndReason],
    ["the process ends by itself", checkProcessEnds]
], tearDown);
