#!/usr/bin/env node
"use strict";
// Checks the peer with node-opcua's own client, as the C++ tests will meet it:
// the values and statuses README.md promises, writes, BrowseNext, the device
// read, a changing value, token renewal and the anchor client's report line.
// Expects the fixture of tests/ua/peer/CMakeLists.txt (--token-lifetime 1000
// --slow-ms 300 --bulk 20).

const assert = require("node:assert/strict");
const path = require("node:path");
const { execFile } = require("node:child_process");
const {
    AttributeIds,
    BrowseDirection,
    DataType,
    StatusCodes,
    TimestampsToReturn,
    Variant,
    VariantArrayType,
    makeBrowsePath
} = require("node-opcua");
const { endpointUrl, connect, waitFor, main } = require("./smoke_support");

const MAX_AGE_CACHED = 0x7fffffff;

// Values as README.md lists them, in plain JavaScript form.
const STATIC_VALUES = {
    Boolean: true,
    Int16: -12345,
    UInt32: 3123456789,
    Int64: "-1234567890123",
    UInt64: "12345678901234567890",
    Float: 3.25,
    Double: 2.718281828459045,
    String: "Flow ≥ 10 m³/h",
    DateTime: "2024-03-15T12:34:56.789Z",
    LocalizedText: "de-DE|Pumpe läuft",
    NodeId: "ns=1;s=Plant.Area1.FIC101",
    ByteString: "deadbeef",
    Int32Array: [1, -2, 2147483647],
    FloatArray: [0.5, -1.25, 1024],
    StringArray: ["alpha", "Beta", "γ"],
    EmptyDoubleArray: []
};

const QUALITY_CODES = {
    "Good_LimitHigh": 0x00000200,
    "Uncertain_LastUsableValue": 0x40900000,
    "Uncertain_SensorNotAccurate": 0x40930000,
    "Uncertain_SensorNotAccurate_LimitLow": 0x40930100,
    "Bad_SensorFailure": 0x808c0000,
    "Bad_NoCommunication": 0x80310000,
    "Bad_SensorFailure_LimitConstant": 0x808c0300
};

function toInt64Text([high, low], signed) {
    const value = (BigInt(high) << 32n) | BigInt(low);
    return (signed ? BigInt.asIntN(64, value) : value).toString();
}

function plain(variant) {
    const value = variant.value;
    switch (variant.dataType) {
    case DataType.Int64: return toInt64Text(value, true);
    case DataType.UInt64: return toInt64Text(value, false);
    case DataType.DateTime: return value.toISOString();
    case DataType.LocalizedText: return `${value.locale}|${value.text}`;
    case DataType.NodeId: return value.toString();
    case DataType.ByteString: return value.toString("hex");
    default: return ArrayBuffer.isView(value) ? Array.from(value) : value;
    }
}

function valueOf(nodeId) {
    return { nodeId, attributeId: AttributeIds.Value };
}

async function checkStaticValues({ session }) {
    const names = Object.keys(STATIC_VALUES);
    const results = await session.read(names.map((name) => valueOf(`ns=1;s=Static.${name}`)),
        MAX_AGE_CACHED);
    names.forEach((name, i) => {
        assert.equal(results[i].statusCode.value, 0, `Static.${name} status`);
        assert.deepEqual(plain(results[i].value), STATIC_VALUES[name], `Static.${name}`);
    });
}

// One write of each type the automation interface carries; arrays change length.
const WRITES = [
    ["Memory.Boolean", DataType.Boolean, false],
    ["Memory.Int16", DataType.Int16, 321],
    ["Memory.Int32", DataType.Int32, -7],
    ["Memory.Float", DataType.Float, -0.75],
    ["Memory.Double", DataType.Double, 1e-300],
    ["Memory.String", DataType.String, "written ✓"],
    ["Memory.DateTime", DataType.DateTime, new Date("2025-06-30T23:59:59.125Z")],
    ["Memory.Int32Array", DataType.Int32, [4, 5, 6, 7]],
    ["Memory.DoubleArray", DataType.Double, [0.25]],
    ["Memory.StringArray", DataType.String, ["x", "", "z"]],
    ["Plant.Area1.FIC101.SP", DataType.Double, 55.5]
];

