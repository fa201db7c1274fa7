// The page around a scene: draws it, with its cameras and a time line. The bundle of three.js stands before this script,
// the bytes of a .glb in the element "scene". Programs read `document.documentElement.dataset.state`: "loading", then
// "ready" or "error" (with `dataset.reason`).
"use strict";

(() => {
  const root = document.documentElement;
  const element = id => document.getElementById(id);

  function fail(reason) {
    root.dataset.state = "error";
    root.dataset.reason = String(reason && reason.message || reason);
    element("message").textContent = "This scene can't be shown: " + root.dataset.reason;
  }

  // ---- The scene

  function decode(text) {
    const raw = atob(text);
    const bytes = new Uint8Array(raw.length);
    for (let i = 0; i < raw.length; ++i)
      bytes[i] = raw.charCodeAt(i);
    return bytes.buffer;
  }

  // The number of the node that an object stands for; undefined for parts of one.
  const nodeOf = (gltf, object) => gltf.parser.associations.get(object)?.nodes;

  // The cameras or lights below an object and above the next nodes: a node may be the thing itself, or a group around it.
  function partsOf(gltf, object, isWanted) {
    const parts = object.children.filter(child => nodeOf(gltf, child) === undefined);
    return [object, ...parts].filter(isWanted);
  }

  function findAll(gltf, isWanted) {
    const found = [];
    gltf.scene.traverse(object => {
      const node = nodeOf(gltf, object);
      if (node !== undefined)
        partsOf(gltf, object, isWanted).forEach(part => found.push({ part, node }));
    });
    return found;
  }

  // ---- What moves besides nodes: KHR_animation_pointer, which three.js passes over

  const KINDS = {
    cameras: { isWanted: part => part.isCamera, indexOf: node => node.camera },
    lights: { isWanted: part => part.isLight, indexOf: node => node.extensions?.KHR_lights_punctual?.light }
  };

  // three.js has the outer angle, and the share of it that fades.
  const innerAngle = light => light.angle * (1 - light.penumbra);

  function setCone(light, inner, outer) {
    light.angle = outer;
    light.penumbra = 1 - inner / outer;
  }

  const SETTERS = {
    yfov(camera, [angle]) { camera.fov = angle * 180 / Math.PI; camera.updateProjectionMatrix(); },
    color(light, [r, g, b]) { light.color.setRGB(r, g, b); },
    intensity(light, [value]) { light.intensity = value; },
    outerConeAngle(light, [angle]) { setCone(light, innerAngle(light), angle); },
    innerConeAngle(light, [angle]) { setCone(light, angle, light.angle); }
  };

  const POINTER = /^\/(?:extensions\/KHR_lights_punctual\/)?(cameras|lights)\/(\d+)\/(?:perspective\/|spot\/)?(\w+)$/;

  async function pointerTrack(gltf, sampler, [, kind, index, property]) {
    const [times, values] = await Promise.all(
      [sampler.input, sampler.output].map(accessor => gltf.parser.getDependency("accessor", accessor)));
    const { isWanted, indexOf } = KINDS[kind];
    const targets = findAll(gltf, isWanted).filter(({ node }) => indexOf(gltf.parser.json.nodes[node]) === Number(index));
    return { times: times.array, values: values.array, size: values.itemSize, isStep: sampler.interpolation === "STEP",
      set: SETTERS[property], targets: targets.map(({ part }) => part) };
  }

  function pointerTracks(gltf) {
    return Promise.all((gltf.parser.json.animations || []).flatMap(animation => animation.channels
      .map(channel => [channel, POINTER.exec(channel.target.extensions?.KHR_animation_pointer?.pointer || "")])
      .filter(([, match]) => match && SETTERS[match[3]])
      .map(([channel, match]) => pointerTrack(gltf, animation.samplers[channel.sampler], match))));
  }

  function valueAt({ times, values, size, isStep }, time) {
    let low = 0, high = times.length - 1;
    while (low < high) { // the last key that isn't behind the time
      const middle = (low + high + 1) >> 1;
      if (times[middle] <= time)
        low = middle;
      else
        high = middle - 1;
    }
    const next = Math.min(low + 1, times.length - 1);
    const share = isStep || next === low ? 0 : Math.min(1, Math.max(0, (time - times[low]) / (times[next] - times[low])));
    return Array.from({ length: size }, (_, i) =>
      values[low * size + i] + share * (values[next * size + i] - values[low * size + i]));
  }

  // ---- Layers in one plane: depth alone can't tell which of them is on top

  const OFFSET_UNITS = 16; // a rank

  const isQuad = object => object.isMesh && object.geometry.attributes.position.count === 4;

  function planeKey(quad) {
    const place = new three.Vector3().setFromMatrixPosition(quad.matrixWorld);
    const normal = new three.Vector3(0, 0, 1).transformDirection(quad.matrixWorld);
    if (normal.x + normal.y * 1e-3 + normal.z * 1e-6 < 0)
      normal.negate();
    return [normal.x, normal.y, normal.z, normal.dot(place)].map(value => Math.round(value * 1e4) || 0).join();
  }

  function setRank(quad, rank) {
    quad.renderOrder = -rank;
    if (rank === (quad.userData.rank || 0))
      return;
    if (quad.userData.rank === undefined)
      quad.material = quad.material.clone(); // others may share it
    quad.userData.rank = rank;
    Object.assign(quad.material, { polygonOffset: true, polygonOffsetFactor: 0, polygonOffsetUnits: OFFSET_UNITS * rank });
  }

  // Quads of one plane are drawn in the order of their nodes, which is that of the layers, the first one on top. What
  // lets through what is behind it is drawn from far to near, all quads of a plane at one distance.
  function arrange(drawn, camera) {
    const planes = new Map();
    for (const object of drawn) {
      const key = isQuad(object) ? planeKey(object) : object.id;
      const plane = planes.get(key) || { id: planes.size, count: 0, distance: 0 };
      planes.set(key, plane);
      const place = new three.Vector3().setFromMatrixPosition(object.matrixWorld);
      plane.distance -= (place.applyMatrix4(camera.matrixWorldInverse).z + plane.distance) / (plane.count + 1); // the mean
      if (isQuad(object))
        setRank(object, plane.count);
      ++plane.count;
      object.userData.plane = plane;
    }
  }

  function compareTransparent(a, b) {
    const one = a.object.userData.plane, other = b.object.userData.plane;
    return other.distance - one.distance || one.id - other.id || a.renderOrder - b.renderOrder || a.id - b.id;
  }

  // ---- The view

  // The scene's camera first, the others as they come.
  function camerasOf(gltf, first) {
    return findAll(gltf, KINDS.cameras.isWanted).sort((a, b) => (b.node === first) - (a.node === first)).map(({ part }) => part);
  }

  // As wide as the film; pixels need not be square.
  function aspectOf(json, extras) {
    const { perspective, orthographic } = json.cameras?.[0] || {};
    return perspective?.aspectRatio || orthographic?.xmag / orthographic?.ymag || extras.width / extras.height;
  }

  // Cameras don't take part in the scale of what they hang on.
  function dropScale(camera) {
    const place = camera.matrixWorld.clone();
    camera.matrixWorld.extractRotation(place).copyPosition(place);
    camera.matrixWorldInverse.copy(camera.matrixWorld).invert();
  }

  // A camera that orbits the middle of the scene, from where the first one stands.
  function freeView(gltf, cameras, aspect, canvas) {
    const box = new three.Box3().setFromObject(gltf.scene);
    const center = box.isEmpty() ? new three.Vector3() : box.getCenter(new three.Vector3());
    const radius = Math.max(1e-3, box.isEmpty() ? 1 : box.getSize(new three.Vector3()).length() / 2);
    const camera = new three.PerspectiveCamera(45, aspect, radius / 1000, radius * 100);
    if (cameras.length)
      cameras[0].getWorldPosition(camera.position);
    if (!cameras.length || camera.position.distanceTo(center) < radius / 100)
      camera.position.set(center.x, center.y, center.z + radius * 2.5);
    const controls = new three.OrbitControls(camera, canvas);
    controls.target.copy(center);
    controls.update();
    return { camera, controls };
  }

  function show(gltf, tracks) {
    const extras = gltf.parser.json.scenes[0].extras.q7r;
    const { fps, timeOffset = 0 } = extras;
    const aspect = aspectOf(gltf.parser.json, extras);
    const start = Math.round(extras.start * fps);
    const end = Math.max(start, Math.round(extras.end * fps));

    const canvas = element("canvas"), slider = element("slider"), play = element("play"), choice = element("camera");
    const renderer = new three.WebGLRenderer({ canvas, antialias: true });
    renderer.setTransparentSort(compareTransparent);
    const mixer = new three.AnimationMixer(gltf.scene);
    const actions = gltf.animations.map(clip => mixer.clipAction(clip).play());
    const world = new three.Scene();
    world.add(gltf.scene);
    world.matrixWorldAutoUpdate = false; // done before each picture
    const drawn = [];
    world.traverse(object => { if (object.isMesh || object.isLine || object.isPoints) drawn.push(object); });
    const cameras = camerasOf(gltf, extras.camera);

    let frame = start, camera = null, lastTick = 0;
    let isPlaying = false;

    function pose() {
      const time = frame / fps + timeOffset;
      for (const action of actions)
        action.time = Math.min(time, action.getClip().duration);
      mixer.update(0);
      for (const track of tracks) {
        const value = valueAt(track, time);
        track.targets.forEach(target => track.set(target, value));
      }
      world.updateMatrixWorld();
    }

    pose();
    const free = freeView(gltf, cameras, aspect, canvas);

    function draw() {
      pose();
      camera.updateWorldMatrix(true, false);
      dropScale(camera);
      arrange(drawn, camera);
      renderer.render(world, camera);
      slider.value = Math.round(frame);
      element("time").textContent = `${(frame / fps).toFixed(2)} s · frame ${Math.round(frame)}`;
    }

    // The largest view of the scene's shape that the window holds, in whole pixels.
    function resize() {
      const area = element("stage").getBoundingClientRect();
      const width = Math.max(1, Math.min(Math.floor(area.width), Math.round(area.height * aspect)));
      renderer.setPixelRatio(window.devicePixelRatio);
      renderer.setSize(width, Math.max(1, Math.round(width / aspect)));
      draw();
    }

    // "0", "1", ... of the list, or "free".
    function choose(name) {
      const index = name === "free" ? -1 : Math.min(Math.max(0, Math.trunc(Number(name)) || 0), cameras.length - 1);
      camera = index < 0 ? free.camera : cameras[index];
      free.controls.enabled = index < 0;
      choice.value = index < 0 ? "free" : String(index);
    }

    function tell() {
      const view = choice.value === "free" ? "free" : "camera=" + choice.value;
      try {
        history.replaceState(null, "", `#t=${Number((frame / fps).toFixed(6))}&${view}`);
      } catch {
        // Some browsers refuse to change the address often; the next change tells it.
      }
    }

    const clamped = value => Math.min(end, Math.max(start, value));

    function readAddress() {
      const words = new URLSearchParams(location.hash.slice(1));
      const time = Number.parseFloat(words.get("t"));
      if (Number.isFinite(time))
        frame = clamped(time * fps);
      choose(words.has("free") ? "free" : words.get("camera") || choice.value);
    }

    function setPlaying(value) {
      isPlaying = value;
      play.textContent = isPlaying ? "Pause" : "Play";
      if (isPlaying && frame >= end)
        frame = start;
      lastTick = 0;
      if (isPlaying)
        requestAnimationFrame(tick);
      else
        tell();
    }

    function tick(now) {
      if (!isPlaying)
        return;
      frame += lastTick ? (now - lastTick) / 1000 * fps : 0;
      lastTick = now;
      if (frame > end)
        frame = start + (frame - start) % Math.max(1, end - start);
      draw();
      requestAnimationFrame(tick);
    }

    function seek(value) {
      frame = clamped(value);
      draw();
      tell();
    }

    const KEYS = {
      " ": () => setPlaying(!isPlaying),
      ArrowLeft: () => seek(Math.round(frame) - 1),
      ArrowRight: () => seek(Math.round(frame) + 1)
    };

    cameras.forEach((item, i) => choice.add(new Option(item.userData.q7r?.name || item.name || "Camera " + (i + 1), i)));
    choice.add(new Option("Free view", "free"));
    Object.assign(slider, { min: start, max: end, step: 1 });
    slider.addEventListener("input", () => seek(Number(slider.value)));
    play.addEventListener("click", () => setPlaying(!isPlaying));
    choice.addEventListener("change", () => { choose(choice.value); draw(); tell(); });
    free.controls.addEventListener("change", () => { if (!isPlaying && camera === free.camera) draw(); });
    canvas.addEventListener("webglcontextrestored", () => draw());
    addEventListener("resize", resize);
    addEventListener("hashchange", () => { readAddress(); draw(); });
    addEventListener("keydown", event => {
      if (KEYS[event.key] && event.target !== choice && !event.ctrlKey && !event.altKey && !event.metaKey) {
        event.preventDefault();
        KEYS[event.key]();
      }
    });

    readAddress();
    resize();
    root.dataset.state = "ready";
  }

  async function begin() {
    const gltf = await new three.GLTFLoader().parseAsync(decode(element("scene").textContent), "");
    show(gltf, await pointerTracks(gltf));
  }

  addEventListener("error", event => fail(event.error || event.message));
  begin().catch(fail);
})();
