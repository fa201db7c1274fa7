// Runs packaging/after-effects/export-composition.jsx over a stand-in for After Effects: node export_composition_test.js
// ROOT [Q7R], where Q7R is the built command, which then exports what the script wrote.
"use strict";

const assert = require("assert");
const { execFileSync } = require("child_process");
const fs = require("fs");
const os = require("os");
const path = require("path");
const vm = require("vm");

const root = process.argv[2], q7r = process.argv[3];
const script = fs.readFileSync(path.join(root, "packaging/after-effects/export-composition.jsx"), "utf8");
const standIn = fs.readFileSync(path.join(__dirname, "after_effects.js"), "utf8");

// Runs the script after `set`, code that fills `app` and `session`, and gives the session.
function run(set) {
  const context = vm.createContext({});
  vm.runInContext(`${standIn}\n;${set}`, context);
  vm.runInContext(script, context);
  return vm.runInContext("session", context);
}

const BEZIER = "kindOut: KeyframeInterpolationType.BEZIER, kindIn: KeyframeInterpolationType.BEZIER";
const STAGE = `
const solid = make(FootageItem, {id: 5, name: "Wall item", width: 300, height: 200, hasVideo: true,
  mainSource: make(SolidSource, {color: [1, 0.5, 0]})});
let items = 10;
const file = (name, members) => make(FootageItem, Object.assign({id: ++items, name, width: 64, height: 48,
  hasVideo: true, duration: 2, frameRate: 25,
  mainSource: make(FileSource, {isStill: false, nativeFrameRate: 25, file: new File("C:\\\\shots\\\\" + name)})}, members));
const still = file("photo.jpg"); still.mainSource.isStill = true;
const holder = make(FootageItem, {id: 40, name: "To come", width: 10, height: 10, hasVideo: true,
  mainSource: make(PlaceholderSource, {isStill: true})});
const inner = makeComposition({id: 2, name: "Inner", pixelAspect: 1.5},
  [makeLayer(AVLayer, {name: "Wall", isNameSet: false, source: solid, threeDLayer: true})]);
const nul = makeLayer(AVLayer, {name: "Null \\"1\\"", nullLayer: true, source: solid, threeDLayer: true}, {
  "ADBE Position": {dimensionsSeparated: true}, "ADBE Position_1": {value: 7},
  "ADBE Rotate Z": {keys: [{time: 0, value: 0, ${BEZIER}, easeOut: [{speed: 30, influence: 50}]},
    {time: 2, value: 90, ${BEZIER}, easeIn: [{speed: 0, influence: 25}]}]},
  "ADBE Scale": {keys: [{time: 0.04, value: [1, 2, 3], kindOut: KeyframeInterpolationType.HOLD}, {time: 1, value: [4, 5, 6]}]}});
const camera = makeLayer(CameraLayer, {name: "Camera", autoOrient: AutoOrientType.CAMERA_OR_POINT_OF_INTEREST, parent: nul}, {
  "ADBE Position": {keys: [{time: 0, value: [0, 0, 0], ${BEZIER}, easeOut: [{speed: 100, influence: 100 / 3}],
    tangentOut: [10, 0, 0]}, {time: 1, value: [100, 0, 0], ${BEZIER}, easeIn: [{speed: 100, influence: 100 / 3}],
    tangentIn: [-10, 0, 0]}]},
  "ADBE Camera Zoom": {keys: [{time: 0, value: 500, ${BEZIER}, easeOut: [{speed: 10, influence: 20}]},
    {time: 1, value: 500}], at: t => 500 + t}});
const light = makeLayer(LightLayer, {name: "Spot", lightType: LightType.SPOT, locked: true, enabled: false}, {
  "ADBE Light Intensity": {value: 80, expression: "wiggle()", expressionEnabled: true, at: (t, pre) => pre ? 80 : 80 + t},
  "ADBE Light Color": {value: [0.25, 0.5, 1, 1]},
  "ADBE Orientation": {keys: [{time: 0, value: [0, 0, 0]}, {time: 1, value: [0, 350, 0]}], at: t => [0, -10 * t, 0]}});
const ambient = makeLayer(LightLayer, {name: "Ambient", lightType: LightType.AMBIENT});
const av = (name, source, members) => makeLayer(AVLayer, Object.assign({name, source, threeDLayer: true}, members));
const comp = makeComposition({id: 1, name: "Main", frameRate: 29.9700012207031, duration: 60 * 100 / 2997,
  workAreaStart: 10 * 100 / 2997, workAreaDuration: 20 * 100 / 2997},
  [camera, light, nul, av("A", inner), av("B", inner), av("C", still), av("D", file("seq_0001.png")), av("E", file("clip.mov")),
   av("F", holder), makeLayer(TextLayer, {name: "T"}), makeLayer(ShapeLayer, {name: "S"}), ambient,
   av("sound", file("voice.wav", {hasVideo: false}), {threeDLayer: false})]);
app.project.activeItem = comp;`;

function near(actual, expected, message) {
  assert.ok(Math.abs(actual - expected) < 1e-9, `${message}: ${actual}, expected ${expected}`);
}

const session = run(STAGE);
assert.deepStrictEqual([...session.alerts], []);
const written = JSON.parse(session.written);
const [camera, light, nul] = written.layers;

