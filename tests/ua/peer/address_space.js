"use strict";
// The test peer's address space. Every node of namespace 1 is named by a string
// NodeId that spells its path (ns=1;s=Plant.Area1.FIC101.PV); README.md lists them
// all, and the C++ tests rely on that table, so change both together.

const {
    DataType,
    DataValue,
    StatusCode,
    StatusCodes,
    coerceLocalizedText,
    coerceNodeId,
    Variant,
    VariantArrayType,
    standardUnits
} = require("node-opcua");

const READ_ONLY = "CurrentRead";
const READ_WRITE = "CurrentRead | CurrentWrite";
const TICK_MS = 100;
const LARGE_FOLDER_SIZE = 3000;

// One variable of each type in Static (read-only) and Memory (writable).
const TYPED_VALUES = [
    ["Boolean", DataType.Boolean, true],
    ["SByte", DataType.SByte, -100],
    ["Byte", DataType.Byte, 200],
    ["Int16", DataType.Int16, -12345],
    ["UInt16", DataType.UInt16, 54321],
    ["Int32", DataType.Int32, -123456789],
    ["UInt32", DataType.UInt32, 3123456789],
    ["Int64", DataType.Int64, "-1234567890123"],
    ["UInt64", DataType.UInt64, "12345678901234567890"],
    ["Float", DataType.Float, 3.25],
    ["Double", DataType.Double, 2.718281828459045],
    ["String", DataType.String, "Flow ≥ 10 m³/h"],
    ["DateTime", DataType.DateTime, new Date(Date.UTC(2024, 2, 15, 12, 34, 56, 789))],
    ["LocalizedText", DataType.LocalizedText, coerceLocalizedText({ locale: "de-DE", text: "Pumpe läuft" })],
    ["NodeId", DataType.NodeId, coerceNodeId("ns=1;s=Plant.Area1.FIC101")],
    ["Guid", DataType.Guid, "72962B91-FA75-4AE6-8D28-B404DC7DAF63"],
    ["ByteString", DataType.ByteString, Buffer.from([0xde, 0xad, 0xbe, 0xef])],
    ["BooleanArray", DataType.Boolean, [true, false, true]],
    ["Int16Array", DataType.Int16, [-1, 0, 32767]],
    ["Int32Array", DataType.Int32, [1, -2, 2147483647]],
    ["FloatArray", DataType.Float, [0.5, -1.25, 1024]],
    ["DoubleArray", DataType.Double, [1.5, -2.25, 1e300]],
    ["StringArray", DataType.String, ["alpha", "Beta", "γ"]],
    ["EmptyDoubleArray", DataType.Double, []]
];

// Fixed values with a status other than Good; the name is the status code's name.
const QUALITY_VALUE = 12.5;
const QUALITIES = [
    ["Good", StatusCodes.Good],
    ["Good_LocalOverride", StatusCodes.GoodLocalOverride],
    ["Good_LimitHigh", StatusCode.makeStatusCode(StatusCodes.Good, "LimitHigh")],
    ["Uncertain", StatusCodes.Uncertain],
    ["Uncertain_LastUsableValue", StatusCodes.UncertainLastUsableValue],
    ["Uncertain_SensorNotAccurate", StatusCodes.UncertainSensorNotAccurate],
    ["Uncertain_SensorNotAccurate_LimitLow",
        StatusCode.makeStatusCode(StatusCodes.UncertainSensorNotAccurate, "LimitLow")],
    ["Uncertain_EngineeringUnitsExceeded", StatusCodes.UncertainEngineeringUnitsExceeded],
    ["Uncertain_SubNormal", StatusCodes.UncertainSubNormal],
    ["Bad", StatusCodes.Bad],
    ["Bad_ConfigurationError", StatusCodes.BadConfigurationError],
    ["Bad_NotConnected", StatusCodes.BadNotConnected],
    ["Bad_DeviceFailure", StatusCodes.BadDeviceFailure],
    ["Bad_SensorFailure", StatusCodes.BadSensorFailure],
    ["Bad_SensorFailure_LimitConstant",
        StatusCode.makeStatusCode(StatusCodes.BadSensorFailure, "LimitConstant")],
    ["Bad_NoCommunication", StatusCodes.BadNoCommunication],
    ["Bad_OutOfService", StatusCodes.BadOutOfService],
    ["Bad_WaitingForInitialData", StatusCodes.BadWaitingForInitialData]
];

function isArrayValue(value) {
    return Array.isArray(value);
}

function makeVariant(dataType, value) {
    const arrayType = isArrayValue(value) ? VariantArrayType.Array : VariantArrayType.Scalar;
    return new Variant({ dataType, arrayType, value });
}

function addFolder(ns, parent, id) {
    const name = id.split(".").pop();
    return ns.addFolder(parent, { nodeId: `s=${id}`, browseName: name });
}

