// A small stand-in for the scripting objects of After Effects, after its published scripting guide: what the script for
// compositions asks, and no more. Runs in the script's own context, so that arrays and classes are the same ones.
"use strict";

var KeyframeInterpolationType = { LINEAR: 6612, BEZIER: 6613, HOLD: 6614 };
var PropertyValueType = { ThreeD_SPATIAL: 6613, ThreeD: 6614, TwoD_SPATIAL: 6615, TwoD: 6616, OneD: 6617, COLOR: 6618 };
var LightType = { PARALLEL: 4412, SPOT: 4413, POINT: 4414, AMBIENT: 4415 };
var AutoOrientType = { NO_AUTO_ORIENT: 4012, CAMERA_OR_POINT_OF_INTEREST: 4014 };

class CompItem {}
class FootageItem {}
class SolidSource {}
class FileSource {}
class PlaceholderSource {}
class AVLayer {}
class TextLayer extends AVLayer {}
class ShapeLayer extends AVLayer {}
class CameraLayer {}
class LightLayer {}

function make(type, members) { return Object.assign(new type(), members); }

var EASE_NONE = [{ speed: 0, influence: 16.666 }];

// A property with a constant, or with keys {time, value, ...}. `at(time)` gives the values between them.
class Property {
  constructor(matchName, propertyValueType, value, options = {}) {
    Object.assign(this, { matchName, propertyValueType, value, keys: [], expression: "", expressionEnabled: false,
      dimensionsSeparated: false }, options);
  }
  get numKeys() { return this.keys.length; }
  keyTime(i) { return this.keys[i - 1].time; }
  keyValue(i) { return this.keys[i - 1].value; }
  keyRoving(i) {
    if (this.propertyValueType !== PropertyValueType.ThreeD_SPATIAL) throw new Error("roving is for spatial properties");
    return Boolean(this.keys[i - 1].roving);
  }
  keyInInterpolationType(i) { return this.keys[i - 1].kindIn || KeyframeInterpolationType.LINEAR; }
  keyOutInterpolationType(i) { return this.keys[i - 1].kindOut || KeyframeInterpolationType.LINEAR; }
  keyInTemporalEase(i) { return this.keys[i - 1].easeIn || EASE_NONE; }
  keyOutTemporalEase(i) { return this.keys[i - 1].easeOut || EASE_NONE; }
  keyInSpatialTangent(i) { return this.keys[i - 1].tangentIn || [0, 0, 0]; }
  keyOutSpatialTangent(i) { return this.keys[i - 1].tangentOut || [0, 0, 0]; }
  valueAtTime(time, preExpression) {
    if (this.at) return this.at(time, preExpression);
    return this.keys.length ? this.keys[0].value : this.value;
  }
}

const PROPERTIES = {
  "ADBE Transform Group": [
    ["ADBE Anchor Point", "ThreeD_SPATIAL", [0, 0, 0]], ["ADBE Position", "ThreeD_SPATIAL", [0, 0, 0]],
    ["ADBE Position_0", "OneD", 0], ["ADBE Position_1", "OneD", 0], ["ADBE Position_2", "OneD", 0],
    ["ADBE Scale", "ThreeD", [100, 100, 100]], ["ADBE Orientation", "ThreeD_SPATIAL", [0, 0, 0]],
    ["ADBE Rotate X", "OneD", 0], ["ADBE Rotate Y", "OneD", 0], ["ADBE Rotate Z", "OneD", 0]],
  "ADBE Camera Options Group": [["ADBE Camera Zoom", "OneD", 1000], ["ADBE Camera Focus Distance", "OneD", 900]],
  "ADBE Light Options Group": [
    ["ADBE Light Intensity", "OneD", 100], ["ADBE Light Color", "COLOR", [1, 1, 1, 1]],
    ["ADBE Light Cone Angle", "OneD", 90], ["ADBE Light Cone Feather 2", "OneD", 50], ["ADBE Casts Shadows", "OneD", 0],
    ["ADBE Light Shadow Darkness", "OneD", 100]]
};

// A layer. `properties` holds what differs from the defaults, by match name: {value, keys, expression, at, ...}.
function makeLayer(type, members, properties = {}) {
  const isAV = AVLayer.prototype.isPrototypeOf(type.prototype) || type === AVLayer;
  const layer = make(type, Object.assign({ enabled: true, locked: false, parent: null, stretch: 100, isNameSet: true,
    nullLayer: false, threeDLayer: isAV ? false : undefined, autoOrient: AutoOrientType.NO_AUTO_ORIENT, source: null },
    members));
  layer.property = group => ({
    property: name => {
      const row = PROPERTIES[group].find(entry => entry[0] === name);
      return new Property(name, PropertyValueType[row[1]], row[2], properties[name]);
    }
  });
  return layer;
}

function makeComposition(members, layers) {
  layers.forEach((layer, i) => { layer.index = i + 1; });
  return make(CompItem, Object.assign({ width: 640, height: 360, pixelAspect: 1, frameRate: 25, duration: 2,
    workAreaStart: 0, workAreaDuration: 2, numLayers: layers.length, layer: i => layers[i - 1] }, members));
}

// ---- Files and dialogs: `session` tells what was asked for and shown.

var session = { path: "/tmp/shot.json", written: "", alerts: [], progress: [], closed: 0, full: false };

class File {
  constructor(path) {
    this.fsName = path;
    this.name = path.split(/[\\/]/).pop();
    this.exists = false;
    this.error = "";
  }
  static saveDialog() { return session.path && new File(session.path); }
  open() {
    if (session.full) this.error = "disk full";
    session.opened = this.fsName;
    return !session.full;
  }
  write(text) { session.written += text; }
  close() { return true; }
}

class Window {
  add() { return (this.bar = { value: 0, minvalue: 0, maxvalue: 100 }); }
  show() {}
  update() { session.progress.push(this.bar.value / this.bar.maxvalue); }
  close() { ++session.closed; }
}

function alert(text) { session.alerts.push(text); }
function confirm() { return false; }
var app = { project: { activeItem: null } };
