#!/usr/bin/env node
"use strict";
// The independent OPC UA server the tests talk to: node-opcua on 127.0.0.1 only,
// serving the address space of address_space.js. Prints one line
// "READY <endpointUrl>" once it listens, "SHUTDOWN <reason>" when it starts to
// shut down and "STOPPED" just before it exits.

const fs = require("node:fs");
const path = require("node:path");
const { parseArgs } = require("node:util");
const {
    OPCUACertificateManager,
    OPCUAServer,
    MessageSecurityMode,
    SecurityPolicy,
    Subscription
} = require("node-opcua");
const { buildAddressSpace } = require("./address_space");

const USAGE = `usage: node server.js [--port N|free] [--resource-path PATH] [--token-lifetime MS]
                      [--bulk N] [--slow-ms MS] [--secure] [--users NAME:PASSWORD,...]
                      [--reject-unknown] [--exit-with-pid PID]`;
const STOP_DELAY_MS = 100;
const SHUTDOWN_GRACE_MS = 10000;
const PARENT_POLL_MS = 1000;
const MAX_NOTIFICATIONS_PER_PUBLISH = 100000;

function fail(message) {
    console.error(`${message}\n${USAGE}`);
    process.exit(2);
}

function toInteger(name, text, min, max) {
    const value = Number(text);
    if (!/^\d+$/.test(text) || value < min || value > max) {
        fail(`--${name} needs a whole number from ${min} to ${max}, not "${text}"`);
    }
    return value;
}

// "name:password,name2:password2" as a map from name to password.
function parseUsers(text) {
    const users = new Map();
    for (const pair of (text || "").split(",").filter((p) => p !== "")) {
        const colon = pair.indexOf(":");
        if (colon <= 0) {
            fail(`--users needs NAME:PASSWORD pairs separated by commas, not "${pair}"`);
        }
        users.set(pair.slice(0, colon), pair.slice(colon + 1));
    }
    return users;
}

function parseOptions(argv) {
    let parsed;
    try {
        parsed = parseArgs({
            args: argv,
            options: {
                "port": { type: "string", default: "free" },
                "resource-path": { type: "string", default: "" },
                "token-lifetime": { type: "string" },
                "bulk": { type: "string", default: "0" },
                "slow-ms": { type: "string", default: "3000" },
                "secure": { type: "boolean", default: false },
                "users": { type: "string" },
                "reject-unknown": { type: "boolean", default: false },
                "exit-with-pid": { type: "string" }
            }
        }).values;
    } catch (error) {
        fail(error.message);
    }
    const port = parsed.port === "free" ? 0 : toInteger("port", parsed.port, 0, 65535);
    return {
        port,
        resourcePath: parsed["resource-path"],
        tokenLifetime: parsed["token-lifetime"] === undefined ? undefined
            : toInteger("token-lifetime", parsed["token-lifetime"], 1000, 3600000),
        bulk: toInteger("bulk", parsed.bulk, 0, 1000000),
        slowMs: toInteger("slow-ms", parsed["slow-ms"], 0, 600000),
        secure: parsed.secure,
        users: parseUsers(parsed.users),
        rejectUnknown: parsed["reject-unknown"],
        exitWithPid: parsed["exit-with-pid"] === undefined ? undefined
            : toInteger("exit-with-pid", parsed["exit-with-pid"], 1, 4194304)
    };
}

// With --secure the peer offers None and both signing policies in both modes.
function securityOptions(options) {
    if (!options.secure) {
        return {
            securityPolicies: [SecurityPolicy.None],
            securityModes: [MessageSecurityMode.None]
        };
    }
    return {
        securityPolicies: [SecurityPolicy.None, SecurityPolicy.Basic256Sha256,
            SecurityPolicy.Aes128_Sha256_RsaOaep],
        securityModes: [MessageSecurityMode.None, MessageSecurityMode.Sign,
            MessageSecurityMode.SignAndEncrypt]
    };
}

// With --reject-unknown the peer keeps its own PKI (under XDG_CONFIG_HOME) and
// refuses client certificates it does not trust; Control.TrustRejected trusts
// those it has refused so far.
function makeCertificateManager(options) {
    if (!options.rejectUnknown) {
        return undefined;
    }
    return new OPCUACertificateManager({
        automaticallyAcceptUnknownCertificate: false,
        rootFolder: path.join(process.env.XDG_CONFIG_HOME || ".", "peer-pki")
    });
}