// A variable that holds what is written to it (or only what it was given).
function addMemoryVariable(ns, folder, id, dataType, value, accessLevel) {
    const variable = ns.addVariable({
        organizedBy: folder,
        nodeId: `s=${id}`,
        browseName: id.split(".").pop(),
        dataType,
        valueRank: isArrayValue(value) ? 1 : -1,
        arrayDimensions: isArrayValue(value) ? [0] : null,
        accessLevel,
        userAccessLevel: accessLevel
    });
    variable.setValueFromSource(makeVariant(dataType, value));
    return variable;
}

function addTypedFolders(ns, objects) {
    const staticFolder = addFolder(ns, objects, "Static");
    const memoryFolder = addFolder(ns, objects, "Memory");
    for (const [name, dataType, value] of TYPED_VALUES) {
        addMemoryVariable(ns, staticFolder, `Static.${name}`, dataType, value, READ_ONLY);
        addMemoryVariable(ns, memoryFolder, `Memory.${name}`, dataType, value, READ_WRITE);
    }
}

function addAnalogItem(ns, folder, id, options) {
    const accessLevel = options.writable ? READ_WRITE : READ_ONLY;
    // node-opcua adds an InstrumentRange property whenever the key is present.
    const instrument = options.instrumentRange ? { instrumentRange: options.instrumentRange } : {};
    const item = ns.addAnalogDataItem({
        organizedBy: folder,
        nodeId: `s=${id}`,
        browseName: id.split(".").pop(),
        dataType: "Double",
        engineeringUnitsRange: options.euRange,
        engineeringUnits: options.units,
        accessLevel,
        userAccessLevel: accessLevel,
        ...instrument
    });
    item.setValueFromSource(makeVariant(DataType.Double, options.value));
    return item;
}

function addFlowLoop(ns, area) {
    const loop = addFolder(ns, area, "Plant.Area1.FIC101");
    addAnalogItem(ns, loop, "Plant.Area1.FIC101.PV", {
        value: 42.5, euRange: { low: 0, high: 200 }, units: standardUnits.cubic_metre_per_hour
    });
    addMemoryVariable(ns, loop, "Plant.Area1.FIC101.SP", DataType.Double, 50, READ_WRITE);
    addAnalogItem(ns, loop, "Plant.Area1.FIC101.OUT", {
        value: 37.5,
        euRange: { low: 0, high: 100 },
        instrumentRange: { low: 0, high: 100 },
        units: standardUnits.percent,
        writable: true
    });
    addMemoryVariable(ns, loop, "Plant.Area1.FIC101.Mode", DataType.String, "AUTO", READ_WRITE);
}

function addTemperatureLoop(ns, area) {
    const loop = addFolder(ns, area, "Plant.Area1.TIC102");
    addAnalogItem(ns, loop, "Plant.Area1.TIC102.PV", {
        value: 71.25,
        euRange: { low: 0, high: 150 },
        instrumentRange: { low: -50, high: 250 },
        units: standardUnits.degree_celsius
    });
    addMemoryVariable(ns, loop, "Plant.Area1.TIC102.SP", DataType.Double, 70, READ_WRITE);
}

function addPump(ns, plant) {
    const area = addFolder(ns, plant, "Plant.Area2");
    const unit = addFolder(ns, area, "Plant.Area2.Unit1");
    const pump = addFolder(ns, unit, "Plant.Area2.Unit1.Pump1");
    const prefix = "Plant.Area2.Unit1.Pump1";
    addMemoryVariable(ns, pump, `${prefix}.Running`, DataType.Boolean, true, READ_ONLY);
    addMemoryVariable(ns, pump, `${prefix}.Speed`, DataType.Float, 1450.5, READ_ONLY);
    addMemoryVariable(ns, pump, `${prefix}.Starts`, DataType.Int32, 17, READ_ONLY);
    addMemoryVariable(ns, pump, `${prefix}.LastStart`, DataType.DateTime,
        new Date(Date.UTC(2024, 0, 2, 6, 0, 0)), READ_ONLY);
}

function addPlant(ns, objects) {
    const plant = addFolder(ns, objects, "Plant");
    const area = addFolder(ns, plant, "Plant.Area1");
    addFlowLoop(ns, area);
    addTemperatureLoop(ns, area);
    addPump(ns, plant);
}

function addQualityFolder(ns, objects) {
    const folder = addFolder(ns, objects, "Quality");
    for (const [name, statusCode] of QUALITIES) {
        const variable = addMemoryVariable(ns, folder, `Quality.${name}`, DataType.Double,
            QUALITY_VALUE, READ_ONLY);
        variable.setValueFromSource(makeVariant(DataType.Double, QUALITY_VALUE), statusCode);
    }
}

// Values that change every tick, pushed by one timer so that both Read and
// monitored items see them. Returns the function that stops the timer.
function addDynamicFolder(ns, objects, startTime) {
    const folder = addFolder(ns, objects, "Dynamic");
    const counter = addMemoryVariable(ns, folder, "Dynamic.Counter", DataType.Int32, 0, READ_ONLY);
    const sine = addMemoryVariable(ns, folder, "Dynamic.Sine", DataType.Double, 0, READ_ONLY);
    const timer = setInterval(() => {
        const ticks = Math.floor((Date.now() - startTime) / TICK_MS);
        counter.setValueFromSource(makeVariant(DataType.Int32, ticks | 0));
        sine.setValueFromSource(makeVariant(DataType.Double, Math.sin(ticks * Math.PI / 50)));
    }, TICK_MS);
    return () => clearInterval(timer);
}