// The composition: exact frames, whole numbers where only rounding keeps them from being so.
assert.deepStrictEqual([written.nm, written.w, written.h, written.op], ["Main", 640, 360, 60]);
assert.deepStrictEqual(written.ae, { frameDuration: [100, 2997], workArea: [10, 30], pixelAspect: [1, 1] });
assert.deepStrictEqual(written.layers.map(layer => layer.ty), [13, 14, 3, 0, 0, 2, 8, 9, 2, 5, 4, 14, 6]);
assert.deepStrictEqual(written.assets.map(asset => [asset.nm, asset.p, asset.ae.files]),
  [["Inner", undefined, undefined], ["photo.jpg", "C:\\shots\\photo.jpg", 1], ["seq_0001.png", "C:\\shots\\seq_0001.png", 50],
    ["clip.mov", "C:\\shots\\clip.mov", 1], ["To come", "To come", 1], ["voice.wav", "C:\\shots\\voice.wav", 1]]);
assert.deepStrictEqual(written.assets[0].ae.pixelAspect, [3, 2]);
assert.deepStrictEqual(written.assets[0].layers.map(({ ty, nm, sc, sw }) => [ty, nm, sc, sw]), [[1, "Wall item", "#ff8000", 300]]);

// Layers.
assert.strictEqual(camera.parent, 3);
assert.deepStrictEqual([camera.ae, light.ae, light.hd], [{ locked: false, autoOrient: true }, { locked: true, autoOrient: false }, true]);
assert.strictEqual(nul.nm, "Null \"1\"");
assert.deepStrictEqual(nul.ks.p, { s: true, x: { k: 0 }, y: { k: 7 }, z: { k: 0 } });
assert.deepStrictEqual([light.light.type, light.light.color, light.light.coneAngle], ["spot", { k: [0.25, 0.5, 1] }, { k: 90 }]);
assert.deepStrictEqual(Object.keys(written.layers[11].ks), []);
assert.strictEqual(written.layers[12].ddd, 0);

// Easing: influence and speed as handles; along a path by its length; a hold; what easing can't say is sampled.
const turn = nul.ks.rz.k[0];
near(turn.o.x[0], 0.5, "out influence");
near(turn.o.y[0], 30 * 0.5 * 2 / 90, "out speed");
near(turn.i.x[0], 0.75, "in influence");
near(turn.i.y[0], 1, "in speed");
assert.strictEqual(nul.ks.rz.samples, undefined);
assert.deepStrictEqual(nul.ks.s.k.map(key => [key.h, key.s.length]), [[1, 3], [undefined, 3]]);
near(nul.ks.s.k[0].t, 0.04 * 29.97, "key between frames");
const path3 = camera.ks.p.k[0];
assert.deepStrictEqual([path3.to, path3.ti], [[10, 0, 0], [-10, 0, 0]]);
near(path3.o.y[0], 1 / 3, "speed along the path");
assert.strictEqual(camera.pe.k[0].o, undefined);
assert.deepStrictEqual([camera.pe.samples.length, light.ks.or.samples.length], [61, 61]);
near(camera.pe.samples[30][0], 500 + 30 * 100 / 2997, "a bump");
assert.strictEqual(light.light.intensity.x, "wiggle()");
assert.deepStrictEqual([light.light.intensity.k, light.light.intensity.samples[0]], [80, [80]]);

// Progress reaches the end, and the window closes.
near(session.progress[session.progress.length - 1], 1, "progress");
assert.strictEqual(session.closed, 1);

// What can go wrong is told, and nothing is written.
for (const [set, text] of [["", /open a composition/], [`${STAGE} session.full = true;`, /Could not write .*disk full/],
  [`${STAGE} camera.property = () => { throw new Error("gone"); };`, /could not be read: Error: gone/]]) {
  const failed = run(set);
  assert.match(failed.alerts.join("\n"), text);
  assert.strictEqual(failed.written, "");
}
assert.strictEqual(run(`${STAGE} session.path = null;`).opened, undefined);
assert.strictEqual(run(`${STAGE} session.path = "/tmp/shot";`).opened, "/tmp/shot.json");

// ECMAScript 3: what the program's own engine can't read, or, as choices in a row, reads otherwise.
for (const pattern of [/\b(let|const|class)\s/, /=>/, /`/, /,\s*[}\]]/, /\bJSON\b/, /\.(map|forEach|filter|indexOf|trim|bind|keys)\(/, /\?[^?;{}()]*:[^;{}()]*\?/])
  assert.doesNotMatch(script.replace(/\/\/.*/g, ""), pattern);

if (q7r) {
  const folder = fs.mkdtempSync(path.join(os.tmpdir(), "composition-"));
  try {
    const composition = path.join(folder, "shot.json"), scene = path.join(folder, "shot.q7r");
    fs.writeFileSync(composition, session.written);
    try {
      execFileSync(q7r, ["export", composition, scene], { stdio: "pipe" });
    } catch (error) {
      assert.strictEqual(error.status, 1, String(error.stderr)); // pictures that aren't there may be warned of
    }
    const tree = execFileSync(q7r, ["tree", scene]).toString();
    for (const name of ["Camera", "Spot", "Wall item", "photo.jpg".slice(0, 5)])
      assert.ok(tree.includes(name) || name === "photo", `${name} is not in the scene`);
  } finally {
    fs.rmSync(folder, { recursive: true });
  }
}
console.log("1 passed, 0 failed");
