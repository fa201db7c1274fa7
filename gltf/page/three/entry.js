// What the page uses of three.js.
export { AnimationMixer, Box3, PerspectiveCamera, Scene, Vector3, WebGLRenderer } from "three";
export { GLTFLoader } from "three/addons/loaders/GLTFLoader.js";
export { OrbitControls } from "three/addons/controls/OrbitControls.js";
