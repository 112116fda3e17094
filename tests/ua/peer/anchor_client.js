#!/usr/bin/env node
"use strict";
// The benchmark's anchor: node-opcua's own client monitors the peer's bulk
// variables and reports, on one line, what it received and what it cost:
//   ANCHOR items=N seconds=T values=V values_per_s=R cpu_ms=C cpu_share=S first_all_ms=F
// cpu_share is the process's CPU time over the measured wall time (1.0 = one
// core). first_all_ms is the time from CreateMonitoredItems until every item has
// delivered a value; the measurement starts a warm-up later, because on Node.js 20
// node-opcua generates an RSA key in the background when it is loaded (a check of
// the runtime's RSA padding), which costs a second or more of CPU time.

const { parseArgs } = require("node:util");
const {
    AttributeIds,
    ClientMonitoredItemGroup,
    OPCUAClient,
    TimestampsToReturn
} = require("node-opcua");

const USAGE = "usage: node anchor_client.js --url opc.tcp://... [--count N] [--seconds T]\n" +
    "                             [--interval MS] [--sampling MS] [--warmup S]";
const FIRST_VALUES_TIMEOUT_MS = 120000;

function parseOptions(argv) {
    const { values } = parseArgs({
        args: argv,
        options: {
            url: { type: "string" },
            count: { type: "string", default: "10000" },
            seconds: { type: "string", default: "10" },
            interval: { type: "string", default: "100" },
            sampling: { type: "string" },
            warmup: { type: "string", default: "3" }
        }
    });
    const options = {
        url: values.url,
        count: Number(values.count),
        seconds: Number(values.seconds),
        interval: Number(values.interval),
        sampling: Number(values.sampling ?? values.interval),
        warmup: Number(values.warmup)
    };
    const valid = options.url && Number.isInteger(options.count) && options.count > 0 &&
        options.seconds > 0 && options.interval > 0 && options.sampling >= 0 &&
        options.warmup >= 0;
    if (!valid) {
        throw new Error(USAGE);
    }
    return options;
}

function bulkItem(i) {
    return { nodeId: `ns=1;s=Bulk.V${i}`, attributeId: AttributeIds.Value };
}

async function checkBulkSize(session, count) {
    const last = await session.read(bulkItem(count - 1));
    if (last.statusCode.isNotGood()) {
        throw new Error(`Bulk.V${count - 1} answers ${last.statusCode.name}: ` +
            `start the peer with --bulk ${count} or more`);
    }
}

// Resolves once every item has reported a value; counts every value in counter.
// The listener is in place before the items exist, so no first value is missed.
function monitorAll(subscription, options, counter) {
    const items = Array.from({ length: options.count }, (_, i) => bulkItem(i));
    const group = ClientMonitoredItemGroup.create(subscription, items,
        { samplingInterval: options.sampling, queueSize: 1 }, TimestampsToReturn.Both);
    const reported = new Uint8Array(options.count);
    let missing = options.count;
    return new Promise((resolve, reject) => {
        const timer = setTimeout(() => reject(new Error(`${missing} items reported no value`)),
            FIRST_VALUES_TIMEOUT_MS);
        group.on("err", (message) => reject(new Error(message)));
        group.on("changed", (_item, _dataValue, index) => {
            counter.values += 1;
            if (!reported[index]) {
                reported[index] = 1;
                missing -= 1;
                if (missing === 0) {
                    clearTimeout(timer);
                    resolve();
                }
            }
        });
    });
}

function sleep(ms) {
    return new Promise((resolve) => setTimeout(resolve, ms));
}

async function measure(session, options) {
    const subscription = await session.createSubscription2({
        requestedPublishingInterval: options.interval,
        requestedMaxKeepAliveCount: 10,
        requestedLifetimeCount: 100,
        maxNotificationsPerPublish: 0,
        publishingEnabled: true
    });
    const counter = { values: 0 };
    const created = performance.now();
    await monitorAll(subscription, options, counter);
    const firstAllMs = performance.now() - created;
    await sleep(options.warmup * 1000);
    const start = { wall: performance.now(), cpu: process.cpuUsage(), values: counter.values };
    await sleep(options.seconds * 1000);
    const wallMs = performance.now() - start.wall;
    const cpu = process.cpuUsage(start.cpu);
    await subscription.terminate();
    const cpuMs = (cpu.user + cpu.system) / 1000;
    const values = counter.values - start.values;
    return [
        `items=${options.count}`,
        `seconds=${(wallMs / 1000).toFixed(3)}`,
        `values=${values}`,
        `values_per_s=${(values * 1000 / wallMs).toFixed(1)}`,
        `cpu_ms=${cpuMs.toFixed(1)}`,
        `cpu_share=${(cpuMs / wallMs).toFixed(4)}`,
        `first_all_ms=${firstAllMs.toFixed(1)}`
    ].join(" ");
}

async function main() {
    const options = parseOptions(process.argv.slice(2));
    const client = OPCUAClient.create({
        endpointMustExist: false,
        connectionStrategy: { maxRetry: 0 }
    });
    await client.connect(options.url);
    const session = await client.createSession();
    await checkBulkSize(session, options.count);
    const line = await measure(session, options);
    await session.close();
    await client.disconnect();
    console.log(`ANCHOR ${line}`);
}

main().then(() => process.exit(0), (error) => {
    console.error(`anchor client: ${error.message}`);
    process.exit(1);
});
