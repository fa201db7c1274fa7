// Writes the active composition as a composition file (.json), which `q7r export` turns into a scene: for those who
// can't install the plug-in. In After Effects, on macOS and Windows: File > Scripts > Run Script File.
//
// What scripts can't ask is left to the defaults of the composition file: the film size and the type of a camera.
// Nothing in the project is changed. ExtendScript is ECMAScript 3: no let, no arrow functions, no JSON object. Of
// choices (a ? b : c) it takes several in a row the wrong way round, unless parentheses tell.

(function exportComposition() {
  "use strict";

  var TITLE = "Export Composition";

  // ---- Text

  var ESCAPES = { "\"": "\\\"", "\\": "\\\\", "\n": "\\n", "\r": "\\r", "\t": "\\t" };

  function quoted(text) {
    return "\"" + String(text).replace(/["\\\u0000-\u001f\u2028\u2029]/g, function (c) {
      return ESCAPES[c] || "\\u" + ("0000" + c.charCodeAt(0).toString(16)).slice(-4);
    }) + "\"";
  }

  // Writes a value to an open file, piece by piece: samples of a long composition are too much for one text.
  function write(file, value) {
    var key, i, first = true;
    if (value === null || value === undefined || (typeof value === "number" && !isFinite(value))) {
      file.write("null");
    } else if (typeof value === "number" || typeof value === "boolean") {
      file.write(String(value));
    } else if (value instanceof Array) {
      file.write("[");
      for (i = 0; i < value.length; ++i) {
        if (i > 0) {
          file.write(",");
        }
        write(file, value[i]);
      }
      file.write("]");
    } else if (typeof value === "object") {
      file.write("{");
      for (key in value) {
        if (value.hasOwnProperty(key) && value[key] !== undefined) {
          file.write((first ? "" : ",") + quoted(key) + ":");
          write(file, value[key]);
          first = false;
        }
      }
      file.write("}");
    } else {
      file.write(quoted(value));
    }
  }

  // ---- Numbers

  function list(value) {
    return value instanceof Array ? value.slice(0) : [value];
  }

  function divisor(a, b) {
    return b === 0 ? a : divisor(b, a % b);
  }

  // The duration of a frame as [value, scale]. The program counts in thousandths of a frame a second.
  function frameDuration(rate) {
    var scale = Math.round(rate * 1000), common = divisor(1000, scale);
    return [1000 / common, scale / common];
  }

  function subtract(a, b) {
    var result = [], i;
    for (i = 0; i < a.length; ++i) {
      result.push(a[i] - (b[i] || 0));
    }
    return result;
  }

  function length(v) {
    var sum = 0, i;
    for (i = 0; i < v.length; ++i) {
      sum += v[i] * v[i];
    }
    return Math.sqrt(sum);
  }

  function isZero(v) {
    return length(v) === 0;
  }

  // The length of a path from a to b with its tangents: five-point Gauss quadrature of its speed over 64 pieces.
  var NODES = [-0.906179845938664, -0.538469310105683, 0, 0.538469310105683, 0.906179845938664];
  var WEIGHTS = [0.236926885056189, 0.478628670499366, 0.568888888888889, 0.478628670499366, 0.236926885056189];

  function pathLength(a, to, ti, b) {
    var pieces = 64, sum = 0, chord = subtract(b, a), piece, node, component, u, v, speed, p1, p2;
    if (isZero(to) && isZero(ti)) {
      return length(chord);
    }
    for (piece = 0; piece < pieces; ++piece) {
      for (node = 0; node < NODES.length; ++node) {
        u = (piece + (NODES[node] + 1) / 2) / pieces;
        v = 1 - u;
        speed = [];
        for (component = 0; component < a.length; ++component) {
          p1 = to[component] || 0;                          // the inner points, seen from a
          p2 = chord[component] + (ti[component] || 0);
          speed.push(3 * (v * v * p1 + 2 * v * u * (p2 - p1) + u * u * (chord[component] - p2)));
        }
        sum += WEIGHTS[node] / 2 / pieces * length(speed);
      }
    }
    return sum;
  }

  // ---- Properties

  var LINEAR_OUT = 1 / 6, LINEAR_IN = 5 / 6; // the handles of a linear side that has a Bezier one opposite

  function isSpatial(property) {
    return property.matchName !== "ADBE Orientation" &&
      (property.propertyValueType === PropertyValueType.TwoD_SPATIAL ||
       property.propertyValueType === PropertyValueType.ThreeD_SPATIAL);
  }

  // One side of an interval's easing, as {x, y} with an entry for each ease. Null where an ease can't be said: the
  // value has a speed but ends where it began.
  function handles(eases, isBezier, isOut, seconds, distances) {
    var x = [], y = [], i, influence, distance, rise;
    for (i = 0; i < distances.length; ++i) {
      distance = distances[i];
      if (!isBezier) {
        x.push(isOut ? LINEAR_OUT : LINEAR_IN);
        y.push(isOut ? LINEAR_OUT : LINEAR_IN);
      } else {
        influence = eases[Math.min(i, eases.length - 1)].influence / 100;
        rise = eases[Math.min(i, eases.length - 1)].speed * influence * seconds;
        if (distance === 0 && rise !== 0) {
          return null;
        }
        rise = distance === 0 ? 0 : rise / distance;
        x.push(isOut ? influence : 1 - influence);
        y.push(isOut ? rise : 1 - rise);
      }
    }
    return { x: x, y: y };
  }

  // What the easing of an interval is measured by: the path's length, the time, or each component's own way.
  function easeDistances(property, a, b, to, ti, seconds) {
    if (isSpatial(property)) {
      return [pathLength(a, to, ti, b)];
    }
    return property.propertyValueType === PropertyValueType.COLOR ? [seconds] : subtract(b, a);
  }

  // Adds to keyframe `key` how the value gets to keyframe i + 1; false if easing can't say it.
  function addInterval(property, i, key, next, seconds) {
    var bezierOut = property.keyOutInterpolationType(i) === KeyframeInterpolationType.BEZIER;
    var bezierIn = property.keyInInterpolationType(i + 1) === KeyframeInterpolationType.BEZIER;
    var to = [], ti = [], distances;
    if (property.keyOutInterpolationType(i) === KeyframeInterpolationType.HOLD) {
      key.h = 1;
      return true;
    }
    if (isSpatial(property)) {
      to = list(property.keyOutSpatialTangent(i));
      ti = list(property.keyInSpatialTangent(i + 1));
      if (!isZero(to) || !isZero(ti)) {
        key.to = to;
        key.ti = ti;
      }
    }
    if (bezierOut || bezierIn) {
      distances = easeDistances(property, key.s, next.s, to, ti, seconds);
      key.o = handles(property.keyOutTemporalEase(i), bezierOut, true, seconds, distances);
      key.i = handles(property.keyInTemporalEase(i + 1), bezierIn, false, seconds, distances);
    }
    return key.o !== null && key.i !== null;
  }

  // A time in frames: a whole number where rounding alone keeps it from being one.
  function frames(time, frame) {
    var whole = Math.round(time / frame);
    return Math.abs(time / frame - whole) < 1e-6 ? whole : time / frame;
  }

  // The property's keyframes; `exact` is false where the values between them need samples.
  function keyframes(property, timing) {
    var keys = [], exact = true, i;
    for (i = 1; i <= property.numKeys; ++i) {
      keys.push({ t: frames(property.keyTime(i), timing.frame), s: list(property.keyValue(i)).slice(0, timing.components) });
      exact = exact && !(isSpatial(property) && property.keyRoving(i));
    }
    for (i = 1; i < property.numKeys; ++i) {
      if (!addInterval(property, i, keys[i - 1], keys[i], property.keyTime(i + 1) - property.keyTime(i))) {
        delete keys[i - 1].o;
        delete keys[i - 1].i;
        exact = false;
      }
    }
    if (property.matchName === "ADBE Orientation" && property.numKeys > 1) {
      exact = false; // it turns by the shortest way, which components on their own don't
    }
    return { keys: keys, exact: exact };
  }

  function samples(property, timing) {
    var values = [], i;
    for (i = 0; i < timing.count; ++i) {
      values.push(list(property.valueAtTime(i * timing.frame, false)).slice(0, timing.components));
    }
    return values;
  }

  // A property as the composition file tells it; undefined where the layer doesn't have it.
  function described(property, timing, components) {
    var result = {}, keyed, own;
    if (!property) {
      return undefined;
    }
    own = { frame: timing.frame, count: timing.count, components: components };
    if (property.numKeys > 0) {
      keyed = keyframes(property, own);
      result.k = keyed.keys;
    } else {
      result.k = list(property.valueAtTime(0, true)).slice(0, components);
      if (components === 1) {
        result.k = result.k[0];
      }
    }
    if (property.expressionEnabled && property.expression !== "") {
      result.x = property.expression;
      result.samples = samples(property, own);
    } else if (keyed && (!keyed.exact || timing.isReversed)) {
      result.samples = samples(property, own);
    }
    return result;
  }

  // ---- Layers

  function transform(layer, timing) {
    var group = layer.property("ADBE Transform Group"), position = group.property("ADBE Position");
    var isThreeD = layer.threeDLayer || isCamera(layer) || isLight(layer), ks = {};
    if (!isLight(layer) || layer.lightType === LightType.SPOT || layer.lightType === LightType.PARALLEL) {
      ks.a = described(group.property("ADBE Anchor Point"), timing, 3);
    }
    if (isLight(layer) && layer.lightType === LightType.AMBIENT) {
      return ks;
    }
    if (position.dimensionsSeparated) {
      ks.p = {
        s: true,
        x: described(group.property("ADBE Position_0"), timing, 1),
        y: described(group.property("ADBE Position_1"), timing, 1)
      };
      if (isThreeD) {
        ks.p.z = described(group.property("ADBE Position_2"), timing, 1);
      }
    } else {
      ks.p = described(position, timing, 3);
    }
    if (!isCamera(layer) && !isLight(layer)) {
      ks.s = described(group.property("ADBE Scale"), timing, isThreeD ? 3 : 2);
    }
    ks.rz = described(group.property("ADBE Rotate Z"), timing, 1);
    if (isThreeD) {
      ks.rx = described(group.property("ADBE Rotate X"), timing, 1);
      ks.ry = described(group.property("ADBE Rotate Y"), timing, 1);
      ks.or = described(group.property("ADBE Orientation"), timing, 3);
    }
    return ks;
  }

  function isCamera(layer) {
    return layer instanceof CameraLayer;
  }

  function isLight(layer) {
    return layer instanceof LightLayer;
  }

  function addCamera(layer, timing, result) {
    var options = layer.property("ADBE Camera Options Group");
    result.ty = 13;
    result.pe = described(options.property("ADBE Camera Zoom"), timing, 1);
    result.camera = { focusDistance: described(options.property("ADBE Camera Focus Distance"), timing, 1) };
  }

  function lightTypeName(type) {
    switch (type) {
    case LightType.PARALLEL:
      return "parallel";
    case LightType.SPOT:
      return "spot";
    case LightType.AMBIENT:
      return "ambient";
    default:
      return "point";
    }
  }

  var LIGHT_OPTIONS = [
    ["intensity", "ADBE Light Intensity", 1], ["color", "ADBE Light Color", 3],
    ["coneAngle", "ADBE Light Cone Angle", 1], ["coneFeather", "ADBE Light Cone Feather 2", 1],
    ["castsShadows", "ADBE Casts Shadows", 1], ["shadowDarkness", "ADBE Light Shadow Darkness", 1]
  ];

  function addLight(layer, timing, result) {
    var options = layer.property("ADBE Light Options Group"), i;
    result.ty = 14;
    result.light = { type: lightTypeName(layer.lightType) };
    for (i = 0; i < LIGHT_OPTIONS.length; ++i) {
      result.light[LIGHT_OPTIONS[i][0]] = described(options.property(LIGHT_OPTIONS[i][1]), timing, LIGHT_OPTIONS[i][2]);
    }
  }

  function hex(color) {
    var text = "#", i;
    for (i = 0; i < 3; ++i) {
      text += ("0" + Math.round(Math.min(1, Math.max(0, color[i])) * 255).toString(16)).slice(-2);
    }
    return text;
  }

  var STILLS = /\.(png|jpe?g|tiff?|tga|exr|dpx|cin|bmp|psd|sgi|rla|gif|iff|hdr)$/i;

  // The files of an image sequence, else 1: a moving source whose file is a still picture's.
  function fileCount(item) {
    var source = item.mainSource;
    if (source.isStill || !source.file || !STILLS.test(source.file.name)) {
      return 1;
    }
    return Math.max(1, Math.round(item.duration * (source.nativeFrameRate || item.frameRate)));
  }

  function footagePath(item) {
    var source = item.mainSource;
    if (source instanceof FileSource) {
      return source.file ? source.file.fsName : source.missingFootagePath;
    }
    return item.name; // a placeholder has no file
  }

  // Where an item stands among the assets; adds it when it is met first.
  function assetOf(item, output) {
    var id = "item_" + item.id, asset;
    if (!output.seen[id]) {
      asset = { id: id, nm: item.name, w: item.width, h: item.height };
      output.seen[id] = asset;
      output.assets.push(asset);
      if (item instanceof CompItem) {
        asset.ae = { pixelAspect: aspect(item.pixelAspect) };
        asset.layers = layers(item, output);
      } else {
        asset.u = "";
        asset.p = footagePath(item);
        asset.ae = { files: fileCount(item) };
      }
    }
    return id;
  }

  function aspect(value) {
    var top = Math.round(value * 1000000), common = divisor(top, 1000000);
    return [top / common, 1000000 / common];
  }

  function footageType(item) {
    if (item instanceof CompItem) {
      return 0;
    }
    if (!item.hasVideo) {
      return 6;
    }
    if (item.mainSource.isStill) {
      return 2;
    }
    return fileCount(item) > 1 ? 8 : 9;
  }

  function addSource(layer, output, result) {
    var item = layer.source;
    result.ddd = layer.threeDLayer ? 1 : 0;
    if (layer.nullLayer) {
      result.ty = 3;
    } else if (layer instanceof TextLayer) {
      result.ty = 5;
    } else if (layer instanceof ShapeLayer || !item) {
      result.ty = 4;
    } else if (item instanceof FootageItem && item.mainSource instanceof SolidSource) {
      result.ty = 1;
      result.sw = item.width;
      result.sh = item.height;
      result.sc = hex(item.mainSource.color);
    } else {
      result.ty = footageType(item);
      result.refId = assetOf(item, output);
    }
    return result.ty === 1 || result.ty === 3;
  }

  function describedLayer(layer, output) {
    var timing = { frame: output.frame, count: output.count, isReversed: layer.stretch < 0 };
    var result = { ind: layer.index }, namesItsSource = false;
    if (isCamera(layer)) {
      addCamera(layer, timing, result);
    } else if (isLight(layer)) {
      addLight(layer, timing, result);
    } else {
      namesItsSource = addSource(layer, output, result);
    }
    if (layer.isNameSet === undefined || layer.isNameSet || isCamera(layer) || isLight(layer)) {
      result.nm = layer.name;
    } else if (namesItsSource && layer.source) {
      result.nm = layer.source.name;
    }
    if (layer.parent) {
      result.parent = layer.parent.index;
    }
    if (!layer.enabled) {
      result.hd = true;
    }
    result.ae = { locked: layer.locked };
    if (isCamera(layer) || isLight(layer)) {
      result.ae.autoOrient = layer.autoOrient === AutoOrientType.CAMERA_OR_POINT_OF_INTEREST;
    }
    result.ks = transform(layer, timing);
    return result;
  }

  function layers(comp, output) {
    var result = [], i;
    for (i = 1; i <= comp.numLayers; ++i) {
      result.push(describedLayer(comp.layer(i), output));
      output.progress(1);
    }
    return result;
  }

  function describedComposition(comp, progress) {
    var duration = frameDuration(comp.frameRate), frame = duration[0] / duration[1];
    var output = {
      frame: frame, count: Math.ceil(comp.duration / frame - 1e-6) + 1, assets: [], seen: {}, progress: progress
    };
    var start = Math.round(comp.workAreaStart / frame);
    return {
      nm: comp.name, w: comp.width, h: comp.height, fr: comp.frameRate, ip: 0, op: Math.round(comp.duration / frame),
      ae: {
        frameDuration: duration,
        workArea: [start, start + Math.round(comp.workAreaDuration / frame)],
        pixelAspect: aspect(comp.pixelAspect)
      },
      layers: layers(comp, output),
      assets: output.assets
    };
  }

  // ---- Dialogs

  // How many layers there are, each nested composition counted once.
  function layerCount(comp, seen) {
    var count = comp.numLayers, i, source;
    seen[comp.id] = true;
    for (i = 1; i <= comp.numLayers; ++i) {
      source = comp.layer(i).source;
      if (source instanceof CompItem && !seen[source.id]) {
        count += layerCount(source, seen);
      }
    }
    return count;
  }

  function openProgress(total) {
    var window = new Window("palette", TITLE), done = 0, bar;
    bar = window.add("progressbar");
    bar.minvalue = 0;
    bar.maxvalue = Math.max(1, total);
    bar.preferredSize = [320, 12];
    window.show();
    return {
      step: function (count) {
        done += count;
        bar.value = done;
        window.update();
      },
      close: function () {
        window.close();
      }
    };
  }

  function save(file, value) {
    file.encoding = "UTF-8";
    file.lineFeed = "Unix";
    if (!file.open("w")) {
      alert("Could not write " + file.fsName + ": " + file.error +
        "\nScripts may write files where Preferences > Scripting & Expressions allows it.", TITLE);
      return;
    }
    write(file, value);
    file.write("\n");
    if (!file.close() || file.error) {
      alert("Could not finish " + file.fsName + ": " + file.error, TITLE);
    }
  }

  function run() {
    var comp = app.project ? app.project.activeItem : null, file, progress;
    if (!(comp instanceof CompItem)) {
      alert("Please open a composition first: the one that is to be exported.", TITLE);
      return;
    }
    file = File.saveDialog("Save the composition as", "Composition file:*.json");
    if (!file) {
      return;
    }
    if (!/\.json$/i.test(file.name)) {
      file = new File(file.fsName + ".json");
      if (file.exists && !confirm(file.name + " exists. Replace it?", true, TITLE)) {
        return;
      }
    }
    progress = openProgress(layerCount(comp, {}));
    try {
      save(file, describedComposition(comp, progress.step));
    } catch (error) {
      alert("The composition could not be read: " + error.toString(), TITLE);
    } finally {
      progress.close();
    }
  }

  run();
}());