function plainWritten(value) {
    return value instanceof Date ? value.toISOString() : value;
}

function writeValue(nodeId, dataType, value) {
    const arrayType = Array.isArray(value) ? VariantArrayType.Array : VariantArrayType.Scalar;
    return { ...valueOf(nodeId), value: { value: new Variant({ dataType, arrayType, value }) } };
}

async function checkMemoryWrites({ session }) {
    const statuses = await session.write(WRITES.map(([id, type, value]) =>
        writeValue(`ns=1;s=${id}`, type, value)));
    statuses.forEach((status, i) => assert.equal(status.value, 0, `write ${WRITES[i][0]}`));
    const results = await session.read(WRITES.map(([id]) => valueOf(`ns=1;s=${id}`)));
    results.forEach((result, i) =>
        assert.deepEqual(plain(result.value), plainWritten(WRITES[i][2]), WRITES[i][0]));
}

async function checkRefusedWrites({ session }) {
    const cases = [
        [writeValue("ns=1;s=Static.Int32", DataType.Int32, 1), StatusCodes.BadNotWritable],
        [writeValue("ns=1;s=Plant.Area1.FIC101.PV", DataType.Double, 1), StatusCodes.BadNotWritable],
        [writeValue("ns=1;s=Memory.Int32", DataType.Double, 1), StatusCodes.BadTypeMismatch],
        [writeValue("ns=1;s=Plant.Area1.FIC101.OUT", DataType.Double, 150), StatusCodes.BadOutOfRange],
        [writeValue("ns=1;s=No.Such.Node", DataType.Double, 1), StatusCodes.BadNodeIdUnknown]
    ];
    const statuses = await session.write(cases.map(([write]) => write));
    statuses.forEach((status, i) => assert.equal(status.name, cases[i][1].name, cases[i][0].nodeId));
}

async function checkQualities({ session }) {
    const names = Object.keys(QUALITY_CODES);
    const results = await session.read(names.map((name) => valueOf(`ns=1;s=Quality.${name}`)));
    names.forEach((name, i) => {
        assert.equal(results[i].statusCode.value, QUALITY_CODES[name], `Quality.${name}`);
        assert.equal(results[i].value.value, 12.5, `Quality.${name} value`);
    });
}

async function checkAnalogItem({ session }) {
    const paths = ["/0:EURange", "/0:EngineeringUnits"].map((relative) =>
        makeBrowsePath("ns=1;s=Plant.Area1.FIC101.PV", relative));
    const targets = await session.translateBrowsePath(paths);
    const ids = targets.map((target) => target.targets[0].targetId);
    const [range, units] = await session.read(ids.map(valueOf));
    assert.deepEqual([range.value.value.low, range.value.value.high], [0, 200]);
    assert.equal(units.value.value.displayName.text, "m³/h");
    const children = await browseChildren(session, "ns=1;s=Plant.Area1.FIC101.PV");
    assert.deepEqual(children.references.map((ref) => ref.browseName.name).sort(),
        ["EURange", "EngineeringUnits"]);
}

async function checkTree({ session }) {
    const path = makeBrowsePath("i=85", "/1:Plant/1:Area2/1:Unit1/1:Pump1/1:Speed");
    const result = await session.translateBrowsePath(path);
    assert.equal(result.targets[0].targetId.toString(), "ns=1;s=Plant.Area2.Unit1.Pump1.Speed");
}

function browseChildren(session, nodeId) {
    return session.browse({
        nodeId,
        browseDirection: BrowseDirection.Forward,
        referenceTypeId: "HierarchicalReferences",
        includeSubtypes: true,
        nodeClassMask: 0,
        resultMask: 63
    });
}