// A device read (Read with maxAge 0) takes slowMs and counts the device reads;
// a cache read answers at once with the last value read from the device.
function addSlowFolder(ns, objects, slowMs) {
    const folder = addFolder(ns, objects, "Slow");
    let deviceReads = 0;
    const variable = ns.addVariable({
        organizedBy: folder,
        nodeId: "s=Slow.Device",
        browseName: "Device",
        dataType: "Double",
        accessLevel: READ_ONLY,
        userAccessLevel: READ_ONLY,
        value: {
            refreshFunc(callback) {
                setTimeout(() => {
                    deviceReads += 1;
                    const value = makeVariant(DataType.Double, deviceReads);
                    callback(null, new DataValue({ value, sourceTimestamp: new Date() }));
                }, slowMs);
            }
        }
    });
    variable.setValueFromSource(makeVariant(DataType.Double, 0));
}

function addLargeFolder(ns, objects) {
    const folder = addFolder(ns, objects, "Large");
    for (let i = 0; i < LARGE_FOLDER_SIZE; ++i) {
        addMemoryVariable(ns, folder, `Large.V${i}`, DataType.Int32, i, READ_ONLY);
    }
}

// Benchmark load: each value is computed when sampled, so an unmonitored bulk
// folder costs nothing.
function addBulkFolder(ns, objects, count, startTime) {
    if (count <= 0) {
        return;
    }
    const folder = addFolder(ns, objects, "Bulk");
    for (let i = 0; i < count; ++i) {
        ns.addVariable({
            organizedBy: folder,
            nodeId: `s=Bulk.V${i}`,
            browseName: `V${i}`,
            dataType: "Double",
            accessLevel: READ_ONLY,
            userAccessLevel: READ_ONLY,
            minimumSamplingInterval: TICK_MS,
            value: {
                get: () => makeVariant(DataType.Double, Math.floor((Date.now() - startTime) / TICK_MS) + i)
            }
        });
    }
}

// Control.Shutdown: writing true calls onShutdown(reason, delayMs) with the
// values of Control.ShutdownReason and Control.ShutdownDelay.
// Control.TrustRejected: writing true awaits onTrustRejected() before the
// Write is answered (the client certificates the peer refused become trusted).
// Control.SessionCount: the sessions open now, so a test can see that a client
// it ended left none behind.
function addControlFolder(ns, objects, onShutdown, onTrustRejected, sessionCount) {
    const folder = addFolder(ns, objects, "Control");
    ns.addVariable({
        organizedBy: folder,
        nodeId: "s=Control.SessionCount",
        browseName: "SessionCount",
        dataType: "Int32",
        accessLevel: READ_ONLY,
        userAccessLevel: READ_ONLY,
        value: { get: () => makeVariant(DataType.Int32, sessionCount()) }
    });
    ns.addVariable({
        organizedBy: folder,
        nodeId: "s=Control.TrustRejected",
        browseName: "TrustRejected",
        dataType: "Boolean",
        minimumSamplingInterval: 1000,
        accessLevel: READ_WRITE,
        userAccessLevel: READ_WRITE,
        value: {
            get: () => makeVariant(DataType.Boolean, false),
            set: async (variant) => {
                if (variant.value === true) {
                    await onTrustRejected();
                }
                return StatusCodes.Good;
            }
        }
    });
    const reason = addMemoryVariable(ns, folder, "Control.ShutdownReason", DataType.String,
        "The test peer was asked to shut down", READ_WRITE);
    const delay = addMemoryVariable(ns, folder, "Control.ShutdownDelay", DataType.Int32, 1000,
        READ_WRITE);
    const shutdown = addMemoryVariable(ns, folder, "Control.Shutdown", DataType.Boolean, false,
        READ_WRITE);
    shutdown.on("value_changed", (dataValue) => {
        if (dataValue.value.value === true) {
            onShutdown(reason.readValue().value.value, delay.readValue().value.value);
        }
    });
}

// Adds every node to the server's own namespace; the result's stop() ends the
// timers of the changing values.
function buildAddressSpace(server, options) {
    const addressSpace = server.engine.addressSpace;
    const ns = addressSpace.getOwnNamespace();
    const objects = addressSpace.rootFolder.objects;
    const startTime = Date.now();
    addPlant(ns, objects);
    addTypedFolders(ns, objects);
    addQualityFolder(ns, objects);
    const stopDynamic = addDynamicFolder(ns, objects, startTime);
    addSlowFolder(ns, objects, options.slowMs);
    addLargeFolder(ns, objects);
    addBulkFolder(ns, objects, options.bulk, startTime);
    addControlFolder(ns, objects, options.onShutdown, options.onTrustRejected,
        () => server.engine.currentSessionCount);
    return { stop: stopDynamic };
}

module.exports = { buildAddressSpace };