async function trustRejected(manager) {
    if (!manager) {
        return;
    }
    const folder = manager.rejectedFolder;
    for (const name of await fs.promises.readdir(folder)) {
        const text = await fs.promises.readFile(path.join(folder, name), "utf8");
        const base64 = text.replace(/-----[^-]+-----/g, "").replace(/\s+/g, "");
        await manager.trustCertificate(Buffer.from(base64, "base64"));
    }
}

function makeServer(options, certificateManager) {
    const users = options.users;
    return new OPCUAServer({
        port: options.port,
        host: "127.0.0.1",
        hostname: "127.0.0.1",
        resourcePath: options.resourcePath,
        defaultSecureTokenLifetime: options.tokenLifetime,
        ...securityOptions(options),
        serverCertificateManager: certificateManager,
        userManager: {
            isValidUser: (name, password) => users.has(name) && users.get(name) === password
        },
        allowAnonymous: true,
        isAuditing: false,
        maxConnectionsPerEndpoint: 50,
        serverCapabilities: {
            maxSessions: 50,
            operationLimits: { maxMonitoredItemsPerCall: 100000 }
        },
        serverInfo: {
            applicationUri: "urn:127.0.0.1:ua-test-peer",
            productUri: "urn:ua-test-peer",
            applicationName: { text: "UA test peer", locale: "en" }
        },
        buildInfo: { productName: "UA test peer", manufacturerName: "Test" }
    });
}

// The returned function shuts the server down once: State becomes Shutdown with
// the reason at once, the endpoints close after delayMs, then the process ends.
function makeShutdown(server, stopValues) {
    let started = false;
    return async (reason, delayMs) => {
        if (started) {
            return;
        }
        started = true;
        console.log(`SHUTDOWN ${reason}`);
        setTimeout(() => {
            console.log("STOPPED (shutdown did not finish in time)");
            process.exit(1);
        }, delayMs + SHUTDOWN_GRACE_MS).unref();
        stopValues();
        server.engine.setShutdownReason(reason);
        await server.shutdown(delayMs);
        console.log("STOPPED");
        process.exit(0);
    };
}

function isRunning(pid) {
    try {
        process.kill(pid, 0);
        return true;
    } catch (error) {
        return error.code === "EPERM";
    }
}

// A peer whose starter has gone (CTest killed, say) must not live on.
function watchParent(pid, shutdown) {
    if (pid === undefined) {
        return;
    }
    setInterval(() => {
        if (!isRunning(pid)) {
            shutdown(`The process ${pid} that started the test peer has ended`, 0);
        }
    }, PARENT_POLL_MS).unref();
}

async function main() {
    const options = parseOptions(process.argv.slice(2));
    // node-opcua puts at most 1,000 notifications in one Publish response, whatever
    // the client asked; let the client's maxNotificationsPerPublish decide instead
    // (the benchmark's 10,000 items then arrive in one response per interval).
    Subscription.maxNotificationPerPublishHighLimit = MAX_NOTIFICATIONS_PER_PUBLISH;
    const certificateManager = makeCertificateManager(options);
    const server = makeServer(options, certificateManager);
    let space;
    const shutdown = makeShutdown(server, () => space && space.stop());
    await server.initialize();
    space = buildAddressSpace(server, {
        bulk: options.bulk,
        slowMs: options.slowMs,
        onTrustRejected: () => trustRejected(certificateManager),
        onShutdown: (reason, delayMs) => setImmediate(() => shutdown(reason, Math.max(0, delayMs)))
    });
    for (const signal of ["SIGTERM", "SIGINT"]) {
        process.on(signal, () => shutdown(`The test peer was stopped (${signal})`, STOP_DELAY_MS));
    }
    watchParent(options.exitWithPid, shutdown);
    await server.start();
    console.log(`READY ${server.getEndpointUrl()}`);
}

main().catch((error) => {
    console.error(`The test peer failed: ${error.stack || error}`);
    process.exit(1);
});