async function checkLargeFolder({ session }) {
    session.requestedMaxReferencesPerNode = 1000;
    let result = await browseChildren(session, "ns=1;s=Large");
    const names = result.references.map((ref) => ref.browseName.name);
    let pages = 1;
    while (result.continuationPoint) {
        result = await session.browseNext(result.continuationPoint, false);
        names.push(...result.references.map((ref) => ref.browseName.name));
        pages += 1;
    }
    assert.equal(pages, 3);
    assert.equal(new Set(names.filter((name) => /^V\d+$/.test(name))).size, 3000);
    const first = await browseChildren(session, "ns=1;s=Large");
    const released = await session.browseNext(first.continuationPoint, true);
    assert.equal(released.statusCode.value, 0);
}

async function checkDeviceRead({ session }) {
    const cached = await session.read(valueOf("ns=1;s=Slow.Device"), MAX_AGE_CACHED);
    const device = await session.read(valueOf("ns=1;s=Slow.Device"), 0);
    assert.equal(device.value.value, cached.value.value + 1);
}

async function checkChangingValue({ session }) {
    const subscription = await session.createSubscription2({
        requestedPublishingInterval: 100,
        requestedMaxKeepAliveCount: 10,
        requestedLifetimeCount: 60,
        publishingEnabled: true
    });
    const item = await subscription.monitor(valueOf("ns=1;s=Dynamic.Counter"),
        { samplingInterval: 100, queueSize: 1 }, TimestampsToReturn.Both);
    const seen = new Set();
    await waitFor(item, "changed", (dataValue) => seen.add(dataValue.value.value).size >= 3, 5000,
        "three counter values");
    await subscription.terminate();
}

async function checkTokenRenewal(context) {
    if (context.renewals === 0) {
        await waitFor(context.client, "security_token_renewed", () => true, 5000, "a token renewal");
    }
}

function runAnchor(url) {
    const script = path.join(__dirname, "anchor_client.js");
    return new Promise((resolve, reject) => {
        const args = [script, "--url", url, "--count", "20", "--seconds", "0.5", "--warmup", "0"];
        execFile(process.execPath, args, { timeout: 120000 },
            (error, stdout) => (error ? reject(error) : resolve(stdout)));
    });
}

async function checkAnchorClient({ anchor }) {
    const line = (await anchor).split("\n").find((text) => text.startsWith("ANCHOR "));
    assert.ok(line, "no ANCHOR line");
    const fields = Object.fromEntries(line.split(" ").slice(1).map((pair) => pair.split("=")));
    assert.equal(fields.items, "20");
    assert.ok(Number(fields.values_per_s) > 0, line);
    assert.ok(Number(fields.cpu_ms) >= 0, line);
}

async function setUp() {
    const url = endpointUrl();
    const context = { url, renewals: 0 };
    // The client asks for a long token lifetime; --token-lifetime makes it short.
    Object.assign(context, await connect(url, { defaultSecureTokenLifetime: 3600000 }));
    context.client.on("security_token_renewed", () => { context.renewals += 1; });
    // The anchor client starts slowly; it runs while the other checks do.
    context.anchor = runAnchor(url);
    context.anchor.catch(() => {});
    return context;
}

async function tearDown({ client, session }) {
    await session.close();
    await client.disconnect();
}

main("peer smoke test", setUp, [
    ["typed values of Static", checkStaticValues],
    ["writes to Memory read back", checkMemoryWrites],
    ["refused writes say why", checkRefusedWrites],
    ["uncertain and bad statuses", checkQualities],
    ["analog item has EURange and EngineeringUnits", checkAnalogItem],
    ["folder tree reaches a leaf", checkTree],
    ["large folder needs BrowseNext", checkLargeFolder],
    ["device read goes to the device", checkDeviceRead],
    ["counter changes every 100 ms", checkChangingValue],
    ["security token is renewed", checkTokenRenewal],
    ["anchor client reports its line", checkAnchorClient]
], tearDown);
